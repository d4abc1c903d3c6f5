#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// The text of a profile file, read and changed as the Windows platform does it, for platforms that have no profile
/// files of their own. Where the platform writes a file anew, this changes one line: comments, blank lines and the
/// spelling of what stays are kept.
///
/// - Lines end with CR, LF or both. White space and the end-of-file mark 26 around lines, names and values do not
/// count.
/// - A line that begins with "[" and has a "]" starts a section, up to the last "]". Lines before the first section
/// belong
///   to the section without a name. Of two sections (or items) of one name the first counts.
/// - A line that begins with ";" is a comment, and one without "=" no item.
/// - A value in a pair of equal quotes, single or double, loses them.
class ProfileDocument {
 public:
  /// The bytes of a file: in code page 1252, or in UTF-8 or UTF-16 (low byte first) with the mark that says so.
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

  /// All items in the order of their lines, those that others of their name hide among them.
  [[nodiscard]] std::vector<Entry> entries() const;

  /// Puts an item's value, at the end of its section where it is new, and the section at the end of the text where that
  /// is new. Blanks before the value are left out. Line breaks in the arguments are written as they are.
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
