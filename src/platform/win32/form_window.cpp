// Windows with controls, created from their descriptions.
#include "automation/run_time_error.hpp"
#include "platform/win32/clipboard.hpp"
#include "platform/win32/colours.hpp"
#include "platform/win32/form_keys.hpp"
#include "platform/win32/form_layout.hpp"
#include "platform/win32/modality.hpp"
#include "platform/win32/win32_platform.hpp"
#include "platform/win32/window.hpp"
// After windows.h.
#include <commctrl.h>

namespace talutil::win32 {

namespace {

constexpr DWORD window_style(const FormDescription& description) {
  return description.is_resizable ? WS_OVERLAPPEDWINDOW : WS_POPUP | WS_CAPTION | WS_SYSMENU;
}

class FormWindow final : public TopWindow, public FormView {
 public:
  FormWindow(FormEvents& events, const FormDescription& description)
      : TopWindow(L"TALUtilForm", COLOR_BTNFACE), events_(events), description_(description) {
    make(window_style(description) | WS_CLIPCHILDREN, WS_EX_CONTROLPARENT, nullptr);
    if (handle() == nullptr) throw RunTimeError(ErrorNumber::action_not_supported, Text(no_screen_for_windows));
    parts_.emplace(handle(), description.parts);
    layout_.emplace(handle(), *parts_, description, window_style(description));
    keys_.emplace(handle(), *parts_, events);
    attach();
  }
  ~FormWindow() override {
    hook_.reset();
    destroy();
  }

  void set_caption(TextView caption) override { SetWindowTextW(handle(), wide(Text(up_to_nul(caption)))); }
  void set_text(std::uint8_t part, TextView text) override { parts_->set_text(part, text); }
  [[nodiscard]] Text text(std::uint8_t part) const override { return parts_->text(part); }

  void set_visible(std::uint8_t part, bool is_visible) override {
    PlacedPart& placed = parts_->of(part);
    placed.is_visible = is_visible;
    ShowWindow(placed.window, is_visible ? SW_SHOWNA : SW_HIDE);
  }

  void mask(std::uint8_t part) override { SendMessageW(parts_->of(part).window, EM_SETPASSWORDCHAR, L'*', 0); }

  void set_colour(std::int32_t colour) override {
    colour_ = colour_of(colour);
    brush_.reset(CreateSolidBrush(colour_));
    InvalidateRect(handle(), nullptr, TRUE);
  }

  void remove_frame() override { layout_->set_style(WS_POPUP); }

  void keep_on_top() override {
    SetWindowPos(handle(), HWND_TOPMOST, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE);
  }

  void keep_open() override { is_kept_open_ = true; }
  void fit() override { layout_->fit(); }

  void set_tabs(std::uint8_t part, std::span<const TextView> captions) override {
    for (std::size_t i = 0; i < captions.size(); ++i) {
      Text caption(captions[i]);
      TCITEMW item{};
      item.mask = TCIF_TEXT;
      item.pszText = reinterpret_cast<wchar_t*>(caption.data());
      SendMessageW(parts_->of(part).window, TCM_INSERTITEMW, i, reinterpret_cast<LPARAM>(&item));
    }
  }

  void set_table(std::uint8_t part, TableSource& table, std::int32_t bar_column) override {
    if (auto& list = parts_->of(part).table) list->show(table, bar_column);
  }

  [[nodiscard]] std::intptr_t dialog_owner() const override { return reinterpret_cast<std::intptr_t>(handle()); }
  void copy(TextView text) override { put_on_clipboard(handle(), text); }

