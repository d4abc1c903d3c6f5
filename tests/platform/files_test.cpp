// What both platforms promise of their files.
#include <gtest/gtest.h>

#include <algorithm>
#include <future>

#include "platform/file_names.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

class RealFiles : public ::testing::Test {
 protected:
  void write(const Text& name, std::string_view bytes) { write_bytes(folder + name, bytes); }

  std::string read(const Text& name) {
    std::string bytes = read_bytes(folder + name);
    EXPECT_EQ(files->open_input(folder + name)->size(), bytes.size());
    return bytes;
  }

  std::vector<Text> names(const Text& pattern, std::uint32_t mask = 0) {
    std::vector<Text> result;
    files->search(folder + pattern, mask, [&](TextView name) { return result.emplace_back(name), true; });
    std::ranges::sort(result);
    return result;
  }

  Files* files = real_files();
  Text folder = scratch_folder();
};

TEST(FileNames, Patterns) {
  using Pair = std::pair<TextView, TextView>;
  for (const auto& [pattern, name] :
       {Pair(u"*.*", u"name"), Pair(u"*", u"a.b.c"), Pair(u"*.", u"name"), Pair(u"*.htm", u"A.B.HTM"),
        Pair(u"a?c.txt", u"abc.txt"), Pair(u"a?.txt", u"a.txt"), Pair(u"a??", u"a"), Pair(u"name.*", u"NAME"),
        Pair(u"a*b*c", u"aXbXbXc"), Pair(u"\u00C9*", u"\u00E9t\u00E9"), Pair(u"a.?", u"a"), Pair(u"*.b.*", u"a.b")}) {
    EXPECT_TRUE(name_matches(name, pattern)) << to_utf8(pattern);
  }
  for (const auto& [pattern, name] : {Pair(u"*.", u"a.b"), Pair(u"*.htm", u"a.html"), Pair(u"?a", u"a"),
                                      Pair(u"name.*", u"names.x"), Pair(u"a*b", u"abc"), Pair(u"", u"a")}) {
    EXPECT_FALSE(name_matches(name, pattern)) << to_utf8(pattern);
  }
}

TEST_F(RealFiles, NamesThatAreNoFiles) {
  const Rows<Text, std::int32_t> rows = {
      {"device", u"CON", 52},
      {"device with extension, in a folder", folder + u"nul.txt", 52},
      {"device with a colon", u"LPT1:", 52},
      {"device name space", u"\\\\.\\PhysicalDrive0", 52},
      {"NUL character", folder + Text(u"a\0b", 3), 52},
      {"wildcard", folder + u"*.txt", 52},
      {"quote", folder + u"\"a", 52},
      {"empty", u"", 75},
      {"longest text", folder + Text(32767, u'a'), 52},
      {"missing file", folder + u"missing.txt", 53},
      {"missing folder", folder + u"missing\\a.txt", 76},
      {"missing drive", u"Q:\\a.txt", 76},
      {"a folder", folder, 75},
  };
  check_rows(rows, [&](const Text& path, std::int32_t error) {
    EXPECT_EQ(error_of([&] { (void)files->open_input(path); }), error);
    if (error == 53) return;
    EXPECT_EQ(error_of([&] { (void)files->open_output(path); }), error) << "output";
    EXPECT_EQ(error_of([&] { files->append(path, "x"); }), error) << "append";
  });
}

TEST_F(RealFiles, OutputTakesTheNameWhenItIsClosed) {
  write(u"a.txt", "old");
  files->open_output(folder + u"a.txt")->write("new");
  EXPECT_EQ(read(u"A.TXT"), "old");
  EXPECT_EQ(names(u"*.*", file_attribute::hidden), std::vector<Text>{u"a.txt"}) << "what was not closed is left";
  write(u"a.txt", "newer, longer");
  EXPECT_EQ(read(u"a.txt. "), "newer, longer");
  files->append(folder + u"\\a.txt", "+");
  files->append(folder + u"b.txt", "b");
  EXPECT_EQ(read(u"a.txt"), "newer, longer+");
  EXPECT_EQ(read(u"b.txt"), "b");
}

