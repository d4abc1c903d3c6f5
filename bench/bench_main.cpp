#include <benchmark/benchmark.h>
#include <malloc.h>

#include <limits>

// Figures mean little without what they were measured with; the machine is told by the library itself.
int main(int argc, char** argv) {
  benchmark::AddCustomContext("compiler", __VERSION__);
#ifdef __OPTIMIZE__
  benchmark::AddCustomContext("optimised", "yes");
#else
  benchmark::AddCustomContext("optimised", "NO: build with CMAKE_BUILD_TYPE=Release");
#endif
  // Large blocks would go back to the system after every round, and its fresh pages cost more than the work that
  // is to be measured, on virtual machines several times more.
  mallopt(M_MMAP_MAX, 0);
  mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
  benchmark::AddCustomContext("memory", "kept between rounds");

  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
