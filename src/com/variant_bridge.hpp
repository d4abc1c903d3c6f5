#pragma once

#include <utility>

#include "automation/variant.hpp"
#include "platform/win32/windows.hpp"

/// Conversion of values between automation's types and the library's.
namespace talutil::com {

/// An automation string, owned until it is passed to the caller.
class OwnedText {
 public:
  OwnedText() = default;
  explicit OwnedText(TextView text);
  OwnedText(OwnedText&& other) noexcept : text_(std::exchange(other.text_, nullptr)) {}
  OwnedText& operator=(OwnedText&& other) noexcept {
    std::swap(text_, other.text_);
    return *this;
  }
  ~OwnedText() { SysFreeString(text_); }

  [[nodiscard]] BSTR get() const noexcept { return text_; }
  [[nodiscard]] BSTR release() noexcept { return std::exchange(text_, nullptr); }

 private:
  BSTR text_ = nullptr;
};

/// A VARIANT that the destructor clears.
class OwnedVariant {
 public:
  OwnedVariant() noexcept { VariantInit(&value_); }
  OwnedVariant(OwnedVariant&& other) noexcept : value_(other.value_) { VariantInit(&other.value_); }
  OwnedVariant& operator=(OwnedVariant&& other) noexcept {
    std::swap(value_, other.value_);
    return *this;
  }
  ~OwnedVariant() { VariantClear(&value_); }

  [[nodiscard]] VARIANT& get() noexcept { return value_; }
  [[nodiscard]] const VARIANT& get() const noexcept { return value_; }
  [[nodiscard]] VARIANT release() noexcept {
    const VARIANT result = value_;
    VariantInit(&value_);
    return result;
  }

 private:
  VARIANT value_;
};

/// The type of arrays of texts: as automation declares them, or arrays of variants, the only ones that scripts can
/// index.
enum class ArrayStyle { of_texts, of_variants };

/// An array that the destructor destroys.
class OwnedArray {
 public:
  OwnedArray() = default;
  OwnedArray(const TextArray& array, ArrayStyle style);
  OwnedArray(OwnedArray&& other) noexcept : array_(std::exchange(other.array_, nullptr)) {}
  OwnedArray& operator=(OwnedArray&& other) noexcept {
    std::swap(array_, other.array_);
    return *this;
  }
  ~OwnedArray() {
    if (array_ != nullptr) SafeArrayDestroy(array_);
  }

  [[nodiscard]] SAFEARRAY* get() const noexcept { return array_; }
  [[nodiscard]] SAFEARRAY* release() noexcept { return std::exchange(array_, nullptr); }

 private:
  SAFEARRAY* array_ = nullptr;
};

[[nodiscard]] Text text_from(BSTR text);

/// Converts an array of texts or variants (each converted to text). Raises 13 for other elements and 9 unless it has
/// one dimension. A null pointer is an array that was never allocated.
[[nodiscard]] TextArray array_from(SAFEARRAY* array, const Locale& locale);

/// Raises 10 if an array cannot be replaced: if it has a fixed size or is locked by its owner.
void require_resizable(const SAFEARRAY* array);

/// The value of a VARIANT; follows references. Raises 5 for a null or circular reference, and 13 for a type that
/// automation cannot convert.
[[nodiscard]] Variant variant_from(const VARIANT& value);

[[nodiscard]] OwnedVariant native_from(const Variant& value, ArrayStyle style);

/// The SystemTime record in a VARIANT, by value or by reference: the caller's own, to be read and written in place.
/// Null for anything else.
[[nodiscard]] SystemTime* system_time_of(const VARIANT& value) noexcept;

/// A reference may lead to another reference to a variant, but well-behaved callers stop after one or two.
constexpr int most_references = 8;

/// The end of a chain of references to variants. Raises 5 if it is null or circular.
[[nodiscard]] const VARIANT& resolved(const VARIANT& value);

}  // namespace talutil::com
