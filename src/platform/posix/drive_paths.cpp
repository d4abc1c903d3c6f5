#include "platform/posix/drive_paths.hpp"

#include <dirent.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <memory>
#include <optional>
#include <system_error>

#include "automation/run_time_error.hpp"
#include "platform/file_names.hpp"
#include "platform/posix/data_folder.hpp"

namespace talutil::posix {

namespace {

constexpr char16_t drive_of_everything = u'z';

std::string drives_root() {
  if (std::string root = environment("TALUTIL_DRIVES"); !root.empty()) return root;
  return data_folder() + "/drives";
}

std::string process_folder() {
  std::error_code error;
  const std::string folder = std::filesystem::current_path(error).string();
  return folder == "/" ? "" : folder;
}

bool exists(const std::string& path) {
  struct stat status {};
  return lstat(path.c_str(), &status) == 0;
}

bool is_folder(const std::string& path) {
  struct stat status {};
  return stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

bool has_drive(TextView path) {
  if (path.size() < 2 || path[1] != u':') return false;
  const char16_t letter = lower_case(path[0]);
  return letter >= u'a' && letter <= u'z';
}

bool is_separator(char16_t unit) { return separators.find(unit) != TextView::npos; }

/// The actual spelling of a name in a folder; nothing if the folder has no such entry.
std::optional<std::string> find_entry(const std::string& folder, TextView name) {
  std::string spelled = to_utf8(name);
  if (exists(folder + "/" + spelled)) return spelled;
  const std::unique_ptr<DIR, int (*)(DIR*)> listing(opendir(folder.empty() ? "/" : folder.c_str()), &closedir);
  while (listing) {
    const dirent* const entry = readdir(listing.get());
    if (entry == nullptr) break;
    if (equals_without_case(from_utf8(entry->d_name), name)) return entry->d_name;
  }
  return std::nullopt;
}

TextView without_trailing_dots(TextView name) { return name.substr(0, name.find_last_not_of(u". ") + 1); }

/// The path of an entry in a folder.
std::string below(const std::string& folder, TextView part) {
  if (const auto entry = find_entry(folder, part)) return folder + "/" + *entry;
  const TextView trimmed = without_trailing_dots(part);
  if (trimmed.empty() || trimmed == part) return folder + "/" + to_utf8(part);
  return folder + "/" + find_entry(folder, trimmed).value_or(to_utf8(trimmed));
}

}  // namespace

DrivePaths::DrivePaths() : root_(drives_root()) {}

std::string DrivePaths::folder_of(char16_t letter) const {
  if (letter == drive_of_everything) return "";
  return root_ + "/" + static_cast<char>(letter);
}

char16_t DrivePaths::current_drive() const {
  const std::string folder = process_folder() + "/";
  const std::string opening = root_ + "/";
  const bool on_drive =
      folder.starts_with(opening) && folder.size() > opening.size() + 1 && folder[opening.size() + 1] == '/';
  return on_drive ? static_cast<char16_t>(folder[opening.size()]) : drive_of_everything;
}

DrivePaths::Place DrivePaths::place_of(TextView path) const {
  if (path.starts_with(u"\\\\")) raise(ErrorNumber::path_not_found);
  const bool named = has_drive(path);
  const char16_t letter = named ? lower_case(path[0]) : current_drive();
  if (named) path.remove_prefix(2);
  const std::string drive = folder_of(letter);
  if (!drive.empty() && !is_folder(drive)) raise(ErrorNumber::path_not_found);
  const bool is_relative = path.empty() || !is_separator(path.front());
  // A drive other than the current one is always at its root: nothing here changes its folder.
  return {is_relative && letter == current_drive() ? process_folder() : drive, path};
}

std::string DrivePaths::native(TextView path) const {
  if (path.starts_with(u'/')) {
    std::string as_it_is = to_utf8(path);
    if (exists(as_it_is)) return as_it_is;
  }
  const bool is_native = path.starts_with(u'/');
  auto [result, rest] = is_native ? Place{"", path} : place_of(path);
  const char16_t letter = has_drive(path) ? lower_case(path[0]) : current_drive();
  const std::size_t floor = is_native ? 0 : folder_of(letter).size();
  while (!rest.empty()) {
    const std::size_t end = std::min(rest.find_first_of(separators), rest.size());
    const TextView part = rest.substr(0, end);
    rest.remove_prefix(std::min(end + 1, rest.size()));
    if (part.empty() || part == u".") continue;
    if (part != u"..") {
      result = below(result, part);
    } else if (result.size() > floor) {
      result.erase(result.find_last_of('/'));
    }
  }
  return result.empty() ? "/" : result;
}

Text DrivePaths::current_folder(TextView drive) const {
  const char16_t current = current_drive();
  const char16_t letter = drive.empty() ? current : lower_case(drive.front());
  if (!has_drive(Text(1, letter) + u":") || (letter != drive_of_everything && !is_folder(folder_of(letter)))) return {};
  Text folder = Text(1, upper_case(letter)) + u":\\";
  if (letter != current) return folder;
  Text inside = from_utf8(process_folder().substr(folder_of(letter).size()));
  for (char16_t& unit : inside) unit = unit == u'/' ? u'\\' : unit;
  return folder + (inside.empty() ? inside : inside.substr(1));
}

void DrivePaths::provide_drive_of(TextView path) const {
  if (!has_drive(path) || lower_case(path[0]) != u'c') return;
  std::error_code ignored;  // If this fails, the drive is simply missing.
  std::filesystem::create_directories(folder_of(u'c'), ignored);
}

}  // namespace talutil::posix
