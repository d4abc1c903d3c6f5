#include "platform/win32/windows.hpp"
#include "tests/faults/failing.hpp"
#include "tests/faults/win32/scripted_calls.hpp"

// The system's functions on files, in the place of the imported ones: calls go through pointers, which the linker takes
// from here rather than from the import libraries.

namespace talutil::testing {

namespace {

constinit ScriptedCalls* script = nullptr;

template <class Call>
DWORD failure() {
  return talutil::testing::failure<DWORD>(
      Call::codes, ERROR_IO_DEVICE, [](DWORD code) { return Call::name + std::string(": ") + std::to_string(code); });
}

template <class Result>
Result failed() {
  if constexpr (std::is_same_v<Result, HANDLE>)
    return INVALID_HANDLE_VALUE;
  else
    return Result{};
}

template <class Function>
Function* real(const char* name) {
  return reinterpret_cast<Function*>(reinterpret_cast<void*>(GetProcAddress(GetModuleHandleW(L"kernel32.dll"), name)));
}

/// Whether a call is refused whenever it is made.
template <class... Arguments>
bool is_refused(std::string_view name, const Arguments&... arguments) {
  if constexpr (sizeof...(Arguments) == 7) {  // CreateFileW.
    return FailingCall::refuses(Allowed::no_new_files) && std::get<4>(std::tie(arguments...)) == CREATE_NEW;
  }
  return FailingCall::refuses(Allowed::no_replacing) && name == "MoveFileExW";
}

template <class Function, class Call>
struct Watched;

template <class Result, class... Arguments, class Call>
struct Watched<Result(Arguments...), Call> {
  static Result call(Arguments... arguments) {
    static auto* const actual = real<Result(Arguments...)>(Call::name);
    const std::string_view name = Call::name;
    DWORD code = failure<Call>();
    if (code == 0 && is_refused(name, arguments...)) code = ERROR_ACCESS_DENIED;
    if (script != nullptr) code = follow_script(name, arguments...);
    if (code != 0) {
      SetLastError(code);
      return failed<Result>();
    }
    const Result result = actual(arguments...);
    if constexpr (std::is_same_v<std::tuple_element_t<sizeof...(Arguments) - 1, std::tuple<Arguments...>>,
                                 WIN32_FIND_DATAW*>) {
      if (script != nullptr) tag(*std::get<sizeof...(Arguments) - 1>(std::tie(arguments...)));
    }
    return result;
  }

 private:
  /// Notes a call. Returns the code that it is to fail with.
  static DWORD follow_script(std::string_view name, const Arguments&... arguments) {
    const auto all = std::tie(arguments...);
    std::string flags;
    if constexpr (std::is_same_v<std::tuple<Arguments...>, std::tuple<LPCWSTR, LPCWSTR, DWORD>>) {
      flags = "(" + std::to_string(std::get<2>(all)) + ")";
    }
    if constexpr (sizeof...(Arguments) == 7) {
      if (std::get<4>(all) == CREATE_NEW) script->created.emplace_back(std::get<0>(all));
    }
    const DWORD code = script->next_code(std::string(name));
    if (name == "FlushFileBuffers" || name == "MoveFileExW") {
      script->note(std::string(name) + flags + (code == 0 ? "" : "!"));
    }
    return code;
  }

  static void tag(WIN32_FIND_DATAW& entry) {
    const auto found = script->tags.find(entry.cFileName);
    if (found == script->tags.end()) return;
    entry.dwFileAttributes |= FILE_ATTRIBUTE_REPARSE_POINT;
    entry.dwReserved0 = found->second;
  }
};

/// The pauses between attempts, which need not be waited for.
void WINAPI no_sleep(DWORD milliseconds) {
  if (script != nullptr) script->note("Sleep(" + std::to_string(milliseconds) + ")");
}

}  // namespace

ScriptedCalls::ScriptedCalls(Codes codes) : codes_(std::move(codes)) { script = this; }

ScriptedCalls::~ScriptedCalls() { script = nullptr; }

DWORD ScriptedCalls::next_code(const std::string& name) {
  std::vector<DWORD>& codes = codes_[name];
  if (codes.empty()) return 0;
  const DWORD code = codes.front();
  codes.erase(codes.begin());
  return code;
}

std::string ScriptedCalls::log() const {
  std::string log;
  for (const std::string& call : calls_) log += (log.empty() ? "" : " ") + call;
  return log;
}

}  // namespace talutil::testing

// Some code of the run-time library calls the imported functions directly, through a jump that stands here as well.
#define IMPORTED_AS(name, pointer)                                                             \
  __attribute__((used)) auto* watched_##name asm("__imp_" #name) = &talutil::testing::pointer; \
  asm(".text\n.globl " #name "\n" #name ": jmp *__imp_" #name "(%rip)\n")
/// A function, and the codes that it can fail with, as documented.
#define WATCHED(function, ...)                                           \
  struct Watched##function {                                             \
    static constexpr const char* name = #function;                       \
    static constexpr std::initializer_list<DWORD> codes = {__VA_ARGS__}; \
  };                                                                     \
  IMPORTED_AS(function, Watched<decltype(function) COMMA Watched##function>::call)
#define COMMA ,

WATCHED(CreateFileW, ERROR_ACCESS_DENIED, ERROR_TOO_MANY_OPEN_FILES, ERROR_SHARING_VIOLATION);
WATCHED(ReadFile, ERROR_CRC, ERROR_LOCK_VIOLATION);
WATCHED(WriteFile, ERROR_DISK_FULL, ERROR_WRITE_FAULT);
WATCHED(FlushFileBuffers, ERROR_DISK_FULL, ERROR_IO_DEVICE);
WATCHED(MoveFileExW, ERROR_ACCESS_DENIED, ERROR_SHARING_VIOLATION, ERROR_IO_DEVICE);
WATCHED(DeleteFileW, ERROR_ACCESS_DENIED, ERROR_SHARING_VIOLATION);
WATCHED(CreateDirectoryW, ERROR_ACCESS_DENIED, ERROR_DISK_FULL);
WATCHED(GetFileSizeEx, ERROR_IO_DEVICE);
WATCHED(SetFilePointerEx, ERROR_IO_DEVICE);
WATCHED(SetEndOfFile, ERROR_DISK_FULL);
WATCHED(SetFileTime, ERROR_ACCESS_DENIED);
WATCHED(FindFirstFileW, ERROR_ACCESS_DENIED, ERROR_NOT_READY);
WATCHED(FindNextFileW, ERROR_IO_DEVICE);
WATCHED(LockFileEx, ERROR_LOCK_VIOLATION, ERROR_NOT_SUPPORTED);
IMPORTED_AS(Sleep, no_sleep);
