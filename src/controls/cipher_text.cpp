#include "controls/cipher_text.hpp"

#include <algorithm>
#include <array>
#include <string_view>

namespace talutil::cipher_text {

namespace {

using Key = Cryptography::Key;
using Nonce = Cryptography::Nonce;
using Tag = Cryptography::Tag;

constexpr std::uint8_t version = 1;
constexpr std::string_view salt = "TALUtil cipher 1";
constexpr std::uint32_t rounds = 100'000;

constexpr std::size_t header_size = 1 + sizeof(Nonce);
constexpr std::size_t smallest_size = header_size + sizeof(Tag);

constexpr TextView alphabet = u"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
constexpr char16_t padding = u'=';
constexpr std::uint8_t no_digit = 0xFF;

constexpr auto digit_values = [] {
  std::array<std::uint8_t, 128> values{};
  values.fill(no_digit);
  for (std::size_t i = 0; i < alphabet.size(); ++i) values[alphabet[i]] = static_cast<std::uint8_t>(i);
  return values;
}();

constexpr std::uint8_t digit_value(char16_t unit) noexcept {
  return unit < digit_values.size() ? digit_values[unit] : no_digit;
}

ByteView bytes_of(std::string_view text) noexcept {
  return {reinterpret_cast<const std::uint8_t*>(text.data()), text.size()};
}

}  // namespace

const Key& key_of(TextView pass_phrase, Cryptography& cryptography) {
  return cryptography.key_for(bytes_of(to_utf8(pass_phrase)), bytes_of(salt), rounds);
}

Bytes seal(Bytes plain, const Key& key, const Nonce& nonce, Cryptography& cryptography) {
  const Tag tag = cryptography.seal(key, nonce, ByteView(&version, 1), plain);
  Bytes sealed;
  sealed.reserve(smallest_size + plain.size());
  sealed.push_back(version);
  sealed.insert(sealed.end(), nonce.begin(), nonce.end());
  sealed.insert(sealed.end(), plain.begin(), plain.end());
  sealed.insert(sealed.end(), tag.begin(), tag.end());
  return sealed;
}

std::optional<Bytes> open(ByteView sealed, const Key& key, Cryptography& cryptography) {
  if (sealed.size() < smallest_size || sealed.front() != version) return std::nullopt;
  Nonce nonce{};
  Tag tag{};
  std::ranges::copy(sealed.subspan(1, nonce.size()), nonce.begin());
  std::ranges::copy(sealed.last(tag.size()), tag.begin());
  const ByteView encrypted = sealed.subspan(header_size, sealed.size() - smallest_size);
  Bytes data(encrypted.begin(), encrypted.end());
  if (!cryptography.open(key, nonce, ByteView(&version, 1), data, tag)) return std::nullopt;
  return data;
}

Bytes to_bytes(TextView text) {
  const std::string bytes = to_utf16_bytes(text);
  return {bytes.begin(), bytes.end()};
}

std::optional<Text> to_text(ByteView bytes) {
  if (bytes.size() % 2 != 0) return std::nullopt;
  return from_utf16_bytes({reinterpret_cast<const char*>(bytes.data()), bytes.size()});
}

Text encode(ByteView bytes) {
  Text text((bytes.size() + 2) / 3 * 4, padding);
  for (std::size_t from = 0, to = 0; from < bytes.size(); from += 3, to += 4) {
    const std::size_t count = std::min<std::size_t>(3, bytes.size() - from);
    std::uint32_t bits = 0;
    for (std::size_t i = 0; i < 3; ++i) bits = bits << 8 | (i < count ? bytes[from + i] : 0U);
    for (std::size_t i = 0; i <= count; ++i) text[to + i] = alphabet[bits >> (18 - 6 * i) & 63];
  }
  return text;
}

std::optional<Bytes> decode(TextView text) {
  if (text.size() % 4 != 0) return std::nullopt;
  const std::size_t digits = std::min(text.find(padding), text.size());
  const std::size_t padded = text.size() - digits;
  if (padded > 2 || text.substr(digits) != TextView(u"==").substr(2 - padded)) return std::nullopt;

  Bytes bytes(digits * 3 / 4);
  auto next = bytes.begin();
  std::uint32_t bits = 0;
  std::uint32_t bit_count = 0;
  for (const char16_t unit : text.substr(0, digits)) {
    const std::uint8_t value = digit_value(unit);
    if (value == no_digit) return std::nullopt;
    bits = bits << 6 | value;
    bit_count += 6;
    if (bit_count < 8) continue;
    bit_count -= 8;
    *next++ = static_cast<std::uint8_t>(bits >> bit_count);
    bits &= (1U << bit_count) - 1;
  }
  // The unused bits of the last digit are zero in every text that we write.
  if (bits != 0) return std::nullopt;
  return bytes;
}

}  // namespace talutil::cipher_text
