#include <gtest/gtest.h>

#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

using RegistryTest = UtilsTest;

TEST_F(RegistryTest, ReadsTextsAndNumbersOfTheUser) {
  platform.registry.keys[u"Key"] = {
      {u"text", {1, std::string("abc\0", 4)}},
      {u"empty", {1, std::string(1, '\0')}},
      {u"nothing", {1, ""}},
      {u"number", {4, std::string("\xD6\xFF\xFF\xFF", 4)}},
      {u"binary", {3, "xy"}},
      {u"long", {4, "123456"}},
  };
  const struct {
    TextView key;
    TextView name;
    std::int32_t status;
    TextView text;
  } rows[] = {
      {u"Key", u"text", 0, u"abc"},   {u"Key", u"empty", 0, u""},    {u"Key", u"nothing", 0, u""},
      {u"Key", u"number", 0, u"-42"}, {u"Key", u"binary", -1, u""},  {u"Key", u"long", 234, u""},
      {u"Key", u"missing", 2, u""},   {u"Missing", u"text", 6, u""},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(utils.REGISTRY_QueryValue(Text(row.key), Text(row.name)), row.status) << to_utf8(row.name);
    EXPECT_EQ(utils.REGISTRY_ReturnValue(Text(row.key), Text(row.name)), row.text) << to_utf8(row.name);
  }
  EXPECT_EQ(platform.registry.calls[0], u"open 1 Key");
  EXPECT_TRUE(platform.registry.opened.empty()) << "a key was left open";
}

TEST_F(RegistryTest, WritesValuesOfKeysThatExist) {
  platform.registry.keys[u"Key"];
  utils.REGISTRY_SetKeyValue(u"Key", u"text", u"abc", 1);
  utils.REGISTRY_SetKeyValue(u"Key", u"from a number", 12, 1);
  utils.REGISTRY_SetKeyValue(u"Key", u"number", u"-2", 4);
  utils.REGISTRY_SetKeyValue(u"Key", u"other", u"abc", 2);
  utils.REGISTRY_SetKeyValue(u"Missing", u"text", u"abc", 1);
  EXPECT_EQ(error_of([&] { utils.REGISTRY_SetKeyValue(u"Key", u"null", Null{}, 1); }), 94);
  EXPECT_EQ(error_of([&] { utils.REGISTRY_SetKeyValue(u"Key", u"word", u"abc", 4); }), 13);
  const auto& values = platform.registry.keys[u"Key"];
  EXPECT_EQ(values.size(), 3U);
  EXPECT_EQ(values.at(u"text").data, std::string("abc\0", 4));
  EXPECT_EQ(values.at(u"from a number").data, std::string("12\0", 3));
  EXPECT_EQ(values.at(u"number").data, "\xFE\xFF\xFF\xFF");
  EXPECT_FALSE(platform.registry.keys.contains(u"Missing"));
  EXPECT_TRUE(platform.registry.opened.empty()) << "a key was left open";
}

TEST_F(RegistryTest, CreatesKeysBelowAnyRoot) {
  utils.REGISTRY_CreateNewKey(u"A\\B", static_cast<std::int32_t>(0x80000001U));
  utils.REGISTRY_CreateNewKey(u"C", static_cast<std::int32_t>(0x80000002U));
  EXPECT_EQ(platform.registry.calls, (std::vector<Text>{u"create user A\\B", u"close", u"create other C", u"close"}));
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
