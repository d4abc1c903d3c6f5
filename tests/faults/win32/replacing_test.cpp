#include <gtest/gtest.h>

#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "platform/win32/win32_files.hpp"
#include "platform/win32/win32_folders.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/faults/machine.hpp"
#include "tests/faults/win32/scripted_calls.hpp"

// What Windows documents and Wine does not do, by the order of the calls.

namespace talutil::testing {
namespace {

struct Replacing : ::testing::Test {
  std::filesystem::path root = make_root();
  ~Replacing() override { std::filesystem::remove_all(root); }

  [[nodiscard]] Text path(TextView name) const { return root.u16string() + u"\\" + Text(name); }
  static void save(const Text& path, std::string_view bytes) {
    const auto file = win32::Win32Files().open_output(path);
    file->write(bytes);
    file->close();
  }
};

TEST_F(Replacing, TriesEveryWayUntilOneIsAllowed) {
  using Codes = ScriptedCalls::Codes;
  const std::vector<DWORD> in_use(20, ERROR_SHARING_VIOLATION);
  // MOVEFILE_REPLACE_EXISTING and _WRITE_THROUGH make 9.
  const std::string flushed = "FlushFileBuffers MoveFileExW(9)";
  std::string refused = "FlushFileBuffers MoveFileExW(9)!";
  for (int i = 1; i < 20; ++i) refused += " Sleep(50) MoveFileExW(9)!";
  const struct {
    const char* name;
    Codes codes;
    std::string log;
    std::string result;
  } rows[] = {
      {"flushed, then replaced in one step", {}, flushed, "new"},
      {"a scanner has it open for a moment",
       {{"MoveFileExW", {ERROR_SHARING_VIOLATION, ERROR_ACCESS_DENIED}}},
       flushed + "! Sleep(50) MoveFileExW(9)! Sleep(50) MoveFileExW(9)",
       "new"},
      {"in place at last", {{"MoveFileExW", in_use}}, refused + " FlushFileBuffers", "new"},
      {"and that fails", {{"MoveFileExW", in_use}, {"SetEndOfFile", {ERROR_DISK_FULL}}}, refused, "kept"},
      {"another reason is not waited for", {{"MoveFileExW", {ERROR_IO_DEVICE}}}, flushed + "!", "old"},
      {"no flush, no replacement", {{"FlushFileBuffers", {ERROR_DISK_FULL}}}, "FlushFileBuffers!", "old"},
  };
  for (const auto& [name, codes, log, result] : rows) {
    SCOPED_TRACE(name);
    const Text target = path(u"target.txt");
    save(target, "old");
    std::string message;
    {
      const ScriptedCalls script(codes);
      try {
        save(target, "new");
      } catch (const RunTimeError& error) {
        message = to_utf8(error.description());
      }
      EXPECT_EQ(script.log(), log);
    }
    const Contents found = read_tree(root);
    EXPECT_EQ(message.empty(), result == "new");
    if (result == "kept") {
      ASSERT_EQ(found.size(), 2);
      EXPECT_EQ(found.begin()->second, "new") << "beside the old file, which may be half written";
      EXPECT_TRUE(message.ends_with(found.begin()->first.substr(1))) << message;
    } else {
      EXPECT_EQ(found, (Contents{{"/target.txt", result}}));
    }
    write_tree(root, {});
  }
}

TEST_F(Replacing, OpensFilesThatOthersHoldForAMoment) {
  save(path(u"a.txt"), "old");
  const auto result = [&](std::vector<DWORD> codes) {
    const ScriptedCalls script({{"CreateFileW", std::move(codes)}});
    const std::int32_t error = error_of([&] { save(path(u"a.txt"), "new"); });
    return std::to_string(error) + " " + script.log();
  };
  EXPECT_EQ(result({ERROR_SHARING_VIOLATION}), "0 Sleep(50) FlushFileBuffers MoveFileExW(9)");
  EXPECT_EQ(result(std::vector<DWORD>(20, ERROR_SHARING_VIOLATION)), "70 Sleep(50)x19");
  EXPECT_EQ(result({ERROR_ACCESS_DENIED}), "75 ") << "a right is not waited for";
}

// Paths in the extended form have no limit of length, and nothing is written to a drive's root first.
TEST_F(Replacing, MakesTemporaryFilesBesideTheirTarget) {
  const ScriptedCalls script;
  save(path(u"a.txt"), "text");
  ASSERT_EQ(script.created.size(), 1);
  EXPECT_TRUE(script.created[0].starts_with(L"\\\\?\\" + root.wstring() + L"\\.talutil-"));
}

// A cloud's folders are reparse points as links are, but with a tag that stands for no other name.
TEST_F(Replacing, PacksTheFoldersOfClouds) {
  for (const char* folder : {"cloud", "link", "junction"}) {
    std::filesystem::create_directories(root / "data" / folder);
    save(path(u"data\\" + from_utf8(folder) + u"\\file"), folder);
  }
  ScriptedCalls script;
  script.tags = {{L"cloud", 0x9000101A}, {L"link", 0xA000000C}, {L"junction", 0xA0000003}};
  win32::Win32Folders folders;
  win32::Win32Files files;
  archives::Progress progress;
  archives::pack(path(u"a.zip"), path(u"data\\*"), {}, folders, progress);
  archives::Archive(path(u"a.zip"), folders).extract(path(u"out\\"), {}, folders, files, {}, progress);
  const Contents found = read_tree(root / "out");
  EXPECT_EQ(found, (Contents{{"/cloud/", ""}, {"/cloud/file", "cloud"}}));
}

}  // namespace
}  // namespace talutil::testing
