// Registration for the machine and for the user, removal, and use without any.
#include <span>

#include "client.hpp"

using namespace talutil::hosts;

namespace {

constexpr const wchar_t* object_class = L"CLSID\\{13223AC3-C9F1-4A82-A6C4-951E12542E20}";
constexpr const wchar_t* position_class = L"CLSID\\{9039A04F-B619-4A0C-A9C9-AA2B3F5BC3DC}";
constexpr const wchar_t* library_key = L"TypeLib\\{BC9C637E-DB88-4022-B98F-6F65F8CE12E5}";
constexpr const wchar_t* interface_key = L"Interface\\{6AF6495B-C4A1-4417-92A9-AE87BC1F2674}";

std::wstring value_of(HKEY root, const std::wstring& key, const wchar_t* name) {
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

struct EntryRow {
  std::wstring key;
  const wchar_t* name;
  std::wstring expected;
};

/// Wine registers a type library for all users even when asked to do it for one.
bool type_library_goes_to(HKEY root) {
  const bool is_wine = GetProcAddress(GetModuleHandleW(L"ntdll.dll"), "wine_get_version") != nullptr;
  return root == HKEY_LOCAL_MACHINE || !is_wine;
}

void is_registered(HKEY root, const std::string& scope, const std::wstring& path) {
  const std::wstring object(object_class);
  const std::wstring position(position_class);
  const std::wstring library(library_key);
  const EntryRow rows[] = {
      {L"TALUtil.ORVUtils\\CLSID", nullptr, object.substr(6)},
      {L"TALUtil.cControlPosition\\CLSID", nullptr, position.substr(6)},
      {object + L"\\InprocServer32", nullptr, path},
      {object + L"\\InprocServer32", L"ThreadingModel", L"(none)"},
      {object + L"\\ProgID", nullptr, L"TALUtil.ORVUtils"},
      {object + L"\\TypeLib", nullptr, library.substr(8)},
      {position + L"\\InprocServer32", nullptr, path},
      {position + L"\\ProgID", nullptr, L"TALUtil.cControlPosition"},
      {library + (sizeof(void*) == 8 ? L"\\1.0\\0\\win64" : L"\\1.0\\0\\win32"), nullptr, path},
      {interface_key + std::wstring(L"\\TypeLib"), nullptr, library.substr(8)},
  };
  for (const EntryRow& row : rows) {
    const bool is_of_class = row.key.starts_with(L"CLSID") || row.key.starts_with(L"TALUtil");
    if (!is_of_class && !type_library_goes_to(root)) continue;
    check_equal(row.expected, value_of(root, row.key, row.name), scope + ", " + narrow(row.key));
  }
}

constexpr const wchar_t* class_keys[] = {L"TALUtil.ORVUtils", L"TALUtil.cControlPosition", object_class,
                                         position_class};
constexpr const wchar_t* library_keys[] = {library_key, interface_key};

void has_none_of(HKEY root, std::span<const wchar_t* const> keys, const std::string& when) {
  for (const wchar_t* const key : keys) check(!has_key(root, key), when + ", " + narrow(key) + " is not there");
}

void nothing_is_registered(const std::string& when) {
  for (const HKEY root : {HKEY_LOCAL_MACHINE, HKEY_CURRENT_USER}) {
    has_none_of(root, class_keys, when);
    has_none_of(root, library_keys, when);
  }
}

/// What an early-bound caller gets on a thread of its own, which is in no apartment of this one.
std::wstring reversed_in_another_apartment(HANDLE context) {
  std::wstring answer;
  on_another_thread(COINIT_MULTITHREADED, [&] {
    ULONG_PTR cookie = 0;
    ActivateActCtx(context, &cookie);
    const Pointer<_ORVUtils> object = create_object();
    Text result;
    const HRESULT status = object->ReverseString(Text(L"abc"), result);
    answer = (status == S_OK ? L"S_OK " : L"failed ") + std::wstring(result.view());
  });
  return answer;
}

/// Uses the library as a program with the assembly in its manifest does.
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
  {
    const Pointer<_ORVUtils> object = create_object();
    Text result;
    check_equal(S_OK, object->ReverseString(Text(L"abc"), result), "a call");
    check_equal(L"cba", result.view(), "its result");
    check_equal(std::wstring(L"S_OK cba"), reversed_in_another_apartment(context), "a call from another apartment");
    Pointer<ITypeInfo> information;
    check_equal(S_OK, object->GetTypeInfo(0, 0, information.receive()), "its type information");
    object->Terminate();
  }
  DeactivateActCtx(0, cookie);
  ReleaseActCtx(context);
}

using Register = HRESULT(WINAPI*)();
using Install = HRESULT(WINAPI*)(BOOL, LPCWSTR);

template <class Function>
Function function_of(HMODULE module, const char* name) {
  const auto found = reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
  if (found == nullptr) throw std::runtime_error(std::string("no function ") + name);
  return found;
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    const std::wstring folder(arguments[1]);
    const std::wstring path = folder + L"\\TALUtil.dll";
    const HMODULE module = LoadLibraryW(path.c_str());
    const auto register_server = function_of<Register>(module, "DllRegisterServer");
    const auto unregister_server = function_of<Register>(module, "DllUnregisterServer");
    const auto install = function_of<Install>(module, "DllInstall");

    check_equal(S_OK, unregister_server(), "removal, whatever was there");
    check_equal(S_OK, install(FALSE, L"user"), "removal for the user, whatever was there");
    is_used_without_registration(folder + L"\\TALUtil.manifest");

    check_equal(S_OK, install(TRUE, L"user"), "registration for the user");
    is_registered(HKEY_CURRENT_USER, "user", path);
    has_none_of(HKEY_LOCAL_MACHINE, class_keys, "machine, while registered for the user");
    check_equal(S_OK, install(FALSE, L"user"), "removal for the user");
    nothing_is_registered("after removal for the user");
    check_equal(S_OK, register_server(), "registration for the machine");
    check_equal(S_OK, register_server(), "registration once more");
    is_registered(HKEY_LOCAL_MACHINE, "machine", path);
    has_none_of(HKEY_CURRENT_USER, class_keys, "user, while registered for the machine");
    check_equal(S_OK, unregister_server(), "removal for the machine");
    nothing_is_registered("after removal for the machine");
    check_equal(S_OK, unregister_server(), "removal once more");
  });
}
