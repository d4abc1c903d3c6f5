#pragma once

#include <functional>
#include <map>
#include <memory>
#include <set>
#include <string>

#include "calling/caller.hpp"
#include "calling/recorded_line.hpp"

namespace talutil::calling {

/// Repeats recorded calls and compares their answers with the recorded ones. Calls whose answer depends on the machine,
/// the time, files, windows or objects of the host are skipped and not made.
class Comparison {
 public:
  /// A started library for each process that was recorded.
  using StartLibrary = std::function<std::shared_ptr<Library>()>;

  explicit Comparison(StartLibrary start) : start_(std::move(start)) {}

  /// Repeats the call of a line. Returns the difference in words, empty if there is none. Fails with JsonError for a
  /// line that is no record.
  [[nodiscard]] std::string repeat(std::string_view line);

  [[nodiscard]] std::size_t compared() const noexcept { return compared_; }
  [[nodiscard]] std::size_t different() const noexcept { return different_; }

  /// How many calls were skipped, by reason.
  [[nodiscard]] const std::map<std::string, std::size_t, std::less<>>& skipped() const noexcept { return skipped_; }

 private:
  struct Process {
    std::shared_ptr<Library> library;
    std::unique_ptr<Caller> caller;
    /// A call has been skipped that may have changed settings; each is certain again from the next record of its value.
    bool has_skipped = false;
    std::set<std::string, std::less<>> certain;
  };

  Process& process(std::uint32_t number);

  /// If a record reads a setting that is uncertain, puts the recorded value instead of comparing it.
  static bool takes_recorded_setting(Process& process, const RecordedLine& record);
  std::string compare(const Process& process, std::string_view line, const RecordedLine& record);

  StartLibrary start_;
  std::map<std::uint32_t, Process> processes_;
  std::map<std::string, std::size_t, std::less<>> skipped_;
  std::size_t compared_ = 0;
  std::size_t different_ = 0;
};

}  // namespace talutil::calling
