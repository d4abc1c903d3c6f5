// Kills processes while they write through the library, and looks at what they leave: kills OPERATIONS FOLDER [SEED]
//
// Eight processes at a time do numbered operations of five kinds: lines of the event log, settings, items of a profile
// file, text files, entries of an archive. Each acknowledges an operation in a file of its own, by a byte, after the
// call has returned without an error. They are killed at random moments and others go on, until OPERATIONS of each
// kind are acknowledged. Nothing acknowledged may then be missing, and nothing torn, and the next writer of a file
// removes what is left of an earlier one.
#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>
#include <map>
#include <optional>
#include <random>
#include <set>
#include <span>
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
constexpr std::uintmax_t keys = 5;  ///< Each worker writes so many items in turn.
constexpr TextView application = u"TALUtil kills";

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
  // The platform looks for its settings when it is made.
  int hive = setenv("TALUTIL_HIVE", (native / "hive.db").c_str(), 1);
#endif
  NativePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

std::string key_of(int worker, std::uintmax_t number) {
  return std::to_string(worker) + "-" + std::to_string(number % keys);
}

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

fs::path acknowledgements(const fs::path& folder, const std::string& kind, int worker) {
  return folder / ("done-" + kind + "-" + std::to_string(worker));
}

/// How many operations a worker has acknowledged; they are numbered from 1.
std::uintmax_t acknowledged(const fs::path& folder, const std::string& kind, int worker) {
  std::error_code is_missing;
  const std::uintmax_t count = fs::file_size(acknowledgements(folder, kind, worker), is_missing);
  return is_missing ? 0 : count;
}

/// The faults found so far.
int faults = 0;

void fault(const std::string& what) {
  if (++faults <= 20) std::printf("FAILED: %s\n", what.c_str());
}

/// Of a key that a worker writes in turn: the last acknowledged operation, or the one that the kill came upon.
void check_value(const std::string& kind, int worker, std::uintmax_t key, std::uintmax_t last,
                 const std::optional<std::string>& found) {
  const std::string what = kind + " " + key_of(worker, key);
  std::uintmax_t least = last;
  while (least > 0 && least % keys != key) --least;
  if (!found) return least == 0 ? void() : fault(what + ": lost");
  const auto written = written_by(*found);
  if (!written || written->worker != worker || written->number % keys != key) {
    fault(what + ": torn: " + *found);
  } else if (written->number != least && written->number != last + 1) {
    fault(what + ": number " + std::to_string(written->number) + " in place of " + std::to_string(least));
  }
}

template <class Read>
void check_values(const Host& host, const std::string& kind, Read read) {
  for (int worker = 0; worker < workers; ++worker) {
    const std::uintmax_t last = acknowledged(host.native, kind, worker);
    for (std::uintmax_t key = 0; key < keys; ++key) check_value(kind, worker, key, last, read(key_of(worker, key)));
  }
}

// ---- The kinds. Each writes what one operation does, and checks what all have left.

void write_log(Host& host, int worker, std::uintmax_t number) {
  host.utils.AppendEventLog(from_utf8(content(worker, number)), u"kills");
}

void check_log(Host& host) {
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
    for (std::uintmax_t number = acknowledged(host.native, "log", worker); number > 0; --number) {
      if (!seen[static_cast<std::size_t>(worker)].contains(number)) fault("log: lost: " + content(worker, number));
    }
  }
}

void write_setting(Host& host, int worker, std::uintmax_t number) {
  host.platform.settings_store.put(Text(application), u"a", from_utf8(key_of(worker, number)),
                                   from_utf8(content(worker, number)));
}

void check_settings(Host& host) {
  check_values(host, "settings", [&](const std::string& key) -> std::optional<std::string> {
    const auto value = host.platform.settings_store.value(Text(application), u"a", from_utf8(key));
    return value ? std::optional(to_utf8(*value)) : std::nullopt;
  });
}

/// All in one file. That a value could not be written, for the wait for others took too long, is not reported, so it is
/// read back.
void write_profile(Host& host, int worker, std::uintmax_t number) {
  Text value = from_utf8(content(worker, number));
  const Text key = from_utf8(key_of(worker, number));
  host.utils.SaveCfgFileData(u"a", key, value, host.folder + u"p.ini", Boolean(true));
  if (host.platform.profiles.value(host.folder + u"p.ini", u"a", key) != value) {
    throw std::runtime_error("the value is not in the file");
  }
}

void check_profile(Host& host) {
  check_values(host, "profile", [&](const std::string& key) -> std::optional<std::string> {
    const Text value = host.platform.profiles.value(host.folder + u"p.ini", u"a", from_utf8(key));
    return value.empty() ? std::nullopt : std::optional(to_utf8(value));
  });
}

