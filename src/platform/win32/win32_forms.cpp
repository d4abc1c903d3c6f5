// Windows with controls, made from their description: the system's own controls in the system's font.
#include <algorithm>
#include <array>
#include <cmath>
#include <optional>

#include "automation/run_time_error.hpp"
#include "controls/grid.hpp"
#include "forms/form_view.hpp"
#include "platform/win32/colours.hpp"
#include "platform/win32/win32_platform.hpp"
#include "platform/win32/window.hpp"
// After windows.h.
#include <commctrl.h>
#include <richedit.h>

namespace talutil::win32 {

namespace {

constexpr const wchar_t* form_class = L"TALUtilForm";
constexpr int first_id = 100;

/// What the system's own controls need before the first of them is made.
void load_controls() {
  static_cast<void>(system_library(L"riched20.dll"));
  const auto start = late_function<BOOL(WINAPI*)(const INITCOMMONCONTROLSEX*)>(L"comctl32.dll", "InitCommonControlsEx");
  const INITCOMMONCONTROLSEX wanted{sizeof wanted, ICC_LISTVIEW_CLASSES | ICC_TAB_CLASSES | ICC_BAR_CLASSES};
  if (start != nullptr) start(&wanted);
}

/// The system's font for texts on windows, with the measures that dialog units stand for.
class SystemFont {
 public:
  SystemFont() {
    NONCLIENTMETRICSW metrics{};
    metrics.cbSize = sizeof metrics;
    if (SystemParametersInfoW(SPI_GETNONCLIENTMETRICS, sizeof metrics, &metrics, 0) != FALSE) {
      font_.reset(CreateFontIndirectW(&metrics.lfMessageFont));
    }
    const Owned<kind::WindowDevice> context = device_of(nullptr);
    const Owned<kind::Selection> selected = select(context.get(), get());
    constexpr wchar_t letters[] = L"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz";
    SIZE size{};
    GetTextExtentPoint32W(context.get(), letters, 52, &size);
    // The average letter, rounded as the system's dialogs round it.
    width_ = (static_cast<int>(size.cx) / 26 + 1) / 2;
    height_ = static_cast<int>(size.cy);
  }

  [[nodiscard]] HGDIOBJ get() const noexcept { return font_ ? font_.get() : GetStockObject(DEFAULT_GUI_FONT); }
  [[nodiscard]] int across(int units) const noexcept { return MulDiv(units, width_, 4); }
  [[nodiscard]] int down(int units) const noexcept { return MulDiv(units, height_, 8); }

  /// How high a text is that is broken into a width.
  [[nodiscard]] int height_of(const Text& text, int width) const {
    RECT place{0, 0, width, 0};
    const Owned<kind::WindowDevice> context = device_of(nullptr);
    const Owned<kind::Selection> selected = select(context.get(), get());
    constexpr UINT format = DT_CALCRECT | DT_WORDBREAK | DT_NOPREFIX | DT_EXPANDTABS | DT_EDITCONTROL;
    DrawTextW(context.get(), wide(text), -1, &place, format);
    return static_cast<int>(place.bottom);
  }

