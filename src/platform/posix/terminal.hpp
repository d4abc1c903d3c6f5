#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace talutil::posix {

/// Where the user answers boxes: standard input.
class Terminal {
 public:
  /// Takes answers from standard input also where it is no terminal but a pipe or a file. Only for programs that read
  /// nothing else from there.
  void take_piped_answers() noexcept { takes_piped_answers_ = true; }

  /// Reads a line; returns nothing if its input has ended, or if there is no terminal and piped answers are not taken.
  /// The prompt is only shown at a terminal.
  [[nodiscard]] std::optional<std::string> ask(std::string_view prompt) const;

 private:
  bool takes_piped_answers_ = false;
};

}  // namespace talutil::posix