/// A file of the worker's own, and one that all replace.
void write_texts(Host& host, int worker, std::uintmax_t number) {
  const Text line = from_utf8(content(worker, number));
  const TextArray lines{.items = std::vector<Text>(200, line), .lower_bound = 0, .allocated = true};
  host.utils.SaveBigFile(lines, host.folder + u"t" + from_utf8(key_of(worker, number)) + u".txt");
  host.utils.SaveBigFile(lines, host.folder + u"shared.txt");
}

/// The one line that a file consists of; a torn one, if it does not.
std::optional<std::string> line_of(const fs::path& path) {
  if (!fs::exists(path)) return std::nullopt;
  const std::string bytes = read_bytes(path);
  const std::string line = bytes.substr(0, bytes.find("\r\n"));
  std::string expected;
  for (int i = 0; i < 200; ++i) expected += line + "\r\n";
  return bytes == expected ? line : "of " + std::to_string(bytes.size()) + " bytes";
}

void check_texts(Host& host) {
  check_values(host, "texts", [&](const std::string& key) { return line_of(host.native / ("t" + key + ".txt")); });
  const auto shared = line_of(host.native / "shared.txt");
  if (shared && !written_by(*shared)) fault("texts: the shared file is torn: " + *shared);
}

void write_archive(Host& host, int worker, std::uintmax_t number) {
  const std::string key = key_of(worker, number);
  const fs::path source = host.native / "sources" / ("e" + key + ".txt");
  std::ofstream(source, std::ios::binary) << content(worker, number);
  archives::Progress progress;
  archives::pack(host.folder + u"a.zip", u'"' + host.folder + u"sources/e" + from_utf8(key) + u".txt\"",
                 {.keep_folders = false}, host.platform.folders, progress);
}

void check_archive(Host& host) {
  if (!fs::exists(host.native / "a.zip")) return;
  try {
    archives::Progress progress;
    archives::Archive archive(host.folder + u"a.zip", host.platform.folders);
    archive.test({}, {}, progress);
    archive.extract(host.folder + u"unpacked", {}, host.platform.folders, host.platform.files, {}, progress);
  } catch (const archives::Error& error) {
    fault("archive: code " + std::to_string(static_cast<int>(error.code())) + ": " + error.what());
  }
  check_values(host, "archive", [&](const std::string& key) -> std::optional<std::string> {
    const fs::path path = host.native / "unpacked" / ("e" + key + ".txt");
    return fs::exists(path) ? std::optional(read_bytes(path)) : std::nullopt;
  });
}

struct Kind {
  std::string name;
  void (*write)(Host& host, int worker, std::uintmax_t number);
  void (*check)(Host& host);
};

const Kind all_kinds[] = {
    {"log", &write_log, &check_log},
    {"settings", &write_setting, &check_settings},
    {"texts", &write_texts, &check_texts},
    {"archive", &write_archive, &check_archive},
    {"profile", &write_profile, &check_profile},
};

// On Windows, the system itself writes profile files.
#ifdef _WIN32
const std::span<const Kind> kinds = std::span(all_kinds).first<4>();
#else
const std::span<const Kind> kinds = all_kinds;
#endif

/// Calls a writer until it succeeds: that another has locked the file is no fault, but cannot last.
bool write(const Kind& kind, Host& host, int worker, std::uintmax_t number) {
  std::string reason;
  for (int attempts = 0; attempts < 100; ++attempts) {
    try {
      kind.write(host, worker, number);
      return true;
    } catch (const std::exception& error) {
      reason = error.what();
    }
  }
  std::printf("%s: worker %d cannot write: %s\n", kind.name.c_str(), worker, reason.c_str());
  return false;
}

/// Goes on from the last acknowledged operation until it is killed. It is not, where the driver lags behind, so it
/// waits after some operations, lest the fast kinds take the time of the others.
int work(const Kind& kind, int worker, const fs::path& folder) {
  Host host(folder);
  std::FILE* const done = std::fopen(acknowledgements(folder, kind.name, worker).string().c_str(), "ab");
  if (done == nullptr) return 1;
  constexpr std::uintmax_t most_at_once = 20;
  const std::uintmax_t first = acknowledged(folder, kind.name, worker) + 1;
  for (std::uintmax_t number = first;; ++number) {
    if (!write(kind, host, worker, number)) return 1;
    if (std::fputc('x', done) == EOF || std::fflush(done) != 0) return 1;
    if (number - first == most_at_once) std::this_thread::sleep_for(std::chrono::hours(1));
  }
}

std::uintmax_t total_of(const Kind& kind, const fs::path& folder) {
  std::uintmax_t total = 0;
  for (int worker = 0; worker < workers; ++worker) total += acknowledged(folder, kind.name, worker);
  return total;
}

using Clock = std::chrono::steady_clock;
using Random = std::mt19937;

std::uintmax_t up_to(std::uintmax_t highest, Random& random) {
  return std::uniform_int_distribution<std::uintmax_t>(0, highest)(random);
}

