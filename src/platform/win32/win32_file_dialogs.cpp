#include "platform/win32/win32_file_dialogs.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/visual_styles.hpp"
// After windows.h.
#include <cderr.h>
#include <commdlg.h>

namespace talutil::win32 {

namespace {

// Flags that hosts cannot use: they refer to code of the caller, return several files, or need a handler for the help
// button.
constexpr std::uint32_t unusable_flags = OFN_ENABLEHOOK | OFN_ENABLETEMPLATE | OFN_ENABLETEMPLATEHANDLE |
                                         OFN_ALLOWMULTISELECT | OFN_SHOWHELP | OFN_ENABLEINCLUDENOTIFY;

/// The platform expects each name and pattern of a filter to be terminated by a NUL.
Text closed_with_nuls(Text filter) {
  if (filter.empty()) return filter;
  std::ranges::replace(filter, u'|', u'\0');
  return filter + u'\0';
}

}  // namespace

std::optional<ChosenFile> Win32FileDialogs::choose(const FileDialog& dialog) {
  using Show = BOOL(WINAPI*)(OPENFILENAMEW*);
  const bool is_save = dialog.purpose == FileDialog::Purpose::save;
  const auto show = late_function<Show>(L"comdlg32.dll", is_save ? "GetSaveFileNameW" : "GetOpenFileNameW");
  const auto last_error = late_function<DWORD(WINAPI*)()>(L"comdlg32.dll", "CommDlgExtendedError");
  if (show == nullptr || last_error == nullptr) raise(ErrorNumber::file_not_found);

  constexpr std::size_t longest_path = 32767;
  Text path = dialog.file_name;
  path.resize(longest_path);
  const Text filter = closed_with_nuls(dialog.filter);
  OPENFILENAMEW native{};
  native.lStructSize = sizeof native;
  native.hwndOwner = GetActiveWindow();
  native.lpstrFilter = filter.empty() ? nullptr : wide(filter);
  native.nFilterIndex = static_cast<DWORD>(std::max(dialog.filter_index, 0));
  native.lpstrFile = reinterpret_cast<wchar_t*>(path.data());
  native.nMaxFile = static_cast<DWORD>(path.size());
  native.lpstrInitialDir = dialog.folder.empty() ? nullptr : wide(dialog.folder);
  native.lpstrTitle = dialog.title.empty() ? nullptr : wide(dialog.title);
  native.lpstrDefExt = dialog.default_extension.empty() ? nullptr : wide(dialog.default_extension);
  native.Flags = (static_cast<std::uint32_t>(dialog.flags) & ~unusable_flags) | OFN_EXPLORER | OFN_NOCHANGEDIR;
  const VisualStyles styles;
  if (show(&native) == FALSE) {
    if (last_error() == FNERR_INVALIDFILENAME) raise(ErrorNumber::bad_file_name_or_number);
    return std::nullopt;
  }
  path.resize(path.find(u'\0'));
  return ChosenFile{std::move(path), static_cast<std::int32_t>(native.nFilterIndex)};
}

}  // namespace talutil::win32
