#pragma once

#include <map>

#include "platform/code_page.hpp"
#include "platform/network.hpp"
#include "platform/posix/hive.hpp"
#include "platform/registry.hpp"

namespace talutil::posix {

/// The registry in the user's hive file. Texts are stored in the same form as by the settings store, so that each can
/// read what the other wrote, and returned in the ANSI code page with a terminating NUL. A hive
/// that cannot be used is a status, `unavailable`, as any other failure.
class PosixRegistry final : public Registry {
 public:
  static constexpr std::int32_t unavailable = 1009;  ///< ERROR_BADDB

  PosixRegistry(Hive& hive, CodePage& code_page) noexcept : hive_(hive), code_page_(code_page) {}

  std::int32_t open(Handle root, const Text& path, std::uint32_t access, Handle& key) override;
  std::int32_t create(Handle root, const Text& path, Handle& key) override;
  void close(Handle key) noexcept override;
  std::int32_t query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                     std::span<char> buffer) override;
  std::int32_t set(Handle key, const Text& name, std::uint32_t type, std::string_view data) override;

 private:
  Handle add(Text path);

  Hive& hive_;
  CodePage& code_page_;
  std::map<Handle, Text> opened_;
  Handle next_ = 1;
};

/// The addresses of the machine's network interfaces, from the kernel.
class PosixNetwork final : public Network {
 public:
  void read_address_table(std::span<std::uint8_t> buffer) override;
};

}  // namespace talutil::posix
