#include <algorithm>
#include <cmath>

#include "calling/json_writer.hpp"
#include "calling/system_time_fields.hpp"
#include "calling/value_forms.hpp"

namespace talutil::calling {

namespace {

/// Opens a form, for example {"date": ; the caller closes it.
void open_form(std::string& out, std::string_view name) {
  out += '{';
  append_name(out, name);
  out += ": ";
}

template <class Number>
void append_form(std::string& out, std::string_view name, Number value) {
  open_form(out, name);
  append_number(out, value);
  out += '}';
}

void append_flag(std::string& out, std::string_view name) {
  open_form(out, name);
  out += "true}";
}

/// JSON has no numbers beyond the finite ones.
void append_floating(std::string& out, auto value) {
  if (std::isfinite(value))
    append_number(out, value);
  else
    append_name(out, std::isnan(value) ? "nan" : value > 0 ? "inf" : "-inf");
}

/// A double always has a full stop or an exponent, because a number without either is a Long.
void append_double(std::string& out, double value) {
  if (!std::isfinite(value)) {
    open_form(out, "double");
    append_floating(out, value);
    out += '}';
    return;
  }
  const std::size_t start = out.size();
  append_number(out, value);
  if (out.find_first_of(".e", start) == std::string::npos) out += ".0";
}

void append_digits(std::string& out, std::int32_t value, int count) {
  const std::string digits = std::to_string(value);
  out.append(static_cast<std::size_t>(std::max(0, count - static_cast<int>(digits.size()))), '0');
  out += digits;
}

/// The date to the second if that is all of it, otherwise its days.
void append_date(std::string& out, Date date) {
  const bool is_in_range = std::isfinite(date.days) && is_in_date_range(date.days);
  const DateParts parts = is_in_range ? parts_of(date) : DateParts();
  if (!is_in_range || date_from_parts(parts) != date || std::signbit(date.days) != (date.days < 0)) {
    open_form(out, "days");
    append_floating(out, date.days);
    out += '}';
    return;
  }
  open_form(out, "date");
  out += '"';
  append_digits(out, parts.year, 4);
  const struct {
    char before;
    std::int32_t value;
  } rest[] = {{'-', parts.month}, {'-', parts.day}, {'T', parts.hour}, {':', parts.minute}, {':', parts.second}};
  for (const auto& [before, value] : rest) {
    out += before;
    append_digits(out, value, 2);
  }
  out += "\"}";
}

void append_record(std::string& out, const SystemTime& time) {
  open_form(out, "system_time");
  std::string_view separator = "{";
  for (const auto& field : system_time_fields) {
    out += separator;
    append_name(out, field.name);
    out += ": ";
    append_number(out, time.*field.field);
    separator = ", ";
  }
  out += "}}";
}

void append_list(std::string& out, const TextArray& list) {
  const bool is_plain = list.allocated && list.lower_bound == 0;
  if (!is_plain) open_form(out, "list");
  if (!list.allocated) {
    out += "null}";
    return;
  }
  out += '[';
  std::string_view separator;
  for (const Text& item : list.items) {
    out += separator;
    append_text(out, item);
    separator = ", ";
  }
  out += ']';
  if (is_plain) return;
  out += ", \"from\": ";
  append_number(out, list.lower_bound);
  out += '}';
}

struct Appender {
  std::string& out;
  ObjectNumbers& objects;

  void operator()(std::monostate) const { append_flag(out, "empty"); }
  void operator()(Null) const { out += "null"; }
  void operator()(Boolean value) const {
    if (value.bits() == 0 || value.is_exactly_true())
      out += value ? "true" : "false";
    else
      append_form(out, "boolean", value.bits());
  }
  void operator()(std::uint8_t value) const { append_form(out, "byte", static_cast<int>(value)); }
  void operator()(std::int16_t value) const { append_form(out, "integer", value); }
  void operator()(std::int32_t value) const { append_number(out, value); }
  void operator()(float value) const {
    open_form(out, "single");
    append_floating(out, value);
    out += '}';
  }
  void operator()(double value) const { append_double(out, value); }
  void operator()(Currency value) const {
    open_form(out, "currency");
    append_text(out, number_to_text(value, plain_numbers));
    out += '}';
  }
  void operator()(Date value) const { append_date(out, value); }
  void operator()(const Text& value) const { append_text(out, value); }
  void operator()(ErrorValue value) const {
    if (value == missing_argument)
      append_flag(out, "missing");
    else
      append_form(out, "error", value.code);
  }
  void operator()(const SystemTime& value) const { append_record(out, value); }
  void operator()(const TextArray& value) const { append_list(out, value); }
  void operator()(const ForeignArray&) const { append_flag(out, "array"); }
  void operator()(const ObjectRef& value) const {
    if (value == nullptr)
      out += "{\"object\": null}";
    else
      objects.append(out, value);
  }
};

}  // namespace

void append_value(std::string& out, const Variant& value, ObjectNumbers& objects) {
  value.visit(Appender{out, objects});
}

void append_declared(std::string& out, ValueType declared, const Variant& value, ObjectNumbers& objects) {
  const auto* const integer = value.get_if<std::int16_t>();
  const auto* const single = value.get_if<float>();
  if (integer != nullptr && declared == ValueType::int16)
    append_number(out, *integer);
  else if (single != nullptr && declared == ValueType::single && std::isfinite(*single))
    append_number(out, *single);
  else
    append_value(out, value, objects);
}

}  // namespace talutil::calling
