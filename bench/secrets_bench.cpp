#include <benchmark/benchmark.h>

#include "bench/toolkit.hpp"
#include "controls/name_case.hpp"

namespace talutil {
namespace {

// The first text of a process has to wait for its key.
void first_encryption(benchmark::State& state) {
  for (auto _ : state) {
    Toolkit toolkit;
    benchmark::DoNotOptimize(toolkit.utils.CryptoEncryptString(u"x"));
  }
}
BENCHMARK(first_encryption)->Unit(benchmark::kMillisecond);

void sizes(benchmark::internal::Benchmark* bench) {
  bench->ArgName("bytes")->Arg(1 << 10)->Arg(10 << 20)->Unit(benchmark::kMicrosecond);
}

void encrypt(benchmark::State& state) {
  Toolkit toolkit;
  const Text text(static_cast<std::size_t>(state.range(0)) / sizeof(char16_t), u'x');
  for (auto _ : state) benchmark::DoNotOptimize(toolkit.utils.CryptoEncryptString(text));
  state.SetBytesProcessed(state.iterations() * state.range(0));
}
BENCHMARK(encrypt)->Apply(sizes);

void decrypt(benchmark::State& state) {
  Toolkit toolkit;
  const Text cipher =
      toolkit.utils.CryptoEncryptString(Text(static_cast<std::size_t>(state.range(0)) / sizeof(char16_t), u'x'));
  for (auto _ : state) benchmark::DoNotOptimize(toolkit.utils.CryptoDecryptString(cipher));
  state.SetBytesProcessed(state.iterations() * state.range(0));
}
BENCHMARK(decrypt)->Apply(sizes);

// One line of names, which must not take longer per letter than a short one.
void name_case_grows(benchmark::State& state) {
  Text text;
  while (text.size() < static_cast<std::size_t>(state.range(0))) text += u"LUDWIG VAN O\u00B4MCDONALD-SMITH'S 3RD NSW ";
  for (auto _ : state) benchmark::DoNotOptimize(name_case(text));
  state.SetComplexityN(state.range(0));
}
BENCHMARK(name_case_grows)
    ->ArgName("characters")
    ->RangeMultiplier(8)
    ->Range(1 << 10, 8 << 20)
    ->Unit(benchmark::kMicrosecond)
    ->Complexity(benchmark::oN);

void password(benchmark::State& state) {
  Toolkit toolkit;
  for (auto _ : state) benchmark::DoNotOptimize(toolkit.utils.GenerateFilePassword(32767, 2, 0));
}
BENCHMARK(password)->Unit(benchmark::kMicrosecond);

}  // namespace
}  // namespace talutil
