// A client that is bound early: through the vtable, by the header that the interface compiler made.
#include "library/c_control_position.hpp"
#include "library/interface_table.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

using U = _ORVUtils;

void settings_are_shared_and_survive() {
  Pointer<U> first = create_object();
  const Pointer<U> second = create_object();
  check(first.get() != second.get(), "two objects");
  VARIANT_BOOL unset = 7;
  check_equal(S_OK, first->get_WriteServerPerformanceFile(&unset), "a Boolean never put");
  check_equal(VARIANT_FALSE, unset, "a Boolean never put");
  first->put_sUserName(*Text(L"anne"));
  first->put_lLoginSessionID(-70000);
  first = {};
  const Pointer<U> third = create_object();
  Text user;
  LONG session = 0;
  second->get_sUserName(user);
  third->get_lLoginSessionID(&session);
  check_equal(L"anne", user.view(), "sUserName through another object");
  check_equal(-70000, session, "lLoginSessionID after the release of its object");
}

void properties_keep_what_they_are_given(U* u) {
  short narrow_number = 0;
  float single = 0;
  DATE date = 0;
  VARIANT_BOOL bits = 0;
  Text text(L"old");
  u->put_iBranchID(-32768);
  u->get_iBranchID(&narrow_number);
  check_equal(-32768, narrow_number, "iBranchID");
  u->put_GSTValue(12.5F);
  u->get_GSTValue(&single);
  check_equal(12.5F, single, "GSTValue");
  u->put_BookingScreenDate(-1.75);
  u->get_BookingScreenDate(&date);
  check_equal(-1.75, date, "BookingScreenDate");
  u->put_bIsProgrammer(1);
  u->get_bIsProgrammer(&bits);
  check_equal(1, bits, "a Boolean keeps the bits it was given");
  u->put_ORV3CFGName(*Text(std::wstring_view(L"a\0b\u00B4\u4E2D", 5)));
  u->get_ORV3CFGName(text);
  check_equal(std::wstring_view(L"a\0b\u00B4\u4E2D", 5), text.view(), "ORV3CFGName, with a NUL and wide characters");
  u->put_ORV3CFGName(nullptr);
  u->get_ORV3CFGName(text);
  check_equal(L"", text.view(), "ORV3CFGName put as a null text");
  u->get_ComputerName(text);
  std::array<wchar_t, MAX_COMPUTERNAME_LENGTH + 1> name{};
  auto length = static_cast<DWORD>(name.size());
  GetComputerNameW(name.data(), &length);
  check_equal(std::wstring_view(name.data(), length), text.view(), "ComputerName");
}

void object_properties_hold_references(U* u) {
  HostObject form(HostObject::Kind::form);
  check_equal(S_OK, u->put_SplashForm(Value(&form).get()), "putting an object");
  check_equal(2U, form.references, "references after the put");
  check_equal(S_OK, u->put_SplashForm(Value(static_cast<IDispatch*>(nullptr)).get()), "putting an empty reference");
  check_equal(1U, form.references, "references after that");
}

struct TextRow {
  const char* name;
  std::wstring_view expected;
  std::function<HRESULT(U*, BSTR*)> call;
};

void text_members(U* u) {
  // One for each shape of call; what the members do with their texts is the unit tests' business.
  const TextRow rows[] = {
      {"two numbers and a variant", L"O\u00B4Brien an",
       [](U* o, BSTR* out) { return o->VerifyTextData(Short{10}, Short{0}, Value(L"  O'Brien & Sons  "), out); }},
      {"a variant number", L"3.5", [](U* o, BSTR* out) { return o->VerifyIntData(Short{0}, Value(3.5), out); }},
      {"a NUL within", L"ab",
       [](U* o, BSTR* out) { return o->StripNulls(Text(std::wstring_view(L"ab\0cd", 5)), out); }},
      {"a NUL in the result", std::wstring_view(L"b\0a", 3),
       [](U* o, BSTR* out) { return o->ReverseString(Text(std::wstring_view(L"a\0b", 3)), out); }},
      {"two 32-bit numbers", L"B", [](U* o, BSTR* out) { return o->GetData(Text(L"A,B,C,"), Long{1}, Long{2}, out); }},
      {"null text", L"", [](U* o, BSTR* out) { return o->ReverseString(Text(), out); }},
  };
  for (const TextRow& row : rows) {
    // A result is only written: what stood there before is not the member's to free.
    BSTR result = reinterpret_cast<BSTR>(0xDEAD);
    check_equal(S_OK, row.call(u, &result), row.name);
    check_equal(row.expected, view(result), row.name);
    SysFreeString(result);
  }
}

