#pragma once

#include "platform/platform.hpp"

namespace talutil::com {

/// Third-party controls. One stands for a class name when the user, or the machine, has a string value of
/// that name in the registry key Software\TALUtil\Controls, holding the program identifier or the class
/// identifier of the control to use; an elevated program goes by the machine's alone. Nothing else is ever created in
/// place of our own controls.
class RegisteredControls final : public ControlMakers {
 public:
  ObjectRef create(TextView class_name) override;
};

}  // namespace talutil::com
