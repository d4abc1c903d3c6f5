#pragma once

#include "com/variant_bridge.hpp"

namespace talutil::com {

/// The address of a variant argument's value, at the end of its chain of references. Arguments with the same address
/// are the same variable of the caller. Null for a value that is not passed by reference.
[[nodiscard]] const void* variable_of(const VARIANT& argument) noexcept;

/// Writes a value back to the caller's variable. All values are converted before the first is stored, so that an error
/// leaves every variable unchanged.
class WriteBack {
 public:
  /// The argument refers either to a typed variable, which keeps its type, or to a variant, which takes the value's
  /// type unless it in turn refers to a typed variable. Raises the errors of the conversions, and 10 for an array that
  /// is fixed or locked.
  WriteBack(const VARIANT& argument, const Variant& value, const Locale& locale);

  /// The same for the address of a caller's variant, as early-bound callers pass it.
  WriteBack(VARIANT* variable, const Variant& value, const Locale& locale);

  void store() noexcept;

 private:
  void make(VARIANT& variable, const Variant& value, const Locale& locale);
  void make_typed(const Variant& value, const Locale& locale);
  void store_typed() noexcept;

  VARIANT* variable_ = nullptr;
  OwnedVariant native_;
  SystemTime* record_ = nullptr;  ///< The caller's record, if a record was written.
  SystemTime time_;
};

}  // namespace talutil::com
