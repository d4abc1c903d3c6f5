#include "com/dispatch_object.hpp"

#include <array>
#include <atomic>
#include <vector>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"
#include "calling/targets.hpp"
#include "com/boundary.hpp"
#include "com/module.hpp"
#include "com/pointer.hpp"
#include "com/recorder.hpp"
#include "com/variant_bridge.hpp"

namespace talutil::com {

namespace {

/// An object's report of its failure; frees the texts in it.
class ExceptionInformation {
 public:
  ExceptionInformation() = default;
  ExceptionInformation(const ExceptionInformation&) = delete;
  ExceptionInformation& operator=(const ExceptionInformation&) = delete;
  ~ExceptionInformation() {
    for (BSTR text : {information_.bstrSource, information_.bstrDescription, information_.bstrHelpFile}) {
      if (text != nullptr) SysFreeString(text);
    }
  }

  [[nodiscard]] EXCEPINFO* get() noexcept { return &information_; }

  [[nodiscard]] RunTimeError error() {
    if (information_.pfnDeferredFillIn != nullptr) information_.pfnDeferredFillIn(&information_);
    const HRESULT result = information_.scode != 0 ? information_.scode : result_of(information_.wCode);
    return error_of(
        result, view_of(information_.bstrDescription),
        {Text(view_of(information_.bstrSource)), Text(view_of(information_.bstrHelpFile)), information_.dwHelpContext});
  }

 private:
  static TextView view_of(BSTR text) noexcept { return win32::view(text, SysStringLen(text)); }

  EXCEPINFO information_{};
};

bool owns_memory(const VARIANT& value) noexcept {
  const VARTYPE type = V_VT(&value);
  return type == VT_BSTR || type == VT_DISPATCH || type == VT_UNKNOWN || type > VT_DECIMAL;
}

/// Skips the platform's slow call for numbers.
void clear(VARIANT& value) noexcept {
  if (owns_memory(value)) VariantClear(&value);
}

/// Arguments in automation's order, the last one first. The few that members usually pass need no allocation.
class NativeArguments {
 public:
  explicit NativeArguments(std::span<const Variant> arguments) : NativeArguments(arguments.size()) {
    for (auto argument = arguments.rbegin(); argument != arguments.rend(); ++argument) {
      data()[size_++] = native_from(*argument, ArrayStyle::of_variants).release();
    }
  }
  NativeArguments(const NativeArguments&) = delete;
  NativeArguments& operator=(const NativeArguments&) = delete;
  ~NativeArguments() {
    for (UINT i = 0; i < size_; ++i) clear(data()[i]);
  }

  [[nodiscard]] VARIANT* data() noexcept { return many_.empty() ? few_.data() : many_.data(); }
  [[nodiscard]] UINT size() const noexcept { return size_; }

 private:
  // A complete object before the first argument is converted, so that these are freed if a later one fails.
  explicit NativeArguments(std::size_t count) : many_(count > std::tuple_size_v<Few> ? count : 0) {}

  using Few = std::array<VARIANT, 4>;

  Few few_;
  std::vector<VARIANT> many_;
  UINT size_ = 0;
};

/// The use of a member of the host's object, once or repeatedly.
class DispatchUse final : public RepeatedUse {
 public:
  DispatchUse(Pointer<IDispatch> dispatch, std::int32_t member, Access access, std::span<const Variant> arguments)
      : dispatch_(std::move(dispatch)), member_(member), access_(access), arguments_(arguments) {}
  DispatchUse(const DispatchUse&) = delete;
  DispatchUse& operator=(const DispatchUse&) = delete;
  ~DispatchUse() override { clear(result_); }

  void set(std::size_t argument, std::int32_t value) override {
    VARIANT& place = arguments_.data()[arguments_.size() - 1 - argument];
    clear(place);
    V_VT(&place) = VT_I4;
    V_I4(&place) = value;
  }

  Variant run() override {
    invoke();
    return V_VT(&result_) == VT_EMPTY ? Variant() : variant_from(result_);
  }

  TextView run_text(const Locale& locale) override {
    invoke();
    if (V_VT(&result_) == VT_BSTR) return win32::view(V_BSTR(&result_), SysStringLen(V_BSTR(&result_)));
    return converted_ = variant_from(result_).to_text(locale);
  }

