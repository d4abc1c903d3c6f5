#include <algorithm>
#include <iostream>

#include "cli/arguments.hpp"
#include "cli/calling.hpp"
#include "cli/entries.hpp"
#include "cli/failure.hpp"
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
  bool result_only = false;  ///< Leaves out what is written back.
  bool test = false;         ///< The exit status tells whether the answer is True.
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
  std::vector<json::Field> fields;
  if (member.result != ValueType::none) fields.emplace_back("result", json::value(result, locale));
  fields.emplace_back("arguments", json::object(written_back));
  std::cout << json::object(fields) << '\n';
}

/// The exit status for an answer that is asked for as a test.
int test_status(const Member& member, const Variant& result) {
  const auto* const answer = result.get_if<Boolean>();
  if (answer == nullptr) {
    throw usage_failure("--test: " + std::string(member.name) + " does not answer True or False; leave --test out");
  }
  return *answer ? 0 : false_status;
}

int call(const CallOptions& options) {
  Session session(options.code_page);
  // Unlike a batch or an archive's password, nothing but the answers to the member's boxes is read from there. After an
  // argument that was (@-), nothing is left.
  session.platform().terminal.take_piped_answers();
  const Entry entry = find_entry(Session::members().members, options.member);
  const Member& member = slot_for(entry, options.arguments.size());
  check_count(member, options.arguments.size());
  if (std::ranges::count(options.arguments, "@-") > 1) {
    throw usage_failure("@- is standard input, which can be read only once; give the other argument as @file:PATH");
  }
  put_settings(session, options.settings);

  std::vector<Argument> arguments;
  const Variant result = call_slot(session, member, options.arguments, arguments);
  if (member.access == Access::put) {
    warn(std::string(member.name) + " is set for this command only; to set it for another member: talutil call --set " +
         std::string(member.name) + "=VALUE MEMBER");
  }
  if (options.test) return test_status(member, result);
  if (options.result_only) arguments.clear();
  (options.json ? print_json : print_plain)(member, result, arguments, session.locale());
  return 0;
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
  add_json(*command, options->json, "Print {\"result\": ..., \"arguments\": {...}}");
  command->add_flag("--result", options->result_only, "Print the result alone, not what is written back");
  command->add_flag("--test", options->test, "Print nothing: exit code 0 for True, 3 for False");
  command->footer(
      "Arguments are texts as typed, and are converted to the parameter's type. For a Variant, a number that is typed\n"
      "as the library would print it (5, -1.5, but not 007) is a number. For values without a text form:\n" +
      written_forms_help() +
      "\n\"--\" ends the options: whatever follows is an argument, even --json.\n"
      "Boxes that the member shows are answered at the terminal or by the lines of\n"
      "standard input, and are closed at its end:\n"
      "  echo YES | talutil call CheckDeleteRecord\n"
      "Dates are typed and printed day first: talutil call IncMonth 31/03/2009 -1");
  choose(*command, work, options, [command, &verbatim](CallOptions& chosen) {
    chosen.arguments = command->remaining();
    chosen.arguments.insert(chosen.arguments.end(), verbatim.begin(), verbatim.end());
    return call(chosen);
  });
}

}  // namespace talutil::cli
