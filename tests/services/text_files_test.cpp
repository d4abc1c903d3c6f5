#include <gtest/gtest.h>

#include "tests/text/recording_utils.hpp"

namespace talutil::testing {
namespace {

class TextFiles : public TextMembersTest {
 protected:
  static TextArray array_of(std::vector<Text> items, std::int32_t lower_bound = 0) {
    return {.items = std::move(items), .lower_bound = lower_bound, .allocated = true};
  }
  const Text path = u"C:\\a.txt";
};

TEST_F(TextFiles, Reading) {
  const std::string long_line(70000, 'x');
  using Lines = std::vector<Text>;
  const struct {
    const char* name;
    std::string bytes;
    Lines lines;
    Text text;
  } rows[] = {
      {"lines", "a\r\nb\r\n", {u"a", u"b"}, u"a\r\nb\r\n"},
      {"last line without an end", "a\r\n\r\nb", {u"a", u"", u"b"}, u"a\r\n\r\nb"},
      {"lone carriage return", "a\rb\r\r\nc", {u"a", u"b", u"", u"c"}, u"a\rb\r\r\nc"},
      {"lone line feed", "a\nb\n\r\n", {u"a\nb\n"}, u"a\nb\n\r\n"},
      {"end-of-file mark",
       "a\r\nb\x1A"
       "c\r\nd",
       {u"a", u"b"},
       u"a\r\nb"},
      {"end-of-file mark first on its line", "a\r\n\x1A", {u"a"}, u"a\r\n"},
      {"code page 1252, NUL",
       std::string("\x80\xFC\0\r\n", 5),
       {Text(u"\u20AC\u00FC\0", 3)},
       Text(u"\u20AC\u00FC\0\r\n", 5)},
      {"longer than a buffer", long_line + "\r\nb", {from_ansi(long_line), u"b"}, from_ansi(long_line) + u"\r\nb"},
      {"line end between two buffers",
       long_line.substr(0, 65535) + "\r\nb",
       {from_ansi(long_line.substr(0, 65535)), u"b"},
       from_ansi(long_line.substr(0, 65535)) + u"\r\nb"},
  };
  for (const auto& row : rows) {
    platform.files.put(path, row.bytes);
    TextArray list;
    EXPECT_EQ(utils.OpenFile(path, list, 0), static_cast<std::int32_t>(row.lines.size())) << row.name;
    EXPECT_EQ(list, array_of(row.lines)) << row.name;
    EXPECT_EQ(utils.LoadTextBox(path), row.text) << row.name;
  }
}

TEST_F(TextFiles, OpenFileAndOpenBigFile) {
  const std::string blank_between = "a\r\n \r\nb\r\n";
  const std::string blank_last = "a\r\n>x<\r\n?\r\n";
  const TextArray old = array_of({u"o", u"l", u"d"});
  const struct {
    const char* name;
    std::string bytes;
    std::int32_t erase_blanks;
    std::int32_t count;
    TextArray before;
    TextArray after;
    std::int32_t error = 0;
  } rows[] = {
      {"blank line kept", blank_between, 0, 3, {}, array_of({u"a", u" ", u"b"})},
      {"blank line skipped", blank_between, 1, 2, {}, array_of({u"a", u"b"})},
      {"only 1 skips", blank_between, 2, 3, {}, array_of({u"a", u" ", u"b"})},
      {"stored as read; a skipped last line leaves its element", blank_last, 1, 2, {}, array_of({u"a", u">x<", u""})},
      {"a longer array is cut", blank_between, 1, 2, old, array_of({u"a", u"b"})},
      {"a skipped line leaves what its element held", " ", 1, 0, old, array_of({u"o"})},
      {"empty file", "", 1, 0, old, old},
      {"array from 1", "a", 0, 0, array_of({u"x"}, 1), array_of({u"x"}, 1), 9},
      {"array from 1, empty file", "", 0, 0, array_of({u"x"}, 1), array_of({u"x"}, 1)},
  };
  for (const auto& row : rows) {
    platform.files.put(path, row.bytes);
    TextArray list = row.before;
    std::int32_t count = 0;
    EXPECT_EQ(error_of([&] { count = utils.OpenBigFile(path, list, static_cast<std::int16_t>(row.erase_blanks)); }),
              row.error)
        << row.name;
    EXPECT_EQ(count, row.count) << row.name;
    EXPECT_EQ(list, row.after) << row.name;
  }

  platform.files.put(path, "1\r\n2\r\n3\r\n");
  for (const auto& [limit, count] :
       std::vector<std::pair<std::int32_t, std::int32_t>>{{2, 2}, {0, 3}, {-1, 3}, {3, 3}}) {
    TextArray list = old;
    EXPECT_EQ(utils.OpenFile(path, list, limit), count) << limit;
    EXPECT_EQ(list.upper_bound(), count - 1) << limit;
  }
  TextArray list = old;
  EXPECT_EQ(utils.OpenFile(u"C:\\missing", list, 0), 0);
  EXPECT_EQ(utils.OpenBigFile(u"C:\\missing", list, 0), 0);
  EXPECT_EQ(utils.LoadTextBox(u"C:\\missing"), u"");
  EXPECT_EQ(list, old);
  // A pattern exists where a file matches, but is none to be opened.
  EXPECT_EQ(error_of([&] { (void)utils.OpenFile(u"C:\\*.txt", list, 0); }), 53);
}

TEST_F(TextFiles, WhatWasReadBeforeAFailureStays) {
  platform.files.put(path, "a\r\nb\r\n");
  library.settings().CounterVerifyText = 2147483646;
  TextArray list;
  EXPECT_EQ(error_of([&] { (void)utils.OpenBigFile(path, list, 1); }), 6);
  EXPECT_EQ(list, array_of({u"a", u""}));
}

TEST_F(TextFiles, Writing) {
  const struct {
    const char* name;
    TextArray list;
    std::string expected;
    std::int32_t error = 0;
  } rows[] = {
      {"lines, substitutes", array_of({u"a", u"", u"\u0101\u0416\u20AC"}), "a\r\n\r\na?\x80\r\n"},
      {"from index 0", array_of({u"x", u"y", u"a"}, -2), "a\r\n"},
      {"bounds below 0", array_of({u"x"}, -2), ""},
      {"lower bound above 0", array_of({u"x", u"y"}, 1), "old", 9},
      {"never allocated", {}, "old", 9},
  };
  for (const auto& row : rows) {
    platform.files.put(path, "old");
    EXPECT_EQ(error_of([&] { utils.SaveBigFile(row.list, path); }), row.error) << row.name;
    EXPECT_EQ(platform.files.bytes(path), row.expected) << row.name;
  }
  platform.files.failures[u"write"] = ErrorNumber::disk_full;
  EXPECT_EQ(error_of([&] { utils.SaveTextBox(u"x", path); }), 61);
  EXPECT_EQ(platform.files.bytes(path), "old");
  platform.files.failures.clear();
  utils.SaveTextBox(u"x", path);
  utils.SaveTextBox(utils.LoadTextBox(path), path);
  EXPECT_EQ(utils.LoadTextBox(path), u"x\r\n\r\n");
}

TEST_F(TextFiles, CopyFileToBackupFile) {
  std::string many;
  for (int i = 0; i < 30001; ++i) many += "l\n\r";
  const struct {
    const char* name;
    std::string source, expected;
    std::int32_t error = 0;
  } rows[] = {
      {"line ends", "a\rb", "a\r\nb\r\n"},
      {"30000 lines", many, "l\n\r\n"},
      {"no line: the old backup stays", "", "old", 9},
  };
  for (const auto& row : rows) {
    platform.files.put(path, row.source);
    platform.files.put(u"C:\\b.txt", "old");
    EXPECT_EQ(error_of([&] { utils.CopyFileToBackupFile(path, u"C:\\b.txt"); }), row.error) << row.name;
    const std::string copy = platform.files.bytes(u"C:\\b.txt");
    if (row.source == many) {
      EXPECT_EQ(copy.size(), 30000 * row.expected.size()) << row.name;
    }
    EXPECT_EQ(copy.substr(0, row.expected.size()), row.expected) << row.name;
  }
}

TEST_F(TextFiles, EventLog) {
  SharedSettings& settings = library.settings();
  settings.sORVPath = u"C:\\TAL\\ORV3";
  const Text log = u"C:\\TAL\\ORV3\\EventLog.txt";
  utils.AppendEventLog(u"event", u"form");
  EXPECT_EQ(platform.files.bytes(log), "(no file)");

  settings.EventLog = 5;
  const struct {
    Text user;
    DateParts time;
    Text event;
  } rows[] = {
      {u"anne", {2026, 11, 15, 9, 7, 3}, u"Booking saved"},
      {u"", {2026, 1, 2, 0, 0, 0}, u"a:b\r\nc"},
      {u"J\u00FCrgen", {2026, 12, 31, 23, 59, 59}, u""},
  };
  for (const auto& row : rows) {
    settings.sUserName = row.user;
    platform.current_time = date_from_parts(row.time).value();
    utils.AppendEventLog(row.event, u"frmBooking");
  }
  EXPECT_EQ(platform.files.bytes(log),
            "anne:15112026090703:Booking saved:frmBooking\r\n"
            ":02012026000000:a:b\r\nc:frmBooking\r\n"
            "J\xFCrgen:31122026235959::frmBooking\r\n");
  platform.files.failures[u"append"] = ErrorNumber::path_not_found;
  EXPECT_EQ(error_of([&] { utils.AppendEventLog(u"e", u"f"); }), 76);
}

}  // namespace
}  // namespace talutil::testing
