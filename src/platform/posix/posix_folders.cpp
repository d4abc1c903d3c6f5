#include "platform/posix/posix_folders.hpp"

#include <dirent.h>
#include <errno.h>
#include <fcntl.h>
#include <stdio.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>

#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::posix {

namespace {

constexpr mode_t rights = 0777;

FileFacts facts_of(const struct stat& status, const char* name) {
  FileFacts facts;
  facts.kind = S_ISREG(status.st_mode)   ? FileKind::file
               : S_ISDIR(status.st_mode) ? FileKind::folder
               : S_ISLNK(status.st_mode) ? FileKind::link
                                         : FileKind::other;
  facts.size = facts.kind == FileKind::file ? static_cast<std::uint64_t>(status.st_size) : 0;
  facts.modified = status.st_mtim.tv_sec;
  facts.attributes = attributes_by_status(name, status);
  facts.mode = status.st_mode;
  return facts;
}

/// Reads from an offset until the buffer is full or the file ends.
std::size_t read_file(const Descriptor& file, std::uint64_t offset, std::span<char> buffer) {
  std::size_t done = 0;
  while (done < buffer.size()) {
    const ssize_t count =
        pread(file.get(), buffer.data() + done, buffer.size() - done, static_cast<off_t>(offset + done));
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) raise_for(errno, {});
    if (count == 0) break;
    done += static_cast<std::size_t>(count);
  }
  return done;
}

class PosixStoredFile final : public StoredFile {
 public:
  explicit PosixStoredFile(Descriptor file) : file_(std::move(file)) {
    struct stat status {};
    if (fstat(file_.get(), &status) != 0) raise_for(errno, {});
    if (S_ISDIR(status.st_mode)) raise(ErrorNumber::path_file_access);
    if (!S_ISREG(status.st_mode)) raise(ErrorNumber::bad_file_name_or_number);
    size_ = static_cast<std::uint64_t>(status.st_size);
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(file_, offset, buffer);
  }

 private:
  Descriptor file_;
  std::uint64_t size_ = 0;
};

/// A name that no other temporary file has.
std::string temporary_name() {
  static std::atomic<unsigned> next{0};
  return ".talutil-" + std::to_string(getpid()) + "-" + std::to_string(next++);
}

class PosixNewFile final : public NewFile {
 public:
  PosixNewFile(int folder, std::string name) : folder_(fcntl(folder, F_DUPFD_CLOEXEC, 0)), name_(std::move(name)) {
    if (folder_.get() < 0) raise_for(errno, {});
    open_replaced();
    do {
      temporary_ = temporary_name();
      file_ = Descriptor(openat(folder_.get(), temporary_.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC, 0666));
    } while (file_.get() < 0 && errno == EEXIST);
    if (file_.get() >= 0) return;
    temporary_.clear();
    raise_for(errno, {});
  }

  ~PosixNewFile() override {
    if (!temporary_.empty()) unlinkat(folder_.get(), temporary_.c_str(), 0);
  }

  [[nodiscard]] StoredFile* replaced() noexcept override { return replaced_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(file_, offset, buffer);
  }

  void write_at(std::uint64_t offset, std::string_view bytes) override {
    size_ = std::max(size_, offset + bytes.size());
    while (!bytes.empty()) {
      const ssize_t written = pwrite(file_.get(), bytes.data(), bytes.size(), static_cast<off_t>(offset));
      if (written < 0 && errno == EINTR) continue;
      if (written < 0) raise_for(errno, {});
      bytes.remove_prefix(static_cast<std::size_t>(written));
      offset += static_cast<std::uint64_t>(written);
    }
  }

  void finish(const FileFacts* facts) override {
    if (facts != nullptr) {
      const std::array<timespec, 2> times{{{0, UTIME_OMIT}, {facts->modified, 0}}};
      if (futimens(file_.get(), times.data()) != 0) raise_for(errno, {});
      const mode_t mode = facts->mode & rights;
      const bool is_locked = (facts->attributes & file_attribute::read_only) != 0;
      if (mode != 0 || is_locked) fchmod(file_.get(), mode != 0 ? mode : S_IRUSR | S_IRGRP | S_IROTH);
    } else if (replaced_mode_ != 0) {
      fchmod(file_.get(), replaced_mode_ & rights);
    }
    file_ = Descriptor();
  }

  using NewFile::take_name;
  void take_name(TextView other_name) override {
    const std::string name = other_name.empty() ? name_ : to_utf8(other_name);
    if (renameat(folder_.get(), temporary_.c_str(), folder_.get(), name.c_str()) != 0) raise_for(errno, {});
    temporary_.clear();
  }

