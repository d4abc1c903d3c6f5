#include "platform/profile_document.hpp"

#include <algorithm>

namespace talutil {

namespace {

constexpr std::string_view utf8_mark = "\xEF\xBB\xBF";
constexpr std::string_view utf16_mark = "\xFF\xFE";
constexpr TextView line_ends = u"\r\n";

constexpr bool is_blank(char16_t unit) noexcept {
  constexpr char16_t end_of_file_mark = 26;
  return (unit >= u'\t' && unit <= u'\r') || unit == u' ' || unit == end_of_file_mark;
}

TextView trim_start(TextView text) noexcept {
  const auto* const first = std::ranges::find_if_not(text, is_blank);
  text.remove_prefix(static_cast<std::size_t>(first - text.begin()));
  return text;
}

TextView trim(TextView text) noexcept {
  text = trim_start(text);
  while (!text.empty() && is_blank(text.back())) text.remove_suffix(1);
  return text;
}

bool is_name(TextView a, TextView b) noexcept { return equals_without_case(trim(a), trim(b)); }

/// The name between the brackets; empty if the line is not a header.
std::optional<TextView> header_name(TextView line) {
  line = trim(line);
  const std::size_t close = line.rfind(u']');
  if (!line.starts_with(u'[') || close == TextView::npos) return std::nullopt;
  return trim(line.substr(1, close - 1));
}

struct Item {
  TextView name;
  TextView value;
};

std::optional<Item> item_of(TextView line) {
  const std::size_t equals = line.find(u'=');
  if (equals == TextView::npos || trim_start(line).starts_with(u';')) return std::nullopt;
  return Item{trim(line.substr(0, equals)), up_to_nul(trim(line.substr(equals + 1)))};
}

TextView without_quotes(TextView value) {
  const bool is_quoted =
      value.size() >= 2 && (value.front() == u'"' || value.front() == u'\'') && value.front() == value.back();
  return is_quoted ? value.substr(1, value.size() - 2) : value;
}

/// Iterates over the lines in a range of a text. The empty lines that CR LF produces do no harm.
class Lines {
 public:
  Lines(TextView text, std::size_t begin, std::size_t end) : text_(text.substr(0, end)), next_(begin) {}

  bool advance() {
    if (next_ >= text_.size()) return false;
    begin_ = next_;
    end_ = std::min(text_.find_first_of(line_ends, begin_), text_.size());
    next_ = end_ + 1;
    return true;
  }

  [[nodiscard]] TextView line() const { return text_.substr(begin_, end_ - begin_); }
  [[nodiscard]] std::size_t begin() const noexcept { return begin_; }
  [[nodiscard]] std::size_t end() const noexcept { return end_; }

 private:
  TextView text_;
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  std::size_t next_;
};

}  // namespace

ProfileDocument::ProfileDocument(std::string_view bytes) {
  if (bytes.starts_with(utf8_mark)) {
    encoding_ = Encoding::utf8;
    text_ = from_utf8(bytes.substr(utf8_mark.size()));
  } else if (bytes.starts_with(utf16_mark)) {
    encoding_ = Encoding::utf16;
    text_ = from_utf16_bytes(bytes.substr(utf16_mark.size()));
  } else {
    text_ = from_ansi(bytes);
  }
}

std::string ProfileDocument::bytes() const {
  switch (encoding_) {
    case Encoding::utf8:
      return std::string(utf8_mark) + to_utf8(text_);
    case Encoding::utf16:
      return std::string(utf16_mark) + to_utf16_bytes(text_);
    case Encoding::ansi:
      break;
  }
  return to_ansi(text_);
}

std::optional<ProfileDocument::Section> ProfileDocument::find_section(TextView name) const {
  std::optional<Section> found;
  if (trim(name).empty()) found = Section{0, text_.size()};
  for (Lines lines(text_, 0, text_.size()); lines.advance();) {
    const auto header = header_name(lines.line());
    if (!header) continue;
    if (found) return Section{found->begin, lines.begin()};
    if (is_name(*header, name)) found = Section{lines.end(), text_.size()};
  }
  return found;
}

std::optional<Text> ProfileDocument::value(TextView section, TextView item) const {
  const auto found = find_section(up_to_nul(section));
  if (!found) return std::nullopt;
  for (Lines lines(text_, found->begin, found->end); lines.advance();) {
    const TextView line = trim(lines.line());
    if (!line.empty() && is_name(line, up_to_nul(item)))
      return std::nullopt;  // the first line with the name decides, with or without a value
    const auto candidate = item_of(line);
    if (candidate && is_name(candidate->name, up_to_nul(item))) return Text(without_quotes(candidate->value));
  }
  return std::nullopt;
}

std::vector<ProfileDocument::Entry> ProfileDocument::entries() const {
  std::vector<Entry> entries;
  TextView section;
  for (Lines lines(text_, 0, text_.size()); lines.advance();) {
    if (const auto header = header_name(lines.line())) {
      section = *header;
    } else if (const auto item = item_of(lines.line())) {
      entries.push_back({Text(section), Text(item->name), Text(without_quotes(item->value))});
    }
  }
  return entries;
}

std::vector<Text> ProfileDocument::item_names(TextView section) const {
  std::vector<Text> names;
  const auto found = find_section(up_to_nul(section));
  if (!found) return names;
  for (Lines lines(text_, found->begin, found->end); lines.advance();) {
    if (const auto item = item_of(lines.line())) names.emplace_back(item->name);
  }
  return names;
}

void ProfileDocument::put(TextView section, TextView item, TextView value) {
  section = trim(up_to_nul(section));
  item = trim(up_to_nul(item));
  const Text line_value(trim_start(up_to_nul(value)));
  const Text line = Text(item) + u'=' + line_value;
  const auto found = find_section(section);
  if (!found) {
    if (!text_.empty() && line_ends.find(text_.back()) == TextView::npos) text_ += u"\r\n";
    text_.append(u"[").append(section).append(u"]\r\n").append(line).append(u"\r\n");
    return;
  }
  std::size_t last_end = found->begin;  // end of the last line that is not blank
  for (Lines lines(text_, found->begin, found->end); lines.advance();) {
    if (trim(lines.line()).empty()) continue;
    last_end = lines.end();
    if (is_name(lines.line(), item)) {  // a name that had no value yet
      const auto name_size = static_cast<std::size_t>(trim(lines.line()).end() - lines.line().begin());
      text_.replace(lines.begin() + name_size, lines.line().size() - name_size, u"=" + line_value);
      return;
    }
    const auto candidate = item_of(lines.line());
    if (!candidate || !is_name(candidate->name, item)) continue;
    const TextView old_value = trim_start(lines.line().substr(lines.line().find(u'=') + 1));
    text_.replace(lines.end() - old_value.size(), old_value.size(), line_value);
    return;
  }
  // The section without a name may be empty, at the very start of the text.
  text_.insert(last_end, last_end == 0 ? line + u"\r\n" : u"\r\n" + line);
}

}  // namespace talutil
