#pragma once

#include <cstdint>
#include <initializer_list>
#include <memory>
#include <type_traits>
#include <vector>

#include "automation/variant.hpp"

namespace talutil {

/// A late-bound object as members use it: `grid.get<std::int32_t>(u"Rows")`, `grid.put(u"ColWidth", {c}, width)`. Read
/// one value per statement, because the host's control sees the order. Each name is looked up once in the lifetime of
/// the Control, usually one call of a member, during which it also keeps a reference to the object.
class Control {
 public:
  /// Results are converted using the locale. Raises 424 if the variant holds no object, 91 for an empty reference.
  Control(const Variant& holder, const Locale& locale);
  Control(ObjectRef object, const Locale& locale);

  /// Raises 438 if the object lacks the member, here and below.
  template <class T = Variant>
  [[nodiscard]] T get(TextView member, std::initializer_list<Variant> indexes = {}) const {
    return get<T>(identifier_of(member), indexes);
  }
  template <class T = Variant>
  [[nodiscard]] T get(std::int32_t member, std::initializer_list<Variant> indexes = {}) const;

  void put(TextView member, Variant value) const { put(member, {}, std::move(value)); }
  void put(TextView member, std::initializer_list<Variant> indexes, Variant value) const;
  void put(std::int32_t member, Variant value) const;
  Variant call(TextView member, std::initializer_list<Variant> arguments = {}) const;

  /// A get or put that is repeated while its first numeric indexes change. The value of a put comes last. The Control
  /// must outlive it.
  [[nodiscard]] std::unique_ptr<RepeatedUse> repeated_get(TextView member,
                                                          std::initializer_list<Variant> indexes) const;
  [[nodiscard]] std::unique_ptr<RepeatedUse> repeated_put(TextView member,
                                                          std::initializer_list<Variant> arguments) const;

  /// Whether the object has a member, which is looked up but not used.
  [[nodiscard]] bool answers(TextView member) const;

  [[nodiscard]] const ObjectRef& object() const noexcept { return object_; }
  [[nodiscard]] const Locale& locale() const noexcept { return locale_; }

 private:
  struct Known {
    Text name;
    std::int32_t identifier;
  };

  [[nodiscard]] const Known* find_known(TextView member) const noexcept;
  [[nodiscard]] std::int32_t identifier_of(TextView member) const;

  ObjectRef object_;
  Locale locale_;
  mutable std::vector<Known> known_;
};

template <class T>
T Control::get(std::int32_t member, std::initializer_list<Variant> indexes) const {
  Variant value = object_->invoke(member, Access::get, {indexes.begin(), indexes.size()});
  if constexpr (std::is_same_v<T, Variant>)
    return value;
  else if constexpr (std::is_same_v<T, Text>)
    return value.to_text(locale_);
  else if constexpr (std::is_same_v<T, Boolean>)
    return value.to_boolean(locale_);
  else if constexpr (std::is_same_v<T, std::int16_t>)
    return value.to_int16(locale_);
  else if constexpr (std::is_same_v<T, std::int32_t>)
    return value.to_int32(locale_);
  else if constexpr (std::is_same_v<T, float>)
    return value.to_single(locale_);
  else
    return value.to_double(locale_);
}

}  // namespace talutil