  bool run_truth(const Locale& locale) override {
    invoke();
    if (V_VT(&result_) == VT_BOOL) return V_BOOL(&result_) != VARIANT_FALSE;
    return bool(variant_from(result_).to_boolean(locale));
  }

 private:
  void invoke() {
    clear(result_);
    V_VT(&result_) = VT_EMPTY;
    ExceptionInformation exception;
    const HRESULT status = use(exception);
    if (status == DISP_E_EXCEPTION) throw exception.error();
    if (FAILED(status)) throw error_of(status, {});
  }

  HRESULT use(ExceptionInformation& exception) {
    switch (access_) {
      case Access::call:
        return invoke(DISPATCH_METHOD, exception);
      case Access::get:
        // Sends both flags, because an object driven by its type information accepts only the first for a function and
        // only the second for a property. Whether a member (ScaleX, TextWidth, ItemData) is one or the other differs
        // between objects.
        return read(exception);
      case Access::put:
        break;
    }
    // An object is put by reference into a property that stores one; only some of these also accept it by value.
    if (V_VT(arguments_.data()) == VT_DISPATCH) {
      const HRESULT status = invoke(DISPATCH_PROPERTYPUTREF, exception);
      if (status != DISP_E_MEMBERNOTFOUND) return status;
    }
    return invoke(DISPATCH_PROPERTYPUT, exception);
  }

  HRESULT read(ExceptionInformation& exception) {
    const HRESULT status = invoke(DISPATCH_METHOD | DISPATCH_PROPERTYGET, exception);
    // Wine's JScript takes both flags as a call and fails for a plain property with E_FAIL.
    if (status != E_FAIL || arguments_.size() != 0) return status;
    return invoke(DISPATCH_PROPERTYGET, exception);
  }

  HRESULT invoke(WORD flags, ExceptionInformation& exception) {
    DISPID value = DISPID_PROPERTYPUT;
    const bool is_put = access_ == Access::put;
    DISPPARAMS parameters{arguments_.data(), is_put ? &value : nullptr, arguments_.size(), is_put ? 1U : 0U};
    return dispatch_->Invoke(member_, IID_NULL, LOCALE_USER_DEFAULT, flags, &parameters, is_put ? nullptr : &result_,
                             exception.get(), nullptr);
  }

  Pointer<IDispatch> dispatch_;
  std::int32_t member_;
  Access access_;
  NativeArguments arguments_;
  VARIANT result_{};
  Text converted_;
};

class HostObject final : public Object {
 public:
  explicit HostObject(Pointer<IDispatch> dispatch) noexcept : dispatch_(std::move(dispatch)) {}

  std::int32_t member_id(TextView name) override {
    DISPID id = DISPID_UNKNOWN;
    const HRESULT result = look_up(name, id);
    if (FAILED(result)) throw error_of(result, {});
    return id;
  }

  std::optional<std::int32_t> find_member(TextView name) override {
    DISPID id = DISPID_UNKNOWN;
    if (FAILED(look_up(name, id))) return {};
    return id;
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    return DispatchUse(dispatch_, member, access, arguments).run();
  }

  std::unique_ptr<RepeatedUse> repeat(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    return std::make_unique<DispatchUse>(dispatch_, member, access, arguments);
  }

  [[nodiscard]] const Pointer<IDispatch>& dispatch() const noexcept { return dispatch_; }

 private:
  HRESULT look_up(TextView name, DISPID& id) {
    Text text(name);
    auto* names = reinterpret_cast<wchar_t*>(text.data());
    return dispatch_->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &id);
  }

  Pointer<IDispatch> dispatch_;
};

/// A host's object that cannot be driven late-bound.
class UndrivenObject final : public Object {
 public:
  std::int32_t member_id(TextView /*name*/) override { raise(ErrorNumber::type_mismatch); }

  Variant invoke(std::int32_t /*member*/, Access /*access*/, std::span<const Variant> /*arguments*/) override {
    raise(ErrorNumber::type_mismatch);
  }
};

/// One of our objects, as passed to a host.
class OwnDispatch final : public IDispatch {
 public:
  explicit OwnDispatch(ObjectRef object) noexcept : object_(std::move(object)) {}
  OwnDispatch(const OwnDispatch&) = delete;
  OwnDispatch& operator=(const OwnDispatch&) = delete;

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    if (out == nullptr) return E_POINTER;
    *out = id == IID_IUnknown || id == IID_IDispatch ? this : nullptr;
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }

