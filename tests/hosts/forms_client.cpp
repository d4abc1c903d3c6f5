// A client that opens the library's own windows, and uses them by keys and the mouse as a user does: forms_client
// FOLDER [OPENINGS [PICTURES]]. With PICTURES, a prefix of their names, it takes pictures alone.
#include <filesystem>
#include <fstream>

#include "windows.hpp"
// After windows.h.
#include <commctrl.h>
#include <richedit.h>

using namespace talutil::hosts;

namespace {

constexpr const wchar_t* form_class = L"TALUtilForm";
constexpr const wchar_t* preview_class = L"TALUtilPreview";
constexpr VARIANT_BOOL yes = VARIANT_TRUE;
constexpr VARIANT_BOOL no = VARIANT_FALSE;
constexpr LONG usual_colour = 0xC0E0FF;

struct Question {
  std::wstring prompt = L"What is your name?";
  VARIANT_BOOL is_masked = no;
  VARIANT_BOOL has_entry = yes;
  VARIANT_BOOL is_frameless = no;
  VARIANT_BOOL is_unclosable = no;
  LONG colour = usual_colour;
};

HRESULT ask(_ORVUtils* u, const Question& question, std::wstring& result) {
  Text answer;
  const HRESULT status =
      u->MyInputBox(Text(L"Who?"), Text(question.prompt), Flag{question.is_masked}, Flag{question.has_entry},
                    Flag{question.is_frameless}, Flag{question.is_unclosable}, Long{question.colour}, answer);
  result = answer.view();
  return status;
}

std::wstring ask(_ORVUtils* u, const Question& question, const std::function<void(HWND)>& user) {
  std::wstring result;
  const auto action = [&] { check_equal(S_OK, ask(u, question, result), "MyInputBox"); };
  check_equal(1, with_user(form_class, action, user), "boxes for " + narrow(question.prompt.substr(0, 40)));
  return result;
}

std::wstring prompt_of(HWND window) { return text_of(controls(window, L"Static").at(0)); }

void boxes_take_texts(_ORVUtils* u) {
  LONG usual_height = 0;
  const auto height = [](HWND window) {
    RECT place{};
    GetWindowRect(window, &place);
    check(place.top >= 0 && place.bottom <= GetSystemMetrics(SM_CYSCREEN), "it stands on the screen");
    return place.bottom - place.top;
  };
  struct Row {
    Question question;
    const wchar_t* answer;
    std::function<void(HWND)> user;
  };
  std::wstring endless;
  while (endless.size() < 65536) endless += L"A line of a prompt that nobody reads to its end.\n";
  const Question several{.prompt = L"one\r\ntwo\nthree\r\nfour\r\n\u05E9\u05DC\u05D5\u05DD \u4F60\u597D\r\n" +
                                   std::wstring(300, L'w')};
  const Row rows[] = {
      {{},
       L"ann",
       [&](HWND window) {
         check_equal(L"Who?|What is your name?|OK", words_of(window), "the texts");
         check(has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST), "it is on top");
         check(has_style(window, GWL_STYLE, WS_CAPTION), "it has a frame");
         check(GetWindow(controls(window, L"Static").at(0), GW_HWNDNEXT) == controls(window, L"Edit").at(0),
               "the label names the entry");
         usual_height = height(window);
         type("ann");
         take_picture(L"input-box");
         press(VK_RETURN);
       }},
      {{.is_masked = yes},
       L"SECRET",
       [](HWND window) {
         for (const char letter : {'S', 'E', 'C', 'R', 'E', 'T'}) press(letter, {VK_SHIFT});
         check(has_style(controls(window, L"Edit").at(0), GWL_STYLE, ES_PASSWORD), "masked");
         take_picture(L"input-box-masked");
         press(VK_TAB);
         press(VK_SPACE);
       }},
      {{},
       L"",
       [](HWND window) {
         type("gone");
         PostMessageW(window, WM_SYSCOMMAND, SC_CLOSE, 0);
       }},
      {{.has_entry = no, .colour = 0x400000},
       L"",
       [](HWND window) {
         check(controls(window, L"Edit").empty(), "no entry");
         take_picture(L"input-box-no-entry");
         click(button(window, L"OK"));
       }},
      {{}, L"", [](HWND) { press(VK_ESCAPE); }},
      {several, L"",
       [&](HWND window) {
         check(height(window) > usual_height + 40, "a box grows with its prompt");
         take_picture(L"input-box-long");
         press(VK_RETURN);
       }},
      {{.prompt = endless + L'\0' + L"after"},
       L"",
       [&](HWND window) {
         check(height(window) > 3 * usual_height, "an endless prompt");
         take_picture(L"input-box-endless");
         press(VK_RETURN);
       }},
      {{.prompt = L"", .colour = static_cast<LONG>(0x8000000F)}, L"", [](HWND) { press(VK_RETURN); }},
      {{.colour = static_cast<LONG>(0x800000FF)}, L"", [](HWND) { press(VK_RETURN); }},
      {{.prompt = L"{\\rtf1 as it was written}", .colour = -1},
       L"",
       [](HWND window) {
         check_equal(L"{\\rtf1 as it was written}", prompt_of(window), "a prompt that looks like rich text");
         press(VK_RETURN);
       }},
  };
  for (const Row& row : rows) check_equal(row.answer, ask(u, row.question, row.user), "the answer");
}

