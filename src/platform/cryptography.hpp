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

  /// Fills with bytes that nobody can predict. Raises 51 where the platform has none to give.
  virtual void fill(std::span<std::uint8_t> bytes) = 0;
};

/// The platform's own AES-256 in Galois/counter mode (NIST SP 800-38D) and PBKDF2 with HMAC-SHA256 (RFC 8018). Both
/// builds give the same bytes. Failures that are not the data's fault raise 51.
class Cryptography {
 public:
  using Key = std::array<std::uint8_t, 32>;
  using Nonce = std::array<std::uint8_t, 12>;
  using Tag = std::array<std::uint8_t, 16>;

  Cryptography() = default;
  Cryptography(const Cryptography&) = delete;
  Cryptography& operator=(const Cryptography&) = delete;
  virtual ~Cryptography() = default;

  /// The key of a pass phrase. The last one is kept, since each costs its rounds: tens of milliseconds.
  [[nodiscard]] const Key& key_for(ByteView pass_phrase, ByteView salt, std::uint32_t rounds);

  /// Encrypts the data in place. A nonce serves one message of a key only.
  [[nodiscard]] virtual Tag seal(const Key& key, const Nonce& nonce, ByteView associated,
                                 std::span<std::uint8_t> data) = 0;

  /// Decrypts the data in place. False when the tag does not fit; the data are then of no use.
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

/// The platform's own, for programs that have no library around them.
[[nodiscard]] std::unique_ptr<RandomSource> make_random_source();
[[nodiscard]] std::unique_ptr<Cryptography> make_cryptography();

}  // namespace talutil
