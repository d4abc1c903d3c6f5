// A client that is bound early, by the header that the interface compiler made, as old compilers make their hosts:
// linked with the tool chain's run-time in its default, shared way, with floating-point exceptions unmasked, and
// letting go of its objects while they work.
#include <xmmintrin.h>

#include <limits>

#include "client.hpp"

using namespace talutil::hosts;

namespace {

using U = _ORVUtils;

void first_error_is_caught(U* u) {
  check_equal(run_time_error(5), u->StringReplace(Text(L"a"), Text(), Text(), Text()), "the first run-time error");
  check_equal(L"TALUtil.ORVUtils: Invalid procedure call or argument", early_outcome(S_OK).text, "its text");
  u->StringReplace(Text(L"a"), Text(), Text(), Text());
  check_equal(E_POINTER, u->StringReplace(nullptr, Text(), Text(), Text()), "a null pointer");
  check_equal(L"(no error information)", early_outcome(S_OK).text, "information on it");
}

void the_computer_has_its_name(U* u) {
  std::array<wchar_t, MAX_COMPUTERNAME_LENGTH + 1> name{};
  auto length = static_cast<DWORD>(name.size());
  GetComputerNameW(name.data(), &length);
  check_equal(std::wstring_view(name.data(), length), text(u, &U::get_ComputerName), "ComputerName");
}

/// The fields that dates lack stay.
void records_are_written_in_place(U* u) {
  SYSTEMTIME time{1, 2, 77, 3, 4, 5, 6, 88};
  const short expected[] = {2024, 3, 77, 11, 22, 0, 0, 88};
  DATE date = 45362.0 + 22.0 / 24;
  check_equal(S_OK, u->DateToSystemTime(date, &time), "DateToSystemTime");
  check(std::memcmp(expected, &time, sizeof time) == 0, "the record that was written");
  check_equal(S_OK, u->SystemTimeToDate(&time, &(date = 0)), "SystemTimeToDate");
  check(date == 45362.0 + 22.0 / 24, "its date");
}

int timer_ticks = 0;
int quitting_tick = 0;

void CALLBACK count_tick(HWND, UINT, UINT_PTR, DWORD) {
  if (++timer_ticks == quitting_tick) PostQuitMessage(7);
}

void passwords_let_messages_in(U* u) {
  const UINT_PTR timer = SetTimer(nullptr, 0, USER_TIMER_MINIMUM, &count_tick);
  for (int calls = 0; timer_ticks < 2 && calls < 10000; ++calls)
    u->GenerateFilePassword(Short{100}, Short{2}, Short{0}, Text());
  check(timer_ticks >= 2, "timer messages are handled between the draws");

  // The mix that draws nothing: the call sleeps until the thread is asked to quit, which its own loop hears of too.
  quitting_tick = timer_ticks + 3;
  const HRESULT status = u->GenerateFilePassword(Short{2}, Short{2}, Short{5}, Text());
  check_equal(run_time_error(18), status, "asked to quit");
  check_equal(L"TALUtil.ORVUtils: User interrupt occurred", early_outcome(status).text, "asked to quit");
  KillTimer(nullptr, timer);
  MSG message{};
  while (GetMessageW(&message, nullptr, 0, 0) > 0) DispatchMessageW(&message);
  check_equal(7, static_cast<int>(message.wParam), "the exit code is kept for the host");
}

void interfaces_are_one_object(U* u) {
  const IID* const known[] = {&IID_IDispatch, &IID__ORVUtils, &IID_ISupportErrorInfo, &IID_IProvideClassInfo,
                              &IID_IUnknown};
  const auto ask = [](IUnknown* object, const IID& id) {
    Pointer<IUnknown> other;
    check_equal(S_OK, object->QueryInterface(id, other.receive_untyped()), "from one interface to another");
    return other;
  };
  for (const IID* from : known) {
    for (const IID* to : known) {
      const Pointer<IUnknown> other = ask(ask(u, *from).get(), *to);
      check(ask(other.get(), IID_IUnknown).get() == ask(u, IID_IUnknown).get(), "the identity of the object");
    }
  }
  void* none = u;
  check_equal(E_NOINTERFACE, u->QueryInterface(IID_IPersist, &none), "an interface it does not have");
  check(none == nullptr, "what is given with it");
  check_equal(E_POINTER, u->QueryInterface(IID_IUnknown, nullptr), "no place for the interface");

  Pointer<ISupportErrorInfo> errors;
  Pointer<IProvideClassInfo> classes;
  Pointer<ITypeInfo> information;
  Text name;
  u->QueryInterface(IID_ISupportErrorInfo, errors.receive_untyped());
  u->QueryInterface(IID_IProvideClassInfo, classes.receive_untyped());
  check_equal(S_OK, errors->InterfaceSupportsErrorInfo(IID__ORVUtils), "error information of _ORVUtils");
  check_equal(S_FALSE, errors->InterfaceSupportsErrorInfo(IID_IPersist), "of an interface it does not have");
  require(classes->GetClassInfo(information.receive()), "GetClassInfo");
  information->GetDocumentation(MEMBERID_NIL, name, nullptr, nullptr, nullptr);
  check_equal(L"ORVUtils", name.view(), "the class information");
}

std::uint16_t control_word() {
  std::uint16_t value = 0;
  __asm__ volatile("fnstcw %0" : "=m"(value));
  return value;
}

/// Settings of the processor that a host may have, until the end of a scope.
class Settings {
 public:
  Settings(std::uint16_t control, std::uint32_t sse_control) { set(control, sse_control); }
  Settings(const Settings&) = delete;
  Settings& operator=(const Settings&) = delete;
  ~Settings() { set(control_, sse_control_); }

