// A client that opens the input box and the information windows, and uses them by keys and the mouse as a user does:
// information_client FOLDER [OPENINGS [PICTURES]]. With PICTURES, a prefix of their names, it takes pictures alone.
#include <algorithm>

#include "boxes.hpp"
// After windows.h.
#include <commctrl.h>
#include <richedit.h>

using namespace talutil::hosts;

namespace {

constexpr VARIANT_BOOL yes = VARIANT_TRUE;
constexpr VARIANT_BOOL no = VARIANT_FALSE;
constexpr LONG usual_colour = 0xC0E0FF;

/// A key as the keyboard sends it, with other keys held down meanwhile.
void press(WORD key, std::initializer_list<WORD> held = {}) {
  const auto send = [](WORD code, DWORD flags) {
    INPUT input{};
    input.type = INPUT_KEYBOARD;
    input.ki.wVk = code;
    input.ki.wScan = static_cast<WORD>(MapVirtualKeyW(code, 0));
    input.ki.dwFlags = flags;
    SendInput(1, &input, sizeof input);
  };
  for (const WORD code : held) send(code, 0);
  send(key, 0);
  send(key, KEYEVENTF_KEYUP);
  for (const WORD code : held) send(code, KEYEVENTF_KEYUP);
  Sleep(60);
}

void type(std::string_view letters) {
  for (const char letter : letters) press(static_cast<WORD>(letter >= 'a' ? letter - 'a' + 'A' : letter));
}

void click(HWND control) {
  RECT place{};
  GetWindowRect(control, &place);
  SetCursorPos(static_cast<int>(place.left + place.right) / 2, static_cast<int>(place.top + place.bottom) / 2);
  INPUT input{};
  input.type = INPUT_MOUSE;
  for (const DWORD button : {MOUSEEVENTF_LEFTDOWN, MOUSEEVENTF_LEFTUP}) {
    input.mi.dwFlags = button;
    SendInput(1, &input, sizeof input);
  }
  Sleep(100);
}

/// The visible controls of a class, in the order of the Tab key.
std::vector<HWND> controls(HWND window, const std::wstring& class_name) {
  std::vector<HWND> found;
  EnumChildWindows(window, &collect, reinterpret_cast<LPARAM>(&found));
  std::erase_if(found, [&](HWND control) {
    return describe(control).class_name != class_name || (GetWindowLongW(control, GWL_STYLE) & WS_VISIBLE) == 0;
  });
  return found;
}

HWND button(HWND window, const std::wstring& caption) {
  for (const HWND control : controls(window, L"Button")) {
    if (describe(control).text == caption) return control;
  }
  check(false, "there is a button " + narrow(caption));
  return nullptr;
}

bool has_style(HWND window, int kind, LONG style) { return (GetWindowLongW(window, kind) & style) == style; }

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

struct Session {
  _ORVUtils* u;
  const Desktop& desktop;
  std::wstring pictures;

  void picture(const std::wstring& name) const {
    Sleep(250);  // Until it is painted.
    take_picture(pictures.substr(0, pictures.rfind(L'|')), (pictures.substr(pictures.rfind(L'|') + 1) + name).c_str());
  }
};

/// Does what waits for a user, who does something with the window and must close it.
template <class Action, class User>
void with_window(const Session& session, Action&& action, User&& user) {
  bool is_seen = false;
  std::thread watcher([&] {
    session.desktop.enter();
    const HWND window = wait_for_window(L"TALUtilForm");
    if (window == nullptr) return;
    is_seen = true;
    user(window);
  });
  action();
  watcher.join();
  check(is_seen, "a window was shown");
}

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

template <class User>
std::wstring ask(const Session& session, const Question& question, User&& user) {
  std::wstring result;
  with_window(
      session, [&] { check_equal(S_OK, ask(session.u, question, result), "MyInputBox"); }, user);
  return result;
}

void boxes_take_texts(const Session& session) {
  const auto enter = [](HWND) { press(VK_RETURN); };
  check_equal(L"ann",
              ask(session, {},
                  [&](HWND window) {
                    check_equal(L"Who?", text_of(window), "the caption");
                    check(has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST), "it is on top");
                    check(has_style(window, GWL_STYLE, WS_CAPTION), "it has a frame");
                    const auto labels = controls(window, L"Static");
                    const auto entries = controls(window, L"Edit");
                    if (!check(labels.size() == 1 && entries.size() == 1, "a label and an entry")) return;
                    check_equal(L"What is your name?", text_of(labels[0]), "the prompt");
                    check(GetWindow(labels[0], GW_HWNDNEXT) == entries[0], "the label names the entry");
                    type("ann");
                    session.picture(L"input-box");
                    press(VK_RETURN);
                  }),
              "what was typed, with Enter");
  check_equal(L"SECRET",
              ask(session, {.is_masked = yes},
                  [&](HWND window) {
                    press('S', {VK_SHIFT});
                    for (const char letter : {'E', 'C', 'R', 'E', 'T'}) press(letter, {VK_SHIFT});
                    check(has_style(controls(window, L"Edit").at(0), GWL_STYLE, ES_PASSWORD), "masked");
                    session.picture(L"input-box-masked");
                    press(VK_TAB);
                    press(VK_SPACE);
                  }),
              "a masked text, with Tab and the button");
  check_equal(L"",
              ask(session, {},
                  [&](HWND window) {
                    type("gone");
                    PostMessageW(window, WM_SYSCOMMAND, SC_CLOSE, 0);
                  }),
              "a box that was closed");
  check_equal(L"",
              ask(session, {.has_entry = no, .colour = 0x400000},
                  [&](HWND window) {
                    check(controls(window, L"Edit").empty(), "no entry");
                    session.picture(L"input-box-no-entry");
                    click(button(window, L"OK"));
                  }),
              "a box without an entry, with a click");
  check_equal(L"x",
              ask(session, {},
                  [](HWND) {
                    type("x");
                    press(VK_RETURN);
                  }),
              "Enter");
  check_equal(L"", ask(session, {}, [](HWND) { press(VK_ESCAPE); }), "Esc");

