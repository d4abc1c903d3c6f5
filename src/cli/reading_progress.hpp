#pragma once

#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

/// Reports on standard error how far a file above 50 MB is read, where that is a terminal; silent elsewhere.
[[nodiscard]] posix::PosixFiles::Progress reading_progress();

}  // namespace talutil::cli
