#include <benchmark/benchmark.h>
#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <functional>
#include <random>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/posix/posix_platform.hpp"
#include "services/sequential_file.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil {
namespace {

/// A toolkit that uses real files.
struct Toolkit {
  testing::FakePlatform platform;
  posix::PosixFiles files;
  Library library{[this] {
    platform.used_files = &files;
    return platform.platform();
  }()};
  ORVUtils utils{library};
};

/// A folder that is removed with the program, containing a text file of 60 MB with lines of 20 to 100 characters.
struct Scratch {
  std::string folder = [] {
    std::string pattern = (std::filesystem::temp_directory_path() / "talutil-bench-XXXXXX").string();
    return std::string(mkdtemp(pattern.data()));
  }();
  std::string text_file = folder + "/lines.txt";
  Text text_path = from_utf8(text_file);

  Scratch() {
    constexpr std::size_t size = 60'000'000;
    std::mt19937 random(42);
    std::ofstream file(text_file, std::ios::binary);
    for (std::size_t written = 0; written < size;) {
      std::string line;
      for (std::size_t length = 20 + random() % 81; length > 0; --length)
        line += static_cast<char>('a' + random() % 26);
      line += "\r\n";
      file << line;
      written += line.size();
    }
  }
  Scratch(const Scratch&) = delete;
  Scratch& operator=(const Scratch&) = delete;
  ~Scratch() { std::filesystem::remove_all(folder); }
};

const Scratch& scratch() {
  static const Scratch made;
  return made;
}

void report_bytes(benchmark::State& state) {
  state.SetBytesProcessed(state.iterations() *
                          static_cast<std::int64_t>(std::filesystem::file_size(scratch().text_file)));
}

/// The baseline: just reads the bytes of the file.
std::string read_bytes(const std::string& path) {
  std::string bytes(std::filesystem::file_size(path), '\0');
  std::ifstream(path, std::ios::binary).read(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  return bytes;
}

// ---- once, in a fresh process: the time a host waits, and the peak memory

struct Cost {
  double megabytes = 0;
  double milliseconds = 0;
};

/// The time of some work, without starting the process, and the peak memory of its process.
Cost cost_of(const std::function<void()>& work) {
  int ends[2];
  if (pipe(ends) != 0) return {};
  const pid_t child = fork();
  if (child == 0) {
    const auto start = std::chrono::steady_clock::now();
    work();
    const double time = std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
    _exit(write(ends[1], &time, sizeof time) == sizeof time ? 0 : 1);
  }
  Cost cost;
  struct rusage usage {};
  int status = 0;
  wait4(child, &status, 0, &usage);
  const bool is_told = read(ends[0], &cost.milliseconds, sizeof cost.milliseconds) == sizeof cost.milliseconds;
  close(ends[0]);
  close(ends[1]);
  if (status != 0 || !is_told) return {};
  cost.megabytes = static_cast<double>(usage.ru_maxrss) / 1024;
  return cost;
}

void fresh_process(benchmark::State& state) {
  const Scratch& files = scratch();
  for (auto _ : state) {
    const double base = cost_of([] {}).megabytes;
    const Cost bytes = cost_of([&] { benchmark::DoNotOptimize(read_bytes(files.text_file)); });
    const Cost text = cost_of([&] { (void)Toolkit().utils.LoadTextBox(files.text_path); });
    const Cost lines = cost_of([&] {
      TextArray list;
      (void)Toolkit().utils.OpenFile(files.text_path, list, 0);
    });
    state.counters["bytes_ms"] = bytes.milliseconds;
    state.counters["bytes_MB"] = bytes.megabytes - base;
    state.counters["LoadTextBox_ms"] = text.milliseconds;
    state.counters["LoadTextBox_MB"] = text.megabytes - base;
    state.counters["OpenFile_ms"] = lines.milliseconds;
    state.counters["OpenFile_MB"] = lines.megabytes - base;
  }
}
BENCHMARK(fresh_process)->Iterations(1)->Repetitions(5)->ReportAggregatesOnly();

// ---- a small text, and the least that makes it last through a power cut

const std::string small_text(2000, 'x');

/// Written over the old one and flushed: not safe, since a power cut may leave a part of it.
void bare_write(benchmark::State& state) {
  const std::string path = scratch().folder + "/bare.txt";
  for (auto _ : state) {
    const int file = open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0666);
    if (write(file, small_text.data(), small_text.size()) < 0 || fsync(file) != 0) state.SkipWithError("cannot write");
    close(file);
  }
}

void save_text_box(benchmark::State& state) {
  Toolkit toolkit;
  const Text text = from_utf8(small_text);
  const Text path = from_utf8(scratch().folder + "/small.txt");
  for (auto _ : state) toolkit.utils.SaveTextBox(text, path);
}

BENCHMARK(bare_write)->UseRealTime();
BENCHMARK(save_text_box)->UseRealTime();

// ---- lines: one at a time, and all of them kept

void getline_loop(benchmark::State& state) {
  for (auto _ : state) {
    std::ifstream file(scratch().text_file, std::ios::binary);
    std::string line;
    while (std::getline(file, line)) benchmark::DoNotOptimize(line.data());
  }
  report_bytes(state);
}

void our_lines(benchmark::State& state) {
  posix::PosixPlatform platform;
  for (auto _ : state) {
    SequentialInput file(platform.platform(), scratch().text_path);
    Text line;
    while (!file.at_end()) {
      file.read_line(line);
      benchmark::DoNotOptimize(line.data());
    }
  }
  report_bytes(state);
}

void getline_kept(benchmark::State& state) {
  for (auto _ : state) {
    std::ifstream file(scratch().text_file, std::ios::binary);
    std::vector<std::string> lines;
    std::string line;
    while (std::getline(file, line)) lines.push_back(line);
    benchmark::DoNotOptimize(lines.data());
  }
  report_bytes(state);
}

void open_file(benchmark::State& state) {
  Toolkit toolkit;
  for (auto _ : state) {
    TextArray list;
    benchmark::DoNotOptimize(toolkit.utils.OpenFile(scratch().text_path, list, 0));
  }
  report_bytes(state);
}

// ---- the whole text

void bytes_alone(benchmark::State& state) {
  for (auto _ : state) benchmark::DoNotOptimize(read_bytes(scratch().text_file));
  report_bytes(state);
}

void load_text_box(benchmark::State& state) {
  Toolkit toolkit;
  for (auto _ : state) benchmark::DoNotOptimize(toolkit.utils.LoadTextBox(scratch().text_path));
  report_bytes(state);
}

#define FILE_BENCHMARK(name) BENCHMARK(name)->Unit(benchmark::kMillisecond)->MinTime(1)
FILE_BENCHMARK(getline_loop);
FILE_BENCHMARK(our_lines);
FILE_BENCHMARK(getline_kept);
FILE_BENCHMARK(open_file);
FILE_BENCHMARK(bytes_alone);
FILE_BENCHMARK(load_text_box);

// ---- the event log: 8 processes of 10,000 lines each, half of them killed at a random moment

/// Appends lines and reports each acknowledged line's number through a pipe.
[[noreturn]] void log_events(std::int32_t process, int acknowledgements) {
  Toolkit toolkit;
  SharedSettings& settings = toolkit.library.settings();
  settings.EventLog = 1;
  settings.sORVPath = from_utf8(scratch().folder);
  settings.sUserName = u"user" + number_to_text(process);
  for (std::int32_t i = 0; i < 10'000; ++i) {
    toolkit.utils.AppendEventLog(u"event " + number_to_text(i), u"frmBooking" + Text(200, u'x'));
    if (write(acknowledgements, &i, sizeof i) != sizeof i) _exit(1);
  }
  _exit(0);
}

struct LoggingProcess {
  pid_t id = -1;
  int acknowledgements = -1;
  std::int32_t acknowledged = 0;
};

void event_log_of_eight(benchmark::State& state) {
  constexpr std::int32_t processes = 8;
  const std::string log = scratch().folder + "/EventLog.txt";
  for (auto _ : state) {
    std::filesystem::remove(log);
    std::vector<LoggingProcess> all(processes);
    for (std::int32_t i = 0; i < processes; ++i) {
      int ends[2];
      if (pipe(ends) != 0 || fcntl(ends[0], F_SETPIPE_SZ, 1 << 17) < 0) return state.SkipWithError("no pipe");
      const pid_t child = fork();
      if (child == 0) log_events(i, ends[1]);
      close(ends[1]);
      all[static_cast<std::size_t>(i)] = {child, ends[0], 0};
    }
    std::mt19937 random(std::random_device{}());
    for (std::size_t i = 0; i < all.size(); i += 2) {
      usleep(static_cast<useconds_t>(random() % 100'000));
      kill(all[i].id, SIGKILL);
    }
    std::int64_t acknowledged = 0;
    for (LoggingProcess& process : all) {
      std::int32_t number = 0;
      while (read(process.acknowledgements, &number, sizeof number) == sizeof number) ++process.acknowledged;
      close(process.acknowledgements);
      waitpid(process.id, nullptr, 0);
      acknowledged += process.acknowledged;
    }

    // Every line must be whole, each process's lines in order, and no acknowledged line missing.
    std::int64_t torn = 0;
    std::vector<std::int32_t> next(processes, 0);
    std::ifstream file(log, std::ios::binary);
    std::string line;
    const std::string ending = ":frmBooking" + std::string(200, 'x') + "\r";
    while (std::getline(file, line)) {
      const auto process = static_cast<std::size_t>(line.size() > 4 ? line[4] - '0' : processes);
      const bool is_whole = process < next.size() && line.starts_with("user") && line.ends_with(ending) &&
                            line.find(":event " + std::to_string(next[process]) + ending) != std::string::npos;
      is_whole ? ++next[process] : ++torn;
    }
    std::int64_t lost = 0;
    for (std::size_t i = 0; i < all.size(); ++i) lost += std::max(0, all[i].acknowledged - next[i]);
    state.counters["acknowledged"] = static_cast<double>(acknowledged);
    state.counters["lost"] = static_cast<double>(lost);
    state.counters["torn"] = static_cast<double>(torn);
    if (lost + torn != 0) state.SkipWithError("events were lost or torn");
  }
}
BENCHMARK(event_log_of_eight)->Iterations(1)->Unit(benchmark::kMillisecond)->UseRealTime();

}  // namespace
}  // namespace talutil
