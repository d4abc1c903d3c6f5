#include "platform/win32/win32_code_page.hpp"

#include <gtest/gtest.h>

#include <array>

#include "platform/win32/windows.hpp"

namespace talutil::win32 {
namespace {

/// The code of a unit by the platform's own conversion, here of a text of two characters.
std::uint32_t code_before_a_bar(UINT page, char16_t unit) {
  const wchar_t text[] = {static_cast<wchar_t>(unit), L'|'};
  std::array<unsigned char, 8> bytes{};
  const int size = WideCharToMultiByte(page, 0, text, 2, reinterpret_cast<char*>(bytes.data()), 8, nullptr, nullptr);
  std::uint32_t code = 0;
  for (int i = 0; i + 1 < size; ++i) code = code * 256 + bytes[static_cast<std::size_t>(i)];
  return code;
}

TEST(Win32CodePage, EveryCodeUnitIsThePlatforms) {
  for (const UINT number : {1252U, 1251U, 1253U, 932U, 65001U}) {
    Win32CodePage page(number);
    for (std::uint32_t i = 0; i <= 0xFFFF; ++i) {
      const auto unit = static_cast<char16_t>(i);
      ASSERT_EQ(page.code(unit), code_before_a_bar(number, unit)) << number << " " << i;
    }
  }
}

TEST(Win32CodePage, TheSystemsPageIsTheDefault) {
  Win32CodePage page;
  Win32CodePage same(GetACP());
  for (std::uint32_t i = 0; i <= 0xFFFF; ++i) {
    const auto unit = static_cast<char16_t>(i);
    ASSERT_EQ(page.code(unit), same.code(unit)) << i;
  }
}

}  // namespace
}  // namespace talutil::win32
