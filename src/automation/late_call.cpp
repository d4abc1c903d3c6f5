#include "automation/late_call.hpp"

#include <algorithm>
#include <vector>

#include "automation/control.hpp"
#include "automation/run_time_error.hpp"

namespace talutil {

template <>
Boolean convert(const Variant& value, const Locale& locale) {
  return value.to_boolean(locale);
}

template <>
std::int16_t convert(const Variant& value, const Locale& locale) {
  return value.to_int16(locale);
}

template <>
std::int32_t convert(const Variant& value, const Locale& locale) {
  return value.to_int32(locale);
}

template <>
float convert(const Variant& value, const Locale& locale) {
  return value.to_single(locale);
}

template <>
Date convert(const Variant& value, const Locale& locale) {
  return value.to_date(locale);
}

template <>
Text convert(const Variant& value, const Locale& locale) {
  return value.to_text(locale);
}

template <>
Variant convert(const Variant& value, const Locale& /*locale*/) {
  return value;
}

template <>
TextArray convert(const Variant& value, const Locale& /*locale*/) {
  if (value.is(Variant::Kind::empty)) return {};
  if (const auto* const array = value.get_if<TextArray>()) return *array;
  raise(ErrorNumber::type_mismatch);
}

template <>
ObjectRef convert(const Variant& value, const Locale& /*locale*/) {
  if (const auto* const object = value.get_if<ObjectRef>()) return *object;
  raise(ErrorNumber::type_mismatch);
}

ObjectRef object_of_kind(const Variant& value, ObjectKind is_of_kind) {
  auto object = convert<ObjectRef>(value, {});
  // Members are only looked up, so the locale does not matter.
  if (object != nullptr && !is_of_kind(Control(object, Locale{}))) raise(ErrorNumber::type_mismatch);
  return object;
}

namespace {

constexpr struct {
  TextView name;
  std::int16_t SystemTime::*field;
} record_fields[] = {
    {u"wYear", &SystemTime::wYear},           {u"wMonth", &SystemTime::wMonth},
    {u"wDayOfWeek", &SystemTime::wDayOfWeek}, {u"wDay", &SystemTime::wDay},
    {u"wHour", &SystemTime::wHour},           {u"wMinute", &SystemTime::wMinute},
    {u"wSecond", &SystemTime::wSecond},       {u"wMilliseconds", &SystemTime::wMilliseconds},
};

}  // namespace

template <>
SystemTime convert(const Variant& value, const Locale& locale) {
  if (const auto* const record = value.get_if<SystemTime>()) return *record;
  if (!value.is(Variant::Kind::object)) raise(ErrorNumber::type_mismatch);
  const Control object(value, locale);
  SystemTime time;
  for (const auto& [name, field] : record_fields) time.*field = object.get<std::int16_t>(name);
  return time;
}

void detail::put_changed_fields(const Variant& holder, const SystemTime& before, const SystemTime& after,
                                const Locale& locale) {
  if (!holder.is(Variant::Kind::object)) return;
  const Control object(holder, locale);
  for (const auto& [name, field] : record_fields) {
    if (after.*field != before.*field) object.put(name, after.*field);
  }
}

Variant Parameter::default_value() const {
  switch (type) {
    case ValueType::boolean:
      return Boolean(default_number != 0);
    case ValueType::int16:
      return static_cast<std::int16_t>(default_number);
    case ValueType::int32:
      return default_number;
    case ValueType::text:
      return Text(default_text.begin(), default_text.end());
    default:
      return missing_argument;
  }
}

std::optional<std::int32_t> LateInterface::find_identifier(TextView name) const {
  const std::int32_t slot = find(name);
  if (slot < 0) return {};
  return members[static_cast<std::size_t>(slot)].identifier;
}

std::int32_t LateInterface::identifier_of(TextView name) const {
  const auto identifier = find_identifier(name);
  if (!identifier) raise(ErrorNumber::member_not_supported);
  return *identifier;
}

std::int32_t LateInterface::slot_of(std::int32_t identifier, Access access) const noexcept {
  const auto fits = [&](const Member& member) {
    return member.identifier == identifier && (member.access == Access::put) == (access == Access::put);
  };
  // Identifiers are consecutive like the slots, so the first guess is nearly always right.
  const auto guess = static_cast<std::size_t>(static_cast<std::uint32_t>(identifier) -
                                              static_cast<std::uint32_t>(members.front().identifier));
  if (guess < members.size() && fits(members[guess])) return static_cast<std::int32_t>(guess);
  const auto found = std::ranges::find_if(members, fits);
  return found == members.end() ? -1 : static_cast<std::int32_t>(found - members.begin());
}

Variant LateInterface::call(void* target, std::int32_t slot, std::span<Argument> arguments,
                            const Locale& locale) const {
  if (slot < 0) raise(ErrorNumber::member_not_supported);
  const Member& member = members[static_cast<std::size_t>(slot)];
  const LateCall function = calls[static_cast<std::size_t>(slot)];
  const std::span<const Parameter> parameters = member.parameters();
  if (arguments.size() > parameters.size()) raise(ErrorNumber::wrong_argument_count);

  // Only an optional argument can be left out. For other parameters, a caller's variable that represents a left-out
  // argument of its own is an error value like any other.
  const auto is_left_out = [&](std::size_t i) {
    if (i >= arguments.size()) return true;
    const auto* const error = arguments[i].value.get_if<ErrorValue>();
    return parameters[i].is_optional && error != nullptr && *error == missing_argument;
  };
  std::array<bool, most_parameters> is_given{};
  bool is_complete = true;
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    is_given[i] = !is_left_out(i);
    is_complete = is_complete && is_given[i];
  }
  if (is_complete) return function(target, arguments, locale);

  // An argument that was left out gets a variable of its own, so that writing back a default has no effect.
  std::array<Argument, most_parameters> all;
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    if (is_given[i]) continue;
    if (!parameters[i].is_optional) raise(ErrorNumber::argument_not_optional);
    all[i].value = parameters[i].default_value();
  }
  struct Exchange {
    std::span<Argument> theirs;
    std::array<Argument, most_parameters>& ours;
    const std::array<bool, most_parameters>& is_given;

    void run() const noexcept {
      for (std::size_t i = 0; i < theirs.size(); ++i) {
        if (is_given[i]) std::swap(theirs[i], ours[i]);
      }
    }
    ~Exchange() { run(); }
  };
  const Exchange exchange{arguments, all, is_given};
  exchange.run();
  return function(target, std::span(all).first(parameters.size()), locale);
}

}  // namespace talutil
