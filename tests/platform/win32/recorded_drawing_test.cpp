// What is drawn on a device that records it.
#include <gtest/gtest.h>

#include <cmath>
#include <map>

#include "documents/report_composer.hpp"
#include "platform/win32/page_renderer.hpp"
#include "platform/win32/win32_drawing.hpp"

namespace talutil::win32 {
namespace {

struct NoFontFiles final : FontFiles {
  std::vector<std::uint8_t> wide_font(bool /*is_fixed_width*/) override { return {}; }
};

struct Drawn {
  POINTL at;
  LONG width;
};
struct Recording {
  std::map<Text, Drawn> texts;
  std::vector<COLORREF> colours;
};

int CALLBACK note(HDC /*device*/, HANDLETABLE* /*objects*/, const ENHMETARECORD* record, int /*count*/, LPARAM target) {
  auto& recording = *reinterpret_cast<Recording*>(target);
  if (record->iType == EMR_SETTEXTCOLOR) {
    recording.colours.push_back(reinterpret_cast<const EMRSETTEXTCOLOR*>(record)->crColor);
  }
  if (record->iType != EMR_EXTTEXTOUTW) return 1;
  const EMRTEXT& text = reinterpret_cast<const EMREXTTEXTOUTW*>(record)->emrtext;
  const auto* const bytes = reinterpret_cast<const BYTE*>(record);
  const auto* const advances = reinterpret_cast<const INT*>(bytes + text.offDx);
  Drawn drawn{text.ptlReference, 0};
  for (UINT i = 0; i < text.nChars; ++i) drawn.width += advances[i];
  recording.texts[Text(reinterpret_cast<const char16_t*>(bytes + text.offString), text.nChars)] = drawn;
  return 1;
}

template <class Draw>
Recording recorded(const Draw& draw) {
  const HDC recorder = CreateEnhMetaFileW(nullptr, nullptr, nullptr, nullptr);
  draw(recorder);
  const HENHMETAFILE file = CloseEnhMetaFile(recorder);
  Recording recording;
  EnumEnhMetaFile(nullptr, file, reinterpret_cast<ENHMFENUMPROC>(&note), &recording, nullptr);
  DeleteEnhMetaFile(file);
  return recording;
}

TEST(RecordedDrawing, TextsHaveTheirColours) {
  const COLORREF buttons = GetSysColor(COLOR_BTNFACE);
  const struct {
    const char* name;
    Text text;
    std::uint32_t colour;
    COLORREF expected;
  } rows[] = {
      {"beyond the code page", u"\u6771", 0x000000FF, 0x000000FF},
      {"the bits above a colour do not count", u"x", 0x7F112233, 0x00112233},
      {"a system colour", u"x", 0x80000000 | COLOR_WINDOW, GetSysColor(COLOR_WINDOW)},
      {"a number without a system colour", u"x", 0x8000FFFF, buttons},
      {"one that has it in its low byte alone", u"x", 0x80000100 | COLOR_WINDOW, buttons},
  };
  for (const auto& row : rows) {
    const Recording recording = recorded([&](HDC recorder) {
      Win32Drawing().draw_text(reinterpret_cast<std::intptr_t>(recorder), {0, 0, 1000, 100}, row.text,
                               static_cast<std::int32_t>(row.colour), false);
    });
    EXPECT_TRUE(recording.texts.contains(row.text)) << row.name;
    ASSERT_FALSE(recording.colours.empty()) << row.name;
    EXPECT_EQ(recording.colours.front(), row.expected) << row.name;
  }
}

TEST(RecordedDrawing, TextsOfPagesLieWhereTheyWereLaidOut) {
  NoFontFiles fonts;
  const auto metrics = std::make_shared<FontMetrics>(fonts);
  PageSetup setup;
  setup.width = 11906;
  setup.height = 16838;
  setup.margin_left = setup.margin_top = setup.margin_right = setup.margin_bottom = 1134;
  ReportComposer composer(metrics, setup);
  for (const FontFamily family : {FontFamily::courier, FontFamily::helvetica, FontFamily::times}) {
    for (const float points : {8.0F, 10.0F, 24.0F}) {
      const Text name = number_to_text(static_cast<std::int32_t>(family)) + number_to_text(points);
      composer.add_text(u"left" + name + u"\tright, caf\u00E9 " + name, {family, points == 24, points});
    }
  }
  const Document document = composer.finish();
  // 96, 144 and 192 dots an inch, 100 and 50 percent: within a pixel of the layout, 30 twips at the coarsest.
  for (const double scale : {1 / 15.0, 1 / 10.0, 2 / 15.0, 1 / 30.0}) {
    const Recording recording = recorded([&](HDC recorder) {
      draw_page(recorder, document.pages[0], {7, 9, scale, scale});
    });
    std::size_t compared = 0;
    for (const PageItem& item : document.pages[0].items) {
      const auto* const run = std::get_if<TextRun>(&item);
      if (run == nullptr) continue;
      const auto found = recording.texts.find(run->text);
      ASSERT_NE(found, recording.texts.end()) << to_utf8(run->text);
      const Drawn& drawn = found->second;
      EXPECT_LE(std::abs(drawn.at.x - 7 - run->left * scale), 0.51) << to_utf8(run->text);
      EXPECT_LE(std::abs(drawn.at.y - 9 - (run->top + baseline(run->font)) * scale), 0.51) << to_utf8(run->text);
      EXPECT_LE(std::abs(drawn.width - run->width * scale), 0.51) << to_utf8(run->text);
      ++compared;
    }
    EXPECT_GT(compared, 18U);
  }
}

TEST(RecordedDrawing, LettersFromRightToLeftLieSideBySide) {
  Page page{11906, 16838, {}};
  page.items.emplace_back(TextRun{300, 600, 3000, {}, true, 0, u"\u05E9(\u05D5\u05B8\u05DD", false, true});
  const Recording recording = recorded([&](HDC recorder) { draw_page(recorder, page, {7, 9, 0.1, 0.1}); });
  // From the right, in the proportions of the font.
  double natural = 0;
  for (const auto& [text, drawn] : recording.texts) natural += drawn.width;
  double right = 7 + 330;
  for (const TextView letter : {u"\u05E9", u"(", u"\u05D5\u05B8", u"\u05DD"}) {
    const auto found = recording.texts.find(Text(letter));
    ASSERT_NE(found, recording.texts.end()) << to_utf8(letter);
    right -= found->second.width * 300 / natural;
    EXPECT_LE(std::abs(found->second.at.x - right), 1) << to_utf8(letter);
  }
}

}  // namespace
}  // namespace talutil::win32