struct NumberRow {
  const char* name;
  LONG expected;
  std::function<HRESULT(U*, LONG*)> call;
};

void number_members(U* u) {
  const NumberRow rows[] = {
      {"second comma", 4, [](U* o, LONG* out) { return o->MyPos(Text(L","), Text(L"A,B,"), Long{2}, out); }},
      {"list index", 1,
       [](U* o, LONG* out) {
         return o->IndexInList(Array(VT_BSTR, 0, {L"Apple", L"Banana"}), Text(L"ban"), out);
       }},
      {"no such entry", -1,
       [](U* o, LONG* out) { return o->IndexInList(Array(VT_VARIANT, 0, {L"Apple"}), Text(L"ban"), out); }},
  };
  for (const NumberRow& row : rows) {
    LONG result = 77;
    check_equal(S_OK, row.call(u, &result), row.name);
    check_equal(row.expected, result, row.name);
  }
  short position = 0;
  u->StringPosition(Text(L"12 SMITH ST"), Short{1}, &position);
  check_equal(3, position, "StringPosition");
  VARIANT_BOOL found = 0;
  u->MyInstrDelim(Text(L"B"), Text(L"A,B,"), Text(L","), &found);
  check_equal(VARIANT_TRUE, found, "MyInstrDelim");
}

void blank_is_written_back(U* u) {
  Text character;
  Text result;
  check_equal(S_OK, u->RemoveStringsFromNumber(Short{2}, Text(L"A B"), character, result), "RemoveStringsFromNumber");
  check_equal(L"AB", result.view(), "result");
  check_equal(L" ", character.view(), "the character written back");
}

void dates(U* u) {
  TALUtil_SYSTEMTIME time{0, 0, 77, 0, 0, 0, 0, 88};
  DATE date = 0;
  Short week{60};
  Value result;
  check_equal(S_OK, u->DateToSystemTime(39877.5732638889, &time), "DateToSystemTime");
  const short expected[] = {2009, 3, 77, 5, 13, 45, 30, 88};
  check(std::memcmp(expected, &time, sizeof time) == 0, "the record that was written");
  time.wMonth = 13;
  check_equal(S_OK, u->SystemTimeToDate(&time, &date), "SystemTimeToDate");
  check(std::abs(date - 40183.5732638889) < 1e-9, "its date, " + std::to_string(date));
  check_equal(S_OK, u->WeekYearToDate(week, Short{2009}, Short{1}, result), "WeekYearToDate");
  check_equal(52, week.value, "the week written back");
  check_equal(VT_DATE, result.type(), "its result");
  Value argument(L"00:00:00");
  result = {};
  check_equal(S_OK, u->VerifyNullDate(Short{0}, argument, result), "VerifyNullDate");
  check_equal(L"01/01/1980", argument.text(), "the date written back");
  check_equal(VT_DATE, result.type(), "its result");
  float hours = 0;
  check_equal(S_OK, u->ConvertDurationToNumber(Value(L"01:45"), &hours), "ConvertDurationToNumber");
  check_equal(1.75F, hours, "its hours");
}

/// The argument for a text that may be left out; the compiler's header has it by value.
struct Delimiter {
  BSTR* place;
  operator BSTR*() const noexcept { return place; }
  operator BSTR() const noexcept { return reinterpret_cast<BSTR>(place); }
};

struct ListRow {
  const char* name;
  const wchar_t* text;
  Array before;
  HRESULT expected;
  LONG count;
  const wchar_t* after;
};

void lists_are_written_back(U* u) {
  constexpr auto index = run_time_error(9);
  constexpr auto fixed = run_time_error(10);
  ListRow rows[] = {
      {"unallocated", L"A,B,C", {}, S_OK, 2, L"[A|B|]"},
      {"shorter than before", L"A,", {VT_BSTR, 0, {L"x", L"y"}}, S_OK, 1, L"[A|]"},
      {"fixed", L"A,", {VT_BSTR, 0, {L"x"}}, fixed, 0, L"[x|]"},
      {"locked", L"A,", {VT_BSTR, 0, {L"x"}}, fixed, 0, L"[x|]"},
      {"two dimensions", L"A,", Array::square(VT_BSTR), index, 0, nullptr},
  };
  for (ListRow& row : rows) {
    const std::string_view name = row.name;
    if (name == "fixed") row.before.get()->fFeatures |= FADF_FIXEDSIZE;
    if (name == "locked") SafeArrayLock(row.before.get());
    LONG count = 77;
    Text comma(L",");
    check_equal(row.expected, u->ReadCommaDelimStrToList(Text(row.text), row.before, Delimiter{comma}, &count),
                row.name);
    if (row.expected == S_OK) check_equal(row.count, count, row.name);
    if (row.after != nullptr) check_equal(row.after, contents(row.before.get()), row.name);
    if (name == "fixed") row.before.get()->fFeatures &= static_cast<USHORT>(~FADF_FIXEDSIZE);
    if (name == "locked") SafeArrayUnlock(row.before.get());
  }
}

