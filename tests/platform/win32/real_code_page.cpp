#include "tests/platform/real_code_page.hpp"

#include "platform/win32/win32_code_page.hpp"

namespace talutil::testing {

std::unique_ptr<CodePage> real_code_page(std::uint32_t number) {
  return std::make_unique<win32::Win32CodePage>(number);
}

}  // namespace talutil::testing
