#pragma once

#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "library/orv_utils.hpp"
#include "tests/fakes/fake_platform.hpp"
#include "tests/faults/machine.hpp"

/// What a host does with files, for the tests in which something goes wrong meanwhile.
namespace talutil::testing {

/// A library on this machine's files, settings and registry. The rest is made up, so that everything always happens in
/// the same way.
class Host {
 public:
  explicit Host(const std::filesystem::path& root);

  [[nodiscard]] Text path(TextView name) const { return folder + Text(name); }

  Text folder;
  FakePlatform fake;
  std::unique_ptr<NativePlatform> real;
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
