// The two ways into the library agree: agreement_client FOLDER [CALLS [SEED]]. Random members are called early and late
// with the same arguments, of every kind of variant, by value, by reference and in variables, also one variable for two
// parameters; error, result and everything that was written back must be the same, and memory must stay flat.
#include <random>

#include "examples/host/window_objects.hpp"
#include "hostile_values.hpp"
#include "slots.hpp"
#include "typed_picture_box.hpp"

using namespace talutil::hosts;

namespace {

/// Members that answer by chance, wait for a user, or show a box for a setting that a random put has made.
bool is_left_out(std::wstring_view member) {
  constexpr std::wstring_view others[] = {
      L"GenerateFilePassword", L"GetNewGuid",       L"CryptoEncryptString", L"ConvertNumberToDatabaseDuration",
      L"VerifyFilePath",       L"SetupFileFolders", L"Terminate",           L"DebugMode",
      L"bIsProgrammer"};
  return waits_for_a_user(member) || std::ranges::find(others, member) != std::end(others);
}

/// Objects of a host's, each of whose members answers only as what it is.
class HostWindows {
 public:
  HostWindows()
      : window_(CreateWindowW(L"Static", L"", WS_OVERLAPPEDWINDOW, 0, 0, 400, 300, nullptr, nullptr, nullptr, nullptr)),
        box_(CreateWindowW(L"ComboBox", L"", CBS_DROPDOWN, 0, 0, 100, 100, nullptr, nullptr, nullptr, nullptr)) {
    for (const LPARAM key : {2, 12, 70000})
      SendMessageW(box_, CB_SETITEMDATA, static_cast<WPARAM>(SendMessageW(box_, CB_ADDSTRING, 0, LPARAM(L"entry"))),
                   key);
    *form.receive() = form_object(window_);
    *combo.receive() = combo_object(box_);
  }
  HostWindows(const HostWindows&) = delete;
  HostWindows& operator=(const HostWindows&) = delete;
  ~HostWindows() {
    DestroyWindow(window_);
    DestroyWindow(box_);
  }

  Pointer<IDispatch> form;
  Pointer<IDispatch> combo;
  TypedPictureBox picture_box;

 private:
  HWND window_;
  HWND box_;
};

/// A type and a value in a line.
std::wstring shown_value(const VARIANT& value) {
  const VARTYPE type = V_VT(&value);
  std::wstring result = std::to_wstring(type) + L" ";
  if ((type & VT_BYREF) != 0) return result + L"reference";
  if ((type & VT_ARRAY) != 0) {
    const VARTYPE element = type & VT_TYPEMASK;
    SAFEARRAY* const array = V_ARRAY(&value);
    const bool is_list =
        array != nullptr && SafeArrayGetDim(array) == 1 && (element == VT_BSTR || element == VT_VARIANT);
    return result + (is_list ? contents(array) : array == nullptr ? L"no array" : L"an array");
  }
  switch (type) {
    case VT_EMPTY:
    case VT_NULL:
      return result;
    case VT_BSTR:
      return result + std::wstring(view(V_BSTR(&value)));
    case VT_DISPATCH:
    case VT_UNKNOWN:
      return result + (V_UNKNOWN(&value) == nullptr ? L"nothing" : L"an object");
    case VT_I2:
    case VT_BOOL:
      return result + std::to_wstring(V_I2(&value));
    case VT_UI1:
    case VT_I1:
      return result + std::to_wstring(V_UI1(&value));
    case VT_I4:
    case VT_R4:
    case VT_INT:
    case VT_UINT:
    case VT_UI4:
    case VT_ERROR:
      return result + std::to_wstring(V_I4(&value));
    default:
      return result + std::to_wstring(V_I8(&value));
  }
}

/// Values of the typed parameters: usual ones and the ends of their ranges.
constexpr std::wstring_view texts[] = {L"",      L"A",  L"a,b,", L"12",        L" 4 5", L"10/3/2024",       L"9:00",
                                       L"1.75 ", L"x;", L",",    L"\xD800\0b", L"Name", L"30/12/1899 01:30"};
constexpr short shorts[] = {0, 1, 2, 3, 4, 5, -1, 12, 60, 2009, 32767, -32768};
constexpr LONG longs[] = {0, 1, 2, 3, -1, 70000, 2147483647, -2147483647 - 1};
constexpr double doubles[] = {45361.25, 0, -1.75, 2958465.99, 2, 0.5, 1e300};

/// The value of one argument, made anew for each way of calling.
class Passed {
 public:
  Passed(const SlotParameter& parameter, const Hostile& variant, std::uint32_t draw)
      : type_(parameter.type == VT_PTR ? parameter.referenced : parameter.type), by_pointer_(parameter.type == VT_PTR) {
    if (type_ == VT_VARIANT) {
      variant.make(places_);
      return;
    }
    switch (type_) {
      case VT_BSTR:
        typed_ = Value(texts[draw % std::size(texts)]);
        break;
      case VT_I2:
        typed_ = Value(shorts[draw % std::size(shorts)]);
        break;
      case VT_BOOL:
        V_BOOL(&typed_.get()) = static_cast<VARIANT_BOOL>(draw % 3 == 0 ? -1 : draw % 3 == 1 ? 0 : 1);
        break;
      case VT_I4:
        typed_ = Value(longs[draw % std::size(longs)]);
        break;
      case VT_R4:
        V_R4(&typed_.get()) = static_cast<float>(doubles[draw % 6]);
        break;
      case VT_DATE:
        V_R8(&typed_.get()) = doubles[draw % std::size(doubles)];
        break;
      case VT_SAFEARRAY:
        if (draw % 4 != 0)
          V_ARRAY(&typed_.get()) = std::exchange(
              Array(draw % 4 == 3 ? VT_VARIANT : VT_BSTR, draw % 8 == 1 ? 1 : 0, {L"a", L"Banana"}).get(), nullptr);
        break;
      default:
        break;
    }
    V_VT(&typed_.get()) = type_ == VT_SAFEARRAY ? VARTYPE{VT_ARRAY | VT_BSTR} : type_;
  }
  Passed(const Passed&) = delete;
  Passed& operator=(const Passed&) = delete;

