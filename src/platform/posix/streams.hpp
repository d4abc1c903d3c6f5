#pragma once

#include <string>

#include "platform/posix/descriptor.hpp"

namespace talutil::posix {

/// Opens what a path names for writing if that is no regular file: a pipe, a device, or a stream of this process
/// ("/dev/stdout", "/dev/fd/3"), even if the stream leads to a regular file, whose contents then stay. No descriptor
/// for anything else. Raises the same errors as Files.
[[nodiscard]] Descriptor open_stream(const std::string& path);

}  // namespace talutil::posix