 private:
  Owned<kind::Font> font_;
  int width_ = 0;
  int height_ = 0;
};

struct ControlKind {
  const wchar_t* class_name;
  DWORD style;
  DWORD extended_style;
};

ControlKind kind_of(const FormPart& part) {
  switch (part.kind) {
    case PartKind::label:
      return {L"STATIC", static_cast<DWORD>(part.is_growing ? SS_NOPREFIX | SS_EDITCONTROL : SS_LEFT), 0};
    case PartKind::entry:
      return {L"EDIT", WS_TABSTOP | ES_AUTOHSCROLL, WS_EX_CLIENTEDGE};
    case PartKind::button:
      return {L"BUTTON", WS_TABSTOP | static_cast<DWORD>(part.is_default ? BS_DEFPUSHBUTTON : BS_PUSHBUTTON), 0};
    case PartKind::rich_text:
      return {L"RichEdit20W", WS_TABSTOP | WS_VSCROLL | ES_MULTILINE | ES_READONLY | ES_NOHIDESEL, WS_EX_CLIENTEDGE};
    case PartKind::table:
      return {L"SysListView32", WS_TABSTOP | LVS_REPORT | LVS_OWNERDATA | LVS_SHOWSELALWAYS, WS_EX_CLIENTEDGE};
    default:
      return {L"SysTabControl32", WS_TABSTOP | WS_CLIPSIBLINGS, 0};
  }
}

DWORD CALLBACK read_rich_text(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* read) {
  auto& rest = *reinterpret_cast<std::string_view*>(cookie);
  const std::string_view part = rest.substr(0, static_cast<std::size_t>(size));
  std::ranges::copy(part, buffer);
  rest.remove_prefix(part.size());
  *read = static_cast<LONG>(part.size());
  return 0;
}

/// Black or white, whichever stands out more from a colour by its brightness.
COLORREF readable_on(COLORREF colour) noexcept {
  constexpr int middle = 128'000;
  const int brightness = GetRValue(colour) * 299 + GetGValue(colour) * 587 + GetBValue(colour) * 114;
  return brightness < middle ? RGB(255, 255, 255) : RGB(0, 0, 0);
}

class FormWindow final : public FormView {
 public:
  FormWindow(FormEvents& events, const FormDescription& description) : events_(events), description_(description) {
    load_controls();
    style_ = description.is_resizable ? WS_OVERLAPPEDWINDOW : WS_POPUP | WS_CAPTION | WS_SYSMENU;
    window_.reset(CreateWindowExW(WS_EX_CONTROLPARENT, form_class, L"", style_ | WS_CLIPCHILDREN, 0, 0, 0, 0, nullptr,
                                  nullptr, own_module(), nullptr));
    if (!window_) {
      throw RunTimeError(static_cast<std::int32_t>(ErrorNumber::action_not_supported), Text(no_screen_for_windows));
    }
    for (const FormPart& part : description.parts) add(part);
    SetWindowLongPtrW(window_.get(), GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this));
    // Tabs lie behind what stands on their pages.
    for (const Control& control : controls_) {
      constexpr UINT order_alone = SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE;
      if (control.part->kind == PartKind::tabs) SetWindowPos(control.window, HWND_BOTTOM, 0, 0, 0, 0, order_alone);
    }
    inner_ = {font_.across(description.width), font_.down(description.height)};
    size_to_inside();
    const SIZE size = outer_size();
    smallest_ = {size.cx / 2, size.cy / 2};
  }
  FormWindow(const FormWindow&) = delete;
  FormWindow& operator=(const FormWindow&) = delete;
  ~FormWindow() override {
    if (window_) SetWindowLongPtrW(window_.get(), GWLP_USERDATA, 0);
  }

  void set_caption(TextView caption) override { SetWindowTextW(window_.get(), wide(Text(up_to_nul(caption)))); }

  void set_text(std::uint8_t part, TextView text) override {
    const HWND control = window_of(part);
    // Elsewhere a text that looks like rich text is what the host has written.
    if (control_of(part).part->kind != PartKind::rich_text || !text.starts_with(u"{\\rtf")) {
      SetWindowTextW(control, wide(Text(up_to_nul(text))));
      return;
    }
    const std::string bytes = to_ansi(text);
    std::string_view rest = bytes;
    EDITSTREAM stream{reinterpret_cast<DWORD_PTR>(&rest), 0, &read_rich_text};
    SendMessageW(control, EM_EXLIMITTEXT, 0, static_cast<LPARAM>(bytes.size()));
    SendMessageW(control, EM_STREAMIN, SF_RTF, reinterpret_cast<LPARAM>(&stream));
  }

  [[nodiscard]] Text text(std::uint8_t part) const override {
    const HWND control = window_of(part);
    Text text(static_cast<std::size_t>(GetWindowTextLengthW(control)) + 1, u'\0');
    const int length = GetWindowTextW(control, reinterpret_cast<wchar_t*>(text.data()), static_cast<int>(text.size()));
    text.resize(static_cast<std::size_t>(length));
    return text;
  }

  void set_visible(std::uint8_t part, bool is_visible) override {
    control_of(part).is_visible = is_visible;
    ShowWindow(window_of(part), is_visible ? SW_SHOWNA : SW_HIDE);
  }

  void mask(std::uint8_t part) override { SendMessageW(window_of(part), EM_SETPASSWORDCHAR, L'*', 0); }

  void set_colour(std::int32_t colour) override {
    colour_ = colour_of(colour);
    brush_.reset(CreateSolidBrush(colour_));
    InvalidateRect(window_.get(), nullptr, TRUE);
  }

