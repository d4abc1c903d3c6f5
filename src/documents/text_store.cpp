#include "documents/text_store.hpp"

#include <algorithm>
#include <utility>

namespace talutil {

TextView TextStore::keep(TextView text) {
  constexpr std::size_t block = 1U << 15U;
  if (text.empty()) return {};
  if (text.size() > room_) {
    // A long text has a block of its own, so that what remains of the last one is not lost.
    const bool is_long = text.size() > block / 4;
    char16_t* const start =
        blocks_.emplace_back(std::make_unique_for_overwrite<char16_t[]>(is_long ? text.size() : block)).get();
    if (is_long) return {start, static_cast<std::size_t>(std::ranges::copy(text, start).out - start)};
    free_ = start;
    room_ = block;
  }
  room_ -= text.size();
  char16_t* const start = std::exchange(free_, free_ + text.size());
  std::ranges::copy(text, start);
  return {start, text.size()};
}

}  // namespace talutil
