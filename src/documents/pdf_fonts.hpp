#pragma once

#include <hpdf.h>

#include <array>

#include "platform/font_files.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The embedded fonts, for characters that code page 1252 lacks.
enum class WideFont : std::uint8_t { proportional, fixed, named };

/// A document of the PDF library and the fonts used in it.
class PdfDocument {
 public:
  /// Raises 7 if out of memory.
  explicit PdfDocument(FontFiles& files);
  PdfDocument(const PdfDocument&) = delete;
  PdfDocument& operator=(const PdfDocument&) = delete;
  ~PdfDocument() { HPDF_Free(document_); }

  [[nodiscard]] HPDF_Doc get() const noexcept { return document_; }

  /// A standard font, for text in code page 1252.
  [[nodiscard]] HPDF_Font standard_font(FontFamily family, bool is_bold);

  /// An embedded font for all other characters, for text in UTF-8; null if the platform has none.
  [[nodiscard]] HPDF_Font wide_font(WideFont which);

  /// Whether an embedded font has a shape for a character.
  [[nodiscard]] bool has_shape(WideFont which, char16_t unit);

  /// Raises 7 or 51 if the library has failed in the meantime.
  void check() const;

 private:
  struct Embedded {
    bool is_sought = false;
    HPDF_Font font = nullptr;
  };

  FontFiles& files_;
  HPDF_Doc document_;
  std::array<HPDF_Font, 6> standard_{};
  std::array<Embedded, 3> wide_;
};

}  // namespace talutil
