#pragma once

#include <algorithm>
#include <array>
#include <optional>
#include <tuple>
#include <vector>

#include "automation/member_table.hpp"
#include "com/boundary.hpp"
#include "com/com_object.hpp"
#include "com/recorder.hpp"
#include "com/variant_bridge.hpp"
#include "com/write_back.hpp"

/// The vtable, generated from the interface table: for each row, a function that takes automation's types, calls the
/// member and marshals the results. There is no code per member.
namespace talutil::com {

/// How a type of the interface is represented in a vtable call, and how it is converted.
template <class T>
struct Wire {  // Numbers and records are the same on both sides.
  using Type = T;
  static T from(const Type& value) { return value; }
  static Type to(const T& value) { return value; }
  static void store(Type& place, Type value) noexcept { place = value; }
};

template <>
struct Wire<Boolean> {
  using Type = VARIANT_BOOL;
  static Boolean from(Type value) { return Boolean::from_bits(value); }
  static Type to(Boolean value) { return value.bits(); }
  static void store(Type& place, Type value) noexcept { place = value; }
};

template <>
struct Wire<Date> {
  using Type = DATE;
  static Date from(Type value) { return {value}; }
  static Type to(Date value) { return value.days; }
  static void store(Type& place, Type value) noexcept { place = value; }
};

template <>
struct Wire<Text> {
  using Type = BSTR;
  static Text from(Type value) { return text_from(value); }
  static OwnedText to(const Text& value) { return OwnedText(value); }
  static void store(Type& place, OwnedText value) noexcept {
    SysFreeString(place);
    place = value.release();
  }
};

template <>
struct Wire<Variant> {
  using Type = VARIANT;
  static Variant from(const Type& value) { return variant_from(value); }
  static OwnedVariant to(const Variant& value) { return native_from(value, ArrayStyle::of_variants); }
  static void store(Type& place, OwnedVariant value) noexcept { std::swap(place, value.get()); }
};

template <>
struct Wire<TextArray> {
  using Type = SAFEARRAY*;
  static TextArray from(Type value, const Locale& locale) { return array_from(value, locale); }
  static OwnedArray to(const TextArray& value) { return {value, ArrayStyle::of_texts}; }
  static void store(Type& place, OwnedArray value) noexcept {
    if (place != nullptr) SafeArrayDestroy(place);
    place = value.release();
  }
};

/// The caller's type for a parameter: the value, or a pointer to it.
template <class A>
using WireParameter = std::conditional_t<passing<A>() == Passing::by_value, typename Wire<std::remove_cvref_t<A>>::Type,
                                         typename Wire<std::remove_cvref_t<A>>::Type*>;

template <class A>
class WireCell {
 public:
  using T = std::remove_cvref_t<A>;
  static constexpr bool is_written_back = passing<A>() == Passing::written_back;
  /// A variant by reference may itself refer to a typed variable, which is written through and never replaced.
  static constexpr bool is_variable = is_written_back && std::is_same_v<T, Variant>;

  WireCell(WireParameter<A> given, const Library& library) {
    if constexpr (std::is_same_v<T, TextArray>) {
      place_ = given;
      value_ = Wire<T>::from(*given, library.locale());
    } else if constexpr (passing<A>() != Passing::by_value) {
      place_ = given;
      value_ = Wire<T>::from(*given);
    } else {
      value_ = Wire<T>::from(given);
    }
    if constexpr (is_written_back) before_ = value_;
  }

  [[nodiscard]] T& value() noexcept {
    if constexpr (is_variable) return first_ == nullptr ? value_ : first_->value();
    return value_;
  }

  /// The address of the caller's variable.
  [[nodiscard]] const void* variable() const noexcept {
    const void* const end = variable_of(*place_);
    return end == nullptr ? place_ : end;
  }

  /// Marks this argument as the same variable as an earlier one.
  void share(WireCell& first) noexcept { first_ = &first; }

  /// Converts the value to write back, if it changed. All are converted before the first is stored.
  void prepare(const Library& library) {
    if constexpr (is_written_back) {
      if (value_ == before_) return;
      if constexpr (is_variable) {
        if (first_ != nullptr) return;
        native_.emplace(place_, value_, library.locale());
      } else {
        if constexpr (std::is_same_v<T, TextArray>) require_resizable(*place_);
        native_.emplace(Wire<T>::to(value_));
      }
    }
  }

  /// The argument as a late call has it: its value, and the index of the earlier argument that is the same variable.
  [[nodiscard]] Argument argument(std::int8_t same_variable_as) const {
    Argument result(Variant{value_});
    result.same_variable_as = same_variable_as;
    return result;
  }

  [[nodiscard]] const void* shared() const noexcept {
    if constexpr (is_variable) return first_;
    return nullptr;
  }

  void store() noexcept {
    if constexpr (is_written_back) {
      if (!native_) return;
      if constexpr (is_variable)
        native_->store();
      else
        Wire<T>::store(*place_, std::move(*native_));
    }
  }

 private:
  struct Nothing {};
  using Native = std::conditional_t<is_variable, WriteBack, decltype(Wire<T>::to(std::declval<const T&>()))>;

