// A client that is bound late, through IDispatch: first what a script may expect, then what nobody should send.
#include <algorithm>
#include <climits>
#include <limits>
#include <span>

#include "com/module.hpp"
#include "hostile_values.hpp"
#include "library/identity.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

DISPID identifier(IDispatch* object, const wchar_t* name) {
  DISPID id = DISPID_UNKNOWN;
  auto* names = const_cast<wchar_t*>(name);
  require(object->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &id), "GetIDsOfNames");
  return id;
}

/// An argument by reference, as a script passes its variables.
Value in(Value& variable) { return Value(&variable.get()); }

/// Uses a member as a script does, arguments in their order.
template <class... Arguments>
Outcome use(IDispatch* object, const wchar_t* member, Arguments&&... arguments) {
  std::array<VARIANT, sizeof...(Arguments)> list{arguments.get()...};
  std::ranges::reverse(list);
  return invoke(object, identifier(object, member), DISPATCH_METHOD | DISPATCH_PROPERTYGET, list);
}

Outcome put(IDispatch* object, const wchar_t* member, const Value& value, WORD flags = DISPATCH_PROPERTYPUT) {
  std::array<VARIANT, 1> list{value.get()};
  std::array<DISPID, 1> named{DISPID_PROPERTYPUT};
  return invoke(object, identifier(object, member), flags, list, named);
}

void properties(IDispatch* u) {
  check_equal(S_OK, put(u, L"SUSERNAME", Value(L"anne")).error(), "a put by a name in capitals");
  check_equal(L"anne", use(u, L"sUserName").result.text(), "sUserName");
  check_equal(S_OK, put(u, L"iBranchID", Value(L"12")).error(), "a text for a number");
  check_equal(VT_I2, use(u, L"iBranchID").result.type(), "iBranchID, its type");
  check_equal(run_time_error(6), put(u, L"iBranchID", Value(40000L)).error(), "too large a number");
  check_equal(DISP_E_MEMBERNOTFOUND, put(u, L"GetData", Value(L"x")).error(), "a put on a method");
  HostObject form(HostObject::Kind::form);
  check_equal(S_OK, put(u, L"SplashForm", Value(&form), DISPATCH_PROPERTYPUTREF).error(), "a reference");
  check_equal(2U, form.references, "references after the put");
  const auto text_by_reference = put(u, L"sUserName", Value(L"x"), DISPATCH_PROPERTYPUTREF);
  check_equal(DISP_E_MEMBERNOTFOUND, text_by_reference.error(), "a reference for a text");
  check_equal(run_time_error(13), put(u, L"SplashForm", Value(L"x")).error(), "a text for an object");
  check_equal(run_time_error(13), put(u, L"SplashForm", Value(&with_value)).error(), "an object that is no form");
  check_equal(2U, form.references, "references after a refused put");
  check_equal(S_OK, put(u, L"SplashForm", Value(static_cast<IDispatch*>(nullptr))).error(), "an empty reference");
  check_equal(1U, form.references, "references after that");
}

void write_back_of_text(IDispatch* u) {
  const auto filter = [u](const Value& character) {
    return use(u, L"RemoveStringsFromNumber", Value(short{2}), Value(L"A B"), character);
  };
  Value variable;
  check_equal(L"AB", filter(in(variable)).result.text(), "an Empty variable counts as an empty text");
  check_equal(L" ", variable.text(), "and gets the blank");
  variable = Value(short{5});
  check_equal(L"A B", filter(in(variable)).result.text(), "a number in a variable");
  check_equal(VT_I2, variable.type(), "an unchanged variable keeps its type");
  Text inner;
  variable = Value::reference(VT_BSTR, inner);
  filter(in(variable));
  check_equal(VT_BYREF | VT_BSTR, variable.type(), "a variable that refers to a text still does");
  check_equal(L" ", inner.view(), "and the text gets the blank");
  short number = 7;
  check_equal(L"A B", filter(Value::reference(VT_I2, &number)).result.text(), "a number by reference");
  check_equal(7, number, "which stays");
}

