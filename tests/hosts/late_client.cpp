// A client that is bound late, through IDispatch, as scripts are.
#include <climits>
#include <limits>

#include "com/module.hpp"
#include "hostile_values.hpp"
#include "library/identity.hpp"

using namespace talutil::hosts;

namespace {

void properties(IDispatch* u) {
  check_equal(S_OK, put(u, L"IBRANCHID", L"12"), "a text for a number, by a name in capitals");
  check_equal(VT_I2, use(u, L"iBranchID").result.type(), "iBranchID, its type");
  check_equal(run_time_error(6), put(u, L"iBranchID", 40000L), "too large a number");
  check_equal(DISP_E_MEMBERNOTFOUND, put(u, L"GetData", L"x"), "a put on a method");
  HostObject form({L"hwnd", L"ScaleMode", L"ScaleX"}, [](const Use&) { return DISP_E_MEMBERNOTFOUND; });
  check_equal(S_OK, put(u, L"SplashForm", &form, DISPATCH_PROPERTYPUTREF), "a reference");
  check_equal(2U, form.references, "references after the put");
  check_equal(DISP_E_MEMBERNOTFOUND, put(u, L"sUserName", L"x", DISPATCH_PROPERTYPUTREF), "a reference for a text");
  check_equal(run_time_error(13), put(u, L"SplashForm", &with_value), "an object that is no form");
  check_equal(run_time_error(13), put(u, L"SplashForm", Value::undriven()), "an object without automation");
  check_equal(2U, form.references, "references after refused puts");
  check_equal(S_OK, put(u, L"SplashForm", Value::nothing()), "an empty reference");
  check_equal(1U, form.references, "references after that");
}

void texts(IDispatch* u) {
  const auto filter = [u](auto&& character) { return use(u, L"RemoveStringsFromNumber", short{2}, L"A B", character); };
  Value variable;
  check_equal(L"AB", filter(variable).result.text(), "an Empty variable counts as an empty text");
  check_equal(L" ", variable.text(), "and gets the blank");
  variable = Value(short{5});
  check_equal(L"A B", filter(variable).result.text(), "a number in a variable");
  check_equal(VT_I2, variable.type(), "an unchanged variable keeps its type");
  Text inner;
  variable = Value::reference(VT_BSTR, static_cast<BSTR*>(inner));
  filter(variable);
  check_equal(VT_BYREF | VT_BSTR, variable.type(), "a variable that refers to a text still does");
  check_equal(L" ", inner.view(), "and the text gets the blank");
  short number = 7;
  check_equal(L"A B", filter(Value::reference(VT_I2, &number)).result.text(), "a number by reference");
  check_equal(7, number, "which stays");
  const std::wstring huge(std::size_t{32} << 20, L'x');
  check_equal(huge.size(), use(u, L"StripNulls", huge).result.text().size(), "the length of a text of 64 MB");
  check_equal(run_time_error(6), use(u, L"ReverseString", huge).error, "a text of 64 MB, reversed");
}

void arrays(IDispatch* u) {
  constexpr auto mismatch = run_time_error(13);
  constexpr VARTYPE variants = VT_ARRAY | VT_VARIANT;
  struct Row {
    const char* name;
    Value before;
    HRESULT error;
    VARTYPE after;
  };
  Row rows[] = {
      {"no array", Value(), S_OK, variants},
      {"variants", Value::array(VT_VARIANT, 0, {}), S_OK, variants},
      {"texts", Value::array(VT_BSTR, 0, {}), S_OK, variants},
      {"numbers", Value::array(VT_I4, 0, {}), mismatch, VT_ARRAY | VT_I4},
      {"a text", Value(L"x"), mismatch, VT_BSTR},
  };
  for (Row& row : rows) {
    check_equal(row.error, use(u, L"ReadCommaDelimStrToList", L"A,B,rest", row.before).error, row.name);
    check_equal(row.after, row.before.type(), std::string("a variable with ") + row.name);
    if (row.error == S_OK) check_equal(L"[A|B|]", contents(V_ARRAY(&row.before.get())), row.name);
  }
  // Texts by reference, as programs pass them.
  Value list = Value::of_type(VT_ARRAY | VT_BSTR);
  SAFEARRAY*& array = V_ARRAY(&list.get());
  const auto read = [&](const wchar_t* text) {
    return use(u, L"ReadCommaDelimStrToList", text, Value::reference(VT_ARRAY | VT_BSTR, &array)).error;
  };
  for (const wchar_t* const text : {L"A,B,", L"A,B,C,D,", L"A,B,"}) check_equal(S_OK, read(text), "texts by reference");
  check_equal(L"[A|B|]", contents(array), "the texts");
  // The platform's reference says so of arrays that SafeArrayCreateVector makes; Wine does not set the first flag.
  constexpr USHORT made_as_vector = 0x2000;
  check_equal(0, array->fFeatures & (FADF_FIXEDSIZE | made_as_vector), "an array that hosts can resize");
  // By reference and in a variable.
  const auto stays = [&](const std::string& name) {
    const SAFEARRAY before = *array;
    check_equal(run_time_error(10), read(L"C,"), name);
    check_equal(run_time_error(10), use(u, L"ReadCommaDelimStrToList", L"C,", list).error, name + " in a variable");
    check(std::memcmp(&before, array, sizeof before) == 0, name + " is the one it was");
    check_equal(L"[A|B|]", contents(array), name + ", its texts");
  };
  array->fFeatures |= FADF_FIXEDSIZE;
  stays("an array of fixed size");
  array->fFeatures &= static_cast<USHORT>(~FADF_FIXEDSIZE);
  SafeArrayLock(array);
  stays("a locked array");
  SafeArrayUnlock(array);
  check_equal(run_time_error(9), use(u, L"IndexInList", Value::square(VT_BSTR), L"A").error, "two dimensions");
  VARTYPE element = VT_EMPTY;
  SafeArrayGetVartype(array, &element);
  check_equal(VT_BSTR, element, "texts by reference stay texts");

  // A style that suburbs do not have gives back what was given.
  for (const VARTYPE type : std::initializer_list<VARTYPE>{VT_VARIANT, VT_BSTR}) {
    const Outcome outcome = use(u, L"ConvertCaseSuburbs", Value::array(type, 1, {L"x", L"y"}));
    if (check_equal(variants, outcome.result.type(), "an array that comes back"))
      check_equal(L"[x|y|]", contents(V_ARRAY(&outcome.result.get())), "its elements");
  }
  const Outcome numbers = use(u, L"ConvertCaseSuburbs", Value::array(VT_I4, -1, {}));
  check_equal(VT_ARRAY | VT_I4, numbers.result.type(), "an array of numbers");
}

void numbers(IDispatch* u) {
  const auto clamp = [u](auto&& week) { return use(u, L"WeekYearToDate", week, short{2009}, short{1}); };
  LONG week = -7;
  check_equal(VT_DATE, clamp(Value::reference(VT_I4, &week)).result.type(), "the type of a date");
  check_equal(1, week, "a 32-bit number by reference");
  Text text(L"99");
  clamp(Value::reference(VT_BSTR, static_cast<BSTR*>(text)));
  check_equal(L"52", text.view(), "a text by reference");
  Value variable(60L);
  clamp(variable);
  check_equal(VT_I2, variable.type(), "a variable gets the member's type");

  // Every type of whole numbers counts as the number that the platform takes it for: ends and middles of all sizes.
  using Limits = std::numeric_limits<LONGLONG>;
  const auto text_of = [u](Value number) {
    return std::wstring(use(u, L"VerifyIntData", short{0}, std::move(number)).result.text());
  };
  for (const int type : {VT_I1, VT_UI1, VT_I2, VT_UI2, VT_I4, VT_UI4, VT_INT, VT_UINT, VT_I8, VT_UI8}) {
    for (LONGLONG bits : std::initializer_list<LONGLONG>{0, -1, 0x7F, 0x80, 0x7FFF, 0x8000, 0x7FFFFFFF, 0x80000000,
                                                         Limits::max(), Limits::min()}) {
      Value value(type, &VARIANT::llVal, bits);
      Value number;
      require(VariantChangeType(number, value, 0, VT_R8), "VariantChangeType");
      const std::wstring expected = text_of(V_R8(&number.get()));
      const std::string name = std::to_string(bits) + " as a number of type " + std::to_string(type);
      check_equal(expected, text_of(std::move(value)), name);
      check_equal(expected, text_of(Value::reference(static_cast<VARTYPE>(type), &bits)), name + ", by reference");
    }
  }
}

/// What a member writes to a variable that has a type of its own goes there in that type, by the day first whatever the
/// user's settings are, and a variant that refers to it stays the reference that it was.
void dates(IDispatch* u) {
  const auto difference = [u](VARIANT* day, auto&& time) {
    return use(u, L"GetTimeDifference", Value(day), L"10/3/2024", time, L"10:30");
  };
  Text text(L"10/3/2024");
  Value variant(L"10/3/2024");
  DATE date = 45361.25;
  double number = 45361.25;
  struct Row {
    const char* name;
    Value reference;
    HRESULT expected;
  };
  Row rows[] = {{"a text", Value::reference(VT_BSTR, static_cast<BSTR*>(text)), S_OK},
                {"a date", Value::reference(VT_DATE, &date), S_OK},
                {"a double", Value::reference(VT_R8, &number), run_time_error(13)},
                {"a variant", Value(&variant.get()), S_OK}};
  for (Row& row : rows) {
    const VARIANT before = row.reference.get();
    check_equal(row.expected, difference(row.reference, L"9:00").error, row.name);
    check(std::memcmp(&before, &row.reference.get(), sizeof before) == 0, std::string(row.name) + " stays referred to");
  }
  check(date == 45361 && number == 45361.25, "the date and the double afterwards");
  check_equal(L"10/03/2024", text.view(), "the text afterwards");
  check_equal(L"10/03/2024", variant.text(), "the variant afterwards");
  Value both(L"10/3/2024 9:00");
  check_equal(L"10:30", difference(both, both).result.text(), "the time of what has become a day");
  check_equal(L"00:00", both.text(), "the variable after that");
}

/// Of four variables that a call changes, one in turn is a number, which cannot take the date or time that is written
/// back: none is changed then.
void failing_calls_change_nothing(_ORVUtils* u) {
  const std::array<const wchar_t*, 4> given{L"10/3/2024", L"11/3/2024", L"9:00", L"8:30"};
  for (std::size_t place = 0; place < 2 * given.size() + 2; ++place) {
    const std::size_t refusing = place / 2;
    short number = 0;
    std::array<Value, given.size()> variables;
    std::array<Value, given.size()> a;
    for (std::size_t i = 0; i < given.size(); ++i) {
      variables[i] = Value(given[i]);
      a[i] = i == refusing ? Value::reference(VT_I2, &number) : Value(&variables[i].get());
    }
    std::array<VARIANT, given.size()> list{a[3].get(), a[2].get(), a[1].get(), a[0].get()};
    const HRESULT error = place % 2 == 0 ? u->GetTimeDifference(a[0], a[1], a[2], a[3], Value())
                                         : invoke(u, identifier(u, L"GetTimeDifference"), DISPATCH_METHOD, list).error;
    const std::string name = std::to_string(refusing) + (place % 2 == 0 ? " refuses, early" : " refuses, late");
    check_equal(refusing < given.size() ? run_time_error(13) : S_OK, error, name);
    for (std::size_t i = 0; i < given.size(); ++i)
      check((variables[i].text() == given[i]) == (refusing < given.size()), name + ": variable " + std::to_string(i));
  }
}

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

void records(IDispatch* u) {
  const auto ours = record_information(u, talutil::com::guid_of(talutil::identity::system_time_record));
  const auto other = record_information(u, talutil::com::guid_of(talutil::identity::file_time_record));
  Value date;
  std::array<VARIANT, 2> list{};
  const auto call = [&](const wchar_t* member, const VARIANT& record, Value second) {
    // Dates come after records, or before them.
    const bool is_first = identifier(u, member) == identifier(u, L"SystemTimeToDate");
    list = {is_first ? second.get() : record, is_first ? record : second.get()};
    return invoke(u, identifier(u, member), DISPATCH_METHOD, list).error;
  };
  for (const VARTYPE type : std::initializer_list<VARTYPE>{VT_RECORD, VT_RECORD | VT_BYREF}) {
    SYSTEMTIME time{1, 2, 77, 3, 4, 5, 6, 88};
    VARIANT record{};
    V_VT(&record) = type;
    V_RECORD(&record) = &time;
    V_RECORDINFO(&record) = ours.get();
    check_equal(S_OK, call(L"DateToSystemTime", record, L"5/3/2009 13:45:30"), "DateToSystemTime");
    const short expected[] = {2009, 3, 77, 5, 13, 45, 30, 88};
    check(std::memcmp(expected, &time, sizeof time) == 0, "the record that was written");
    const Value variable(&record);
    check_equal(S_OK, call(L"SystemTimeToDate", variable.get(), &date.get()), "SystemTimeToDate of a variable");
    check_equal(VT_DATE, date.type(), "its date");
    check_equal(S_OK, call(L"DateToSystemTime", variable.get(), L"1/1/2010"), "a variable with a record");
    check_equal(2010, time.wYear, "its year");
    for (IRecordInfo* const wrong : {other.get(), static_cast<IRecordInfo*>(nullptr)}) {
      V_RECORDINFO(&record) = wrong;
      check_equal(run_time_error(13), call(L"SystemTimeToDate", record, &date.get()),
                  "a record of another kind, or none");
    }
  }
}

void optional_and_named_arguments(IDispatch* u) {
  const auto count = [](Outcome outcome) { return outcome.error == S_OK ? V_I4(&outcome.result.get()) : -1; };
  Value list;
  check_equal(2, count(use(u, L"ReadCommaDelimStrToList", L"A,B,", list)), "left out");
  check_equal(1, count(use(u, L"ReadCommaDelimStrToList", L"A,B;", list, L";")), "given");
  check_equal(2, count(use(u, L"ReadCommaDelimStrToList", L"A,B,", list, Value::missing())), "missing");

  // By name: the value of sDelimiter, then of sTemp; the list stands in its place in front.
  std::array<const wchar_t*, 4> names{L"readcommadelimstrtolist", L"SDELIMITER", L"sTemp", L"sFList"};
  std::array<DISPID, 4> ids{};
  require(u->GetIDsOfNames(IID_NULL, const_cast<wchar_t**>(names.data()), 4, LOCALE_USER_DEFAULT, ids.data()),
          "GetIDsOfNames");
  const Value delimiter(L";");
  const Value text(L"A;B;C;");
  const Value place(&list.get());
  std::array<VARIANT, 3> arguments{delimiter.get(), text.get(), place.get()};
  const auto call = [&](std::size_t given, std::vector<DISPID> named) {
    return invoke(u, ids[0], DISPATCH_METHOD, std::span(arguments).first(given), named);
  };
  check_equal(3, count(call(3, {ids[1], ids[2], ids[3]})), "all by name");
  check_equal(DISP_E_PARAMNOTFOUND, call(3, {ids[1], ids[1]}).error, "a name twice");
  check_equal(DISP_E_PARAMNOTFOUND, call(3, {99}).error, "no such name");
  check_equal(DISP_E_PARAMNOTOPTIONAL, call(1, {ids[1]}).error, "only sDelimiter");
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
  for (const DISPID odd : std::initializer_list<DISPID>{0, DISPID_UNKNOWN, 0x6002FFFF, 0x60040000, INT_MIN})
    check_equal(DISP_E_MEMBERNOTFOUND, invoke(u, odd, DISPATCH_METHOD | DISPATCH_PROPERTYGET, {}).error, "no member");
  check_equal(DISP_E_PARAMNOTOPTIONAL, use(u, L"StripNulls").error, "too few arguments");
  check_equal(DISP_E_BADPARAMCOUNT, use(u, L"StripNulls", Value(), Value()).error, "too many arguments");
  check_equal(DISP_E_PARAMNOTOPTIONAL, use(u, L"StripNulls", Value::missing()).error, "a missing argument");
  // Nobody need take the result or the error.
  const Value one(1L);
  const Value zero(0L);
  const Value text(L"A,");
  std::array<VARIANT, 3> wrong{one.get(), one.get(), text.get()};
  std::array<VARIANT, 3> right{one.get(), zero.get(), text.get()};
  DISPPARAMS failing_call{wrong.data(), nullptr, 3, 0};
  DISPPARAMS good_call{right.data(), nullptr, 3, 0};
  DISPPARAMS promised{nullptr, nullptr, 3, 0};
  const std::pair<DISPPARAMS*, HRESULT> rows[] = {
      {nullptr, E_POINTER}, {&promised, E_POINTER}, {&failing_call, DISP_E_EXCEPTION}, {&good_call, S_OK}};
  for (const auto& [given, expected] : rows)
    check_equal(expected, u->Invoke(get_data, IID_NULL, 0, DISPATCH_METHOD, given, nullptr, nullptr, nullptr),
                "a call whose outcome nobody takes");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const Pointer<_ORVUtils> object = create_object();
    for (const auto check_part :
         {properties, texts, arrays, numbers, dates, records, optional_and_named_arguments, misuse})
      check_part(object.get());
    failing_calls_change_nothing(object.get());
    check_equal(S_OK, use(object.get(), L"Terminate").error, "Terminate");
  });
}
