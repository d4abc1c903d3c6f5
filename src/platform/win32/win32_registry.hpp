#pragma once

#include "platform/network.hpp"
#include "platform/registry.hpp"

namespace talutil::win32 {

class Win32Registry final : public Registry {
 public:
  std::int32_t open(Handle root, const Text& path, std::uint32_t access, Handle& key) override;
  std::int32_t create(Handle root, const Text& path, Handle& key) override;
  void close(Handle key) noexcept override;
  std::int32_t query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                     std::span<char> buffer) override;
  std::int32_t set(Handle key, const Text& name, std::uint32_t type, std::string_view data) override;
};

class Win32Network final : public Network {
 public:
  void read_address_table(std::span<std::uint8_t> buffer) override;
};

}  // namespace talutil::win32
