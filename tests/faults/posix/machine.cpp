#include "tests/faults/machine.hpp"

#include <stdlib.h>

namespace talutil::testing {

std::filesystem::path make_root() {
  static const std::filesystem::path folder = std::filesystem::temp_directory_path();
  std::string root = (folder / "talutil-faults-XXXXXX").string();
  root = mkdtemp(root.data());
  std::filesystem::create_directory(root + "/c");
  std::filesystem::create_directory(root + "/tmp");
  return root;
}

// The folder is this machine's drives, of which C: has the files.
std::unique_ptr<NativePlatform> native_platform(const std::filesystem::path& root) {
  setenv("TALUTIL_DRIVES", root.c_str(), 1);
  setenv("TALUTIL_HIVE", (root / "c/hive.db").c_str(), 1);
  setenv("TMPDIR", (root / "tmp").c_str(), 1);
  return std::make_unique<NativePlatform>(1252);
}

Text library_path(const std::filesystem::path& /*root*/) { return u"C:\\"; }

bool has_own_settings() noexcept { return true; }

bool clears_at_once() noexcept { return true; }

std::size_t stride_of_short_form() noexcept { return 1; }

void set_time(const std::filesystem::path& path) { std::filesystem::last_write_time(path, {}); }

Contents contents_of(const std::filesystem::path& root) {
  Contents files = read_tree(root);
  std::erase_if(files, [](const auto& file) { return file.first.starts_with("/c/hive.db"); });
  if (!std::filesystem::exists(root / "c/hive.db")) return files;
  posix::Hive hive(root / "c/hive.db");
  for (const auto& [key, name, value] : hive.values_below(u"HKEY_CURRENT_USER")) {
    files["hive " + to_utf8(key) + " " + to_utf8(name)] = value.data;
  }
  if (hive.has_key(u"HKEY_CURRENT_USER\\Software\\Host\\Key")) files["hive key"];
  return files;
}

std::size_t open_handles() {
  const std::filesystem::directory_iterator all("/proc/self/fd");
  return static_cast<std::size_t>(std::distance(begin(all), end(all)));
}

}  // namespace talutil::testing
