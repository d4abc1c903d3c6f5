#pragma once

#include <cstdint>
#include <exception>
#include <string>

/// The outcome of an operation on an archive. Hosts know these codes.
namespace talutil::archives {

enum class Code : std::int16_t {
  ok = 0,
  busy = 1,            ///< An action was started while another runs.
  unexpected_end = 2,  ///< The archive is cut off.
  bad_structure = 3,   ///< Not an archive, or a damaged one.
  out_of_memory = 4,
  internal = 5,
  entry_too_big = 6,  ///< Part of the published codes; never used.
  bad_comment = 7,    ///< A comment longer than 65,535 bytes.
  bad_test = 8,       ///< The test found damage.
  cancelled = 9,
  temporary_file = 10,  ///< The archive's folder is missing or does not accept new files.
  cannot_read = 11,
  nothing_to_do = 12,   ///< No file or entry matches.
  missing = 13,         ///< No archive name was given, or no such archive exists.
  cannot_write = 14,    ///< The disk is full.
  cannot_create = 15,   ///< The new file could not be given its name.
  bad_parameters = 16,  ///< An unknown action, or a password that is missing or wrong.
  incomplete = 17,      ///< Done, except for entries that were refused.
  cannot_open = 18,     ///< The archive exists, but is locked or not readable.
  bad_media = 19,       ///< A volume of a split set is missing or too short.
  bad_volume_size = 20,
  split_set_in_use = 21  ///< A split set cannot be added to.
};

/// The only exception that archive operations throw. The detail says what was wrong, for callers that can show it.
class Error : public std::exception {
 public:
  explicit Error(Code code, std::string detail = {}) : code_(code), detail_(std::move(detail)) {}

  [[nodiscard]] Code code() const noexcept { return code_; }
  [[nodiscard]] const char* what() const noexcept override { return detail_.c_str(); }

 private:
  Code code_;
  std::string detail_;
};

}  // namespace talutil::archives
