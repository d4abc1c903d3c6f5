#pragma once

#include <gtest/gtest.h>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil::testing {

/// The library with one object, on a platform that is made up.
struct UtilsTest : ::testing::Test {
  FakePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

}  // namespace talutil::testing
