#pragma once

#include <array>
#include <utility>

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// An open file of the system, closed at its end.
class FileHandle {
 public:
  explicit FileHandle(HANDLE handle = INVALID_HANDLE_VALUE) noexcept : handle_(handle) {}
  FileHandle(FileHandle&& other) noexcept : handle_(std::exchange(other.handle_, INVALID_HANDLE_VALUE)) {}
  FileHandle& operator=(FileHandle&& other) noexcept {
    std::swap(handle_, other.handle_);
    return *this;
  }
  ~FileHandle() { close(); }

  [[nodiscard]] HANDLE get() const noexcept { return handle_; }
  [[nodiscard]] bool is_open() const noexcept { return handle_ != INVALID_HANDLE_VALUE; }
  void close() noexcept {
    if (is_open()) CloseHandle(std::exchange(handle_, INVALID_HANDLE_VALUE));
  }

 private:
  HANDLE handle_;
};

/// Ends a search of the system.
struct FindHandle {
  HANDLE handle;
  explicit FindHandle(HANDLE found) : handle(found) {}
  FindHandle(const FindHandle&) = delete;
  FindHandle& operator=(const FindHandle&) = delete;
  ~FindHandle() {
    if (handle != INVALID_HANDLE_VALUE) FindClose(handle);
  }
};

/// A library of the system's own folder; null when it is missing. By its bare name alone a library of the same name in
/// the program's or the current folder would be taken.
[[nodiscard]] inline HMODULE system_library(const wchar_t* name) {
  // Searched and not named by its path, so that the manifest of a program still chooses the version of the controls.
  const HMODULE module = LoadLibraryExW(name, nullptr, LOAD_LIBRARY_SEARCH_SYSTEM32);
  if (module != nullptr || GetLastError() != ERROR_INVALID_PARAMETER) return module;
  // Windows 7 without the update of 2011 that brought the flag (KB2533623).
  std::array<wchar_t, MAX_PATH> folder{};
  const UINT length = GetSystemDirectoryW(folder.data(), static_cast<UINT>(folder.size()));
  return LoadLibraryW(wide(Text(view(folder.data(), length)) + u'\\' + Text(view(name, lstrlenW(name)))));
}

/// A function of a system library that few callers need: loaded at its first use, so that others do not wait for it.
/// Null when the library or the function is missing.
template <class Function>
[[nodiscard]] Function late_function(const wchar_t* library, const char* name) {
  const HMODULE module = system_library(library);
  if (module == nullptr) return nullptr;
  return reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

/// The module that this code is part of: the library's DLL, or a test.
[[nodiscard]] inline HMODULE own_module() noexcept {
  HMODULE module = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<const wchar_t*>(&own_module), &module);
  return module;
}

}  // namespace talutil::win32