struct ErrorRow {
  const char* name;
  int number;
  const wchar_t* text;
  std::function<HRESULT(U*)> call;
};

void errors_have_number_and_text(U* u) {
  const ErrorRow rows[] = {
      {"empty character", 5, L"Invalid procedure call or argument",
       [](U* o) { return o->StringReplace(Text(L"a"), Text(), Text(), Text()); }},
      {"an object without a value", 438, L"Object doesn't support this property or method",
       [](U* o) {
         HostObject object(HostObject::Kind::without_value);
         return o->VerifyTextData(Short{}, Short{}, Value(&object), Text());
       }},
      {"an empty reference", 91, L"Object variable or With block variable not set",
       [](U* o) { return o->VerifyTextData(Short{}, Short{}, Value(static_cast<IDispatch*>(nullptr)), Text()); }},
  };
  for (const ErrorRow& row : rows) {
    SetErrorInfo(0, nullptr);
    check_equal(run_time_error(row.number), row.call(u), row.name);
    check_equal(L"TALUtil.ORVUtils: " + std::wstring(row.text), error_text(), row.name);
  }
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
  Text password;
  check_equal(run_time_error(18), u->GenerateFilePassword(Short{2}, Short{2}, Short{5}, password), "asked to quit");
  check_equal(L"TALUtil.ORVUtils: User interrupt occurred", error_text(), "asked to quit");
  KillTimer(nullptr, timer);
  MSG message{};
  while (GetMessageW(&message, nullptr, 0, 0) > 0) DispatchMessageW(&message);
  check_equal(7, static_cast<int>(message.wParam), "the exit code is kept for the host");
}

void interfaces_are_one_object(U* u) {
  const std::array<const IID*, 5> known{&IID_IDispatch, &IID__ORVUtils, &IID_ISupportErrorInfo, &IID_IProvideClassInfo,
                                        &IID_IUnknown};
  Pointer<IUnknown> identity;
  u->QueryInterface(IID_IUnknown, identity.receive_untyped());
  for (const IID* from : known) {
    for (const IID* to : known) {
      Pointer<IUnknown> part;
      Pointer<IUnknown> other;
      Pointer<IUnknown> again;
      u->QueryInterface(*from, part.receive_untyped());
      check_equal(S_OK, part->QueryInterface(*to, other.receive_untyped()), "from one interface to another");
      other->QueryInterface(IID_IUnknown, again.receive_untyped());
      check(again.get() == identity.get(), "the identity of the object");
    }
  }
  void* none = u;
  check_equal(E_NOINTERFACE, u->QueryInterface(IID_IPersist, &none), "an interface it does not have");
  check_equal(nullptr, none, "what is given with it");
  check_equal(E_POINTER, u->QueryInterface(IID_IUnknown, nullptr), "no place for the interface");

  Pointer<ISupportErrorInfo> errors;
  u->QueryInterface(IID_ISupportErrorInfo, errors.receive_untyped());
  check_equal(S_OK, errors->InterfaceSupportsErrorInfo(IID__ORVUtils), "error information of _ORVUtils");
  check_equal(S_FALSE, errors->InterfaceSupportsErrorInfo(IID_IPersist), "of an interface it does not have");
  Pointer<IProvideClassInfo> classes;
  Pointer<ITypeInfo> information;
  u->QueryInterface(IID_IProvideClassInfo, classes.receive_untyped());
  require(classes->GetClassInfo(information.receive()), "GetClassInfo");
  Text name;
  information->GetDocumentation(MEMBERID_NIL, name, nullptr, nullptr, nullptr);
  check_equal(L"ORVUtils", name.view(), "the class information");
}

