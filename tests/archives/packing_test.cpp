#include "tests/archives/tree.hpp"

namespace talutil::archives {
namespace {

using namespace testing;
using talutil::testing::set_read_only;

const Tree sample = {
    {u"data\\", ""},
    {u"data\\empty\\", ""},
    {u"data\\empty.txt", ""},
    {u"data\\letter.txt", some_text(5000)},
    {u"data\\\u0416 wide \u00E9.txt", "wide"},
    {u"data\\sub\\", ""},
    {u"data\\sub\\noise.bin", some_text(70'000, 7)},
};

struct PackingTest : ArchiveTest {
  PackingTest() { write_tree(folder, sample); }
};

TEST_F(PackingTest, GivesBackWhatItWasGiven) {
  const Text password = u"secret \u00E9";
  const Rows<PackingOptions> rows = {
      {"plain", {}},
      {"stored", {.level = 0}},
      {"small", {.level = 9}},
      {"traditional encryption", {.password = password}},
      {"AES", {.aes = true, .password = password}},
      {"volumes", {.volume_size = smallest_volume}},
      {"encrypted volumes", {.level = 0, .password = password, .volume_size = smallest_volume}},
  };
  set_read_only(folder + u"data\\letter.txt", true);
  check_rows(rows, [&](const PackingOptions& options) {
    const Text to = scratch_folder();
    ASSERT_EQ(pack_files(to + u"a.zip", u"\"" + folder + u"data\"", options), Code::ok);
    EXPECT_EQ(read_tree(to).contains(u"a.z01"), options.level == 0 && options.volume_size.has_value());
    EXPECT_EQ(unpacked(to + u"a.zip", options.password), sample);
    ASSERT_EQ(unpack_files(to + u"a.zip", to, {.password = options.password}), Code::ok);
    const auto data = real_folders()->open(to)->folder(u"data", false);
    EXPECT_TRUE(data->facts(u"letter.txt")->attributes & file_attribute::read_only);
    data->list([](TextView, const FileFacts& facts) {
      EXPECT_TRUE(facts.kind == FileKind::folder || facts.modified == 1234567891) << facts.modified;
    });
    const UnpackingOptions again{.password = options.password, .overwrite = true};
    EXPECT_EQ(unpack_files(to + u"a.zip", to, again), Code::cannot_create);
    set_read_only(to + u"data\\letter.txt", false);
  });
  set_read_only(folder + u"data\\letter.txt", false);
}

// What just fills a buffer, one byte less and one more: of the pieces that are read, and of what is packed in memory.
TEST_F(PackingTest, FilesMayEndAtTheEndOfABuffer) {
  constexpr std::size_t in_memory = 16U << 20U;
  std::string noise;
  for (unsigned number = 1; noise.size() < 300'000;) noise += static_cast<char>((number = number * 69069U + 1) >> 24U);
  const struct {
    PackingOptions options;
    std::size_t large;  ///< The size of one more file.
  } rows[] = {{{}, in_memory}, {{.aes = true, .password = u"p"}, in_memory + 1}, {{.level = 0}, 1U << 20U}};
  for (const auto& [options, large] : rows) {
    Tree files = {{u"large", some_text(large)}};
    for (const std::size_t size : {1U, 4096U, 65'536U, 262'144U}) {
      for (const std::size_t each : {size - 1, size, size + 1}) {
        files[u"n" + from_utf8(std::to_string(each))] = noise.substr(0, each);
        files[u"t" + from_utf8(std::to_string(each))] = some_text(each);
      }
    }
    folder = scratch_folder();
    write_tree(folder, files);
    ASSERT_EQ(pack_files(folder + u"a.zip", folder + u"*", options), Code::ok);
    EXPECT_TRUE(unpacked(folder + u"a.zip", options.password) == files) << large;
    EXPECT_EQ(read_tree(folder).at(u"a.zip").size() < large, options.level > 0);
  }
}

// Wherever the end of a volume falls: on the data, a header, the directory or its end, and just behind all of them.
TEST_F(PackingTest, VolumesEndAnywhere) {
  const auto count = [](std::string_view bytes, std::string_view mark) {
    std::size_t found = 0;
    for (std::size_t at = 0; (at = bytes.find(mark, at)) != std::string_view::npos; ++at) ++found;
    return found;
  };
  write_file(folder, u"data\\v.bin", "");
  const Text items = folder + u"data\\letter.txt " + folder + u"data\\v.bin";
  ASSERT_EQ(pack_files(archive, items, {.level = 0}), Code::ok);
  const std::size_t overhead = read_tree(folder).at(u"a.zip").size();
  bool is_end_alone = false;
  for (std::size_t size = smallest_volume - overhead - 2; size <= smallest_volume - 4998; ++size) {
    const std::string content = some_text(size);
    write_file(folder, u"data\\v.bin", content);
    const Text to = scratch_folder();
    ASSERT_EQ(pack_files(to + u"a.zip", items, {.level = 0, .volume_size = smallest_volume}), Code::ok);
    const Tree files = read_tree(to);
    ASSERT_EQ(files.contains(u"a.z01"), size + overhead > smallest_volume) << size;
    for (const auto& [name, bytes] : files) EXPECT_LE(bytes.size(), smallest_volume) << to_utf8(name) << " of " << size;
    // The records at the end name the entries of the directory that the last volume has, and all of them.
    const std::string& last = files.at(u"a.zip");
    const std::size_t entries = count(last, "PK\1\2");
    is_end_alone = is_end_alone || entries == 0;
    EXPECT_EQ(last.substr(last.rfind("PK\5\6") + 8, 4), (std::string{static_cast<char>(entries), 0, 2, 0})) << size;
    ASSERT_TRUE(unpacked(to + u"a.zip").at(u"v.bin") == content) << size;
  }
  EXPECT_TRUE(is_end_alone);
}

TEST_F(PackingTest, UnderstandsItems) {
  // "@" stands for the folder.
  const Text texts = u"empty.txt|letter.txt|\u0416 wide \u00E9.txt";
  const Rows<Text, PackingOptions, Text> rows = {
      {"a file", u"@data\\letter.txt", {}, u"letter.txt"},
      {"patterns", u"@data\\*.TXT @data\\l*", {}, texts},
      {"all below a folder", u"@data\\sub\\*.*", {}, u"noise.bin"},
      {"folders by pattern", u"@data\\s*", {}, u"sub\\|sub\\noise.bin"},
      {"no folders", u"@data\\*", {.recurse = false}, texts},
      {"no names of folders", u"@data\\s*", {.keep_folders = false}, u"noise.bin"},
      {"a file named thrice", u"@data\\sub\\n* @data\\l* @data\\letter.txt @data\\sub\\*", {}, u"letter.txt|noise.bin"},
      {"one of two is missing", u"@missing @data\\sub", {}, u"sub\\|sub\\noise.bin"},
      {"the archive is not its own", u"@*.zip @data\\l*", {}, u"letter.txt"},
  };
  check_rows(rows, [&](Text items, const PackingOptions& options, const Text& expected) {
    for (std::size_t at = 0; (at = items.find(u'@')) != Text::npos;) items.replace(at, 1, folder);
    write_file(folder, u"a.zip", "");
    ASSERT_EQ(pack_files(archive, items, options), Code::ok);
    EXPECT_EQ(paths_of(unpacked(archive)), expected);
  });
}

TEST_F(PackingTest, AddsToAnArchive) {
  ASSERT_EQ(pack_files(archive, folder + u"data\\letter.txt " + folder + u"data\\sub", {.comment = u"first"}),
            Code::ok);
  write_file(folder, u"LETTER.TXT", "new");
  ASSERT_EQ(pack_files(archive, folder + u"LETTER.TXT"), Code::ok);
  EXPECT_EQ(unpacked(archive),
            (Tree{{u"LETTER.TXT", "new"}, {u"sub\\", ""}, {u"sub\\noise.bin", sample.at(u"data\\sub\\noise.bin")}}));
  EXPECT_EQ(Archive(archive, *real_folders()).comment(), u"first");
}

TEST_F(PackingTest, AFailedRunLeavesTheOldArchive) {
  ASSERT_EQ(pack_files(archive, folder + u"data"), Code::ok);
  Tree before = read_tree(folder);
  Progress cancelled([](std::uint64_t, std::uint64_t, TextView) { return false; });
  EXPECT_EQ(pack_files(archive, folder + u"data", {}, cancelled), Code::cancelled);
  EXPECT_EQ(read_tree(folder), before);
  Progress vanishing([&](std::uint64_t, std::uint64_t, TextView) {
    if (before.erase(u"data\\sub\\noise.bin") > 0) real_files()->delete_files(folder + u"data\\sub\\*.*");
    return true;
  });
  EXPECT_EQ(pack_files(archive, folder + u"data\\letter.txt " + folder + u"data\\sub", {}, vanishing),
            Code::cannot_read);
  EXPECT_EQ(read_tree(folder), before);
}

TEST_F(PackingTest, EndsWithTheCodeOfItsFault) {
  const Text items = folder + u"data";
  ASSERT_EQ(pack_files(folder + u"set.zip", items, {.level = 0, .volume_size = smallest_volume}), Code::ok);
  write_tree(folder, {{u"broken.zip", "PK\3\4 and no end"},
                      {u"none.zip", "no archive at all"},
                      {u"twice\\none.zip", "another of that name"},
                      {u"locked.zip", ""},
                      {u"read-only.zip", ""}});
  set_read_only(folder + u"read-only.zip", true);
  const auto lock = talutil::testing::lock_file(folder + u"locked.zip");
  const Rows<Text, Text, PackingOptions, Code> rows = {
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
      {"volumes too small", archive, items, {.volume_size = smallest_volume - 1}, Code::bad_volume_size},
      {"volumes too large", archive, items, {.volume_size = largest_volume + 1}, Code::bad_volume_size},
      {"two files of one name", archive, folder + u"*.zip " + folder + u"twice\\*", {}, Code::bad_parameters},
      {"level", archive, items, {.level = 10}, Code::bad_parameters},
      {"level below 0", archive, items, {.level = -1}, Code::bad_parameters},
      {"password with NUL", archive, items, {.password = Text(u"a\0b", 3)}, Code::bad_parameters},
      {"comment", archive, items, {.comment = Text(65536, u'c')}, Code::bad_comment},
      {"longest comment", archive, items, {.comment = Text(65535, u'c')}, Code::ok},
      {"largest volumes", archive, items, {.volume_size = largest_volume}, Code::ok},
  };
  check_rows(rows, [](const Text& path, const Text& list, const PackingOptions& options, Code code) {
    EXPECT_EQ(pack_files(path, list, options), code);
  });
  const std::pair<Text, Code> read[] = {{u"", Code::missing},
                                        {u"missing.zip", Code::missing},
                                        {u"missing\\a.zip", Code::missing},
                                        {u"none.zip", Code::bad_structure},
                                        {u"locked.zip", Code::cannot_open}};
  for (const auto& [name, code] : read) EXPECT_EQ(test_file(name.empty() ? name : folder + name), code);
  set_read_only(folder + u"read-only.zip", false);
  real_files()->delete_files(folder + u"set.z01");
  EXPECT_EQ(test_file(folder + u"set.zip"), Code::bad_media) << "a volume that is missing";
}

TEST_F(PackingTest, FilesThatChangeArePackedAsTheyWereRead) {
  for (const std::int32_t level : {0, 6}) {
    write_tree(folder, {{u"grows.txt", "found"}, {u"shrinks.txt", "found too"}});
    int calls = 0;
    Progress changing([&](std::uint64_t done, std::uint64_t total, TextView) {
      EXPECT_LE(done, total);
      if (calls++ == 0) write_tree(folder, {{u"grows.txt", "found and longer now"}, {u"shrinks.txt", "f"}});
      return true;
    });
    const Text items = folder + u"data\\letter.txt " + folder + u"grows.txt " + folder + u"shrinks.txt";
    ASSERT_EQ(pack_files(archive, items, {.level = level}, changing), Code::ok);
    EXPECT_EQ(unpacked(archive),
              (Tree{{u"letter.txt", some_text(5000)}, {u"grows.txt", "found"}, {u"shrinks.txt", "f"}}));
  }
}

}  // namespace
}  // namespace talutil::archives
