#pragma once

#include <string>

#include "calling/caller.hpp"
#include "library/orv_utils.hpp"
#include "platform/posix/posix_platform.hpp"

/// A handle of the C library: a started library, for calls as JSON and for typed calls.
struct talutil_library {
  explicit talutil_library(std::uint32_t code_page) : platform(code_page) { library.start(); }

  talutil::posix::PosixPlatform platform;
  talutil::Library library{platform.platform()};
  talutil::ORVUtils utils{library};
  talutil::calling::Caller caller{library};
  std::string description;  ///< Of the last typed call that failed.
};
