#include <set>

#include "tests/faults/fixture.hpp"
#include "tests/faults/posix/recorded_disk.hpp"

namespace talutil::testing {
namespace {

struct PowerCuts : Faults {};

TEST_P(PowerCuts, LoseNothing) {
  write_tree(root, old_files);
  RecordedDisk disk(root);
  in_a_host(GetParam().act);
  disk.stop();
  const unsigned ways = is_whole() ? 204 : 16;
  for (std::size_t step = 0; step <= disk.steps(); ++step) {
    std::set<Contents> found;
    for (unsigned kept = 0; kept < ways; ++kept) found.insert(disk.after_cut(step, kept));
    for (const Contents& files : found) {
      ++Counts::cuts;
      write_tree(root, files);
      SCOPED_TRACE("cut before step " + std::to_string(step) + " of " + std::to_string(disk.steps()));
      const Contents left = contents();
      expect_whole(left, true);
      if (step == disk.steps() && GetParam().promise == Promise::whole) expect_new(left);
      expect_next_call_works(false);
      if (HasFailure()) return;
    }
  }
}

INSTANTIATE_TEST_SUITE_P(All, PowerCuts, ::testing::ValuesIn(operations()), &name_of);

}  // namespace
}  // namespace talutil::testing
