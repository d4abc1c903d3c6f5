#pragma once

#include <algorithm>
#include <array>
#include <bit>
#include <cstdint>
#include <span>
#include <string_view>
#include <type_traits>

#include "automation/control.hpp"
#include "automation/object.hpp"
#include "automation/system_time.hpp"

/// A class that is driven through automation has one table of its members, a function template over a policy:
///
///     template <class P>
///     constexpr auto members_of(std::type_identity<Thing>) {
///       return P::rows(P::template property<&Thing::Width>("Width"),
///                      P::template method<&Thing::Move>("Move", "X", optional("Y", 0)));
///     }
///
/// A policy turns each row into something: Describe into names and types, LateCalls into the functions behind late
/// binding, the COM layer into slots. A property has two slots, one per access.
namespace talutil {

/// The types of the interface. None is the result of a member that returns nothing.
enum class ValueType : std::uint8_t {
  none,
  boolean,
  int16,
  int32,
  single,
  date,
  text,
  variant,
  text_array,
  system_time,
  object
};

template <class T>
consteval ValueType value_type() {
  if constexpr (std::is_void_v<T>)
    return ValueType::none;
  else if constexpr (std::is_same_v<T, Boolean>)
    return ValueType::boolean;
  else if constexpr (std::is_same_v<T, std::int16_t>)
    return ValueType::int16;
  else if constexpr (std::is_same_v<T, std::int32_t>)
    return ValueType::int32;
  else if constexpr (std::is_same_v<T, float>)
    return ValueType::single;
  else if constexpr (std::is_same_v<T, Date>)
    return ValueType::date;
  else if constexpr (std::is_same_v<T, Text>)
    return ValueType::text;
  else if constexpr (std::is_same_v<T, Variant>)
    return ValueType::variant;
  else if constexpr (std::is_same_v<T, TextArray>)
    return ValueType::text_array;
  else if constexpr (std::is_same_v<T, SystemTime>)
    return ValueType::system_time;
  else if constexpr (std::is_same_v<T, ObjectRef>)
    return ValueType::object;
  else
    static_assert(!sizeof(T*), "not a type of the interface");
}

/// How an argument is passed: `T`, `const T&` and `T&` in the C++ signature.
enum class Passing : std::uint8_t { by_value, by_reference, written_back };

template <class P>
consteval Passing passing() {
  if constexpr (!std::is_reference_v<P>)
    return Passing::by_value;
  else
    return std::is_const_v<std::remove_reference_t<P>> ? Passing::by_reference : Passing::written_back;
}

/// The condition that a property may impose on the objects put into it.
using ObjectKind = bool (*)(const Control& object);
constexpr bool any_object(const Control& /*object*/) { return true; }

/// A row's description of a parameter: its published name and, if it is optional, its default.
struct ParameterName {
  constexpr ParameterName(const char* parameter) : name(parameter) {}

  const char* name;
  bool is_optional = false;
  std::int32_t number = 0;
  const char* text = "";
};

constexpr ParameterName optional(const char* name, std::int32_t number) {
  ParameterName result(name);
  result.is_optional = true;
  result.number = number;
  return result;
}

constexpr ParameterName optional(const char* name, const char* text) {
  ParameterName result(name);
  result.is_optional = true;
  result.text = text;
  return result;
}

/// The published name of a member and, if it must be a certain one, its dispatch identifier.
struct MemberName {
  constexpr MemberName(const char* member) : name(member) {}
  constexpr MemberName(const char* member, std::int32_t id) : name(member), identifier(id) {}

  const char* name;
  std::int32_t identifier = 0;
};

struct Parameter {
  std::string_view name;
  ValueType type = ValueType::none;
  Passing passing = Passing::by_value;
  bool is_optional = false;
  std::int32_t default_number = 0;
  std::string_view default_text;

  /// The value of an optional parameter that the caller left out.
  [[nodiscard]] Variant default_value() const;
};

constexpr std::size_t most_parameters = 9;

/// The description of one slot of an interface.
struct Member {
  std::string_view name;
  std::int32_t identifier = 0;
  Access access = Access::call;
  ValueType result = ValueType::none;
  std::uint8_t parameter_count = 0;
  const Parameter* first_parameter = nullptr;

  [[nodiscard]] constexpr std::span<const Parameter> parameters() const noexcept {
    return {first_parameter, parameter_count};
  }
};

namespace detail {

template <class M>
struct MemberPointer;

template <class C, class R, class... A>
struct MemberPointer<R (C::*)(A...)> {
  using Class = C;
  using Result = R;
  static constexpr std::size_t arity = sizeof...(A);
  static constexpr bool is_function = true;

