#include "platform/posix/data_folder.hpp"

#include <stdlib.h>

namespace talutil::posix {

std::string environment(const char* name) {
  const char* const value = getenv(name);
  return value == nullptr ? "" : value;
}

std::string data_folder() {
  const std::string data = environment("XDG_DATA_HOME");
  return (data.empty() ? environment("HOME") + "/.local/share" : data) + "/talutil";
}

}  // namespace talutil::posix
