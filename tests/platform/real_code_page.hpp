#pragma once

#include <memory>

#include "platform/code_page.hpp"

namespace talutil::testing {

/// The platform's own code page of a number, for the tests that hold for both platforms.
[[nodiscard]] std::unique_ptr<CodePage> real_code_page(std::uint32_t number);

}  // namespace talutil::testing
