#pragma once

#include "automation/text.hpp"
#include "library/shared_settings.hpp"

/// The groups of the user's settings store, which are its application names. They follow the database and the user of
/// the moment.
namespace talutil::settings_groups {

inline constexpr TextView previous_database = u"ORV3\\PreviousDatabaseSettings";
inline constexpr TextView code_count = u"ORV3\\Programmer\\CodeCount";

/// Without a user the two underscores stand side by side.
[[nodiscard]] inline Text user(const SharedSettings& settings) {
  return u"ORV3\\" + settings.sDatabaseName + u"_" + settings.sUserName + u"_UserSettings";
}

[[nodiscard]] inline Text database(const SharedSettings& settings) {
  return u"ORV3\\" + settings.sDatabaseName + u"_DatabaseSettings";
}

}  // namespace talutil::settings_groups
