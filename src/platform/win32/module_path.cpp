#include "platform/win32/module_path.hpp"

#include "automation/run_time_error.hpp"

namespace talutil::win32 {

Text module_path(HMODULE module) {
  // The system truncates a path that does not fit, and then returns the buffer's full size.
  constexpr std::size_t longest_path = 32768;
  for (Text path(MAX_PATH, u'\0'); path.size() <= longest_path; path.resize(2 * path.size())) {
    const DWORD length =
        GetModuleFileNameW(module, reinterpret_cast<wchar_t*>(path.data()), static_cast<DWORD>(path.size()));
    if (length == 0) break;
    if (length < path.size()) return path.substr(0, length);
  }
  raise(ErrorNumber::internal_error);
}

}  // namespace talutil::win32
