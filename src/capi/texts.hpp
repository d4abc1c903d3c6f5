#pragma once

#include <string_view>

namespace talutil::capi {

/// A copy for the caller, who releases it with talutil_free. Null if there is not enough memory.
[[nodiscard]] char* new_text(std::string_view bytes) noexcept;

}  // namespace talutil::capi