  void remove_frame() override {
    style_ = WS_POPUP;
    SetWindowLongPtrW(window_.get(), GWL_STYLE, static_cast<LONG>(style_ | WS_CLIPCHILDREN));
    size_to_inside();
  }

  void keep_on_top() override {
    SetWindowPos(window_.get(), HWND_TOPMOST, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE);
  }

  void fit() override {
    RECT work{};
    SystemParametersInfoW(SPI_GETWORKAREA, 0, &work, 0);
    const int most_height = static_cast<int>(work.bottom - work.top) * 2 / 3;
    int shift = 0;
    int bottom_before = 0;
    for (Control& control : controls_) {
      const FormPart& part = *control.part;
      const int top = font_.down(part.place.top);
      const int height = font_.down(part.place.height);
      if (!control.is_visible) {
        shift -= height + top - bottom_before;
      } else {
        control.place.top = top + shift;
        control.place.bottom = top + shift + height;
        if (part.is_growing) {
          const int needed = font_.height_of(text(part.id), font_.across(part.place.width));
          if (needed > most_height) make_scrollable(control);
          control.place.bottom = control.place.top + std::clamp(needed, height, most_height);
          shift += static_cast<int>(control.place.bottom - control.place.top) - height;
        }
        move(control, 0, 0);
      }
      bottom_before = top + height;
    }
    inner_.cy = font_.down(description_.height) + shift;
    size_to_inside();
  }

  void set_tabs(std::uint8_t part, std::span<const TextView> captions) override {
    const HWND tabs = window_of(part);
    for (std::size_t i = 0; i < captions.size(); ++i) {
      Text caption(captions[i]);
      TCITEMW item{};
      item.mask = TCIF_TEXT;
      item.pszText = reinterpret_cast<wchar_t*>(caption.data());
      SendMessageW(tabs, TCM_INSERTITEMW, i, reinterpret_cast<LPARAM>(&item));
    }
  }

  void set_table(std::uint8_t part, Grid& table, std::int32_t bar_column) override {
    Control& control = control_of(part);
    control.table = &table;
    control.bar_column = bar_column;
    table.set_window(static_cast<std::int32_t>(reinterpret_cast<LONG_PTR>(control.window)));
    while (SendMessageW(control.window, LVM_DELETECOLUMN, 0, 0) != 0) {
    }
    const int dots = dots_per_inch(window_.get());
    RECT room{};
    GetClientRect(control.window, &room);
    int rest = static_cast<int>(room.right) - GetSystemMetrics(SM_CXVSCROLL);
    for (std::int32_t c = 0; c < table.Cols(); ++c) {
      Text heading = table.FixedRows() > 0 ? table.TextMatrix(0, c) : Text();
      LVCOLUMNW column{};
      column.mask = LVCF_TEXT | LVCF_WIDTH | LVCF_SUBITEM;
      column.cx = static_cast<int>(std::lround(table.ColWidth(c) * dots / twips_per_inch));
      rest -= column.cx;
      // The last one takes what room is left.
      if (c + 1 == table.Cols() && rest > 0) column.cx += rest;
      column.pszText = reinterpret_cast<wchar_t*>(heading.data());
      column.iSubItem = c;
      SendMessageW(control.window, LVM_INSERTCOLUMNW, static_cast<WPARAM>(c), reinterpret_cast<LPARAM>(&column));
    }
    SendMessageW(control.window, LVM_SETITEMCOUNT, static_cast<WPARAM>(table.Rows() - table.FixedRows()), 0);
    InvalidateRect(control.window, nullptr, TRUE);
  }

  void copy(TextView text) override {
    const std::size_t size = (text.size() + 1) * sizeof(char16_t);
    // Another program may have it open for a moment.
    Owned<kind::Clipboard> clipboard(OpenClipboard(window_.get()));
    for (int tries = 0; !clipboard; ++tries) {
      constexpr std::int32_t cannot_open_clipboard = 521;
      if (tries == 10) throw RunTimeError(cannot_open_clipboard, u"Can't open Clipboard");
      Sleep(20);
      clipboard.reset(OpenClipboard(window_.get()));
    }
    EmptyClipboard();
    Owned<kind::GlobalMemory> block(GlobalAlloc(GMEM_MOVEABLE, size));
    if (!block) return;
    {
      const Owned<kind::LockedMemory> locked = lock(block.get());
      *std::ranges::copy(text, static_cast<char16_t*>(locked.get())).out = u'\0';
    }
    if (SetClipboardData(CF_UNICODETEXT, block.get()) != nullptr) static_cast<void>(block.release());
  }

