#include "platform/win32/pages_window.hpp"

#include <algorithm>
#include <cmath>
#include <utility>

#include "platform/win32/page_renderer.hpp"
// After windows.h.
#include <windowsx.h>

namespace talutil::win32 {

namespace {

// In pixels at 96 dots per inch.
constexpr int usual_line = 24;
constexpr int usual_gap = 12;
constexpr int usual_shadow = 4;

constexpr int largest = 1 << 20;  ///< In pixels: more than any page has.

}  // namespace

PagesWindow::PagesWindow(HWND frame, PreviewEvents& events, const PreviewPages* pages)
    : OwnWindow(L"TALUtilPages", COLOR_APPWORKSPACE), events_(events), pages_(pages) {
  make(WS_CHILD | WS_VISIBLE | WS_HSCROLL | WS_VSCROLL, WS_EX_CLIENTEDGE, frame, L"Pages");
  attach();
}

void PagesWindow::show() {
  place_bars();
  scroll_to(horizontal_, 0);
  scroll_to(vertical_, 0);
  InvalidateRect(handle(), nullptr, FALSE);
}

bool PagesWindow::take_key(WPARAM key) {
  const int line = scaled(usual_line, handle());
  switch (key) {
    case VK_NEXT:
      events_.chosen(PreviewMenu::mnuNext);
      return true;
    case VK_PRIOR:
      events_.chosen(PreviewMenu::mnuPrev);
      return true;
    case VK_HOME:
      return scroll_by(vertical_, -largest), true;
    case VK_END:
      return scroll_by(vertical_, largest), true;
    case VK_UP:
      return scroll_by(vertical_, -line), true;
    case VK_DOWN:
      return scroll_by(vertical_, line), true;
    case VK_LEFT:
      return scroll_by(horizontal_, -line), true;
    case VK_RIGHT:
      return scroll_by(horizontal_, line), true;
    default:
      return false;
  }
}

void PagesWindow::wheel(WPARAM what) {
  const int distance = GET_WHEEL_DELTA_WPARAM(what);
  if ((LOWORD(what) & MK_CONTROL) != 0)
    events_.zoom_step(distance > 0);
  else
    scroll_by(vertical_, -distance * 3 * scaled(usual_line, handle()) / WHEEL_DELTA);
}

double PagesWindow::scale() const {
  return pages_ == nullptr ? 1 : dots_per_inch(handle()) / twips_per_inch * pages_->zoom_percent() / 100;
}

void PagesWindow::place_bars() {
  const Page* const shown = page();
  const RECT room = inner();
  const int gap = scaled(usual_gap, handle());
  const auto place = [&](Bar& bar, std::int32_t twips, LONG pixels) {
    const int size = shown == nullptr ? 0 : static_cast<int>(std::lround(twips * scale())) + 2 * gap;
    bar.last = std::max(0, size - static_cast<int>(pixels));
    bar.position = std::min(bar.position, bar.last);
    const SCROLLINFO information{
        sizeof information, SIF_ALL | SIF_DISABLENOSCROLL, 0, size, static_cast<UINT>(pixels), bar.position, 0};
    SetScrollInfo(handle(), bar.direction, &information, TRUE);
  };
  place(horizontal_, shown == nullptr ? 0 : shown->width, room.right);
  place(vertical_, shown == nullptr ? 0 : shown->height, room.bottom);
}

void PagesWindow::scroll_to(Bar& bar, int position) {
  position = std::clamp(position, 0, bar.last);
  if (position == bar.position) return;
  const int distance = std::exchange(bar.position, position) - position;
  SetScrollPos(handle(), bar.direction, position, TRUE);
  // Scrolls what remains visible and repaints the rest.
  const bool is_down = bar.direction == SB_VERT;
  ScrollWindowEx(handle(), is_down ? 0 : distance, is_down ? distance : 0, nullptr, nullptr, nullptr, nullptr,
                 SW_INVALIDATE);
}

void PagesWindow::scroll(Bar& bar, WORD what) {
  SCROLLINFO information{sizeof information, SIF_ALL, 0, 0, 0, 0, 0};
  GetScrollInfo(handle(), bar.direction, &information);
  const auto room = static_cast<int>(information.nPage);
  const int line = scaled(usual_line, handle());
  switch (what) {
    case SB_LINEUP:
      return scroll_by(bar, -line);
    case SB_LINEDOWN:
      return scroll_by(bar, line);
    case SB_PAGEUP:
      return scroll_by(bar, -room);
    case SB_PAGEDOWN:
      return scroll_by(bar, room);
    case SB_THUMBTRACK:
    case SB_THUMBPOSITION:
      return scroll_to(bar, information.nTrackPos);
    case SB_TOP:
      return scroll_to(bar, 0);
    case SB_BOTTOM:
      return scroll_to(bar, bar.last);
    default:
      return;
  }
}

void PagesWindow::draw(HDC device, const RECT& room) const {
  FillRect(device, &room, GetSysColorBrush(COLOR_APPWORKSPACE));
  const Page* const shown = page();
  if (shown == nullptr) return;
  const double pixels = scale();
  const int gap = scaled(usual_gap, handle());
  const int shadow = scaled(usual_shadow, handle());
  const auto to_pixels = [pixels](std::int32_t twips) { return static_cast<int>(std::lround(twips * pixels)); };
  const int width = to_pixels(shown->width);
  const int height = to_pixels(shown->height);
  const int left = std::max(gap, (static_cast<int>(room.right) - width) / 2) - horizontal_.position;
  const int top = std::max(gap, (static_cast<int>(room.bottom) - height) / 2) - vertical_.position;
  const RECT dark{left + shadow, top + shadow, left + width + shadow, top + height + shadow};
  FillRect(device, &dark, GetSysColorBrush(COLOR_3DDKSHADOW));
  const RECT paper{left, top, left + width, top + height};
  FillRect(device, &paper, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH)));
  FrameRect(device, &paper, static_cast<HBRUSH>(GetStockObject(BLACK_BRUSH)));
  IntersectClipRect(device, left + 1, top + 1, left + width - 1, top + height - 1);
  draw_page(device, *shown, {left, top, pixels, pixels});
  if (const auto guides = pages_->guides()) {
    const RECT lines{left + to_pixels(guides->left), top + to_pixels(guides->top),
                     left + width - to_pixels(shown->width - guides->left - guides->width),
                     top + height - to_pixels(shown->height - guides->top - guides->height)};
    DrawFocusRect(device, &lines);
  }
}

