#pragma once

#include <cstdint>
#include <span>

namespace talutil {

class Network {
 public:
  virtual ~Network() = default;

  /// Fills a buffer with the table of the machine's IPv4 addresses in ascending order: their count in 32 bits, low byte
  /// first, then one row of 24 bytes each, which begins with the address in network order. Leaves the buffer unchanged
  /// if the table does not fit.
  virtual void read_address_table(std::span<std::uint8_t> buffer) = 0;
};

}  // namespace talutil
