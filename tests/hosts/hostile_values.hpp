#pragma once

#include <limits>

#include "client.hpp"

/// Arguments that a host should not send but may, and what a call with them may answer.
namespace talutil::hosts {

inline constexpr auto their_error = static_cast<HRESULT>(0x80041234U);

inline HostObject with_value({}, [](const Use& use) {
  return use.member == DISPID_VALUE && !use.is_put() ? use.answer(L"12") : DISP_E_MEMBERNOTFOUND;
});
inline HostObject without_value({}, [](const Use&) { return DISP_E_MEMBERNOTFOUND; });
inline HostObject failing({}, [](const Use& use) {
  if (use.member != DISPID_VALUE || use.is_put()) return DISP_E_MEMBERNOTFOUND;
  use.exception->scode = their_error;
  use.exception->bstrDescription = SysAllocString(L"not today");
  return DISP_E_EXCEPTION;
});

/// What a late-bound caller can get, whatever it sends. 51, an error of no kind the library knows, is not among it.
inline bool is_documented(const Outcome& outcome) {
  constexpr HRESULT results[] = {DISP_E_BADPARAMCOUNT, DISP_E_PARAMNOTOPTIONAL, DISP_E_MEMBERNOTFOUND,
                                 DISP_E_UNKNOWNNAME,   DISP_E_PARAMNOTFOUND,    E_POINTER};
  constexpr int numbers[] = {5, 6, 7, 9, 10, 11, 13, 18, 52, 53, 57, 70, 75, 76, 91, 94, 424, 438, 445, 449};
  constexpr std::wstring_view source = L"TALUtil.ORVUtils: ";
  if (SUCCEEDED(outcome.status)) return true;
  if (outcome.status != DISP_E_EXCEPTION) return std::ranges::find(results, outcome.status) != std::end(results);
  if (outcome.error == their_error) return outcome.text == L": not today";
  return outcome.text.starts_with(source) && outcome.text.size() > source.size() &&
         std::ranges::find(numbers, outcome.error, run_time_error) != std::end(numbers);
}

/// Places for what an argument refers to; cleared after the call, whatever the member made of them.
struct Places {
  Value cell;
  VARIANT outer{};
  Value argument;
};

struct Hostile {
  std::string name;
  std::function<void(Places&)> make;
};

/// The argument as given, by reference, in a variable, and in a variable by reference.
inline void add_all_ways(std::vector<Hostile>& list, const std::string& name, const std::function<Value()>& make) {
  const auto refer = [make](Places& places) {
    places.cell = make();
    // A decimal takes the whole of its VARIANT.
    const bool is_whole = places.cell.type() == VT_DECIMAL;
    return Value::reference(places.cell.type(), is_whole ? places.cell : static_cast<void*>(&V_I8(&places.cell.get())));
  };
  const auto add = [&](const char* way, std::function<void(Places&)> place) { list.push_back({name + way, place}); };
  add("", [make](Places& places) { places.argument = make(); });
  add(" by reference", [refer](Places& places) { places.argument = refer(places); });
  add(" in a variable", [make](Places& places) { places.argument = Value(&(places.cell = make()).get()); });
  add(" in a variable by reference", [refer](Places& places) {
    places.outer = refer(places).get();
    places.argument = Value(&places.outer);
  });
}

inline std::vector<Hostile> hostile_values() {
  std::vector<Hostile> list;
  // Every kind of variant there is and some there are not, all of them zero; texts, objects and arrays are null.
  constexpr int array = VT_ARRAY;
  std::vector<int> types{VT_RECORD,     VT_FILETIME,         VT_CLSID,
                         array,         array | VT_BSTR,     array | VT_VARIANT,
                         array | VT_I4, VT_VECTOR | VT_BSTR, VT_RESERVED | VT_I4};
  for (int type = VT_EMPTY; type < 32; ++type) {
    if (type != VT_VARIANT) types.push_back(type);
  }
  for (const int number : types) {
    const auto type = static_cast<VARTYPE>(number);
    add_all_ways(list, "zero of type " + std::to_string(type), [type] { return Value::of_type(type); });
    list.push_back({"null reference of type " + std::to_string(type),
                    [type](Places& places) { places.argument = Value::reference(type, nullptr); }});
  }
  using Limits = std::numeric_limits<double>;
  static constexpr auto two_texts = {L"a", L"b"};
  static constexpr DECIMAL largest_decimal{0, {{0, 0}}, 0xFFFFFFFF, {{0xFFFFFFFF, 0xFFFFFFFF}}};
  const std::pair<const char*, Value (*)()> values[] = {
      {"number as text", [] { return Value(L"12"); }},
      {"text", [] { return Value(std::wstring_view(L"a\0\xD800,", 4)); }},
      {"missing", [] { return Value::missing(); }},
      {"other error", [] { return Value(VT_ERROR, &VARIANT::scode, E_FAIL); }},
      {"infinity", [] { return Value(Limits::infinity()); }},
      {"not a number", [] { return Value(Limits::quiet_NaN()); }},
      {"date beyond the calendar", [] { return Value(VT_DATE, &VARIANT::date, Limits::max()); }},
      {"largest currency", [] { return Value(VT_CY, &VARIANT::llVal, std::numeric_limits<LONGLONG>::max()); }},
      {"largest whole number", [] { return Value(VT_UI8, &VARIANT::llVal, -1); }},
      {"largest decimal", [] { return Value(VT_DECIMAL, &VARIANT::decVal, largest_decimal); }},
      {"object with a value", [] { return Value(&with_value); }},
      {"object without a value", [] { return Value(&without_value); }},
      {"object that fails", [] { return Value(&failing); }},
      {"texts", [] { return Value::array(VT_BSTR, 0, two_texts); }},
      {"variants from 1", [] { return Value::array(VT_VARIANT, 1, {L"a"}); }},
      {"numbers", [] { return Value::array(VT_I4, -1, {}); }},
      {"two dimensions", [] { return Value::square(VT_VARIANT); }},
  };
  for (const auto& [name, make] : values) add_all_ways(list, name, make);
  list.push_back({"a circle", [](Places& places) { places.outer = (places.argument = Value(&places.outer)).get(); }});
  return list;
}

}  // namespace talutil::hosts
