#include <filesystem>
#include <iostream>
#include <optional>

#include "cli/escapes.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"
#include "platform/posix/data_folder.hpp"
#include "platform/profile_document.hpp"
#include "services/settings_groups.hpp"

namespace talutil::cli {

namespace {

/// The location of settings: a profile file, or a group of the user's store.
struct ConfigOptions {
  std::string file;
  std::string group = "user";
  std::string database;
  std::string user;
  std::string section;
  std::string item;
  std::string value;
  std::string profile;  ///< The file that export writes and import reads.
  bool force = false;
  bool json = false;
};

using Setting = posix::PosixSettingsStore::Setting;

/// A session with the database and user given by the options.
class ConfigSession {
 public:
  explicit ConfigSession(const ConfigOptions& options) : options_(options) {
    if (!options.file.empty() && !(options.database.empty() && options.user.empty())) {
      throw usage_failure("--file " + options.file + " has no database and no user; leave --database and --user out");
    }
    session_.settings().sDatabaseName = text(options.database, "--database");
    session_.settings().sUserName = text(options.user, "--user");
  }

  [[nodiscard]] static Text text(const std::string& typed, const std::string& what) { return utf8_text(typed, what); }

  /// The application name of the requested group.
  [[nodiscard]] Text group() {
    const SharedSettings& settings = session_.settings();
    if (options_.group == "previous") return Text(settings_groups::previous_database);
    if (options_.group == "code") return Text(settings_groups::code_count);
    if (options_.group != "user" && options_.group != "database") {
      throw usage_failure("--group " + options_.group +
                          ": there is no such group; there are user, database, previous and code");
    }
    if (options_.database.empty())
      throw usage_failure("name the database: --database NAME, or a profile file: --file FILE");
    if (options_.group == "database") return settings_groups::database(settings);
    return user_group();
  }

  [[nodiscard]] Text user_group() {
    if (options_.database.empty()) throw usage_failure("name the database: --database NAME");
    if (options_.user.empty()) throw usage_failure("name the user: --user NAME");
    return settings_groups::user(session_.settings());
  }

  [[nodiscard]] ORVUtils& utils() noexcept { return session_.utils(); }
  [[nodiscard]] posix::PosixPlatform& platform() noexcept { return session_.platform(); }
  [[nodiscard]] posix::PosixSettingsStore& store() noexcept { return platform().settings_store; }
  [[nodiscard]] const SharedSettings& settings() noexcept { return session_.settings(); }

