#include "platform/win32/win32_guids.hpp"

#include <array>

#include "automation/run_time_error.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

Text Win32Guids::make() {
  GUID guid;
  std::array<wchar_t, 40> text{};
  if (FAILED(CoCreateGuid(&guid))) raise(ErrorNumber::internal_error);
  // The count includes the terminating NUL.
  const int count = StringFromGUID2(guid, text.data(), static_cast<int>(text.size()));
  if (count == 0) raise(ErrorNumber::internal_error);
  return Text(view(text.data(), static_cast<std::size_t>(count - 1)));
}

}  // namespace talutil::win32
