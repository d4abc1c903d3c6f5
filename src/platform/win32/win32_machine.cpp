#include "platform/win32/win32_machine.hpp"

#include <algorithm>
#include <array>

#include "automation/numbers.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/last_error.hpp"

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

Text registry_text(const wchar_t* key, const wchar_t* value) {
  std::array<wchar_t, 256> text{};
  DWORD size = sizeof text - sizeof(wchar_t);
  if (RegGetValueW(HKEY_LOCAL_MACHINE, key, value, RRF_RT_REG_SZ, nullptr, text.data(), &size) != ERROR_SUCCESS) {
    return {};
  }
  return Text(trim_blanks(up_to_nul(view(text.data(), text.size()))));
}

std::int32_t registry_number(const wchar_t* key, const wchar_t* value) {
  DWORD number = 0;
  DWORD size = sizeof number;
  RegGetValueW(HKEY_LOCAL_MACHINE, key, value, RRF_RT_REG_DWORD, nullptr, &number, &size);
  return static_cast<std::int32_t>(number);
}

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
  FILETIME local{};
  SYSTEMTIME parts{};
  if ((time.dwLowDateTime | time.dwHighDateTime) == 0 || FileTimeToLocalFileTime(&time, &local) == FALSE ||
      FileTimeToSystemTime(&local, &parts) == FALSE) {
    return std::nullopt;
  }
  return date_from_parts({parts.wYear, parts.wMonth, parts.wDay, parts.wHour, parts.wMinute, parts.wSecond});
}

}  // namespace

std::vector<DriveFacts> Win32Machine::drives() {
  std::vector<DriveFacts> drives;
  // Suppresses the box that asks for a disk to be inserted.
  const UINT before = SetErrorMode(SEM_FAILCRITICALERRORS);
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
  SetErrorMode(before);
  return drives;
}

MemoryFacts Win32Machine::memory() {
  MEMORYSTATUSEX status{};
  status.dwLength = sizeof status;
  GlobalMemoryStatusEx(&status);
  // The platform includes physical memory in its page file figures.
  const auto beyond = [](DWORDLONG pages, DWORDLONG memory) { return pages - std::min(pages, memory); };
  return {status.ullTotalPhys, status.ullAvailPhys, beyond(status.ullTotalPageFile, status.ullTotalPhys),
          beyond(status.ullAvailPageFile, status.ullAvailPhys)};
}

ProcessorFacts Win32Machine::processor() {
  SYSTEM_INFO system{};
  GetNativeSystemInfo(&system);
  return {registry_text(processor_key, L"ProcessorNameString"), architecture_words(system.wProcessorArchitecture),
          static_cast<std::int32_t>(system.dwNumberOfProcessors), registry_number(processor_key, L"~MHz")};
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
  Text version = registry_text(system_key, L"CurrentVersion");
  if (const Text build = registry_text(system_key, L"CurrentBuildNumber"); !build.empty())
    version += u", build " + build;
  if (const Text service_pack = registry_text(system_key, L"CSDVersion"); !service_pack.empty()) {
    version += u", " + service_pack;
  }
  return {registry_text(system_key, L"ProductName"),
          version,
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
