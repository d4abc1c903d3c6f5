#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

struct Configuration : LateMembers {
  Configuration() {
    settings.sDatabaseName = u"Main";
    settings.sUserName = u"anne";
    settings.sNatNameD = u"mine";
    settings.sORVDataName = u"data";
    platform.files.put(u"C:\\a.ini", "");
  }

  SharedSettings& settings = library.settings();
  std::vector<Text>& accesses = platform.settings_store.accesses;
};

TEST_F(Configuration, ReadsOfAFile) {
  const std::string longest(1023, 'v');
  platform.profiles.files.insert_or_assign(
      u"C:\\a.ini", ProfileDocument("[S]\r\nabc=x\r\nempty=\r\nslash=\\\r\nunc=\\\\server\r\npath=\\C:\\Data\r\n"
                                    "three=\\\\\\x\r\nlong=" +
                                    longest + "more"));
  // clang-format off
  check({{u"GetCfgFileData", {
      {u"S|ABC|d|C:\\a.ini|True", "x"}, {u"S||d|C:\\a.ini|True", "abc"}, {u"S|long|d|C:\\a.ini|True", longest},
      {u"S|path|d|C:\\a.ini|True", "C:\\Data"}, {u"S|unc|d|C:\\a.ini|True", "\\server"},
      {u"S|three|d|C:\\a.ini|True", ""}, {u"S|none|NoDefaultData|C:\\a.ini|True", ""},
      {u"S|abc|NoDefaultData|C:\\none.ini|True", ""},
      // These are missing, and the default is saved, even where it is not what is returned.
      {u"S|empty|d|C:\\a.ini|True", "d"}, {u"S|slash|d|C:\\a.ini|True", "d"}, {u"S|none|d|C:\\a.ini|True", "d"},
      {u"S|none||C:\\a.ini|True", ""}, {u"S|none|\\\\server|C:\\a.ini|True", ""}, {u"T||d|C:\\a.ini|True", "d"}}}});
  // clang-format on
  std::vector<Text> saved;
  for (const TextView item : {u"S|empty=d", u"S|slash=d", u"S|none=d", u"S|none=", u"S|none=\\\\server", u"T|=d"}) {
    saved.push_back(u"ORV3\\Main_anne_UserSettings|" + Text(item));
    saved.push_back(u"ORV3\\Main_DatabaseSettings|" + Text(item));
  }
  EXPECT_EQ(accesses, saved);
}

TEST_F(Configuration, WritesToAFile) {
  const std::pair<Text, Text> rows[] = {
      {u"x", u"x"}, {u"", u"\\"}, {u"\\", u"\\"}, {u"\\x", u"\\"}, {u"\\\\server\\share", u"\\"}, {u"a\\", u"a\\"}};
  for (const auto& [given, written] : rows) {
    Text output = given;
    utils.SaveCfgFileData(u"S", u"k", output, u"C:\\a.ini", Boolean(true));
    EXPECT_EQ(output, written);
    EXPECT_EQ(platform.profiles.files.at(u"C:\\a.ini").value(u"S", u"k"), written);
  }
  EXPECT_TRUE(accesses.empty());
}

TEST_F(Configuration, GroupsOfTheStore) {
  const Text previous = u"PreviousDatabaseSettings";
  const Text code = u"CodeCount";
  // By their first letters: the user's, the database's, of the previous database, of the code counter.
  std::map<char, Text> groups = {{'u', u"ORV3\\Main_anne_UserSettings|S|k"},
                                 {'d', u"ORV3\\Main_DatabaseSettings|S|k"},
                                 {'p', u"ORV3\\PreviousDatabaseSettings|S|k"},
                                 {'c', u"ORV3\\Programmer\\CodeCount|S|k"},
                                 {'n', u"ORV3\\Main__UserSettings|S|k"}};
  const Rows<Text, Text, Text, Text, char, std::string> rows = {
      {"the user's", u"anne", u"mine", u"data", u"mine", 'u', "ud"},
      {"the database's", u"anne", u"mine", u"data", u"data", 'd', "ud"},
      {"previous", u"anne", u"mine", u"data", previous, 'p', "p"},
      {"code", u"anne", u"mine", u"data", code, 'c', "c"},
      {"case counts", u"anne", u"mine", u"data", u"codecount", 'u', "ud"},
      {"unknown", u"anne", u"mine", u"data", u"C:\\a.ini", 'u', "ud"},
      {"no user: the database's", u"", u"mine", u"data", u"mine", 'd', "nd"},
      {"no user: previous all the same", u"", u"mine", u"data", previous, 'p', "p"},
      {"no user: not code, which is written", u"", u"mine", u"data", code, 'd', "c"},
      {"an empty selector is not the host's own", u"anne", u"", u"data", u"", 'u', "ud"},
      {"but can be the database's", u"anne", u"", u"", u"", 'd', "ud"},
      {"the host's comes first", u"anne", code, previous, code, 'u', "ud"},
      {"the database's before previous", u"anne", u"x", previous, previous, 'd', "ud"},
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
  check(
      {{u"GetCfgFileData", {{u"S|k|d|x|False", "error 57"}}}, {u"SaveCfgFileData", {{u"S|k|d|x|False", "error 57"}}}});
}

}  // namespace
}  // namespace talutil::testing
