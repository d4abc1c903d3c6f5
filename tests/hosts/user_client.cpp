// Runs a script whose windows need a user, and is that user: user_client SCRIPT.vbs KEYS..., for each window that the
// script opens, one after another, what is typed and pressed there. Fails, and ends the script, if a window does not
// come or the script does not end.
#include "../process.hpp"
#include "windows.hpp"

using namespace talutil::hosts;
using talutil::testing::Process;

namespace {

/// The window of a process, other than the one before, that can be seen and takes input.
HWND next_window(const Process& process, HWND previous) {
  std::vector<HWND> windows = windows_of(process.number());
  std::erase_if(windows, [](HWND window) { return IsWindowEnabled(window) == FALSE; });
  return windows.empty() || windows[0] == previous ? nullptr : windows[0];
}

bool be_user(const Process& script, std::span<wchar_t*> keys) {
  HWND window = nullptr;
  for (const std::wstring text : keys) {
    const HWND previous = window;
    wait_until([&] { return (window = next_window(script, previous)) != nullptr || !script.runs(); });
    if (!check(window != nullptr, "a window for " + narrow(text))) return false;
    text_of(window);  // It is ready for keys once its thread answers messages.
    SetForegroundWindow(window);
    follow(window, std::string(text.begin(), text.end()));
  }
  return check(wait_until([&] { return !script.runs(); }), "the script ends");
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  const std::span words(arguments, static_cast<std::size_t>(count));
  const Process script({"cscript.exe", "//nologo", std::filesystem::path(words[1]).string()});
  return be_user(script, words.subspan(2)) ? 0 : 1;
}
