#pragma once

#include <cstdint>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// Left, top, right and bottom in pixels; the right and bottom edges are exclusive.
struct PixelRectangle {
  std::int32_t left = 0;
  std::int32_t top = 0;
  std::int32_t right = 0;
  std::int32_t bottom = 0;
  friend bool operator==(const PixelRectangle&, const PixelRectangle&) = default;
};

struct WindowImage {
  std::int32_t width = 0;  ///< Both in pixels.
  std::int32_t height = 0;
  std::vector<std::uint8_t> pixels;  ///< Red, green, blue, row by row from the top.
};

/// Drawing on the platform's device contexts and windows.
class Drawing {
 public:
  virtual ~Drawing() = default;

  /// Draws a text from the top left corner of a rectangle, clipped to it, in the font of the device context. The colour
  /// is 0x00BBGGRR, or a system colour with the highest bit set. With `breaks_words`, lines break between words. Raises
  /// 5 for an invalid device context, 445 where there are no device contexts.
  virtual void draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text, std::int32_t colour,
                         bool breaks_words) = 0;

  /// The current image of a window. Raises 5 for an invalid window, 445 where there are no windows.
  [[nodiscard]] virtual WindowImage image_of(std::intptr_t window) = 0;
};

/// Prints windows by way of a separate library: printhelper.dll, beside the program or beside this library. It is
/// loaded on first use. Both functions raise 53 if it is missing and 453 if it lacks the function.
class WindowPrinting {
 public:
  virtual ~WindowPrinting() = default;

  /// Prepares the printer for a window.
  virtual void configure_printer(std::int32_t window) = 0;

  /// Prints the image of a window.
  virtual void send_to_printer(std::int32_t window) = 0;
};

/// The description of the error raised if the library that prints windows is missing.
inline constexpr TextView missing_print_helper = u"File not found: printhelper.dll";

}  // namespace talutil
