#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// The text of a profile file, read and changed by the rules of Windows, for platforms without profile files of their
/// own. Unlike Windows, which rewrites the file, this changes a single line: comments, blank lines and the spelling of
/// everything else are kept.
///
/// - Lines end with CR, LF or both. White space and the end-of-file mark 26 are ignored around lines, names and values.
/// - A line that begins with "[" and contains "]" starts a section; its name extends to the last "]". Lines before the
///   first section belong to the section without a name. The first of several sections (or items) of one name counts.
/// - A line that begins with ";" is a comment; a line without "=" is not an item.
/// - A value in a pair of matching quotes, single or double, is returned without them.
class ProfileDocument {
 public:
  /// Takes the bytes of a file: code page 1252, or UTF-8 or UTF-16 (little-endian) with a byte order mark.
  explicit ProfileDocument(std::string_view bytes);

  [[nodiscard]] std::string bytes() const;

  [[nodiscard]] std::optional<Text> value(TextView section, TextView item) const;

  [[nodiscard]] std::vector<Text> item_names(TextView section) const;

  struct Entry {
    Text section;
    Text item;
    Text value;
    friend bool operator==(const Entry&, const Entry&) = default;
  };

  /// All items in file order, including those hidden by an earlier item of the same name.
  [[nodiscard]] std::vector<Entry> entries() const;

  /// Sets an item's value. Adds a new item at the end of its section and a new section at the end of the text. Blanks
  /// before the value are removed. Line breaks in the arguments are written as they are.
  void put(TextView section, TextView item, TextView value);

 private:
  enum class Encoding { ansi, utf8, utf16 };

  struct Section {
    std::size_t begin;  ///< The first character after its header
    std::size_t end;
  };

  [[nodiscard]] std::optional<Section> find_section(TextView name) const;

  Encoding encoding_ = Encoding::ansi;
  Text text_;
};

}  // namespace talutil
