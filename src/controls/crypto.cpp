#include "controls/crypto.hpp"

#include "controls/cipher_text.hpp"

namespace talutil {

namespace {

void require(bool is_known) {
  if (!is_known) raise(ErrorNumber::invalid_procedure_call);
}

/// The same error whatever is wrong with a cipher text, so as not to reveal which check failed.
template <class T>
T opened(std::optional<T> result) {
  if (!result) {
    throw RunTimeError(ErrorNumber::invalid_procedure_call,
                       u"This is not a cipher text of this library, or it was changed");
  }
  return std::move(*result);
}

Variant data_object(Bytes bytes, const Locale& locale) {
  return ObjectRef(std::make_shared<CryptoData>(std::move(bytes), locale));
}

}  // namespace

Text CryptoData::Read(const std::int32_t& Format) const {
  if (Format == encoded) return cipher_text::encode(bytes_);
  require(Format == plain);
  return opened(cipher_text::to_text(bytes_));
}

const Bytes& CryptoKey::checked_input(std::int32_t algorithm, const Variant& data, Boolean final) const {
  require(Mode == counter_mode && Padding == no_padding && algorithm == aes && final);
  const ObjectRef* const reference = data.get_if<ObjectRef>();
  const auto* const input = reference == nullptr ? nullptr : dynamic_cast<const CryptoData*>(reference->get());
  if (input == nullptr) raise(ErrorNumber::type_mismatch);
  return input->bytes();
}

Variant CryptoKey::Encrypt(const std::int32_t& Algorithm, const Variant& Data, const Boolean& Final) const {
  const Bytes& plain = checked_input(Algorithm, Data, Final);
  Cryptography::Nonce nonce{};
  platform_.random_source.fill(nonce);
  return data_object(cipher_text::seal(plain, key_, nonce, platform_.cryptography), locale());
}

Variant CryptoKey::Decrypt(const std::int32_t& Algorithm, const Variant& Data, const Boolean& Final) const {
  return data_object(opened(cipher_text::open(checked_input(Algorithm, Data, Final), key_, platform_.cryptography)),
                     locale());
}

Variant Crypto::CreateKey(const Text& PassPhrase, const std::int32_t& KeyBits, const std::int32_t& Derivation) const {
  require(KeyBits == key_bits && Derivation == from_pass_phrase);
  return ObjectRef(std::make_shared<CryptoKey>(platform_, cipher_text::key_of(PassPhrase, platform_.cryptography)));
}

Variant Crypto::CreateData(const Text& Source, const std::int32_t& Format) const {
  if (Format == CryptoData::encoded) return data_object(opened(cipher_text::decode(Source)), locale());
  require(Format == CryptoData::plain);
  return data_object(cipher_text::to_bytes(Source), locale());
}

}  // namespace talutil
