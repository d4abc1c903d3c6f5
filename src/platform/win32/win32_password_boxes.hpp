#pragma once

#include "platform/password_boxes.hpp"

namespace talutil::win32 {

class Win32PasswordBoxes final : public PasswordBoxes {
 public:
  [[nodiscard]] std::optional<Text> ask(TextView prompt, TextView title) override;
};

}  // namespace talutil::win32
