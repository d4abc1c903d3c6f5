#include "platform/posix/posix_files.hpp"

#include <dirent.h>
#include <errno.h>
#include <fcntl.h>
#include <limits.h>
#include <stdlib.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <filesystem>

#include "platform/file_names.hpp"
#include "platform/posix/descriptor.hpp"
#include "platform/posix/replacement.hpp"
#include "platform/posix/streams.hpp"

namespace talutil::posix {

namespace {

constexpr mode_t all_write_bits = S_IWUSR | S_IWGRP | S_IWOTH;

/// The attributes that other programs store here for files from Windows.
std::uint32_t stored_attributes(const std::string& path) {
  std::array<char, 32> text{};
  if (lgetxattr(path.c_str(), dos_attributes, text.data(), text.size() - 1) <= 0) return 0;
  return static_cast<std::uint32_t>(strtoul(text.data(), nullptr, 0)) &
         (file_attribute::hidden | file_attribute::system);
}

std::uint32_t attributes_of(const std::string& path, const struct stat& status) {
  const std::string_view name = std::string_view(path).substr(path.find_last_of('/') + 1);
  return stored_attributes(path) | attributes_by_status(name, status);
}

/// Whether a search with the mask finds an entry. Devices, dead links and the like never are.
bool is_searched_for(const std::string& path, std::uint32_t mask) {
  constexpr std::uint32_t passed_over = file_attribute::hidden | file_attribute::system | file_attribute::folder;
  struct stat status {};
  if (stat(path.c_str(), &status) != 0 || !(S_ISREG(status.st_mode) || S_ISDIR(status.st_mode))) return false;
  return (attributes_of(path, status) & passed_over & ~mask) == 0;
}

/// A path split into the folder, as written, and the name or pattern in it.
struct FolderAndName {
  Text folder;
  Text name;
};

FolderAndName split(const Text& path) {
  const TextView name = last_part(path);
  return {path.substr(0, path.size() - name.size()), Text(name)};
}

std::string folder_or_current(const DrivePaths& paths, const Text& folder) {
  return folder.empty() ? "." : paths.native(folder);
}

class PosixInputFile final : public InputFile {
 public:
  PosixInputFile(Descriptor file, const PosixFiles::Progress& progress) : file_(std::move(file)), progress_(progress) {
    struct stat status {};
    if (fstat(file_.get(), &status) != 0) raise_for(errno, {});
    size_ = static_cast<std::uint64_t>(status.st_size);
    lock(file_, LOCK_SH);
    posix_fadvise(file_.get(), 0, 0, POSIX_FADV_SEQUENTIAL);
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }

  std::size_t read(std::span<char> buffer) override {
    ssize_t count = 0;
    do {
      count = ::read(file_.get(), buffer.data(), buffer.size());
    } while (count < 0 && errno == EINTR);
    if (count < 0) raise_for(errno, {});
    done_ += static_cast<std::uint64_t>(count);
    if (progress_) progress_(count == 0 ? size_ : done_, size_);
    return static_cast<std::size_t>(count);
  }

 private:
  Descriptor file_;
  const PosixFiles::Progress& progress_;
  std::uint64_t size_ = 0;
  std::uint64_t done_ = 0;
};

/// The file that a path refers to, through links, whether it exists or not.
std::filesystem::path target_of(std::filesystem::path path) {
  constexpr int most_links = 40;
  std::error_code error;
  for (int links = 0; std::filesystem::is_symlink(path, error); ++links) {
    if (links == most_links) raise(ErrorNumber::path_file_access);
    path = path.parent_path() / std::filesystem::read_symlink(path, error);
  }
  return path;
}

Replacement replacement_of(const std::string& given) {
  const std::filesystem::path path = target_of(given);
  const std::string parent = path.has_parent_path() ? path.parent_path().string() : ".";
  Descriptor folder(open(parent.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC));
  if (folder.get() < 0) raise_for(errno == ENOENT ? ENOTDIR : errno, path);
  return {std::move(folder), path.filename(), O_WRONLY};
}

class PosixOutputFile final : public OutputFile {
 public:
  explicit PosixOutputFile(const std::string& path) : replacement_(replacement_of(path)) { replacement_.keep_rights(); }

  void write(std::string_view bytes) override { write_all(replacement_.file(), bytes); }
  void close() override { replacement_.take_name(); }

 private:
  Replacement replacement_;
};

/// What is no file cannot be replaced, only written to.
class StreamOutput final : public OutputFile {
 public:
  explicit StreamOutput(Descriptor stream) : stream_(std::move(stream)) {}

  void write(std::string_view bytes) override { write_all(stream_, bytes); }
  void close() override {}

