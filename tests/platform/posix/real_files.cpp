#include "tests/platform/real_files.hpp"

#include <fcntl.h>
#include <stdlib.h>
#include <sys/file.h>
#include <sys/stat.h>

#include <filesystem>

#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/posix/posix_folders.hpp"

namespace talutil::testing {

namespace {

/// Drive T: is a temporary folder, removed when the program ends.
struct TemporaryDrives {
  std::string root = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "talutil-drives-XXXXXX").string();
    return std::string(mkdtemp(pattern.data()));
  }();
  TemporaryDrives() {
    std::filesystem::create_directory(root + "/t");
    setenv("TALUTIL_DRIVES", root.c_str(), 1);
  }
  TemporaryDrives(const TemporaryDrives&) = delete;
  TemporaryDrives& operator=(const TemporaryDrives&) = delete;
  ~TemporaryDrives() { std::filesystem::remove_all(root); }
};

}  // namespace

std::unique_ptr<Files> real_files() {
  static const TemporaryDrives drives;
  return std::make_unique<posix::PosixFiles>();
}

std::unique_ptr<Folders> real_folders() {
  static_cast<void>(real_files());  // Makes the drives.
  return std::make_unique<posix::PosixFolders>();
}

Text scratch_folder() {
  static int count = 0;
  Text folder = u"T:\\scratch" + from_utf8(std::to_string(++count)) + u"\\";
  real_files()->make_path(folder);
  return folder;
}

Text make_hidden_file(const Text& folder) {
  real_files()->append(folder + u".hidden.txt", "");
  return folder + u".hidden.txt";
}

void set_read_only(const Text& path, bool read_only) {
  chmod(posix::DrivePaths().native(path).c_str(), read_only ? 0444 : 0644);
}

std::shared_ptr<void> lock_file(const Text& path) {
  auto file = std::make_shared<posix::Descriptor>(posix::open_file(posix::DrivePaths().native(path), O_RDONLY));
  posix::lock(*file, LOCK_EX);
  return file;
}

}  // namespace talutil::testing
