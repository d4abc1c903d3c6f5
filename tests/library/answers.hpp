#pragma once

#include <array>
#include <utility>
#include <vector>

#include "tests/fakes/late_members.hpp"

namespace talutil::testing {

/// A member, and what it answers to arguments, both as `LateRow` writes them.
struct Answers {
  TextView member;
  std::vector<std::pair<TextView, std::string_view>> rows;
};

class AnsweringMembers : public LateMembers {
 protected:
  void check(const std::vector<Answers>& members) {
    for (const auto& [member, rows] : members) {
      for (const auto& [arguments, answer] : rows) LateMembers::check(std::array{LateRow{member, arguments, answer}});
    }
  }
};

}  // namespace talutil::testing
