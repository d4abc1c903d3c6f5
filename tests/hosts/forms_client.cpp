// A client that opens the library's own windows, and uses them by keys and the mouse as a user does: forms_client
// FOLDER [PICTURES]. With PICTURES, a prefix of their names, it takes pictures alone. What the windows do with what
// they are told is shown by tests/infoforms and tests/preview; here it is the system's controls, keys and screen.
#include "windows.hpp"
// After windows.h.
#include <commctrl.h>

using namespace talutil::hosts;

namespace {

constexpr VARIANT_BOOL yes = VARIANT_TRUE;
constexpr VARIANT_BOOL no = VARIANT_FALSE;

LONG height_on_screen(HWND window) {
  const RECT place = place_of(window);
  check(place.top >= 0 && place.bottom <= GetSystemMetrics(SM_CYSCREEN), "it stands on the screen");
  return height_of(window);
}

/// The one window of a form that is shown.
HWND only_form() {
  const auto windows = top_windows(form_class);
  check_equal(std::size_t{1}, windows.size(), "windows of forms");
  return windows.at(0);
}

void boxes_take_texts(_ORVUtils* u) {
  LONG usual_height = 0;
  const auto looks_usual = [&](HWND window) {
    usual_height = height_on_screen(window);
    check_equal(L"Who?|What is your name?|OK", words_of(window), "the texts");
    check(has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST) && has_style(window, GWL_STYLE, WS_CAPTION), "a frame, on top");
    check(GetWindow(controls(window, L"Static").at(0), GW_HWNDNEXT) == controls(window, L"Edit").at(0),
          "the label names the entry");
  };
  const auto is_masked = [](HWND box) {
    check(has_style(controls(box, L"Edit").at(0), GWL_STYLE, ES_PASSWORD), "mask");
  };
  const auto has_no_entry = [](HWND box) { check(controls(box, L"Edit").empty(), "no entry"); };
  const auto has_grown = [&](HWND box) { check(height_on_screen(box) > usual_height + 40, "grown with its prompt"); };
  const auto is_high = [&](HWND box) { check(height_on_screen(box) > 3 * usual_height, "an endless prompt"); };
  const std::wstring several = L"one\r\ntwo\nthree\r\nfour\r\n\u05E9\u05DC\u05D5\u05DD \u4F60\u597D\r\n";
  std::wstring endless;
  while (endless.size() < 65536) endless += L"A line of a prompt that nobody reads to its end.\n";
  const struct {
    Question question;
    std::function<void(HWND)> look;
    const char* script;
    const wchar_t* answer;
  } rows[] = {
      {{}, looks_usual, "ann{picture input-box}{ENTER}", L"ann"},
      {{.is_masked = yes}, is_masked, "{SHIFT+S}e{SHIFT+T}{picture input-box-masked}{TAB} ", L"SeT"},
      {{.has_entry = no, .colour = 0x400000}, has_no_entry, "{picture input-box-no-entry}{click OK}", L""},
      {{}, looks_usual, "gone{ESC}", L""},
      {{.prompt = several + std::wstring(300, L'w')}, has_grown, "{picture input-box-long}{ENTER}", L""},
      {{.prompt = endless + L'\0' + L"after"}, is_high, "{picture input-box-endless}{ENTER}", L""},
  };
  for (const auto& row : rows) {
    const auto answer = ask(u, row.question, [&](HWND window) { row.look(window), follow(window, row.script); });
    check_equal(row.answer, answer, row.script);
  }
}

/// Whether the thread was asked to quit; takes the request away.
bool is_asked_to_quit(WPARAM code) {
  MSG message{};
  return PeekMessageW(&message, nullptr, WM_QUIT, WM_QUIT, PM_REMOVE) != FALSE && message.wParam == code;
}

std::atomic<bool> is_seen = false;

void see(HWND) { is_seen = true; }

/// Asks for the end once the user has seen a window.
void CALLBACK quit(HWND, UINT, UINT_PTR timer, DWORD) {
  if (!is_seen.exchange(false)) return;
  KillTimer(nullptr, timer);
  PostQuitMessage(7);
}

