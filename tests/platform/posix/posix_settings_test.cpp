// What the two stores have in common, and how the files are treated that they lie in.
#include "platform/posix/posix_settings.hpp"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "platform/posix/posix_registry.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::posix {
namespace {

struct SettingsFiles : ::testing::Test {
  std::filesystem::path folder = [] {
    const Text scratch = testing::scratch_folder();
    return std::filesystem::path(PosixFiles().native(scratch));
  }();
};

TEST_F(SettingsFiles, TheRegistryAndTheSettingsShareTheirTexts) {
  Hive hive(folder / "new/folders/hive.db");
  PosixSettingsStore store(hive);
  WesternCodePage code_page;
  PosixRegistry registry(hive, code_page);
  Registry::Handle key = 0;
  ASSERT_EQ(registry.create(Registry::current_user, u"Software\\TALUtil\\Settings\\A\\S", key), Registry::ok);
  EXPECT_EQ(registry.set(key, u"k", Registry::text, std::string("\xE9\x80\0", 3)), Registry::ok);
  EXPECT_EQ(std::filesystem::status(hive.path()).permissions(), std::filesystem::perms(0600)) << "the user's alone";
  Hive none("/proc/none/hive.db");
  EXPECT_EQ(PosixRegistry(none, code_page).open(Registry::current_user, u"A", 0, key), PosixRegistry::unavailable);
  EXPECT_EQ(store.value(u"A", u"S", u"K"), u"\u00E9\u20AC");
  EXPECT_EQ(registry.set(key, u"k", Registry::number, "1234"), Registry::ok);
  EXPECT_EQ(store.value(u"A", u"S", u"k"), std::nullopt) << "a value of another type is no text";
  store.put(u"A\\B", u"S", u"k", u"\xD800");
  store.put(u"A\\B2", u"S", u"k", u"beside");
  const auto all = store.settings_of(u"a\\B");
  ASSERT_EQ(all.size(), 1U);
  EXPECT_EQ(all[0].section + all[0].key + all[0].value, Text(u"Sk") + u'\xD800');
}

TEST_F(SettingsFiles, ProfilesAreReplacedWhole) {
  Profiles* const profiles = &testing::real_platform().profiles;
  const std::string path = folder / "a.ini";
  profiles->put(from_utf8(path), u"S", u"k", u"1");
  chmod(path.c_str(), 0640);
  profiles->put(from_utf8(path), u"S", u"k", u"\u20AC");
  EXPECT_EQ(testing::read_bytes(from_utf8(path)), "[S]\r\nk=\x80\r\n");
  EXPECT_EQ(std::filesystem::status(path).permissions(), std::filesystem::perms(0640)) << "the access rights stay";
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder), {}), 1) << "no draft is left";
  {
    const auto lock = testing::lock_file(from_utf8(path));
    profiles->put(from_utf8(path), u"S", u"k", u"2");
  }
  EXPECT_EQ(testing::read_bytes(from_utf8(path)), "[S]\r\nk=\x80\r\n") << "what is locked just then stays";
  profiles->put(from_utf8((folder / "none/a.ini").string()), u"S", u"k", u"v");
  EXPECT_FALSE(std::filesystem::exists(folder / "none"));
}

}  // namespace
}  // namespace talutil::posix
