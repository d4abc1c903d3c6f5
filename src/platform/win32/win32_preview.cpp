// The preview window: a frame with menus, and the pages in a child of its own.
#include <algorithm>
#include <cmath>

#include "automation/run_time_error.hpp"
#include "platform/win32/page_renderer.hpp"
#include "platform/win32/win32_platform.hpp"
#include "platform/win32/window.hpp"
#include "preview/preview_view.hpp"
#include "preview/print_control.hpp"
// After windows.h.
#include <windowsx.h>

namespace talutil::win32 {

namespace {

constexpr const wchar_t* frame_class = L"TALUtilPreview";
constexpr const wchar_t* pages_class = L"TALUtilPages";
constexpr UINT first_command = 100;

/// The pages: one is shown, with a shadow, in the middle of what room there is; scrolled by bars, wheel, keys and by
/// dragging.
class PagesWindow {
 public:
  PagesWindow(HWND frame, PreviewEvents& events, PrintControl* print) : events_(events), print_(print) {
    window_ = CreateWindowExW(WS_EX_CLIENTEDGE, pages_class, L"Pages", WS_CHILD | WS_VISIBLE | WS_HSCROLL | WS_VSCROLL,
                              0, 0, 0, 0, frame, nullptr, own_module(), this);
  }
  PagesWindow(const PagesWindow&) = delete;
  PagesWindow& operator=(const PagesWindow&) = delete;

  [[nodiscard]] HWND handle() const noexcept { return window_; }

  /// Another page, document or zoom: from its top.
  void show() {
    place_bars();
    scroll_to(horizontal_, 0);
    scroll_to(vertical_, 0);
    InvalidateRect(window_, nullptr, FALSE);
  }

