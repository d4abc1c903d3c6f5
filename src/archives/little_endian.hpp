#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

/// Numbers as archives store them, low byte first.
namespace talutil::archives {

template <class Number>
[[nodiscard]] Number number_at(std::string_view bytes, std::size_t place) {
  Number value = 0;
  for (std::size_t i = sizeof(Number); i-- > 0;) {
    value = static_cast<Number>(static_cast<std::uint64_t>(value) << 8U | static_cast<unsigned char>(bytes[place + i]));
  }
  return value;
}

template <class Number>
void put_number(std::string& bytes, std::size_t place, Number value) {
  for (std::size_t i = 0; i < sizeof(Number); ++i) {
    bytes[place + i] = static_cast<char>(static_cast<std::uint64_t>(value) >> (8 * i));
  }
}

template <class Number>
void append_number(std::string& bytes, Number value) {
  bytes.resize(bytes.size() + sizeof(Number));
  put_number(bytes, bytes.size() - sizeof(Number), value);
}

}  // namespace talutil::archives
