#pragma once

#include <algorithm>
#include <array>
#include <atomic>
#include <cstring>
#include <functional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "checks.hpp"
#include "com/pointer.hpp"

// Defines the identifiers that the header declares.
#include <initguid.h>
// After initguid.h.
#include "TALUtil.h"

namespace talutil::hosts {

using com::Pointer;

inline void require(HRESULT result, const char* what) {
  if (FAILED(result)) throw std::runtime_error(std::string(what) + " answered " + shown(result));
}

template <class T>
std::wstring_view view(const T& text) {
  return {text, SysStringLen(text)};
}

/// A text as an argument or a result: `u->StripNulls(Text(L"a"), out)`.
class Text {
 public:
  Text() = default;
  Text(std::wstring_view text) : value_(SysAllocStringLen(text.data(), static_cast<UINT>(text.size()))) {}
  Text(const wchar_t* text) : Text(std::wstring_view(text)) {}
  Text(const Text&) = delete;
  Text& operator=(const Text&) = delete;
  ~Text() { SysFreeString(value_); }

  [[nodiscard]] BSTR get() const noexcept { return value_; }
  [[nodiscard]] BSTR release() noexcept { return std::exchange(value_, nullptr); }
  [[nodiscard]] std::wstring_view view() const noexcept { return {value_, SysStringLen(value_)}; }
  operator BSTR*() noexcept { return &value_; }

 private:
  BSTR value_ = nullptr;
};

/// A number as an argument passed by reference.
template <class T>
struct Number {
  T value{};
  operator T*() noexcept { return &value; }
};
using Short = Number<short>;
using Long = Number<LONG>;

/// A VARIANT that is cleared at its end.
class Value {
 public:
  Value() noexcept { VariantInit(&value_); }
  Value(const wchar_t* text) : Value() { put(VT_BSTR, V_BSTR(&value_), SysAllocString(text)); }
  Value(std::wstring_view text) : Value() { put(VT_BSTR, V_BSTR(&value_), Text(text).release()); }
  Value(short number) : Value() { put(VT_I2, V_I2(&value_), number); }
  Value(LONG number) : Value() { put(VT_I4, V_I4(&value_), number); }
  Value(double number) : Value() { put(VT_R8, V_R8(&value_), number); }
  Value(IDispatch* object) : Value() {
    put(VT_DISPATCH, V_DISPATCH(&value_), object);
    if (object != nullptr) object->AddRef();
  }
  /// A reference to a caller's variable.
  Value(VARIANT* variable) : Value() { put(VT_BYREF | VT_VARIANT, V_VARIANTREF(&value_), variable); }
  static Value null() { return of_type(VT_NULL); }
  static Value of_type(VARTYPE type) {
    Value result;
    V_VT(&result.value_) = type;
    return result;
  }
  static Value reference(VARTYPE type, void* place) {
    Value result;
    result.put(static_cast<VARTYPE>(VT_BYREF | type), V_BYREF(&result.value_), place);
    return result;
  }
  static Value missing() {
    Value result;
    result.put(VT_ERROR, V_ERROR(&result.value_), DISP_E_PARAMNOTFOUND);
    return result;
  }
  Value(Value&& other) noexcept : value_(other.value_) { VariantInit(&other.value_); }
  Value& operator=(Value&& other) noexcept {
    std::swap(value_, other.value_);
    return *this;
  }
  ~Value() { VariantClear(&value_); }

  [[nodiscard]] VARIANT& get() noexcept { return value_; }
  [[nodiscard]] const VARIANT& get() const noexcept { return value_; }
  [[nodiscard]] VARTYPE type() const noexcept { return V_VT(&value_); }
  [[nodiscard]] std::wstring_view text() const noexcept {
    return type() == VT_BSTR ? hosts::view(V_BSTR(&value_)) : std::wstring_view(L"(not a text)");
  }
  operator VARIANT*() noexcept { return &value_; }

 private:
  template <class Field, class Given>
  void put(VARTYPE type, Field& field, Given given) noexcept {
    field = given;
    V_VT(&value_) = type;
  }

  VARIANT value_;
};

/// A one-dimensional array, destroyed at its end.
class Array {
 public:
  Array() = default;
  Array(VARTYPE type, LONG lower, std::initializer_list<const wchar_t*> items)
      : array_(SafeArrayCreateVector(type, lower, static_cast<ULONG>(items.size()))) {
    LONG index = lower;
    for (const wchar_t* const item : items) {
      Value element(item);
      SafeArrayPutElement(array_, &index,
                          type == VT_BSTR ? static_cast<void*>(V_BSTR(&element.get())) : &element.get());
      ++index;
    }
  }
  static Array square(VARTYPE type) {
    std::array<SAFEARRAYBOUND, 2> bounds{{{2, 0}, {2, 0}}};
    Array result;
    result.array_ = SafeArrayCreate(type, 2, bounds.data());
    return result;
  }
  Array(Array&& other) noexcept : array_(std::exchange(other.array_, nullptr)) {}
  ~Array() {
    if (array_ != nullptr) SafeArrayDestroy(array_);
  }

  [[nodiscard]] SAFEARRAY*& get() noexcept { return array_; }
  operator SAFEARRAY**() noexcept { return &array_; }

