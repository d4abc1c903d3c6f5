#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>

#include "automation/text.hpp"

namespace talutil::calling {

/// Bytes that are not what they should be. The message gives the byte, counted from 1, and what was expected there.
class JsonError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

/// Reads one JSON document piece by piece, in its order and without building a tree. Texts become UTF-16 directly;
/// escaped lone surrogates and NULs, which hosts' texts may contain, are kept. Does not copy: the bytes must outlive
/// the reader. Every function fails with JsonError for anything that JSON does not allow.
class JsonReader {
 public:
  enum class Kind : std::uint8_t { object, array, text, number, truth, null };

  explicit JsonReader(std::string_view bytes) noexcept : bytes_(bytes) {}

  /// The kind of the value that comes next.
  [[nodiscard]] Kind kind();

  /// Enters an object. `next_key` then reads each key, whose value must be read before the next, and returns false
  /// after the last.
  void begin_object();
  [[nodiscard]] bool next_key(Text& key);

  /// The same for an array: `next_element` returns whether there is another element, which must then be read.
  void begin_array();
  [[nodiscard]] bool next_element();

  void read_text(Text& text);

  /// A number as written: JSON's form of it has been checked.
  [[nodiscard]] std::string_view read_number();

  [[nodiscard]] bool read_truth();
  void read_null();

  /// Checks a value of any kind and returns its bytes.
  std::string_view skip_value();

  /// Fails unless the document ends here.
  void end();

  [[noreturn]] void fail(const std::string& expected) const;

 private:
  char next_character();
  void skip_white_space() noexcept;
  void take(char expected, const char* name);
  void take_word(std::string_view word);
  void take_digits();
  void read_escape(Text& text);
  [[nodiscard]] char16_t read_unit();
  void read_wide(Text& text);
  void skip_nested(int depth);

  std::string_view bytes_;
  std::size_t at_ = 0;
  bool is_first_ = false;  ///< Nothing has been read since the innermost object or array was entered.
  Text unused_;
};

}  // namespace talutil::calling
