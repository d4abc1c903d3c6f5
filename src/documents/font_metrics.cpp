#include "documents/font_metrics.hpp"

#include <algorithm>

#include "documents/pdf_fonts.hpp"
#include "documents/text_direction.hpp"

namespace talutil {

struct FontMetrics::Library {
  explicit Library(FontFiles& files) : document(files) {}
  PdfDocument document;
};

FontMetrics::FontMetrics(FontFiles& files) : files_(files) {}

FontMetrics::~FontMetrics() = default;

bool FontMetrics::is_wide(char16_t unit) noexcept { return unit >= 0x80 && chr(ansi_code(unit)).front() != unit; }

std::int32_t FontMetrics::find_width(char16_t unit, const FontStyle& font) {
  if (!library_) library_ = std::make_unique<Library>(files_);
  if (unit < 0x80 || !is_wide(unit)) {
    auto& widths = widths_[font_index(font.family, font.is_bold)];
    if (widths[u' '] == 0) {
      const HPDF_Font standard = library_->document.standard_font(font.family, font.is_bold);
      for (std::int32_t code = 0; code < 256; ++code) {
        widths[static_cast<std::size_t>(code)] =
            static_cast<std::uint16_t>(std::max(HPDF_Font_GetUnicodeWidth(standard, chr(code).front()), 0));
      }
    }
    return widths[ansi_code(unit)];
  }
  return is_invisible(unit) ? 0 : wide(unit, font).width;
}

const FontMetrics::Wide& FontMetrics::wide(char16_t unit, const FontStyle& font) {
  constexpr std::int32_t missing_character = 600;
  auto& known = wide_[static_cast<std::size_t>(font.family)];
  if (const auto found = known.find(unit); found != known.end()) return found->second;
  if (!library_) library_ = std::make_unique<Library>(files_);
  PdfDocument& document = library_->document;
  // The fixed-width font's marks have a place of their own, instead of standing on the letter before them.
  const bool is_fixed = font.family == FontFamily::courier && !is_mark(unit);
  Wide wide{.family = is_fixed || font.family != FontFamily::courier ? font.family : FontFamily::helvetica};
  const WideFont first = is_fixed ? WideFont::fixed : WideFont::proportional;
  const WideFont second = is_fixed ? WideFont::proportional : WideFont::fixed;
  WideFont which = first;
  if (!document.has_shape(first, unit)) {
    if (document.has_shape(second, unit)) {
      which = second;
      wide.family = is_fixed ? FontFamily::helvetica : FontFamily::courier;
    } else if (document.has_shape(WideFont::named, unit)) {
      which = WideFont::named;
      wide.is_named_font = true;
    } else {
      wide.is_missing = true;
    }
  }
  const HPDF_Font embedded = document.wide_font(which);
  wide.width = embedded == nullptr ? missing_character
                                   : std::max(0, static_cast<std::int32_t>(HPDF_Font_GetUnicodeWidth(embedded, unit)));
  return known[unit] = wide;
}

double FontMetrics::width(TextView text, const FontStyle& font) {
  double sum = 0;
  for (const char16_t unit : text) sum += width(unit, font);
  return to_twips(sum, font);
}

FontFamily family_of(TextView font_name) {
  const Text name = lower_case(font_name);
  const auto has = [&](TextView part) { return name.find(part) != Text::npos; };
  if (has(u"courier") || has(u"mono") || has(u"console") || has(u"fixed")) return FontFamily::courier;
  if (has(u"times") || (has(u"serif") && !has(u"sans"))) return FontFamily::times;
  return FontFamily::helvetica;
}

}  // namespace talutil
