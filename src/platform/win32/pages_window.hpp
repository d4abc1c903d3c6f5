#pragma once

#include "platform/preview_view.hpp"
#include "platform/win32/window.hpp"

namespace talutil::win32 {

/// The pages in a preview: one is shown, with a shadow, in the middle of what room there is; scrolled by bars, wheel,
/// keys and by dragging.
class PagesWindow final : public OwnWindow {
 public:
  /// @param pages null where a third-party control shows its pages itself
  PagesWindow(HWND frame, PreviewEvents& events, const PreviewPages* pages);
  ~PagesWindow() override { destroy(); }

  /// Another page, document or zoom: from its top.
  void show();

  /// Keys that the pages have themselves. False for others.
  bool take_key(WPARAM key);

  /// The mouse wheel scrolls, with Ctrl it zooms.
  void wheel(WPARAM what);

 protected:
  std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) override;

 private:
  struct Bar {
    int direction;
    int position = 0;  ///< In pixels, as all here.
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
