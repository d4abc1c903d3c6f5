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

// Documented codes that the tool chain's headers lack.
constexpr DWORD virus_infected = 225;
constexpr DWORD virus_deleted = 226;
constexpr DWORD disk_quota_exceeded = 1295;

constexpr Meaning meanings[] = {
    {ERROR_FILE_NOT_FOUND, ErrorNumber::file_not_found},
    {ERROR_PATH_NOT_FOUND, ErrorNumber::path_not_found},
    {ERROR_INVALID_DRIVE, ErrorNumber::path_not_found},
    {ERROR_BAD_NETPATH, ErrorNumber::path_not_found},
    {ERROR_BAD_NET_NAME, ErrorNumber::path_not_found},
    {ERROR_NETNAME_DELETED, ErrorNumber::path_not_found},
    {ERROR_SEM_TIMEOUT, ErrorNumber::path_not_found},
    {ERROR_NETWORK_UNREACHABLE, ErrorNumber::path_not_found},
    {ERROR_HOST_UNREACHABLE, ErrorNumber::path_not_found},
    {ERROR_NO_NET_OR_BAD_PATH, ErrorNumber::path_not_found},
    {ERROR_DEV_NOT_EXIST, ErrorNumber::path_not_found},
    {ERROR_NETWORK_ACCESS_DENIED, ErrorNumber::path_not_found},
    {ERROR_SESSION_CREDENTIAL_CONFLICT, ErrorNumber::path_file_access},
    {ERROR_LOGON_FAILURE, ErrorNumber::path_file_access},
    {virus_infected, ErrorNumber::path_file_access},
    {virus_deleted, ErrorNumber::path_file_access},
    {ERROR_DELETE_PENDING, ErrorNumber::permission_denied},
    {ERROR_USER_MAPPED_FILE, ErrorNumber::permission_denied},
    {ERROR_CANT_ACCESS_FILE, ErrorNumber::permission_denied},
    {disk_quota_exceeded, ErrorNumber::disk_full},
    {ERROR_FILE_EXISTS, ErrorNumber::file_already_exists},
    {ERROR_ALREADY_EXISTS, ErrorNumber::file_already_exists},
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
