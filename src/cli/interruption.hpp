#pragma once

#include <signal.h>
#include <termios.h>

#include <atomic>
#include <thread>

namespace talutil::cli {

/// While it exists, an interrupted command (SIGINT, SIGTERM, SIGHUP) leaves nothing half-written: it removes the
/// temporary files that it is writing, gives the terminal back its echo and then ends by the signal, which shells
/// report as 130, 143 or 129. Create it before any other thread.
class Interruption {
 public:
  Interruption();
  Interruption(const Interruption&) = delete;
  Interruption& operator=(const Interruption&) = delete;
  ~Interruption();

 private:
  void wait() const;

  sigset_t signals_{};
  sigset_t before_{};
  termios terminal_{};
  bool has_terminal_ = false;
  std::atomic<bool> is_over_ = false;
  std::thread waiting_;
};

}  // namespace talutil::cli
