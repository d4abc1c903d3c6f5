#include "cli/arguments.hpp"

#include <algorithm>
#include <iterator>

#include "automation/late_call.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "controls/delimited_text.hpp"

namespace talutil::cli {

namespace {

/// A written form: "@null" is complete, "@int:" is followed by more text.
struct WrittenForm {
  std::string_view opening;
  std::string_view example;
  std::string_view meaning;
  Variant (*read)(std::string_view rest, const Locale& locale);

  [[nodiscard]] bool fits(std::string_view typed) const {
    return opening.back() == ':' || opening == "@@" ? typed.starts_with(opening) : typed == opening;
  }
};

Variant read_list(std::string_view rest, const Locale& /*locale*/) {
  TextArray list;
  list.allocated = true;
  if (rest.find('"') != std::string_view::npos) {
    const auto rows = read_delimited(utf8_text(rest, "@list:"), u',');
    list.items = rows.front();
    return list;
  }
  for (std::size_t start = 0; !rest.empty() && start <= rest.size();) {
    const std::size_t end = std::min(rest.find(',', start), rest.size());
    list.items.push_back(utf8_text(rest.substr(start, end - start), "@list:"));
    start = end + 1;
  }
  return list;
}

Variant read_lines(std::string_view rest, const Locale& /*locale*/) {
  TextArray list;
  list.allocated = true;
  const Text text = utf8_text(read_bytes(std::string(rest)), std::string(rest));
  for (TextView left = text; !left.empty();) {
    TextView line = left.substr(0, left.find(u'\n'));
    left.remove_prefix(std::min(line.size() + 1, left.size()));
    if (line.ends_with(u'\r')) line.remove_suffix(1);
    list.items.emplace_back(line);
  }
  return list;
}

Text typed_text(std::string_view typed) { return utf8_text(typed, "the argument \"" + std::string(typed) + "\""); }

using View = std::string_view;
constexpr WrittenForm written_forms[] = {
    {"@null", "@null", "Null", [](View, const Locale&) -> Variant { return Null{}; }},
    {"@empty", "@empty", "Empty; an array that holds nothing yet", [](View, const Locale&) { return Variant(); }},
    {"@missing", "@missing", "an optional argument left out",
     [](View, const Locale&) -> Variant { return missing_argument; }},
    {"@int:", "@int:5", "a 32-bit whole number",
     [](View rest, const Locale& locale) -> Variant { return Variant(typed_text(rest)).to_int32(locale); }},
    {"@num:", "@num:1.5", "a double-precision number",
     [](View rest, const Locale& locale) -> Variant { return Variant(typed_text(rest)).to_double(locale); }},
    {"@date:", "@date:31/03/2009", "a date and time, day first",
     [](View rest, const Locale& locale) -> Variant { return Variant(typed_text(rest)).to_date(locale); }},
    {"@text:", "@text:5", "a text, even of digits",
     [](View rest, const Locale&) -> Variant { return typed_text(rest); }},
    {"@list:", "@list:A,B,C", "an array of texts, from index 0; a text with a comma in double quotes", &read_list},
    {"@lines:", "@lines:PATH", "an array of the lines of a file in UTF-8", &read_lines},
    {"@file:", "@file:PATH", "the text of a file in UTF-8",
     [](View rest, const Locale&) -> Variant { return utf8_text(read_bytes(std::string(rest)), std::string(rest)); }},
    {"@-", "@-", "the text of standard input, in UTF-8",
     [](View, const Locale&) -> Variant { return utf8_text(read_bytes("-"), "standard input"); }},
    {"@@", "@@x", "the text @x",
     [](View rest, const Locale&) -> Variant { return typed_text("@" + std::string(rest)); }},
};

struct TypeWords {
  std::string_view name;
  std::string_view how;
};

TypeWords type_words(ValueType type) noexcept {
  switch (type) {
    case ValueType::boolean:
      return {"a Boolean", "True, False or a number"};
    case ValueType::int16:
      return {"a whole number", "-32768 to 32767"};
    case ValueType::int32:
      return {"a whole number", "-2147483648 to 2147483647"};
    case ValueType::single:
      return {"a number", "a number such as 1.5"};
    case ValueType::date:
      return {"a date", "DD/MM/YYYY, DD/MM/YYYY HH:MM or HH:MM"};
    case ValueType::text:
      return {"a text", "the text itself, \"\" for an empty one"};
    case ValueType::variant:
      return {"a value", "a text, or a number; @text:5 for the text 5"};
    case ValueType::text_array:
      return {"a list", "@list:A,B,C, or @empty for an array that holds nothing yet"};
    default:
      return {};
  }
}

/// Converts a value to the parameter's type. Raises the errors of the conversion.
Variant converted(ValueType type, const Variant& value, const Locale& locale) {
  switch (type) {
    case ValueType::boolean:
      return convert<Boolean>(value, locale);
    case ValueType::int16:
      return convert<std::int16_t>(value, locale);
    case ValueType::int32:
      return convert<std::int32_t>(value, locale);
    case ValueType::single:
      return convert<float>(value, locale);
    case ValueType::date:
      return convert<Date>(value, locale);
    case ValueType::text:
      return convert<Text>(value, locale);
    case ValueType::text_array:
      return convert<TextArray>(value, locale);
    default:
      return value;
  }
}

/// What was typed for a parameter without a type: a number if it is written as the library writes that number, so that
/// its text is the same, otherwise a text.
Variant untyped(std::string_view typed, const Locale& locale) {
  const bool may_be_number = !typed.empty() && typed.find_first_not_of("+-.0123456789") == std::string_view::npos;
  Text text = typed_text(typed);
  if (!may_be_number) return text;
  try {
    const Variant number = Variant(text).to_double(locale);
    if (number.to_text(locale) != text) return text;
    const double value = *number.get_if<double>();
    const bool is_whole = typed.find('.') == std::string_view::npos && value >= -2147483648.0 && value <= 2147483647.0;
    return is_whole ? Variant(static_cast<std::int32_t>(value)) : number;
  } catch (const RunTimeError&) {
    return text;
  }
}

bool is_overflow(const RunTimeError& error) { return error.is(ErrorNumber::overflow); }

}  // namespace

Variant read_argument(std::string_view typed, const Locale& locale) {
  if (!typed.starts_with('@')) return typed_text(typed);
  const auto form = std::ranges::find_if(written_forms, [&](const WrittenForm& each) { return each.fits(typed); });
  const std::string shown = '"' + std::string(typed) + '"';
  if (form == std::end(written_forms)) {
    throw usage_failure(shown + " is not a written form; write \"@" + std::string(typed) +
                        "\" for the text, or one of:\n" + written_forms_help());
  }
  try {
    return form->read(typed.substr(form->opening.size()), locale);
  } catch (const RunTimeError& error) {
    throw usage_failure(shown + (is_overflow(error) ? " is out of range for " : " is not ") +
                        std::string(form->meaning) + "; write it like " + std::string(form->example));
  }
}

std::string written_forms_help() {
  constexpr std::size_t width = 18;
  std::string help;
  for (const WrittenForm& form : written_forms) {
    help += "  " + std::string(form.example) + std::string(width - form.example.size(), ' ');
    help += form.meaning;
    help += '\n';
  }
  help.pop_back();
  return help;
}

std::string_view how_to_write(ValueType type) noexcept { return type_words(type).how; }

Variant argument_for(const Parameter& parameter, std::string_view typed, const Locale& locale) {
  const bool is_untyped = parameter.type == ValueType::variant && !typed.starts_with('@');
  Variant value = is_untyped ? untyped(typed, locale) : read_argument(typed, locale);
  if (value == Variant(missing_argument)) {
    if (!parameter.is_optional) throw run_time_failure("is not optional; write a value for it");
    return value;
  }
  if (parameter.type == ValueType::system_time) {
    throw run_time_failure("a SYSTEMTIME record cannot be written on the command line");
  }
  try {
    return converted(parameter.type, value, locale);
  } catch (const RunTimeError& error) {
    const TypeWords words = type_words(parameter.type);
    throw run_time_failure('"' + std::string(typed) + "\" is " +
                           (is_overflow(error) ? "out of range" : "not " + std::string(words.name)) + "; write " +
                           std::string(words.how));
  }
}

}  // namespace talutil::cli
