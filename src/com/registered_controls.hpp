#pragma once

#include "platform/platform.hpp"

namespace talutil::com {

/// Third-party controls. A control replaces ours if the user or the machine has a string value of the class's name in
/// the registry key Software\TALUtil\Controls, with the control's program identifier or class identifier. An elevated
/// program uses only the machine's key. Nothing else is ever created in place of our own controls.
class RegisteredControls final : public ControlMakers {
 public:
  bool may_have_any() override;
  ObjectRef create(TextView class_name) override;
};

}  // namespace talutil::com
