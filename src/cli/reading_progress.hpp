#pragma once

#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

/// Shows the progress of reading a file above 50 MB; see ProgressLine.
[[nodiscard]] posix::PosixFiles::Progress reading_progress();

}  // namespace talutil::cli
