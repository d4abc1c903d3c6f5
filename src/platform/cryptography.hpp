#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <vector>

namespace talutil {

using Bytes = std::vector<std::uint8_t>;
using ByteView = std::span<const std::uint8_t>;

class RandomSource {
 public:
  virtual ~RandomSource() = default;

  /// Fills the buffer with unpredictable bytes. Raises 51 if the platform cannot supply any.
  virtual void fill(std::span<std::uint8_t> bytes) = 0;
};

/// AES-256 in Galois/counter mode (NIST SP 800-38D) and PBKDF2 with HMAC-SHA256 (RFC 8018), as implemented by the
/// platform. Both builds produce the same bytes. Failures not caused by the data raise 51.
class Cryptography {
 public:
  using Key = std::array<std::uint8_t, 32>;
  using Nonce = std::array<std::uint8_t, 12>;
  using Tag = std::array<std::uint8_t, 16>;

  Cryptography() = default;
  Cryptography(const Cryptography&) = delete;
  Cryptography& operator=(const Cryptography&) = delete;
  virtual ~Cryptography() = default;

  /// Derives the key of a pass phrase. Keeps the last one, because deriving a key takes tens of milliseconds.
  [[nodiscard]] const Key& key_for(ByteView pass_phrase, ByteView salt, std::uint32_t rounds);

  /// Encrypts the data in place. Never use a nonce for two messages with the same key.
  [[nodiscard]] virtual Tag seal(const Key& key, const Nonce& nonce, ByteView associated,
                                 std::span<std::uint8_t> data) = 0;

  /// Decrypts the data in place. Returns false if the tag does not match; the data are then useless.
  [[nodiscard]] virtual bool open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
                                  const Tag& tag) = 0;

 private:
  struct Derived {
    Bytes pass_phrase;
    Bytes salt;
    std::uint32_t rounds = 0;
    Key key{};
  };

  [[nodiscard]] virtual Key derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) = 0;

  std::optional<Derived> last_;
};

/// The platform's implementations, for programs that run without a library.
[[nodiscard]] std::unique_ptr<RandomSource> make_random_source();
[[nodiscard]] std::unique_ptr<Cryptography> make_cryptography();

}  // namespace talutil
