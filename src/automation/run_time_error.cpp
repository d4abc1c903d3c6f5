#include "automation/run_time_error.hpp"

#include <atomic>
#include <memory>
#include <new>
#include <stdexcept>

namespace talutil {

std::string_view standard_description(std::int32_t number) noexcept {
  // A switch, so that the compiler demands a text for every number added to the enumeration.
  // clang-format off
  switch (static_cast<ErrorNumber>(number)) {
    case ErrorNumber::invalid_procedure_call: return "Invalid procedure call or argument";  // 5
    case ErrorNumber::overflow: return "Overflow";  // 6
    case ErrorNumber::out_of_memory: return "Out of memory";  // 7
    case ErrorNumber::subscript_out_of_range: return "Subscript out of range";  // 9
    case ErrorNumber::array_fixed_or_locked: return "This array is fixed or temporarily locked";  // 10
    case ErrorNumber::division_by_zero: return "Division by zero";  // 11
    case ErrorNumber::type_mismatch: return "Type mismatch";  // 13
    case ErrorNumber::user_interrupt: return "User interrupt occurred";  // 18
    case ErrorNumber::internal_error: return "Internal error";  // 51
    case ErrorNumber::bad_file_name_or_number: return "Bad file name or number";  // 52
    case ErrorNumber::file_not_found: return "File not found";  // 53
    case ErrorNumber::file_already_open: return "File already open";  // 55
    case ErrorNumber::device_io_error: return "Device I/O error";  // 57
    case ErrorNumber::file_already_exists: return "File already exists";  // 58
    case ErrorNumber::disk_full: return "Disk full";  // 61
    case ErrorNumber::input_past_end_of_file: return "Input past end of file";  // 62
    case ErrorNumber::too_many_files: return "Too many files";  // 67
    case ErrorNumber::permission_denied: return "Permission denied";  // 70
    case ErrorNumber::disk_not_ready: return "Disk not ready";  // 71
    case ErrorNumber::path_file_access: return "Path/File access error";  // 75
    case ErrorNumber::path_not_found: return "Path not found";  // 76
    case ErrorNumber::object_variable_not_set: return "Object variable or With block variable not set";  // 91
    case ErrorNumber::invalid_use_of_null: return "Invalid use of Null";  // 94
    case ErrorNumber::form_already_displayed: return "Form already displayed; can't show modally";  // 400
    case ErrorNumber::object_required: return "Object required";  // 424
    case ErrorNumber::cannot_create_object: return "ActiveX component can't create object";  // 429
    case ErrorNumber::interface_not_supported: return "Class does not support Automation or does not support expected interface";  // 430
    case ErrorNumber::member_not_supported: return "Object doesn't support this property or method";  // 438
    case ErrorNumber::action_not_supported: return "Object doesn't support this action";  // 445
    case ErrorNumber::named_arguments_not_supported: return "Object doesn't support named arguments";  // 446
    case ErrorNumber::locale_not_supported: return "Object doesn't support current locale setting";  // 447
    case ErrorNumber::named_argument_not_found: return "Named argument not found";  // 448
    case ErrorNumber::argument_not_optional: return "Argument not optional";  // 449
    case ErrorNumber::wrong_argument_count: return "Wrong number of arguments or invalid property assignment";  // 450
    case ErrorNumber::not_a_collection: return "Property let procedure not defined and property get procedure did not return an object";  // 451
    case ErrorNumber::missing_entry_point: return "Can't find DLL entry point";  // 453
    case ErrorNumber::printer_error: return "Printer error";  // 482
    case ErrorNumber::cancelled: return "Cancel was selected.";  // 32755
  }
  // clang-format on
  return "Application-defined or object-defined error";
}

RunTimeError::RunTimeError(ErrorNumber number)
    : RunTimeError(static_cast<std::int32_t>(number),
                   from_utf8(standard_description(static_cast<std::int32_t>(number)))) {}

RunTimeError::RunTimeError(std::int32_t number, Text description, std::optional<ErrorOrigin> origin) {
  std::string narrow = to_utf8(description);
  contents_ =
      std::make_shared<Contents>(Contents{number, std::move(description), std::move(origin), std::move(narrow)});
}

void raise(ErrorNumber number) { throw RunTimeError(number); }

const RunTimeError& out_of_memory_error() {
  // No static object: the run time's guard for one costs a tenth of the time in which the library starts. Two threads
  // may both create it; one of the two is kept, and never released.
  static std::atomic<const RunTimeError*> kept = nullptr;
  const RunTimeError* error = kept.load(std::memory_order_acquire);
  if (error != nullptr) return *error;
  auto made = std::make_unique<RunTimeError>(ErrorNumber::out_of_memory);
  if (kept.compare_exchange_strong(error, made.get(), std::memory_order_acq_rel)) error = made.release();
  return *error;
}

RunTimeError current_error() noexcept {
  try {
    throw;
  } catch (const RunTimeError& error) {
    return error;
  } catch (const std::bad_alloc&) {
    return out_of_memory_error();
  } catch (const std::length_error&) {
    return out_of_memory_error();
  } catch (...) {
  }
  try {
    return RunTimeError(ErrorNumber::internal_error);
  } catch (...) {
    return out_of_memory_error();
  }
}

}  // namespace talutil