  template <class Visitor>
  static constexpr decltype(auto) with_arguments(Visitor&& visitor) {
    return visitor.template operator()<A...>();
  }
};

template <class C, class R, class... A>
struct MemberPointer<R (C::*)(A...) const> : MemberPointer<R (C::*)(A...)> {};

template <class C, class R, class... A>
struct MemberPointer<R (C::*)(A...) const noexcept> : MemberPointer<R (C::*)(A...)> {};

template <class C, class T>
requires(!std::is_function_v<T>) struct MemberPointer<T C::*> {
  using Class = C;
  using Result = T;
  static constexpr bool is_function = false;
};

/// A slot together with its parameters, as its row describes it.
struct DescribedSlot {
  Member member;
  std::array<Parameter, most_parameters> parameters{};
};

template <class T, std::size_t... N>
constexpr auto join(const std::array<T, N>&... parts) {
  std::array<T, (N + ... + 0)> all{};
  std::size_t next = 0;
  ((std::copy(parts.begin(), parts.end(), all.begin() + next), next += N), ...);
  return all;
}

}  // namespace detail

template <auto M>
using MemberTraits = detail::MemberPointer<decltype(M)>;

/// The type of a property in the interface: object references are passed as variants.
template <auto M>
using PropertyType = std::conditional_t<std::is_same_v<typename MemberTraits<M>::Result, ObjectRef>, Variant,
                                        typename MemberTraits<M>::Result>;

/// Describes each slot.
struct Describe {
  using Slot = detail::DescribedSlot;

  template <auto M>
  static constexpr std::array<Slot, 1> get_only(MemberName name) {
    return {accessor(name, Access::get, value_type<PropertyType<M>>())};
  }

  template <auto M, ObjectKind = any_object>
  static constexpr std::array<Slot, 1> put_only(MemberName name) {
    Slot slot = accessor(name, Access::put, ValueType::none);
    slot.member.parameter_count = 1;
    slot.parameters[0].name = "value";
    slot.parameters[0].type = value_type<PropertyType<M>>();
    return {slot};
  }

  template <auto M>
  static constexpr std::array<Slot, 2> property(MemberName name) {
    return {get_only<M>(name)[0], put_only<M>(name)[0]};
  }

  template <auto M>
  static constexpr std::array<Slot, 2> property_put_first(MemberName name) {
    return {put_only<M>(name)[0], get_only<M>(name)[0]};
  }

  /// A property implemented by functions, with or without indexes: G returns the value, S takes it after the indexes.
  /// Used by controls, not by interfaces.
  template <auto G, auto S, class... Names>
  static constexpr std::array<Slot, 2> accessors(MemberName name, Names... names) {
    std::array<Slot, 2> slots{method<G>(name, names...)[0], setter<S>(name, names...)[0]};
    slots[0].member.access = Access::get;
    return slots;
  }

  /// A write-only property, with or without indexes: S takes the value after them.
  template <auto S, class... Names>
  static constexpr std::array<Slot, 1> setter(MemberName name, Names... names) {
    std::array<Slot, 1> slot = method<S>(name, names..., "value");
    slot[0].member.access = Access::put;
    return slot;
  }

  template <auto M, class... Names>
  static constexpr std::array<Slot, 1> method(MemberName name, Names... names) {
    using Traits = MemberTraits<M>;
    static_assert(sizeof...(Names) == Traits::arity, "a name for each parameter");
    Slot slot = accessor(name, Access::call, value_type<typename Traits::Result>());
    const std::array<ParameterName, sizeof...(Names) + 1> given{ParameterName(names)..., ParameterName("")};
    Traits::with_arguments([&]<class... A>() {
      std::uint8_t& count = slot.member.parameter_count;
      ((slot.parameters[count] = parameter<A>(given[count]), ++count), ...);
    });
    return {slot};
  }

  template <class... Rows>
  static constexpr auto rows(const Rows&... parts) {
    return detail::join(parts...);
  }

 private:
  static constexpr Slot accessor(MemberName name, Access access, ValueType result) {
    Slot slot;
    slot.member.name = name.name;
    slot.member.identifier = name.identifier;
    slot.member.access = access;
    slot.member.result = result;
    return slot;
  }

