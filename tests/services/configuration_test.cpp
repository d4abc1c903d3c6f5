#include <gtest/gtest.h>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/fake_platform.hpp"

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

class Configuration : public ::testing::Test {
 protected:
  Configuration() {
    SharedSettings& settings = library.settings();
    settings.sDatabaseName = u"Main";
    settings.sUserName = u"anne";
    settings.sNatNameD = u"mine";
    settings.sORVDataName = u"data";
  }

  void file(std::string_view bytes) { platform.profiles.files.insert_or_assign(u"C:\\a.ini", ProfileDocument(bytes)); }

  Text read_file(const Text& item, const Text& otherwise) {
    return utils.GetCfgFileData(u"S", item, otherwise, u"C:\\a.ini", Boolean(true));
  }

  FakePlatform platform;
  Library library{platform.platform()};
  ConfiguredUtils utils{library, platform};
  std::vector<Text>& accesses = platform.settings_store.accesses;
};

TEST_F(Configuration, ReadsOfAFile) {
  const std::string long_value(1500, 'v');
  file("[S]\r\nabc=x\r\nempty=\r\nslash=\\\r\nunc=\\\\server\r\npath=\\C:\\Data\r\nthree=\\\\\\x\r\nlong=" +
       long_value);
  const struct {
    const char* name;
    Text item, otherwise, expected;
    bool saves;
  } rows[] = {
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
  for (const auto& row : rows) {
    accesses.clear();
    EXPECT_EQ(read_file(row.item, row.otherwise), row.expected) << row.name;
    const std::vector<Text> saved = {u"ORV3\\Main_anne_UserSettings|S|" + row.item + u"=" + row.otherwise,
                                     u"ORV3\\Main_DatabaseSettings|S|" + row.item + u"=" + row.otherwise};
    EXPECT_EQ(accesses, row.saves ? saved : std::vector<Text>{}) << row.name;
  }
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
  const Text anne = u"ORV3\\Main_anne_UserSettings|S|k";
  const Text nobody = u"ORV3\\Main__UserSettings|S|k";
  const Text main = u"ORV3\\Main_DatabaseSettings|S|k";
  const Text previous = u"ORV3\\PreviousDatabaseSettings|S|k";
  const Text code = u"ORV3\\Programmer\\CodeCount|S|k";
  const struct {
    const char* name;
    Text user, own_selector, data_selector, selector;
    Text read;
    std::vector<Text> written;
  } rows[] = {
      {"the user's", u"anne", u"mine", u"data", u"mine", anne, {anne, main}},
      {"the database's", u"anne", u"mine", u"data", u"data", main, {anne, main}},
      {"previous", u"anne", u"mine", u"data", u"PreviousDatabaseSettings", previous, {previous}},
      {"code", u"anne", u"mine", u"data", u"CodeCount", code, {code}},
      {"case counts", u"anne", u"mine", u"data", u"codecount", anne, {anne, main}},
      {"unknown", u"anne", u"mine", u"data", u"C:\\a.ini", anne, {anne, main}},
      {"no user: the database's", u"", u"mine", u"data", u"mine", main, {nobody, main}},
      {"no user: previous all the same", u"", u"mine", u"data", u"PreviousDatabaseSettings", previous, {previous}},
      {"no user: not code, which is written", u"", u"mine", u"data", u"CodeCount", main, {code}},
      {"an empty selector is not the host's own", u"anne", u"", u"data", u"", anne, {anne, main}},
      {"but can be the database's", u"anne", u"", u"", u"", main, {anne, main}},
      {"the host's selectors come first",
       u"anne",
       u"CodeCount",
       u"PreviousDatabaseSettings",
       u"CodeCount",
       anne,
       {anne, main}},
      {"the database's comes before previous",
       u"anne",
       u"x",
       u"PreviousDatabaseSettings",
       u"PreviousDatabaseSettings",
       main,
       {anne, main}},
  };
  for (const auto& row : rows) {
    library.settings().sUserName = row.user;
    library.settings().sNatNameD = row.own_selector;
    library.settings().sORVDataName = row.data_selector;
    platform.settings_store.values.clear();
    accesses.clear();
    // A missing value is saved where it was looked for, whatever the default; that of the code counter is not.
    const bool is_code = row.read == code;
    EXPECT_EQ(utils.GetCfgFileData(u"S", u"k", u"NoDefaultData", row.selector, Boolean(false)),
              is_code ? u"" : u"NoDefaultData")
        << row.name;
    EXPECT_EQ(accesses,
              is_code ? std::vector<Text>{row.read} : (std::vector<Text>{row.read, row.read + u"=NoDefaultData"}))
        << row.name;
    accesses.clear();
    Text output = u"\\v";
    utils.SaveCfgFileData(u"S", u"k", output, row.selector, Boolean(false));
    std::vector<Text> written = row.written;
    for (Text& each : written) each += u"=\\v";
    EXPECT_EQ(accesses, written) << row.name;
    EXPECT_EQ(output, u"\\v");
  }
  platform.settings_store.fails = true;
  EXPECT_EQ(error_of([&] { (void)utils.GetCfgFileData(u"S", u"k", u"d", u"x", Boolean(false)); }), 57);
}

}  // namespace
}  // namespace talutil::testing
