#include "platform/win32/win32_code_page.hpp"

#include "automation/checked.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

static_assert(CP_ACP == 0);

std::string Win32CodePage::bytes_of(TextView text) {
  // The platform rejects an empty text.
  if (text.empty()) return {};
  const auto* const units = reinterpret_cast<const wchar_t*>(text.data());
  const auto length = checked_cast<std::int32_t>(text.size());
  const int size = WideCharToMultiByte(number_, 0, units, length, nullptr, 0, nullptr, nullptr);
  std::string bytes(static_cast<std::size_t>(size), '\0');
  WideCharToMultiByte(number_, 0, units, length, bytes.data(), size, nullptr, nullptr);
  return bytes;
}

Text Win32CodePage::text_of(std::string_view bytes) {
  if (bytes.empty()) return {};
  const auto size = checked_cast<std::int32_t>(bytes.size());
  const int length = MultiByteToWideChar(number_, 0, bytes.data(), size, nullptr, 0);
  Text text(static_cast<std::size_t>(length), u'\0');
  MultiByteToWideChar(number_, 0, bytes.data(), size, reinterpret_cast<wchar_t*>(text.data()), length);
  return text;
}

}  // namespace talutil::win32
