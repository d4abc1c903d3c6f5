#pragma once

#include <optional>

#include "automation/text.hpp"
#include "platform/cryptography.hpp"

/// The cipher text of the library, byte for byte in docs/cipher-text.md: version, nonce, encrypted data, tag. It is
/// fixed, since hosts keep such texts in their databases.
namespace talutil::cipher_text {

/// The key of a pass phrase, by version 1's salt and rounds.
[[nodiscard]] const Cryptography::Key& key_of(TextView pass_phrase, Cryptography& cryptography);

[[nodiscard]] Bytes seal(Bytes plain, const Cryptography::Key& key, const Cryptography::Nonce& nonce,
                         Cryptography& cryptography);

/// Empty for bytes that are no sealed message of this key, whatever is wrong with them.
[[nodiscard]] std::optional<Bytes> open(ByteView sealed, const Cryptography::Key& key, Cryptography& cryptography);

/// A text as its code units, low byte first: every text, lone surrogates included, comes back as it was.
[[nodiscard]] Bytes to_bytes(TextView text);

/// Empty for an odd number of bytes.
[[nodiscard]] std::optional<Text> to_text(ByteView bytes);

/// Base64 (RFC 4648, section 4) with its padding, on one line.
[[nodiscard]] Text encode(ByteView bytes);

/// Empty for anything that encode does not give, so that no two texts stand for the same bytes.
[[nodiscard]] std::optional<Bytes> decode(TextView text);

}  // namespace talutil::cipher_text
