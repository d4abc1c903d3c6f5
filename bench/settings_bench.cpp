#include <benchmark/benchmark.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <filesystem>
#include <random>

#include "automation/numbers.hpp"
#include "platform/posix/posix_settings.hpp"

namespace talutil {
namespace {

/// A store in a folder that is removed with the program.
struct Scratch {
  std::string folder = [] {
    std::string pattern = std::filesystem::temp_directory_path() / "talutil-bench-XXXXXX";
    return std::string(mkdtemp(pattern.data()));
  }();
  Scratch() = default;
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;
  ~Scratch() { std::filesystem::remove_all(folder); }
  [[nodiscard]] std::string hive() const { return folder + "/hive.db"; }
};

constexpr std::int32_t keys = 1000;

void store_writes(benchmark::State& state) {
  const Scratch scratch;
  posix::Hive hive(scratch.hive());
  posix::PosixSettingsStore store(hive);
  std::int32_t i = 0;
  for (auto _ : state) {
    ++i;
    store.put(u"Application", u"Section", number_to_text(i % keys), number_to_text(i));
  }
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(store_writes)->UseRealTime();

void store_reads(benchmark::State& state) {
  const Scratch scratch;
  posix::Hive hive(scratch.hive());
  posix::PosixSettingsStore store(hive);
  for (std::int32_t i = 0; i < keys; ++i) store.put(u"Application", u"Section", number_to_text(i), u"value");
  std::int32_t i = 0;
  for (auto _ : state) benchmark::DoNotOptimize(store.value(u"Application", u"Section", number_to_text(++i % keys)));
  state.SetItemsProcessed(state.iterations());
}
BENCHMARK(store_reads)->UseRealTime();

// ---- 8 processes of 1,000 writes each, half of them killed at a random moment

/// Writes settings and reports each acknowledged write's number through a pipe.
[[noreturn]] void write_settings(const std::string& path, std::int32_t process, int acknowledgements) {
  posix::Hive hive(path);
  posix::PosixSettingsStore store(hive);
  for (std::int32_t i = 0; i < keys; ++i) {
    store.put(u"Process " + number_to_text(process), u"S", number_to_text(i), Text(100, u'x') + number_to_text(i));
    if (write(acknowledgements, &i, sizeof i) != sizeof i) _exit(1);
  }
  _exit(0);
}

void settings_of_eight(benchmark::State& state) {
  constexpr std::size_t processes = 8;
  struct Writer {
    pid_t id = -1;
    int acknowledgements = -1;
  };
  for (auto _ : state) {
    const Scratch scratch;
    std::array<Writer, processes> writers;
    for (std::size_t i = 0; i < processes; ++i) {
      std::array<int, 2> ends{};
      if (pipe(ends.data()) != 0) return state.SkipWithError("no pipe");
      const pid_t child = fork();
      if (child == 0) write_settings(scratch.hive(), static_cast<std::int32_t>(i), ends[1]);
      close(ends[1]);
      writers[i] = {child, ends[0]};
    }
    std::mt19937 random(std::random_device{}());
    for (std::size_t i = 0; i < processes; i += 2) {
      usleep(static_cast<useconds_t>(random() % 100'000));
      kill(writers[i].id, SIGKILL);
    }
    posix::Hive hive(scratch.hive());
    posix::PosixSettingsStore store(hive);
    std::int64_t acknowledged = 0;
    std::int64_t lost = 0;
    for (std::size_t i = 0; i < processes; ++i) {
      const Text application = u"Process " + number_to_text(static_cast<std::int32_t>(i));
      std::int32_t number = 0;
      while (read(writers[i].acknowledgements, &number, sizeof number) == sizeof number) {
        ++acknowledged;
        const auto value = store.value(application, u"S", number_to_text(number));
        if (value != Text(100, u'x') + number_to_text(number)) ++lost;
      }
      close(writers[i].acknowledgements);
      waitpid(writers[i].id, nullptr, 0);
    }
    state.counters["acknowledged"] = static_cast<double>(acknowledged);
    state.counters["lost"] = static_cast<double>(lost);
    if (lost != 0) state.SkipWithError("settings were lost or torn");
  }
}
BENCHMARK(settings_of_eight)->Iterations(1)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
}  // namespace talutil
