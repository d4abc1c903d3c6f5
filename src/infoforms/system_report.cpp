#include "infoforms/system_report.hpp"

#include <algorithm>
#include <cmath>

#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

Text number_words(std::uint64_t number) {
  const std::string digits = std::to_string(number);
  Text words;
  for (std::size_t i = 0; i < digits.size(); ++i) {
    if (i > 0 && (digits.size() - i) % 3 == 0) words += u',';
    words += static_cast<char16_t>(digits[i]);
  }
  return words;
}

Text size_with_bytes(std::uint64_t bytes) {
  return bytes < 1024 ? size_words(bytes) : size_words(bytes) + u" (" + number_words(bytes) + u" bytes)";
}

Text percent(std::uint64_t part, std::uint64_t whole) {
  if (whole == 0) return {};
  const double share = static_cast<double>(part) * 100 / static_cast<double>(whole);
  return number_words(static_cast<std::uint64_t>(std::lround(share))) + u"%";
}

/// For example "29 minutes" or "1 day, 0 hours, 5 minutes".
Text time_words(std::uint64_t seconds) {
  constexpr std::uint64_t minute = 60;
  constexpr std::uint64_t hour = 60 * minute;
  constexpr std::uint64_t day = 24 * hour;
  Text words;
  const auto add = [&](std::uint64_t number, TextView unit) {
    if (number == 0 && words.empty() && unit != u"minute") return;
    words += (words.empty() ? u"" : u", ") + number_words(number) + u" " + Text(unit) + (number == 1 ? u"" : u"s");
  };
  add(seconds / day, u"day");
  add(seconds % day / hour, u"hour");
  add(seconds % hour / minute, u"minute");
  return words;
}

Text date_words(const std::optional<Date>& date) {
  return date ? format_date(*date, u"DD/MM/YYYY HH:MM") : Text(u"unknown");
}

FactTable fact_list(TextView title, std::vector<std::vector<Text>> rows) {
  // Facts that the platform does not report are left out.
  std::erase_if(rows, [](const std::vector<Text>& row) { return row[1].empty(); });
  return {title, {u"Fact", u"Value"}, std::move(rows)};
}

/// Counts a folder and everything below it, up to a number of entries or as long as its user waits.
class Counting {
 public:
  Counting(FolderCount& count, const std::function<bool()>& is_given_up) : count_(count), is_given_up_(is_given_up) {}

  void add(Folder& folder) {
    std::vector<Text> folders;
    folder.list([&](TextView name, const FileFacts& facts) {
      if (is_over()) return;
      if (facts.kind == FileKind::folder) {
        ++count_.folders;
        folders.emplace_back(name);
      } else {
        ++count_.files;
        count_.size += facts.size;
      }
    });
    for (const Text& name : folders) {
      if (is_over()) return;
      try {
        add(*folder.folder(name, false));
      } catch (const RunTimeError&) {
        // A folder that cannot be read.
        count_.is_complete = false;
      }
    }
  }

 private:
  bool is_over() {
    constexpr std::uint64_t most_entries = 100'000;
    constexpr std::uint64_t asked_every = 256;  // Asking for keys takes longer than counting.
    const std::uint64_t entries = count_.files + count_.folders;
    if (entries >= most_entries || (entries % asked_every == 0 && is_given_up_ && is_given_up_())) is_over_ = true;
    if (is_over_) count_.is_complete = false;
    return is_over_;
  }

  FolderCount& count_;
  const std::function<bool()>& is_given_up_;
  bool is_over_ = false;
};

}  // namespace

Text size_words(std::uint64_t bytes) {
  static constexpr TextView units[] = {u"bytes", u"KB", u"MB", u"GB", u"TB", u"PB", u"EB"};
  constexpr std::uint64_t step = 1024;
  std::uint64_t size = 1;
  std::size_t unit = 0;
  for (; bytes / size >= step; size *= step) ++unit;
  if (unit == 0) return number_words(bytes) + u" bytes";
  const std::uint64_t tenths = bytes / size * 10 + (bytes % size * 10 + size / 2) / size;
  return number_words(tenths / 10) + u"." + number_words(tenths % 10) + u" " + Text(units[unit]);
}

Text attribute_words(std::uint32_t attributes) {
  constexpr std::pair<std::uint32_t, TextView> names[] = {{file_attribute::read_only, u"read-only"},
                                                          {file_attribute::hidden, u"hidden"},
                                                          {file_attribute::system, u"system"}};
  Text words;
  for (const auto& [bit, name] : names) {
    if ((attributes & bit) != 0) words += (words.empty() ? u"" : u", ") + Text(name);
  }
  return words.empty() ? u"none" : words;
}

