#pragma once

#include "platform/input_boxes.hpp"

namespace talutil::win32 {

class Win32InputBoxes final : public InputBoxes {
 public:
  [[nodiscard]] std::optional<Text> ask(TextView prompt, TextView title, Entry entry) override;
};

}  // namespace talutil::win32
