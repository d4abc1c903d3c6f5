#include <algorithm>
#include <charconv>
#include <limits>
#include <optional>

#include "automation/run_time_error.hpp"
#include "calling/system_time_fields.hpp"
#include "calling/value_forms.hpp"

namespace talutil::calling {

namespace {

struct Context {
  JsonReader& json;
  const ObjectNumbers& objects;
  const Locale& locale;
};

/// Whether a value may be a list; an element of one may not.
enum class Place : std::uint8_t { anywhere, in_list };

Variant read_any(const Context& context, Place place);

template <class Number>
std::optional<Number> parse(std::string_view digits) {
  Number value{};
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
  if (error != std::errc() || end != digits.data() + digits.size()) return {};
  return value;
}

template <class Whole>
Whole read_whole(JsonReader& json) {
  const std::string_view digits = json.read_number();
  const auto value = parse<Whole>(digits);
  if (value) return *value;
  json.fail("a whole number from " + std::to_string(std::numeric_limits<Whole>::min()) + " to " +
            std::to_string(std::numeric_limits<Whole>::max()) + " before this, not " + std::string(digits));
}

/// A floating-point number, or one of the words for those that JSON does not have.
template <class Floating>
Floating read_floating(JsonReader& json) {
  if (json.kind() == JsonReader::Kind::text) {
    Text word;
    json.read_text(word);
    if (word == u"nan") return std::numeric_limits<Floating>::quiet_NaN();
    if (word == u"inf") return std::numeric_limits<Floating>::infinity();
    if (word == u"-inf") return -std::numeric_limits<Floating>::infinity();
    json.fail("a number, \"inf\", \"-inf\" or \"nan\" before this");
  }
  const std::string_view digits = json.read_number();
  const auto value = parse<Floating>(digits);
  if (!value) json.fail("a smaller number before this: " + std::string(digits) + " is out of range");
  return *value;
}

/// A whole number is a Long if it fits; anything else is a double.
Variant read_plain_number(JsonReader& json) {
  const std::string_view digits = json.read_number();
  if (const auto whole = parse<std::int32_t>(digits)) return *whole;
  const auto value = parse<double>(digits);
  if (!value) json.fail("a smaller number before this: " + std::string(digits) + " is out of range");
  return *value;
}

template <class Value>
Variant read_flag(JsonReader& json, Value value) {
  if (!json.read_truth()) json.fail("true before this");
  return value;
}

/// The digits at fixed places of an ISO date; nothing if there are others or something else stands between them.
std::optional<DateParts> parts_of_text(TextView text) {
  constexpr TextView pattern = u"0000-00-00T00:00:00";
  if (text.size() != 10 && text.size() != 16 && text.size() != pattern.size()) return {};
  std::int32_t numbers[6] = {};
  std::size_t number = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (pattern[i] == u'0' && is_decimal_digit(text[i]))
      numbers[number] = numbers[number] * 10 + (text[i] - u'0');
    else if (text[i] == pattern[i] && pattern[i] != u'0')
      ++number;
    else
      return {};
  }
  return DateParts{numbers[0], numbers[1], numbers[2], numbers[3], numbers[4], numbers[5]};
}

Variant read_date(JsonReader& json) {
  Text text;
  json.read_text(text);
  const auto parts = parts_of_text(text);
  const auto date = parts ? date_from_parts(*parts) : std::nullopt;
  if (!date) json.fail("a date such as \"2009-03-31\" or \"2009-03-31T10:20:30\" before this");
  return *date;
}

Variant read_currency(JsonReader& json) {
  Text text;
  json.read_text(text);
  try {
    if (const auto value = text_to_currency(text, plain_numbers)) return *value;
  } catch (const RunTimeError&) {  // Too large for a currency, and as wrong as a text that is no number.
  }
  json.fail("a number in quotes that a currency can hold, such as \"1.25\", before this");
}

Variant read_record(JsonReader& json) {
  SystemTime time;
  Text key;
  json.begin_object();
  while (json.next_key(key)) {
    const auto* const field =
        std::ranges::find_if(system_time_fields, [&](const auto& known) { return known.key == key; });
    if (field == std::end(system_time_fields)) json.fail("a field of SYSTEMTIME, such as \"wYear\", before this");
    time.*field->field = read_whole<std::int16_t>(json);
  }
  return time;
}

Variant read_object(const Context& context) {
  if (context.json.kind() == JsonReader::Kind::null) {
    context.json.read_null();
    return ObjectRef();
  }
  const auto number = read_whole<std::int32_t>(context.json);
  ObjectRef object = context.objects.find(number);
  if (object == nullptr)
    context.json.fail("the number of an object before this: there is no object " + std::to_string(number));
  return object;
}

TextArray read_items(const Context& context) {
  TextArray list;
  if (context.json.kind() == JsonReader::Kind::null) {
    context.json.read_null();
    return list;
  }
  list.allocated = true;
  context.json.begin_array();
  while (context.json.next_element()) {
    const Variant item = read_any(context, Place::in_list);
    list.items.push_back(item.to_text(context.locale));
  }
  return list;
}

/// The form {"list": [...], "from": 1}, in this order, after its first key.
Variant read_list(const Context& context, Text& key) {
  TextArray list = read_items(context);
  if (!context.json.next_key(key)) return list;
  if (key != u"from") context.json.fail("\"from\" as the second key of a list");
  list.lower_bound = read_whole<std::int32_t>(context.json);
  if (context.json.next_key(key)) context.json.fail("nothing after \"from\"");
  return list;
}

struct Form {
  TextView name;
  Variant (*read)(const Context& context);
};

constexpr Form forms[] = {
    {u"empty", [](const Context& c) { return read_flag(c.json, Variant()); }},
    {u"missing", [](const Context& c) { return read_flag(c.json, missing_argument); }},
    {u"array", [](const Context& c) { return read_flag(c.json, ForeignArray()); }},
    {u"boolean", [](const Context& c) -> Variant { return Boolean::from_bits(read_whole<std::int16_t>(c.json)); }},
    {u"byte", [](const Context& c) -> Variant { return read_whole<std::uint8_t>(c.json); }},
    {u"integer", [](const Context& c) -> Variant { return read_whole<std::int16_t>(c.json); }},
    {u"long", [](const Context& c) -> Variant { return read_whole<std::int32_t>(c.json); }},
    {u"single", [](const Context& c) -> Variant { return read_floating<float>(c.json); }},
    {u"double", [](const Context& c) -> Variant { return read_floating<double>(c.json); }},
    {u"currency", [](const Context& c) { return read_currency(c.json); }},
    {u"date", [](const Context& c) { return read_date(c.json); }},
    {u"days", [](const Context& c) -> Variant { return Date{read_floating<double>(c.json)}; }},
    {u"error", [](const Context& c) -> Variant { return ErrorValue{read_whole<std::int32_t>(c.json)}; }},
    {u"system_time", [](const Context& c) { return read_record(c.json); }},
    {u"object", &read_object},
};

/// Forms of recordings, which stand for what they do not contain.
constexpr struct {
  TextView name;
  const char* reason;
} unavailable_forms[] = {{u"masked", "a masked text"}, {u"host_object", "an object of the host"}};

std::string names_of_forms() {
  std::string names;
  for (const Form& form : forms) names += to_utf8(form.name) + ", ";
  return names + "list";
}

/// The rest of a form after its first key.
Variant read_form(const Context& context, Text& key, Place place) {
  if (key == u"list" && place == Place::anywhere) return read_list(context, key);
  for (const auto& [name, reason] : unavailable_forms) {
    if (key == name) throw UnavailableValue(reason);
  }
  const auto* const form = std::ranges::find(forms, key, &Form::name);
  if (form == std::end(forms)) {
    context.json.fail("a value's form before this: {\"" + to_utf8(key) + "\": ...} is none" +
                      (place == Place::in_list ? " for an element" : "") + "; there are " + names_of_forms());
  }
  Variant value = form->read(context);
  if (context.json.next_key(key)) context.json.fail("a single key in a value's form");
  return value;
}

Variant read_any(const Context& context, Place place) {
  JsonReader& json = context.json;
  switch (json.kind()) {
    case JsonReader::Kind::text: {
      Text text;
      json.read_text(text);
      return text;
    }
    case JsonReader::Kind::number:
      return read_plain_number(json);
    case JsonReader::Kind::truth:
      return Boolean(json.read_truth());
    case JsonReader::Kind::null:
      json.read_null();
      return Null{};
    case JsonReader::Kind::array:
      if (place == Place::in_list) json.fail("an element that is no list itself");
      return read_items(context);
    case JsonReader::Kind::object: {
      Text key;
      json.begin_object();
      if (!json.next_key(key)) json.fail("a key in a value's form before this");
      return read_form(context, key, place);
    }
  }
  return {};
}

/// The variable of an earlier argument, after the key "same".
Argument read_same(JsonReader& json, const std::vector<Argument>& earlier) {
  const auto index = read_whole<std::int32_t>(json);
  Text key;
  if (json.next_key(key)) json.fail("a single key in a value's form");
  if (index < 0 || static_cast<std::size_t>(index) >= std::min<std::size_t>(earlier.size(), most_parameters)) {
    json.fail("the index of an earlier argument, counted from 0, before this, not " + std::to_string(index));
  }
  const Argument& first = earlier[static_cast<std::size_t>(index)];
  Argument argument(first.value);
  argument.same_variable_as = first.same_variable_as >= 0 ? first.same_variable_as : static_cast<std::int8_t>(index);
  return argument;
}

}  // namespace

Variant read_value(JsonReader& json, const ObjectNumbers& objects, const Locale& locale) {
  return read_any({json, objects, locale}, Place::anywhere);
}

void read_argument(JsonReader& json, const ObjectNumbers& objects, const Locale& locale,
                   std::vector<Argument>& arguments) {
  const Context context{json, objects, locale};
  if (json.kind() != JsonReader::Kind::object) {
    arguments.emplace_back(read_any(context, Place::anywhere));
    return;
  }
  Text key;
  json.begin_object();
  if (!json.next_key(key)) json.fail("a key in a value's form before this");
  if (key == u"same")
    arguments.push_back(read_same(json, arguments));
  else
    arguments.emplace_back(read_form(context, key, Place::anywhere));
}

}  // namespace talutil::calling
