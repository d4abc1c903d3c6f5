#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "library/orv_utils.hpp"
#include "platform/posix/posix_platform.hpp"
#include "tests/fakes/fake_platform.hpp"

/// What a host does with files, for the tests in which something goes wrong meanwhile.
namespace talutil::testing {

/// A library on this machine's files, settings and registry, all of them in one folder: drive C:. The rest is made up,
/// so that everything always happens in the same way.
class Host {
 public:
  explicit Host(const std::string& root);

  FakePlatform fake;
  posix::PosixPlatform real;
  Library library;
  ORVUtils utils{library};
};

/// How sure a host can be of what it has done.
enum class Promise {
  whole,      ///< Every file is the old or the new one, and what has succeeded is there, even after a power cut.
  unflushed,  ///< The same, but a power cut may undo it.
  silent,     ///< The same, but a failure is not reported.
};

struct Operation {
  const char* name;
  Promise promise;
  std::function<void(Host&)> prepare;  ///< Makes what is there before.
  std::function<void(Host&)> act;

  friend void PrintTo(const Operation& operation, std::ostream* stream) { *stream << operation.name; }
};

[[nodiscard]] const std::vector<Operation>& operations();

}  // namespace talutil::testing
