#pragma once

#include <string>

#include "automation/run_time_error.hpp"
#include "calling/value_forms.hpp"

namespace talutil::calling {

/// A call as a recording keeps it: the request as "talutil batch" reads it, and the answer. Passwords and texts to be
/// encrypted are masked: {"masked": true} stands for them.
class CallRecord {
 public:
  /// What is recorded with each call besides.
  struct Origin {
    std::uint32_t process = 0;  ///< Objects are numbered by process.
    std::int32_t object = 0;    ///< The number of the object; 0 for a toolkit.
  };

  /// Notes the arguments before the call. The member and the numbers must outlive the record.
  CallRecord(const Origin& origin, const Member& member, std::span<const Argument> arguments, ObjectNumbers& objects);

  /// Notes how the call ended, once, with the arguments after it.
  void succeed(const Variant& result, std::span<const Argument> arguments);
  void fail(const RunTimeError& error, std::span<const Argument> arguments);

  /// The line, with its line break.
  [[nodiscard]] std::string line(std::int64_t microseconds) &&;

 private:
  void append_arguments(std::span<const Argument> arguments);
  void append_written_back(std::span<const Argument> arguments);

  const Member& member_;
  ObjectNumbers& objects_;
  std::string line_;
  bool masks_result_ = false;
};

/// The lines for an object that a host has created or released.
[[nodiscard]] std::string creation_line(std::uint32_t process, std::string_view class_name, std::int32_t object);
[[nodiscard]] std::string release_line(std::uint32_t process, std::int32_t object);

/// Appends the error of an answer: its number, description and source.
void append_error(std::string& out, const RunTimeError& error);

/// Appends the arguments that are written back, under their names, if there are any.
void append_written_back(std::string& out, const Member& member, std::span<const Argument> arguments,
                         ObjectNumbers& objects);

}  // namespace talutil::calling
