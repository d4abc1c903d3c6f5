#include "platform/win32/win32_settings.hpp"

#include <array>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"

namespace talutil::win32 {

namespace {

constexpr TextView settings_key = u"Software\\TALUtil\\Settings\\";

/// The result of the profile functions; a null item lists the names.
///
/// The wide functions: a file without a byte order mark is in the system's ANSI code page for them too, but paths and
/// the names in them keep every character.
Text read_profile(const Text& file, const Text& section, const wchar_t* item) {
  std::array<wchar_t, Profiles::longest_value + 1> buffer{};
  const DWORD count =
      GetPrivateProfileStringW(wide(section), item, L"", buffer.data(), static_cast<DWORD>(buffer.size()), wide(file));
  return Text(view(buffer.data(), count));
}

/// Names end at a NUL, as they do for the system.
Text path_of(const Text& application, const Text& section) {
  const Text path = Text(settings_key).append(up_to_nul(application));
  return section.empty() ? path : (path + u'\\').append(up_to_nul(section));
}

DWORD bytes_of(std::size_t units) { return static_cast<DWORD>(units) * DWORD{sizeof(char16_t)}; }

void require(LSTATUS status, const Text& path) {
  if (status == ERROR_SUCCESS) return;
  throw RunTimeError(ErrorNumber::device_io_error, u"Cannot use the settings in HKEY_CURRENT_USER\\" + path +
                                                       u": system error " +
                                                       number_to_text(static_cast<std::int32_t>(status)));
}

/// Returns false for a missing key or value; raises other failures.
bool is_there(LSTATUS status, const Text& path) {
  if (status == ERROR_FILE_NOT_FOUND || status == ERROR_PATH_NOT_FOUND) return false;
  require(status, path);
  return true;
}

}  // namespace

Text Win32Profiles::value(const Text& file, const Text& section, const Text& item) {
  return read_profile(file, section, wide(item));
}

Text Win32Profiles::item_names(const Text& file, const Text& section) { return read_profile(file, section, nullptr); }

void Win32Profiles::put(const Text& file, const Text& section, const Text& item, const Text& value) {
  WritePrivateProfileStringW(wide(section), wide(item), wide(value), wide(file));
}

std::optional<Text> Win32SettingsStore::value(const Text& application, const Text& section, const Text& key) {
  const Text path = path_of(application, section);
  Owned<kind::RegistryKey> opened;
  if (!is_there(RegOpenKeyExW(HKEY_CURRENT_USER, wide(path), 0, KEY_QUERY_VALUE, opened.receive()), path)) {
    return std::nullopt;
  }
  Text text;
  DWORD type = 0;
  DWORD bytes = 0;
  LSTATUS status = RegQueryValueExW(opened.get(), wide(key), nullptr, &type, nullptr, &bytes);
  // Another process may lengthen the value between the two calls.
  while (status == ERROR_SUCCESS || status == ERROR_MORE_DATA) {
    text.resize((bytes + 1) / sizeof(char16_t));
    bytes = bytes_of(text.size());
    status = RegQueryValueExW(opened.get(), wide(key), nullptr, &type, reinterpret_cast<BYTE*>(text.data()), &bytes);
    if (status == ERROR_SUCCESS) break;
  }
  if (!is_there(status, path) || type != REG_SZ) return std::nullopt;
  text.resize(bytes / sizeof(char16_t));
  if (text.ends_with(u'\0')) text.pop_back();
  return text;
}

void Win32SettingsStore::put(const Text& application, const Text& section, const Text& key, const Text& value) {
  const Text path = path_of(application, section);
  Owned<kind::RegistryKey> opened;
  require(
      RegCreateKeyExW(HKEY_CURRENT_USER, wide(path), 0, nullptr, 0, KEY_SET_VALUE, nullptr, opened.receive(), nullptr),
      path);
  const DWORD bytes = bytes_of(value.size() + 1);
  require(RegSetValueExW(opened.get(), wide(key), 0, REG_SZ, reinterpret_cast<const BYTE*>(value.c_str()), bytes),
          path);
}

}  // namespace talutil::win32
