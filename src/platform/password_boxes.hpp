#pragma once

#include <optional>

#include "automation/text.hpp"

namespace talutil {

class PasswordBoxes {
 public:
  virtual ~PasswordBoxes() = default;

  /// Asks for a text that is not shown while it is typed. Nothing when the box is cancelled, or where there is nobody
  /// to ask.
  [[nodiscard]] virtual std::optional<Text> ask(TextView prompt, TextView title) = 0;
};

}  // namespace talutil
