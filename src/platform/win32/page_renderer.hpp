#pragma once

#include "platform/page_model.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Where a page lies on a device, and how large: pixels for each twip, across and down.
struct PagePlacement {
  int left = 0;
  int top = 0;
  double scale_x = 0;
  double scale_y = 0;
};

/// Draws the items of a page on the screen or a printer: what lies outside the device is left to it to leave out. Texts
/// get the widths that they were laid out with, whatever the device's own fonts say.
void draw_page(HDC device, const Page& page, const PagePlacement& placement);

}  // namespace talutil::win32
