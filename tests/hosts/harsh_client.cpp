// A host that lets go of its objects while they work.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

/// A control that lets go of the library's object while that moves it.
class LettingGo final : public NamelessObject {
 public:
  IUnknown* object = nullptr;
  ULONG left = 77;

  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* names, UINT, LCID, DISPID* id) override {
    constexpr std::wstring_view known[] = {L"left",       L"Top",         L"Width", L"Height",
                                           L"ScaleWidth", L"ScaleHeight", L"Move",  L"Container"};
    const auto* const found = std::find(std::begin(known), std::end(known), names[0]);
    *id = static_cast<DISPID>(found - known) + 1;
    return found == std::end(known) ? DISP_E_UNKNOWNNAME : S_OK;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS*, VARIANT* result, EXCEPINFO*,
                                   UINT*) override {
    constexpr DISPID move = 7;
    constexpr DISPID container = 8;
    if (id == move) {
      if ((flags & DISPATCH_METHOD) == 0) return DISP_E_MEMBERNOTFOUND;
      left = object->Release();
      return S_OK;
    }
    if ((flags & DISPATCH_PROPERTYGET) == 0) return DISP_E_MEMBERNOTFOUND;
    V_VT(result) = id == container ? VT_DISPATCH : VT_R4;
    if (id == container)
      V_DISPATCH(result) = this;
    else
      V_R4(result) = id == 5 || id == 6 ? 1000.0F : 10.0F;
    return S_OK;
  }
};

void objects_outlive_their_calls() {
  LettingGo control;
  Pointer<_cControlPosition> position;
  require(CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                           position.receive_untyped()),
          "creating TALUtil.cControlPosition");
  control.object = position.get();
  Value form(&control);
  Value moved(&control);
  check_equal(S_OK, position.release()->DragControl(form, moved, 20, 20),
              "the last reference goes during an early call");
  check_equal(1U, control.left, "references that the call itself holds");

  require(CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                           position.receive_untyped()),
          "creating TALUtil.cControlPosition");
  control.object = position.get();
  control.left = 77;
  std::array<VARIANT, 4> arguments{Value(20.0).get(), Value(20.0).get(), moved.get(), form.get()};
  DISPPARAMS parameters{arguments.data(), nullptr, 4, 0};
  auto* name = const_cast<wchar_t*>(L"DragControl");
  DISPID id = 0;
  position->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id);
  check_equal(S_OK,
              position.release()->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, nullptr,
                                         nullptr, nullptr),
              "the last reference goes during a late call");
  check_equal(1U, control.left, "references that the call itself holds");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    objects_outlive_their_calls();
  });
}