  ULONG STDMETHODCALLTYPE AddRef() override { return ++references_; }

  ULONG STDMETHODCALLTYPE Release() override {
    const ULONG left = --references_;
    if (left == 0) delete this;
    return left;
  }

  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) override {
    if (count == nullptr) return E_POINTER;
    *count = 0;
    return S_OK;
  }

  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT, LCID, ITypeInfo** out) override {
    if (out != nullptr) *out = nullptr;
    return DISP_E_BADINDEX;
  }

  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR* names, UINT count, LCID, DISPID* ids) override {
    if (names == nullptr || ids == nullptr || count == 0 || names[0] == nullptr) return E_POINTER;
    std::fill_n(ids, count, DISPID_UNKNOWN);
    try {
      ids[0] = object_->member_id(win32::view(names[0], std::char_traits<wchar_t>::length(names[0])));
      return count == 1 ? S_OK : DISP_E_UNKNOWNNAME;
    } catch (...) {
      return DISP_E_UNKNOWNNAME;
    }
  }

  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* parameters, VARIANT* result,
                                   EXCEPINFO* exception, UINT*) override {
    if (parameters == nullptr || (parameters->cArgs != 0 && parameters->rgvarg == nullptr)) return E_POINTER;
    // A host may release the control while handling one of its events.
    const auto keeper = Pointer<OwnDispatch>::shared(this);
    const FloatingPointSettings settings;
    try {
      std::vector<Variant> arguments;
      arguments.reserve(parameters->cArgs);
      for (UINT i = parameters->cArgs; i > 0; --i) arguments.push_back(variant_from(parameters->rgvarg[i - 1]));
      Access access = Access::call;
      if ((flags & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) != 0)
        access = Access::put;
      else if ((flags & DISPATCH_METHOD) == 0)
        access = Access::get;
      OwnedVariant answer = native_from(use(id, access, arguments), ArrayStyle::of_variants);
      if (result != nullptr) *result = answer.release();
      return S_OK;
    } catch (...) {
      return report_current_exception(exception);
    }
  }

  [[nodiscard]] const ObjectRef& object() const noexcept { return object_; }

 private:
  ~OwnDispatch() {
    if (Recorder* const recorder = module_recorder()) recorder->released(this);
  }

  Variant use(DISPID id, Access access, std::span<const Variant> arguments) {
    Recorder* const recorder = module_recorder();
    const Member* const member = recorder == nullptr ? nullptr : calling::member_of_object(*object_, id, access);
    if (member == nullptr) return object_->invoke(id, access, arguments);
    recorder->give_number(this);
    const std::vector<Argument> given(arguments.begin(), arguments.end());
    return recorded(
        recorder, this, *member, [&] { return std::span<const Argument>(given); },
        [&] { return object_->invoke(id, access, arguments); });
  }

  ObjectRef object_;
  std::atomic<ULONG> references_ = 1;
};

}  // namespace

ObjectRef object_from(IUnknown* object) {
  if (object == nullptr) return {};
  Pointer<IDispatch> dispatch;
  if (SUCCEEDED(object->QueryInterface(IID_IDispatch, dispatch.receive_untyped()))) {
    return std::make_shared<HostObject>(std::move(dispatch));
  }
  return std::make_shared<UndrivenObject>();
}

const void* identity_of_host_object(const ObjectRef& object) noexcept {
  const auto* const theirs = dynamic_cast<HostObject*>(object.get());
  return theirs == nullptr ? nullptr : theirs->dispatch().get();
}

IDispatch* dispatch_from(const ObjectRef& object) {
  if (object == nullptr) return nullptr;
  if (const auto* const theirs = dynamic_cast<HostObject*>(object.get())) {
    return Pointer<IDispatch>(theirs->dispatch()).release();
  }
  if (dynamic_cast<UndrivenObject*>(object.get()) != nullptr) raise(ErrorNumber::type_mismatch);
  return new OwnDispatch(object);
}

}  // namespace talutil::com
