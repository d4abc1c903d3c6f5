#pragma once

#include "client.hpp"

/// Windows that wait for a user: looked at, and used by keys and the mouse, from another thread.
namespace talutil::hosts {

inline std::wstring class_of(HWND window) {
  std::array<wchar_t, 64> name{};
  GetClassNameW(window, name.data(), static_cast<int>(name.size()));
  return name.data();
}

/// The text of a window or control as it is once that has handled what was sent before.
inline std::wstring text_of(HWND window) {
  std::wstring text(static_cast<std::size_t>(SendMessageW(window, WM_GETTEXTLENGTH, 0, 0)) + 1, L' ');
  const auto length = SendMessageW(window, WM_GETTEXT, text.size(), reinterpret_cast<LPARAM>(text.data()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

inline BOOL CALLBACK collect(HWND window, LPARAM list) {
  reinterpret_cast<std::vector<HWND>*>(list)->push_back(window);
  return TRUE;
}

/// The windows of a process without a parent that can be seen, or not.
inline std::vector<HWND> windows_of(DWORD process, bool is_visible = true) {
  std::vector<HWND> windows;
  EnumWindows(&collect, reinterpret_cast<LPARAM>(&windows));
  std::erase_if(windows, [&](HWND window) {
    DWORD owner = 0;
    GetWindowThreadProcessId(window, &owner);
    return owner != process || (IsWindowVisible(window) != FALSE) != is_visible;
  });
  return windows;
}

/// Those of this process that have a class.
inline std::vector<HWND> top_windows(const std::wstring& class_name, bool is_visible = true) {
  std::vector<HWND> windows = windows_of(GetCurrentProcessId(), is_visible);
  std::erase_if(windows, [&](HWND window) { return class_of(window) != class_name; });
  return windows;
}

/// The visible controls on a window, of a class or of all, in the order of the Tab key.
inline std::vector<HWND> controls(HWND window, const std::wstring& class_name = {}) {
  std::vector<HWND> found;
  EnumChildWindows(window, &collect, reinterpret_cast<LPARAM>(&found));
  std::erase_if(found, [&](HWND control) {
    return (!class_name.empty() && class_of(control) != class_name) ||
           (GetWindowLongW(control, GWL_STYLE) & WS_VISIBLE) == 0;
  });
  return found;
}

inline HWND button(HWND window, const std::wstring& caption) {
  for (const HWND control : controls(window, L"Button")) {
    if (text_of(control) == caption) return control;
  }
  check(false, "there is a button " + narrow(caption));
  return nullptr;
}

/// What a user reads on a window: its title and the texts of its controls, with bars between them.
inline std::wstring words_of(HWND window) {
  std::wstring words = text_of(window);
  for (const HWND control : controls(window)) {
    std::wstring text = text_of(control);
    std::erase(text, L'&');
    if (!text.empty()) words += L'|' + text;
  }
  return words;
}

inline bool has_style(HWND window, int kind, LONG style) { return (GetWindowLongW(window, kind) & style) == style; }

/// Waits for half a minute at most.
template <class Condition>
bool wait_until(Condition&& condition) {
  for (int i = 0; i < 3000; ++i) {
    if (condition()) return true;
    Sleep(10);
  }
  return false;
}

/// A desktop of this client's own for this thread. One that other programs have left may belong to a screen that is
/// gone.
inline void enter_desktop() {
  static const HDESK desktop = CreateDesktopW(L"TALUtilTest", nullptr, nullptr, 0, GENERIC_ALL, nullptr);
  check(SetThreadDesktop(desktop) != FALSE, "a desktop for this thread");
}

constexpr const wchar_t* dialog_class = L"#32770";

/// Does what waits for a user, who does something with each window of a class that is shown meanwhile, one after
/// another. Answers how many there were.
inline int with_user(const wchar_t* class_name, const std::function<void()>& action,
                     const std::function<void(HWND)>& user) {
  int seen = 0;
  std::atomic<bool> is_over = false;
  std::thread other([&] {
    enter_desktop();
    std::vector<HWND> windows;
    while (wait_until([&] { return is_over || !(windows = top_windows(class_name)).empty(); }) && !is_over) {
      ++seen;
      user(windows[0]);
      wait_until([&] { return is_over || IsWindowVisible(windows[0]) == FALSE; });
    }
  });
  action();
  is_over = true;
  other.join();
  return seen;
}

/// The folder of pictures and what their names begin with.
inline std::wstring pictures;

/// Asks the script that runs the tests for a picture of the screen, which it takes before it removes the file.
inline void take_picture(const std::wstring& name) {
  Sleep(250);  // Until it is painted, which the screen does not say.
  const std::wstring wanted = pictures + name + L".wanted";
  CloseHandle(CreateFileW(wanted.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr));
  check(wait_until([&] { return GetFileAttributesW(wanted.c_str()) == INVALID_FILE_ATTRIBUTES; }),
        "a picture is taken");
}

/// A key as the keyboard sends it, with other keys held down meanwhile.
inline void press(WORD key, std::initializer_list<WORD> held = {}) {
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

inline RECT place_of(HWND window) {
  RECT place{};
  GetWindowRect(window, &place);
  return place;
}
inline LONG width_of(HWND window) { return place_of(window).right - place_of(window).left; }
inline LONG height_of(HWND window) { return place_of(window).bottom - place_of(window).top; }

inline void click(HWND control) {
  const RECT place = place_of(control);
  SetCursorPos(static_cast<int>(place.left + place.right) / 2, static_cast<int>(place.top + place.bottom) / 2);
  INPUT input{};
  input.type = INPUT_MOUSE;
  for (const DWORD action : {MOUSEEVENTF_LEFTDOWN, MOUSEEVENTF_LEFTUP}) {
    input.mi.dwFlags = action;
    SendInput(1, &input, sizeof input);
  }
  Sleep(100);
}

/// Does what a script says: types its letters, and presses the keys in braces, held down with others:
/// "ann{CTRL+A}{TAB}".
/// "{click OK}" clicks on a button, "{picture NAME}" takes a picture.
inline void follow(HWND window, std::string_view script) {
  constexpr std::pair<std::string_view, WORD> names[] = {{"ENTER", VK_RETURN}, {"ESC", VK_ESCAPE}, {"TAB", VK_TAB},
                                                         {"CTRL", VK_CONTROL}, {"ALT", VK_MENU},   {"SHIFT", VK_SHIFT},
                                                         {"F4", VK_F4},        {";", VK_OEM_1},    {"\\", VK_OEM_5}};
  const auto code_of = [&](std::string_view name) {
    const auto* const found = std::ranges::find(names, name, [](const auto& row) { return row.first; });
    return found == std::end(names) ? static_cast<WORD>(std::toupper(name.at(0))) : found->second;
  };
  const auto wide_after = [](std::string_view text, std::size_t from) {
    return std::wstring(text.begin() + static_cast<std::ptrdiff_t>(from), text.end());
  };
  wait_until([window] { return GetForegroundWindow() == window; });
  while (!script.empty()) {
    const std::size_t end = script[0] == '{' ? script.find('}') : 0;
    const std::string_view step = end == 0 ? script.substr(0, 1) : script.substr(1, end - 1);
    script.remove_prefix(end + 1);
    const std::size_t plus = step.find('+');
    if (step.starts_with("click "))
      click(button(window, wide_after(step, 6)));
    else if (step.starts_with("picture "))
      take_picture(wide_after(step, 8));
    else if (plus == std::string_view::npos)
      press(code_of(step));
    else
      press(code_of(step.substr(plus + 1)), {code_of(step.substr(0, plus))});
  }
}

/// Handles messages, those of keys among them, until a condition holds.
template <class Condition>
bool messages_until(Condition&& condition) {
  return wait_until([&] {
    handle_messages();
    return condition();
  });
}

inline void close(HWND window) { SendMessageW(window, WM_CLOSE, 0, 0); }

constexpr const wchar_t* preview_class = L"TALUtilPreview";
constexpr const wchar_t* form_class = L"TALUtilForm";
using User = std::function<void(HWND)>;

/// What opens one window of a class that waits for its user.
inline void show(const wchar_t* window_class, const std::function<HRESULT()>& open, const User& user) {
  const auto action = [&] { check_equal(S_OK, open(), "what opens a window"); };
  check_equal(1, with_user(window_class, action, user), "windows of class " + narrow(window_class));
}

struct Question {
  std::wstring prompt = L"What is your name?";
  VARIANT_BOOL is_masked = VARIANT_FALSE;
  VARIANT_BOOL has_entry = VARIANT_TRUE;
  VARIANT_BOOL is_frameless = VARIANT_FALSE;
  VARIANT_BOOL is_unclosable = VARIANT_FALSE;
  LONG colour = 0xC0E0FF;
};

inline HRESULT ask(_ORVUtils* u, const Question& question, std::wstring& result) {
  Text answer;
  const HRESULT status =
      u->MyInputBox(Text(L"Who?"), Text(question.prompt), Flag{question.is_masked}, Flag{question.has_entry},
                    Flag{question.is_frameless}, Flag{question.is_unclosable}, Long{question.colour}, answer);
  result = answer.view();
  return status;
}

inline std::wstring ask(_ORVUtils* u, const Question& question, const User& user) {
  std::wstring result;
  show(
      form_class, [&] { return ask(u, question, result); }, user);
  return result;
}

/// Opens the preview of a text, the user doing what the function does; it must close the window.
inline void preview(_ORVUtils* u, std::wstring_view text, const User& user) {
  HostObject box({L"Text"}, [&](const Use& use) { return use.answer(text); });
  Value holder(&box);
  const auto open = [&] {
    return u->TextBoxPrintPreview(Short{100}, Short{1}, Text(L"Notes"), Text(L"C:\\exports\\"), holder);
  };
  show(preview_class, open, user);
  check(top_windows(preview_class).empty(), "the window is gone");
}

}  // namespace talutil::hosts