struct ListRow {
  const char* name;
  VARTYPE type;  ///< Of the array that the variable holds; VT_EMPTY for none.
  HRESULT error;
  VARTYPE type_after;
  const wchar_t* after;
};

void write_back_of_arrays(IDispatch* u) {
  const ListRow rows[] = {
      {"none", VT_EMPTY, S_OK, VT_ARRAY | VT_VARIANT, L"[A|B|]"},
      {"variants", VT_ARRAY | VT_VARIANT, S_OK, VT_ARRAY | VT_VARIANT, L"[A|B|]"},
      {"texts", VT_ARRAY | VT_BSTR, S_OK, VT_ARRAY | VT_VARIANT, L"[A|B|]"},
      {"numbers", VT_ARRAY | VT_I4, run_time_error(13), VT_ARRAY | VT_I4, nullptr},
      {"a text", VT_BSTR, run_time_error(13), VT_BSTR, nullptr},
  };
  const auto split = [u](const Value& list) { return use(u, L"ReadCommaDelimStrToList", Value(L"A,B,rest"), list); };
  for (const ListRow& row : rows) {
    Value variable = row.type == VT_BSTR ? Value(L"x") : Value();
    if ((row.type & VT_ARRAY) != 0) {
      V_ARRAY(&variable.get()) = SafeArrayCreateVector(row.type & VT_TYPEMASK, 0, 0);
      V_VT(&variable.get()) = row.type;
    }
    check_equal(row.error, split(in(variable)).error(), row.name);
    check_equal(row.type_after, variable.type(), std::string("a variable with ") + row.name);
    if (row.after != nullptr) check_equal(row.after, contents(V_ARRAY(&variable.get())), row.name);
  }
  Array texts;
  check_equal(S_OK, split(Value::reference(VT_ARRAY | VT_BSTR, texts)).error(), "texts by reference");
  check_equal(L"[A|B|]", contents(texts.get()), "texts by reference");
  VARTYPE element = VT_EMPTY;
  SafeArrayGetVartype(texts.get(), &element);
  check_equal(VT_BSTR, element, "texts by reference stay texts");
}

void other_arrays_come_back(IDispatch* u) {
  for (const VARTYPE type : std::initializer_list<VARTYPE>{VT_VARIANT, VT_BSTR}) {
    const Value list = array_value(type, 1, {L"x", L"y"});
    const Outcome outcome = use(u, L"ConvertCaseSuburbs", list);
    check_equal(S_OK, outcome.error(), "an array that no style applies to");
    if (!check_equal(VT_ARRAY | VT_VARIANT, outcome.result.type(), "what comes back")) continue;
    check_equal(L"[x|y|]", contents(V_ARRAY(&outcome.result.get())), "its elements");
  }
  const Value numbers = array_value(VT_I4, -1, {});
  check_equal(VT_ARRAY | VT_I4, use(u, L"ConvertCaseSuburbs", numbers).result.type(), "an array of numbers");
}

void write_back_of_numbers(IDispatch* u) {
  const auto clamp = [u](const Value& week) {
    return use(u, L"WeekYearToDate", week, Value(short{2009}), Value(short{1}));
  };
  LONG week = -7;
  clamp(Value::reference(VT_I4, &week));
  check_equal(1, week, "a 32-bit number by reference");
  Text text(L"99");
  clamp(Value::reference(VT_BSTR, text));
  check_equal(L"52", text.view(), "a text by reference");
  Value variable(60L);
  clamp(in(variable));
  check_equal(VT_I2, variable.type(), "a variable gets the member's type");
}

/// A variant that the client clears by itself, if at all.
struct Plain {
  VARIANT value{};
  [[nodiscard]] VARIANT& get() noexcept { return value; }
};

