#include "platform/win32/form_layout.hpp"

#include <algorithm>
#include <utility>

#include "platform/win32/dots.hpp"
#include "platform/win32/modality.hpp"

namespace talutil::win32 {

namespace {

/// Moves a part to its position in a window that has grown by `across` and `down`. What it showed is not copied along:
/// another part may have painted over it already.
void move(const PlacedPart& placed, int across, int down) {
  RECT place = placed.place;
  const std::uint8_t follows = placed.part->follows;
  if ((follows & part_follows::right) != 0) OffsetRect(&place, across, 0);
  if ((follows & part_follows::bottom) != 0) OffsetRect(&place, 0, down);
  if ((follows & part_follows::width) != 0) place.right += across;
  if ((follows & part_follows::height) != 0) place.bottom += down;
  SetWindowPos(placed.window, nullptr, static_cast<int>(place.left), static_cast<int>(place.top),
               static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top),
               SWP_NOZORDER | SWP_NOACTIVATE | SWP_NOCOPYBITS);
}

}  // namespace

FormLayout::FormLayout(HWND window, FormParts& parts, const FormDescription& description, DWORD style)
    : window_(window),
      parts_(parts),
      description_(description),
      style_(style),
      dots_(dots_per_inch(window)),
      inner_{parts.font().across(description.width), parts.font().down(description.height)} {
  size_to_inside();
  const SIZE size = outer_size();
  if (description.is_resizable) smallest_ = {size.cx * 3 / 4, size.cy * 3 / 4};
}

void FormLayout::fit() {
  stack();
  size_to_inside();
}

void FormLayout::set_dots(int dots, const RECT& place) {
  const int before = std::exchange(dots_, dots);
  parts_.set_dots(dots);
  inner_ = {parts_.font().across(description_.width), parts_.font().down(description_.height)};
  smallest_ = {MulDiv(smallest_.cx, dots, before), MulDiv(smallest_.cy, dots, before)};
  const bool is_stacked = std::ranges::any_of(parts_, [](const PlacedPart& placed) { return placed.part->is_growing; });
  if (is_stacked)
    stack();
  else
    for (const PlacedPart& placed : parts_) move(placed, 0, 0);
  SetWindowPos(window_, nullptr, static_cast<int>(place.left), static_cast<int>(place.top),
               static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top),
               SWP_NOZORDER | SWP_NOACTIVATE);
  if (!description_.is_resizable) size_to_inside();
}

/// Places the parts below each other.
void FormLayout::stack() {
  const SystemFont& font = parts_.font();
  const RECT work = work_area_at(window_);
  const int most_height = static_cast<int>(work.bottom - work.top) * 2 / 3;
  int shift = 0;
  int bottom_before = 0;
  for (PlacedPart& placed : parts_) {
    const FormPart& part = *placed.part;
    const int top = font.down(part.place.top);
    const int height = font.down(part.place.height);
    if (!placed.is_visible) {
      shift -= height + top - bottom_before;
    } else {
      placed.place.top = top + shift;
      placed.place.bottom = top + shift + height;
      if (part.is_growing) {
        const int needed = font.height_of(parts_.text(part.id), font.across(part.place.width));
        if (needed > most_height) parts_.make_scrollable(placed);
        placed.place.bottom = placed.place.top + std::clamp(needed, height, most_height);
        shift += static_cast<int>(placed.place.bottom - placed.place.top) - height;
      }
      move(placed, 0, 0);
    }
    bottom_before = top + height;
  }
  inner_.cy = font.down(description_.height) + shift;
}

void FormLayout::follow() const {
  const bool moves_parts = description_.is_resizable && IsIconic(window_) == FALSE;
  RECT inside{};
  GetClientRect(window_, &inside);
  for (const PlacedPart& placed : parts_) {
    if (moves_parts)
      move(placed, static_cast<int>(inside.right - inner_.cx), static_cast<int>(inside.bottom - inner_.cy));
    if (placed.table) placed.table->fill_width();
  }
}

void FormLayout::centre() const {
  const RECT work = work_area_at(window_);
  SIZE size = outer_size();
  // A resizable window need not be larger than the screen.
  if (description_.is_resizable) {
    size = {std::min(size.cx, work.right - work.left), std::min(size.cy, work.bottom - work.top)};
  }
  const auto middle = [](LONG start, LONG end, LONG length) {
    return static_cast<int>(std::max(start, start + (end - start - length) / 2));
  };
  SetWindowPos(window_, nullptr, middle(work.left, work.right, size.cx), middle(work.top, work.bottom, size.cy),
               static_cast<int>(size.cx), static_cast<int>(size.cy), SWP_NOZORDER | SWP_NOACTIVATE);
}

void FormLayout::set_style(DWORD style) {
  style_ = style;
  SetWindowLongPtrW(window_, GWL_STYLE, static_cast<LONG>(style | WS_CLIPCHILDREN));
  size_to_inside();
}

void FormLayout::size_to_inside() const {
  RECT outer{0, 0, inner_.cx, inner_.cy};
  add_frame(outer, style_, WS_EX_CONTROLPARENT, dots_);
  SetWindowPos(window_, nullptr, 0, 0, static_cast<int>(outer.right - outer.left),
               static_cast<int>(outer.bottom - outer.top),
               SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_FRAMECHANGED);
}

SIZE FormLayout::outer_size() const {
  RECT outer{};
  GetWindowRect(window_, &outer);
  return {outer.right - outer.left, outer.bottom - outer.top};
}

}  // namespace talutil::win32
