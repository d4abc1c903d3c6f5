// DeleteFile of the scripting run time's file-system object, called the way scripts call it.
#include "automation/run_time_error.hpp"
#include "platform/file_names.hpp"
#include "platform/win32/win32_files.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

namespace {

/// Run-time errors of automation objects are this facility's codes.
constexpr HRESULT run_time_facility = static_cast<HRESULT>(0x800A0000);

struct Release {
  void operator()(IUnknown* object) const noexcept { object->Release(); }
};
using ObjectPointer = std::unique_ptr<IDispatch, Release>;

ObjectPointer create_file_system_object() {
  CLSID class_id;
  void* object = nullptr;
  if (FAILED(CLSIDFromProgID(L"Scripting.FileSystemObject", &class_id)) ||
      FAILED(CoCreateInstance(class_id, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, &object))) {
    raise(ErrorNumber::cannot_create_object);
  }
  return ObjectPointer(static_cast<IDispatch*>(object));
}

[[noreturn]] void raise_for_result(HRESULT result, const EXCEPINFO& exception) {
  if (result == DISP_E_EXCEPTION) result = exception.scode;
  if ((static_cast<std::uint32_t>(result) & 0xFFFF0000U) != static_cast<std::uint32_t>(run_time_facility)) {
    raise(ErrorNumber::path_file_access);
  }
  raise(static_cast<ErrorNumber>(result & 0xFFFF));
}

}  // namespace

void Win32Files::delete_files(const Text& pattern) {
  const ObjectPointer object = create_file_system_object();
  // Some versions of that object take wildcards in a folder's name for any folder, and call no match a success.
  require_pattern(pattern);
  bool matches = false;
  search(pattern, file_attribute::hidden | file_attribute::system, [&](TextView /*name*/) {
    matches = true;
    return false;
  });
  if (!matches || is_open_ended(pattern)) raise(ErrorNumber::file_not_found);

  wchar_t name[] = L"DeleteFile";
  LPOLESTR names = name;
  DISPID member = 0;
  if (FAILED(object->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &member))) {
    raise(ErrorNumber::member_not_supported);
  }
  VARIANT arguments[2];  // The last one first.
  V_VT(&arguments[0]) = VT_BOOL;
  V_BOOL(&arguments[0]) = VARIANT_FALSE;
  V_VT(&arguments[1]) = VT_BSTR;
  V_BSTR(&arguments[1]) = SysAllocStringLen(wide(pattern), static_cast<UINT>(pattern.size()));
  DISPPARAMS parameters{arguments, nullptr, 2, 0};
  EXCEPINFO exception{};
  const HRESULT result =
      object->Invoke(member, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, nullptr, &exception, nullptr);
  VariantClear(&arguments[1]);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrHelpFile);
  if (FAILED(result)) raise_for_result(result, exception);
}

}  // namespace talutil::win32