  /// Keys that the pages have themselves. False for others.
  bool take_key(WPARAM key) {
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

  void wheel(WPARAM what) {
    const int distance = GET_WHEEL_DELTA_WPARAM(what);
    if ((LOWORD(what) & MK_CONTROL) != 0)
      events_.zoom_step(distance > 0);
    else
      scroll_by(vertical_, -distance * 3 * line / WHEEL_DELTA);
  }

  static LRESULT CALLBACK handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept {
    if (message == WM_NCCREATE) {
      const auto* const creation = reinterpret_cast<CREATESTRUCTW*>(value);
      SetWindowLongPtrW(window, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(creation->lpCreateParams));
    }
    auto* const self = reinterpret_cast<PagesWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
    if (self == nullptr) return DefWindowProcW(window, message, what, value);
    try {
      return self->answer(window, message, what, value);
    } catch (...) {
      // Nothing may leave a window procedure.
      return DefWindowProcW(window, message, what, value);
    }
  }

 private:
  static constexpr int line = 24;  // Pixels.
  static constexpr int largest = 1 << 20;
  static constexpr int gap = 12;
  static constexpr int shadow = 4;

  struct Bar {
    int direction;
    int position = 0;
    int last = 0;
  };

  [[nodiscard]] const Page* page() const {
    if (print_ == nullptr || print_->CurrentPage() < 1) return nullptr;
    return &print_->document().pages[static_cast<std::size_t>(print_->CurrentPage()) - 1];
  }
  [[nodiscard]] double scale() const {
    return print_ == nullptr ? 1 : dots_per_inch(window_) / twips_per_inch * print_->Zoom() / 100;
  }

  void place_bars() {
    const Page* const shown = page();
    RECT room;
    GetClientRect(window_, &room);
    const auto place = [&](Bar& bar, std::int32_t twips, LONG pixels) {
      const int size = shown == nullptr ? 0 : static_cast<int>(std::lround(twips * scale())) + 2 * gap;
      bar.last = std::max(0, size - static_cast<int>(pixels));
      bar.position = std::min(bar.position, bar.last);
      const SCROLLINFO information{
          sizeof information, SIF_ALL | SIF_DISABLENOSCROLL, 0, size, static_cast<UINT>(pixels), bar.position, 0};
      SetScrollInfo(window_, bar.direction, &information, TRUE);
    };
    place(horizontal_, shown == nullptr ? 0 : shown->width, room.right);
    place(vertical_, shown == nullptr ? 0 : shown->height, room.bottom);
  }

  void scroll_to(Bar& bar, int position) {
    position = std::clamp(position, 0, bar.last);
    if (position == bar.position) return;
    const int distance = std::exchange(bar.position, position) - position;
    SetScrollPos(window_, bar.direction, position, TRUE);
    // What stays in sight is moved, the rest drawn.
    const bool is_down = bar.direction == SB_VERT;
    ScrollWindowEx(window_, is_down ? 0 : distance, is_down ? distance : 0, nullptr, nullptr, nullptr, nullptr,
                   SW_INVALIDATE);
  }

  void scroll_by(Bar& bar, int distance) { scroll_to(bar, bar.position + distance); }

  void scroll(Bar& bar, WORD what) {
    SCROLLINFO information{sizeof information, SIF_ALL, 0, 0, 0, 0, 0};
    GetScrollInfo(window_, bar.direction, &information);
    const auto room = static_cast<int>(information.nPage);
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

  void draw(HDC device, const RECT& room) const {
    FillRect(device, &room, GetSysColorBrush(COLOR_APPWORKSPACE));
    const Page* const shown = page();
    if (shown == nullptr) return;
    const double pixels = scale();
    const auto width = static_cast<int>(std::lround(shown->width * pixels));
    const auto height = static_cast<int>(std::lround(shown->height * pixels));
    const int left = std::max(gap, (static_cast<int>(room.right) - width) / 2) - horizontal_.position;
    const int top = std::max(gap, (static_cast<int>(room.bottom) - height) / 2) - vertical_.position;
    const RECT dark{left + shadow, top + shadow, left + width + shadow, top + height + shadow};
    FillRect(device, &dark, GetSysColorBrush(COLOR_3DDKSHADOW));
    const RECT paper{left, top, left + width, top + height};
    FillRect(device, &paper, static_cast<HBRUSH>(GetStockObject(WHITE_BRUSH)));
    FrameRect(device, &paper, static_cast<HBRUSH>(GetStockObject(BLACK_BRUSH)));
    IntersectClipRect(device, left + 1, top + 1, left + width - 1, top + height - 1);
    draw_page(device, *shown, {left, top, pixels, pixels});
    if (print_->ShowGuides) {
      const auto inset = [pixels](std::int32_t margin) { return static_cast<int>(std::lround(margin * pixels)); };
      const RECT guides{left + inset(print_->MarginLeft), top + inset(print_->MarginTop),
                        left + width - inset(print_->MarginRight), top + height - inset(print_->MarginBottom)};
      DrawFocusRect(device, &guides);
    }
  }

  /// By way of a bitmap, so that nothing flickers.
  void paint() const {
    PAINTSTRUCT painting;
    const Owned<kind::Painting> screen(BeginPaint(window_, &painting), {window_, &painting});
    RECT room;
    GetClientRect(window_, &room);
    const RECT& part = painting.rcPaint;
    const int width = static_cast<int>(part.right - part.left);
    const int height = static_cast<int>(part.bottom - part.top);
    const Owned<kind::MadeDevice> memory(CreateCompatibleDC(screen.get()));
    const Owned<kind::Bitmap> bitmap(CreateCompatibleBitmap(screen.get(), std::max(width, 1), std::max(height, 1)));
    const Owned<kind::Selection> selected = select(memory.get(), bitmap.get());
    SetWindowOrgEx(memory.get(), static_cast<int>(part.left), static_cast<int>(part.top), nullptr);
    draw(memory.get(), room);
    SelectClipRgn(memory.get(), nullptr);
    BitBlt(screen.get(), static_cast<int>(part.left), static_cast<int>(part.top), width, height, memory.get(),
           static_cast<int>(part.left), static_cast<int>(part.top), SRCCOPY);
  }

  LRESULT answer(HWND window, UINT message, WPARAM what, LPARAM value) {
    window_ = window;
    switch (message) {
      case WM_PAINT:
        paint();
        return 0;
      case WM_ERASEBKGND:
        return 1;
      case WM_SIZE:
        place_bars();
        InvalidateRect(window, nullptr, FALSE);
        return 0;
      case WM_HSCROLL:
        scroll(horizontal_, LOWORD(what));
        return 0;
      case WM_VSCROLL:
        scroll(vertical_, LOWORD(what));
        return 0;
      case WM_LBUTTONDOWN:
        SetCapture(window);
        drag_start_ = {GET_X_LPARAM(value) + horizontal_.position, GET_Y_LPARAM(value) + vertical_.position};
        SetCursor(LoadCursorW(nullptr, IDC_SIZEALL));
        return 0;
      case WM_MOUSEMOVE:
        if (GetCapture() != window) return 0;
        scroll_to(horizontal_, static_cast<int>(drag_start_.x) - GET_X_LPARAM(value));
        scroll_to(vertical_, static_cast<int>(drag_start_.y) - GET_Y_LPARAM(value));
        return 0;
      case WM_LBUTTONUP:
        ReleaseCapture();
        return 0;
      default:
        return DefWindowProcW(window, message, what, value);
    }
  }

  PreviewEvents& events_;
  PrintControl* print_;
  HWND window_ = nullptr;
  Bar horizontal_{SB_HORZ};
  Bar vertical_{SB_VERT};
  POINT drag_start_{};
};

class PreviewWindow final : public PreviewView {
 public:
  PreviewWindow(PreviewEvents& events, PrintControl* print) : events_(events) {
    constexpr int usual_width = 800;
    constexpr int usual_height = 600;
    const auto make = [](HWND parent) {
      Owned<kind::Menu> menu = make_menu();
      Owned<kind::Window> window(CreateWindowExW(0, frame_class, L"", WS_OVERLAPPEDWINDOW | WS_CLIPCHILDREN,
                                                 CW_USEDEFAULT, CW_USEDEFAULT, usual_width, usual_height, parent,
                                                 menu.get(), own_module(), nullptr));
      // A window ends its menu itself.
      if (window) static_cast<void>(menu.release());
      return window;
    };
    window_ = make(nullptr);
    // Unattended runs may have no desktop to put windows on. They show none.
    if (!window_) {
      window_ = make(HWND_MESSAGE);
      has_desktop_ = false;
    }
    if (!window_) raise(ErrorNumber::internal_error);
    pages_ = std::make_unique<PagesWindow>(window_.get(), events, print);
    SetWindowLongPtrW(window_.get(), GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this));
  }
  PreviewWindow(const PreviewWindow&) = delete;
  PreviewWindow& operator=(const PreviewWindow&) = delete;
  ~PreviewWindow() override {
    if (window_) SetWindowLongPtrW(window_.get(), GWLP_USERDATA, 0);
  }

  void set_caption(TextView caption) override { SetWindowTextW(window_.get(), wide(Text(caption))); }

  [[nodiscard]] std::int32_t window_state() const override {
    // A window that is not shown yet has the state that it will be shown in.
    if (!is_shown_) return state_;
    if (IsIconic(window_.get()) != FALSE) return 1;
    return IsZoomed(window_.get()) != FALSE ? 2 : 0;
  }

  void set_window_state(std::int32_t state) override {
    state_ = state >= 0 && state <= 2 ? state : 0;
    if (is_shown_) ShowWindow(window_.get(), command());
  }

  [[nodiscard]] float width() const override { return twips(outer().right - outer().left); }
  [[nodiscard]] float height() const override { return twips(outer().bottom - outer().top); }
  void set_width(float width) override { resize(pixels(width), outer().bottom - outer().top); }
  void set_height(float height) override { resize(outer().right - outer().left, pixels(height)); }
  [[nodiscard]] float inner_width() const override { return twips(inner().right); }
  [[nodiscard]] float inner_height() const override { return twips(inner().bottom); }

  void size_pages(float width, float height) override {
    const int frame = (static_cast<int>(inner().right) - pixels(width)) / 2;
    MoveWindow(pages_->handle(), frame, frame, pixels(width), pixels(height), TRUE);
  }

  void check(PreviewMenu item, bool is_checked) override {
    CheckMenuItem(GetMenu(window_.get()), command_of(item), is_checked ? MF_CHECKED : MF_UNCHECKED);
  }

  void show_page() override { pages_->show(); }

  void show_modal() override {
    if (!has_desktop_) {
      throw RunTimeError(static_cast<std::int32_t>(ErrorNumber::action_not_supported), Text(no_screen));
    }
    const WaitingWindows others(window_.get());
    is_shown_ = true;
    ShowWindow(window_.get(), command());
    SetForegroundWindow(window_.get());
    events_.resized();
    events_.activated();
    pages_->show();
    handle_until(
        is_closed_, [](const MSG&) { return false; }, [this] { close(); });
    ShowWindow(window_.get(), SW_HIDE);
  }

  void close() override {
    if (is_closed_) return;
    events_.closing();
    is_closed_ = true;
    // Wakes the loop.
    PostMessageW(window_.get(), WM_NULL, 0, 0);
  }

  static LRESULT CALLBACK handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept {
    auto* const self = reinterpret_cast<PreviewWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
    if (self == nullptr) return DefWindowProcW(window, message, what, value);
    return self->answer(message, what, value);
  }

 private:
  static UINT command_of(PreviewMenu item) noexcept { return first_command + static_cast<UINT>(item); }

  static Owned<kind::Menu> make_menu() {
    Owned<kind::Menu> menu(CreateMenu());
    HMENU levels[3] = {menu.get(), nullptr, nullptr};
    for (std::size_t i = 0; i < std::size(preview_menu); ++i) {
      const PreviewMenuItem& item = preview_menu[i];
      const bool opens = i + 1 < std::size(preview_menu) && preview_menu[i + 1].level > item.level;
      if (opens) {
        Owned<kind::Menu> popup(CreatePopupMenu());
        const BOOL is_added = AppendMenuW(levels[item.level], MF_POPUP, reinterpret_cast<UINT_PTR>(popup.get()),
                                          wide(Text(item.caption)));
        levels[item.level + 1] = is_added != FALSE ? popup.release() : nullptr;
      } else {
        AppendMenuW(levels[item.level], MF_STRING, command_of(item.item), wide(Text(item.caption)));
      }
    }
    return menu;
  }

  [[nodiscard]] int command() const noexcept {
    constexpr int commands[] = {SW_SHOWNORMAL, SW_SHOWMINIMIZED, SW_SHOWMAXIMIZED};
    return commands[state_];
  }

  [[nodiscard]] RECT outer() const {
    RECT place{};
    GetWindowRect(window_.get(), &place);
    return place;
  }
  [[nodiscard]] RECT inner() const {
    RECT place{};
    GetClientRect(window_.get(), &place);
    return place;
  }
  [[nodiscard]] float twips(LONG length) const {
    return static_cast<float>(length * twips_per_inch / dots_per_inch(window_.get()));
  }
  [[nodiscard]] int pixels(float length) const {
    return static_cast<int>(std::lround(double{length} * dots_per_inch(window_.get()) / twips_per_inch));
  }
  void resize(LONG width, LONG height) const {
    constexpr LONG most = 32000;
    SetWindowPos(window_.get(), nullptr, 0, 0, static_cast<int>(std::clamp<LONG>(width, 0, most)),
                 static_cast<int>(std::clamp<LONG>(height, 0, most)), SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
  }

  LRESULT answer(UINT message, WPARAM what, LPARAM value) noexcept {
    switch (message) {
      case WM_COMMAND:
        if (LOWORD(what) >= first_command) {
          events_.chosen(static_cast<PreviewMenu>(LOWORD(what) - first_command));
          return 0;
        }
        break;
      case WM_KEYDOWN:
        if (!pages_->take_key(what)) events_.key_down(static_cast<std::int32_t>(what));
        return 0;
      case WM_MOUSEWHEEL:
        pages_->wheel(what);
        return 0;
      case WM_SIZE:
        if (is_shown_) events_.resized();
        return 0;
      case WM_CLOSE:
        close();
        return 0;
      case WM_DESTROY:
        // Somebody else has destroyed the window.
        close();
        static_cast<void>(window_.release());
        return 0;
      default:
        break;
    }
    return DefWindowProcW(window_.get(), message, what, value);
  }

  PreviewEvents& events_;
  Owned<kind::WindowClass> frame_window_class_ =
      register_class(frame_class, &PreviewWindow::handle_message, COLOR_APPWORKSPACE);
  Owned<kind::WindowClass> pages_window_class_ =
      register_class(pages_class, &PagesWindow::handle_message, COLOR_APPWORKSPACE);
  // The window ends first, and the one of the pages with it, which still gets messages then.
  std::unique_ptr<PagesWindow> pages_;
  Owned<kind::Window> window_;
  std::int32_t state_ = 0;
  bool has_desktop_ = true;
  bool is_shown_ = false;
  bool is_closed_ = false;
};

}  // namespace

std::unique_ptr<PreviewView> Win32FormWindows::make_preview(PreviewEvents& events, PrintControl* pages) {
  return std::make_unique<PreviewWindow>(events, pages);
}

}  // namespace talutil::win32
