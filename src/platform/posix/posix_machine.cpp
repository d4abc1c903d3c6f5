#include "platform/posix/posix_machine.hpp"

#include <errno.h>
#include <fcntl.h>
#include <mntent.h>
#include <pwd.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <sys/utsname.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <fstream>
#include <memory>
#include <set>
#include <string>

#include "automation/run_time_error.hpp"
#include "platform/posix/descriptor.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::posix {

namespace {

/// The value of the first "KEY: VALUE" or "KEY=VALUE" line with that key in a system file.
std::string value_in(const char* path, std::string_view key) {
  std::ifstream file(path);
  for (std::string line; std::getline(file, line);) {
    if (!line.starts_with(key)) continue;
    const std::size_t start = line.find_first_not_of(" \t:=\"", key.size());
    if (start == std::string::npos) return {};
    return line.substr(start, line.find_last_not_of(" \t\"") + 1 - start);
  }
  return {};
}

std::uint64_t kilobytes_in_memory_table(std::string_view key) {
  constexpr std::uint64_t kilobyte = 1024;
  return std::strtoull(value_in("/proc/meminfo", key).c_str(), nullptr, 10) * kilobyte;
}

Text kind_of(std::string_view file_system, std::string_view device) {
  constexpr std::string_view network[] = {"nfs", "nfs4", "cifs", "smb3", "9p", "fuse.sshfs"};
  if (std::ranges::find(network, file_system) != std::end(network)) return u"Network";
  if (file_system == "iso9660" || file_system == "udf") return u"CD-ROM";
  if (file_system == "tmpfs" || file_system == "ramfs") return u"RAM disk";
  const std::string name(device.substr(device.find_last_of('/') + 1));
  std::ifstream removable("/sys/class/block/" + name + "/removable");
  if (removable && removable.get() == '1') return u"Removable";
  return u"Fixed";
}

std::optional<Date> local_date(const statx_timestamp& stamp) {
  const time_t seconds = stamp.tv_sec;
  struct tm parts {};
  if (localtime_r(&seconds, &parts) == nullptr) return std::nullopt;
  return date_from_parts(
      {parts.tm_year + 1900, parts.tm_mon + 1, parts.tm_mday, parts.tm_hour, parts.tm_min, std::min(parts.tm_sec, 59)});
}

}  // namespace

std::vector<DriveFacts> PosixMachine::drives() {
  const std::unique_ptr<FILE, int (*)(FILE*)> table(setmntent("/proc/self/mounts", "r"), &endmntent);
  std::vector<DriveFacts> drives;
  std::set<unsigned long> seen;
  if (!table) return drives;
  struct mntent entry {};
  std::array<char, 4096> buffer{};
  while (getmntent_r(table.get(), &entry, buffer.data(), static_cast<int>(buffer.size())) != nullptr) {
    const std::string_view type = entry.mnt_type;
    if (type == "tmpfs" || type == "devtmpfs" || type == "ramfs" || type == "efivarfs") continue;  // Memory.
    struct statvfs status {};
    // File systems without blocks are virtual; one that is mounted twice is listed once.
    if (statvfs(entry.mnt_dir, &status) != 0 || status.f_blocks == 0) continue;
    if (status.f_fsid != 0 && !seen.insert(status.f_fsid).second) continue;
    drives.push_back({from_utf8(entry.mnt_dir), kind_of(entry.mnt_type, entry.mnt_fsname), from_utf8(entry.mnt_fsname),
                      from_utf8(entry.mnt_type), std::uint64_t{status.f_blocks} * status.f_frsize,
                      std::uint64_t{status.f_bavail} * status.f_frsize});
  }
  return drives;
}

MemoryFacts PosixMachine::memory() {
  return {kilobytes_in_memory_table("MemTotal"), kilobytes_in_memory_table("MemAvailable"),
          kilobytes_in_memory_table("SwapTotal"), kilobytes_in_memory_table("SwapFree")};
}

ProcessorFacts PosixMachine::processor() {
  struct utsname system {};
  uname(&system);
  return {from_utf8(value_in("/proc/cpuinfo", "model name")), from_utf8(system.machine),
          static_cast<std::int32_t>(sysconf(_SC_NPROCESSORS_ONLN)),
          static_cast<std::int32_t>(std::strtod(value_in("/proc/cpuinfo", "cpu MHz").c_str(), nullptr))};
}

OperatingSystemFacts PosixMachine::operating_system() {
  struct utsname system {};
  uname(&system);
  timespec up{};
  clock_gettime(CLOCK_BOOTTIME, &up);
  const passwd* const user = getpwuid(getuid());
  const std::string name = value_in("/etc/os-release", "PRETTY_NAME");
  return {from_utf8(name.empty() ? system.sysname : name),
          from_utf8(std::string(system.sysname) + " " + system.release),
          from_utf8(system.nodename),
          user == nullptr ? Text() : from_utf8(user->pw_name),
          u"/",
          static_cast<std::uint64_t>(up.tv_sec)};
}

ItemFacts PosixMachine::item(const Text& path) {
  const std::string native = paths_.native(path);
  struct statx status {};
  if (statx(AT_FDCWD, native.c_str(), 0, STATX_BASIC_STATS | STATX_BTIME, &status) != 0) raise_for(errno, native);
  ItemFacts facts;
  facts.is_folder = S_ISDIR(status.stx_mode);
  facts.size = facts.is_folder ? 0 : status.stx_size;
  facts.attributes = PosixFiles().attributes(path);
  // Some file systems have the field, but nothing in it.
  if ((status.stx_mask & STATX_BTIME) != 0 && status.stx_btime.tv_sec != 0)
    facts.created = local_date(status.stx_btime);
  facts.modified = local_date(status.stx_mtime);
  facts.accessed = local_date(status.stx_atime);
  return facts;
}

}  // namespace talutil::posix
