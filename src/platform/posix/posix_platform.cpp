#include "platform/posix/posix_platform.hpp"

#include <errno.h>
#include <langinfo.h>
#include <locale.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <iostream>
#include <string>
#include <type_traits>

#include "automation/run_time_error.hpp"

namespace talutil::posix {

namespace {

MessageAnswer ask_ok(const Terminal& terminal) {
  return terminal.ask("[Enter] ") ? MessageAnswer::ok : MessageAnswer::cancel;
}

MessageAnswer ask_yes_no(const Terminal& terminal) {
  while (const auto line = terminal.ask("Yes or no? [y/n] ")) {
    const char first = line->empty() ? ' ' : line->front();
    if (first == 'y' || first == 'Y') return MessageAnswer::yes;
    if (first == 'n' || first == 'N') return MessageAnswer::no;
    std::cerr << '"' << *line << "\" is neither yes nor no\n";
  }
  return MessageAnswer::no;
}

struct FreeLocale {
  void operator()(locale_t locale) const noexcept { freelocale(locale); }
};
using LocaleHandle = std::unique_ptr<std::remove_pointer_t<locale_t>, FreeLocale>;

/// The first character of a text of the locale; `otherwise` if the text is empty or not UTF-8.
char16_t first_character(std::string_view text, char16_t otherwise) {
  const Text decoded = from_utf8(text);
  return decoded.empty() || decoded.front() == u'\uFFFD' ? otherwise : decoded.front();
}

class Window final : public HiddenWindow {
 public:
  [[nodiscard]] std::intptr_t handle() override { return 0; }
};

Locale environment_locale() {
  Locale result;
  const LocaleHandle environment(newlocale(LC_CTYPE_MASK | LC_NUMERIC_MASK | LC_MONETARY_MASK, "", nullptr));
  // The environment names a locale that is not installed.
  if (!environment) return result;
  const auto item = [&](nl_item wanted) { return std::string_view(nl_langinfo_l(wanted, environment.get())); };

  result.decimal_separator = first_character(item(RADIXCHAR), result.decimal_separator);
  result.thousands_separator = first_character(item(THOUSEP), result.thousands_separator);
  // Some locales have a decimal comma and no thousands separator; one character cannot be both.
  if (result.thousands_separator == result.decimal_separator) {
    result.thousands_separator = result.decimal_separator == u',' ? u'.' : u',';
  }
  // The first character gives the symbol's position.
  if (const auto currency = item(CRNCYSTR); !currency.empty()) {
    result.set_currency(from_utf8(currency.substr(1)));
  }
  return result;
}

}  // namespace

MessageAnswer PosixMessageBoxes::show(TextView text, MessageButtons buttons, TextView title) {
  const std::string caption = title.empty() ? program_invocation_short_name : to_utf8(title);
  // Flush what the program has printed so far, so that it precedes the box.
  std::cout.flush();
  std::cerr << caption << ": " << to_utf8(text) << '\n';
  return buttons == MessageButtons::ok ? ask_ok(terminal_) : ask_yes_no(terminal_);
}

Text PosixComputer::name() {
  std::array<char, 256> name{};
  if (gethostname(name.data(), name.size() - 1) != 0) return {};
  const std::string_view full(name.data());
  return upper_case(from_utf8(full.substr(0, full.find('.'))));
}

Locale PosixComputer::locale() {
  if (!locale_) locale_ = environment_locale();
  return *locale_;
}

Date PosixClock::now() {
  const time_t seconds = time(nullptr);
  struct tm now {};
  localtime_r(&seconds, &now);
  return date_from_parts(
             {now.tm_year + 1900, now.tm_mon + 1, now.tm_mday, now.tm_hour, now.tm_min, std::min(now.tm_sec, 59)})
      .value_or(Date{});
}

std::unique_ptr<HiddenWindow> PosixFormWindows::make_hidden(TextView /*caption*/) { return std::make_unique<Window>(); }

std::unique_ptr<Waiting> PosixFormWindows::show_hourglass() {
  struct Unseen final : Waiting {
    [[nodiscard]] bool is_given_up() const override { return false; }
  };
  return std::make_unique<Unseen>();
}

bool PosixMessagePump::wait_and_handle() {
  pause();
  return false;
}

void PosixDrawing::draw_text(std::intptr_t /*device_context*/, const PixelRectangle& /*place*/, TextView /*text*/,
                             std::int32_t /*colour*/, bool /*breaks_words*/) {
  raise(ErrorNumber::action_not_supported);
}

void PosixWindowPrinting::configure_printer(std::int32_t /*window*/) {
  throw RunTimeError(ErrorNumber::file_not_found, Text(missing_print_helper));
}

void PosixWindowPrinting::send_to_printer(std::int32_t window) { configure_printer(window); }

}  // namespace talutil::posix
