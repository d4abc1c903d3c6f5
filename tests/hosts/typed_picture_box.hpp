#pragma once

#include <cmath>

#include "client.hpp"

namespace talutil::hosts {

/// A picture box as its type information describes it: functions are functions, properties have their accessors.
class PictureBox {
 public:
  virtual VARIANT_BOOL STDMETHODCALLTYPE get_FontBold() { return bold; }
  virtual void STDMETHODCALLTYPE put_FontBold(VARIANT_BOOL value) { bold = value; }
  virtual LONG STDMETHODCALLTYPE get_ForeColor() { return colour; }
  virtual void STDMETHODCALLTYPE put_ForeColor(LONG value) { colour = value; }
  virtual double STDMETHODCALLTYPE get_CurrentX() { return x; }
  virtual void STDMETHODCALLTYPE put_CurrentX(double value) { x = value; }
  virtual double STDMETHODCALLTYPE get_CurrentY() { return y; }
  virtual void STDMETHODCALLTYPE put_CurrentY(double value) { y = value; }
  virtual LONG STDMETHODCALLTYPE get_hDC() { return static_cast<LONG>(reinterpret_cast<LONG_PTR>(context)); }
  virtual short STDMETHODCALLTYPE get_ScaleMode() { return 1; }
  virtual double STDMETHODCALLTYPE ScaleX(double value) { return value; }
  virtual double STDMETHODCALLTYPE TextWidth(BSTR text) { return 100.0 * SysStringLen(text); }
  virtual double STDMETHODCALLTYPE TextHeight(BSTR) { return 200; }
  virtual void STDMETHODCALLTYPE Print(BSTR text) {
    printed = std::wstring(view(text)) + (bold != 0 ? L" bold" : L"") + L" in " + std::to_wstring(colour) + L" at " +
              std::to_wstring(std::lround(x)) + L"," + std::to_wstring(std::lround(y));
  }

  HDC context = CreateCompatibleDC(nullptr);
  VARIANT_BOOL bold = VARIANT_FALSE;
  LONG colour = 5;
  double x = 0;
  double y = 0;
  std::wstring printed;

  PictureBox() = default;
  PictureBox(const PictureBox&) = delete;
  PictureBox& operator=(const PictureBox&) = delete;
  ~PictureBox() { DeleteDC(context); }
};

/// The box for automation, by way of the platform's own use of type information.
class TypedPictureBox final : public NamelessObject {
 public:
  TypedPictureBox() {
    const auto name = [](const wchar_t* text) { return const_cast<wchar_t*>(text); };
    PARAMDATA boolean{name(L"value"), VT_BOOL};
    PARAMDATA number{name(L"value"), VT_I4};
    PARAMDATA twips{name(L"value"), VT_R8};
    PARAMDATA text{name(L"value"), VT_BSTR};
    UINT slot = 0;
    std::vector<METHODDATA> members;
    const auto add = [&](const wchar_t* member, DISPID id, PARAMDATA* parameter, WORD use, VARTYPE result) {
      const UINT count = parameter == nullptr ? 0 : 1;
      members.push_back({name(member), parameter, id, slot++, CC_STDCALL, count, use, result});
    };
    const auto add_property = [&](const wchar_t* member, DISPID id, PARAMDATA& value) {
      add(member, id, nullptr, DISPATCH_PROPERTYGET, value.vt);
      add(member, id, &value, DISPATCH_PROPERTYPUT, VT_EMPTY);
    };
    add_property(L"FontBold", 1, boolean);
    add_property(L"ForeColor", 2, number);
    add_property(L"CurrentX", 3, twips);
    add_property(L"CurrentY", 4, twips);
    add(L"hDC", 5, nullptr, DISPATCH_PROPERTYGET, VT_I4);
    add(L"ScaleMode", 6, nullptr, DISPATCH_PROPERTYGET, VT_I2);
    add(L"ScaleX", 7, &twips, DISPATCH_METHOD, VT_R8);
    add(L"TextWidth", 8, &text, DISPATCH_METHOD, VT_R8);
    add(L"TextHeight", 9, &text, DISPATCH_METHOD, VT_R8);
    add(L"Print", 10, &text, DISPATCH_METHOD, VT_EMPTY);
    INTERFACEDATA all{members.data(), static_cast<UINT>(members.size())};
    Pointer<ITypeInfo> class_information;
    require(CreateDispTypeInfo(&all, LOCALE_USER_DEFAULT, class_information.receive()), "CreateDispTypeInfo");
    // What it makes describes a class; the members are those of its interface.
    HREFTYPE members_type = 0;
    require(class_information->GetRefTypeOfImplType(0, &members_type), "GetRefTypeOfImplType");
    require(class_information->GetRefTypeInfo(members_type, information_.receive()), "GetRefTypeInfo");
  }

  PictureBox box;
  ULONG references = 1;

  ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
  ULONG STDMETHODCALLTYPE Release() override { return --references; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* names, UINT count, LCID, DISPID* ids) override {
    return DispGetIDsOfNames(information_.get(), names, count, ids);
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* parameters, VARIANT* result,
                                   EXCEPINFO* exception, UINT* argument) override {
    return DispInvoke(&box, information_.get(), id, flags, parameters, result, exception, argument);
  }

 private:
  Pointer<ITypeInfo> information_;
};

}  // namespace talutil::hosts