  /// Shares the variable of an earlier argument.
  void share(Passed& earlier) noexcept { shared_ = &earlier; }
  [[nodiscard]] bool is_variable() const noexcept { return (V_VT(&places_.argument.get()) & VT_BYREF) != 0; }

  /// As a cell for DispCallFunc.
  [[nodiscard]] VARIANT early() {
    if (shared_ != nullptr) return shared_->early();
    VARIANT result{};
    if (!by_pointer_) {
      if (type_ == VT_VARIANT) return places_.argument.get();
      return typed_.get();
    }
    V_VT(&result) = VT_PTR;
    V_BYREF(&result) = type_ == VT_VARIANT ? static_cast<void*>(&places_.argument.get()) : &V_I8(&typed_.get());
    return result;
  }
  [[nodiscard]] VARTYPE early_type() const noexcept { return by_pointer_ ? VARTYPE{VT_PTR} : type_; }

  /// As a member of the list that Invoke takes.
  [[nodiscard]] VARIANT late() {
    if (shared_ != nullptr) return shared_->late();
    if (type_ == VT_VARIANT) return places_.argument.get();
    if (!by_pointer_) return typed_.get();
    VARIANT result{};
    V_VT(&result) = static_cast<VARTYPE>(VT_BYREF | V_VT(&typed_.get()));
    V_BYREF(&result) = &V_I8(&typed_.get());
    return result;
  }

  /// What a call has left in the variables. One that was passed by value is the caller's no more in a late call.
  [[nodiscard]] std::wstring after() const {
    if (type_ != VT_VARIANT) return shown_value(typed_.get());
    if (!is_variable()) return {};
    return shown_value(places_.cell.get()) + L" / " + shown_value(places_.outer);
  }

