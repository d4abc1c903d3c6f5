#include <gtest/gtest.h>

#include "automation/text.hpp"
#include "platform/win32/windows.hpp"

namespace talutil {
namespace {

constexpr int unit_count = 0x10000;

char by_code_page(wchar_t unit) {
  char byte = 0;
  WideCharToMultiByte(1252, 0, &unit, 1, &byte, 1, nullptr, nullptr);
  return byte;
}

wchar_t case_of(LPWSTR (*function)(LPWSTR), int unit) {
  return static_cast<wchar_t>(reinterpret_cast<std::uintptr_t>(function(reinterpret_cast<LPWSTR>(unit))));
}

TEST(TextTables, EveryCodeUnitIsThePlatforms) {
  const auto upper = [](LPWSTR unit) { return CharUpperW(unit); };
  const auto lower = [](LPWSTR unit) { return CharLowerW(unit); };
  for (int i = 0; i < unit_count; ++i) {
    const auto unit = static_cast<char16_t>(i);
    ASSERT_EQ(ansi_code(unit), static_cast<std::uint8_t>(by_code_page(static_cast<wchar_t>(i)))) << i;
    ASSERT_EQ(upper_case(unit), case_of(upper, i)) << i;
    ASSERT_EQ(lower_case(unit), case_of(lower, i)) << i;
  }
}

TEST(TextTables, EveryByteIsThePlatforms) {
  for (int i = 0; i < 256; ++i) {
    const auto byte = static_cast<char>(i);
    wchar_t unit = 0;
    MultiByteToWideChar(1252, 0, &byte, 1, &unit, 1);
    EXPECT_EQ(chr(i), Text(1, static_cast<char16_t>(unit))) << i;
  }
}

}  // namespace
}  // namespace talutil
