// DeleteFile of the scripting run time's file-system object, called the way scripts call it.
#include "automation/run_time_error.hpp"
#include "platform/file_names.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/win32_files.hpp"

namespace talutil::win32 {

namespace {

/// The HRESULTs of run-time errors from automation objects.
constexpr HRESULT run_time_facility = static_cast<HRESULT>(0x800A0000);

struct Reference {
  using Handle = IDispatch*;
  static void close(IDispatch* object) noexcept { object->Release(); }
};

struct AutomationText {
  using Handle = BSTR;
  static void close(BSTR text) noexcept { SysFreeString(text); }
};

Owned<Reference> create_file_system_object() {
  CLSID class_id;
  void* object = nullptr;
  if (FAILED(CLSIDFromProgID(L"Scripting.FileSystemObject", &class_id)) ||
      FAILED(CoCreateInstance(class_id, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, &object))) {
    raise(ErrorNumber::cannot_create_object);
  }
  return Owned<Reference>(static_cast<IDispatch*>(object));
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
  const Owned<Reference> object = create_file_system_object();
  // In some versions of that object, wildcards in a folder's name match any folder, and no match counts as success.
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
  if (FAILED(object.get()->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &member))) {
    raise(ErrorNumber::member_not_supported);
  }
  const Owned<AutomationText> text(SysAllocStringLen(wide(pattern), static_cast<UINT>(pattern.size())));
  VARIANT arguments[2];  // In reverse order.
  V_VT(&arguments[0]) = VT_BOOL;
  V_BOOL(&arguments[0]) = VARIANT_FALSE;
  V_VT(&arguments[1]) = VT_BSTR;
  V_BSTR(&arguments[1]) = text.get();
  DISPPARAMS parameters{arguments, nullptr, 2, 0};
  EXCEPINFO exception{};
  const HRESULT result = object.get()->Invoke(member, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters,
                                              nullptr, &exception, nullptr);
  const Owned<AutomationText> source(exception.bstrSource);
  const Owned<AutomationText> description(exception.bstrDescription);
  const Owned<AutomationText> help_file(exception.bstrHelpFile);
  if (FAILED(result)) raise_for_result(result, exception);
}

}  // namespace talutil::win32
