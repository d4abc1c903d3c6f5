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
  using Closed = std::vector<int>;
  using Item = Owned<Noted>;
  const struct {
    const char* name;
    void (*use)(Item& item, Closed& others);
    Closed expected, expected_others;
  } rows[] = {
      {"ends", [](Item&, Closed&) {}, {1}, {}},
      {"released", [](Item& item, Closed&) { EXPECT_EQ(item.release(), 1); }, {}, {}},
      {"exchanged", [](Item& item, Closed&) { item.reset(2); }, {1, 2}, {}},
      {"received", [](Item& item, Closed&) { *item.receive() = 2; }, {1, 2}, {}},
      {"moved from", [](Item& item, Closed&) { const Item other(std::move(item)); }, {1}, {}},
      // A handle goes back to where it came from.
      {"moved to", [](Item& item, Closed& others) { item = Item(2, {&others}); }, {1}, {2}},
      {"moved to itself",
       [](Item& item, Closed&) {
         item = static_cast<Item&&>(item);
         EXPECT_EQ(item.get(), 1);
       },
       {1},
       {}},
  };
  for (const auto& row : rows) {
    Closed closed, others;
    SetLastError(ERROR_FILE_EXISTS);
    {
      Item item(1, {&closed});
      row.use(item, others);
    }
    EXPECT_EQ(closed, row.expected) << row.name;
    EXPECT_EQ(others, row.expected_others) << row.name;
    EXPECT_EQ(GetLastError(), DWORD{ERROR_FILE_EXISTS}) << row.name;
  }
}

}  // namespace
}  // namespace talutil::win32
