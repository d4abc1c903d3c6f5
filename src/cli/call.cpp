#include <iostream>

#include "cli/calling.hpp"
#include "cli/commands.hpp"
#include "cli/entries.hpp"
#include "cli/json.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

/// A value for people to read: texts as they are, arrays with their texts in quotes.
std::string plain(const Variant& value, const Locale& locale) {
  switch (value.kind()) {
    case Variant::Kind::empty:
      return "Empty";
    case Variant::Kind::null:
      return "Null";
    case Variant::Kind::text_array:
      return value.get_if<TextArray>()->allocated ? json::value(value, locale) : "an array that holds nothing";
    case Variant::Kind::error:
    case Variant::Kind::foreign_array:
    case Variant::Kind::object:
      return "a value that has no text";
    default:
      return to_utf8(value.to_text(locale));
  }
}

void print_plain(const Member& member, const Variant& result, const std::vector<Argument>& arguments,
                 const Locale& locale) {
  if (member.result != ValueType::none) std::cout << plain(result, locale) << '\n';
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const Parameter& parameter = member.parameters()[i];
    if (parameter.passing != Passing::written_back) continue;
    std::cout << parameter.name << " = " << plain(arguments[i].value, locale) << '\n';
  }
}

void print_json(const Member& member, const Variant& result, const std::vector<Argument>& arguments,
                const Locale& locale) {
  std::vector<json::Field> written_back;
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    const Parameter& parameter = member.parameters()[i];
    if (parameter.passing != Passing::written_back) continue;
    written_back.emplace_back(parameter.name, json::value(arguments[i].value, locale));
  }
  std::cout << json::object({{"result", json::value(result, locale)}, {"arguments", json::object(written_back)}})
            << '\n';
}

}  // namespace

void call(const CallOptions& options) {
  Session session(options.code_page);
  const Entry entry = find_entry(Session::members().members, options.member);
  const Member& member = slot_for(entry, options.arguments.size());
  check_count(member, options.arguments.size());
  put_settings(session, options.settings);

  std::vector<Argument> arguments;
  const Variant result = call_slot(session, member, options.arguments, arguments);
  (options.json ? print_json : print_plain)(member, result, arguments, session.locale());
}

}  // namespace talutil::cli
