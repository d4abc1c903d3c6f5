#include "cli/options.hpp"

#include "platform/posix/posix_code_page.hpp"

namespace talutil::cli {

void add_settings(CLI::App& command, std::vector<std::string>& settings, const std::string& help) {
  command.add_option("--set", settings, help)->allow_extra_args(false)->type_name("NAME=VALUE");
}

void add_code_page(CLI::App& command, std::optional<std::uint32_t>& number, const std::string& use) {
  command.add_option("--code-page", number, "The ANSI code page " + use + "; default: TALUTIL_CODE_PAGE, else 1252")
      ->check(CLI::IsMember(posix::code_page_numbers()))
      ->type_name("NUMBER");
}

}  // namespace talutil::cli
