#include "cli/line_source.hpp"

#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "cli/failure.hpp"

namespace talutil::cli {

LineSource::LineSource(int descriptor, std::function<void()> before_waiting)
    : descriptor_(descriptor), before_waiting_(std::move(before_waiting)) {}

bool LineSource::read(std::string_view& line) {
  while (true) {
    const std::size_t end = buffer_.find('\n', scanned_);
    if (end != std::string::npos) {
      line = std::string_view(buffer_).substr(start_, end - start_);
      start_ = scanned_ = end + 1;
      break;
    }
    scanned_ = buffer_.size();
    if (fill()) continue;
    if (start_ == buffer_.size()) return false;
    line = std::string_view(buffer_).substr(start_);
    start_ = buffer_.size();
    break;
  }
  constexpr std::string_view byte_order_mark = "\xEF\xBB\xBF";
  if (++number_ == 1 && line.starts_with(byte_order_mark)) line.remove_prefix(byte_order_mark.size());
  return true;
}

/// Appends what the stream has at hand; returns false at its end.
bool LineSource::fill() {
  constexpr std::size_t piece = 1 << 18;
  if (has_ended_) return false;
  buffer_.erase(0, start_);
  scanned_ -= start_;
  start_ = 0;
  pollfd source{descriptor_, POLLIN, 0};
  if (poll(&source, 1, 0) == 0) before_waiting_();
  // A long line is read in pieces that grow with it, so that its bytes are not moved for each one.
  const std::size_t size = buffer_.size();
  buffer_.resize(size + std::max(piece, size));
  ssize_t count = 0;
  do {
    count = ::read(descriptor_, buffer_.data() + size, buffer_.size() - size);
  } while (count < 0 && errno == EINTR);
  if (count < 0) throw run_time_failure(std::string("cannot read the input: ") + std::strerror(errno));
  buffer_.resize(size + static_cast<std::size_t>(count));
  has_ended_ = count == 0;
  return count > 0;
}

}  // namespace talutil::cli
