#include <gtest/gtest.h>

#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

/// A toolkit whose file is there when the profiles have one.
class ConfiguredUtils final : public ORVUtils {
 public:
  ConfiguredUtils(Library& library, FakePlatform& platform) : ORVUtils(library), platform_(platform) {}
  Boolean FileExists(Text sFilename) override { return Boolean(platform_.profiles.files.contains(sFilename)); }

 private:
  FakePlatform& platform_;
};

struct Configuration : ::testing::Test {
  Configuration() {
    settings.sDatabaseName = u"Main";
    settings.sUserName = u"anne";
    settings.sNatNameD = u"mine";
    settings.sORVDataName = u"data";
  }

  Text read_file(const Text& item, const Text& otherwise) {
    return utils.GetCfgFileData(u"S", item, otherwise, u"C:\\a.ini", Boolean(true));
  }

  FakePlatform platform;
  Library library{platform.platform()};
  ConfiguredUtils utils{library, platform};
  SharedSettings& settings = library.settings();
  std::vector<Text>& accesses = platform.settings_store.accesses;
};

TEST_F(Configuration, ReadsOfAFile) {
  const std::string long_value(1500, 'v');
  platform.profiles.files.insert_or_assign(
      u"C:\\a.ini", ProfileDocument("[S]\r\nabc=x\r\nempty=\r\nslash=\\\r\nunc=\\\\server\r\npath=\\C:\\Data\r\n"
                                    "three=\\\\\\x\r\nlong=" +
                                    long_value));
  const Rows<Text, Text, Text, bool> rows = {
      {"a value", u"ABC", u"d", u"x", false},
      {"an empty value is missing", u"empty", u"d", u"d", true},
      {"a backslash is missing", u"slash", u"d", u"d", true},
      {"no item", u"none", u"d", u"d", true},
      {"no item, no default", u"none", u"NoDefaultData", u"", false},
      {"no item, an empty default is saved", u"none", u"", u"", true},
      {"one backslash goes", u"path", u"d", u"C:\\Data", false},
      {"a path of the network loses one and comes back", u"unc", u"d", u"\\server", false},
      {"of three two are left: empty", u"three", u"d", u"", false},
      {"a default that begins with two is empty, and saved as it is", u"none", u"\\\\server", u"", true},
      {"no item named: the first name", u"", u"d", u"abc", false},
      {"cut at 1023", u"long", u"d", Text(1023, u'v'), false},
  };
  check_rows(rows, [&](const Text& item, const Text& otherwise, const Text& expected, bool saves) {
    accesses.clear();
    EXPECT_EQ(read_file(item, otherwise), expected);
    const Text saved = u"|S|" + item + u"=" + otherwise;
    EXPECT_EQ(accesses, saves ? (std::vector<Text>{u"ORV3\\Main_anne_UserSettings" + saved,
                                                   u"ORV3\\Main_DatabaseSettings" + saved})
                              : std::vector<Text>{});
  });
  EXPECT_EQ(utils.GetCfgFileData(u"S", u"abc", u"NoDefaultData", u"C:\\none.ini", Boolean(true)), u"");
  EXPECT_EQ(utils.GetCfgFileData(u"None", u"", u"d", u"C:\\a.ini", Boolean(true)), u"d");
}

TEST_F(Configuration, WritesToAFile) {
  const struct {
    Text output, written;
  } rows[] = {{u"x", u"x"},    {u"", u"\\"}, {u"\\", u"\\"}, {u"\\x", u"\\"}, {u"\\\\server\\share", u"\\"},
              {u"a\\", u"a\\"}};
  for (const auto& row : rows) {
    Text output = row.output;
    utils.SaveCfgFileData(u"S", u"k", output, u"C:\\a.ini", Boolean(true));
    EXPECT_EQ(output, row.written);
    EXPECT_EQ(platform.profiles.files.at(u"C:\\a.ini").value(u"S", u"k"), row.written);
  }
  EXPECT_TRUE(accesses.empty());
  EXPECT_EQ(read_file(u"k", u"d"), u"a\\");
}

TEST_F(Configuration, GroupsOfTheStore) {
  const Text previous_selector = u"PreviousDatabaseSettings";
  const Text code_selector = u"CodeCount";
  // By their first letters: the user's, the database's, of the previous database, of the code counter.
  std::map<char, Text> groups = {{'u', u"ORV3\\Main_anne_UserSettings|S|k"},
                                 {'d', u"ORV3\\Main_DatabaseSettings|S|k"},
                                 {'p', u"ORV3\\PreviousDatabaseSettings|S|k"},
                                 {'c', u"ORV3\\Programmer\\CodeCount|S|k"},
                                 {'n', u"ORV3\\Main__UserSettings|S|k"}};
  const Rows<Text, Text, Text, Text, char, std::string> rows = {
      {"the user's", u"anne", u"mine", u"data", u"mine", 'u', "ud"},
      {"the database's", u"anne", u"mine", u"data", u"data", 'd', "ud"},
      {"previous", u"anne", u"mine", u"data", previous_selector, 'p', "p"},
      {"code", u"anne", u"mine", u"data", code_selector, 'c', "c"},
      {"case counts", u"anne", u"mine", u"data", u"codecount", 'u', "ud"},
      {"unknown", u"anne", u"mine", u"data", u"C:\\a.ini", 'u', "ud"},
      {"no user: the database's", u"", u"mine", u"data", u"mine", 'd', "nd"},
      {"no user: previous all the same", u"", u"mine", u"data", previous_selector, 'p', "p"},
      {"no user: not code, which is written", u"", u"mine", u"data", code_selector, 'd', "c"},
      {"an empty selector is not the host's own", u"anne", u"", u"data", u"", 'u', "ud"},
      {"but can be the database's", u"anne", u"", u"", u"", 'd', "ud"},
      {"the host's comes first", u"anne", code_selector, previous_selector, code_selector, 'u', "ud"},
      {"the database's before previous", u"anne", u"x", previous_selector, previous_selector, 'd', "ud"},
  };
  check_rows(rows, [&](const Text& user, const Text& own, const Text& data, const Text& selector, char read,
                       const std::string& written) {
    settings.sUserName = user;
    settings.sNatNameD = own;
    settings.sORVDataName = data;
    platform.settings_store.values.clear();
    accesses.clear();
    // A missing value is saved where it was looked for, whatever the default; that of the code counter is not.
    std::vector<Text> expected = {groups[read]};
    if (read != 'c') expected.push_back(groups[read] + u"=NoDefaultData");
    EXPECT_EQ(utils.GetCfgFileData(u"S", u"k", u"NoDefaultData", selector, Boolean(false)),
              read == 'c' ? u"" : u"NoDefaultData");
    EXPECT_EQ(accesses, expected);
    accesses.clear();
    expected.clear();
    Text output = u"\\v";
    utils.SaveCfgFileData(u"S", u"k", output, selector, Boolean(false));
    for (const char group : written) expected.push_back(groups[group] + u"=\\v");
    EXPECT_EQ(accesses, expected);
    EXPECT_EQ(output, u"\\v");
  });
  platform.settings_store.fails = true;
  EXPECT_EQ(error_of([&] { (void)utils.GetCfgFileData(u"S", u"k", u"d", u"x", Boolean(false)); }), 57);
}

}  // namespace
}  // namespace talutil::testing
