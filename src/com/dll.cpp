// The entry points of TALUtil.dll and the state of the loaded module.
#include <memory>
#include <mutex>

#include "com/boundary.hpp"
#include "com/classes.hpp"
#include "com/dispatch_object.hpp"
#include "com/module.hpp"
#include "com/pointer.hpp"
#include "com/recorder.hpp"
#include "com/registered_controls.hpp"
#include "com/registration.hpp"
#include "controls/common_dialog.hpp"
#include "controls/grid.hpp"
#include "controls/zip_controls.hpp"
#include "infoforms/frm_components.hpp"
#include "platform/win32/exception_frames.hpp"
#include "platform/win32/module_path.hpp"
#include "platform/win32/win32_platform.hpp"

/// Ends the process where an exception finds no handler. The library's own function would first write the exception's
/// name to a console that hosts do not have, with 50 KB of code to make it legible.
void __gnu_cxx::__verbose_terminate_handler() { std::abort(); }

namespace talutil::com {

namespace {

/// The DLL's platform and the library that uses it.
struct LoadedLibrary {
  RegisteredControls control_makers;
  win32::Win32Platform platform{control_makers};
  Library library{platform.platform()};
};

struct Module {
  HINSTANCE handle = nullptr;
  std::atomic<long> references = 0;  ///< Class objects and locks; counted before the library exists.
  // Recursive, because starting the library may lead back here on the same thread: a third-party control may create one
  // of our classes.
  std::recursive_mutex starting;
  bool is_starting = false;
  // Neither is ever released: objects that hosts have put into the settings must not be released under the loader lock.
  LoadedLibrary* loaded = nullptr;
  Recorder* recorder = nullptr;
  ITypeLib* type_library = nullptr;
};

Module module_state;

/// Keeps the DLL in the process until that ends. Hosts may hold our objects, windows and timers in ways that no count
/// reflects, and each unloading would leak a slot of thread storage and some memory of the compiler's run time, even if
/// no object was made: after a thousand, 32-bit processes would have no slots left.
void stay_loaded() noexcept {
  HMODULE module = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_PIN,
                     reinterpret_cast<const wchar_t*>(&module_state), &module);
}

/// Records the creation of an object of the class with an index in identity::classes. Toolkits need no number, since
/// all of them share their state.
template <std::size_t Class>
void record_creation(const void* identity) noexcept {
  if (module_state.recorder == nullptr) return;
  module_state.recorder->created(identity::classes[Class].program_id, identity);
}

template <class C, std::size_t Class>
HRESULT create_object(REFIID id, void** out) noexcept {
  return guarded([&] {
    // NOLINTNEXTLINE(bugprone-unhandled-exception-at-new): the guard around it turns it into error 7.
    auto* const made = new ComObject<C>(module_library());
    if constexpr (!std::is_same_v<C, ORVUtils>) record_creation<Class>(&made->object);
    const HRESULT result = ComObject<C>::query_interface(made, &id, out);
    ComObject<C>::release(made);
    if (FAILED(result)) throw system_error(result);
  });
}

/// Creates a control for a host. It is always our own, even if a third-party control is registered in its place.
template <class C, std::size_t Class>
HRESULT create_control(REFIID id, void** out) noexcept {
  return guarded([&] {
    Pointer<IDispatch> made;
    *made.receive() = dispatch_from(std::make_shared<C>(module_library().platform()));
    record_creation<Class>(made.get());
    const HRESULT result = made->QueryInterface(id, out);
    if (FAILED(result)) throw system_error(result);
  });
}

/// One per class, for the lifetime of the DLL.
class ClassObject final : public IClassFactory {
 public:
  using Create = HRESULT (*)(REFIID id, void** out) noexcept;

  constexpr explicit ClassObject(Create create) noexcept : create_(create) {}

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    if (out == nullptr) return E_POINTER;
    *out = id == IID_IUnknown || id == IID_IClassFactory ? this : nullptr;
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }

  ULONG STDMETHODCALLTYPE AddRef() override { return static_cast<ULONG>(++module_state.references); }

  ULONG STDMETHODCALLTYPE Release() override { return static_cast<ULONG>(--module_state.references); }

  HRESULT STDMETHODCALLTYPE CreateInstance(IUnknown* outer, REFIID id, void** out) override {
    if (out == nullptr) return E_POINTER;
    *out = nullptr;
    return outer != nullptr ? CLASS_E_NOAGGREGATION : create_(id, out);
  }

