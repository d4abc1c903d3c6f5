#include "calling/call_record.hpp"
#include "calling/comparison.hpp"
#include "controls/zip_controls.hpp"
#include "library/interface_table.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::calling {
namespace {

using testing::check_rows;
using testing::Rows;

TEST(CallRecord, MasksSecrets) {
  using Arguments = std::vector<Argument>;
  const auto text = [](TextView value) { return Argument(Variant(value)); };
  const auto flag = [](bool value) { return Argument(Variant(Boolean(value))); };
  const Rows<TextView, Arguments, bool, bool> rows{
      // member, arguments with a text "secret", whether it may stand in the line, and the result "answer"
      {"an ordinary one", u"StripNulls", {text(u"secret")}, true, true},
      {"encrypting", u"CryptoEncryptString", {text(u"secret")}, false, false},
      {"decrypting", u"CryptoDecryptString", {text(u"secret")}, false, false},
      {"checking a password", u"VerifyPasswordText", {text(u"secret")}, false, true},
      {"making one", u"GenerateFilePassword", {text(u"secret")}, true, false},
      {"zipping", u"CallZIPFiles", {text(u"a"), text(u"b"), text(u"0"), text(u"secret")}, false, true},
      {"asking in clear", u"MyInputBox", {text(u"secret"), text(u""), flag(false)}, true, true},
      {"with asterisks", u"MyInputBox", {text(u"secret"), text(u""), flag(true)}, true, false},
      {"with anything else", u"MyInputBox", {text(u"secret"), text(u""), text(u"x")}, true, false},
  };
  check_rows(rows, [](TextView name, const Arguments& arguments, bool shows_argument, bool shows_result) {
    NumberedObjects objects;
    const LateInterface& members = late_interface<ORVUtils>();
    const auto slot = static_cast<std::size_t>(*slot_for(members, name, 0));
    CallRecord record({7, 0}, members.members[slot], arguments, objects);
    record.succeed(u"answer", arguments);
    const std::string line = std::move(record).line(5);
    EXPECT_EQ(shows_argument, line.find("secret") != std::string::npos) << line;
    EXPECT_EQ(shows_result, line.find("answer") != std::string::npos) << line;
  });
  NumberedObjects objects;
  const Argument password(Variant(u"secret"));
  const LateInterface& zip = late_interface<ZipControl>();
  const auto put = static_cast<std::size_t>(*slot_for(zip, u"Password", 1));
  CallRecord record({7, 3}, zip.members[put], {&password, 1}, objects);
  record.succeed({}, {&password, 1});
  EXPECT_EQ(R"({"process": 7, "on": 3, "call": "Password", "args": [{"masked": true}], "result": {"masked": true}, )"
            "\"microseconds\": 5}\n",
            std::move(record).line(5));
}

struct ComparisonTest : testing::UtilsTest {
  /// What the comparison of a recording prints, and what it skipped.
  std::string compare(std::vector<std::string_view> lines) {
    Comparison comparison([this] { return std::shared_ptr<Library>(std::shared_ptr<void>(), &library); });
    std::string text;
    for (const std::string_view line : lines) text += comparison.repeat(line);
    EXPECT_EQ(text.empty() ? 0U : 1U, comparison.different());
    for (const auto& [reason, count] : comparison.skipped()) text += "|" + reason + " " + std::to_string(count);
    return text;
  }
};

TEST_F(ComparisonTest, FindsDifferencesAndSkipsWhatSaysNothing) {
  const Rows<std::vector<std::string_view>, std::string_view> rows{
      {"laid out otherwise",
       {R"({"call":"WeekYearToDate","args":[60,2009,1],"result":{"date":"2009-12-24T00:00:00"},"arguments":{"iWeek":52}})"},
       ""},
      {"blanks within a text",
       {R"({"call": "StripNulls", "args": ["a b"], "result": "ab"})"},
       R"(StripNulls["a b"]: recorded "ab", now "a b")"},
      {"not written back",
       {R"({"call": "WeekYearToDate", "args": [60, 2009, 1], "result": {"date": "2009-12-24T00:00:00"}})"},
       R"(WeekYearToDate[60, 2009, 1]: recorded {"date": "2009-12-24T00:00:00"}, now {"date": "2009-12-24T00:00:00"} and {"iWeek": 52})"},
      {"no error any more",
       {R"({"call": "iBranchID", "error": {"number": 5}})"},
       R"(iBranchID: recorded {"number": 5}, now 0)"},
      {"a member that is gone",
       {R"({"call": "Gone", "result": 1})"},
       R"(Gone: recorded 1, now {"number": 438, "description": "the object has no member \"Gone\"; \"talutil list\" lists those of the toolkit", "source": "talutil", "line": 0})"},
      {"objects by their numbers",
       {R"({"create": "TALUtil.cControlPosition", "result": {"object": 8}})",
        R"({"on": 8, "call": "Top", "args": [5], "result": {"empty": true}})",
        R"({"on": 8, "call": "Top", "result": 5})", R"({"release": 8})", R"({"on": 8, "call": "Top", "result": 5})"},
       "|an object of unknown origin 1"},
      {"an object of the host",
       {R"({"call": "IncDay", "args": [{"host_object": 1}, 1], "error": {"number": 438}})"},
       "|an object of the host 1"},
      {"such a form in a text is none",
       {R"({"call": "StripNulls", "args": ["{\"masked\": true}"], "result": "{\"masked\": true}"})"},
       ""},
      {"the time", {R"({"call": "VerifyNullDate", "args": [3, "1/1/1980 10:00"], "result": "x"})"}, "|the time 1"},
      {"not made at all", {R"({"call": "DeleteFiles", "args": ["C:\\*.*"], "result": {"empty": true}})"}, "|files 1"},
      {"a counter after a skipped call",
       {R"({"call": "VerifyTextData", "args": [0, 0, {"masked": true}], "result": ""})",
        R"({"call": "CounterVerifyText", "result": 7})", R"({"call": "CounterVerifyText", "result": 7})",
        R"({"call": "VerifyTextData", "args": [0, 0, "a"], "result": "a"})",
        R"({"call": "CounterVerifyText", "result": 8})"},
       "|a masked text 1|a setting that a skipped call may have changed 1"},
  };
  check_rows(rows, [&](const std::vector<std::string_view>& lines, std::string_view expected) {
    EXPECT_EQ(expected, compare(lines));
  });
}

}  // namespace
}  // namespace talutil::calling
