#include "platform/win32/win32_cryptography.hpp"

#include <array>

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
// After windows.h.
#include <bcrypt.h>

namespace talutil {

namespace win32 {

namespace {

/// Loads the library safely before the first call, where the delayed import would search for it by its bare name.
void load_cryptography() {
  if (GetModuleHandleW(L"bcrypt.dll") == nullptr) static_cast<void>(system_library(L"bcrypt.dll"));
}

void require(NTSTATUS status) {
  if (status < 0) raise(ErrorNumber::internal_error);
}

// The functions take non-const pointers even for their input, and none may be null.
UCHAR* pointer(ByteView bytes) noexcept {
  static constexpr UCHAR nothing = 0;
  return const_cast<UCHAR*>(bytes.empty() ? &nothing : bytes.data());
}

ULONG length(ByteView bytes) { return checked_cast<std::int32_t>(bytes.size()); }

struct CipherKey {
  using Handle = BCRYPT_KEY_HANDLE;
  static void close(BCRYPT_KEY_HANDLE key) noexcept { BCryptDestroyKey(key); }
};

Owned<CipherKey> import_key(BCRYPT_ALG_HANDLE cipher, const Cryptography::Key& key) {
  Owned<CipherKey> imported;
  require(BCryptGenerateSymmetricKey(cipher, imported.receive(), nullptr, 0, pointer(key), length(key), 0));
  return imported;
}

BCRYPT_AUTHENTICATED_CIPHER_MODE_INFO mode_info(const Cryptography::Nonce& nonce, ByteView associated,
                                                const Cryptography::Tag& tag) {
  BCRYPT_AUTHENTICATED_CIPHER_MODE_INFO info;
  BCRYPT_INIT_AUTH_MODE_INFO(info);
  info.pbNonce = pointer(nonce);
  info.cbNonce = length(nonce);
  info.pbAuthData = pointer(associated);
  info.cbAuthData = length(associated);
  info.pbTag = pointer(tag);
  info.cbTag = length(tag);
  return info;
}

}  // namespace

void Win32RandomSource::fill(std::span<std::uint8_t> bytes) {
  load_cryptography();
  require(BCryptGenRandom(nullptr, pointer(bytes), length(bytes), BCRYPT_USE_SYSTEM_PREFERRED_RNG));
}

void CipherProvider::close(void* provider) noexcept { BCryptCloseAlgorithmProvider(provider, 0); }

void* Win32Cryptography::cipher() {
  if (cipher_) return cipher_.get();
  Owned<CipherProvider> opened;
  load_cryptography();
  require(BCryptOpenAlgorithmProvider(opened.receive(), BCRYPT_AES_ALGORITHM, nullptr, 0));
  std::array<wchar_t, sizeof BCRYPT_CHAIN_MODE_GCM / sizeof(wchar_t)> mode{BCRYPT_CHAIN_MODE_GCM};
  require(BCryptSetProperty(opened.get(), BCRYPT_CHAINING_MODE, reinterpret_cast<UCHAR*>(mode.data()), sizeof mode, 0));
  cipher_ = std::move(opened);
  return cipher_.get();
}

Cryptography::Tag Win32Cryptography::seal(const Key& key, const Nonce& nonce, ByteView associated,
                                          std::span<std::uint8_t> data) {
  const Owned<CipherKey> handle = import_key(cipher(), key);
  Tag tag{};
  auto info = mode_info(nonce, associated, tag);
  ULONG written = 0;
  require(BCryptEncrypt(handle.get(), pointer(data), length(data), &info, nullptr, 0, pointer(data), length(data),
                        &written, 0));
  return tag;
}

bool Win32Cryptography::open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
                             const Tag& tag) {
  const Owned<CipherKey> handle = import_key(cipher(), key);
  auto info = mode_info(nonce, associated, tag);
  ULONG written = 0;
  const NTSTATUS status = BCryptDecrypt(handle.get(), pointer(data), length(data), &info, nullptr, 0, pointer(data),
                                        length(data), &written, 0);
  if (status == static_cast<NTSTATUS>(0xC000A002)) return false;  // STATUS_AUTH_TAG_MISMATCH
  require(status);
  return true;
}

Cryptography::Key Win32Cryptography::derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) {
  Owned<CipherProvider> hash;
  load_cryptography();
  require(BCryptOpenAlgorithmProvider(hash.receive(), BCRYPT_SHA256_ALGORITHM, nullptr, BCRYPT_ALG_HANDLE_HMAC_FLAG));
  Key key{};
  require(BCryptDeriveKeyPBKDF2(hash.get(), pointer(pass_phrase), length(pass_phrase), pointer(salt), length(salt),
                                rounds, key.data(), length(key), 0));
  return key;
}

}  // namespace win32

std::unique_ptr<RandomSource> make_random_source() { return std::make_unique<win32::Win32RandomSource>(); }

std::unique_ptr<Cryptography> make_cryptography() { return std::make_unique<win32::Win32Cryptography>(); }

}  // namespace talutil
