#include "tests/faults/posix/recorded_disk.hpp"

#include <dirent.h>
#include <dlfcn.h>
#include <errno.h>
#include <fcntl.h>
#include <stdarg.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <random>
#include <utility>

#include "tests/faults/failing.hpp"

namespace talutil::testing {

namespace {

constexpr int half = -1;  ///< In the place of an error code: only half of the bytes are read or written.

constinit RecordedDisk* disk = nullptr;

/// The next definition of a function: the C library's.
template <class Function>
Function* next(const char* name) {
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

int failure(const char* name, std::initializer_list<int> codes) {
  return talutil::testing::failure<int>(
      codes, EIO, [&](int code) { return std::string(name) + ": " + (code == half ? "half" : strerror(code)); });
}

template <class Call>
auto unless_failing(const char* name, std::initializer_list<int> codes, Call call) -> decltype(call()) {
  if (const int code = failure(name, codes); code != 0) {
    errno = code;
    return -1;
  }
  return call();
}

/// The same for a number of bytes, of which only half may be handled.
template <class Call>
ssize_t for_bytes(const char* name, std::size_t count, std::initializer_list<int> codes, Call call) {
  const int code = failure(name, codes);
  if (code == half) return call((count + 1) / 2);
  if (code == 0) return call(count);
  errno = code;
  return -1;
}

std::string path_of(int descriptor) {
  char path[4096];
  const ssize_t length = readlink(("/proc/self/fd/" + std::to_string(descriptor)).c_str(), path, sizeof path);
  return length < 0 ? std::string() : std::string(path, static_cast<std::size_t>(length));
}

std::string path_of(int folder, const char* name) {
  if (name[0] == '/') return name;
  return (folder == AT_FDCWD ? std::filesystem::current_path().string() : path_of(folder)) + "/" + name;
}

ino_t inode_of(const std::string& path) {
  struct stat status {};
  return lstat(path.c_str(), &status) == 0 ? status.st_ino : 0;
}

using Step = RecordedDisk::Step;
using Kind = Step::Kind;

int opened(const char* name, int folder, const char* path, int flags, mode_t mode) {
  return unless_failing(name, {EACCES, EMFILE, EIO}, [&] {
    static const auto real = next<decltype(::openat)>("openat");
    if (FailingCall::refuses(Allowed::no_new_files) && (flags & O_CREAT) != 0 && folder != AT_FDCWD)
      return errno = EACCES, -1;
    if (disk == nullptr) return real(folder, path, flags, mode);
    RecordedDisk* const watching = std::exchange(disk, nullptr);
    const std::string whole = path_of(folder, path);
    const bool is_new = inode_of(whole) == 0;
    const int descriptor = real(folder, path, flags, mode);
    const int code = errno;
    if (descriptor >= 0 && watching->covers(whole) && (flags & (O_CREAT | O_TRUNC)) != 0) {
      const ino_t inode = inode_of(whole);
      if (is_new) watching->forget(inode);
      const std::size_t file = watching->number_of(inode);
      if (is_new) watching->record({Kind::create, whole, file});
      if (!is_new && (flags & O_TRUNC) != 0) watching->record({Kind::truncate, whole, file});
    }
    disk = watching;
    errno = code;
    return descriptor;
  });
}

/// Records a change of an open file.
void record(int descriptor, Kind kind, std::size_t offset = 0, std::string bytes = {}) {
  if (disk == nullptr) return;
  RecordedDisk* const watching = std::exchange(disk, nullptr);
  const int code = errno;
  const std::string path = path_of(descriptor);
  struct stat status {};
  if (watching->covers(path) && fstat(descriptor, &status) == 0) {
    if (kind == Kind::flush_file && S_ISDIR(status.st_mode)) kind = Kind::flush_folder;
    watching->record({kind, path, watching->number_of(status.st_ino), {}, offset, std::move(bytes)});
  }
  errno = code;
  disk = watching;
}

/// Records a change of a name, after it has succeeded.
template <class Call>
int named(const char* name, std::initializer_list<int> codes, Kind kind, int folder, const char* path, int to_folder,
          const char* to, Call call) {
  return unless_failing(name, codes, [&] {
    if (disk == nullptr) return call();
    RecordedDisk* const watching = std::exchange(disk, nullptr);
    const std::string whole = path_of(folder, path);
    const ino_t inode = inode_of(whole);
    const int result = call();
    const int code = errno;
    if (result == 0 && watching->covers(whole)) {
      const std::size_t file = kind == Kind::make_folder ? 0 : watching->number_of(inode);
      watching->record({kind, whole, file, to == nullptr ? std::string() : path_of(to_folder, to)});
    }
    errno = code;
    disk = watching;
    return result;
  });
}

/// Records what was written, at an offset or, if that is negative, where the file is now.
ssize_t written(int file, const void* bytes, ssize_t count, off_t offset) {
  if (disk == nullptr || count <= 0) return count;
  const auto size = static_cast<std::size_t>(count);
  const auto start = static_cast<std::size_t>(offset < 0 ? lseek(file, 0, SEEK_CUR) - count : offset);
  record(file, Kind::write, start, std::string(static_cast<const char*>(bytes), size));
  return count;
}

std::string parent_of(const std::string& path) { return std::filesystem::path(path).parent_path(); }

}  // namespace

RecordedDisk::RecordedDisk(std::string root) : root_(std::move(root)), before_(read_tree(root_)) {
  for (const auto& [path, bytes] : before_) {
    if (!path.ends_with('/')) named_before_[path] = number_of(inode_of(root_ + path));
  }
  disk = this;
}

RecordedDisk::~RecordedDisk() { stop(); }

void RecordedDisk::stop() { disk = nullptr; }

void RecordedDisk::record(Step step) { steps_.push_back(std::move(step)); }

std::size_t RecordedDisk::number_of(ino_t inode) {
  const auto [place, is_new] = numbers_.try_emplace(inode, next_);
  if (is_new) ++next_;
  return place->second;
}

/// Whether a later step before the cut has flushed this one.
bool RecordedDisk::is_flushed(std::size_t step, std::size_t end) const {
  const Step& change = steps_[step];
  const bool is_content = change.kind == Kind::write || change.kind == Kind::truncate;
  for (std::size_t i = step + 1; i < end; ++i) {
    const Step& later = steps_[i];
    if (is_content && later.kind == Kind::flush_file && later.file == change.file) return true;
    if (!is_content && later.kind == Kind::flush_folder && later.path == parent_of(change.path)) return true;
  }
  return false;
}

Contents RecordedDisk::after_cut(std::size_t end, unsigned kept) const {
  std::mt19937 random(kept);
  std::map<std::string, std::size_t> names;
  std::map<std::size_t, std::string> contents;
  Contents found;
  for (const auto& [path, bytes] : before_) {
    if (path.ends_with('/'))
      found[path];
    else
      contents[names[root_ + path] = named_before_.at(path)] = bytes;
  }
  for (std::size_t i = 0; i < end; ++i) {
    const Step& step = steps_[i];
    const bool is_content = step.kind == Kind::write || step.kind == Kind::truncate;
    const bool is_lucky = kept > 3 ? random() % 2 == 0 : (kept & (is_content ? 1U : 2U)) != 0;
    if (!is_lucky && !is_flushed(i, end)) continue;
    std::string& bytes = contents[step.file];
    switch (step.kind) {
      case Kind::create:
        names[step.path] = step.file;
        break;
      case Kind::make_folder:
        found[step.path.substr(root_.size()) + "/"];
        break;
      case Kind::rename:
        names[step.to] = step.file;
        [[fallthrough]];
      case Kind::remove:
        if (const auto old = names.find(step.path); old != names.end() && old->second == step.file) names.erase(old);
        break;
      case Kind::write:
        bytes.resize(std::max(bytes.size(), step.offset + step.bytes.size()));
        bytes.replace(step.offset, step.bytes.size(), step.bytes);
        break;
      case Kind::truncate:
        bytes.resize(step.offset);
        break;
      default:
        break;
    }
  }
  for (const auto& [path, file] : names) {
    // What lies in a folder that is lost is lost as well.
    const std::string inside = path.substr(root_.size());
    const std::string folder = parent_of(inside);
    if (folder == "/" || found.contains(folder + "/")) found[inside] = contents[file];
  }
  return found;
}

}  // namespace talutil::testing

// The system calls themselves, in the place of the C library's.

using namespace talutil::testing;

/// A function that makes or opens a file, with a mode behind its parameters if it makes one.
#define OPENING(name, parameters, folder)                                \
  int name parameters {                                                  \
    va_list rest;                                                        \
    va_start(rest, flags);                                               \
    const auto mode = (flags & O_CREAT) != 0 ? va_arg(rest, mode_t) : 0; \
    va_end(rest);                                                        \
    return opened(#name, folder, path, flags, mode);                     \
  }

/// A function that fails with one of these codes, or does what the C library's does.
#define FAILING(name, parameters, arguments, ...)                                \
  int name parameters noexcept {                                                 \
    static const auto real = next<decltype(name)>(#name);                        \
    return unless_failing(#name, {__VA_ARGS__}, [&] { return real arguments; }); \
  }

extern "C" {

OPENING(openat, (int folder, const char* path, int flags, ...), folder)
OPENING(open, (const char* path, int flags, ...), AT_FDCWD)
OPENING(open64, (const char* path, int flags, ...), AT_FDCWD)

ssize_t read(int file, void* bytes, std::size_t count) {
  static const auto real = next<decltype(read)>("read");
  return for_bytes("read", count, {EIO, EINTR, half}, [&](std::size_t part) { return real(file, bytes, part); });
}

ssize_t pread(int file, void* bytes, std::size_t count, off_t offset) {
  static const auto real = next<decltype(pread)>("pread");
  return for_bytes("pread", count, {EIO, EINTR, half},
                   [&](std::size_t part) { return real(file, bytes, part, offset); });
}
ssize_t pread64(int file, void* bytes, std::size_t count, off_t offset) { return pread(file, bytes, count, offset); }

ssize_t write(int file, const void* bytes, std::size_t count) {
  static const auto real = next<decltype(write)>("write");
  return for_bytes("write", count, {ENOSPC, EIO, EINTR, half},
                   [&](std::size_t part) { return written(file, bytes, real(file, bytes, part), -1); });
}

ssize_t pwrite(int file, const void* bytes, std::size_t count, off_t offset) {
  static const auto real = next<decltype(pwrite)>("pwrite");
  return for_bytes("pwrite", count, {ENOSPC, EIO, EINTR, half},
                   [&](std::size_t part) { return written(file, bytes, real(file, bytes, part, offset), offset); });
}
ssize_t pwrite64(int file, const void* bytes, std::size_t count, off_t offset) {
  return pwrite(file, bytes, count, offset);
}

int fsync(int file) {
  return unless_failing("fsync", {EIO, ENOSPC}, [&] {
    record(file, Kind::flush_file);
    return 0;  // The disk is the recorded one.
  });
}
int fdatasync(int file) { return fsync(file); }

int ftruncate(int file, off_t length) noexcept {
  static const auto real = next<decltype(ftruncate)>("ftruncate");
  return unless_failing("ftruncate", {EIO}, [&] {
    const int result = real(file, length);
    if (result == 0) record(file, Kind::truncate, static_cast<std::size_t>(length));
    return result;
  });
}
int ftruncate64(int file, off_t length) noexcept { return ftruncate(file, length); }

int renameat(int folder, const char* path, int to_folder, const char* to) noexcept {
  static const auto real = next<decltype(renameat)>("renameat");
  return named("renameat", {EPERM, EIO, ENOSPC}, Kind::rename, folder, path, to_folder, to, [&] {
    return FailingCall::refuses(Allowed::no_replacing) ? (errno = EPERM, -1) : real(folder, path, to_folder, to);
  });
}

int unlinkat(int folder, const char* path, int flags) noexcept {
  static const auto real = next<decltype(unlinkat)>("unlinkat");
  return named("unlinkat", {EPERM, EIO}, Kind::remove, folder, path, 0, nullptr,
               [&] { return real(folder, path, flags); });
}
int unlink(const char* path) noexcept { return unlinkat(AT_FDCWD, path, 0); }

int mkdirat(int folder, const char* path, mode_t mode) noexcept {
  static const auto real = next<decltype(mkdirat)>("mkdirat");
  return named("mkdirat", {ENOSPC, EACCES}, Kind::make_folder, folder, path, 0, nullptr,
               [&] { return real(folder, path, mode); });
}
int mkdir(const char* path, mode_t mode) noexcept { return mkdirat(AT_FDCWD, path, mode); }

FAILING(flock, (int file, int operation), (file, operation), ENOLCK, EINTR, EWOULDBLOCK)
FAILING(fstat, (int file, struct stat* status), (file, status), EIO)
FAILING(fstat64, (int file, struct stat64* status), (file, status), EIO)
FAILING(fstatat, (int folder, const char* path, struct stat* status, int flags), (folder, path, status, flags), EIO)
FAILING(stat, (const char* path, struct stat* status), (path, status), EIO)
FAILING(futimens, (int file, const struct timespec times[2]), (file, times), EPERM)
FAILING(fchmod, (int file, mode_t mode), (file, mode), EPERM)

DIR* opendir(const char* path) {
  static const auto real = next<decltype(opendir)>("opendir");
  const int code = failure("opendir", {EMFILE, EACCES});
  errno = code;
  return code == 0 ? real(path) : nullptr;
}
dirent* readdir(DIR* folder) {
  static const auto real = next<decltype(readdir)>("readdir");
  const int code = failure("readdir", {EIO});
  if (code == 0) return real(folder);
  errno = code;
  return nullptr;
}

}  // extern "C"
