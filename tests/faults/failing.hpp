#pragma once

#include <cstddef>
#include <initializer_list>
#include <string>

namespace talutil::testing {

/// What the folders of a test's files allow.
enum class Allowed { everything, no_replacing, no_new_files };

/// Lets one of this program's system calls on files fail, in a way in which the system may let that call fail. The
/// calls are watched below the platform's code; natively those of the databases and the standard library are, too.
struct FailingCall {
  const std::size_t number;  ///< Counted from 0.
  const std::size_t way;     ///< One of the call's possible failures, counted from 0.
  bool goes_on;              ///< Whether every later call fails as well, as with a disk that is gone.
  const Allowed allowed;
  std::size_t calls = 0;

  static inline constinit FailingCall* present = nullptr;

  FailingCall(std::size_t call, std::size_t failure, bool all_fail, Allowed is_allowed)
      : number(call), way(failure), goes_on(all_fail), allowed(is_allowed) {
    present = this;
    failed.clear();
  }
  FailingCall(const FailingCall&) = delete;
  FailingCall& operator=(const FailingCall&) = delete;
  ~FailingCall() {
    present = nullptr;
    was_reached = calls > number;
  }

  /// Of the last one: whether there was a call with its number, and the name of the function that failed and how, which
  /// is empty if that has no such way of failing.
  static inline bool was_reached = false;
  static inline std::string failed;

  /// Whether a call is refused whenever it is made.
  [[nodiscard]] static bool refuses(Allowed kind) noexcept { return present != nullptr && present->allowed == kind; }
};

/// The code that this call is to fail with; 0 if it is to be made.
/// @param codes those of its possible failures. Codes that are not true, such as that of a missing file, are not among
/// them: what follows would be right then.
/// @param later the code of the calls after one that goes on
/// @param describe gives the text for a code
template <class Code, class Describe>
Code failure(std::initializer_list<Code> codes, Code later, Describe describe) {
  FailingCall* const failing = FailingCall::present;
  if (failing == nullptr) return {};
  const std::size_t call = failing->calls++;
  if (call < failing->number || (call > failing->number && !failing->goes_on)) return {};
  if (call > failing->number) return later;
  if (failing->way >= codes.size()) {
    failing->goes_on = false;
    return {};
  }
  const Code code = codes.begin()[failing->way];
  FailingCall::failed = describe(code);
  return code;
}

}  // namespace talutil::testing
