#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The entries of the preview window's menus, by name; those with entries below them only open these.
enum class PreviewMenu : std::uint8_t {
  mnuFile,
  mnuPrinter,
  mnuExportPDF,
  mnuClose,
  mnuOptions,
  mnuZoom,
  mnu25,
  mnu50,
  mnu75,
  mnu100,
  mnu125,
  mnu150,
  mnu200,
  mnuPrev,
  mnuNext,
  mnuPaper,
  mnuPaperSize,
  mnuA4,
  mnuA3,
  mnuDuplex,
  mnuVertical,
  mnuHorizontal,
  mnuSimplex,
};

struct PreviewMenuItem {
  TextView caption;
  PreviewMenu item;
  std::uint8_t level;  ///< 0 stands in the bar, 1 below it, 2 below that.
};

/// In their order. "Vertcial" is what users know.
inline constexpr PreviewMenuItem preview_menu[] = {
    {u"File", PreviewMenu::mnuFile, 0},
    {u"Send Document to Printer", PreviewMenu::mnuPrinter, 1},
    {u"Export to Adobe PDF Format", PreviewMenu::mnuExportPDF, 1},
    {u"Close", PreviewMenu::mnuClose, 1},
    {u"Options", PreviewMenu::mnuOptions, 0},
    {u"Zoom", PreviewMenu::mnuZoom, 1},
    {u"25%", PreviewMenu::mnu25, 2},
    {u"50%", PreviewMenu::mnu50, 2},
    {u"75%", PreviewMenu::mnu75, 2},
    {u"100%", PreviewMenu::mnu100, 2},
    {u"125%", PreviewMenu::mnu125, 2},
    {u"150%", PreviewMenu::mnu150, 2},
    {u"200%", PreviewMenu::mnu200, 2},
    {u"Prev Page", PreviewMenu::mnuPrev, 1},
    {u"Next Page", PreviewMenu::mnuNext, 1},
    {u"Paper", PreviewMenu::mnuPaper, 0},
    {u"Size", PreviewMenu::mnuPaperSize, 1},
    {u"A4", PreviewMenu::mnuA4, 2},
    {u"A3", PreviewMenu::mnuA3, 2},
    {u"Duplex", PreviewMenu::mnuDuplex, 1},
    {u"Vertcial", PreviewMenu::mnuVertical, 2},
    {u"Horizontal", PreviewMenu::mnuHorizontal, 2},
    {u"Simplex", PreviewMenu::mnuSimplex, 2},
};

/// The document that a preview window shows.
class PreviewPages {
 public:
  virtual ~PreviewPages() = default;

  /// The page that is shown; null for none.
  [[nodiscard]] virtual const Page* shown_page() const = 0;

  /// How large it is shown, percent.
  [[nodiscard]] virtual float zoom_percent() const = 0;

  /// The room between the margins of the page, where it is to be seen.
  [[nodiscard]] virtual std::optional<TwipsRectangle> guides() const = 0;
};

/// What a preview window reports to its presenter. None of these throws.
class PreviewEvents {
 public:
  virtual ~PreviewEvents() = default;

  /// The window is shown. Coming back from another program does not count.
  virtual void activated() noexcept = 0;

  /// The window has another size; not reported while it is being made.
  virtual void resized() noexcept = 0;
  virtual void chosen(PreviewMenu item) noexcept = 0;

  /// A key by the platform's code. Answers the code that it is to be passed on as.
  virtual std::int32_t key_down(std::int32_t code) noexcept = 0;

  /// The window is about to go, whoever has closed it.
  virtual void closing() noexcept = 0;

  /// The next zoom of the menu, larger or smaller: what Ctrl and the mouse wheel do.
  virtual void zoom_step(bool larger) noexcept = 0;
};

/// What is raised where a preview cannot be shown.
inline constexpr TextView no_screen = u"There is no screen to show the preview on; export the report to PDF instead";

/// The preview window, hidden until it is shown. Sizes are twips.
class PreviewView {
 public:
  virtual ~PreviewView() = default;

  virtual void set_caption(TextView caption) = 0;

  /// 0 normal, 1 minimised, 2 maximised.
  [[nodiscard]] virtual std::int32_t window_state() const = 0;
  virtual void set_window_state(std::int32_t state) = 0;
  [[nodiscard]] virtual float width() const = 0;
  virtual void set_width(float width) = 0;
  [[nodiscard]] virtual float height() const = 0;
  virtual void set_height(float height) = 0;
  [[nodiscard]] virtual float inner_width() const = 0;
  [[nodiscard]] virtual float inner_height() const = 0;

  /// The size of the pages' part of the window.
  virtual void size_pages(float width, float height) = 0;
  virtual void check(PreviewMenu item, bool is_checked) = 0;

  /// The document, the page or the zoom is another one.
  virtual void show_page() = 0;

  /// Shows the window and returns when it was closed. Raises 445 where there are no windows.
  virtual void show_modal() = 0;
  virtual void close() = 0;
};

}  // namespace talutil