 private:
  SAFEARRAY* array_ = nullptr;
};

/// The texts of an array, in brackets, each followed by a bar: what a row of a table can hold.
inline std::wstring contents(const SAFEARRAY* array) {
  if (array == nullptr) return L"(none)";
  VARTYPE type = VT_EMPTY;
  SafeArrayGetVartype(const_cast<SAFEARRAY*>(array), &type);
  std::wstring result = L"[";
  for (ULONG i = 0; i < array->rgsabound[0].cElements; ++i) {
    const BSTR text =
        type == VT_BSTR ? static_cast<BSTR*>(array->pvData)[i] : V_BSTR(&static_cast<VARIANT*>(array->pvData)[i]);
    result += std::wstring(view(text)) + L"|";
  }
  return result + L"]";
}

inline Pointer<_ORVUtils> create_object() {
  Pointer<_ORVUtils> object;
  require(CoCreateInstance(CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, IID__ORVUtils, object.receive_untyped()),
          "creating TALUtil.ORVUtils");
  return object;
}

/// Handles the messages that wait for this thread, calls from other apartments among them.
inline void handle_messages() {
  MSG message;
  while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != 0) DispatchMessageW(&message);
}

/// Does the work on a thread with an apartment of its own, while this thread handles the calls that come from there and
/// whatever else it is given.
template <class Work, class Meanwhile = void (*)()>
void on_another_thread(COINIT apartment, Work work, Meanwhile meanwhile = &handle_messages) {
  std::atomic<bool> is_done = false;
  std::thread thread([&] {
    CoInitializeEx(nullptr, apartment);
    try {
      work();
    } catch (const std::exception& error) {
      check(false, error.what());
    }
    CoUninitialize();
    is_done = true;
  });
  while (!is_done) {
    MsgWaitForMultipleObjects(0, nullptr, FALSE, 1, QS_ALLINPUT);
    meanwhile();
  }
  thread.join();
}

/// The description of the thread's error, with its source before it: "TALUtil.ORVUtils: Type mismatch".
inline std::wstring error_text() {
  Pointer<IErrorInfo> error;
  if (GetErrorInfo(0, error.receive()) != S_OK) return L"(no error information)";
  Text source;
  Text description;
  error->GetSource(source);
  error->GetDescription(description);
  return std::wstring(source.view()) + L": " + std::wstring(description.view());
}

/// The HRESULT of a run-time error.
constexpr HRESULT run_time_error(int number) {
  return static_cast<HRESULT>(0x800A0000U + static_cast<unsigned>(number));
}

/// What the clients' own automation objects have in common: most know no names.
class NamelessObject : public IDispatch {
 public:
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) final {
    *out = id == IID_IUnknown || id == IID_IDispatch ? this : nullptr;
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) final { return *count = 0, S_OK; }
  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT, LCID, ITypeInfo**) final { return DISP_E_BADINDEX; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override {
    return DISP_E_UNKNOWNNAME;
  }
};

/// An object of the client's that has no automation at all.
class UndrivenObject final : public IUnknown {
 public:
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    *out = id == IID_IUnknown ? this : nullptr;
    return *out == nullptr ? E_NOINTERFACE : S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }

  [[nodiscard]] Value value() {
    Value result;
    V_VT(&result.get()) = VT_UNKNOWN;
    V_UNKNOWN(&result.get()) = this;
    return result;
  }
};

/// An automation object of the client's: its default property answers a value, or there is none, or it fails; every
/// other member is unknown, but that a form knows the names by which forms and picture boxes are told. Its references
/// are counted for the client to see.
class HostObject final : public NamelessObject {
 public:
  enum class Kind { with_value, without_value, failing, form };
  explicit HostObject(Kind kind) noexcept : kind_(kind) {}

  ULONG references = 1;

  ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
  ULONG STDMETHODCALLTYPE Release() override { return --references; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* name, UINT, LCID, DISPID* id) override {
    constexpr std::wstring_view known[] = {L"hwnd", L"ScaleMode", L"ScaleX"};
    const auto* const found = std::ranges::find(known, *name);
    *id = kind_ == Kind::form && found != std::end(known) ? static_cast<DISPID>(found - known) + 1 : DISPID_UNKNOWN;
    return *id == DISPID_UNKNOWN ? DISP_E_UNKNOWNNAME : S_OK;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS*, VARIANT* result,
                                   EXCEPINFO* exception, UINT*) override {
    const bool has_value = kind_ == Kind::with_value || kind_ == Kind::failing;
    if (id != DISPID_VALUE || (flags & DISPATCH_PROPERTYGET) == 0 || !has_value) return DISP_E_MEMBERNOTFOUND;
    if (kind_ == Kind::failing) {
      exception->scode = failure;
      exception->bstrDescription = SysAllocString(L"not today");
      return DISP_E_EXCEPTION;
    }
    *result = VARIANT{};
    V_VT(result) = VT_BSTR;
    V_BSTR(result) = SysAllocString(L"12");
    return S_OK;
  }

  static constexpr auto failure = static_cast<HRESULT>(0x80041234U);

 private:
  Kind kind_;
};

}  // namespace talutil::hosts
