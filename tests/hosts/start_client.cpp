// What only a process that begins can show: when the library may be unloaded, a third-party control in the place of
// ours, which tells the name of the computer, and on which thread the library runs: start_client FOLDER.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

constexpr CLSID control_class = {0x5B1E7A10, 0x7C5D, 0x4E0A, {0x9D, 0x52, 0x11, 0x3A, 0x60, 0x9F, 0x27, 0xC4}};
constexpr const wchar_t* control_class_text = L"{5B1E7A10-7C5D-4E0A-9D52-113A609F27C4}";
constexpr const wchar_t* missing_class_text = L"{5B1E7A10-7C5D-4E0A-9D52-113A609F27C5}";
constexpr const wchar_t* program_id = L"TALUtilTest.SystemInformation";
constexpr const wchar_t* controls_key = L"Software\\TALUtil\\Controls";
constexpr const wchar_t* program_key = L"Software\\Classes\\TALUtilTest.SystemInformation";
constexpr const wchar_t* information_control = L"SystemInfoControl.MSysInfo";
constexpr const wchar_t* grid_control = L"VSFlex8Ctl.VSFlexGrid";

/// The maker of the control, which is one object that knows one identifier and no names.
class Factory final : public IClassFactory {
 public:
  const wchar_t* answer = L"";
  HostObject control{{}, [this](const Use& use) {
                       if (use.member != 0x68030010 || (use.flags & DISPATCH_PROPERTYGET) == 0)
                         return DISP_E_MEMBERNOTFOUND;
                       return use.given.cArgs == 0 ? use.answer(answer) : DISP_E_BADPARAMCOUNT;
                     }};

  Factory() {
    require(CoRegisterClassObject(control_class, this, CLSCTX_INPROC_SERVER, REGCLS_MULTIPLEUSE, &registration_),
            "CoRegisterClassObject");
  }
  Factory(const Factory&) = delete;
  Factory& operator=(const Factory&) = delete;
  ~Factory() { CoRevokeClassObject(registration_); }

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    *out = id == IID_IUnknown || id == IID_IClassFactory ? this : nullptr;
    return *out == nullptr ? E_NOINTERFACE : S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE CreateInstance(IUnknown*, REFIID id, void** out) override {
    return control.QueryInterface(id, out);
  }
  HRESULT STDMETHODCALLTYPE LockServer(BOOL) override { return S_OK; }

 private:
  DWORD registration_ = 0;
};

/// What the client writes to the registry goes with it.
struct Registry {
  Registry() { clean(); }
  Registry(const Registry&) = delete;
  Registry& operator=(const Registry&) = delete;
  ~Registry() { clean(); }

  static void clean() {
    for (const HKEY root : {HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE}) RegDeleteTreeW(root, controls_key);
    RegDeleteTreeW(HKEY_LOCAL_MACHINE, program_key);
  }
  static void set(HKEY root, const wchar_t* key, const wchar_t* name, std::wstring_view value) {
    const auto size = static_cast<DWORD>((value.size() + 1) * sizeof(wchar_t));
    check_equal(ERROR_SUCCESS, RegSetKeyValueW(root, key, name, REG_SZ, value.data(), size), "writing " + narrow(key));
  }
};

HRESULT can_unload(HMODULE module) { return static_cast<HRESULT>(GetProcAddress(module, "DllCanUnloadNow")()); }

void class_objects_keep_the_library(HMODULE module) {
  const auto get_class = reinterpret_cast<HRESULT(WINAPI*)(REFCLSID, REFIID, void**)>(
      reinterpret_cast<void*>(GetProcAddress(module, "DllGetClassObject")));
  Pointer<IClassFactory> factory;
  check_equal(S_OK, can_unload(module), "before any object");
  check_equal(CLASS_E_CLASSNOTAVAILABLE, get_class(IID_IUnknown, IID_IClassFactory, factory.receive_untyped()),
              "a class it does not have");
  require(get_class(CLSID_ORVUtils, IID_IClassFactory, factory.receive_untyped()), "DllGetClassObject");
  check_equal(S_FALSE, can_unload(module), "while a class object is held");
  Pointer<IUnknown> object;
  check_equal(CLASS_E_NOAGGREGATION, factory->CreateInstance(factory.get(), IID_IUnknown, object.receive_untyped()),
              "aggregation");
  IClassFactory* const kept = factory.get();
  kept->LockServer(TRUE);
  factory = {};
  check_equal(S_FALSE, can_unload(module), "while the server is locked");
  kept->LockServer(FALSE);
  check_equal(S_OK, can_unload(module), "after the last lock");
}

/// Hosts may look for the library again and again, which must not use up the process's slots of thread storage.
void loading_again_costs_nothing(const std::wstring& path) {
  const auto free_slot = [] {
    const DWORD slot = TlsAlloc();
    TlsFree(slot);
    return slot;
  };
  FreeLibrary(LoadLibraryW(path.c_str()));
  const DWORD before = free_slot();
  for (int i = 0; i < 20; ++i) FreeLibrary(LoadLibraryW(path.c_str()));
  check_equal(before, free_slot(), "the next slot after loading and freeing twenty times");
}

