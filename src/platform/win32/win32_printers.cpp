#include "platform/win32/win32_printers.hpp"

#include <algorithm>
#include <optional>
#include <string>
#include <vector>

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/page_renderer.hpp"
#include "platform/win32/visual_styles.hpp"
#include "platform/win32/wait_pointer.hpp"
// After windows.h.
#include <cderr.h>
#include <commdlg.h>

namespace talutil::win32 {

namespace {

constexpr double twips_per_inch = 1440;

[[noreturn]] void raise_printer_error(const Text& what) {
  throw RunTimeError(ErrorNumber::printer_error, u"Printer error: " + what);
}

/// The printer dialog and its results, including the memory and the device context that it returns.
class PrintDialog {
 public:
  PrintDialog() {
    native_.lStructSize = sizeof native_;
    native_.hwndOwner = GetActiveWindow();
    if (show_ == nullptr || last_error_ == nullptr) raise_printer_error(u"comdlg32.dll is missing");
  }

  /// Selects the default printer and applies the document's settings. Raises 482 if there is no printer.
  void prepare(const PrintSettings& settings) {
    native_.Flags = PD_RETURNDEFAULT;
    if (!show()) raise_printer_error(u"no printer is installed");
    const Owned<kind::LockedMemory> locked = lock(mode_.get());
    if (!locked) return;
    auto* const mode = static_cast<DEVMODEW*>(locked.get());
    // Many drivers prefer a form's name, or its lengths, to the number of the paper.
    mode->dmFields &= ~DWORD{DM_FORMNAME | DM_PAPERLENGTH | DM_PAPERWIDTH};
    mode->dmFields |= DM_ORIENTATION | DM_PAPERSIZE;
    mode->dmOrientation = settings.orientation == 1 ? DMORIENT_LANDSCAPE : DMORIENT_PORTRAIT;
    mode->dmPaperSize = static_cast<short>(settings.paper_size);
    if (settings.duplex != 0) {
      mode->dmFields |= DM_DUPLEX;
      mode->dmDuplex = static_cast<short>(settings.duplex);
    }
    let_driver_adjust(*mode);
  }

  /// Lets the user choose the pages. Returns false if the dialog is cancelled.
  bool ask(std::size_t pages) {
    native_.Flags = PD_ALLPAGES | PD_NOSELECTION | PD_RETURNDC | PD_USEDEVMODECOPIESANDCOLLATE;
    native_.nMinPage = native_.nFromPage = 1;
    native_.nMaxPage = native_.nToPage = static_cast<WORD>(std::min<std::size_t>(pages, 0xFFFF));
    native_.nCopies = 1;
    if (show()) return true;
    const DWORD reason = last_error_();
    // Left over from the search for a default printer on some systems; the dialog itself was cancelled.
    if (reason != 0 && reason != PDERR_NODEFAULTPRN) raise_printer_error(u"the printer dialog failed");
    return false;
  }

  /// Opens the device context for printing without a dialog.
  void open() {
    const Owned<kind::LockedMemory> locked = lock(names_.get());
    const Owned<kind::LockedMemory> mode = lock(mode_.get());
    if (!locked) return;
    const auto* const names = static_cast<const DEVNAMES*>(locked.get());
    const auto* const words = static_cast<const wchar_t*>(locked.get());
    device_.reset(CreateDCW(words + names->wDriverOffset, words + names->wDeviceOffset, nullptr,
                            static_cast<const DEVMODEW*>(mode.get())));
  }

  [[nodiscard]] HDC device() const noexcept { return device_.get(); }

  /// The chosen pages as a half-open range, counted from 0.
  [[nodiscard]] std::pair<std::size_t, std::size_t> range(std::size_t pages) const noexcept {
    if ((native_.Flags & PD_PAGENUMS) == 0) return {0, pages};
    const std::size_t first = std::max<std::size_t>(native_.nFromPage, 1) - 1;
    return {std::min(first, pages), std::min<std::size_t>(std::max(native_.nToPage, native_.nFromPage), pages)};
  }

 private:
  using Show = BOOL(WINAPI*)(PRINTDLGW*);
  using LastError = DWORD(WINAPI*)();

  /// Lets the driver make the rest of its settings fit those that were changed (DocumentProperties with DM_IN_BUFFER
  /// and DM_OUT_BUFFER). If it cannot, they stay as they are.
  void let_driver_adjust(DEVMODEW& mode) const {
    using Open = BOOL(WINAPI*)(wchar_t*, HANDLE*, void*);
    using Close = BOOL(WINAPI*)(HANDLE);
    using Adjust = LONG(WINAPI*)(HWND, HANDLE, wchar_t*, DEVMODEW*, DEVMODEW*, DWORD);
    const auto open = late_function<Open>(L"winspool.drv", "OpenPrinterW");
    const auto close = late_function<Close>(L"winspool.drv", "ClosePrinter");
    const auto adjust = late_function<Adjust>(L"winspool.drv", "DocumentPropertiesW");
    const Owned<kind::LockedMemory> locked = lock(names_.get());
    if (open == nullptr || close == nullptr || adjust == nullptr || !locked) return;
    const auto* const names = static_cast<const DEVNAMES*>(locked.get());
    std::wstring device = static_cast<const wchar_t*>(locked.get()) + names->wDeviceOffset;
    HANDLE printer = nullptr;
    if (open(device.data(), &printer, nullptr) == FALSE) return;
    std::vector<BYTE> before(mode.dmSize + mode.dmDriverExtra);
    std::copy_n(reinterpret_cast<const BYTE*>(&mode), before.size(), before.begin());
    const LONG answer = adjust(nullptr, printer, device.data(), &mode, reinterpret_cast<DEVMODEW*>(before.data()),
                               DM_IN_BUFFER | DM_OUT_BUFFER);
    if (answer != IDOK) std::ranges::copy(before, reinterpret_cast<BYTE*>(&mode));
    close(printer);
  }

