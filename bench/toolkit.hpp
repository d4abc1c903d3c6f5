#pragma once

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil {

/// A toolkit without a machine, so that members alone are measured.
struct Toolkit {
  testing::FakePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

}  // namespace talutil
