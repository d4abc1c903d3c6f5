#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

struct TextFiles : LateMembers {
  const Text path = u"C:\\a.txt";
};

// How lines are read of any bytes is compared with a model in fuzz/text_files_fuzz.cpp.
TEST_F(TextFiles, BlankLinesAndMissingFiles) {
  const std::string blank_between = "a\r\n \r\nb\r\n";
  const std::string blank_last = "a\r\n>x<\r\n?\r\n";
  const TextArray old = array_of({u"o", u"l", u"d"});
  const Rows<std::string, std::int16_t, std::string, TextArray, TextArray> rows = {
      {"only 1 skips", blank_between, 2, "3", {}, array_of({u"a", u" ", u"b"})},
      {"stored as read; a skipped last line leaves its element", blank_last, 1, "2", {}, array_of({u"a", u">x<", u""})},
      {"blank line skipped, a longer array is cut", blank_between, 1, "2", old, array_of({u"a", u"b"})},
      {"a skipped line leaves what its element held", " ", 1, "0", old, array_of({u"o"})},
      {"empty file", "", 1, "0", old, old},
      {"array from 1", "a", 0, "error 9", array_of({u"x"}, 1), array_of({u"x"}, 1)},
      {"array from 1, empty file", "", 0, "0", array_of({u"x"}, 1), array_of({u"x"}, 1)},
  };
  check_rows(rows, [&](const std::string& bytes, std::int16_t erases, const std::string& count, TextArray list,
                       const TextArray& after) {
    platform.files.put(path, bytes);
    EXPECT_EQ(outcome([&] { return utils.OpenBigFile(path, list, erases); }), count);
    EXPECT_EQ(list, after);
  });
  TextArray list = old;
  EXPECT_EQ(utils.OpenFile(u"C:\\missing", list, 0) + utils.OpenBigFile(u"C:\\missing", list, 0), 0);
  EXPECT_EQ(list, old);
  // A pattern exists where a file matches, but is none to be opened.
  check({{u"LoadTextBox", {{u"C:\\missing", ""}, {u"C:\\*.txt", "error 53"}}}});
  library.settings().CounterVerifyText = 2147483646;
  platform.files.put(path, "a\r\nb\r\n");
  list = {};
  EXPECT_EQ(error_of([&] { (void)utils.OpenBigFile(path, list, 1); }), 6);
  EXPECT_EQ(list, array_of({u"a", u""})) << "what was read before a failure stays";
}

TEST_F(TextFiles, Writing) {
  const Rows<TextArray, std::string, std::int32_t> rows = {
      {"lines, substitutes", array_of({u"a", u"", u"\u0101\u0416\u20AC"}), "a\r\n\r\na?\x80\r\n", 0},
      {"from index 0", array_of({u"x", u"y", u"a"}, -2), "a\r\n", 0},
      {"bounds below 0", array_of({u"x"}, -2), "", 0},
      {"lower bound above 0", array_of({u"x", u"y"}, 1), "old", 9},
      {"never allocated", {}, "old", 9},
  };
  check_rows(rows, [&](const TextArray& list, const std::string& expected, std::int32_t error) {
    platform.files.put(path, "old");
    EXPECT_EQ(error_of([&] { utils.SaveBigFile(list, path); }), error);
    EXPECT_EQ(platform.files.bytes(path), expected);
  });
  // What just fills the buffer, one byte less and one more, and the line behind it.
  for (const std::size_t length : {65533U, 65534U, 65535U}) {
    utils.SaveBigFile(array_of({Text(length, u'x'), u"y"}), path);
    EXPECT_TRUE(platform.files.bytes(path) == std::string(length, 'x') + "\r\ny\r\n") << length;
  }
  platform.files.put(path, "old");
  platform.files.failures[u"write"] = ErrorNumber::disk_full;
  check({{u"SaveTextBox", {{u"x|C:\\a.txt", "error 61"}}}, {u"LoadTextBox", {{path, "old"}}}});
  platform.files.failures.clear();
  check({{u"SaveTextBox", {{u"x\r\n|C:\\a.txt", "Empty"}}}, {u"LoadTextBox", {{path, "x\r\n\r\n"}}}});
}

TEST_F(TextFiles, CopyFileToBackupFile) {
  std::string many = "a\r";
  for (int i = 1; i < 30'000; ++i) many += "l\n\r\n";
  platform.files.put(path, many + "l");
  utils.CopyFileToBackupFile(path, u"C:\\b.txt");
  EXPECT_TRUE(platform.files.bytes(u"C:\\b.txt") == "a\r\n" + many.substr(2)) << "30,000 lines at most";
  platform.files.put(path, "");
  check({{u"CopyFileToBackupFile", {{u"C:\\a.txt|C:\\b.txt", "error 9"}}}});
  EXPECT_TRUE(platform.files.bytes(u"C:\\b.txt") != "") << "without a line the old backup stays";
}

// What is in a line is read by the command's log.
TEST_F(TextFiles, EventLog) {
  SharedSettings& settings = library.settings();
  settings.sORVPath = u"C:\\TAL\\ORV3";
  settings.sUserName = u"J\u00FCrgen";
  const Text log = u"C:\\TAL\\ORV3\\EventLog.txt";
  utils.AppendEventLog(u"event", u"form");
  EXPECT_EQ(platform.files.bytes(log), "(no file)");
  settings.EventLog = 5;
  platform.current_time = date_from_parts({2026, 1, 2, 9, 7, 3}).value();
  for (const Text event : {u"a:b\r\nc", u""}) utils.AppendEventLog(event, u"frm");
  EXPECT_EQ(platform.files.bytes(log), "J\xFCrgen:02012026090703:a:b\r\nc:frm\r\nJ\xFCrgen:02012026090703::frm\r\n");
  platform.files.failures[u"append"] = ErrorNumber::path_not_found;
  check({{u"AppendEventLog", {{u"e|f", "error 76"}}}});
}

}  // namespace
}  // namespace talutil::testing