  template <class A>
  static constexpr Parameter parameter(const ParameterName& given) {
    return {given.name, value_type<std::remove_cvref_t<A>>(), passing<A>(), given.is_optional, given.number,
            given.text};
  }
};

constexpr char fold_case(char c) noexcept { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; }

/// Compares names of the interface, which are ASCII, ignoring case.
template <class Char>
constexpr bool same_name(std::string_view name, std::basic_string_view<Char> other) noexcept {
  // Compare lengths first: checking a whole table compares every pair at compile time.
  if (name.size() != other.size()) return false;
  for (std::size_t i = 0; i < name.size(); ++i) {
    if (other[i] >= 0x80 || fold_case(name[i]) != fold_case(static_cast<char>(other[i]))) return false;
  }
  return true;
}

/// Assigns an identifier to every member without one, the same for all accesses of a name. Checks the table at compile
/// time: no access of a name twice, optional parameters last.
template <std::size_t N>
consteval std::array<Member, N> numbered(std::array<Member, N> members, std::int32_t first_identifier) {
  for (std::size_t i = 0; i < N; ++i) {
    bool optionals = false;
    for (const Parameter& parameter : members[i].parameters()) {
      if (optionals && !parameter.is_optional) throw "an optional parameter stands before a required one";
      optionals = optionals || parameter.is_optional;
    }
    if (members[i].identifier == 0) members[i].identifier = first_identifier + static_cast<std::int32_t>(i);
    for (std::size_t j = 0; j < i; ++j) {
      if (!same_name(members[i].name, members[j].name)) continue;
      if (members[i].access == members[j].access || members[i].access == Access::call) throw "a name stands twice";
      members[i].identifier = members[j].identifier;
    }
  }
  return members;
}

namespace detail {

/// Only read by the compiler: the program contains the two tables below.
template <class C>
inline constexpr auto described_slots = members_of<Describe>(std::type_identity<C>{});

template <std::size_t Count, std::size_t N>
consteval std::array<Parameter, Count> all_parameters(const std::array<DescribedSlot, N>& slots) {
  std::array<Parameter, Count> all{};
  std::size_t next = 0;
  for (const DescribedSlot& slot : slots) {
    for (std::size_t i = 0; i < slot.member.parameter_count; ++i) all[next++] = slot.parameters[i];
  }
  return all;
}

template <std::size_t N>
consteval std::size_t parameter_count(const std::array<DescribedSlot, N>& slots) {
  std::size_t count = 0;
  for (const DescribedSlot& slot : slots) count += slot.member.parameter_count;
  return count;
}

/// The parameters of all slots of a class, one slot's after the other's.
template <class C>
inline constexpr auto described_parameters = all_parameters<parameter_count(described_slots<C>)>(described_slots<C>);

template <std::size_t N>
consteval std::array<Member, N> with_parameters(const std::array<DescribedSlot, N>& slots, const Parameter* next) {
  std::array<Member, N> members{};
  for (std::size_t i = 0; i < N; ++i) {
    members[i] = slots[i].member;
    members[i].first_parameter = next;
    next += members[i].parameter_count;
  }
  return members;
}

}  // namespace detail

/// The members of a class, slot by slot.
template <class C>
inline constexpr auto described =
    numbered(detail::with_parameters(detail::described_slots<C>, detail::described_parameters<C>.data()), 0x60030000);

/// Finds members by name with a single hash, so that a script's call does not search the table.
template <std::size_t Slots>
class NameIndex {
 public:
  template <std::size_t N>
  explicit consteval NameIndex(const std::array<Member, N>& members) {
    static_assert(2 * N <= Slots && (Slots & (Slots - 1)) == 0);
    for (std::size_t i = 0; i < N; ++i) {
      std::size_t at = hash(members[i].name) % Slots;
      while (slots_[at] != 0 && !same_name(members[slots_[at] - 1].name, members[i].name)) at = (at + 1) % Slots;
      if (slots_[at] == 0) slots_[at] = static_cast<std::uint16_t>(i + 1);
    }
  }

  /// The index of the first slot of a name; -1 if there is none.
  template <class Char>
  [[nodiscard]] constexpr std::int32_t find(std::span<const Member> members,
                                            std::basic_string_view<Char> name) const noexcept {
    for (std::size_t at = hash(name) % Slots; slots_[at] != 0; at = (at + 1) % Slots) {
      if (same_name(members[slots_[at] - 1].name, name)) return slots_[at] - 1;
    }
    return -1;
  }

 private:
  // FNV-1a of the case-folded name.
  template <class Char>
  static constexpr std::uint32_t hash(std::basic_string_view<Char> name) noexcept {
    std::uint32_t value = 2166136261U;
    for (const Char c : name) value = (value ^ static_cast<std::uint8_t>(fold_case(static_cast<char>(c)))) * 16777619U;
    return value;
  }

  std::array<std::uint16_t, Slots> slots_{};
};

template <class C>
inline constexpr NameIndex<std::bit_ceil(2 * described<C>.size())> name_index{described<C>};

}  // namespace talutil
