#pragma once

#include <cstdint>
#include <functional>

#include "archives/archive_error.hpp"
#include "automation/text.hpp"

namespace talutil::archives {

/// Reports the progress of an operation to a watcher, which can cancel it by returning false.
class Progress {
 public:
  using Watcher = std::function<bool(std::uint64_t done, std::uint64_t total, TextView name)>;

  explicit Progress(Watcher watcher = {}) : watcher_(std::move(watcher)) {}

  void start(std::uint64_t total_bytes) noexcept {
    total_ = total_bytes;
    done_ = 0;
  }

  /// Fails with cancelled if the watcher cancels the operation.
  void advance(std::uint64_t bytes, TextView name) {
    done_ += bytes;
    if (watcher_ && !watcher_(done_, total_, name)) throw Error(Code::cancelled, "cancelled");
  }

 private:
  Watcher watcher_;
  std::uint64_t done_ = 0;
  std::uint64_t total_ = 0;
};

}  // namespace talutil::archives
