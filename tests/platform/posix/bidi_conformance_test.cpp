// The official conformance tests of the Unicode Bidirectional Algorithm, which the distribution's package contains.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <optional>
#include <sstream>

#include "documents/bidi_levels.hpp"

namespace talutil {

namespace {

constexpr const char* class_names[] = {"L",  "R",  "AL",  "EN",  "ES",  "ET",  "AN",  "CS",  "NSM", "BN",  "B",  "S",
                                       "WS", "ON", "LRE", "LRO", "RLE", "RLO", "PDF", "LRI", "RLI", "FSI", "PDI"};

std::vector<std::string> words_of(const std::string& text) {
  std::istringstream stream(text);
  return {std::istream_iterator<std::string>(stream), {}};
}

std::vector<std::string> fields_of(const std::string& line) {
  std::vector<std::string> fields;
  std::istringstream stream(line);
  for (std::string field; std::getline(stream, field, ';');) fields.push_back(field);
  return fields;
}

/// Levels or places; "x" is a character without a level.
template <class Number>
std::vector<Number> numbers_of(const std::string& text) {
  std::vector<Number> numbers;
  for (const std::string& word : words_of(text)) {
    numbers.push_back(static_cast<Number>(word == "x" ? no_level : std::stoul(word)));
  }
  return numbers;
}

/// Calls `check` with each line that is not empty or a comment; the number of those for which it was false.
template <class Check>
std::size_t failures(const char* file, std::size_t least, Check check) {
  std::ifstream stream(std::string("/usr/share/unicode/") + file);
  std::size_t failed = 0;
  std::size_t seen = 0;
  for (std::string line; std::getline(stream, line);) {
    if (line.empty() || line.front() == '#') continue;
    ++seen;
    if (check(line)) continue;
    if (++failed <= 5) ADD_FAILURE() << file << ": " << line;
  }
  EXPECT_GE(seen, least) << file;
  return failed;
}

bool gives(const std::vector<BidiCharacter>& line, BidiLevel base, const std::vector<BidiLevel>& levels,
           const std::vector<std::size_t>& order) {
  const std::vector<BidiLevel> found = bidi_levels(line, base);
  return found == levels && visual_order(found) == order;
}

}  // namespace

TEST(BidiConformance, OrdersAllSequencesOfClasses) {
  std::vector<BidiLevel> levels;
  std::vector<std::size_t> order;
  const auto check = [&](const std::string& text) {
    if (text.starts_with("@Levels:")) levels = numbers_of<BidiLevel>(text.substr(8));
    if (text.starts_with("@Reorder:")) order = numbers_of<std::size_t>(text.substr(9));
    if (text.front() == '@') return true;
    std::vector<BidiCharacter> line;
    const auto fields = fields_of(text);
    for (const std::string& word : words_of(fields[0])) {
      const auto found = std::ranges::find(class_names, word);
      line.push_back({static_cast<BidiClass>(found - std::begin(class_names)), 0});
    }
    const int bases = std::stoi(fields[1], nullptr, 16);
    return ((bases & 1) == 0 || gives(line, base_level(line), levels, order)) &&
           ((bases & 2) == 0 || gives(line, 0, levels, order)) && ((bases & 4) == 0 || gives(line, 1, levels, order));
  };
  EXPECT_EQ(failures("BidiTest.txt", 490000, check), 0U);
}

TEST(BidiConformance, OrdersTextsWithBracketsAndIsolates) {
  const auto check = [](const std::string& text) {
    const auto fields = fields_of(text);
    std::vector<BidiCharacter> line;
    for (const std::string& word : words_of(fields[0])) {
      const auto code = static_cast<char32_t>(std::stoul(word, nullptr, 16));
      line.push_back({bidi_class(code), code});
    }
    const int direction = std::stoi(fields[1]);
    const BidiLevel base = direction == 2 ? base_level(line) : static_cast<BidiLevel>(direction);
    return base == std::stoi(fields[2]) &&
           gives(line, base, numbers_of<BidiLevel>(fields[3]), numbers_of<std::size_t>(fields[4]));
  };
  EXPECT_EQ(failures("BidiCharacterTest.txt", 91000, check), 0U);
}

}  // namespace talutil
