#include "cli/arguments.hpp"

#include <algorithm>
#include <iterator>

#include "automation/late_call.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"

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
  for (std::size_t start = 0; !rest.empty() && start <= rest.size();) {
    const std::size_t end = std::min(rest.find(',', start), rest.size());
    list.items.push_back(utf8_text(rest.substr(start, end - start), "@list:"));
    start = end + 1;
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
    {"@list:", "@list:A,B,C", "an array of texts, from index 0", &read_list},
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
  Variant value = read_argument(typed, locale);
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
