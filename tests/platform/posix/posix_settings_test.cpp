#include "platform/posix/posix_settings.hpp"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <iterator>

#include "automation/run_time_error.hpp"

namespace talutil::posix {
namespace {

class SettingsFiles : public ::testing::Test {
 protected:
  ~SettingsFiles() override { std::filesystem::remove_all(folder); }

  [[nodiscard]] std::string path(const char* name) const { return folder / name; }
  static std::string bytes(const std::string& file) {
    std::ifstream in(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), {}};
  }
  static void write(const std::string& file, const char* text) { std::ofstream(file, std::ios::binary) << text; }

  std::filesystem::path folder = [] {
    std::string name = std::filesystem::temp_directory_path() / "talutil-XXXXXX";
    return std::filesystem::path(mkdtemp(name.data()));
  }();
};

TEST_F(SettingsFiles, TheStoreKeepsTextsAsTheyAre) {
  Hive hive(path("new/folders/hive.db"));
  PosixSettingsStore store(hive);
  EXPECT_EQ(store.value(u"A\\B", u"S", u"k"), std::nullopt);
  const Text odd = Text(u"a\0b\r\n]=", 7) + u'\xD800' + Text(2000, u'x');
  store.put(u"A\\B", u"S", u"k", odd);
  store.put(u"A\\B", u"s]=\r\n", u"K", u"other");
  store.put(u"a\\b", u"s", u"K", u"last");  // the same place, in another case
  store.put(u"A\\B2", u"S", u"k", u"beside");
  store.put(u"A\\B", u"", u"", u"no names");
  EXPECT_EQ(store.value(u"A\\b", u"S", Text(u"k\0x", 3)), u"last");
  store.put(u"A\\B", u"S", u"k", odd);

  Hive other(path("new/folders/hive.db"));
  const auto all = PosixSettingsStore(other).settings_of(u"a\\B");
  ASSERT_EQ(all.size(), 3U);
  EXPECT_EQ(all[0].value, u"no names");
  EXPECT_EQ(all[1].section, u"S");
  EXPECT_TRUE(all[1].key == u"k" && all[1].value == odd);
  EXPECT_EQ(all[2].section, u"s]=\r\n");
  // A value of another type is no text.
  hive.put(u"HKEY_CURRENT_USER\\Software\\TALUtil\\Settings\\A\\S", u"k", {4, "1234"});
  EXPECT_EQ(store.value(u"A", u"S", u"k"), std::nullopt);
}

TEST_F(SettingsFiles, ADamagedStoreIsNamed) {
  write(path("hive.db"), "this is not what it should be, and long enough to be looked at as a file of another kind");
  Hive hive(path("hive.db"));
  PosixSettingsStore store(hive);
  for (int attempt = 0; attempt < 2; ++attempt) {
    try {
      store.put(u"A", u"S", u"k", u"v");
      FAIL() << "written";
    } catch (const RunTimeError& error) {
      EXPECT_EQ(error.number(), 57);
      EXPECT_EQ(error.what(), "Cannot use the settings in " + path("hive.db") + ": file is not a database");
    }
  }
}

TEST_F(SettingsFiles, ProfilesAreReplacedWhole) {
  PosixFiles files;
  PosixProfiles profiles(files);
  const Text file = from_utf8(path("a.ini"));
  EXPECT_EQ(profiles.value(file, u"S", u"k"), u"");
  profiles.put(file, u"S", u"k", u"\u20AC\u0100\u0416");
  EXPECT_EQ(bytes(path("a.ini")),
            "[S]\r\nk=\x80"
            "A?\r\n");
  EXPECT_EQ(profiles.value(file, u"s", u"K"),
            u"\u20AC"
            u"A?");
  profiles.put(file, u"S", u"l", Text(1500, u'x'));
  EXPECT_EQ(profiles.value(file, u"S", u"l"), Text(1023, u'x'));
  EXPECT_EQ(profiles.item_names(file, u"S"), Text(u"k\0l\0", 4));

  chmod(path("a.ini").c_str(), 0640);
  profiles.put(file, u"S", u"k", u"2");
  struct stat now {};
  stat(path("a.ini").c_str(), &now);
  EXPECT_EQ(now.st_mode & 0777U, 0640U) << "the access rights stay";
  const auto entries = std::distance(std::filesystem::directory_iterator(folder), {});
  EXPECT_EQ(entries, 1) << "no draft is left";
  profiles.put(from_utf8(path("none/a.ini")), u"S", u"k", u"v");  // nobody is told
  EXPECT_FALSE(std::filesystem::exists(path("none")));
}

}  // namespace
}  // namespace talutil::posix
