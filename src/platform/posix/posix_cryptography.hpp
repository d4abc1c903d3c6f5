#pragma once

#include "platform/cryptography.hpp"

namespace talutil::posix {

/// Random bytes from the kernel.
class PosixRandomSource final : public RandomSource {
 public:
  void fill(std::span<std::uint8_t> bytes) override;
};

/// Implemented by OpenSSL.
class PosixCryptography final : public Cryptography {
 public:
  Tag seal(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data) override;
  bool open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
            const Tag& tag) override;

 private:
  Key derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) override;
};

}  // namespace talutil::posix
