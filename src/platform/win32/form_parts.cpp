#include "platform/win32/form_parts.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"
#include "platform/win32/dots.hpp"
#include "platform/win32/visual_styles.hpp"
// After windows.h.
#include <commctrl.h>
#include <richedit.h>

namespace talutil::win32 {

namespace {

constexpr WORD first_command = 100;

/// Prepares the system's controls; call before creating any.
void load_controls() {
  static_cast<void>(system_library(L"riched20.dll"));
  const auto start = late_function<BOOL(WINAPI*)(const INITCOMMONCONTROLSEX*)>(L"comctl32.dll", "InitCommonControlsEx");
  const INITCOMMONCONTROLSEX wanted{sizeof wanted, ICC_LISTVIEW_CLASSES | ICC_TAB_CLASSES | ICC_BAR_CLASSES};
  if (start != nullptr) start(&wanted);
}

struct SystemControl {
  const wchar_t* class_name;
  DWORD style;
  DWORD extended_style;
};

SystemControl control_of(const FormPart& part) {
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

}  // namespace

FormParts::FormParts(HWND window, std::span<const FormPart> parts) : window_(window), font_(dots_per_inch(window)) {
  const VisualStyles styles;
  load_controls();
  for (const FormPart& part : parts) add(part);
  // Tabs are behind the parts on their pages.
  for (const PlacedPart& placed : parts_) {
    constexpr UINT order_alone = SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE;
    if (placed.is(PartKind::tabs)) SetWindowPos(placed.window, HWND_BOTTOM, 0, 0, 0, 0, order_alone);
  }
}

HWND FormParts::make(const FormPart& part, const wchar_t* class_name, DWORD style, DWORD extended_style,
                     const RECT& place) const {
  const HWND control =
      CreateWindowExW(extended_style, class_name, wide(Text(part.caption)), WS_CHILD | WS_VISIBLE | style,
                      static_cast<int>(place.left), static_cast<int>(place.top),
                      static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top), window_,
                      reinterpret_cast<HMENU>(static_cast<INT_PTR>(first_command + part.id)), own_module(), nullptr);
  if (control == nullptr) raise(ErrorNumber::internal_error);
  SendMessageW(control, WM_SETFONT, reinterpret_cast<WPARAM>(font_.get()), FALSE);
  return control;
}

void FormParts::add(const FormPart& part) {
  const SystemControl kind = control_of(part);
  const RECT place = place_of(part);
  const HWND control = make(part, kind.class_name, kind.style, kind.extended_style, place);
  parts_.push_back({&part, control, place, true, std::nullopt});
  if (part.kind == PartKind::table) {
    constexpr DWORD looks = LVS_EX_FULLROWSELECT | LVS_EX_GRIDLINES | LVS_EX_DOUBLEBUFFER;
    SendMessageW(control, LVM_SETEXTENDEDLISTVIEWSTYLE, looks, looks);
    parts_.back().table.emplace(control);
  }
  if (part.kind == PartKind::entry) SendMessageW(control, EM_SETLIMITTEXT, 0, 0);
  if (!part.tip.empty()) add_tip(control, part.tip);
}

RECT FormParts::place_of(const FormPart& part) const {
  const int left = font_.across(part.place.left);
  const int top = font_.down(part.place.top);
  return {left, top, left + font_.across(part.place.width), top + font_.down(part.place.height)};
}

void FormParts::set_dots(int dots) {
  font_ = SystemFont(dots);
  for (PlacedPart& placed : parts_) {
    placed.place = place_of(*placed.part);
    SendMessageW(placed.window, WM_SETFONT, reinterpret_cast<WPARAM>(font_.get()), FALSE);
    if (placed.table) placed.table->follow_dots(dots);
  }
}

void FormParts::add_tip(HWND control, TextView tip) {
  // Without an owner, because on some systems a window is placed below its own tooltips and cannot stay on top.
  Owned<kind::Window> tips(CreateWindowExW(WS_EX_TOPMOST, L"tooltips_class32", nullptr, WS_POPUP | TTS_ALWAYSTIP, 0, 0,
                                           0, 0, nullptr, nullptr, own_module(), nullptr));
  Text text(tip);
  TTTOOLINFOW tool{};
  tool.cbSize = TTTOOLINFOW_V1_SIZE;
  tool.uFlags = TTF_IDISHWND | TTF_SUBCLASS;
  tool.hwnd = window_;
  tool.uId = reinterpret_cast<UINT_PTR>(control);
  tool.lpszText = reinterpret_cast<wchar_t*>(text.data());
  SendMessageW(tips.get(), TTM_ADDTOOLW, 0, reinterpret_cast<LPARAM>(&tool));
  tips_.push_back(std::move(tips));
}

const PlacedPart& FormParts::of(std::uint8_t id) const {
  const auto found = std::ranges::find_if(parts_, [&](const PlacedPart& placed) { return placed.part->id == id; });
  if (found == parts_.end()) raise(ErrorNumber::internal_error);
  return *found;
}

PlacedPart& FormParts::of(std::uint8_t id) { return const_cast<PlacedPart&>(std::as_const(*this).of(id)); }

std::optional<LRESULT> FormParts::draw_page_behind(HWND control, HDC device) {
  const PlacedPart* const label = find(control);
  const auto tabs = std::ranges::find_if(parts_, [](const PlacedPart& placed) { return placed.is(PartKind::tabs); });
  if (label == nullptr || !label->is(PartKind::label) || tabs == parts_.end()) return std::nullopt;
  POINT place{};
  POINT before{};
  MapWindowPoints(control, tabs->window, &place, 1);
  SetViewportOrgEx(device, static_cast<int>(-place.x), static_cast<int>(-place.y), &before);
  SendMessageW(tabs->window, WM_PRINTCLIENT, reinterpret_cast<WPARAM>(device), PRF_CLIENT);
  SetViewportOrgEx(device, static_cast<int>(before.x), static_cast<int>(before.y), nullptr);
  SetBkMode(device, TRANSPARENT);
  return reinterpret_cast<LRESULT>(GetStockObject(NULL_BRUSH));
}

PlacedPart* FormParts::find(HWND control) noexcept {
  const auto found = std::ranges::find(parts_, control, &PlacedPart::window);
  return found == parts_.end() ? nullptr : &*found;
}

const PlacedPart* FormParts::find_command(WORD command) noexcept {
  const auto found =
      std::ranges::find_if(parts_, [&](const PlacedPart& placed) { return command_of(placed) == command; });
  return found == parts_.end() ? nullptr : &*found;
}

const PlacedPart* FormParts::default_button() noexcept {
  const auto found = std::ranges::find_if(
      parts_, [](const PlacedPart& placed) { return placed.part->is_default && placed.is_visible; });
  return found == parts_.end() ? nullptr : &*found;
}

WORD FormParts::command_of(const PlacedPart& part) noexcept { return static_cast<WORD>(first_command + part.part->id); }

void FormParts::set_text(std::uint8_t id, TextView text) {
  const PlacedPart& placed = of(id);
  // In other parts, text that looks like RTF is just text that the host has written.
  if (!placed.is(PartKind::rich_text) || !text.starts_with(u"{\\rtf")) {
    SetWindowTextW(placed.window, wide(Text(up_to_nul(text))));
    return;
  }
  const std::string bytes = to_ansi(text);
  std::string_view rest = bytes;
  EDITSTREAM stream{reinterpret_cast<DWORD_PTR>(&rest), 0, &read_rich_text};
  SendMessageW(placed.window, EM_EXLIMITTEXT, 0, static_cast<LPARAM>(bytes.size()));
  SendMessageW(placed.window, EM_STREAMIN, SF_RTF, reinterpret_cast<LPARAM>(&stream));
}

Text FormParts::text(std::uint8_t id) const {
  const HWND control = of(id).window;
  Text text(static_cast<std::size_t>(GetWindowTextLengthW(control)) + 1, u'\0');
  const int length = GetWindowTextW(control, reinterpret_cast<wchar_t*>(text.data()), static_cast<int>(text.size()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

void FormParts::make_scrollable(PlacedPart& placed) {
  const VisualStyles styles;
  Text broken;
  for (const char16_t unit : text(placed.part->id)) {
    if (unit == u'\n' && !broken.ends_with(u'\r')) broken += u'\r';
    broken += unit;
  }
  const HWND before = placed.window;
  placed.window = make(*placed.part, L"EDIT", WS_TABSTOP | WS_VSCROLL | ES_MULTILINE | ES_READONLY, 0, placed.place);
  SendMessageW(placed.window, EM_SETLIMITTEXT, 0, 0);
  SetWindowTextW(placed.window, wide(broken));
  SetWindowPos(placed.window, before, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  DestroyWindow(before);
}

}  // namespace talutil::win32
