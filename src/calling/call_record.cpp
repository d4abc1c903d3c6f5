#include "calling/call_record.hpp"

#include <algorithm>

#include "calling/json_writer.hpp"
#include "library/identity.hpp"

namespace talutil::calling {

namespace {

/// What is secret about a member: the argument with this index, and the result.
struct Secret {
  std::string_view member;
  std::size_t argument;
  bool result;
};

constexpr std::size_t no_argument = most_parameters;

constexpr Secret secrets[] = {
    {"CryptoEncryptString", 0, true},
    {"CryptoDecryptString", 0, true},
    {"VerifyPasswordText", 0, false},
    {"GenerateFilePassword", no_argument, true},
    {"CallZIPFiles", 3, false},
    {"MyInputBox", no_argument, true},
    {"Password", 0, true},  // Of the zip controls.
};

const Secret* secret_of(const Member& member) {
  const auto* const found = std::ranges::find(secrets, member.name, &Secret::member);
  return found == std::end(secrets) ? nullptr : found;
}

/// An input box is secret only if it shows asterisks.
bool masks_result(const Member& member, std::span<const Argument> arguments) {
  const Secret* const secret = secret_of(member);
  if (secret == nullptr || !secret->result) return false;
  constexpr std::size_t password = 2;
  if (secret->argument != no_argument || member.name != "MyInputBox") return true;
  return arguments.size() > password && arguments[password].value != Variant(Boolean(false));
}

void append_masked(std::string& out) { out += "{\"masked\": true}"; }

void append_process(std::string& out, std::uint32_t process) {
  out += "{\"process\": ";
  append_number(out, process);
  out += ", ";
}

}  // namespace

CallRecord::CallRecord(const Origin& origin, const Member& member, std::span<const Argument> arguments,
                       ObjectNumbers& objects)
    : member_(member), objects_(objects), masks_result_(masks_result(member, arguments)) {
  append_process(line_, origin.process);
  if (origin.object != 0) {
    line_ += "\"on\": ";
    append_number(line_, origin.object);
    line_ += ", ";
  }
  line_ += "\"call\": ";
  append_name(line_, member.name);
  append_arguments(arguments);
}

void CallRecord::append_arguments(std::span<const Argument> arguments) {
  if (arguments.empty()) return;
  const Secret* const secret = secret_of(member_);
  std::string_view separator = ", \"args\": [";
  for (std::size_t i = 0; i < arguments.size(); ++i) {
    line_ += separator;
    separator = ", ";
    if (secret != nullptr && secret->argument == i) {
      append_masked(line_);
    } else if (arguments[i].same_variable_as >= 0) {
      line_ += "{\"same\": ";
      append_number(line_, static_cast<int>(arguments[i].same_variable_as));
      line_ += '}';
    } else {
      append_value(line_, arguments[i].value, objects_);
    }
  }
  line_ += ']';
}

void CallRecord::succeed(const Variant& result, std::span<const Argument> arguments) {
  line_ += ", \"result\": ";
  if (masks_result_)
    append_masked(line_);
  else
    append_declared(line_, member_.result, result, objects_);
  append_written_back(arguments);
}

void CallRecord::fail(const RunTimeError& error, std::span<const Argument> arguments) {
  line_ += ", ";
  append_error(line_, error);
  append_written_back(arguments);
}

void CallRecord::append_written_back(std::span<const Argument> arguments) {
  // None of the members with secrets writes back.
  calling::append_written_back(line_, member_, arguments, objects_);
}

std::string CallRecord::line(std::int64_t microseconds) && {
  line_ += ", \"microseconds\": ";
  append_number(line_, microseconds);
  line_ += "}\n";
  return std::move(line_);
}

std::string creation_line(std::uint32_t process, std::string_view class_name, std::int32_t object) {
  std::string line;
  append_process(line, process);
  line += "\"create\": ";
  append_name(line, class_name);
  line += ", \"result\": {\"object\": ";
  append_number(line, object);
  return line + "}}\n";
}

std::string release_line(std::uint32_t process, std::int32_t object) {
  std::string line;
  append_process(line, process);
  line += "\"release\": ";
  append_number(line, object);
  return line + "}\n";
}

void append_error(std::string& out, const RunTimeError& error) {
  out += "\"error\": {\"number\": ";
  append_number(out, error.number());
  out += ", \"description\": ";
  append_text(out, error.description());
  out += ", \"source\": ";
  if (error.origin())
    append_text(out, error.origin()->source);
  else
    append_name(out, identity::classes[0].program_id);
  out += '}';
}

void append_written_back(std::string& out, const Member& member, std::span<const Argument> arguments,
                         ObjectNumbers& objects) {
  const std::size_t count = std::min<std::size_t>(arguments.size(), member.parameter_count);
  std::string_view separator = ", \"arguments\": {";
  for (std::size_t i = 0; i < count; ++i) {
    const Parameter& parameter = member.parameters()[i];
    if (parameter.passing != Passing::written_back || arguments[i].value == Variant(missing_argument)) continue;
    const auto same = arguments[i].same_variable_as;
    out += separator;
    append_name(out, parameter.name);
    out += ": ";
    append_declared(out, parameter.type,
                    same < 0 ? arguments[i].value : arguments[static_cast<std::size_t>(same)].value, objects);
    separator = ", ";
  }
  if (separator == ", ") out += '}';
}

}  // namespace talutil::calling
