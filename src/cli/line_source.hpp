#pragma once

#include <functional>
#include <string>
#include <string_view>

namespace talutil::cli {

/// Reads a stream line by line, whatever the lengths of the lines. A line feed ends a line; the last needs none.
class LineSource {
 public:
  /// Reads an open descriptor, which stays the caller's. `before_waiting` runs whenever the stream has nothing more at
  /// hand, so that answers are not held back while the other side waits for them.
  LineSource(int descriptor, std::function<void()> before_waiting);

  /// Reads the next line, valid until the next call; returns false at the end. Fails with the system's message.
  bool read(std::string_view& line);

  /// The number of the line, from 1.
  [[nodiscard]] std::size_t number() const noexcept { return number_; }

 private:
  bool fill();

  int descriptor_;
  std::function<void()> before_waiting_;
  std::string buffer_;
  std::size_t start_ = 0;    ///< Where the next line begins.
  std::size_t scanned_ = 0;  ///< Before this there is no line feed from `start_` on.
  std::size_t number_ = 0;
  bool has_ended_ = false;
};

}  // namespace talutil::cli
