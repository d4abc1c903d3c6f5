// Measures what a client waits for: loading the library, creating an object and releasing both, compared with one of
// the platform's objects; and an early-bound call.
#include <cstdio>

#include "host_grid.hpp"
#include "timing.hpp"

using namespace talutil::hosts;

namespace {

template <class Function>
Function function_of(HMODULE module, const char* name) {
  return reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

/// From an unloaded library to a released object, in the steps that the system performs for a client.
double first_life_of_object(const CLSID& class_id, const wchar_t* path) {
  const double start = now_in_microseconds();
  const HMODULE module = LoadLibraryW(path);
  const auto get_class = function_of<HRESULT(WINAPI*)(REFCLSID, REFIID, void**)>(module, "DllGetClassObject");
  if (get_class == nullptr) throw std::runtime_error("cannot load " + narrow(path));
  Pointer<IClassFactory> factory;
  Pointer<IDispatch> object;
  require(get_class(class_id, IID_IClassFactory, factory.receive_untyped()), "DllGetClassObject");
  require(factory->CreateInstance(nullptr, IID_IDispatch, object.receive_untyped()), "CreateInstance");
  object = {};
  factory = {};
  return now_in_microseconds() - start;
}

CLSID class_of(const wchar_t* program_id) {
  CLSID class_id;
  require(CLSIDFromProgID(program_id, &class_id), "CLSIDFromProgID");
  return class_id;
}

constexpr const wchar_t* ours_word = L"ours";
constexpr const wchar_t* theirs_word = L"theirs";

/// One such sequence in a separate process, in microseconds, because the library stays in a process that has used it.
double life_in_own_process(const std::wstring& folder, const wchar_t* whose) {
  std::array<wchar_t, MAX_PATH> program{};
  GetModuleFileNameW(nullptr, program.data(), static_cast<DWORD>(program.size()));
  std::wstring command = L"\"" + std::wstring(program.data()) + L"\" \"" + folder + L"\" " + whose;
  STARTUPINFOW setup{};
  setup.cb = sizeof setup;
  PROCESS_INFORMATION process{};
  if (CreateProcessW(nullptr, command.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &setup, &process) == FALSE)
    throw std::runtime_error("cannot start " + narrow(command));
  WaitForSingleObject(process.hProcess, INFINITE);
  DWORD microseconds = 0;
  GetExitCodeProcess(process.hProcess, &microseconds);
  CloseHandle(process.hThread);
  CloseHandle(process.hProcess);
  if (microseconds == 0) throw std::runtime_error(narrow(command) + " has measured nothing");
  return microseconds;
}

/// Runs in that process: the exit code is the time.
int measure_life(const std::wstring& folder, const std::wstring& whose) {
  const std::wstring library = folder + L"\\TALUtil.dll";
  return static_cast<int>(whose == ours_word
                              ? first_life_of_object(CLSID_ORVUtils, library.c_str())
                              : first_life_of_object(class_of(L"Scripting.FileSystemObject"), L"scrrun.dll"));
}

void compare_lives(const std::wstring& folder) {
  constexpr int repetitions = 21;
  std::vector<double> ours;
  std::vector<double> theirs;
  std::vector<double> ratios;
  for (int i = 0; i < repetitions; ++i) {
    ours.push_back(life_in_own_process(folder, ours_word));
    theirs.push_back(life_in_own_process(folder, theirs_word));
    ratios.push_back(ours.back() / theirs.back());
  }
  std::printf(
      "load, create, release, first in a process: TALUtil %.0f us, FileSystemObject %.0f us, ratio %.2f "
      "(goal: at most 1.20)\n",
      median(ours), median(theirs), median(ratios));
}

void time_ciphers(_ORVUtils* u) {
  Text plain(std::wstring(512, L'x').c_str());
  Text cipher;
  const double start = now_in_microseconds();
  require(u->CryptoEncryptString(plain, cipher), "CryptoEncryptString");
  std::printf("the first CryptoEncryptString, which derives the key: %.0f us\n", now_in_microseconds() - start);
  const auto time = [&](const char* name, auto&& call) {
    std::printf("%s of 1 KB, bound early: %.1f us (goal: below 50)\n", name, nanoseconds_of(call, 500) / 1000);
  };
  time("CryptoEncryptString", [&] { u->CryptoEncryptString(plain, Text()); });
  time("CryptoDecryptString", [&] { u->CryptoDecryptString(cipher, Text()); });
}

/// A bare use of a member: what any late-bound client pays.
void bare_use(IDispatch* object, DISPID member, WORD flags, VARIANT* last_first, UINT count, VARIANT* result) {
  DISPID named = DISPID_PROPERTYPUT;
  const bool is_put = flags == DISPATCH_PROPERTYPUT;
  DISPPARAMS parameters{last_first, is_put ? &named : nullptr, count, is_put ? 1U : 0U};
  require(object->Invoke(member, IID_NULL, 0, flags, &parameters, result, nullptr, nullptr), "a bare use");
}

VARIANT number(LONG value) {
  VARIANT result{};
  V_VT(&result) = VT_I4;
  V_I4(&result) = value;
  return result;
}

void tick_bare(HostGrid& table) {
  for (LONG r = 0; r < table.rows(); ++r) {
    std::array<VARIANT, 3> arguments{VARIANT{}, number(0), number(r)};
    V_VT(&arguments[0]) = VT_BOOL;
    V_BOOL(&arguments[0]) = VARIANT_TRUE;
    bare_use(&table, HostGrid::TextMatrix, DISPATCH_PROPERTYPUT, arguments.data(), 3, nullptr);
  }
}

/// The reads of an export, and its text written in one piece.
void export_bare(HostGrid& table, const std::wstring& path) {
  std::string text;
  for (LONG r = 0; r < table.rows(); ++r) {
    VARIANT answer{};
    VARIANT row = number(r);
    bare_use(&table, HostGrid::RowHidden, DISPATCH_PROPERTYGET, &row, 1, &answer);
    bare_use(&table, HostGrid::Cols, DISPATCH_PROPERTYGET, nullptr, 0, &answer);
    for (LONG c = 0; c < table.columns(); ++c) {
      std::array<VARIANT, 2> cell{number(c), row};
      bare_use(&table, HostGrid::ColHidden, DISPATCH_PROPERTYGET, cell.data(), 1, &answer);
      bare_use(&table, HostGrid::TextMatrix, DISPATCH_PROPERTYGET, cell.data(), 2, &answer);
      if (c > 0) text += ',';
      for (const wchar_t unit : view(V_BSTR(&answer))) text += static_cast<char>(unit);
      VariantClear(&answer);
    }
    text += "\r\n";
  }
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  DWORD written = 0;
  WriteFile(file, text.data(), static_cast<DWORD>(text.size()), &written, nullptr);
  CloseHandle(file);
}

template <class Ours, class Bare>
void compare_with_bare(const char* what, double goal, Ours ours, Bare bare) {
  constexpr int repetitions = 11;
  std::vector<double> our_times;
  std::vector<double> bare_times;
  std::vector<double> ratios;
  const auto time_of = [](const auto& work) {
    const double start = now_in_microseconds();
    work();
    return now_in_microseconds() - start;
  };
  for (int i = 0; i < repetitions; ++i) {
    our_times.push_back(time_of(ours));
    bare_times.push_back(time_of(bare));
    ratios.push_back(our_times.back() / bare_times.back());
  }
  std::printf("%s: TALUtil %.1f ms, a bare loop %.1f ms, ratio %.2f (goal: at most %.2f)\n", what,
              median(our_times) / 1000, median(bare_times) / 1000, median(ratios), goal);
}

/// A file dialog that replaces the system's and returns at once, so that exports are timed without a dialog. It is its
/// own class object.
class AnsweredDialog final : public IClassFactory {
 public:
  static constexpr CLSID class_id = {0x61C0A9F4, 0x2F0E, 0x4F6D, {0x8A, 0x11, 0x0D, 0x5C, 0x7E, 0x39, 0xB2, 0x48}};

  explicit AnsweredDialog(std::wstring path) : dialog_(std::move(path)) {
    constexpr std::wstring_view text = L"{61C0A9F4-2F0E-4F6D-8A11-0D5C7E39B248}";
    RegSetKeyValueW(HKEY_LOCAL_MACHINE, key, name, REG_SZ, text.data(), static_cast<DWORD>((text.size() + 1) * 2));
    require(CoRegisterClassObject(class_id, this, CLSCTX_INPROC_SERVER, REGCLS_MULTIPLEUSE, &cookie_), "the dialog");
  }
  AnsweredDialog(const AnsweredDialog&) = delete;
  AnsweredDialog& operator=(const AnsweredDialog&) = delete;
  ~AnsweredDialog() {
    CoRevokeClassObject(cookie_);
    RegDeleteKeyValueW(HKEY_LOCAL_MACHINE, key, name);
    RegDeleteKeyW(HKEY_LOCAL_MACHINE, key);
  }

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** out) override {
    *out = id == IID_IUnknown || id == IID_IClassFactory ? this : nullptr;
    return *out == nullptr ? E_NOINTERFACE : S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
  ULONG STDMETHODCALLTYPE Release() override { return 1; }
  HRESULT STDMETHODCALLTYPE CreateInstance(IUnknown*, REFIID id, void** out) override {
    return dialog_.QueryInterface(id, out);
  }
  HRESULT STDMETHODCALLTYPE LockServer(BOOL) override { return S_OK; }

 private:
  static constexpr const wchar_t* key = L"Software\\TALUtil\\Controls";
  static constexpr const wchar_t* name = L"MSComDlg.CommonDialog";

  /// Accepts every member; reading returns the path.
  class Dialog final : public NamelessObject {
   public:
    explicit Dialog(std::wstring path) : path_(std::move(path)) {}
    ULONG STDMETHODCALLTYPE AddRef() override { return 2; }
    ULONG STDMETHODCALLTYPE Release() override { return 1; }
    HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID* ids) override {
      return *ids = 1, S_OK;
    }
    HRESULT STDMETHODCALLTYPE Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT* result, EXCEPINFO*,
                                     UINT*) override {
      if (result == nullptr) return S_OK;
      V_VT(result) = VT_BSTR;
      V_BSTR(result) = SysAllocString(path_.c_str());
      return S_OK;
    }

   private:
    std::wstring path_;
  };

