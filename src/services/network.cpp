#include <array>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

Boolean ORVUtils::PingSite(const Text& /*sAddress*/) { return Boolean(true); }

Variant ORVUtils::GetIpAddrTable() {
  // Room for 21 rows and no more: for hosts, a machine with more addresses has none.
  std::array<std::uint8_t, 512> table{};
  constexpr std::size_t first_row = 4;
  constexpr std::size_t row_size = 24;
  library_.platform().network.read_address_table(table);
  const std::size_t count = table[0] | static_cast<std::size_t>(table[1]) << 8U;
  if (count > 32767) raise(ErrorNumber::overflow);
  if (first_row + count * row_size > table.size()) raise(ErrorNumber::subscript_out_of_range);
  TextArray addresses;
  addresses.allocated = true;
  for (std::size_t row = 0; row < count; ++row) {
    const std::uint8_t* const bytes = &table[first_row + row * row_size];
    Text address;
    for (int i = 0; i < 4; ++i) address += (i == 0 ? u"" : u".") + number_to_text(std::int32_t{bytes[i]});
    addresses.items.push_back(std::move(address));
  }
  return addresses;
}

}  // namespace talutil
