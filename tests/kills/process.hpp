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

/// Processes of this very program.
namespace talutil::testing {

#ifdef _WIN32

class Process {
 public:
  explicit Process(const std::vector<std::string>& arguments) {
    std::wstring path(MAX_PATH, L'\0');
    path.resize(GetModuleFileNameW(nullptr, path.data(), MAX_PATH));
    std::wstring line = L'"' + path + L'"';
    for (const std::string& argument : arguments) line += L" \"" + std::filesystem::path(argument).wstring() + L'"';
    STARTUPINFOW startup{};
    startup.cb = sizeof startup;
    PROCESS_INFORMATION made{};
    if (CreateProcessW(path.c_str(), line.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr, &startup, &made) == 0) {
      return;
    }
    CloseHandle(made.hThread);
    handle_ = made.hProcess;
  }
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;
  ~Process() {
    if (handle_ == nullptr) return;
    TerminateProcess(handle_, 1);
    WaitForSingleObject(handle_, INFINITE);
    CloseHandle(handle_);
  }

  [[nodiscard]] bool runs() const { return handle_ != nullptr && WaitForSingleObject(handle_, 0) == WAIT_TIMEOUT; }

 private:
  HANDLE handle_ = nullptr;
};

#else

class Process {
 public:
  explicit Process(const std::vector<std::string>& arguments) {
    static std::string path = std::filesystem::read_symlink("/proc/self/exe").string();
    std::vector<char*> words{path.data()};
    for (const std::string& argument : arguments) words.push_back(const_cast<char*>(argument.c_str()));
    words.push_back(nullptr);
    if (posix_spawn(&number_, path.c_str(), nullptr, nullptr, words.data(), environ) != 0) number_ = 0;
  }
  Process(const Process&) = delete;
  Process& operator=(const Process&) = delete;
  ~Process() {
    if (number_ == 0) return;
    kill(number_, SIGKILL);
    waitpid(number_, nullptr, 0);
  }

  /// Does not wait for it, so that the number stays that of this process until the end.
  [[nodiscard]] bool runs() const {
    siginfo_t information{};
    return number_ != 0 && waitid(P_PID, static_cast<id_t>(number_), &information, WEXITED | WNOHANG | WNOWAIT) == 0 &&
           information.si_pid == 0;
  }

 private:
  pid_t number_ = 0;
};

#endif

}  // namespace talutil::testing
