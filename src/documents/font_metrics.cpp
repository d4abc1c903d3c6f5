#include "documents/font_metrics.hpp"

#include <algorithm>

#include "documents/pdf_fonts.hpp"

namespace talutil {

struct FontMetrics::Library {
  explicit Library(FontFiles& files) : document(files) {}
  PdfDocument document;
};

FontMetrics::FontMetrics(FontFiles& files) : files_(files) {}

FontMetrics::~FontMetrics() = default;

bool FontMetrics::is_wide(char16_t unit) noexcept { return unit >= 0x80 && chr(ansi_code(unit)).front() != unit; }

std::int32_t FontMetrics::width(char16_t unit, const FontStyle& font) {
  constexpr bool is_fixed = true;
  constexpr std::int32_t missing_character = 600;
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
  const bool fixed = font.family == FontFamily::courier ? is_fixed : !is_fixed;
  auto& known = wide_widths_[fixed ? 1 : 0];
  const auto found = known.find(unit);
  if (found != known.end()) return found->second;
  const HPDF_Font wide = library_->document.wide_font(fixed);
  const std::int32_t width =
      wide == nullptr ? missing_character : static_cast<std::int32_t>(HPDF_Font_GetUnicodeWidth(wide, unit));
  return known[unit] = std::max(width, 0);
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
