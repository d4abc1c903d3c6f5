#include <zlib.h>

#include "archives/directory.hpp"
#include "archives/little_endian.hpp"
#include "tests/archives/memory_file.hpp"
#include "tests/archives/tree.hpp"

namespace talutil::archives {
namespace {

using namespace testing;

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
  const auto add = [](std::string& to, auto... numbers) { (append_number(to, numbers), ...); };
  const auto two = [](std::size_t number) { return static_cast<std::uint16_t>(number); };
  const auto four = [](std::size_t number) { return static_cast<std::uint32_t>(number); };
  std::uint32_t offset = 0;
  for (const Made& entry : entries) {
    const std::size_t size = entry.content.size();
    if (!entry.has_next_offset) offset = four(bytes.size());
    std::string common;
    add(common, two(20), two(0x800), two(0), two(0), two(0x21));
    add(common, four(crc32(0, reinterpret_cast<const Bytef*>(entry.content.data()), static_cast<uInt>(size))));
    add(common, four(size), entry.size != 0xFFFF'FFFF ? entry.size : four(size), two(entry.name.size()), two(0));
    add(bytes, local_signature);
    bytes += common + entry.name + entry.content;
    add(directory, central_signature, two(entry.posix_mode != 0 ? 0x314 : 20));
    directory += common;
    add(directory, two(0), two(0), two(0), entry.posix_mode << 16U, offset);
    directory += entry.name;
  }
  const std::uint32_t start = four(bytes.size());
  bytes += directory;
  add(bytes, end_signature, four(0), two(entries.size()), two(entries.size()), four(directory.size()), start, two(0));
  return bytes;
}

Code test_bytes(std::string bytes) {
  Progress progress;
  return code_of([&] { Archive(std::make_unique<MemoryFile>(std::move(bytes))).test({}, {}, progress); });
}

struct UnpackingTest : ArchiveTest {
  Code unpack(const std::vector<Made>& entries, const UnpackingOptions& options = {}) {
    write_file(folder, u"a.zip", make_archive(entries));
    return unpack_files(archive, folder + u"out", options);
  }
  Tree out() { return read_tree(folder + u"out"); }
};

TEST_F(UnpackingTest, PassesOverWhatIsNotSafe) {
  constexpr std::uint32_t link = 0120777;
  std::string deep;
  for (int level = 0; level < 1000; ++level) deep += "d/";
  // Where names differ only in case, both are there if the system tells them apart.
  const bool is_one_name = real_folders()->ignores_case();
  const Code of_twins = is_one_name ? Code::incomplete : Code::ok;
  const Rows<std::vector<Made>, Code, Text> rows = {
      {"climbs out", {{"../../evil"}, {"a/../../evil"}, {"good"}}, Code::incomplete, u"good"},
      {"absolute", {{"/etc/evil"}, {"C:\\evil"}}, Code::ok, u"etc\\|etc\\evil|evil"},
      {"a link, and a way through it", {{"l", "/etc", link}, {"l/x"}}, Code::incomplete, u"l\\|l\\x"},
      {"a NUL in a name", {{std::string("a\0.txt", 6)}, {"b"}}, Code::incomplete, u"b"},
      {"a name of 65,535 bytes", {{std::string(65535, 'n')}, {"b"}}, Code::incomplete, u"b"},
      {"names that differ by case", {{"a"}, {"A"}}, of_twins, is_one_name ? u"a" : u"A|a"},
      {"the same name twice", {{"a", "first"}, {"a"}}, Code::ok, u"a"},
      {"a file where a folder is", {{"f/g"}, {"f"}}, Code::incomplete, u"f\\|f\\g"},
      {"the folder itself", {{"./", ""}, {"./a"}}, Code::ok, u"a"},
      {"no folder that deep", {{deep + "f"}, {"b"}}, Code::incomplete, u"b"},
      {"a folder where a file is", {{"f"}, {"f/g"}}, Code::incomplete, u"f"},
      {"a device", {{"x/aux.txt"}}, Code::ok, u"x\\|x\\_aux.txt"},
      {"folders in another case",
       {{"Data/a"}, {"DATA/b"}},
       Code::ok,
       is_one_name ? u"Data\\|Data\\a|Data\\b" : u"DATA\\|DATA\\b|Data\\|Data\\a"},
      {"nothing in it", {}, Code::ok, u""},
      {"entries on the same bytes", {{"a"}, {"b", "content", 0, 0xFFFF'FFFF, true}}, Code::bad_structure, u""},
      {"longer than it is", {{"a", "content", 0, 8}}, Code::bad_structure, u""},
      {"shorter than it is", {{"a", "content", 0, 6}}, Code::bad_structure, u""},
  };
  check_rows(rows, [&](const std::vector<Made>& entries, Code code, const Text& written) {
    folder = scratch_folder();
    archive = folder + u"a.zip";
    write_file(folder, u"out\\", "");
    EXPECT_EQ(unpack(entries), code);
    EXPECT_EQ(paths_of(out()), written);
    // Of two entries of one name the last one counts.
    for (const auto& [path, content] : out()) EXPECT_EQ(content, path.ends_with(u'\\') ? "" : "content");
  });
}

// Up to a gibibyte whatever the archive's own size; beyond it only as many times that size as is allowed.
TEST_F(UnpackingTest, UnpacksNoMoreThanIsAllowed) {
  constexpr std::uint32_t gibibyte = 1U << 30U;
  constexpr std::uint32_t ratio = 11'000'000;
  const auto size = static_cast<std::uint32_t>(make_archive({{"a"}}).size());
  const auto claim = [&](std::uint32_t total, std::uint32_t largest_ratio) {
    return unpack({{"a", "content", 0, total}}, {.largest_ratio = largest_ratio});
  };
  // What may be unpacked is not as long as it says.
  EXPECT_EQ(claim(gibibyte, 1), Code::bad_structure);
  EXPECT_EQ(claim(gibibyte + 1, 200), Code::incomplete);
  EXPECT_EQ(claim((size + 1) * ratio - 1, ratio), Code::bad_structure);
  EXPECT_EQ(claim((size + 1) * ratio, ratio), Code::incomplete);
  EXPECT_TRUE(out().empty());
  EXPECT_EQ(unpack({{"a"}, {"b"}}, {.largest_total = 13}), Code::incomplete);
  EXPECT_EQ(unpack({{"a"}, {"b"}}, {.items = u"*.none"}), Code::nothing_to_do);
  EXPECT_TRUE(out().empty());
  EXPECT_EQ(unpack({{"a"}, {"b"}}, {.largest_total = 14}), Code::ok);
}

TEST_F(UnpackingTest, KeepsOrReplacesFiles) {
  // The name on disk is kept where the system ignores case.
  const std::string name = real_folders()->ignores_case() ? "a.txt" : "A.txt";
  write_file(folder, u"out\\A.txt", "old");
  EXPECT_EQ(unpack({{name, "new"}, {"b.txt"}}), Code::ok);
  EXPECT_EQ(out(), (Tree{{u"A.txt", "old"}, {u"b.txt", "content"}}));
  EXPECT_EQ(unpack({{name, "new"}, {"x/b.txt", "flat"}}, {.overwrite = true, .keep_folders = false}), Code::ok);
  EXPECT_EQ(out(), (Tree{{u"A.txt", "new"}, {u"b.txt", "flat"}}));
}

TEST_F(UnpackingTest, AsksForPasswords) {
  write_file(folder, u"secret.txt", some_text(1000));
  const Rows<Text, std::vector<Text>, Code> rows = {
      // "-" is a box that is cancelled
      {"known", u"right", {}, Code::ok},
      {"typed", u"", {u"right"}, Code::ok},
      {"typed at the third time", u"wrong", {u"bad", u"worse", u"right"}, Code::ok},
      {"wrong three times", u"wrong", {u"bad", u"worse", u"worst"}, Code::bad_parameters},
      {"cancelled", u"", {u"-"}, Code::cancelled},
      {"cancelled at last", u"wrong", {u"bad", u"-"}, Code::cancelled},
  };
  for (const bool aes : {false, true}) {
    const Text locked = folder + (aes ? u"aes.zip" : u"old.zip");
    ASSERT_EQ(pack_files(locked, folder + u"secret.txt", {.aes = aes, .password = u"right"}), Code::ok);
    check_rows(rows, [&](const Text& given, const std::vector<Text>& typed, Code code) {
      const Text target = scratch_folder();
      std::size_t asked = 0;
      const PasswordQuestion ask = [&](const Text& entry, bool was_wrong) -> std::optional<Text> {
        EXPECT_EQ(entry, u"secret.txt");
        EXPECT_EQ(was_wrong, asked > 0 || !given.empty());
        const Text& answer = typed.at(asked++);
        return answer == u"-" ? std::nullopt : std::optional(answer);
      };
      EXPECT_EQ(unpack_files(locked, target, {.password = given}, ask), code);
      EXPECT_EQ(asked, typed.size());
      EXPECT_EQ(read_tree(target), code == Code::ok ? (Tree{{u"secret.txt", some_text(1000)}}) : Tree{});
    });
    EXPECT_EQ(unpack_files(locked, scratch_folder(), {.password = u"wrong"}), Code::bad_parameters) << "nobody to ask";
  }
}

TEST_F(UnpackingTest, NothingIsLeftOfADamagedFile) {
  std::string bytes = make_archive({{"first"}, {"second", std::string(1000, 'x')}, {"third"}});
  bytes[bytes.find("xxx")] = 'y';
  write_file(folder, u"a.zip", bytes);
  EXPECT_EQ(unpack_files(archive, folder + u"out"), Code::bad_structure);
  EXPECT_EQ(out(), (Tree{{u"first", "content"}, {u"third", "content"}})) << "the others are restored";
  EXPECT_EQ(test_file(archive), Code::bad_test);
  // The directory contradicts what stands before an entry.
  bytes = make_archive({{"name"}, {"b"}});
  bytes[bytes.rfind("name")] = 'N';
  EXPECT_EQ(test_bytes(bytes), Code::bad_test);
}

TEST_F(UnpackingTest, ReadsWhatStandsAmongOtherBytes) {
  const std::string bytes = make_archive({{"a"}, {"b"}});
  for (const std::size_t behind : {0, 1, 2000, 65'000}) {
    for (const std::size_t before : {0, 1, 3000}) {
      write_file(folder, u"a.zip", std::string(before, 'x') + bytes + std::string(behind, '\0'));
      const Text target = scratch_folder();
      EXPECT_EQ(unpack_files(archive, target), Code::ok) << before << ' ' << behind;
      EXPECT_EQ(read_tree(target), (Tree{{u"a", "content"}, {u"b", "content"}}));
      EXPECT_EQ(test_file(archive), Code::ok);
    }
  }
  // Adding to it would lose what stands before.
  write_file(folder, u"a.zip", "program" + bytes);
  write_file(folder, u"c", "new");
  EXPECT_EQ(pack_files(archive, folder + u"c"), Code::bad_parameters);
}

TEST_F(UnpackingTest, TruncatedArchivesAreRefusedAndFlippedBitsFoundOrHarmless) {
  write_tree(folder, {{u"data\\a.txt", some_text(600)}, {u"data\\b.txt", "b"}});
  std::vector<std::string> kinds = {make_archive({{"a", "stored"}, {"b", "too"}})};
  for (const PackingOptions& options :
       {PackingOptions{}, PackingOptions{.password = u"p"}, PackingOptions{.aes = true, .password = u"p"}}) {
    EXPECT_EQ(pack_files(archive, folder + u"data", options), Code::ok);
    kinds.push_back(read_tree(folder).at(u"a.zip"));
    real_files()->delete_files(archive);
  }
  for (const std::string& whole : kinds) {
    for (std::size_t length = 0; length < whole.size(); length += length + 64 < whole.size() ? 64 : 1) {
      const Code code = test_bytes(whole.substr(0, length));
      EXPECT_EQ(code, length == 0 ? Code::bad_structure : Code::unexpected_end) << length;
    }
  }
  for (std::size_t kind = 0; kind < 2; ++kind) {
    const std::string& whole = kinds[kind];
    ASSERT_EQ(test_bytes(whole), Code::ok);
    std::size_t found = 0;
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
    EXPECT_GT(found, whole.size() * 8 / 3) << kind;
  }
}

}  // namespace
}  // namespace talutil::archives
