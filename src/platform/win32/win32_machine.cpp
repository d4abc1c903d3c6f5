#include "platform/win32/win32_machine.hpp"

#include <algorithm>
#include <array>

#include "automation/numbers.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"
#include "platform/win32/windows_version.hpp"

namespace talutil::win32 {

namespace {

constexpr const wchar_t* processor_key = L"HARDWARE\\DESCRIPTION\\System\\CentralProcessor\\0";
constexpr const wchar_t* system_key = L"SOFTWARE\\Microsoft\\Windows NT\\CurrentVersion";

Text kind_of(const Text& root) {
  switch (GetDriveTypeW(wide(root))) {
    case DRIVE_REMOVABLE:
      return u"Removable";
    case DRIVE_FIXED:
      return u"Fixed";
    case DRIVE_REMOTE:
      return u"Network";
    case DRIVE_CDROM:
      return u"CD-ROM";
    case DRIVE_RAMDISK:
      return u"RAM disk";
    default:
      return u"Unknown";
  }
}

/// A key of the machine as 64-bit programs see it: to others the system shows values of its own.
Owned<kind::RegistryKey> machine_key(const wchar_t* path) {
  Owned<kind::RegistryKey> key;
  RegOpenKeyExW(HKEY_LOCAL_MACHINE, path, 0, KEY_QUERY_VALUE | KEY_WOW64_64KEY, key.receive());
  return key;
}

Text text_of(const Owned<kind::RegistryKey>& key, const wchar_t* value) {
  std::array<wchar_t, 256> text{};
  DWORD size = sizeof text - sizeof(wchar_t);
  if (RegGetValueW(key.get(), nullptr, value, RRF_RT_REG_SZ, nullptr, text.data(), &size) != ERROR_SUCCESS) return {};
  return Text(trim_blanks(up_to_nul(view(text.data(), text.size()))));
}

std::int32_t number_of(const Owned<kind::RegistryKey>& key, const wchar_t* value) {
  DWORD number = 0;
  DWORD size = sizeof number;
  RegGetValueW(key.get(), nullptr, value, RRF_RT_REG_DWORD, nullptr, &number, &size);
  return static_cast<std::int32_t>(number);
}

/// The machine's own architecture, also where it emulates this program's.
WORD native_architecture() {
  using Ask = BOOL(WINAPI*)(HANDLE, USHORT*, USHORT*);
  constexpr USHORT arm64 = 0xAA64;  // IMAGE_FILE_MACHINE_ARM64
  USHORT process = 0;
  USHORT machine = 0;
  const auto ask = late_function<Ask>(L"kernel32.dll", "IsWow64Process2");
  if (ask != nullptr && ask(GetCurrentProcess(), &process, &machine) != FALSE && machine == arm64) {
    return PROCESSOR_ARCHITECTURE_ARM64;
  }
  SYSTEM_INFO system{};
  GetNativeSystemInfo(&system);
  return system.wProcessorArchitecture;
}

/// Adds up the page files; the other figures of the system count memory as well.
class PageFiles {
 public:
  std::uint64_t total = 0;
  std::uint64_t used = 0;

  PageFiles() {
    const auto enumerate = late_function<BOOL(WINAPI*)(BOOL(CALLBACK*)(void*, File*, const wchar_t*), void*)>(
        L"psapi.dll", "EnumPageFilesW");
    if (enumerate == nullptr) return;
    enumerate(&add, this);
    SYSTEM_INFO system{};
    GetSystemInfo(&system);
    total *= system.dwPageSize;
    used *= system.dwPageSize;
  }

 private:
  struct File {  // ENUM_PAGE_FILE_INFORMATION
    DWORD size, reserved;
    SIZE_T total, used, most_used;
  };