 private:
  static void set(std::uint16_t control, std::uint32_t sse_control) {
    __asm__ volatile("fnclex");
    __asm__ volatile("fldcw %0" : : "m"(control));
    _mm_setcsr(sse_control);
  }

  std::uint16_t control_ = control_word();
  std::uint32_t sse_control_ = _mm_getcsr();
};

void unmasked_exceptions_do_no_harm(U* u) {
  // Invalid operation, division by zero and overflow unmasked, in both units.
  constexpr std::uint16_t control = 0x0272;
  constexpr std::uint32_t sse_control = 0x1900;
  Value number(std::numeric_limits<double>::quiet_NaN());
  const Settings settings(control, sse_control);
  const HRESULT early = u->GetDay(number, Short{});
  const HRESULT late = use(u, L"GetDay", number).status;
  const std::uint16_t control_after = control_word();
  const std::uint32_t sse_control_after = _mm_getcsr() & ~0x3FU;
  check(FAILED(early), "a NaN for a date, early");
  check_equal(DISP_E_EXCEPTION, late, "a NaN for a date, late");
  check_equal(control, control_after, "the control word comes back");
  check_equal(sse_control, sse_control_after, "so does that of the newer unit");
}

void short_precision_changes_no_digit(U* u) {
  constexpr std::uint16_t single_precision = 0x007F;
  const Settings settings(single_precision, 0x1F80);
  const std::wstring digits = text(u, &U::VerifyIntData, Short{0}, Value(L"123456789012345"));
  check_equal(L"123456789012345", digits, "a number with 24 bits of precision");
}

auto second_object() { return create_object<_cControlPosition>(CLSID_cControlPosition, IID__cControlPosition); }

/// A control, which is its own form, lets go of the library's object while that moves it.
void objects_outlive_their_calls() {
  for (const bool is_early : {true, false}) {
    _cControlPosition* const object = second_object().release();
    ULONG left = 77;
    HostObject* form = nullptr;
    HostObject control({L"left", L"Top", L"Width", L"Height", L"ScaleWidth", L"ScaleHeight", L"Container", L"Move"},
                       [&](const Use& use) {
                         if (use.member == 8) return left = object->Release(), S_OK;
                         if (use.member == 7) return use.answer(form);
                         return use.answer(use.member > 4 ? 1000L : 10L);
                       });
    form = &control;
    Value moved(&control);
    const HRESULT status =
        is_early ? object->DragControl(moved, moved, 20, 20)
                 : use(object, L"DragControl", Value(&control), Value(&control), Value(20L), Value(20L)).error;
    check_equal(S_OK, status, "the last reference goes during a call");
    check_equal(1U, left, "references that the call itself holds");
    moved = Value();
    check_equal(1U, control.references, "references to the control");
  }
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const Pointer<U> object = create_object();
    U* const u = object.get();
    for (const auto check_part :
         {first_error_is_caught, the_computer_has_its_name, records_are_written_in_place, passwords_let_messages_in,
          interfaces_are_one_object, unmasked_exceptions_do_no_harm, short_precision_changes_no_digit})
      check_part(u);
    objects_outlive_their_calls();
    check_equal(S_OK, u->Terminate(), "Terminate");
    check_equal(S_OK, u->Terminate(), "Terminate again");
  });
}