 private:
  const ConfigOptions& options_;
  Session session_;
};

std::string place_of(const ConfigOptions& options) {
  return options.item + " in [" + options.section + "]" + (options.file.empty() ? "" : " of " + options.file);
}

void print_settings(const std::vector<Setting>& settings, const Text& only_section, bool as_json) {
  std::optional<Text> section;
  for (const Setting& each : settings) {
    if (!only_section.empty() && !equals_without_case(each.section, only_section)) continue;
    if (as_json) {
      std::cout << json::object({{"section", json::text(each.section)},
                                 {"item", json::text(each.key)},
                                 {"value", json::text(each.value)}})
                << '\n';
      continue;
    }
    if (section != each.section) std::cout << '[' << to_utf8(escapes::write(each.section)) << "]\n";
    section = each.section;
    std::cout << to_utf8(escapes::write(each.key)) << '=' << to_utf8(escapes::write(each.value)) << '\n';
  }
}

std::vector<Setting> settings_in(const std::string& profile) {
  std::vector<Setting> settings;
  for (ProfileDocument::Entry& entry : ProfileDocument(read_bytes(profile)).entries()) {
    settings.push_back({std::move(entry.section), std::move(entry.item), std::move(entry.value)});
  }
  return settings;
}

void config_get(const ConfigOptions& options) {
  ConfigSession session(options);
  const Text section = ConfigSession::text(options.section, "SECTION");
  const Text item = ConfigSession::text(options.item, "ITEM");
  std::optional<Text> value;
  if (options.file.empty()) {
    value = session.store().value(session.group(), section, item);
  } else {
    const Text file = ConfigSession::text(options.file, "--file");
    value = session.utils().GetCfgFileData(section, item, u"NoDefaultData", file, Boolean(true));
    if (value->empty()) value.reset();  // an empty value of a file is a missing one
  }
  if (!value) throw run_time_failure("there is no " + place_of(options));
  std::cout << (options.json ? json::object({{"value", json::text(*value)}}) : to_utf8(*value)) << '\n';
}

/// Removes a setting, a user's also from the database's group, as set writes both.
void config_unset(const ConfigOptions& options) {
  if (!options.file.empty()) {
    throw usage_failure("unset: settings in a profile file cannot be removed; delete the line of " + options.item);
  }
  ConfigSession session(options);
  const Text section = ConfigSession::text(options.section, "SECTION");
  const Text item = ConfigSession::text(options.item, "ITEM");
  bool was_there = session.store().remove(session.group(), section, item);
  if (options.group == "user") {
    was_there |= session.store().remove(settings_groups::database(session.settings()), section, item);
  }
  if (!was_there) throw run_time_failure("there is no " + place_of(options));
}

void config_set(const ConfigOptions& options) {
  ConfigSession session(options);
  const Text section = ConfigSession::text(options.section, "SECTION");
  const Text item = ConfigSession::text(options.item, "ITEM");
  const Text value = ConfigSession::text(options.value, "VALUE");
  if (options.file.empty()) {
    session.store().put(session.group(), section, item, value);
    if (options.group == "user")
      session.store().put(settings_groups::database(session.settings()), section, item, value);
    return;
  }
  const Text file = ConfigSession::text(options.file, "--file");
  Text written = value;
  session.utils().SaveCfgFileData(section, item, written, file, Boolean(true));
  if (written != value) {
    std::cerr << "talutil: " << place_of(options)
              << ": an empty value, and one that begins with a backslash, is read as a "
              << "missing one\n";
  }
  // Members do not report a file that cannot be written.
  if (const auto& failure = session.platform().profiles.failure()) {
    throw run_time_failure("cannot write " + place_of(options), *failure);
  }
  // A file in which the value cannot be found again has not been written either.
  ProfileDocument expected("");
  expected.put(section, item, from_ansi(to_ansi(written)));
  const Text read = session.platform().profiles.value(file, section, item);
  if (expected.value(section, item).value_or(Text()).substr(0, Profiles::longest_value) != read) {
    throw run_time_failure("cannot write " + place_of(options));
  }
}

void config_list(const ConfigOptions& options) {
  ConfigSession session(options);
  const Text section = ConfigSession::text(options.section, "SECTION");
  if (options.file.empty()) {
    return print_settings(session.store().settings_of(session.group()), section, options.json);
  }
  const Text file = ConfigSession::text(options.file, "--file");
  print_settings(settings_in(session.platform().files.native(file)), section, options.json);
}

void config_export(const ConfigOptions& options) {
  ConfigSession session(options);
  const std::vector<Setting> settings = session.store().settings_of(session.user_group());
  if (!options.force && std::filesystem::is_regular_file(options.profile)) {
    throw run_time_failure(options.profile + " is there already; --force replaces it");
  }
  std::string bytes = "\xEF\xBB\xBF; Settings of a user; talutil config import reads them\r\n";
  std::optional<Text> section;
  for (const Setting& each : settings) {
    if (section != each.section && !(each.section.empty() && !section)) {
      bytes += '[' + to_utf8(escapes::write(each.section)) + "]\r\n";
    }
    section = each.section;
    bytes += to_utf8(escapes::write(each.key)) + '=' + to_utf8(escapes::write(each.value)) + "\r\n";
  }
  write_bytes(options.profile, bytes);
  const std::string count = std::to_string(settings.size());
  if (options.json)
    (options.profile == "-" ? std::cerr : std::cout) << json::object({{"settings", count}}) << '\n';
  else
    warn(count + " settings written to " + shown_output(options.profile));
}

int config_import(const ConfigOptions& options) {
  ConfigSession session(options);
  const Text group = session.user_group();
  // Reads the whole file before writing anything.
  std::vector<Setting> settings = within(options.profile, [&] { return settings_in(options.profile); });
  within(options.profile, [&] {
    for (Setting& each : settings) {
      each = {escapes::read(each.section), escapes::read(each.key), escapes::read(each.value)};
    }
  });
  if (settings.empty()) {
    throw run_time_failure(shown_input(options.profile) +
                           ": there is no setting in it; is it a file written by export?");
  }
  std::size_t added = 0;
  std::size_t same = 0;
  std::size_t differing = 0;
  for (const Setting& each : settings) {
    const auto old = session.store().value(group, each.section, each.key);
    ++(!old ? added : *old == each.value ? same : differing);
    if (!old || (options.force && *old != each.value)) session.store().put(group, each.section, each.key, each.value);
  }
  if (options.json) {
    std::cout << json::object({{"added", std::to_string(added)},
                               {"same", std::to_string(same)},
                               {options.force ? "replaced" : "kept", std::to_string(differing)}})
              << '\n';
  } else {
    warn(std::to_string(added) + " settings added, " + std::to_string(same) + " the same, " +
         std::to_string(differing) + (options.force ? " replaced" : " kept as they were; --force replaces them"));
  }
  return differing == 0 || options.force ? 0 : partial_status;
}

/// Takes what the options leave out from the environment. A profile file has neither database nor user.
void take_environment(ConfigOptions& options) {
  if (!options.file.empty()) return;
  if (options.database.empty()) options.database = posix::environment("TALUTIL_DATABASE");
  if (options.user.empty()) options.user = posix::environment("TALUTIL_USER");
}

}  // namespace

void add_config(CLI::App& app, Work& work) {
  auto* const config = app.add_subcommand("config", "Read and write settings in a profile file or the user's store");
  config->require_subcommand(1);
  const auto options = std::make_shared<ConfigOptions>();
  const auto add = [&](const char* name, const char* help, auto function) {
    auto* const command = config->add_subcommand(name, help);
    command->add_option("--database", options->database,
                        "The database of the settings (sDatabaseName); default: TALUTIL_DATABASE");
    command->add_option("--user", options->user, "The user of the settings (sUserName); default: TALUTIL_USER");
    add_json(*command, options->json, "Print the answer as JSON");
    choose(*command, work, options, [function](ConfigOptions& chosen) {
      take_environment(chosen);
      return function(chosen);
    });
    return command;
  };
  const auto add_place = [&](CLI::App* command) {
    command->add_option("--file", options->file, "A profile file instead of the store");
    command->add_option("--group", options->group, "The group of the store: user, database, previous or code")
        ->capture_default_str();
    return command;
  };
  auto* const get = add_place(add("get", "Print a setting", &config_get));
  auto* const set =
      add_place(add("set", "Write a setting; a user's setting also to the database's group", &config_set));
  auto* const unset =
      add_place(add("unset", "Remove a setting; a user's setting also from the database's group", &config_unset));
  for (CLI::App* const command : {get, set, unset}) {
    command->add_option("SECTION", options->section)->required();
    command->add_option("ITEM", options->item)->required();
  }
  set->add_option("VALUE", options->value)->required();
  add_place(add("list", "Print all settings, or those in a section", &config_list))
      ->add_option("SECTION", options->section);
  auto* const exporting = add("export", "Write a user's settings to a profile file", &config_export);
  auto* const importing = add("import", "Read a user's settings from a file written by export", &config_import);
  exporting->add_flag("--force", options->force, "Replace an existing file");
  importing->add_flag("--force", options->force, "Replace settings that differ");
  for (CLI::App* const command : {exporting, importing}) {
    command->add_option("FILE", options->profile, "- is standard input or output")->required();
  }
}

}  // namespace talutil::cli
