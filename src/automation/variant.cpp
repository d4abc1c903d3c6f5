#include "automation/variant.hpp"

#include <cmath>
#include <limits>

#include "automation/checked.hpp"

namespace talutil {

namespace {

template <class... Visitors>
struct Overloaded : Visitors... {
  using Visitors::operator()...;
};
template <class... Visitors>
Overloaded(Visitors...) -> Overloaded<Visitors...>;

template <class T>
[[noreturn]] void refuse(const T& /*value*/) {
  raise(std::is_same_v<T, Null> ? ErrorNumber::invalid_use_of_null : ErrorNumber::type_mismatch);
}

template <class T>
T required(std::optional<T> value) {
  if (!value) raise(ErrorNumber::type_mismatch);
  return *value;
}

/// Visits a variant, or the default value of an object in it.
template <class Visitor>
decltype(auto) visit_value(const Variant& variant, const Visitor& visitor) {
  if (variant.is(Variant::Kind::object)) return variant.value().visit(visitor);
  return variant.visit(visitor);
}

template <class T>
constexpr bool is_number = std::is_arithmetic_v<T>;

/// Converts numeric kinds to a double; rejects others.
struct ToDouble {
  double operator()(std::monostate) const noexcept { return 0; }
  double operator()(Boolean value) const noexcept { return value.bits(); }
  double operator()(Currency value) const noexcept { return static_cast<double>(value.ten_thousandths) / 10000; }
  double operator()(Date value) const noexcept { return value.days; }
  template <class T>
  double operator()(const T& value) const {
    if constexpr (is_number<T>)
      return value;
    else
      refuse(value);
  }
};

struct ToText {
  const Locale& locale;

