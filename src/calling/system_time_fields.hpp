#pragma once

#include <string_view>

#include "automation/variant.hpp"

namespace talutil::calling {

/// The fields of a SYSTEMTIME in the system's order and by the system's names, as texts and as bytes.
inline constexpr struct {
  TextView key;
  std::string_view name;
  std::int16_t SystemTime::*field;
} system_time_fields[] = {
    {u"wYear", "wYear", &SystemTime::wYear},
    {u"wMonth", "wMonth", &SystemTime::wMonth},
    {u"wDayOfWeek", "wDayOfWeek", &SystemTime::wDayOfWeek},
    {u"wDay", "wDay", &SystemTime::wDay},
    {u"wHour", "wHour", &SystemTime::wHour},
    {u"wMinute", "wMinute", &SystemTime::wMinute},
    {u"wSecond", "wSecond", &SystemTime::wSecond},
    {u"wMilliseconds", "wMilliseconds", &SystemTime::wMilliseconds},
};

}  // namespace talutil::calling
