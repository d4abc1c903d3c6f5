// Cost against size, for each member that takes a text, a list or a grid: lines of NAME<TAB>SIZE<TAB>SECONDS for a
// script to read, and for each name a last line "# NAME<TAB>EXPONENT", the slope of the times in a diagram with two
// logarithmic scales: 1 is a straight line. Sizes are bytes of a text, elements of a list, rows of a grid.
//   lines_bench [NAME...]
#include <malloc.h>
#include <time.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <functional>
#include <limits>
#include <memory>
#include <string_view>
#include <vector>

#include "bench/quick_grid.hpp"
#include "bench/toolkit.hpp"
#include "controls/grid.hpp"

namespace talutil {
namespace {

/// Of the processor, because other programs would lengthen long calls and, with the least of many, not short ones.
double seconds_of_processor() {
  timespec now{};
  clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
  return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

double time_of(const std::function<void()>& call) {
  const double start = seconds_of_processor();
  call();
  return seconds_of_processor() - start;
}

/// The least time of one call, after one that warms up; as many calls as fit into a moment, which lets small sizes
/// repeat often.
double least_time(const std::function<void()>& call) {
  constexpr double moment = 0.15;
  constexpr int most_calls = 2000;
  double least = std::numeric_limits<double>::max();
  double total = time_of(call);
  for (int i = 0; i < 3 || (total < moment && i < most_calls); ++i) {
    const double time = time_of(call);
    total += time;
    least = std::min(least, time);
  }
  return least;
}

struct Point {
  double size;
  double seconds;
};

/// The slope of the straight line nearest to the points' logarithms.
double exponent_of(const std::vector<Point>& points) {
  const auto mean = [&](auto value) {
    double sum = 0;
    for (const Point& point : points) sum += value(std::log(point.size), std::log(point.seconds));
    return sum / static_cast<double>(points.size());
  };
  const double x = mean([](double size, double) { return size; });
  const double y = mean([](double, double time) { return time; });
  const double covariance = mean([&](double size, double time) { return (size - x) * (time - y); });
  return covariance / mean([&](double size, double) { return (size - x) * (size - x); });
}

/// A member, prepared for a size; what is returned is measured.
struct Line {
  const char* name;
  std::vector<std::size_t> sizes;
  std::function<std::function<void()>(std::size_t size)> prepare;
};

Toolkit& toolkit() {
  static Toolkit made;
  return made;
}

ORVUtils& utils() { return toolkit().utils; }

const std::vector<std::size_t> bytes_to_64_mb = {1U << 16U, 1U << 18U, 1U << 20U, 1U << 22U, 1U << 24U, 1U << 26U};
const std::vector<std::size_t> bytes_to_64_kb = {1U << 12U, 1U << 13U, 1U << 14U, 1U << 15U, 65534};
const std::vector<std::size_t> rows_to_a_million = {1000, 3000, 10'000, 30'000, 100'000, 300'000, 1'000'000};

/// Repeats a piece of text. The end has no blank, which would be trimmed.
Text repeated(TextView piece, std::size_t bytes) {
  Text text;
  text.reserve(bytes / sizeof(char16_t) + piece.size());
  while (text.size() < bytes / sizeof(char16_t)) text += piece;
  text.resize(bytes / sizeof(char16_t));
  text.back() = u'x';
  return text;
}

constexpr TextView notes = u"Smith & Sons, 12 King's Parade\r\nSt Alban's, \"corner\" of Main Rd #5, ";
constexpr TextView fields = u"alpha,beta,12,";
constexpr TextView digits = u"7041";
constexpr TextView blanks_and_digits = u"a 1 ";

/// A line for a member with one long text. The call's result is dropped.
template <class Call>
Line text_line(const char* name, TextView piece, const std::vector<std::size_t>& sizes, Call call) {
  return {name, sizes, [=](std::size_t size) {
            const auto text = std::make_shared<const Text>(repeated(piece, size));
            return [=] { call(*text); };
          }};
}

/// The same with the text as a variant.
template <class Call>
Line value_line(const char* name, TextView piece, Call call) {
  return {name, bytes_to_64_mb, [=](std::size_t size) {
            const auto value = std::make_shared<const Variant>(repeated(piece, size));
            return [=] { call(*value); };
          }};
}

template <class Call>
Line list_line(const char* name, Call call) {
  return {name, rows_to_a_million, [=](std::size_t size) {
            const auto list = std::make_shared<TextArray>();
            list->items.assign(size, u"A line of text as it stands in lists");
            list->allocated = true;
            return [=] { call(*list); };
          }};
}

template <class Call>
Line grid_line(const char* name, Call call) {
  return {name, rows_to_a_million, [=](std::size_t size) {
            const auto grid = std::make_shared<QuickGrid>(static_cast<std::int32_t>(size));
            return [=] { call(ObjectRef(grid)); };
          }};
}

/// A table of our own with five columns.
std::shared_ptr<Grid> filled_grid(std::size_t rows) {
  const auto grid = std::make_shared<Grid>(toolkit().library.platform());
  grid->put_Cols(5);
  for (std::size_t r = 0; r < rows; ++r) grid->AddItem(u"Smith, John\t120\tMain Rd\t5/3/2009\tyes", -1);
  return grid;
}

Text saved_text(TextView piece, std::size_t size) {
  const Text path = u"C:\\lines.txt";
  toolkit().platform.files.put(path, to_ansi(repeated(piece, size)));
  return path;
}

void add_cleaning(std::vector<Line>& lines) {
  for (const std::int16_t extras : {std::int16_t{0}, std::int16_t{3}, std::int16_t{4}, std::int16_t{5}}) {
    static const char* const names[] = {"VerifyTextData",  "", "", "VerifyTextData 3", "VerifyTextData 4",
                                        "VerifyTextData 5"};
    lines.push_back(value_line(names[extras], notes,
                               [extras](const Variant& value) { (void)utils().VerifyTextData(0, extras, value); }));
  }
  lines.push_back(value_line("VerifyIntData", digits, [](const Variant& value) {
    try {
      (void)utils().VerifyIntData(0, value);
    } catch (const RunTimeError&) {
      // Too large for a number, which is known only at its end.
    }
  }));
  lines.push_back(value_line("ConvertCase", notes, [](const Variant& value) {
    utils().settings().iCharactercase = 1;
    (void)utils().ConvertCase(0, value);
  }));
  lines.push_back(value_line("ConvertCaseSuburbs", notes, [](const Variant& value) {
    utils().settings().iCharacterCaseSuburbs = 1;
    (void)utils().ConvertCaseSuburbs(value);
  }));
  const auto text = [&](const char* name, TextView piece, auto call) {
    lines.push_back(text_line(name, piece, bytes_to_64_mb, call));
  };
  // What the others are compared with: the caches of the processor bend even this line.
  text("a bare copy", notes, [](const Text& s) {
    const Text copy(s);
    [[maybe_unused]] const volatile char16_t last = copy.back();
  });
  text("VerifyMemField", notes, [](const Text& s) { (void)utils().VerifyMemField(s); });
  text("StripNulls", notes, [](const Text& s) { (void)utils().StripNulls(s); });
  text("RemoveNumberFromString", notes, [](const Text& s) { (void)utils().RemoveNumberFromString(s); });
  text("RemoveStringsFromNumber", notes, [](const Text& s) {
    Text character;
    (void)utils().RemoveStringsFromNumber(0, s, character);
  });
  text("StringReplace", notes, [](const Text& s) { (void)utils().StringReplace(s, u"&", u"and"); });
  text("CRLFStringReplace", notes, [](const Text& s) { (void)utils().CRLFStringReplace(s, u"|"); });
  text("StringReplaceWord", notes, [](const Text& s) { (void)utils().StringReplaceWord(s, u"Sons", u"Co"); });
  text("StringReplaceWord half", u"a",
       [](const Text& s) { (void)utils().StringReplaceWord(s, s.substr(0, s.size() / 2) + u"b", u""); });
}

void add_looking_up(std::vector<Line>& lines) {
  const auto text = [&](const char* name, TextView piece, auto call) {
    lines.push_back(text_line(name, piece, bytes_to_64_mb, call));
  };
  text("GetData", fields, [](const Text& s) {
    const std::int32_t count = utils().SubStrCount(u",", s);
    (void)utils().GetData(s, count - 1, count);
  });
  text("MyPos", fields, [](const Text& s) { (void)utils().MyPos(u"!", s, 1); });
  text("SubStrCount", fields, [](const Text& s) { (void)utils().SubStrCount(u",", s); });
  text("ReadCommaDelimStrToList", fields, [](const Text& s) {
    TextArray list;
    (void)utils().ReadCommaDelimStrToList(s, list, u",");
  });
  text("IsValueNumber", digits, [](const Text& s) { (void)utils().IsValueNumber(s.substr(0, s.size() - 1)); });
  text("IsValueDate", notes, [](const Text& s) { (void)utils().IsValueDate(s); });
  text("IsValueTime", notes, [](const Text& s) { (void)utils().IsValueTime(s); });
  text("VerifyEmail", digits, [](const Text& s) { (void)utils().VerifyEmail(s); });
  text("VerifyPasswordText", digits,
       [](const Text& s) { (void)utils().VerifyPasswordText(s.substr(0, s.size() - 1)); });
  text("NumbersInString", u"abc ", [](const Text& s) { (void)utils().NumbersInString(s); });
  text("CryptoEncryptString", notes, [](const Text& s) { (void)utils().CryptoEncryptString(s); });
  lines.push_back({"CryptoDecryptString", bytes_to_64_mb, [](std::size_t size) {
                     const auto cipher = std::make_shared<Text>(utils().CryptoEncryptString(repeated(notes, size)));
                     return [=] { (void)utils().CryptoDecryptString(*cipher); };
                   }});
  // These raise an error for more than 32,767 characters.
  const auto short_text = [&](const char* name, TextView piece, auto call) {
    lines.push_back(text_line(name, piece, bytes_to_64_kb, call));
  };
  short_text("StringPosition", blanks_and_digits, [](const Text& s) { (void)utils().StringPosition(s + u"5", 1); });
  short_text("StringRestoreCRLF", u"abc||", [](const Text& s) { (void)utils().StringRestoreCRLF(s, u"|"); });
  short_text("ReverseString", notes, [](const Text& s) { (void)utils().ReverseString(s); });
  short_text("MyInstrDelim", fields, [](const Text& s) { (void)utils().MyInstrDelim(u"no", s, u","); });
  short_text("AddZeros", digits,
             [](const Text& s) { (void)utils().AddZeros(u"7", static_cast<std::int16_t>(s.size()), -1); });
}

void add_files(std::vector<Line>& lines) {
  lines.push_back({"LoadTextBox", bytes_to_64_mb, [](std::size_t size) {
                     const Text path = saved_text(notes, size);
                     return [=] { (void)utils().LoadTextBox(path); };
                   }});
  lines.push_back({"OpenFile", bytes_to_64_mb, [](std::size_t size) {
                     const Text path = saved_text(notes, size);
                     return [=] {
                       TextArray list;
                       (void)utils().OpenFile(path, list, 0);
                     };
                   }});
  lines.push_back({"OpenBigFile", bytes_to_64_mb, [](std::size_t size) {
                     const Text path = saved_text(notes, size);
                     return [=] {
                       TextArray list;
                       (void)utils().OpenBigFile(path, list, 1);
                     };
                   }});
  lines.push_back(
      text_line("SaveTextBox", notes, bytes_to_64_mb, [](const Text& s) { utils().SaveTextBox(s, u"C:\\saved.txt"); }));
  lines.push_back(list_line("SaveBigFile", [](const TextArray& list) { utils().SaveBigFile(list, u"C:\\saved.txt"); }));
  lines.push_back(list_line("IndexInList", [](const TextArray& list) { (void)utils().IndexInList(list, u"A loss"); }));
}

void add_grids(std::vector<Line>& lines) {
  lines.push_back(grid_line("SelectGridRows", [](const Variant& grid) { utils().SelectGridRows(0, grid, 1); }));
  lines.push_back(
      grid_line("CountGridSelectedRows", [](const Variant& grid) { (void)utils().CountGridSelectedRows(0, grid); }));
  lines.push_back(grid_line("ExportGridData", [](const Variant& grid) {
    toolkit().platform.chosen_files = {u"C:\\x.txt"};
    utils().ExportGridData(grid, 0, Boolean(true), u"x");
  }));
  lines.push_back(
      {"Grid.AddItem", rows_to_a_million, [](std::size_t rows) { return [=] { (void)filled_grid(rows); }; }});
  constexpr std::int16_t comma_text = 3;
  lines.push_back({"Grid.SaveGrid", rows_to_a_million, [](std::size_t rows) {
                     const auto grid = filled_grid(rows);
                     return [=] { grid->SaveGrid(u"C:\\grid.csv", comma_text, Boolean(true)); };
                   }});
  lines.push_back({"Grid.LoadGrid", rows_to_a_million, [](std::size_t rows) {
                     filled_grid(rows)->SaveGrid(u"C:\\grid.csv", comma_text, Boolean(true));
                     const auto grid = filled_grid(0);
                     return [=] { grid->LoadGrid(u"C:\\grid.csv", comma_text, Boolean(true)); };
                   }});
}

void measure(const Line& line) {
  std::vector<Point> points;
  for (const std::size_t size : line.sizes) {
    const double seconds = least_time(line.prepare(size));
    points.push_back({static_cast<double>(size), seconds});
    std::printf("%s\t%zu\t%.9f\n", line.name, size, seconds);
  }
  std::printf("# %s\t%.3f\n", line.name, exponent_of(points));
  std::fflush(stdout);
}

}  // namespace
}  // namespace talutil

int main(int count, char** arguments) {
  using namespace talutil;
  // As in bench_main.cpp: fresh pages from the system would cost more than the work.
  mallopt(M_MMAP_MAX, 0);
  mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
  std::vector<Line> lines;
  add_cleaning(lines);
  add_looking_up(lines);
  add_files(lines);
  add_grids(lines);
  const std::vector<std::string_view> wanted(arguments + 1, arguments + count);
  for (const Line& line : lines) {
    if (wanted.empty() || std::ranges::count(wanted, line.name) > 0) measure(line);
  }
  return 0;
}
