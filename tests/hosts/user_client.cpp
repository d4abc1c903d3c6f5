// Runs a script whose windows need a user, and is that user: user_client SCRIPT.vbs KEYS..., for each window that the
// script opens, one after another, what is typed and pressed there. Fails, and ends the script, if a window does not
// come or the script does not end.
#include "windows.hpp"

using namespace talutil::hosts;

namespace {

/// The window of a process, other than the one before, that can be seen and takes input.
HWND next_window(DWORD process, HWND previous) {
  std::vector<HWND> windows;
  EnumWindows(&collect, reinterpret_cast<LPARAM>(&windows));
  for (const HWND window : windows) {
    DWORD owner = 0;
    GetWindowThreadProcessId(window, &owner);
    if (owner == process && IsWindowVisible(window) != FALSE && IsWindowEnabled(window) != FALSE)
      return window == previous ? nullptr : window;
  }
  return nullptr;
}

bool be_user(const PROCESS_INFORMATION& script, int count, wchar_t** keys) {
  HWND window = nullptr;
  const auto is_over = [&] { return WaitForSingleObject(script.hProcess, 0) == WAIT_OBJECT_0; };
  for (int i = 0; i < count; ++i) {
    const HWND previous = window;
    wait_until([&] { return (window = next_window(script.dwProcessId, previous)) != nullptr || is_over(); });
    const std::wstring text = keys[i];
    if (!check(window != nullptr, "a window for " + narrow(text))) return false;
    text_of(window);  // It is ready for keys once its thread answers messages.
    SetForegroundWindow(window);
    follow(window, std::string(text.begin(), text.end()));
  }
  return check(wait_until(is_over), "the script ends");
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  std::wstring command = L"cscript.exe //nologo \"" + std::wstring(arguments[1]) + L"\"";
  STARTUPINFOW start{};
  start.cb = sizeof start;
  PROCESS_INFORMATION script{};
  if (!check(CreateProcessW(nullptr, command.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &script) != 0,
             "a script host for " + narrow(command)))
    return 1;
  if (be_user(script, count - 2, arguments + 2)) return 0;
  TerminateProcess(script.hProcess, 1);
  return 1;
}
