#pragma once

#include <atomic>
#include <thread>

#include "client.hpp"

/// Windows that wait for a user, looked at and used from another thread.
namespace talutil::hosts {

/// A control of a host with one property that is a text.
class TextObject final : public NamelessObject {
 public:
  TextObject(const wchar_t* name, std::wstring text) : name_(name), text_(std::move(text)) {}
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* name, UINT, LCID, DISPID* ids) override {
    *ids = lstrcmpiW(*name, name_) == 0 ? 1 : DISPID_UNKNOWN;
    return *ids == 1 ? S_OK : DISP_E_UNKNOWNNAME;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID, REFIID, LCID, WORD flags, DISPPARAMS*, VARIANT* result, EXCEPINFO*,
                                   UINT*) override {
    if ((flags & DISPATCH_PROPERTYGET) == 0) return DISP_E_MEMBERNOTFOUND;
    V_VT(result) = VT_BSTR;
    V_BSTR(result) = SysAllocString(text_.c_str());
    return S_OK;
  }

 private:
  const wchar_t* name_;
  std::wstring text_;
};

struct WindowText {
  std::wstring class_name;
  std::wstring text;
};

inline WindowText describe(HWND window) {
  std::array<wchar_t, 256> text{};
  std::array<wchar_t, 64> name{};
  GetWindowTextW(window, text.data(), static_cast<int>(text.size()));
  GetClassNameW(window, name.data(), static_cast<int>(name.size()));
  return {name.data(), text.data()};
}

inline BOOL CALLBACK collect(HWND window, LPARAM list) {
  reinterpret_cast<std::vector<HWND>*>(list)->push_back(window);
  return TRUE;
}

/// The windows of this process without a parent that the condition holds for.
template <class Condition>
std::vector<HWND> top_windows(Condition&& condition) {
  std::vector<HWND> windows;
  EnumWindows(&collect, reinterpret_cast<LPARAM>(&windows));
  std::erase_if(windows, [&](HWND window) {
    DWORD process = 0;
    GetWindowThreadProcessId(window, &process);
    return process != GetCurrentProcessId() || !condition(window);
  });
  return windows;
}

/// Asks the script that runs the tests for a picture of the screen, which it takes before it removes the file.
inline void take_picture(const std::wstring& folder, const wchar_t* name) {
  const std::wstring wanted = folder + L"\\" + name + L".wanted";
  CloseHandle(CreateFileW(wanted.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr));
  for (int i = 0; i < 100 && GetFileAttributesW(wanted.c_str()) != INVALID_FILE_ATTRIBUTES; ++i) Sleep(100);
  check_equal(INVALID_FILE_ATTRIBUTES, GetFileAttributesW(wanted.c_str()), "a picture was taken");
}

/// The window of a class of the library's, once it is shown; null when it is not within half a minute.
inline HWND wait_for_window(const std::wstring& class_name) {
  for (int i = 0; i < 3000; ++i) {
    const auto windows = top_windows(
        [&](HWND window) { return describe(window).class_name == class_name && IsWindowVisible(window) != FALSE; });
    if (!windows.empty()) return windows[0];
    Sleep(10);
  }
  return nullptr;
}

/// The text of a window or control as it is once that has handled what was sent before.
inline std::wstring text_of(HWND window) {
  std::wstring text(static_cast<std::size_t>(SendMessageW(window, WM_GETTEXTLENGTH, 0, 0)) + 1, L' ');
  const auto length = SendMessageW(window, WM_GETTEXT, text.size(), reinterpret_cast<LPARAM>(text.data()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

/// How many drawing and window handles this process has.
struct Handles {
  DWORD drawing = GetGuiResources(GetCurrentProcess(), GR_GDIOBJECTS);
  DWORD windows = GetGuiResources(GetCurrentProcess(), GR_USEROBJECTS);
};

/// What a user sees of a box before answering it.
struct SeenBox {
  bool seen = false;
  std::wstring title;
  std::vector<WindowText> parts;
};

inline HWND wait_for_box(const std::atomic<bool>& is_over) {
  for (int i = 0; i < 200 && !is_over; ++i) {
    const std::vector<HWND> boxes = top_windows(
        [](HWND window) { return describe(window).class_name == L"#32770" && IsWindowVisible(window) != FALSE; });
    if (!boxes.empty()) return boxes[0];
    Sleep(50);
  }
  return nullptr;
}

inline SeenBox look_at_box(HWND box) {
  SeenBox result{true, describe(box).text, {}};
  std::vector<HWND> children;
  EnumChildWindows(box, &collect, reinterpret_cast<LPARAM>(&children));
  for (const HWND child : children) {
    const auto style = static_cast<DWORD>(GetWindowLongW(child, GWL_STYLE));
    if ((style & WS_VISIBLE) != 0) result.parts.push_back(describe(child));
  }
  return result;
}

/// A desktop of this client's own. One that other programs have left may belong to a screen that is gone.
class Desktop {
 public:
  Desktop() : desktop_(CreateDesktopW(L"TALUtilTest", nullptr, nullptr, 0, GENERIC_ALL, nullptr)) { enter(); }
  Desktop(const Desktop&) = delete;
  Desktop& operator=(const Desktop&) = delete;
  void enter() const { check(SetThreadDesktop(desktop_) != FALSE, "a desktop for this thread"); }

 private:
  HDESK desktop_;
};

/// Does something that waits for a user, while another thread looks at the box and answers it.
template <class Answer, class Action>
SeenBox act_and_watch(const Desktop& desktop, Answer&& answer, Action&& action) {
  SeenBox seen;
  std::atomic<bool> is_over = false;
  std::thread watcher([&] {
    desktop.enter();
    const HWND box = wait_for_box(is_over);
    if (box == nullptr) return;
    seen = look_at_box(box);
    answer(box);
  });
  action();
  is_over = true;
  watcher.join();
  return seen;
}

}  // namespace talutil::hosts
