#include "tests/platform/real_platform.hpp"

#include <fcntl.h>
#include <net/if.h>
#include <netinet/in.h>
#include <stdlib.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <time.h>

#include <array>
#include <cstring>
#include <filesystem>
#include <map>
#include <set>

#include "platform/posix/descriptor.hpp"

namespace talutil::testing {

namespace {

/// Drive T: and the registry are in a temporary folder, removed when the program ends.
struct TemporaryDrives {
  std::string root = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "talutil-drives-XXXXXX").string();
    return std::string(mkdtemp(pattern.data()));
  }();
  TemporaryDrives() {
    std::filesystem::create_directory(root + "/t");
    setenv("TALUTIL_DRIVES", root.c_str(), 1);
    setenv("TALUTIL_HIVE", (root + "/hive.db").c_str(), 1);
  }
  TemporaryDrives(const TemporaryDrives&) = delete;
  TemporaryDrives& operator=(const TemporaryDrives&) = delete;
  ~TemporaryDrives() { std::filesystem::remove_all(root); }
};

std::string native(const Text& path) { return posix::DrivePaths().native(path); }

}  // namespace

NativePlatform& real_platform() {
  static const TemporaryDrives drives;
  static NativePlatform platform(1252);
  return platform;
}

Registry* real_registry() { return &real_platform().registry; }

CodePage* real_code_page(std::uint32_t number) {
  static std::map<std::uint32_t, std::unique_ptr<CodePage>> pages;
  return pages.try_emplace(number, posix::make_code_page(number)).first->second.get();
}

std::vector<Text> machine_addresses() {
  std::array<ifreq, 100> interfaces{};
  ifconf list{};
  list.ifc_len = sizeof interfaces;
  list.ifc_req = interfaces.data();
  const posix::Descriptor socket(::socket(AF_INET, SOCK_DGRAM, 0));
  ioctl(socket.get(), SIOCGIFCONF, &list);
  std::multiset<std::array<std::uint8_t, 4>> found;
  for (std::size_t i = 0; i < static_cast<std::size_t>(list.ifc_len) / sizeof(ifreq); ++i) {
    std::array<std::uint8_t, 4> address{};
    std::memcpy(address.data(), interfaces[i].ifr_addr.sa_data + 2, sizeof address);
    found.insert(address);
  }
  std::vector<Text> addresses;
  for (const auto& address : found) addresses.push_back(address_at(address.data()));
  return addresses;
}

void for_each_zone(const std::function<void(std::int64_t seconds)>& use) {
  const char* const variable = getenv("TZ");
  const std::string before = variable == nullptr ? "" : variable;
  const struct {
    const char* name;
    std::int64_t standard_minutes, summer_minutes;
  } zones[] = {{"Australia/Brisbane", 600, 600},
               {"Australia/Sydney", 600, 660},
               {"Europe/London", 0, 60},
               {"America/St_Johns", -210, -150},
               {"Pacific/Chatham", 765, 825}};
  for (const auto& zone : zones) {
    setenv("TZ", zone.name, 1);
    tzset();
    const time_t now = time(nullptr);
    struct tm local {};
    localtime_r(&now, &local);
    use(60 * (local.tm_isdst > 0 ? zone.summer_minutes : zone.standard_minutes));
  }
  variable == nullptr ? unsetenv("TZ") : setenv("TZ", before.c_str(), 1);
  tzset();
}

Text scratch_folder() {
  static int count = 0;
  Text folder = u"T:\\scratch" + from_utf8(std::to_string(++count)) + u"\\";
  real_files()->make_path(folder);
  return folder;
}

Text make_hidden_file(const Text& folder) {
  real_files()->append(folder + u".hidden.txt", "");
  return folder + u".hidden.txt";
}

void set_read_only(const Text& path, bool read_only) { chmod(native(path).c_str(), read_only ? 0444 : 0644); }

std::shared_ptr<void> lock_file(const Text& path) {
  auto file = std::make_shared<posix::Descriptor>(posix::open_file(native(path), O_RDONLY));
  posix::lock(*file, LOCK_EX);
  return file;
}

}  // namespace talutil::testing
