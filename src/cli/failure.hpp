#pragma once

#include <stdexcept>
#include <string>

#include "automation/run_time_error.hpp"

namespace talutil::cli {

/// Exit statuses of the command.
constexpr int run_time_status = 1;
constexpr int usage_status = 2;

/// Ends the command with a message (without the program's name) and an exit status.
class Failure : public std::runtime_error {
 public:
  Failure(int status, const std::string& message) : std::runtime_error(message), status_(status) {}
  [[nodiscard]] int status() const noexcept { return status_; }

 private:
  int status_;
};

inline Failure usage_failure(const std::string& message) { return {usage_status, message}; }
inline Failure run_time_failure(const std::string& message) { return {run_time_status, message}; }

/// For example "error 5: Invalid procedure call or argument".
inline std::string error_words(const RunTimeError& error) {
  return "error " + std::to_string(error.number()) + ": " + error.what();
}

/// Does some work; if it fails, the message is prefixed with the place: a file, a line, a member.
template <class Work>
auto within(const std::string& place, Work work) {
  try {
    return work();
  } catch (const Failure& failure) {
    throw Failure(failure.status(), place + ": " + failure.what());
  }
}

}  // namespace talutil::cli
