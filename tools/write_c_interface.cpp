// Writes the typed functions of the C library from the interface table: "header" prints their declarations, "source"
// their definitions. Members with other parameters than texts, numbers and truth values have none.
#include <algorithm>
#include <cstdio>
#include <string>
#include <string_view>

#include "library/interface_table.hpp"
#include "texts/member_texts.hpp"

namespace {

using namespace talutil;

constexpr const char* c_type(ValueType type) {
  switch (type) {
    case ValueType::text:
      return "const char*";
    case ValueType::int16:
      return "int16_t";
    case ValueType::int32:
      return "int32_t";
    case ValueType::single:
      return "float";
    case ValueType::boolean:
      return "bool";
    default:
      return nullptr;
  }
}

std::string place_type(ValueType type) { return type == ValueType::text ? "char**" : c_type(type) + std::string("*"); }

bool has_function(const Member& member) {
  return (member.result == ValueType::none || c_type(member.result) != nullptr) &&
         std::ranges::all_of(member.parameters(), [](const Parameter& p) { return c_type(p.type) != nullptr; });
}

std::string function_name(const Member& member) {
  const char* const access = member.access == Access::get ? "get_" : member.access == Access::put ? "put_" : "";
  return std::string("talutil_") + access + std::string(member.name);
}

/// The C parameters of one parameter: a text that is written back is two of them.
std::string parameter_of(const Parameter& parameter) {
  const std::string name(parameter.name);
  if (parameter.passing != Passing::written_back) return c_type(parameter.type) + (" " + name);
  if (parameter.type != ValueType::text) return place_type(parameter.type) + " " + name;
  return "const char* " + name + ", char** " + name + "_after";
}

std::string declaration(const Member& member) {
  std::string text = "int32_t " + function_name(member) + "(talutil_library* library";
  for (const Parameter& parameter : member.parameters()) text += ", " + parameter_of(parameter);
  if (member.result != ValueType::none) text += ", " + place_type(member.result) + " result";
  return text + ")";
}

std::string default_of(const Parameter& parameter) {
  if (parameter.type == ValueType::text) return '"' + std::string(parameter.default_text) + '"';
  if (parameter.type == ValueType::boolean) return parameter.default_number == 0 ? "false" : "true";
  return std::to_string(parameter.default_number);
}

std::string comment(const Member& member) {
  std::string text = "/* " + std::string(texts::text_of(texts::text_of("ORVUtils"), member.name).summary);
  for (const Parameter& parameter : member.parameters()) {
    if (parameter.is_optional)
      text += " By default, " + std::string(parameter.name) + " is " + default_of(parameter) + ".";
  }
  return text + " */\n";
}

/// What the call takes from C. A number that is written back is read through its pointer, if there is one.
std::string given(const Parameter& parameter) {
  const std::string name(parameter.name);
  if (parameter.passing != Passing::written_back || parameter.type == ValueType::text) return name;
  return name + " == nullptr ? " + c_type(parameter.type) + "{} : *" + name;
}

std::string definition(const Member& member, std::size_t slot) {
  std::string arguments;
  std::string places;
  for (std::size_t i = 0; i < member.parameter_count; ++i) {
    const Parameter& parameter = member.parameters()[i];
    arguments += (i == 0 ? "" : ", ") + given(parameter);
    if (parameter.passing != Passing::written_back) continue;
    const char* const after = parameter.type == ValueType::text ? "_after" : "";
    places += (places.empty() ? "{" : ", {") + std::to_string(i) + ", " + std::string(parameter.name) + after + "}";
  }
  return declaration(member) + " {\n  return talutil::capi::call(library, " + std::to_string(slot) + ", {" + arguments +
         "}, {" + places + "}" + (member.result == ValueType::none ? "" : ", result") + ");\n}\n";
}

}  // namespace

int main(int argc, char** argv) {
  const std::string_view what = argc == 2 ? argv[1] : "";
  if (what != "header" && what != "source") {
    std::fputs("usage: write_c_interface header|source\n", stderr);
    return 2;
  }
  const bool is_header = what == "header";
  std::string text = is_header ? "/* Included by talutil_c.h. Made from the table of the interface. */\n"
                               : "#include \"talutil_c.h\"\n#include \"capi/typed_call.hpp\"\n";
  const auto& members = described<ORVUtils>;
  for (std::size_t slot = 0; slot < members.size(); ++slot) {
    if (!has_function(members[slot])) continue;
    text += '\n';
    text += is_header ? comment(members[slot]) + "TALUTIL_API " + declaration(members[slot]) + ";\n"
                      : definition(members[slot], slot);
  }
  return std::fputs(text.c_str(), stdout) < 0 ? 1 : 0;
}
