#pragma once

#include "automation/late_call.hpp"
#include "com/com_object.hpp"
#include "com/early_call.hpp"

/// The vtable, generated from the interface table: for each row, a function that takes automation's types and passes on
/// where they are. There is no code per member.
namespace talutil::com {

/// How a type of the interface is represented in a vtable call. Numbers and records are the same on both sides.
template <class T>
struct Wire {
  using Type = T;
};
template <>
struct Wire<Boolean> {
  using Type = VARIANT_BOOL;
};
template <>
struct Wire<Date> {
  using Type = DATE;
};
template <>
struct Wire<Text> {
  using Type = BSTR;
};
template <>
struct Wire<Variant> {
  using Type = VARIANT;
};
template <>
struct Wire<TextArray> {
  using Type = SAFEARRAY*;
};

/// The caller's type for a parameter: the value, or a pointer to it.
template <class A>
using WireParameter = std::conditional_t<passing<A>() == Passing::by_value, typename Wire<std::remove_cvref_t<A>>::Type,
                                         typename Wire<std::remove_cvref_t<A>>::Type*>;

template <class R, class... A>
inline constexpr Signature signature_of{
    value_type<R>(), sizeof...(A), {Signature::Passed{value_type<std::remove_cvref_t<A>>(), passing<A>()}...}};

/// Where an argument is: by value in the caller's frame, by reference where its pointer leads.
template <class A>
const void* place_of(const WireParameter<A>& given) noexcept {
  if constexpr (passing<A>() == Passing::by_value)
    return &given;
  else
    return given;
}

/// The part that all slots of a class share.
template <class C>
[[gnu::noinline]] HRESULT call_slot(ComObject<C>* self, LateCall function, const Signature& signature,
                                    const void* const* arguments, void* result) noexcept {
  const Places places{arguments, result};
  const HRESULT status = check_places(signature, places);
  if (FAILED(status)) return status;
  const typename ComObject<C>::Keeper keeper(self);
  return call_early({late_interface<C>(), function, &self->object, self->object.library()}, signature, places);
}

template <class C, auto M, class Signature = decltype(M)>
struct MethodThunk;

template <class C, auto M, class Owner, class R, class... A>
struct MethodThunk<C, M, R (Owner::*)(A...)> {
  static HRESULT STDMETHODCALLTYPE call(ComObject<C>* self, WireParameter<A>... given,
                                        typename Wire<R>::Type* result) noexcept {
    const void* const places[] = {place_of<A>(given)..., nullptr};
    return call_slot(self, &detail::late_method<C, M>, signature_of<R, A...>, places, result);
  }
};

template <class C, auto M, class Owner, class... A>
struct MethodThunk<C, M, void (Owner::*)(A...)> {
  static HRESULT STDMETHODCALLTYPE call(ComObject<C>* self, WireParameter<A>... given) noexcept {
    const void* const places[] = {place_of<A>(given)..., nullptr};
    return call_slot(self, &detail::late_method<C, M>, signature_of<void, A...>, places, nullptr);
  }
};

template <class C, auto M, ObjectKind Kind = any_object>
struct PropertyThunk {
  using Field = typename MemberTraits<M>::Result;
  using Type = typename Wire<PropertyType<M>>::Type;

  static HRESULT STDMETHODCALLTYPE get(ComObject<C>* self, Type* result) noexcept {
    if constexpr (std::is_arithmetic_v<Field>) {
      // Hosts read numbers in loops, and these need no conversion.
      if (result != nullptr && module_recorder() == nullptr) {
        *result = detail::part_of<typename MemberTraits<M>::Class>(self->object).*M;
        return S_OK;
      }
    }
    return call_slot(self, &detail::late_get<C, M>, signature_of<PropertyType<M>>, nullptr, result);
  }

  static HRESULT STDMETHODCALLTYPE put(ComObject<C>* self, Type value) noexcept {
    const void* const places[] = {&value};
    return call_slot(self, &detail::late_put<C, M, Kind>, signature_of<void, PropertyType<M>>, places, nullptr);
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