  // The box grows with its prompt, within the screen.
  LONG usual_height = 0;
  const auto height = [](HWND window) {
    RECT place{};
    GetWindowRect(window, &place);
    check(place.top >= 0 && place.bottom <= GetSystemMetrics(SM_CYSCREEN), "it stands on the screen");
    return place.bottom - place.top;
  };
  ask(session, {}, [&](HWND window) {
    usual_height = height(window);
    press(VK_RETURN);
  });
  ask(session,
      {.prompt = L"one\r\ntwo\nthree\r\nfour\r\n\u05E9\u05DC\u05D5\u05DD \u4F60\u597D\r\n" + std::wstring(300, L'w')},
      [&](HWND window) {
        check(height(window) > usual_height + 40, "a long prompt");
        session.picture(L"input-box-long");
        press(VK_RETURN);
      });
  std::wstring endless;
  while (endless.size() < 65536) endless += L"A line of a prompt that nobody reads to its end.\n";
  ask(session, {.prompt = endless + L'\0' + L"after"}, [&](HWND window) {
    check(height(window) > 3 * usual_height, "an endless prompt");
    session.picture(L"input-box-endless");
    press(VK_RETURN);
  });
  ask(session, {.prompt = L"", .colour = static_cast<LONG>(0x8000000F)}, enter);
  ask(session, {.colour = static_cast<LONG>(0x800000FF)}, enter);
  constexpr const wchar_t* formatted = L"{\\rtf1 as it was written}";
  ask(session, {.prompt = formatted, .colour = -1}, [&](HWND window) {
    check_equal(formatted, text_of(controls(window, L"Static").at(0)), "a prompt that looks like rich text");
    press(VK_RETURN);
  });
}

Session* timer_session = nullptr;
HRESULT inner_status = S_OK;

void CALLBACK ask_again(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  std::wstring result;
  inner_status = ask(timer_session->u, {.prompt = L"Again?"}, result);
}

void CALLBACK quit(HWND, UINT, UINT_PTR timer, DWORD) {
  KillTimer(nullptr, timer);
  PostQuitMessage(7);
}

void boxes_are_entered_once(Session& session) {
  timer_session = &session;
  SetTimer(nullptr, 0, 100, &ask_again);
  const std::wstring answer = ask(session, {}, [&](HWND window) {
    Sleep(400);
    check_equal(L"What is your name?", text_of(controls(window, L"Static").at(0)), "the prompt stays");
    type("a");
    press(VK_RETURN);
  });
  check_equal(run_time_error(400), inner_status, "a box within a box");
  check_equal(L"a", answer, "the answer of the first");

  // A host that quits gets its box back, and hears of it in its own loop.
  SetTimer(nullptr, 0, 1000, &quit);
  ask(session, {}, [](HWND) {});
  MSG message{};
  check(PeekMessageW(&message, nullptr, WM_QUIT, WM_QUIT, PM_REMOVE) != FALSE && message.wParam == 7, "it quits");

  // A window of the host that goes away takes its box with it.
  const HWND owner = CreateWindowW(L"Static", L"host", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 0, 0, 200, 100, nullptr,
                                   nullptr, nullptr, nullptr);
  SetForegroundWindow(owner);
  bool was_enabled = true;
  ask(session, {}, [&](HWND) {
    Sleep(100);
    was_enabled = IsWindowEnabled(owner) != FALSE;
    press(VK_RETURN);
  });
  check(!was_enabled && IsWindowEnabled(owner) != FALSE, "the host's window waits");
  ask(session, {}, [&](HWND) {
    Sleep(100);
    SendMessageW(owner, WM_CLOSE, 0, 0);
  });
  check(IsWindow(owner) == FALSE, "the host's window is gone, and the call has returned");
}

