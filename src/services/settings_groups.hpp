#pragma once

#include "automation/text.hpp"
#include "library/shared_settings.hpp"

/// The groups ("applications") in the user's settings store. They depend on the current database and user.
namespace talutil::settings_groups {

inline constexpr TextView previous_database = u"ORV3\\PreviousDatabaseSettings";
inline constexpr TextView code_count = u"ORV3\\Programmer\\CodeCount";

/// Without a user the name has two adjacent underscores.
[[nodiscard]] inline Text user(const SharedSettings& settings) {
  return u"ORV3\\" + settings.sDatabaseName + u"_" + settings.sUserName + u"_UserSettings";
}

[[nodiscard]] inline Text database(const SharedSettings& settings) {
  return u"ORV3\\" + settings.sDatabaseName + u"_DatabaseSettings";
}

}  // namespace talutil::settings_groups
