#include "cli/calling.hpp"

#include <algorithm>

#include "cli/arguments.hpp"
#include "cli/failure.hpp"
#include "cli/json.hpp"

namespace talutil::cli {

namespace {

std::string count_words(const Member& member) {
  const auto parameters = member.parameters();
  const auto required = std::ranges::count(parameters, false, &Parameter::is_optional);
  std::string words = std::to_string(required);
  if (static_cast<std::size_t>(required) < parameters.size()) words += " to " + std::to_string(parameters.size());
  words += parameters.size() == 1 ? " argument" : " arguments";
  std::string_view separator = " (";
  for (const Parameter& parameter : parameters) {
    words += separator;
    words += parameter.name;
    separator = ", ";
  }
  return parameters.empty() ? words : words + ")";
}

/// What a member was called with, for the report of its error: "iSt = 2, iEn = 1".
std::string called_with(const Member& member, const std::vector<std::string>& typed) {
  constexpr std::size_t longest = 40;
  std::string words;
  for (std::size_t i = 0; i < typed.size(); ++i) {
    words += (words.empty() ? "" : ", ") + std::string(member.parameters()[i].name) + " = ";
    words += json::text(std::string_view(typed[i]).substr(0, longest)) + (typed[i].size() > longest ? "..." : "");
  }
  return words;
}

void put_setting(Session& session, const std::string& written) {
  const std::size_t equals = written.find('=');
  if (equals == std::string::npos) {
    throw usage_failure("--set " + written + ": has no value; write --set " + written + "=VALUE");
  }
  const Entry entry = find_entry(Session::members().members, written.substr(0, equals));
  if (entry.is_method())
    throw usage_failure("--set " + written + ": " + std::string(entry.any().name) + " is a method");
  std::vector<Argument> arguments;
  call_slot(session, slot_for(entry, 1), {written.substr(equals + 1)}, arguments);
}

}  // namespace

void check_count(const Member& member, std::size_t count) {
  const auto parameters = member.parameters();
  const bool too_few = count < parameters.size() && !parameters[count].is_optional;
  if (!too_few && count <= parameters.size()) return;
  const std::string name(member.name);
  throw usage_failure(name + " takes " + count_words(member) + ", not " + std::to_string(count) +
                      "; see \"talutil help " + name + "\"");
}

const Member& slot_for(const Entry& entry, std::size_t argument_count) {
  if (entry.is_method()) return *entry.call;
  const std::string name(entry.any().name);
  if (argument_count == 0) {
    if (entry.get == nullptr) throw usage_failure(name + " can only be put; write its value after it");
    return *entry.get;
  }
  if (entry.put == nullptr) throw usage_failure(name + " can only be read; leave its value out");
  return *entry.put;
}

Variant call_slot(Session& session, const Member& member, const std::vector<std::string>& typed,
                  std::vector<Argument>& arguments) {
  check_count(member, typed.size());
  const std::string name(member.name);
  try {
    const Locale locale = session.locale();
    for (std::size_t i = 0; i < typed.size(); ++i) {
      const Parameter& parameter = member.parameters()[i];
      // A setting has only one value, so its name is enough.
      const std::string place = member.access == Access::put ? name : name + ": " + std::string(parameter.name);
      arguments.emplace_back(within(place, [&] { return argument_for(parameter, typed[i], locale); }));
    }
    return session.call(member, arguments);
  } catch (const RunTimeError& error) {
    const bool has_arguments = member.access == Access::call && !typed.empty();
    throw Failure(run_time_status,
                  name + ": " + error_words(error) + (has_arguments ? "; " + called_with(member, typed) : ""),
                  error.number());
  }
}

void put_settings(Session& session, const std::vector<std::string>& settings) {
  for (const std::string& setting : settings) put_setting(session, setting);
}

}  // namespace talutil::cli
