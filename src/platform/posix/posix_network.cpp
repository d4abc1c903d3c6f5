#include <arpa/inet.h>
#include <ifaddrs.h>
#include <netinet/in.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <vector>

#include "platform/posix/posix_registry.hpp"

namespace talutil::posix {

namespace {

constexpr std::size_t count_size = 4;
constexpr std::size_t row_size = 24;

struct Row {
  in_addr_t address;  ///< Both in network order.
  in_addr_t mask;
};

in_addr_t address_in(const sockaddr* address) {
  sockaddr_in inet{};
  std::memcpy(&inet, address, sizeof inet);
  return inet.sin_addr.s_addr;
}

std::vector<Row> read_rows() {
  ifaddrs* list = nullptr;
  if (getifaddrs(&list) != 0) return {};
  const std::unique_ptr<ifaddrs, void (*)(ifaddrs*)> owner(list, &freeifaddrs);
  std::vector<Row> rows;
  for (const ifaddrs* entry = list; entry != nullptr; entry = entry->ifa_next) {
    if (entry->ifa_addr == nullptr || entry->ifa_addr->sa_family != AF_INET) continue;
    rows.push_back({address_in(entry->ifa_addr), entry->ifa_netmask != nullptr ? address_in(entry->ifa_netmask) : 0});
  }
  std::ranges::sort(rows, {}, [](const Row& row) { return ntohl(row.address); });
  return rows;
}

}  // namespace

void PosixNetwork::read_address_table(std::span<std::uint8_t> buffer) {
  const std::vector<Row> rows = read_rows();
  if (count_size + rows.size() * row_size > buffer.size()) return;
  for (std::size_t i = 0; i < count_size; ++i) buffer[i] = static_cast<std::uint8_t>(rows.size() >> (8 * i));
  auto* row = buffer.data() + count_size;
  for (std::size_t i = 0; i < rows.size(); ++i, row += row_size) {
    const auto index = static_cast<std::uint32_t>(i + 1);
    std::memcpy(row, &rows[i].address, sizeof rows[i].address);
    std::memcpy(row + 4, &index, sizeof index);
    std::memcpy(row + 8, &rows[i].mask, sizeof rows[i].mask);
  }
}

}  // namespace talutil::posix
