#include "platform/cryptography.hpp"

#include <algorithm>

namespace talutil {

const Cryptography::Key& Cryptography::key_for(ByteView pass_phrase, ByteView salt, std::uint32_t rounds) {
  const bool is_kept = last_ && last_->rounds == rounds && std::ranges::equal(last_->pass_phrase, pass_phrase) &&
                       std::ranges::equal(last_->salt, salt);
  if (!is_kept) {
    last_ = Derived{{pass_phrase.begin(), pass_phrase.end()},
                    {salt.begin(), salt.end()},
                    rounds,
                    derive_key(pass_phrase, salt, rounds)};
  }
  return last_->key;
}

}  // namespace talutil
