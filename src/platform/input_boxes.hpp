#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// Whether a text is shown while it is typed.
enum class Entry : std::uint8_t { shown, masked };

class InputBoxes {
 public:
  virtual ~InputBoxes() = default;

  /// Asks for a text. Returns nothing if the box is cancelled or there is nobody to ask.
  [[nodiscard]] virtual std::optional<Text> ask(TextView prompt, TextView title, Entry entry) = 0;
};

}  // namespace talutil
