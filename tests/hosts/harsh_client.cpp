// A host as old compilers make them: linked with the tool chain's run-time in its default, shared way, with
// floating-point exceptions unmasked, and letting go of its objects while they work.
#include <xmmintrin.h>

#include <limits>

#include "client.hpp"

using namespace talutil::hosts;

namespace {

using U = _ORVUtils;

void first_error_is_caught(U* u) {
  check_equal(run_time_error(5), u->StringReplace(Text(L"a"), Text(), Text(), Text()), "the first run-time error");
}

std::uint16_t control_word() {
  std::uint16_t value = 0;
  __asm__ volatile("fnstcw %0" : "=m"(value));
  return value;
}

/// Settings of the processor that a host may have, until the end of a scope.
class Settings {
 public:
  Settings(std::uint16_t control, std::uint32_t sse_control) : control_(control_word()), sse_control_(_mm_getcsr()) {
    set(control, sse_control);
  }
  Settings(const Settings&) = delete;
  Settings& operator=(const Settings&) = delete;
  ~Settings() { set(control_, sse_control_); }

 private:
  static void set(std::uint16_t control, std::uint32_t sse_control) {
    __asm__ volatile("fnclex");
    __asm__ volatile("fldcw %0" : : "m"(control));
    _mm_setcsr(sse_control);
  }

  std::uint16_t control_;
  std::uint32_t sse_control_;
};

Value not_a_number() { return Value(std::numeric_limits<double>::quiet_NaN()); }

void unmasked_exceptions_do_no_harm(U* u) {
  // Invalid operation, division by zero and overflow unmasked, in both units.
  constexpr std::uint16_t control = 0x0272;
  constexpr std::uint32_t sse_control = 0x1900;
  HRESULT early = S_OK;
  HRESULT late = S_OK;
  std::uint16_t control_after = 0;
  std::uint32_t sse_control_after = 0;
  Value number = not_a_number();
  Value result;
  const Settings settings(control, sse_control);
  early = u->GetDay(number, Short{});
  VARIANT argument = number.get();
  DISPPARAMS parameters{&argument, nullptr, 1, 0};
  auto* name = const_cast<wchar_t*>(L"GetDay");
  DISPID id = 0;
  u->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id);
  late = u->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, result, nullptr, nullptr);
  control_after = control_word();
  sse_control_after = _mm_getcsr() & ~0x3FU;
  check(FAILED(early), "a NaN for a date, early");
  check_equal(DISP_E_EXCEPTION, late, "a NaN for a date, late");
  check_equal(control, control_after, "the control word comes back");
  check_equal(sse_control, sse_control_after, "so does that of the newer unit");
}

void short_precision_changes_no_digit(U* u) {
  constexpr std::uint16_t single_precision = 0x007F;
  Text digits;
  {
    const Settings settings(single_precision, 0x1F80);
    u->VerifyIntData(Short{0}, Value(L"123456789012345"), digits);
  }
  check_equal(L"123456789012345", digits.view(), "a number with 24 bits of precision");
}

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

void a_null_pointer_leaves_no_old_error(U* u) {
  u->StringReplace(Text(L"a"), Text(), Text(), Text());
  check_equal(E_POINTER, u->StringReplace(nullptr, Text(), Text(), Text()), "a null pointer");
  check_equal(L"(no error information)", error_text(), "information on it");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const Pointer<U> object = create_object();
    first_error_is_caught(object.get());
    unmasked_exceptions_do_no_harm(object.get());
    short_precision_changes_no_digit(object.get());
    objects_outlive_their_calls();
    a_null_pointer_leaves_no_old_error(object.get());
  });
}
