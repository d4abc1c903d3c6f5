// Calls every member that the type library describes: agreement_client FOLDER [CALLS [SEED]]. First random calls, early
// and late with the same arguments, of every kind of variant, by value, by reference and in variables, also one
// variable for two parameters: error, result and everything that was written back must be the same, and memory must
// stay flat. Then properties, put and got. Then what nobody should send: null pointers, wrong numbers of arguments, and
// hostile values in each place.
#include <random>

#include "examples/host/window_objects.hpp"
#include "hostile_values.hpp"
#include "slots.hpp"

using namespace talutil::hosts;

namespace {

bool is_among(const Slot& slot, std::initializer_list<std::wstring_view> names) {
  return std::ranges::find(names, slot.name) != names.end();
}

/// Members that wait for a user would wait for ever.
bool waits_for_a_user(const Slot& slot) {
  return is_among(slot, {L"BrowseForFolder", L"CallZIPFiles", L"CallUnZIPFiles", L"CheckDeleteRecord",
                         L"CheckModifyDatabase", L"CountGridSelectedRows", L"ExportGridData", L"SelectGridRows",
                         L"DrawShellExecuteError", L"GridPrintPreview", L"TextBoxPrintPreview", L"ListBoxPrintPreview",
                         L"MyInputBox", L"ShowShortCutKeys", L"ShowCmdLineHelp", L"ShowSysInfo"});
}

/// Others answer by chance, show a box for a setting that a random put has made, or take a record, which cannot be made
/// for every kind of variant.
bool is_left_out(const Slot& slot) {
  return waits_for_a_user(slot) ||
         is_among(slot,
                  {L"GenerateFilePassword", L"GetNewGuid", L"CryptoEncryptString", L"ConvertNumberToDatabaseDuration",
                   L"VerifyFilePath", L"SetupFileFolders", L"Terminate", L"DebugMode", L"bIsProgrammer"}) ||
         std::ranges::any_of(slot.parameters, [](const auto& p) { return p.referenced == VT_USERDEFINED; });
}

/// A type and a value in a line.
std::wstring shown_value(const VARIANT& value) {
  const VARTYPE type = V_VT(&value);
  const std::wstring result = std::to_wstring(type) + L" ";
  if ((type & VT_BYREF) != 0) return result + L"reference";
  if ((type & VT_ARRAY) != 0) {
    SAFEARRAY* const array = V_ARRAY(&value);
    const bool is_list = type == (VT_ARRAY | VT_BSTR) || type == (VT_ARRAY | VT_VARIANT);
    return result + (array == nullptr || (is_list && SafeArrayGetDim(array) == 1) ? contents(array) : L"an array");
  }
  if (type == VT_BSTR) return result + std::wstring(view(V_BSTR(&value)));
  if (type == VT_DISPATCH || type == VT_UNKNOWN)
    return result + (V_UNKNOWN(&value) == nullptr ? L"nothing" : L"an object");
  const auto is_one_of = [type](std::initializer_list<VARENUM> types) {
    return std::ranges::find(types, type) != types.end();
  };
  if (is_one_of({VT_EMPTY, VT_NULL})) return result;
  return result + std::to_wstring(is_one_of({VT_UI1, VT_I1})                                      ? V_UI1(&value)
                                  : is_one_of({VT_I2, VT_BOOL})                                   ? V_I2(&value)
                                  : is_one_of({VT_R8, VT_DATE, VT_CY, VT_I8, VT_UI8, VT_DECIMAL}) ? V_I8(&value)
                                                                                                  : V_I4(&value));
}

/// Values of the typed parameters: usual ones and the ends of their ranges. Those at 2 suit most members.
constexpr std::wstring_view texts[] = {L"",
                                       L"A",
                                       L"a,b,",
                                       L"12",
                                       L" 4 5",
                                       L"10/3/2024",
                                       L"9:00",
                                       L"1.75 ",
                                       L"x;",
                                       L",",
                                       {L"\xD800\0b", 3},
                                       L"Name",
                                       L"30/12/1899 01:30"};
constexpr short shorts[] = {0, 1, 2, 3, 4, 5, -1, 12, 60, 2009, 32767, -32768};
constexpr LONG longs[] = {0, 1, 2, 3, -1, 70000, 2147483647, -2147483647 - 1};
constexpr double doubles[] = {45361.25, 0, -1.75, 2958465.99, 2, 0.5, 1e300};

Value typed_value(VARTYPE type, std::uint32_t draw) {
  switch (type) {
    case VT_BSTR:
      // A null pointer is an empty text.
      return draw % 20 == 0 ? Value::of_type(VT_BSTR) : Value(texts[draw % std::size(texts)]);
    case VT_I2:
      return Value(shorts[draw % std::size(shorts)]);
    case VT_BOOL:
      return Value(VT_BOOL, &VARIANT::boolVal, static_cast<VARIANT_BOOL>(draw % 3 == 0 ? -1 : draw % 3 - 1));
    case VT_R4:
      return Value(VT_R4, &VARIANT::fltVal, static_cast<float>(doubles[draw % 6]));
    case VT_DATE:
      return Value(VT_DATE, &VARIANT::date, doubles[draw % std::size(doubles)]);
    case VT_SAFEARRAY: {
      if (draw % 4 == 0) return Value::of_type(VT_ARRAY | VT_BSTR);
      Value list = Value::array(draw % 4 == 3 ? VT_VARIANT : VT_BSTR, draw % 8 == 1 ? 1 : 0, {L"a", L"Banana"});
      if (draw % 8 == 5) V_ARRAY(&list.get())->fFeatures |= FADF_FIXEDSIZE;
      V_VT(&list.get()) = VT_ARRAY | VT_BSTR;
      return list;
    }
    default:
      return Value(longs[draw % std::size(longs)]);
  }
}

/// One call's choices, from which its arguments can be made as often as they are needed.
struct Choice {
  explicit Choice(const Slot& called)
      : slot(&called), values(called.parameters.size()), draws(values.size(), 2), shares(values.size(), -1) {}