 private:
  VARTYPE type_;
  bool by_pointer_;
  Places places_;
  Value typed_;
  Passed* shared_ = nullptr;
};

/// One call's choices, from which its arguments can be made as often as they are needed.
struct Choice {
  const Slot* slot;
  std::vector<const Hostile*> values;
  std::vector<std::uint32_t> draws;
  std::vector<int> shares;  ///< The earlier argument whose variable this is; -1 for none.
};

std::vector<std::unique_ptr<Passed>> arguments_of(const Choice& choice) {
  std::vector<std::unique_ptr<Passed>> result;
  for (std::size_t i = 0; i < choice.values.size(); ++i) {
    result.push_back(std::make_unique<Passed>(choice.slot->parameters[i], *choice.values[i], choice.draws[i]));
    const int shared = choice.shares[i];
    if (shared >= 0 && result[static_cast<std::size_t>(shared)]->is_variable())
      result.back()->share(*result[static_cast<std::size_t>(shared)]);
  }
  return result;
}

std::wstring states(const std::vector<std::unique_ptr<Passed>>& arguments) {
  std::wstring result;
  for (const auto& argument : arguments) result += L"\n    " + argument->after();
  return result;
}

std::wstring outcome_text(HRESULT error, const std::wstring& information, const std::wstring& result) {
  std::array<wchar_t, 16> number{};
  swprintf(number.data(), number.size(), L"%08lX ", static_cast<unsigned long>(error));
  return number.data() + (FAILED(error) ? information : result);
}

std::wstring call_early(IDispatch* object, const Choice& choice) {
  const auto arguments = arguments_of(choice);
  std::vector<VARIANT> cells;
  std::vector<VARTYPE> types;
  for (const auto& argument : arguments) {
    cells.push_back(argument->early());
    types.push_back(argument->early_type());
  }
  std::array<std::byte, 64> storage{};
  const bool has_result = choice.slot->parameters.size() > arguments.size();
  if (has_result) {
    VARIANT place{};
    V_VT(&place) = VT_PTR;
    V_BYREF(&place) = storage.data();
    cells.push_back(place);
    types.push_back(VT_PTR);
  }
  std::vector<VARIANTARG*> places;
  for (VARIANT& cell : cells) places.push_back(&cell);
  VARIANT status{};
  SetErrorInfo(0, nullptr);
  require(DispCallFunc(object, static_cast<ULONG_PTR>(choice.slot->offset), CC_STDCALL, VT_ERROR,
                       static_cast<UINT>(cells.size()), types.data(), places.data(), &status),
          "DispCallFunc");
  const std::wstring information = FAILED(V_ERROR(&status)) ? error_text() : L"";
  Value result;
  if (has_result) {
    const VARTYPE type = choice.slot->parameters.back().referenced;
    if (type == VT_VARIANT) {
      std::memcpy(&result.get(), storage.data(), sizeof(VARIANT));
    } else {
      std::memcpy(&V_I8(&result.get()), storage.data(), sizeof(LONGLONG));
      V_VT(&result.get()) = type;
    }
  }
  return outcome_text(V_ERROR(&status), information, shown_value(result.get())) + states(arguments);
}

std::wstring call_late(IDispatch* object, const Choice& choice) {
  const auto arguments = arguments_of(choice);
  std::vector<VARIANT> list;
  for (const auto& argument : arguments) list.push_back(argument->late());
  std::ranges::reverse(list);
  std::array<DISPID, 1> named{DISPID_PROPERTYPUT};
  const bool is_put = choice.slot->kind == INVOKE_PROPERTYPUT;
  const Outcome outcome = invoke(object, choice.slot->identifier, static_cast<WORD>(choice.slot->kind), list,
                                 is_put ? std::span<DISPID>(named) : std::span<DISPID>());
  return outcome_text(outcome.error(), outcome.source + L": " + outcome.description,
                      shown_value(outcome.result.get())) +
         states(arguments);
}

class Calls {
 public:
  Calls(IDispatch* object, HostWindows& windows) : object_(object), slots_(slots_of(object)) {
    std::erase_if(slots_, [](const Slot& slot) {
      return is_left_out(slot.name) || std::ranges::any_of(slot.parameters, [](const SlotParameter& p) {
               return p.referenced == VT_USERDEFINED;
             });
    });
    for (Hostile& value : hostile_values()) {
      // An argument that is left out can only be so in a late call.
      if (value.name != "missing") values_.push_back(std::move(value));
    }
    for (const std::wstring_view text : texts)
      add_all_ways(values_, "text " + narrow(text), [text] { return Value(text); });
    for (IDispatch* const host :
         {windows.form.get(), windows.combo.get(), static_cast<IDispatch*>(&windows.picture_box)})
      add_all_ways(values_, "an object of the host's", [host] { return Value(host); });
    for (const double number : doubles) {
      add_all_ways(values_, "date", [number] {
        Value date(number);
        V_VT(&date.get()) = VT_DATE;
        return date;
      });
    }
  }

  /// Begins a series of calls, the same for the same seed.
  void begin(unsigned seed) { random_.seed(seed); }

