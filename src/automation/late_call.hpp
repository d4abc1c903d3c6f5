#pragma once

#include <array>
#include <span>
#include <tuple>
#include <utility>

#include "automation/member_table.hpp"

/// Late binding: calls members with variants, whatever the types of their signatures.
namespace talutil {

/// An argument of a late-bound call. If the parameter is written back, `value` is changed in place, but only if the
/// member changed it, so that a caller's variable otherwise keeps its type.
struct Argument {
  Argument() = default;
  Argument(Variant given) : value(std::move(given)) {}

  Variant value;
  bool is_changed = false;
  /// The index of an earlier argument that is the same variable of the caller; -1 if none is. A member that writes to a
  /// variant through one parameter then sees the change through the other, as with any reference.
  std::int8_t same_variable_as = -1;
};

/// Calls one slot. The arguments are complete: their number is right and defaults are filled in.
using LateCall = Variant (*)(void* target, std::span<Argument> arguments, const Locale& locale);

/// Coerces a variant to a type of the interface. Raises the errors of Variant's conversions.
template <class T>
[[nodiscard]] T convert(const Variant& value, const Locale& locale);

template <>
Boolean convert(const Variant& value, const Locale& locale);
template <>
std::int16_t convert(const Variant& value, const Locale& locale);
template <>
std::int32_t convert(const Variant& value, const Locale& locale);
template <>
float convert(const Variant& value, const Locale& locale);
template <>
Date convert(const Variant& value, const Locale& locale);
template <>
Text convert(const Variant& value, const Locale& locale);
template <>
Variant convert(const Variant& value, const Locale& locale);

/// Empty converts to an array that was never allocated. Raises 13 for anything else that is not an array of texts.
template <>
TextArray convert(const Variant& value, const Locale& locale);

/// An object or an empty reference. Raises 13 for anything else; does not read an object's default value.
template <>
ObjectRef convert(const Variant& value, const Locale& locale);

/// The same for a property that only stores objects of one kind: raises 13 for other objects.
[[nodiscard]] ObjectRef object_of_kind(const Variant& value, ObjectKind is_of_kind);

/// A record, or an object with the fields of one, which are read in order. Raises 13 for anything else, 91 for an empty
/// reference and 438 for an object that lacks a field.
template <>
SystemTime convert(const Variant& value, const Locale& locale);

namespace detail {

/// Puts changed fields into an object that represents a record; does nothing for a real record.
void put_changed_fields(const Variant& holder, const SystemTime& before, const SystemTime& after, const Locale& locale);

/// One parameter during a call: the argument's own value if its type fits, otherwise a converted copy.
template <class A>
class Cell {
 public:
  using T = std::remove_cvref_t<A>;
  static constexpr bool is_written_back = passing<A>() == Passing::written_back;
  static constexpr bool is_record = is_written_back && std::is_same_v<T, SystemTime>;

  void bind(std::span<Argument> arguments, std::size_t place, const Locale& locale) {
    Argument& argument = arguments[place];
    argument_ = &argument;
    locale_ = &locale;
    if constexpr (std::is_same_v<T, Variant>) {
      const auto first = argument.same_variable_as;
      used_ = is_written_back && first >= 0 ? &arguments[static_cast<std::size_t>(first)].value : &argument.value;
    } else if (T* const held = argument.value.get_if<T>()) {
      used_ = held;
    } else {
      converted_ = convert<T>(argument.value, locale);
      used_ = &converted_;
    }
    if constexpr (is_written_back) before_ = *used_;
  }

  /// Writes changes to an object that represents a record while errors can still be reported.
  void give_back() {
    if constexpr (is_record) put_changed_fields(argument_->value, before_, *used_, *locale_);
  }

  /// Keeps what the member wrote, whether or not it succeeded.
  ~Cell() {
    if constexpr (is_written_back) {
      if (used_ == nullptr || *used_ == before_) return;
      if (is_record && used_ == &converted_) return;
      argument_->is_changed = true;
      if constexpr (!std::is_same_v<T, Variant>) {
        if (used_ == &converted_) argument_->value = Variant(std::move(converted_));
      }
    }
  }

  [[nodiscard]] T& value() noexcept { return *used_; }

 private:
  struct Nothing {};

