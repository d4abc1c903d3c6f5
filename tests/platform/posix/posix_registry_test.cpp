#include "platform/posix/posix_registry.hpp"

#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <net/if.h>
#include <netinet/in.h>
#include <sched.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstring>
#include <filesystem>

#include "automation/variant.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::posix {
namespace {

TEST(PosixRegistry, KeepsTypesAndSharesTextsWithTheSettings) {
  const std::string path =
      (std::filesystem::temp_directory_path() / ("talutil-hive-" + std::to_string(getpid()))).string();
  {
    Hive hive(path);
    PosixRegistry registry(hive);
    Registry::Handle key = 0;
    EXPECT_EQ(registry.open(Registry::current_user, u"Software\\X", Registry::query_value, key), Registry::not_found);
    EXPECT_EQ(registry.create(0x12345, u"Software\\X", key), Registry::invalid_handle);
    ASSERT_EQ(registry.create(Registry::current_user, u"Software\\X\\Y", key), Registry::ok);
    registry.close(key);
    // The key above exists by the one below, in any case and with a separator at its end.
    ASSERT_EQ(registry.open(Registry::current_user, u"SOFTWARE\\x\\", Registry::query_value, key), Registry::ok);
    EXPECT_EQ(registry.set(key, u"text", Registry::text, std::string("\xE9t\xE9\0", 4)), Registry::ok);
    EXPECT_EQ(registry.set(key, u"bytes", Registry::binary, std::string("a\0b", 3)), Registry::ok);
    EXPECT_EQ(hive.value(u"HKEY_CURRENT_USER\\Software\\X", u"TEXT")->data, to_utf16_bytes(u"\u00E9t\u00E9"));
    std::uint32_t type = 0;
    std::uint32_t size = 0;
    std::array<char, 4> bytes{};
    EXPECT_EQ(registry.query(key, u"Text", type, size, bytes), Registry::ok);
    EXPECT_EQ(std::string(bytes.data(), size), std::string("\xE9t\xE9\0", 4));
    EXPECT_EQ(registry.query(key, u"bytes", type, size, std::span(bytes).first(2)), Registry::more_data);
    EXPECT_EQ(type, Registry::binary);
    EXPECT_EQ(size, 3U);
    EXPECT_EQ(registry.query(key + 1, u"text", type, size, {}), Registry::invalid_handle);
  }
  std::filesystem::remove(path);
}

/// Gives the loopback interface of this network namespace so many addresses, from 127.0.0.1 on.
bool add_addresses(int count) {
  const int control = socket(AF_INET, SOCK_DGRAM, 0);
  for (int i = 0; i < count; ++i) {
    ifreq request{};
    const std::string name = i == 0 ? "lo" : "lo:" + std::to_string(i);
    name.copy(request.ifr_name, sizeof request.ifr_name - 1);
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK + static_cast<std::uint32_t>(i));
    std::memcpy(&request.ifr_addr, &address, sizeof address);
    if (ioctl(control, SIOCSIFADDR, &request) != 0) return false;
    request.ifr_flags = IFF_UP;
    if (ioctl(control, SIOCSIFFLAGS, &request) != 0) return false;
  }
  close(control);
  return true;
}

TEST(PosixNetwork, ListsTheAddressesOfTheKernel) {
  for (const int count : {1, 21, 22}) {
    // In a process of its own, which leaves this one's network alone.
    const pid_t child = fork();
    if (child == 0) {
      if (unshare(CLONE_NEWNET) != 0 || !add_addresses(count)) _exit(2);
      PosixPlatform platform;
      Library library(platform.platform());
      const Variant result = ORVUtils(library).GetIpAddrTable();
      const std::size_t expected = count > 21 ? 0 : static_cast<std::size_t>(count);
      const auto* const addresses = result.get_if<TextArray>();
      const bool is_right =
          addresses->items.size() == expected &&
          (expected == 0 || (addresses->items.front() == u"127.0.0.1" &&
                             addresses->items.back() == u"127.0.0." + from_utf8(std::to_string(count))));
      _exit(is_right ? 0 : 1);
    }
    int status = 0;
    waitpid(child, &status, 0);
    if (WIFEXITED(status) && WEXITSTATUS(status) == 2) GTEST_SKIP() << "no right to a network of one's own";
    EXPECT_EQ(status, 0) << count;
  }
}

}  // namespace
}  // namespace talutil::posix
