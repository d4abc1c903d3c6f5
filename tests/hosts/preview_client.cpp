// A client that opens the preview window: what it shows, its keys, and that nothing is left of it.
#include <filesystem>
#include <fstream>

#include "boxes.hpp"

using namespace talutil::hosts;

namespace {

void press(HWND window, WPARAM key) { SendMessageW(window, WM_KEYDOWN, key, 0); }

/// Opens the preview of a text, the user doing what the function does; it must close the window.
void preview(_ORVUtils* u, const Desktop& desktop, const std::wstring& text, const std::function<void(HWND)>& user) {
  TextObject box(L"Text", text);
  Value holder(&box);
  bool is_seen = false;
  std::thread watcher([&] {
    desktop.enter();
    const HWND window = wait_for_window(L"TALUtilPreview");
    if (window == nullptr) return;
    is_seen = true;
    user(window);
  });
  check_equal(S_OK, u->TextBoxPrintPreview(Short{100}, Short{1}, Text(L"Notes"), Text(L"C:\\exports\\"), holder),
              "TextBoxPrintPreview");
  watcher.join();
  check(is_seen, "the preview window was shown");
}

void window_shows_pages(_ORVUtils* u, const Desktop& desktop, const std::wstring& pictures) {
  std::wstring text;
  for (int i = 1; i <= 150; ++i)
    text += L"Line " + std::to_wstring(i) + L": caf\u00E9, \u041F\u0440\u0438\u0432\u0435\u0442, 12.50\t\u20AC\r\n";
  preview(u, desktop, text, [&](HWND window) {
    check_equal(L"Notes           Page 1 of 3      Press F9 to Print.", text_of(window), "the caption");
    press(window, VK_F3);
    check_equal(L"Notes           Page 2 of 3      Press F9 to Print.", text_of(window), "after F3");
    press(window, VK_NEXT);
    press(window, VK_NEXT);
    check_equal(L"Notes           Page 3 of 3      Press F9 to Print.", text_of(window), "the last page");
    press(window, VK_F2);
    press(window, VK_F2);
    Sleep(300);
    take_picture(pictures, L"preview_100");
    for (int i = 0; i < 2; ++i) SendMessageW(window, WM_MOUSEWHEEL, MAKEWPARAM(MK_CONTROL, -WHEEL_DELTA), 0);
    Sleep(300);
    take_picture(pictures, L"preview_50");
    for (int i = 0; i < 5; ++i) SendMessageW(window, WM_MOUSEWHEEL, MAKEWPARAM(MK_CONTROL, WHEEL_DELTA), 0);
    Sleep(300);
    take_picture(pictures, L"preview_200");
    SetWindowPos(window, nullptr, 0, 0, 200, 100, SWP_NOMOVE | SWP_NOZORDER);
    RECT place{};
    GetWindowRect(window, &place);
    check_equal(600, static_cast<int>(place.right - place.left), "the smallest width");
    check_equal(400, static_cast<int>(place.bottom - place.top), "the smallest height");
    const HMENU paper = GetSubMenu(GetMenu(window), 2);
    std::array<wchar_t, 40> item{};
    GetMenuStringW(GetSubMenu(paper, 1), 0, item.data(), static_cast<int>(item.size()), MF_BYPOSITION);
    check_equal(L"Vertcial", std::wstring(item.data()), "the spelling that users know");
    press(window, VK_ESCAPE);
  });
  check(top_windows([](HWND window) { return describe(window).class_name == L"TALUtilPreview"; }).empty(),
        "the window is gone");
}

void nothing_is_left(_ORVUtils* u, const Desktop& desktop) {
  const auto open = [&] { preview(u, desktop, L"x", [](HWND window) { SendMessageW(window, WM_CLOSE, 0, 0); }); };
  for (int i = 0; i < 3; ++i) open();
  const Handles before;
  for (int i = 0; i < 20; ++i) open();
  const Handles after;
  check(after.drawing <= before.drawing + 2, "drawing handles after 20 openings");
  check(after.windows <= before.windows + 2, "window handles after 20 openings");
}

void CALLBACK quit(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  PostQuitMessage(3);
}

void host_quits(_ORVUtils* u, const Desktop& desktop) {
  SetTimer(nullptr, 0, 1000, &quit);
  preview(u, desktop, L"x", [](HWND) {});
  MSG message{};
  check(PeekMessageW(&message, nullptr, WM_QUIT, WM_QUIT, PM_REMOVE) != FALSE && message.wParam == 3,
        "a host that quits gets its call back and hears of it");
}

void unattended_reports_are_written(_ORVUtils* u) {
  const wchar_t* const path = L"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\SalesReport.pdf";
  DeleteFileW(path);
  u->put_AutomatedEndOfMonth(VARIANT_TRUE);
  // A window alone: its picture is the report.
  const HWND window = CreateWindowW(L"Static", L"A report", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 200, 100, nullptr,
                                    nullptr, nullptr, nullptr);
  TextObject grid(L"hwnd", std::to_wstring(reinterpret_cast<LONG_PTR>(window)));
  Value holder(&grid);
  Value empty;
  check_equal(
      S_OK,
      u->GridPrintPreview(Short{100}, Short{2}, Text(L"Sales"), Text(L""), holder, empty, empty, Text(L"SalesReport")),
      "GridPrintPreview");
  const auto start_of_file = [&] {
    std::ifstream file(path, std::ios::binary);
    std::string start(5, ' ');
    file.read(start.data(), 5);
    return start;
  };
  check_equal(std::string("%PDF-"), start_of_file(), "the report of an unattended run");

  // What another program has open, or what is read-only, stays as it is, without a word.
  const auto write_again = [&](const char* what) {
    check_equal(S_OK,
                u->GridPrintPreview(Short{100}, Short{2}, Text(L"Sales"), Text(L""), holder, empty, empty,
                                    Text(L"SalesReport")),
                what);
  };
  std::ofstream(std::filesystem::path(path)) << "older";
  const HANDLE reader = CreateFileW(path, GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr);
  write_again("a report that is open elsewhere");
  check_equal(std::string("older"), start_of_file(), "the report that is open elsewhere");
  CloseHandle(reader);
  SetFileAttributesW(path, FILE_ATTRIBUTE_READONLY);
  write_again("a read-only report");
  check_equal(std::string("older"), start_of_file(), "the read-only report");
  SetFileAttributesW(path, FILE_ATTRIBUTE_NORMAL);
  write_again("a report that can be written again");
  check_equal(std::string("%PDF-"), start_of_file(), "it is written again");
  u->put_AutomatedEndOfMonth(VARIANT_FALSE);
  DestroyWindow(window);
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  const Desktop desktop;
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    window_shows_pages(object.get(), desktop, std::wstring(arguments[1]) + L"\\..\\screenshots");
    nothing_is_left(object.get(), desktop);
    host_quits(object.get(), desktop);
    unattended_reports_are_written(object.get());
  });
}
