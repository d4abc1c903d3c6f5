#include "cli/reading_progress.hpp"

#include <unistd.h>

#include <iostream>
#include <string>

namespace talutil::cli {

posix::PosixFiles::Progress reading_progress() {
  if (isatty(STDERR_FILENO) == 0) return {};
  constexpr std::uint64_t megabyte = 1'000'000;
  constexpr std::uint64_t smallest = 50 * megabyte;
  return [shown = std::uint64_t{0}](std::uint64_t done, std::uint64_t total) mutable {
    if (total <= smallest) return;
    const std::uint64_t percent = done * 100 / total;
    if (percent == shown) return;
    shown = percent;
    std::cerr << "\rreading: " << percent << " % of " << total / megabyte << " MB" << (done == total ? "\n" : "")
              << std::flush;
  };
}

}  // namespace talutil::cli
