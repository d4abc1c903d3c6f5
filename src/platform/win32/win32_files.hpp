#pragma once

#include "platform/files.hpp"

namespace talutil::win32 {

class Win32Files final : public Files {
 public:
  void search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) override;
  std::uint32_t attributes(const Text& path) override;
  /// As MakeSureDirectoryPathExists does, but with every character of the path.
  bool make_path(const Text& path) override;
  Text current_folder(TextView drive) override;
  /// Calls DeleteFile of "Scripting.FileSystemObject". Raises that object's errors, and 429 if it cannot be created.
  void delete_files(const Text& pattern) override;
  std::unique_ptr<InputFile> open_input(const Text& path) override;
  std::unique_ptr<OutputFile> open_output(const Text& path) override;
  void append(const Text& path, std::string_view bytes) override;
};

}  // namespace talutil::win32
