// Runs a script whose windows need a user, and is that user: user.exe SCRIPT.vbs ACTION...
//
// An action is "type TEXT", which ends with the Return key, or "press KEY" (Return, Escape), each done at the next
// window that the script opens. Ends with 1, and ends the script, if such a window does not come or the script does not
// end.
#include <windows.h>

#include <cstdio>
#include <string>
#include <vector>

namespace {

constexpr DWORD patience_ms = 60'000;

/// Waits for the visible window that a process has opened last and that takes input; null if there is none in time.
struct Search {
  DWORD process;
  HWND found;
};

BOOL CALLBACK take_if_of_process(HWND window, LPARAM parameter) {
  auto* const search = reinterpret_cast<Search*>(parameter);
  DWORD process = 0;
  GetWindowThreadProcessId(window, &process);
  if (process != search->process || !IsWindowVisible(window) || !IsWindowEnabled(window)) return TRUE;
  search->found = window;
  return FALSE;
}

HWND wait_for_window(const PROCESS_INFORMATION& script, HWND previous) {
  constexpr DWORD pause_ms = 20;
  for (DWORD waited = 0; waited < patience_ms; waited += pause_ms) {
    Search search{script.dwProcessId, nullptr};
    EnumWindows(&take_if_of_process, reinterpret_cast<LPARAM>(&search));
    // A window is ready for keys once its thread waits for messages, which it says by answering one.
    if (search.found != nullptr && search.found != previous &&
        SendMessageTimeoutW(search.found, WM_NULL, 0, 0, SMTO_ABORTIFHUNG, patience_ms, nullptr) != 0) {
      return search.found;
    }
    if (WaitForSingleObject(script.hProcess, pause_ms) == WAIT_OBJECT_0) return nullptr;
  }
  return nullptr;
}

void send(WORD key, wchar_t character, DWORD flags) {
  INPUT input{};
  input.type = INPUT_KEYBOARD;
  input.ki.wVk = key;
  input.ki.wScan = character != 0 ? static_cast<WORD>(character) : static_cast<WORD>(MapVirtualKeyW(key, 0));
  input.ki.dwFlags = flags | (character != 0 ? KEYEVENTF_UNICODE : 0);
  SendInput(1, &input, sizeof input);
}

void press(WORD key, wchar_t character = 0) {
  send(key, character, 0);
  send(key, character, KEYEVENTF_KEYUP);
}

bool act(const std::wstring& action) {
  const std::wstring what = action.substr(action.find(L' ') + 1);
  if (action.starts_with(L"type ")) {
    for (const wchar_t character : what) press(0, character);
    press(VK_RETURN);
  } else if (action == L"press Return") {
    press(VK_RETURN);
  } else if (action == L"press Escape") {
    press(VK_ESCAPE);
  } else {
    std::fwprintf(stderr, L"user: \"%ls\" is no action; write type TEXT, press Return or press Escape\n",
                  action.c_str());
    return false;
  }
  return true;
}

bool be_user(const PROCESS_INFORMATION& script, const std::vector<std::wstring>& actions) {
  HWND window = nullptr;
  for (const std::wstring& action : actions) {
    window = wait_for_window(script, window);
    if (window == nullptr) {
      std::fwprintf(stderr, L"user: there was no window for \"%ls\"\n", action.c_str());
      return false;
    }
    SetForegroundWindow(window);
    if (!act(action)) return false;
  }
  if (WaitForSingleObject(script.hProcess, patience_ms) == WAIT_OBJECT_0) return true;
  std::fputs("user: the script did not end\n", stderr);
  return false;
}

}  // namespace

int wmain(int argc, wchar_t** argv) {
  if (argc < 2) {
    std::fputs("usage: user.exe SCRIPT.vbs ACTION...\n", stderr);
    return 2;
  }
  std::wstring command = L"cscript.exe //nologo \"" + std::wstring(argv[1]) + L"\"";
  STARTUPINFOW start{};
  start.cb = sizeof start;
  PROCESS_INFORMATION script{};
  if (!CreateProcessW(nullptr, command.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &start, &script)) {
    std::fwprintf(stderr, L"user: cannot start %ls: error %lu\n", command.c_str(), GetLastError());
    return 1;
  }
  const bool is_done = be_user(script, std::vector<std::wstring>(argv + 2, argv + argc));
  if (!is_done) TerminateProcess(script.hProcess, 1);
  return is_done ? 0 : 1;
}
