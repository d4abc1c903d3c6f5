#include "platform/win32/replacement.hpp"

#include <array>
#include <atomic>
#include <cstddef>
#include <utility>
#include <vector>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "platform/folders.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/stored_files.hpp"

namespace talutil::win32 {

namespace {

/// The beginning of the names of this machine's temporary files: shares have those of others, too.
const Text& machine_prefix() {
  static const Text prefix = [] {
    std::array<wchar_t, MAX_COMPUTERNAME_LENGTH + 1> name{};
    DWORD length = static_cast<DWORD>(name.size());
    if (GetComputerNameW(name.data(), &length) == 0) length = 0;
    return Text(temporary_prefix) + short_name_of(view(name.data(), length)) + u"-";
  }();
  return prefix;
}

bool is_running(DWORD process) {
  const Owned<kind::KernelObject> opened(OpenProcess(PROCESS_QUERY_LIMITED_INFORMATION, FALSE, process));
  DWORD code = STILL_ACTIVE;
  // Any other reason than that there is none means that it cannot be looked at.
  if (!opened) return GetLastError() != ERROR_INVALID_PARAMETER;
  return GetExitCodeProcess(opened.get(), &code) == 0 || code == STILL_ACTIVE;
}

/// Whether nobody is going to name a temporary file any more: its process has ended, or it is older than a day.
bool is_stale(const WIN32_FIND_DATAW& entry) {
  const TextView name = view(entry.cFileName, wcslen(entry.cFileName));
  if (name.starts_with(machine_prefix())) {
    const DWORD process = wcstoul(entry.cFileName + machine_prefix().size(), nullptr, 10);
    if (!is_running(process)) return true;
  }
  FILETIME now{};
  GetSystemTimeAsFileTime(&now);
  constexpr std::uint64_t day = 864'000'000'000;
  return joined(entry.ftLastWriteTime.dwHighDateTime, entry.ftLastWriteTime.dwLowDateTime) + day <
         joined(now.dwHighDateTime, now.dwLowDateTime);
}

}  // namespace

Text short_name_of(TextView name) {
  std::uint32_t hash = 0x811C9DC5;  // FNV-1a.
  for (const char16_t unit : name) hash = (hash ^ unit) * 0x01000193;
  return number_to_text(static_cast<std::int32_t>(hash >> 1U));
}

bool is_in_use(DWORD code) noexcept { return code == ERROR_SHARING_VIOLATION || code == ERROR_LOCK_VIOLATION; }

bool is_passing(DWORD code) noexcept {
  return is_in_use(code) || code == ERROR_ACCESS_DENIED || code == ERROR_DELETE_PENDING ||
         code == ERROR_USER_MAPPED_FILE;
}

void write_all(const Owned<kind::File>& file, std::string_view bytes) {
  constexpr std::size_t longest = 1U << 24U;
  while (!bytes.empty()) {
    const std::string_view part = bytes.substr(0, longest);
    DWORD written = 0;
    if (WriteFile(file.get(), part.data(), static_cast<DWORD>(part.size()), &written, nullptr) == 0) raise_last_error();
    if (written == 0) raise(ErrorNumber::disk_full);
    bytes.remove_prefix(written);
  }
}

Replacement::Replacement(Text folder) : folder_(std::move(folder)) {
  remove_stale();
  static std::atomic<std::int32_t> next{0};
  do {
    temporary_ = folder_ + machine_prefix() + number_to_text(static_cast<std::int32_t>(GetCurrentProcessId())) + u"-" +
                 number_to_text(next++);
    file_.reset(CreateFileW(wide(temporary_), GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ, nullptr, CREATE_NEW,
                            FILE_ATTRIBUTE_HIDDEN, nullptr));
  } while (!file_ && GetLastError() == ERROR_FILE_EXISTS);
  if (file_) return;
  temporary_.clear();
  raise_last_error();
}

Replacement::~Replacement() {
  file_.reset();
  if (temporary_.empty()) return;
  // If it cannot be removed, it is when this process has ended.
  static_cast<void>(retried([&] { return DeleteFileW(wide(temporary_)); }));
}

/// Removes what killed processes have left. Files that others are about to name stay.
void Replacement::remove_stale() const {
  WIN32_FIND_DATAW entry;
  const Owned<kind::FileSearch> search(FindFirstFileW(wide(folder_ + Text(temporary_prefix) + u"*"), &entry));
  if (!search) return;
  do {
    if (is_stale(entry)) DeleteFileW(wide(folder_ + Text(view(entry.cFileName, wcslen(entry.cFileName)))));
  } while (FindNextFileW(search.get(), &entry) != 0);
}

/// Gives the new version the time of creation, the attributes and the rights of the old one; the latter only if this
/// user may change them.
///
/// ReplaceFile would do so too, but takes the name from the old file before it gives it to the new one, so that a
/// process that is killed in between leaves no file of that name.
void Replacement::keep_properties(const Text& target) const {
  std::vector<std::byte> rights;
  DWORD size = 0;
  GetFileSecurityW(wide(target), DACL_SECURITY_INFORMATION, nullptr, 0, &size);
  rights.resize(size);
  if (GetFileSecurityW(wide(target), DACL_SECURITY_INFORMATION, rights.data(), size, &size) != 0) {
    SetFileSecurityW(wide(temporary_), DACL_SECURITY_INFORMATION, rights.data());
  }
  WIN32_FILE_ATTRIBUTE_DATA facts{};
  if (GetFileAttributesExW(wide(target), GetFileExInfoStandard, &facts) == 0) return;
  const Owned<kind::File> file(CreateFileW(wide(temporary_), FILE_WRITE_ATTRIBUTES, FILE_SHARE_READ | FILE_SHARE_WRITE,
                                           nullptr, OPEN_EXISTING, 0, nullptr));
  if (file) SetFileTime(file.get(), &facts.ftCreationTime, nullptr, nullptr);
  SetFileAttributesW(wide(temporary_), facts.dwFileAttributes);
}

void Replacement::take_name(const Text& name, DWORD attributes, bool replaces, Keep keep) {
  const Text target = folder_ + name;
  if (FlushFileBuffers(file_.get()) == 0) raise_last_error();
  file_.reset();
  SetFileAttributesW(wide(temporary_), attributes == 0 ? FILE_ATTRIBUTE_NORMAL : attributes);
  if (replaces && keep == Keep::attributes_and_rights) keep_properties(target);
  const DWORD how = MOVEFILE_WRITE_THROUGH | (replaces ? MOVEFILE_REPLACE_EXISTING : 0);
  const DWORD code = retried([&] { return MoveFileExW(wide(temporary_), wide(target), how); });
  if (code == ERROR_ALREADY_EXISTS || code == ERROR_FILE_EXISTS) raise(ErrorNumber::permission_denied);
  if (code != 0 && replaces && is_passing(code)) return overwrite(target);
  if (code != 0) raise_for(code);
  temporary_.clear();
}

/// The one step that is not atomic: for files that others have open, and in folders where files cannot be replaced.
void Replacement::overwrite(const Text& target) {
  constexpr DWORD shared = FILE_SHARE_READ | FILE_SHARE_WRITE;
  const Owned<kind::File> from(
      CreateFileW(wide(temporary_), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr));
  if (!from) raise_last_error();
  const Owned<kind::File> to(CreateFileW(wide(target), GENERIC_WRITE, shared, nullptr, OPEN_EXISTING, 0, nullptr));
  // It was writable a moment ago, so what prevents it is that another program has it open.
  if (!to) raise(ErrorNumber::permission_denied);
  try {
    std::array<char, 1U << 16U> buffer;
    for (;;) {
      DWORD count = 0;
      if (ReadFile(from.get(), buffer.data(), static_cast<DWORD>(buffer.size()), &count, nullptr) == 0) {
        raise_last_error();
      }
      if (count == 0) break;
      write_all(to, std::string_view(buffer.data(), count));
    }
    // Cut off at the end and not at the beginning, so that the old contents remain as long as possible.
    if (SetEndOfFile(to.get()) == 0 || FlushFileBuffers(to.get()) == 0) raise_last_error();
  } catch (const RunTimeError& error) {
    const Text kept = std::exchange(temporary_, {});
    throw RunTimeError(error.number(), error.description() + u": " + target + u"; its new contents are in " + kept);
  }
}

}  // namespace talutil::win32
