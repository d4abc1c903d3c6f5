#include "com/dispatch_object.hpp"

#include <array>
#include <atomic>
#include <vector>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"
#include "com/boundary.hpp"
#include "com/module.hpp"
#include "com/pointer.hpp"
#include "com/variant_bridge.hpp"

namespace talutil::com {

namespace {

/// What an object told of its failure; its texts are freed here.
class ExceptionInformation {
 public:
  ExceptionInformation() = default;
  ExceptionInformation(const ExceptionInformation&) = delete;
  ExceptionInformation& operator=(const ExceptionInformation&) = delete;
  ~ExceptionInformation() {
    SysFreeString(information_.bstrSource);
    SysFreeString(information_.bstrDescription);
    SysFreeString(information_.bstrHelpFile);
  }

  [[nodiscard]] EXCEPINFO* get() noexcept { return &information_; }

  [[nodiscard]] RunTimeError error() {
    if (information_.pfnDeferredFillIn != nullptr) information_.pfnDeferredFillIn(&information_);
    const HRESULT result = information_.scode != 0 ? information_.scode : result_of(information_.wCode);
    return error_of(result, view_of(information_.bstrDescription), view_of(information_.bstrSource));
  }

 private:
  static TextView view_of(BSTR text) noexcept { return win32::view(text, SysStringLen(text)); }

  EXCEPINFO information_{};
};

/// Arguments in the order that automation wants: the last one first. The few that members pass need no memory.
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
    for (UINT i = 0; i < size_; ++i) VariantClear(data() + i);
  }

  [[nodiscard]] VARIANT* data() noexcept { return many_.empty() ? few_.data() : many_.data(); }
  [[nodiscard]] UINT size() const noexcept { return size_; }

 private:
  // Complete before the first argument is made, so that those made are freed when a later one cannot be.
  explicit NativeArguments(std::size_t count) : many_(count > std::tuple_size_v<Few> ? count : 0) {}

  using Few = std::array<VARIANT, 4>;

  Few few_;
  std::vector<VARIANT> many_;
  UINT size_ = 0;
};

/// The host's object.
class DispatchObject final : public Object {
 public:
  explicit DispatchObject(Pointer<IDispatch> dispatch) noexcept : dispatch_(std::move(dispatch)) {}

  std::int32_t member_id(TextView name) override {
    Text text(name);
    auto* names = reinterpret_cast<wchar_t*>(text.data());
    DISPID id = DISPID_UNKNOWN;
    const HRESULT result = dispatch_->GetIDsOfNames(IID_NULL, &names, 1, LOCALE_USER_DEFAULT, &id);
    if (FAILED(result)) throw error_of(result, {});
    return id;
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    NativeArguments natives(arguments);

    DISPID value = DISPID_PROPERTYPUT;
    DISPPARAMS parameters{natives.data(), nullptr, natives.size(), 0};
    if (access == Access::put) {
      parameters.rgdispidNamedArgs = &value;
      parameters.cNamedArgs = 1;
    }
    OwnedVariant result;
    ExceptionInformation exception;
    const HRESULT status = dispatch_->Invoke(member, IID_NULL, LOCALE_USER_DEFAULT, flags_of(access), &parameters,
                                             access == Access::put ? nullptr : &result.get(), exception.get(), nullptr);
    if (status == DISP_E_EXCEPTION) throw exception.error();
    if (FAILED(status)) throw error_of(status, {});
    return variant_from(result.get());
  }

  [[nodiscard]] const Pointer<IDispatch>& dispatch() const noexcept { return dispatch_; }

 private:
  static WORD flags_of(Access access) noexcept {
    switch (access) {
      case Access::put:
        return DISPATCH_PROPERTYPUT;
      case Access::get:
        return DISPATCH_PROPERTYGET;
      case Access::call:
        break;
    }
    return DISPATCH_METHOD;
  }

  Pointer<IDispatch> dispatch_;
};

/// One of ours, for a host.
class ObjectDispatch final : public IDispatch {
 public:
  explicit ObjectDispatch(ObjectRef object) noexcept : object_(std::move(object)) {}
  ObjectDispatch(const ObjectDispatch&) = delete;
  ObjectDispatch& operator=(const ObjectDispatch&) = delete;

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
    try {
      std::vector<Variant> arguments;
      arguments.reserve(parameters->cArgs);
      for (UINT i = parameters->cArgs; i > 0; --i) arguments.push_back(variant_from(parameters->rgvarg[i - 1]));
      Access access = Access::call;
      if ((flags & (DISPATCH_PROPERTYPUT | DISPATCH_PROPERTYPUTREF)) != 0)
        access = Access::put;
      else if ((flags & DISPATCH_METHOD) == 0)
        access = Access::get;
      OwnedVariant answer = native_from(object_->invoke(id, access, arguments), ArrayStyle::of_variants);
      if (result != nullptr) *result = answer.release();
      return S_OK;
    } catch (...) {
      return report_current_exception(exception);
    }
  }

  [[nodiscard]] const ObjectRef& object() const noexcept { return object_; }

 private:
  ~ObjectDispatch() = default;

  ObjectRef object_;
  std::atomic<ULONG> references_ = 1;
  ModuleReference keeps_module_loaded_;
};

}  // namespace

ObjectRef object_from(IUnknown* object) {
  if (object == nullptr) return {};
  Pointer<IDispatch> dispatch;
  if (FAILED(object->QueryInterface(IID_IDispatch, dispatch.receive_untyped()))) raise(ErrorNumber::type_mismatch);
  return std::make_shared<DispatchObject>(std::move(dispatch));
}

IDispatch* dispatch_from(const ObjectRef& object) {
  if (object == nullptr) return nullptr;
  if (const auto* const theirs = dynamic_cast<DispatchObject*>(object.get())) {
    return Pointer<IDispatch>(theirs->dispatch()).release();
  }
  return new ObjectDispatch(object);
}

}  // namespace talutil::com
