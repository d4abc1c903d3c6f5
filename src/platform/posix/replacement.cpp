#include "platform/posix/replacement.hpp"

#include <errno.h>
#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <array>
#include <filesystem>
#include <utility>

#include "platform/folders.hpp"

namespace talutil::posix {

namespace {

/// The temporary name for a target: a hash (FNV-1a, 64 bits), so that it is never too long.
std::string temporary_name(std::string_view target) {
  std::uint64_t hash = 0xCBF29CE484222325;
  for (const char c : target) hash = (hash ^ static_cast<unsigned char>(c)) * 0x100000001B3;
  std::array<char, 17> digits{};
  snprintf(digits.data(), digits.size(), "%016llx", static_cast<unsigned long long>(hash));
  return to_utf8(temporary_prefix) + digits.data();
}

/// Whether a name in a folder still refers to an open file.
bool is_named(const Descriptor& file, const Descriptor& folder, const std::string& name) {
  struct stat open {};
  struct stat named {};
  return fstat(file.get(), &open) == 0 && fstatat(folder.get(), name.c_str(), &named, AT_SYMLINK_NOFOLLOW) == 0 &&
         open.st_ino == named.st_ino && open.st_dev == named.st_dev;
}

void flush(const Descriptor& file) {
  if (fsync(file.get()) != 0) raise_for(errno, {});
}

bool is_forbidden(int code) noexcept { return code == EACCES || code == EPERM || code == EROFS; }

}  // namespace

Replacement::Replacement(Descriptor folder, std::string name, int access)
    : folder_(std::move(folder)), name_(std::move(name)) {
  // First the turn among the writers, then the target: the writer before may just have replaced it.
  try {
    const int refusal = open_temporary();
    // Problems with the target are reported now, not after everything has been written.
    open_target(access);
    if (refusal == 0) return;
    // A folder that does not allow new files may still allow overwriting this one.
    if (!is_forbidden(refusal) || target_.get() < 0) raise_for(refusal, name_);
    std::error_code error;
    const std::filesystem::path elsewhere = std::filesystem::temp_directory_path(error);
    if (error) raise_for(error.value(), {});
    std::string path = elsewhere / (to_utf8(temporary_prefix) + "XXXXXX");
    file_ = Descriptor(mkostemp(path.data(), O_CLOEXEC));
    if (file_.get() < 0) raise_for(errno, path);
    temporary_ = std::move(path);
    is_elsewhere_ = true;
  } catch (...) {
    discard();
    throw;
  }
}

Replacement::~Replacement() { discard(); }

void Replacement::open_target(int access) {
  for (;;) {
    Descriptor target(openat(folder_.get(), name_.c_str(), access | O_CLOEXEC | O_NONBLOCK | O_NOFOLLOW));
    // A link is replaced itself, not what it points to.
    if (target.get() < 0 && (errno == ENOENT || errno == ELOOP)) {
      target_ = Descriptor();
      return;
    }
    if (target.get() < 0) raise_for(errno, {});
    require_regular(target, access);
    lock(target, LOCK_EX);
    if (!is_named(target, folder_, name_)) continue;
    target_ = std::move(target);
    return;
  }
}

/// Returns the system's error code if there can be no temporary file.
int Replacement::open_temporary() {
  std::string temporary = temporary_name(name_);
  for (;;) {
    Descriptor file(openat(folder_.get(), temporary.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600));
    if (file.get() < 0) return errno;
    lock(file, LOCK_EX);
    // Whoever held the lock before may have given the file its name.
    if (!is_named(file, folder_, temporary)) continue;
    temporary_ = std::move(temporary);
    if (ftruncate(file.get(), 0) != 0) raise_for(errno, {});
    file_ = std::move(file);
    return 0;
  }
}

void Replacement::keep_rights() const {
  struct stat status {};
  if (target_.get() >= 0 && fstat(target_.get(), &status) == 0) {
    // The owner first, because changing it clears bits of the rights. Only an administrator can give files away.
    static_cast<void>(fchown(file_.get(), status.st_uid, status.st_gid) == 0);
    fchmod(file_.get(), status.st_mode & 07777);
    std::array<char, 32> attributes{};
    const ssize_t length = fgetxattr(target_.get(), dos_attributes, attributes.data(), attributes.size());
    if (length > 0) fsetxattr(file_.get(), dos_attributes, attributes.data(), static_cast<std::size_t>(length), 0);
    return;
  }
  const mode_t mask = umask(0);
  umask(mask);
  fchmod(file_.get(), 0666 & ~mask);
}

void Replacement::take_name(const std::string& name) {
  flush_contents();
  rename(name);
  flush_names();
}

void Replacement::begin_flush() const noexcept {
  static_cast<void>(sync_file_range(file_.get(), 0, 0, SYNC_FILE_RANGE_WRITE));
}

void Replacement::flush_contents() const {
  // What is written in place is flushed there.
  if (!is_elsewhere_) flush(file_);
}

void Replacement::rename(const std::string& name) {
  if (is_elsewhere_) return overwrite_target();
  if (renameat(folder_.get(), temporary_.c_str(), folder_.get(), name.c_str()) != 0) {
    if (!is_forbidden(errno) || target_.get() < 0 || name != name_) raise_for(errno, {});
    return overwrite_target();
  }
  temporary_.clear();
  is_renamed_ = true;
}

void Replacement::flush_names() const noexcept {
  // Without this, a power cut could undo the renaming.
  if (is_renamed_) flush_folder(folder_);
}

/// The one step that is not atomic: for targets that this user may write, in folders where files cannot be replaced. If
/// it fails, the new version stays where it is, because it could be the only copy.
void Replacement::overwrite_target() {
  try {
    copy_to_target();
  } catch (const RunTimeError& error) {
    std::error_code ignored;
    const std::string folder = "/proc/self/fd/" + std::to_string(folder_.get());
    const std::string target = std::filesystem::read_symlink(folder, ignored).string() + "/";
    const std::string kept = (is_elsewhere_ ? "" : target) + std::exchange(temporary_, {});
    throw RunTimeError(error.number(), error.description() + u": " + from_utf8(target + name_) +
                                           u"; its new contents are in " + from_utf8(kept));
  }
  discard();
}

void Replacement::copy_to_target() const {
  if (lseek(file_.get(), 0, SEEK_SET) != 0 || lseek(target_.get(), 0, SEEK_SET) != 0) raise_for(errno, {});
  std::array<char, 1U << 16U> buffer;
  off_t length = 0;
  for (;;) {
    const ssize_t count = read(file_.get(), buffer.data(), buffer.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) raise_for(errno, {});
    if (count == 0) break;
    write_all(target_, std::string_view(buffer.data(), static_cast<std::size_t>(count)));
    length += count;
  }
  // Cut off at the end and not at the beginning, so that the old contents remain as long as possible.
  if (ftruncate(target_.get(), length) != 0) raise_for(errno, {});
  flush(target_);
}

void Replacement::discard() noexcept {
  if (!temporary_.empty()) unlinkat(folder_.get(), temporary_.c_str(), 0);
  temporary_.clear();
}

}  // namespace talutil::posix
