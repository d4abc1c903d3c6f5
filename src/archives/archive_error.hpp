#pragma once

#include <cstdint>
#include <exception>
#include <string>

/// How work on an archive ends. The codes are those that hosts know.
namespace talutil::archives {

enum class Code : std::int16_t {
  ok = 0,
  busy = 1,            ///< An action was started while another runs.
  unexpected_end = 2,  ///< The archive is cut off.
  bad_structure = 3,   ///< No archive, or a damaged one.
  out_of_memory = 4,
  internal = 5,
  entry_too_big = 6,  ///< Kept for hosts; nothing gives it.
  bad_comment = 7,    ///< A comment above 65,535 bytes.
  bad_test = 8,       ///< The test found damage.
  cancelled = 9,
  temporary_file = 10,  ///< The archive's folder is missing, or takes no new file.
  cannot_read = 11,
  nothing_to_do = 12,   ///< No file or entry matches.
  missing = 13,         ///< No name of an archive, or there is none of that name.
  cannot_write = 14,    ///< The disk is full.
  cannot_create = 15,   ///< A file cannot take its name.
  bad_parameters = 16,  ///< An unknown action, or a password that is missing or wrong.
  incomplete = 17,      ///< Done but for entries that were refused.
  cannot_open = 18,     ///< There is an archive, but it is locked or may not be read.
  bad_media = 19,       ///< A volume of a split set is missing or too short.
  bad_volume_size = 20,
  split_set_in_use = 21  ///< A split set cannot be added to.
};

/// The one way that work on archives fails. The detail says what was wrong, for those who can show it.
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
