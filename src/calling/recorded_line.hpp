#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace talutil::calling {

/// How a recorded call or one of now ended, as bytes of its line.
struct Ending {
  std::string_view result;
  std::string_view error;
  std::string_view arguments;  ///< What was written back.
};

/// What a line of a recording says. Parts of the line are kept as its bytes, so the line must outlive it.
struct RecordedLine {
  std::string member;  ///< Empty for a creation or release.
  std::string create;  ///< The class of a created object, whose number is the result.
  std::int32_t release = 0;
  std::int32_t on = 0;  ///< 0 for the toolkit.
  std::uint32_t process = 0;
  std::string_view args;
  Ending ending;
};

/// Fails with JsonError for anything but a JSON object, and for numbers that are none.
[[nodiscard]] RecordedLine read_recorded_line(std::string_view line);

/// The number in {"object": 1}. Fails with JsonError for anything else.
[[nodiscard]] std::int32_t object_number_in(std::string_view result);

/// Whether two endings are the same, however they are laid out.
[[nodiscard]] bool same_ending(const Ending& a, const Ending& b);

}  // namespace talutil::calling
