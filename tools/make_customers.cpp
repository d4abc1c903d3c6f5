// Writes examples/data/customers.csv, two thousand customers as a neglected application would export them:
//
//   g++ -std=c++20 tools/make_customers.cpp -o make_customers && ./make_customers > examples/data/customers.csv
//
// Lines end in CR LF, the encoding is code page 1252, and the bytes are the same on every run.
#include <cstdint>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

namespace {

using namespace std::string_literals;
using Words = std::vector<std::string>;

constexpr int row_count = 2000;

/// A small generator of our own, so that the file is the same on every machine.
class Chance {
 public:
  int below(int limit) {
    state_ = state_ * 6364136223846793005U + 1442695040888963407U;
    return static_cast<int>((state_ >> 33) % static_cast<std::uint64_t>(limit));
  }
  bool one_in(int n) { return below(n) == 0; }
  const std::string& pick(const Words& words) {
    return words[static_cast<std::size_t>(below(static_cast<int>(words.size())))];
  }
  std::string digits(int count) {
    std::string result;
    while (count-- > 0) result += static_cast<char>('0' + below(10));
    return result;
  }

 private:
  std::uint64_t state_ = 20090331;
};

// Octal escapes are characters of code page 1252.
const Words given_names{"Anne", "Ben",     "Carla",  "Dora", "Emil", "Fay",
                        "Gus",  "Ren\351", "Zo\353", "Ines", "Jo",   "Karl"};
const Words family_names{"O'Brien",   "D'Arcy",      "M\374ller",    "Bj\366rk",  "Garc\355a", "Smithers",
                         "L\351ger",  "N\372\361ez", "Van der Poel", "Ashgrove",  "O'Hara",    "Wei\337",
                         "Pickering", "McKenna",     "Machin",       "de la Cruz"};
const Words trades{"Plumbing", "Gardens", "Electrical", "Roofing", "Caf\351", "Cleaning", "Pest Control"};
const Words streets{"Main Road", "Harbour St", "King's Parade", "Mill Lane", "Station Street", "Lake Drive"};
const Words suburbs{"Northbank", "St Alban's", "Eastmere", "Port Hollow", "Green  Valley", "Upper Tarn"};
const Words places{"Level 3", "Unit 5", "Rear building", "Cnr Main & Mill", "c/- Reception", "Block \"C\"", "Dock <2>"};
const Words remarks{"Called about the invoice.", "Prefers   mornings.", "Paid in   full,     thanks.",
                    "Said \"never again\".",     "Quote <pending>",     "Won't answer before 9.",
                    "Has    four    cats."};
const Words tags{"regular",  "trade",     "owes money", "VIP",       "do not call",
                 "warranty", "O'Brien's", "new<er>",    "pool & spa"};

const std::string line_break = "\r\n";

/// As clerks type: sometimes in capitals, sometimes without any.
std::string in_typed_case(Chance& chance, std::string text) {
  const int habit = chance.below(5);
  if (habit > 1) return text;
  const int distance = 'a' - 'A';
  for (char& c : text) {
    const auto code = static_cast<unsigned char>(c);
    const bool is_small = (code >= 'a' && code <= 'z') || (code >= 0xE0 && code != 0xF7);
    const bool is_capital = (code >= 'A' && code <= 'Z') || (code >= 0xC0 && code < 0xDF && code != 0xD7);
    if (habit == 0 && is_small) c = static_cast<char>(code - distance);
    if (habit == 1 && is_capital) c = static_cast<char>(code + distance);
  }
  return text;
}

/// Joins randomly chosen lines.
std::string lines(Chance& chance, const Words& words, int count) {
  std::string result;
  for (int i = 0; i < count; ++i) result += (i > 0 ? line_break : "") + chance.pick(words);
  return result;
}

std::string name(Chance& chance) {
  switch (chance.below(6)) {
    case 0:
      return chance.pick(family_names) + " & Sons";
    case 1:
      return '"' + chance.pick(family_names) + "\" " + chance.pick(trades);
    case 2:
      return "  " + chance.pick(given_names) + " " + chance.pick(family_names) + " ";
    case 3:
      return chance.pick(family_names) + ", " + chance.pick(given_names);
    default:
      return chance.pick(given_names) + " " + chance.pick(family_names);
  }
}

/// Two or more lines, some of them for the office only ($*$).
std::string address(Chance& chance, const std::string& suburb) {
  std::string result = lines(chance, places, chance.below(4)) + (chance.one_in(2) ? line_break : "");
  if (chance.one_in(5)) result += "$*$ moved in " + std::to_string(1990 + chance.below(20)) + line_break;
  result += std::to_string(1 + chance.below(250)) + " " + chance.pick(streets) + line_break + suburb;
  return chance.one_in(3) ? result + line_break + chance.digits(4) : result;
}

std::string phone(Chance& chance) {
  const std::string number = chance.digits(4) + (chance.one_in(2) ? " " : "") + chance.digits(4);
  return chance.one_in(4) ? "\t" + number : chance.one_in(5) ? "(0" + chance.digits(1) + ") " + number + "?" : number;
}

std::string amount(Chance& chance) {
  const Words units{"", "kg", " AUD", "?", " hrs"};
  const std::string thousands =
      chance.one_in(2) ? std::to_string(1 + chance.below(9)) + "," + chance.digits(3) : chance.digits(2);
  return (chance.one_in(12) ? "-" : "") + thousands + "." + chance.digits(2) + chance.pick(units);
}

std::string quantity(Chance& chance) {
  const Words odd{"", "none", "&H1F", "1e3 pcs", "1 200", "007"};
  return chance.one_in(4) ? chance.pick(odd) : std::to_string(chance.below(500));
}

std::string notes(Chance& chance) {
  std::string result = lines(chance, remarks, chance.below(4));
  if (chance.one_in(6)) result += line_break + line_break + line_break + "--" + chance.pick(given_names);
  return result;
}

/// A comma-separated list; in a third of them the closing comma is missing.
std::string tag_list(Chance& chance) {
  std::string result;
  for (int count = chance.below(4); count > 0; --count) result += chance.pick(tags) + ",";
  if (!result.empty() && chance.one_in(3)) result.pop_back();
  return result;
}

/// Quoted if the text requires it, and sometimes if it does not.
std::string field(Chance& chance, const std::string& text) {
  if (text.find_first_of(",\"\r\n") == std::string::npos && !chance.one_in(10)) return text;
  std::string result = "\"";
  for (const char c : text) result.append(c == '"' ? 2 : 1, c);
  return result + '"';
}

std::string row(Chance& chance, int id) {
  const std::string suburb = in_typed_case(chance, chance.pick(suburbs));
  Words fields{std::to_string(id),      in_typed_case(chance, name(chance)),
               address(chance, suburb), suburb,
               phone(chance),           amount(chance),
               quantity(chance),        notes(chance),
               tag_list(chance)};
  // Remains of an old record reader after the end of a name.
  if (chance.one_in(25)) fields[1] += "\0\0old"s;
  if (chance.one_in(40)) fields[3] += "\0"s;
  std::string result;
  for (const std::string& each : fields) result += (result.empty() ? "" : ",") + field(chance, each);
  return result + line_break;
}

}  // namespace

int main() {
  Chance chance;
  std::string csv = "ID,Name,Address,Suburb,Phone,Amount,Quantity,Notes,Tags" + line_break;
  for (int id = 1; id <= row_count; ++id) csv += row(chance, id);
  return std::fwrite(csv.data(), 1, csv.size(), stdout) == csv.size() ? 0 : 1;
}