Pointer<IRecordInfo> record_information(IDispatch* object, const GUID& id) {
  Pointer<ITypeInfo> members;
  Pointer<ITypeLib> library;
  Pointer<ITypeInfo> record;
  Pointer<IRecordInfo> result;
  UINT index = 0;
  require(object->GetTypeInfo(0, LOCALE_USER_DEFAULT, members.receive()), "GetTypeInfo");
  require(members->GetContainingTypeLib(library.receive(), &index), "GetContainingTypeLib");
  require(library->GetTypeInfoOfGuid(id, record.receive()), "GetTypeInfoOfGuid");
  require(GetRecordInfoFromTypeInfo(record.get(), result.receive()), "GetRecordInfoFromTypeInfo");
  return result;
}

Plain record_variant(VARTYPE type, void* data, IRecordInfo* information) {
  Plain result;
  V_VT(&result.value) = type;
  V_RECORD(&result.value) = data;
  V_RECORDINFO(&result.value) = information;
  return result;
}

void records(IDispatch* u) {
  const auto ours = record_information(u, talutil::com::guid_of(talutil::identity::system_time_record));
  const auto other = record_information(u, talutil::com::guid_of(talutil::identity::file_time_record));
  for (const VARTYPE type : std::initializer_list<VARTYPE>{VT_RECORD, VT_RECORD | VT_BYREF}) {
    TALUtil_SYSTEMTIME time{1, 2, 77, 3, 4, 5, 6, 88};
    Plain record = record_variant(type, &time, ours.get());
    check_equal(S_OK, use(u, L"DateToSystemTime", Value(L"5/3/2009 13:45:30"), record).error(), "DateToSystemTime");
    const short expected[] = {2009, 3, 77, 5, 13, 45, 30, 88};
    check(std::memcmp(expected, &time, sizeof time) == 0, "the record that was written");
    Value date;
    Plain variable;
    V_VT(&variable.value) = VT_BYREF | VT_VARIANT;
    V_VARIANTREF(&variable.value) = &record.value;
    check_equal(S_OK, use(u, L"SystemTimeToDate", variable, in(date)).error(), "SystemTimeToDate of a variable");
    check_equal(VT_DATE, date.type(), "its date");
    check_equal(S_OK, use(u, L"DateToSystemTime", Value(L"1/1/2010"), variable).error(), "a variable with a record");
    check_equal(2010, time.wYear, "its year");
    record = record_variant(type, &time, other.get());
    check_equal(run_time_error(13), use(u, L"SystemTimeToDate", record, in(date)).error(), "another record");
    record = record_variant(type, &time, nullptr);
    check_equal(run_time_error(13), use(u, L"SystemTimeToDate", record, in(date)).error(), "a record of no kind");
  }
}

/// An object with the fields of a record, as a script makes one.
class RecordObject final : public NamelessObject {
 public:
  std::array<short, 8> fields{2009, 3, 77, 5, 13, 45, 30, 88};
  int puts = 0;

  ULONG STDMETHODCALLTYPE AddRef() override { return 1; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* names, UINT, LCID, DISPID* id) override {
    constexpr std::wstring_view known[] = {L"wYear", L"wMonth",  L"wDayOfWeek", L"wDay",
                                           L"wHour", L"wMinute", L"wSecond",    L"wMilliseconds"};
    const auto* const found = std::ranges::find(known, names[0]);
    *id = static_cast<DISPID>(found - known) + 1;
    return found == std::end(known) ? DISP_E_UNKNOWNNAME : S_OK;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* given, VARIANT* result, EXCEPINFO*,
                                   UINT*) override {
    short& field = fields.at(static_cast<std::size_t>(id - 1));
    if (flags == DISPATCH_PROPERTYPUT) {
      field = V_I2(&given->rgvarg[0]);
      ++puts;
      return S_OK;
    }
    if ((flags & DISPATCH_PROPERTYGET) == 0) return DISP_E_MEMBERNOTFOUND;
    *result = Value(field).get();
    return S_OK;
  }
};

