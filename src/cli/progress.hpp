#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <string_view>

namespace talutil::cli {

/// A line on standard error that shows how far the work is, and disappears when it is done. Only on a terminal that can
/// redraw a line (TERM is not "dumb"), and not before the work has taken a moment.
class ProgressLine {
 public:
  explicit ProgressLine(std::string word);
  ProgressLine(const ProgressLine&) = delete;
  ProgressLine& operator=(const ProgressLine&) = delete;
  ~ProgressLine();

  /// @param total 0 if it is not known; then `done` itself is shown
  /// @param what what is being worked on; may be empty
  void show(std::uint64_t done, std::uint64_t total, std::string_view what = {});

 private:
  using Clock = std::chrono::steady_clock;

  std::string word_;
  bool can_show_;
  bool is_shown_ = false;
  Clock::time_point next_;
};

}  // namespace talutil::cli
