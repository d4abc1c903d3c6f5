#include <gtest/gtest.h>

#include <filesystem>

#include "platform/posix/hive.hpp"
#include "tests/faults/allocations.hpp"
#include "tests/faults/operations.hpp"
#include "tests/faults/system_calls.hpp"

// Whatever fails, and wherever the power is cut: the old or the new contents are whole, and the next call works.

namespace talutil::testing {
namespace {

using Files = RecordedDisk::Files;

/// How much is tried: everything that takes long only if the environment asks for it.
bool is_whole() { return getenv("TALUTIL_WHOLE") != nullptr; }

/// Reports how much was tried, which no check can.
struct Counts final : ::testing::Environment {
  void TearDown() override {
    std::printf("%zu failing calls, %zu failing allocations, %zu power cuts\n", failures, allocations, cuts);
  }
  static inline std::size_t failures = 0;
  static inline std::size_t allocations = 0;
  static inline std::size_t cuts = 0;
};
const auto* const counts = ::testing::AddGlobalTestEnvironment(new Counts);

/// A folder of the test's own, for the files of hosts.
struct Faults : ::testing::TestWithParam<Operation> {
  Faults() {
    static const std::filesystem::path folder = std::filesystem::temp_directory_path();
    std::string pattern = (folder / "talutil-faults-XXXXXX").string();
    root = mkdtemp(pattern.data());
    std::filesystem::create_directory(root + "/c");
    std::filesystem::create_directory(root + "/tmp");
    setenv("TMPDIR", (root + "/tmp").c_str(), 1);
    EXPECT_FALSE(in_a_host(GetParam().prepare));
    old_files = read_tree(root);
    old_contents = contents();
    write_tree(root, old_files);
    EXPECT_FALSE(in_a_host(GetParam().act));
    new_contents = contents();
  }
  ~Faults() override { std::filesystem::remove_all(root); }

  /// Does something in a new host. Returns whether an error or a message has said that it failed.
  bool in_a_host(const std::function<void(Host&)>& work) {
    last_message.clear();
    Host host(root);
    try {
      work(host);
    } catch (const RunTimeError& error) {
      EXPECT_GT(error.number(), 0);
      EXPECT_FALSE(error.description().empty());
      last_message = to_utf8(error.description());
      return true;
    } catch (const std::bad_alloc&) {
      return true;
    }
    for (const auto& message : host.fake.messages) last_message = to_utf8(message.text);
    return !host.fake.messages.empty();
  }

  /// Everything in the folder, with the values of the hive in the place of its files.
  [[nodiscard]] Files contents() const {
    Files files = read_tree(root);
    std::erase_if(files, [](const auto& file) { return file.first.starts_with("/c/hive.db"); });
    if (!std::filesystem::exists(root + "/c/hive.db")) return files;
    posix::Hive hive(root + "/c/hive.db");
    for (const auto& [key, name, value] : hive.values_below(u"HKEY_CURRENT_USER")) {
      files["hive " + to_utf8(key) + " " + to_utf8(name)] = value.data;
    }
    if (hive.has_key(u"HKEY_CURRENT_USER\\Software\\Host\\Key")) files["hive key"];
    return files;
  }

  /// Each file is the old or the new one, and there are no others.
  void expect_whole(const Files& found, bool may_leave_temporaries) const {
    Files all = old_contents;
    all.insert(new_contents.begin(), new_contents.end());
    all.insert(found.begin(), found.end());
    for (const auto& [path, ignored] : all) {
      if (may_leave_temporaries && path.find("/.talutil-") != std::string::npos) continue;
      EXPECT_TRUE(same(path, found, old_contents) || same(path, found, new_contents)) << path << " is neither";
    }
  }

  /// What was to be done has been done.
  void expect_new(const Files& found) const {
    for (const auto& [path, bytes] : new_contents) EXPECT_TRUE(same(path, found, new_contents)) << path;
  }

  /// Does what is tested while a call fails. Returns what has failed; nothing if the call has no such way of failing.
  std::string fail(std::size_t number, std::size_t way, bool goes_on, Allowed allowed) {
    write_tree(root, old_files);
    std::string what;
    const std::size_t descriptors = open_descriptors();
    const bool has_reported = in_a_host([&](Host& host) {
      const FailingCall failing(number, way, goes_on, allowed);
      const auto note = [&] {
        is_reached = failing.is_reached();
        what = FailingCall::what();
      };
      try {
        GetParam().act(host);
      } catch (...) {
        note();
        throw;
      }
      note();
    });
    if (what.empty()) return what;
    ++Counts::failures;
    SCOPED_TRACE("call " + std::to_string(number) + ", " + what + (goes_on ? " from then on" : "") +
                 (allowed == Allowed::everything     ? ""
                  : allowed == Allowed::no_replacing ? ", no file can be replaced"
                                                     : ", no file can be made"));
    EXPECT_EQ(open_descriptors(), descriptors);
    const Files found = contents();
    const bool cannot_remove = what.starts_with("unlink");
    // In place, a file may be left half written, but then its new contents are kept.
    const auto kept = std::ranges::find_if(found, [&](const auto& file) { return is_kept(file); });
    if (allowed == Allowed::everything || kept == found.end()) {
      expect_whole(found, goes_on || cannot_remove);
    } else {
      EXPECT_TRUE(cannot_remove || last_message.empty() || last_message.starts_with("ORV Zipping") ||
                  last_message.ends_with(kept->first))
          << last_message;
      std::filesystem::remove(root + kept->first);
    }
    if (!has_reported && GetParam().promise != Promise::silent) expect_new(found);
    expect_next_call_works(allowed != Allowed::everything && cannot_remove);
    return what;
  }

