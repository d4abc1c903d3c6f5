#include "cli/options.hpp"

#include "platform/posix/posix_code_page.hpp"

namespace talutil::cli {

void add_settings(CLI::App& command, std::vector<std::string>& settings, const std::string& help) {
  command.add_option("--set", settings, help)->allow_extra_args(false)->type_name("NAME=VALUE");
}

void add_json(CLI::App& command, bool& is_json, const std::string& help) {
  command.add_flag("--json", is_json, help + "; errors as JSON on standard error");
}

void add_encoding(CLI::App& command, std::string& name) {
  command.add_option("--encoding", name, "The input's encoding: utf-8, utf-16 or a code page; default: found out")
      ->type_name("NAME");
}

void add_code_page(CLI::App& command, std::optional<std::uint32_t>& number, const std::string& use) {
  command.add_option("--code-page", number, "The ANSI code page " + use + "; default: TALUTIL_CODE_PAGE, else 1252")
      ->check(CLI::IsMember(posix::code_page_numbers()))
      ->type_name("NUMBER");
}

}  // namespace talutil::cli
