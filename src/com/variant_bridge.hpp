#pragma once

#include <utility>

#include "automation/variant.hpp"
#include "platform/win32/windows.hpp"

/// Values on their way between automation's own types and ours.
namespace talutil::com {

/// An automation string that is owned until it is released to the caller.
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

/// A VARIANT that is cleared at its end.
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

/// How arrays of texts are written: as automation declares them, or as arrays of variants, the only ones that
/// a script can index.
enum class ArrayStyle { of_texts, of_variants };

/// An array that is destroyed at its end.
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

/// An array of texts or of variants (each converted to text). Raises 13 for other elements and 9 for other than
/// one dimension. A null pointer is an array that was never allocated.
[[nodiscard]] TextArray array_from(SAFEARRAY* array, const Locale& locale);

/// Raises 10 for an array that cannot be exchanged for another: one of fixed size, or locked by its owner.
void require_resizable(const SAFEARRAY* array);

/// The value of a VARIANT, references followed. Raises 5 for a reference that points nowhere or in circles,
/// and 13 for a type that automation has no conversion for.
[[nodiscard]] Variant variant_from(const VARIANT& value);

[[nodiscard]] OwnedVariant native_from(const Variant& value, ArrayStyle style);

/// The library's record of that type in a VARIANT, by value or by reference: the caller's own, which is read and
/// written where it lies. A null pointer for anything else.
[[nodiscard]] SystemTime* system_time_of(const VARIANT& value) noexcept;

/// A reference may lead to a variant that is a reference again, but honest callers stop after one or two.
constexpr int most_references = 8;

/// The end of a chain of references to variants. Raises 5 for one that leads nowhere or in circles.
[[nodiscard]] const VARIANT& resolved(const VARIANT& value);

}  // namespace talutil::com
