#pragma once

#include <initializer_list>

#include "tests/faults/machine.hpp"

namespace talutil::testing {

/// What the present FailingCall asks for, and how far that is.
struct Failing {
  std::size_t calls = 0;
  std::size_t number = 0;
  std::size_t way = 0;
  bool goes_on = false;
  Allowed allowed = Allowed::everything;
  std::string what;
};
inline constinit Failing* failing = nullptr;

/// The code that this call is to fail with; 0 if it is to be made.
/// @param codes those of its possible failures. Codes that are not true, such as that of a missing file, are not among
/// them: what follows would be right then.
/// @param later the code of the calls after one that goes on
/// @param describe gives the text for a code
template <class Code, class Describe>
Code failure(std::initializer_list<Code> codes, Code later, Describe describe) {
  if (failing == nullptr) return {};
  const std::size_t call = failing->calls++;
  if (call < failing->number || (call > failing->number && !failing->goes_on)) return {};
  if (call > failing->number) return later;
  if (failing->way >= codes.size()) {
    failing->goes_on = false;
    return {};
  }
  const Code code = codes.begin()[failing->way];
  failing->what = describe(code);
  return code;
}

}  // namespace talutil::testing
