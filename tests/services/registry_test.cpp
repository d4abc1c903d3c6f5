#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

using RegistryTest = LateMembers;

TEST_F(RegistryTest, ReadsTextsAndNumbersOfTheUser) {
  // clang-format off
  platform.registry.keys[u"Key"] = {
      {u"text", {1, std::string("abc\0", 4)}}, {u"empty", {1, std::string(1, '\0')}}, {u"nothing", {1, ""}},
      {u"number", {4, std::string("\xD6\xFF\xFF\xFF", 4)}}, {u"binary", {3, "xy"}}, {u"long", {4, "123456"}}};
  check({{u"REGISTRY_QueryValue", {{u"Key|text", "0"}, {u"Key|empty", "0"}, {u"Key|nothing", "0"}, {u"Key|number", "0"},
          {u"Key|binary", "-1"}, {u"Key|long", "234"}, {u"Key|missing", "2"}, {u"Missing|text", "6"}}},
         {u"REGISTRY_ReturnValue", {{u"Key|text", "abc"}, {u"Key|empty", ""}, {u"Key|nothing", ""},
          {u"Key|number", "-42"},
          {u"Key|binary", ""}, {u"Key|long", ""}, {u"Key|missing", ""}, {u"Missing|text", ""}}}});
  // clang-format on
  EXPECT_EQ(platform.registry.calls[0], u"open 1 Key");
  EXPECT_TRUE(platform.registry.opened.empty()) << "a key was left open";
}

TEST_F(RegistryTest, WritesValuesOfKeysThatExist) {
  platform.registry.keys[u"Key"];
  check({{u"REGISTRY_SetKeyValue",
          {{u"Key|text|abc|1", "Empty"},
           {u"Key|from a number|=12|1", "Empty"},
           {u"Key|number|-2|4", "Empty"},
           {u"Key|other|abc|2", "Empty"},
           {u"Missing|text|abc|1", "Empty"},
           {u"Key|null|@null|1", "error 94"},
           {u"Key|word|abc|4", "error 13"}}}});
  const auto& values = platform.registry.keys[u"Key"];
  EXPECT_EQ(values.size(), 3U);
  EXPECT_EQ(values.at(u"text").data, std::string("abc\0", 4));
  EXPECT_EQ(values.at(u"from a number").data, std::string("12\0", 3));
  EXPECT_EQ(values.at(u"number").data, "\xFE\xFF\xFF\xFF");
  EXPECT_FALSE(platform.registry.keys.contains(u"Missing"));
  utils.REGISTRY_CreateNewKey(u"C", static_cast<std::int32_t>(0x80000002U));
  EXPECT_EQ(platform.registry.calls.end()[-2], u"create other C") << "below any root";
  EXPECT_TRUE(platform.registry.opened.empty()) << "a key was left open";
}

TEST_F(RegistryTest, AddressesFitOrAreNone) {
  for (const int count : {0, 1, 21, 22}) {
    platform.network.addresses.assign(static_cast<std::size_t>(count), {192, 168, 1, 20});
    const std::vector<Text> expected(count == 22 ? 0 : static_cast<std::size_t>(count), u"192.168.1.20");
    EXPECT_EQ(utils.GetIpAddrTable(), Variant(array_of(expected))) << count;
  }
}

}  // namespace
}  // namespace talutil::testing