 private:
  void open_replaced() {
    struct stat status {};
    if (fstatat(folder_.get(), name_.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0) return;
    if (S_ISLNK(status.st_mode)) return;  // Replaces the link, not what it points to.
    if ((attributes_by_status(name_, status) & (file_attribute::read_only | file_attribute::folder)) != 0) {
      raise(ErrorNumber::path_file_access);
    }
    replaced_mode_ = status.st_mode;
    Descriptor old(openat(folder_.get(), name_.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK | O_NOFOLLOW));
    if (old.get() < 0) raise_for(errno, {});
    lock(old, LOCK_EX);
    replaced_ = std::make_unique<PosixStoredFile>(std::move(old));
  }

  Descriptor folder_;
  std::string name_;
  std::string temporary_;
  mode_t replaced_mode_ = 0;
  std::unique_ptr<PosixStoredFile> replaced_;
  Descriptor file_;
  std::uint64_t size_ = 0;
};

class PosixFolder final : public Folder {
 public:
  explicit PosixFolder(Descriptor folder) : folder_(std::move(folder)) {}

  [[nodiscard]] Text path() const override {
    std::error_code ignored;  // The path of a deleted folder is empty.
    return from_utf8(std::filesystem::read_symlink("/proc/self/fd/" + std::to_string(folder_.get()), ignored).string());
  }

  void list(const std::function<void(TextView name, const FileFacts& facts)>& found) override {
    const int copy = openat(folder_.get(), ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    const std::unique_ptr<DIR, int (*)(DIR*)> listing(copy < 0 ? nullptr : fdopendir(copy), &closedir);
    if (!listing) raise_for(errno, {});
    while (const dirent* const entry = readdir(listing.get())) {
      const std::string_view name = entry->d_name;
      if (name == "." || name == "..") continue;
      // An entry that has vanished in the meantime is skipped.
      if (const auto known = native_facts(entry->d_name)) found(from_utf8(name), *known);
    }
  }

  [[nodiscard]] std::optional<FileFacts> facts(TextView name) override { return native_facts(to_utf8(name).c_str()); }

  [[nodiscard]] std::unique_ptr<StoredFile> open(TextView name) override {
    Descriptor file(openat(folder_.get(), to_utf8(name).c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    if (file.get() < 0) raise_for(errno, {});
    // Do not read a file that is being written; from here on, others' locks do not matter.
    lock(file, LOCK_SH);
    flock(file.get(), LOCK_UN);
    return std::make_unique<PosixStoredFile>(std::move(file));
  }

  [[nodiscard]] std::unique_ptr<NewFile> create(TextView name) override {
    return std::make_unique<PosixNewFile>(folder_.get(), to_utf8(name));
  }

  [[nodiscard]] std::unique_ptr<Folder> folder(TextView name, bool make_missing) override {
    const std::string native = to_utf8(name);
    if (make_missing && mkdirat(folder_.get(), native.c_str(), rights) != 0 && errno != EEXIST) raise_for(errno, {});
    Descriptor opened(openat(folder_.get(), native.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    if (opened.get() < 0) raise_for(errno == ENOTDIR ? ELOOP : errno, {});
    return std::make_unique<PosixFolder>(std::move(opened));
  }

  void set_facts(TextView name, const FileFacts& facts) override {
    const std::string native = to_utf8(name);
    const std::array<timespec, 2> times{{{0, UTIME_OMIT}, {facts.modified, 0}}};
    if ((facts.mode & rights) != 0) fchmodat(folder_.get(), native.c_str(), facts.mode & rights, 0);
    utimensat(folder_.get(), native.c_str(), times.data(), AT_SYMLINK_NOFOLLOW);
  }

  void remove(TextView name) override {
    if (unlinkat(folder_.get(), to_utf8(name).c_str(), 0) != 0) raise_for(errno, {});
  }

 private:
  [[nodiscard]] std::optional<FileFacts> native_facts(const char* name) const {
    struct stat status {};
    if (fstatat(folder_.get(), name, &status, AT_SYMLINK_NOFOLLOW) != 0) return std::nullopt;
    struct stat target {};
    if (S_ISLNK(status.st_mode) && fstatat(folder_.get(), name, &target, 0) == 0 && S_ISREG(target.st_mode)) {
      status = target;
    }
    return facts_of(status, name);
  }

  Descriptor folder_;
};

}  // namespace

std::unique_ptr<Folder> PosixFolders::open(const Text& path) {
  const std::string native = path.empty() ? "." : paths_.native(path);
  Descriptor opened(::open(native.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
  if (opened.get() < 0) raise_for(errno == ENOENT ? ENOTDIR : errno, native);
  return std::make_unique<PosixFolder>(std::move(opened));
}

}  // namespace talutil::posix
