#include "cli/reading_progress.hpp"

#include <memory>

#include "cli/progress.hpp"

namespace talutil::cli {

posix::PosixFiles::Progress reading_progress() {
  constexpr std::uint64_t smallest = 50'000'000;
  return [line = std::shared_ptr<ProgressLine>()](std::uint64_t done, std::uint64_t total) mutable {
    if (total <= smallest) return;
    if (!line) line = std::make_shared<ProgressLine>("reading");
    line->show(done, total);
    if (done == total) line.reset();
  };
}

}  // namespace talutil::cli
