// printhelper.dll: prints a window as it appears, for the library's PrintScreen and for hosts that call it directly.
// Both functions take a window and return 1, or 0 if it cannot be printed.
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <utility>
#include <vector>

#include "platform/win32/exception_frames.hpp"
#include "platform/win32/handle.hpp"
// After windows.h.
#include <winspool.h>

namespace {

using talutil::win32::Owned;
namespace kind = talutil::win32::kind;

/// A function of the spooler's library, which comes from the system folder only: an import would also find a library of
/// its name in the folder of the program.
template <class Function>
Function spooler_function(const char* name) {
  return talutil::win32::late_function<Function>(L"winspool.drv", name);
}

struct Printer {
  using Handle = HANDLE;
  static void close(HANDLE printer) noexcept {
    if (const auto close = spooler_function<decltype(&ClosePrinter)>("ClosePrinter")) close(printer);
  }
};

/// The printer settings for a window, kept from ConfigurePrinter to SendToPrinter.
struct Setup {
  HWND window = nullptr;
  std::vector<wchar_t> printer;
  std::vector<std::byte> settings;  ///< A DEVMODE including the driver's own data.

  [[nodiscard]] DEVMODEW* device_mode() { return reinterpret_cast<DEVMODEW*>(settings.data()); }
};

// Per thread, because threads print their own windows.
thread_local Setup prepared;

struct Size {
  int width = 0;
  int height = 0;
};

bool size_of(HWND window, Size& size) {
  RECT place;
  if (GetWindowRect(window, &place) == FALSE) return false;
  size = {static_cast<int>(place.right - place.left), static_cast<int>(place.bottom - place.top)};
  return size.width > 0 && size.height > 0;
}

/// Prepares the default printer with the paper oriented like the window.
bool prepare(HWND window, Setup& setup) {
  Size size;
  DWORD length = 0;
  const auto get_default = spooler_function<decltype(&GetDefaultPrinterW)>("GetDefaultPrinterW");
  const auto open = spooler_function<decltype(&OpenPrinterW)>("OpenPrinterW");
  const auto adjust = spooler_function<decltype(&DocumentPropertiesW)>("DocumentPropertiesW");
  if (get_default == nullptr || open == nullptr || adjust == nullptr || !size_of(window, size)) return false;
  get_default(nullptr, &length);
  if (length == 0) return false;
  setup.printer.resize(length);
  if (get_default(setup.printer.data(), &length) == FALSE) return false;

  Owned<Printer> printer;
  if (open(setup.printer.data(), printer.receive(), nullptr) == FALSE) return false;
  const LONG bytes = adjust(nullptr, printer.get(), setup.printer.data(), nullptr, nullptr, 0);
  bool is_ready = false;
  if (bytes > 0) {
    setup.settings.resize(static_cast<std::size_t>(bytes));
    DEVMODEW* const mode = setup.device_mode();
    is_ready = adjust(nullptr, printer.get(), setup.printer.data(), mode, nullptr, DM_OUT_BUFFER) == IDOK;
    mode->dmFields |= DM_ORIENTATION;
    mode->dmOrientation = size.width > size.height ? DMORIENT_LANDSCAPE : DMORIENT_PORTRAIT;
    // Lets the driver adjust the rest of its settings.
    is_ready = is_ready &&
               adjust(nullptr, printer.get(), setup.printer.data(), mode, mode, DM_IN_BUFFER | DM_OUT_BUFFER) == IDOK;
  }
  setup.window = window;
  return is_ready;
}

/// The image of a window, including its frame, as if nothing were in front of it.
class Picture {
 public:
  Picture(HWND window, Size size) : size_(size) {
    const Owned<kind::WindowDevice> screen = talutil::win32::device_of(nullptr);
    BITMAPINFO information{};
    information.bmiHeader = {sizeof(BITMAPINFOHEADER), size.width, size.height, 1, 32, BI_RGB, 0, 0, 0, 0, 0};
    bitmap_.reset(CreateDIBSection(screen.get(), &information, DIB_RGB_COLORS, &bits_, nullptr, 0));
    context_.reset(CreateCompatibleDC(screen.get()));
    if (bitmap_ && context_) {
      selected_ = talutil::win32::select(context_.get(), bitmap_.get());
      // Parts that a window does not draw stay white.
      PatBlt(context_.get(), 0, 0, size.width, size.height, WHITENESS);
      const Owned<kind::WindowDevice> source(GetWindowDC(window), {window});
      if (PrintWindow(window, context_.get(), 0) == FALSE)
        BitBlt(context_.get(), 0, 0, size.width, size.height, source.get(), 0, 0, SRCCOPY);
    }
  }