  HRESULT STDMETHODCALLTYPE LockServer(BOOL lock) override {
    if (lock != FALSE)
      AddRef();
    else
      Release();
    return S_OK;
  }

 private:
  Create create_;
};

// In the order of identity::classes.
ClassObject class_objects[] = {
    ClassObject(&create_object<ORVUtils, 0>),    ClassObject(&create_object<cControlPosition, 1>),
    ClassObject(&create_control<Grid, 2>),       ClassObject(&create_control<CommonDialog, 3>),
    ClassObject(&create_control<ZipControl, 4>), ClassObject(&create_control<UnzipControl, 5>),
};
static_assert(std::size(class_objects) == std::size(identity::classes));

}  // namespace

HINSTANCE module_handle() noexcept { return module_state.handle; }

Library& module_library() {
  const std::lock_guard lock(module_state.starting);
  if (module_state.loaded != nullptr) return module_state.loaded->library;
  if (module_state.is_starting) {
    throw RunTimeError(ErrorNumber::cannot_create_object,
                       u"ActiveX component can't create object: TALUtil is just starting; a control that is registered "
                       u"to stand for one of its own creates TALUtil in its turn");
  }
  struct Starting {
    Starting() noexcept { module_state.is_starting = true; }
    Starting(const Starting&) = delete;
    Starting& operator=(const Starting&) = delete;
    ~Starting() { module_state.is_starting = false; }
  };
  const Starting starting;
  auto loaded = std::make_unique<LoadedLibrary>();
  loaded->library.start();
  module_state.loaded = loaded.release();
  module_state.recorder = Recorder::start().release();
  return module_state.loaded->library;
}

Recorder* module_recorder() noexcept { return module_state.recorder; }

HRESULT type_information(const GUID& identifier, ITypeInfo** out) noexcept {
  return guarded([&] {
    if (module_state.type_library == nullptr) {
      const Text path = win32::module_path(module_state.handle);
      const HRESULT result = LoadTypeLibEx(win32::wide(path), REGKIND_NONE, &module_state.type_library);
      if (FAILED(result)) throw error_of(result, {});
    }
    const HRESULT result = module_state.type_library->GetTypeInfoOfGuid(identifier, out);
    if (FAILED(result)) throw error_of(result, {});
  });
}

}  // namespace talutil::com

using namespace talutil;
using namespace talutil::com;

extern "C" BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, void* /*reserved*/) {
  // Nothing else here, because the loader lock is held; none of these loads or waits for anything.
  if (reason == DLL_PROCESS_ATTACH) {
    module_state.handle = instance;
    stay_loaded();
    DisableThreadLibraryCalls(instance);
    win32::register_exception_frames(instance);
  } else if (reason == DLL_PROCESS_DETACH) {
    win32::unregister_exception_frames();
  }
  return TRUE;
}

// What is exported is named in talutil.def; the optimiser of the whole library does not know that file.
extern "C" [[gnu::externally_visible]] HRESULT WINAPI DllGetClassObject(REFCLSID class_id, REFIID id, void** out) {
  if (out == nullptr) return E_POINTER;
  *out = nullptr;
  for (std::size_t i = 0; i < std::size(class_objects); ++i) {
    if (class_id == guid_of(identity::classes[i].identifier)) return class_objects[i].QueryInterface(id, out);
  }
  return CLASS_E_CLASSNOTAVAILABLE;
}

// The DLL stays in the process either way; this tells COM when it need not ask again.
extern "C" [[gnu::externally_visible]] HRESULT WINAPI DllCanUnloadNow() {
  return module_state.loaded == nullptr && module_state.references == 0 ? S_OK : S_FALSE;
}

extern "C" [[gnu::externally_visible]] HRESULT WINAPI DllRegisterServer() {
  return register_library(RegistrationScope::machine);
}

extern "C" [[gnu::externally_visible]] HRESULT WINAPI DllUnregisterServer() {
  return unregister_library(RegistrationScope::machine);
}

// "regsvr32 /n /i:user TALUtil.dll" registers for the current user only, without administrator rights.
extern "C" [[gnu::externally_visible]] HRESULT WINAPI DllInstall(BOOL install, LPCWSTR command_line) {
  const bool for_user = command_line != nullptr && lstrcmpiW(command_line, L"user") == 0;
  const auto scope = for_user ? RegistrationScope::user : RegistrationScope::machine;
  return install != FALSE ? register_library(scope) : unregister_library(scope);
}
