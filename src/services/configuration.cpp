#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "services/settings_groups.hpp"

namespace talutil {

namespace {

/// With this default, reading a missing item of a file returns an empty value and saves nothing.
constexpr TextView no_default = u"NoDefaultData";

// Selectors given in the file name's place that stand for groups; all others are settings of the host.
constexpr TextView previous_database_selector = u"PreviousDatabaseSettings";
constexpr TextView code_count_selector = u"CodeCount";

// In a file a single backslash means an empty value, and a value that begins with a backslash gets another one in
// front.
constexpr TextView backslash = u"\\";
constexpr TextView two_backslashes = u"\\\\";

/// The value of an item in a file, or the first name in its section if the item is empty; empty if there is none.
Text read_profile(ORVUtils& utils, const Text& file, const Text& section, const Text& item) {
  Profiles& profiles = utils.library().platform().profiles;
  Text buffer =
      utils.StripNulls(item.empty() ? profiles.item_names(file, section) : profiles.value(file, section, item));
  if (buffer.starts_with(backslash)) buffer.erase(0, backslash.size());
  return buffer;
}

Text read_file(ORVUtils& utils, const Text& section, const Text& item, const Text& default_data, const Text& file) {
  if (utils.FileExists(file)) {
    Text value = read_profile(utils, file, section, item);
    if (!value.empty()) return value;
  }
  if (default_data == no_default) return {};
  // Saved to the user's store, not to the file, which remains without the item.
  Text output = default_data;
  utils.SaveCfgFileData(section, item, output, file, Boolean(false));
  return default_data;
}

/// The group that a selector is read from. Without a user it is the database's, which every write updates.
Text group_of(const SharedSettings& settings, const Text& selector) {
  if (settings.sUserName.empty() && selector != previous_database_selector) return settings_groups::database(settings);
  if (!selector.empty() && selector == settings.sNatNameD) return settings_groups::user(settings);
  if (selector == settings.sORVDataName) return settings_groups::database(settings);
  if (selector == previous_database_selector) return Text(settings_groups::previous_database);
  if (selector == code_count_selector) return Text(settings_groups::code_count);
  return settings_groups::user(settings);
}

Text read_store(const ORVUtils& utils, const Text& section, const Text& item, const Text& default_data,
                const Text& selector) {
  SettingsStore& store = utils.library().platform().settings_store;
  const Text group = group_of(utils.settings(), selector);
  Text value = store.value(group, section, item).value_or(Text());
  if (!value.empty() || group == settings_groups::code_count) return value;
  store.put(group, section, item, default_data);
  return default_data;
}

void save_store(const ORVUtils& utils, const Text& section, const Text& item, const Text& output,
                const Text& selector) {
  SettingsStore& store = utils.library().platform().settings_store;
  const SharedSettings& settings = utils.settings();
  const bool is_host_selector =
      (!selector.empty() && selector == settings.sNatNameD) || selector == settings.sORVDataName;
  if (!is_host_selector && selector == previous_database_selector) {
    store.put(Text(settings_groups::previous_database), section, item, output);
  } else if (!is_host_selector && selector == code_count_selector) {
    store.put(Text(settings_groups::code_count), section, item, output);
  } else {
    // The database's group holds the last value that any user saved.
    store.put(settings_groups::user(settings), section, item, output);
    store.put(settings_groups::database(settings), section, item, output);
  }
}

}  // namespace

Text ORVUtils::GetCfgFileData(const Text& sSection, const Text& sItem, const Text& sDefaultData, const Text& sFilename,
                              const Boolean& bLoadFromFile) {
  if (!bLoadFromFile) return read_store(*this, sSection, sItem, sDefaultData, sFilename);
  Text result = read_file(*this, sSection, sItem, sDefaultData, sFilename);
  // A network path is never returned from a file.
  if (result.starts_with(two_backslashes) || result == backslash) return {};
  return result;
}

void ORVUtils::SaveCfgFileData(const Text& sSection, const Text& sItem, Text& sOutput, const Text& sFilename,
                               const Boolean& bSaveToFile) {
  if (!bSaveToFile) return save_store(*this, sSection, sItem, sOutput, sFilename);
  if (sOutput.empty()) {
    sOutput = backslash;
  } else if (sOutput.starts_with(backslash)) {
    sOutput.insert(0, backslash);
  }
  if (sOutput.starts_with(two_backslashes)) sOutput = backslash;
  library().platform().profiles.put(sFilename, sSection, sItem, sOutput);
}

}  // namespace talutil
