#include "tests/faults/operations.hpp"

#include "archives/unpacking.hpp"
#include "controls/grid.hpp"

namespace talutil::testing {

namespace {

Platform on_this_machine(FakePlatform& fake, NativePlatform& real) {
  fake.used_files = &real.files;
  fake.used_folders = &real.folders;
  fake.used_profiles = &real.profiles;
  fake.used_settings = &real.settings_store;
  fake.used_registry = &real.registry;
  fake.used_code_page = &real.platform().code_page;
  return fake.platform();
}

Text long_text(std::size_t size, char16_t filling) {
  Text text;
  while (text.size() < size) text += Text(70, filling) + u"\r\n";
  return text;
}

void save(Host& host, const Text& path, const Text& text) { host.utils.SaveTextBox(text, path); }

void save_item(Host& host, TextView item, TextView value) {
  Text output(value);
  host.utils.SaveCfgFileData(u"Section", Text(item), output, host.path(u"host.ini"), Boolean(true));
}

void save_setting(Host& host, TextView value) {
  Text output(value);
  host.utils.SaveCfgFileData(u"Section", u"item", output, u"", Boolean(false));
}

void zip(Host& host, const Text& items, std::int16_t multi_volume = 0) {
  host.utils.CallZIPFiles(host.path(u"a.zip"), items, multi_volume, u"", Boolean(false));
}

void make_data(Host& host) {
  host.utils.VerifyFilePath(host.path(u"data\\sub\\"));
  save(host, host.path(u"data\\one.txt"), long_text(5000, u'1'));
  save(host, host.path(u"data\\sub\\two.txt"), u"two");
}

void log_to(Host& host, TextView event) {
  host.library.settings().EventLog = 1;
  host.library.settings().sORVPath = host.path(u"");
  host.utils.AppendEventLog(Text(event), u"form");
}

void report(Host& host, TextView text) {
  const auto grid = std::make_shared<Grid>(host.library.platform());
  grid->put_Cols(2);
  for (int row = 0; row < 50; ++row) grid->AddItem(Text(text) + u'\t' + number_to_text(row), -1);
  host.fake.chosen_files = {host.path(u"grid.csv")};
  host.utils.ExportGridData(ObjectRef(grid), 0, Boolean(true), u"Sales");
}

const Text key = u"Software\\Host\\Key";
const auto current_user = static_cast<std::int32_t>(Registry::current_user);

/// A month end, which shows no window.
void write_report(Host& host) {
  host.library.settings().AutomatedEndOfMonth = Boolean(true);
  const auto grid = std::make_shared<Grid>(host.library.platform());
  grid->put_Cols(1);
  grid->AddItem(u"line", -1);
  host.utils.GridPrintPreview(100, 1, u"Sales", u"", ObjectRef(grid), {}, {}, u"SalesReport");
}

/// An archive, and in the folder that it is unpacked into, an older file.
void make_archive(Host& host) {
  make_data(host);
  zip(host, host.path(u"data\\*.*"));
  host.utils.VerifyFilePath(host.path(u"out\\"));
  save(host, host.path(u"out\\one.txt"), u"old");
}

/// Runs tasks as one thread does, but lets files be finished together, as with threads.
struct WideTasks final : Tasks {
  [[nodiscard]] std::size_t at_once() const noexcept override { return 4; }
  [[nodiscard]] std::unique_ptr<talutil::StartedTask> start(std::function<void()> task) override {
    return serial.start(std::move(task));
  }
  SerialTasks serial;
};

void unpack_together(Host& host) {
  WideTasks tasks;
  archives::Progress progress;
  try {
    archives::Archive archive(host.path(u"a.zip"), host.real->folders);
    archive.extract(host.path(u"out"), {.overwrite = true, .tasks = &tasks}, host.real->folders, host.real->files, {},
                    progress);
  } catch (const archives::Error& error) {
    throw RunTimeError(ErrorNumber::device_io_error, from_utf8(error.what()));
  }
}

void nothing(Host& /*host*/) {}

}  // namespace

Host::Host(const std::filesystem::path& root)
    : folder(library_path(root)), real(native_platform(root)), library(on_this_machine(fake, *real)) {}

const std::vector<Operation>& operations() {
  static const std::vector<Operation> all = [] {
    std::vector<Operation> some = {
        {"SaveTextBox, new", Promise::whole, nothing, [](Host& host) { save(host, host.path(u"text.txt"), u"text"); }},
        {"SaveTextBox, over another", Promise::whole,
         [](Host& host) { save(host, host.path(u"text.txt"), long_text(1000, u'o')); },
         [text = long_text(300'000, u'n')](Host& host) { save(host, host.path(u"text.txt"), text); }},
        {"SaveBigFile", Promise::whole, [](Host& host) { save(host, host.path(u"list.txt"), u"old"); },
         [list = TextArray{.items = {u"a", long_text(270'000, u'b')}, .allocated = true}](Host& host) {
           host.utils.SaveBigFile(list, host.path(u"list.txt"));
         }},
        {"CopyFileToBackupFile", Promise::whole,
         [](Host& host) {
           save(host, host.path(u"source.txt"), long_text(3000, u's'));
           save(host, host.path(u"backup.txt"), u"old");
         },
         [](Host& host) { host.utils.CopyFileToBackupFile(host.path(u"source.txt"), host.path(u"backup.txt")); }},
        {"SaveCfgFileData, a file's item", Promise::silent, [](Host& host) { save_item(host, u"first", u"1"); },
         [](Host& host) { save_item(host, u"second", u"2"); }},
        {"AppendEventLog", Promise::unflushed, [](Host& host) { log_to(host, u"first"); },
         [](Host& host) { log_to(host, u"second"); }},
        {"CallZIPFiles, a new archive", Promise::whole, make_data,
         [](Host& host) { zip(host, host.path(u"data\\*.*")); }},
        {"CallZIPFiles, more files", Promise::whole,
         [](Host& host) {
           make_data(host);
           save(host, host.path(u"three.txt"), long_text(100'000, u'3'));
           zip(host, host.path(u"data\\*.*"));
         },
         [](Host& host) { zip(host, host.path(u"three.txt")); }},
        {"CallUnZIPFiles", Promise::whole, make_archive,
         [](Host& host) { host.utils.CallUnZIPFiles(host.path(u"a.zip"), host.path(u"out\\"), u"", Boolean(true)); }},
        {"Unpacking several files together", Promise::whole, make_archive, unpack_together},
        {"ExportGridData", Promise::silent, [](Host& host) { report(host, u"old"); },
         [](Host& host) { report(host, u"new"); }},
        {"VerifyFilePath", Promise::silent, nothing,
         [](Host& host) { host.utils.VerifyFilePath(host.path(u"made\\for\\reports\\")); }},
        {"DeleteFiles", Promise::silent,
         [](Host& host) {
           save(host, host.path(u"one.tmp"), u"1");
           save(host, host.path(u"two.tmp"), u"2");
         },
         [](Host& host) { host.utils.DeleteFiles(host.path(u"*.tmp")); }},
        {"LoadTextBox", Promise::silent,
         [](Host& host) { save(host, host.path(u"text.txt"), long_text(300'000, u't')); },
         [](Host& host) { static_cast<void>(host.utils.LoadTextBox(host.path(u"text.txt"))); }},
    };
    if (!has_own_settings()) return some;
    some.insert(
        some.end(),
        {
            {"SaveCfgFileData, a setting", Promise::unflushed, [](Host& host) { save_setting(host, u"old"); },
             [](Host& host) { save_setting(host, u"new"); }},
            {"REGISTRY_SetKeyValue", Promise::silent,
             [](Host& host) {
               host.utils.REGISTRY_CreateNewKey(key, current_user);
               host.utils.REGISTRY_SetKeyValue(key, u"other", u"kept", 1);
             },
             [](Host& host) { host.utils.REGISTRY_SetKeyValue(key, u"name", u"value", 1); }},
            {"REGISTRY_CreateNewKey", Promise::silent, nothing,
             [](Host& host) { host.utils.REGISTRY_CreateNewKey(key, current_user); }},
            {"GridPrintPreview at the end of a month", Promise::silent,
             [](Host& host) { host.utils.VerifyFilePath(u"C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\"); }, write_report},
        });
    return some;
  }();
  return all;
}

}  // namespace talutil::testing