  void show() override {
    if (!is_shown_) layout_->centre();
    // A window that the user has made larger stays so.
    show_window(handle(), !is_shown_ || IsIconic(handle()) != FALSE ? SW_SHOWNORMAL : SW_SHOW);
    is_shown_ = true;
    SetForegroundWindow(handle());
    RedrawWindow(handle(), nullptr, nullptr, RDW_ERASE | RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    // The host's message loop receives the keys of a modeless window.
    if (!hook_) hook_.reset(SetWindowsHookExW(WH_GETMESSAGE, &take_from_host, nullptr, GetCurrentThreadId()));
  }

  void show_modal() override {
    if (is_modal_) {
      SetForegroundWindow(handle());
      wait_until_closed();
      return;
    }
    is_modal_ = true;
    // Minimised, it would be a stub in the corner of the screen while its owner cannot be used.
    SetWindowLongPtrW(handle(), GWL_STYLE, GetWindowLongPtrW(handle(), GWL_STYLE) & ~LONG_PTR{WS_MINIMIZEBOX});
    const WaitingWindows others(handle());
    show();
    hook_.reset();
    wait_until_closed();
  }

  [[nodiscard]] bool is_open() const override { return !is_closed(); }

  void close(CloseMode mode) override {
    if (is_closed()) return;
    end_showing(mode);
    // A modal window is hidden when `show_modal` ends.
    if (!is_modal_) destroy();
  }

  bool take(MSG& message) override {
    if (handle() == nullptr || (message.hwnd != handle() && IsChild(handle(), message.hwnd) == FALSE)) return false;
    return keys_->take(message) || IsDialogMessageW(handle(), &message) != FALSE;
  }

 protected:
  void close_by_code() override { close(CloseMode::code); }

  std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) override {
    switch (message) {
      case WM_COMMAND:
        answer_command(LOWORD(what), HIWORD(what));
        return 0;
      case WM_NOTIFY:
        return answer_notice(*reinterpret_cast<NMHDR*>(value));
      case DM_GETDEFID: {
        const PlacedPart* const button = parts_->default_button();
        return button == nullptr ? 0 : MAKELRESULT(FormParts::command_of(*button), DC_HASDEFID);
      }
      case WM_NEXTDLGCTL:
        // A label reached by its mnemonic gets the focus for a moment, then passes it on.
        keys_->focus(LOWORD(value) != 0 ? reinterpret_cast<HWND>(what)
                                        : GetNextDlgTabItem(handle(), GetFocus(), what != 0));
        return 0;
      case WM_CTLCOLORSTATIC:
      case WM_CTLCOLORBTN:
        return colour_part(reinterpret_cast<HDC>(what), reinterpret_cast<HWND>(value));
      case WM_ERASEBKGND: {
        if (!brush_) return std::nullopt;
        const RECT inside = inner();
        FillRect(reinterpret_cast<HDC>(what), &inside, brush_.get());
        return 1;
      }
      case WM_SIZE:
        layout_->follow();
        return 0;
      case wm_dpi_changed:
        layout_->set_dots(LOWORD(what), *reinterpret_cast<const RECT*>(value));
        InvalidateRect(handle(), nullptr, TRUE);
        return 0;
      case WM_GETMINMAXINFO:
        if (layout_->smallest().cx == 0) return std::nullopt;
        reinterpret_cast<MINMAXINFO*>(value)->ptMinTrackSize = {layout_->smallest().cx, layout_->smallest().cy};
        return 0;
      case WM_ACTIVATE:
        if (LOWORD(what) == WA_INACTIVE) keys_->remember_focus();
        return std::nullopt;
      case WM_SETFOCUS:
        keys_->return_focus();
        return 0;
      case WM_SYSCOMMAND:
        // The lowest four bits are the system's own.
        if ((what & 0xFFF0U) == SC_CLOSE && is_kept_open_) return 0;
        return std::nullopt;
      case WM_CLOSE:
        close(CloseMode::control_menu);
        return 0;
      case WM_DESTROY:
        // Destroyed from outside, most likely along with its owner.
        if (!is_closed()) end_showing(CloseMode::code);
        forget();
        return 0;
      default:
        return std::nullopt;
    }
  }

 private:
  /// Handles the keys of modeless windows in messages that the host takes from the queue.
  static LRESULT CALLBACK take_from_host(int code, WPARAM what, LPARAM value) noexcept {
    if (code == HC_ACTION && what == PM_REMOVE) {
      auto& message = *reinterpret_cast<MSG*>(value);
      auto* const self = dynamic_cast<FormWindow*>(of(GetAncestor(message.hwnd, GA_ROOT)));
      if (self != nullptr && !self->is_modal_ && self->take(message)) message.message = WM_NULL;
    }
    return CallNextHookEx(nullptr, code, what, value);
  }

  void end_showing(CloseMode mode) {
    set_closed();
    events_.closing(mode);
    for (PlacedPart& placed : *parts_) {
      if (placed.table) placed.table->close();
    }
    hook_.reset();
    wake();
  }

  void answer_command(WORD command, WORD notice) {
    if (command == IDCANCEL) return events_.escaped();
    if (const PlacedPart* const placed = parts_->find_command(command); placed != nullptr && notice == BN_CLICKED) {
      events_.clicked(placed->part->id);
    }
  }

  [[nodiscard]] std::optional<LRESULT> answer_notice(NMHDR& notice) {
    const PlacedPart* const placed = parts_->find(notice.hwndFrom);
    if (placed == nullptr) return std::nullopt;
    if (placed->table) return placed->table->answer(notice);
    if (notice.code != TCN_SELCHANGE) return std::nullopt;
    events_.tab_chosen(placed->part->id, static_cast<std::int32_t>(SendMessageW(placed->window, TCM_GETCURSEL, 0, 0)));
    return 0;
  }

  [[nodiscard]] std::optional<LRESULT> colour_part(HDC device, HWND control) {
    if (!brush_) return parts_->draw_page_behind(control, device);
    SetBkMode(device, TRANSPARENT);
    SetTextColor(device, readable_on(colour_));
    SetBkColor(device, colour_);
    return reinterpret_cast<LRESULT>(brush_.get());
  }

  FormEvents& events_;
  const FormDescription& description_;
  // Set as soon as the window exists.
  std::optional<FormParts> parts_;
  std::optional<FormLayout> layout_;
  std::optional<FormKeys> keys_;
  Owned<kind::Brush> brush_;
  Owned<kind::Hook> hook_;
  COLORREF colour_ = 0;
  bool is_shown_ = false;
  bool is_modal_ = false;
  bool is_kept_open_ = false;
};

}  // namespace

std::unique_ptr<FormView> Win32FormWindows::make_form(FormEvents& events, const FormDescription& description) {
  return std::make_unique<FormWindow>(events, description);
}

}  // namespace talutil::win32
