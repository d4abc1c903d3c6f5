#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "automation/text.hpp"

namespace talutil {

/// The registry. Values go through the platform's ANSI functions: their names and texts are converted by the code page.
/// Every call returns a status code of the platform.
class Registry {
 public:
  using Handle = std::uintptr_t;

  static constexpr std::int32_t ok = 0;
  static constexpr std::int32_t not_found = 2;
  static constexpr std::int32_t invalid_handle = 6;
  static constexpr std::int32_t more_data = 234;

  static constexpr Handle current_user = 0x80000001;

  // Access rights for opening a key.
  static constexpr std::uint32_t query_value = 1;
  static constexpr std::uint32_t set_value = 2;
  static constexpr std::uint32_t all_but_links = 63;

  // Types of values.
  static constexpr std::uint32_t text = 1;  ///< ANSI; the size includes the NUL.
  static constexpr std::uint32_t binary = 3;
  static constexpr std::uint32_t number = 4;  ///< 32 bits, low byte first.

  virtual ~Registry() = default;

  /// Opens or creates a key; leaves the handle unchanged on failure.
  virtual std::int32_t open(Handle root, const Text& path, std::uint32_t access, Handle& key) = 0;
  virtual std::int32_t create(Handle root, const Text& path, Handle& key) = 0;
  virtual void close(Handle key) noexcept = 0;

  /// Reads the type and size of a value and, if there is a buffer, its bytes.
  virtual std::int32_t query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                             std::span<char> buffer) = 0;
  virtual std::int32_t set(Handle key, const Text& name, std::uint32_t type, std::string_view data) = 0;
};

}  // namespace talutil
