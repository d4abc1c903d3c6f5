#include "automation/late_call.hpp"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "automation/run_time_error.hpp"
#include "tests/fakes/error_of.hpp"

namespace talutil {
namespace {

// A class with one member of every shape.
class Sample {
 public:
  std::int32_t Size = 3;
  ObjectRef Picture;

  [[nodiscard]] Text name() const { return u"sample"; }

  Text Join(const Text& first, Text& second, const Text& separator) {
    const Text joined = first + separator + second;
    if (second.empty()) second = u"filled";
    return joined;
  }

  void WriteThenFail(std::int16_t& number) {
    number = 7;
    raise(ErrorNumber::subscript_out_of_range);
  }

  std::int32_t Count(TextArray& list, Variant& anything) {
    list.items.emplace_back(u"more");
    list.allocated = true;
    anything = Date{1};
    return static_cast<std::int32_t>(list.items.size());
  }
};

template <class P>
constexpr auto members_of(std::type_identity<Sample>) {
  return P::rows(P::template property<&Sample::Size>("Size", ""), P::template put_only<&Sample::Picture>("Picture", ""),
                 P::template get_only<&Sample::name>({"Name", 0x1234}, ""),
                 P::template method<&Sample::Join>("Join", "", "first", "second", optional("separator", "-")),
                 P::template method<&Sample::WriteThenFail>("WriteThenFail", "", "number"),
                 P::template method<&Sample::Count>("Count", "", "list", "anything"));
}

class LateCallTest : public ::testing::Test {
 protected:
  Variant call(TextView name, Access access, std::vector<Argument> arguments = {}) {
    given_ = std::move(arguments);
    const LateInterface& members = late_interface<Sample>();
    return members.call(&sample_, members.slot_of(members.identifier_of(name), access), given_, plain_numbers);
  }

  std::int32_t error(TextView name, Access access, std::vector<Argument> arguments = {}) {
    return talutil::testing::error_of([&] { call(name, access, std::move(arguments)); });
  }

  Sample sample_;
  std::vector<Argument> given_;
};

TEST_F(LateCallTest, CoercesArgumentsAndFillsDefaults) {
  EXPECT_EQ(call(u"join", Access::call, {Variant(std::int16_t{5}), Variant(u"b")}), Variant(u"5-b"));
  EXPECT_FALSE(given_[1].is_changed);
  EXPECT_EQ(call(u"JOIN", Access::call, {Variant(u"a"), Variant(u"b"), Variant(u"+")}), Variant(u"a+b"));
  EXPECT_EQ(call(u"Join", Access::call, {Variant(u"a"), Variant(u"b"), Variant(missing_argument)}), Variant(u"a-b"));
  call(u"Size", Access::put, {Variant(u" 12 ")});
  EXPECT_EQ(call(u"Size", Access::get), Variant(std::int32_t{12}));
  EXPECT_EQ(call(u"Size", Access::call), Variant(std::int32_t{12}));
  EXPECT_EQ(call(u"Name", Access::get), Variant(u"sample"));
  EXPECT_EQ(call(u"Join", Access::get, {Variant(u"a"), Variant(u"b")}), Variant(u"a-b")) << "a method's answer";
}

TEST_F(LateCallTest, WritesBackWhatChangedInTheTypeOfTheParameter) {
  call(u"Join", Access::call, {Variant(u"a"), Variant(), Variant(u"-")});
  EXPECT_TRUE(given_[1].is_changed);
  EXPECT_EQ(given_[1].value, Variant(u"filled"));

  call(u"Count", Access::call, {Variant(), Variant(u"x")});
  EXPECT_EQ(given_[0].value, Variant(TextArray{{u"more"}, 0, true}));
  EXPECT_EQ(given_[1].value, Variant(Date{1}));

  // With a default in play the arguments travel through places of the call's own, and come back.
  call(u"Join", Access::call, {Variant(u"a"), Variant(u""), Variant(missing_argument)});
  EXPECT_EQ(given_[1].value, Variant(u"filled"));
}

TEST_F(LateCallTest, KeepsWhatWasWrittenBeforeAnError) {
  EXPECT_EQ(error(u"WriteThenFail", Access::call, {Variant(u"1")}), 9);
  EXPECT_EQ(given_[0].value, Variant(std::int16_t{7}));
  EXPECT_TRUE(given_[0].is_changed);
}

TEST_F(LateCallTest, RefusesWrongCalls) {
  EXPECT_EQ(error(u"Nothing", Access::call), 438);
  EXPECT_EQ(error(u"Join", Access::call, {Variant(u"a")}), 449);
  // A variable that stands for an argument which its own caller left out is a value where one is required.
  EXPECT_EQ(error(u"Join", Access::call, {Variant(missing_argument), Variant(u"b")}), 13);
  EXPECT_EQ(error(u"Join", Access::call, {Variant(u"a"), Variant(u"b"), Variant(u"c"), Variant(u"d")}), 450);
  EXPECT_EQ(error(u"Join", Access::call, {Variant(Null{}), Variant(u"b")}), 94);
  EXPECT_EQ(error(u"Count", Access::call, {Variant(u"no array"), Variant()}), 13);
  EXPECT_EQ(late_interface<Sample>().slot_of(0x1234, Access::put), -1);
}

TEST_F(LateCallTest, ObjectPropertiesTakeObjectsOnly) {
  EXPECT_EQ(error(u"Picture", Access::put, {Variant(u"a text")}), 13);
  EXPECT_EQ(error(u"Picture", Access::put, {Variant()}), 13);
  EXPECT_EQ(error(u"Picture", Access::put, {Variant(ObjectRef())}), 0);
}

}  // namespace
}  // namespace talutil
