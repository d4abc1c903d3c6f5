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
  const Text names[] = {u"", u"mine", u"C:\\a.ini", u"codecount", previous, code};
  for (const Text& user : {Text(), Text(u"anne")}) {
    // By their first letters: the user's, the database's, of the previous database, of the code counter.
    std::map<char, Text> groups = {{'u', u"ORV3\\Main_" + user + u"_UserSettings|S|k"},
                                   {'d', u"ORV3\\Main_DatabaseSettings|S|k"},
                                   {'p', u"ORV3\\PreviousDatabaseSettings|S|k"},
                                   {'c', u"ORV3\\Programmer\\CodeCount|S|k"}};
    for (std::size_t i = 0; i < 216; ++i) {
      const Text& selector = names[i % 6];
      settings.sUserName = user;
      settings.sNatNameD = names[i / 6 % 6];
      settings.sORVDataName = names[i / 36];
      SCOPED_TRACE(to_utf8(user + u'|' + settings.sNatNameD + u'|' + settings.sORVDataName + u'|' + selector));
      // The host's own name comes first, unless it is empty.
      const bool is_own = !selector.empty() && selector == settings.sNatNameD;
      const char kind = is_own                              ? 'u'
                        : selector == settings.sORVDataName ? 'd'
                        : selector == previous              ? 'p'
                        : selector == code                  ? 'c'
                                                            : 'u';
      platform.settings_store.values.clear();
      accesses.clear();
      // A missing value is saved where it was looked for, whatever the default; that of the code counter is not.
      const char read = user.empty() && selector != previous ? 'd' : kind;
      std::vector<Text> expected = {groups[read]};
      if (read != 'c') expected.push_back(groups[read] + u"=NoDefaultData");
      EXPECT_EQ(utils.GetCfgFileData(u"S", u"k", u"NoDefaultData", selector, Boolean(false)),
                read == 'c' ? u"" : u"NoDefaultData");
      EXPECT_EQ(accesses, expected);
      accesses.clear();
      expected.clear();
      Text output = u"\\v";
      utils.SaveCfgFileData(u"S", u"k", output, selector, Boolean(false));
      const bool is_alone = kind == 'p' || kind == 'c';
      for (const char group : is_alone ? std::string(1, kind) : "ud") expected.push_back(groups[group] + u"=\\v");
      EXPECT_EQ(accesses, expected);
      EXPECT_EQ(output, u"\\v");
    }
  }
  platform.settings_store.fails = true;
  check(
      {{u"GetCfgFileData", {{u"S|k|d|x|False", "error 57"}}}, {u"SaveCfgFileData", {{u"S|k|d|x|False", "error 57"}}}});
}

}  // namespace
}  // namespace talutil::testing
