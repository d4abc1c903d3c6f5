#include "platform/posix/posix_input_boxes.hpp"

#include <termios.h>
#include <unistd.h>

#include <iostream>

namespace talutil::posix {

namespace {

/// Turns off the terminal's echo.
class Silence {
 public:
  Silence() {
    if (tcgetattr(STDIN_FILENO, &before_) != 0) return;
    is_silent_ = true;
    termios silent = before_;
    silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
    tcsetattr(STDIN_FILENO, TCSAFLUSH, &silent);
  }
  Silence(const Silence&) = delete;
  Silence& operator=(const Silence&) = delete;
  ~Silence() {
    if (!is_silent_) return;
    tcsetattr(STDIN_FILENO, TCSAFLUSH, &before_);
    std::cerr << '\n';
  }

 private:
  termios before_{};
  bool is_silent_ = false;
};

}  // namespace

std::optional<Text> PosixInputBoxes::ask(TextView prompt, TextView title, Entry entry) {
  std::optional<Silence> silence;
  if (entry == Entry::masked) silence.emplace();
  const auto line = terminal_.ask((title.empty() ? "" : to_utf8(title) + ": ") + to_utf8(prompt) + " ");
  return line ? std::optional(from_utf8(*line)) : std::nullopt;
}

}  // namespace talutil::posix
