#include "calling/recorded_line.hpp"

#include <algorithm>
#include <charconv>
#include <iterator>

#include "calling/json_reader.hpp"

namespace talutil::calling {

namespace {

template <class Number>
Number read_number(JsonReader& json) {
  const std::string_view digits = json.read_number();
  Number number{};
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), number);
  if (error != std::errc() || end != digits.data() + digits.size()) json.fail("a whole number before this");
  return number;
}

std::string read_name(JsonReader& json) {
  Text name;
  json.read_text(name);
  return to_utf8(name);
}

constexpr struct {
  TextView name;
  void (*read)(JsonReader& json, RecordedLine& line);
} keys[] = {
    {u"call", [](JsonReader& json, RecordedLine& line) { line.member = read_name(json); }},
    {u"create", [](JsonReader& json, RecordedLine& line) { line.create = read_name(json); }},
    {u"release", [](JsonReader& json, RecordedLine& line) { line.release = read_number<std::int32_t>(json); }},
    {u"on", [](JsonReader& json, RecordedLine& line) { line.on = read_number<std::int32_t>(json); }},
    {u"process", [](JsonReader& json, RecordedLine& line) { line.process = read_number<std::uint32_t>(json); }},
    {u"args", [](JsonReader& json, RecordedLine& line) { line.args = json.skip_value(); }},
    {u"result", [](JsonReader& json, RecordedLine& line) { line.ending.result = json.skip_value(); }},
    {u"error", [](JsonReader& json, RecordedLine& line) { line.ending.error = json.skip_value(); }},
    {u"arguments", [](JsonReader& json, RecordedLine& line) { line.ending.arguments = json.skip_value(); }},
};

/// JSON without the white space between its parts.
std::string compact(std::string_view json) {
  std::string result;
  bool is_in_text = false;
  for (std::size_t i = 0; i < json.size(); ++i) {
    const char c = json[i];
    if (c == '"') is_in_text = !is_in_text;
    if (is_in_text || (c != ' ' && c != '\t' && c != '\r')) result += c;
    if (is_in_text && c == '\\' && i + 1 < json.size()) result += json[++i];
  }
  return result;
}

}  // namespace

RecordedLine read_recorded_line(std::string_view line) {
  RecordedLine result;
  JsonReader json(line);
  Text name;
  json.begin_object();
  while (json.next_key(name)) {
    const auto* const key = std::ranges::find_if(keys, [&](const auto& known) { return known.name == name; });
    if (key == std::end(keys))
      json.skip_value();
    else
      key->read(json, result);
  }
  json.end();
  return result;
}

std::int32_t object_number_in(std::string_view result) {
  JsonReader json(result);
  Text key;
  json.begin_object();
  if (!json.next_key(key) || key != u"object") json.fail("the number of an object");
  return read_number<std::int32_t>(json);
}

bool same_ending(const Ending& a, const Ending& b) {
  const auto same = [](std::string_view one, std::string_view other) {
    return one == other || compact(one) == compact(other);
  };
  return same(a.result, b.result) && same(a.error, b.error) && same(a.arguments, b.arguments);
}

}  // namespace talutil::calling
