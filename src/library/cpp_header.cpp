#include "library/cpp_header.hpp"

#include <algorithm>
#include <vector>

#include "library/c_control_position.hpp"
#include "library/identity.hpp"
#include "library/interface_definition.hpp"
#include "library/interface_table.hpp"
#include "library/version.hpp"
#include "texts/member_texts.hpp"

namespace talutil {

namespace {

constexpr std::size_t line_length = 120;

std::string_view type_name(ValueType type) { return automation_type(type, "SAFEARRAY*"); }

/// Text in lines that each begin with a prefix.
void write_lines(std::string& out, std::string_view prefix, std::string_view text) {
  while (!text.empty()) {
    const std::size_t room = line_length - prefix.size();
    std::size_t length = text.size();
    if (length > room) {
      length = text.substr(0, room + 1).find_last_of(' ');
      // A word that is longer than a line stays whole.
      if (length == std::string_view::npos) length = std::min(text.find(' '), text.size());
    }
    out += prefix;
    out += text.substr(0, length);
    out += '\n';
    text.remove_prefix(std::min(length + 1, text.size()));
  }
}

/// The names of the parameters that meet a condition, after a heading: " Changes a, b."
template <class Condition>
std::string sentence(std::string_view heading, const Member& member, Condition condition) {
  std::string result;
  for (const Parameter& parameter : member.parameters()) {
    if (!condition(parameter)) continue;
    result += result.empty() ? " " + std::string(heading) + " " : ", ";
    result += parameter.name;
  }
  return result.empty() ? result : result + ".";
}

/// The help, with what the types do not say: which arguments a call changes, and what late-bound callers may leave out.
std::string description(const Member& member, std::string_view summary) {
  std::string text(summary);
  text += sentence("Changes", member, [](const Parameter& p) { return p.passing == Passing::written_back; });
  for (const Parameter& parameter : member.parameters()) {
    if (!parameter.is_optional) continue;
    text += " The default of " + std::string(parameter.name) + " is ";
    text += parameter.type == ValueType::text ? "\"" + std::string(parameter.default_text) + "\""
                                              : std::to_string(parameter.default_number);
    text += ".";
  }
  return text;
}

/// The declaration on one line, or with the parameters on lines of their own if it is too long for that.
void write_function(std::string& out, const Member& member) {
  std::string start = "  virtual HRESULT __stdcall ";
  if (member.access == Access::get) start += "get_";
  if (member.access == Access::put) start += "put_";
  start += std::string(member.name) + "(";
  std::vector<std::string> parameters;
  for (const Parameter& parameter : member.parameters()) {
    parameters.push_back(std::string(type_name(parameter.type)) +
                         (parameter.passing == Passing::by_value ? " " : "* ") + std::string(parameter.name));
  }
  if (member.result != ValueType::none) parameters.push_back(std::string(type_name(member.result)) + "* result");

  std::string line = start;
  for (const std::string& parameter : parameters) {
    const bool is_last = &parameter == &parameters.back();
    const std::string text = parameter + (is_last ? ") = 0;" : ",");
    const bool begins_line = line.back() == '(' || line.back() == ' ';
    if (!begins_line && line.size() + 1 + text.size() > line_length) {
      out += line + "\n";
      line = std::string(start.size(), ' ');
    } else if (!begins_line) {
      line += ' ';
    }
    line += text;
  }
  if (parameters.empty()) line += ") = 0;";
  out += line + "\n";
}

void write_identifier(std::string& out, std::string_view name, std::string_view identifier) {
  const auto part = [identifier](std::size_t start, std::size_t length) {
    return "0x" + std::string(identifier.substr(start, length));
  };
  out += "constexpr GUID " + std::string(name) + " = {" + part(0, 8) + ", " + part(9, 4) + ", " + part(14, 4) + ", {";
  // The last groups, of 4 and 12 digits, are bytes.
  for (const std::size_t start : {19, 21, 24, 26, 28, 30, 32, 34}) {
    if (start != 19) out += ", ";
    out += part(start, 2);
  }
  out += "}};\n";
}

void write_interface(std::string& out, std::string_view name, std::span<const Member> members) {
  const texts::ClassText& text = texts::text_of(name);
  out += '\n';
  write_lines(out, "/// ", text.text.summary);
  out += "struct _" + std::string(name) + " : IDispatch {\n";
  for (const Member& member : members) {
    if (&member != members.data()) out += '\n';
    write_lines(out, "  /// ", description(member, texts::text_of(text, member.name).summary));
    write_function(out, member);
  }
  out += "};\n";
}

}  // namespace

std::string cpp_header() {
  std::string out =
      "// The interfaces of TALUtil " + std::string(version_text) +
      " for C++ programs. Printed by \"talutil header\" from the tables that\n"
      "// also make the library: do not change it.\n"
      "//\n"
      "//   TALUtil::_ORVUtils* toolkit = nullptr;\n"
      "//   CoCreateInstance(TALUtil::CLSID_ORVUtils, nullptr, CLSCTX_INPROC_SERVER,\n"
      "//                    TALUtil::IID__ORVUtils, reinterpret_cast<void**>(&toolkit));\n"
      "//\n"
      "// A call that fails returns 0x800A0000 plus the number of the run-time error; GetErrorInfo has its\n"
      "// text. Texts and arrays that a call returns belong to the caller, who frees them with\n"
      "// SysFreeString and SafeArrayDestroy. An argument that a call changes has to be valid before it: a\n"
      "// null pointer as a BSTR or SAFEARRAY* is the empty one. Calls take no defaults: pass every argument.\n"
      "#pragma once\n\n#include <windows.h>\n\n#include <oaidl.h>\n\nnamespace TALUtil {\n\n";
  write_identifier(out, "LIBID_TALUtil", identity::type_library);
  write_identifier(out, "CLSID_ORVUtils", identity::orv_utils_class);
  write_identifier(out, "IID__ORVUtils", identity::orv_utils_interface);
  write_identifier(out, "CLSID_cControlPosition", identity::control_position_class);
  write_identifier(out, "IID__cControlPosition", identity::control_position_interface);
  out +=
      "\n/// A rectangle. The library's other records are the platform's own: SYSTEMTIME, FILETIME and GUID.\n"
      "struct TRect {\n  long left;\n  long Top;\n  long Right;\n  long Bottom;\n};\n";
  write_interface(out, "ORVUtils", described<ORVUtils>);
  write_interface(out, "cControlPosition", described<cControlPosition>);
  return out + "\n}  // namespace TALUtil\n";
}

}  // namespace talutil