 private:
  Descriptor stream_;
};

}  // namespace

std::uint32_t attributes_by_status(std::string_view name, const struct stat& status) {
  std::uint32_t result = 0;
  if (name.starts_with('.') && name != "." && name != "..") result |= file_attribute::hidden;
  if (S_ISDIR(status.st_mode)) return result | file_attribute::folder;
  return (status.st_mode & all_write_bits) == 0 ? result | file_attribute::read_only : result;
}

void PosixFiles::search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) {
  require_pattern(pattern);
  auto [folder, name] = split(pattern);
  if (name.empty()) name = u"*.*";
  std::string native_folder;
  try {
    native_folder = folder_or_current(paths_, folder);
    if (name.find_first_of(u"*?") == Text::npos) {
      const std::string path = paths_.native(pattern);
      if (is_searched_for(path, mask)) found(from_utf8(path.substr(path.find_last_of('/') + 1)));
      return;
    }
  } catch (const RunTimeError& error) {
    if (!error.is(ErrorNumber::path_not_found)) throw;
    return;
  }
  const FolderListing listing(opendir(native_folder.c_str()));
  const bool is_missing = errno == ENOENT || errno == ENOTDIR || errno == EACCES;
  if (!listing && !is_missing) raise_for(errno, native_folder);
  while (const dirent* const entry = listing ? next_entry(listing) : nullptr) {
    const Text entry_name = from_utf8(entry->d_name);
    if (!name_matches(entry_name, name) || !is_searched_for(native_folder + "/" + entry->d_name, mask)) continue;
    if (!found(entry_name)) return;
  }
}

std::uint32_t PosixFiles::attributes(const Text& path) {
  const std::string native_path = paths_.native(path);
  struct stat status {};
  if (stat(native_path.c_str(), &status) != 0) raise_for(errno, native_path);
  return attributes_of(native_path, status);
}

bool PosixFiles::make_path(const Text& path) {
  const std::size_t end = path.find_last_of(separators);
  if (end == Text::npos) return true;
  const Text folder = path.substr(0, end);
  paths_.provide_drive_of(folder);
  try {
    std::error_code error;
    const std::string native_folder = paths_.native(folder.empty() ? u"\\" : folder);
    std::filesystem::create_directories(native_folder, error);
    return std::filesystem::is_directory(native_folder, error);
  } catch (const RunTimeError&) {
    return false;  // A missing drive.
  }
}

Text PosixFiles::current_folder(TextView drive) { return paths_.current_folder(drive); }

void PosixFiles::delete_files(const Text& pattern) {
  const auto [folder, name] = split(pattern);
  if (name.empty()) raise(ErrorNumber::file_not_found);
  const std::string native_folder = folder_or_current(paths_, folder);
  std::error_code error;
  if (!std::filesystem::is_directory(native_folder, error)) raise(ErrorNumber::path_not_found);
  std::vector<std::string> matches;
  search(pattern, file_attribute::hidden | file_attribute::system,
         [&](TextView match) { return matches.push_back(native_folder + "/" + to_utf8(match)), true; });
  if (matches.empty()) raise(ErrorNumber::file_not_found);
  for (const std::string& path : matches) {
    struct stat status {};
    if (stat(path.c_str(), &status) == 0 && (status.st_mode & all_write_bits) == 0) {
      raise(ErrorNumber::permission_denied);
    }
    if (unlink(path.c_str()) != 0) raise_for(errno, path);
  }
}

std::unique_ptr<InputFile> PosixFiles::open_input(const Text& path) {
  require_file_name(path);
  return std::make_unique<PosixInputFile>(open_file(paths_.native(path), O_RDONLY), progress_);
}

std::unique_ptr<OutputFile> PosixFiles::open_output(const Text& path) {
  require_file_name(path);
  const std::string native_path = paths_.native(path);
  if (allows_streams_) {
    if (Descriptor stream = open_stream(native_path); stream.get() >= 0) {
      return std::make_unique<StreamOutput>(std::move(stream));
    }
  }
  return std::make_unique<PosixOutputFile>(native_path);
}

void PosixFiles::append(const Text& path, std::string_view bytes) {
  require_file_name(path);
  const Descriptor file = open_file(paths_.native(path), O_WRONLY | O_APPEND | O_CREAT);
  lock(file, LOCK_EX);
  struct stat before {};
  if (fstat(file.get(), &before) != 0) raise_for(errno, {});
  try {
    write_all(file, bytes);
  } catch (const RunTimeError&) {
    // A partial line is worse than none, because the next one would be joined to it.
    if (ftruncate(file.get(), before.st_size) != 0) raise(ErrorNumber::device_io_error);
    throw;
  }
}

}  // namespace talutil::posix
