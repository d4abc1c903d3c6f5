#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The paper, and what appears on every page. Lengths are in twips.
struct PageSetup {
  std::int32_t width = 0;
  std::int32_t height = 0;
  std::int32_t margin_left = 0;
  std::int32_t margin_top = 0;
  std::int32_t margin_right = 0;
  std::int32_t margin_bottom = 0;
  /// Above the top margin, on every page. A long header takes more lines, then smaller letters; only if it does not fit
  /// in letters of 6 points is its middle left out.
  Text header;
  FontStyle header_font;
  std::optional<FontStyle> footer_font;  ///< If none, that of the header.
  bool has_rule = true;                  ///< A rule below the header.
  /// On the left, below the bottom margin; the page number is on the right, the columns of a divided grid in the
  /// middle.
  Text footer;
  bool wraps_words = true;

  [[nodiscard]] std::int32_t room() const noexcept { return width - margin_left - margin_right; }
  [[nodiscard]] std::int32_t bottom() const noexcept { return height - margin_bottom; }
};

/// A paper size by the platform's code, in portrait orientation, in twips; A4 for an unknown code.
struct PaperSize {
  std::int32_t code;
  std::int32_t width;
  std::int32_t height;
};
[[nodiscard]] const PaperSize& paper_size(std::int32_t code) noexcept;

}  // namespace talutil
