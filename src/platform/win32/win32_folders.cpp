#include "platform/win32/win32_folders.hpp"

#include <atomic>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"

namespace talutil::win32 {

namespace {

// 1 January 1970 in the platform's count of 100 nanoseconds from 1601.
constexpr std::int64_t epoch = 116'444'736'000'000'000;
constexpr std::int64_t ticks_a_second = 10'000'000;
constexpr DWORD kept_attributes =
    FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_ARCHIVE;

std::uint64_t joined(DWORD high, DWORD low) { return static_cast<std::uint64_t>(high) << 32U | low; }

/// Of WIN32_FIND_DATAW and of WIN32_FILE_ATTRIBUTE_DATA.
template <class Data>
FileFacts facts_of(const Data& data) {
  FileFacts facts;
  const bool is_folder = (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  const bool is_link = (data.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
  facts.kind = is_folder ? (is_link ? FileKind::link : FileKind::folder) : FileKind::file;
  facts.size = is_folder ? 0 : joined(data.nFileSizeHigh, data.nFileSizeLow);
  const auto ticks =
      static_cast<std::int64_t>(joined(data.ftLastWriteTime.dwHighDateTime, data.ftLastWriteTime.dwLowDateTime));
  facts.modified = (ticks - epoch) / ticks_a_second;
  facts.attributes = data.dwFileAttributes & (kept_attributes | FILE_ATTRIBUTE_DIRECTORY);
  return facts;
}

FILETIME file_time(std::int64_t seconds) {
  const auto ticks = static_cast<std::uint64_t>(seconds * ticks_a_second + epoch);
  return {static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32U)};
}

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
      // It could be written to a moment ago: what keeps it from being replaced is another who has it open.
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

class Win32Folder final : public Folder {
 public:
  /// A path in the form that is taken as it is, however long, with a separator at its end.
  explicit Win32Folder(Text path) : path_(std::move(path)) {}

  [[nodiscard]] Text path() const override {
    const TextView plain = TextView(path_).substr(extended.size());
    if (plain.starts_with(u"UNC\\")) return u"\\" + Text(plain.substr(3, plain.size() - 4));
    return Text(plain.size() == 3 ? plain : plain.substr(0, plain.size() - 1));
  }

  void list(const std::function<void(TextView name, const FileFacts& facts)>& found) override {
    WIN32_FIND_DATAW entry;
    const Owned<kind::FileSearch> search(FindFirstFileW(wide(path_ + u"*"), &entry));
    if (!search) raise_last_error();
    do {
      const TextView name = view(entry.cFileName, wcslen(entry.cFileName));
      if (name != u"." && name != u"..") found(name, facts_of(entry));
    } while (FindNextFileW(search.get(), &entry) != 0);
  }

  [[nodiscard]] std::optional<FileFacts> facts(TextView name) override {
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (GetFileAttributesExW(wide(below(name)), GetFileExInfoStandard, &data) == 0) return std::nullopt;
    return facts_of(data);
  }

  [[nodiscard]] std::unique_ptr<StoredFile> open(TextView name) override {
    return std::make_unique<Win32StoredFile>(below(name), FILE_SHARE_READ | FILE_SHARE_WRITE);
  }

  [[nodiscard]] std::unique_ptr<NewFile> create(TextView name) override {
    return std::make_unique<Win32NewFile>(path_, name);
  }

  [[nodiscard]] std::unique_ptr<Folder> folder(TextView name, bool make_missing) override {
    const Text path = below(name);
    if (make_missing && CreateDirectoryW(wide(path), nullptr) == 0 && GetLastError() != ERROR_ALREADY_EXISTS) {
      raise_last_error();
    }
    const DWORD attributes = GetFileAttributesW(wide(path));
    if (attributes == INVALID_FILE_ATTRIBUTES) raise_last_error();
    const DWORD kind = attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT);
    if (kind != FILE_ATTRIBUTE_DIRECTORY) raise(ErrorNumber::path_file_access);
    return std::make_unique<Win32Folder>(path + u"\\");
  }

  void set_facts(TextView name, const FileFacts& facts) override {
    const Text path = below(name);
    const FILETIME time = file_time(facts.modified);
    const Owned<kind::File> entry(CreateFileW(wide(path), FILE_WRITE_ATTRIBUTES, FILE_SHARE_READ | FILE_SHARE_WRITE,
                                              nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr));
    if (entry) SetFileTime(entry.get(), nullptr, nullptr, &time);
    if ((facts.attributes & kept_attributes) != 0) SetFileAttributesW(wide(path), facts.attributes & kept_attributes);
  }

  void remove(TextView name) override {
    if (DeleteFileW(wide(below(name))) == 0) raise_last_error();
  }

  static constexpr TextView extended = u"\\\\?\\";

 private:
  [[nodiscard]] Text below(TextView name) const { return path_ + Text(name); }

  Text path_;
};

/// The full path with nothing left to be understood by the platform.
Text full_path(const Text& path) {
  const wchar_t* const given = path.empty() ? L"." : wide(path);
  const DWORD size = GetFullPathNameW(given, 0, nullptr, nullptr);
  Text full(size, u'\0');
  const DWORD length = GetFullPathNameW(given, size, reinterpret_cast<wchar_t*>(full.data()), nullptr);
  if (length == 0 || length >= size) raise(ErrorNumber::path_not_found);
  full.resize(length);
  if (full.back() != u'\\') full += u'\\';
  if (full.starts_with(Win32Folder::extended)) return full;
  if (full.starts_with(u"\\\\")) return Text(Win32Folder::extended) + u"UNC\\" + full.substr(2);
  return Text(Win32Folder::extended) + full;
}

}  // namespace

std::unique_ptr<Folder> Win32Folders::open(const Text& path) {
  Text full = full_path(path);
  const DWORD attributes = GetFileAttributesW(wide(full));
  if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0) {
    raise(ErrorNumber::path_not_found);
  }
  return std::make_unique<Win32Folder>(std::move(full));
}

}  // namespace talutil::win32
