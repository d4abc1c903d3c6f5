#pragma once

#include <algorithm>
#include <vector>

#include "platform/win32/windows.hpp"

/// Shared by the programs that measure under Windows.
namespace talutil::hosts {

inline double now_in_microseconds() {
  LARGE_INTEGER count;
  LARGE_INTEGER frequency;
  QueryPerformanceCounter(&count);
  QueryPerformanceFrequency(&frequency);
  return static_cast<double>(count.QuadPart) * 1e6 / static_cast<double>(frequency.QuadPart);
}

inline double median(std::vector<double> values) {
  std::ranges::sort(values);
  return values[values.size() / 2];
}

template <class Call>
double nanoseconds_of(Call&& call, int calls = 20'000) {
  constexpr int repetitions = 15;
  std::vector<double> times;
  for (int i = 0; i < repetitions; ++i) {
    const double start = now_in_microseconds();
    for (int j = 0; j < calls; ++j) call();
    times.push_back((now_in_microseconds() - start) * 1000 / calls);
  }
  return median(times);
}

}  // namespace talutil::hosts