  typename Wire<T>::Type* place_ = nullptr;
  T value_{};
  [[no_unique_address]] std::conditional_t<is_written_back, T, Nothing> before_{};
  [[no_unique_address]] std::conditional_t<is_written_back, std::optional<Native>, Nothing> native_{};
  [[no_unique_address]] std::conditional_t<is_variable, WireCell*, Nothing> first_{};
};

/// A variant that a caller passes twice is one variable: what is written through one parameter is visible through the
/// other.
template <class... A>
void find_shared_variables(std::tuple<WireCell<A>...>& cells) {
  constexpr std::size_t count = (0 + ... + (WireCell<A>::is_variable ? 1 : 0));
  if constexpr (count > 1) {
    std::array<WireCell<Variant&>*, count> seen{};
    std::size_t size = 0;
    const auto look_at = [&](auto& cell) {
      if constexpr (std::is_same_v<decltype(cell), WireCell<Variant&>&>) {
        const auto end = seen.begin() + size;
        const auto same =
            std::find_if(seen.begin(), end, [&](auto* other) { return other->variable() == cell.variable(); });
        if (same != end)
          cell.share(**same);
        else
          seen[size++] = &cell;
      }
    };
    std::apply([&](WireCell<A>&... cell) { (look_at(cell), ...); }, cells);
  }
}

template <class... A>
void write_back(std::tuple<WireCell<A>...>& cells, const Library& library) {
  std::apply(
      [&](WireCell<A>&... cell) {
        (cell.prepare(library), ...);
        (cell.store(), ...);
      },
      cells);
}

/// Runs a member; whatever it wrote back is stored even if it fails.
template <class Function, class... A>
auto run(std::tuple<WireCell<A>...>& cells, const Library& library, Function&& function) {
  if constexpr (!(WireCell<A>::is_written_back || ...)) {
    return function();
  } else {
    find_shared_variables(cells);
    try {
      return function();
    } catch (...) {
      write_back(cells, library);
      throw;
    }
  }
}

/// The arguments of an early-bound call as a recording takes them.
template <class... A>
std::vector<Argument> arguments_of(const std::tuple<WireCell<A>...>& cells) {
  std::vector<Argument> arguments;
  std::vector<const void*> addresses;
  const auto add = [&](const auto& cell) {
    const auto first = std::ranges::find(addresses, cell.shared());
    const bool is_shared = cell.shared() != nullptr && first != addresses.end();
    arguments.push_back(cell.argument(static_cast<std::int8_t>(is_shared ? first - addresses.begin() : -1)));
    addresses.push_back(&cell);
  };
  std::apply([&](const WireCell<A>&... cell) { (add(cell), ...); }, cells);
  return arguments;
}

/// The member behind the function of a slot. Searches the slots: only recordings need it.
template <class C>
const Member& member_behind(Slot slot) noexcept {
  const Slot* const first = vtable_of<C>() + own_slots;
  const Slot* const found = std::find(first, first + described<C>.size(), slot);
  return described<C>[static_cast<std::size_t>(found - first)];
}

/// Records a use of a member, if calls are recorded.
template <class C, class Arguments, class Use>
auto recorded_use(ComObject<C>* self, Slot slot, const Arguments& arguments, const Use& use) {
  Recorder* const recorder = module_recorder();
  if (recorder == nullptr) return use();
  using Result = decltype(use());
  const Member& member = member_behind<C>(slot);
  if constexpr (std::is_void_v<Result>) {
    const auto use_without_result = [&] {
      use();
      return Variant();
    };
    recorded_use(*recorder, &self->object, member, arguments, use_without_result);
  } else {
    std::optional<Result> result;
    const auto keep = [&] {
      result.emplace(use());
      return Variant(*result);
    };
    recorded_use(*recorder, &self->object, member, arguments, keep);
    return *std::move(result);
  }
}

template <class A>
constexpr bool is_null(const WireParameter<A>& given) noexcept {
  if constexpr (passing<A>() != Passing::by_value)
    return given == nullptr;
  else
    return false;
}

template <class T>
void initialize(T& place) noexcept {
  place = T{};
}

/// The result for a null pointer. Clears the thread's error information, which may be about an earlier error.
inline HRESULT null_pointer() noexcept {
  SetErrorInfo(0, nullptr);
  return E_POINTER;
}

template <class C, auto M, class Signature = decltype(M)>
struct MethodThunk;

template <class C, auto M, class Owner, class R, class... A>
struct MethodThunk<C, M, R (Owner::*)(A...)> {
  static HRESULT STDMETHODCALLTYPE call(ComObject<C>* self, WireParameter<A>... given,
                                        typename Wire<R>::Type* result) noexcept {
    if (result == nullptr) return null_pointer();
    initialize(*result);
    if ((is_null<A>(given) || ...)) return null_pointer();
    const typename ComObject<C>::Keeper keeper(self);
    return guarded([&] {
      const Library& library = self->object.library();
      std::tuple<WireCell<A>...> cells{WireCell<A>(given, library)...};
      auto answer = run(cells, library, [&] {
        return Wire<R>::to(recorded_use(
            self, reinterpret_cast<Slot>(&call), [&] { return arguments_of(cells); },
            [&] { return std::apply([&](auto&... cell) { return (self->object.*M)(cell.value()...); }, cells); }));
      });
      write_back(cells, library);
      Wire<R>::store(*result, std::move(answer));
    });
  }
};

template <class C, auto M, class Owner, class... A>
struct MethodThunk<C, M, void (Owner::*)(A...)> {
  static HRESULT STDMETHODCALLTYPE call(ComObject<C>* self, WireParameter<A>... given) noexcept {
    if ((is_null<A>(given) || ...)) return null_pointer();
    const typename ComObject<C>::Keeper keeper(self);
    return guarded([&] {
      const Library& library = self->object.library();
      std::tuple<WireCell<A>...> cells{WireCell<A>(given, library)...};
      run(cells, library, [&] {
        recorded_use(
            self, reinterpret_cast<Slot>(&call), [&] { return arguments_of(cells); },
            [&] { std::apply([&](auto&... cell) { (self->object.*M)(cell.value()...); }, cells); });
      });
      write_back(cells, library);
    });
  }
};

/// The uses of all properties of a type: a property adds to them only its place and its slot.
template <class C, class Field, class Type, ObjectKind Kind>
struct FieldAccess {
  [[gnu::noinline]] static HRESULT get(ComObject<C>* self, Slot slot, const Field& field, Type* result) noexcept {
    const auto none = [] { return std::vector<Argument>(); };
    return guarded(
        [&] { Wire<Field>::store(*result, Wire<Field>::to(recorded_use(self, slot, none, [&] { return field; }))); });
  }

