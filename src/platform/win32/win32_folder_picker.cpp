#include "platform/win32/win32_folder_picker.hpp"

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/modality.hpp"
#include "platform/win32/visual_styles.hpp"
// After windows.h.
#include <shlobj.h>

namespace talutil::win32 {

namespace {

struct ItemList {
  using Handle = PIDLIST_ABSOLUTE;
  static void close(PIDLIST_ABSOLUTE items) noexcept { CoTaskMemFree(items); }
};

}  // namespace

std::optional<Text> Win32FolderPicker::choose(TextView title, std::intptr_t owner) {
  using Browse = PIDLIST_ABSOLUTE(WINAPI*)(BROWSEINFOW*);
  using GetPath = BOOL(WINAPI*)(PCIDLIST_ABSOLUTE, wchar_t*);
  const auto browse = late_function<Browse>(L"shell32.dll", "SHBrowseForFolderW");
  const auto get_path = late_function<GetPath>(L"shell32.dll", "SHGetPathFromIDListW");
  if (browse == nullptr || get_path == nullptr) raise(ErrorNumber::file_not_found);

  const Text caption(title);
  BROWSEINFOW dialog{};
  dialog.hwndOwner = reinterpret_cast<HWND>(owner);  // NOLINT(performance-no-int-to-ptr): the seam passes integers.
  dialog.lpszTitle = wide(caption);
  // Its owner is a hidden window, so that the others would stay usable.
  const WaitingWindows others(nullptr);
  const VisualStyles styles;
  const Owned<ItemList> items(browse(&dialog));
  if (!items) return std::nullopt;
  // Blanks, which remain if the chosen item is not a folder of the file system.
  Text path(MAX_PATH, u' ');
  get_path(items.get(), reinterpret_cast<wchar_t*>(path.data()));
  return Text(up_to_nul(path));
}

}  // namespace talutil::win32