_ORVUtils* entered = nullptr;
HRESULT inner_status = S_OK;

void CALLBACK ask_again(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  std::wstring result;
  inner_status = ask(entered, {.prompt = L"Again?"}, result);
}

/// Asks for the end once a window is there.
void CALLBACK quit(HWND, UINT, UINT_PTR timer, DWORD) {
  if (top_windows(form_class).empty() && top_windows(preview_class).empty()) return;
  KillTimer(nullptr, timer);
  PostQuitMessage(7);
}

void boxes_are_entered_once(_ORVUtils* u) {
  entered = u;
  SetTimer(nullptr, 0, 100, &ask_again);
  const std::wstring answer = ask(u, {}, [&](HWND window) {
    wait_until([] { return inner_status != S_OK; });
    check_equal(L"What is your name?", prompt_of(window), "the prompt stays");
    type("a");
    press(VK_RETURN);
  });
  check_equal(run_time_error(400), inner_status, "a box within a box");
  check_equal(L"a", answer, "the answer of the first");

  // A host that quits gets its box back, and hears of it in its own loop.
  SetTimer(nullptr, 0, 100, &quit);
  ask(u, {}, [](HWND) {});
  check(is_asked_to_quit(7), "it quits");

  // A window of the host that goes away takes its box with it.
  const HWND owner = CreateWindowW(L"Static", L"host", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 200, 100, nullptr,
                                   nullptr, nullptr, nullptr);
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
  Question notice{.prompt = L"Please wait...", .has_entry = no, .is_frameless = yes, .is_unclosable = yes};
  check_equal(S_OK, ask(u, notice, result), "a notice");
  const auto windows = top_windows(form_class);
  if (!check_equal(std::size_t{1}, windows.size(), "the notice is there")) return;
  const HWND window = windows[0];
  check(!has_style(window, GWL_STYLE, WS_CAPTION) && has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST),
        "frameless, on top");
  check_equal(L"Who?|Please wait...", words_of(window), "nothing but its text");
  const HDC device = GetDC(window);
  check_equal(static_cast<COLORREF>(usual_colour), GetPixel(device, 2, 2), "it is painted without a message handled");
  ReleaseDC(window, device);
  take_picture(L"notice");
  notice.prompt = L"Nearly done";
  check_equal(S_OK, ask(u, notice, result), "another notice");
  check(top_windows(form_class) == windows && prompt_of(window) == L"Nearly done", "the same window");
  press(VK_ESCAPE);
  handle_messages();
  check(top_windows(form_class) == windows, "Esc does not close it");
  u->put_DebugMode(0);
  u->Terminate();
  check(IsWindow(window) == FALSE, "Terminate does");
}

