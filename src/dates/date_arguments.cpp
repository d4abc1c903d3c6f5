#include "dates/date_arguments.hpp"

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"

namespace talutil {

bool is_missing_date(const Variant& argument, const Locale& locale) {
  return argument.is_null() || argument.equals_text(u"", locale);
}

Date formatted_date(const Variant& argument, const Locale& locale) {
  const Variant value = argument.value();
  if (value.is_null()) raise(ErrorNumber::type_mismatch);
  return value.to_date(locale);
}

Text reformatted(const Text& text, TextView pattern, const Locale& locale) {
  const auto date = text_to_date(text, locale.current_year);
  return date ? format_date(*date, pattern) : text;
}

Text short_date_text(std::int32_t day, std::int32_t month, std::int32_t year) {
  return number_to_text(day) + u"/" + number_to_text(month) + u"/" + number_to_text(year);
}

Text hours_and_minutes_text(std::int32_t minutes) {
  return number_to_text(minutes / 60) + u":" + number_to_text(minutes % 60);
}

std::int32_t in_minutes(std::int32_t hours, std::int32_t minutes) {
  return checked_add(checked_multiply(hours, 60), minutes);
}

}  // namespace talutil
