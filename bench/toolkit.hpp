#pragma once

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil {

/// A toolkit on a fake platform, so that only the members are measured.
struct Toolkit {
  testing::FakePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

}  // namespace talutil
