#include "platform/win32/win32_drawing.hpp"

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "platform/win32/colours.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/module_path.hpp"

namespace talutil::win32 {

namespace {

/// The print helper in the folder of a module (null: the program); null if there is none.
HMODULE helper_beside(HMODULE module) {
  const Text program = module_path(module);
  const Text helper = program.substr(0, program.find_last_of(u'\\') + 1) + u"printhelper.dll";
  // By its full path, so that no library of that name elsewhere in the search order is run.
  return LoadLibraryExW(wide(helper), nullptr, LOAD_WITH_ALTERED_SEARCH_PATH);
}

void call_helper(const char* function, std::int32_t window) {
  HMODULE helper = helper_beside(nullptr);
  if (helper == nullptr) helper = helper_beside(own_module());
  if (helper == nullptr) {
    throw RunTimeError(ErrorNumber::file_not_found, Text(missing_print_helper));
  }
  using Print = std::int32_t(WINAPI*)(std::int32_t);
  const auto print = reinterpret_cast<Print>(reinterpret_cast<void*>(GetProcAddress(helper, function)));
  if (print == nullptr) {
    throw RunTimeError(ErrorNumber::missing_entry_point,
                       u"Can't find DLL entry point " + from_utf8(function) + u" in printhelper.dll");
  }
  // The return value carries no information. The helper stays loaded, because it keeps state between the two calls.
  print(window);
}

}  // namespace

void Win32Drawing::draw_text(std::intptr_t device_context, const PixelRectangle& place, TextView text,
                             std::int32_t colour, bool breaks_words) {
  const auto length = checked_cast<std::int32_t>(text.size());
  const HDC context = reinterpret_cast<HDC>(device_context);  // NOLINT(performance-no-int-to-ptr): the seam passes it.
  const COLORREF before = SetTextColor(context, colour_of(colour));
  if (before == CLR_INVALID) raise(ErrorNumber::invalid_procedure_call);
  const int background_before = SetBkMode(context, TRANSPARENT);
  RECT rectangle{place.left, place.top, place.right, place.bottom};
  // Not DrawTextA: it would turn characters beyond the ANSI code page into question marks, and it ignores a program's
  // choice of UTF-8 as its page.
  DrawTextW(context, wide(text.data()), length, &rectangle, breaks_words ? DT_WORDBREAK : 0);
  SetBkMode(context, background_before);
  SetTextColor(context, before);
}

WindowImage Win32Drawing::image_of(std::intptr_t window) {
  const HWND handle = reinterpret_cast<HWND>(window);  // NOLINT(performance-no-int-to-ptr): the seam passes integers.
  RECT place{};
  if (GetWindowRect(handle, &place) == FALSE) raise(ErrorNumber::invalid_procedure_call);
  WindowImage image;
  image.width = static_cast<std::int32_t>(place.right - place.left);
  image.height = static_cast<std::int32_t>(place.bottom - place.top);
  BITMAPINFO information{};
  information.bmiHeader = {sizeof(BITMAPINFOHEADER), image.width, -image.height, 1, 32, BI_RGB, 0, 0, 0, 0, 0};
  void* bits = nullptr;
  const Owned<kind::MadeDevice> context(CreateCompatibleDC(nullptr));
  const Owned<kind::Bitmap> bitmap(CreateDIBSection(context.get(), &information, DIB_RGB_COLORS, &bits, nullptr, 0));
  if (bitmap) {
    const Owned<kind::Selection> selected = select(context.get(), bitmap.get());
    // Parts that a window does not draw stay white.
    PatBlt(context.get(), 0, 0, image.width, image.height, WHITENESS);
    PrintWindow(handle, context.get(), 0);
    GdiFlush();
    const auto* pixel = static_cast<const std::uint8_t*>(bits);
    const auto count = static_cast<std::size_t>(image.width) * static_cast<std::size_t>(image.height);
    image.pixels.reserve(count * 3);
    for (std::size_t i = 0; i < count; ++i, pixel += 4)
      image.pixels.insert(image.pixels.end(), {pixel[2], pixel[1], pixel[0]});
  }
  if (image.pixels.empty()) raise(ErrorNumber::invalid_procedure_call);
  return image;
}

void Win32WindowPrinting::configure_printer(std::int32_t window) { call_helper("ConfigurePrinter", window); }

void Win32WindowPrinting::send_to_printer(std::int32_t window) { call_helper("SendToPrinter", window); }

}  // namespace talutil::win32