  [[gnu::noinline]] static HRESULT put(ComObject<C>* self, Slot slot, Field& field, Type value) noexcept {
    return guarded([&] {
      // A value that cannot be converted is the caller's error, and no call that could be recorded.
      auto given = converted(value);
      if (module_recorder() == nullptr) return store(field, std::move(given));
      recorded_use(
          self, slot, [&] { return std::vector<Argument>{Argument(Variant(given))}; }, [&] { store(field, given); });
    });
  }

 private:
  static auto converted(const Type& value) {
    if constexpr (std::is_same_v<Field, ObjectRef>)
      return variant_from(value);
    else
      return Wire<Field>::from(value);
  }

  template <class Given>
  static void store(Field& field, Given given) {
    if constexpr (std::is_same_v<Field, ObjectRef>)
      field = object_of_kind(given, Kind);
    else
      field = std::move(given);
  }
};

template <class C, auto M, ObjectKind Kind = any_object>
struct PropertyThunk {
  using Field = typename MemberTraits<M>::Result;
  using Type = typename Wire<PropertyType<M>>::Type;
  using Access = FieldAccess<C, Field, Type, Kind>;

  static Field& field(ComObject<C>* self) noexcept {
    return detail::part_of<typename MemberTraits<M>::Class>(self->object).*M;
  }

  static HRESULT STDMETHODCALLTYPE get(ComObject<C>* self, Type* result) noexcept {
    if (result == nullptr) return null_pointer();
    initialize(*result);
    if constexpr (std::is_arithmetic_v<Type>) {
      if (module_recorder() == nullptr) {
        *result = Wire<Field>::to(field(self));
        return S_OK;
      }
    }
    return Access::get(self, reinterpret_cast<Slot>(&get), field(self), result);
  }

  static HRESULT STDMETHODCALLTYPE put(ComObject<C>* self, Type value) noexcept {
    return Access::put(self, reinterpret_cast<Slot>(&put), field(self), value);
  }
};

/// A list of slots as a type, because the functions have different signatures.
template <auto... Functions>
struct SlotList {};

template <auto... A, auto... B>
constexpr SlotList<A..., B...> operator+(SlotList<A...>, SlotList<B...>) {
  return {};
}

/// The policy that names the function of each slot. Only its types are used.
template <class C>
struct Vtable {
  template <auto M>
  static constexpr SlotList<&PropertyThunk<C, M>::get> get_only(MemberName) {
    return {};
  }

  template <auto M, ObjectKind Kind = any_object>
  static constexpr SlotList<&PropertyThunk<C, M, Kind>::put> put_only(MemberName) {
    return {};
  }

  template <auto M>
  static constexpr SlotList<&PropertyThunk<C, M>::get, &PropertyThunk<C, M>::put> property(MemberName) {
    return {};
  }

  template <auto M>
  static constexpr SlotList<&PropertyThunk<C, M>::put, &PropertyThunk<C, M>::get> property_put_first(MemberName) {
    return {};
  }

  template <auto M, class... Names>
  static constexpr SlotList<&MethodThunk<C, M>::call> method(MemberName, Names...) {
    return {};
  }

  template <class... Rows>
  static constexpr auto rows(const Rows&...) -> decltype((SlotList<>{} + ... + Rows{})) {
    return {};
  }
};

template <class C>
using SlotsOf = decltype(members_of<Vtable<C>>(std::type_identity<C>{}));

}  // namespace talutil::com
