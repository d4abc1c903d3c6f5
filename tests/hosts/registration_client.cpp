// Registration for the machine and for the user, removal, and use without any.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

/// A value below Software\Classes.
std::wstring value_of(HKEY root, const std::wstring& key, const wchar_t* name = nullptr) {
  std::array<wchar_t, 300> value{};
  DWORD size = sizeof value;
  const LSTATUS status =
      RegGetValueW(root, (L"Software\\Classes\\" + key).c_str(), name, RRF_RT_REG_SZ, nullptr, value.data(), &size);
  return status == ERROR_SUCCESS ? value.data() : L"(none)";
}

bool has_key(HKEY root, const std::wstring& key) {
  HKEY handle = nullptr;
  const LSTATUS status = RegOpenKeyExW(root, (L"Software\\Classes\\" + key).c_str(), 0, KEY_READ, &handle);
  if (status == ERROR_SUCCESS) RegCloseKey(handle);
  return status == ERROR_SUCCESS;
}

enum class Scope { none, user, machine };

/// Looks for everything that a registration in one scope makes, and for nothing of it in the other.
void is_registered(Scope scope, const std::wstring& path) {
  const std::wstring object = L"{13223AC3-C9F1-4A82-A6C4-951E12542E20}";
  const std::wstring position = L"{9039A04F-B619-4A0C-A9C9-AA2B3F5BC3DC}";
  const std::wstring library = L"{BC9C637E-DB88-4022-B98F-6F65F8CE12E5}";
  const std::wstring interface_key = L"Interface\\{6AF6495B-C4A1-4417-92A9-AE87BC1F2674}";
  const std::wstring library_key = L"TypeLib\\" + library;
  const struct {
    std::wstring key;
    std::wstring expected;
    const wchar_t* name = nullptr;
  } rows[] = {
      {L"TALUtil.ORVUtils\\CLSID", object},
      {L"TALUtil.cControlPosition\\CLSID", position},
      {L"CLSID\\" + object + L"\\InprocServer32", path},
      {L"CLSID\\" + object + L"\\InprocServer32", L"(none)", L"ThreadingModel"},
      {L"CLSID\\" + object + L"\\ProgID", L"TALUtil.ORVUtils"},
      {L"CLSID\\" + object + L"\\TypeLib", library},
      {L"CLSID\\" + position + L"\\InprocServer32", path},
      {L"CLSID\\" + position + L"\\ProgID", L"TALUtil.cControlPosition"},
      {library_key + (sizeof(void*) == 8 ? L"\\1.0\\0\\win64" : L"\\1.0\\0\\win32"), path},
      {interface_key + L"\\TypeLib", library},
  };
  for (const auto& [root, owner] : {std::pair(HKEY_LOCAL_MACHINE, Scope::machine), {HKEY_CURRENT_USER, Scope::user}}) {
    const std::string where = owner == Scope::user ? "user, " : "machine, ";
    for (const auto& row : rows) {
      const bool is_of_library = row.key.starts_with(library_key) || row.key.starts_with(interface_key);
      // Wine registers a type library for all users even when asked to do it for one.
      if (is_of_library && scope == Scope::user && GetProcAddress(GetModuleHandleW(L"ntdll"), "wine_get_version"))
        continue;
      const std::wstring top = row.key.substr(0, row.key.find(L'\\', row.key.find(L'}') + 1));
      if (owner == scope)
        check_equal(row.expected, value_of(root, row.key, row.name), where + narrow(row.key));
      else
        check(!has_key(root, top), where + narrow(top) + " is not there");
    }
  }
}

void an_object_can_be_called() {
  const Pointer<_ORVUtils> object = create_object();
  Text result;
  check_equal(S_OK, object->ReverseString(Text(L"abc"), result), "a call");
  check_equal(L"cba", result.view(), "its result");
  Pointer<ITypeInfo> information;
  check_equal(S_OK, object->GetTypeInfo(0, 0, information.receive()), "its type information");
  object->Terminate();
}

/// Uses the library as a program with the assembly in its manifest does, also from a thread in no apartment of this
/// one.
void is_used_without_registration(const std::wstring& manifest) {
  ACTCTXW request{};
  request.cbSize = sizeof request;
  request.lpSource = manifest.c_str();
  CLSID class_id;
  check(FAILED(CLSIDFromProgID(L"TALUtil.ORVUtils", &class_id)), "nothing is registered");
  const HANDLE context = CreateActCtxW(&request);
  if (!check(context != INVALID_HANDLE_VALUE, "the manifest is accepted")) return;
  ULONG_PTR cookie = 0;
  check(ActivateActCtx(context, &cookie) != FALSE, "the manifest is activated");
  check_equal(S_OK, CLSIDFromProgID(L"TALUtil.ORVUtils", &class_id), "the program identifier");
  an_object_can_be_called();
  on_another_thread(COINIT_MULTITHREADED, [context] {
    ULONG_PTR other_cookie = 0;
    ActivateActCtx(context, &other_cookie);
    an_object_can_be_called();
  });
  DeactivateActCtx(0, cookie);
  ReleaseActCtx(context);
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    const std::wstring folder(arguments[1]);
    const std::wstring path = folder + L"\\TALUtil.dll";
    const HMODULE module = LoadLibraryW(path.c_str());
    const auto entry = [module](const char* name) { return reinterpret_cast<void*>(GetProcAddress(module, name)); };
    const auto register_server = reinterpret_cast<HRESULT(WINAPI*)()>(entry("DllRegisterServer"));
    const auto unregister_server = reinterpret_cast<HRESULT(WINAPI*)()>(entry("DllUnregisterServer"));
    const auto install = reinterpret_cast<HRESULT(WINAPI*)(BOOL, LPCWSTR)>(entry("DllInstall"));

    check_equal(S_OK, unregister_server(), "removal, whatever was there");
    check_equal(S_OK, install(FALSE, L"user"), "removal for the user, whatever was there");
    is_used_without_registration(folder + L"\\TALUtil.manifest");

    check_equal(S_OK, install(TRUE, L"user"), "registration for the user");
    is_registered(Scope::user, path);
    check_equal(S_OK, install(FALSE, L"user"), "removal for the user");
    is_registered(Scope::none, path);
    check_equal(S_OK, register_server(), "registration for the machine");
    check_equal(S_OK, register_server(), "registration once more");
    is_registered(Scope::machine, path);
    check_equal(S_OK, unregister_server(), "removal for the machine");
    is_registered(Scope::none, path);
    check_equal(S_OK, unregister_server(), "removal once more");
  });
}
