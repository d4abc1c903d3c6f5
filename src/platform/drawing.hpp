#pragma once

#include <cstdint>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// Left, top, right and bottom in pixels; the right and the bottom edge lie outside.
struct PixelRectangle {
  std::int32_t left = 0;
  std::int32_t top = 0;
  std::int32_t right = 0;
  std::int32_t bottom = 0;
  friend bool operator==(const PixelRectangle&, const PixelRectangle&) = default;
};

/// The image of a window.
struct WindowImage {
  std::int32_t width = 0;  ///< In pixels, as the height.
  std::int32_t height = 0;
  std::vector<std::uint8_t> pixels;  ///< Red, green, blue, row by row from the top.
};

/// Drawing on what the platform draws on.
class Drawing {
 public:
  virtual ~Drawing() = default;

  /// Draws a text from the top left corner of a rectangle, cut off at its edges, in the font of the device context.
  /// The colour is 0x00BBGGRR, or a system colour with the highest bit set. With `breaks_words` lines break between
  /// words. Raises 5 for a device context that is none, 445 where there are none.
  virtual void draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text, std::int32_t colour,
                         bool breaks_words) = 0;

  /// A window as it looks. Raises 5 for what is no window, 445 where there are none.
  [[nodiscard]] virtual WindowImage image_of(std::intptr_t window) = 0;
};

/// The printing of windows, which a library of its own does: printhelper.dll, beside the program or beside this
/// library. It is loaded when it is called. Both raise 53 when it is missing and 453 when it lacks the function.
class WindowPrinting {
 public:
  virtual ~WindowPrinting() = default;

  /// Prepares the printer for a window.
  virtual void configure_printer(std::int32_t window) = 0;

  /// Prints the image of a window.
  virtual void send_to_printer(std::int32_t window) = 0;
};

/// What is raised for the library that prints windows.
inline constexpr TextView missing_print_helper = u"File not found: printhelper.dll";

}  // namespace talutil
