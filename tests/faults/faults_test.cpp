#include "tests/faults/allocations.hpp"
#include "tests/faults/fixture.hpp"

namespace talutil::testing {
namespace {

const auto* const counts = ::testing::AddGlobalTestEnvironment(new Counts);

TEST_P(Faults, ACallThatFailsLosesNothing) {
  for (const auto& [goes_on, allowed] : {std::pair(false, Allowed::everything),
                                         {true, Allowed::everything},
                                         {false, Allowed::no_replacing},
                                         {false, Allowed::no_new_files}}) {
    for (std::size_t number = 0;; number += stride()) {
      std::string what = "none";
      for (std::size_t way = 0; !what.empty() && !(goes_on && way > 0); ++way) {
        what = fail(number, way, goes_on, allowed);
        if (HasFailure()) return;
      }
      if (!FailingCall::was_reached) break;
    }
  }
}

TEST_P(Faults, AnAllocationThatFailsLosesNothing) {
  for (std::size_t number = 0;; number += stride()) {
    write_tree(root, old_files);
    const std::size_t handles = open_handles();
    const bool has_reported = in_a_host([&](Host& host) {
      const FailingAllocation failing(number);
      GetParam().act(host);
    });
    if (!FailingAllocation::is_reached()) return;
    ++Counts::allocations;
    SCOPED_TRACE("allocation " + std::to_string(number));
    EXPECT_EQ(open_handles(), handles);
    const Contents found = contents();
    expect_whole(found, false);
    if (!has_reported && GetParam().promise != Promise::silent) expect_new(found);
    expect_next_call_works(false);
    if (HasFailure()) return;
  }
}

INSTANTIATE_TEST_SUITE_P(All, Faults, ::testing::ValuesIn(operations()), &name_of);

}  // namespace
}  // namespace talutil::testing