  /// What was to be done can be done now, and leaves nothing else behind.
  void expect_next_call_works(bool may_leave_temporaries) {
    const std::size_t descriptors = open_descriptors();
    EXPECT_FALSE(in_a_host(GetParam().act)) << "the next call: " << last_message;
    EXPECT_EQ(open_descriptors(), descriptors);
    Files found = contents();
    if (GetParam().name == std::string_view("AppendEventLog")) return;  // Now it has two more lines.
    for (const auto& [path, ignored] : found) {
      const bool is_temporary = path.find("/.talutil-") != std::string::npos;
      EXPECT_TRUE(new_contents.contains(path) || (may_leave_temporaries && is_temporary)) << path;
    }
    for (const auto& [path, bytes] : new_contents) EXPECT_TRUE(found.contains(path) && found[path] == bytes) << path;
  }

  /// Whether a file is a temporary one that has new contents.
  [[nodiscard]] bool is_kept(const Files::value_type& file) const {
    return file.first.find("/.talutil-") != std::string::npos &&
           std::ranges::any_of(new_contents, [&](const auto& one) { return one.second == file.second; });
  }

  static bool same(const std::string& path, const Files& a, const Files& b) {
    const auto in_a = a.find(path);
    const auto in_b = b.find(path);
    if (in_a == a.end() || in_b == b.end()) return in_a == a.end() && in_b == b.end();
    return in_a->second == in_b->second;
  }

  static std::size_t open_descriptors() {
    const std::filesystem::directory_iterator all("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(all), end(all)));
  }

  bool is_reached = true;  ///< Whether there was a call with the number that was to fail.
  std::string root;
  std::string last_message;
  Files old_files;  ///< Including those of the hive.
  Files old_contents;
  Files new_contents;
};

TEST_P(Faults, ACallThatFailsLosesNothing) {
  for (const auto& [goes_on, allowed] : {std::pair(false, Allowed::everything),
                                         {true, Allowed::everything},
                                         {false, Allowed::no_replacing},
                                         {false, Allowed::no_new_files}}) {
    for (std::size_t number = 0;; ++number) {
      std::string what = "none";
      for (std::size_t way = 0; !what.empty() && !(goes_on && way > 0); ++way) {
        what = fail(number, way, goes_on, allowed);
        if (HasFailure()) return;
      }
      if (!is_reached) break;
    }
  }
}

TEST_P(Faults, AnAllocationThatFailsLosesNothing) {
  for (std::size_t number = 0;; ++number) {
    write_tree(root, old_files);
    bool is_reached_now = false;
    const std::size_t descriptors = open_descriptors();
    const bool has_reported = in_a_host([&](Host& host) {
      const FailingAllocation failing(number);
      try {
        GetParam().act(host);
      } catch (...) {
        is_reached_now = true;
        throw;
      }
      is_reached_now = FailingAllocation::is_reached();
    });
    if (!is_reached_now) return;
    ++Counts::allocations;
    SCOPED_TRACE("allocation " + std::to_string(number));
    EXPECT_EQ(open_descriptors(), descriptors);
    const Files found = contents();
    expect_whole(found, false);
    if (!has_reported && GetParam().promise != Promise::silent) expect_new(found);
    expect_next_call_works(false);
    if (HasFailure()) return;
  }
}

TEST_P(Faults, APowerCutLosesNothing) {
  write_tree(root, old_files);
  RecordedDisk disk(root);
  in_a_host(GetParam().act);
  disk.stop();
  const unsigned seeds = is_whole() ? 200 : 8;
  for (std::size_t step = 0; step <= disk.steps(); ++step) {
    std::vector<Files> found;
    for (const auto lost : {RecordedDisk::Lost::everything, RecordedDisk::Lost::contents, RecordedDisk::Lost::names,
                            RecordedDisk::Lost::nothing}) {
      found.push_back(disk.after_cut(step, lost, 0));
    }
    for (unsigned seed = 0; seed < seeds; ++seed) {
      found.push_back(disk.after_cut(step, RecordedDisk::Lost::at_random, seed));
    }
    std::ranges::sort(found);
    const auto same_ones = std::ranges::unique(found);
    found.erase(same_ones.begin(), same_ones.end());
    for (const Files& files : found) {
      ++Counts::cuts;
      write_tree(root, files);
      SCOPED_TRACE("cut before step " + std::to_string(step) + " of " + std::to_string(disk.steps()));
      const Files left = contents();
      expect_whole(left, true);
      if (step == disk.steps() && GetParam().promise == Promise::whole) expect_new(left);
      expect_next_call_works(false);
      if (HasFailure()) return;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(All, Faults, ::testing::ValuesIn(operations()), [](const auto& tested) {
  std::string name = tested.param.name;
  std::erase_if(name, [](char c) { return !isalnum(c); });
  return name;
});

}  // namespace
}  // namespace talutil::testing
