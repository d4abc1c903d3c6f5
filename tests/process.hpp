#pragma once

#include <filesystem>
#include <string>
#include <vector>

#ifdef _WIN32
#include "platform/win32/handle.hpp"
#else
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>
#endif

namespace talutil::testing {

/// A process of a program, found by its path or as the system finds it, and its arguments. It ends with the object.
class Process {
 public:
  explicit Process(std::vector<std::string> words) {
#ifdef _WIN32
    std::wstring line;
    for (const std::string& word : words) line += L'"' + std::filesystem::path(word).wstring() + L"\" ";
    STARTUPINFOW startup{};
    startup.cb = sizeof startup;
    PROCESS_INFORMATION made{};
    if (CreateProcessW(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, nullptr, &startup, &made) == 0) return;
    CloseHandle(made.hThread);
    handle_ = made.hProcess;
#else
    std::vector<char*> arguments;
    for (std::string& word : words) arguments.push_back(word.data());
    arguments.push_back(nullptr);
    if (posix_spawnp(&number_, arguments[0], nullptr, nullptr, arguments.data(), environ) != 0) number_ = 0;
#endif
  }
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;
  ~Process() {
#ifdef _WIN32
    if (handle_ == nullptr) return;
    TerminateProcess(handle_, 1);
    WaitForSingleObject(handle_, INFINITE);
    CloseHandle(handle_);
#else
    if (number_ == 0) return;
    kill(number_, SIGKILL);
    waitpid(number_, nullptr, 0);
#endif
  }

#ifdef _WIN32
  [[nodiscard]] DWORD number() const { return GetProcessId(handle_); }
  [[nodiscard]] bool runs() const { return handle_ != nullptr && WaitForSingleObject(handle_, 0) == WAIT_TIMEOUT; }

 private:
  HANDLE handle_ = nullptr;
#else
  /// Does not wait for it, so that the number stays that of this process until the end.
  [[nodiscard]] bool runs() const {
    siginfo_t information{};
    return number_ != 0 && waitid(P_PID, static_cast<id_t>(number_), &information, WEXITED | WNOHANG | WNOWAIT) == 0 &&
           information.si_pid == 0;
  }

 private:
  pid_t number_ = 0;
#endif
};

}  // namespace talutil::testing
