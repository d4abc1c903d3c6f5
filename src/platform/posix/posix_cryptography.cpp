#include "platform/posix/posix_cryptography.hpp"

#include <errno.h>
#include <openssl/evp.h>
#include <sys/random.h>

#include <algorithm>

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"

namespace talutil {

namespace posix {

namespace {

void require(bool has_worked) {
  if (!has_worked) raise(ErrorNumber::internal_error);
}

struct FreeContext {
  void operator()(EVP_CIPHER_CTX* context) const noexcept { EVP_CIPHER_CTX_free(context); }
};
using Context = std::unique_ptr<EVP_CIPHER_CTX, FreeContext>;

enum Direction : int { decrypting, encrypting };

Context start(Direction direction, const Cryptography::Key& key, const Cryptography::Nonce& nonce) {
  Context context(EVP_CIPHER_CTX_new());
  require(context != nullptr);
  // The nonce has the mode's default length.
  require(EVP_CipherInit_ex(context.get(), EVP_aes_256_gcm(), nullptr, key.data(), nonce.data(), direction) == 1);
  return context;
}

/// Processes any number of bytes; if `result` is null, they are only authenticated.
void feed(EVP_CIPHER_CTX* context, ByteView bytes, std::uint8_t* result) {
  constexpr std::size_t most_at_once = std::size_t{1} << 30U;
  for (std::size_t at = 0; at < bytes.size(); at += most_at_once) {
    const std::size_t count = std::min(most_at_once, bytes.size() - at);
    int written = 0;
    require(EVP_CipherUpdate(context, result == nullptr ? nullptr : result + at, &written, bytes.data() + at,
                             static_cast<int>(count)) == 1);
  }
}

bool finish(EVP_CIPHER_CTX* context) {
  // The mode leaves no remainder, but the function requires a buffer.
  std::array<std::uint8_t, EVP_MAX_BLOCK_LENGTH> rest{};
  int written = 0;
  return EVP_CipherFinal_ex(context, rest.data(), &written) == 1;
}

}  // namespace

void PosixRandomSource::fill(std::span<std::uint8_t> bytes) {
  while (!bytes.empty()) {
    const ssize_t count = getrandom(bytes.data(), bytes.size(), 0);
    if (count < 0 && errno == EINTR) continue;
    require(count > 0);
    bytes = bytes.subspan(static_cast<std::size_t>(count));
  }
}

Cryptography::Tag PosixCryptography::seal(const Key& key, const Nonce& nonce, ByteView associated,
                                          std::span<std::uint8_t> data) {
  const Context context = start(encrypting, key, nonce);
  feed(context.get(), associated, nullptr);
  feed(context.get(), data, data.data());
  require(finish(context.get()));
  Tag tag{};
  require(EVP_CIPHER_CTX_ctrl(context.get(), EVP_CTRL_GCM_GET_TAG, tag.size(), tag.data()) == 1);
  return tag;
}

bool PosixCryptography::open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
                             const Tag& tag) {
  const Context context = start(decrypting, key, nonce);
  feed(context.get(), associated, nullptr);
  feed(context.get(), data, data.data());
  Tag expected = tag;
  require(EVP_CIPHER_CTX_ctrl(context.get(), EVP_CTRL_GCM_SET_TAG, expected.size(), expected.data()) == 1);
  return finish(context.get());
}

Cryptography::Key PosixCryptography::derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) {
  Key key{};
  require(PKCS5_PBKDF2_HMAC(reinterpret_cast<const char*>(pass_phrase.data()), checked_cast<int>(pass_phrase.size()),
                            salt.data(), checked_cast<int>(salt.size()), checked_cast<int>(rounds), EVP_sha256(),
                            key.size(), key.data()) == 1);
  return key;
}

}  // namespace posix

std::unique_ptr<RandomSource> make_random_source() { return std::make_unique<posix::PosixRandomSource>(); }

std::unique_ptr<Cryptography> make_cryptography() { return std::make_unique<posix::PosixCryptography>(); }

}  // namespace talutil
