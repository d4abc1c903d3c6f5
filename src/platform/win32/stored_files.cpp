#include "platform/win32/stored_files.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/replacement.hpp"

namespace talutil::win32 {

namespace {

// 1 January 1970, in units of 100 nanoseconds since 1601.
constexpr std::int64_t epoch = 116'444'736'000'000'000;
constexpr std::int64_t ticks_a_second = 10'000'000;

void seek(const Owned<kind::File>& file, std::uint64_t offset) {
  LARGE_INTEGER place{};
  place.QuadPart = static_cast<LONGLONG>(offset);
  if (SetFilePointerEx(file.get(), place, nullptr, FILE_BEGIN) == 0) raise_last_error();
}

std::size_t read_file(const Owned<kind::File>& file, std::uint64_t offset, std::span<char> buffer) {
  seek(file, offset);
  std::size_t done = 0;
  while (done < buffer.size()) {
    DWORD count = 0;
    if (ReadFile(file.get(), buffer.data() + done, static_cast<DWORD>(buffer.size() - done), &count, nullptr) == 0) {
      raise_last_error();
    }
    if (count == 0) break;
    done += count;
  }
  return done;
}

class Win32StoredFile final : public StoredFile {
 public:
  explicit Win32StoredFile(Owned<kind::File> file) : file_(std::move(file)) {
    LARGE_INTEGER size{};
    if (!file_ || GetFileSizeEx(file_.get(), &size) == 0) raise_last_error();
    size_ = static_cast<std::uint64_t>(size.QuadPart);
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(file_, offset, buffer);
  }

 private:
  Owned<kind::File> file_;
  std::uint64_t size_ = 0;
};

class Win32NewFile final : public NewFile {
 public:
  Win32NewFile(const Text& folder, TextView name)
      : name_(name), turn_(take_turn(folder, name)), replaced_(open_replaced(folder + name_)), replacement_(folder) {}

  [[nodiscard]] StoredFile* replaced() noexcept override { return replaced_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(replacement_.file(), offset, buffer);
  }

  void write_at(std::uint64_t offset, std::string_view bytes) override {
    seek(replacement_.file(), offset);
    size_ = std::max(size_, offset + bytes.size());
    write_all(replacement_.file(), bytes);
  }

  void finish(const FileFacts* facts) override {
    if (facts == nullptr) return;
    const FILETIME time = file_time(facts->modified);
    if (SetFileTime(replacement_.file().get(), nullptr, nullptr, &time) == 0) raise_last_error();
    attributes_ = facts->attributes & kept_attributes;
  }

  using NewFile::take_name;
  void take_name(TextView other_name) override {
    // The system replaces no file that is open.
    const bool replaces = replaced_ != nullptr || !other_name.empty();
    replaced_.reset();
    replacement_.take_name(other_name.empty() ? name_ : Text(other_name), attributes_, replaces,
                           Replacement::Keep::nothing);
  }
  // The system renames through to the disk, and only what is closed.
  void begin_flush() noexcept override {}
  void flush_contents() override {}
  void take_name_unflushed() override { take_name({}); }
  void flush_names() noexcept override {}

 private:
  /// Writers of one file take turns, from before they open the old version until the new one has its name: in between,
  /// the old one is neither open nor replaced for a moment, and whoever read it then would undo the other's changes.
  /// The lock is a file that nobody else can open and that goes with its handle.
  [[nodiscard]] static Owned<kind::File> take_turn(const Text& folder, TextView name) {
    const Text path = folder + Text(temporary_prefix) + u"lock" + short_name_of(upper_case(name));
    Owned<kind::File> file;
    const DWORD code = retried([&] {
      file.reset(CreateFileW(wide(path), GENERIC_WRITE, 0, nullptr, OPEN_ALWAYS,
                             FILE_ATTRIBUTE_HIDDEN | FILE_FLAG_DELETE_ON_CLOSE, nullptr));
      return file ? TRUE : FALSE;
    });
    if (code != 0) raise_for(code);
    return file;
  }

  /// Opened for writing too where that is allowed, so that programs that write in place are noticed.
  [[nodiscard]] static std::unique_ptr<Win32StoredFile> open_replaced(const Text& path) {
    const DWORD attributes = GetFileAttributesW(wide(path));
    if (attributes == INVALID_FILE_ATTRIBUTES) return nullptr;
    if ((attributes & (FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_DIRECTORY)) != 0) raise(ErrorNumber::path_file_access);
    Owned<kind::File> file;
    const auto open = [&](DWORD access) {
      return retried([&] {
        file.reset(CreateFileW(wide(path), access, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr));
        return file ? TRUE : FALSE;
      });
    };
    DWORD code = open(GENERIC_READ | GENERIC_WRITE);
    if (code == ERROR_ACCESS_DENIED) code = open(GENERIC_READ);
    if (code != 0) raise_for(code);
    return std::make_unique<Win32StoredFile>(std::move(file));
  }

  Text name_;
  Owned<kind::File> turn_;
  std::unique_ptr<Win32StoredFile> replaced_;
  Replacement replacement_;
  DWORD attributes_ = 0;
  std::uint64_t size_ = 0;
};

}  // namespace

bool find_next(const Owned<kind::FileSearch>& search, WIN32_FIND_DATAW& entry) {
  if (FindNextFileW(search.get(), &entry) != 0) return true;
  if (GetLastError() != ERROR_NO_MORE_FILES) raise_last_error();
  return false;
}

std::int64_t seconds_of(const FILETIME& time) noexcept {
  return (static_cast<std::int64_t>(joined(time.dwHighDateTime, time.dwLowDateTime)) - epoch) / ticks_a_second;
}

FILETIME file_time(std::int64_t seconds) noexcept {
  const auto ticks = static_cast<std::uint64_t>(seconds * ticks_a_second + epoch);
  return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32U)};
}

std::unique_ptr<StoredFile> open_stored_file(const Text& path, DWORD sharing) {
  return std::make_unique<Win32StoredFile>(
      Owned<kind::File>(CreateFileW(wide(path), GENERIC_READ, sharing, nullptr, OPEN_EXISTING, 0, nullptr)));
}

std::unique_ptr<NewFile> create_new_file(const Text& folder, TextView name) {
  return std::make_unique<Win32NewFile>(folder, name);
}

}  // namespace talutil::win32
