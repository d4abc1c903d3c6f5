#include "platform/win32/page_renderer.hpp"

#include <cmath>
#include <map>
#include <numeric>

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

namespace {

int rounded(double value) { return static_cast<int>(std::lround(value)); }

/// The fonts of one page on one device.
class Fonts {
 public:
  Fonts(HDC device, double scale)
      : device_(device), scale_(scale), before_(GetCurrentObject(device, OBJ_FONT), {device}) {}

  void select(const FontStyle& style) {
    static constexpr const wchar_t* names[] = {L"Courier New", L"Arial", L"Times New Roman"};
    // If a font is missing, the platform substitutes a similar one.
    static constexpr DWORD kinds[] = {FIXED_PITCH | FF_MODERN, VARIABLE_PITCH | FF_SWISS, VARIABLE_PITCH | FF_ROMAN};
    const Key key{style.family, style.is_bold, style.points};
    Owned<kind::Font>& font = fonts_[key];
    if (!font) {
      constexpr double twips_per_point = 20;
      font.reset(CreateFontW(-rounded(style.points * twips_per_point * scale_), 0, 0, 0,
                             style.is_bold ? FW_BOLD : FW_NORMAL, FALSE, FALSE, FALSE, DEFAULT_CHARSET, OUT_TT_PRECIS,
                             CLIP_DEFAULT_PRECIS, CLEARTYPE_QUALITY, kinds[static_cast<std::size_t>(style.family)],
                             names[static_cast<std::size_t>(style.family)]));
    }
    SelectObject(device_, font.get());
  }

 private:
  using Key = std::tuple<FontFamily, bool, float>;

  HDC device_;
  double scale_;
  std::map<Key, Owned<kind::Font>> fonts_;
  Owned<kind::Selection> before_;
};

/// Whether a character belongs to the one before it: a mark, or the second half of a pair.
bool continues_letter(char16_t unit) {
  WORD kind = 0;
  GetStringTypeW(CT_CTYPE3, wide(&unit), 1, &kind);
  return (kind & C3_NONSPACING) != 0 || (unit & 0xFC00U) == 0xDC00U;
}

class Drawer {
 public:
  Drawer(HDC device, const PagePlacement& placement)
      : device_(device), placement_(placement), fonts_(device, placement.scale_y) {
    SetBkMode(device, TRANSPARENT);
    SetTextAlign(device, TA_BASELINE | TA_LEFT);
    // A device that only records has no edges.
    has_edges_ = GetClipBox(device, &seen_) > NULLREGION && IsRectEmpty(&seen_) == FALSE &&
                 GetObjectType(device) != OBJ_ENHMETADC;
  }

  void draw(const TextRun& run) {
    if (is_unseen({run.left, run.top, run.width, line_height(run.font)})) return;
    fonts_.select(run.font);
    SetTextColor(device_, run.colour);
    std::vector<int> ends = ends_of(run.text, run.width);
    if (run.is_right_to_left) return draw_letters(run, ends);
    std::adjacent_difference(ends.begin(), ends.end(), ends.begin());
    text_out(run, x_of(run.left), 0, run.text, ends.data());
  }

  void draw(const Box& box) {
    if (is_unseen(box.place)) return;
    const RECT place = rectangle_of(box.place);
    if (box.fill) {
      const Owned<kind::Brush> brush(CreateSolidBrush(*box.fill));
      FillRect(device_, &place, brush.get());
    }
    if (box.line_width == 0) return;
    const Owned<kind::Pen> pen(
        CreatePen(PS_INSIDEFRAME, std::max(1, rounded(box.line_width * placement_.scale_y)), box.line_colour));
    const Owned<kind::Selection> selected = select(device_, pen.get());
    const POINT corners[] = {{place.left, place.top},
                             {place.right, place.top},
                             {place.right, place.bottom},
                             {place.left, place.bottom},
                             {place.left, place.top}};
    Polyline(device_, corners, box.place.height == 0 ? 2 : 5);
  }

