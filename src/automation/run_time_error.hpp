#pragma once

#include <cstdint>
#include <exception>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "automation/text.hpp"

namespace talutil {

/// The standard run-time errors, whose numbers and texts hosts know. Some are never raised here, but third-party
/// objects may raise them by number alone, and the text then comes from here.
enum class ErrorNumber : std::int32_t {
  invalid_procedure_call = 5,
  overflow = 6,
  out_of_memory = 7,
  subscript_out_of_range = 9,
  array_fixed_or_locked = 10,
  division_by_zero = 11,
  type_mismatch = 13,
  user_interrupt = 18,
  internal_error = 51,
  bad_file_name_or_number = 52,
  file_not_found = 53,
  file_already_open = 55,
  device_io_error = 57,
  file_already_exists = 58,
  disk_full = 61,
  input_past_end_of_file = 62,
  too_many_files = 67,
  permission_denied = 70,
  disk_not_ready = 71,
  path_file_access = 75,
  path_not_found = 76,
  object_variable_not_set = 91,
  invalid_use_of_null = 94,
  form_already_displayed = 400,
  object_required = 424,
  cannot_create_object = 429,
  interface_not_supported = 430,
  member_not_supported = 438,
  action_not_supported = 445,
  named_arguments_not_supported = 446,
  locale_not_supported = 447,
  named_argument_not_found = 448,
  argument_not_optional = 449,
  wrong_argument_count = 450,
  not_a_collection = 451,
  missing_entry_point = 453,
  printer_error = 482,
  cancelled = 32755,
};

/// The standard text of a number; the text of an unknown number is "Application-defined or object-defined error".
[[nodiscard]] std::string_view standard_description(std::int32_t number) noexcept;

/// The origin of an error raised by another object, as that object reports it, and where to read about it: a host's
/// Err.Source, Err.HelpFile and Err.HelpContext. Whatever the object does not report is empty.
struct ErrorOrigin {
  Text source;
  Text help_file;
  std::uint32_t help_context = 0;

  friend bool operator==(const ErrorOrigin&, const ErrorOrigin&) = default;
};

/// The library's only exception: a host's Err.Number and Err.Description. Copies share their texts, so that copying
/// needs no memory.
class RunTimeError : public std::exception {
 public:
  explicit RunTimeError(ErrorNumber number);

  /// With a more specific description than the standard one.
  RunTimeError(ErrorNumber number, Text description)
      : RunTimeError(static_cast<std::int32_t>(number), std::move(description)) {}

  /// Without an origin, the error is the library's own.
  RunTimeError(std::int32_t number, Text description, std::optional<ErrorOrigin> origin = {});

  [[nodiscard]] std::int32_t number() const noexcept { return contents_->number; }
  [[nodiscard]] bool is(ErrorNumber number) const noexcept {
    return contents_->number == static_cast<std::int32_t>(number);
  }
  [[nodiscard]] const Text& description() const noexcept { return contents_->description; }
  [[nodiscard]] const std::optional<ErrorOrigin>& origin() const noexcept { return contents_->origin; }
  [[nodiscard]] const char* what() const noexcept override { return contents_->narrow.c_str(); }

 private:
  struct Contents {
    std::int32_t number;
    Text description;
    std::optional<ErrorOrigin> origin;
    std::string narrow;
  };

  std::shared_ptr<const Contents> contents_;
};

[[noreturn]] void raise(ErrorNumber number);

/// Error 7, created by the first call (during start-up), because later there may not be enough memory to create it.
[[nodiscard]] const RunTimeError& out_of_memory_error();

/// The exception being handled as a run-time error: a failed allocation is 7, an unknown exception 51.
[[nodiscard]] RunTimeError current_error() noexcept;

}  // namespace talutil
