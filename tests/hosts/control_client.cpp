// Another maker's control in the place of ours: it tells the name of the computer.
#include "client.hpp"

using namespace talutil::hosts;

namespace {

constexpr CLSID control_class = {0x5B1E7A10, 0x7C5D, 0x4E0A, {0x9D, 0x52, 0x11, 0x3A, 0x60, 0x9F, 0x27, 0xC4}};
constexpr const wchar_t* control_class_text = L"{5B1E7A10-7C5D-4E0A-9D52-113A609F27C4}";
constexpr const wchar_t* missing_class_text = L"{5B1E7A10-7C5D-4E0A-9D52-113A609F27C5}";
constexpr const wchar_t* program_id = L"TALUtilTest.SystemInformation";
constexpr const wchar_t* controls_key = L"Software\\TALUtil\\Controls";
constexpr const wchar_t* program_key = L"Software\\Classes\\TALUtilTest.SystemInformation";
constexpr const wchar_t* value_name = L"SystemInfoControl.MSysInfo";
constexpr const wchar_t* grid_value_name = L"VSFlex8Ctl.VSFlexGrid";

/// The control: an object that knows one identifier and no names.
class SystemInformation final : public NamelessObject {
 public:
  static inline const wchar_t* answer = L"";
  static inline int alive = 0;
  static inline std::vector<std::pair<DISPID, WORD>> uses;

  SystemInformation() { ++alive; }
  ULONG STDMETHODCALLTYPE AddRef() override { return ++references_; }
  ULONG STDMETHODCALLTYPE Release() override {
    const ULONG left = --references_;
    if (left == 0) delete this;
    return left;
  }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID id, REFIID, LCID, WORD flags, DISPPARAMS* parameters, VARIANT* result,
                                   EXCEPINFO*, UINT*) override {
    uses.emplace_back(id, flags);
    if (id != 0x68030010) return DISP_E_MEMBERNOTFOUND;
    if (parameters->cArgs != 0) return DISP_E_BADPARAMCOUNT;
    V_VT(result) = VT_BSTR;
    V_BSTR(result) = SysAllocString(answer);
    return S_OK;
  }

 private:
  ~SystemInformation() { --alive; }
  ULONG references_ = 1;
};

class Factory final : public IClassFactory {
 public:
  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    *out = id == IID_IUnknown || id == IID_IClassFactory ? this : nullptr;
    return *out == nullptr ? E_NOINTERFACE : S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE CreateInstance(IUnknown*, REFIID id, void** out) override {
    auto* const made = new SystemInformation;
    const HRESULT result = made->QueryInterface(id, out);
    made->Release();
    return result;
  }
  HRESULT STDMETHODCALLTYPE LockServer(BOOL) override { return S_OK; }
};

void set(HKEY root, const wchar_t* key, const wchar_t* name, std::wstring_view value) {
  const LSTATUS status =
      RegSetKeyValueW(root, key, name, REG_SZ, value.data(), static_cast<DWORD>((value.size() + 1) * sizeof(wchar_t)));
  check_equal(ERROR_SUCCESS, status, "writing " + narrow(key));
}

/// What the client writes to the registry goes with it.
struct RegistryCleaner {
  RegistryCleaner() { clean(); }
  ~RegistryCleaner() { clean(); }
  static void clean() {
    for (const HKEY root : {HKEY_CURRENT_USER, HKEY_LOCAL_MACHINE}) {
      for (const wchar_t* const name : {value_name, grid_value_name}) RegDeleteKeyValueW(root, controls_key, name);
      RegDeleteKeyW(root, controls_key);
    }
    RegDeleteTreeW(HKEY_LOCAL_MACHINE, program_key);
  }
};

std::wstring computer_name(_ORVUtils* u) {
  Text name;
  u->get_ComputerName(name);
  return std::wstring(name.view());
}