  Dialog dialog_;
  DWORD cookie_ = 0;
};

/// A host's grid that responds at once, so that only the calls themselves are measured.
void time_grids(_ORVUtils* u, const std::wstring& folder) {
  HostGrid table(10000, 20);
  for (LONG r = 0; r < table.rows(); ++r) {
    for (LONG c = 0; c < table.columns(); ++c)
      table.text(r, c) = L"cell " + std::to_wstring(r) + L" " + std::to_wstring(c);
  }
  Value grid(&table);
  const std::wstring path = folder + L"\\host_bench.txt";
  const AnsweredDialog dialog(path);
  u->Terminate();  // So that the components window creates its controls again.
  compare_with_bare(
      "export of 10,000 x 20 cells", 1.3,
      [&] { require(u->ExportGridData(grid, Short{0}, Number<VARIANT_BOOL>{VARIANT_TRUE}, Text(L"x")), "export"); },
      [&] { export_bare(table, path); });
  compare_with_bare(
      "SelectGridRows on 10,000 rows", 1.1, [&] { require(u->SelectGridRows(Long{0}, grid, Short{1}), "select"); },
      [&] { tick_bare(table); });
  DeleteFileW(path.c_str());
}

void time_early_calls(const std::wstring& folder) {
  const Pointer<_ORVUtils> object = create_object();
  _ORVUtils* const u = object.get();
  LONG number = 0;
  Text text(L"abcde");
  std::printf("early-bound property get of a 32-bit integer: %.0f ns\n",
              nanoseconds_of([&] { u->get_lLoginSessionID(&number); }));
  std::printf("early-bound StripNulls of 5 characters: %.0f ns, its result freed\n", nanoseconds_of([&] {
                BSTR result = nullptr;
                u->StripNulls(text, &result);
                SysFreeString(result);
              }));
  time_ciphers(u);
  time_grids(u, folder);
  u->Terminate();
}

}  // namespace

int wmain(int count, wchar_t** arguments) {
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  int status = 0;
  try {
    if (count > 2) return measure_life(arguments[1], arguments[2]);
    compare_lives(arguments[1]);
    time_early_calls(arguments[1]);
  } catch (const std::exception& error) {
    std::printf("FAILED: %s\n", error.what());
    status = 1;
  }
  CoUninitialize();
  return status;
}
