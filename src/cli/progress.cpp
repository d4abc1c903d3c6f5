#include "cli/progress.hpp"

#include <stdlib.h>
#include <unistd.h>

#include <algorithm>
#include <iostream>

namespace talutil::cli {

namespace {

bool can_redraw() {
  const char* const kind = getenv("TERM");
  return isatty(STDERR_FILENO) != 0 && kind != nullptr && std::string_view(kind) != "dumb";
}

}  // namespace

ProgressLine::ProgressLine(std::string word)
    : word_(std::move(word)), can_show_(can_redraw()), next_(Clock::now() + std::chrono::milliseconds(300)) {}

ProgressLine::~ProgressLine() {
  if (is_shown_) std::cerr << "\r\033[K" << std::flush;
}

void ProgressLine::show(std::uint64_t done, std::uint64_t total, std::string_view what) {
  constexpr std::uint64_t whole = 100;
  constexpr std::uint64_t step = 4;
  constexpr std::size_t longest = 40;
  if (!can_show_ || Clock::now() < next_) return;
  next_ = Clock::now() + std::chrono::milliseconds(100);
  is_shown_ = true;
  std::cerr << '\r' << word_;
  if (total == 0) {
    std::cerr << ": " << done;
  } else {
    // In doubles, since sizes times 100 may not fit.
    const auto share = static_cast<double>(done) / static_cast<double>(total);
    const std::uint64_t percent = std::min(whole, static_cast<std::uint64_t>(share * whole));
    std::cerr << " [" << std::string(percent / step, '#') << std::string((whole - percent) / step, '.') << "] "
              << percent << " %";
  }
  if (!what.empty()) std::cerr << "  " << (what.size() > longest ? what.substr(what.size() - longest) : what);
  std::cerr << "\033[K" << std::flush;
}

}  // namespace talutil::cli
