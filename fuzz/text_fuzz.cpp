// Checks members on any text against naive models of them. Build with clang and run:
//   text_fuzz -max_len=512 -max_total_time=60

#include <algorithm>
#include <cstdint>
#include <vector>

#include "automation/run_time_error.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::Input;
using fuzz::require;
using namespace std::string_view_literals;

/// An object of whose class the library knows nothing: its members call one another where others work in one pass.
struct Overridden final : ORVUtils {
  using ORVUtils::ORVUtils;
};

bool is_digit(int code) { return code >= '0' && code <= '9'; }

template <class Predicate>
bool any_code(TextView text, Predicate is_wanted) {
  return std::any_of(text.begin(), text.end(), [&](char16_t unit) { return is_wanted(ansi_code(unit)); });
}

/// The characters whose code answers yes.
template <class Predicate>
Text kept(Text text, Predicate keep) {
  std::erase_if(text, [&](char16_t unit) { return !keep(ansi_code(unit)); });
  return text;
}

Text replaced(TextView text, char16_t from, TextView to) {
  Text result;
  for (const char16_t unit : text) {
    if (ansi_code(unit) == ansi_code(from))
      result += to;
    else
      result += unit;
  }
  return result;
}

/// Each kind of character that a member tells from others, at its edges, and others that count as one of them.
constexpr TextView edges =
    u"/09:@AZ[`az{ ,.-'\"\t\r\n&#<>?\u00B4\u20AC\u2032\uFF03\u2003\u2085\uFF21\u0100\u0416\u4E2D\0"sv;

void check_characters(ORVUtils& utils, Input& input) {
  const char16_t one = input.one_of(edges);
  const Text to = input.word(edges, 2);
  Text text = input.byte() % 2 == 0 ? input.text(70) : input.word(u"0123456789ABC.Z", 12);
  // Long texts are searched in blocks.
  const std::int32_t repeats = input.whole(0, 16);
  for (Text once = text; text.size() < once.size() * static_cast<std::size_t>(repeats);) text += once;

  require(utils.StringReplace(text, Text(1, one) + to, to) == replaced(text, one, to), "StringReplace");
  require(utils.CRLFStringReplace(text, u"-") == replaced(replaced(text, u'\r', u"-"), u'\n', u"-"),
          "CRLFStringReplace");
  require(utils.StripNulls(text) == text.substr(0, text.find(u'\0')), "StripNulls");
  require(utils.RemoveNumberFromString(text) == kept(text, [](int code) { return code >= 'A'; }),
          "RemoveNumberFromString");
  Text character;
  const auto without = [&](std::int16_t kind) { return utils.RemoveStringsFromNumber(kind, text, character); };
  require(without(0) == kept(text, is_digit), "RemoveStringsFromNumber 0");
  require(without(1) == kept(text, [](int code) { return is_digit(code) || code == ' '; }),
          "RemoveStringsFromNumber 1");
  require(without(3) == kept(text, [](int code) { return is_digit(code) || code == '.'; }),
          "RemoveStringsFromNumber 3");
  character = one;
  Text others = text;
  std::erase(others, one);
  require(without(2) == others, "RemoveStringsFromNumber 2");
  require(utils.ReverseString(text) == Text(text.rbegin(), text.rend()), "ReverseString");
  require(bool(utils.NumbersInString(text)) == any_code(text, is_digit), "NumbersInString");
  const auto is_not_of_a_number = [](int code) { return !is_digit(code) && code != '.'; };
  require(bool(utils.IsValueNumber(text)) == (!text.empty() && !any_code(text, is_not_of_a_number)), "IsValueNumber");
  const auto is_not_of_a_password = [](int code) { return !is_digit(code) && (code < 'A' || code > 'Z'); };
  require(bool(utils.VerifyPasswordText(text)) == !any_code(text, is_not_of_a_password), "VerifyPasswordText");
}

