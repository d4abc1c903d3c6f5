// A client that prints: without a printer, then on one that writes PostScript into a file.
#include <fstream>

#include "windows.hpp"
// After windows.h.
#include <winspool.h>

using namespace talutil::hosts;

namespace {

constexpr const wchar_t* printer_name = L"TALUtilTest";
constexpr const wchar_t* printer_environment = sizeof(void*) == 8 ? L"Windows x64" : L"Windows NT x86";

BOOL CALLBACK save_description(HMODULE module, const wchar_t* type, wchar_t* name, LONG_PTR path) {
  const HRSRC resource = FindResourceW(module, name, type);
  std::ofstream file(reinterpret_cast<const wchar_t*>(path), std::ios::binary);
  file.write(static_cast<const char*>(LockResource(LoadResource(module, resource))),
             static_cast<std::streamsize>(SizeofResource(module, resource)));
  return FALSE;
}

wchar_t* fixed(const wchar_t* constant) { return const_cast<wchar_t*>(constant); }

/// Where the printer writes, as the machine below Wine names it.
void print_into(const std::wstring& file) {
  RegSetKeyValueW(HKEY_CURRENT_USER, L"Software\\Wine\\Printing\\Spooler", L"LPT1:", REG_SZ, file.c_str(),
                  static_cast<DWORD>((file.size() + 1) * sizeof(wchar_t)));
}

/// A PostScript printer whose port is a file.
void install_printer() {
  std::array<wchar_t, MAX_PATH> folder{};
  DWORD needed = 0;
  GetPrinterDriverDirectoryW(nullptr, fixed(printer_environment), 1, reinterpret_cast<BYTE*>(folder.data()),
                             sizeof folder, &needed);
  std::wstring description = std::wstring(folder.data()) + L"\\test.ppd";
  EnumResourceNamesW(LoadLibraryW(L"winspool.drv"), L"PPDFILE", &save_description,
                     reinterpret_cast<LONG_PTR>(description.c_str()));
  DRIVER_INFO_3W driver{};
  driver.cVersion = 3;
  driver.pName = fixed(L"Test PostScript");
  driver.pEnvironment = fixed(printer_environment);
  driver.pDriverPath = driver.pConfigFile = fixed(L"wineps.drv");
  driver.pDataFile = description.data();
  driver.pDefaultDataType = fixed(L"RAW");
  AddPrinterDriverExW(nullptr, 3, reinterpret_cast<BYTE*>(&driver), APD_COPY_NEW_FILES | APD_COPY_FROM_DIRECTORY);
  PRINTER_INFO_2W printer{};
  printer.pPrinterName = fixed(printer_name);
  printer.pPortName = fixed(L"LPT1:");
  printer.pDriverName = driver.pName;
  printer.pPrintProcessor = fixed(L"WinPrint");
  printer.pDatatype = fixed(L"RAW");
  printer.pComment = printer.pLocation = printer.pParameters = printer.pShareName = printer.pSepFile = fixed(L"");
  const HANDLE added = AddPrinterW(nullptr, 2, reinterpret_cast<BYTE*>(&printer));
  check(added != nullptr && ClosePrinter(added) != FALSE, "a printer is added");
  check(SetDefaultPrinterW(printer_name) != FALSE, "it is the default printer");
}

void remove_printer() {
  HANDLE printer = nullptr;
  PRINTER_DEFAULTSW rights{nullptr, nullptr, PRINTER_ALL_ACCESS};
  if (OpenPrinterW(fixed(printer_name), &printer, &rights) != FALSE) {
    DeletePrinter(printer);
    ClosePrinter(printer);
  }
}

/// What the library's helper answers for a window.
LONG helper_answer(HMODULE helper, LONG window) {
  LONG answer = 1;
  for (const char* name : {"ConfigurePrinter", "SendToPrinter"}) {
    const auto print = reinterpret_cast<LONG(WINAPI*)(LONG)>(reinterpret_cast<void*>(GetProcAddress(helper, name)));
    answer = answer != 0 && print != nullptr ? print(window) : 0;
  }
  return answer;
}

/// A form as PrintScreen wants it, and the print helper, which the client puts beside the library.
void forms_are_printed(_ORVUtils* u, const std::wstring& folder, const std::wstring& output) {
  const HWND shown = window(L"Static", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 400, 200);
  const auto number = static_cast<LONG>(reinterpret_cast<LONG_PTR>(shown));
  HostObject form({L"hwnd", L"Refresh"}, [&](const Use& use) {
    return use.member == 1 ? use.answer(number) : UpdateWindow(shown) != FALSE ? S_OK : E_FAIL;
  });
  Value holder(&form);
  const auto is_asked = [&](std::vector<DISPID> members) {
    return std::ranges::equal(std::exchange(form.uses, {}), members, {}, [](const auto& use) { return use.first; });
  };
  const std::wstring beside = folder + L"\\printhelper.dll";
  DeleteFileW(beside.c_str());
  const Outcome outcome = early_outcome(u->PrintScreen(holder));
  check_equal(run_time_error(53), outcome.error, "without the print helper");
  check_equal(L"TALUtil.ORVUtils: File not found: printhelper.dll", outcome.text, "its text");
  check(is_asked({1}), "what the form was asked for");
  check(CopyFileW((folder + L"\\printhelper\\printhelper.dll").c_str(), beside.c_str(), FALSE) != FALSE,
        "the print helper beside TALUtil.dll");
  check_equal(S_OK, u->PrintScreen(holder), "with the print helper");
  check(is_asked({1, 2, 1}), "hwnd, Refresh, hwnd");
  const HMODULE helper = GetModuleHandleW(beside.c_str());
  check(helper != nullptr, "it is loaded from beside TALUtil.dll");
  check_equal(0, helper_answer(helper, number), "a window without a printer");
  install_printer();
  print_into(output + L"/printed_window.ps");
  check_equal(0, helper_answer(helper, 12345), "no window");
  check_equal(1, helper_answer(helper, number), "a window and a printer");
  FreeLibrary(helper);
  DeleteFileW(beside.c_str());
  DestroyWindow(shown);
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
  // The key returns when everything is printed.
  const auto print = [](HWND window) {
    SendMessageW(window, WM_KEYDOWN, VK_F9, 0);
    close(window);
  };
  with_dialog([&] {
    preview(u,
            L"The first page\r\n\u05E9\u05DC\u05D5\u05DD (abc) 12.50\r\n\u0645\u0631\u062D\u0628\u0627 50%\fThe second "
            L"page",
            print);
  });
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  enter_desktop();
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    remove_printer();
    forms_are_printed(object.get(), arguments[1], arguments[2]);
    print_into(arguments[2] + std::wstring(L"/printed_report.ps"));
    preview_is_printed(object.get());
    remove_printer();
  });
}
