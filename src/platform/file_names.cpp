#include "platform/file_names.hpp"

#include <algorithm>
#include <array>
#include <vector>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

/// The elements of a pattern as the file system reads it: wildcards next to dots have special meanings.
enum class Kind : std::uint8_t {
  unit,
  any_one,
  any_run,
  one_or_end,     ///< "?": a character, or nothing before a dot or at the end
  dot_or_end,     ///< "." before a wildcard: a dot, or nothing at the end
  up_to_last_dot  ///< "*" before a final ".": everything but the last dot
};

struct Step {
  Kind kind;
  char16_t unit;
};

std::vector<Step> steps_of(TextView pattern) {
  std::vector<Step> steps;
  if (pattern == u"*.*") return {{Kind::any_run, 0}};
  for (std::size_t i = 0; i < pattern.size(); ++i) {
    const char16_t unit = pattern[i];
    const char16_t next = i + 1 < pattern.size() ? pattern[i + 1] : u'\0';
    if (unit == u'?') {
      steps.push_back({Kind::one_or_end, unit});
    } else if (unit == u'*') {
      const bool before_final_dot = next == u'.' && i + 2 == pattern.size();
      steps.push_back({before_final_dot ? Kind::up_to_last_dot : Kind::any_run, unit});
    } else if (unit == u'.' && (next == u'?' || next == u'*' || next == u'\0')) {
      steps.push_back({Kind::dot_or_end, unit});
    } else {
      steps.push_back({Kind::unit, upper_case(unit)});
    }
  }
  return steps;
}

/// Tracks all positions in the pattern that a name can have reached, so that the time is at worst proportional to the
/// length of the name times that of the pattern.
class Matcher {
 public:
  explicit Matcher(const std::vector<Step>& steps) : steps_(steps), places_(steps.size() + 1, false) {
    places_[0] = true;
  }

  void take(char16_t unit, bool is_last_dot) {
    pass_empty([](Kind kind) { return kind == Kind::any_run || kind == Kind::up_to_last_dot; });
    if (unit == u'.') pass_empty([](Kind kind) { return kind != Kind::unit && kind != Kind::dot_or_end; });
    std::vector<bool> next(places_.size(), false);
    for (std::size_t i = 0; i < steps_.size(); ++i) {
      if (!places_[i]) continue;
      const bool stays = steps_[i].kind == Kind::any_run || (steps_[i].kind == Kind::up_to_last_dot && !is_last_dot);
      if (stays) next[i] = true;
      if (advances(steps_[i], unit)) next[i + 1] = true;
    }
    places_ = std::move(next);
  }

  bool ends() {
    pass_empty([](Kind kind) { return kind != Kind::unit; });
    return places_.back();
  }

 private:
  static bool advances(const Step& step, char16_t unit) {
    switch (step.kind) {
      case Kind::unit:
        return upper_case(unit) == step.unit;
      case Kind::one_or_end:
        return unit != u'.';
      case Kind::dot_or_end:
        return unit == u'.';
      default:
        return false;
    }
  }

  template <class CanBeEmpty>
  void pass_empty(CanBeEmpty can_be_empty) {
    for (std::size_t i = 0; i < steps_.size(); ++i) {
      if (places_[i] && can_be_empty(steps_[i].kind)) places_[i + 1] = true;
    }
  }

  const std::vector<Step>& steps_;
  std::vector<bool> places_;
};

}  // namespace

bool is_device_name(TextView part) {
  constexpr std::array<TextView, 6> plain = {u"CON", u"PRN", u"AUX", u"NUL", u"CONIN$", u"CONOUT$"};
  constexpr TextView digits = u"123456789\u00B9\u00B2\u00B3";
  constexpr std::array<TextView, 2> numbered = {u"COM", u"LPT"};
  TextView stem = part.substr(0, part.find_first_of(u".:"));
  stem = stem.substr(0, stem.find_last_not_of(u' ') + 1);
  const auto is_stem = [&](TextView name) { return equals_without_case(stem, name); };
  if (std::ranges::any_of(plain, is_stem)) return true;
  if (stem.size() != 4 || digits.find(stem.back()) == TextView::npos) return false;
  stem.remove_suffix(1);
  return std::ranges::any_of(numbered, is_stem);
}

TextView last_part(TextView path) noexcept {
  const std::size_t end = path.find_last_of(u"\\/:");
  return end == TextView::npos ? path : path.substr(end + 1);
}

bool is_open_ended(TextView path) noexcept { return !path.empty() && last_part(path).empty(); }

void require_file_name(TextView path) {
  if (path.empty()) raise(ErrorNumber::path_file_access);
  constexpr TextView forbidden(u"*?\"<>|\0", 7);
  const TextView name = path.substr(path.find_last_of(separators) + 1);
  const bool is_device = is_device_name(name) || is_device_name(last_part(name));
  const bool in_device_space = path.starts_with(u"\\\\.") || path.starts_with(u"\\\\?");
  if (in_device_space || is_device || path.find_first_of(forbidden) != TextView::npos) {
    raise(ErrorNumber::bad_file_name_or_number);
  }
}

void require_pattern(TextView pattern) {
  const TextView folder = pattern.substr(0, pattern.size() - last_part(pattern).size());
  if (pattern.find_first_of(TextView(u"\"<>|\0", 5)) != TextView::npos ||
      folder.find_first_of(u"*?") != TextView::npos) {
    raise(ErrorNumber::bad_file_name_or_number);
  }
}

bool name_matches(TextView name, TextView pattern) {
  const std::vector<Step> steps = steps_of(pattern);
  const std::size_t last_dot = name.find_last_of(u'.');
  Matcher matcher(steps);
  for (std::size_t i = 0; i < name.size(); ++i) matcher.take(name[i], i == last_dot);
  return matcher.ends();
}

}  // namespace talutil
