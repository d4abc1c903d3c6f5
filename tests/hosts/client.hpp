#pragma once

#include <algorithm>
#include <array>
#include <atomic>
#include <cstdio>
#include <cstring>
#include <exception>
#include <fstream>
#include <functional>
#include <source_location>
#include <span>
#include <stdexcept>
#include <string>
#include <string_view>
#include <thread>
#include <type_traits>
#include <vector>

#include "../fakes/host_members.hpp"
#include "com/pointer.hpp"
#include "com/variant_bridge.hpp"
#include "talutil.h"

/// What the client programs share: checks, of which those that fail are a line each and whose counts are the last line;
/// owners of what is passed; and objects of a host's.
namespace talutil::hosts {

using namespace TALUtil;
using com::Pointer;

inline int passed = 0;
inline int failed = 0;

inline std::string narrow(std::wstring_view text) {
  std::string result;
  for (const wchar_t c : text) {
    std::array<char, 8> code{};
    std::snprintf(code.data(), code.size(), c >= 0x20 && c < 0x7f ? "%lc" : "\\x%02x", static_cast<unsigned>(c));
    result += code.data();
  }
  return "\"" + result + "\"";
}

template <class T>
std::string shown(const T& value) {
  if constexpr (std::is_same_v<T, std::string_view>) return std::string(value);
  if constexpr (std::is_same_v<T, std::wstring_view>) return narrow(value);
  if constexpr (std::is_same_v<T, HRESULT>) {
    // Also what a LONG looks like: small values are easier to read as numbers.
    std::array<char, 16> text{};
    std::snprintf(text.data(), text.size(), value < 0 ? "0x%08lX" : "%ld", value);
    return text.data();
  }
  if constexpr (std::is_arithmetic_v<T>) return std::to_string(value);
}

inline bool check(bool condition, const std::string& what,
                  const std::source_location& at = std::source_location::current()) {
  ++(condition ? passed : failed);
  if (condition) return true;
  const std::string_view path = at.file_name();
  const std::string file(path.substr(path.find_last_of('/') + 1));
  std::printf("FAILED %s:%u: %s\n", file.c_str(), static_cast<unsigned>(at.line()), what.c_str());
  std::fflush(stdout);
  return false;
}

template <class Expected, class Got>
bool check_equal(const Expected& expected, const Got& got, const std::string& what,
                 const std::source_location& at = std::source_location::current()) {
  using Text = std::conditional_t<
      std::is_convertible_v<const Got&, std::string_view>, std::string_view,
      std::conditional_t<std::is_convertible_v<const Got&, std::wstring_view>, std::wstring_view, Got>>;
  const Text wanted = static_cast<Text>(expected);
  const Text given = got;
  return check(wanted == given, what + ": expected " + shown(wanted) + ", got " + shown(given), at);
}

/// Runs the checks of a program in an apartment. A program that dies prints no counts, which counts as a failure.
template <class Checks>
int run_checks(Checks&& checks) {
  check_equal(S_OK, CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED), "CoInitializeEx");
  try {
    checks();
  } catch (const std::exception& error) {
    check(false, std::string("ended early: ") + error.what());
  }
  CoUninitialize();
  std::printf("%d passed, %d failed\n", passed, failed);
  return failed == 0 ? 0 : 1;
}

inline void require(HRESULT result, const std::string& what) {
  if (FAILED(result)) throw std::runtime_error(what + " answered " + shown(result));
}

template <class T>
std::wstring_view view(const T& text) {
  return {text, SysStringLen(text)};
}

/// A text as an argument or a result: `u->StripNulls(Text(L"a"), out)`.
class Text {
 public:
  Text() = default;
  Text(std::wstring_view text) : value_(SysAllocStringLen(text.data(), static_cast<UINT>(text.size()))) {}
  Text(const wchar_t* text) : Text(std::wstring_view(text)) {}
  Text(const Text&) = delete;
  Text& operator=(const Text&) = delete;
  ~Text() { SysFreeString(value_); }