void keys_are_listed(_ORVUtils* u) {
  check_equal(S_OK, u->ShowShortCutKeys(), "ShowShortCutKeys");
  check_equal(S_OK, u->ShowShortCutKeys(), "again");
  const auto windows = top_windows(form_class);
  if (!check_equal(std::size_t{1}, windows.size(), "one window")) return;
  const HWND window = windows[0];
  check_equal(L"  Shortcut keys List", text_of(window), "the caption");
  check(has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST), "on top");
  const HWND list = controls(window, L"RichEdit20W").at(0);
  const std::wstring text = text_of(list);
  check(text.starts_with(L"GENERAL\r\nCopy Text CTRL+C\r\n"), "the list begins with " + narrow(text.substr(0, 40)));
  check(text.find(L"Message Center to Employee = F12 \r\n") != std::wstring::npos, "a blank that is kept");
  CHARFORMAT2W format{};
  format.cbSize = sizeof format;
  SendMessageW(list, EM_SETSEL, 0, 7);
  SendMessageW(list, EM_GETCHARFORMAT, SCF_SELECTION, reinterpret_cast<LPARAM>(&format));
  SendMessageW(list, EM_SETSEL, 0, 0);
  check_equal(L"Courier New", std::wstring(format.szFaceName), "the font");
  check(format.yHeight == 240 && (format.dwEffects & (CFE_BOLD | CFE_UNDERLINE)) == (CFE_BOLD | CFE_UNDERLINE),
        "headings of 12 points, bold and underlined");
  handle_messages();
  take_picture(L"shortcut-keys");

  const HWND print = button(window, L"Print");
  const HWND cross = button(window, L"Cross");
  const auto is_at = [](HWND control) { return messages_until([control] { return GetFocus() == control; }); };
  check(is_at(print), "the first button has the focus");
  press(VK_TAB);
  check(is_at(cross), "Tab reaches the second");
  press(VK_SPACE);
  press('K', {VK_MENU});
  check(is_at(list), "the cross button closes nothing, and Alt and a letter reach the list");
  press(VK_TAB);
  check(is_at(print), "Tab leaves it");
  // There is no printer: the user is told, the host is not.
  bool is_told = false;
  const auto answer = [&](HWND box) {
    PostMessageW(box, WM_COMMAND, IDOK, 0);
    is_told = true;
  };
  with_user(
      dialog_class, [&] { press(VK_SPACE), messages_until([&] { return is_told; }); }, answer);
  check(is_told, "a box tells that nothing can be printed");
  SetWindowPos(window, nullptr, 0, 0, 700, 600, SWP_NOMOVE | SWP_NOZORDER);
  RECT inside{};
  RECT place{};
  GetClientRect(window, &inside);
  GetWindowRect(list, &place);
  MapWindowPoints(nullptr, window, reinterpret_cast<POINT*>(&place), 2);
  check(inside.right - place.right < 30 && inside.bottom - place.bottom < 30, "the list grows with its window");
  SetFocus(list);
  press(VK_ESCAPE);
  check(messages_until([] { return top_windows(form_class).empty(); }), "Esc closes it");
}

std::wstring clipboard() {
  std::wstring text;
  if (OpenClipboard(nullptr) == FALSE) return text;
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
  const std::wstring examples = text_of(controls(window, L"RichEdit20W").at(0));
  check(examples.starts_with(L"Examples on how run ORV with command line options,\r\n\"C:\\Program Files\\TAL\\") &&
            examples.ends_with(L"\" SINEMP 120000002:1"),
        "the examples: " + narrow(examples));
  take_picture(L"command-line-help");
  press('A', {VK_CONTROL});
  press('C', {VK_CONTROL});
  const std::wstring copied = clipboard();
  check(copied.starts_with(L"RM\tStarts ORV with no booking screen\r\n") &&
            copied.find(L"\r\n\t  Preload the requested time out time if specified\r\n") != std::wstring::npos,
        "copied rows: " + narrow(copied.substr(0, 60)));
  press(VK_ESCAPE);
}

