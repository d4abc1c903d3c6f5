#pragma once

#include <windows.h>
// After windows.h.
#include <oleauto.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

/// An automation object made of functions: the library drives a host's windows through such objects, by name. As with
/// real controls, a member can only be used as what it is: a method is called, a property is read or set.
///
///     auto* const form = new Scriptable;
///     form->property(L"Width", [=] { return variant(width_of(window)); }, [=](const VARIANT& v) { ... });
///     form->method(L"Refresh", {0, 0}, [=](const Scriptable::Arguments&) { UpdateWindow(window); return VARIANT{}; });
class Scriptable : public IDispatch {
 public:
  /// The arguments of a call, in the order in which they are written.
  using Arguments = std::vector<VARIANT>;
  using Method = std::function<VARIANT(const Arguments&)>;
  using Getter = std::function<VARIANT()>;
  using Setter = std::function<void(const VARIANT&)>;

  /// The number of arguments that a method takes.
  struct Count {
    std::size_t least;
    std::size_t most;
  };

  void method(const wchar_t* name, Count count, Method call) {
    members_.push_back({name, count, std::move(call), {}, {}, {}});
  }

  /// Any of the functions may be missing. `put` takes a value (`form.Width = 100`), `set` a reference to an object
  /// (`Set control.Container = form`). A caller may try one after the other.
  void property(const wchar_t* name, Getter get, Setter put = {}, Setter set = {}) {
    members_.push_back({name, {0, 0}, {}, std::move(get), std::move(put), std::move(set)});
  }

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    if (out == nullptr) return E_POINTER;
    *out = id == IID_IUnknown || id == IID_IDispatch ? this : nullptr;
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return ++references_; }
  ULONG STDMETHODCALLTYPE Release() override {
    const ULONG left = --references_;
    if (left == 0) delete this;
    return left;
  }
  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) override { return *count = 0, S_OK; }
  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT, LCID, ITypeInfo**) override { return DISP_E_BADINDEX; }

  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* names, UINT count, LCID, DISPID* ids) override {
    for (UINT i = 0; i < count; ++i) ids[i] = DISPID_UNKNOWN;
    for (std::size_t i = 0; i < members_.size(); ++i) {
      if (lstrcmpiW(members_[i].name, names[0]) == 0) ids[0] = static_cast<DISPID>(i + 1);
    }
    return count == 1 && ids[0] != DISPID_UNKNOWN ? S_OK : DISP_E_UNKNOWNNAME;
  }

  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* parameters, VARIANT* result,
                                   EXCEPINFO* exception, UINT*) override {
    if (id < 1 || static_cast<std::size_t>(id) > members_.size()) return DISP_E_MEMBERNOTFOUND;
    try {
      return use(members_[static_cast<std::size_t>(id) - 1], flags, *parameters, result);
    } catch (const std::exception& error) {
      if (exception != nullptr) {
        const std::string text = error.what();
        *exception = {};
        exception->scode = E_FAIL;
        exception->bstrSource = SysAllocString(L"Bookings");
        exception->bstrDescription = SysAllocString(std::wstring(text.begin(), text.end()).c_str());
      }
      return DISP_E_EXCEPTION;
    }
  }

 private:
  struct Member {
    const wchar_t* name;
    Count count;
    Method call;
    Getter get;
    Setter put;
    Setter set;
  };

  static HRESULT use(const Member& member, WORD flags, const DISPPARAMS& given, VARIANT* result) {
    // Late-bound callers cannot tell a function from a property and ask for a value with both flags.
    if ((flags & DISPATCH_METHOD) != 0 && member.call) {
      if (given.cArgs < member.count.least || given.cArgs > member.count.most) return DISP_E_BADPARAMCOUNT;
      // Automation passes arguments in reverse order.
      const Arguments arguments(std::reverse_iterator(given.rgvarg + given.cArgs), std::reverse_iterator(given.rgvarg));
      return answer(member.call(arguments), result);
    }
    if ((flags & DISPATCH_PROPERTYGET) != 0 && member.get) {
      return given.cArgs == 0 ? answer(member.get(), result) : DISP_E_BADPARAMCOUNT;
    }
    if ((flags & DISPATCH_PROPERTYPUTREF) != 0 && member.set) return take(member.set, given);
    if ((flags & DISPATCH_PROPERTYPUT) != 0 && member.put) return take(member.put, given);
    return DISP_E_MEMBERNOTFOUND;
  }

  static HRESULT take(const Setter& setter, const DISPPARAMS& given) {
    if (given.cArgs != 1) return DISP_E_BADPARAMCOUNT;
    setter(given.rgvarg[0]);
    return S_OK;
  }

  /// Passes a value to the caller, who may not want it.
  static HRESULT answer(VARIANT value, VARIANT* result) {
    if (result != nullptr)
      *result = value;
    else
      VariantClear(&value);
    return S_OK;
  }

  virtual ~Scriptable() = default;

  std::vector<Member> members_;
  ULONG references_ = 1;
};

/// Conversion of values to and from automation's types.
inline VARIANT variant(LONG number) {
  VARIANT value{};
  V_VT(&value) = VT_I4;
  V_I4(&value) = number;
  return value;
}
inline VARIANT variant(float number) {
  VARIANT value{};
  V_VT(&value) = VT_R4;
  V_R4(&value) = number;
  return value;
}
inline VARIANT variant(bool truth) {
  VARIANT value{};
  V_VT(&value) = VT_BOOL;
  V_BOOL(&value) = truth ? VARIANT_TRUE : VARIANT_FALSE;
  return value;
}
inline VARIANT variant(const std::wstring& text) {
  VARIANT value{};
  V_VT(&value) = VT_BSTR;
  V_BSTR(&value) = SysAllocString(text.c_str());
  return value;
}
/// The result holds its own reference to the object.
inline VARIANT variant(IDispatch* object) {
  VARIANT value{};
  V_VT(&value) = VT_DISPATCH;
  V_DISPATCH(&value) = object;
  if (object != nullptr) object->AddRef();
  return value;
}

inline float number_of(const VARIANT& value) {
  VARIANT number{};
  if (FAILED(VariantChangeType(&number, const_cast<VARIANT*>(&value), 0, VT_R4)))
    throw std::invalid_argument("A number is wanted here.");
  return V_R4(&number);
}
inline std::wstring text_of(const VARIANT& value) {
  VARIANT text{};
  if (FAILED(VariantChangeType(&text, const_cast<VARIANT*>(&value), 0, VT_BSTR)))
    throw std::invalid_argument("A text is wanted here.");
  std::wstring result(V_BSTR(&text), SysStringLen(V_BSTR(&text)));
  VariantClear(&text);
  return result;
}
