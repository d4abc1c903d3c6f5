#pragma once

#include "platform/page_model.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// The position of a page on a device and its scale: pixels per twip, horizontally and vertically.
struct PagePlacement {
  int left = 0;
  int top = 0;
  double scale_x = 0;
  double scale_y = 0;
};

/// Draws the items of a page on the screen or a printer; the device clips them. Texts keep the widths they were laid
/// out with, whatever the device's fonts are.
void draw_page(HDC device, const Page& page, const PagePlacement& placement);

}  // namespace talutil::win32
