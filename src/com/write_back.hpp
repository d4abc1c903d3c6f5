#pragma once

#include "com/variant_bridge.hpp"

namespace talutil::com {

/// Where a variant argument's value lies: what its chain of references ends at. Two arguments with the same place are
/// one variable of the caller's. A null pointer for a value that is passed as such.
[[nodiscard]] const void* variable_of(const VARIANT& argument) noexcept;

/// A value on its way back to the caller's variable. All values are made before the first is stored, so that an error
/// leaves every variable as it was.
class WriteBack {
 public:
  /// The argument refers to a variable of its own type, which it keeps, or to a variant, which takes the value's type
  /// unless it refers to a typed variable in its turn. Raises what the conversions of Variant raise, and 10 for an
  /// array that is fixed or locked.
  WriteBack(const VARIANT& argument, const Variant& value, const Locale& locale);

  /// The same for a caller's variant by its address, as early-bound callers pass it.
  WriteBack(VARIANT* variable, const Variant& value, const Locale& locale);

  void store() noexcept;

 private:
  void make(VARIANT& variable, const Variant& value, const Locale& locale);
  void make_typed(const Variant& value, const Locale& locale);
  void store_typed() noexcept;

  VARIANT* variable_ = nullptr;
  OwnedVariant native_;
  SystemTime* record_ = nullptr;  ///< The caller's, where it is a record that was written.
  SystemTime time_;
};

}  // namespace talutil::com
