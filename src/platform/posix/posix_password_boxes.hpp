#pragma once

#include "platform/password_boxes.hpp"

namespace talutil::posix {

/// Asks at the terminal, which shows nothing of what is typed.
class PosixPasswordBoxes final : public PasswordBoxes {
 public:
  [[nodiscard]] std::optional<Text> ask(TextView prompt, TextView title) override;
};

}  // namespace talutil::posix
