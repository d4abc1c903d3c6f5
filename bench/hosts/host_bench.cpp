// Times what a client waits for: loading the library, making an object and letting go of both, against one of the
// platform's own objects; and a call bound early.
#include <cstdio>

#include "client.hpp"
#include "timing.hpp"

using namespace talutil::hosts;

namespace {

template <class Function>
Function function_of(HMODULE module, const char* name) {
  return reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

/// From nothing loaded to nothing loaded, by the steps that the system takes for a client. (The system itself
/// would keep one of the two loaded.)
double life_of_object(const CLSID& class_id, const wchar_t* path) {
  const double start = now_in_microseconds();
  const HMODULE module = LoadLibraryW(path);
  const auto get_class = function_of<HRESULT(WINAPI*)(REFCLSID, REFIID, void**)>(module, "DllGetClassObject");
  if (get_class == nullptr) throw std::runtime_error("cannot load " + narrow(path));
  {
    Pointer<IClassFactory> factory;
    Pointer<IDispatch> object;
    require(get_class(class_id, IID_IClassFactory, factory.receive_untyped()), "DllGetClassObject");
    require(factory->CreateInstance(nullptr, IID_IDispatch, object.receive_untyped()), "CreateInstance");
  }
  const auto can_unload = function_of<HRESULT(WINAPI*)()>(module, "DllCanUnloadNow");
  if (can_unload != nullptr) can_unload();
  FreeLibrary(module);
  const double time = now_in_microseconds() - start;
  if (GetModuleHandleW(path) != nullptr) throw std::runtime_error(narrow(path) + " is still loaded");
  return time;
}

CLSID class_of(const wchar_t* program_id) {
  CLSID class_id;
  require(CLSIDFromProgID(program_id, &class_id), "CLSIDFromProgID");
  return class_id;
}

void compare_lives(const std::wstring& folder) {
  const std::wstring library = folder + L"\\TALUtil.dll";
  const CLSID file_system = class_of(L"Scripting.FileSystemObject");
  constexpr int repetitions = 31;
  std::vector<double> ours;
  std::vector<double> theirs;
  std::vector<double> ratios;
  // The first repetition warms up and is not counted.
  for (int i = 0; i <= repetitions; ++i) {
    const double mine = life_of_object(CLSID_ORVUtils, library.c_str());
    const double other = life_of_object(file_system, L"scrrun.dll");
    if (i == 0) continue;
    ours.push_back(mine);
    theirs.push_back(other);
    ratios.push_back(mine / other);
  }
  std::printf(
      "load, create, release, unload: TALUtil %.0f us, FileSystemObject %.0f us, ratio %.2f (goal: at most 1.00)\n",
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

void time_early_calls() {
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
  u->Terminate();
}

}  // namespace

int wmain(int, wchar_t** arguments) {
  CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
  int status = 0;
  try {
    compare_lives(arguments[1]);
    time_early_calls();
  } catch (const std::exception& error) {
    std::printf("FAILED: %s\n", error.what());
    status = 1;
  }
  CoUninitialize();
  return status;
}
