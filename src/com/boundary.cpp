#include "com/boundary.hpp"

#include <new>
#include <stdexcept>

#include "com/pointer.hpp"

namespace talutil::com {

namespace {

constexpr const wchar_t* source_name = L"TALUtil.ORVUtils";
constexpr std::uint32_t run_time_facility = 0x800A0000;

struct PlatformResult {
  HRESULT result;
  ErrorNumber number;
};

// What automation itself answers with, as hosts know it.
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
    {E_OUTOFMEMORY, ErrorNumber::out_of_memory},
    {E_INVALIDARG, ErrorNumber::invalid_procedure_call},
};

BSTR description_of(const RunTimeError& error) noexcept {
  return SysAllocStringLen(win32::wide(error.description()), static_cast<UINT>(error.description().size()));
}

/// An error of the host's control keeps the source that it came with.
const wchar_t* source_of(const RunTimeError& error) noexcept {
  return error.source().empty() ? source_name : win32::wide(error.source());
}

}  // namespace

HRESULT result_of(std::int32_t number) noexcept {
  const auto bits = static_cast<std::uint32_t>(number);
  return static_cast<HRESULT>(bits <= 0xFFFF ? run_time_facility + bits : bits);
}

RunTimeError error_of(HRESULT result, TextView description, TextView source) {
  const auto bits = static_cast<std::uint32_t>(result);
  std::int32_t number = result;
  if ((bits & 0xFFFF0000) == run_time_facility) number = static_cast<std::int32_t>(bits & 0xFFFF);
  for (const auto& known : platform_results) {
    if (known.result == result) number = static_cast<std::int32_t>(known.number);
  }
  if (!description.empty()) return {number, Text(description), Text(source)};
  const std::string_view standard = standard_description(number);
  return {number, Text(standard.begin(), standard.end()), Text(source)};
}

RunTimeError current_error() noexcept {
  try {
    throw;
  } catch (const RunTimeError& error) {
    return error;
  } catch (const std::bad_alloc&) {
    return RunTimeError(ErrorNumber::out_of_memory);
  } catch (const std::length_error&) {
    return RunTimeError(ErrorNumber::out_of_memory);
  } catch (...) {
    return RunTimeError(ErrorNumber::internal_error);
  }
}

HRESULT report_current_exception() noexcept {
  const RunTimeError error = current_error();
  Pointer<ICreateErrorInfo> creator;
  Pointer<IErrorInfo> information;
  if (SUCCEEDED(CreateErrorInfo(creator.receive()))) {
    creator->SetSource(const_cast<wchar_t*>(source_of(error)));
    creator->SetDescription(const_cast<wchar_t*>(win32::wide(error.description())));
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
  }
  return DISP_E_EXCEPTION;
}

}  // namespace talutil::com