FactTable drive_table(Machine& machine) {
  FactTable table{u"Drives", {u"Drive", u"Kind", u"Label", u"File system", u"Total", u"Free", u"Used"}, {}};
  for (const DriveFacts& drive : machine.drives()) {
    if (drive.file_system.empty()) {
      table.rows.push_back({drive.name, drive.kind, {}, u"not ready", {}, {}, {}});
      continue;
    }
    table.rows.push_back({drive.name, drive.kind, drive.label, drive.file_system, size_words(drive.total),
                          size_words(drive.free),
                          percent(drive.total - std::min(drive.free, drive.total), drive.total)});
  }
  return table;
}

FactTable memory_table(Machine& machine) {
  const MemoryFacts memory = machine.memory();
  const bool has_page_file = memory.page_file_total > 0;
  return fact_list(u"Memory",
                   {{u"Total", size_with_bytes(memory.total)},
                    {u"Available", size_with_bytes(memory.available)},
                    {u"Used", percent(memory.total - std::min(memory.available, memory.total), memory.total)},
                    {u"Page file, total", has_page_file ? size_with_bytes(memory.page_file_total) : u"none"},
                    {u"Page file, available", has_page_file ? size_with_bytes(memory.page_file_available) : Text()}});
}

FactTable processor_table(Machine& machine) {
  const ProcessorFacts processor = machine.processor();
  return fact_list(u"Processor",
                   {{u"Name", processor.name},
                    {u"Architecture", processor.architecture},
                    {u"Logical processors", number_to_text(processor.count)},
                    {u"Speed", processor.megahertz > 0 ? number_to_text(processor.megahertz) + u" MHz" : Text()}});
}

FactTable operating_system_table(Machine& machine) {
  const OperatingSystemFacts system = machine.operating_system();
  return fact_list(u"Operating system", {{u"Name", system.name},
                                         {u"Version", system.version},
                                         {u"Computer", system.computer},
                                         {u"User", system.user},
                                         {u"System folder", system.folder},
                                         {u"Running for", time_words(system.uptime)}});
}

FolderCount count_folder(Folders& folders, const Text& path, const std::function<bool()>& is_given_up) {
  FolderCount count;
  Counting(count, is_given_up).add(*folders.open(path));
  return count;
}

FactTable item_table(const Platform& platform, const Text& path) {
  const ItemFacts item = platform.machine.item(path);
  std::vector<std::vector<Text>> rows{{u"Path", path}, {u"Kind", item.is_folder ? u"Folder" : u"File"}};
  if (item.is_folder) {
    const auto hourglass = platform.form_windows.show_hourglass();
    const FolderCount count = count_folder(platform.folders, path, [&] { return hourglass->is_given_up(); });
    const Text at_least = count.is_complete ? u"" : u"at least ";
    rows.push_back({u"Files", at_least + number_words(count.files)});
    rows.push_back({u"Folders", at_least + number_words(count.folders)});
    rows.push_back({u"Size", at_least + size_with_bytes(count.size)});
  } else {
    rows.push_back({u"Size", size_with_bytes(item.size)});
  }
  rows.push_back({u"Created", date_words(item.created)});
  rows.push_back({u"Modified", date_words(item.modified)});
  rows.push_back({u"Accessed", date_words(item.accessed)});
  rows.push_back({u"Attributes", attribute_words(item.attributes)});
  return fact_list(u"Folder or file", std::move(rows));
}

Text as_text(std::span<const FactTable> tables) {
  Text text;
  for (const FactTable& table : tables) {
    if (!text.empty()) text += u"\r\n";
    text += Text(table.title) + u"\r\n";
    // A list of facts needs no headings.
    const bool is_list = table.columns.size() == 2;
    std::vector<std::vector<Text>> lines(is_list ? 0 : 1, {table.columns.begin(), table.columns.end()});
    lines.insert(lines.end(), table.rows.begin(), table.rows.end());
    std::vector<std::size_t> widths(table.columns.size());
    for (const auto& line : lines) {
      for (std::size_t c = 0; c < line.size(); ++c) widths[c] = std::max(widths[c], line[c].size());
    }
    for (const auto& line : lines) {
      Text row = u"  ";
      for (std::size_t c = 0; c < line.size(); ++c) row += line[c] + Text(widths[c] - line[c].size() + 2, u' ');
      row.erase(row.find_last_not_of(u' ') + 1);
      text += row + u"\r\n";
    }
  }
  return text;
}

}  // namespace talutil
