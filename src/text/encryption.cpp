#include "automation/control.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// The same in every installation, so that each can read the others' cipher texts.
constexpr TextView pass_phrase = u"w4Tq%Lp2#Zr9!Kb7&Nt8*Hy3@Jm5^Xc1";

// Arguments for the encryption control on the components window; a third-party control in its place uses the same
// codes.
constexpr std::int32_t key_bits = 256;
constexpr std::int32_t key_derivation = 1;
constexpr std::int32_t key_mode = 1;
constexpr std::int32_t key_padding = 2;
constexpr std::int32_t algorithm = 9;
constexpr std::int32_t encoded_text = 1;
constexpr std::int32_t plain_text = 3;

/// Applies an operation of the control's key to a text. All objects created for this are released before it returns.
Text transform(const ORVUtils& utils, TextView operation, const Text& source, std::int32_t from, std::int32_t to) {
  const Locale locale = utils.locale();
  const Control crypto(utils.library().components().control(u"Crypto1"), locale);
  const Control key(crypto.call(u"CreateKey", {pass_phrase, key_bits, key_derivation}), locale);
  key.put(u"Mode", key_mode);
  key.put(u"Padding", key_padding);
  const Control input(crypto.call(u"CreateData", {source, from}), locale);
  const Control output(key.call(operation, {algorithm, input.object(), Boolean(true)}), locale);
  return output.call(u"Read", {to}).to_text(locale);
}

}  // namespace

Text ORVUtils::CryptoEncryptString(const Text& sSourceString) {
  if (sSourceString.empty()) return {};
  return transform(*this, u"Encrypt", sSourceString, plain_text, encoded_text);
}

Text ORVUtils::CryptoDecryptString(const Text& sSourceString) {
  if (sSourceString.empty()) return {};
  return transform(*this, u"Decrypt", sSourceString, encoded_text, plain_text);
}

}  // namespace talutil
