// A client that prints: without a printer, then on one that writes PostScript into a file.
#include <fstream>

#include "boxes.hpp"
// After windows.h.
#include <winspool.h>

using namespace talutil::hosts;

namespace {

constexpr const wchar_t* printer_name = L"TALUtilTest";
constexpr const wchar_t* printer_environment = sizeof(void*) == 8 ? L"Windows x64" : L"Windows NT x86";
constexpr const wchar_t* spooler_key = L"Software\\Wine\\Printing\\Spooler";

BOOL CALLBACK save_description(HMODULE module, const wchar_t* type, wchar_t* name, LONG_PTR path) {
  const HRSRC resource = FindResourceW(module, name, type);
  std::ofstream file(reinterpret_cast<const wchar_t*>(path), std::ios::binary);
  file.write(static_cast<const char*>(LockResource(LoadResource(module, resource))),
             static_cast<std::streamsize>(SizeofResource(module, resource)));
  return FALSE;
}

wchar_t* text(const wchar_t* constant) { return const_cast<wchar_t*>(constant); }

/// A PostScript printer whose port is a file.
void install_printer(const std::wstring& output) {
  std::array<wchar_t, MAX_PATH> folder{};
  DWORD needed = 0;
  GetPrinterDriverDirectoryW(nullptr, text(printer_environment), 1, reinterpret_cast<BYTE*>(folder.data()),
                             sizeof folder, &needed);
  std::wstring description = std::wstring(folder.data()) + L"\\test.ppd";
  EnumResourceNamesW(LoadLibraryW(L"winspool.drv"), L"PPDFILE", &save_description,
                     reinterpret_cast<LONG_PTR>(description.c_str()));
  RegSetKeyValueW(HKEY_CURRENT_USER, spooler_key, L"LPT1:", REG_SZ, output.c_str(),
                  static_cast<DWORD>((output.size() + 1) * sizeof(wchar_t)));

  DRIVER_INFO_3W driver{};
  driver.cVersion = 3;
  driver.pName = text(L"Test PostScript");
  driver.pEnvironment = text(printer_environment);
  driver.pDriverPath = driver.pConfigFile = text(L"wineps.drv");
  driver.pDataFile = description.data();
  driver.pDefaultDataType = text(L"RAW");
  AddPrinterDriverExW(nullptr, 3, reinterpret_cast<BYTE*>(&driver), APD_COPY_NEW_FILES | APD_COPY_FROM_DIRECTORY);
  PRINTER_INFO_2W printer{};
  printer.pPrinterName = text(printer_name);
  printer.pPortName = text(L"LPT1:");
  printer.pDriverName = driver.pName;
  printer.pPrintProcessor = text(L"WinPrint");
  printer.pDatatype = text(L"RAW");
  printer.pComment = printer.pLocation = printer.pParameters = printer.pShareName = printer.pSepFile = text(L"");
  const HANDLE added = AddPrinterW(nullptr, 2, reinterpret_cast<BYTE*>(&printer));
  if (check(added != nullptr || GetLastError() == ERROR_PRINTER_ALREADY_EXISTS, "a printer is added")) {
    if (added != nullptr) ClosePrinter(added);
  }
  check(SetDefaultPrinterW(printer_name) != FALSE, "it is the default printer");
}

void remove_printer() {
  HANDLE printer = nullptr;
  PRINTER_DEFAULTSW rights{nullptr, nullptr, PRINTER_ALL_ACCESS};
  if (OpenPrinterW(text(printer_name), &printer, &rights) != FALSE) {
    DeletePrinter(printer);
    ClosePrinter(printer);
  }
}

/// Prints by the library's helper, as PrintScreen does.
LONG print_window(const std::wstring& folder, HWND window) {
  const HMODULE module = LoadLibraryW((folder + L"\\printhelper\\printhelper.dll").c_str());
  LONG answer = 1;
  for (const char* name : {"ConfigurePrinter", "SendToPrinter"}) {
    const auto print = reinterpret_cast<LONG(WINAPI*)(LONG)>(reinterpret_cast<void*>(GetProcAddress(module, name)));
    answer = answer != 0 && print != nullptr ? print(static_cast<LONG>(reinterpret_cast<LONG_PTR>(window))) : 0;
  }
  FreeLibrary(module);
  return answer;
}

/// Opens a preview and prints from it, the printer dialog being answered with OK. Answers what stood on its title.
std::wstring print_preview(_ORVUtils* u, const Desktop& desktop) {
  TextObject box(L"Text", L"The first page\fThe second page");
  Value holder(&box);
  std::wstring title;
  std::thread user([&] {
    desktop.enter();
    const HWND window = wait_for_window(L"TALUtilPreview");
    if (window == nullptr) return;
    Sleep(300);
    PostMessageW(window, WM_KEYDOWN, VK_F9, 0);
    Sleep(500);
    const std::atomic<bool> is_over = false;
    const HWND dialog = wait_for_box(is_over);
    if (dialog != nullptr) {
      title = describe(dialog).text;
      SendMessageW(dialog, WM_COMMAND, IDOK, 0);
    }
    Sleep(1000);
    SendMessageW(window, WM_CLOSE, 0, 0);
  });
  check_equal(S_OK, u->TextBoxPrintPreview(Short{100}, Short{1}, Text(L"Notes"), Text(L""), holder),
              "TextBoxPrintPreview");
  user.join();
  return title;
}

/// Prints the list of shortcut keys from its window.
bool print_keys(_ORVUtils* u, const Desktop& desktop) {
  check_equal(S_OK, u->ShowShortCutKeys(), "ShowShortCutKeys");
  const HWND window = wait_for_window(L"TALUtilForm");
  const SeenBox dialog = act_and_watch(
      desktop, [](HWND box) { PostMessageW(box, WM_COMMAND, IDOK, 0); },
      [&] { SendMessageW(FindWindowExW(window, nullptr, L"Button", L"Print"), BM_CLICK, 0, 0); });
  SendMessageW(window, WM_CLOSE, 0, 0);
  return dialog.title == L"Print";
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  const Desktop desktop;
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    const std::wstring folder = arguments[1];
    const std::wstring output = arguments[2];  // As the machine below Wine names it.
    const HWND window = CreateWindowW(L"Static", L"A window to print", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 10, 10, 400,
                                      200, nullptr, nullptr, nullptr, nullptr);
    remove_printer();
    check_equal(0, print_window(folder, window), "a window without a printer");
    install_printer(output + L"/printed_window.ps");
    check_equal(1, print_window(folder, window), "a window with one");
    install_printer(output + L"/printed_report.ps");
    check_equal(L"Print", print_preview(object.get(), desktop), "the printer dialog");
    install_printer(output + L"/printed_keys.ps");
    check(print_keys(object.get(), desktop), "the printer dialog for the keys");
    DestroyWindow(window);
    remove_printer();
  });
}
