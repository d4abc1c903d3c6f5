#include "platform/posix/terminal.hpp"

#include <unistd.h>

#include <iostream>

namespace talutil::posix {

std::optional<std::string> ask_terminal(std::string_view prompt) {
  if (isatty(STDIN_FILENO) == 0) return std::nullopt;
  std::cerr << prompt << std::flush;
  std::string line;
  // End of input closes this box, not the next one.
  if (!std::getline(std::cin, line)) {
    std::cin.clear();
    return std::nullopt;
  }
  return line;
}

}  // namespace talutil::posix
