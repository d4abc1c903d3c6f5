#include "platform/posix/posix_files.hpp"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>

#include <filesystem>
#include <fstream>

#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

struct PosixFilesTest : ::testing::Test {
  Text folder = scratch_folder();
  posix::PosixFiles files;
  std::string native = files.native(folder);
};

TEST_F(PosixFilesTest, WhereWindowsPathsLie) {
  std::ofstream(native + "/Readme.TXT") << "x";
  std::filesystem::create_directory(native + "/Sub");
  const Text native_text = from_utf8(native);
  const Rows<Text, std::string> rows = {
      {"case of folder and file", folder + u"SUB\\..\\README.txt", "/Readme.TXT"},
      {"slashes, doubled ones", folder + u"sub//\\new.txt", "/Sub/new.txt"},
      {"trailing dots and blanks", folder + u"sub. \\new. .", "/Sub/new"},
      {"native path", native_text + u"/Readme.TXT", "/Readme.TXT"},
      {"native path in another case", native_text + u"/readme.txt", "/Readme.TXT"},
      {"drive of everything", u"z:" + native_text + u"\\sub", "/Sub"},
  };
  check_rows(rows, [&](const Text& path, const std::string& below) { EXPECT_EQ(files.native(path), native + below); });
  EXPECT_EQ(files.native(u"T:\\..\\..\\etc"), native.substr(0, native.find_last_of('/')) + "/etc");
  EXPECT_EQ(error_of([&] { (void)files.native(u"\\\\server\\share\\a"); }), 76);
}

TEST_F(PosixFilesTest, TheCurrentFolderOnADrive) {
  const std::filesystem::path before = std::filesystem::current_path();
  std::filesystem::current_path(native);
  EXPECT_EQ(files.current_folder(u"") + u"\\", folder);
  EXPECT_EQ(files.current_folder(u"z"), u"Z:\\");
  EXPECT_EQ(files.native(u"t:a"), native + "/a");
  EXPECT_EQ(files.native(u"\\a"), native.substr(0, native.find_last_of('/')) + "/a");
  std::filesystem::current_path(before);
  EXPECT_EQ(files.native(u"t:a"), native.substr(0, native.find_last_of('/')) + "/a");
}

TEST_F(PosixFilesTest, LinksAndDevices) {
  write_bytes(folder + u"real.txt", "old");
  std::filesystem::create_symlink("real.txt", native + "/link.txt");
  std::filesystem::create_symlink("loop", native + "/loop");
  mkfifo((native + "/pipe").c_str(), 0600);
  write_bytes(folder + u"link.txt", "new");
  EXPECT_TRUE(std::filesystem::is_symlink(native + "/link.txt"));
  EXPECT_EQ(read_bytes(folder + u"real.txt"), "new");
  EXPECT_EQ(error_of([&] { (void)files.open_input(folder + u"loop"); }), 75);
  EXPECT_EQ(error_of([&] { (void)files.open_input(folder + u"pipe"); }), 52);
  EXPECT_EQ(error_of([&] { write_bytes(u"/dev/null", "x"); }), 52);
  EXPECT_EQ(error_of([&] { write_bytes(folder + u"loop\\a", "x"); }), 75);
  std::vector<Text> names;
  files.search(folder + u"*.*", 0, [&](TextView name) { return names.emplace_back(name), true; });
  EXPECT_EQ(names.size(), 2U);
  // A link is deleted, not what it leads to.
  files.delete_files(folder + u"link.*");
  EXPECT_EQ(read_bytes(folder + u"real.txt"), "new");
}

TEST_F(PosixFilesTest, StoredAttributes) {
  write_bytes(folder + u"a.txt", "");
  if (setxattr((native + "/a.txt").c_str(), "user.DOSATTRIB", "0x6", 3, 0) != 0) {
    GTEST_SKIP() << "the temporary folder's file system stores no attributes";
  }
  EXPECT_EQ(files.attributes(folder + u"a.txt"), file_attribute::hidden | file_attribute::system);
}

TEST_F(PosixFilesTest, ProgressIsTold) {
  write_bytes(folder + u"a.txt", "abc");
  std::vector<std::uint64_t> told;
  files.set_progress([&](std::uint64_t done, std::uint64_t total) { told.insert(told.end(), {done, total}); });
  std::array<char, 2> buffer{};
  const auto file = files.open_input(folder + u"a.txt");
  while (file->read(buffer) != 0) continue;
  EXPECT_EQ(told, (std::vector<std::uint64_t>{2, 3, 3, 3, 3, 3}));
}

}  // namespace
}  // namespace talutil::testing
