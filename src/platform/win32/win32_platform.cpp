#include "platform/win32/win32_platform.hpp"

#include <array>

#include "automation/run_time_error.hpp"
#include "platform/win32/dots.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/module_path.hpp"
#include "platform/win32/visual_styles.hpp"
#include "platform/win32/wait_pointer.hpp"

namespace talutil::win32 {

namespace {

/// The host application's title: the name of its program, without folder or extension.
Text host_title() {
  const Text path = module_path(nullptr);
  const Text name = path.substr(path.find_last_of(u'\\') + 1);
  return name.substr(0, name.find_last_of(u'.'));
}

constexpr float twips_per_inch = 1440;

/// Asks for the system's dots first: a device context connects the thread to the screen, which most scripts never need.
/// The two agree, because the system scales both directions alike since it has that function.
float twips_per_pixel(int capability) {
  if (const int dots = system_dots(); dots != 0) return twips_per_inch / static_cast<float>(dots);
  const Owned<kind::WindowDevice> screen = device_of(nullptr);
  if (!screen) raise(ErrorNumber::internal_error);
  return twips_per_inch / static_cast<float>(GetDeviceCaps(screen.get(), capability));
}

/// The owner of dialogs. It is created for the first dialog: until then, a script that never processes messages has no
/// window that could block broadcasts. Windows end with their thread; if this one has, it is created again.
class DialogOwner final : public HiddenWindow {
 public:
  explicit DialogOwner(TextView caption) : caption_(caption) {}

  [[nodiscard]] std::intptr_t handle() override {
    if (IsWindow(window_.get()) == FALSE) {
      static_cast<void>(window_.release());
      window_ = make();
    }
    return reinterpret_cast<std::intptr_t>(window_.get());
  }

 private:
  /// Uses one of the system's window classes, so that its window procedure exists as long as the window does.
  [[nodiscard]] Owned<kind::Window> make() const {
    Owned<kind::Window> window(
        CreateWindowExW(0, L"Static", wide(caption_), WS_POPUP, 0, 0, 0, 0, nullptr, nullptr, nullptr, nullptr));
    if (!window) raise(ErrorNumber::internal_error);
    return window;
  }

  Text caption_;
  Owned<kind::Window> window_;
};

/// A setting of the user's locale; empty if there is none.
Text user_setting(LCTYPE setting) {
  std::array<wchar_t, 16> text{};
  const int length = GetLocaleInfoW(LOCALE_USER_DEFAULT, setting, text.data(), static_cast<int>(text.size()));
  return length > 1 ? Text(view(text.data(), static_cast<std::size_t>(length) - 1)) : Text();
}

/// The first character of such a setting; `otherwise` if it is empty.
char16_t user_character(LCTYPE setting, char16_t otherwise) {
  const Text text = user_setting(setting);
  return text.empty() ? otherwise : text.front();
}

}  // namespace

MessageAnswer Win32MessageBoxes::show(TextView text, MessageButtons buttons, TextView title) {
  const Text caption = title.empty() ? host_title() : Text(title);
  const HWND owner = GetActiveWindow();
  UINT style = (buttons == MessageButtons::ok ? MB_OK : MB_YESNO) | MB_TASKMODAL;
  // Scripts have no window whose place in front the box could take.
  if (owner == nullptr) style |= MB_SETFOREGROUND;
  const VisualStyles styles;
  switch (MessageBoxW(owner, wide(Text(text)), wide(caption), style)) {
    case IDOK:
      return MessageAnswer::ok;
    case IDYES:
      return MessageAnswer::yes;
    case IDNO:
      return MessageAnswer::no;
    default:
      return buttons == MessageButtons::ok ? MessageAnswer::cancel : MessageAnswer::no;
  }
}

float Win32Screen::twips_per_pixel_x() { return twips_per_pixel(LOGPIXELSX); }

float Win32Screen::twips_per_pixel_y() { return twips_per_pixel(LOGPIXELSY); }

void Win32Screen::reset_pointer() { SetCursor(LoadCursorW(nullptr, IDC_ARROW)); }

Text Win32Computer::name() {
  std::array<wchar_t, MAX_COMPUTERNAME_LENGTH + 1> name{};
  auto length = static_cast<DWORD>(name.size());
  return GetComputerNameW(name.data(), &length) != 0 ? Text(view(name.data(), length)) : Text();
}

Locale Win32Computer::locale() {
  if (locale_) return *locale_;
  Locale result;
  result.decimal_separator = user_character(LOCALE_SDECIMAL, result.decimal_separator);
  result.thousands_separator = user_character(LOCALE_STHOUSAND, result.thousands_separator);
  result.set_currency(user_setting(LOCALE_SCURRENCY));
  locale_ = result;
  return result;
}

Date Win32Clock::now() {
  SYSTEMTIME now;
  GetLocalTime(&now);
  return date_from_parts({now.wYear, now.wMonth, now.wDay, now.wHour, now.wMinute, now.wSecond}).value_or(Date{});
}

std::int32_t Win32Clock::year() {
  // Found anew every second: the system takes longer to find the local time than a short member runs, while its counter
  // is only a look into memory.
  constexpr std::uint64_t milliseconds = 1000;
  constexpr int year_bits = 16;
  const std::uint64_t second = GetTickCount64() / milliseconds + 1;
  std::uint64_t known = known_year_.load(std::memory_order_relaxed);
  if (known >> year_bits != second) {
    SYSTEMTIME now;
    GetLocalTime(&now);
    known = second << year_bits | now.wYear;
    known_year_.store(known, std::memory_order_relaxed);
  }
  return static_cast<std::uint16_t>(known);
}

std::unique_ptr<HiddenWindow> Win32FormWindows::make_hidden(TextView caption) {
  return std::make_unique<DialogOwner>(caption);
}

std::unique_ptr<Waiting> Win32FormWindows::show_hourglass() { return std::make_unique<WaitPointer>(); }

bool Win32MessagePump::handle_waiting() {
  MSG message;
  while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != 0) {
    if (message.message == WM_QUIT) {
      // The message was meant for the host's loop.
      PostQuitMessage(static_cast<int>(message.wParam));
      return false;
    }
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
  return true;
}

bool Win32MessagePump::wait_and_handle() {
  MsgWaitForMultipleObjectsEx(0, nullptr, INFINITE, QS_ALLINPUT, MWMO_INPUTAVAILABLE);
  return handle_waiting();
}

}  // namespace talutil::win32
