#include "platform/win32/stored_files.hpp"

#include <atomic>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"

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
  Win32StoredFile(const Text& path, DWORD sharing)
      : file_(CreateFileW(wide(path), GENERIC_READ, sharing, nullptr, OPEN_EXISTING, 0, nullptr)) {
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
  Win32NewFile(const Text& folder, TextView name) : folder_(folder), path_(folder + Text(name)) {
    const DWORD attributes = GetFileAttributesW(wide(path_));
    if (attributes != INVALID_FILE_ATTRIBUTES) {
      if ((attributes & (FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_DIRECTORY)) != 0)
        raise(ErrorNumber::path_file_access);
      replaced_ = std::make_unique<Win32StoredFile>(path_, FILE_SHARE_READ);
    }
    static std::atomic<std::int32_t> next{0};
    do {
      temporary_ = folder + u".talutil-" + number_to_text(static_cast<std::int32_t>(GetCurrentProcessId())) + u"-" +
                   number_to_text(next++);
      file_ = Owned<kind::File>(CreateFileW(wide(temporary_), GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ, nullptr,
                                            CREATE_NEW, FILE_ATTRIBUTE_NORMAL, nullptr));
    } while (!file_ && GetLastError() == ERROR_FILE_EXISTS);
    if (file_) return;
    temporary_.clear();
    raise_last_error();
  }
  Win32NewFile(const Win32NewFile&) = delete;
  Win32NewFile& operator=(const Win32NewFile&) = delete;

  ~Win32NewFile() override {
    file_.reset();
    if (!temporary_.empty()) DeleteFileW(wide(temporary_));
  }

  [[nodiscard]] StoredFile* replaced() noexcept override { return replaced_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    return read_file(file_, offset, buffer);
  }

  void write_at(std::uint64_t offset, std::string_view bytes) override {
    constexpr std::size_t longest = 1U << 24U;
    seek(file_, offset);
    size_ = std::max(size_, offset + bytes.size());
    while (!bytes.empty()) {
      DWORD written = 0;
      const auto part = static_cast<DWORD>(std::min(bytes.size(), longest));
      if (WriteFile(file_.get(), bytes.data(), part, &written, nullptr) == 0) raise_last_error();
      if (written == 0) raise(ErrorNumber::disk_full);
      bytes.remove_prefix(written);
    }
  }

  void finish(const FileFacts* facts) override {
    if (facts != nullptr) {
      const FILETIME time = file_time(facts->modified);
      if (SetFileTime(file_.get(), nullptr, nullptr, &time) == 0) raise_last_error();
    }
    file_.reset();
    if (facts != nullptr && (facts->attributes & kept_attributes) != 0) {
      SetFileAttributesW(wide(temporary_), facts->attributes & kept_attributes);
    }
  }

  using NewFile::take_name;
  void take_name(TextView other_name) override {
    replaced_.reset();
    const Text path = other_name.empty() ? path_ : folder_ + Text(other_name);
    if (MoveFileExW(wide(temporary_), wide(path), MOVEFILE_REPLACE_EXISTING) == 0) {
      const DWORD reason = GetLastError();
      // The file was writable a moment ago, so what prevents replacing it is that someone has it open.
      raise_for(reason == ERROR_ACCESS_DENIED ? ERROR_SHARING_VIOLATION : reason);
    }
    temporary_.clear();
  }

 private:
  Text folder_;
  Text path_;
  Text temporary_;
  std::unique_ptr<Win32StoredFile> replaced_;
  Owned<kind::File> file_;
  std::uint64_t size_ = 0;
};

}  // namespace

std::int64_t seconds_of(const FILETIME& time) noexcept {
  return (static_cast<std::int64_t>(joined(time.dwHighDateTime, time.dwLowDateTime)) - epoch) / ticks_a_second;
}

FILETIME file_time(std::int64_t seconds) noexcept {
  const auto ticks = static_cast<std::uint64_t>(seconds * ticks_a_second + epoch);
  return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32U)};
}

std::unique_ptr<StoredFile> open_stored_file(const Text& path, DWORD sharing) {
  return std::make_unique<Win32StoredFile>(path, sharing);
}

std::unique_ptr<NewFile> create_new_file(const Text& folder, TextView name) {
  return std::make_unique<Win32NewFile>(folder, name);
}

}  // namespace talutil::win32