void objects_as_records(IDispatch* u) {
  RecordObject object;
  Value date;
  check_equal(S_OK, use(u, L"SystemTimeToDate", Value(&object), in(date)).error(), "SystemTimeToDate of an object");
  check(std::abs(V_DATE(&date.get()) - 39877.5732638889) < 1e-9, "its date");
  check_equal(S_OK, use(u, L"DateToSystemTime", Value(L"5/4/2010 13:45:30"), Value(&object)).error(), "an object");
  check(object.fields == std::array<short, 8>{2010, 4, 77, 5, 13, 45, 30, 88}, "its fields");
  check_equal(2, object.puts, "only what changed is put");
  check_equal(run_time_error(438), use(u, L"SystemTimeToDate", Value(&with_value), in(date)).error(), "no fields");
}

void optional_and_named_arguments(IDispatch* u) {
  const auto count = [](Outcome outcome) { return outcome.error() == S_OK ? V_I4(&outcome.result.get()) : -1; };
  Value list;
  check_equal(2, count(use(u, L"ReadCommaDelimStrToList", Value(L"A,B,"), in(list))), "left out");
  check_equal(1, count(use(u, L"ReadCommaDelimStrToList", Value(L"A,B;"), in(list), Value(L";"))), "given");
  check_equal(2, count(use(u, L"ReadCommaDelimStrToList", Value(L"A,B,"), in(list), Value::missing())), "missing");

  // By name: the value of sDelimiter, then of sTemp; the list stands in its place in front.
  std::array<const wchar_t*, 4> names{L"readcommadelimstrtolist", L"SDELIMITER", L"sTemp", L"sFList"};
  std::array<DISPID, 4> ids{};
  require(u->GetIDsOfNames(IID_NULL, const_cast<wchar_t**>(names.data()), 4, LOCALE_USER_DEFAULT, ids.data()),
          "GetIDsOfNames");
  const Value delimiter(L";");
  const Value text(L"A;B;C;");
  const Value place = in(list);
  std::array<VARIANT, 3> arguments{delimiter.get(), text.get(), place.get()};
  check_equal(3, count(invoke(u, ids[0], DISPATCH_METHOD, arguments, std::span(ids).subspan(1))), "all by name");
  std::array<DISPID, 2> twice{ids[1], ids[1]};
  check_equal(DISP_E_PARAMNOTFOUND, invoke(u, ids[0], DISPATCH_METHOD, arguments, twice).error(), "a name twice");
  std::array<DISPID, 1> unknown{99};
  check_equal(DISP_E_PARAMNOTFOUND, invoke(u, ids[0], DISPATCH_METHOD, arguments, unknown).error(), "no such name");
  std::array<DISPID, 1> known{ids[1]};
  check_equal(DISP_E_PARAMNOTOPTIONAL, invoke(u, ids[0], DISPATCH_METHOD, std::span(arguments).first(1), known).error(),
              "only sDelimiter");
  std::array<const wchar_t*, 2> wrong{L"GetData", L"sNothing"};
  check_equal(DISP_E_UNKNOWNNAME,
              u->GetIDsOfNames(IID_NULL, const_cast<wchar_t**>(wrong.data()), 2, LOCALE_USER_DEFAULT, ids.data()),
              "an unknown name of an argument");
  check_equal(DISPID_UNKNOWN, ids[1], "its identifier");
}

