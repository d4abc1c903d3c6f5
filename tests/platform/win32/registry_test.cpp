#include <gtest/gtest.h>

#include <array>

#include "automation/variant.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/win32_registry.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil::win32 {
namespace {

/// The members over the platform's own registry and network; the rest of the platform is fake.
struct RealRegistry : ::testing::Test {
  testing::FakePlatform fake;
  Win32Registry registry;
  Win32Network network;
  Library library{[this] {
    fake.real_registry = &registry;
    fake.real_network = &network;
    return fake.platform();
  }()};
  ORVUtils utils{library};
};

TEST_F(RealRegistry, MembersAgreeWithThePlatform) {
  const Text path = u"Software\\TALUtil\\Test";
  constexpr auto user = static_cast<std::int32_t>(0x80000001U);
  RegDeleteKeyW(HKEY_CURRENT_USER, wide(path));
  EXPECT_EQ(utils.REGISTRY_QueryValue(path, u"text"), ERROR_INVALID_HANDLE);
  utils.REGISTRY_CreateNewKey(path, user);
  utils.REGISTRY_CreateNewKey(path, user);
  EXPECT_EQ(utils.REGISTRY_QueryValue(path, u"text"), ERROR_FILE_NOT_FOUND);
  utils.REGISTRY_SetKeyValue(path, u"text", u"abc", 1);
  utils.REGISTRY_SetKeyValue(path, u"number", 42, 4);
  std::array<char, 8> bytes{};
  DWORD size = bytes.size();
  DWORD type = 0;
  RegGetValueA(HKEY_CURRENT_USER, "Software\\TALUtil\\Test", "text", RRF_RT_ANY, &type, bytes.data(), &size);
  EXPECT_EQ(type, REG_SZ);
  EXPECT_EQ(std::string(bytes.data(), size), std::string("abc\0", 4));
  EXPECT_EQ(utils.REGISTRY_ReturnValue(path, u"text"), u"abc");
  EXPECT_EQ(utils.REGISTRY_ReturnValue(path, u"number"), u"42");
  RegSetKeyValueA(HKEY_CURRENT_USER, "Software\\TALUtil\\Test", "bytes", REG_BINARY, "xy", 2);
  EXPECT_EQ(utils.REGISTRY_QueryValue(path, u"bytes"), -1);
  EXPECT_EQ(utils.REGISTRY_ReturnValue(path, u"bytes"), u"");
  RegDeleteKeyW(HKEY_CURRENT_USER, wide(path));
}

TEST_F(RealRegistry, AddressesAreThePlatforms) {
  using Function = DWORD(WINAPI*)(void*, ULONG*, BOOL);
  const auto get = late_function<Function>(L"iphlpapi.dll", "GetIpAddrTable");
  ASSERT_NE(get, nullptr);
  std::array<std::uint8_t, 4096> table{};
  ULONG size = table.size();
  ASSERT_EQ(get(table.data(), &size, TRUE), static_cast<DWORD>(NO_ERROR));
  const Variant result = utils.GetIpAddrTable();
  const auto& addresses = result.get_if<TextArray>()->items;
  ASSERT_EQ(addresses.size(), table[0] > 21 ? 0U : table[0]);
  for (std::size_t i = 0; i < addresses.size(); ++i) {
    const std::uint8_t* const row = &table[4 + 24 * i];
    EXPECT_EQ(to_utf8(addresses[i]), std::to_string(row[0]) + "." + std::to_string(row[1]) + "." +
                                         std::to_string(row[2]) + "." + std::to_string(row[3]));
  }
}

}  // namespace
}  // namespace talutil::win32