  Text operator()(std::monostate) const { return {}; }
  Text operator()(const Text& value) const { return value; }
  Text operator()(Boolean value) const { return value ? u"True" : u"False"; }
  Text operator()(Date value) const { return date_to_text(value); }
  Text operator()(Currency value) const { return number_to_text(value, locale); }
  Text operator()(float value) const { return number_to_text(value, locale); }
  Text operator()(double value) const { return number_to_text(value, locale); }
  template <class T>
  Text operator()(const T& value) const {
    if constexpr (is_number<T>)
      return number_to_text(std::int32_t{value});
    else
      refuse(value);
  }
};

template <std::signed_integral To>
To to_integer(const Variant& variant, const Locale& locale) {
  return visit_value(variant, Overloaded{[&](const Text& text) { return required(text_to_integer<To>(text, locale)); },
                                         [](const auto& value) { return round_to<To>(ToDouble{}(value)); }});
}

float to_float(double value) {
  if (std::abs(value) > std::numeric_limits<float>::max()) raise(ErrorNumber::overflow);
  return static_cast<float>(value);
}

Boolean text_to_boolean(const Text& text, const Locale& locale) {
  if (equals_without_case(text, u"True") || text == u"#TRUE#") return Boolean(true);
  if (equals_without_case(text, u"False") || text == u"#FALSE#") return Boolean(false);
  return Boolean(required(text_to_number(text, locale)) != 0);
}

}  // namespace

std::int32_t TextArray::upper_bound() const {
  if (!allocated) raise(ErrorNumber::subscript_out_of_range);
  return checked_cast<std::int32_t>(std::int64_t{lower_bound} + static_cast<std::int64_t>(items.size()) - 1);
}

const Text& TextArray::at(std::int32_t index) const {
  if (index < lower_bound || index > upper_bound()) raise(ErrorNumber::subscript_out_of_range);
  return items[static_cast<std::size_t>(std::int64_t{index} - lower_bound)];
}

Variant Variant::value() const {
  // An object can be its own default member; no legitimate chain is this long.
  constexpr int deepest = 16;
  Variant current = *this;
  for (int depth = 0; current.is(Kind::object); ++depth) {
    const ObjectRef object = *current.get_if<ObjectRef>();
    if (!object) raise(ErrorNumber::object_variable_not_set);
    if (depth == deepest) raise(ErrorNumber::member_not_supported);
    current = object->invoke(default_member, Access::get, {});
  }
  return current;
}

Text Variant::to_text(const Locale& locale) const { return visit_value(*this, ToText{locale}); }

std::int16_t Variant::to_int16(const Locale& locale) const { return to_integer<std::int16_t>(*this, locale); }

std::int32_t Variant::to_int32(const Locale& locale) const { return to_integer<std::int32_t>(*this, locale); }

float Variant::to_single(const Locale& locale) const {
  return visit_value(*this,
                     Overloaded{[](float value) { return value; },
                                [&](const Text& text) { return to_float(required(text_to_number(text, locale))); },
                                [](const auto& value) { return to_float(ToDouble{}(value)); }});
}

double Variant::to_double(const Locale& locale) const {
  return visit_value(*this, Overloaded{[&](const Text& text) { return required(text_to_number(text, locale)); },
                                       [](const auto& value) { return ToDouble{}(value); }});
}

Currency Variant::to_currency(const Locale& locale) const {
  return visit_value(*this, Overloaded{[](Currency value) { return value; },
                                       [&](const Text& text) { return required(text_to_currency(text, locale)); },
                                       [](const auto& value) { return number_to_currency(ToDouble{}(value)); }});
}

Boolean Variant::to_boolean(const Locale& locale) const {
  return visit_value(*this, Overloaded{[](Boolean value) { return value; },
                                       [&](const Text& text) { return text_to_boolean(text, locale); },
                                       [](const auto& value) { return Boolean(ToDouble{}(value) != 0); }});
}

Date Variant::to_date(const Locale& locale) const {
  return visit_value(*this,
                     Overloaded{[](Date value) { return value; },
                                [&](const Text& text) { return required(text_to_date(text, locale.current_year)); },
                                [](const auto& value) { return to_date_checked(ToDouble{}(value)); }});
}

bool Variant::is_date(const Locale& locale) const {
  return visit_value(*this,
                     Overloaded{[](Date) { return true; },
                                [&](const Text& text) { return text_to_date(text, locale.current_year).has_value(); },
                                [](const auto&) { return false; }});
}

bool Variant::is_null() const {
  return visit_value(*this, Overloaded{[](Null) { return true; }, [](const auto&) { return false; }});
}

bool Variant::equals_number(double number, const Locale& locale) const {
  const Variant held = value();
  return !held.is(Kind::null) && held.to_double(locale) == number;
}

bool Variant::equals_text(TextView text, const Locale& locale) const {
  return visit_value(*this,
                     Overloaded{[](Null) { return false; }, [&](const Text& value) { return TextView(value) == text; },
                                [&](const auto& value) { return ToText{locale}(value) == text; }});
}

std::partial_ordering compare(const Variant& a, const Variant& b) {
  constexpr Locale any;  // Not used: no text is read as a number, and no number is written.
  const Variant left = a.value();
  const Variant right = b.value();
  if (left.is(Variant::Kind::null) || right.is(Variant::Kind::null)) return std::partial_ordering::unordered;
  const bool is_text[] = {left.is(Variant::Kind::text), right.is(Variant::Kind::text)};
  const auto empty_or_text = [](const Variant& value) {
    return value.is(Variant::Kind::text) || value.is(Variant::Kind::empty);
  };
  if ((is_text[0] || is_text[1]) && empty_or_text(left) && empty_or_text(right))
    return left.to_text(any) <=> right.to_text(any);
  // Converted even beside a text, which is always greater, so that an invalid value is rejected.
  const double numbers[] = {is_text[0] ? 1 : left.to_double(any), is_text[1] ? 1 : right.to_double(any)};
  if (is_text[0]) return std::partial_ordering::greater;
  if (is_text[1]) return std::partial_ordering::less;
  return numbers[0] <=> numbers[1];
}

}  // namespace talutil
