#pragma once

#include "platform/preview_view.hpp"
#include "platform/win32/window.hpp"

namespace talutil::win32 {

/// The pages area of a preview: shows one page, with a shadow, centred. Scrolls by scroll bars, wheel, keys and
/// dragging.
class PagesWindow final : public OwnWindow {
 public:
  /// @param pages null if a third-party control displays its own pages
  PagesWindow(HWND frame, PreviewEvents& events, const PreviewPages* pages);
  ~PagesWindow() override { destroy(); }

  /// Shows another page, document or zoom from the top of the page.
  void show();

  /// Handles the keys of the pages area. Returns false for other keys.
  bool take_key(WPARAM key);

  /// The mouse wheel scrolls, or zooms together with Ctrl.
  void wheel(WPARAM what);

 protected:
  std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) override;

 private:
  struct Bar {
    int direction;
    int position = 0;  ///< In pixels, like the other members.
    int last = 0;
  };

  [[nodiscard]] const Page* page() const { return pages_ == nullptr ? nullptr : pages_->shown_page(); }
  [[nodiscard]] double scale() const;
  void place_bars();
  void scroll_to(Bar& bar, int position);
  void scroll_by(Bar& bar, int distance) { scroll_to(bar, bar.position + distance); }
  void scroll(Bar& bar, WORD what);
  void draw(HDC device, const RECT& room) const;
  void paint() const;

  PreviewEvents& events_;
  const PreviewPages* pages_;
  Bar horizontal_{SB_HORZ};
  Bar vertical_{SB_VERT};
  POINT drag_start_{};
};

}  // namespace talutil::win32