  /// Draws the image centred, as large as the page allows without distortion.
  bool draw(HDC page) const {
    if (!selected_) return false;
    const int page_width = GetDeviceCaps(page, HORZRES);
    const int page_height = GetDeviceCaps(page, VERTRES);
    const auto dots_x = static_cast<double>(GetDeviceCaps(page, LOGPIXELSX));
    const auto dots_y = static_cast<double>(GetDeviceCaps(page, LOGPIXELSY));
    const double scale = std::min(page_width / (size_.width * dots_x), page_height / (size_.height * dots_y));
    const auto width = static_cast<int>(size_.width * dots_x * scale);
    const auto height = static_cast<int>(size_.height * dots_y * scale);
    BITMAPINFO information{};
    information.bmiHeader = {sizeof(BITMAPINFOHEADER), size_.width, size_.height, 1, 32, BI_RGB, 0, 0, 0, 0, 0};
    GdiFlush();
    SetStretchBltMode(page, HALFTONE);
    return StretchDIBits(page, (page_width - width) / 2, (page_height - height) / 2, width, height, 0, 0, size_.width,
                         size_.height, bits_, &information, DIB_RGB_COLORS, SRCCOPY) > 0;
  }

 private:
  Size size_;
  void* bits_ = nullptr;
  Owned<kind::Bitmap> bitmap_;
  Owned<kind::MadeDevice> context_;
  Owned<kind::Selection> selected_;
};

bool print(HWND window, Setup& setup) {
  Size size;
  if (!size_of(window, size)) return false;
  // Before starting the printer, so that windows that come to the front meanwhile are not printed.
  const Picture picture(window, size);
  const Owned<kind::MadeDevice> page(CreateDCW(nullptr, setup.printer.data(), nullptr, setup.device_mode()));
  if (!page) return false;
  wchar_t title[256] = L"";
  GetWindowTextW(window, title, static_cast<int>(std::size(title)));
  DOCINFOW document{sizeof document, title, nullptr, nullptr, 0};
  bool is_printed = false;
  if (StartDocW(page.get(), &document) > 0) {
    is_printed = StartPage(page.get()) > 0 && picture.draw(page.get()) && EndPage(page.get()) > 0;
    if (is_printed)
      is_printed = EndDoc(page.get()) > 0;
    else
      AbortDoc(page.get());
  }
  return is_printed;
}

template <class Work>
std::int32_t without_exceptions(std::int32_t handle, Work work) noexcept {
  const HWND window = reinterpret_cast<HWND>(static_cast<std::intptr_t>(handle));
  try {
    return work(window) ? 1 : 0;
  } catch (...) {
    return 0;
  }
}

}  // namespace

extern "C" BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, void* /*reserved*/) {
  if (reason == DLL_PROCESS_ATTACH) talutil::win32::register_exception_frames(instance);
  if (reason == DLL_PROCESS_DETACH) talutil::win32::unregister_exception_frames();
  return TRUE;
}

/// Prepares the default printer for a window, with the paper oriented like the window.
extern "C" std::int32_t WINAPI ConfigurePrinter(std::int32_t window) noexcept {
  return without_exceptions(window, [](HWND handle) {
    Setup setup;
    const bool is_ready = prepare(handle, setup);
    prepared = is_ready ? std::move(setup) : Setup{};
    return is_ready;
  });
}

/// Prints the image of a window on one page. Prepares a window that was not prepared yet.
extern "C" std::int32_t WINAPI SendToPrinter(std::int32_t window) noexcept {
  return without_exceptions(window, [](HWND handle) {
    Setup setup = std::exchange(prepared, {});
    return (setup.window == handle || prepare(handle, setup)) && print(handle, setup);
  });
}
