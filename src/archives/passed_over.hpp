#pragma once

#include "archives/archive_error.hpp"
#include "automation/text.hpp"

namespace talutil::archives {

/// Whether the failure of one entry leaves hope for those after it.
[[nodiscard]] constexpr bool concerns_one_entry(Code code) noexcept {
  return code == Code::bad_structure || code == Code::unexpected_end || code == Code::cannot_create ||
         code == Code::incomplete;
}

/// Collects what an operation had to leave out while it went on with everything else, to report it at the end.
class PassedOver {
 public:
  /// @param reason why, for the report of the first one
  void add(TextView name, Code code = Code::incomplete, const std::string& reason = {}) {
    constexpr std::size_t most_named = 3;
    if (count_++ < most_named) names_ += (names_.empty() ? "" : ", ") + to_utf8(name);
    if (code_ != Code::incomplete || code == Code::incomplete) return;
    code_ = code;
    reason_ = reason;
  }

  /// Fails with the first code that was not `incomplete`, if there was one.
  void throw_if_any() const {
    if (count_ == 0) return;
    throw Error(code_, std::to_string(count_) + " entries were passed over, such as " + names_ +
                           (reason_.empty() ? "" : ": " + reason_));
  }

 private:
  std::uint64_t count_ = 0;
  std::string names_;
  Code code_ = Code::incomplete;
  std::string reason_;
};

}  // namespace talutil::archives
