#include "text/forbidden_characters.hpp"

#include <algorithm>
#include <array>
#include <iterator>
#include <utility>

namespace talutil {

namespace {

constexpr std::size_t ascii_count = 0x80;
constexpr std::size_t comma_step = std::size(forbidden);
constexpr std::size_t blank_step = comma_step + 1;

/// All steps in their order.
constexpr auto steps = [] {
  std::array<Replacement, std::size(forbidden) + 2> all{};
  std::copy(std::begin(forbidden), std::end(forbidden), all.begin());
  all[comma_step] = comma_removal;
  all[blank_step] = blank_removal;
  return all;
}();

/// What becomes of a character: it stays, goes, or makes place for the text of the step with this number.
using Fate = std::uint8_t;
constexpr Fate stays = 0xFF;
constexpr Fate goes = 0xFE;

/// Fates by code; the last is that of all codes beyond ASCII.
using Fates = std::array<Fate, ascii_count + 1>;

constexpr Fates fates_by_code(bool drops_commas, bool drops_blanks) {
  Fates fates{};
  fates.fill(stays);
  for (std::size_t i = 0; i < steps.size(); ++i) {
    if ((i == comma_step && !drops_commas) || (i == blank_step && !drops_blanks)) continue;
    fates[steps[i].from.front()] = steps[i].to.empty() ? goes : static_cast<Fate>(i);
  }
  return fates;
}

constexpr Fates all_fates[2][2] = {{fates_by_code(false, false), fates_by_code(false, true)},
                                   {fates_by_code(true, false), fates_by_code(true, true)}};

class Pass {
 public:
  Pass(CodePage& page, const Fates& fates, TextView text) : page_(page), fates_(fates), text_(text) {}

  Text run() {
    const std::size_t unchanged = find_first();
    if (unchanged == text_.size()) return Text(text_);
    result_.assign(text_, 0, unchanged);
    result_.resize(text_.size());
    end_ = unchanged;
    replace_from(unchanged);
    result_.resize(end_);
    return std::move(result_);
  }

 private:
  [[nodiscard]] Fate fate_of(char16_t unit) { return fates_[std::min<std::uint32_t>(page_.code(unit), ascii_count)]; }

  /// Most texts have nothing to replace, and most characters need not be looked up.
  [[nodiscard]] std::size_t find_first() {
    std::size_t at = 0;
    while (at < text_.size() && (text_[at] < ascii_count ? fates_[text_[at]] : fate_of(text_[at])) == stays) ++at;
    return at;
  }

  void replace_from(std::size_t at) {
    for (;;) {
      Fate fate = stays;
      at = keep_up_to(at, fate);
      if (at == text_.size()) return;
      make_room(text_.size() - at, steps[fate].to.size());
      append_replacement(fate);
      ++at;
    }
  }

  /// Keeps what stays up to a character that makes place for a text, whose position it returns. Writes each character
  /// and then counts it or not, because which ones go cannot be predicted in a text of another script.
  [[nodiscard]] std::size_t keep_up_to(std::size_t at, Fate& fate) {
    // Copies, which need not be read again after each character that is written.
    CodePage& page = page_;
    const Fate* const fates = fates_.data();
    const TextView text = text_;
    char16_t* const out = result_.data();
    std::size_t end = end_;
    for (; at < text.size(); ++at) {
      fate = fates[std::min<std::uint32_t>(page.code(text[at]), ascii_count)];
      if (fate < goes) break;
      out[end] = text[at];
      end += fate == stays ? 1 : 0;
    }
    end_ = end;
    return at;
  }

  void make_room(std::size_t left, std::size_t replacement) {
    const std::size_t needed = end_ + left + replacement;
    if (needed > result_.size()) result_.resize(needed + left / 8);
  }

  /// Later steps work on the replacement, too: a page may lack the acute accent, which then counts as "?".
  void append_replacement(std::size_t step) {
    for (const char16_t unit : steps[step].to) {
      std::size_t later = step + 1;
      while (later < steps.size() && (page_.code(unit) != steps[later].from.front() || fate_of(unit) == stays)) ++later;
      if (later < steps.size())
        append_replacement(later);
      else
        result_[end_++] = unit;
    }
  }

  CodePage& page_;
  const Fates& fates_;
  TextView text_;
  Text result_;
  std::size_t end_ = 0;  ///< Of what is certain in the result; behind it is room.
};

}  // namespace

Text without_forbidden(CodePage& page, TextView text, bool drops_commas, bool drops_blanks) {
  return Pass(page, all_fates[drops_commas ? 1 : 0][drops_blanks ? 1 : 0], text).run();
}

}  // namespace talutil
