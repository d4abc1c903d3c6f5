// A host whose windows stand beside those of another program. While it waits for one of the library's windows, and when
// that is closed, nobody else comes to the front. It has no manifest and does not scale.
#include <filesystem>

#include "../process.hpp"
#include "windows.hpp"

using namespace talutil::hosts;

namespace {

constexpr UINT dpi_changed = 0x02E0;

std::vector<std::string> events;  ///< What the host's window heard, in order.

LRESULT CALLBACK note(HWND window, UINT message, WPARAM what, LPARAM value) {
  if (message == WM_ENABLE) events.emplace_back(what != 0 ? "enabled" : "disabled");
  if (message == WM_ACTIVATE) events.emplace_back(LOWORD(what) != WA_INACTIVE ? "active" : "inactive");
  if (message == WM_ACTIVATEAPP) events.emplace_back(what != 0 ? "program to the front" : "program to the back");
  return DefWindowProcW(window, message, what, value);
}

HWND make_host_window() {
  WNDCLASSW description{};
  description.lpfnWndProc = &note;
  description.hInstance = GetModuleHandleW(nullptr);
  description.lpszClassName = L"ModalityHost";
  description.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_WINDOW + 1);
  RegisterClassW(&description);
  return CreateWindowW(L"ModalityHost", L"The host", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 300, 200, 500, 300, nullptr,
                       nullptr, nullptr, nullptr);
}

struct Shown {
  const char* name;
  bool is_preview;
  std::function<void(const User&)> show;
};

/// A program that has just begun may hear late that it had the focus, and then takes the front once more: the host is
/// in front when it has stayed there for a while.
void stay_in_front(HWND host) {
  constexpr int long_enough = 50;  // Looks.
  int looks = 0;
  check(messages_until([&] {
          if (GetForegroundWindow() != host) {
            SetForegroundWindow(host);
            looks = 0;
          }
          return ++looks > long_enough;
        }),
        "the host is in front");
}

void nobody_else_comes_to_the_front(const Shown& shown, HWND host) {
  stay_in_front(host);
  events.clear();
  const auto look = [&](HWND window) {
    const std::string what = shown.name;
    check(GetWindow(window, GW_OWNER) == host, what + ": the host owns it");
    check(IsWindowEnabled(host) == FALSE, what + ": the host waits");
    check(!has_style(window, GWL_STYLE, WS_MINIMIZEBOX) || shown.is_preview,
          what + ": it cannot be minimised into a corner");
    Sleep(100);
    PostMessageW(window, WM_CLOSE, 0, 0);
  };
  shown.show(look);
  handle_messages();
  std::string all;
  for (const std::string& event : events) all += event + ' ';
  check_equal("disabled inactive enabled active ", all, std::string(shown.name) + ": what the host heard");
  check(GetForegroundWindow() == host, std::string(shown.name) + ": the host is in front again");
}

/// The module that has a control's procedure.
std::filesystem::path module_of(HWND control) {
  HMODULE module = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<const wchar_t*>(GetWindowLongPtrW(control, GWLP_WNDPROC)), &module);
  std::array<wchar_t, MAX_PATH> path{};
  GetModuleFileNameW(module, path.data(), static_cast<DWORD>(path.size()));
  return path.data();
}

/// The window and everything on it grow to one and a half times their sizes.
void windows_follow_dots(HWND window) {
  const RECT before = place_of(window);
  const HWND part = controls(window).back();
  const LONG width = width_of(window);
  const LONG height_of_part = height_of(part);
  const RECT suggested{before.left, before.top, before.left + width * 3 / 2, before.top + height_of(window) * 3 / 2};
  SendMessageW(window, dpi_changed, MAKEWPARAM(144, 144), reinterpret_cast<LPARAM>(&suggested));
  check(width_of(window) > width * 5 / 4, "wider at 144 dots");
  check(height_of(part) >= height_of_part, "its parts as well");
}

void looks_are_those_of_the_system(_ORVUtils* u) {
  const auto look = [&](HWND window) {
    const auto lists = controls(window, L"SysListView32");
    if (check(!lists.empty(), "a table")) {
      const std::wstring module = module_of(lists[0]).wstring();
      check(module.find(L"common-controls") != std::wstring::npos, "the later controls, from " + narrow(module));
    }
    windows_follow_dots(window);
    PostMessageW(window, WM_CLOSE, 0, 0);
  };
  show(
      form_class, [u] { return u->ShowSysInfo(); }, look);
}

