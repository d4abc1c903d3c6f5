#pragma once

#include "platform/input_boxes.hpp"
#include "platform/posix/terminal.hpp"

namespace talutil::posix {

/// Asks at the terminal, without echo for masked entries.
class PosixInputBoxes final : public InputBoxes {
 public:
  explicit PosixInputBoxes(const Terminal& terminal) noexcept : terminal_(terminal) {}

  [[nodiscard]] std::optional<Text> ask(TextView prompt, TextView title, Entry entry) override;

 private:
  const Terminal& terminal_;
};

}  // namespace talutil::posix
