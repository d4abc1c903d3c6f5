#include "calling/request.hpp"

#include <algorithm>

#include "automation/run_time_error.hpp"

namespace talutil::calling {

namespace {

struct Source {
  JsonReader& json;
  const ObjectNumbers& objects;
  const Locale& locale;
};

Text read_name(JsonReader& json) {
  Text name;
  json.read_text(name);
  return name;
}

std::int32_t read_object_number(const Source& source) {
  const Variant value = read_value(source.json, source.objects, source.locale);
  const auto* const number = value.get_if<std::int32_t>();
  if (number == nullptr) source.json.fail("the number of an object before this");
  return *number;
}

void read_settings(const Source& source, Request& request) {
  Text name;
  source.json.begin_object();
  while (source.json.next_key(name)) {
    request.settings.emplace_back(name, read_value(source.json, source.objects, source.locale));
  }
}

void read_arguments(const Source& source, Request& request) {
  source.json.begin_array();
  while (source.json.next_element()) {
    read_argument(source.json, source.objects, source.locale, request.arguments);
  }
}

void skip(const Source& source, Request& /*request*/) { source.json.skip_value(); }

constexpr struct {
  TextView name;
  void (*read)(const Source& source, Request& request);
} keys[] = {
    {u"call", [](const Source& s, Request& r) { r.call = read_name(s.json); }},
    {u"args", &read_arguments},
    {u"id", [](const Source& s, Request& r) { r.id = s.json.skip_value(); }},
    {u"on", [](const Source& s, Request& r) { r.on = read_object_number(s); }},
    {u"set", &read_settings},
    {u"create", [](const Source& s, Request& r) { r.create = read_name(s.json); }},
    {u"release", [](const Source& s, Request& r) { r.release = read_object_number(s); }},
    // The answer, in a recording.
    {u"result", &skip},
    {u"arguments", &skip},
    {u"error", &skip},
    {u"microseconds", &skip},
    {u"process", &skip},
};

constexpr std::size_t request_keys = 7;

std::string names_of_keys() {
  std::string names;
  for (std::size_t i = 0; i < request_keys; ++i) names += (i == 0 ? "" : ", ") + to_utf8(keys[i].name);
  return names;
}

}  // namespace

void Request::clear() {
  id = {};
  call.reset();
  create.reset();
  release.reset();
  on.reset();
  arguments.clear();
  settings.clear();
}

void read_request(JsonReader& json, const ObjectNumbers& objects, const Locale& locale, Request& request) {
  const Source source{json, objects, locale};
  Text name;
  json.begin_object();
  while (json.next_key(name)) {
    const auto* const key = std::ranges::find_if(keys, [&](const auto& known) { return known.name == name; });
    if (key == std::end(keys)) {
      json.fail("a key of a call before this: \"" + to_utf8(name) + "\" is none; there are " + names_of_keys());
    }
    key->read(source, request);
  }
  json.end();
  const int actions =
      int{request.call.has_value()} + int{request.create.has_value()} + int{request.release.has_value()};
  if (actions > 1 || (actions == 0 && request.settings.empty())) {
    throw JsonError("a line needs exactly one of \"call\", \"create\" and \"release\", or \"set\"");
  }
}

}  // namespace talutil::calling
