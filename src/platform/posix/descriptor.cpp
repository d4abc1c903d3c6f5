#include "platform/posix/descriptor.hpp"

#include <errno.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <thread>

namespace talutil::posix {

namespace {

constexpr mode_t file_rights = 0666;

bool folder_is_missing(const std::string& path) {
  const std::size_t end = path.find_last_of('/');
  return end != std::string::npos && end > 0 && access(path.substr(0, end).c_str(), F_OK) != 0;
}

}  // namespace

Descriptor::~Descriptor() {
  if (number_ >= 0) close(number_);
}

void raise_for(int code, const std::string& path) {
  switch (code) {
    case ENOENT:
      raise(folder_is_missing(path) ? ErrorNumber::path_not_found : ErrorNumber::file_not_found);
    case ENOTDIR:
      raise(ErrorNumber::path_not_found);
    case EACCES:
    case EPERM:
    case EROFS:
    case EISDIR:
    case ELOOP:
      raise(ErrorNumber::path_file_access);
    case EBUSY:
    case ETXTBSY:
    case EWOULDBLOCK:
      raise(ErrorNumber::permission_denied);
    case ENOSPC:
    case EDQUOT:
    case EFBIG:
      raise(ErrorNumber::disk_full);
    case EMFILE:
    case ENFILE:
      raise(ErrorNumber::too_many_files);
    case ENAMETOOLONG:
    case EINVAL:
    case ENXIO:
      raise(ErrorNumber::bad_file_name_or_number);
    default:
      raise(ErrorNumber::device_io_error);
  }
}

Descriptor open_file(const std::string& path, int flags) {
  // Non-blocking, because opening a pipe would otherwise wait for its other end.
  Descriptor file(open(path.c_str(), flags | O_CLOEXEC | O_NONBLOCK, file_rights));
  if (file.get() < 0) raise_for(errno, path);
  require_regular(file, flags);
  return file;
}

void require_regular(const Descriptor& file, int flags) {
  struct stat status {};
  if (fstat(file.get(), &status) != 0) raise_for(errno, {});
  if (S_ISDIR(status.st_mode)) raise(ErrorNumber::path_file_access);
  if (!S_ISREG(status.st_mode)) raise(ErrorNumber::bad_file_name_or_number);
  // Read-only is an attribute of the file here, regardless of the user's own rights.
  const bool may_write = (status.st_mode & (S_IWUSR | S_IWGRP | S_IWOTH)) != 0;
  if ((flags & O_ACCMODE) != O_RDONLY && !may_write) raise(ErrorNumber::path_file_access);
}

void lock(const Descriptor& file, int operation) {
  using namespace std::chrono_literals;
  // Appending holds its lock for microseconds; a lock that is held for longer will not be released soon.
  const auto end = std::chrono::steady_clock::now() + 2s;
  while (flock(file.get(), operation | LOCK_NB) != 0) {
    if (errno != EINTR && errno != EWOULDBLOCK) return;  // The file system has no locks.
    if (std::chrono::steady_clock::now() > end) raise(ErrorNumber::permission_denied);
    std::this_thread::sleep_for(100us);
  }
}

void write_all(const Descriptor& file, std::string_view bytes) {
  while (!bytes.empty()) {
    const ssize_t written = write(file.get(), bytes.data(), bytes.size());
    if (written < 0 && errno == EINTR) continue;
    if (written < 0) raise_for(errno, {});
    bytes.remove_prefix(static_cast<std::size_t>(written));
  }
}

void flush_folder(const Descriptor& folder) noexcept {
  // The folder may only be open for its path.
  const Descriptor readable(openat(folder.get(), ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  static_cast<void>(fsync(readable.get()) == 0);
}

const dirent* next_entry(const FolderListing& listing) {
  errno = 0;
  const dirent* const entry = readdir(listing.get());
  if (entry == nullptr && errno != 0) raise_for(errno, {});
  return entry;
}

}  // namespace talutil::posix