  void show() override {
    if (!is_shown_) centre();
    is_shown_ = true;
    ShowWindow(window_.get(), SW_SHOWNORMAL);
    SetForegroundWindow(window_.get());
    RedrawWindow(window_.get(), nullptr, nullptr, RDW_ERASE | RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    // The keys of a window that nobody waits for come by way of the host's loop.
    if (!hook_) hook_.reset(SetWindowsHookExW(WH_GETMESSAGE, &take_message, nullptr, GetCurrentThreadId()));
  }

  void show_modal() override {
    const auto translate = [this](MSG& message) { return take(message); };
    const auto quit = [this] { close(CloseMode::code); };
    if (is_modal_) {
      SetForegroundWindow(window_.get());
      handle_until(is_closed_, translate, quit);
      return;
    }
    is_modal_ = true;
    const WaitingWindows others(window_.get());
    SetWindowLongPtrW(window_.get(), GWLP_HWNDPARENT, reinterpret_cast<LONG_PTR>(others.owner()));
    show();
    hook_.reset();
    handle_until(is_closed_, translate, quit);
    if (window_) ShowWindow(window_.get(), SW_HIDE);
  }

  [[nodiscard]] bool is_open() const override { return !is_closed_; }

  void close(CloseMode mode) override {
    if (is_closed_) return;
    is_closed_ = true;
    events_.closing(mode);
    for (Control& control : controls_) {
      if (control.table != nullptr) std::exchange(control.table, nullptr)->set_window(0);
    }
    hook_.reset();
    if (!is_modal_) window_.reset();
    // Wakes the loop.
    if (is_modal_) PostThreadMessageW(GetCurrentThreadId(), WM_NULL, 0, 0);
  }

  static LRESULT CALLBACK handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept {
    auto* const self = reinterpret_cast<FormWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
    if (self == nullptr || !self->window_) return DefWindowProcW(window, message, what, value);
    try {
      if (const auto answer = self->answer(message, what, value)) return *answer;
    } catch (...) {
      // Nothing may leave a window procedure.
    }
    return DefWindowProcW(window, message, what, value);
  }

 private:
  struct Control {
    const FormPart* part;
    HWND window;
    RECT place;  ///< In a window of its first size.
    bool is_visible = true;
    Grid* table = nullptr;
    std::int32_t bar_column = -1;
  };

  void add(const FormPart& part) {
    const ControlKind kind = kind_of(part);
    const int left = font_.across(part.place.left);
    const int top = font_.down(part.place.top);
    const RECT place{left, top, left + font_.across(part.place.width), top + font_.down(part.place.height)};
    controls_.push_back({&part, make_control(part, kind, place), place});
    const HWND control = controls_.back().window;
    if (part.kind == PartKind::table) {
      constexpr DWORD looks = LVS_EX_FULLROWSELECT | LVS_EX_GRIDLINES | LVS_EX_DOUBLEBUFFER;
      SendMessageW(control, LVM_SETEXTENDEDLISTVIEWSTYLE, looks, looks);
    }
    if (part.kind == PartKind::entry) SendMessageW(control, EM_SETLIMITTEXT, 0, 0);
    if (!part.tip.empty()) add_tip(control, part.tip);
  }

  [[nodiscard]] HWND make_control(const FormPart& part, const ControlKind& kind, const RECT& place) const {
    const HWND control = CreateWindowExW(
        kind.extended_style, kind.class_name, wide(Text(part.caption)), WS_CHILD | WS_VISIBLE | kind.style,
        static_cast<int>(place.left), static_cast<int>(place.top), static_cast<int>(place.right - place.left),
        static_cast<int>(place.bottom - place.top), window_.get(),
        reinterpret_cast<HMENU>(static_cast<INT_PTR>(first_id + part.id)), own_module(), nullptr);
    if (control == nullptr) raise(ErrorNumber::internal_error);
    SendMessageW(control, WM_SETFONT, reinterpret_cast<WPARAM>(font_.get()), FALSE);
    return control;
  }

  void add_tip(HWND control, TextView tip) {
    // Without an owner: some systems put a window below its own tips, which keeps it from the top.
    Owned<kind::Window> tips(CreateWindowExW(WS_EX_TOPMOST, L"tooltips_class32", nullptr, WS_POPUP | TTS_ALWAYSTIP, 0,
                                             0, 0, 0, nullptr, nullptr, own_module(), nullptr));
    Text text(tip);
    TTTOOLINFOW tool{};
    tool.cbSize = TTTOOLINFOW_V1_SIZE;
    tool.uFlags = TTF_IDISHWND | TTF_SUBCLASS;
    tool.hwnd = window_.get();
    tool.uId = reinterpret_cast<UINT_PTR>(control);
    tool.lpszText = reinterpret_cast<wchar_t*>(text.data());
    SendMessageW(tips.get(), TTM_ADDTOOLW, 0, reinterpret_cast<LPARAM>(&tool));
    tips_.push_back(std::move(tips));
  }

  /// A label that is higher than the screen becomes a text that can be scrolled.
  void make_scrollable(Control& control) {
    Text broken;
    for (const char16_t unit : text(control.part->id)) {
      if (unit == u'\n' && !broken.ends_with(u'\r')) broken += u'\r';
      broken += unit;
    }
    const HWND before = control.window;
    constexpr ControlKind kind{L"EDIT", WS_TABSTOP | WS_VSCROLL | ES_MULTILINE | ES_READONLY, 0};
    control.window = make_control(*control.part, kind, control.place);
    SendMessageW(control.window, EM_SETLIMITTEXT, 0, 0);
    SetWindowTextW(control.window, wide(broken));
    SetWindowPos(control.window, before, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
    DestroyWindow(before);
  }

  [[nodiscard]] const Control& control_of(std::uint8_t part) const {
    const auto found =
        std::ranges::find_if(controls_, [&](const Control& control) { return control.part->id == part; });
    if (found == controls_.end()) raise(ErrorNumber::internal_error);
    return *found;
  }
  [[nodiscard]] Control& control_of(std::uint8_t part) {
    return const_cast<Control&>(std::as_const(*this).control_of(part));
  }
  [[nodiscard]] HWND window_of(std::uint8_t part) const { return control_of(part).window; }

  [[nodiscard]] SIZE outer_size() const {
    RECT outer{};
    GetWindowRect(window_.get(), &outer);
    return {outer.right - outer.left, outer.bottom - outer.top};
  }

  void size_to_inside() const {
    RECT outer{0, 0, inner_.cx, inner_.cy};
    AdjustWindowRectEx(&outer, style_, FALSE, WS_EX_CONTROLPARENT);
    SetWindowPos(window_.get(), nullptr, 0, 0, static_cast<int>(outer.right - outer.left),
                 static_cast<int>(outer.bottom - outer.top),
                 SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_FRAMECHANGED);
  }

  void centre() const {
    RECT work{};
    SystemParametersInfoW(SPI_GETWORKAREA, 0, &work, 0);
    SIZE size = outer_size();
    // One that can be resized need not be larger than the screen.
    if (description_.is_resizable) {
      size = {std::min(size.cx, work.right - work.left), std::min(size.cy, work.bottom - work.top)};
    }
    const auto middle = [](LONG start, LONG end, LONG length) {
      return static_cast<int>(std::max(start, start + (end - start - length) / 2));
    };
    SetWindowPos(window_.get(), nullptr, middle(work.left, work.right, size.cx), middle(work.top, work.bottom, size.cy),
                 static_cast<int>(size.cx), static_cast<int>(size.cy), SWP_NOZORDER | SWP_NOACTIVATE);
  }

  /// Puts a control where it belongs in a window that has grown by so much.
  static void move(const Control& control, int across, int down) {
    RECT place = control.place;
    const std::uint8_t follows = control.part->follows;
    if ((follows & part_follows::right) != 0) OffsetRect(&place, across, 0);
    if ((follows & part_follows::bottom) != 0) OffsetRect(&place, 0, down);
    if ((follows & part_follows::width) != 0) place.right += across;
    if ((follows & part_follows::height) != 0) place.bottom += down;
    SetWindowPos(control.window, nullptr, static_cast<int>(place.left), static_cast<int>(place.top),
                 static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top),
                 SWP_NOZORDER | SWP_NOACTIVATE);
  }

  void lay_out() const {
    if (!description_.is_resizable || IsIconic(window_.get()) != FALSE) return;
    RECT inside{};
    GetClientRect(window_.get(), &inside);
    for (const Control& control : controls_) {
      move(control, static_cast<int>(inside.right - inner_.cx), static_cast<int>(inside.bottom - inner_.cy));
    }
  }

  static LRESULT CALLBACK take_message(int code, WPARAM what, LPARAM value) noexcept {
    if (code == HC_ACTION && what == PM_REMOVE) {
      auto& message = *reinterpret_cast<MSG*>(value);
      const HWND root = message.hwnd == nullptr ? nullptr : GetAncestor(message.hwnd, GA_ROOT);
      std::array<wchar_t, 16> name{};
      if (root != nullptr && GetClassNameW(root, name.data(), static_cast<int>(name.size())) != 0 &&
          lstrcmpW(name.data(), form_class) == 0) {
        auto* const self = reinterpret_cast<FormWindow*>(GetWindowLongPtrW(root, GWLP_USERDATA));
        if (self != nullptr && !self->is_modal_ && self->take(message)) message.message = WM_NULL;
      }
    }
    return CallNextHookEx(nullptr, code, what, value);
  }

  [[nodiscard]] static bool is_down(int key) noexcept { return GetKeyState(key) < 0; }

  /// Handles the keys that move about a window. False for other messages.
  bool take(MSG& message) {
    if (!window_ || (message.hwnd != window_.get() && IsChild(window_.get(), message.hwnd) == FALSE)) return false;
    if (message.message == WM_KEYDOWN && take_key(message.wParam)) return true;
    return IsDialogMessageW(window_.get(), &message) != FALSE;
  }

  bool take_key(WPARAM key) {
    const bool is_control = is_down(VK_CONTROL);
    const auto focused = std::ranges::find(controls_, GetFocus(), &Control::window);
    Grid* const table = focused == controls_.end() ? nullptr : focused->table;
    if (key == VK_ESCAPE) {
      events_.escaped();
      return true;
    }
    if (key == VK_TAB) {
      if (is_control) return turn_tab(is_down(VK_SHIFT));
      // Rich texts would take the key for themselves.
      focus(GetNextDlgTabItem(window_.get(), GetFocus(), is_down(VK_SHIFT) ? TRUE : FALSE));
      return true;
    }
    if (is_control && key == 'C' && table != nullptr) {
      copy(selected_rows(*focused));
      return true;
    }
    if (is_control && key == 'A' && focused != controls_.end()) {
      if (table != nullptr) select_rows(focused->window);
      if (focused->part->kind == PartKind::entry) SendMessageW(focused->window, EM_SETSEL, 0, -1);
      return table != nullptr || focused->part->kind == PartKind::entry;
    }
    return false;
  }

  bool turn_tab(bool is_back) {
    const auto tabs =
        std::ranges::find_if(controls_, [](const Control& control) { return control.part->kind == PartKind::tabs; });
    if (tabs == controls_.end()) return false;
    const auto count = static_cast<int>(SendMessageW(tabs->window, TCM_GETITEMCOUNT, 0, 0));
    const auto now = static_cast<int>(SendMessageW(tabs->window, TCM_GETCURSEL, 0, 0));
    const int next = (now + (is_back ? count - 1 : 1)) % count;
    SendMessageW(tabs->window, TCM_SETCURSEL, static_cast<WPARAM>(next), 0);
    events_.tab_chosen(tabs->part->id, next);
    // What had the focus may be gone from sight.
    if (IsWindowVisible(GetFocus()) == FALSE) focus(tabs->window);
    return true;
  }

  /// What has the focus first: never a prompt that is there to be scrolled.
  [[nodiscard]] HWND first_control() const {
    const auto found = std::ranges::find_if(
        controls_, [](const Control& control) { return control.is_visible && control.part->kind != PartKind::label; });
    return found == controls_.end() ? nullptr : found->window;
  }

  void focus(HWND control) {
    SetFocus(control);
    const auto found = std::ranges::find(controls_, control, &Control::window);
    if (found != controls_.end() && found->part->kind == PartKind::entry) SendMessageW(control, EM_SETSEL, 0, -1);
  }

  static void select_rows(HWND list) {
    LVITEMW item{};
    item.state = item.stateMask = LVIS_SELECTED;
    SendMessageW(list, LVM_SETITEMSTATE, static_cast<WPARAM>(-1), reinterpret_cast<LPARAM>(&item));
  }

  [[nodiscard]] static Text selected_rows(const Control& control) {
    Text text;
    const Grid& table = *control.table;
    int row = -1;
    while ((row = static_cast<int>(SendMessageW(control.window, LVM_GETNEXTITEM, static_cast<WPARAM>(row),
                                                MAKELPARAM(LVNI_SELECTED, 0)))) != -1) {
      for (std::int32_t c = 0; c < table.Cols(); ++c) {
        if (c > 0) text += u'\t';
        text += table.TextMatrix(row + table.FixedRows(), c);
      }
      text += u"\r\n";
    }
    return text;
  }

  [[nodiscard]] const FormPart* default_button() const {
    const auto found = std::ranges::find_if(
        controls_, [](const Control& control) { return control.part->is_default && control.is_visible; });
    return found == controls_.end() ? nullptr : found->part;
  }

  /// Draws a percentage as a bar with its text on it.
  static void draw_bar(const NMLVCUSTOMDRAW& drawing, const Control& control) {
    const HDC device = drawing.nmcd.hdc;
    const auto row = static_cast<std::int32_t>(drawing.nmcd.dwItemSpec) + control.table->FixedRows();
    const Text text = control.table->TextMatrix(row, control.bar_column);
    RECT place{LVIR_BOUNDS, control.bar_column, 0, 0};
    SendMessageW(drawing.nmcd.hdr.hwndFrom, LVM_GETSUBITEMRECT, drawing.nmcd.dwItemSpec,
                 reinterpret_cast<LPARAM>(&place));
    FillRect(device, &place, GetSysColorBrush(COLOR_WINDOW));
    if (text.empty()) return;
    InflateRect(&place, -3, -2);
    FrameRect(device, &place, GetSysColorBrush(COLOR_BTNSHADOW));
    InflateRect(&place, -1, -1);
    constexpr double whole = 100;
    RECT bar = place;
    bar.right = bar.left + std::lround(static_cast<double>(place.right - place.left) *
                                       std::min(leading_number(text), whole) / whole);
    const auto draw_text = [&](const RECT& part, int colour) {
      const Owned<kind::SavedState> saved = save_state(device);
      IntersectClipRect(device, static_cast<int>(part.left), static_cast<int>(part.top), static_cast<int>(part.right),
                        static_cast<int>(part.bottom));
      SetBkMode(device, TRANSPARENT);
      SetTextColor(device, GetSysColor(colour));
      RECT whole_place = place;
      DrawTextW(device, wide(text), -1, &whole_place, DT_CENTER | DT_VCENTER | DT_SINGLELINE | DT_NOPREFIX);
    };
    FillRect(device, &bar, GetSysColorBrush(COLOR_HIGHLIGHT));
    draw_text(bar, COLOR_HIGHLIGHTTEXT);
    draw_text({bar.right, place.top, place.right, place.bottom}, COLOR_WINDOWTEXT);
  }

  [[nodiscard]] std::optional<LRESULT> answer_notice(NMHDR& notice) {
    const auto found = std::ranges::find(controls_, notice.hwndFrom, &Control::window);
    if (found == controls_.end()) return std::nullopt;
    if (notice.code == TCN_SELCHANGE) {
      events_.tab_chosen(found->part->id, static_cast<std::int32_t>(SendMessageW(found->window, TCM_GETCURSEL, 0, 0)));
      return 0;
    }
    if (found->table == nullptr) return std::nullopt;
    if (notice.code == LVN_GETDISPINFOW) {
      LVITEMW& item = reinterpret_cast<NMLVDISPINFOW&>(notice).item;
      const std::int32_t row = item.iItem + found->table->FixedRows();
      if ((item.mask & LVIF_TEXT) != 0 && row < found->table->Rows() && item.iSubItem < found->table->Cols()) {
        const Text text = found->table->TextMatrix(row, item.iSubItem);
        lstrcpynW(item.pszText, wide(text), item.cchTextMax);
      }
      return 0;
    }
    if (notice.code == NM_CUSTOMDRAW && found->bar_column >= 0) {
      const auto& drawing = reinterpret_cast<const NMLVCUSTOMDRAW&>(notice);
      if (drawing.nmcd.dwDrawStage == CDDS_PREPAINT) return CDRF_NOTIFYITEMDRAW;
      if (drawing.nmcd.dwDrawStage == CDDS_ITEMPREPAINT) return CDRF_NOTIFYSUBITEMDRAW;
      if (drawing.nmcd.dwDrawStage == (CDDS_ITEMPREPAINT | CDDS_SUBITEM) && drawing.iSubItem == found->bar_column) {
        draw_bar(drawing, *found);
        return CDRF_SKIPDEFAULT;
      }
      return CDRF_DODEFAULT;
    }
    return std::nullopt;
  }

  [[nodiscard]] std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) {
    switch (message) {
      case WM_COMMAND:
        if (LOWORD(what) == IDCANCEL) {
          events_.escaped();
        } else if (HIWORD(what) == BN_CLICKED && LOWORD(what) >= first_id) {
          events_.clicked(static_cast<std::uint8_t>(LOWORD(what) - first_id));
        }
        return 0;
      case WM_NOTIFY:
        return answer_notice(*reinterpret_cast<NMHDR*>(value));
      case DM_GETDEFID: {
        const FormPart* const button = default_button();
        return button == nullptr ? 0 : MAKELRESULT(first_id + button->id, DC_HASDEFID);
      }
      case WM_NEXTDLGCTL:
        // A label that was reached by its letter has the focus for a moment, then passes it on.
        focus(LOWORD(value) != 0 ? reinterpret_cast<HWND>(what)
                                 : GetNextDlgTabItem(window_.get(), GetFocus(), what != 0));
        return 0;
      case WM_CTLCOLORSTATIC:
      case WM_CTLCOLORBTN:
        if (!brush_) return std::nullopt;
        SetBkMode(reinterpret_cast<HDC>(what), TRANSPARENT);
        SetTextColor(reinterpret_cast<HDC>(what), readable_on(colour_));
        SetBkColor(reinterpret_cast<HDC>(what), colour_);
        return reinterpret_cast<LRESULT>(brush_.get());
      case WM_ERASEBKGND: {
        if (!brush_) return std::nullopt;
        RECT inside{};
        GetClientRect(window_.get(), &inside);
        FillRect(reinterpret_cast<HDC>(what), &inside, brush_.get());
        return 1;
      }
      case WM_SIZE:
        lay_out();
        return 0;
      case WM_GETMINMAXINFO:
        if (!description_.is_resizable || smallest_.cx == 0) return std::nullopt;
        reinterpret_cast<MINMAXINFO*>(value)->ptMinTrackSize = {smallest_.cx, smallest_.cy};
        return 0;
      case WM_ACTIVATE:
        if (LOWORD(what) == WA_INACTIVE) focused_ = GetFocus();
        return std::nullopt;
      case WM_SETFOCUS:
        focus(focused_ != nullptr && IsChild(window_.get(), focused_) != FALSE ? focused_ : first_control());
        return 0;
      case WM_CLOSE:
        close(CloseMode::control_menu);
        return 0;
      case WM_DESTROY:
        // By close, or somebody else has destroyed it, with its owner most likely.
        close_destroyed();
        return 0;
      default:
        return std::nullopt;
    }
  }

  void close_destroyed() {
    const bool was_modal = std::exchange(is_modal_, true);
    close(CloseMode::code);
    is_modal_ = was_modal;
    static_cast<void>(window_.release());
  }

  FormEvents& events_;
  const FormDescription& description_;
  // In this order: the window ends before what it draws with, and its tips and hook before it.
  Owned<kind::WindowClass> window_class_ = register_class(form_class, &FormWindow::handle_message, COLOR_BTNFACE);
  SystemFont font_;
  Owned<kind::Brush> brush_;
  Owned<kind::Window> window_;
  std::vector<Owned<kind::Window>> tips_;
  Owned<kind::Hook> hook_;
  std::vector<Control> controls_;
  DWORD style_ = 0;
  SIZE inner_{};
  SIZE smallest_{};
  COLORREF colour_ = 0;
  HWND focused_ = nullptr;
  bool is_shown_ = false;
  bool is_modal_ = false;
  bool is_closed_ = false;
};

}  // namespace

std::unique_ptr<FormView> Win32FormWindows::make_form(FormEvents& events, const FormDescription& description) {
  return std::make_unique<FormWindow>(events, description);
}

}  // namespace talutil::win32
