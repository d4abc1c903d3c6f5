#include "documents/pdf_fonts.hpp"

#include "automation/run_time_error.hpp"
#include "documents/font_metrics.hpp"
#include "documents/unicode_map.hpp"

namespace talutil {

namespace {

/// The PDF library's own map of a font leads from codes to shapes, not to characters.
void replace_unicode_map(HPDF_Font font) {
  const HPDF_Stream stream = static_cast<HPDF_FontAttr>(font->attr)->cmap_stream->stream;
  HPDF_MemStream_FreeData(stream);
  HPDF_Stream_WriteStr(stream, unicode_map().c_str());
}

}  // namespace

PdfDocument::PdfDocument(FontFiles& files) : files_(files), document_(HPDF_New(nullptr, nullptr)) {
  if (document_ == nullptr) raise(ErrorNumber::out_of_memory);
  HPDF_SetCompressionMode(document_, HPDF_COMP_ALL);
  HPDF_UseUTFEncodings(document_);
}

HPDF_Font PdfDocument::standard_font(FontFamily family, bool is_bold) {
  static constexpr const char* names[] = {"Courier",        "Courier-Bold", "Helvetica",
                                          "Helvetica-Bold", "Times-Roman",  "Times-Bold"};
  const std::size_t index = font_index(family, is_bold);
  if (standard_[index] == nullptr) standard_[index] = HPDF_GetFont(document_, names[index], "WinAnsiEncoding");
  if (standard_[index] == nullptr) raise(ErrorNumber::out_of_memory);
  return standard_[index];
}

HPDF_Font PdfDocument::wide_font(WideFont which) {
  Embedded& wide = wide_[static_cast<std::size_t>(which)];
  if (wide.is_sought) return wide.font;
  wide.is_sought = true;
  const auto bytes = which == WideFont::named ? files_.named_font() : files_.wide_font(which == WideFont::fixed);
  if (bytes.empty()) return nullptr;
  const char* const name =
      HPDF_LoadTTFontFromMem(document_, bytes.data(), static_cast<HPDF_UINT>(bytes.size()), HPDF_TRUE);
  if (name != nullptr) wide.font = HPDF_GetFont(document_, name, "UTF-8");
  // Treat a font that is unusable, or already loaded under that name, as missing.
  if (wide.font == nullptr)
    HPDF_ResetError(document_);
  else
    replace_unicode_map(wide.font);
  return wide.font;
}

bool PdfDocument::has_shape(WideFont which, char16_t unit) {
  const HPDF_Font font = wide_font(which);
  if (font == nullptr) return false;
  return HPDF_TTFontDef_GetGlyphid(static_cast<HPDF_FontAttr>(font->attr)->fontdef, unit) != 0;
}

void PdfDocument::check() const {
  const HPDF_STATUS status = HPDF_GetError(document_);
  if (status == HPDF_OK) return;
  raise(status == HPDF_FAILD_TO_ALLOC_MEM ? ErrorNumber::out_of_memory : ErrorNumber::internal_error);
}

}  // namespace talutil
