#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// Restores a property of a picture box after drawing, even after an error.
class RestoredProperty {
 public:
  RestoredProperty(const Control& box, TextView property)
      : box_(box), property_(property), before_(box.get(property)) {}
  RestoredProperty(const RestoredProperty&) = delete;
  RestoredProperty& operator=(const RestoredProperty&) = delete;
  ~RestoredProperty() {
    try {
      box_.put(property_, before_);
    } catch (...) {
      // The caller sees the drawing's own error or success instead.
    }
  }

 private:
  const Control& box_;
  TextView property_;
  Variant before_;
};

/// The values of iJustify; see docs/drawing.md for pictures.
enum class Justify : std::int16_t { left_running_over = -2, left = -1, centre = 0, right = 1 };

}  // namespace

Boolean ORVUtils::GetMousePos(const Variant& lngSrcX, const Variant& lngSrcY, const Variant& lngDestX1,
                              const Variant& lngDestY1, const Variant& lngDestX2, const Variant& lngDestY2) {
  // Evaluates all four, so that a value that cannot be compared is an error wherever it is. Null is neither greater nor
  // less.
  const bool inside[] = {compare(lngSrcX, lngDestX1) > 0, compare(lngSrcX, lngDestX2) < 0,
                         compare(lngSrcY, lngDestY1) > 0, compare(lngSrcY, lngDestY2) < 0};
  return Boolean(inside[0] && inside[1] && inside[2] && inside[3]);
}

std::int32_t ORVUtils::GetMaxPages(const std::int32_t& iRowsPerPage, const std::int32_t& iRowCount) {
  if (iRowsPerPage == 0) raise(ErrorNumber::division_by_zero);
  // Pages are counted in single precision, so the count is inexact above 2^24; hosts have always seen it so.
  const double rows_per_page = iRowsPerPage;
  auto pages = static_cast<float>(round_to<std::int32_t>(iRowCount / rows_per_page));
  if (pages * rows_per_page > iRowCount) pages -= 1;
  if (std::int64_t{iRowCount} % iRowsPerPage > 0) pages += 1;
  return round_to<std::int32_t>(pages);
}

void ORVUtils::PrintScreen(const Variant& vForm) {
  const Control form(vForm, locale());
  WindowPrinting& printing = library_.platform().window_printing;
  printing.configure_printer(form.get<std::int32_t>(u"hwnd"));
  form.call(u"Refresh");
  printing.send_to_printer(form.get<std::int32_t>(u"hwnd"));
}

void ORVUtils::MyDrawText(const std::int16_t& iDestX1, const std::int16_t& iDestY1, const std::int16_t& iDestX2,
                          const std::int16_t& iDestY2, const Variant& sText, const std::int32_t& lColor,
                          const std::int16_t& iJustify, const Boolean& bBold, const Boolean& bWordWrap) {
  const Text text = sText.to_text(locale());
  if (text.empty()) return;
  const Control box(settings().DrawTextPictureBox, locale());
  const RestoredProperty bold(box, u"FontBold");
  const RestoredProperty colour(box, u"ForeColor");
  box.put(u"FontBold", bBold);
  box.put(u"ForeColor", lColor);

  const auto twips_x = static_cast<float>(settings().ScreenTwipsPerPixelX);
  const auto twips_y = static_cast<float>(settings().ScreenTwipsPerPixelY);
  const auto width = box.get<float>(u"TextWidth", {text});
  const float room = static_cast<float>(iDestX2 - iDestX1) * twips_x;
  const auto justify = static_cast<Justify>(iJustify);
  if (width > room && justify != Justify::left_running_over) {
    const auto context = box.get<std::int32_t>(u"hDC");
    library_.platform().drawing.draw_text(context, {iDestX1, iDestY1, iDestX2, iDestY2}, text, lColor,
                                          bWordWrap.is_exactly_true());
    return;
  }
  const auto height = box.get<float>(u"TextHeight", {text});
  const float left = static_cast<float>(iDestX1) * twips_x;
  const float middle = static_cast<float>(iDestY1 + iDestY2) / 2 * twips_y;
  float x = left;
  if (justify == Justify::centre) x = left + room / 2 - width / 2;
  if (justify == Justify::right) x = left + room - width;
  box.put(u"CurrentX", x);
  box.put(u"CurrentY", middle - height / 2);
  box.call(u"Print", {text});
}

}  // namespace talutil
