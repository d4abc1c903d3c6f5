#include <benchmark/benchmark.h>

#include <cstdint>
#include <memory>
#include <random>
#include <vector>

#include "bench/toolkit.hpp"

namespace talutil {
namespace {

constexpr std::int64_t kilobyte = 1024;
constexpr std::int64_t megabyte = 1024 * kilobyte;

/// Words of the given letters with blanks, line breaks and commas in between, and one special character in fifty: text
/// as users type and paste it. No blanks at the ends, because those would be trimmed.
Text dirty_text(std::size_t bytes, TextView letters) {
  constexpr TextView specials = u"&\"'\t#><?";
  std::mt19937 random(42);
  const auto below = [&random](std::size_t limit) { return random() % limit; };
  Text text;
  text.reserve(bytes / sizeof(char16_t));
  while (text.size() < bytes / sizeof(char16_t)) {
    const std::size_t dice = below(300);
    if (dice < 6) {
      text += specials[below(specials.size())];
    } else if (dice < 50) {
      text += u' ';
    } else if (dice < 56) {
      text += u',';
    } else if (dice < 58) {
      text += u"\r\n";
    } else {
      text += letters[below(letters.size())];
    }
  }
  text.front() = text.back() = u'x';
  return text;
}

constexpr TextView plain_letters = u"abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789.-";
constexpr TextView accented_letters = u"\u00E0\u00E9\u00EA\u00EF\u00F4\u00F6\u00FC\u00E7\u00F1\u00DF";
constexpr TextView other_letters =
    u"\u0416\u0439\u0446\u0443\u043A\u0435\u043D\u03B1\u03C9\u0142\u017A\u010D\u0159\u0151\u5E02\u8857\u6771\u4EAC";

enum class Letters : std::int64_t { plain, accented, other };

Text dirty_text(std::int64_t bytes, Letters letters) {
  constexpr TextView choices[] = {plain_letters, accented_letters, other_letters};
  return dirty_text(static_cast<std::size_t>(bytes), choices[static_cast<std::size_t>(letters)]);
}

/// Two flat buffers, each large enough for a text after all replacements.
struct FlatBuffers {
  explicit FlatBuffers(std::size_t length)
      : first(std::make_unique<char16_t[]>(3 * length)), second(std::make_unique<char16_t[]>(3 * length)) {}
  std::unique_ptr<char16_t[]> first;
  std::unique_ptr<char16_t[]> second;
};

/// The baseline: the eight replacements as a plain loop over a flat copy, in existing buffers. `code_of` determines
/// what is compared.
template <class CodeOf>
TextView eight_plain_passes(const Text& text, FlatBuffers& buffers, CodeOf code_of) {
  const struct {
    char16_t from;
    TextView to;
  } steps[] = {{u'&', u"and"}, {u'"', u""}, {u'\'', u"\u00B4"}, {u'\t', u""},
               {u'#', u""},    {u'>', u""}, {u'<', u""},        {u'?', u""}};
  char16_t* source = buffers.first.get();
  char16_t* target = buffers.second.get();
  std::size_t length = text.copy(source, text.size());
  for (const auto& step : steps) {
    char16_t* end = target;
    for (std::size_t i = 0; i < length; ++i) {
      if (code_of(source[i]) == step.from) {
        for (const char16_t unit : step.to) *end++ = unit;
      } else {
        *end++ = source[i];
      }
    }
    length = static_cast<std::size_t>(end - target);
    std::swap(source, target);
  }
  return {source, length};
}

void report(benchmark::State& state, std::int64_t bytes) {
  state.SetComplexityN(bytes);
  state.SetBytesProcessed(state.iterations() * bytes);
}

template <class CodeOf>
void measure_yardstick(benchmark::State& state, CodeOf code_of) {
  const Text text = dirty_text(state.range(0), Letters{state.range(1)});
  FlatBuffers buffers(text.size());
  for (auto _ : state) benchmark::DoNotOptimize(eight_plain_passes(text, buffers, code_of));
  report(state, state.range(0));
}

/// Compares code units: the same for plain and accented letters, but does not remove other letters that should be
/// removed.
void eight_passes(benchmark::State& state) {
  measure_yardstick(state, [](char16_t unit) { return unit; });
}

/// Compares ANSI codes, as the members do, using a table of all codes: the same result for all letters.
void eight_passes_by_code(benchmark::State& state) {
  std::vector<std::uint8_t> codes;
  for (std::uint32_t unit = 0; unit <= 0xFFFF; ++unit) codes.push_back(ansi_code(static_cast<char16_t>(unit)));
  const auto code_of = [&codes](char16_t unit) { return codes[unit]; };
  measure_yardstick(state, code_of);

  const Text text = dirty_text(state.range(0), Letters{state.range(1)});
  FlatBuffers buffers(text.size());
  if (eight_plain_passes(text, buffers, code_of) != Toolkit().utils.VerifyTextData(0, 0, text)) {
    state.SkipWithError("the yardstick and VerifyTextData differ");
  }
}

void verify_text_data(benchmark::State& state) {
  Toolkit toolkit;
  const Variant text = dirty_text(state.range(0), Letters{state.range(1)});
  for (auto _ : state) benchmark::DoNotOptimize(toolkit.utils.VerifyTextData(0, 0, text));
  report(state, state.range(0));
}

// A field of 64 bytes, and a megabyte, whose times are to be compared; for plain, accented and other letters.
void sizes_and_letters(benchmark::internal::Benchmark* bench) {
  bench->ArgNames({"bytes", "letters"})->ArgsProduct({{64, megabyte}, {0, 1, 2}});
}
BENCHMARK(eight_passes)->Apply(sizes_and_letters);
BENCHMARK(eight_passes_by_code)->Apply(sizes_and_letters);
BENCHMARK(verify_text_data)->Apply(sizes_and_letters);

/// Runs one member on texts of growing size; the last lines of its table show whether its time grows in proportion.
template <class Call>
void grow(benchmark::State& state, Letters letters, Call call) {
  Toolkit toolkit;
  const Text text = dirty_text(state.range(0), letters);
  for (auto _ : state) benchmark::DoNotOptimize(call(toolkit.utils, text));
  report(state, state.range(0));
}

void growing_sizes(benchmark::internal::Benchmark* bench) {
  bench->ArgName("bytes")
      ->RangeMultiplier(4)
      ->Range(64 * kilobyte, 16 * megabyte)
      ->Unit(benchmark::kMicrosecond)
      ->Complexity(benchmark::oN);
}

BENCHMARK_CAPTURE(grow, VerifyTextData, Letters::plain, [](ORVUtils& utils, const Text& text) {
  return utils.VerifyTextData(0, 4, text);
})->Apply(growing_sizes);

BENCHMARK_CAPTURE(grow, StringReplace, Letters::plain, [](ORVUtils& utils, const Text& text) {
  return utils.StringReplace(text, u"&", u"and");
})->Apply(growing_sizes);

BENCHMARK_CAPTURE(grow, StringReplace_other_letters, Letters::other, [](ORVUtils& utils, const Text& text) {
  return utils.StringReplace(text, u"&", u"and");
})->Apply(growing_sizes);

BENCHMARK_CAPTURE(grow, StringReplaceWord, Letters::plain, [](ORVUtils& utils, const Text& text) {
  return utils.StringReplaceWord(text, u"\r\n", u" ");
})->Apply(growing_sizes);

// A word half as long as the text that almost occurs at every position.
BENCHMARK_CAPTURE(grow, StringReplaceWord_repetitive, Letters::plain, [](ORVUtils& utils, const Text& text) {
  const Text run(text.size(), u'a');
  return utils.StringReplaceWord(run, run.substr(0, run.size() / 2) + u"b", u"");
})->Apply(growing_sizes);

BENCHMARK_CAPTURE(grow, ReadCommaDelimStrToList, Letters::plain, [](ORVUtils& utils, const Text& text) {
  TextArray list;
  return utils.ReadCommaDelimStrToList(text, list, u",");
})->Apply(growing_sizes);

BENCHMARK_CAPTURE(grow, CRLFStringReplace, Letters::plain, [](ORVUtils& utils, const Text& text) {
  return utils.CRLFStringReplace(text, u"|");
})->Apply(growing_sizes);

}  // namespace
}  // namespace talutil
