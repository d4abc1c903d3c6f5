// A client that prints: without a printer, then on one that writes PostScript into a file.
#include <fstream>

#include "windows.hpp"
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

/// Does what prints by way of the printer dialog, which is answered with OK.
void with_dialog(const std::function<void()>& print) {
  std::wstring title;
  with_user(dialog_class, print, [&](HWND dialog) {
    title = text_of(dialog);
    SendMessageW(dialog, WM_COMMAND, IDOK, 0);
  });
  check_equal(L"Print", title, "the title of the printer dialog");
}

void preview_is_printed(_ORVUtils* u) {
  HostObject box({L"Text"}, [](const Use& use) { return use.answer(L"The first page\fThe second page"); });
  Value holder(&box);
  with_dialog([&] {
    const auto open = [&] {
      check_equal(S_OK, u->TextBoxPrintPreview(Short{100}, Short{1}, Text(L"Notes"), Text(L""), holder), "a preview");
    };
    // The key returns when everything is printed.
    with_user(L"TALUtilPreview", open, [](HWND window) {
      SendMessageW(window, WM_KEYDOWN, VK_F9, 0);
      close(window);
    });
  });
}

void keys_are_printed(_ORVUtils* u) {
  check_equal(S_OK, u->ShowShortCutKeys(), "ShowShortCutKeys");
  const HWND window = top_windows(L"TALUtilForm").at(0);
  with_dialog([&] { SendMessageW(button(window, L"Print"), BM_CLICK, 0, 0); });
  close(window);
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  enter_desktop();
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
    preview_is_printed(object.get());
    install_printer(output + L"/printed_keys.ps");
    keys_are_printed(object.get());
    DestroyWindow(window);
    remove_printer();
  });
}
