#pragma once

#include <map>

#include "platform/platform.hpp"

namespace talutil {

/// Makes the controls that forms hold, keyed by the class names that hosts know. Ours are built in; another
/// maker's takes the place of one when the user has registered it under that name.
class ControlFactory {
 public:
  using Maker = ObjectRef (*)(const Platform& platform);

  explicit ControlFactory(const Platform& platform);

  /// Puts a maker in the place of the one that stood under the class name.
  void register_maker(TextView class_name, Maker maker);

  /// A new control. Raises 429 for a class name nobody makes.
  [[nodiscard]] ObjectRef create(TextView class_name) const;

 private:
  const Platform& platform_;
  std::map<Text, Maker, std::less<>> makers_;
};

}  // namespace talutil
