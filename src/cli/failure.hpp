#pragma once

#include <cstdint>
#include <iostream>
#include <stdexcept>
#include <string>

#include "automation/run_time_error.hpp"

namespace talutil::cli {

/// Exit statuses of the command; docs/command.md and `talutil help exit-codes` describe them.
constexpr int run_time_status = 1;
constexpr int usage_status = 2;
constexpr int false_status = 3;
constexpr int partial_status = 4;

/// Ends the command with a message (without the program's name) and an exit status.
class Failure : public std::runtime_error {
 public:
  Failure(int status, const std::string& message, std::int32_t number = 0)
      : std::runtime_error(message), status_(status), number_(number) {}
  [[nodiscard]] int status() const noexcept { return status_; }

  /// The number of the run-time error behind it; 0 for none.
  [[nodiscard]] std::int32_t number() const noexcept { return number_; }

 private:
  int status_;
  std::int32_t number_;
};

inline Failure usage_failure(const std::string& message) { return {usage_status, message}; }
inline Failure run_time_failure(const std::string& message) { return {run_time_status, message}; }

/// For example "error 5: Invalid procedure call or argument".
inline std::string error_words(const RunTimeError& error) {
  return "error " + std::to_string(error.number()) + ": " + error.what();
}

/// A failure because of a run-time error, with its number.
inline Failure run_time_failure(const std::string& place, const RunTimeError& error) {
  return {run_time_status, place + ": " + error_words(error), error.number()};
}

/// Says on standard error what did not happen as one might expect, while the work goes on.
inline void warn(const std::string& message) { std::cerr << "talutil: " << message << '\n'; }

/// Does some work; if it fails, the message is prefixed with the place: a file, a line, a member.
template <class Work>
auto within(const std::string& place, Work work) {
  try {
    return work();
  } catch (const Failure& failure) {
    throw Failure(failure.status(), place + ": " + failure.what(), failure.number());
  }
}

/// The same for work on a file of the library; its run-time errors become failures.
template <class Work>
auto on_file(const std::string& path, Work work) {
  try {
    return work();
  } catch (const RunTimeError& error) {
    throw run_time_failure(path, error);
  }
}

}  // namespace talutil::cli
