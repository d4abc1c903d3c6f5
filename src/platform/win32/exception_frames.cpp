#include "platform/win32/exception_frames.hpp"

#include <cstring>
#include <iterator>

#ifdef __i386__
#include <winternl.h>
#endif

namespace talutil::win32 {

#ifdef __i386__

extern "C" void __register_frame_info(const void* frames, void* object);
extern "C" void* __deregister_frame_info(const void* frames);

namespace {

// The unwinder's record of the tables: six words in this version of the compiler, plus some spare ones.
long object_of_frames[16];
const void* registered_frames = nullptr;

/// The section ".eh_frame"; the module's header truncates its name to eight characters.
const void* frames_of(HMODULE module) noexcept {
  const auto* const base = reinterpret_cast<const BYTE*>(module);
  const auto* const header =
      reinterpret_cast<const IMAGE_NT_HEADERS*>(base + reinterpret_cast<const IMAGE_DOS_HEADER*>(base)->e_lfanew);
  const IMAGE_SECTION_HEADER* section = IMAGE_FIRST_SECTION(header);
  for (int i = 0; i < header->FileHeader.NumberOfSections; ++i, ++section) {
    if (std::memcmp(section->Name, ".eh_fram", sizeof section->Name) == 0) return base + section->VirtualAddress;
  }
  return nullptr;
}

/// Whether the process has loaded the compiler's shared run time. Goes through the loader's own list, which does not
/// change while DllMain runs: GetModuleHandle may look for the file in every folder of the path to learn its full name.
bool is_shared_run_time_loaded() noexcept {
  constexpr wchar_t name[] = L"\\libgcc_s_dw2-1.dll";
  constexpr int length = std::size(name) - 1;
  // As NtCurrentTeb does, in which the compiler sees an access beyond an array.
  const PEB* process = nullptr;
  __asm__("movl %%fs:0x30, %0" : "=r"(process));
  const LIST_ENTRY& modules = process->Ldr->InMemoryOrderModuleList;
  for (const LIST_ENTRY* at = modules.Flink; at != &modules; at = at->Flink) {
    const UNICODE_STRING& path = CONTAINING_RECORD(at, LDR_DATA_TABLE_ENTRY, InMemoryOrderLinks)->FullDllName;
    const int units = path.Length / static_cast<int>(sizeof(wchar_t));
    if (units < length) continue;
    if (CompareStringOrdinal(path.Buffer + units - length, length, name, length, TRUE) == CSTR_EQUAL) return true;
  }
  return false;
}

}  // namespace

void register_exception_frames(HMODULE module) noexcept {
  if (!is_shared_run_time_loaded()) return;
  registered_frames = frames_of(module);
  if (registered_frames != nullptr) __register_frame_info(registered_frames, &object_of_frames);
}

void unregister_exception_frames() noexcept {
  if (registered_frames != nullptr) __deregister_frame_info(registered_frames);
  registered_frames = nullptr;
}

#else

void register_exception_frames(HMODULE /*module*/) noexcept {}
void unregister_exception_frames() noexcept {}

#endif

}  // namespace talutil::win32
