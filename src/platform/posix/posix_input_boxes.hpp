#pragma once

#include "platform/input_boxes.hpp"

namespace talutil::posix {

/// Asks at the terminal, without echo for masked entries.
class PosixInputBoxes final : public InputBoxes {
 public:
  [[nodiscard]] std::optional<Text> ask(TextView prompt, TextView title, Entry entry) override;
};

}  // namespace talutil::posix