  [[nodiscard]] BSTR get() const noexcept { return value_; }
  [[nodiscard]] BSTR release() noexcept { return std::exchange(value_, nullptr); }
  [[nodiscard]] std::wstring_view view() const noexcept { return hosts::view(value_); }
  operator BSTR*() noexcept { return &value_; }

 private:
  BSTR value_ = nullptr;
};

/// A number as an argument passed by reference.
template <class T>
struct Number {
  T value{};
  operator T*() noexcept { return &value; }
};
using Short = Number<short>;
using Long = Number<LONG>;
using Flag = Number<VARIANT_BOOL>;

/// A VARIANT that is cleared at its end.
class Value : public com::OwnedVariant {
 public:
  Value() noexcept = default;
  Value(const wchar_t* text) : Value(std::wstring_view(text)) {}
  Value(std::wstring_view text) : Value(VT_BSTR, &VARIANT::bstrVal, Text(text).release()) {}
  Value(short number) : Value(VT_I2, &VARIANT::iVal, number) {}
  Value(LONG number) : Value(VT_I4, &VARIANT::lVal, number) {}
  Value(double number) : Value(VT_R8, &VARIANT::dblVal, number) {}
  Value(IDispatch* object) : Value(VT_DISPATCH, &VARIANT::pdispVal, object) {
    if (object != nullptr) object->AddRef();
  }
  /// A reference to a caller's variable.
  Value(VARIANT* variable) : Value(VT_BYREF | VT_VARIANT, &VARIANT::pvarVal, variable) {}
  /// One field and its type.
  template <class Field, class Given>
  Value(int type, Field VARIANT::*field, Given given) noexcept {
    get().*field = given;
    V_VT(&get()) = static_cast<VARTYPE>(type);
  }
  static Value of_type(VARTYPE type) { return Value(type, &VARIANT::llVal, LONGLONG{}); }
  static Value null() { return of_type(VT_NULL); }
  static Value nothing() { return of_type(VT_DISPATCH); }
  static Value missing() { return Value(VT_ERROR, &VARIANT::scode, DISP_E_PARAMNOTFOUND); }
  static Value reference(VARTYPE type, void* place) { return Value(VT_BYREF | type, &VARIANT::byref, place); }
  /// An array of texts or of variants.
  static Value array(VARTYPE type, LONG lower, std::initializer_list<const wchar_t*> items) {
    SAFEARRAY* const array = SafeArrayCreateVector(type, lower, static_cast<ULONG>(items.size()));
    for (const wchar_t* const item : items) {
      Value element(item);
      void* const place = type == VT_BSTR ? static_cast<void*>(V_BSTR(&element.get())) : &element.get();
      SafeArrayPutElement(array, &lower, place);
      ++lower;
    }
    return Value(VT_ARRAY | type, &VARIANT::parray, array);
  }
  static Value square(VARTYPE type) {
    std::array<SAFEARRAYBOUND, 2> bounds{{{2, 0}, {2, 0}}};
    return Value(VT_ARRAY | type, &VARIANT::parray, SafeArrayCreate(type, 2, bounds.data()));
  }
  /// An object without automation.
  static Value undriven() {
    Pointer<ICreateErrorInfo> object;
    require(CreateErrorInfo(object.receive()), "CreateErrorInfo");
    return Value(VT_UNKNOWN, &VARIANT::punkVal, object.release());
  }

  [[nodiscard]] VARTYPE type() const noexcept { return V_VT(&get()); }
  [[nodiscard]] std::wstring_view text() const noexcept {
    return type() == VT_BSTR ? view(V_BSTR(&get())) : std::wstring_view(L"(not a text)");
  }
  operator VARIANT*() noexcept { return &get(); }
};

/// The texts of an array, in brackets, each followed by a bar: what a row of a table can hold.
inline std::wstring contents(const SAFEARRAY* array) {
  if (array == nullptr) return L"(none)";
  VARTYPE type = VT_EMPTY;
  SafeArrayGetVartype(const_cast<SAFEARRAY*>(array), &type);
  std::wstring result = L"[";
  for (ULONG i = 0; i < array->rgsabound[0].cElements; ++i) {
    const BSTR text =
        type == VT_BSTR ? static_cast<BSTR*>(array->pvData)[i] : V_BSTR(&static_cast<VARIANT*>(array->pvData)[i]);
    result += std::wstring(view(text)) + L"|";
  }
  return result + L"]";
}

