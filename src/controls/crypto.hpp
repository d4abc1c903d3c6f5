#pragma once

#include "controls/table_object.hpp"

namespace talutil {

/// Data passed to or returned by the encryption control.
class CryptoData final : public TableObject<CryptoData> {
 public:
  /// The formats in which data can be passed and read.
  static constexpr std::int32_t encoded = 1;  ///< Base64
  static constexpr std::int32_t plain = 3;    ///< The code units of a text

  CryptoData(Bytes bytes, const Locale& locale) : TableObject(locale), bytes_(std::move(bytes)) {}

  /// The data in one of the formats. Raises 5 for an unknown format, and for bytes that cannot be shown in it.
  [[nodiscard]] Text Read(const std::int32_t& Format) const;

  [[nodiscard]] const Bytes& bytes() const noexcept { return bytes_; }

 private:
  Bytes bytes_;
};

/// The key of a pass phrase, with options for its use. Only one way is safe, so each option has a single value, which
/// describes how this key's messages are encrypted.
class CryptoKey final : public TableObject<CryptoKey> {
 public:
  static constexpr std::int32_t counter_mode = 1;  ///< Galois/counter mode
  static constexpr std::int32_t no_padding = 2;    ///< Not needed by the mode
  static constexpr std::int32_t aes = 9;           ///< AES with a key of 256 bits

  CryptoKey(const Platform& platform, const Cryptography::Key& key)
      : TableObject(platform), platform_(platform), key_(key) {}

  std::int32_t Mode = 0;
  std::int32_t Padding = 0;

  /// Encrypts data with a fresh nonce and returns the result as new data. Raises 5 for an algorithm or options other
  /// than the above and if Final is False (a message must be passed whole), 13 if Data is another kind of object.
  [[nodiscard]] Variant Encrypt(const std::int32_t& Algorithm, const Variant& Data, const Boolean& Final) const;

  /// Reverses Encrypt. Data that were changed, or not encrypted with this key, raise 5, always with the same
  /// description.
  [[nodiscard]] Variant Decrypt(const std::int32_t& Algorithm, const Variant& Data, const Boolean& Final) const;

 private:
  [[nodiscard]] const Bytes& checked_input(std::int32_t algorithm, const Variant& data, Boolean final) const;

  const Platform& platform_;
  Cryptography::Key key_;
};

/// The encryption control: converts strings to printable cipher text and back. See cipher_text.hpp for the format.
class Crypto final : public TableObject<Crypto> {
 public:
  static constexpr std::int32_t key_bits = 256;
  static constexpr std::int32_t from_pass_phrase = 1;

  explicit Crypto(const Platform& platform) : TableObject(platform), platform_(platform) {}

  /// Creates a key. Raises 5 for any KeyBits but 256 and any Derivation but 1 (a pass phrase).
  [[nodiscard]] Variant CreateKey(const Text& PassPhrase, const std::int32_t& KeyBits,
                                  const std::int32_t& Derivation) const;

  /// Creates data from a text in one of the formats. Raises 5 for an unknown format, and for a text that is not Base64
  /// (with the description that Decrypt uses).
  [[nodiscard]] Variant CreateData(const Text& Source, const std::int32_t& Format) const;

 private:
  const Platform& platform_;
};

template <class P>
constexpr auto members_of(std::type_identity<CryptoData>) {
  return P::rows(P::template method<&CryptoData::Read>("Read", "Format"));
}

template <class P>
constexpr auto members_of(std::type_identity<CryptoKey>) {
  return P::rows(P::template property<&CryptoKey::Mode>("Mode"), P::template property<&CryptoKey::Padding>("Padding"),
                 P::template method<&CryptoKey::Encrypt>("Encrypt", "Algorithm", "Data", "Final"),
                 P::template method<&CryptoKey::Decrypt>("Decrypt", "Algorithm", "Data", "Final"));
}

template <class P>
constexpr auto members_of(std::type_identity<Crypto>) {
  return P::rows(P::template method<&Crypto::CreateKey>("CreateKey", "PassPhrase", "KeyBits", "Derivation"),
                 P::template method<&Crypto::CreateData>("CreateData", "Source", "Format"));
}

}  // namespace talutil
