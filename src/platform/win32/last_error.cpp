#include "platform/win32/last_error.hpp"

#include <algorithm>
#include <iterator>

#include "automation/run_time_error.hpp"

namespace talutil::win32 {

namespace {

struct Meaning {
  DWORD code;
  ErrorNumber number;
};

constexpr Meaning meanings[] = {
    {ERROR_FILE_NOT_FOUND, ErrorNumber::file_not_found},
    {ERROR_PATH_NOT_FOUND, ErrorNumber::path_not_found},
    {ERROR_INVALID_DRIVE, ErrorNumber::path_not_found},
    {ERROR_BAD_NETPATH, ErrorNumber::path_not_found},
    {ERROR_BAD_NET_NAME, ErrorNumber::path_not_found},
    {ERROR_TOO_MANY_OPEN_FILES, ErrorNumber::too_many_files},
    {ERROR_ACCESS_DENIED, ErrorNumber::path_file_access},
    {ERROR_WRITE_PROTECT, ErrorNumber::path_file_access},
    {ERROR_CANT_RESOLVE_FILENAME, ErrorNumber::path_file_access},
    {ERROR_NOT_READY, ErrorNumber::disk_not_ready},
    {ERROR_SHARING_VIOLATION, ErrorNumber::permission_denied},
    {ERROR_LOCK_VIOLATION, ErrorNumber::permission_denied},
    {ERROR_UNABLE_TO_REMOVE_REPLACED, ErrorNumber::permission_denied},
    {ERROR_HANDLE_DISK_FULL, ErrorNumber::disk_full},
    {ERROR_DISK_FULL, ErrorNumber::disk_full},
    {ERROR_INVALID_NAME, ErrorNumber::bad_file_name_or_number},
    {ERROR_BAD_PATHNAME, ErrorNumber::bad_file_name_or_number},
    {ERROR_DIRECTORY, ErrorNumber::path_not_found},
    {ERROR_FILENAME_EXCED_RANGE, ErrorNumber::bad_file_name_or_number},
    {ERROR_BUFFER_OVERFLOW, ErrorNumber::bad_file_name_or_number},
};

}  // namespace

void raise_for(DWORD code) {
  const auto* const found = std::ranges::find(meanings, code, &Meaning::code);
  raise(found != std::end(meanings) ? found->number : ErrorNumber::device_io_error);
}

}  // namespace talutil::win32