HRESULT call_slot(IUnknown* object, const Slot& slot, std::vector<VARIANT>& arguments) {
  std::vector<VARTYPE> types;
  std::vector<VARIANTARG*> places;
  for (VARIANT& argument : arguments) {
    types.push_back(V_VT(&argument));
    places.push_back(&argument);
  }
  VARIANT result{};
  require(DispCallFunc(object, static_cast<ULONG_PTR>(slot.offset), CC_STDCALL, VT_ERROR,
                       static_cast<UINT>(arguments.size()), types.data(), places.data(), &result),
          "DispCallFunc");
  return V_ERROR(&result);
}

/// Calls a slot with zeros, then once for each of its pointers with that one null.
void walk_slot(IUnknown* object, const Slot& slot, const talutil::Member& member) {
  const std::string name(member.name);
  std::vector<std::array<std::byte, 64>> storage(slot.parameters.size());
  std::vector<VARIANT> arguments(slot.parameters.size());
  std::array<std::byte, sizeof(VARIANT)> empty{};
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    V_VT(&arguments[i]) = slot.parameters[i].type;
    if (slot.parameters[i].type == VT_PTR) V_BYREF(&arguments[i]) = storage[i].data();
    // DispCallFunc passes the VARIANT itself where one is passed by value; a zeroed one is Empty.
    if (slot.parameters[i].type == VT_VARIANT) std::memcpy(&arguments[i], empty.data(), sizeof(VARIANT));
  }
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    if (slot.parameters[i].type != VT_PTR) continue;
    void* const place = std::exchange(V_BYREF(&arguments[i]), nullptr);
    check_equal(E_POINTER, call_slot(object, slot, arguments), name + ", argument " + std::to_string(i) + " null");
    V_BYREF(&arguments[i]) = place;
  }
  if (member.access == talutil::Access::get) check_equal(S_OK, call_slot(object, slot, arguments), name);
}

template <class Table>
void walk_vtable(IDispatch* object, const Table& table) {
  const std::vector<Slot> slots = slots_of(object);
  if (!check_equal(table.size(), slots.size(), "slots in the type library")) return;
  for (std::size_t i = 0; i < slots.size(); ++i) walk_slot(object, slots[i], table[i]);
}

void second_class(const Pointer<_cControlPosition>& position) {
  LONG height = 0;
  check_equal(S_OK, position->put_Height(-5), "put_Height");
  position->get_Height(&height);
  check_equal(-5, height, "get_Height");
  Pointer<_cControlPosition> other;
  require(CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                           other.receive_untyped()),
          "creating TALUtil.cControlPosition");
  other->get_Height(&height);
  check_equal(0, height, "Height of another object");
  walk_vtable(position.get(), talutil::described<talutil::cControlPosition>);
}

/// A variable of the caller's, of a type of its own, and a variant that refers to it.
struct TypedVariable {
  VARTYPE type;
  VARIANT variable{};

  explicit TypedVariable(VARTYPE kind) : type(kind) {}
  TypedVariable(const TypedVariable&) = delete;
  TypedVariable& operator=(const TypedVariable&) = delete;
  ~TypedVariable() { VariantClear(&variable); }

  [[nodiscard]] VARIANT reference() {
    VARIANT result{};
    V_VT(&result) = static_cast<VARTYPE>(VT_BYREF | type);
    V_BYREF(&result) = type == VT_VARIANT ? static_cast<void*>(&variable) : &V_I8(&variable);
    return result;
  }
  [[nodiscard]] std::wstring text() {
    Value shown_as_text;
    require(VariantChangeType(shown_as_text, &variable, 0, VT_BSTR), "VariantChangeType");
    return std::wstring(shown_as_text.text());
  }
};

