#include "platform/posix/posix_guids.hpp"

#include <sys/random.h>

#include <array>

#include "automation/run_time_error.hpp"

namespace talutil::posix {

Text PosixGuids::make() {
  std::array<std::uint8_t, 16> bytes{};
  if (getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size())) {
    raise(ErrorNumber::internal_error);
  }
  bytes[6] = static_cast<std::uint8_t>((bytes[6] & 0x0F) | 0x40);
  bytes[8] = static_cast<std::uint8_t>((bytes[8] & 0x3F) | 0x80);

  constexpr TextView digits = u"0123456789ABCDEF";
  Text text = u"{";
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) text += u'-';
    text += digits[bytes[i] >> 4];
    text += digits[bytes[i] & 0x0F];
  }
  return text + u'}';
}

}  // namespace talutil::posix
