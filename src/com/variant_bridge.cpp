#include "com/variant_bridge.hpp"

#include <limits>

#include "automation/run_time_error.hpp"
#include "com/dispatch_object.hpp"
#include "com/module.hpp"
#include "library/identity.hpp"

namespace talutil::com {

namespace {

/// Gives access to the data of an array for reading or writing.
class ArrayAccess {
 public:
  explicit ArrayAccess(SAFEARRAY* array) : array_(array) {
    if (FAILED(SafeArrayAccessData(array, &data_))) raise(ErrorNumber::array_fixed_or_locked);
  }
  ArrayAccess(const ArrayAccess&) = delete;
  ArrayAccess& operator=(const ArrayAccess&) = delete;
  ~ArrayAccess() { SafeArrayUnaccessData(array_); }

  template <class T>
  [[nodiscard]] T* as() const noexcept {
    return static_cast<T*>(data_);
  }

 private:
  SAFEARRAY* array_;
  void* data_ = nullptr;
};

double decimal_to_double(DECIMAL value) {
  double result = 0;
  if (FAILED(VarR8FromDec(&value, &result))) raise(ErrorNumber::overflow);
  return result;
}

/// A whole number of any size as the smallest of our kinds that can hold it.
template <class T>
Variant whole_number(T value) {
  if (std::in_range<std::int16_t>(value)) return static_cast<std::int16_t>(value);
  if (std::in_range<std::int32_t>(value)) return static_cast<std::int32_t>(value);
  return static_cast<double>(value);
}

/// The data of a simple type, whether in the VARIANT itself or referred to by it.
Variant simple_value(VARTYPE type, const void* data) {
  const auto as = [data]<class T>(std::type_identity<T>) { return *static_cast<const T*>(data); };
  switch (type) {
    case VT_UI1:
      return as(std::type_identity<std::uint8_t>{});
    case VT_I2:
      return as(std::type_identity<std::int16_t>{});
    case VT_I4:
    case VT_INT:
      return as(std::type_identity<std::int32_t>{});
    case VT_R4:
      return as(std::type_identity<float>{});
    case VT_R8:
      return as(std::type_identity<double>{});
    case VT_CY:
      return Currency{as(std::type_identity<std::int64_t>{})};
    case VT_DATE:
      return Date{as(std::type_identity<double>{})};
    case VT_BOOL:
      return Boolean::from_bits(as(std::type_identity<std::int16_t>{}));
    case VT_ERROR:
      return ErrorValue{as(std::type_identity<std::int32_t>{})};
    case VT_BSTR:
      return text_from(as(std::type_identity<BSTR>{}));
    case VT_I1:
      return whole_number(as(std::type_identity<std::int8_t>{}));
    case VT_UI2:
      return whole_number(as(std::type_identity<std::uint16_t>{}));
    case VT_UI4:
    case VT_UINT:
      return whole_number(as(std::type_identity<std::uint32_t>{}));
    case VT_I8:
      return whole_number(as(std::type_identity<std::int64_t>{}));
    case VT_UI8:
      return whole_number(as(std::type_identity<std::uint64_t>{}));
    case VT_DECIMAL:
      return decimal_to_double(*static_cast<const DECIMAL*>(data));
    case VT_DISPATCH:
      return object_from(as(std::type_identity<IDispatch*>{}));
    case VT_UNKNOWN:
      return object_from(as(std::type_identity<IUnknown*>{}));
    default:
      raise(ErrorNumber::type_mismatch);
  }
}

void put(VARIANT& out, std::monostate) { V_VT(&out) = VT_EMPTY; }
void put(VARIANT& out, Null) { V_VT(&out) = VT_NULL; }
void put(VARIANT& out, Boolean value) {
  V_VT(&out) = VT_BOOL;
  V_BOOL(&out) = value.bits();
}
void put(VARIANT& out, std::uint8_t value) {
  V_VT(&out) = VT_UI1;
  V_UI1(&out) = value;
}
void put(VARIANT& out, std::int16_t value) {
  V_VT(&out) = VT_I2;
  V_I2(&out) = value;
}
void put(VARIANT& out, std::int32_t value) {
  V_VT(&out) = VT_I4;
  V_I4(&out) = value;
}
void put(VARIANT& out, float value) {
  V_VT(&out) = VT_R4;
  V_R4(&out) = value;
}
void put(VARIANT& out, double value) {
  V_VT(&out) = VT_R8;
  V_R8(&out) = value;
}
void put(VARIANT& out, Currency value) {
  V_VT(&out) = VT_CY;
  V_CY(&out).int64 = value.ten_thousandths;
}
void put(VARIANT& out, Date value) {
  V_VT(&out) = VT_DATE;
  V_DATE(&out) = value.days;
}
void put(VARIANT& out, ErrorValue value) {
  V_VT(&out) = VT_ERROR;
  V_ERROR(&out) = value.code;
}
void put(VARIANT& out, const Text& value) {
  V_BSTR(&out) = OwnedText(value).release();
  V_VT(&out) = VT_BSTR;
}
void put(VARIANT& out, const ObjectRef& value) {
  V_DISPATCH(&out) = dispatch_from(value);
  V_VT(&out) = VT_DISPATCH;
}
// Records are written to the caller's record; a variable without one cannot take one.
void put(VARIANT&, const SystemTime&) { raise(ErrorNumber::type_mismatch); }
void put(VARIANT& out, const ForeignArray& value) {
  // The platform's function is not const-correct, but does not change its source.
  auto* const native = const_cast<VARIANT*>(static_cast<const VARIANT*>(value.contents.get()));
  if (FAILED(VariantCopy(&out, native))) throw std::bad_alloc();
}

/// A copy of an array that members can only return unchanged.
ForeignArray kept_array(SAFEARRAY* array, VARTYPE element) {
  auto copy = std::make_shared<OwnedVariant>();
  VARIANT& native = copy->get();
  V_VT(&native) = static_cast<VARTYPE>(VT_ARRAY | element);
  // Copying fails only if the array is corrupt.
  if (array != nullptr && FAILED(SafeArrayCopy(array, &V_ARRAY(&native)))) raise(ErrorNumber::type_mismatch);
  return {std::shared_ptr<const void>(copy, &native)};
}

}  // namespace

OwnedText::OwnedText(TextView text) : text_(nullptr) {
  if (text.size() > std::numeric_limits<UINT>::max()) throw std::bad_alloc();
  text_ = SysAllocStringLen(reinterpret_cast<const wchar_t*>(text.data()), static_cast<UINT>(text.size()));
  if (text_ == nullptr) throw std::bad_alloc();
}

OwnedArray::OwnedArray(const TextArray& array, ArrayStyle style) {
  if (!array.allocated) return;
  const VARTYPE type = style == ArrayStyle::of_texts ? VT_BSTR : VT_VARIANT;
  // Not SafeArrayCreateVector, whose arrays are documented as fixed-size (FADF_FIXEDSIZE): a host could not resize one
  // in its next call with the same variable. Wine does not set the flag.
  SAFEARRAYBOUND bound{static_cast<ULONG>(array.items.size()), array.lower_bound};
  array_ = SafeArrayCreate(type, 1, &bound);
  if (array_ == nullptr) throw std::bad_alloc();
  // The array owns each element as soon as it is stored, even if a later one fails.
  const ArrayAccess access(array_);
  for (std::size_t i = 0; i < array.items.size(); ++i) {
    OwnedText element(array.items[i]);
    if (style == ArrayStyle::of_texts) {
      access.as<BSTR>()[i] = element.release();
    } else {
      VARIANT& place = access.as<VARIANT>()[i];
      V_VT(&place) = VT_BSTR;
      V_BSTR(&place) = element.release();
    }
  }
}

Text text_from(BSTR text) { return Text(win32::view(text, SysStringLen(text))); }

TextArray array_from(SAFEARRAY* array, const Locale& locale) {
  TextArray result;
  if (array == nullptr) return result;
  if (SafeArrayGetDim(array) == 0) return result;
  if (SafeArrayGetDim(array) != 1) raise(ErrorNumber::subscript_out_of_range);
  VARTYPE type = VT_EMPTY;
  if (FAILED(SafeArrayGetVartype(array, &type)) || (type != VT_BSTR && type != VT_VARIANT)) {
    raise(ErrorNumber::type_mismatch);
  }
  result.allocated = true;
  result.lower_bound = array->rgsabound[0].lLbound;
  const std::size_t count = array->rgsabound[0].cElements;
  result.items.reserve(count);
  const ArrayAccess access(array);
  for (std::size_t i = 0; i < count; ++i) {
    result.items.push_back(type == VT_BSTR ? text_from(access.as<BSTR>()[i])
                                           : variant_from(access.as<VARIANT>()[i]).to_text(locale));
  }
  return result;
}

void require_resizable(const SAFEARRAY* array) {
  if (array == nullptr) return;
  const bool is_fixed = (array->fFeatures & (FADF_AUTO | FADF_STATIC | FADF_FIXEDSIZE)) != 0;
  if (is_fixed || array->cLocks != 0) raise(ErrorNumber::array_fixed_or_locked);
}

SystemTime* system_time_of(const VARIANT& value) noexcept {
  if ((V_VT(&value) & VT_TYPEMASK) != VT_RECORD || (V_VT(&value) & VT_ARRAY) != 0) return nullptr;
  constexpr GUID ours = guid_of(identity::system_time_record);
  GUID id{};
  if (V_RECORDINFO(&value) == nullptr || FAILED(V_RECORDINFO(&value)->GetGuid(&id)) || id != ours) return nullptr;
  return static_cast<SystemTime*>(V_RECORD(&value));
}

const VARIANT& resolved(const VARIANT& value) {
  const VARIANT* at = &value;
  for (int depth = 0; V_VT(at) == (VT_BYREF | VT_VARIANT); ++depth) {
    at = V_VARIANTREF(at);
    if (at == nullptr || depth == most_references) raise(ErrorNumber::invalid_procedure_call);
  }
  return *at;
}

Variant variant_from(const VARIANT& value) {
  const VARIANT& source = resolved(value);
  const VARTYPE type = V_VT(&source) & VT_TYPEMASK;
  const bool by_reference = (V_VT(&source) & VT_BYREF) != 0;
  if (by_reference && V_BYREF(&source) == nullptr) raise(ErrorNumber::invalid_procedure_call);
  if ((V_VT(&source) & VT_ARRAY) != 0) {
    SAFEARRAY* const array = by_reference ? *V_ARRAYREF(&source) : V_ARRAY(&source);
    if (type != VT_BSTR || array == nullptr || SafeArrayGetDim(array) != 1) return kept_array(array, type);
    return array_from(array, {});
  }
  if (type == VT_EMPTY) return {};
  if (type == VT_NULL) return Null{};
  if (type == VT_RECORD) {
    SystemTime* const record = system_time_of(source);
    if (record == nullptr) raise(ErrorNumber::type_mismatch);
    return *record;
  }
  if (by_reference) return simple_value(type, V_BYREF(&source));
  // A decimal uses the whole VARIANT, every other type its data field.
  return simple_value(type, type == VT_DECIMAL ? static_cast<const void*>(&source) : &V_I8(&source));
}

OwnedVariant native_from(const Variant& value, ArrayStyle style) {
  OwnedVariant result;
  if (const auto* const array = value.get_if<TextArray>()) {
    OwnedArray native(*array, style);
    V_ARRAY(&result.get()) = native.release();
    V_VT(&result.get()) = static_cast<VARTYPE>(VT_ARRAY | (style == ArrayStyle::of_texts ? VT_BSTR : VT_VARIANT));
    return result;
  }
  value.visit([&](const auto& held) {
    if constexpr (!std::is_same_v<std::remove_cvref_t<decltype(held)>, TextArray>) put(result.get(), held);
  });
  return result;
}

}  // namespace talutil::com
