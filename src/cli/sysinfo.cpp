#include <array>
#include <iostream>

#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "infoforms/system_report.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::cli {

namespace {

struct SystemOptions {
  bool json = false;
  std::string item;  ///< A file or folder to show details of; empty for none.
};

std::string date_json(const std::optional<Date>& date) {
  return date ? json::text(format_date(*date, u"YYYY-MM-DD HH:MM")) : "null";
}

std::string drive_json(const DriveFacts& drive) {
  return json::object({{"name", json::text(drive.name)},
                       {"kind", json::text(drive.kind)},
                       {"label", json::text(drive.label)},
                       {"file_system", json::text(drive.file_system)},
                       {"total", std::to_string(drive.total)},
                       {"free", std::to_string(drive.free)}});
}

std::string item_json(const Platform& platform, const Text& path) {
  const ItemFacts item = platform.machine.item(path);
  FolderCount count{1, 0, item.size, true};
  if (item.is_folder) count = count_folder(platform.folders, path);
  return json::object({{"path", json::text(path)},
                       {"kind", item.is_folder ? "\"folder\"" : "\"file\""},
                       {"files", std::to_string(count.files)},
                       {"folders", std::to_string(count.folders)},
                       {"size", std::to_string(count.size)},
                       {"complete", count.is_complete ? "true" : "false"},
                       {"created", date_json(item.created)},
                       {"modified", date_json(item.modified)},
                       {"accessed", date_json(item.accessed)},
                       {"attributes", json::text(attribute_words(item.attributes))}});
}

std::string machine_json(const Platform& platform) {
  Machine& machine = platform.machine;
  std::vector<std::string> drives;
  for (const DriveFacts& drive : machine.drives()) drives.push_back(drive_json(drive));
  const MemoryFacts memory = machine.memory();
  const ProcessorFacts processor = machine.processor();
  const OperatingSystemFacts system = machine.operating_system();
  std::vector<json::Field> fields{
      {"drives", json::array(drives)},
      {"memory", json::object({{"total", std::to_string(memory.total)},
                               {"available", std::to_string(memory.available)},
                               {"page_file_total", std::to_string(memory.page_file_total)},
                               {"page_file_available", std::to_string(memory.page_file_available)}})},
      {"processor", json::object({{"name", json::text(processor.name)},
                                  {"architecture", json::text(processor.architecture)},
                                  {"count", std::to_string(processor.count)},
                                  {"megahertz", std::to_string(processor.megahertz)}})},
      {"operating_system", json::object({{"name", json::text(system.name)},
                                         {"version", json::text(system.version)},
                                         {"computer", json::text(system.computer)},
                                         {"user", json::text(system.user)},
                                         {"folder", json::text(system.folder)},
                                         {"uptime", std::to_string(system.uptime)}})}};
  return json::object(fields);
}

void system_information(const SystemOptions& options) {
  posix::PosixPlatform posix_platform;
  const Platform platform = posix_platform.platform();
  const Text item = utf8_text(options.item, "the path");
  try {
    if (options.json) {
      std::cout << (item.empty() ? machine_json(platform) : item_json(platform, item)) << '\n';
      return;
    }
    std::vector<FactTable> tables;
    if (item.empty()) {
      tables = {drive_table(platform.machine), memory_table(platform.machine), processor_table(platform.machine),
                operating_system_table(platform.machine)};
    } else {
      tables = {item_table(platform, item)};
    }
    std::string text = to_utf8(as_text(tables));
    std::erase(text, '\r');
    std::cout << text;
  } catch (const RunTimeError& error) {
    throw run_time_failure(options.item.empty() ? "this machine" : options.item, error);
  }
}

}  // namespace

void add_system(CLI::App& app, Work& work) {
  const auto options = std::make_shared<SystemOptions>();
  auto* const command = app.add_subcommand("sysinfo", "Print information about the machine, or about a file or folder");
  command->add_option("PATH", options->item, "A file or folder (C:\\TAL, /var/log)");
  add_json(*command, options->json, "Print JSON, with sizes in bytes and times in seconds");
  choose(*command, work, options, &system_information);
}

}  // namespace talutil::cli
