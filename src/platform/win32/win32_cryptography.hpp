#pragma once

#include "platform/cryptography.hpp"

namespace talutil::win32 {

/// The system's preferred generator.
class Win32RandomSource final : public RandomSource {
 public:
  void fill(std::span<std::uint8_t> bytes) override;
};

/// Cryptography Next Generation (bcrypt.dll). The cipher is opened at its first use and kept.
class Win32Cryptography final : public Cryptography {
 public:
  ~Win32Cryptography() override;

  Tag seal(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data) override;
  bool open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
            const Tag& tag) override;

 private:
  Key derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) override;

  void* cipher();

  void* cipher_ = nullptr;
};

}  // namespace talutil::win32
