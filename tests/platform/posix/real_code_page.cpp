#include "tests/platform/real_code_page.hpp"

#include "platform/posix/posix_code_page.hpp"

namespace talutil::testing {

std::unique_ptr<CodePage> real_code_page(std::uint32_t number) { return posix::make_code_page(number); }

}  // namespace talutil::testing