void check_words(ORVUtils& utils, Input& input) {
  const Text word = input.word(input.byte() % 2 == 0 ? u"ab" : u"ab\r", 12);
  const auto part = [&] { return static_cast<std::size_t>(input.whole(0, static_cast<std::int32_t>(word.size()))); };
  // Half of the texts nearly have the word, where a search must fall back to a shorter beginning of it.
  const Text text = input.byte() % 2 == 0 ? word.substr(0, part()) + word.substr(part()) + word + input.text(70)
                                          : input.word(u"ab\r", 16);
  const Text to = input.word(u"abA", 3);
  Text expected = text;
  for (std::size_t at = 0; !word.empty() && (at = expected.find(word, at)) != Text::npos; at += to.size()) {
    expected.replace(at, word.size(), to);
  }
  require(utils.StringReplaceWord(text, word, to) == expected, "StringReplaceWord");

  // A marker stands for a line break, and the character after it for nothing; one at the end stays behind it.
  Text restored;
  for (std::size_t at = 0; at < text.size(); ++at) {
    restored += text[at] == u'a' ? u"\r\n" : Text(1, text[at]);
    if (text[at] == u'a' && ++at == text.size()) restored += u'a';
  }
  require(utils.StringRestoreCRLF(text, u"a") == restored, "StringRestoreCRLF");
}

/// A list taken apart: where each delimiter is, and the fields that they close; what comes after the last is none.
struct Fields {
  Fields(TextView list, char16_t delimiter) {
    for (std::size_t start = 0, at = 0; (at = list.find(delimiter, start)) != TextView::npos; start = at + 1) {
      positions.push_back(static_cast<std::int32_t>(at) + 1);
      texts.emplace_back(list.substr(start, at - start));
    }
  }
  std::vector<std::int32_t> positions;
  std::vector<Text> texts;
};

void check_list(ORVUtils& utils, Input& input) {
  const Text list = input.byte() % 2 == 0 ? input.text(255) : input.word(u"Aa,,;", 12);
  const char16_t separator = input.one_of(u",;"sv);
  const Text delimiter(1, separator);
  const Text wanted = input.word(u"Aa", 2);
  const Fields fields(list, separator);
  const auto count = static_cast<std::int32_t>(fields.texts.size());
  require(utils.SubStrCount(delimiter, list) == count, "SubStrCount");
  for (std::int32_t n = 1; n <= count + 1; ++n) {
    const std::int32_t place = n <= count ? fields.positions[static_cast<std::size_t>(n - 1)] : 0;
    require(utils.MyPos(delimiter, list, n) == place, "MyPos");
  }
  const bool is_there = std::find(fields.texts.begin(), fields.texts.end(), wanted) != fields.texts.end();
  require(bool(utils.MyInstrDelim(wanted, list, delimiter)) == is_there, "MyInstrDelim");

  const TextArray before = input.byte() % 2 == 0 ? TextArray{} : TextArray{{u"1", u"2", u"3"}, 0, true};
  TextArray read = before;
  require(utils.ReadCommaDelimStrToList(list, read, delimiter) == count, "the count of ReadCommaDelimStrToList");
  require(read == (count == 0 ? before : TextArray{fields.texts, 0, true}), "ReadCommaDelimStrToList");
  const auto found = std::find_if(fields.texts.begin(), fields.texts.end(), [&](TextView field) {
    return upper_case(field).starts_with(upper_case(TextView(wanted)));
  });
  const auto index = found == fields.texts.end() ? -1 : found - fields.texts.begin();
  require(count == 0 || utils.IndexInList(read, wanted) == index, "IndexInList");
  if (separator != u',') return;
  Text joined;
  const std::int32_t first = input.whole(0, count);
  for (std::int32_t end = first + 1; end <= count; ++end) {
    joined += fields.texts[static_cast<std::size_t>(end - 1)];
    require(utils.GetData(list, first, end) == joined, "GetData");
    joined += u',';
  }
  require(utils.GetData(list, first, count + 1).empty(), "GetData behind the last comma");
}

void require_verified(ORVUtils& utils, std::int16_t width, std::int16_t extras, const Text& text, TextView expected) {
  require(utils.VerifyTextData(width, extras, text) == expected, "VerifyTextData");
  require(Overridden(utils.library()).VerifyTextData(width, extras, text) == expected, "VerifyTextData of calls");
}

