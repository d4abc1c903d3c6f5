#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "automation/late_call.hpp"
#include "library/interface_table.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {

/// Calls members as a table row writes them: arguments parted by "|", where "@null" and "@empty" are those
/// values, "#5/3/2009#" a date, "=1.5" a number and everything else a text. The answer shows the result the same
/// way, then each argument that was written back.
class LateMembers : public UtilsTest {
 protected:
  std::string call(TextView member, TextView written) {
    std::vector<Argument> arguments;
    for (std::size_t start = 0; start <= written.size();) {
      const std::size_t end = std::min(written.find(u'|', start), written.size());
      arguments.emplace_back(read(written.substr(start, end - start)));
      start = end + 1;
    }
    const LateInterface& members = late_interface<ORVUtils>();
    const std::int32_t slot = members.slot_of(members.identifier_of(member), Access::call);
    std::string answer;
    try {
      answer = shown(members.call(&utils, slot, arguments, utils.locale()));
    } catch (const RunTimeError& error) {
      answer = "error " + std::to_string(error.number());
    }
    for (const Argument& argument : arguments) {
      if (argument.is_changed) answer += " | " + shown(argument.value);
    }
    return answer;
  }


 private:
  static Variant read(TextView written) {
    if (written == u"@null") return Null{};
    if (written == u"@empty") return {};
    if (written == u"@error") return ErrorValue{5};
    if (written.starts_with(u'=')) return Variant(written.substr(1)).to_double(plain_numbers);
    if (written.starts_with(u'#')) return Variant(written.substr(1, written.size() - 2)).to_date(plain_numbers);
    return written;
  }

  static std::string shown(const Variant& value) {
    if (value.is(Variant::Kind::empty)) return "Empty";
    const std::string text = to_utf8(value.to_text(plain_numbers));
    return value.is(Variant::Kind::date) ? "#" + text + "#" : text;
  }
};

}  // namespace talutil::testing
