// Checks what must hold for any cipher text: cipher_fuzz -max_len=512 -runs=1000000
#include <optional>

#include "automation/run_time_error.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

/// Returns nothing if the text is rejected, which must be with the one possible error.
std::optional<Text> decrypted(ORVUtils& utils, const Text& cipher) {
  try {
    return utils.CryptoDecryptString(cipher);
  } catch (const RunTimeError& error) {
    require(error.number() == 5 && error.description().starts_with(u"This is not a cipher text"), "the one error");
    return std::nullopt;
  }
}

void check(fuzz::Input input) {
  // One for all runs, as in a host: the key is derived once.
  static fuzz::Host host;
  ORVUtils& utils = host.utils();

  const std::size_t place = input.byte() | input.byte() << 8;
  const Text change = input.text(4);
  const Text text = input.text(255);
  require(text.empty() || !decrypted(utils, text), "a foreign text does not open");
  if (text.empty()) return;

  const Text cipher = utils.CryptoEncryptString(text);
  require(decrypted(utils, cipher) == text, "what was encrypted comes back");
  Text changed = cipher;
  changed.replace(place % cipher.size(), change.size(), change);
  require(changed == cipher || !decrypted(utils, changed), "a changed text does not open");
  require(!decrypted(utils, cipher.substr(0, 1 + place % (cipher.size() - 1))), "a cut text does not open");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u"AQABaz019+/= \r\n"});
  return 0;
}
