#include <gtest/gtest.h>

#include "automation/control.hpp"
#include "controls/cipher_text.hpp"
#include "infoforms/frm_components.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

constexpr TextView pass_phrase = u"w4Tq%Lp2#Zr9!Kb7&Nt8*Hy3@Jm5^Xc1";

struct Vector {
  std::uint8_t first_of_nonce;  ///< The bytes of a nonce count up from here.
  Text plain;
  Text cipher;
};

// Made by another program from the description in docs/cipher-text.md.
const Vector vectors[] = {
    {0x00, u"a", u"AQABAgMEBQYHCAkKC99eTG3otllE5jGb/DZq8J6cmg=="},
    {0x10, u"The quick brown fox, 12/03/2009",
     u"ARAREhMUFRYXGBkaG0JX5dKm8k7O7CBW0r5jr37F+7FmbowgTbgeaA8gbD9EsmFg20fgICLldWLP7//FDcsjrJSkRBK4a9r6mg5aB0S/"
     u"LfxNGKS7lWuBNIZTcQ=="},
};

using Encryption = UtilsTest;

TEST_F(Encryption, VectorsInBothDirections) {
  for (const Vector& vector : vectors) {
    Cryptography::Nonce nonce{};
    for (std::size_t i = 0; i < nonce.size(); ++i) nonce[i] = static_cast<std::uint8_t>(vector.first_of_nonce + i);
    const auto& key = cipher_text::key_of(pass_phrase, *platform.cryptography);
    const Bytes sealed = cipher_text::seal(cipher_text::to_bytes(vector.plain), key, nonce, *platform.cryptography);
    EXPECT_EQ(cipher_text::encode(sealed), vector.cipher);
    EXPECT_EQ(utils.CryptoDecryptString(vector.cipher), vector.plain);
  }
  EXPECT_EQ(utils.CryptoDecryptString(u"AQAAAAAAAAAAAAAAAA3eQxzWshiVMcK8SGvKN5rQ4acn"), Text({u'\xD83D', u'A'}));
}

// What comes back, and that a changed text does not, is for the fuzzer.
TEST_F(Encryption, NoTextIsSealedTwiceInTheSameWayAndAnEmptyOneNotAtAll) {
  EXPECT_EQ(utils.CryptoEncryptString(u"") + utils.CryptoDecryptString(u""), u"");
  EXPECT_EQ(platform.open_windows, 0) << "the control is not touched";
  EXPECT_NE(utils.CryptoEncryptString(u"x"), utils.CryptoEncryptString(u"x"));
}

TEST_F(Encryption, WhatIsNoCipherTextIsRejected) {
  const Text good = vectors[0].cipher;
  // Bits that the padding leaves over, another version, an odd number of bytes, characters beyond the table, a blank.
  const auto& key = cipher_text::key_of(pass_phrase, *platform.cryptography);
  const Bytes odd = cipher_text::seal(Bytes{1, 2, 3}, key, {}, *platform.cryptography);
  for (const Text& cipher :
       {Text(u"AQABAgMEBQYHCAkKC99eTG3otllE5jGb/DZq8J6cmh=="), u"Ag" + good.substr(2), cipher_text::encode(odd),
        Text(u"\u0410\u0410\u0410\u0410"), Text(60, u'A'), good + u" "}) {
    EXPECT_EQ(error_of([&] { (void)utils.CryptoDecryptString(cipher); }), 5) << to_utf8(cipher);
  }
}

TEST_F(Encryption, TheControlKnowsItsCodesAndNoOthers) {
  const Control crypto(library.components().control(u"Crypto1"), plain_numbers);
  const Control key(crypto.call(u"CreateKey", {u"pass", 256, 1}), plain_numbers);
  const Control data(crypto.call(u"CreateData", {u"text", 3}), plain_numbers);
  const Variant input(data.object());
  const auto encrypt = [&](std::int32_t algorithm, const Variant& given, bool final) {
    return error_of([&] { key.call(u"Encrypt", {algorithm, given, Boolean(final)}); });
  };
  EXPECT_EQ(encrypt(9, input, true), 5) << "before the options are set";
  key.put(u"Mode", 1);
  key.put(u"Padding", 2);
  EXPECT_EQ(encrypt(9, input, true), 0);
  EXPECT_EQ(encrypt(8, input, true), 5);
  EXPECT_EQ(encrypt(9, input, false), 5);
  EXPECT_EQ(encrypt(9, u"text", true), 13);
  EXPECT_EQ(encrypt(9, key.object(), true), 13);
  EXPECT_EQ(error_of([&] { crypto.call(u"CreateKey", {u"pass", 128, 1}); }), 5);
  EXPECT_EQ(error_of([&] { crypto.call(u"CreateKey", {u"pass", 256, 0}); }), 5);
  EXPECT_EQ(error_of([&] { crypto.call(u"CreateData", {u"text", 2}); }), 5);
  EXPECT_EQ(error_of([&] { data.call(u"Read", {2}); }), 5);
  // The key of one pass phrase does not open what that of another has closed.
  const Control mine(crypto.call(u"CreateData", {vectors[0].cipher, 1}), plain_numbers);
  EXPECT_EQ(error_of([&] { key.call(u"Decrypt", {9, mine.object(), Boolean(true)}); }), 5);
}

}  // namespace
}  // namespace talutil::testing