/// What a member writes to a variant that refers to a typed variable goes to that variable, which keeps its type, and
/// the variant stays the reference that it was.
void typed_variables_are_written_through(U* u) {
  struct Row {
    const char* name;
    VARTYPE type;
    const wchar_t* after;
  };
  // 10 March, which is 3 October to a user whose dates are month first.
  const Row rows[] = {{"a text", VT_BSTR, L"10/03/2024"},
                      {"a date", VT_DATE, L"45361"},
                      {"a double", VT_R8, L"45361"},
                      {"a variant", VT_VARIANT, L"10/03/2024"}};
  for (const Row& row : rows) {
    TypedVariable day(row.type);
    if (row.type == VT_VARIANT || row.type == VT_BSTR) {
      V_BSTR(&day.variable) = SysAllocString(L"10/3/2024");
      V_VT(&day.variable) = VT_BSTR;
    } else {
      V_R8(&day.variable) = 45361.25;
      V_VT(&day.variable) = row.type;
    }
    VARIANT reference = day.reference();
    const VARIANT before = reference;
    Value other_day(L"10/3/2024");
    Value time(L"9:00");
    Value other_time(L"10:30");
    Value result;
    check_equal(row.type == VT_R8 ? run_time_error(13) : S_OK,
                u->GetTimeDifference(&reference, other_day, time, other_time, result), row.name);
    check(std::memcmp(&before, &reference, sizeof before) == 0, std::string(row.name) + ": the reference stays");
    if (row.type == VT_DATE) V_VT(&day.variable) = VT_R8;
    check_equal(row.type == VT_R8 ? L"45361.25" : row.after, day.text(), row.name);
  }
  Value both(L"10/3/2024 9:00");
  Value other(L"10/3/2024 10:30");
  Value result;
  check_equal(S_OK, u->GetTimeDifference(both, other, both, other, result), "one variable for a day and its time");
  check_equal(L"0:0", result.text(), "the time of what has become a day");
  check_equal(L"00:00", both.text(), "the variable after that");
}

void a_list_can_be_filled_again(U* u) {
  Array list;
  LONG count = 0;
  for (const wchar_t* const text : {L"A,B,", L"C,"})
    check_equal(S_OK, u->ReadCommaDelimStrToList(Text(text), list, Text(L","), &count), "a list that is filled again");
  // The platform's reference says so of arrays that SafeArrayCreateVector makes; Wine does not set the first flag.
  constexpr USHORT made_as_vector = 0x2000;
  check_equal(0, list.get()->fFeatures & (FADF_FIXEDSIZE | made_as_vector), "an array that hosts can resize");
}

void library_stays_once_it_is_used(HMODULE module) {
  const auto can_unload =
      reinterpret_cast<HRESULT(WINAPI*)()>(reinterpret_cast<void*>(GetProcAddress(module, "DllCanUnloadNow")));
  const auto get_class = reinterpret_cast<HRESULT(WINAPI*)(REFCLSID, REFIID, void**)>(
      reinterpret_cast<void*>(GetProcAddress(module, "DllGetClassObject")));
  check_equal(S_OK, can_unload(), "before any object");
  Pointer<IClassFactory> factory;
  require(get_class(CLSID_ORVUtils, IID_IClassFactory, factory.receive_untyped()), "DllGetClassObject");
  check_equal(S_FALSE, can_unload(), "while a class object is held");
  check_equal(CLASS_E_CLASSNOTAVAILABLE, get_class(IID_IUnknown, IID_IClassFactory, factory.receive_untyped()),
              "a class it does not have");
  require(get_class(CLSID_ORVUtils, IID_IClassFactory, factory.receive_untyped()), "DllGetClassObject");
  factory->LockServer(TRUE);
  Pointer<U> object;
  check_equal(CLASS_E_NOAGGREGATION, factory->CreateInstance(factory.get(), IID_IUnknown, object.receive_untyped()),
              "aggregation");
  factory->LockServer(FALSE);
  factory = {};
  check_equal(S_OK, can_unload(), "after the last lock");
  object = create_object();
  object = {};
  check_equal(S_FALSE, can_unload(), "after the first object");
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    const HMODULE module = LoadLibraryW((std::wstring(arguments[1]) + L"\\TALUtil.dll").c_str());
    library_stays_once_it_is_used(module);
    settings_are_shared_and_survive();
    Pointer<U> object = create_object();
    U* const u = object.get();
    properties_keep_what_they_are_given(u);
    object_properties_hold_references(u);
    text_members(u);
    number_members(u);
    blank_is_written_back(u);
    lists_are_written_back(u);
    a_list_can_be_filled_again(u);
    typed_variables_are_written_through(u);
    dates(u);
    errors_have_number_and_text(u);
    passwords_let_messages_in(u);
    interfaces_are_one_object(u);
    walk_vtable(u, talutil::described<talutil::ORVUtils>);
    Pointer<_cControlPosition> position;
    require(CoCreateInstance(CLSID_cControlPosition, nullptr, CLSCTX_INPROC_SERVER, IID__cControlPosition,
                             position.receive_untyped()),
            "creating TALUtil.cControlPosition");
    second_class(position);
    check_equal(S_OK, u->Terminate(), "Terminate");
    check_equal(S_OK, u->Terminate(), "Terminate again");
  });
}
