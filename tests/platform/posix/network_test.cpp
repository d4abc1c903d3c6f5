#include <arpa/inet.h>
#include <net/if.h>
#include <netinet/in.h>
#include <sched.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>

#include "platform/posix/posix_registry.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::posix {
namespace {

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

struct PosixNetworkTest : testing::UtilsTest {
  PosixNetworkTest()
      : UtilsTest(
            [](auto& fake) { fake.use(&testing::FakePlatform::used_network, std::make_shared<PosixNetwork>()); }) {}
};

TEST_F(PosixNetworkTest, ListsTheAddressesOfTheKernel) {
  for (const int count : {1, 21, 22}) {
    // In a process of its own, which leaves this one's network alone.
    const pid_t child = fork();
    if (child == 0) {
      if (unshare(CLONE_NEWNET) != 0 || !add_addresses(count)) _exit(2);
      std::vector<Text> expected;
      for (int i = 1; i <= count && count <= 21; ++i) expected.push_back(u"127.0.0." + number_to_text(i));
      _exit(utils.GetIpAddrTable() == Variant(testing::array_of(expected)) ? 0 : 1);
    }
    int status = 0;
    waitpid(child, &status, 0);
    if (WIFEXITED(status) && WEXITSTATUS(status) == 2) GTEST_SKIP() << "no right to a network of one's own";
    EXPECT_EQ(status, 0) << count;
  }
}

}  // namespace
}  // namespace talutil::posix
