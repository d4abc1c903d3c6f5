#pragma once

#include "automation/text.hpp"

namespace talutil {

class Guids {
 public:
  virtual ~Guids() = default;

  /// A new GUID in registry format: 38 characters, upper-case hexadecimal digits in braces.
  [[nodiscard]] virtual Text make() = 0;
};

}  // namespace talutil
