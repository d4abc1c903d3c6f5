#pragma once

#include <string>
#include <vector>

#include "automation/late_call.hpp"
#include "library/interface_table.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {

/// A member, and what it answers to arguments. Those are parted by "|", where "@null", "@empty", "@missing" and
/// "@error" are those values, "#5/3/2009#" a date, "=1.5" a number and everything else a text; the answer is the result
/// in the same form and then each argument that was written back.
struct Answers {
  TextView member;
  std::vector<std::pair<TextView, std::string_view>> rows;
};

inline Variant late_value(TextView written) {
  if (written == u"@null") return Null{};
  if (written == u"@empty") return {};
  if (written == u"@missing") return missing_argument;
  if (written == u"@error") return ErrorValue{5};
  if (written.starts_with(u'=')) return Variant(written.substr(1)).to_double(plain_numbers);
  if (written.starts_with(u'#')) return Variant(written.substr(1, written.size() - 2)).to_date(plain_numbers);
  return written;
}

inline std::string shown_late(const Variant& value) {
  if (value.is(Variant::Kind::empty)) return "Empty";
  const std::string text = to_utf8(value.to_text(plain_numbers));
  return value.is(Variant::Kind::date) ? "#" + text + "#" : text;
}

class LateMembers : public UtilsTest {
 protected:
  /// What a member answers to the arguments of a row ("@none" is without any).
  std::string call(TextView member, TextView written, Access access = Access::call) {
    std::vector<Argument> arguments;
    for (std::size_t start = 0; start <= written.size() && written != u"@none";) {
      const std::size_t end = std::min(written.find(u'|', start), written.size());
      arguments.emplace_back(late_value(written.substr(start, end - start)));
      start = end + 1;
    }
    std::string answer;
    const std::int32_t error = error_of([&] { answer = shown_late(call(member, access, arguments)); });
    if (error != 0) answer = "error " + std::to_string(error);
    for (const Argument& argument : arguments) {
      if (argument.is_changed) answer += " | " + shown_late(argument.value);
    }
    return answer;
  }

  Variant call(TextView member, Access access, std::span<Argument> arguments) {
    const LateInterface& members = late_interface<ORVUtils>();
    const std::int32_t slot = members.slot_of(members.identifier_of(member), access);
    return members.call(static_cast<ORVUtils*>(&utils), slot, arguments, utils.locale());
  }

  void check(const std::vector<Answers>& members) {
    for (const auto& [member, rows] : members) {
      for (const auto& [arguments, answer] : rows) {
        EXPECT_EQ(call(member, arguments), answer) << to_utf8(member) << '(' << to_utf8(arguments) << ')';
      }
    }
  }
};

}  // namespace talutil::testing
