#pragma once

#include <memory>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// Keeps texts one after the other in large blocks, where they stay until the store is destroyed, even if it is moved.
/// A text takes no more than its characters, unlike one that is allocated by itself.
class TextStore {
 public:
  /// Copies a text into the store.
  TextView keep(TextView text);

 private:
  std::vector<std::unique_ptr<char16_t[]>> blocks_;
  char16_t* free_ = nullptr;  ///< What remains of the last block that is not full.
  std::size_t room_ = 0;
};

}  // namespace talutil
