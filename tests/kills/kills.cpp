// Kills processes while they write through the library, and looks at what they leave: kills OPERATIONS FOLDER [SEED]
//
// Eight processes at a time do numbered operations of three kinds in turn, on files that all of them write: lines of
// the event log, entries of an archive, items of a profile file. Each acknowledges an operation in a file of its own,
// by a byte, after the call has returned without an error. They are killed at random moments and others go on, until
// OPERATIONS of each kind are acknowledged. Nothing acknowledged may then be missing, and nothing torn, and the next
// writer of a file removes what is left of an earlier one. What each system call of one process leaves is the business
// of tests/faults; here processes stand in each other's way, and their ends are real.
#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <optional>
#include <random>
#include <set>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <utility>
#include <vector>

#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/platform/native_platform.hpp"
#include "tests/process.hpp"

namespace talutil::testing {
namespace {

namespace fs = std::filesystem;

/// How this program was called.
std::string this_program;

constexpr int workers = 8;
// On Windows, the system itself writes profile files, the last kind.
#ifdef _WIN32
constexpr std::uintmax_t kinds = 2;
#else
constexpr std::uintmax_t kinds = 3;
#endif
constexpr std::uintmax_t keys = 5;  ///< Of each kind, a worker writes so many items in turn.

/// The library on the native platform.
struct Host {
  explicit Host(fs::path place) : native(std::move(place)) {
    utils.settings().EventLog = 1;
    utils.settings().sORVPath = folder.substr(0, folder.size() - 1);
  }

