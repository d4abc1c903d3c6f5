#include "com/write_back.hpp"

#include "automation/run_time_error.hpp"
#include "com/boundary.hpp"

namespace talutil::com {

namespace {

/// Converts a value to a number type that the library has no kind for. Goes by way of a number, so that the locale does
/// not matter.
OwnedVariant other_number(const Variant& value, VARTYPE type, const Locale& locale) {
  OwnedVariant result = native_from(value.to_double(locale), ArrayStyle::of_variants);
  const HRESULT status = VariantChangeType(&result.get(), &result.get(), 0, type);
  if (FAILED(status)) throw error_of(status, {});
  return result;
}

/// Converts a value to a variable's own type. Uses our conversions, because the platform's read and write dates in the
/// order of the user's locale, but here dates in texts are day first.
OwnedVariant converted(const Variant& value, VARTYPE type, const Locale& locale) {
  const auto native = [](Variant same) { return native_from(same, ArrayStyle::of_variants); };
  switch (type) {
    case VT_BSTR:
      return native(value.to_text(locale));
    case VT_DATE:
      return native(value.to_date(locale));
    case VT_I2:
      return native(value.to_int16(locale));
    case VT_I4:
      return native(value.to_int32(locale));
    case VT_R4:
      return native(value.to_single(locale));
    case VT_R8:
      return native(value.to_double(locale));
    case VT_CY:
      return native(value.to_currency(locale));
    case VT_BOOL:
      return native(value.to_boolean(locale));
    case VT_I1:
    case VT_UI1:
    case VT_UI2:
    case VT_UI4:
    case VT_INT:
    case VT_UINT:
    case VT_I8:
    case VT_UI8:
    case VT_DECIMAL:
      return other_number(value, type, locale);
    default:
      break;
  }
  OwnedVariant result = native(value);
  if (V_VT(&result.get()) == type) return result;
  if (FAILED(VariantChangeType(&result.get(), &result.get(), 0, type))) raise(ErrorNumber::type_mismatch);
  return result;
}

}  // namespace

const void* variable_of(const VARIANT& argument) noexcept {
  const VARIANT* at = &argument;
  for (int depth = 0; depth < most_references && V_VT(at) == (VT_BYREF | VT_VARIANT); ++depth) {
    at = V_VARIANTREF(at);
    if (at == nullptr) return nullptr;
  }
  if ((V_VT(at) & VT_BYREF) != 0) return V_BYREF(at);
  return at == &argument ? nullptr : at;
}

WriteBack::WriteBack(const VARIANT& argument, const Variant& value, const Locale& locale) {
  VARIANT& variable = const_cast<VARIANT&>(resolved(argument));
  if (const auto* const time = value.get_if<SystemTime>()) {
    record_ = system_time_of(variable);
    time_ = *time;
    if (record_ != nullptr) return;
  }
  make(variable, value, locale);
}

WriteBack::WriteBack(VARIANT* variable, const Variant& value, const Locale& locale) {
  make(const_cast<VARIANT&>(resolved(*variable)), value, locale);
}

void WriteBack::make(VARIANT& variable, const Variant& value, const Locale& locale) {
  variable_ = &variable;
  if ((V_VT(&variable) & VT_BYREF) != 0) {
    make_typed(value, locale);
    return;
  }
  if ((V_VT(&variable) & VT_ARRAY) != 0) require_resizable(V_ARRAY(&variable));
  native_ = native_from(value, ArrayStyle::of_variants);
}

void WriteBack::make_typed(const Variant& value, const Locale& locale) {
  const VARTYPE type = V_VT(variable_) & ~VT_BYREF;
  if ((type & VT_ARRAY) == 0) {
    native_ = converted(value, type, locale);
    return;
  }
  require_resizable(*V_ARRAYREF(variable_));
  const VARTYPE element = type & VT_TYPEMASK;
  if (element != VT_BSTR && element != VT_VARIANT) raise(ErrorNumber::type_mismatch);
  native_ = native_from(value, element == VT_BSTR ? ArrayStyle::of_texts : ArrayStyle::of_variants);
}

void WriteBack::store() noexcept {
  if (record_ != nullptr) {
    *record_ = time_;
  } else if ((V_VT(variable_) & VT_BYREF) == 0) {
    std::swap(*variable_, native_.get());
  } else if ((V_VT(variable_) & VT_ARRAY) != 0) {
    std::swap(*V_ARRAYREF(variable_), V_ARRAY(&native_.get()));
    if (V_ARRAY(&native_.get()) == nullptr) V_VT(&native_.get()) = VT_EMPTY;
  } else {
    store_typed();
  }
}

void WriteBack::store_typed() noexcept {
  VARIANT& native = native_.get();
  switch (V_VT(&native)) {
    case VT_BSTR:
      std::swap(*V_BSTRREF(variable_), V_BSTR(&native));
      break;
    case VT_DISPATCH:
      std::swap(*V_DISPATCHREF(variable_), V_DISPATCH(&native));
      break;
    case VT_UNKNOWN:
      std::swap(*V_UNKNOWNREF(variable_), V_UNKNOWN(&native));
      break;
    case VT_UI1:
    case VT_I1:
      *V_UI1REF(variable_) = V_UI1(&native);
      break;
    case VT_I2:
    case VT_UI2:
    case VT_BOOL:
      *V_I2REF(variable_) = V_I2(&native);
      break;
    case VT_I4:
    case VT_UI4:
    case VT_INT:
    case VT_UINT:
    case VT_ERROR:
    case VT_R4:
      *V_I4REF(variable_) = V_I4(&native);
      break;
    case VT_DECIMAL: {
      // In a variant, the first field of a decimal holds the type; in the caller's decimal it is unused, so keep it.
      DECIMAL& place = *V_DECIMALREF(variable_);
      const auto reserved = place.wReserved;
      place = V_DECIMAL(&native);
      place.wReserved = reserved;
      break;
    }
    default:
      *V_I8REF(variable_) = V_I8(&native);
      break;
  }
}

}  // namespace talutil::com
