// Archives that are packed and unpacked by several threads, as the command does.
#include "platform/posix/thread_tasks.hpp"
#include "tests/archives/tree.hpp"

namespace talutil::archives {
namespace {

using namespace testing;

/// Files of all sizes, among them some that cannot be compressed and two that are not held in memory together.
Tree many_files() {
  Tree files;
  for (unsigned i = 0; i < 90; ++i) {
    const Text name = u"data\\" + from_utf8(std::to_string(i % 7)) + u"\\f" + from_utf8(std::to_string(i));
    files[name] = i % 10 == 9 ? std::string(1, static_cast<char>(i)) : some_text(i * i * 37 % 50'000, i);
  }
  files[u"data\\big1"] = files[u"data\\big2"] = some_text(16U << 20U);
  return files;
}

struct ThreadArchivesTest : ArchiveTest {
  [[nodiscard]] std::string packed(Tasks* tasks) {
    EXPECT_EQ(pack_files(archive, folder + u"data", {.tasks = tasks}), Code::ok);
    std::string bytes = read_tree(folder).at(u"a.zip");
    real_files()->delete_files(archive);
    return bytes;
  }
};

TEST_F(ThreadArchivesTest, AnArchiveDoesNotDependOnTheThreads) {
  const Tree files = many_files();
  write_tree(folder, files);
  const std::string serial = packed(nullptr);
  for (const std::size_t count : {1U, 3U, 8U}) {
    posix::ThreadTasks tasks(count);
    ASSERT_TRUE(packed(&tasks) == serial) << count;
    ASSERT_EQ(pack_files(archive, folder + u"data", {.tasks = &tasks}), Code::ok);
    const Text target = scratch_folder();
    ASSERT_EQ(unpack_files(archive, target, {.tasks = &tasks}), Code::ok);
    Tree unpacked = read_tree(target);
    std::erase_if(unpacked, [](const auto& file) { return file.first.ends_with(u'\\'); });
    EXPECT_TRUE(unpacked == files) << count;
    real_files()->delete_files(archive);
  }
}

TEST_F(ThreadArchivesTest, AFileThatFailsStopsThePacking) {
  write_tree(folder, many_files());
  const Tree before = read_tree(folder);
  posix::ThreadTasks tasks(3);
  int calls = 0;
  // Some files have been read by then, but not the one that vanishes.
  Progress vanishing([&](std::uint64_t, std::uint64_t, TextView) {
    if (++calls == 5) real_files()->delete_files(folder + u"data\\6\\*.*");
    return true;
  });
  EXPECT_EQ(pack_files(archive, folder + u"data", {.tasks = &tasks}, vanishing), Code::cannot_read);
  calls = 0;
  Progress cancelling([&](std::uint64_t, std::uint64_t, TextView) { return ++calls < 40; });
  EXPECT_EQ(pack_files(archive, folder + u"data", {.tasks = &tasks}, cancelling), Code::cancelled);
  for (const auto& [path, content] : read_tree(folder)) EXPECT_TRUE(before.contains(path)) << to_utf8(path);
}

TEST_F(ThreadArchivesTest, UnpacksAsOneThreadDoes) {
  Tree files;
  for (unsigned i = 0; i < 60; ++i) files[u"f" + from_utf8(std::to_string(100 + i))] = some_text(3000, i + 1);
  write_tree(folder, files);
  ASSERT_EQ(pack_files(archive, folder + u"f*"), Code::ok);
  // Two have become damaged, one is there twice, one has a name that leads out.
  std::string bytes = read_tree(folder).at(u"a.zip");
  const auto rename = [&](const std::string& from, const std::string& to) {
    for (std::size_t at = 0; (at = bytes.find(from, at)) != std::string::npos;) bytes.replace(at, to.size(), to);
  };
  for (const char* const damaged : {"f105", "f140"}) {
    const std::size_t at = bytes.find(damaged);
    bytes[at + 600] = static_cast<char>(bytes[at + 600] ^ 0x55);
  }
  rename("f121", "f120");
  rename("f133", "../x");
  write_file(folder, u"a.zip", bytes);
  const auto unpack = [&](Tasks* tasks, int most_calls) {
    const Text target = scratch_folder();
    Text notices;
    int calls = 0;
    const auto notice = [&](const Text& entry, Fate, std::string_view reason) {
      notices += entry + u": " + from_utf8(reason) + u"\n";
    };
    Progress progress([&](std::uint64_t, std::uint64_t, TextView) { return ++calls <= most_calls; });
    const Code code = unpack_files(archive, target, {.notice = notice, .tasks = tasks}, {}, progress);
    return std::tuple(code, read_tree(target), notices);
  };
  for (const int most_calls : {1000, 47, 3, 0}) {
    const auto serial = unpack(nullptr, most_calls);
    const auto& [code, unpacked, notices] = serial;
    EXPECT_EQ(code, most_calls == 1000 ? Code::bad_structure : Code::cancelled);
    EXPECT_EQ(unpacked.size(), most_calls == 1000 ? 56U : unpacked.size());
    posix::ThreadTasks tasks(3);
    EXPECT_TRUE(unpack(&tasks, most_calls) == serial) << most_calls;
  }
}

}  // namespace
}  // namespace talutil::archives