void system_is_described(HWND window) {
  take_picture(L"system-drives");
  for (const wchar_t* const tab : {L"system-memory", L"system-processor", L"system-operating-system"}) {
    press(VK_TAB, {VK_CONTROL});
    take_picture(tab);
  }
  click(button(window, L"&Copy as text"));
  const std::wstring copied = clipboard();
  for (const wchar_t* const part : {L"Drives\r\n", L"  C:", L"Memory\r\n", L"Processor\r\n", L"Computer"})
    check(copied.find(part) != std::wstring::npos, "the copy has " + narrow(part));
  press(VK_TAB, {VK_CONTROL});
  press('F', {VK_MENU});
  type("c");
  press(VK_OEM_1, {VK_SHIFT});
  press(VK_OEM_5);
  type("windows");
  check_equal(0, rows_of(window), "no details yet");
  press(VK_RETURN);
  check(wait_until([&] { return rows_of(window) >= 8; }), "the details of a folder");
  check_equal(L"c:\\windows", text_of(controls(window, L"Edit").at(0)), "the path as it was typed");
  take_picture(L"system-folder");
  click(button(window, L"&Refresh"));
  press(VK_ESCAPE);
}

/// Opens the preview of a text, the user doing what the function does; it must close the window.
void preview(_ORVUtils* u, const std::wstring& text, const std::function<void(HWND)>& user) {
  HostObject box({L"Text"}, [&](const Use& use) { return use.answer(std::wstring_view(text)); });
  Value holder(&box);
  const auto open = [&] {
    const HRESULT status = u->TextBoxPrintPreview(Short{100}, Short{1}, Text(L"Notes"), Text(L"C:\\exports\\"), holder);
    check_equal(S_OK, status, "TextBoxPrintPreview");
  };
  check_equal(1, with_user(preview_class, open, user), "preview windows");
  check(top_windows(preview_class).empty(), "the window is gone");
}

void pages_are_shown(HWND window) {
  const auto key = [window](WPARAM code) { SendMessageW(window, WM_KEYDOWN, code, 0); };
  const auto turn = [window](int steps) {
    for (; steps != 0; steps -= steps / std::abs(steps)) {
      const int delta = steps > 0 ? WHEEL_DELTA : -WHEEL_DELTA;
      SendMessageW(window, WM_MOUSEWHEEL, MAKEWPARAM(MK_CONTROL, delta), 0);
    }
  };
  const auto page = [window](const wchar_t* number) {
    check_equal(std::wstring(L"Notes           Page ") + number + L" of 3      Press F9 to Print.", text_of(window),
                "the caption");
  };
  page(L"1");
  key(VK_F3);
  page(L"2");
  key(VK_NEXT);
  key(VK_NEXT);
  page(L"3");
  key(VK_F2);
  key(VK_F2);
  take_picture(L"preview_100");
  turn(-2);
  take_picture(L"preview_50");
  turn(5);
  take_picture(L"preview_200");
  SetWindowPos(window, nullptr, 0, 0, 200, 100, SWP_NOMOVE | SWP_NOZORDER);
  RECT place{};
  GetWindowRect(window, &place);
  check(place.right - place.left == 600 && place.bottom - place.top == 400, "the smallest size");
  std::array<wchar_t, 40> item{};
  GetMenuStringW(GetSubMenu(GetSubMenu(GetMenu(window), 2), 1), 0, item.data(), static_cast<int>(item.size()),
                 MF_BYPOSITION);
  check_equal(L"Vertcial", std::wstring(item.data()), "the spelling that users know");
  key(VK_ESCAPE);
}

