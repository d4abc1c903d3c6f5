#include "com/registration.hpp"

#include <array>
#include <string>

#include "com/boundary.hpp"
#include "com/module.hpp"
#include "com/pointer.hpp"
#include "library/identity.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/module_path.hpp"

// In the platform's library, but not in the tool chain's headers.
extern "C" HRESULT WINAPI RegisterTypeLibForUser(ITypeLib* library, OLECHAR* path, OLECHAR* help_folder);
extern "C" HRESULT WINAPI UnRegisterTypeLibForUser(REFGUID library, WORD major, WORD minor, LCID locale, SYSKIND kind);

namespace talutil::com {

namespace {

/// 32-bit and 64-bit programs have separate class entries, but share program identifiers and type libraries.
constexpr bool is_64_bit = sizeof(void*) == 8;
constexpr SYSKIND system_kind = is_64_bit ? SYS_WIN64 : SYS_WIN32;
constexpr REGSAM view_of_others = is_64_bit ? KEY_WOW64_32KEY : KEY_WOW64_64KEY;

class Key {
 public:
  static Key create(HKEY parent, const std::wstring& path) {
    Key key;
    check(RegCreateKeyExW(parent, path.c_str(), 0, nullptr, 0, KEY_WRITE, nullptr, key.handle_.receive(), nullptr));
    return key;
  }

  void set(const wchar_t* name, const std::wstring& value) const {
    check(RegSetValueExW(handle_.get(), name, 0, REG_SZ, reinterpret_cast<const BYTE*>(value.c_str()),
                         static_cast<DWORD>(value.size() + 1) * sizeof(wchar_t)));
  }

  void remove(const wchar_t* name) const {
    const LSTATUS status = RegDeleteValueW(handle_.get(), name);
    if (status != ERROR_FILE_NOT_FOUND) check(status);
  }

  static void check(LSTATUS status) {
    if (status != ERROR_SUCCESS) throw system_error(HRESULT_FROM_WIN32(static_cast<DWORD>(status)));
  }

 private:
  Key() = default;

  win32::Owned<win32::kind::RegistryKey> handle_;
};

std::wstring text_of(const GUID& identifier) {
  std::array<wchar_t, 40> text{};
  StringFromGUID2(identifier, text.data(), static_cast<int>(text.size()));
  return text.data();
}

HKEY root_of(RegistrationScope scope) noexcept {
  return scope == RegistrationScope::user ? HKEY_CURRENT_USER : HKEY_LOCAL_MACHINE;
}

std::wstring class_key(const std::wstring& rest) { return L"Software\\Classes\\" + rest; }

std::wstring program_id_of(const identity::Class& entry) { return {entry.program_id.begin(), entry.program_id.end()}; }

std::wstring identifier_of(const identity::Class& entry) { return text_of(guid_of(entry.identifier)); }

void register_class(HKEY root, const identity::Class& entry, const std::wstring& path) {
  const std::wstring identifier = identifier_of(entry);
  const std::wstring program_id = program_id_of(entry);
  const std::wstring key = class_key(L"CLSID\\" + identifier);
  Key::create(root, class_key(program_id)).set(nullptr, program_id);
  Key::create(root, class_key(program_id + L"\\CLSID")).set(nullptr, identifier);
  Key::create(root, key).set(nullptr, program_id);
  const Key server = Key::create(root, key + L"\\InprocServer32");
  server.set(nullptr, path);
  // No ThreadingModel: objects live in the host's first apartment, to which calls from others are marshalled, because
  // nothing locks the shared settings. Earlier versions may have registered one.
  server.remove(L"ThreadingModel");
  Key::create(root, key + L"\\ProgID").set(nullptr, program_id);
  Key::create(root, key + L"\\TypeLib").set(nullptr, text_of(guid_of(identity::type_library)));
  const std::string version =
      std::to_string(identity::type_library_major) + "." + std::to_string(identity::type_library_minor);
  Key::create(root, key + L"\\Version").set(nullptr, {version.begin(), version.end()});
  Key::create(root, key + L"\\Programmable").set(nullptr, L"");
}

/// True while the library for programs of the other bitness is registered.
bool others_have(HKEY root, const identity::Class& entry) {
  win32::Owned<win32::kind::RegistryKey> key;
  const std::wstring path = class_key(L"CLSID\\" + identifier_of(entry));
  return RegOpenKeyExW(root, path.c_str(), 0, KEY_QUERY_VALUE | view_of_others, key.receive()) == ERROR_SUCCESS;
}

void register_type_library(RegistrationScope scope, const std::wstring& path) {
  Pointer<ITypeLib> library;
  HRESULT result = LoadTypeLibEx(path.c_str(), REGKIND_NONE, library.receive());
  if (SUCCEEDED(result)) {
    auto* const name = const_cast<wchar_t*>(path.c_str());
    result = scope == RegistrationScope::user ? RegisterTypeLibForUser(library.get(), name, nullptr)
                                              : RegisterTypeLib(library.get(), name, nullptr);
  }
  if (FAILED(result)) throw system_error(result);
}

}  // namespace

HRESULT register_library(RegistrationScope scope) noexcept {
  const HRESULT result = guarded([scope] {
    const Text own_path = win32::module_path(module_handle());
    const std::wstring path(own_path.begin(), own_path.end());
    for (const identity::Class& entry : identity::classes) register_class(root_of(scope), entry, path);
    register_type_library(scope, path);
  });
  if (FAILED(result)) static_cast<void>(unregister_library(scope));
  return result;
}

HRESULT unregister_library(RegistrationScope scope) noexcept {
  return guarded([scope] {
    const auto remove = [root = root_of(scope)](const std::wstring& key) {
      const LSTATUS status = RegDeleteTreeW(root, key.c_str());
      if (status != ERROR_FILE_NOT_FOUND) Key::check(status);
    };
    for (const identity::Class& entry : identity::classes) {
      // First, because on a system with only one bitness both views are the same.
      remove(class_key(L"CLSID\\" + identifier_of(entry)));
      if (!others_have(root_of(scope), entry)) remove(class_key(program_id_of(entry)));
    }
    const GUID library = guid_of(identity::type_library);
    const auto unregister = scope == RegistrationScope::user ? &UnRegisterTypeLibForUser : &UnRegisterTypeLib;
    const HRESULT result =
        unregister(library, identity::type_library_major, identity::type_library_minor, 0, system_kind);
    // Wine returns E_INVALIDARG for a library that is not registered.
    if (FAILED(result) && result != TYPE_E_REGISTRYACCESS && result != TYPE_E_LIBNOTREGISTERED &&
        result != E_INVALIDARG) {
      throw system_error(result);
    }
  });
}

}  // namespace talutil::com
