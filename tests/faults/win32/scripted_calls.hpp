#pragma once

#include <map>
#include <string>
#include <vector>

#include "platform/win32/windows.hpp"

namespace talutil::testing {

/// Answers the system's functions on files as a script says, for what the system does and Wine does not, and notes
/// those that replace files.
class ScriptedCalls {
 public:
  using Codes = std::map<std::string, std::vector<DWORD>>;

  /// @param codes the codes that the next calls of a function fail with, 0 for one that is made; later ones are made
  explicit ScriptedCalls(Codes codes = {});
  ScriptedCalls(const ScriptedCalls&) = delete;
  ScriptedCalls& operator=(const ScriptedCalls&) = delete;
  ~ScriptedCalls();

  /// The calls of FlushFileBuffers, of MoveFileExW with its flags, and of Sleep, each with "!" if it failed.
  [[nodiscard]] std::string log() const;

  /// Where files were created that did not exist.
  std::vector<std::wstring> created;

  /// The tags of reparse points that entries have, by name.
  std::map<std::wstring, DWORD> tags;

  void note(const std::string& call) { calls_.push_back(call); }
  [[nodiscard]] DWORD next_code(const std::string& name);

 private:
  Codes codes_;
  std::vector<std::string> calls_;
};

}  // namespace talutil::testing