TEST_F(RealFiles, ReadOnlyAndLockedFilesStay) {
  write(u"a.txt", "old");
  set_read_only(folder + u"a.txt", true);
  EXPECT_EQ(error_of([&] { write(u"a.txt", "new"); }), 75);
  EXPECT_EQ(error_of([&] { files->append(folder + u"a.txt", "x"); }), 75);
  set_read_only(folder + u"a.txt", false);
  {
    const auto lock = lock_file(folder + u"a.txt");
    // At once, as each may wait a while for the lock.
    std::vector<std::future<std::int32_t>> errors;
    const std::function<void()> calls[] = {[&] { (void)read(u"a.txt"); }, [&] { write(u"a.txt", "new"); },
                                           [&] { files->append(folder + u"a.txt", "x"); }};
    for (const auto& call : calls) errors.push_back(std::async(std::launch::async, [&call] { return error_of(call); }));
    for (auto& error : errors) EXPECT_EQ(error.get(), 70);
  }
  EXPECT_EQ(read(u"a.txt"), "old");
}

TEST_F(RealFiles, Searches) {
  for (const TextView name : {u"a.txt", u"b.htm", u"noextension"}) write(Text(name), "");
  files->make_path(folder + u"sub\\deeper\\file.txt");
  make_hidden_file(folder);
  using Names = std::vector<Text>;
  EXPECT_EQ(names(u"*.*"), (Names{u"a.txt", u"b.htm", u"noextension"}));
  EXPECT_EQ(names(u""), (Names{u"a.txt", u"b.htm", u"noextension"}));
  EXPECT_EQ(names(u"A.TXT"), Names{u"a.txt"});
  EXPECT_EQ(names(u"sub"), Names{});
  EXPECT_EQ(names(u"SUB", file_attribute::folder), Names{u"sub"});
  EXPECT_EQ(names(u"sub\\", file_attribute::folder), (Names{u".", u"..", u"deeper"}));
  EXPECT_EQ(names(u"sub\\deeper\\*.*"), Names{});
  EXPECT_EQ(names(u"*hidden.txt"), Names{});
  EXPECT_EQ(names(u"*hidden.txt", file_attribute::hidden).size(), 1U);
  EXPECT_EQ(names(u"missing\\*.*"), Names{});
  EXPECT_EQ(error_of([&] { files->search(u"T:\\a|b", 0, [](TextView) { return true; }); }), 52);
  EXPECT_NE(files->attributes(folder + u"sub\\") & file_attribute::folder, 0U);
  EXPECT_EQ(files->attributes(folder + u"a.txt") & file_attribute::folder, 0U);
  EXPECT_EQ(error_of([&] { (void)files->attributes(folder + u"missing"); }), 53);
}

TEST_F(RealFiles, Deleting) {
  for (const TextView name : {u"a.txt", u"b.txt", u"c.htm"}) write(Text(name), "");
  files->make_path(folder + u"sub.txt\\");
  write(u"sub.txt\\a.txt", "");
  files->delete_files(folder + u"*.txt");
  EXPECT_EQ(names(u"*.*"), std::vector<Text>{u"c.htm"});
  EXPECT_EQ(read(u"sub.txt\\a.txt"), "");
  EXPECT_EQ(error_of([&] { files->delete_files(folder + u"*.txt"); }), 53);
  for (const TextView pattern : {u"sub.txt\\..", u"sub.txt\\.", u"sub.txt", u"sub.t*\\a.txt", u"*\\..\\c.htm"}) {
    EXPECT_NE(error_of([&] { files->delete_files(folder + Text(pattern)); }), 0) << to_utf8(pattern);
  }
  set_read_only(folder + u"c.htm", true);
  EXPECT_EQ(error_of([&] { files->delete_files(folder + u"c.*"); }), 70);
  EXPECT_EQ(names(u"*.*"), std::vector<Text>{u"c.htm"});
  EXPECT_EQ(names(u"sub.txt\\*.*"), std::vector<Text>{u"a.txt"});
  set_read_only(folder + u"c.htm", false);
}

TEST_F(RealFiles, MakingFolders) {
  write(u"file", "");
  EXPECT_TRUE(files->make_path(folder + u"one\\two\\not this"));
  EXPECT_EQ(names(u"one\\*", file_attribute::folder), (std::vector<Text>{u".", u"..", u"two"}));
  EXPECT_EQ(names(u"one\\two\\not this", file_attribute::folder), std::vector<Text>{});
  EXPECT_TRUE(files->make_path(folder + u"ONE\\TWO\\"));
  EXPECT_FALSE(files->make_path(folder + u"file\\two\\"));
  EXPECT_FALSE(files->make_path(u"Q:\\one\\"));
}

TEST_F(RealFiles, CurrentFolders) {
  const Text current = files->current_folder(u"");
  ASSERT_GT(current.size(), 2U);
  EXPECT_EQ(current[1], u':');
  EXPECT_EQ(files->current_folder(Text(1, lower_case(current[0]))), current);
  EXPECT_EQ(files->current_folder(u"Q"), u"");
}

}  // namespace
}  // namespace talutil::testing
