#include "platform/win32/extended_path.hpp"

#include "automation/run_time_error.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

Text extended_path(const Text& path) {
  const wchar_t* const given = path.empty() ? L"." : wide(path);
  const DWORD size = GetFullPathNameW(given, 0, nullptr, nullptr);
  Text full(size, u'\0');
  const DWORD length = GetFullPathNameW(given, size, reinterpret_cast<wchar_t*>(full.data()), nullptr);
  if (length == 0 || length >= size) raise(ErrorNumber::path_not_found);
  full.resize(length);
  if (full.starts_with(extended_prefix)) return full;
  if (full.starts_with(u"\\\\")) return Text(extended_prefix) + u"UNC\\" + full.substr(2);
  return Text(extended_prefix) + full;
}

}  // namespace talutil::win32
