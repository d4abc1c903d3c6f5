#include "com/registered_controls.hpp"

#include <array>

#include "automation/run_time_error.hpp"
#include "com/dispatch_object.hpp"
#include "com/pointer.hpp"
#include "platform/win32/handle.hpp"

namespace talutil::com {

namespace {

constexpr const wchar_t* key_name = L"Software\\TALUtil\\Controls";

/// The class registered for a name below one root; empty if there is none.
Text registered_class(HKEY root, const Text& class_name) {
  std::array<wchar_t, 256> value{};
  DWORD size = sizeof value;
  const LSTATUS status =
      RegGetValueW(root, key_name, win32::wide(class_name), RRF_RT_REG_SZ, nullptr, value.data(), &size);
  return status == ERROR_SUCCESS ? Text(win32::view(value.data(), size / sizeof(wchar_t) - 1)) : Text();
}

/// Whether the process has rights that the user's other programs lack. Those can write to the user's part of the
/// registry, and must not determine what code runs here.
bool is_elevated() noexcept {
  win32::Owned<win32::kind::KernelObject> token;
  if (OpenProcessToken(GetCurrentProcess(), TOKEN_QUERY, token.receive()) == FALSE) return false;
  TOKEN_ELEVATION_TYPE type = TokenElevationTypeDefault;
  DWORD size = sizeof type;
  GetTokenInformation(token.get(), TokenElevationType, &type, sizeof type, &size);
  return type == TokenElevationTypeFull;
}

}  // namespace

bool RegisteredControls::may_have_any() {
  for (const HKEY root : {HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE}) {
    win32::Owned<win32::kind::RegistryKey> key;
    // One that exists but cannot be opened is left to the look for each control.
    if (RegOpenKeyExW(root, key_name, 0, KEY_QUERY_VALUE, key.receive()) != ERROR_FILE_NOT_FOUND) return true;
  }
  return false;
}

ObjectRef RegisteredControls::create(TextView class_name) {
  const Text name(class_name);
  Text replacement = registered_class(HKEY_CURRENT_USER, name);
  if (!replacement.empty() && is_elevated()) replacement.clear();
  if (replacement.empty()) replacement = registered_class(HKEY_LOCAL_MACHINE, name);
  if (replacement.empty()) return {};

  CLSID class_id;
  Pointer<IUnknown> object;
  // Report a broken registration to the user; a silent fallback would hide it.
  if (FAILED(CLSIDFromString(win32::wide(replacement), &class_id)) ||
      FAILED(CoCreateInstance(class_id, nullptr, CLSCTX_INPROC_SERVER, IID_IUnknown, object.receive_untyped()))) {
    const Text description = u"ActiveX component can't create object: " + replacement + u" is registered in " +
                             Text(u"Software\\TALUtil\\Controls") + u" to stand for " + name +
                             u"; install it or remove the value";
    throw RunTimeError(ErrorNumber::cannot_create_object, description);
  }
  return object_from(object.get());
}

}  // namespace talutil::com
