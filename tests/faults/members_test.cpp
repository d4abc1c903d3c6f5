#include <gtest/gtest.h>

#include "automation/late_call.hpp"
#include "library/interface_table.hpp"
#include "tests/fakes/utils_test.hpp"
#include "tests/faults/allocations.hpp"

// Every member, with an allocation that fails: nothing is lost or left locked, and the library works on.

namespace talutil::testing {
namespace {

/// A control that has every member a host's control may have. Reading gives a small number, or what was put last.
struct AnyControl final : Object {
  std::map<std::string, std::int32_t> names;
  std::map<std::int32_t, Variant> values;

  std::int32_t member_id(TextView name) override {
    return names.try_emplace(to_utf8(name), static_cast<std::int32_t>(names.size()) + 1).first->second;
  }
  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    if (access == Access::put) values[member] = arguments.back();
    const auto found = values.find(member);
    return found == values.end() ? Variant(2) : found->second;
  }
};

/// A started library on a made-up machine, where every question is answered.
struct World : UtilsTest {
  World() {
    library.start();
    platform.files.put(u"C:\\a.txt", "one\r\ntwo,three\r\n");
    platform.answers = {MessageAnswer::yes, MessageAnswer::yes};
    platform.inputs = platform.passwords = platform.chosen_files = {u"C:\\a.txt", u"5/3/2009"};
    SharedSettings& settings = library.settings();
    settings.EventLog = 1;
    settings.sORVPath = u"C:";
    settings.sReportsDir = u"C:\\reports\\";
  }
  void TestBody() override {}

  static Variant argument(const Parameter& parameter, TextView text, const ObjectRef& object) {
    switch (parameter.type) {
      case ValueType::text:
        return text;
      case ValueType::text_array:
        return Variant(array_of({u"a", Text(text)}));
      case ValueType::variant:
        return object ? Variant(object) : Variant(text);
      case ValueType::object:
        return Variant(object ? object : std::make_shared<AnyControl>());
      case ValueType::date:
        return Variant(Date{40000.5});
      default:
        return Variant(std::int16_t{1});
    }
  }

  void call(std::int32_t slot, std::span<Argument> arguments) {
    late_interface<ORVUtils>().call(static_cast<ORVUtils*>(&utils), slot, arguments, utils.locale());
  }
};

TEST(Members, SurviveEveryFailingAllocation) {
  const bool is_whole = getenv("TALUTIL_WHOLE") != nullptr;
  const auto& members = late_interface<ORVUtils>().members;
  std::size_t tried = 0;
  for (std::size_t slot = 0; slot < members.size(); ++slot) {
    const Member& member = members[slot];
    for (const auto& [text, has_object] : {std::pair(TextView(u"C:\\a.txt"), true), {u"5/3/2009 8:30", false}}) {
      // The first hundred one by one, then with growing steps: some members allocate ten thousand times.
      for (std::size_t number = 0;; number += is_whole ? 1 : 1 + number / 100) {
        World world;
        std::vector<Argument> arguments;
        const ObjectRef object = has_object ? std::make_shared<AnyControl>() : nullptr;
        for (const Parameter& parameter : member.parameters()) {
          arguments.emplace_back(World::argument(parameter, text, object));
        }
        if (member.access == Access::put && arguments.empty()) arguments.emplace_back(Variant(text));
        SCOPED_TRACE(std::string(member.name) + ", allocation " + std::to_string(number));
        bool is_reached = true;
        {
          const FailingAllocation failing(number);
          try {
            world.call(static_cast<std::int32_t>(slot), arguments);
          } catch (const RunTimeError&) {
          } catch (const std::bad_alloc&) {
          }
          is_reached = FailingAllocation::is_reached();
        }
        EXPECT_LE(world.platform.form.windows, 1) << "notices stay open";
        EXPECT_LE(world.platform.preview.windows, 1) << "a report that failed stays loaded";
        EXPECT_EQ(world.utils.StripNulls(Text(u"a\0", 2)), u"a");
        if (!is_reached || ::testing::Test::HasFailure()) break;
        ++tried;
      }
      if (::testing::Test::HasFailure()) return;
    }
  }
  std::printf("%zu failing allocations of %zu members\n", tried, members.size());
}

}  // namespace
}  // namespace talutil::testing
