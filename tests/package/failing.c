#include <stddef.h>

// A library that cannot be registered.
long __stdcall DllRegisterServer(void) { return (long)0x80004005; }
long __stdcall DllUnregisterServer(void) { return 0; }
long __stdcall DllInstall(int install, const wchar_t* for_whom) {
  (void)for_whom;
  return install ? (long)0x80004005 : 0;
}