/// The cleaning, character by character.
Text cleaned(TextView text, std::int16_t extras) {
  Text result;
  for (const char16_t unit : trim_blanks(text)) {
    const int code = ansi_code(unit);
    if (unit == 0) break;
    if (code == '&')
      result += u"and";
    else if (code == '\'')
      result += u'\u00B4';
    else if (u"\"\t#><?"sv.find(static_cast<char16_t>(code)) == TextView::npos &&
             !(code == ',' && (extras == 1 || extras == 3)) && !(code == ' ' && (extras == 2 || extras == 3)))
      result += unit;
  }
  return result;
}

void check_cleaning(ORVUtils& utils, Input& input) {
  const auto extras = static_cast<std::int16_t>(input.whole(-1, 3));
  const auto width = static_cast<std::int16_t>(input.whole(-3, 9));
  const Text text = input.byte() % 2 == 0 ? input.text(255) : input.word(edges, 12);
  const Text whole = cleaned(text, extras);
  require_verified(utils, width, extras, text, width > 0 ? whole.substr(0, static_cast<std::size_t>(width)) : whole);
  Overridden calling(utils.library());
  require(utils.VerifyMemField(text) == calling.VerifyMemField(text), "VerifyMemField of calls");
  const Text address = input.word(u"ab  1", 14);
  require(utils.StringPosition(address, 1) == calling.StringPosition(address, 1), "StringPosition of calls");
  try {
    (void)utils.VerifyIntData(0, text);
  } catch (const RunTimeError& error) {
    require(error.number() == 6, "a text with a number too large is an overflow");
  }
}

/// Marked lines are dropped, the last three others kept; one below 40 is joined to the one before it where both are
/// below 73 together.
std::vector<Text> kept_lines(std::vector<Text> lines) {
  std::vector<Text> kept;
  for (; !lines.empty() && kept.size() < 3; lines.pop_back()) {
    Text line = lines.back();
    if (line.empty()) continue;
    if (lines.size() > 1 && line.size() < 40) {
      Text& before = lines[lines.size() - 2];
      if (!before.empty() && line.size() + before.size() < 73) {
        line.insert(0, before + u" - ");
        before.clear();
      }
    }
    kept.insert(kept.begin(), line);
  }
  return kept;
}

Text in_lines(const std::vector<Text>& lines) {
  Text text;
  for (const Text& line : lines) text.append(line).append(u"\r\n");
  return text;
}

/// Lines of lengths near those that decide, some marked, some with blanks around.
Text text_of_lines(Input& input) {
  constexpr std::size_t lengths[] = {0, 0, 1, 31, 32, 33, 34, 38, 39, 40, 41, 71, 72};
  Text text;
  for (char16_t letter = u'a'; letter <= u'g'; ++letter) {
    const Text line(input.one_of(lengths), letter);
    text += (input.whole(0, 3) == 0 ? u" " + line + u"  " : line) + (input.whole(0, 7) == 0 ? u"$*$ " : u"");
    if (input.whole(0, 7) == 0) break;
    text += u"\r\n";
  }
  return text;
}

void check_lines(ORVUtils& utils, Input& input) {
  const Text text = input.byte() % 4 == 0 ? input.text(255) : text_of_lines(input);
  if (trim_blanks(text).empty()) return;
  std::vector<Text> unmarked;
  std::vector<Text> candidates;
  const Text rest = cleaned(text, 0) + u"\r\n";
  for (std::size_t start = 0, end = 0; (end = rest.find(u"\r\n", start)) != Text::npos; start = end + 2) {
    const Text line = rest.substr(start, end - start);
    const bool is_marked = line.find(u"$*$") != Text::npos;
    candidates.emplace_back(is_marked ? u"" : trim_blanks(line));
    if (!is_marked) unmarked.push_back(candidates.back());
  }
  require_verified(utils, 0, 5, text, in_lines(unmarked));
  require_verified(utils, 0, 4, text, in_lines(kept_lines(candidates)));
}

void check(Input input) {
  static fuzz::Host host;
  constexpr void (*checks[])(ORVUtils&, Input&) = {&check_characters, &check_words, &check_list, &check_cleaning,
                                                   &check_lines};
  input.one_of(checks)(host.utils(), input);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace std::string_view_literals;
  talutil::check({data, size, u"aab ,&\"'\t#><?\r\n$*|\0\u2032\u0416\u00B4"sv});
  return 0;
}
