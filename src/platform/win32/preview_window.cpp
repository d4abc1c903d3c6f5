// The preview window: a frame with menus around the pages.
#include <algorithm>
#include <cmath>

#include "automation/run_time_error.hpp"
#include "platform/win32/modality.hpp"
#include "platform/win32/pages_window.hpp"
#include "platform/win32/win32_platform.hpp"

namespace talutil::win32 {

namespace {

constexpr UINT first_command = 100;

UINT command_of(PreviewMenu item) noexcept { return first_command + static_cast<UINT>(item); }

/// A caption with a letter that Alt, or the letter alone in an open menu, chooses it by: the first one that no caption
/// before it in the same menu has.
Text with_letter(TextView caption, Text& taken) {
  Text result(caption);
  for (std::size_t i = 0; i < result.size(); ++i) {
    const char16_t letter = upper_case(result[i]);
    const bool is_usable = (letter >= u'A' && letter <= u'Z') || (letter >= u'0' && letter <= u'9');
    if (!is_usable || taken.find(letter) != Text::npos) continue;
    taken += letter;
    return result.insert(i, 1, u'&');
  }
  return result;
}

Owned<kind::Menu> make_menu() {
  Owned<kind::Menu> menu(CreateMenu());
  HMENU levels[3] = {menu.get(), nullptr, nullptr};
  Text taken[3];
  for (std::size_t i = 0; i < std::size(preview_menu); ++i) {
    const PreviewMenuItem& item = preview_menu[i];
    const bool opens = i + 1 < std::size(preview_menu) && preview_menu[i + 1].level > item.level;
    const Text caption = with_letter(item.caption, taken[item.level]);
    if (opens) {
      Owned<kind::Menu> popup(CreatePopupMenu());
      const BOOL is_added =
          AppendMenuW(levels[item.level], MF_POPUP, reinterpret_cast<UINT_PTR>(popup.get()), wide(caption));
      taken[item.level + 1].clear();
      levels[item.level + 1] = is_added != FALSE ? popup.release() : nullptr;
    } else {
      AppendMenuW(levels[item.level], MF_STRING, command_of(item.item), wide(caption));
    }
  }
  return menu;
}

class PreviewWindow final : public TopWindow, public PreviewView {
 public:
  PreviewWindow(PreviewEvents& events, const PreviewPages* pages)
      : TopWindow(L"TALUtilPreview", COLOR_APPWORKSPACE), events_(events) {
    constexpr DWORD style = WS_OVERLAPPEDWINDOW | WS_CLIPCHILDREN;
    // In pixels at 96 dots per inch.
    constexpr int usual_width = 800;
    constexpr int usual_height = 600;
    make(style, 0, nullptr, L"", make_menu());
    // An unattended run may have no desktop for windows; nothing is shown then.
    if (handle() == nullptr) {
      make(style, 0, HWND_MESSAGE, L"", make_menu());
      has_desktop_ = false;
    }
    if (handle() == nullptr) raise(ErrorNumber::internal_error);
    resize(scaled(usual_width, handle()), scaled(usual_height, handle()));
    pages_.emplace(handle(), events, pages);
    attach();
  }
  ~PreviewWindow() override { destroy(); }

  void set_caption(TextView caption) override { SetWindowTextW(handle(), wide(Text(caption))); }

  [[nodiscard]] std::int32_t window_state() const override {
    // Before the window is shown, this is the state in which it will be shown.
    if (!is_shown_) return state_;
    if (IsIconic(handle()) != FALSE) return 1;
    return IsZoomed(handle()) != FALSE ? 2 : 0;
  }

  void set_window_state(std::int32_t state) override {
    state_ = state >= 0 && state <= 2 ? state : 0;
    if (is_shown_) ShowWindow(handle(), command());
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
    CheckMenuItem(GetMenu(handle()), command_of(item), is_checked ? MF_CHECKED : MF_UNCHECKED);
  }

  void show_page() override { pages_->show(); }

  void show_modal() override {
    if (!has_desktop_) throw RunTimeError(ErrorNumber::action_not_supported, Text(no_screen));
    const WaitingWindows others(handle());
    is_shown_ = true;
    show_window(handle(), command());
    SetForegroundWindow(handle());
    events_.resized();
    events_.activated();
    pages_->show();
    wait_until_closed();
  }

  void close() override {
    if (is_closed()) return;
    set_closed();
    events_.closing();
    wake();
  }

 protected:
  void close_by_code() override { close(); }

  std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) override {
    switch (message) {
      case WM_COMMAND:
        if (LOWORD(what) < first_command) return std::nullopt;
        events_.chosen(static_cast<PreviewMenu>(LOWORD(what) - first_command));
        return 0;
      // Keys with Alt come as messages of their own; Alt alone, and F10, open the menus.
      case WM_SYSKEYDOWN:
        if (what == VK_MENU || what == VK_F10 || what == VK_F4) return std::nullopt;
        if (!is_our_key(what)) return std::nullopt;
        [[fallthrough]];
      case WM_KEYDOWN:
        if (!pages_->take_key(what)) events_.key_down(static_cast<std::int32_t>(what));
        return 0;
      case WM_MOUSEWHEEL:
        pages_->wheel(what);
        return 0;
      case wm_dpi_changed: {
        const RECT& place = *reinterpret_cast<const RECT*>(value);
        SetWindowPos(handle(), nullptr, static_cast<int>(place.left), static_cast<int>(place.top),
                     static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top),
                     SWP_NOZORDER | SWP_NOACTIVATE);
        pages_->show();
        return 0;
      }
      case WM_SIZE:
        if (is_shown_) events_.resized();
        return 0;
      case WM_CLOSE:
        close();
        return 0;
      case WM_DESTROY:
        // The window was destroyed from outside.
        close();
        forget();
        return 0;
      default:
        return std::nullopt;
    }
  }

 private:
  [[nodiscard]] int command() const noexcept {
    constexpr int commands[] = {SW_SHOWNORMAL, SW_SHOWMINIMIZED, SW_SHOWMAXIMIZED};
    return commands[state_];
  }

  [[nodiscard]] float twips(LONG length) const {
    return static_cast<float>(length * twips_per_inch / dots_per_inch(handle()));
  }
  [[nodiscard]] int pixels(float length) const {
    return static_cast<int>(std::lround(double{length} * dots_per_inch(handle()) / twips_per_inch));
  }
  void resize(LONG width, LONG height) const {
    constexpr LONG most = 32000;
    SetWindowPos(handle(), nullptr, 0, 0, static_cast<int>(std::clamp<LONG>(width, 0, most)),
                 static_cast<int>(std::clamp<LONG>(height, 0, most)), SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
  }

  [[nodiscard]] static bool is_our_key(WPARAM key) noexcept {
    return key == VK_F2 || key == VK_F3 || key == VK_F9 || key == VK_ESCAPE;
  }

  PreviewEvents& events_;
  std::optional<PagesWindow> pages_;
  std::int32_t state_ = 0;
  bool has_desktop_ = true;
  bool is_shown_ = false;
};

}  // namespace

std::unique_ptr<PreviewView> Win32FormWindows::make_preview(PreviewEvents& events, const PreviewPages* pages) {
  return std::make_unique<PreviewWindow>(events, pages);
}

}  // namespace talutil::win32