  const Slot* slot;
  std::vector<const Hostile*> values;  ///< Null for one of the parameter's own type, which is drawn.
  std::vector<std::uint32_t> draws;
  std::vector<int> shares;  ///< The earlier argument whose variable this is; -1 for none.
};

/// The arguments of one way of calling. A hostile value lies in its place's argument, a typed one in its cell.
class Arguments {
 public:
  explicit Arguments(const Choice& choice) : choice_(choice), places_(choice.values.size()) {
    for (std::size_t i = 0; i < places_.size(); ++i) {
      if (is_hostile(i))
        choice.values[i]->make(places_[i]);
      else
        places_[i].cell = typed_value(choice.slot->parameters[i].bare(), choice.draws[i]);
      const auto shared = static_cast<std::size_t>(choice.shares[i]);
      sources_.push_back(choice.shares[i] >= 0 && is_variable(shared) ? sources_[shared] : i);
    }
  }

  /// As cells for DispCallFunc.
  [[nodiscard]] std::vector<VARIANT> early() {
    return each([this](std::size_t i, bool by_reference) {
      Value& value = this->value(i);
      if (!by_reference) return value.get();
      void* const place = choice_.slot->parameters[i].bare() == VT_VARIANT ? static_cast<void*>(value) : data_of(value);
      return Value(VT_PTR, &VARIANT::byref, place).release();
    });
  }

  /// As the list that Invoke takes.
  [[nodiscard]] std::vector<VARIANT> late() {
    std::vector<VARIANT> list = each([this](std::size_t i, bool by_reference) {
      Value& value = this->value(i);
      return is_hostile(i) || !by_reference ? value.get() : Value::reference(value.type(), data_of(value)).release();
    });
    std::ranges::reverse(list);
    return list;
  }

  /// What a call has left in the variables. One that was passed by value is the caller's no more in a late call.
  [[nodiscard]] std::wstring states() const {
    std::wstring result;
    for (std::size_t i = 0; i < places_.size(); ++i) {
      result += L"\n    ";
      if (!is_hostile(i) || is_variable(i)) result += shown_value(places_[i].cell.get());
      if (is_variable(i)) result += L" / " + shown_value(places_[i].outer);
    }
    return result;
  }

 private:
  static void* data_of(Value& value) { return &V_I8(&value.get()); }
  [[nodiscard]] bool is_hostile(std::size_t i) const { return choice_.values[i] != nullptr; }
  [[nodiscard]] bool is_variable(std::size_t i) const {
    return is_hostile(i) && (places_[i].argument.type() & VT_BYREF) != 0;
  }
  [[nodiscard]] Value& value(std::size_t i) {
    return is_hostile(i) ? places_[sources_[i]].argument : places_[sources_[i]].cell;
  }

