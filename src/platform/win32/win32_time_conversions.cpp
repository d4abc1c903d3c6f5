#include "platform/win32/win32_time_conversions.hpp"

#include <bit>

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

namespace {

// The layouts equal those of the platform's structures, except for signedness.
FILETIME native(FileTime time) noexcept { return std::bit_cast<FILETIME>(time); }
FileTime ours(FILETIME time) noexcept { return std::bit_cast<FileTime>(time); }

}  // namespace

void Win32TimeConversions::system_to_file(const SystemTime& time, FileTime& result) {
  const auto from = std::bit_cast<SYSTEMTIME>(time);
  FILETIME to = native(result);
  SystemTimeToFileTime(&from, &to);
  result = ours(to);
}

void Win32TimeConversions::file_to_system(FileTime time, SystemTime& result) {
  const FILETIME from = native(time);
  auto to = std::bit_cast<SYSTEMTIME>(result);
  FileTimeToSystemTime(&from, &to);
  result = std::bit_cast<SystemTime>(to);
}

void Win32TimeConversions::local_to_utc(FileTime local, FileTime& utc) {
  const FILETIME from = native(local);
  FILETIME to = native(utc);
  LocalFileTimeToFileTime(&from, &to);
  utc = ours(to);
}

void Win32TimeConversions::utc_to_local(FileTime utc, FileTime& local) {
  const FILETIME from = native(utc);
  FILETIME to = native(local);
  FileTimeToLocalFileTime(&from, &to);
  local = ours(to);
}

}  // namespace talutil::win32
