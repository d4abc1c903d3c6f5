#include "platform/win32/win32_files.hpp"

#include <algorithm>
#include <array>

#include "automation/run_time_error.hpp"
#include "platform/file_names.hpp"
#include "platform/win32/extended_path.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/replacement.hpp"
#include "platform/win32/stored_files.hpp"

namespace talutil::win32 {

namespace {

// The sharing mode of sequential files: others may read and write meanwhile.
constexpr DWORD shared = FILE_SHARE_READ | FILE_SHARE_WRITE;

bool drive_is_missing(const Text& path) {
  return path.find(u':') == 1 && GetDriveTypeW(wide(path.substr(0, 2) + u"\\")) <= DRIVE_NO_ROOT_DIR;
}

/// Some systems report a missing drive as a missing file.
[[noreturn]] void raise_for_path(DWORD code, const Text& path) {
  raise_for(drive_is_missing(path) ? ERROR_PATH_NOT_FOUND : code);
}

/// Raises the error of an invalid name, and 75 if a read-only file is to be written, because some systems let an
/// administrator do that.
void require_usable(const Text& path, bool is_to_be_written) {
  require_file_name(path);
  if (path.size() >= MAX_PATH) raise(ErrorNumber::bad_file_name_or_number);
  if (!is_to_be_written) return;
  const DWORD attributes = GetFileAttributesW(wide(path));
  if (attributes == INVALID_FILE_ATTRIBUTES) return;
  constexpr DWORD refused = FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_DIRECTORY;
  if ((attributes & refused) != 0) raise(ErrorNumber::path_file_access);
}

Owned<kind::File> open_file(const Text& path, DWORD access, DWORD sharing, DWORD disposition) {
  require_usable(path, access != GENERIC_READ);
  Owned<kind::File> file(
      CreateFileW(wide(path), access, sharing, nullptr, disposition, FILE_ATTRIBUTE_NORMAL, nullptr));
  if (!file) raise_for_path(GetLastError(), path);
  if (GetFileType(file.get()) != FILE_TYPE_DISK) raise(ErrorNumber::bad_file_name_or_number);
  return file;
}

class Win32InputFile final : public InputFile {
 public:
  explicit Win32InputFile(const Text& path) : file_(open_file(path, GENERIC_READ, shared, OPEN_EXISTING)) {
    LARGE_INTEGER size{};
    if (GetFileSizeEx(file_.get(), &size) == 0) raise_last_error();
    size_ = static_cast<std::uint64_t>(size.QuadPart);
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return size_; }

  std::size_t read(std::span<char> buffer) override {
    DWORD count = 0;
    if (ReadFile(file_.get(), buffer.data(), static_cast<DWORD>(buffer.size()), &count, nullptr) == 0) {
      raise_last_error();
    }
    return count;
  }

 private:
  Owned<kind::File> file_;
  std::uint64_t size_ = 0;
};

class Win32OutputFile final : public OutputFile {
 public:
  explicit Win32OutputFile(const Text& path) : path_(path), replaces_(is_there(path)), replacement_(folder_of(path)) {}

  void write(std::string_view bytes) override { write_all(replacement_.file(), bytes); }

  void close() override {
    replacement_.take_name(Text(last_part(path_)), 0, replaces_ || GetFileAttributesW(wide(path_)) != missing,
                           Replacement::Keep::attributes_and_rights);
  }

 private:
  static constexpr DWORD missing = INVALID_FILE_ATTRIBUTES;

  /// Whether there is a target. Problems with it are reported now, not after everything has been written.
  [[nodiscard]] static bool is_there(const Text& path) {
    require_usable(path, true);
    Owned<kind::File> target;
    const auto open = [&] {
      target.reset(CreateFileW(wide(path), GENERIC_WRITE, shared, nullptr, OPEN_EXISTING, 0, nullptr));
      return target ? TRUE : FALSE;
    };
    // A missing right is not waited for.
    const DWORD reason = retried(open, &is_in_use);
    if (!target && (reason != ERROR_FILE_NOT_FOUND || drive_is_missing(path))) raise_for_path(reason, path);
    return static_cast<bool>(target);
  }

  [[nodiscard]] static Text folder_of(const Text& path) {
    Text folder = extended_path(path.substr(0, path.size() - last_part(path).size()));
    return folder.back() == u'\\' ? folder : folder + u'\\';
  }

