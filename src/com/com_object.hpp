#pragma once

#include <atomic>

#include "automation/late_call.hpp"
#include "com/invoke.hpp"
#include "com/module.hpp"
#include "com/recorder.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::com {

/// A slot of a vtable, regardless of its signature.
using Slot = void (*)();

/// The slots before those of a class's own members.
constexpr std::size_t own_slots = 7;

/// The differences between the classes that hosts create.
template <class C>
struct ClassTraits;

/// The slots of a class, defined in vtables.cpp.
template <class C>
[[nodiscard]] const Slot* vtable_of() noexcept;

/// An object as hosts see it: a pointer to its slots comes first. It has no virtual functions of its own, so that its
/// address is the interface pointer.
template <class C>
class ComObject {
 public:
  explicit ComObject(Library& library) : object(library) {}
  ComObject(const ComObject&) = delete;
  ComObject& operator=(const ComObject&) = delete;

  // The first seven slots.
  static HRESULT STDMETHODCALLTYPE query_interface(ComObject* self, const IID* id, void** out) noexcept {
    if (out == nullptr || id == nullptr) return E_POINTER;
    *out = nullptr;
    if (*id == IID_IUnknown || *id == IID_IDispatch || *id == ClassTraits<C>::interface_id)
      *out = self;
    else if (*id == IID_ISupportErrorInfo)
      *out = static_cast<ISupportErrorInfo*>(&self->error_support_);
    else if (*id == IID_IProvideClassInfo)
      *out = static_cast<IProvideClassInfo*>(&self->class_information_);
    if (*out == nullptr) return E_NOINTERFACE;
    add_reference(self);
    return S_OK;
  }

  static ULONG STDMETHODCALLTYPE add_reference(ComObject* self) noexcept { return ++self->references_; }

  static ULONG STDMETHODCALLTYPE release(ComObject* self) noexcept {
    const ULONG left = --self->references_;
    if (left != 0) return left;
    if (Recorder* const recorder = module_recorder()) recorder->released(&self->object);
    delete self;
    return 0;
  }

  /// Keeps the object alive during a call: a member may show dialogs and let messages through, and a host that handles
  /// one of those may release its last reference.
  class Keeper {
   public:
    explicit Keeper(ComObject* object) noexcept : object_(object) { add_reference(object); }
    Keeper(const Keeper&) = delete;
    Keeper& operator=(const Keeper&) = delete;
    ~Keeper() { release(object_); }

   private:
    ComObject* object_;
  };

  static HRESULT STDMETHODCALLTYPE type_information_count(ComObject*, UINT* count) noexcept {
    if (count == nullptr) return E_POINTER;
    *count = 1;
    return S_OK;
  }

  static HRESULT STDMETHODCALLTYPE get_type_information(ComObject*, UINT index, LCID, ITypeInfo** out) noexcept {
    if (out == nullptr) return E_POINTER;
    *out = nullptr;
    return index == 0 ? type_information(ClassTraits<C>::interface_id, out) : DISP_E_BADINDEX;
  }

  static HRESULT STDMETHODCALLTYPE get_identifiers(ComObject*, const IID* id, LPOLESTR* names, UINT count, LCID,
                                                   DISPID* ids) noexcept {
    if (id == nullptr) return E_POINTER;
    if (*id != IID_NULL) return DISP_E_UNKNOWNINTERFACE;
    return find_identifiers(late_interface<C>(), names, count, ids);
  }

  static HRESULT STDMETHODCALLTYPE invoke_member(ComObject* self, DISPID member, const IID* id, LCID, WORD flags,
                                                 DISPPARAMS* parameters, VARIANT* result, EXCEPINFO* exception,
                                                 UINT* bad_argument) noexcept {
    if (id == nullptr) return E_POINTER;
    if (*id != IID_NULL) return DISP_E_UNKNOWNINTERFACE;
    const Keeper keeper(self);
    return invoke(late_interface<C>(), &self->object, self->object.library().locale(),
                  {member, flags, parameters, result, exception, bad_argument});
  }

 private:
  /// A second interface of the object, which forwards reference counting and queries to the first.
  template <class Interface>
  class Part : public Interface {
   public:
    explicit Part(ComObject* owner) noexcept : owner_(owner) {}
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
      return query_interface(owner_, &id, out);
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return add_reference(owner_); }
    ULONG STDMETHODCALLTYPE Release() override { return release(owner_); }

   private:
    ComObject* owner_;
  };

  class ErrorSupport final : public Part<ISupportErrorInfo> {
   public:
    using Part<ISupportErrorInfo>::Part;
    HRESULT STDMETHODCALLTYPE InterfaceSupportsErrorInfo(REFIID id) override {
      return id == ClassTraits<C>::interface_id || id == IID_IDispatch ? S_OK : S_FALSE;
    }
  };

  class ClassInformation final : public Part<IProvideClassInfo> {
   public:
    using Part<IProvideClassInfo>::Part;
    HRESULT STDMETHODCALLTYPE GetClassInfo(ITypeInfo** out) override {
      if (out == nullptr) return E_POINTER;
      *out = nullptr;
      return type_information(ClassTraits<C>::class_id, out);
    }
  };

  ~ComObject() = default;

  const Slot* slots_ = vtable_of<C>();
  std::atomic<ULONG> references_ = 1;

 public:
  C object;

 private:
  ErrorSupport error_support_{this};
  ClassInformation class_information_{this};
};

}  // namespace talutil::com