void missing_control_is_reported() {
  set(HKEY_LOCAL_MACHINE, controls_key, value_name, missing_class_text);
  Pointer<_ORVUtils> object;
  check_equal(run_time_error(429),
              CoCreateInstance(CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, IID__ORVUtils, object.receive_untyped()),
              "creating an object whose control is missing");
  const std::wstring text = error_text();
  check(text.starts_with(L"TALUtil.ORVUtils: ActiveX component can't create object: "), narrow(text));
  for (const wchar_t* const part : {missing_class_text, controls_key, value_name}) {
    check(text.find(part) != std::wstring::npos, narrow(text) + " names " + narrow(part));
  }
}

/// A control that stands for one of ours and creates the library in its turn, while the library starts.
void control_leads_back() {
  set(HKEY_LOCAL_MACHINE, controls_key, grid_value_name, L"TALUtil.Grid");
  Pointer<_ORVUtils> object;
  check_equal(run_time_error(429),
              CoCreateInstance(CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER, IID__ORVUtils, object.receive_untyped()),
              "creating an object whose control leads back to it");
  const std::wstring text = error_text();
  check(text.find(L"TALUtil.Grid") != std::wstring::npos, narrow(text) + " names TALUtil.Grid");
  RegDeleteKeyValueW(HKEY_LOCAL_MACHINE, controls_key, grid_value_name);
}

void control_answers() {
  set(HKEY_LOCAL_MACHINE, controls_key, value_name, control_class_text);
  SystemInformation::answer = L"FRONT-DESK";
  const Pointer<_ORVUtils> object = create_object();
  check_equal(L"FRONT-DESK", computer_name(object.get()), "ComputerName");
  check_equal(1, SystemInformation::alive, "controls on the window");
  if (check_equal(std::size_t{1}, SystemInformation::uses.size(), "uses of the control")) {
    check_equal(0x68030010, SystemInformation::uses[0].first, "the identifier");
    check((SystemInformation::uses[0].second & DISPATCH_PROPERTYGET) != 0, "it is read");
  }
  object->Terminate();
  check_equal(0, SystemInformation::alive, "controls after Terminate");
  check_equal(L"FRONT-DESK", computer_name(object.get()), "ComputerName after Terminate");
}

void control_by_program_identifier() {
  set(HKEY_LOCAL_MACHINE, (std::wstring(program_key) + L"\\CLSID").c_str(), nullptr, control_class_text);
  set(HKEY_LOCAL_MACHINE, controls_key, value_name, program_id);
  SystemInformation::answer = L"BACK-OFFICE";
  const Pointer<_ORVUtils> object = create_object();
  // A window that is not loaded is loaded and closed again, which reads the name anew.
  object->Terminate();
  check_equal(L"BACK-OFFICE", computer_name(object.get()), "ComputerName of a window loaded again");
  check_equal(0, SystemInformation::alive, "controls after that");
}

bool is_elevated() {
  HANDLE token = nullptr;
  TOKEN_ELEVATION_TYPE type = TokenElevationTypeDefault;
  DWORD size = 0;
  OpenProcessToken(GetCurrentProcess(), TOKEN_QUERY, &token);
  GetTokenInformation(token, TokenElevationType, &type, sizeof type, &size);
  CloseHandle(token);
  return type == TokenElevationTypeFull;
}

/// What every program of the user may write does not choose the code of an elevated one. Wine's programs are elevated.
void users_part_is_for_plain_programs() {
  const Pointer<_ORVUtils> object = create_object();
  RegDeleteKeyValueW(HKEY_LOCAL_MACHINE, controls_key, value_name);
  set(HKEY_CURRENT_USER, controls_key, value_name, missing_class_text);
  check_equal(is_elevated() ? S_OK : run_time_error(429), object->Terminate(), "a control in the user's part");
}

}  // namespace

int wmain(int, wchar_t**) {
  return run_checks([] {
    const RegistryCleaner cleaner;
    Factory factory;
    DWORD registration = 0;
    require(CoRegisterClassObject(control_class, &factory, CLSCTX_INPROC_SERVER, REGCLS_MULTIPLEUSE, &registration),
            "CoRegisterClassObject");
    missing_control_is_reported();
    control_leads_back();
    control_answers();
    control_by_program_identifier();
    users_part_is_for_plain_programs();
    CoRevokeClassObject(registration);
  });
}
