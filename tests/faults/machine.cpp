#include "tests/faults/machine.hpp"

#include <fstream>
#include <sstream>

namespace talutil::testing {

Contents read_tree(const std::filesystem::path& root) {
  Contents files;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(root)) {
    const std::string path = "/" + entry.path().lexically_relative(root).generic_string();
    if (entry.is_directory()) {
      files[path + "/"];
    } else {
      std::stringstream bytes;
      bytes << std::ifstream(entry.path(), std::ios::binary).rdbuf();
      files[path] = bytes.str();
    }
  }
  return files;
}

void write_tree(const std::filesystem::path& root, const Contents& files) {
  std::filesystem::remove_all(root);
  std::filesystem::create_directories(root);
  for (const auto& [path, bytes] : files) {
    if (path.ends_with('/')) {
      std::filesystem::create_directories(root / path.substr(1));
      continue;
    }
    std::ofstream(root / path.substr(1), std::ios::binary) << bytes;
  }
  // Archives record the times.
  for (const auto& entry : std::filesystem::recursive_directory_iterator(root)) {
    set_time(entry.path());
  }
}

}  // namespace talutil::testing
