#include "com/boundary.hpp"

#include <array>

#include "com/pointer.hpp"

namespace talutil::com {

namespace {

constexpr const wchar_t* source_name = L"TALUtil.ORVUtils";
constexpr std::uint32_t run_time_facility = 0x800A0000;

struct PlatformResult {
  HRESULT result;
  ErrorNumber number;
};

// Automation's own results and the run-time errors that hosts know for them.
constexpr PlatformResult platform_results[] = {
    {DISP_E_MEMBERNOTFOUND, ErrorNumber::member_not_supported},
    {DISP_E_UNKNOWNNAME, ErrorNumber::member_not_supported},
    {DISP_E_TYPEMISMATCH, ErrorNumber::type_mismatch},
    {DISP_E_BADVARTYPE, ErrorNumber::type_mismatch},
    {DISP_E_OVERFLOW, ErrorNumber::overflow},
    {DISP_E_BADINDEX, ErrorNumber::subscript_out_of_range},
    {DISP_E_ARRAYISLOCKED, ErrorNumber::array_fixed_or_locked},
    {DISP_E_BADPARAMCOUNT, ErrorNumber::wrong_argument_count},
    {DISP_E_PARAMNOTOPTIONAL, ErrorNumber::argument_not_optional},
    {DISP_E_PARAMNOTFOUND, ErrorNumber::named_argument_not_found},
    {DISP_E_DIVBYZERO, ErrorNumber::division_by_zero},
    {DISP_E_NONAMEDARGS, ErrorNumber::named_arguments_not_supported},
    {DISP_E_UNKNOWNLCID, ErrorNumber::locale_not_supported},
    {DISP_E_NOTACOLLECTION, ErrorNumber::not_a_collection},
    {E_OUTOFMEMORY, ErrorNumber::out_of_memory},
    {E_INVALIDARG, ErrorNumber::invalid_procedure_call},
    {E_NOTIMPL, ErrorNumber::action_not_supported},
    {E_ACCESSDENIED, ErrorNumber::permission_denied},
    {E_NOINTERFACE, ErrorNumber::interface_not_supported},
};

std::int32_t number_of(HRESULT result) noexcept {
  const auto bits = static_cast<std::uint32_t>(result);
  if ((bits & 0xFFFF0000) == run_time_facility) return static_cast<std::int32_t>(bits & 0xFFFF);
  for (const auto& known : platform_results) {
    if (known.result == result) return static_cast<std::int32_t>(known.number);
  }
  return result;
}

bool is_run_time_number(std::int32_t number) noexcept { return number > 0 && number <= 0xFFFF; }

/// The system's message for a result, on one line.
Text system_text(HRESULT result) {
  std::array<wchar_t, 512> text{};
  constexpr DWORD flags = FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS | FORMAT_MESSAGE_MAX_WIDTH_MASK;
  const DWORD size = FormatMessageW(flags, nullptr, static_cast<DWORD>(result), 0, text.data(),
                                    static_cast<DWORD>(text.size()), nullptr);
  TextView line = win32::view(text.data(), size);
  while (!line.empty() && line.back() <= u' ') line.remove_suffix(1);
  return line.empty() ? from_utf8(standard_description(result)) : Text(line);
}

BSTR description_of(const RunTimeError& error) noexcept {
  return SysAllocStringLen(win32::wide(error.description()), static_cast<UINT>(error.description().size()));
}

/// An error of the host's control keeps its original source, even if that is empty: the error still does not come from
/// the library.
const wchar_t* source_of(const RunTimeError& error) noexcept {
  return error.origin() ? win32::wide(error.origin()->source) : source_name;
}

}  // namespace

HRESULT result_of(std::int32_t number) noexcept {
  const auto bits = static_cast<std::uint32_t>(number);
  return static_cast<HRESULT>(bits <= 0xFFFF ? run_time_facility + bits : bits);
}

RunTimeError error_of(HRESULT result, TextView description, const ErrorOrigin& reported) {
  const std::int32_t number = number_of(result);
  // A run-time error without any origin comes from a late-bound call by the library itself.
  std::optional<ErrorOrigin> origin;
  if (reported != ErrorOrigin{} || !is_run_time_number(number)) origin = reported;
  if (!description.empty()) return {number, Text(description), std::move(origin)};
  return {number, is_run_time_number(number) ? from_utf8(standard_description(number)) : system_text(result),
          std::move(origin)};
}

RunTimeError system_error(HRESULT result) { return {result, system_text(result)}; }

HRESULT report_current_exception() noexcept {
  const RunTimeError error = current_error();
  Pointer<ICreateErrorInfo> creator;
  Pointer<IErrorInfo> information;
  if (SUCCEEDED(CreateErrorInfo(creator.receive()))) {
    creator->SetSource(const_cast<wchar_t*>(source_of(error)));
    creator->SetDescription(const_cast<wchar_t*>(win32::wide(error.description())));
    if (error.origin()) {
      creator->SetHelpFile(const_cast<wchar_t*>(win32::wide(error.origin()->help_file)));
      creator->SetHelpContext(error.origin()->help_context);
    }
    if (SUCCEEDED(creator->QueryInterface(IID_IErrorInfo, information.receive_untyped()))) {
      SetErrorInfo(0, information.get());
    }
  }
  return result_of(error.number());
}

HRESULT report_current_exception(EXCEPINFO* information) noexcept {
  const RunTimeError error = current_error();
  if (information != nullptr) {
    *information = {};
    information->scode = result_of(error.number());
    information->bstrSource = SysAllocString(source_of(error));
    information->bstrDescription = description_of(error);
    if (!error.origin()) return DISP_E_EXCEPTION;
    const Text& help_file = error.origin()->help_file;
    // Null rather than empty: a caller that shows no help might not free the string.
    if (!help_file.empty()) information->bstrHelpFile = SysAllocString(win32::wide(help_file));
    information->dwHelpContext = error.origin()->help_context;
  }
  return DISP_E_EXCEPTION;
}

}  // namespace talutil::com
