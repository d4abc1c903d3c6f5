#pragma once

#include <map>

#include "platform/network.hpp"
#include "platform/posix/hive.hpp"
#include "platform/registry.hpp"

namespace talutil::posix {

/// The registry in the user's hive file. Texts are stored in the same form as by the settings store, so that each can
/// read what the other wrote, and returned in code page 1252 with a terminating NUL.
class PosixRegistry final : public Registry {
 public:
  explicit PosixRegistry(Hive& hive) noexcept : hive_(hive) {}

  std::int32_t open(Handle root, const Text& path, std::uint32_t access, Handle& key) override;
  std::int32_t create(Handle root, const Text& path, Handle& key) override;
  void close(Handle key) override;
  std::int32_t query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                     std::span<char> buffer) override;
  std::int32_t set(Handle key, const Text& name, std::uint32_t type, std::string_view data) override;

 private:
  Handle add(Text path);

  Hive& hive_;
  std::map<Handle, Text> opened_;
  Handle next_ = 1;
};

/// The addresses of the machine's network interfaces, from the kernel.
class PosixNetwork final : public Network {
 public:
  void read_address_table(std::span<std::uint8_t> buffer) override;
};

}  // namespace talutil::posix
