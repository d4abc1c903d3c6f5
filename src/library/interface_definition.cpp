#include "library/interface_definition.hpp"

#include <charconv>

#include "library/c_control_position.hpp"
#include "library/identity.hpp"
#include "library/interface_table.hpp"
#include "texts/member_texts.hpp"

namespace talutil {

namespace {

std::string quoted(std::string_view text) {
  std::string result = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') result += '\\';
    result += c;
  }
  return result + '"';
}

std::string hexadecimal(std::int32_t value) {
  std::array<char, 8> digits{};
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), static_cast<std::uint32_t>(value), 16);
  return "0x" + std::string(digits.data(), end.ptr);
}

std::string type_name(ValueType type) { return std::string(automation_type(type, "SAFEARRAY(BSTR)")); }

std::string default_value(const Parameter& parameter) {
  if (!parameter.is_optional) return {};
  const std::string value =
      parameter.type == ValueType::text ? quoted(parameter.default_text) : std::to_string(parameter.default_number);
  return ", optional, defaultvalue(" + value + ")";
}

void write_parameter(std::string& out, const Parameter& parameter, Dialect dialect) {
  const bool default_refused =
      dialect == Dialect::type_library && parameter.is_optional && parameter.type == ValueType::text;
  const bool by_value = parameter.passing == Passing::by_value || default_refused;
  out += by_value ? "[in" : "[in, out";
  out += default_value(parameter);
  out += "] ";
  out += type_name(parameter.type);
  out += by_value ? " " : "* ";
  out += parameter.name;
}

void write_member(std::string& out, const Member& member, std::string_view help, Dialect dialect) {
  out += "    [id(" + hexadecimal(member.identifier) + ")";
  if (member.access == Access::get) out += ", propget";
  if (member.access == Access::put) out += ", propput";
  out += ", helpstring(" + quoted(help) + ")]\n    HRESULT ";
  out += member.name;
  out += "(";
  std::string_view separator;
  for (const Parameter& parameter : member.parameters()) {
    out += separator;
    write_parameter(out, parameter, dialect);
    separator = ", ";
  }
  if (member.result != ValueType::none) {
    out += separator;
    out += "[out, retval] ";
    out += type_name(member.result);
    out += "* result";
  }
  out += ");\n";
}

struct DescribedClass {
  std::string_view name;
  std::string_view class_identifier;
  std::string_view interface_identifier;
  std::span<const Member> members;
};

void write_class(std::string& out, const DescribedClass& described_class, Dialect dialect) {
  out += "\n  [odl, uuid(";
  out += described_class.interface_identifier;
  out += "), dual, oleautomation, hidden, nonextensible]\n  interface _";
  out += described_class.name;
  out += " : IDispatch {\n";
  const texts::ClassText& text = texts::text_of(described_class.name);
  for (const Member& member : described_class.members) {
    write_member(out, member, texts::text_of(text, member.name).summary, dialect);
  }
  out += "  };\n\n  [uuid(";
  out += described_class.class_identifier;
  out += "), helpstring(" + quoted(text.text.summary) + ")]\n  coclass ";
  out += described_class.name;
  out += " {\n    [default] interface _";
  out += described_class.name;
  out += ";\n  };\n";
}

void write_record(std::string& out, std::string_view name, std::string_view identifier,
                  std::initializer_list<std::string_view> fields) {
  out += "\n  typedef [uuid(";
  out += identifier;
  out += ")] struct ";
  out += name;
  out += " {\n";
  for (const std::string_view field : fields) {
    out += "    ";
    out += field;
    out += ";\n";
  }
  out += "  } ";
  out += name;
  out += ";\n";
}

}  // namespace

std::string_view automation_type(ValueType type, std::string_view array) {
  switch (type) {
    case ValueType::boolean:
      return "VARIANT_BOOL";
    case ValueType::int16:
      return "short";
    case ValueType::int32:
      return "long";
    case ValueType::single:
      return "float";
    case ValueType::date:
      return "DATE";
    case ValueType::text:
      return "BSTR";
    case ValueType::variant:
      return "VARIANT";
    case ValueType::text_array:
      return array;
    case ValueType::system_time:
      return "SYSTEMTIME";
    case ValueType::none:
    case ValueType::object:
      break;
  }
  return "void";
}

std::string interface_definition(Dialect dialect) {
  std::string out = "[uuid(";
  out += identity::type_library;
  out += "), version(" + std::to_string(identity::type_library_major) + "." +
         std::to_string(identity::type_library_minor) + "), helpstring(" + quoted(identity::library_help) +
         ")]\nlibrary ";
  out += identity::library_name;
  out += " {\n  importlib(\"stdole2.tlb\");\n";
  write_record(out, "SYSTEMTIME", identity::system_time_record,
               {"short wYear", "short wMonth", "short wDayOfWeek", "short wDay", "short wHour", "short wMinute",
                "short wSecond", "short wMilliseconds"});
  write_record(out, "FILETIME", identity::file_time_record, {"long dwLowDateTime", "long dwHighDateTime"});
  write_record(out, dialect == Dialect::type_library ? guid_stand_in : "GUID", identity::guid_record,
               {"long Data1", "short Data2", "short Data3", "unsigned char Data4[8]"});
  write_record(out, "TRect", identity::rectangle_record, {"long left", "long Top", "long Right", "long Bottom"});
  write_class(out, {"ORVUtils", identity::orv_utils_class, identity::orv_utils_interface, described<ORVUtils>},
              dialect);
  write_class(out,
              {"cControlPosition", identity::control_position_class, identity::control_position_interface,
               described<cControlPosition>},
              dialect);
  return out + "};\n";
}

}  // namespace talutil
