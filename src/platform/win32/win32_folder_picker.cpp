#include "platform/win32/win32_folder_picker.hpp"

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/win32_files.hpp"
// After windows.h.
#include <shlobj.h>

namespace talutil::win32 {

namespace {

struct ItemList {
  using Handle = PIDLIST_ABSOLUTE;
  static void close(PIDLIST_ABSOLUTE items) noexcept { CoTaskMemFree(items); }
};

/// Converts a text from the code page of the platform's ANSI functions.
Text from_platform_ansi(const char* bytes) {
  const int length = MultiByteToWideChar(CP_ACP, 0, bytes, -1, nullptr, 0);
  Text text(static_cast<std::size_t>(length), u'\0');
  MultiByteToWideChar(CP_ACP, 0, bytes, -1, reinterpret_cast<wchar_t*>(text.data()), length);
  text.pop_back();  // The NUL.
  return text;
}

}  // namespace

std::optional<Text> Win32FolderPicker::choose(TextView title, std::intptr_t owner) {
  using Browse = PIDLIST_ABSOLUTE(WINAPI*)(BROWSEINFOA*);
  using GetPath = BOOL(WINAPI*)(PCIDLIST_ABSOLUTE, char*);
  const auto browse = late_function<Browse>(L"shell32.dll", "SHBrowseForFolderA");
  const auto get_path = late_function<GetPath>(L"shell32.dll", "SHGetPathFromIDListA");
  if (browse == nullptr || get_path == nullptr) raise(ErrorNumber::file_not_found);

  const std::string caption = to_platform_ansi(title);
  BROWSEINFOA dialog{};
  dialog.hwndOwner = reinterpret_cast<HWND>(owner);  // NOLINT(performance-no-int-to-ptr): the seam passes integers.
  dialog.lpszTitle = caption.c_str();
  const Owned<ItemList> items(browse(&dialog));
  if (!items) return std::nullopt;
  // Blanks, which remain if the chosen item is not a folder of the file system.
  std::string path(MAX_PATH, ' ');
  get_path(items.get(), path.data());
  return from_platform_ansi(path.c_str());
}

}  // namespace talutil::win32
