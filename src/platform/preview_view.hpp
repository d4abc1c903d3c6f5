#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The entries of the preview window's menus, by name; entries with a submenu only open it.
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
  std::uint8_t level;  ///< 0 is in the menu bar, 1 below it, 2 below that.
};

/// In menu order. Users know the spelling "Vertcial".
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

  /// The current page; null if there is none.
  [[nodiscard]] virtual const Page* shown_page() const = 0;

  /// The zoom in percent.
  [[nodiscard]] virtual float zoom_percent() const = 0;

  /// The area between the page's margins, if it is to be marked.
  [[nodiscard]] virtual std::optional<TwipsRectangle> guides() const = 0;
};

/// What a preview window reports to its presenter. None of these throws.
class PreviewEvents {
 public:
  virtual ~PreviewEvents() = default;

  /// The window was shown. Not reported on returning from another program.
  virtual void activated() noexcept = 0;

  /// The window was resized; not reported during its creation.
  virtual void resized() noexcept = 0;
  virtual void chosen(PreviewMenu item) noexcept = 0;

  /// A key was pressed, as the platform's key code. Returns the code to process instead.
  virtual std::int32_t key_down(std::int32_t code) noexcept = 0;

  /// The window is about to close, whatever the reason.
  virtual void closing() noexcept = 0;

  /// The user asked for the next larger or smaller zoom of the menu (Ctrl and mouse wheel).
  virtual void zoom_step(bool larger) noexcept = 0;
};

/// The description of the error raised where a preview cannot be shown.
inline constexpr TextView no_screen = u"There is no screen to show the preview on; export the report to PDF instead";

/// The preview window, hidden until it is shown. Sizes are in twips.
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

  /// Sets the size of the area that shows the pages.
  virtual void size_pages(float width, float height) = 0;
  virtual void check(PreviewMenu item, bool is_checked) = 0;

  /// Call when the document, the page or the zoom has changed.
  virtual void show_page() = 0;

  /// Shows the window and returns when it is closed. Raises 445 where there are no windows.
  virtual void show_modal() = 0;
  virtual void close() = 0;
};

}  // namespace talutil