/// Creates an object, which fails for a control of the components window; the error names the parts.
void creation_fails(std::initializer_list<const wchar_t*> parts) {
  Pointer<_ORVUtils> object;
  const Outcome outcome = early_outcome(
      CoCreateInstance(CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, IID__ORVUtils, object.receive_untyped()));
  check_equal(run_time_error(429), outcome.error, "creating an object without a control of its window");
  check(outcome.text.starts_with(L"TALUtil.ORVUtils: ActiveX component can't create object"), narrow(outcome.text));
  for (const wchar_t* const part : parts)
    check(outcome.text.find(part) != std::wstring::npos, narrow(outcome.text) + " names " + narrow(part));
}

void controls_are_replaced(Factory& factory) {
  const auto computer_name = [](_ORVUtils* u) { return text(u, &_ORVUtils::get_ComputerName); };
  Registry::set(HKEY_LOCAL_MACHINE, controls_key, information_control, missing_class_text);
  creation_fails({missing_class_text, controls_key, information_control});
  // A control that creates the library in its turn, while the library starts.
  Registry::set(HKEY_LOCAL_MACHINE, controls_key, grid_control, L"TALUtil.Grid");
  creation_fails({L"TALUtil.Grid"});
  RegDeleteKeyValueW(HKEY_LOCAL_MACHINE, controls_key, grid_control);

  Registry::set(HKEY_LOCAL_MACHINE, controls_key, information_control, control_class_text);
  factory.answer = L"FRONT-DESK";
  const Pointer<_ORVUtils> object = create_object();
  check_equal(L"FRONT-DESK", computer_name(object.get()), "ComputerName");
  check_equal(std::size_t{1}, factory.control.uses.size(), "uses of the control");
  check(factory.control.references > 1, "the control stays on its window");
  object->Terminate();
  check_equal(1U, factory.control.references, "references to the control after Terminate");
  check_equal(L"FRONT-DESK", computer_name(object.get()), "ComputerName after Terminate");

  Registry::set(HKEY_LOCAL_MACHINE, (std::wstring(program_key) + L"\\CLSID").c_str(), nullptr, control_class_text);
  Registry::set(HKEY_LOCAL_MACHINE, controls_key, information_control, program_id);
  factory.answer = L"BACK-OFFICE";
  // A window that is not loaded is loaded and closed again, which reads the name anew.
  object->Terminate();
  check_equal(L"BACK-OFFICE", computer_name(object.get()), "ComputerName of a control by its program identifier");
  check_equal(1U, factory.control.references, "references to the control after that");

  // What every program of the user may write does not choose the code of an elevated one. Wine's programs are elevated.
  RegDeleteKeyValueW(HKEY_LOCAL_MACHINE, controls_key, information_control);
  Registry::set(HKEY_CURRENT_USER, controls_key, information_control, missing_class_text);
  check_equal(S_OK, object->Terminate(), "a control in the user's part");
}

/// Whatever thread calls, the library runs on the one that came first, so that no two threads are in it at once: there
/// it uses the host's objects. An object of another thread's is asked over there.
void calls_are_made_on_the_first_thread(COINIT apartment) {
  const std::string name = apartment == COINIT_MULTITHREADED ? "a thread without an apartment" : "two apartments";
  DWORD used_on = 0;
  HostObject picture({L"ScaleMode", L"ScaleX", L"FontBold", L"ForeColor", L"TextWidth"},
                     [&](const Use&) { return used_on = GetCurrentThreadId(), DISP_E_MEMBERNOTFOUND; });
  const Pointer<_ORVUtils> here = create_object();
  check_equal(S_OK, put(here.get(), L"DrawTextPictureBox", &picture), name);
  on_another_thread(apartment, [&] {
    const Pointer<_ORVUtils> there = create_object();
    there->MyDrawText(Short{0}, Short{0}, Short{9}, Short{9}, Value(L"a"), Long{}, Short{}, Flag{}, Flag{});
    HostObject value({}, [](const Use& use) { return use.answer(L"12"); });
    check_equal(L"12", text(there.get(), &_ORVUtils::VerifyTextData, Short{}, Short{}, Value(&value)), name);
    // The number of an error comes through; its text does on Windows, not in Wine.
    check_equal(run_time_error(5), there->StringReplace(Text(L"a"), Text(), Text(), Text()), name);
  });
  check_equal(GetCurrentThreadId(), used_on, name + ": where a picture box was used");
  put(here.get(), L"DrawTextPictureBox", Value::nothing());
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  return run_checks([&] {
    const std::wstring path = std::wstring(arguments[1]) + L"\\TALUtil.dll";
    loading_again_costs_nothing(path);
    const HMODULE module = LoadLibraryW(path.c_str());
    class_objects_keep_the_library(module);
    {
      const Registry registry;
      Factory factory;
      controls_are_replaced(factory);
    }
    check_equal(S_FALSE, can_unload(module), "after the first object");
    calls_are_made_on_the_first_thread(COINIT_APARTMENTTHREADED);
    calls_are_made_on_the_first_thread(COINIT_MULTITHREADED);
  });
}
