#pragma once

#include <compare>
#include <cstdint>
#include <memory>
#include <optional>
#include <variant>
#include <vector>

#include "automation/boolean.hpp"
#include "automation/date.hpp"
#include "automation/locale.hpp"
#include "automation/numbers.hpp"
#include "automation/object.hpp"
#include "automation/system_time.hpp"
#include "automation/text.hpp"

namespace talutil {

/// A one-dimensional array of texts with a lower bound. An array that was never allocated has no bounds, unlike one
/// without elements.
struct TextArray {
  std::vector<Text> items;
  std::int32_t lower_bound = 0;
  bool allocated = false;

  /// The highest index. Raises 9 for an unallocated array.
  [[nodiscard]] std::int32_t upper_bound() const;

  /// The element at an index. Raises 9 if it is out of bounds.
  [[nodiscard]] const Text& at(std::int32_t index) const;

  friend bool operator==(const TextArray&, const TextArray&) = default;
};

struct Null {
  friend constexpr bool operator==(Null, Null) noexcept = default;
};

/// An error value; also used for an argument that the caller left out.
struct ErrorValue {
  std::int32_t code = 0;
  friend constexpr bool operator==(ErrorValue, ErrorValue) noexcept = default;
};

/// An array of other elements than texts. It can be passed on, but not converted.
struct ForeignArray {
  /// The platform's copy, to be passed back; shared by copies of this value.
  std::shared_ptr<const void> contents;
  friend bool operator==(const ForeignArray&, const ForeignArray&) noexcept = default;
};

/// The automation variant as a value. Conversions follow automation's rules: halves round to even, out of range raises
/// 6, unconvertible 13, Null 94, an empty object reference 91. An object stands for the value of its default member.
class Variant {
 public:
  enum class Kind : std::uint8_t {
    empty,
    null,
    boolean,
    byte,
    int16,
    int32,
    single,
    double_,
    currency,
    date,
    text,
    error,
    system_time,
    text_array,
    foreign_array,
    object
  };

  Variant() noexcept = default;
  Variant(Null value) noexcept : storage_(value) {}
  Variant(Boolean value) noexcept : storage_(value) {}
  Variant(std::uint8_t value) noexcept : storage_(value) {}
  Variant(std::int16_t value) noexcept : storage_(value) {}
  Variant(std::int32_t value) noexcept : storage_(value) {}
  Variant(float value) noexcept : storage_(value) {}
  Variant(double value) noexcept : storage_(value) {}
  Variant(Currency value) noexcept : storage_(value) {}
  Variant(Date value) noexcept : storage_(value) {}
  Variant(Text value) noexcept : storage_(std::move(value)) {}
  Variant(TextView value) : storage_(Text(value)) {}
  Variant(const char16_t* value) : storage_(Text(value)) {}
  Variant(ErrorValue value) noexcept : storage_(value) {}
  Variant(SystemTime value) noexcept : storage_(value) {}
  Variant(TextArray value) noexcept : storage_(std::move(value)) {}
  Variant(ForeignArray value) noexcept : storage_(std::move(value)) {}
  Variant(ObjectRef value) noexcept : storage_(std::move(value)) {}
  Variant(bool) = delete;
  Variant(const void*) = delete;

  [[nodiscard]] Kind kind() const noexcept { return static_cast<Kind>(storage_.index()); }
  [[nodiscard]] bool is(Kind wanted) const noexcept { return kind() == wanted; }

  template <class T>
  [[nodiscard]] const T* get_if() const noexcept {
    return std::get_if<T>(&storage_);
  }
  template <class T>
  [[nodiscard]] T* get_if() noexcept {
    return std::get_if<T>(&storage_);
  }

  template <class Visitor>
  decltype(auto) visit(Visitor&& visitor) const {
    return std::visit(std::forward<Visitor>(visitor), storage_);
  }

  /// The value itself, or the value of an object's default member (through several objects if necessary). Raises 91 for
  /// an empty object reference and 438 for an object without a default member.
  [[nodiscard]] Variant value() const;

  [[nodiscard]] Text to_text(const Locale& locale) const;
  [[nodiscard]] std::int16_t to_int16(const Locale& locale) const;
  [[nodiscard]] std::int32_t to_int32(const Locale& locale) const;
  [[nodiscard]] float to_single(const Locale& locale) const;
  [[nodiscard]] double to_double(const Locale& locale) const;
  [[nodiscard]] Currency to_currency(const Locale& locale) const;
  [[nodiscard]] Boolean to_boolean(const Locale& locale) const;

  /// Texts are read day first. Numbers are days.
  [[nodiscard]] Date to_date(const Locale& locale) const;

  /// True for a date and for a text that can be read as one; never for a number, Null or Empty.
  [[nodiscard]] bool is_date(const Locale& locale) const;

  /// True only for Null (for an object, if its default member is Null).
  [[nodiscard]] bool is_null() const;

  /// Compares with a text, code by code, as hosts do: any other kind is converted to text first, Empty equals the empty
  /// text, Null equals nothing. Raises 13 for an error value or an array.
  [[nodiscard]] bool equals_text(TextView text, const Locale& locale) const;

  /// Compares with a number, as hosts do: a text is read as a number (raises 13 if it is not one), Empty is 0, Null
  /// equals nothing.
  [[nodiscard]] bool equals_number(double number, const Locale& locale) const;

  /// Same kind and same value; objects are compared by identity.
  friend bool operator==(const Variant&, const Variant&) = default;

 private:
  // In the order of Kind.
  std::variant<std::monostate, Null, Boolean, std::uint8_t, std::int16_t, std::int32_t, float, double, Currency, Date,
               Text, ErrorValue, SystemTime, TextArray, ForeignArray, ObjectRef>
      storage_;
};

/// The error value for an argument that was left out.
inline constexpr ErrorValue missing_argument{static_cast<std::int32_t>(0x80020004U)};

/// Compares two variants by automation's rules: numbers (including dates and Booleans) by value, texts code by code, a
/// number is less than any text; Empty is 0 beside a number and an empty text beside a text. Unordered if either is
/// Null. Raises 13 for an error value or an array.
[[nodiscard]] std::partial_ordering compare(const Variant& a, const Variant& b);

}  // namespace talutil
