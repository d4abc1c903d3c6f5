#include <iostream>

#include "cli/arguments.hpp"
#include "cli/calling.hpp"
#include "cli/entries.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

struct CallOptions {
  std::string member;
  std::vector<std::string> arguments;
  std::vector<std::string> settings;  ///< NAME=VALUE, put in order before the call.
  std::optional<std::uint32_t> code_page;
  bool json = false;
};

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

}  // namespace

void add_call(CLI::App& app, Work& work, const std::vector<std::string>& verbatim) {
  const auto options = std::make_shared<CallOptions>();
  auto* const command = app.add_subcommand("call", "Call a method, or read or change a setting: MEMBER [ARGUMENT]...");
  // Whatever is not one of our options is an argument, in order: "-1" and "-x" need no preceding "--".
  command->allow_extras();
  command->set_help_flag("--help", "Print this help message and exit");
  command->add_option("MEMBER", options->member, "The member's name, in any case")->required();
  add_settings(*command, options->settings, "Change a setting before the call; may be repeated");
  add_code_page(*command, options->code_page, "used to compare characters");
  command->add_flag("--json", options->json, "Print {\"result\": ..., \"arguments\": {...}}");
  command->footer(
      "Arguments are texts as typed, and are converted to the parameter's type. For values without a text form:\n" +
      written_forms_help() +
      "\n\"--\" ends the options: whatever follows is an argument, even --json.\n"
      "Dates are typed and printed day first: talutil call IncMonth 31/03/2009 -1");
  choose(*command, work, options, [command, &verbatim](CallOptions& chosen) {
    chosen.arguments = command->remaining();
    chosen.arguments.insert(chosen.arguments.end(), verbatim.begin(), verbatim.end());
    call(chosen);
  });
}

}  // namespace talutil::cli
