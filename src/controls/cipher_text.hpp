#pragma once

#include <optional>

#include "automation/text.hpp"
#include "platform/cryptography.hpp"

/// The library's cipher text, described byte for byte in docs/cipher-text.md: version, nonce, encrypted data, tag. The
/// format is fixed, because hosts store such texts in their databases.
namespace talutil::cipher_text {

/// Derives the key of a pass phrase with the salt and rounds of version 1.
[[nodiscard]] const Cryptography::Key& key_of(TextView pass_phrase, Cryptography& cryptography);

[[nodiscard]] Bytes seal(Bytes plain, const Cryptography::Key& key, const Cryptography::Nonce& nonce,
                         Cryptography& cryptography);

/// Returns nothing unless the bytes are a sealed message of this key.
[[nodiscard]] std::optional<Bytes> open(ByteView sealed, const Cryptography::Key& key, Cryptography& cryptography);

/// The code units of a text, low byte first: every text, even with lone surrogates, survives the round trip.
[[nodiscard]] Bytes to_bytes(TextView text);

/// Returns nothing for an odd number of bytes.
[[nodiscard]] std::optional<Text> to_text(ByteView bytes);

/// Base64 (RFC 4648, section 4) with padding, on one line.
[[nodiscard]] Text encode(ByteView bytes);

/// Returns nothing for anything that `encode` does not produce, so that no two texts decode to the same bytes.
[[nodiscard]] std::optional<Bytes> decode(TextView text);

}  // namespace talutil::cipher_text
