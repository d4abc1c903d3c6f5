// Compares reading and formatting dates with the platform's functions, alternating in one process.
#include <array>
#include <cstdio>
#include <cstdlib>

#include "automation/date.hpp"
#include "timing.hpp"

using namespace talutil;
using namespace talutil::hosts;

namespace {

constexpr LCID british_english = 0x0809;
constexpr int repetitions = 31;
constexpr int rounds = 500;

constexpr TextView texts[] = {u"5/3/2009",   u"05/03/2009 13:45", u"5 March 2009",        u"2009-03-05",
                              u"05-03-2009", u"13:45:30",         u"5/3/2009 1:45:30 PM", u"31/02/2009"};
constexpr TextView patterns[] = {u"DD/MM/YYYY", u"DD/MM/YYYY HH:MM", u"HH:MM", u"DDMMYYYY"};

template <class Call>
double time_of(Call call) {
  const double start = now_in_microseconds();
  for (int i = 0; i < rounds; ++i) call();
  return now_in_microseconds() - start;
}

/// The median of the ratios of the two, measured alternately.
template <class Ours, class Platforms>
void compare(const char* what, std::size_t items, Ours ours, Platforms platforms) {
  std::vector<double> our_times;
  std::vector<double> platform_times;
  std::vector<double> ratios;
  for (int i = 0; i < repetitions; ++i) {
    our_times.push_back(time_of(ours));
    platform_times.push_back(time_of(platforms));
    ratios.push_back(our_times.back() / platform_times.back());
  }
  const double each = 1000.0 / (rounds * static_cast<double>(items));
  std::printf("%s: TALUtil %.0f ns, the platform %.0f ns, ratio %.2f (goal: at most 0.50)\n", what,
              median(our_times) * each, median(platform_times) * each, median(ratios));
}

void read_texts() {
  volatile double sink = 0;
  std::array<Text, std::size(texts)> copies;
  std::ranges::copy(texts, copies.begin());
  compare(
      "reading a date", copies.size(),
      [&] {
        for (const Text& text : copies) sink = text_to_date(text, 2009).value_or(Date{}).days;
      },
      [&] {
        for (Text& text : copies) {
          double days = 0;
          VarDateFromStr(reinterpret_cast<OLECHAR*>(text.data()), british_english, 0, &days);
          sink = days;
        }
      });
}

void format_dates() {
  constexpr Date date{39877.5729166667};
  volatile std::size_t sink = 0;
  std::array<Text, std::size(patterns)> copies;
  std::ranges::copy(patterns, copies.begin());
  compare(
      "formatting a date", copies.size(),
      [&] {
        for (const Text& pattern : copies) sink = format_date(date, pattern).size();
      },
      [&] {
        VARIANT value{};
        V_VT(&value) = VT_DATE;
        V_DATE(&value) = date.days;
        for (Text& pattern : copies) {
          BSTR text = nullptr;
          VarFormat(&value, reinterpret_cast<OLECHAR*>(pattern.data()), 1, 1, 0, &text);
          sink = SysStringLen(text);
          SysFreeString(text);
        }
      });
}

}  // namespace

int main() {
  read_texts();
  format_dates();
  return 0;
}