  /// One member, both ways. What is written to the disk or the registry by the first call may change the second, so
  /// that a difference must show twice.
  void compare() {
    const Choice choice = chosen();
    for (int attempt = 0;; ++attempt) {
      const std::wstring early = call_early(object_, choice);
      const std::wstring late = call_late(object_, choice);
      calls_ += 2;
      if (early == late) return;
      if (attempt == 0) continue;
      ++differences_;
      if (differences_ <= 10)
        check(false, description_of(choice) + "\n  early " + narrow(early) + "\n  late  " + narrow(late));
      return;
    }
  }

  [[nodiscard]] long calls() const noexcept { return calls_; }
  [[nodiscard]] long differences() const noexcept { return differences_; }

 private:
  Choice chosen() {
    Choice choice{&slots_[random_() % slots_.size()], {}, {}, {}};
    std::size_t count = choice.slot->parameters.size();
    if (count > 0 && (choice.slot->parameters.back().flags & PARAMFLAG_FRETVAL) != 0) --count;
    for (std::size_t i = 0; i < count; ++i) {
      choice.values.push_back(&values_[random_() % values_.size()]);
      choice.draws.push_back(static_cast<std::uint32_t>(random_()));
      choice.shares.push_back(earlier_variant(*choice.slot, i));
    }
    return choice;
  }

  int earlier_variant(const Slot& slot, std::size_t place) {
    if (slot.parameters[place].referenced != VT_VARIANT || random_() % 4 != 0) return -1;
    for (std::size_t i = 0; i < place; ++i) {
      if (slot.parameters[i].referenced == VT_VARIANT) return static_cast<int>(i);
    }
    return -1;
  }

  static std::string description_of(const Choice& choice) {
    std::string text = narrow(choice.slot->name);
    for (std::size_t i = 0; i < choice.values.size(); ++i) {
      text += i == 0 ? ": " : "; ";
      if (choice.shares[i] >= 0) text += "(the variable of argument " + std::to_string(choice.shares[i]) + ") ";
      text += choice.values[i]->name + ", draw " + std::to_string(choice.draws[i]);
    }
    return text;
  }

  IDispatch* object_;
  std::vector<Slot> slots_;
  std::vector<Hostile> values_;
  std::mt19937 random_;
  long calls_ = 0;
  long differences_ = 0;
};

void empty_object_properties(_ORVUtils* u) {
  const Value nothing(static_cast<IDispatch*>(nullptr));
  u->put_FolderBrowseForm(nothing.get());
  u->put_SplashForm(nothing.get());
  u->put_DrawTextPictureBox(nothing.get());
}

/// The same calls twice: what the system loads once and keeps (fonts, libraries) is there after the first time.
/// Settings of other lengths make some difference; a byte lost with each call would make a larger one.
void memory_stays_flat(Calls& calls, _ORVUtils* u, unsigned seed, long wanted) {
  constexpr std::size_t tolerance = 16384;
  const auto run = [&](long until) {
    calls.begin(seed);
    while (calls.calls() < until) calls.compare();
    empty_object_properties(u);
    return bytes_in_use();
  };
  const std::size_t before = run(wanted / 2);
  const std::size_t after = run(wanted);
  check(after < before + tolerance, std::to_string(calls.calls() / 2) + " calls took the heaps from " +
                                        std::to_string(before) + " to " + std::to_string(after) + " bytes");
  check_equal(0L, calls.differences(), "differences in " + std::to_string(calls.calls()) + " calls");
  std::printf("%ld calls, %ld differences, heaps from %zu to %zu bytes in the second half\n", calls.calls(),
              calls.differences(), before, after);
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  const long wanted = count > 2 ? wcstol(arguments[2], nullptr, 10) : 40'000;
  const auto seed = static_cast<unsigned>(count > 3 ? wcstoul(arguments[3], nullptr, 10) : 1);
  return run_checks([wanted, seed] {
    std::array<wchar_t, MAX_PATH> folder{};
    GetTempPathW(static_cast<DWORD>(folder.size()), folder.data());
    SetCurrentDirectoryW(folder.data());
    free_texts_at_once();
    const Pointer<_ORVUtils> object = create_object();
    HostWindows windows;
    Calls calls(object.get(), windows);
    memory_stays_flat(calls, object.get(), seed, wanted);
  });
}
