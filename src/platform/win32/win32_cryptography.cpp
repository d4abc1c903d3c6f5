#include "platform/win32/win32_cryptography.hpp"

#include <array>
#include <type_traits>

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "platform/win32/handle.hpp"
#include "platform/win32/windows.hpp"
// After windows.h.
#include <bcrypt.h>

namespace talutil {

namespace win32 {

namespace {

/// The import is delayed until the first call, which would then look for the library by its bare name.
void load_cryptography() {
  if (GetModuleHandleW(L"bcrypt.dll") == nullptr) static_cast<void>(system_library(L"bcrypt.dll"));
}

void require(NTSTATUS status) {
  if (status < 0) raise(ErrorNumber::internal_error);
}

// The calls take writable pointers also for what they only read, and none may be null.
UCHAR* pointer(ByteView bytes) noexcept {
  static constexpr UCHAR nothing = 0;
  return const_cast<UCHAR*>(bytes.empty() ? &nothing : bytes.data());
}

ULONG length(ByteView bytes) { return checked_cast<std::int32_t>(bytes.size()); }

struct CloseAlgorithm {
  void operator()(BCRYPT_ALG_HANDLE handle) const noexcept { BCryptCloseAlgorithmProvider(handle, 0); }
};
struct DestroyKey {
  void operator()(BCRYPT_KEY_HANDLE handle) const noexcept { BCryptDestroyKey(handle); }
};
using Algorithm = std::unique_ptr<void, CloseAlgorithm>;
using KeyHandle = std::unique_ptr<void, DestroyKey>;

KeyHandle import_key(BCRYPT_ALG_HANDLE cipher, const Cryptography::Key& key) {
  BCRYPT_KEY_HANDLE handle = nullptr;
  require(BCryptGenerateSymmetricKey(cipher, &handle, nullptr, 0, pointer(key), length(key), 0));
  return KeyHandle(handle);
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

Win32Cryptography::~Win32Cryptography() {
  if (cipher_ != nullptr) BCryptCloseAlgorithmProvider(cipher_, 0);
}

void* Win32Cryptography::cipher() {
  if (cipher_ != nullptr) return cipher_;
  BCRYPT_ALG_HANDLE handle = nullptr;
  load_cryptography();
  require(BCryptOpenAlgorithmProvider(&handle, BCRYPT_AES_ALGORITHM, nullptr, 0));
  Algorithm opened(handle);
  std::array<wchar_t, sizeof BCRYPT_CHAIN_MODE_GCM / sizeof(wchar_t)> mode{BCRYPT_CHAIN_MODE_GCM};
  require(BCryptSetProperty(handle, BCRYPT_CHAINING_MODE, reinterpret_cast<UCHAR*>(mode.data()), sizeof mode, 0));
  return cipher_ = opened.release();
}

Cryptography::Tag Win32Cryptography::seal(const Key& key, const Nonce& nonce, ByteView associated,
                                          std::span<std::uint8_t> data) {
  const KeyHandle handle = import_key(cipher(), key);
  Tag tag{};
  auto info = mode_info(nonce, associated, tag);
  ULONG written = 0;
  require(BCryptEncrypt(handle.get(), pointer(data), length(data), &info, nullptr, 0, pointer(data), length(data),
                        &written, 0));
  return tag;
}

bool Win32Cryptography::open(const Key& key, const Nonce& nonce, ByteView associated, std::span<std::uint8_t> data,
                             const Tag& tag) {
  const KeyHandle handle = import_key(cipher(), key);
  auto info = mode_info(nonce, associated, tag);
  ULONG written = 0;
  const NTSTATUS status = BCryptDecrypt(handle.get(), pointer(data), length(data), &info, nullptr, 0, pointer(data),
                                        length(data), &written, 0);
  if (status == static_cast<NTSTATUS>(0xC000A002)) return false;  // STATUS_AUTH_TAG_MISMATCH
  require(status);
  return true;
}

Cryptography::Key Win32Cryptography::derive_key(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) {
  BCRYPT_ALG_HANDLE handle = nullptr;
  load_cryptography();
  require(BCryptOpenAlgorithmProvider(&handle, BCRYPT_SHA256_ALGORITHM, nullptr, BCRYPT_ALG_HANDLE_HMAC_FLAG));
  const Algorithm hash(handle);
  Key key{};
  require(BCryptDeriveKeyPBKDF2(hash.get(), pointer(pass_phrase), length(pass_phrase), pointer(salt), length(salt),
                                rounds, key.data(), length(key), 0));
  return key;
}

}  // namespace win32

std::unique_ptr<RandomSource> make_random_source() { return std::make_unique<win32::Win32RandomSource>(); }

std::unique_ptr<Cryptography> make_cryptography() { return std::make_unique<win32::Win32Cryptography>(); }

}  // namespace talutil
