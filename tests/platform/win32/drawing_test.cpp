// What is drawn on a device that records it.
#include <gtest/gtest.h>

#include "platform/win32/win32_drawing.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {
namespace {

struct Drawn {
  Text text;
  std::vector<COLORREF> colours;
};

int CALLBACK note(HDC /*device*/, HANDLETABLE* /*objects*/, const ENHMETARECORD* record, int /*count*/, LPARAM target) {
  auto& drawn = *reinterpret_cast<Drawn*>(target);
  if (record->iType == EMR_SETTEXTCOLOR) {
    drawn.colours.push_back(reinterpret_cast<const EMRSETTEXTCOLOR*>(record)->crColor);
  }
  if (record->iType == EMR_EXTTEXTOUTW) {
    const EMRTEXT& text = reinterpret_cast<const EMREXTTEXTOUTW*>(record)->emrtext;
    const auto* const units = reinterpret_cast<const BYTE*>(record) + text.offString;
    drawn.text.append(reinterpret_cast<const char16_t*>(units), text.nChars);
  }
  return 1;
}

TEST(Win32Drawing, DrawsTextsInTheirColours) {
  const COLORREF buttons = GetSysColor(COLOR_BTNFACE);
  const struct {
    const char* name;
    Text text;
    std::uint32_t colour;
    COLORREF expected;
  } rows[] = {
      {"beyond the code page", u"O\u2019Neil \u0416\u6771\u0E01", 0x000000FF, 0x000000FF},
      {"the bits above a colour do not count", u"x", 0x7F112233, 0x00112233},
      {"a system colour", u"x", 0x80000000 | COLOR_WINDOW, GetSysColor(COLOR_WINDOW)},
      {"a number without a system colour", u"x", 0x8000FFFF, buttons},
      {"one that has it in its low byte alone", u"x", 0x80000100 | COLOR_WINDOW, buttons},
  };
  for (const auto& row : rows) {
    const HDC recorder = CreateEnhMetaFileW(nullptr, nullptr, nullptr, nullptr);
    Win32Drawing().draw_text(reinterpret_cast<std::intptr_t>(recorder), {0, 0, 1000, 100}, row.text,
                             static_cast<std::int32_t>(row.colour), false);
    const HENHMETAFILE file = CloseEnhMetaFile(recorder);
    Drawn drawn;
    EnumEnhMetaFile(nullptr, file, &note, &drawn, nullptr);
    DeleteEnhMetaFile(file);
    EXPECT_EQ(drawn.text, row.text) << row.name;
    ASSERT_FALSE(drawn.colours.empty()) << row.name;
    EXPECT_EQ(drawn.colours.front(), row.expected) << row.name;
  }
}

}  // namespace
}  // namespace talutil::win32
