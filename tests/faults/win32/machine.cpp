#include "tests/faults/machine.hpp"

#include "platform/win32/stored_files.hpp"
#include "platform/win32/win32_platform.hpp"

namespace talutil::testing {

namespace {

class Win32Parts final : public RealParts {
 public:
  explicit Win32Parts(const std::filesystem::path& root) : folder_(root.u16string() + u"\\") {}
  [[nodiscard]] Text folder() const override { return folder_; }
  [[nodiscard]] Files& files() override { return files_; }
  [[nodiscard]] Folders& folders() override { return folders_; }
  [[nodiscard]] Profiles& profiles() override { return profiles_; }
  [[nodiscard]] SettingsStore& settings_store() override { return settings_store_; }
  [[nodiscard]] Registry& registry() override { return registry_; }
  [[nodiscard]] CodePage& code_page() override { return code_page_; }

 private:
  Text folder_;
  win32::Win32Files files_;
  win32::Win32Folders folders_;
  win32::Win32Profiles profiles_;
  win32::Win32SettingsStore settings_store_;
  win32::Win32Registry registry_;
  win32::Win32CodePage code_page_;
};

}  // namespace

std::filesystem::path make_root() {
  // Deleting is done by an automation object.
  static const HRESULT apartment = CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  static_cast<void>(apartment);
  static int count = 0;
  const std::filesystem::path root =
      std::filesystem::temp_directory_path() /
      ("talutil-faults-" + std::to_string(GetCurrentProcessId()) + "-" + std::to_string(++count));
  std::filesystem::create_directory(root);
  return root;
}

std::unique_ptr<RealParts> real_parts(const std::filesystem::path& root) { return std::make_unique<Win32Parts>(root); }

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