void unattended_reports_are_written(_ORVUtils* u) {
  const std::filesystem::path path = L"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\SalesReport.pdf";
  DeleteFileW(path.c_str());
  u->put_AutomatedEndOfMonth(VARIANT_TRUE);
  // A window alone: its picture is the report.
  const HWND window = CreateWindowW(L"Static", L"A report", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 200, 100, nullptr,
                                    nullptr, nullptr, nullptr);
  HostObject grid({L"hwnd"},
                  [&](const Use& use) { return use.answer(static_cast<LONG>(reinterpret_cast<LONG_PTR>(window))); });
  Value holder(&grid);
  Value empty;
  const auto write = [&](const char* expected, const char* what) {
    const HRESULT status = u->GridPrintPreview(Short{100}, Short{2}, Text(L"Sales"), Text(L""), holder, empty, empty,
                                               Text(L"SalesReport"));
    check_equal(S_OK, status, what);
    std::string start(5, ' ');
    std::ifstream(path, std::ios::binary).read(start.data(), 5);
    check_equal(expected, start, what);
  };
  write("%PDF-", "the report of an unattended run");
  // What another program has open, or what is read-only, stays as it is, without a word.
  std::ofstream(path) << "older";
  const HANDLE reader = CreateFileW(path.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING, 0, nullptr);
  write("older", "a report that is open elsewhere");
  CloseHandle(reader);
  SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_READONLY);
  write("older", "a read-only report");
  SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
  write("%PDF-", "a report that can be written again");
  u->put_AutomatedEndOfMonth(VARIANT_FALSE);
  DestroyWindow(window);
}

/// Opens and closes each window, and looks at what is left of it.
void nothing_is_left(_ORVUtils* u, int openings) {
  const std::pair<const char*, std::function<void()>> windows[] = {{"the input box", [u] { ask(u, {}, close); }},
                                                                   {"the list of keys",
                                                                    [u] {
                                                                      u->ShowShortCutKeys();
                                                                      for (const HWND window : top_windows(form_class))
                                                                        close(window);
                                                                    }},
                                                                   {"the switches",
                                                                    [u] {
                                                                      with_user(
                                                                          form_class, [u] { u->ShowCmdLineHelp(); },
                                                                          close);
                                                                    }},
                                                                   {"the system",
                                                                    [u] {
                                                                      with_user(
                                                                          form_class, [u] { u->ShowSysInfo(); }, close);
                                                                    }},
                                                                   {"the preview", [u] { preview(u, L"x", close); }}};
  const auto count = [](DWORD kind) { return static_cast<int>(GetGuiResources(GetCurrentProcess(), kind)); };
  for (const auto& [name, open] : windows) {
    for (int i = 0; i < 5; ++i) open();
    const int drawing = count(GR_GDIOBJECTS);
    const int user = count(GR_USEROBJECTS);
    for (int i = 0; i < openings; ++i) open();
    const int more_drawing = count(GR_GDIOBJECTS) - drawing;
    const int more_user = count(GR_USEROBJECTS) - user;
    check(more_drawing <= 2 && more_user <= 2, std::string("handles after opening ") + name + ": " +
                                                   std::to_string(more_drawing) + " and " + std::to_string(more_user) +
                                                   " more");
  }
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  enter_desktop();
  pictures = std::wstring(arguments[1]) + L"\\..\\screenshots\\" + (count > 3 ? arguments[3] : L"");
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    boxes_take_texts(u);
    const auto help = [u] { check_equal(S_OK, u->ShowCmdLineHelp(), "ShowCmdLineHelp"); };
    const auto system = [u] { check_equal(S_OK, u->ShowSysInfo(), "ShowSysInfo"); };
    check_equal(1, with_user(form_class, help, switches_are_explained), "windows of switches");
    check_equal(1, with_user(form_class, system, system_is_described), "windows of the system");
    keys_are_listed(u);
    if (count <= 3) {
      std::wstring pages;
      for (int i = 1; i <= 150; ++i)
        pages +=
            L"Line " + std::to_wstring(i) + L": caf\u00E9, \u041F\u0440\u0438\u0432\u0435\u0442, 12.50\t\u20AC\r\n";
      preview(u, pages, pages_are_shown);
      SetTimer(nullptr, 0, 100, &quit);
      preview(u, L"x", [](HWND) {});
      check(is_asked_to_quit(7), "a host that quits gets its call back and hears of it");
      unattended_reports_are_written(u);
      boxes_are_entered_once(u);
      nothing_is_left(u, count > 2 ? _wtoi(arguments[2]) : 20);
    }
    notices_stay(u);
  });
}