  fs::path native;
#ifdef _WIN32
  Text folder = Text(native.u16string()) + u"\\";
#else
  Text folder = u"Z:" + from_utf8(native.string()) + u"/";
#endif
  NativePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

std::uintmax_t key_of(std::uintmax_t number) { return number / kinds % keys; }

Text item_of(int worker, std::uintmax_t number) {
  return from_utf8(std::to_string(worker) + "-" + std::to_string(key_of(number)));
}

/// What an operation writes: its numbers and as many more characters as these say.
std::string content(int worker, std::uintmax_t number) {
  const std::size_t length = 20 + number * 7 % 80;
  return std::to_string(worker) + "." + std::to_string(number) + "." +
         std::string(length, static_cast<char>('a' + number % 26)) + ".";
}

/// The worker and the number of an operation.
using Operation = std::pair<int, std::uintmax_t>;

/// Which operation a whole content is of.
std::optional<Operation> written_by(const std::string& text) {
  int worker = 0;
  unsigned long long number = 0;
  if (std::sscanf(text.c_str(), "%d.%llu.", &worker, &number) != 2) return std::nullopt;
  return text == content(worker, number) ? std::optional(Operation(worker, number)) : std::nullopt;
}

std::string read_bytes(const fs::path& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

fs::path acknowledgements(const fs::path& folder, int worker) { return folder / ("done-" + std::to_string(worker)); }

/// How many operations a worker has acknowledged; they are numbered from 1.
std::uintmax_t acknowledged(const fs::path& folder, int worker) {
  std::error_code is_missing;
  const std::uintmax_t count = fs::file_size(acknowledgements(folder, worker), is_missing);
  return is_missing ? 0 : count;
}

/// The faults found so far.
int faults = 0;

void fault(const std::string& what) {
  if (++faults <= 20) std::printf("FAILED: %s\n", what.c_str());
}

// ---- The kinds. Each writes what one operation does, and finds what all of them have left.

using Contents = std::vector<std::string>;

void write_log(Host& host, int worker, std::uintmax_t number) {
  host.utils.AppendEventLog(from_utf8(content(worker, number)), u"kills");
}

/// What stands in the lines of a file between a mark and their end; of a line that has another end, all of it.
Contents contents_of_lines(const fs::path& path, char mark, const std::string& end) {
  Contents found;
  std::istringstream lines(read_bytes(path));
  for (std::string line; std::getline(lines, line);) {
    if (line == "[a]\r") continue;
    const std::size_t begin = line.find(mark, 1) + 1;
    found.push_back(line.ends_with(end) ? line.substr(begin, line.size() - begin - end.size()) : line);
  }
  return found;
}

/// User, time, event and form.
Contents contents_of_log(Host& host) { return contents_of_lines(host.native / "EventLog.txt", ':', ":kills\r"); }

void write_archive(Host& host, int worker, std::uintmax_t number) {
  const Text name = u"sources/e" + item_of(worker, number) + u".txt";
  std::ofstream(host.native / to_utf8(name), std::ios::binary) << content(worker, number);
  archives::Progress progress;
  archives::pack(host.folder + u"a.zip", u'"' + host.folder + name + u'"', {.keep_folders = false},
                 host.platform.folders, progress);
}

Contents contents_of_archive(Host& host) {
  const fs::path out = host.native / "unpacked";
  try {
    archives::Progress progress;
    archives::Archive archive(host.folder + u"a.zip", host.platform.folders);
    archive.extract(host.folder + u"unpacked", {}, host.platform.folders, host.platform.files, {}, progress);
  } catch (const archives::Error& error) {
    fault("archive: code " + std::to_string(static_cast<int>(error.code())) + ": " + error.what());
  }
  Contents found;
  for (const auto& entry : fs::directory_iterator(out)) found.push_back(read_bytes(entry.path()));
  return found;
}

/// All in one file. That a value could not be written, for the wait for others took too long, is not reported, so it is
/// read back.
void write_profile(Host& host, int worker, std::uintmax_t number) {
  Text value = from_utf8(content(worker, number));
  const Text item = item_of(worker, number);
  host.utils.SaveCfgFileData(u"a", item, value, host.folder + u"p.ini", Boolean(true));
  if (host.platform.profiles.value(host.folder + u"p.ini", u"a", item) != value) {
    throw std::runtime_error("the value is not in the file");
  }
}

Contents contents_of_profile(Host& host) { return contents_of_lines(host.native / "p.ini", '=', "\r"); }

struct Kind {
  const char* name;
  void (*write)(Host& host, int worker, std::uintmax_t number);
  Contents (*contents)(Host& host);
  std::uintmax_t kept;  ///< How many of a worker's last operations are still to be found.
};

constexpr std::array all_kinds = {
    Kind{"log", &write_log, &contents_of_log, UINTMAX_MAX},
    Kind{"archive", &write_archive, &contents_of_archive, keys},
    Kind{"profile", &write_profile, &contents_of_profile, keys},
};

/// What was acknowledged is there, but for what the operation that the kill came upon has replaced; nothing is torn.
void check(Host& host, std::uintmax_t number_of_kind) {
  const Kind& kind = all_kinds.at(number_of_kind);
  std::set<Operation> found;
  for (const std::string& text : kind.contents(host)) {
    const auto written = written_by(text);
    if (!written) fault(std::string(kind.name) + ": torn: " + text);
    if (written) found.insert(*written);
  }
  for (int worker = 0; worker < workers; ++worker) {
    const std::uintmax_t last = acknowledged(host.native, worker);
    const bool has_next = found.contains({worker, last + 1});
    std::uintmax_t kept = kind.kept;
    for (std::uintmax_t number = last; number > 0 && kept > 0; --number) {
      if (number % kinds != number_of_kind) continue;
      --kept;
      const bool is_replaced = has_next && kind.kept == keys && key_of(number) == key_of(last + 1);
      if (found.contains({worker, number}) || is_replaced) continue;
      fault(std::string(kind.name) + ": lost: " + content(worker, number));
    }
  }
}

/// Does an operation until it succeeds: that another has locked the file is no fault, but cannot last.
bool write(Host& host, int worker, std::uintmax_t number) {
  const Kind& kind = all_kinds.at(number % kinds);
  std::string reason;
  for (int attempts = 0; attempts < 100; ++attempts) {
    try {
      kind.write(host, worker, number);
      return true;
    } catch (const std::exception& error) {
      reason = error.what();
    }
  }
  std::printf("%s: worker %d cannot write: %s\n", kind.name, worker, reason.c_str());
  return false;
}

/// Goes on from the last acknowledged operation until it is killed.
int work(int worker, const fs::path& folder) {
  Host host(folder);
  std::FILE* const done = std::fopen(acknowledgements(folder, worker).string().c_str(), "ab");
  if (done == nullptr) return 1;
  for (std::uintmax_t number = acknowledged(folder, worker) + 1;; ++number) {
    if (!write(host, worker, number)) return 1;
    if (std::fputc('x', done) == EOF || std::fflush(done) != 0) return 1;
  }
}

std::uintmax_t total(const fs::path& folder) {
  std::uintmax_t sum = 0;
  for (int worker = 0; worker < workers; ++worker) sum += acknowledged(folder, worker);
  return sum;
}

using Clock = std::chrono::steady_clock;
using Random = std::mt19937;

std::uintmax_t up_to(std::uintmax_t highest, Random& random) {
  return std::uniform_int_distribution<std::uintmax_t>(0, highest)(random);
}

/// A process, which is to be killed after some operations, of each kind as often as of any other.
struct Victim {
  Victim(int number, const fs::path& where, Random& random)
      : worker(number),
        folder(where),
        goal(acknowledged(folder, worker) + up_to(2 * kinds - 1, random)),
        process({this_program, "--work", std::to_string(worker), folder.string()}) {}

  /// Once it has reached its goal, at any moment of the operation that follows.
  bool is_due(Random& random) {
    const auto now = Clock::now();
    if (!end && acknowledged(folder, worker) >= goal) {
      const auto lived = std::chrono::duration_cast<std::chrono::microseconds>(now - start).count();
      end = now + std::chrono::microseconds(up_to(static_cast<std::uintmax_t>(lived) + 2000, random));
    }
    return end && now >= *end;
  }

  int worker;
  fs::path folder;
  std::uintmax_t goal;
  Process process;
  Clock::time_point start = Clock::now();
  std::optional<Clock::time_point> end;
};

/// Lets processes work until enough is done. Returns how many it has killed.
int kill_at_random(const fs::path& folder, std::uintmax_t operations, unsigned seed) {
  Random random(seed);
  std::array<std::optional<Victim>, workers> victims;
  auto last_progress = Clock::now();
  std::uintmax_t done_before = 0;
  for (int kills = 0;; std::this_thread::sleep_for(std::chrono::milliseconds(1))) {
    const std::uintmax_t done = total(folder);
    if (done >= operations) return kills;
    if (done != std::exchange(done_before, done)) last_progress = Clock::now();
    if (Clock::now() - last_progress > std::chrono::minutes(1)) return fault("no progress for a minute"), kills;
    for (int worker = 0; worker < workers; ++worker) {
      auto& victim = victims[static_cast<std::size_t>(worker)];
      if (victim && !victim->process.runs()) return fault("a worker has ended by itself"), kills;
      if (victim && !victim->is_due(random)) continue;
      kills += victim ? 1 : 0;
      victim.reset();
      victim.emplace(worker, folder, random);
    }
  }
}

std::vector<fs::path> temporaries(const fs::path& folder) {
  std::vector<fs::path> found;
  for (const auto& entry : fs::recursive_directory_iterator(folder)) {
    if (entry.path().filename().string().starts_with(to_utf8(temporary_prefix))) found.push_back(entry.path());
  }
  return found;
}

/// Writes each file once more, which removes what is left beside it.
void expect_nothing_left(Host& host) {
#ifdef _WIN32
  // There, only those of yesterday count as left.
  for (const fs::path& path : temporaries(host.native)) {
    fs::last_write_time(path, fs::file_time_type::clock::now() - std::chrono::hours(48));
  }
#endif
  for (int worker = 0; worker < workers; ++worker) {
    const std::uintmax_t last = acknowledged(host.native, worker);
    for (std::uintmax_t next = 1; next <= kinds * keys; ++next) {
      if (!write(host, worker, last + next)) fault("cannot be written any more");
    }
  }
  for (const fs::path& path : temporaries(host.native)) fault(path.string() + ": left by a killed process");
}

int drive(std::uintmax_t operations, const fs::path& folder, unsigned seed) {
  fs::create_directories(folder / "sources");
  const int kills = kill_at_random(folder, operations * kinds, seed);
  const std::uintmax_t done = total(folder);
  Host host(folder);
  for (std::uintmax_t kind = 0; kind < kinds; ++kind) check(host, kind);
  const std::size_t left = temporaries(folder).size();
  expect_nothing_left(host);
  std::printf("%ju operations, %d processes killed, %zu temporary files left by them\n", done, kills, left);
  std::printf("%d passed, %d failed\n", faults == 0 ? static_cast<int>(kinds) : 0, faults);
  return faults == 0 ? 0 : 1;
}

}  // namespace
}  // namespace talutil::testing

int main(int count, char** arguments) {
  using namespace talutil::testing;
  this_program = arguments[0];
  if (count == 4 && std::strcmp(arguments[1], "--work") == 0) return work(std::atoi(arguments[2]), arguments[3]);
  if (count < 3) {
    std::fputs("usage: kills OPERATIONS FOLDER [SEED]\n", stderr);
    return 2;
  }
  return drive(std::strtoull(arguments[1], nullptr, 10), std::filesystem::absolute(arguments[2]),
               count > 3 ? static_cast<unsigned>(std::atoi(arguments[3])) : 1);
}
