#include "platform/win32/handle.hpp"

#include <gtest/gtest.h>

#include <vector>

namespace talutil::win32 {
namespace {

/// Notes what is given back, as a number of the test's own, and fails as the system may.
struct Noted {
  using Handle = int;
  std::vector<int>* closed;
  static int none() noexcept { return -1; }
  void close(int handle) const {
    closed->push_back(handle);
    SetLastError(ERROR_INVALID_HANDLE);
  }
};

TEST(Owned, GivesEachHandleBackOnceAndKeepsTheLastError) {
  std::vector<int> closed, others;
  SetLastError(ERROR_FILE_EXISTS);
  {
    using Item = Owned<Noted>;
    Item ends(1, {&closed}), released(2, {&closed}), exchanged(3, {&closed}), received(4, {&closed});
    EXPECT_EQ(released.release(), 2);
    exchanged.reset(30);
    *received.receive() = 40;
    Item moved(5, {&closed});
    Item moved_to(std::move(moved));
    // A handle goes back to where it came from.
    moved_to = Item(6, {&others});
    moved_to = static_cast<Item&&>(moved_to);
    EXPECT_EQ(moved_to.get(), 6);
    EXPECT_EQ(closed, (std::vector{3, 4, 5}));
    EXPECT_EQ(others, std::vector<int>());
  }
  EXPECT_EQ(closed, (std::vector{3, 4, 5, 40, 30, 1}));
  EXPECT_EQ(others, std::vector{6});
  EXPECT_EQ(GetLastError(), DWORD{ERROR_FILE_EXISTS});
}

}  // namespace
}  // namespace talutil::win32