void misuse(IDispatch* u) {
  auto* unknown = const_cast<wchar_t*>(L"NoSuchMember");
  DISPID id = 0;
  const DISPID get_data = identifier(u, L"GetData");
  check_equal(DISP_E_UNKNOWNNAME, u->GetIDsOfNames(IID_NULL, &unknown, 1, 0, &id), "an unknown member");
  check_equal(DISPID_UNKNOWN, id, "its identifier");
  check_equal(DISP_E_UNKNOWNINTERFACE, u->GetIDsOfNames(IID_IUnknown, &unknown, 1, 0, &id), "an interface of names");
  check_equal(E_POINTER, u->GetIDsOfNames(IID_NULL, nullptr, 1, 0, &id), "no names");
  check_equal(E_POINTER, u->GetIDsOfNames(IID_NULL, &unknown, 1, 0, nullptr), "no place for identifiers");
  check_equal(DISP_E_MEMBERNOTFOUND, invoke(u, 0, DISPATCH_PROPERTYGET, {}).error(), "the default member");
  for (const DISPID odd : std::initializer_list<DISPID>{DISPID_UNKNOWN, 0x6002FFFF, 0x60040000, INT_MIN}) {
    check_equal(DISP_E_MEMBERNOTFOUND, invoke(u, odd, DISPATCH_METHOD, {}).error(), "an unknown identifier");
  }
  check_equal(E_POINTER, u->Invoke(get_data, IID_NULL, 0, DISPATCH_METHOD, nullptr, nullptr, nullptr, nullptr),
              "no arguments at all");
  DISPPARAMS promised{nullptr, nullptr, 3, 0};
  check_equal(E_POINTER, u->Invoke(get_data, IID_NULL, 0, DISPATCH_METHOD, &promised, nullptr, nullptr, nullptr),
              "arguments promised but not given");
  check_equal(DISP_E_PARAMNOTOPTIONAL, use(u, L"StripNulls").error(), "too few arguments");
  check_equal(DISP_E_BADPARAMCOUNT, use(u, L"StripNulls", Value(), Value()).error(), "too many arguments");
  check_equal(DISP_E_PARAMNOTOPTIONAL, use(u, L"StripNulls", Value::missing()).error(), "a missing argument");
  // Nobody need take the result or the error.
  const Value number(1L);
  const Value text(L"A,");
  std::array<VARIANT, 3> arguments{number.get(), number.get(), text.get()};
  DISPPARAMS parameters{arguments.data(), nullptr, 3, 0};
  check_equal(DISP_E_EXCEPTION,
              u->Invoke(get_data, IID_NULL, 0, DISPATCH_METHOD, &parameters, nullptr, nullptr, nullptr),
              "an error that nobody takes");
  V_I4(&arguments[1]) = 0;
  check_equal(S_OK, u->Invoke(get_data, IID_NULL, 0, DISPATCH_METHOD, &parameters, nullptr, nullptr, nullptr),
              "a result that nobody takes");
}

/// An argument that suits a parameter, for the places beside the hostile one.
Value suitable(const SlotParameter& parameter) {
  switch (parameter.type == VT_PTR ? parameter.referenced : parameter.type) {
    case VT_BSTR:
      return Value(L"a,b,");
    case VT_I2:
    case VT_BOOL:
      return Value(short{2});
    case VT_SAFEARRAY:
      return array_value(VT_BSTR, 0, {L"a"});
    default:
      return Value(1L);
  }
}

class Walk {
 public:
  explicit Walk(IDispatch* object) : object_(object), slots_(slots_of(object)), values_(hostile_values()) {
    std::erase_if(slots_, [](const Slot& slot) { return waits_for_a_user(slot.name); });
    for (Slot& slot : slots_) {
      std::erase_if(slot.parameters, [](const SlotParameter& p) { return (p.flags & PARAMFLAG_FRETVAL) != 0; });
    }
  }

  /// Sends each value to each place of each member; one check a member.
  void send_everything() {
    for (const Slot& slot : slots_) {
      std::string fault;
      for (std::size_t place = 0; place < slot.parameters.size(); ++place) {
        for (const Hostile& value : values_) {
          std::string found = send(slot, place, value);
          if (fault.empty()) fault = std::move(found);
        }
      }
      check(fault.empty(), fault);
    }
  }

