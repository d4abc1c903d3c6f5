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
#include <functional>
#include <iterator>
#include <optional>
#include <random>
#include <set>
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

std::string name_of(int worker, std::uintmax_t key) { return std::to_string(worker) + "-" + std::to_string(key); }

Text item_of(int worker, std::uintmax_t number) { return from_utf8(name_of(worker, key_of(number))); }

/// What an operation writes: its numbers and as many more characters as these say.
std::string content(int worker, std::uintmax_t number) {
  const std::size_t length = 20 + number * 7 % 80;
  return std::to_string(worker) + "." + std::to_string(number) + "." +
         std::string(length, static_cast<char>('a' + number % 26)) + ".";
}

struct Written {
  int worker = 0;
  std::uintmax_t number = 0;
};

/// Which operation a whole content is of.
std::optional<Written> written_by(const std::string& text) {
  Written written;
  unsigned long long number = 0;
  if (std::sscanf(text.c_str(), "%d.%llu.", &written.worker, &number) != 2) return std::nullopt;
  written.number = number;
  return text == content(written.worker, written.number) ? std::optional(written) : std::nullopt;
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

using Found = std::optional<std::string>;
using Read = std::function<Found(const std::string& name)>;

/// Checks each item of a kind: the last acknowledged operation on it, or the one that the kill came upon.
void check_items(const Host& host, std::uintmax_t kind, const std::string& kind_name, const Read& read) {
  for (int worker = 0; worker < workers; ++worker) {
    const std::uintmax_t last = acknowledged(host.native, worker);
    for (std::uintmax_t key = 0; key < keys; ++key) {
      const auto is_on_it = [&](std::uintmax_t number) { return number % kinds == kind && key_of(number) == key; };
      std::uintmax_t least = last;
      while (least > 0 && !is_on_it(least)) --least;
      const Found found = read(name_of(worker, key));
      const std::string what = kind_name + " " + name_of(worker, key);
      if (!found) {
        if (least > 0) fault(what + ": lost");
        continue;
      }
      const auto written = written_by(*found);
      if (!written || written->worker != worker || !is_on_it(written->number)) {
        fault(what + ": torn: " + *found);
      } else if (written->number != least && written->number != last + 1) {
        fault(what + ": number " + std::to_string(written->number) + " in place of " + std::to_string(least));
      }
    }
  }
}

// ---- The kinds. Each writes what one operation does, and checks what all have left.

void write_log(Host& host, int worker, std::uintmax_t number) {
  host.utils.AppendEventLog(from_utf8(content(worker, number)), u"kills");
}

void check_log(Host& host, std::uintmax_t kind) {
  std::array<std::set<std::uintmax_t>, workers> seen;
  const std::string log = read_bytes(host.native / "EventLog.txt");
  for (std::size_t at = 0; at < log.size();) {
    const std::size_t end = log.find("\r\n", at);
    const std::string line = log.substr(at, end - at);
    at = end == std::string::npos ? log.size() : end + 2;
    // User, time, event and form.
    const std::size_t event = line.find(':', 1) + 1;
    const std::size_t form = line.rfind(':');
    const auto written = form > event ? written_by(line.substr(event, form - event)) : std::nullopt;
    if (!written || line.substr(form) != ":kills" || end == std::string::npos) {
      fault("log: torn: " + line);
    } else {
      seen[static_cast<std::size_t>(written->worker)].insert(written->number);
    }
  }
  for (int worker = 0; worker < workers; ++worker) {
    for (std::uintmax_t number = acknowledged(host.native, worker); number > 0; --number) {
      const bool is_seen = seen[static_cast<std::size_t>(worker)].contains(number);
      if (number % kinds == kind && !is_seen) fault("log: lost: " + content(worker, number));
    }
  }
}

void write_archive(Host& host, int worker, std::uintmax_t number) {
  const Text name = u"sources/e" + item_of(worker, number) + u".txt";
  std::ofstream(host.native / to_utf8(name), std::ios::binary) << content(worker, number);
  archives::Progress progress;
  archives::pack(host.folder + u"a.zip", u'"' + host.folder + name + u'"', {.keep_folders = false},
                 host.platform.folders, progress);
}

Read archive_reader(Host& host) {
  try {
    archives::Progress progress;
    archives::Archive archive(host.folder + u"a.zip", host.platform.folders);
    archive.extract(host.folder + u"unpacked", {}, host.platform.folders, host.platform.files, {}, progress);
  } catch (const archives::Error& error) {
    fault("archive: code " + std::to_string(static_cast<int>(error.code())) + ": " + error.what());
  }
  return [&](const std::string& name) -> Found {
    const fs::path path = host.native / "unpacked" / ("e" + name + ".txt");
    return fs::exists(path) ? Found(read_bytes(path)) : std::nullopt;
  };
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

Read profile_reader(Host& host) {
  return [&](const std::string& name) -> Found {
    const Text value = host.platform.profiles.value(host.folder + u"p.ini", u"a", from_utf8(name));
    return value.empty() ? std::nullopt : Found(to_utf8(value));
  };
}

struct Kind {
  const char* name;
  void (*write)(Host& host, int worker, std::uintmax_t number);
  Read (*reader)(Host& host);  ///< Null for the log, which is not a set of items.
};

constexpr std::array all_kinds = {
    Kind{"log", &write_log, nullptr},
    Kind{"archive", &write_archive, &archive_reader},
    Kind{"profile", &write_profile, &profile_reader},
};

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
  check_log(host, 0);
  for (std::uintmax_t kind = 1; kind < kinds; ++kind) {
    check_items(host, kind, all_kinds.at(kind).name, all_kinds.at(kind).reader(host));
  }
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