/// A process, which is to be killed after some operations.
struct Victim {
  Victim(const Kind& kind, int number, const fs::path& where, Random& random)
      : name(kind.name),
        worker(number),
        folder(where),
        goal(acknowledged(folder, name, worker) + up_to(4, random)),
        process({this_program, "--work", name, std::to_string(worker), folder.string()}) {}

  /// Once it has reached its goal, at any moment of the operation that follows.
  bool is_due(Random& random) {
    const auto now = Clock::now();
    if (!end && acknowledged(folder, name, worker) >= goal) {
      const auto lived = std::chrono::duration_cast<std::chrono::microseconds>(now - start).count();
      end = now + std::chrono::microseconds(up_to(static_cast<std::uintmax_t>(lived) + 2000, random));
    }
    return end && now >= *end;
  }

  std::string name;
  int worker;
  fs::path folder;
  std::uintmax_t goal;
  Process process;
  Clock::time_point start = Clock::now();
  std::optional<Clock::time_point> end;
};

/// Lets processes work until enough of each kind is done. Returns how many it has killed.
int kill_at_random(const fs::path& folder, std::uintmax_t operations, unsigned seed) {
  Random random(seed);
  std::array<std::optional<Victim>, workers> victims;
  auto last_progress = Clock::now();
  std::uintmax_t total_before = 0;
  for (int kills = 0;; std::this_thread::sleep_for(std::chrono::milliseconds(1))) {
    std::uintmax_t total = 0;
    std::vector<const Kind*> open;
    for (const Kind& kind : kinds) {
      const std::uintmax_t done = total_of(kind, folder);
      total += done;
      if (done < operations) open.push_back(&kind);
    }
    if (open.empty()) return kills;
    if (total != std::exchange(total_before, total)) last_progress = Clock::now();
    if (Clock::now() - last_progress > std::chrono::minutes(1)) return fault("no progress for a minute"), kills;
    for (int worker = 0; worker < workers; ++worker) {
      auto& victim = victims[static_cast<std::size_t>(worker)];
      if (victim && !victim->process.runs()) return fault("a worker has ended by itself"), kills;
      if (victim && !victim->is_due(random)) continue;
      kills += victim ? 1 : 0;
      victim.reset();
      victim.emplace(*open[up_to(open.size() - 1, random)], worker, folder, random);
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

/// Writes each file once more.
void write_again(Host& host) {
  for (const Kind& kind : kinds) {
    for (int worker = 0; worker < workers; ++worker) {
      const std::uintmax_t last = acknowledged(host.native, kind.name, worker);
      for (std::uintmax_t next = 1; next <= keys; ++next) {
        if (!write(kind, host, worker, last + next)) fault(kind.name + ": cannot be written any more");
      }
    }
  }
}

int drive(std::uintmax_t operations, const fs::path& folder, unsigned seed) {
  fs::create_directories(folder / "sources");
  const int kills = kill_at_random(folder, operations, seed);
  Host host(folder);
  for (const Kind& kind : kinds) kind.check(host);
  const auto left = temporaries(folder);
#ifdef _WIN32
  // There, only those of yesterday count as left.
  for (const fs::path& path : left) {
    fs::last_write_time(path, fs::file_time_type::clock::now() - std::chrono::hours(48));
  }
#endif
  write_again(host);
  for (const fs::path& path : temporaries(folder)) fault(path.string() + ": left by a killed process");
#ifdef _WIN32
  RegDeleteTreeW(HKEY_CURRENT_USER, win32::wide(u"Software\\TALUtil\\Settings\\" + Text(application)));
#endif
  for (const Kind& kind : kinds) {
    std::printf("%s: %ju operations\n", kind.name.c_str(), total_of(kind, folder));
  }
  std::printf("%d processes killed, %zu temporary files left by them\n", kills, left.size());
  const int kinds_checked = static_cast<int>(kinds.size());
  std::printf("%d passed, %d failed\n", faults == 0 ? kinds_checked : 0, faults);
  return faults == 0 ? 0 : 1;
}

}  // namespace
}  // namespace talutil::testing

int main(int count, char** arguments) {
  using namespace talutil::testing;
  this_program = arguments[0];
  if (count == 5 && std::strcmp(arguments[1], "--work") == 0) {
    const auto kind = std::ranges::find_if(kinds, [&](const Kind& each) { return arguments[2] == each.name; });
    return kind == kinds.end() ? 2 : work(*kind, std::atoi(arguments[3]), arguments[4]);
  }
  if (count < 3) {
    std::fputs("usage: kills OPERATIONS FOLDER [SEED]\n", stderr);
    return 2;
  }
  return drive(std::strtoull(arguments[1], nullptr, 10), std::filesystem::absolute(arguments[2]),
               count > 3 ? static_cast<unsigned>(std::atoi(arguments[3])) : 1);
}
