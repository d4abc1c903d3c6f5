#include "platform/code_page.hpp"

namespace talutil {

namespace {

constexpr std::size_t code_unit_count = 0x10000;
constexpr char16_t first_latin = 0xA0;
constexpr char16_t latin_length = 0x60;

}  // namespace

void CodePage::begin() {
  codes_.assign(code_unit_count, unknown);
  const auto is_own_code = [this](char16_t unit) { return code(unit) == unit; };
  while (latin_count_ < latin_length && is_own_code(static_cast<char16_t>(first_latin + latin_count_))) ++latin_count_;
}

std::uint32_t CodePage::ask(char16_t unit) {
  std::uint32_t code = 0;
  for (const char byte : bytes_of(TextView(&unit, 1))) code = code << 8 | static_cast<unsigned char>(byte);
  return code;
}

}  // namespace talutil
