// Registration for the machine and for the user, removal, and use without any.
#include <set>

#include "client.hpp"

using namespace talutil::hosts;

namespace {

using Lines = std::set<std::wstring>;

/// Adds what is below a key of Software\Classes: "KEY\" and "KEY\NAME=VALUE".
void add_tree(Lines& lines, HKEY root, const std::wstring& key) {
  HKEY handle = nullptr;
  if (RegOpenKeyExW(root, (L"Software\\Classes\\" + key).c_str(), 0, KEY_READ, &handle) != ERROR_SUCCESS) return;
  lines.insert(key + L"\\");
  std::array<wchar_t, 300> name{};
  std::array<wchar_t, 300> value{};
  auto* const data = reinterpret_cast<BYTE*>(value.data());
  for (DWORD i = 0, length = 300, size = sizeof value;
       RegEnumValueW(handle, i, name.data(), &length, nullptr, nullptr, data, &size) == ERROR_SUCCESS;
       ++i, length = 300, size = sizeof value)
    lines.insert(key + L"\\" + name.data() + L"=" + value.data());
  for (DWORD i = 0; RegEnumKeyW(handle, i, name.data(), 300) == ERROR_SUCCESS; ++i)
    add_tree(lines, root, key + L"\\" + name.data());
  RegCloseKey(handle);
}

/// Lines that one of two has alone are a failure.
void are_the_same(const Lines& expected, const Lines& found, const std::string& what) {
  std::wstring lines;
  for (const std::wstring& line : found) lines += expected.contains(line) ? L"" : L"; not expected: " + line;
  for (const std::wstring& line : expected) lines += found.contains(line) ? L"" : L"; missing: " + line;
  check(lines.empty(), what + narrow(lines));
}

const std::wstring object_id = L"{13223AC3-C9F1-4A82-A6C4-951E12542E20}";
const std::wstring position_id = L"{9039A04F-B619-4A0C-A9C9-AA2B3F5BC3DC}";
const std::wstring library_id = L"{BC9C637E-DB88-4022-B98F-6F65F8CE12E5}";
const std::wstring interface_id = L"{6AF6495B-C4A1-4417-92A9-AE87BC1F2674}";

Lines classes_in(HKEY root) {
  Lines lines;
  for (const wchar_t* const name : {L"TALUtil.ORVUtils", L"TALUtil.cControlPosition"}) add_tree(lines, root, name);
  for (const std::wstring& id : {object_id, position_id}) add_tree(lines, root, L"CLSID\\" + id);
  return lines;
}

Lines type_library_in(HKEY root) {
  Lines lines;
  add_tree(lines, root, L"TypeLib\\" + library_id);
  add_tree(lines, root, L"Interface\\" + interface_id);
  return lines;
}

enum class Scope { none, user, machine };

/// Looks for everything that a registration in one scope makes, and for nothing of it in the other.
void is_registered(Scope scope, const std::wstring& path) {
  const Lines classes = {L"TALUtil.ORVUtils\\CLSID\\=" + object_id,
                         L"TALUtil.cControlPosition\\CLSID\\=" + position_id,
                         L"CLSID\\" + object_id + L"\\InprocServer32\\=" + path,
                         L"CLSID\\" + object_id + L"\\ProgID\\=TALUtil.ORVUtils",
                         L"CLSID\\" + object_id + L"\\TypeLib\\=" + library_id,
                         L"CLSID\\" + position_id + L"\\InprocServer32\\=" + path,
                         L"CLSID\\" + position_id + L"\\ProgID\\=TALUtil.cControlPosition"};
  const Lines libraries = {
      L"TypeLib\\" + library_id + (sizeof(void*) == 8 ? L"\\1.0\\0\\win64\\=" : L"\\1.0\\0\\win32\\=") + path,
      L"Interface\\" + interface_id + L"\\TypeLib\\=" + library_id};
  const bool is_wine = GetProcAddress(GetModuleHandleW(L"ntdll"), "wine_get_version") != nullptr;
  for (const auto& [root, owner] : {std::pair(HKEY_LOCAL_MACHINE, Scope::machine), {HKEY_CURRENT_USER, Scope::user}}) {
    for (const auto& [found, expected] : {std::pair(classes_in(root), classes), {type_library_in(root), libraries}}) {
      // Wine registers a type library for all users even when asked to do it for one.
      if (expected == libraries && scope == Scope::user && is_wine) continue;
      const std::string where = owner == Scope::user ? "the user's part" : "the machine's part";
      for (const std::wstring& line : expected) check(owner != scope || found.contains(line), narrow(line));
      if (owner != scope) are_the_same({}, found, where);
      const auto is_model = [](const std::wstring& line) { return line.find(L"ThreadingModel") != std::wstring::npos; };
      check(std::ranges::none_of(found, is_model), where + " has no threading model");
    }
  }
}

/// Registers over what an earlier version has left, which ends in the same as on clean ground.
void earlier_registrations_are_replaced(HKEY root, const std::function<HRESULT()>& registers) {
  const Lines clean = classes_in(root);
  for (const std::wstring& id : {object_id, position_id}) {
    const std::wstring key = L"Software\\Classes\\CLSID\\" + id + L"\\InprocServer32";
    for (const wchar_t* const name : {L"", L"ThreadingModel"})
      RegSetKeyValueW(root, key.c_str(), name, REG_SZ, L"Both", 5 * sizeof(wchar_t));
  }
  check(classes_in(root) != clean, "what an earlier version has left");
  check_equal(S_OK, registers(), "registration once more");
  are_the_same(clean, classes_in(root), "what is registered over it");
}

void an_object_can_be_called() {
  const Pointer<_ORVUtils> object = create_object();
  check_equal(L"cba", text(object.get(), &_ORVUtils::ReverseString, Text(L"abc")), "a call");
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
    earlier_registrations_are_replaced(HKEY_CURRENT_USER, [&] { return install(TRUE, L"user"); });
    check_equal(S_OK, install(FALSE, L"user"), "removal for the user");
    is_registered(Scope::none, path);
    check_equal(S_OK, register_server(), "registration for the machine");
    is_registered(Scope::machine, path);
    earlier_registrations_are_replaced(HKEY_LOCAL_MACHINE, register_server);
    check_equal(S_OK, unregister_server(), "removal for the machine");
    is_registered(Scope::none, path);
    check_equal(S_OK, unregister_server(), "removal once more");
  });
}
