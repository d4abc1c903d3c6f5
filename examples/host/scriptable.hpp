#pragma once

#include <windows.h>
// After windows.h.
#include <oleauto.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

/// An automation object made of functions: the library drives a host's windows through such objects, by name.
///
///     auto* const form = new Scriptable;
///     form->property(L"Width", [=] { return variant(width_of(window)); }, [=](const VARIANT& v) { ... });
///     form->method(L"Refresh", [=](Arguments) { UpdateWindow(window); return VARIANT{}; });
class Scriptable : public IDispatch {
 public:
  /// The arguments of a use, in the order that they are written.
  using Arguments = std::vector<VARIANT>;
  using Method = std::function<VARIANT(const Arguments&)>;
  using Getter = std::function<VARIANT()>;
  using Setter = std::function<void(const VARIANT&)>;

  void method(const wchar_t* name, Method call) { members_.push_back({name, std::move(call), {}}); }
  void property(const wchar_t* name, Getter get, Setter put = {}) {
    members_.push_back({name, [get = std::move(get)](const Arguments&) { return get(); }, std::move(put)});
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
    const Member& member = members_[static_cast<std::size_t>(id) - 1];
    try {
      if ((flags & DISPATCH_PROPERTYPUT) != 0) {
        if (!member.put || parameters->cArgs != 1) return DISP_E_MEMBERNOTFOUND;
        member.put(parameters->rgvarg[0]);
        return S_OK;
      }
      // Automation hands arguments over last first.
      const Arguments arguments(std::reverse_iterator(parameters->rgvarg + parameters->cArgs),
                                std::reverse_iterator(parameters->rgvarg));
      VARIANT answer = member.call(arguments);
      if (result != nullptr)
        *result = answer;
      else
        VariantClear(&answer);
      return S_OK;
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
    Method call;
    Setter put;
  };

  virtual ~Scriptable() = default;

  std::vector<Member> members_;
  ULONG references_ = 1;
};

/// Values for automation and back.
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
/// The value gets a reference of its own.
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
