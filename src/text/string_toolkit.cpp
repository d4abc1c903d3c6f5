#include <algorithm>
#include <cstdint>
#include <iterator>
#include <utility>
#include <vector>

#include "automation/checked.hpp"
#include "automation/text.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "text/ansi_finder.hpp"
#include "text/characters.hpp"

namespace talutil {

namespace {

template <class Predicate>
Text keep_if(TextView text, Predicate keep) {
  Text kept;
  std::ranges::copy_if(text, std::back_inserter(kept), keep);
  return kept;
}

/// For each prefix of a word, the length of its longest proper prefix that is also its suffix: how much of the word is
/// still matched after a mismatch.
std::vector<std::uint32_t> borders_of(TextView word) {
  std::vector<std::uint32_t> borders(word.size());
  std::uint32_t matched = 0;
  for (std::size_t i = 1; i < word.size(); ++i) {
    while (matched > 0 && word[i] != word[matched]) matched = borders[matched - 1];
    if (word[i] == word[matched]) ++matched;
    borders[i] = matched;
  }
  return borders;
}

Text replace_short_word(TextView text, TextView word, TextView replacement) {
  Text result;
  std::size_t copied = 0;
  for (std::size_t found = 0; (found = text.find(word, copied)) != TextView::npos; copied = found + word.size()) {
    if (copied == 0) result.reserve(text.size());
    result.append(text, copied, found - copied).append(replacement);
  }
  return copied == 0 ? Text(text) : std::move(result.append(text, copied));
}

/// Only goes back in the word, never in the text, so that repetitive texts take no longer than others.
Text replace_word(TextView text, TextView word, TextView replacement) {
  const std::vector<std::uint32_t> borders = borders_of(word);
  Text result;
  result.reserve(text.size());
  std::size_t copied = 0;
  std::size_t matched = 0;
  for (std::size_t at = 0; at < text.size(); ++at) {
    // If nothing is matched, skips to the next possible start, or to the last character if there is none.
    if (matched == 0) at = std::min(text.find(word.front(), at), text.size() - 1);
    while (matched > 0 && text[at] != word[matched]) matched = borders[matched - 1];
    if (text[at] == word[matched]) ++matched;
    if (matched < word.size()) continue;
    const std::size_t end = at + 1;
    result.append(text, copied, end - word.size() - copied).append(replacement);
    copied = end;
    matched = 0;
  }
  return result.append(text, copied);
}

}  // namespace

Text ORVUtils::StripNulls(const Text& s) { return Text(up_to_nul(s)); }

Text ORVUtils::RemoveNumberFromString(const Text& sTemp) {
  // This also removes characters that count as question marks because the code page lacks them.
  return keep_if(sTemp, by_code(library_.platform().code_page, [](std::uint32_t code) { return code >= u'A'; }));
}

Text ORVUtils::RemoveStringsFromNumber(const std::int16_t& iOption, const Text& sTemp, Text& sCharacter) {
  if (sTemp.empty()) return {};
  CodePage& page = library_.platform().code_page;
  switch (iOption) {
    case 0:
      return keep_if(sTemp, by_code(page, is_digit_code));
    case 1:
      return keep_if(sTemp, by_code(page, [](std::uint32_t code) { return is_digit_code(code) || code == u' '; }));
    case 2:
      if (sCharacter.empty()) sCharacter.assign(1, u' ');
      // Each character is compared with all of sCharacter, so a longer one removes nothing.
      return keep_if(sTemp, [&](char16_t unit) { return TextView(&unit, 1) != sCharacter; });
    case 3:
      return keep_if(sTemp, by_code(page, [](std::uint32_t code) { return is_digit_code(code) || code == u'.'; }));
    default:
      return {};
  }
}

Text ORVUtils::StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace) {
  if (sSrc.empty()) return {};
  if (sChr.empty()) raise(ErrorNumber::invalid_procedure_call);
  AnsiFinder finder(library_.platform().code_page, sChr.front());
  Text result;
  // Reserves room for some longer replacements, so that most texts are not moved as they grow.
  result.reserve(sSrc.size() + (sReplace.size() > 1 ? sSrc.size() / 8 : 0));
  for (std::size_t copied = 0; copied < sSrc.size();) {
    const std::size_t found = finder.find(sSrc, copied);
    const std::size_t end = finder.find_other(sSrc, found);
    result.append(sSrc, copied, found - copied);
    for (std::size_t i = found; i < end; ++i) result += sReplace;
    copied = end;
  }
  return result;
}

Text ORVUtils::CRLFStringReplace(const Text& sSrc, const Text& sReplace) {
  return StringReplace(StringReplace(sSrc, u"\r", sReplace), u"\n", sReplace);
}

Text ORVUtils::StringRestoreCRLF(const Text& sSrc, const Text& sSourceCharacter) {
  require_16_bit_length(sSrc.size());
  Text result;
  for (std::size_t at = 0; at < sSrc.size(); ++at) {
    const bool is_last = at + 1 == sSrc.size();
    const bool is_marker = TextView(sSrc).substr(at, 1) == sSourceCharacter;
    if (is_marker) result += line_break;
    // A marker at the very end has no second character to skip and stays after the line break: hosts rely on it.
    if (is_marker && !is_last) {
      ++at;
    } else {
      result += sSrc[at];
    }
  }
  return result;
}

Text ORVUtils::AddZeros(const Text& sText, const std::int16_t& iExpLength, const std::int16_t& iJustify) {
  const std::size_t wanted = static_cast<std::size_t>(std::max<std::int16_t>(iExpLength, 0));
  if (sText.size() >= wanted) return sText;
  const Text zeros(wanted - sText.size(), u'0');
  if (iJustify == -1) return zeros + sText;
  if (iJustify == 1) return sText + zeros;
  return sText;
}

Text ORVUtils::ReverseString(const Text& sSource) {
  require_16_bit_length(sSource.size());
  return {sSource.rbegin(), sSource.rend()};
}

Text ORVUtils::StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo) {
  if (sChangeFrom.empty() || sChangeFrom.size() > sSource.size()) return sSource;
  // Such a word can be compared at every position, however repetitive the text is.
  constexpr std::size_t short_length = 8;
  if (sChangeFrom.size() <= short_length) return replace_short_word(sSource, sChangeFrom, sChangeTo);
  return replace_word(sSource, sChangeFrom, sChangeTo);
}

}  // namespace talutil
