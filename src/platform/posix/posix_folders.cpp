#include "platform/posix/posix_folders.hpp"

#include <errno.h>
#include <fcntl.h>
#include <stdio.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <filesystem>

#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/posix/replacement.hpp"

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

class PosixNewFile final : public NewFile {
 public:
  PosixNewFile(Descriptor folder, std::string name) : replacement_(std::move(folder), std::move(name), O_RDWR) {
    if (replacement_.target().get() < 0) return;
    // A second descriptor of the same open file, so that the lock stays.
    Descriptor old(fcntl(replacement_.target().get(), F_DUPFD_CLOEXEC, 0));
    if (old.get() < 0) raise_for(errno, {});
    replaced_ = std::make_unique<PosixStoredFile>(std::move(old));
  }

  [[nodiscard]] StoredFile* replaced() noexcept override { return replaced_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(replacement_.file(), offset, buffer);
  }

  void write_at(std::uint64_t offset, std::string_view bytes) override {
    size_ = std::max(size_, offset + bytes.size());
    while (!bytes.empty()) {
      const ssize_t written = pwrite(replacement_.file().get(), bytes.data(), bytes.size(), static_cast<off_t>(offset));
      if (written < 0 && errno == EINTR) continue;
      if (written < 0) raise_for(errno, {});
      bytes.remove_prefix(static_cast<std::size_t>(written));
      offset += static_cast<std::uint64_t>(written);
    }
  }

  void finish(const FileFacts* facts) override {
    const int file = replacement_.file().get();
    if (facts == nullptr || facts->mode == 0) replacement_.keep_rights();
    if (facts == nullptr) return;
    const std::array<timespec, 2> times{{{0, UTIME_OMIT}, {facts->modified, 0}}};
    if (futimens(file, times.data()) != 0) raise_for(errno, {});
    const mode_t mode = facts->mode & rights;
    if (mode != 0) fchmod(file, mode);
    if (mode == 0 && (facts->attributes & file_attribute::read_only) != 0) fchmod(file, S_IRUSR | S_IRGRP | S_IROTH);
  }

  using NewFile::take_name;
  void take_name(TextView other_name) override {
    if (other_name.empty())
      replacement_.take_name();
    else
      replacement_.take_name(to_utf8(other_name));
  }
  void begin_flush() noexcept override { replacement_.begin_flush(); }
  void flush_contents() override { replacement_.flush_contents(); }
  void take_name_unflushed() override { replacement_.take_name_unflushed(); }
  void flush_names() noexcept override { replacement_.flush_names(); }

 private:
  Replacement replacement_;
  std::unique_ptr<PosixStoredFile> replaced_;
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
    const FolderListing listing(copy < 0 ? nullptr : fdopendir(copy));
    if (!listing) raise_for(errno, {});
    while (const dirent* const entry = next_entry(listing)) {
      const std::string_view name = entry->d_name;
      if (name == "." || name == "..") continue;
      // An entry that has vanished in the meantime is skipped.
      auto known = native_facts(entry->d_name);
      if (!known) continue;
      const Text text = from_utf8(name);
      if (to_utf8(text) != name) known->kind = FileKind::unnameable;
      found(text, *known);
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
    Descriptor folder(fcntl(folder_.get(), F_DUPFD_CLOEXEC, 0));
    if (folder.get() < 0) raise_for(errno, {});
    return std::make_unique<PosixNewFile>(std::move(folder), to_utf8(name));
  }

  [[nodiscard]] std::unique_ptr<Folder> folder(TextView name, bool make_missing) override {
    const std::string native = to_utf8(name);
    if (make_missing) make(native);
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
  void make(const std::string& name) {
    if (mkdirat(folder_.get(), name.c_str(), rights) == 0) return flush_folder(folder_);
    if (errno != EEXIST) raise_for(errno, {});
  }

  [[nodiscard]] std::optional<FileFacts> native_facts(const char* name) const {
    struct stat status {};
    if (fstatat(folder_.get(), name, &status, AT_SYMLINK_NOFOLLOW) != 0) {
      if (errno == ENOENT || errno == ENAMETOOLONG) return std::nullopt;
      raise_for(errno, {});
    }
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
