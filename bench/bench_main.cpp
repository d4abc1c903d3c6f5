#include <benchmark/benchmark.h>
#include <malloc.h>

#include <limits>

// Results mean little without the machine they were measured on; the benchmark library reports that itself.
int main(int argc, char** argv) {
  benchmark::AddCustomContext("compiler", __VERSION__);
#ifdef __OPTIMIZE__
  benchmark::AddCustomContext("optimised", "yes");
#else
  benchmark::AddCustomContext("optimised", "NO: build with CMAKE_BUILD_TYPE=Release");
#endif
  // Otherwise large blocks would be returned to the system after every round, and fresh pages cost more than the work
  // to be measured, several times more on virtual machines.
  mallopt(M_MMAP_MAX, 0);
  mallopt(M_TRIM_THRESHOLD, std::numeric_limits<int>::max());
  benchmark::AddCustomContext("memory", "kept between rounds");

  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
