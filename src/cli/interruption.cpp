#include "cli/interruption.hpp"

#include <dirent.h>
#include <pthread.h>
#include <stdlib.h>
#include <sys/file.h>
#include <unistd.h>

#include <array>
#include <filesystem>
#include <string>

#include "platform/folders.hpp"

namespace talutil::cli {

namespace {

constexpr int end_of_command = SIGUSR1;  ///< Ends the thread that waits for the others.

/// Removes every temporary file that this process holds. Its descriptors are the list of them; a file that it merely
/// waits for is locked by its writer and stays.
void remove_temporaries() {
  const std::string prefix = to_utf8(temporary_prefix);
  std::error_code error;
  for (std::filesystem::directory_iterator each("/proc/self/fd", error), end; !error && each != end;
       each.increment(error)) {
    std::error_code unreadable;
    const std::filesystem::path path = std::filesystem::read_symlink(each->path(), unreadable);
    if (unreadable || !path.filename().string().starts_with(prefix)) continue;
    const int number = atoi(each->path().filename().c_str());
    if (flock(number, LOCK_EX | LOCK_NB) == 0) unlink(path.c_str());
  }
}

}  // namespace

Interruption::Interruption() {
  has_terminal_ = tcgetattr(STDIN_FILENO, &terminal_) == 0;
  sigemptyset(&signals_);
  for (const int number : {SIGINT, SIGTERM, SIGHUP, end_of_command}) {
    // A signal that the caller ignores, as for commands in the background, stays ignored.
    struct sigaction action {};
    sigaction(number, nullptr, &action);
    if (action.sa_handler != SIG_IGN) sigaddset(&signals_, number);
  }
  pthread_sigmask(SIG_BLOCK, &signals_, &before_);
  waiting_ = std::thread([this] { wait(); });
}

Interruption::~Interruption() {
  is_over_ = true;
  pthread_kill(waiting_.native_handle(), end_of_command);
  waiting_.join();
  pthread_sigmask(SIG_SETMASK, &before_, nullptr);
}

void Interruption::wait() const {
  int number = 0;
  // Somebody else's signal of that number ends the command like any other.
  if (sigwait(&signals_, &number) != 0 || (number == end_of_command && is_over_)) return;
  remove_temporaries();
  if (has_terminal_) tcsetattr(STDIN_FILENO, TCSANOW, &terminal_);
  sigset_t one;
  sigemptyset(&one);
  sigaddset(&one, number);
  pthread_sigmask(SIG_UNBLOCK, &one, nullptr);
  raise(number);
}

}  // namespace talutil::cli