void handle_messages(int milliseconds) {
  const DWORD end = GetTickCount() + static_cast<DWORD>(milliseconds);
  do {
    MSG message;
    while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != FALSE) {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
    Sleep(5);
  } while (GetTickCount() < end);
}

std::vector<HWND> forms() {
  return top_windows(
      [](HWND window) { return describe(window).class_name == L"TALUtilForm" && IsWindowVisible(window) != FALSE; });
}

/// Last, since the form has no frame afterwards.
void notices_stay(const Session& session) {
  ask(session, {}, [](HWND) {
    type("kept");
    press(VK_RETURN);
  });
  std::wstring result;
  Question notice{.prompt = L"Please wait...", .has_entry = no, .is_frameless = yes, .is_unclosable = yes};
  check_equal(S_OK, ask(session.u, notice, result), "a notice");
  check_equal(L"kept", result, "the result of the last use");
  const auto windows = forms();
  if (!check_equal(std::size_t{1}, windows.size(), "the notice is there")) return;
  const HWND window = windows[0];
  check(!has_style(window, GWL_STYLE, WS_CAPTION) && has_style(window, GWL_EXSTYLE, WS_EX_TOPMOST),
        "frameless, on top");
  check(controls(window, L"Button").empty() && controls(window, L"Edit").empty(), "nothing but its text");
  const HDC device = GetDC(window);
  check_equal(static_cast<COLORREF>(usual_colour), GetPixel(device, 2, 2), "it is painted without a message handled");
  ReleaseDC(window, device);
  session.picture(L"notice");
  notice.prompt = L"Nearly done";
  check_equal(S_OK, ask(session.u, notice, result), "another notice");
  check(forms() == windows && text_of(controls(window, L"Static").at(0)) == L"Nearly done", "the same window");
  check_equal(run_time_error(400), ask(session.u, {}, result), "a question meanwhile");
  press(VK_ESCAPE);
  handle_messages(100);
  check_equal(std::size_t{1}, forms().size(), "Esc does not close it");
  session.u->put_DebugMode(0);
  session.u->Terminate();
  check(forms().empty(), "Terminate does");
  ask(session, {}, [&](HWND box) {
    check(!has_style(box, GWL_STYLE, WS_CAPTION), "the form stays without a frame");
    press(VK_RETURN);
  });
}

void keys_are_listed(const Session& session) {
  check_equal(S_OK, session.u->ShowShortCutKeys(), "ShowShortCutKeys");
  check_equal(S_OK, session.u->ShowShortCutKeys(), "again");
  const auto windows = forms();
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
  check_equal(L"Courier New", std::wstring(format.szFaceName), "the font");
  check(format.yHeight == 240 && (format.dwEffects & (CFE_BOLD | CFE_UNDERLINE)) == (CFE_BOLD | CFE_UNDERLINE),
        "headings of 12 points, bold and underlined");
  SendMessageW(list, EM_SETSEL, 0, 0);
  handle_messages(300);
  session.picture(L"shortcut-keys");

  check(GetFocus() == button(window, L"Print"), "the first button has the focus");
  press(VK_TAB);
  handle_messages(100);
  check(GetFocus() == button(window, L"Cross"), "Tab reaches the second");
  press(VK_SPACE);
  handle_messages(100);
  check(IsWindow(window) != FALSE, "the cross button closes nothing");
  press('K', {VK_MENU});
  handle_messages(100);
  check(GetFocus() == list, "Alt and a letter reach the list");
  press(VK_TAB);
  handle_messages(100);
  check(GetFocus() == button(window, L"Print"), "and Tab leaves it");
  // There is no printer: the user is told, the host is not.
  const SeenBox box = act_and_watch(
      session.desktop, [](HWND message) { PostMessageW(message, WM_COMMAND, IDOK, 0); },
      [&] {
        press(VK_SPACE);
        handle_messages(1500);
      });
  check(box.seen, "a box tells that nothing can be printed");
  SetWindowPos(window, nullptr, 0, 0, 700, 600, SWP_NOMOVE | SWP_NOZORDER);
  RECT inside{};
  GetClientRect(window, &inside);
  RECT place{};
  GetWindowRect(list, &place);
  MapWindowPoints(nullptr, window, reinterpret_cast<POINT*>(&place), 2);
  check(inside.right - place.right < 30 && inside.bottom - place.bottom < 30, "the list grows with its window");
  SetFocus(list);
  press(VK_ESCAPE);
  handle_messages(100);
  check(forms().empty(), "Esc closes it");
}

