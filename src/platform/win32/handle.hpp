#pragma once

#include <array>
#include <utility>

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// A handle that the destructor releases. The policy defines a kind of handle: its type, how to release it, and the
/// empty value unless that is null. A policy with data also knows where the handle came from.
template <class Policy>
class Owned {
 public:
  using Handle = typename Policy::Handle;

  explicit Owned(Handle handle = none(), Policy policy = {}) noexcept : handle_(handle), policy_(policy) {}
  Owned(Owned&& other) noexcept : handle_(other.release()), policy_(other.policy_) {}
  Owned& operator=(Owned&& other) noexcept {
    if (this == &other) return *this;
    reset();
    policy_ = other.policy_;
    handle_ = other.release();
    return *this;
  }
  ~Owned() { reset(); }

  [[nodiscard]] Handle get() const noexcept { return handle_; }
  [[nodiscard]] explicit operator bool() const noexcept { return handle_ != none(); }
  [[nodiscard]] Handle release() noexcept { return std::exchange(handle_, none()); }

  /// For functions that return a handle through an argument.
  [[nodiscard]] Handle* receive() noexcept {
    reset();
    return &handle_;
  }

  /// Preserves the system's last error, which is often read only after handles have been released.
  void reset(Handle handle = none()) noexcept {
    const Handle before = std::exchange(handle_, handle);
    if (before == none()) return;
    const DWORD reason = GetLastError();
    policy_.close(before);
    SetLastError(reason);
  }

 private:
  static Handle none() noexcept {
    if constexpr (requires { Policy::none(); })
      return Policy::none();
    else
      return {};
  }

  Handle handle_;
  [[no_unique_address]] Policy policy_;
};

/// The kinds of handles. Those that need an extra header are defined where they are used.
namespace kind {

struct KernelObject {
  using Handle = HANDLE;
  static void close(HANDLE object) noexcept { CloseHandle(object); }
};

struct File : KernelObject {
  static HANDLE none() noexcept { return INVALID_HANDLE_VALUE; }
};

struct FileSearch {
  using Handle = HANDLE;
  static HANDLE none() noexcept { return INVALID_HANDLE_VALUE; }
  static void close(HANDLE search) noexcept { FindClose(search); }
};

struct RegistryKey {
  using Handle = HKEY;
  static void close(HKEY key) noexcept { RegCloseKey(key); }
};

struct GlobalMemory {
  using Handle = HGLOBAL;
  static void close(HGLOBAL block) noexcept { GlobalFree(block); }
};

struct LockedMemory {
  using Handle = void*;
  HGLOBAL block;
  void close(void* /*bytes*/) const noexcept { GlobalUnlock(block); }
};

struct Window {
  using Handle = HWND;
  static void close(HWND window) noexcept { DestroyWindow(window); }
};

struct Menu {
  using Handle = HMENU;
  static void close(HMENU menu) noexcept { DestroyMenu(menu); }
};

struct Hook {
  using Handle = HHOOK;
  static void close(HHOOK hook) noexcept { UnhookWindowsHookEx(hook); }
};

/// The open clipboard; the handle is TRUE.
struct Clipboard {
  using Handle = BOOL;
  static void close(BOOL /*is_open*/) noexcept { CloseClipboard(); }
};

template <class Object>
struct GdiObject {
  using Handle = Object;
  static void close(Object object) noexcept { DeleteObject(object); }
};
using Bitmap = GdiObject<HBITMAP>;
using Brush = GdiObject<HBRUSH>;
using Font = GdiObject<HFONT>;
using Pen = GdiObject<HPEN>;

/// A device context that we created.
struct MadeDevice {
  using Handle = HDC;
  static void close(HDC device) noexcept { DeleteDC(device); }
};

/// The device context of a window, or of the screen if the window is null.
struct WindowDevice {
  using Handle = HDC;
  HWND window;
  void close(HDC device) const noexcept { ReleaseDC(window, device); }
};

/// The device context of a window during painting.
struct Painting {
  using Handle = HDC;
  HWND window;
  const PAINTSTRUCT* painting;
  void close(HDC /*device*/) const noexcept { EndPaint(window, painting); }
};

/// The object that a device context had selected before; it is selected again at the end, because an object must not be
/// deleted while it is selected.
struct Selection {
  using Handle = HGDIOBJ;
  HDC device;
  void close(HGDIOBJ before) const noexcept { SelectObject(device, before); }
};

/// The saved state of a device context, to be restored.
struct SavedState {
  using Handle = int;
  HDC device;
  void close(int state) const noexcept { RestoreDC(device, state); }
};

}  // namespace kind

[[nodiscard]] inline Owned<kind::WindowDevice> device_of(HWND window) noexcept {
  return Owned<kind::WindowDevice>(GetDC(window), {window});
}

[[nodiscard]] inline Owned<kind::Selection> select(HDC device, HGDIOBJ object) noexcept {
  return Owned<kind::Selection>(SelectObject(device, object), {device});
}

[[nodiscard]] inline Owned<kind::SavedState> save_state(HDC device) noexcept {
  return Owned<kind::SavedState>(SaveDC(device), {device});
}

[[nodiscard]] inline Owned<kind::LockedMemory> lock(HGLOBAL block) noexcept {
  return Owned<kind::LockedMemory>(block == nullptr ? nullptr : GlobalLock(block), {block});
}

/// Loads a library from the system folder; null if it is missing. A bare name would also find a library of that name in
/// the program's or the current folder.
[[nodiscard]] inline HMODULE system_library(const wchar_t* name) {
  // A search rather than a full path, so that a program's manifest still selects the version of the controls.
  const HMODULE module = LoadLibraryExW(name, nullptr, LOAD_LIBRARY_SEARCH_SYSTEM32);
  if (module != nullptr || GetLastError() != ERROR_INVALID_PARAMETER) return module;
  // Windows 7 without the update of 2011 that introduced the flag (KB2533623).
  std::array<wchar_t, MAX_PATH> folder{};
  const UINT length = GetSystemDirectoryW(folder.data(), static_cast<UINT>(folder.size()));
  return LoadLibraryW(wide(Text(view(folder.data(), length)) + u'\\' + Text(view(name, lstrlenW(name)))));
}

/// A rarely used function of a system library, loaded on demand so that others do not pay for it. Null if the library
/// or the function is missing.
template <class Function>
[[nodiscard]] Function late_function(const wchar_t* library, const char* name) {
  const HMODULE module = system_library(library);
  if (module == nullptr) return nullptr;
  return reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

/// The module that contains this code: the library's DLL, or a test.
[[nodiscard]] inline HMODULE own_module() noexcept {
  HMODULE module = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<const wchar_t*>(&own_module), &module);
  return module;
}

}  // namespace talutil::win32
