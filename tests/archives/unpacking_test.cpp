#include <gtest/gtest.h>
#include <zlib.h>

#include "archives/directory.hpp"
#include "archives/little_endian.hpp"
#include "archives/split_set.hpp"
#include "tests/archives/memory_file.hpp"
#include "tests/archives/tree.hpp"

namespace talutil::archives {
namespace {

using namespace testing;
using talutil::testing::scratch_folder;

/// An entry as nobody's program would write it.
struct Made {
  std::string name;
  std::string content = "content";
  std::uint32_t posix_mode = 0;
  std::uint32_t size = 0xFFFF'FFFF;  ///< Other than the true one.
  bool has_next_offset = false;      ///< Claims the bytes of the entry before.
};

/// An archive of stored entries.
std::string make_archive(const std::vector<Made>& entries) {
  std::string bytes;
  std::string directory;
  std::uint32_t offset = 0;
  for (const Made& entry : entries) {
    if (!entry.has_next_offset) offset = static_cast<std::uint32_t>(bytes.size());
    std::string common;
    for (const int number : {20, 0x800, 0, 0, 0x21}) append_number(common, static_cast<std::uint16_t>(number));
    append_number(common, static_cast<std::uint32_t>(crc32(0, reinterpret_cast<const Bytef*>(entry.content.data()),
                                                           static_cast<uInt>(entry.content.size()))));
    append_number(common, static_cast<std::uint32_t>(entry.content.size()));
    append_number(common, entry.size != 0xFFFF'FFFF ? entry.size : static_cast<std::uint32_t>(entry.content.size()));
    append_number(common, static_cast<std::uint16_t>(entry.name.size()));
    append_number(common, std::uint16_t{0});
    append_number(bytes, local_signature);
    bytes += common + entry.name + entry.content;
    append_number(directory, central_signature);
    append_number(directory, static_cast<std::uint16_t>(entry.posix_mode != 0 ? 0x314 : 20));
    directory += common;
    directory.append(6, '\0');
    append_number(directory, entry.posix_mode << 16U);
    append_number(directory, offset);
    directory += entry.name;
  }
  const auto count = static_cast<std::uint16_t>(entries.size());
  const auto start = static_cast<std::uint32_t>(bytes.size());
  bytes += directory;
  append_number(bytes, end_signature);
  append_number(bytes, std::uint32_t{0});
  append_number(bytes, count);
  append_number(bytes, count);
  append_number(bytes, static_cast<std::uint32_t>(directory.size()));
  append_number(bytes, start);
  append_number(bytes, std::uint16_t{0});
  return bytes;
}

Code test_bytes(std::string bytes) {
  Progress progress;
  return code_of([&] { Archive(std::make_unique<MemoryFile>(std::move(bytes))).test({}, {}, progress); });
}

class UnpackingTest : public ::testing::Test {
 protected:
  Code unpack(const std::vector<Made>& entries, const UnpackingOptions& options = {}) {
    write_file(folder, u"a.zip", make_archive(entries));
    return unpack_files(folder + u"a.zip", folder + u"out", options);
  }
  Tree out() { return read_tree(folder + u"out"); }

  Text folder = scratch_folder();
};

TEST_F(UnpackingTest, PassesOverWhatIsNotSafe) {
  constexpr std::uint32_t link = 0120777;
  const struct {
    const char* name;
    std::vector<Made> entries;
    Code code;
    std::vector<Text> written;
  } rows[] = {
      {"climbs out", {{"../../evil"}, {"a/../../evil"}, {"good"}}, Code::incomplete, {u"good"}},
      {"absolute", {{"/etc/evil"}, {"C:\\evil"}}, Code::ok, {u"etc\\", u"etc\\evil", u"evil"}},
      {"a link, and a way through it", {{"l", "/etc", link}, {"l/x"}}, Code::incomplete, {u"l\\", u"l\\x"}},
      {"a NUL in a name", {{std::string("a\0.txt", 6)}, {"b"}}, Code::incomplete, {u"b"}},
      {"a name of 65,535 bytes", {{std::string(65535, 'n')}, {"b"}}, Code::incomplete, {u"b"}},
      {"names that differ by case", {{"a", "first"}, {"A", "second"}}, Code::incomplete, {u"a"}},
      {"the same name twice", {{"a", "first"}, {"a", "second"}}, Code::incomplete, {u"a"}},
      {"a file where a folder is", {{"f/g"}, {"F"}}, Code::incomplete, {u"f\\", u"f\\g"}},
      {"a folder where a file is", {{"f"}, {"f/g"}}, Code::incomplete, {u"f"}},
      {"a device", {{"x/aux.txt"}}, Code::ok, {u"x\\", u"x\\_aux.txt"}},
      {"folders in another case", {{"Data/a"}, {"DATA/b"}}, Code::ok, {u"Data\\", u"Data\\a", u"Data\\b"}},
  };
  for (const auto& row : rows) {
    folder = scratch_folder();
    EXPECT_EQ(unpack(row.entries), row.code) << row.name;
    std::vector<Text> written;
    for (const auto& [name, content] : out()) written.push_back(name);
    EXPECT_EQ(written, row.written) << row.name;
  }
}

TEST_F(UnpackingTest, ChecksWhatAnArchiveClaims) {
  const struct {
    const char* name;
    std::vector<Made> entries;
    Code code;
  } rows[] = {
      {"nothing in it", {}, Code::nothing_to_do},
      {"entries on the same bytes", {{"a"}, {"b", "content", 0, 0xFFFF'FFFF, true}}, Code::bad_structure},
      {"longer than it is", {{"a", "content", 0, 1000}}, Code::bad_structure},
      {"gigabytes out of bytes", {{"a", "content", 0, 0xF000'0000}}, Code::incomplete},
  };
  for (const auto& row : rows) {
    const Code code = unpack(row.entries);
    EXPECT_EQ(code, row.code) << row.name;
    EXPECT_TRUE(code == Code::bad_structure || out().empty()) << row.name;
  }
  EXPECT_EQ(unpack({{"a"}, {"b"}}, {.largest_total = 13}), Code::incomplete);
  EXPECT_EQ(unpack({{"a"}, {"b"}}, {.items = u"*.none"}), Code::nothing_to_do);
}

TEST_F(UnpackingTest, KeepsOrReplacesFiles) {
  write_file(folder, u"out\\A.txt", "old");
  EXPECT_EQ(unpack({{"a.txt", "new"}, {"b.txt"}}), Code::ok);
  EXPECT_EQ(out(), (Tree{{u"A.txt", "old"}, {u"b.txt", "content"}}));
  EXPECT_EQ(unpack({{"a.txt", "new"}, {"x/b.txt", "flat"}}, {.overwrite = true, .keep_folders = false}), Code::ok);
  EXPECT_EQ(out(), (Tree{{u"A.txt", "new"}, {u"b.txt", "flat"}}));
}

TEST_F(UnpackingTest, AsksForPasswords) {
  write_file(folder, u"secret.txt", some_text(1000));
  const struct {
    const char* name;
    Text given;
    std::vector<Text> typed;  // "-" is a box that is cancelled
    Code code;
  } rows[] = {
      {"known", u"right", {}, Code::ok},
      {"typed", u"", {u"right"}, Code::ok},
      {"typed at the third time", u"wrong", {u"bad", u"worse", u"right"}, Code::ok},
      {"wrong three times", u"wrong", {u"bad", u"worse", u"worst"}, Code::bad_parameters},
      {"cancelled", u"", {u"-"}, Code::cancelled},
      {"cancelled at last", u"wrong", {u"bad", u"-"}, Code::cancelled},
  };
  for (const bool aes : {false, true}) {
    const Text archive = folder + (aes ? u"aes.zip" : u"old.zip");
    ASSERT_EQ(pack_files(archive, folder + u"secret.txt", {.aes = aes, .password = u"right"}), Code::ok);
    for (const auto& row : rows) {
      const Text target = scratch_folder();
      std::size_t asked = 0;
      const PasswordQuestion ask = [&](const Text& entry, bool was_wrong) -> std::optional<Text> {
        EXPECT_EQ(entry, u"secret.txt");
        EXPECT_EQ(was_wrong, asked > 0 || !row.given.empty()) << row.name;
        const Text& answer = row.typed.at(asked++);
        return answer == u"-" ? std::nullopt : std::optional(answer);
      };
      EXPECT_EQ(unpack_files(archive, target, {.password = row.given}, ask), row.code) << row.name;
      EXPECT_EQ(asked, row.typed.size()) << row.name;
      const Tree expected = row.code == Code::ok ? Tree{{u"secret.txt", some_text(1000)}} : Tree{};
      EXPECT_EQ(read_tree(target), expected) << row.name;
    }
    EXPECT_EQ(unpack_files(archive, scratch_folder(), {.password = u"wrong"}), Code::bad_parameters) << "nobody to ask";
  }
}

TEST_F(UnpackingTest, OpensWithTheCodeOfTheFault) {
  write_file(folder, u"text.zip", "no archive at all");
  write_file(folder, u"locked.zip", make_archive({{"a"}}));
  const auto lock = talutil::testing::lock_file(folder + u"locked.zip");
  const struct {
    Text archive;
    Code code;
  } rows[] = {
      {u"", Code::missing},
      {folder + u"none.zip", Code::missing},
      {folder + u"none\\a.zip", Code::missing},
      {folder + u"text.zip", Code::bad_structure},
      {folder + u"locked.zip", Code::cannot_open},
  };
  for (const auto& row : rows) EXPECT_EQ(test_file(row.archive), row.code) << to_utf8(row.archive);
}

TEST_F(UnpackingTest, NothingIsLeftOfADamagedFile) {
  std::string bytes = make_archive({{"first"}, {"second", std::string(1000, 'x')}, {"third"}});
  bytes[bytes.find("xxx")] = 'y';
  write_file(folder, u"a.zip", bytes);
  EXPECT_EQ(unpack_files(folder + u"a.zip", folder + u"out"), Code::bad_structure);
  EXPECT_EQ(out(), (Tree{{u"first", "content"}}));
  EXPECT_EQ(test_file(folder + u"a.zip"), Code::bad_test);
}

TEST_F(UnpackingTest, EncryptedDirectoriesAreRefused) {
  std::string bytes = make_archive({{"a"}});
  const std::size_t directory = bytes.find("PK\1\2");
  for (std::size_t i = 0; i < central_header_size; ++i) {
    bytes[directory + i] = static_cast<char>(bytes[directory + i] ^ 0x5A);
  }
  EXPECT_EQ(test_bytes(bytes), Code::bad_structure);
}

/// One archive of each kind, in memory.
std::vector<std::string> kinds_of_archives(const Text& folder) {
  write_file(folder, u"data\\a.txt", some_text(600));
  write_file(folder, u"data\\b.txt", "b");
  std::vector<std::string> kinds = {make_archive({{"a", "stored"}, {"b", "too"}})};
  for (const PackingOptions& options :
       {PackingOptions{}, PackingOptions{.password = u"p"}, PackingOptions{.aes = true, .password = u"p"}}) {
    EXPECT_EQ(pack_files(folder + u"kind.zip", folder + u"data", options), Code::ok);
    kinds.push_back(read_tree(folder).at(u"kind.zip"));
    talutil::testing::real_files()->delete_files(folder + u"kind.zip");
  }
  return kinds;
}

TEST_F(UnpackingTest, TruncatedArchivesAreRefused) {
  for (const std::string& whole : kinds_of_archives(folder)) {
    for (std::size_t length = 0; length < whole.size(); length += 64) {
      const Code code = test_bytes(whole.substr(0, length));
      EXPECT_EQ(code, length == 0 ? Code::bad_structure : Code::unexpected_end) << length;
    }
  }
}

TEST_F(UnpackingTest, FlippedBitsAreFoundOrHarmless) {
  const auto kinds = kinds_of_archives(folder);
  for (std::size_t kind = 0; kind < 2; ++kind) {
    const std::string& whole = kinds[kind];
    ASSERT_EQ(test_bytes(whole), Code::ok);
    int found = 0;
    const std::size_t content = whole.find("stored");
    for (std::size_t bit = 0; bit < whole.size() * 8; ++bit) {
      std::string damaged = whole;
      damaged[bit / 8] = static_cast<char>(damaged[bit / 8] ^ (1 << (bit % 8)));
      // Whatever it does, it ends with a code; a time or an attribute that changed is no fault of the data.
      const Code code = test_bytes(damaged);
      if (code != Code::ok) ++found;
      const bool is_content = kind == 0 && bit / 8 >= content && bit / 8 < content + 6;
      EXPECT_TRUE(!is_content || code == Code::bad_test) << bit;
    }
    EXPECT_GT(found, static_cast<int>(whole.size() * 8 / 3)) << kind;
  }
}

TEST(SplitSets, AreReadInEveryForm) {
  const Text folder = scratch_folder();
  std::string noise;
  for (std::uint32_t value = 1; noise.size() < 300'000;) append_number(noise, value = value * 1664525U + 1013904223U);
  write_file(folder, u"noise.bin", noise);
  ASSERT_EQ(pack_files(folder + u"set.zip", folder + u"noise.bin", {.volume_size = smallest_volume}), Code::ok);
  ASSERT_EQ(pack_files(folder + u"one.zip", folder + u"noise.bin", {.volume_size = 10'000'000}), Code::ok);
  Tree files = read_tree(folder);
  EXPECT_EQ(files.count(u"set.z04"), 1U);
  EXPECT_EQ(files.at(u"set.z01").size(), smallest_volume);
  EXPECT_EQ(files.count(u"one.z01"), 0U) << "one volume is a plain archive";
  const std::string& plain = files.at(u"one.zip");
  for (int piece = 0; piece < 4; ++piece) {
    write_file(folder, u"cut.zip.00" + Text(1, static_cast<char16_t>(u'1' + piece)),
               plain.substr(static_cast<std::size_t>(piece) * 80'000, piece == 3 ? std::string::npos : 80'000));
  }
  for (const TextView name : {u"set.zip", u"one.zip", u"cut.zip.001"}) {
    const Text target = scratch_folder();
    EXPECT_EQ(unpack_files(folder + Text(name), target), Code::ok) << to_utf8(name);
    EXPECT_EQ(read_tree(target), (Tree{{u"noise.bin", noise}})) << to_utf8(name);
  }
}

}  // namespace
}  // namespace talutil::archives