  Argument* argument_ = nullptr;
  const Locale* locale_ = nullptr;
  T* used_ = nullptr;
  T converted_{};
  [[no_unique_address]] std::conditional_t<is_written_back, T, Nothing> before_{};
};

/// The object to which a member pointer applies: the target itself, or its shared settings.
template <class Class, class Target>
Class& part_of(Target& target) {
  if constexpr (std::is_base_of_v<Class, Target>)
    return target;
  else
    return target.settings();
}

/// Calls a member; writes records back to objects even if it fails.
template <class Use, class... A>
Variant use_cells(const Use& use, Cell<A>&... cell) {
  if constexpr ((Cell<A>::is_record || ...)) {
    Variant result;
    try {
      result = use();
    } catch (...) {
      (cell.give_back(), ...);
      throw;
    }
    (cell.give_back(), ...);
    return result;
  } else {
    return use();
  }
}

template <class Target, auto M>
Variant late_method(void* target, std::span<Argument> arguments, const Locale& locale) {
  using Traits = MemberTraits<M>;
  auto& object = part_of<typename Traits::Class>(*static_cast<Target*>(target));
  return Traits::with_arguments([&]<class... A>() -> Variant {
    std::tuple<Cell<A>...> cells;
    return std::apply(
        [&](Cell<A>&... cell) -> Variant {
          std::size_t next = 0;
          (cell.bind(arguments, next++, locale), ...);
          return use_cells(
              [&]() -> Variant {
                if constexpr (std::is_void_v<typename Traits::Result>) {
                  (object.*M)(cell.value()...);
                  return {};
                } else {
                  return (object.*M)(cell.value()...);
                }
              },
              cell...);
        },
        cells);
  });
}

template <class Target, auto M>
Variant late_get(void* target, std::span<Argument> /*arguments*/, const Locale& /*locale*/) {
  using Traits = MemberTraits<M>;
  auto& object = part_of<typename Traits::Class>(*static_cast<Target*>(target));
  if constexpr (Traits::is_function)
    return (object.*M)();
  else
    return object.*M;
}

template <class Target, auto M, ObjectKind Kind = any_object>
Variant late_put(void* target, std::span<Argument> arguments, const Locale& locale) {
  using Traits = MemberTraits<M>;
  auto& object = part_of<typename Traits::Class>(*static_cast<Target*>(target));
  if constexpr (std::is_same_v<typename Traits::Result, ObjectRef>)
    object.*M = object_of_kind(arguments[0].value, Kind);
  else
    object.*M = convert<typename Traits::Result>(arguments[0].value, locale);
  return {};
}

}  // namespace detail

/// The policy that generates the functions behind late binding, slot by slot.
template <class Target>
struct LateCalls {
  template <auto M>
  static constexpr std::array<LateCall, 1> get_only(MemberName) {
    return {&detail::late_get<Target, M>};
  }

  template <auto M, ObjectKind Kind = any_object>
  static constexpr std::array<LateCall, 1> put_only(MemberName) {
    return {&detail::late_put<Target, M, Kind>};
  }

  template <auto M>
  static constexpr std::array<LateCall, 2> property(MemberName) {
    return {&detail::late_get<Target, M>, &detail::late_put<Target, M>};
  }

  template <auto M>
  static constexpr std::array<LateCall, 2> property_put_first(MemberName) {
    return {&detail::late_put<Target, M>, &detail::late_get<Target, M>};
  }

  template <auto G, auto S, class... Names>
  static constexpr std::array<LateCall, 2> accessors(MemberName, Names...) {
    return {&detail::late_method<Target, G>, &detail::late_method<Target, S>};
  }

  template <auto S, class... Names>
  static constexpr std::array<LateCall, 1> setter(MemberName, Names...) {
    return {&detail::late_method<Target, S>};
  }

  template <auto M, class... Names>
  static constexpr std::array<LateCall, 1> method(MemberName, Names...) {
    return {&detail::late_method<Target, M>};
  }

  template <class... Rows>
  static constexpr auto rows(const Rows&... parts) {
    return detail::join(parts...);
  }
};

/// The late-bound members of a class without the class itself: what a dispatcher needs.
struct LateInterface {
  std::span<const Member> members;
  std::span<const LateCall> calls;
  std::int32_t (*find)(TextView name);  ///< The first slot of a name; -1 if there is none.

  /// The identifier of a name. If it is unknown, the first returns nothing and the second raises 438.
  [[nodiscard]] std::optional<std::int32_t> find_identifier(TextView name) const;
  [[nodiscard]] std::int32_t identifier_of(TextView name) const;

  /// The slot for an access of a member; -1 if it has none. A call also finds a property's get, and a get also finds a
  /// method, because late-bound callers cannot tell them apart.
  [[nodiscard]] std::int32_t slot_of(std::int32_t identifier, Access access) const noexcept;

  /// Calls a slot with the given arguments; defaults replace those left out at the end or marked as missing. Raises 438
  /// for slot -1, 450 for too many arguments, 449 for a missing argument that is not optional.
  Variant call(void* target, std::int32_t slot, std::span<Argument> arguments, const Locale& locale) const;
};

template <class C>
[[nodiscard]] const LateInterface& late_interface() {
  static constexpr auto calls = members_of<LateCalls<C>>(std::type_identity<C>{});
  static constexpr LateInterface table{described<C>, calls, [](TextView name) {
                                         return name_index<C>.find(std::span<const Member>(described<C>), name);
                                       }};
  return table;
}

}  // namespace talutil
