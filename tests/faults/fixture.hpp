#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>

#include "tests/faults/failing.hpp"
#include "tests/faults/operations.hpp"

/// Whatever fails, and wherever the power is cut: the old or the new contents are whole, and the next call works.
namespace talutil::testing {

/// How much is tried: everything that takes long only if the environment asks for it.
inline bool is_whole() { return getenv("TALUTIL_WHOLE") != nullptr; }

inline std::size_t stride() { return is_whole() ? 1 : stride_of_short_form(); }

/// Reports how much was tried, which no check can.
struct Counts final : ::testing::Environment {
  void TearDown() override {
    const ::testing::UnitTest& tests = *::testing::UnitTest::GetInstance();
    std::printf("%zu failing calls, %zu failing allocations, %zu power cuts\n%d passed, %d failed\n", failures,
                allocations, cuts, tests.successful_test_count(), tests.failed_test_count());
  }
  static inline std::size_t failures = 0;
  static inline std::size_t allocations = 0;
  static inline std::size_t cuts = 0;
};
inline std::string name_of(const ::testing::TestParamInfo<Operation>& tested) {
  std::string name = tested.param.name;
  std::erase_if(name, [](unsigned char c) { return std::isalnum(c) == 0; });
  return name;
}

/// A folder of the test's own, for the files of hosts.
struct Faults : ::testing::TestWithParam<Operation> {
  Faults() {
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

  [[nodiscard]] Contents contents() const { return contents_of(root); }

  /// Each file is the old or the new one, and there are no others.
  void expect_whole(const Contents& found, bool may_leave_temporaries) const {
    Contents all = old_contents;
    all.insert(new_contents.begin(), new_contents.end());
    all.insert(found.begin(), found.end());
    for (const auto& [path, ignored] : all) {
      if (may_leave_temporaries && path.find("/.talutil-") != std::string::npos) continue;
      EXPECT_TRUE(same(path, found, old_contents) || same(path, found, new_contents)) << path << " is neither";
    }
  }

  /// What was to be done has been done.
  void expect_new(const Contents& found) const {
    for (const auto& [path, bytes] : new_contents) EXPECT_TRUE(same(path, found, new_contents)) << path;
  }

  /// Does what is tested while a call fails. Returns what has failed; nothing if the call has no such way of failing.
  std::string fail(std::size_t number, std::size_t way, bool goes_on, Allowed allowed) {
    write_tree(root, old_files);
    const std::size_t handles = open_handles();
    const bool has_reported = in_a_host([&](Host& host) {
      const FailingCall failing(number, way, goes_on, allowed);
      GetParam().act(host);
    });
    const std::string what = FailingCall::failed;
    if (what.empty()) return what;
    ++Counts::failures;
    SCOPED_TRACE("call " + std::to_string(number) + ", " + what + (goes_on ? " from then on" : "") +
                 (allowed == Allowed::everything     ? ""
                  : allowed == Allowed::no_replacing ? ", no file can be replaced"
                                                     : ", no file can be made"));
    EXPECT_EQ(open_handles(), handles);
    const Contents found = contents();
    // What cannot be removed is left.
    const bool cannot_remove = what.starts_with("unlink") || what.starts_with("DeleteFileW");
    // In place, a file may be left half written, but then its new contents are kept.
    const auto kept = std::ranges::find_if(found, [&](const auto& file) { return is_kept(file); });
    if (allowed == Allowed::everything || kept == found.end()) {
      expect_whole(found, goes_on || cannot_remove);
    } else {
      EXPECT_TRUE(cannot_remove || last_message.empty() || last_message.starts_with("ORV Zipping") ||
                  last_message.ends_with(kept->first.substr(kept->first.rfind('/') + 1)))
          << last_message;
      std::filesystem::remove(root / kept->first.substr(1));
    }
    if (!has_reported && GetParam().promise != Promise::silent) expect_new(found);
    expect_next_call_works((cannot_remove && allowed != Allowed::everything) ||
                           (!clears_at_once() && (goes_on || cannot_remove)));
    return what;
  }

  /// What was to be done can be done now, and leaves nothing else behind.
  void expect_next_call_works(bool may_leave_temporaries) {
    const std::size_t handles = open_handles();
    EXPECT_FALSE(in_a_host(GetParam().act)) << "the next call: " << last_message;
    EXPECT_EQ(open_handles(), handles);
    Contents found = contents();
    if (GetParam().name == std::string_view("AppendEventLog")) return;  // Now it has two more lines.
    for (const auto& [path, ignored] : found) {
      const bool is_temporary = path.find("/.talutil-") != std::string::npos;
      EXPECT_TRUE(new_contents.contains(path) || (may_leave_temporaries && is_temporary)) << path;
    }
    for (const auto& [path, bytes] : new_contents) EXPECT_TRUE(found.contains(path) && found[path] == bytes) << path;
  }

  /// Whether a file is a temporary one that has new contents.
  [[nodiscard]] bool is_kept(const Contents::value_type& file) const {
    return file.first.find("/.talutil-") != std::string::npos &&
           std::ranges::any_of(new_contents, [&](const auto& one) { return one.second == file.second; });
  }

  static bool same(const std::string& path, const Contents& a, const Contents& b) {
    const auto in_a = a.find(path);
    const auto in_b = b.find(path);
    if (in_a == a.end() || in_b == b.end()) return in_a == a.end() && in_b == b.end();
    return in_a->second == in_b->second;
  }

  std::filesystem::path root = make_root();
  std::string last_message;
  Contents old_files;  ///< Including those of the hive.
  Contents old_contents;
  Contents new_contents;
};

}  // namespace talutil::testing
