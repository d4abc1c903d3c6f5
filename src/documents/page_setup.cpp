#include "documents/page_setup.hpp"

#include <algorithm>
#include <iterator>

namespace talutil {

const PaperSize& paper_size(std::int32_t code) noexcept {
  // The platform's printing codes. ISO sizes are in millimetres, others in inches, converted to the nearest twip.
  static constexpr PaperSize sizes[] = {
      {1, 12240, 15840},   // Letter, 8.5 x 11
      {5, 12240, 20160},   // Legal, 8.5 x 14
      {7, 10440, 15120},   // Executive, 7.25 x 10.5
      {8, 16838, 23811},   // A3, 297 x 420
      {9, 11906, 16838},   // A4, 210 x 297
      {11, 8391, 11906},   // A5, 148 x 210
      {12, 14570, 20636},  // B4 (JIS), 257 x 364
      {13, 10318, 14570},  // B5 (JIS), 182 x 257
      {3, 15840, 24480},   // Tabloid, 11 x 17
  };
  const auto* const found = std::ranges::find(sizes, code, &PaperSize::code);
  return found == std::end(sizes) ? sizes[4] : *found;
}

}  // namespace talutil
