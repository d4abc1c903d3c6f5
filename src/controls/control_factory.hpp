#pragma once

#include "platform/platform.hpp"

namespace talutil {

/// Creates the controls that forms contain, by the class names that hosts know. Ours are built in; a third-party
/// control replaces one of them if the user has registered it under that name.
class ControlFactory {
 public:
  explicit ControlFactory(const Platform& platform) : platform_(platform) {}

  /// Creates a control. Raises 429 for an unknown class name.
  [[nodiscard]] ObjectRef create(TextView class_name) const;

  /// Creates our own control, whatever is registered in its place.
  [[nodiscard]] ObjectRef create_own(TextView class_name) const;

 private:
  const Platform& platform_;
};

}  // namespace talutil