template <class Interface = _ORVUtils>
Pointer<Interface> create_object(const CLSID& id = CLSID_ORVUtils, const IID& interface_id = IID__ORVUtils) {
  Pointer<Interface> object;
  require(CoCreateInstance(id, nullptr, CLSCTX_INPROC_SERVER, interface_id, object.receive_untyped()), "creating");
  return object;
}

/// What a member that gives a text gives for these arguments: `text(u, &_ORVUtils::StripNulls, Text(L"a"))`.
template <class Member, class... Given>
std::wstring text(_ORVUtils* u, Member member, Given&&... given) {
  Text result;
  check_equal(S_OK, (u->*member)(given..., result), "a member that gives a text");
  return std::wstring(result.view());
}

inline std::string bytes_of(const std::wstring& path) {
  std::ifstream file(path.c_str(), std::ios::binary);
  return file ? std::string(std::istreambuf_iterator<char>(file), {}) : "(no file)";
}

/// A window of the client's, 10 pixels from the corner of its parent or of the screen.
inline HWND window(const wchar_t* window_class, DWORD style, int width, int height, HWND parent = nullptr) {
  return CreateWindowW(window_class, L"A window", style, 10, 10, width, height, parent, nullptr, nullptr, nullptr);
}

/// Handles the messages that wait for this thread, calls from other apartments among them.
inline void handle_messages() {
  MSG message;
  while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE) != 0) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

/// Does the work on a thread with an apartment of its own, while this thread handles the calls that come from there.
template <class Work>
void on_another_thread(COINIT apartment, Work work) {
  std::atomic<bool> is_done = false;
  std::thread thread([&] {
    CoInitializeEx(nullptr, apartment);
    try {
      work();
    } catch (const std::exception& error) {
      check(false, error.what());
    }
    CoUninitialize();
    is_done = true;
  });
  while (!is_done) {
    MsgWaitForMultipleObjects(0, nullptr, FALSE, 1, QS_ALLINPUT);
    handle_messages();
  }
  thread.join();
}

/// The HRESULT of a run-time error.
constexpr HRESULT run_time_error(int number) {
  return static_cast<HRESULT>(0x800A0000U + static_cast<unsigned>(number));
}

/// What a caller hears of a call.
struct Outcome {
  HRESULT status = S_OK;
  HRESULT error = S_OK;  ///< The status, or the number of an exception.
  std::wstring text;     ///< The source and description of an error: "TALUtil.ORVUtils: Type mismatch".
  std::wstring help;     ///< Its help file and context: "a.chm#1".
  Value result;
};

/// What the thread's error information says; takes it away.
inline Outcome early_outcome(HRESULT status) {
  Outcome outcome{status, status, L"(no error information)", {}, {}};
  Pointer<IErrorInfo> error;
  if (GetErrorInfo(0, error.receive()) != S_OK) return outcome;
  Text source;
  Text description;
  Text help;
  DWORD context = 0;
  error->GetSource(source);
  error->GetDescription(description);
  error->GetHelpFile(help);
  error->GetHelpContext(&context);
  outcome.text = std::wstring(source.view()) + L": " + std::wstring(description.view());
  outcome.help = std::wstring(help.view()) + L"#" + std::to_wstring(context);
  return outcome;
}

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
  outcome.error = outcome.status == DISP_E_EXCEPTION ? exception.scode : outcome.status;
  outcome.text = std::wstring(view(exception.bstrSource)) + L": " + std::wstring(view(exception.bstrDescription));
  outcome.help = std::wstring(view(exception.bstrHelpFile)) + L"#" + std::to_wstring(exception.dwHelpContext);
  for (const BSTR text : {exception.bstrSource, exception.bstrDescription, exception.bstrHelpFile}) SysFreeString(text);
  return outcome;
}

inline DISPID identifier(IDispatch* object, const wchar_t* name) {
  DISPID id = DISPID_UNKNOWN;
  auto* names = const_cast<wchar_t*>(name);
  require(object->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &id), narrow(name));
  return id;
}