  void draw(const Picture& picture) {
    if (!picture.pixels || is_unseen(picture.place)) return;
    // The device expects blue first, and rows padded to a multiple of four bytes.
    const std::size_t row_bytes = (static_cast<std::size_t>(picture.width) * 3 + 3) / 4 * 4;
    std::vector<std::uint8_t> rows(row_bytes * static_cast<std::size_t>(picture.height));
    const std::uint8_t* source = picture.pixels->data();
    for (std::int32_t y = 0; y < picture.height; ++y) {
      std::uint8_t* target = rows.data() + row_bytes * static_cast<std::size_t>(y);
      for (std::int32_t x = 0; x < picture.width; ++x, source += 3, target += 3) {
        target[0] = source[2];
        target[1] = source[1];
        target[2] = source[0];
      }
    }
    BITMAPINFO information{};
    information.bmiHeader = {sizeof(BITMAPINFOHEADER), picture.width, -picture.height, 1, 24, BI_RGB, 0, 0, 0, 0, 0};
    const RECT place = rectangle_of(picture.place);
    SetStretchBltMode(device_, HALFTONE);
    StretchDIBits(device_, place.left, place.top, place.right - place.left, place.bottom - place.top, 0, 0,
                  picture.width, picture.height, rows.data(), &information, DIB_RGB_COLORS, SRCCOPY);
  }

 private:
  /// Where each character ends, in pixels: in the device's font, scaled to the width that was laid out.
  [[nodiscard]] std::vector<int> ends_of(TextView text, std::int32_t width) const {
    std::vector<int> ends(text.size());
    SIZE natural{};
    GetTextExtentExPointW(device_, wide(text.data()), static_cast<int>(text.size()), 0, nullptr, ends.data(), &natural);
    const double stretch = natural.cx == 0 ? 1 : width * placement_.scale_x / natural.cx;
    for (int& end : ends) end = rounded(end * stretch);
    return ends;
  }

  void text_out(const TextRun& run, int x, UINT options, TextView text, const int* advances) {
    ExtTextOutW(device_, x, y_of(run.top + baseline(run.font)), options, nullptr, wide(text.data()),
                static_cast<UINT>(text.size()), advances);
  }

  /// Draws a run that begins at its right end, each letter with its marks by itself: Wine puts such a text into order,
  /// but not the widths given with it. A bracket by itself is still mirrored.
  void draw_letters(const TextRun& run, const std::vector<int>& ends) {
    if (ends.empty()) return;
    const int right = x_of(run.left) + ends.back();
    const TextView text = run.text;
    for (std::size_t start = 0, end = 0; start < text.size(); start = end) {
      end = start + 1;
      while (end < text.size() && continues_letter(text[end])) ++end;
      text_out(run, right - ends[end - 1], ETO_RTLREADING, text.substr(start, end - start), nullptr);
    }
  }

  [[nodiscard]] int x_of(std::int32_t twips) const { return placement_.left + rounded(twips * placement_.scale_x); }
  [[nodiscard]] int y_of(std::int32_t twips) const { return placement_.top + rounded(twips * placement_.scale_y); }
  [[nodiscard]] RECT rectangle_of(const TwipsRectangle& place) const {
    return {x_of(place.left), y_of(place.top), x_of(place.left + place.width), y_of(place.top + place.height)};
  }

  /// Whether an area is outside the part being drawn. Letters and lines may extend slightly beyond their area.
  [[nodiscard]] bool is_unseen(const TwipsRectangle& place) const {
    if (!has_edges_) return false;
    constexpr LONG beyond = 8;
    const RECT here = rectangle_of(place);
    return here.right + beyond < seen_.left || here.left - beyond > seen_.right || here.bottom + beyond < seen_.top ||
           here.top - beyond > seen_.bottom;
  }

  HDC device_;
  const PagePlacement& placement_;
  RECT seen_{};
  bool has_edges_ = false;
  Fonts fonts_;
};

}  // namespace

void draw_page(HDC device, const Page& page, const PagePlacement& placement) {
  const Owned<kind::SavedState> saved = save_state(device);
  Drawer drawer(device, placement);
  for (const PageItem& item : page.items) std::visit([&](const auto& held) { drawer.draw(held); }, item);
}

}  // namespace talutil::win32
