#include <gtest/gtest.h>

#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "platform/win32/win32_files.hpp"
#include "platform/win32/win32_folders.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/faults/machine.hpp"
#include "tests/faults/win32/scripted_calls.hpp"

// What Windows documents and Wine does not do, by the order of the calls. That nothing is lost whichever of them fails,
// once or always, is shown by Faults.

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

TEST_F(Replacing, FlushesFirstAndWaitsForWhatIsInUse) {
  const std::vector<DWORD> in_use(20, ERROR_SHARING_VIOLATION);
  // MOVEFILE_REPLACE_EXISTING and _WRITE_THROUGH make 9.
  const std::string flushed = "FlushFileBuffers MoveFileExW(9)";
  std::string refused = flushed + "!";
  for (int i = 1; i < 20; ++i) refused += " Sleep(50) MoveFileExW(9)!";
  const struct {
    const char* name;
    std::vector<DWORD> codes;
    std::string log;
    std::string result;
  } rows[] = {
      {"flushed, then replaced in one step", {}, flushed, "new"},
      {"a scanner has it open for a moment",
       {ERROR_SHARING_VIOLATION, ERROR_ACCESS_DENIED},
       flushed + "! Sleep(50) MoveFileExW(9)! Sleep(50) MoveFileExW(9)",
       "new"},
      {"in place at last", in_use, refused + " FlushFileBuffers", "new"},
      {"another reason is not waited for", {ERROR_IO_DEVICE}, flushed + "!", "old"},
  };
  for (const auto& [name, codes, log, result] : rows) {
    SCOPED_TRACE(name);
    save(path(u"target.txt"), "old");
    const ScriptedCalls script({{"MoveFileExW", codes}});
    EXPECT_EQ(error_of([&] { save(path(u"target.txt"), "new"); }) == 0, result == "new");
    EXPECT_EQ(script.log(), log);
    EXPECT_EQ(read_tree(root), (Contents{{"/target.txt", result}}));
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
  std::string refused = "70";
  for (int i = 1; i < 20; ++i) refused += " Sleep(50)";
  EXPECT_EQ(result(std::vector<DWORD>(20, ERROR_SHARING_VIOLATION)), refused);
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
