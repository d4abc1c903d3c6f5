#include "platform/posix/terminal.hpp"

#include <errno.h>
#include <unistd.h>

#include <iostream>

namespace talutil::posix {

namespace {

/// A line from a pipe or a file. It is read byte by byte, because whatever follows it belongs to whoever reads the same
/// input next: a shell's loop, or the next command in a script.
std::optional<std::string> piped_line() {
  std::string line;
  char next = '\0';
  ssize_t count = 0;
  while ((count = read(STDIN_FILENO, &next, 1)) > 0 || (count < 0 && errno == EINTR)) {
    if (count < 0) continue;
    if (next == '\n') break;
    line += next;
  }
  if (count <= 0 && line.empty()) return std::nullopt;
  if (line.ends_with('\r')) line.pop_back();
  return line;
}

}  // namespace

std::optional<std::string> Terminal::ask(std::string_view prompt) const {
  if (isatty(STDIN_FILENO) == 0) return takes_piped_answers_ ? piped_line() : std::nullopt;
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