/// Paints into a bitmap first to avoid flicker.
void PagesWindow::paint() const {
  PAINTSTRUCT painting;
  const Owned<kind::Painting> screen(BeginPaint(handle(), &painting), {handle(), &painting});
  const RECT& part = painting.rcPaint;
  const int width = static_cast<int>(part.right - part.left);
  const int height = static_cast<int>(part.bottom - part.top);
  const Owned<kind::MadeDevice> memory(CreateCompatibleDC(screen.get()));
  const Owned<kind::Bitmap> bitmap(CreateCompatibleBitmap(screen.get(), std::max(width, 1), std::max(height, 1)));
  const Owned<kind::Selection> selected = select(memory.get(), bitmap.get());
  SetWindowOrgEx(memory.get(), static_cast<int>(part.left), static_cast<int>(part.top), nullptr);
  draw(memory.get(), inner());
  SelectClipRgn(memory.get(), nullptr);
  BitBlt(screen.get(), static_cast<int>(part.left), static_cast<int>(part.top), width, height, memory.get(),
         static_cast<int>(part.left), static_cast<int>(part.top), SRCCOPY);
}

std::optional<LRESULT> PagesWindow::answer(UINT message, WPARAM what, LPARAM value) {
  switch (message) {
    case WM_PAINT:
      paint();
      return 0;
    case WM_ERASEBKGND:
      return 1;
    case WM_SIZE:
      place_bars();
      InvalidateRect(handle(), nullptr, FALSE);
      return 0;
    case WM_HSCROLL:
      scroll(horizontal_, LOWORD(what));
      return 0;
    case WM_VSCROLL:
      scroll(vertical_, LOWORD(what));
      return 0;
    case WM_LBUTTONDOWN:
      SetCapture(handle());
      drag_start_ = {GET_X_LPARAM(value) + horizontal_.position, GET_Y_LPARAM(value) + vertical_.position};
      SetCursor(LoadCursorW(nullptr, IDC_SIZEALL));
      return 0;
    case WM_MOUSEMOVE:
      if (GetCapture() != handle()) return 0;
      scroll_to(horizontal_, static_cast<int>(drag_start_.x) - GET_X_LPARAM(value));
      scroll_to(vertical_, static_cast<int>(drag_start_.y) - GET_Y_LPARAM(value));
      return 0;
    case WM_LBUTTONUP:
      ReleaseCapture();
      return 0;
    case WM_DESTROY:
      // Destroyed along with its frame.
      forget();
      return 0;
    default:
      return std::nullopt;
  }
}

}  // namespace talutil::win32
