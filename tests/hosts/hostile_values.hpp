#pragma once

#include <algorithm>
#include <limits>
#include <span>

#include "client.hpp"

/// Arguments that a host should not send but may, and what a call with them may answer.
namespace talutil::hosts {

// What a late-bound caller can get beside success, whatever it sends.
inline constexpr HRESULT documented_results[] = {DISP_E_BADPARAMCOUNT, DISP_E_PARAMNOTOPTIONAL, DISP_E_MEMBERNOTFOUND,
                                                 DISP_E_UNKNOWNNAME,   DISP_E_PARAMNOTFOUND,    E_POINTER};
// 51, an error of no kind the library knows, is not among them.
inline constexpr int documented_numbers[] = {5,  6,  7,  9,  10, 11, 13,  18,  52,  53,
                                             57, 70, 75, 76, 91, 94, 424, 438, 445, 449};

inline HostObject with_value(HostObject::Kind::with_value);
inline HostObject without_value(HostObject::Kind::without_value);
inline HostObject failing(HostObject::Kind::failing);

struct Outcome {
  HRESULT status = S_OK;
  HRESULT code = S_OK;  ///< Of the exception, where there was one.
  std::wstring source;
  std::wstring description;
  Value result;

  [[nodiscard]] HRESULT error() const { return status == DISP_E_EXCEPTION ? code : status; }
  [[nodiscard]] bool is_documented() const {
    if (SUCCEEDED(status)) return true;
    if (status != DISP_E_EXCEPTION)
      return std::ranges::find(documented_results, status) != std::end(documented_results);
    if (description.empty()) return false;
    if (code == HostObject::failure) return source.empty();
    return source == L"TALUtil.ORVUtils" &&
           std::ranges::any_of(documented_numbers, [this](int number) { return code == run_time_error(number); });
  }
};

/// The arguments of one call, the last first, and the identifiers of the named ones, which stand in front.
inline Outcome invoke(IDispatch* object, DISPID member, WORD flags, std::span<VARIANT> arguments,
                      std::span<DISPID> named = {}) {
  Outcome outcome;
  DISPPARAMS parameters{arguments.data(), named.data(), static_cast<UINT>(arguments.size()),
                        static_cast<UINT>(named.size())};
  EXCEPINFO exception{};
  UINT bad_argument = 0;
  outcome.status = object->Invoke(member, IID_NULL, LOCALE_USER_DEFAULT, flags, &parameters, outcome.result, &exception,
                                  &bad_argument);
  outcome.code = exception.scode;
  outcome.source = view(exception.bstrSource);
  outcome.description = view(exception.bstrDescription);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  return outcome;
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
  const auto refer = [](Places& places) {
    const VARTYPE type = places.cell.type();
    // A decimal takes the whole of its VARIANT.
    void* const data = type == VT_DECIMAL ? static_cast<void*>(&places.cell.get()) : &V_I8(&places.cell.get());
    return Value::reference(type, data);
  };
  list.push_back({name, [make](Places& places) { places.argument = make(); }});
  list.push_back({name + " by reference", [make, refer](Places& places) {
                    places.cell = make();
                    places.argument = refer(places);
                  }});
  list.push_back({name + " in a variable", [make](Places& places) {
                    places.cell = make();
                    places.argument = Value(&places.cell.get());
                  }});
  list.push_back({name + " in a variable by reference", [make, refer](Places& places) {
                    places.cell = make();
                    places.outer = refer(places).get();
                    places.argument = Value(&places.outer);
                  }});
}

inline Value array_value(VARTYPE type, LONG lower, std::initializer_list<const wchar_t*> items) {
  Value result;
  V_ARRAY(&result.get()) = std::exchange(Array(type, lower, items).get(), nullptr);
  V_VT(&result.get()) = VT_ARRAY | type;
  return result;
}

inline Value with_bits(VARTYPE type, LONGLONG bits) {
  Value result = Value::of_type(type);
  V_I8(&result.get()) = bits;
  return result;
}

/// Members that wait for a user would wait for ever.
inline bool waits_for_a_user(std::wstring_view member) {
  constexpr std::wstring_view waiting[] = {L"BrowseForFolder",   L"CallZIPFiles",        L"CallUnZIPFiles",
                                           L"CheckDeleteRecord", L"CheckModifyDatabase", L"CountGridSelectedRows",
                                           L"ExportGridData",    L"SelectGridRows",      L"DrawShellExecuteError",
                                           L"GridPrintPreview",  L"TextBoxPrintPreview", L"ListBoxPrintPreview",
                                           L"MyInputBox",        L"ShowShortCutKeys",    L"ShowCmdLineHelp",
                                           L"ShowSysInfo"};
  return std::ranges::find(waiting, member) != std::end(waiting);
}

inline std::vector<Hostile> hostile_values() {
  std::vector<Hostile> list;
  // Every kind of variant there is and some there are not, all of them zero; texts, objects and arrays are null.
  std::vector<int> types = {VT_RECORD,        VT_FILETIME,         VT_CLSID,
                            VT_ARRAY,         VT_ARRAY | VT_BSTR,  VT_ARRAY | VT_VARIANT,
                            VT_ARRAY | VT_I4, VT_VECTOR | VT_BSTR, VT_RESERVED | VT_I4};
  for (int type = VT_EMPTY; type < 32; ++type) {
    if (type != VT_VARIANT) types.push_back(type);
  }
  for (const int type : types) {
    add_all_ways(list, "zero of type " + std::to_string(type),
                 [type] { return Value::of_type(static_cast<VARTYPE>(type)); });
    list.push_back({"null reference of type " + std::to_string(type), [type](Places& places) {
                      places.argument = Value::reference(static_cast<VARTYPE>(type), nullptr);
                    }});
  }
  const double infinity = std::numeric_limits<double>::infinity();
  add_all_ways(list, "number as text", [] { return Value(L"12"); });
  add_all_ways(list, "text", [] { return Value(std::wstring_view(L"a\0\xD800,", 4)); });
  add_all_ways(list, "missing", [] { return Value::missing(); });
  add_all_ways(list, "other error", [] { return with_bits(VT_ERROR, E_FAIL); });
  add_all_ways(list, "infinity", [infinity] { return Value(infinity); });
  add_all_ways(list, "not a number", [] { return Value(std::numeric_limits<double>::quiet_NaN()); });
  add_all_ways(list, "date beyond the calendar", [] { return with_bits(VT_DATE, 0x7FEFFFFFFFFFFFFFLL); });
  add_all_ways(list, "largest currency", [] { return with_bits(VT_CY, std::numeric_limits<LONGLONG>::max()); });
  add_all_ways(list, "largest whole number", [] { return with_bits(VT_UI8, -1); });
  add_all_ways(list, "largest decimal", [] {
    Value result;
    result.get().decVal = DECIMAL{};
    result.get().decVal.Hi32 = result.get().decVal.Lo32 = result.get().decVal.Mid32 = 0xFFFFFFFF;
    V_VT(&result.get()) = VT_DECIMAL;
    return result;
  });
  add_all_ways(list, "object with a value", [] { return Value(&with_value); });
  add_all_ways(list, "object without a value", [] { return Value(&without_value); });
  add_all_ways(list, "object that fails", [] { return Value(&failing); });
  add_all_ways(list, "texts", [] { return array_value(VT_BSTR, 0, {L"a", L"b"}); });
  add_all_ways(list, "variants from 1", [] { return array_value(VT_VARIANT, 1, {L"a"}); });
  add_all_ways(list, "numbers", [] { return array_value(VT_I4, -1, {}); });
  add_all_ways(list, "two dimensions", [] {
    Value result;
    V_ARRAY(&result.get()) = std::exchange(Array::square(VT_VARIANT).get(), nullptr);
    V_VT(&result.get()) = VT_ARRAY | VT_VARIANT;
    return result;
  });
  list.push_back({"a circle", [](Places& places) {
                    V_VT(&places.outer) = VT_BYREF | VT_VARIANT;
                    V_VARIANTREF(&places.outer) = &places.outer;
                    places.argument = Value(&places.outer);
                  }});
  return list;
}

/// Without the platform's cache of texts, what is left on the heaps is what leaked.
inline void free_texts_at_once() {
  const auto no_cache = GetProcAddress(GetModuleHandleW(L"oleaut32.dll"), "SetOaNoCache");
  if (check(no_cache != nullptr, "SetOaNoCache")) no_cache();
}

/// The bytes in use on all heaps of the process.
inline std::size_t bytes_in_use() {
  std::array<HANDLE, 32> heaps{};
  const DWORD count = GetProcessHeaps(static_cast<DWORD>(heaps.size()), heaps.data());
  std::size_t bytes = 0;
  for (DWORD i = 0; i < count; ++i) {
    PROCESS_HEAP_ENTRY entry{};
    while (HeapWalk(heaps[i], &entry) != FALSE) {
      if ((entry.wFlags & PROCESS_HEAP_ENTRY_BUSY) != 0) bytes += entry.cbData;
    }
  }
  return bytes;
}

}  // namespace talutil::hosts
