#pragma once

#include "platform/platform.hpp"

namespace talutil {

/// Makes the controls that forms hold, keyed by the class names that hosts know. Ours are built in; another
/// maker's takes the place of one when the user has registered it under that name.
class ControlFactory {
 public:
  explicit ControlFactory(const Platform& platform) : platform_(platform) {}

  /// A new control. Raises 429 for a class name nobody makes.
  [[nodiscard]] ObjectRef create(TextView class_name) const;

 private:
  const Platform& platform_;
};

}  // namespace talutil
