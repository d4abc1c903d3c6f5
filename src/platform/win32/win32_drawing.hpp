#pragma once

#include "platform/drawing.hpp"

namespace talutil::win32 {

class Win32Drawing final : public Drawing {
 public:
  void draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text, std::int32_t colour,
                 bool breaks_words) override;
  [[nodiscard]] WindowImage image_of(std::intptr_t window) override;
};

class Win32WindowPrinting final : public WindowPrinting {
 public:
  void configure_printer(std::int32_t window) override;
  void send_to_printer(std::int32_t window) override;
};

}  // namespace talutil::win32
