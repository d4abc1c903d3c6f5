#include <benchmark/benchmark.h>

#include <chrono>
#include <sstream>
#include <string>
#include <vector>

#ifdef TALUTIL_BENCH_DATE
#include <date/date.h>
#endif

#include "bench/toolkit.hpp"

namespace talutil {
namespace {

void text_to_date(benchmark::State& state, TextView text) {
  for (auto _ : state) benchmark::DoNotOptimize(talutil::text_to_date(text, 2009));
}
BENCHMARK_CAPTURE(text_to_date, day, u"05/03/2009");
BENCHMARK_CAPTURE(text_to_date, day_and_time, u"05/03/2009 13:45");
BENCHMARK_CAPTURE(text_to_date, month_name, u"5 March 2009 1:45 PM");
BENCHMARK_CAPTURE(text_to_date, no_date, u"31/02/2009");

void format_date(benchmark::State& state, TextView pattern) {
  for (auto _ : state) benchmark::DoNotOptimize(talutil::format_date({39877.5729166667}, pattern));
}
BENCHMARK_CAPTURE(format_date, day, u"DD/MM/YYYY");
BENCHMARK_CAPTURE(format_date, day_and_time, u"DD/MM/YYYY HH:MM");

// ---- a million texts: read and written, by us and by the reference implementation of the standard's calendar

constexpr std::int32_t date_count = 1'000'000;

/// Days of two centuries in an order without a pattern.
template <class String>
std::vector<String> day_texts() {
  std::vector<String> texts;
  std::uint32_t random = 42;
  for (std::int32_t i = 0; i < date_count; ++i) {
    random = random * 1664525 + 1013904223;
    const Date day{static_cast<double>(1 + (random >> 8U) % 73000)};
    const Text text = talutil::format_date(day, u"DD/MM/YYYY");
    texts.emplace_back(text.begin(), text.end());
  }
  return texts;
}

void million_texts(benchmark::State& state) {
  const auto texts = day_texts<Text>();
  for (auto _ : state) {
    for (const Text& text : texts) {
      if (talutil::format_date(*talutil::text_to_date(text, 2009), u"DD/MM/YYYY") != text)
        state.SkipWithError("another date");
    }
  }
}
BENCHMARK(million_texts)->Unit(benchmark::kMillisecond);

#ifdef TALUTIL_BENCH_DATE
void million_texts_by_date_library(benchmark::State& state) {
  const auto texts = day_texts<std::string>();
  std::istringstream in;
  std::ostringstream out;
  for (auto _ : state) {
    for (const std::string& text : texts) {
      date::sys_days day;
      in.clear();
      in.str(text);
      date::from_stream(in, "%d/%m/%Y", day);
      out.str({});
      date::to_stream(out, "%d/%m/%Y", day);
      if (out.str() != text) state.SkipWithError("another date");
    }
  }
}
BENCHMARK(million_texts_by_date_library)->Unit(benchmark::kMillisecond);
#endif

template <class Call>
void member(benchmark::State& state, Call call) {
  Toolkit toolkit;
  for (auto _ : state) benchmark::DoNotOptimize(call(toolkit.utils));
}
BENCHMARK_CAPTURE(member, IncDay_1, [](ORVUtils& utils) { return utils.IncDay(u"05/03/2009", 1); });
BENCHMARK_CAPTURE(member, IncDay_32767, [](ORVUtils& utils) { return utils.IncDay(u"05/03/2009", 32767); });
BENCHMARK_CAPTURE(member, IncMonth_32767, [](ORVUtils& utils) { return utils.IncMonth(u"05/03/2009", 32767); });
BENCHMARK_CAPTURE(member, GetWeekNumber, [](ORVUtils& utils) { return utils.GetWeekNumber(u"05/03/2009"); });
BENCHMARK_CAPTURE(member, WeekYearToDate, [](ORVUtils& utils) {
  std::int16_t week = 10;
  return utils.WeekYearToDate(week, 2009, 1);
});

/// Compares two hundred years with one day, alternating calls; "ratio" is the first divided by the second.
template <class Call>
void long_and_short_period(benchmark::State& state, Call call) {
  using Clock = std::chrono::steady_clock;
  constexpr int batch = 1000;
  Toolkit toolkit;
  const Variant start = u"05/03/1809";
  const auto time = [&](const Variant& end) {
    const auto begin = Clock::now();
    for (int i = 0; i < batch; ++i) benchmark::DoNotOptimize(call(toolkit.utils, start, end));
    return std::chrono::duration<double>(Clock::now() - begin).count();
  };
  double long_period = 0;
  double short_period = 0;
  for (auto _ : state) {
    long_period += time(u"05/03/2009");
    short_period += time(u"06/03/1809");
  }
  state.counters["ratio"] = long_period / short_period;
}
BENCHMARK_CAPTURE(long_and_short_period, GetDaysInPeriod,
                  [](ORVUtils& utils, const Variant& start, const Variant& end) {
                    return utils.GetDaysInPeriod(start, end);
                  })
    ->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(long_and_short_period, GetMonthsInPeriod,
                  [](ORVUtils& utils, const Variant& start, const Variant& end) {
                    return utils.GetMonthsInPeriod(start, end);
                  })
    ->Unit(benchmark::kMicrosecond);

}  // namespace
}  // namespace talutil
