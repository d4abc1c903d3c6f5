#include "platform/win32/form_keys.hpp"

#include <algorithm>

#include "platform/win32/clipboard.hpp"
// After windows.h.
#include <commctrl.h>

namespace talutil::win32 {

namespace {

bool is_down(int key) noexcept { return GetKeyState(key) < 0; }

}  // namespace

bool FormKeys::take(const MSG& message) {
  if (message.message != WM_KEYDOWN) return false;
  const WPARAM key = message.wParam;
  const bool is_control = is_down(VK_CONTROL);
  const PlacedPart* const focused = parts_.find(GetFocus());
  const bool is_table = focused != nullptr && focused->table;
  if (key == VK_ESCAPE) {
    events_.escaped();
    return true;
  }
  if (key == VK_TAB) {
    if (is_control) return turn_tab(is_down(VK_SHIFT));
    // Rich texts would consume the key.
    focus(GetNextDlgTabItem(window_, GetFocus(), is_down(VK_SHIFT) ? TRUE : FALSE));
    return true;
  }
  if (is_control && key == 'C' && is_table) {
    put_on_clipboard(window_, focused->table->selected_rows());
    return true;
  }
  if (is_control && key == 'A' && is_table) {
    focused->table->select_all();
    return true;
  }
  if (is_control && key == 'A' && focused != nullptr && focused->is(PartKind::entry)) {
    SendMessageW(focused->window, EM_SETSEL, 0, -1);
    return true;
  }
  return false;
}

bool FormKeys::turn_tab(bool is_back) {
  const auto tabs = std::ranges::find_if(parts_, [](const PlacedPart& placed) { return placed.is(PartKind::tabs); });
  if (tabs == parts_.end()) return false;
  const auto count = static_cast<int>(SendMessageW(tabs->window, TCM_GETITEMCOUNT, 0, 0));
  const auto now = static_cast<int>(SendMessageW(tabs->window, TCM_GETCURSEL, 0, 0));
  const int next = (now + (is_back ? count - 1 : 1)) % count;
  SendMessageW(tabs->window, TCM_SETCURSEL, static_cast<WPARAM>(next), 0);
  events_.tab_chosen(tabs->part->id, next);
  // The control with the focus may be hidden now.
  if (IsWindowVisible(GetFocus()) == FALSE) focus(tabs->window);
  return true;
}

void FormKeys::focus(HWND control) {
  SetFocus(control);
  const PlacedPart* const placed = parts_.find(control);
  if (placed != nullptr && placed->is(PartKind::entry)) SendMessageW(control, EM_SETSEL, 0, -1);
}

void FormKeys::return_focus() {
  if (focused_ != nullptr && IsChild(window_, focused_) != FALSE) return focus(focused_);
  // Never a prompt, even if it can be scrolled.
  auto first = std::ranges::find_if(
      parts_, [](const PlacedPart& placed) { return placed.is_visible && !placed.is(PartKind::label); });
  // A text to be read comes before the buttons above it, which Space would press.
  if (first != parts_.end() && first->is(PartKind::button)) {
    const auto text =
        std::ranges::find_if(parts_, [](const PlacedPart& placed) { return placed.is(PartKind::rich_text); });
    if (text != parts_.end()) first = text;
  }
  focus(first == parts_.end() ? nullptr : first->window);
}

}  // namespace talutil::win32