  /// The dialog takes the memory that it returned before, and may return different memory.
  [[nodiscard]] bool show() noexcept {
    native_.hDevMode = mode_.release();
    native_.hDevNames = names_.release();
    const VisualStyles styles;
    const BOOL is_answered = show_(&native_);
    mode_.reset(native_.hDevMode);
    names_.reset(native_.hDevNames);
    device_.reset(std::exchange(native_.hDC, nullptr));
    return is_answered != FALSE;
  }

  PRINTDLGW native_{};
  Owned<kind::GlobalMemory> mode_;
  Owned<kind::GlobalMemory> names_;
  Owned<kind::MadeDevice> device_;
  Show show_ = late_function<Show>(L"comdlg32.dll", "PrintDlgW");
  LastError last_error_ = late_function<LastError>(L"comdlg32.dll", "CommDlgExtendedError");
};

/// A print job; cancelled unless it is complete.
class PrintJob {
 public:
  explicit PrintJob(HDC device) : device_(device) {}
  PrintJob(const PrintJob&) = delete;
  PrintJob& operator=(const PrintJob&) = delete;
  ~PrintJob() {
    if (!is_complete_) AbortDoc(device_);
  }

  /// Returns false if the user cancels a dialog of the printer's own, such as that of a printer that makes files.
  [[nodiscard]] bool start(const Text& title) {
    DOCINFOW information{sizeof information, wide(title), nullptr, nullptr, 0};
    if (StartDocW(device_, &information) > 0) return true;
    const DWORD reason = GetLastError();
    is_complete_ = true;
    if (reason == ERROR_CANCELLED || reason == ERROR_PRINT_CANCELLED) return false;
    raise_printer_error(u"the document could not be started");
  }

  void add(const Page& page) const {
    if (StartPage(device_) <= 0) raise_printer_error(u"a page could not be started");
    const double scale_x = GetDeviceCaps(device_, LOGPIXELSX) / twips_per_inch;
    const double scale_y = GetDeviceCaps(device_, LOGPIXELSY) / twips_per_inch;
    draw_page(device_, page,
              {-GetDeviceCaps(device_, PHYSICALOFFSETX), -GetDeviceCaps(device_, PHYSICALOFFSETY), scale_x, scale_y});
    if (EndPage(device_) <= 0) raise_printer_error(u"a page could not be printed");
  }

  void complete() {
    if (EndDoc(device_) <= 0) raise_printer_error(u"the document could not be ended");
    is_complete_ = true;
  }

 private:
  HDC device_;
  bool is_complete_ = false;
};

/// Forgets the keys that were pressed while a dialog or the printing kept the user waiting: they would ask for the same
/// again, or close the window that is behind.
struct ForgottenKeys {
  ForgottenKeys() = default;
  ForgottenKeys(const ForgottenKeys&) = delete;
  ForgottenKeys& operator=(const ForgottenKeys&) = delete;
  ~ForgottenKeys() {
    MSG message;
    while (PeekMessageW(&message, nullptr, WM_KEYFIRST, WM_KEYLAST, PM_REMOVE) != FALSE) {
    }
  }
};

}  // namespace

bool Win32Printers::print(const Document& document, const PrintSettings& settings) {
  // Only where there is a dialog: otherwise they were meant for the host.
  std::optional<ForgottenKeys> keys;
  if (settings.shows_dialog) keys.emplace();
  PrintDialog dialog;
  dialog.prepare(settings);
  if (!settings.shows_dialog)
    dialog.open();
  else if (!dialog.ask(document.pages.size()))
    return false;
  if (dialog.device() == nullptr) raise_printer_error(u"the printer does not answer");
  PrintJob job(dialog.device());
  if (!job.start(settings.title)) return false;
  const WaitPointer waiting;
  const auto [first, end] = dialog.range(document.pages.size());
  for (std::size_t page = first; page < end; ++page) {
    if (waiting.is_given_up()) return false;
    job.add(document.pages[page]);
  }
  job.complete();
  return true;
}

std::vector<std::uint8_t> Win32FontFiles::wide_font(bool is_fixed_width) {
  std::vector<std::uint8_t> bytes;
  const Owned<kind::MadeDevice> context(CreateCompatibleDC(nullptr));
  const Owned<kind::Font> font(CreateFontW(-16, 0, 0, 0, FW_NORMAL, FALSE, FALSE, FALSE, DEFAULT_CHARSET,
                                           OUT_TT_ONLY_PRECIS, CLIP_DEFAULT_PRECIS, DEFAULT_QUALITY,
                                           is_fixed_width ? FIXED_PITCH | FF_MODERN : VARIABLE_PITCH | FF_SWISS,
                                           is_fixed_width ? L"Courier New" : L"Arial"));
  const Owned<kind::Selection> selected = select(context.get(), font.get());
  const DWORD size = GetFontData(context.get(), 0, 0, nullptr, 0);
  if (size != GDI_ERROR && size > 0) {
    bytes.resize(size);
    if (GetFontData(context.get(), 0, 0, bytes.data(), size) != size) bytes.clear();
  }
  return bytes;
}

}  // namespace talutil::win32
