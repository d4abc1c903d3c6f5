#include "platform/win32/list_view.hpp"

#include <algorithm>
#include <cmath>
#include <utility>

#include "automation/numbers.hpp"
#include "platform/win32/window.hpp"
// After windows.h.
#include <commctrl.h>

namespace talutil::win32 {

namespace {

LRESULT send(HWND window, UINT message, std::intptr_t what, const void* value = nullptr) {
  return SendMessageW(window, message, static_cast<WPARAM>(what), reinterpret_cast<LPARAM>(value));
}

}  // namespace

void ListView::show(TableSource& table, std::int32_t bar_column) {
  table_ = &table;
  bar_column_ = bar_column;
  table.set_window(static_cast<std::int32_t>(reinterpret_cast<LONG_PTR>(window_)));
  while (send(window_, LVM_DELETECOLUMN, 0) != 0) {
  }
  for (std::int32_t c = 0; c < table.column_count(); ++c) {
    Text heading = table.heading(c);
    LVCOLUMNW column{};
    column.mask = LVCF_TEXT | LVCF_FMT | LVCF_WIDTH | LVCF_SUBITEM;
    column.fmt = table.is_right_aligned(c) ? LVCFMT_RIGHT : LVCFMT_LEFT;
    column.cx = dots_of(c);
    column.pszText = reinterpret_cast<wchar_t*>(heading.data());
    column.iSubItem = c;
    send(window_, LVM_INSERTCOLUMNW, c, &column);
  }
  send(window_, LVM_SETITEMCOUNT, table.row_count());
  fill_width();
  InvalidateRect(window_, nullptr, TRUE);
}

int ListView::dots_of(std::int32_t column) const {
  return static_cast<int>(std::lround(table_->column_width(column) * dots_ / twips_per_inch));
}

void ListView::fill_width() const {
  if (table_ == nullptr || table_->column_count() == 0) return;
  RECT room{};
  GetClientRect(window_, &room);
  const std::int32_t last = table_->column_count() - 1;
  int rest = static_cast<int>(room.right);
  if ((GetWindowLongPtrW(window_, GWL_STYLE) & WS_VSCROLL) == 0) rest -= GetSystemMetrics(SM_CXVSCROLL);
  // The user may have changed the others.
  for (std::int32_t c = 0; c < last; ++c) rest -= static_cast<int>(send(window_, LVM_GETCOLUMNWIDTH, c));
  SendMessageW(window_, LVM_SETCOLUMNWIDTH, static_cast<WPARAM>(last), std::max(rest, dots_of(last)));
}

void ListView::close() {
  if (table_ != nullptr) std::exchange(table_, nullptr)->set_window(0);
}

void ListView::select_all() const {
  LVITEMW item{};
  item.state = item.stateMask = LVIS_SELECTED;
  send(window_, LVM_SETITEMSTATE, -1, &item);
}

Text ListView::selected_rows() const {
  Text text;
  if (table_ == nullptr) return text;
  std::intptr_t row = -1;
  while ((row = SendMessageW(window_, LVM_GETNEXTITEM, static_cast<WPARAM>(row), MAKELPARAM(LVNI_SELECTED, 0))) != -1) {
    for (std::int32_t c = 0; c < table_->column_count(); ++c) {
      if (c > 0) text += u'\t';
      text += table_->cell_text(static_cast<std::int32_t>(row), c);
    }
    text += u"\r\n";
  }
  return text;
}

/// Draws a percentage as a bar with its text on top.
void ListView::draw_bar(HDC device, std::int32_t row) const {
  const Text text = table_->cell_text(row, bar_column_);
  RECT place{LVIR_BOUNDS, bar_column_, 0, 0};
  send(window_, LVM_GETSUBITEMRECT, row, &place);
  FillRect(device, &place, GetSysColorBrush(COLOR_WINDOW));
  if (text.empty()) return;
  const RECT cell = place;
  InflateRect(&place, -3, -2);
  FrameRect(device, &place, GetSysColorBrush(COLOR_BTNSHADOW));
  InflateRect(&place, -1, -1);
  constexpr double whole = 100;
  RECT bar = place;
  bar.right = bar.left + std::lround(static_cast<double>(place.right - place.left) *
                                     std::min(leading_number(text), whole) / whole);
  // The text may be higher than the bar, and lies across both its parts in their colours.
  const auto draw_text = [&](LONG left, LONG right, int colour) {
    const Owned<kind::SavedState> saved = save_state(device);
    IntersectClipRect(device, static_cast<int>(left), static_cast<int>(cell.top), static_cast<int>(right),
                      static_cast<int>(cell.bottom));
    SetBkMode(device, TRANSPARENT);
    SetTextColor(device, GetSysColor(colour));
    RECT whole_cell = cell;
    DrawTextW(device, wide(text), -1, &whole_cell, DT_CENTER | DT_VCENTER | DT_SINGLELINE | DT_NOPREFIX);
  };
  FillRect(device, &bar, GetSysColorBrush(COLOR_HIGHLIGHT));
  draw_text(bar.left, bar.right, COLOR_HIGHLIGHTTEXT);
  draw_text(bar.right, place.right, COLOR_WINDOWTEXT);
}

std::optional<LRESULT> ListView::answer(NMHDR& notice) const {
  if (table_ == nullptr) return std::nullopt;
  if (notice.code == LVN_GETDISPINFOW) {
    LVITEMW& item = reinterpret_cast<NMLVDISPINFOW&>(notice).item;
    // The list view may still ask for rows that the table no longer has.
    if ((item.mask & LVIF_TEXT) != 0 && item.iItem < table_->row_count() && item.iSubItem < table_->column_count()) {
      const Text text = table_->cell_text(item.iItem, item.iSubItem);
      lstrcpynW(item.pszText, wide(text), item.cchTextMax);
    }
    return 0;
  }
  if (notice.code == NM_CUSTOMDRAW && bar_column_ >= 0) {
    const auto& drawing = reinterpret_cast<const NMLVCUSTOMDRAW&>(notice);
    if (drawing.nmcd.dwDrawStage == CDDS_PREPAINT) return CDRF_NOTIFYITEMDRAW;
    if (drawing.nmcd.dwDrawStage == CDDS_ITEMPREPAINT) return CDRF_NOTIFYSUBITEMDRAW;
    if (drawing.nmcd.dwDrawStage == (CDDS_ITEMPREPAINT | CDDS_SUBITEM) && drawing.iSubItem == bar_column_) {
      draw_bar(drawing.nmcd.hdc, static_cast<std::int32_t>(drawing.nmcd.dwItemSpec));
      return CDRF_SKIPDEFAULT;
    }
    return CDRF_DODEFAULT;
  }
  return std::nullopt;
}

}  // namespace talutil::win32