void hosts_may_go_meanwhile(_ORVUtils* u) {
  // A host that quits gets its box back, and hears of it in its own loop.
  SetTimer(nullptr, 0, 100, &quit);
  ask(u, {}, see);
  check(is_asked_to_quit(7), "it quits");

  // A window of the host that goes away takes its box with it.
  const HWND owner = window(L"Static", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 200, 100);
  SetForegroundWindow(owner);
  const auto is_waiting = [&] { return IsWindowEnabled(owner) == FALSE; };
  ask(u, {}, [&](HWND) {
    check(wait_until(is_waiting), "the host's window waits");
    press(VK_RETURN);
  });
  check(!is_waiting(), "no longer than for the box");
  ask(u, {}, [&](HWND) {
    wait_until(is_waiting);
    close(owner);
  });
  check(IsWindow(owner) == FALSE, "the host's window is gone, and the call has returned");
}

/// Last, since the form has no frame afterwards.
void notices_stay(_ORVUtils* u) {
  std::wstring result;
  const Question notice{.prompt = L"Please wait...", .has_entry = no, .is_frameless = yes, .is_unclosable = yes};
  check_equal(S_OK, ask(u, notice, result), "a notice");
  const HWND window = only_form();
  check(!has_style(window, GWL_STYLE, WS_CAPTION) && has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST),
        "frameless, on top");
  check_equal(L"Who?|Please wait...", words_of(window), "nothing but its text");
  const HDC device = GetDC(window);
  check_equal(static_cast<COLORREF>(notice.colour), GetPixel(device, 2, 2), "it is painted without a message handled");
  ReleaseDC(window, device);
  take_picture(L"notice");
  SendMessageW(window, WM_SYSCOMMAND, SC_CLOSE, 0);
  check(IsWindow(window) != FALSE, "Alt+F4 does not close it");
  SendMessageW(window, WM_CLOSE, 0, 0);
  check(IsWindow(window) == FALSE, "the host does");
}

void keys_are_listed(_ORVUtils* u) {
  check_equal(S_OK, u->ShowShortCutKeys(), "ShowShortCutKeys");
  const HWND window = only_form();
  const HWND list = controls(window, L"RichEdit20W").at(0);
  handle_messages();
  take_picture(L"shortcut-keys");

  const HWND print = button(window, L"Print");
  const HWND cross = button(window, L"Cross");
  const auto is_at = [](HWND control) { return messages_until([control] { return GetFocus() == control; }); };
  check(is_at(list), "the text to be read has the focus");
  press(VK_TAB);
  check(is_at(print), "Tab reaches the first button");
  press(VK_TAB);
  check(is_at(cross), "and the second");
  follow(window, " {ALT+K}");
  check(is_at(list), "the cross button closes nothing, and Alt and a letter reach the list");
  press(VK_TAB);
  check(is_at(print), "Tab leaves it");
  // There is no printer: the user is told, the host is not.
  std::atomic<bool> is_told = false;
  const auto print_it = [&] { press(VK_SPACE), messages_until([&] { return is_told.load(); }); };
  with_user(dialog_class, print_it, [&](HWND box) { is_told = PostMessageW(box, WM_COMMAND, IDOK, 0) != FALSE; });
  check(is_told, "a box tells that nothing can be printed");
  SetWindowPos(window, nullptr, 0, 0, 700, 600, SWP_NOMOVE | SWP_NOZORDER);
  const RECT around = place_of(window);
  const RECT inside = place_of(list);
  check(around.right - inside.right < 40 && around.bottom - inside.bottom < 40, "the list grows with its window");
  SetFocus(list);
  press(VK_ESCAPE);
  check(messages_until([] { return top_windows(form_class).empty(); }), "Esc closes it");
}

std::wstring clipboard() {
  std::wstring text;
  // The system's own clipboard manager has it open for a moment after every change.
  if (!messages_until([] { return OpenClipboard(nullptr) != FALSE; })) return L"a clipboard that stays closed";
  if (const HANDLE block = GetClipboardData(CF_UNICODETEXT); block != nullptr) {
    text = static_cast<const wchar_t*>(GlobalLock(block));
    GlobalUnlock(block);
  }
  CloseClipboard();
  return text;
}

int rows_of(HWND window) {
  return static_cast<int>(SendMessageW(controls(window, L"SysListView32").at(0), LVM_GETITEMCOUNT, 0, 0));
}