void switches_are_explained(const Session& session) {
  with_window(
      session, [&] { check_equal(S_OK, session.u->ShowCmdLineHelp(), "ShowCmdLineHelp"); },
      [&](HWND window) {
        const HWND list = controls(window, L"SysListView32").at(0);
        check_equal(9, static_cast<int>(SendMessageW(list, LVM_GETITEMCOUNT, 0, 0)), "rows below the heading");
        const std::wstring examples = text_of(controls(window, L"RichEdit20W").at(0));
        check(
            examples.starts_with(L"Examples on how run ORV with command line options,\r\n\"C:\\Program Files\\TAL\\") &&
                examples.ends_with(L"\" SINEMP 120000002:1"),
            "the examples: " + narrow(examples));
        session.picture(L"command-line-help");
        press('A', {VK_CONTROL});
        press('C', {VK_CONTROL});
        const std::wstring copied = clipboard();
        check(copied.starts_with(L"RM\tStarts ORV with no booking screen\r\n") &&
                  copied.find(L"\r\n\t  Preload the requested time out time if specified\r\n") != std::wstring::npos,
              "copied rows: " + narrow(copied.substr(0, 60)));
        press(VK_ESCAPE);
      });
}

void system_is_described(const Session& session) {
  with_window(
      session, [&] { check_equal(S_OK, session.u->ShowSysInfo(), "ShowSysInfo"); },
      [&](HWND window) {
        session.picture(L"system-drives");
        for (const wchar_t* const tab : {L"system-memory", L"system-processor", L"system-operating-system"}) {
          press(VK_TAB, {VK_CONTROL});
          session.picture(tab);
        }
        click(button(window, L"&Copy as text"));
        const std::wstring copied = clipboard();
        for (const wchar_t* const part : {L"Drives\r\n", L"  C:", L"Memory\r\n", L"Processor\r\n", L"Computer"}) {
          check(copied.find(part) != std::wstring::npos, "the copy has " + narrow(part));
        }
        press(VK_TAB, {VK_CONTROL});
        press('F', {VK_MENU});
        type("c");
        press(VK_OEM_1, {VK_SHIFT});
        press(VK_OEM_5);
        type("windows");
        const auto before = controls(window, L"SysListView32").at(0);
        check_equal(0, static_cast<int>(SendMessageW(before, LVM_GETITEMCOUNT, 0, 0)), "no details yet");
        press(VK_RETURN);
        Sleep(500);
        check_equal(L"c:\\windows", text_of(controls(window, L"Edit").at(0)), "the path as it was typed");
        check(SendMessageW(before, LVM_GETITEMCOUNT, 0, 0) >= 8, "the details of a folder");
        session.picture(L"system-folder");
        click(button(window, L"&Refresh"));
        press(VK_ESCAPE);
      });
}

/// Opens and closes each window, and looks at what is left of it.
void nothing_is_left(const Session& session, int openings) {
  const auto close = [](HWND window) { PostMessageW(window, WM_CLOSE, 0, 0); };
  const std::pair<const char*, std::function<void()>> windows[] = {
      {"the input box", [&] { ask(session, {}, close); }},
      {"the list of keys",
       [&] {
         session.u->ShowShortCutKeys();
         for (const HWND window : forms()) SendMessageW(window, WM_CLOSE, 0, 0);
       }},
      {"the switches",
       [&] {
         with_window(
             session, [&] { session.u->ShowCmdLineHelp(); }, close);
       }},
      {"the system", [&] {
         with_window(
             session, [&] { session.u->ShowSysInfo(); }, close);
       }}};
  for (const auto& [name, open] : windows) {
    for (int i = 0; i < 5; ++i) open();
    const Handles before;
    for (int i = 0; i < openings; ++i) open();
    const Handles after;
    check(after.drawing <= before.drawing + 2 && after.windows <= before.windows + 2,
          std::string("handles after opening ") + name + ": " + std::to_string(after.drawing - before.drawing) +
              " and " + std::to_string(after.windows - before.windows) + " more");
  }
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  const Desktop desktop;
  return run_checks([&] {
    const Pointer<_ORVUtils> object = create_object();
    Session session{object.get(), desktop,
                    std::wstring(arguments[1]) + L"\\..\\screenshots|" + (count > 3 ? arguments[3] : L"")};
    boxes_take_texts(session);
    switches_are_explained(session);
    system_is_described(session);
    keys_are_listed(session);
    if (count <= 3) {
      boxes_are_entered_once(session);
      nothing_is_left(session, count > 2 ? _wtoi(arguments[2]) : 20);
    }
    notices_stay(session);
  });
}
