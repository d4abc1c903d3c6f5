#include <benchmark/benchmark.h>

// Figures mean little without what they were measured with; the machine is told by the library itself.
int main(int argc, char** argv) {
  benchmark::AddCustomContext("compiler", __VERSION__);
#ifdef __OPTIMIZE__
  benchmark::AddCustomContext("optimised", "yes");
#else
  benchmark::AddCustomContext("optimised", "NO: build with CMAKE_BUILD_TYPE=Release");
#endif
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
