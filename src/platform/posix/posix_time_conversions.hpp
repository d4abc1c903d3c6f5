#pragma once

#include "platform/time_conversions.hpp"

namespace talutil::posix {

/// Reads the environment (TZ) again for each conversion.
class PosixTimeConversions final : public CalendarTimeConversions {
 protected:
  std::int64_t utc_offset_seconds() override;
};

}  // namespace talutil::posix
