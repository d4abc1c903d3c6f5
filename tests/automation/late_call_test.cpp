#include "automation/late_call.hpp"

#include "automation/run_time_error.hpp"
#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

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

  std::int32_t Count(TextArray& list) { return static_cast<std::int32_t>(list.items.size()); }
};

template <class P>
constexpr auto members_of(std::type_identity<Sample>) {
  return P::rows(P::template property<&Sample::Size>("Size"), P::template put_only<&Sample::Picture>("Picture"),
                 P::template get_only<&Sample::name>({"Name", 0x1234}),
                 P::template method<&Sample::Join>("Join", "first", "second", optional("separator", "-")),
                 P::template method<&Sample::WriteThenFail>("WriteThenFail", "number"),
                 P::template method<&Sample::Count>("Count", "list"));
}

Variant use(Sample& sample, TextView name, Access access, std::span<Argument> arguments) {
  const LateInterface& members = late_interface<Sample>();
  return members.call(&sample, members.slot_of(members.identifier_of(name), access), arguments, plain_numbers);
}

TEST(LateCall, CoercesArgumentsAndWritesBackInTheTypeOfTheParameter) {
  using enum Access;
  const struct {
    TextView member;
    Access access;
    TextView arguments;
    std::string_view answer;
  } rows[] = {
      {u"join", call, u"=5|b", "\"5-b\""},
      {u"JOIN", call, u"a|b|+", "\"a+b\""},
      {u"Join", get, u"a|b", "\"a-b\""},  // A method's answer.
      {u"Join", call, u"a|@empty|-", "\"a-\" | \"filled\""},
      // With a default in play the arguments travel through places of the call's own, and come back.
      {u"Join", call, u"a||@missing", "\"a-\" | \"filled\""},
      {u"WriteThenFail", call, u"1", "error 9 | 7%"},
      {u"Size", put, u" 12 ", "Empty"},
      {u"Size", get, u"@none", "12&"},
      {u"Size", call, u"@none", "12&"},
      {u"Name", get, u"@none", "\"sample\""},
      {u"Nothing", call, u"@none", "error 438"},
      {u"Join", call, u"a", "error 449"},
      // A variable that stands for an argument which its own caller left out is a value where one is required.
      {u"Join", call, u"@missing|b", "error 13"},
      {u"Join", call, u"a|b|c|d", "error 450"},
      {u"Join", call, u"@null|b", "error 94"},
      {u"Count", call, u"no array", "error 13"},
      {u"Picture", put, u"a text", "error 13"},
      {u"Picture", put, u"@empty", "error 13"},
  };
  Sample sample;
  for (const auto& [member, access, arguments, answer] : rows) {
    const auto use_it = [&](auto given) { return use(sample, member, access, given); };
    EXPECT_EQ(testing::late_answer(arguments, &testing::shown, use_it), answer)
        << to_utf8(member) << to_utf8(arguments);
  }
}

}  // namespace
}  // namespace talutil