  /// Members in their number beside zero to twelve arguments.
  void send_wrong_counts() {
    for (const Slot& slot : slots_) {
      std::vector<Value> owned;
      std::vector<VARIANT> arguments;
      for (int count = 0; count <= 12; ++count) {
        put(object_, L"DebugMode", Value(short{0}));
        const Outcome outcome = invoke(object_, slot.identifier, static_cast<WORD>(slot.kind), arguments);
        check(outcome.is_documented(),
              narrow(slot.name) + " with " + std::to_string(count) + " arguments answered " + shown(outcome.error()));
        owned.push_back(Value(L"1"));
        arguments.push_back(owned.back().get());
      }
    }
  }

 private:
  std::string send(const Slot& slot, std::size_t place, const Hostile& value) {
    Places places;
    value.make(places);
    std::vector<Value> others;
    std::vector<VARIANT> arguments;
    for (std::size_t i = slot.parameters.size(); i > 0; --i) {
      if (i - 1 != place) others.push_back(suitable(slot.parameters[i - 1]));
      arguments.push_back(i - 1 == place ? places.argument.get() : others.back().get());
    }
    const std::vector<VARIANT> before = arguments;
    std::array<DISPID, 1> named{DISPID_PROPERTYPUT};
    const bool is_put = slot.kind == INVOKE_PROPERTYPUT;
    const Outcome outcome = invoke(object_, slot.identifier, static_cast<WORD>(slot.kind), arguments,
                                   is_put ? std::span<DISPID>(named) : std::span<DISPID>());
    const std::string what = narrow(slot.name) + ", argument " + std::to_string(place) + ": " + value.name;
    if (!outcome.is_documented()) return what + ": answered " + shown(outcome.error()) + " " + narrow(outcome.source);
    // The list is the caller's: nothing in it may change, only what its references lead to.
    const std::size_t size = arguments.size() * sizeof(VARIANT);
    if (std::memcmp(before.data(), arguments.data(), size) != 0) return what + ": the caller's list was changed";
    return {};
  }

  IDispatch* object_;
  std::vector<Slot> slots_;
  std::vector<Hostile> values_;
};

void release_settings(IDispatch* u) {
  for (const wchar_t* name : {L"FolderBrowseForm", L"SplashForm", L"DrawTextPictureBox"}) {
    put(u, name, Value(static_cast<IDispatch*>(nullptr)));
  }
  for (const HostObject* object : {&with_value, &without_value, &failing}) {
    check_equal(1U, object->references, "references to a host's object after all calls");
  }
}

void huge_text(IDispatch* u) {
  const std::wstring text(std::size_t{32} << 20, L'x');
  const Outcome outcome = use(u, L"StripNulls", Value(text));
  check_equal(S_OK, outcome.error(), "a text of 64 MB");
  check_equal(text.size(), outcome.result.text().size(), "its length");
  check_equal(run_time_error(6), use(u, L"ReverseString", Value(text)).error(), "a text of 64 MB, reversed");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    // What members take for the names of files shall not lie about.
    std::array<wchar_t, MAX_PATH> folder{};
    GetTempPathW(static_cast<DWORD>(folder.size()), folder.data());
    SetCurrentDirectoryW(folder.data());
    const Pointer<_ORVUtils> object = create_object();
    IDispatch* const u = object.get();
    properties(u);
    write_back_of_text(u);
    write_back_of_arrays(u);
    write_back_of_numbers(u);
    other_arrays_come_back(u);
    records(u);
    objects_as_records(u);
    optional_and_named_arguments(u);
    misuse(u);
    huge_text(u);
    // Hostile arguments meet the call that never returns; a thread that is asked to quit gets out of it.
    PostQuitMessage(0);
    Walk walk(u);
    walk.send_wrong_counts();
    walk.send_everything();
    release_settings(u);
    put(u, L"DebugMode", Value(short{0}));
    check_equal(S_OK, use(u, L"Terminate").error(), "Terminate");
  });
}