/// Uses a member as a script does, arguments in their order: a variable is passed by reference.
template <class... Arguments>
Outcome use(IDispatch* object, const wchar_t* member, Arguments&&... arguments) {
  [[maybe_unused]] const auto passed_as = [](auto&& argument) {
    if constexpr (std::is_same_v<decltype(argument), Value&>)
      return Value(&argument.get());
    else
      return Value(std::forward<decltype(argument)>(argument));
  };
  std::array<Value, sizeof...(Arguments)> owners{passed_as(std::forward<Arguments>(arguments))...};
  std::vector<VARIANT> list;
  for (const Value& owner : owners) list.insert(list.begin(), owner.get());
  return invoke(object, identifier(object, member), DISPATCH_METHOD | DISPATCH_PROPERTYGET, list);
}

inline HRESULT put(IDispatch* object, const wchar_t* member, const Value& value, WORD flags = DISPATCH_PROPERTYPUT) {
  std::array<VARIANT, 1> list{value.get()};
  std::array<DISPID, 1> named{DISPID_PROPERTYPUT};
  return invoke(object, identifier(object, member), flags, list, named).error;
}

/// What the clients' own automation objects have in common: most know no names.
class NamelessObject : public IDispatch {
 public:
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) final {
    *out = id == IID_IUnknown || id == IID_IDispatch ? this : nullptr;
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) final { return *count = 0, S_OK; }
  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT, LCID, ITypeInfo**) final { return DISP_E_BADINDEX; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override {
    return DISP_E_UNKNOWNNAME;
  }
};

/// One use of a member of a host's object.
struct Use {
  DISPID member;  ///< From 1, in the order of the names; 0 is the default one.
  WORD flags;
  const DISPPARAMS& given;
  VARIANT* result;
  EXCEPINFO* exception;

  [[nodiscard]] bool is_put() const { return (flags & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) != 0; }
  [[nodiscard]] VARIANT& argument(UINT index = 0) const { return given.rgvarg[given.cArgs - 1 - index]; }
  [[nodiscard]] HRESULT answer(Value value) const {
    if (result != nullptr) *result = value.release();
    return S_OK;
  }
};

/// An automation object of the client's with members of those names, which one function answers for. Each is used only
/// as what it is, as in real controls. References and look-ups are counted for the client to see.
class HostObject : public NamelessObject {
  std::vector<std::wstring_view> names_;

 public:
  using Answer = std::function<HRESULT(const Use&)>;
  HostObject(std::vector<std::wstring_view> names, Answer answer)
      : names_(std::move(names)), answer_(std::move(answer)) {}

  ULONG references = 1;
  std::vector<std::pair<DISPID, WORD>> uses;
  std::vector<int> look_ups = std::vector<int>(names_.size() + 1);

  ULONG STDMETHODCALLTYPE AddRef() final { return ++references; }
  ULONG STDMETHODCALLTYPE Release() final { return --references; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* asked, UINT, LCID, DISPID* id) override {
    const auto found =
        std::ranges::find_if(names_, [&](std::wstring_view name) { return lstrcmpiW(name.data(), *asked) == 0; });
    *id = found == names_.end() ? DISPID_UNKNOWN : static_cast<DISPID>(found - names_.begin()) + 1;
    if (*id != DISPID_UNKNOWN) ++look_ups[static_cast<std::size_t>(*id)];
    return *id == DISPID_UNKNOWN ? DISP_E_UNKNOWNNAME : S_OK;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* given, VARIANT* result,
                                   EXCEPINFO* exception, UINT*) override {
    uses.emplace_back(id, flags);
    if (id > 0 && static_cast<std::size_t>(id) <= names_.size()) {
      const std::wstring_view name = names_[static_cast<std::size_t>(id) - 1];
      // Automation's flags are the numbers that the table has.
      if ((flags & testing::uses_of(std::string(name.begin(), name.end()))) == 0) return DISP_E_MEMBERNOTFOUND;
    }
    return answer_(Use{id, flags, *given, result, exception});
  }

 private:
  Answer answer_;
};

/// The bytes in use on all heaps of the process. Without the platform's cache of texts, what stays there has leaked.
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
