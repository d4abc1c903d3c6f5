#pragma once

#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

/// Reports the progress of reading a file above 50 MB on standard error, if that is a terminal.
[[nodiscard]] posix::PosixFiles::Progress reading_progress();

}  // namespace talutil::cli