  Text path_;
  bool replaces_;
  Replacement replacement_;
};

/// The right to append to a file, which its other appenders wait for.
class AppendLock {
 public:
  AppendLock(HANDLE file, OVERLAPPED& place) : file_(file), place_(place) {
    const DWORD code =
        retried([&] { return LockFileEx(file, LOCKFILE_EXCLUSIVE_LOCK | LOCKFILE_FAIL_IMMEDIATELY, 0, 1, 0, &place); });
    is_locked_ = code == 0;
    // Some stores have no locks; a line may then be torn, but is not lost.
    if (!is_locked_ && code != ERROR_INVALID_FUNCTION && code != ERROR_NOT_SUPPORTED) raise_for(code);
  }
  AppendLock(const AppendLock&) = delete;
  AppendLock& operator=(const AppendLock&) = delete;
  ~AppendLock() {
    if (is_locked_) UnlockFileEx(file_, 0, 1, 0, &place_);
  }

 private:
  HANDLE file_;
  OVERLAPPED& place_;
  bool is_locked_ = false;
};

bool is_nothing_found(DWORD code) {
  constexpr DWORD codes[] = {ERROR_FILE_NOT_FOUND, ERROR_PATH_NOT_FOUND,      ERROR_NO_MORE_FILES, ERROR_BAD_NETPATH,
                             ERROR_BAD_NET_NAME,   ERROR_NETWORK_UNREACHABLE, ERROR_NOT_READY};
  return std::ranges::find(codes, code) != std::end(codes);
}

}  // namespace

void Win32Files::search(const Text& pattern, std::uint32_t mask, const std::function<bool(TextView name)>& found) {
  constexpr DWORD passed_over = FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_DIRECTORY;
  require_pattern(pattern);
  WIN32_FIND_DATAW entry;
  const Text whole = is_open_ended(pattern) ? pattern + u"*.*" : pattern;
  const Owned<kind::FileSearch> search(FindFirstFileW(wide(whole), &entry));
  if (!search) {
    const DWORD reason = GetLastError();
    if (is_nothing_found(reason)) return;
    raise_for(reason);
  }
  do {
    if ((entry.dwFileAttributes & passed_over & ~mask) != 0) continue;
    if (!found(view(entry.cFileName, wcslen(entry.cFileName)))) return;
  } while (find_next(search, entry));
}

std::uint32_t Win32Files::attributes(const Text& path) {
  const DWORD result = GetFileAttributesW(wide(path));
  if (result == INVALID_FILE_ATTRIBUTES) raise_last_error();
  return result;
}

bool Win32Files::make_path(const Text& path) {
  const std::size_t last = path.find_last_of(separators);
  if (last == Text::npos) return true;
  // What there is already, a drive or a share among it, refuses; what counts is whether there is a folder at the end.
  for (std::size_t end = path.find_first_of(separators); end != Text::npos;
       end = path.find_first_of(separators, end + 1)) {
    if (end > 0) CreateDirectoryW(wide(path.substr(0, end)), nullptr);
  }
  const DWORD attributes = GetFileAttributesW(wide(path.substr(0, last + 1)));
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

Text Win32Files::current_folder(TextView drive) {
  std::array<wchar_t, MAX_PATH + 1> folder{};
  const Text relative = drive.empty() ? Text(u".") : Text(drive) + u":.";
  if (!drive.empty() && GetDriveTypeW(wide(Text(drive) + u":\\")) == DRIVE_NO_ROOT_DIR) return {};
  const DWORD length = GetFullPathNameW(wide(relative), static_cast<DWORD>(folder.size()), folder.data(), nullptr);
  return length < folder.size() ? Text(view(folder.data(), length)) : Text();
}

std::unique_ptr<InputFile> Win32Files::open_input(const Text& path) { return std::make_unique<Win32InputFile>(path); }

std::unique_ptr<OutputFile> Win32Files::open_output(const Text& path) {
  return std::make_unique<Win32OutputFile>(path);
}

void Win32Files::append(const Text& path, std::string_view bytes) {
  const Owned<kind::File> file = open_file(path, FILE_APPEND_DATA | GENERIC_READ, shared, OPEN_ALWAYS);
  // Locks a byte beyond the end of any file: appending processes wait for each other, others are unaffected.
  OVERLAPPED far_byte{};
  far_byte.OffsetHigh = 0x3FFFFFFF;  // Some network stores refuse positions beyond 2^62.
  const AppendLock turn(file.get(), far_byte);
  LARGE_INTEGER before{};
  if (GetFileSizeEx(file.get(), &before) == 0) raise_last_error();
  try {
    write_all(file, bytes);
  } catch (const RunTimeError&) {
    // A partial line is worse than none, because the next one would be joined to it.
    const Owned<kind::File> whole = open_file(path, GENERIC_WRITE, shared, OPEN_EXISTING);
    if (SetFilePointerEx(whole.get(), before, nullptr, FILE_BEGIN) == 0 || SetEndOfFile(whole.get()) == 0) {
      raise(ErrorNumber::device_io_error);
    }
    throw;
  }
}

}  // namespace talutil::win32
