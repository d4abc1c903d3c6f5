#include "tests/faults/machine.hpp"

#include "platform/win32/stored_files.hpp"

namespace talutil::testing {

std::filesystem::path make_root() {
  static int count = 0;
  const std::filesystem::path root =
      std::filesystem::temp_directory_path() /
      ("talutil-faults-" + std::to_string(GetCurrentProcessId()) + "-" + std::to_string(++count));
  std::filesystem::create_directory(root);
  return root;
}

std::unique_ptr<NativePlatform> native_platform(const std::filesystem::path& /*root*/) {
  return std::make_unique<NativePlatform>();
}

Text library_path(const std::filesystem::path& root) { return root.u16string() + u"\\"; }

bool has_own_settings() noexcept { return false; }

bool clears_at_once() noexcept { return false; }

std::size_t stride_of_short_form() noexcept { return 5; }

void set_time(const std::filesystem::path& path) {
  const FILETIME time = win32::file_time(1'234'567'890);
  const win32::Owned<win32::kind::File> entry(
      CreateFileW(path.c_str(), FILE_WRITE_ATTRIBUTES, 0, nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr));
  SetFileTime(entry.get(), nullptr, nullptr, &time);
}

Contents contents_of(const std::filesystem::path& root) { return read_tree(root); }

std::size_t open_handles() {
  DWORD count = 0;
  GetProcessHandleCount(GetCurrentProcess(), &count);
  return count;
}

}  // namespace talutil::testing
