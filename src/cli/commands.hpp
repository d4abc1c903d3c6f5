#pragma once

#include <functional>
#include <string>
#include <vector>

namespace CLI {
class App;
}

/// The subcommands: each adds itself with its options to the parser, which chooses the work of the one on the command
/// line. The work prints to standard output, throws Failure if it cannot be done, and returns the exit status.
namespace talutil::cli {

using Work = std::function<int()>;

void add_list(CLI::App& app, Work& work);

/// @param verbatim arguments of the member that are not to be taken for options; filled in before the work begins
void add_call(CLI::App& app, Work& work, const std::vector<std::string>& verbatim);
void add_clean(CLI::App& app, Work& work);
void add_secrets(CLI::App& app, Work& work);
void add_config(CLI::App& app, Work& work);
void add_archives(CLI::App& app, Work& work);
void add_export(CLI::App& app, Work& work);
void add_report(CLI::App& app, Work& work);
void add_log(CLI::App& app, Work& work);
void add_system(CLI::App& app, Work& work);

/// Explains a class or a member.
void help(const std::string& name);

/// Prints the reference of all classes as a page in Markdown.
void reference();

/// Prints the same as JSON: an object with "families" and "classes".
void reference_json();

/// Prints the manual page of the command, in roff.
void man_page(const CLI::App& app);

}  // namespace talutil::cli
