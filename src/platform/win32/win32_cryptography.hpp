#pragma once

#include "platform/cryptography.hpp"
#include "platform/win32/handle.hpp"

namespace talutil::win32 {

/// The system's preferred generator.
class Win32RandomSource final : public RandomSource {
 public:
  void fill(std::span<std::uint8_t> bytes) override;
};

struct CipherProvider {
  using Handle = void*;
  static void close(void* provider) noexcept;
};

/// Cryptography Next Generation (bcrypt.dll). The cipher is opened on first use and kept.
class Win32Cryptography final : public Cryptography {
 public:
  Tag seal(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data) override;
  bool open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
            const Tag& tag) override;

 private:
  Key derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) override;

  void* cipher();

  Owned<CipherProvider> cipher_;
};

}  // namespace talutil::win32
