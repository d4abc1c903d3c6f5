#include "platform/win32/handle.hpp"
#include "platform/win32/win32_registry.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::win32 {
namespace {

struct Win32NetworkTest : testing::UtilsTest {
  Win32NetworkTest()
      : UtilsTest(
            [](auto& fake) { fake.use(&testing::FakePlatform::used_network, std::make_shared<Win32Network>()); }) {}
};

TEST_F(Win32NetworkTest, AddressesAreThePlatforms) {
  using Function = DWORD(WINAPI*)(void*, ULONG*, BOOL);
  const auto get = late_function<Function>(L"iphlpapi.dll", "GetIpAddrTable");
  ASSERT_NE(get, nullptr);
  std::array<std::uint8_t, 4096> table{};
  ULONG size = table.size();
  ASSERT_EQ(get(table.data(), &size, TRUE), static_cast<DWORD>(NO_ERROR));
  std::vector<Text> expected;
  for (std::size_t i = 0; i < table[0] && table[0] <= 21; ++i) {
    Text& address = expected.emplace_back();
    for (std::size_t part = 0; part < 4; ++part) {
      address += (part == 0 ? u"" : u".") + number_to_text(std::int32_t{table[4 + 24 * i + part]});
    }
  }
  EXPECT_EQ(utils.GetIpAddrTable(), Variant(testing::array_of(expected)));
}

}  // namespace
}  // namespace talutil::win32