  template <class Make>
  [[nodiscard]] std::vector<VARIANT> each(Make make) {
    std::vector<VARIANT> result;
    for (std::size_t i = 0; i < places_.size(); ++i)
      result.push_back(make(i, choice_.slot->parameters[i].type == VT_PTR));
    return result;
  }

  const Choice& choice_;
  std::vector<Places> places_;
  std::vector<std::size_t> sources_;  ///< Where the variable of each argument is.
};

HRESULT call_slot(IUnknown* object, const Slot& slot, std::vector<VARIANT>& cells) {
  std::vector<VARTYPE> types;
  std::vector<VARIANTARG*> places;
  for (VARIANT& cell : cells) {
    types.push_back(types.size() < slot.parameters.size() ? slot.parameters[types.size()].type : VARTYPE{VT_PTR});
    places.push_back(&cell);
  }
  VARIANT status{};
  require(DispCallFunc(object, static_cast<ULONG_PTR>(slot.offset), CC_STDCALL, VT_ERROR,
                       static_cast<UINT>(cells.size()), types.data(), places.data(), &status),
          "DispCallFunc");
  return V_ERROR(&status);
}

Outcome call_early(IDispatch* object, const Slot& slot, Arguments& arguments) {
  std::vector<VARIANT> cells = arguments.early();
  // A result is only written: what stood there before is not the member's to free.
  VARIANT place;
  std::memset(&place, 0xDD, sizeof place);
  void* const storage = slot.result == VT_VARIANT ? static_cast<void*>(&place) : &V_I8(&place);
  if (slot.result != VT_EMPTY) cells.push_back(Value(VT_PTR, &VARIANT::byref, storage).release());
  SetErrorInfo(0, nullptr);
  Outcome outcome = early_outcome(call_slot(object, slot, cells));
  const bool has_result = slot.result == VT_VARIANT ? V_VT(&place) != VT_EMPTY : V_BSTR(&place) != nullptr;
  if (slot.result != VT_EMPTY && slot.result != VT_VARIANT) V_VT(&place) = slot.result;
  if (SUCCEEDED(outcome.error) && slot.result != VT_EMPTY)
    outcome.result.get() = place;
  else if (has_result && (slot.result == VT_VARIANT || slot.result == VT_BSTR))
    outcome.text += L", beside what was no result";
  return outcome;
}

Outcome call_late(IDispatch* object, const Slot& slot, Arguments& arguments) {
  std::vector<VARIANT> list = arguments.late();
  const std::vector<VARIANT> before = list;
  std::array<DISPID, 1> named{DISPID_PROPERTYPUT};
  Outcome outcome = invoke(object, slot.identifier, slot.kind, list,
                           slot.kind == INVOKE_PROPERTYPUT ? std::span<DISPID>(named) : std::span<DISPID>());
  // The list is the caller's: nothing in it may change, only what its references lead to.
  if (std::memcmp(before.data(), list.data(), list.size() * sizeof(VARIANT)) == 0) return outcome;
  return {E_UNEXPECTED, E_UNEXPECTED, L"the caller's list was changed", {}, {}};
}

/// Everything that a caller can see of a call.
template <class Call>
std::wstring text_of(Call call, IDispatch* object, const Choice& choice) {
  Arguments arguments(choice);
  const Outcome outcome = call(object, *choice.slot, arguments);
  const std::string error = shown(outcome.error);
  return std::wstring(error.begin(), error.end()) + L" " +
         (FAILED(outcome.error) ? outcome.text : shown_value(outcome.result.get())) + arguments.states();
}

std::string description_of(const Choice& choice) {
  std::string text = narrow(choice.slot->name);
  for (const Hostile* const value : choice.values) text += "; " + (value == nullptr ? "its own type" : value->name);
  return text;
}

Choice chosen(const std::vector<Slot>& slots, const std::vector<Hostile>& values, std::mt19937& random) {
  Choice choice(slots[random() % slots.size()]);
  int earlier = -1;  // The first place of a variant that is written back.
  for (std::size_t i = 0; i < choice.values.size(); ++i) {
    const SlotParameter& parameter = choice.slot->parameters[i];
    choice.draws[i] = static_cast<std::uint32_t>(random());
    if (parameter.bare() == VT_VARIANT) choice.values[i] = &values[random() % values.size()];
    if (parameter.referenced != VT_VARIANT) continue;
    if (random() % 4 == 0) choice.shares[i] = earlier;
    if (earlier < 0) earlier = static_cast<int>(i);
  }
  return choice;
}

/// Makes the same calls for the same seed; answers how many differ. What is written to the disk or the registry by the
/// first call of two may change the second, so that a difference must show twice.
long differences(IDispatch* u, const std::vector<Hostile>& values, unsigned seed, long pairs) {
  std::vector<Slot> slots = slots_of(u);
  std::erase_if(slots, is_left_out);
  std::mt19937 random(seed);
  long count = 0;
  for (; pairs > 0; --pairs) {
    const Choice choice = chosen(slots, values, random);
    std::wstring early;
    std::wstring late;
    for (int tries = 0; tries == 0 || (tries < 2 && early != late); ++tries) {
      early = text_of(call_early, u, choice);
      late = text_of(call_late, u, choice);
    }
    if (early != late && ++count <= 10)
      check(false, description_of(choice) + "\n  early " + narrow(early) + "\n  late  " + narrow(late));
  }
  return count;
}

void let_go_of_objects(IDispatch* u) {
  for (const wchar_t* name : {L"FolderBrowseForm", L"SplashForm", L"DrawTextPictureBox"})
    put(u, name, Value::nothing());
}

/// A combo box of entries with keys.
HWND combo_box(std::initializer_list<LPARAM> keys) {
  const HWND box = window(L"ComboBox", CBS_DROPDOWN, 100, 100);
  for (const LPARAM key : keys)
    SendMessageW(box, CB_SETITEMDATA, static_cast<WPARAM>(SendMessageW(box, CB_ADDSTRING, 0, LPARAM(L"entry"))), key);
  return box;
}

/// The same calls twice: what the system loads once and keeps (fonts, libraries) is there after the first time.
/// Settings of other lengths make some difference; a byte lost with each call would make a larger one.
void both_ways_agree(IDispatch* u, unsigned seed, long wanted) {
  const HWND outer = window(L"Static", WS_OVERLAPPEDWINDOW, 400, 300);
  const HWND box = combo_box({2, 12, 70000});
  // Their members answer only as what they are.
  Pointer<IDispatch> form;
  Pointer<IDispatch> combo;
  Pointer<IDispatch> picture;
  *form.receive() = form_object(outer);
  *combo.receive() = combo_object(box);
  *picture.receive() = picture_object(outer, 400, 300);
  std::vector<Hostile> values = hostile_values();
  // An argument that is left out can only be so in a late call.
  std::erase_if(values, [](const Hostile& value) { return value.name == "missing"; });
  for (const std::wstring_view text : texts)
    add_all_ways(values, "text " + narrow(text), [text] { return Value(text); });
  for (IDispatch* const host : {form.get(), combo.get(), picture.get()})
    add_all_ways(values, "an object of the host's", [host] { return Value(host); });
  for (const double number : doubles)
    add_all_ways(values, "date", [number] { return Value(VT_DATE, &VARIANT::date, number); });
  long different = 0;
  const auto run = [&] {
    different += differences(u, values, seed, wanted / 4);
    let_go_of_objects(u);
    return bytes_in_use();
  };
  constexpr std::size_t tolerance = 16384;
  const std::size_t before = run();
  const std::size_t after = run();
  std::printf("%ld calls, %ld differences, heaps from %zu to %zu bytes in the second half\n", wanted, different, before,
              after);
  check(after < before + tolerance,
        "the calls took the heaps from " + std::to_string(before) + " to " + std::to_string(after) + " bytes");
  check_equal(0L, different, "differences in " + std::to_string(wanted) + " calls");
  DestroyWindow(outer);
  DestroyWindow(box);
}

/// What is put in one way is got in the other, by a second object too where both share one block of settings.
void properties_keep_what_they_are_given(IDispatch* object, IDispatch* second, bool is_shared) {
  const std::vector<Slot> slots = slots_of(object);
  for (const Slot& put : slots) {
    const auto get = std::ranges::find_if(
        slots, [&](const Slot& slot) { return slot.kind == INVOKE_PROPERTYGET && slot.name == put.name; });
    if (put.kind != INVOKE_PROPERTYPUT || get == slots.end()) continue;
    const Choice nothing(*get);
    // The last of them switches no box on.
    for (const std::uint32_t draw : {0U, 20U, 23U, 10U, 5U, 1U}) {
      Choice choice(put);
      choice.draws = {draw};
      Arguments given(choice);
      Arguments none(nothing);
      const bool is_early = draw % 2 == 0;
      const auto got = [&](IDispatch* from) {
        return shown_value((is_early ? call_late : call_early)(from, *get, none).result.get());
      };
      const std::wstring before = got(second);
      check_equal(S_OK, (is_early ? call_early : call_late)(object, put, given).error, narrow(put.name));
      const std::wstring expected = shown_value(typed_value(put.parameters[0].bare(), draw).get());
      check_equal(expected, got(object), narrow(put.name));
      check_equal(is_shared ? expected : before, got(second), narrow(put.name) + " of a second object");
    }
  }
}

/// Calls each slot with usual values, once for each of its pointers with that one null.
void null_pointers_are_refused(IDispatch* object) {
  for (const Slot& slot : slots_of(object)) {
    const Choice choice(slot);
    Arguments arguments(choice);
    std::vector<VARIANT> cells = arguments.early();
    Value result;
    if (slot.result != VT_EMPTY) cells.push_back(Value(VT_PTR, &VARIANT::byref, &result.get()).release());
    for (VARIANT& cell : cells) {
      if (V_VT(&cell) != VT_PTR) continue;
      void* const place = std::exchange(V_BYREF(&cell), nullptr);
      check_equal(E_POINTER, call_slot(object, slot, cells), narrow(slot.name) + ", a null argument");
      V_BYREF(&cell) = place;
    }
  }
}

/// Sends each value to each place of each member, with what suits beside it.
void hostile_values_do_no_harm(IDispatch* u) {
  const std::vector<Hostile> values = hostile_values();
  std::vector<Slot> slots = slots_of(u);
  std::erase_if(slots, waits_for_a_user);
  // They meet the call that never returns; a thread that is asked to quit gets out of it.
  PostQuitMessage(0);
  const Value text(L"1");
  for (const Slot& slot : slots) {
    std::vector<VARIANT> list;
    std::string fault;
    for (; list.size() < 13; list.push_back(text.get())) {
      // A member that ends the library speaks of it otherwise.
      put(u, L"DebugMode", short{0});
      const Outcome outcome = invoke(u, slot.identifier, slot.kind, list);
      if (!is_documented(outcome)) fault = narrow(slot.name) + ", a wrong count, answered " + shown(outcome.error);
    }
    Choice choice(slot);
    for (const Hostile*& place : choice.values) {
      for (const Hostile& value : values) {
        place = &value;
        Arguments arguments(choice);
        const Outcome outcome = call_late(u, slot, arguments);
        if (fault.empty() && !is_documented(outcome))
          fault = description_of(choice) + ": answered " + shown(outcome.error) + " " + narrow(outcome.text);
      }
      place = nullptr;
    }
    check(fault.empty(), fault);
  }
  let_go_of_objects(u);
  for (const HostObject* object : {&with_value, &without_value, &failing})
    check_equal(1U, object->references, "references to a host's object after all calls");
  put(u, L"DebugMode", short{0});
  check_equal(S_OK, use(u, L"Terminate").error, "Terminate");
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  const long wanted = count > 2 ? wcstol(arguments[2], nullptr, 10) : 40'000;
  const auto seed = static_cast<unsigned>(count > 3 ? wcstoul(arguments[3], nullptr, 10) : 1);
  return run_checks([wanted, seed] {
    // What members take for the names of files shall not lie about.
    std::array<wchar_t, MAX_PATH> folder{};
    GetTempPathW(static_cast<DWORD>(folder.size()), folder.data());
    SetCurrentDirectoryW(folder.data());
    const auto no_cache = GetProcAddress(GetModuleHandleW(L"oleaut32.dll"), "SetOaNoCache");
    if (check(no_cache != nullptr, "SetOaNoCache")) no_cache();
    const Pointer<_ORVUtils> object = create_object();
    both_ways_agree(object.get(), seed, wanted);
    null_pointers_are_refused(object.get());
    const auto position = create_object<_cControlPosition>(CLSID_cControlPosition, IID__cControlPosition);
    null_pointers_are_refused(position.get());
    properties_keep_what_they_are_given(object.get(), create_object().get(), true);
    properties_keep_what_they_are_given(
        position.get(), create_object<_cControlPosition>(CLSID_cControlPosition, IID__cControlPosition).get(), false);
    hostile_values_do_no_harm(object.get());
  });
}
