#include "tests/platform/real_platform.hpp"

#include <array>
#include <map>

namespace talutil::testing {

NativePlatform& real_platform() {
  static NativePlatform platform;
  return platform;
}

Registry* real_registry() {
  RegDeleteKeyW(HKEY_CURRENT_USER, L"Software\\TALUtil\\Test\\Below");
  RegDeleteKeyW(HKEY_CURRENT_USER, L"Software\\TALUtil\\Test");
  return &real_platform().registry;
}

CodePage* real_code_page(std::uint32_t number) {
  static std::map<std::uint32_t, win32::Win32CodePage> pages;
  return &pages.try_emplace(number, number).first->second;
}

std::vector<Text> machine_addresses() {
  using Function = DWORD(WINAPI*)(void*, ULONG*, BOOL);
  std::array<std::uint8_t, 4096> table{};
  ULONG size = table.size();
  win32::late_function<Function>(L"iphlpapi.dll", "GetIpAddrTable")(table.data(), &size, TRUE);
  std::vector<Text> addresses;
  for (std::size_t i = 0; i < table[0]; ++i) addresses.push_back(address_at(&table[4 + 24 * i]));
  return addresses;
}

void for_each_zone(const std::function<void(std::int64_t seconds)>& use) {
  TIME_ZONE_INFORMATION zone{};
  const DWORD season = GetTimeZoneInformation(&zone);
  LONG bias = zone.Bias;
  if (season == TIME_ZONE_ID_STANDARD) bias += zone.StandardBias;
  if (season == TIME_ZONE_ID_DAYLIGHT) bias += zone.DaylightBias;
  use(std::int64_t{-60} * bias);
}

Text scratch_folder() {
  static int count = 0;
  std::array<wchar_t, MAX_PATH + 1> temporary{};
  const DWORD length = GetTempPathW(static_cast<DWORD>(temporary.size()), temporary.data());
  Text folder = Text(win32::view(temporary.data(), length)) + u"talutil" +
                from_utf8(std::to_string(GetTickCount()) + "-" + std::to_string(++count)) + u"\\";
  real_files()->make_path(folder);
  return folder;
}

Text make_hidden_file(const Text& folder) {
  const Text path = folder + u"hidden.txt";
  real_files()->append(path, "");
  SetFileAttributesW(win32::wide(path), FILE_ATTRIBUTE_HIDDEN);
  return path;
}

void set_read_only(const Text& path, bool read_only) {
  SetFileAttributesW(win32::wide(path), read_only ? FILE_ATTRIBUTE_READONLY : FILE_ATTRIBUTE_NORMAL);
}

std::shared_ptr<void> lock_file(const Text& path) {
  return std::make_shared<win32::Owned<win32::kind::File>>(
      CreateFileW(win32::wide(path), GENERIC_READ, 0, nullptr, OPEN_EXISTING, 0, nullptr));
}

}  // namespace talutil::testing