/// The highest of many new handles: it rises when handles are not given back. (Wine counts none of them.)
template <class Make, class Close>
std::uintptr_t highest_new(Make make, Close close) {
  std::array<HANDLE, 256> made{};
  for (HANDLE& handle : made) handle = make();
  std::uintptr_t highest = 0;
  for (const HANDLE handle : made) {
    highest = std::max(highest, reinterpret_cast<std::uintptr_t>(handle) & 0xFFFFU);
    close(handle);
  }
  return highest;
}

/// What windows of this process hold: handles of the system, drawing objects, windows and menus, memory.
struct Holdings {
  std::uintptr_t handles = highest_new([] { return CreateEventW(nullptr, FALSE, FALSE, nullptr); }, &CloseHandle);
  std::uintptr_t drawing = highest_new([] { return static_cast<HANDLE>(CreateSolidBrush(0)); }, &DeleteObject);
  std::uintptr_t windows = highest_new([] { return static_cast<HANDLE>(CreateMenu()); },
                                       [](HANDLE menu) { DestroyMenu(static_cast<HMENU>(menu)); });
  std::size_t bytes = bytes_in_use();
};

/// What a window takes is given back when it closes.
void opening_holds_nothing(const Shown& shown) {
  const auto close = [](HWND window) { PostMessageW(window, WM_CLOSE, 0, 0); };
  const auto open = [&](long times) {
    for (long i = 0; i < times; ++i) shown.show(close);
    handle_messages();
    return Holdings();
  };
  constexpr long enough_to_settle = 3;
  constexpr long openings = 10;
  constexpr std::size_t bytes_each = 400;  // Wine's labels do not free theirs; a lost window is larger.
  const Holdings before = open(enough_to_settle);
  const Holdings after = open(openings);
  std::printf("%s, %ld times: handles %zu to %zu, drawing objects %zu to %zu, windows %zu to %zu, bytes %zu to %zu\n",
              shown.name, openings, before.handles, after.handles, before.drawing, after.drawing, before.windows,
              after.windows, before.bytes, after.bytes);
  const std::string what = shown.name;
  constexpr std::uintptr_t a_few = 8;  // In steps of 1, those of the system in steps of 4.
  check(after.handles <= before.handles + 4 * a_few, what + ": handles");
  check(after.drawing <= before.drawing + a_few, what + ": drawing objects");
  check(after.windows <= before.windows + a_few, what + ": windows and menus");
  check(after.bytes <= before.bytes + 16384 + bytes_each * static_cast<std::size_t>(openings), what + ": memory");
}

}  // namespace

int wmain(int, wchar_t**) {
  enter_desktop();
  return run_checks([] {
    const Pointer<_ORVUtils> object = create_object();
    _ORVUtils* const u = object.get();
    const HWND host = make_host_window();
    const talutil::testing::Process other({"notepad.exe"});
    const auto is_in_front = [&](HWND window) { return GetForegroundWindow() == window; };
    check(wait_until([&] { return std::ranges::any_of(windows_of(other.number()), is_in_front); }),
          "another program is in front");
    const auto form = [](const std::function<HRESULT()>& open) {
      return [open](const User& user) { show(form_class, open, user); };
    };
    const Shown windows[] = {{"MyInputBox", false, [u](const User& user) { ask(u, {}, user); }},
                             {"ShowSysInfo", false, form([u] { return u->ShowSysInfo(); })},
                             {"ShowCmdLineHelp", false, form([u] { return u->ShowCmdLineHelp(); })},
                             {"the preview", true, [u](const User& user) { preview(u, L"A page", user); }}};
    for (const Shown& shown : windows) nobody_else_comes_to_the_front(shown, host);
    looks_are_those_of_the_system(u);
    for (const Shown& shown : windows) opening_holds_nothing(shown);
    const auto keys = [u](const User& user) {
      u->ShowShortCutKeys();
      const HWND window = top_windows(form_class).at(0);
      user(window);
      messages_until([window] { return IsWindow(window) == FALSE; });
    };
    opening_holds_nothing({"ShowShortCutKeys", false, keys});
    DestroyWindow(host);
  });
}
