#include <CLI/CLI.hpp>
#include <algorithm>
#include <iostream>

#include "automation/member_table.hpp"
#include "cli/arguments.hpp"
#include "cli/batch.hpp"
#include "cli/commands.hpp"
#include "cli/failure.hpp"
#include "library/cpp_header.hpp"
#include "library/interface_definition.hpp"
#include "library/version.hpp"
#include "platform/posix/posix_code_page.hpp"

namespace {

using namespace talutil::cli;

/// The parsed command line: the options of each subcommand, and the subcommand chosen.
struct Request {
  ListOptions list;
  std::string help_member;
  bool man = false;
  bool reference_json = false;
  CallOptions call;
  CleanOptions clean;
  SecretOptions secret;
  PasswordOptions password;
  ConfigOptions config;
  ZipOptions zip;
  UnzipOptions unzip;
  ExportOptions export_table;
  ReportOptions report;
  SystemOptions system;
  LogTailOptions log_tail;
  std::function<void()> run;
};

void add_export(CLI::App& app, Request& request) {
  ExportOptions& options = request.export_table;
  auto* const command = app.add_subcommand("export", "Write the visible rows and columns of a table, as a grid does");
  command->add_option("--from", options.table, "The table, comma-separated; its first line, the header, is row 0")
      ->required()
      ->type_name("FILE");
  command->add_option("--hide", options.hidden, "Columns to leave out, counted from 1: 2,5")
      ->delimiter(',')
      ->allow_extra_args(false)
      ->type_name("COLUMNS");
  command->add_option("--rows", options.rows, "The rows to write, for example 3-7; default: all")
      ->type_name("FIRST-LAST");
  command->add_option("FILE", options.output, "The file to write, comma-separated")->required();
  command->callback([&] { request.run = [&] { export_table(options); }; });
}

void add_report(CLI::App& app, Request& request) {
  ReportOptions& options = request.report;
  auto* const command = app.add_subcommand("report", "Lay out a table or a text on pages and write them as PDF");
  command->add_option("FILE", options.file, "A comma-separated table (.csv, with headings in the first line) or a text")
      ->required();
  command->add_option("--title", options.title, "The header of every page; default: the file's name");
  command->add_option("--paper", options.paper, "A4 or A3")->check(CLI::IsMember({"A4", "A3"}));
  command->add_flag("--landscape", options.landscape, "Use landscape orientation");
  command->add_option("--pdf", options.pdf, "The file to write; default: FILE with .pdf");
  command->callback([&] { request.run = [&] { report(options); }; });
}

void add_list(CLI::App& app, Request& request) {
  auto* const command = app.add_subcommand("list", "List every member with its access and signature");
  command->add_flag("--json", request.list.json, "As a JSON array");
  command->callback([&] { request.run = [&] { list(request.list); }; });
}

void add_help(CLI::App& app, Request& request) {
  auto* const command = app.add_subcommand("help", "Explain a class, a member, or this command");
  command->add_option("MEMBER", request.help_member, "A class, a member or Class.Member, in any case");
  command->add_flag("--man", request.man, "Print the manual page, talutil.1");
  command->callback([&] {
    request.run = [&] {
      if (request.man)
        man_page(app);
      else if (request.help_member.empty())
        std::cout << app.help();
      else
        help(request.help_member);
    };
  });
}

void add_settings(CLI::App& command, std::vector<std::string>& settings, const std::string& help) {
  command.add_option("--set", settings, help)->allow_extra_args(false)->type_name("NAME=VALUE");
}

void add_code_page(CLI::App& command, std::optional<std::uint32_t>& number, const std::string& use) {
  command.add_option("--code-page", number, "The ANSI code page " + use + "; default: TALUTIL_CODE_PAGE, else 1252")
      ->check(CLI::IsMember(talutil::posix::code_page_numbers()))
      ->type_name("NUMBER");
}

void add_call(CLI::App& app, Request& request) {
  auto* const command = app.add_subcommand("call", "Call a method, or read or change a setting: MEMBER [ARGUMENT]...");
  // Whatever is not one of our options is an argument, in order: "-1" and "-x" need no preceding "--".
  command->allow_extras();
  command->set_help_flag("--help", "Print this help message and exit");
  command->add_option("MEMBER", request.call.member, "The member's name, in any case")->required();
  add_settings(*command, request.call.settings, "Change a setting before the call; may be repeated");
  add_code_page(*command, request.call.code_page, "used to compare characters");
  command->add_flag("--json", request.call.json, "Print {\"result\": ..., \"arguments\": {...}}");
  command->footer(
      "Arguments are texts as typed, and are converted to the parameter's type. For values without a text form:\n" +
      written_forms_help() +
      "\n\"--\" ends the options: whatever follows is an argument, even --json.\n"
      "Dates are typed and printed day first: talutil call IncMonth 31/03/2009 -1");
  command->callback([&, command] {
    const auto arguments = command->remaining();
    request.call.arguments.insert(request.call.arguments.begin(), arguments.begin(), arguments.end());
    request.run = [&] { call(request.call); };
  });
}

void add_clean(CLI::App& app, Request& request) {
  auto* const command = app.add_subcommand("clean", "Clean a CSV file field by field and write it as SQL inserts");
  command->add_option("CSV", request.clean.csv, "The file, with the columns' names in the first row")->required();
  command->add_option("--plan", request.clean.plan, "Which members clean which column (see below)")->required();
  command->add_option("--output", request.clean.output, "The SQL file; default: the CSV file's name with .sql");
  command->add_option("--table", request.clean.table, "The table; default: the CSV file's name");
  add_settings(*command, request.clean.settings, "Change a setting first, for example iCharactercase=1");
  add_code_page(*command, request.clean.code_page, "of both files, also used to compare characters");
  command->footer(
      "A plan has one line per column: its name, a member and the member's arguments before the value.\n"
      "\"|\" passes the result to another member, \"list\" cleans each element of a comma-separated list,\n"
      "\"*\" stands for the value if it is not the last argument, and \"#\" begins a comment:\n"
      "  Name    VerifyTextData 40 0\n"
      "  Amount  VerifyTextData 0 1 | VerifyIntData 1\n"
      "  Tags    list VerifyTextData 20 1\n"
      "  Code    AddZeros * 6 -1");
  command->callback([&] { request.run = [&] { clean(request.clean); }; });
}

void add_secrets(CLI::App& app, Request& request) {
  auto* const encrypting = app.add_subcommand("encrypt", "Encrypt the text on standard input, as hosts do");
  encrypting->add_flag("--exact", request.secret.exact, "Treat a final line break as part of the text");
  encrypting->footer("  printf %s \"$secret\" | talutil encrypt");
  encrypting->callback([&] { request.run = [&] { encrypt(request.secret); }; });
  auto* const decrypting = app.add_subcommand("decrypt", "Decrypt the cipher text on standard input");
  decrypting->add_flag("--exact", request.secret.exact, "Print no line break after the text");
  decrypting->callback([&] { request.run = [&] { decrypt(request.secret); }; });

  auto* const making = app.add_subcommand("password", "Print a random password");
  making->add_option("--length", request.password.length, "Its length")
      ->check(CLI::Range(1, 32767))
      ->capture_default_str();
  making->add_option("--mix", request.password.mix, "The characters: digits, letters (and symbols), all or hex")
      ->capture_default_str();
  making->add_option("--count", request.password.count, "How many, one per line")
      ->check(CLI::Range(1, 1'000'000))
      ->capture_default_str();
  making->callback([&] { request.run = [&] { password(request.password); }; });
}

void add_config(CLI::App& app, Request& request) {
  auto* const config = app.add_subcommand("config", "Read and write settings in a profile file or the user's store");
  config->require_subcommand(1);
  ConfigOptions& options = request.config;
  const auto add = [&](const char* name, const char* help, void (*work)(const ConfigOptions&)) {
    auto* const command = config->add_subcommand(name, help);
    command->add_option("--database", options.database, "The database of the settings (sDatabaseName)");
    command->add_option("--user", options.user, "The user of the settings (sUserName)");
    command->callback([&request, &options, work] { request.run = [&options, work] { work(options); }; });
    return command;
  };
  const auto add_place = [&](CLI::App* command) {
    command->add_option("--file", options.file, "A profile file instead of the store");
    command->add_option("--group", options.group, "The group of the store: user, database, previous or code")
        ->capture_default_str();
    return command;
  };
  auto* const get = add_place(add("get", "Print a setting", &config_get));
  auto* const set =
      add_place(add("set", "Write a setting; a user's setting also to the database's group", &config_set));
  for (CLI::App* const command : {get, set}) {
    command->add_option("SECTION", options.section)->required();
    command->add_option("ITEM", options.item)->required();
  }
  set->add_option("VALUE", options.value)->required();
  add_place(add("list", "Print all settings, or those in a section", &config_list))
      ->add_option("SECTION", options.section);
  auto* const exporting = add("export", "Write a user's settings to a profile file", &config_export);
  auto* const importing = add("import", "Read a user's settings from a file written by export", &config_import);
  exporting->add_flag("--force", options.force, "Replace an existing file");
  importing->add_flag("--force", options.force, "Replace settings that differ");
  for (CLI::App* const command : {exporting, importing}) command->add_option("FILE", options.profile)->required();
}

void add_archives(CLI::App& app, Request& request) {
  ZipOptions& packing = request.zip;
  auto* const zip = app.add_subcommand("zip", "Pack files into an archive, add to an archive, or test it");
  zip->add_option("ARCHIVE", packing.archive)->required();
  zip->add_option("ITEM", packing.items, "Files, folders with all their contents, or patterns (\"C:\\DATA\\*.*\")");
  zip->add_flag("--test", packing.test, "Read the archive, or the given entries, and check every byte; write nothing");
  zip->add_flag("--encrypt", packing.encrypt, "Ask for a password and encrypt with it");
  zip->add_option("--password-file", packing.password_file,
                  "Read the password from the first line of this file; - is input");
  zip->add_flag("--aes", packing.aes, "Encrypt with AES-256, which not every program can read");
  zip->add_flag("--no-folders", packing.no_folders, "Store names without their folders");
  zip->add_option("--level", packing.level, "0 stores, 1 is fast, 9 small")
      ->check(CLI::Range(0, 9))
      ->capture_default_str();
  zip->add_option("--volumes", packing.volume_size, "Create a split set with volumes of this size (100000000, 650MB)")
      ->transform(CLI::AsSizeValue(true));
  zip->add_option("--comment", packing.comment, "The archive's comment");
  zip->footer("  talutil password | tee key | talutil zip backup.zip DATA --password-file -");
  zip->callback([&] { request.run = [&] { talutil::cli::zip(packing); }; });

  UnzipOptions& unpacking = request.unzip;
  auto* const unzip = app.add_subcommand("unzip", "Unpack an archive, or the last volume of a split set");
  unzip->add_option("ARCHIVE", unpacking.archive)->required();
  unzip->add_option("ITEM", unpacking.items, "Entries, folders or patterns; default: all");
  unzip->add_option("--to", unpacking.destination, "The folder to unpack to; created if missing")
      ->capture_default_str();
  unzip->add_option("--password-file", unpacking.password_file,
                    "Read the password from its first line; - is standard input");
  unzip->add_flag("--overwrite", unpacking.overwrite, "Replace existing files; by default they are kept");
  unzip->add_flag("--no-folders", unpacking.no_folders, "Write all files into one folder");
  unzip->add_flag("--list", unpacking.list, "List the entries instead: size, packed size, time (UTC), name");
  unzip->callback([&] { request.run = [&] { talutil::cli::unzip(unpacking); }; });
}

void add_log(CLI::App& app, Request& request) {
  auto* const command = app.add_subcommand("log", "Show an event log");
  command->require_subcommand(1);
  auto* const tail = command->add_subcommand("tail", "Print the last events, oldest first");
  tail->add_option("PATH", request.log_tail.path, "EventLog.txt, or its folder (C:\\TAL\\ORV3)")->required();
  tail->add_option("-n,--lines", request.log_tail.lines, "How many lines; default: 10");
  tail->add_flag("-f,--follow", request.log_tail.follow, "Continue with new events as they are added");
  tail->callback([&] { request.run = [&] { log_tail(request.log_tail); }; });
}

void add_system(CLI::App& app, Request& request) {
  auto* const command =
      app.add_subcommand("sysinfo", "Print information about the machine, and about a file or folder if given");
  command->add_option("PATH", request.system.item, "A file or folder (C:\\TAL, /var/log)");
  command->add_flag("--json", request.system.json, "Print JSON, with sizes in bytes and times in seconds");
  command->callback([&] { request.run = [&] { system_information(request.system); }; });
}

void add_printers(CLI::App& app, Request& request) {
  app.add_subcommand("idl", "Print the interface definition of the type library")->callback([&] {
    request.run = [] { std::cout << talutil::interface_definition(); };
  });
  app.add_subcommand("header", "Print talutil.h, with which C++ programs are bound early")->callback([&] {
    request.run = [] { std::cout << talutil::cpp_header(); };
  });
  auto* const printing = app.add_subcommand("reference", "Print the reference of all classes, in Markdown");
  printing->add_flag("--json", request.reference_json, "Print it as JSON, for programs");
  printing->callback([&] { request.run = request.reference_json ? reference_json : reference; });
}

/// Fails if the first word is not a subcommand; lists the subcommands.
void check_subcommand(const CLI::App& app, std::string_view word) {
  std::string names;
  for (const CLI::App* const command : app.get_subcommands({})) {
    if (command->get_name() == word) return;
    names += (names.empty() ? "" : ", ") + command->get_name();
  }
  throw usage_failure("there is no subcommand \"" + std::string(word) + "\"; there are " + names);
}

/// Removes what follows "--" from the command line: arguments of a call that must not be interpreted.
std::vector<std::string> take_verbatim(std::vector<std::string>& words) {
  const auto mark = std::ranges::find(words, "--");
  if (mark == words.end()) return {};
  std::vector<std::string> verbatim(mark + 1, words.end());
  words.erase(mark, words.end());
  return verbatim;
}

int run(std::vector<std::string> words) {
  CLI::App app("TALUtil on the command line: its members listed, explained and called.", "talutil");
  app.set_version_flag("--version", talutil::version_text);
  app.require_subcommand(1);
  app.footer(
      "\"talutil help MEMBER\" explains a member, \"talutil call --help\" how arguments are written.\n"
      "TALUTIL_CODE_PAGE sets the ANSI code page used to compare characters (1251, 932, 65001 ...); default: 1252.");
  Request request;
  add_list(app, request);
  add_help(app, request);
  add_call(app, request);
  add_batch(app, request.run);
  add_clean(app, request);
  add_secrets(app, request);
  add_config(app, request);
  add_archives(app, request);
  add_export(app, request);
  add_report(app, request);
  add_log(app, request);
  add_system(app, request);
  add_printers(app, request);
  if (!words.empty() && !words.front().starts_with('-')) check_subcommand(app, words.front());
  if (!words.empty() && words.front() == "call") request.call.arguments = take_verbatim(words);
  std::ranges::reverse(words);  // the parser takes them from the back
  try {
    app.parse(words);
  } catch (const CLI::Success& help_or_version) {
    return app.exit(help_or_version);
  } catch (const CLI::ParseError& error) {
    std::string message = error.what();
    // Keep a name in capitals, such as that of a missing argument.
    const bool is_name = message.size() > 1 && talutil::fold_case(message[1]) != message[1];
    if (!is_name) message.front() = talutil::fold_case(message.front());
    throw usage_failure(message + "; see \"talutil --help\"");
  }
  request.run();
  if (!std::cout.flush()) throw run_time_failure("cannot write the output");
  return 0;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run({argv + 1, argv + argc});
  } catch (const Failure& failure) {
    std::cerr << "talutil: " << failure.what() << '\n';
    return failure.status();
  } catch (const talutil::RunTimeError& error) {
    std::cerr << "talutil: " << error_words(error) << '\n';
  } catch (const std::exception& error) {
    std::cerr << "talutil: " << error.what() << '\n';
  }
  return run_time_status;
}
