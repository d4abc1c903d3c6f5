#include "platform/posix/streams.hpp"

#include <errno.h>
#include <fcntl.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>

namespace talutil::posix {

namespace {

/// The number of the descriptor of this process that a path below /proc names; -1 for any other path.
int own_descriptor(const std::filesystem::path& path) {
  const std::string name = path.filename();
  const bool is_number = !name.empty() && std::ranges::all_of(name, [](char c) { return c >= '0' && c <= '9'; });
  if (!is_number) return -1;
  std::error_code error;
  const auto folder = std::filesystem::canonical(path.parent_path(), error);
  if (error || folder != "/proc/" + std::to_string(getpid()) + "/fd") return -1;
  return atoi(name.c_str());
}

}  // namespace

Descriptor open_stream(const std::string& given) {
  constexpr int most_links = 40;
  std::filesystem::path path = given;
  std::error_code error;
  for (int links = 0; links < most_links && std::filesystem::is_symlink(path, error); ++links) {
    if (const int number = own_descriptor(path); number >= 0) {
      Descriptor copy(fcntl(number, F_DUPFD_CLOEXEC, 0));
      if (copy.get() < 0) raise_for(errno, given);
      return copy;
    }
    path = path.parent_path() / std::filesystem::read_symlink(path, error);
  }
  struct stat status {};
  if (stat(given.c_str(), &status) != 0 || S_ISREG(status.st_mode) || S_ISDIR(status.st_mode)) return Descriptor();
  Descriptor file(open(given.c_str(), O_WRONLY | O_CLOEXEC));
  if (file.get() < 0) raise_for(errno, given);
  return file;
}

}  // namespace talutil::posix
