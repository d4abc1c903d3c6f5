#pragma once

#include <sys/stat.h>

#include "platform/files.hpp"
#include "platform/posix/drive_paths.hpp"

namespace talutil::posix {

/// The attributes that follow from the name and status of a file: hidden, folder, read-only.
[[nodiscard]] std::uint32_t attributes_by_status(std::string_view name, const struct stat& status);

/// Files and folders, mapped by DrivePaths. Names with a leading dot are hidden, as are files whose stored attribute
/// says so (the extended attribute user.DOSATTRIB, "0x2"); files that nobody may write are read-only.
class PosixFiles final : public Files {
 public:
  /// Called while a file is being read, with the bytes read so far and the total.
  using Progress = std::function<void(std::uint64_t done, std::uint64_t total)>;
  void set_progress(Progress progress) { progress_ = std::move(progress); }

  /// Lets output go to pipes, devices and the process's own streams as it comes; see open_stream. Members of the
  /// library refuse them, as they refuse the platform's devices.
  void allow_streams() noexcept { allows_streams_ = true; }

  [[nodiscard]] std::string native(const Text& path) const { return paths_.native(path); }

  void search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) override;
  std::uint32_t attributes(const Text& path) override;
  bool make_path(const Text& path) override;
  Text current_folder(TextView drive) override;
  void delete_files(const Text& pattern) override;
  std::unique_ptr<InputFile> open_input(const Text& path) override;
  std::unique_ptr<OutputFile> open_output(const Text& path) override;
  void append(const Text& path, std::string_view bytes) override;

 private:
  DrivePaths paths_;
  Progress progress_;
  bool allows_streams_ = false;
};

}  // namespace talutil::posix
