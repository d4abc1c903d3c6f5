// Our own tables of code units and bytes, beside the platform's.
#include <gtest/gtest.h>

#include <array>

#include "automation/text.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {
namespace {

constexpr std::uint32_t unit_count = 0x10000;

/// The code of a unit by the platform's own conversion, here of a text of two characters.
std::uint32_t code_before_a_bar(char16_t unit) {
  const wchar_t text[] = {static_cast<wchar_t>(unit), L'|'};
  std::array<unsigned char, 8> bytes{};
  const int size = WideCharToMultiByte(1252, 0, text, 2, reinterpret_cast<char*>(bytes.data()), 8, nullptr, nullptr);
  std::uint32_t code = 0;
  for (int i = 0; i + 1 < size; ++i) code = code * 256 + bytes[static_cast<std::size_t>(i)];
  return code;
}

char16_t case_of(LPWSTR(WINAPI* function)(LPWSTR), std::uint32_t unit) {
  const std::uintptr_t value = unit;
  return static_cast<char16_t>(reinterpret_cast<std::uintptr_t>(function(reinterpret_cast<LPWSTR>(value))));
}

TEST(CodeUnits, HaveTheirPlacesInOurOwnTables) {
  for (std::uint32_t i = 0; i < unit_count; ++i) {
    const auto unit = static_cast<char16_t>(i);
    ASSERT_EQ(ansi_code(unit), code_before_a_bar(unit)) << i;
    ASSERT_EQ(upper_case(unit), case_of(&CharUpperW, i)) << i;
    ASSERT_EQ(lower_case(unit), case_of(&CharLowerW, i)) << i;
  }
  for (int i = 0; i < 256; ++i) {
    const auto byte = static_cast<char>(i);
    wchar_t unit = 0;
    MultiByteToWideChar(1252, 0, &byte, 1, &unit, 1);
    EXPECT_EQ(chr(i), Text(1, static_cast<char16_t>(unit))) << i;
  }
}

}  // namespace
}  // namespace talutil::win32
