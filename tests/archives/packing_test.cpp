#include <gtest/gtest.h>

#include "archives/split_set.hpp"
#include "tests/archives/tree.hpp"

namespace talutil::archives {
namespace {

using namespace testing;
using talutil::testing::scratch_folder;

const Tree sample = {
    {u"data\\", ""},
    {u"data\\empty\\", ""},
    {u"data\\empty.txt", ""},
    {u"data\\letter.txt", some_text(5000)},
    {u"data\\\u0416 wide \u00E9.txt", "wide"},
    {u"data\\sub\\", ""},
    {u"data\\sub\\noise.bin", some_text(70'000, 7)},
};

class PackingTest : public ::testing::Test {
 protected:
  void SetUp() override { write_tree(folder, sample); }

  /// What an archive unpacks to.
  Tree unpacked(const UnpackingOptions& options = {}) {
    const Text target = scratch_folder();
    EXPECT_EQ(unpack_files(archive, target, options), Code::ok);
    return read_tree(target);
  }

  std::string archive_bytes() { return read_tree(folder).at(u"a.zip"); }

  Text folder = scratch_folder();
  Text archive = folder + u"a.zip";
};

TEST_F(PackingTest, GivesBackWhatItWasGiven) {
  const struct {
    const char* name;
    PackingOptions options;
  } rows[] = {
      {"plain", {}},
      {"stored", {.level = 0}},
      {"small", {.level = 9}},
      {"traditional encryption", {.password = u"secret \u00E9"}},
      {"AES", {.aes = true, .password = u"secret \u00E9"}},
      {"volumes", {.volume_size = smallest_volume}},
      {"encrypted volumes", {.level = 0, .password = u"secret \u00E9", .volume_size = smallest_volume}},
  };
  for (const auto& row : rows) {
    folder = scratch_folder();
    archive = folder + u"a.zip";
    write_tree(folder, sample);
    ASSERT_EQ(pack_files(archive, u"\"" + folder + u"data\"", row.options), Code::ok) << row.name;
    EXPECT_EQ(unpacked({.password = row.options.password}), sample) << row.name;
    EXPECT_EQ(test_file(archive, {.password = row.options.password}), Code::ok) << row.name;
    const bool is_set = row.options.level == 0 && row.options.volume_size.has_value();
    EXPECT_EQ(read_tree(folder).contains(u"a.z01"), is_set) << row.name;
    Archive read(archive, *talutil::testing::real_folders());
    for (std::uint64_t i = 0; i < read.count(); ++i) {
      const Archive::Entry entry = read.entry(i);
      if (entry.facts.kind != FileKind::folder) {
        EXPECT_EQ(entry.facts.modified, 1234567891) << row.name;
      }
    }
  }
}

TEST_F(PackingTest, KeepsTimesAndReadOnly) {
  talutil::testing::set_read_only(folder + u"data\\letter.txt", true);
  ASSERT_EQ(pack_files(archive, folder + u"data\\letter.txt"), Code::ok);
  const Text target = scratch_folder();
  ASSERT_EQ(unpack_files(archive, target), Code::ok);
  const auto facts = talutil::testing::real_folders()->open(target)->facts(u"letter.txt");
  ASSERT_TRUE(facts);
  EXPECT_EQ(facts->modified, 1234567891);
  EXPECT_TRUE(facts->attributes & file_attribute::read_only);
  EXPECT_EQ(unpack_files(archive, target, {.overwrite = true}), Code::cannot_create);
  talutil::testing::set_read_only(target + u"letter.txt", false);
  talutil::testing::set_read_only(folder + u"data\\letter.txt", false);
}

TEST_F(PackingTest, UnderstandsItems) {
  const struct {
    const char* name;
    Text items;
    PackingOptions options;
    std::vector<Text> expected;
  } rows[] = {
      {"a file", folder + u"data\\letter.txt", {}, {u"letter.txt"}},
      {"patterns",
       folder + u"data\\*.TXT " + folder + u"data\\l*",
       {},
       {u"empty.txt", u"letter.txt", u"\u0416 wide \u00E9.txt"}},
      {"all below a folder", folder + u"data\\sub\\*.*", {}, {u"noise.bin"}},
      {"folders by pattern", folder + u"data\\s*", {}, {u"sub\\", u"sub\\noise.bin"}},
      {"no folders", folder + u"data\\*", {.recurse = false}, {u"empty.txt", u"letter.txt", u"\u0416 wide \u00E9.txt"}},
      {"no names of folders", folder + u"data\\s*", {.keep_folders = false}, {u"noise.bin"}},
      {"a file named thrice",
       folder + u"data\\sub\\n* " + folder + u"data\\l* " + folder + u"data\\letter.txt " + folder + u"data\\sub\\*",
       {},
       {u"letter.txt", u"noise.bin"}},
      {"one of two is missing", folder + u"missing " + folder + u"data\\sub", {}, {u"sub\\", u"sub\\noise.bin"}},
      {"the archive is not its own", folder + u"*.zip " + folder + u"data\\l*", {}, {u"letter.txt"}},
  };
  for (const auto& row : rows) {
    write_file(folder, u"a.zip", "");
    ASSERT_EQ(pack_files(archive, row.items, row.options), Code::ok) << row.name;
    std::vector<Text> names;
    for (const auto& [name, content] : unpacked()) names.push_back(name);
    EXPECT_EQ(names, row.expected) << row.name;
  }
}

TEST_F(PackingTest, AddsToAnArchive) {
  ASSERT_EQ(pack_files(archive, folder + u"data\\letter.txt " + folder + u"data\\sub", {.comment = u"first"}),
            Code::ok);
  write_file(folder, u"LETTER.TXT", "new");
  ASSERT_EQ(pack_files(archive, folder + u"LETTER.TXT"), Code::ok);
  EXPECT_EQ(unpacked(),
            (Tree{{u"LETTER.TXT", "new"}, {u"sub\\", ""}, {u"sub\\noise.bin", sample.at(u"data\\sub\\noise.bin")}}));
  EXPECT_EQ(Archive(archive, *talutil::testing::real_folders()).comment(), u"first");
}

TEST_F(PackingTest, AFailedRunLeavesTheOldArchive) {
  ASSERT_EQ(pack_files(archive, folder + u"data"), Code::ok);
  const std::string before = archive_bytes();
  Progress cancelled([](std::uint64_t, std::uint64_t, TextView) { return false; });
  EXPECT_EQ(pack_files(archive, folder + u"data", {}, cancelled), Code::cancelled);
  int calls = 0;
  Progress vanishing([&](std::uint64_t, std::uint64_t, TextView) {
    if (calls++ == 0) talutil::testing::real_files()->delete_files(folder + u"data\\sub\\*.*");
    return true;
  });
  EXPECT_EQ(pack_files(archive, folder + u"data\\letter.txt " + folder + u"data\\sub", {}, vanishing),
            Code::cannot_read);
  EXPECT_EQ(archive_bytes(), before);
  Tree left = read_tree(folder);
  std::erase_if(left, [](const auto& entry) { return entry.first.starts_with(u"data"); });
  EXPECT_EQ(left.size(), 1U) << "a file of the failed run is left";
}

TEST_F(PackingTest, EndsWithTheCodeOfItsFault) {
  const Text items = folder + u"data";
  ASSERT_EQ(pack_files(folder + u"set.zip", items, {.level = 0, .volume_size = smallest_volume}), Code::ok);
  write_file(folder, u"broken.zip", "PK\3\4 and no end");
  write_file(folder, u"none.zip", "no archive at all");
  write_file(folder, u"twice\\none.zip", "another of that name");
  write_file(folder, u"locked.zip", "");
  write_file(folder, u"read-only.zip", "");
  talutil::testing::set_read_only(folder + u"read-only.zip", true);
  const auto lock = talutil::testing::lock_file(folder + u"locked.zip");
  const struct {
    const char* name;
    Text archive;
    Text items;
    PackingOptions options;
    Code code;
  } rows[] = {
      {"no name", u"", items, {}, Code::missing},
      {"a folder's name", folder, items, {}, Code::missing},
      {"a device", folder + u"nul.zip", items, {}, Code::missing},
      {"folder of the archive is missing", folder + u"missing\\a.zip", items, {}, Code::temporary_file},
      {"nothing matches", archive, folder + u"*.none", {}, Code::nothing_to_do},
      {"no items", archive, u"  ", {}, Code::nothing_to_do},
      {"a missing drive", archive, u"Q:\\*.*", {}, Code::nothing_to_do},
      {"archive is a folder", folder + u"data", folder + u"data\\l*", {}, Code::cannot_create},
      {"archive is read-only", folder + u"read-only.zip", items, {}, Code::cannot_create},
      {"archive is locked", folder + u"locked.zip", items, {}, Code::cannot_open},
      {"archive is cut off", folder + u"broken.zip", items, {}, Code::unexpected_end},
      {"archive is none", folder + u"none.zip", items, {}, Code::bad_structure},
      {"adding to a set", folder + u"set.zip", items, {}, Code::split_set_in_use},
      {"volumes too small", archive, items, {.volume_size = 1000}, Code::bad_volume_size},
      {"two files of one name", archive, folder + u"*.zip " + folder + u"twice\\*", {}, Code::bad_parameters},
      {"level", archive, items, {.level = 10}, Code::bad_parameters},
      {"password with NUL", archive, items, {.password = Text(u"a\0b", 3)}, Code::bad_parameters},
      {"comment", archive, items, {.comment = Text(65536, u'c')}, Code::bad_comment},
  };
  for (const auto& row : rows) EXPECT_EQ(pack_files(row.archive, row.items, row.options), row.code) << row.name;
  talutil::testing::set_read_only(folder + u"read-only.zip", false);
}

TEST_F(PackingTest, LargeFilesAreStreamed) {
  std::string large;
  for (int i = 0; i < 9; ++i) large += some_text(2'000'000, static_cast<unsigned>(i));
  write_file(folder, u"large.txt", large);
  for (const bool aes : {false, true}) {
    ASSERT_EQ(pack_files(archive, folder + u"large.txt", {.aes = aes, .password = aes ? u"p" : u""}), Code::ok);
    EXPECT_EQ(unpacked({.password = u"p"}), (Tree{{u"large.txt", large}}));
  }
  EXPECT_LT(archive_bytes().size(), large.size() / 2);
}

TEST_F(PackingTest, FilesThatChangeArePackedAsTheyWereRead) {
  for (const std::int32_t level : {0, 6}) {
    write_file(folder, u"grows.txt", "found");
    write_file(folder, u"shrinks.txt", "found too");
    int calls = 0;
    Progress changing([&](std::uint64_t done, std::uint64_t total, TextView) {
      EXPECT_LE(done, total);
      if (calls++ == 0) {
        write_file(folder, u"grows.txt", "found and longer now");
        write_file(folder, u"shrinks.txt", "f");
      }
      return true;
    });
    const Text items = folder + u"data\\letter.txt " + folder + u"grows.txt " + folder + u"shrinks.txt";
    ASSERT_EQ(pack_files(archive, items, {.level = level}, changing), Code::ok);
    const Tree expected = {
        {u"letter.txt", sample.at(u"data\\letter.txt")}, {u"grows.txt", "found"}, {u"shrinks.txt", "f"}};
    EXPECT_EQ(unpacked(), expected) << level;
  }
}

TEST_F(PackingTest, AVolumeThatIsMissingIsNamed) {
  ASSERT_EQ(pack_files(archive, folder + u"data", {.level = 0, .volume_size = smallest_volume}), Code::ok);
  talutil::testing::real_files()->delete_files(folder + u"a.z01");
  EXPECT_EQ(test_file(archive), Code::bad_media);
}

}  // namespace
}  // namespace talutil::archives