  static BOOL CALLBACK add(void* sums, File* file, const wchar_t* /*name*/) {
    static_cast<PageFiles*>(sums)->total += file->total;
    static_cast<PageFiles*>(sums)->used += file->used;
    return TRUE;
  }
};

Text architecture_words(WORD architecture) {
  switch (architecture) {
    case PROCESSOR_ARCHITECTURE_INTEL:
      return u"x86";
    case PROCESSOR_ARCHITECTURE_AMD64:
      return u"x64";
    case PROCESSOR_ARCHITECTURE_ARM64:
      return u"ARM64";
    default:
      return u"Unknown";
  }
}

std::optional<Date> local_date(const FILETIME& time) {
  SYSTEMTIME utc{};
  SYSTEMTIME parts{};
  // By the daylight saving time of that day, not of today.
  if ((time.dwLowDateTime | time.dwHighDateTime) == 0 || FileTimeToSystemTime(&time, &utc) == FALSE ||
      SystemTimeToTzSpecificLocalTime(nullptr, &utc, &parts) == FALSE) {
    return std::nullopt;
  }
  return date_from_parts({parts.wYear, parts.wMonth, parts.wDay, parts.wHour, parts.wMinute, parts.wSecond});
}

}  // namespace

std::vector<DriveFacts> Win32Machine::drives() {
  std::vector<DriveFacts> drives;
  // Suppresses the box that asks for a disk to be inserted.
  DWORD before = 0;
  SetThreadErrorMode(SEM_FAILCRITICALERRORS, &before);
  const DWORD present = GetLogicalDrives();
  for (int letter = 0; letter < 26; ++letter) {
    if ((present >> letter & 1) == 0) continue;
    DriveFacts& drive = drives.emplace_back();
    drive.name = {static_cast<char16_t>(u'A' + letter), u':'};
    const Text root = drive.name + u"\\";
    drive.kind = kind_of(root);
    std::array<wchar_t, MAX_PATH + 1> label{};
    std::array<wchar_t, MAX_PATH + 1> file_system{};
    ULARGE_INTEGER available{};
    ULARGE_INTEGER total{};
    if (GetVolumeInformationW(wide(root), label.data(), static_cast<DWORD>(label.size()), nullptr, nullptr, nullptr,
                              file_system.data(), static_cast<DWORD>(file_system.size())) == FALSE ||
        GetDiskFreeSpaceExW(wide(root), &available, &total, nullptr) == FALSE) {
      continue;
    }
    drive.label = up_to_nul(view(label.data(), label.size()));
    drive.file_system = up_to_nul(view(file_system.data(), file_system.size()));
    drive.total = total.QuadPart;
    drive.free = available.QuadPart;
  }
  SetThreadErrorMode(before, nullptr);
  return drives;
}

MemoryFacts Win32Machine::memory() {
  MEMORYSTATUSEX status{};
  status.dwLength = sizeof status;
  GlobalMemoryStatusEx(&status);
  const PageFiles files;
  return {status.ullTotalPhys, status.ullAvailPhys, files.total, files.total - std::min(files.total, files.used)};
}

ProcessorFacts Win32Machine::processor() {
  SYSTEM_INFO system{};
  GetNativeSystemInfo(&system);
  const Owned<kind::RegistryKey> key = machine_key(processor_key);
  return {text_of(key, L"ProcessorNameString"), architecture_words(native_architecture()),
          static_cast<std::int32_t>(system.dwNumberOfProcessors), number_of(key, L"~MHz")};
}

OperatingSystemFacts Win32Machine::operating_system() {
  std::array<wchar_t, MAX_COMPUTERNAME_LENGTH + 1> computer{};
  auto computer_size = static_cast<DWORD>(computer.size());
  GetComputerNameW(computer.data(), &computer_size);
  std::array<wchar_t, 257> user{};
  auto user_size = static_cast<DWORD>(user.size());
  GetUserNameW(user.data(), &user_size);
  std::array<wchar_t, MAX_PATH> folder{};
  GetWindowsDirectoryW(folder.data(), static_cast<UINT>(folder.size()));
  const Owned<kind::RegistryKey> key = machine_key(system_key);
  const RegisteredVersion registered{.product = text_of(key, L"ProductName"),
                                     .version = text_of(key, L"CurrentVersion"),
                                     .major = number_of(key, L"CurrentMajorVersionNumber"),
                                     .minor = number_of(key, L"CurrentMinorVersionNumber"),
                                     .build = text_of(key, L"CurrentBuildNumber"),
                                     .revision = number_of(key, L"UBR"),
                                     .release = text_of(key, L"DisplayVersion"),
                                     .service_pack = text_of(key, L"CSDVersion")};
  return {windows_name(registered),
          windows_version(registered),
          Text(up_to_nul(view(computer.data(), computer.size()))),
          Text(up_to_nul(view(user.data(), user.size()))),
          Text(up_to_nul(view(folder.data(), folder.size()))),
          GetTickCount64() / 1000};
}

ItemFacts Win32Machine::item(const Text& path) {
  WIN32_FILE_ATTRIBUTE_DATA data{};
  if (GetFileAttributesExW(wide(path), GetFileExInfoStandard, &data) == FALSE) raise_last_error();
  ItemFacts facts;
  constexpr DWORD known =
      FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_DIRECTORY;
  facts.attributes = data.dwFileAttributes & known;
  facts.is_folder = (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  if (!facts.is_folder) facts.size = (std::uint64_t{data.nFileSizeHigh} << 32) | data.nFileSizeLow;
  facts.created = local_date(data.ftCreationTime);
  facts.modified = local_date(data.ftLastWriteTime);
  facts.accessed = local_date(data.ftLastAccessTime);
  return facts;
}

}  // namespace talutil::win32