void switches_are_explained(HWND window) {
  check_equal(9, rows_of(window), "rows below the heading");
  follow(window, "{picture command-line-help}{CTRL+A}{CTRL+C}");
  const auto is_copied = [] {
    const std::wstring copied = clipboard();
    return copied.starts_with(L"RM\tStarts ORV with no booking screen\r\n") &&
           copied.find(L"\r\n\t  Preload the requested time out time if specified\r\n") != std::wstring::npos;
  };
  check(wait_until(is_copied), "copied rows: " + narrow(clipboard().substr(0, 60)));
  press(VK_ESCAPE);
}

void system_is_described(HWND window) {
  follow(window,
         "{picture system-drives}{CTRL+TAB}{picture system-memory}{CTRL+TAB}{picture system-processor}{CTRL+TAB}"
         "{picture system-operating-system}{click &Copy as text}");
  check(wait_until([] { return clipboard().starts_with(L"Drives\r\n  Drive  Kind"); }),
        "what was copied: " + narrow(clipboard().substr(0, 60)));
  follow(window, "{CTRL+TAB}{ALT+F}c{SHIFT+;}\\windows");
  check_equal(0, rows_of(window), "no details yet");
  press(VK_RETURN);
  check(wait_until([&] { return rows_of(window) >= 8; }), "the details of a folder");
  check_equal(L"c:\\windows", text_of(controls(window, L"Edit").at(0)), "the path as it was typed");
  follow(window, "{picture system-folder}{click &Refresh}{ESC}");
}

void pages_are_shown(HWND window) {
  const auto key = [window](WPARAM code) { SendMessageW(window, WM_KEYDOWN, code, 0); };
  key(VK_F3);
  check_equal(L"Notes           Page 2 of 3      Press F9 to Print.", text_of(window), "the caption");
  SetWindowPos(window, nullptr, 0, 0, 200, 100, SWP_NOMOVE | SWP_NOZORDER);
  check(width_of(window) == 600 && height_of(window) == 400, "the smallest size");
  std::array<wchar_t, 40> item{};
  GetMenuStringW(GetSubMenu(GetSubMenu(GetMenu(window), 2), 1), 0, item.data(), static_cast<int>(item.size()),
                 MF_BYPOSITION);
  check_equal(L"&Vertcial", std::wstring(item.data()), "the spelling that users know, with a letter");
  key(VK_ESCAPE);
}

void unattended_reports_are_written(_ORVUtils* u) {
  const wchar_t* const path = L"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\SalesReport.pdf";
  DeleteFileW(path);
  u->put_AutomatedEndOfMonth(VARIANT_TRUE);
  // A window alone: its picture is the report.
  const HWND report = window(L"Static", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 200, 100);
  HostObject grid({L"hwnd"},
                  [&](const Use& use) { return use.answer(static_cast<LONG>(reinterpret_cast<LONG_PTR>(report))); });
  Value holder(&grid);
  Value empty;
  const HRESULT status =
      u->GridPrintPreview(Short{100}, Short{2}, Text(L"Sales"), Text(L""), holder, empty, empty, Text(L"SalesReport"));
  check_equal(S_OK, status, "GridPrintPreview");
  check_equal("%PDF-", bytes_of(path).substr(0, 5), "the report of an unattended run");
  u->put_AutomatedEndOfMonth(VARIANT_FALSE);
  DestroyWindow(report);
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  SetProcessDPIAware();  // Otherwise the system scales its windows.
  enter_desktop();
  pictures = std::wstring(arguments[1]) + L"\\screenshots\\" + (count > 2 ? arguments[2] : L"");
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    boxes_take_texts(u);
    show(
        form_class, [u] { return u->ShowCmdLineHelp(); }, switches_are_explained);
    show(
        form_class, [u] { return u->ShowSysInfo(); }, system_is_described);
    keys_are_listed(u);
    if (count < 3) {
      std::wstring pages =
          L"\u05E9\u05DC\u05D5\u05DD (\u05D0\u05B8\u05D1) abc 12.50!\r\n\u0645\u0631\u062D\u0628\u0627 50% a\r\n";
      for (int i = 3; i <= 150; ++i)
        pages +=
            L"Line " + std::to_wstring(i) + L": caf\u00E9, \u041F\u0440\u0438\u0432\u0435\u0442, 12.50\t\u20AC\r\n";
      preview(u, pages, pages_are_shown);
      SetTimer(nullptr, 0, 100, &quit);
      preview(u, L"x", see);
      check(is_asked_to_quit(7), "a host that quits gets its call back and hears of it");
      unattended_reports_are_written(u);
      hosts_may_go_meanwhile(u);
    }
    notices_stay(u);
  });
}
