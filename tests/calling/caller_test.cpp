#include "calling/caller.hpp"

#include "controls/grid.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::calling {
namespace {

using testing::check_rows;
using testing::Rows;

struct CallerTest : testing::UtilsTest {
  std::string answer(std::string_view line) {
    std::string out;
    is_request = caller.answer(line, 7, out);
    return out;
  }

  Caller caller{library};
  bool is_request = false;
};

TEST_F(CallerTest, AnswersCallsInOrderAndKeepsObjectsByNumber) {
  const Rows<std::string_view, std::string_view> rows{
      {"any case, any order, any identifier", R"( {"args":["A,B,",0,1],"id":{"a":[1]},"call":"getDATA"} )",
       R"({"id": {"a":[1]}, "result": "A"})"},
      {"set first", R"({"set": {"iCharacterCaseSuburbs": 3}, "call": "ConvertCaseSuburbs", "args": ["carlton"]})",
       R"({"result": "CARLTON"})"},
      {"a declared Single is a number", R"({"set": {"GSTValue": 0.1}, "call": "GSTValue"})", R"({"result": 0.1})"},
      {"one variable twice", R"({"call": "GetTimeDifference", "args": ["1/1/2009", {"same": 0}, "9:00", "10:30"]})",
       R"({"result": "1:30", "arguments": {"vStDate": "01/01/2009", "vEnDate": "01/01/2009", "vStTime": "09:00", "vEnTime": "10:30"}})"},
      {"a property that cannot be read", R"({"call": "SplashForm", "id": null})",
       R"({"id": null, "error": {"number": 438, "description": "Object doesn't support this property or method", "source": "TALUtil.ORVUtils"}})"},
      {"a control", R"({"create": "TALUtil.Grid", "set": {"Rows": 2, "Cols": 2}})", R"({"result": {"object": 1}})"},
      {"an interface", R"({"create": "ccontrolposition"})", R"({"result": {"object": 2}})"},
      {"stored under the same number", R"({"create": "ZipControl", "set": {"OnProgress": {"object": 1}}})",
       R"({"result": {"object": 3}})"},
      {"and handed back", R"({"on": 3, "call": "OnProgress"})", R"({"result": {"object": 1}})"},
      {"released", R"({"release": 1})", R"({"result": {"empty": true}})"},
      {"a number is not used again", R"({"create": "Grid"})", R"({"result": {"object": 4}})"},
  };
  check_rows(rows, [&](std::string_view line, std::string_view expected) {
    EXPECT_EQ(expected, answer(line));
    EXPECT_TRUE(is_request);
  });
}

TEST_F(CallerTest, RefusesWhatIsNoCallAndGoesOn) {
  const Rows<std::string_view, std::string_view> rows{
      {"no JSON", "GetData", "byte 1: expected an object"},
      {"a comma too many", R"({"call": "MyPos", "args": ["a",]})",
       "byte 32: expected a value: an object, an array, a text in quotes, a number, true, false or null"},
      {"two actions", R"({"call": "Terminate", "create": "Grid"})",
       R"(a line needs exactly one of \"call\", \"create\" and \"release\", or \"set\")"},
      {"no member", R"({"call": "GetDta"})",
       R"(the object has no member \"GetDta\"; \"talutil list\" lists those of the toolkit)"},
      {"no class", R"({"create": "Gird"})",
       R"(there is no class \"Gird\"; there are ORVUtils, cControlPosition, Grid, CommonDialog, ZipControl, UnzipControl)"},
      {"no object to call", R"({"on": 9, "call": "Top"})",
       R"(there is no object 9; \"create\" makes one and answers its number)"},
      {"a bare NUL", std::string_view("{\"call\": \"Get\0\"}", 16),
       R"(byte 14: expected no bare control character in a text; write \\u followed by its four hexadecimal digits)"},
      {"not UTF-8", "{\"call\": \"\xC0\x80\"}", "byte 11: expected UTF-8"},
  };
  check_rows(rows, [&](std::string_view line, std::string_view message) {
    const std::string answered = answer(line);
    EXPECT_NE(std::string::npos, answered.find("\"description\": \"" + std::string(message) + "\", ")) << answered;
    EXPECT_TRUE(answered.ends_with("\"source\": \"talutil\", \"line\": 7}}")) << answered;
    EXPECT_FALSE(is_request);
  });
  EXPECT_EQ(R"({"result": "A"})", answer(R"({"call": "GetData", "args": ["A,", 0, 1]})"));
}

TEST(ValueForms, ReadBackAsTheyWere) {
  NumberedObjects objects;
  std::string number;
  const ObjectRef object = std::make_shared<Grid>(testing::FakePlatform().platform());
  objects.append(number, object);
  const Rows<Variant, std::string_view> rows{
      {"Empty", {}, R"({"empty": true})"},
      {"other bits", Boolean::from_bits(5), R"({"boolean": 5})"},
      {"Byte", std::uint8_t{255}, R"({"byte": 255})"},
      {"Integer", std::int16_t{-32768}, R"({"integer": -32768})"},
      {"Long", std::int32_t{-2147483647 - 1}, "-2147483648"},
      {"Single without end", std::numeric_limits<float>::infinity(), R"({"single": "inf"})"},
      {"a whole Double", 3.0, "3.0"},
      {"minus zero", -0.0, "-0.0"},
      {"Double without end", -std::numeric_limits<double>::infinity(), R"({"double": "-inf"})"},
      {"Currency", Currency{INT64_MIN}, R"({"currency": "-922337203685477.5808"})"},
      {"Date", Date{39903.43090277778}, R"({"date": "2009-03-31T10:20:30"})"},
      {"a Date before day 0", Date{-1.25}, R"({"date": "1899-12-29T06:00:00"})"},
      {"a Date between seconds", Date{39903.4309}, R"({"days": 39903.4309})"},
      {"a Date out of range", Date{1e300}, R"({"days": 1e+300})"},
      {"escapes", Text(u"\"\\/\b\n\r\t\x7F", 8), R"("\"\\/\u0008\n\r\t\u007f")"},
      {"NUL and lone surrogates", Text(u"a\0\xD800x\xDC00\xD800", 6), R"("a\u0000\ud800x\udc00\ud800")"},
      {"an error", ErrorValue{-2147352567}, R"({"error": -2147352567})"},
      {"missing", missing_argument, R"({"missing": true})"},
      {"a record", SystemTime{2009, 3, 2, 31, 10, 20, 30, 999},
       R"({"system_time": {"wYear": 2009, "wMonth": 3, "wDayOfWeek": 2, "wDay": 31, "wHour": 10, "wMinute": 20, "wSecond": 30, "wMilliseconds": 999}})"},
      {"a list", testing::array_of({u"a", u""}), R"(["a", ""])"},
      {"from 1", testing::array_of({u"a"}, 1), R"({"list": ["a"], "from": 1})"},
      {"never allocated", TextArray(), R"({"list": null})"},
      {"other elements", ForeignArray(), R"({"array": true})"},
      {"an object", object, R"({"object": 1})"},
      {"no object", ObjectRef(), R"({"object": null})"},
  };
  check_rows(rows, [&](const Variant& value, std::string_view expected) {
    std::string written;
    append_value(written, value, objects);
    EXPECT_EQ(expected, written);
    JsonReader json(written);
    const Variant read = read_value(json, objects, plain_numbers);
    json.end();
    EXPECT_EQ(value, read);
    std::string again;
    append_value(again, read, objects);
    EXPECT_EQ(expected, again);
  });
}

TEST(ValueForms, ReadOtherWays) {
  const NumberedObjects objects;
  const Rows<std::string_view, Variant> good{
      {"a day", R"({"date": "2009-03-31"})", Date{39903}},
      {"a Long in full", R"({"long": 5})", std::int32_t{5}},
      {"beyond a Long", "2147483648", 2147483648.0},
      {"a whole number as a Double", R"({"double": 1})", 1.0},
      {"elements become texts", R"([1.5, true, {"date": "2009-03-31"}])",
       testing::array_of({u"1.5", u"True", u"31/03/2009"})},
      {"escapes", R"("\u00fC\ud83d\uDE00\/")", Text(u"ü\U0001F600/")},
  };
  check_rows(good, [&](std::string_view written, const Variant& expected) {
    JsonReader json(written);
    EXPECT_EQ(expected, read_value(json, objects, plain_numbers));
  });
  const Rows<std::string_view> bad{
      {"32 March", R"({"date": "2009-03-32"})"},
      {"beyond its type", R"({"integer": 40000})"},
      {"no whole number", R"({"byte": 1.0})"},
      {"beyond a double", "1e999"},
      {"two keys", R"({"byte": 1, "integer": 2})"},
      {"no form", R"({"text": "a"})"},
      {"a false flag", R"({"empty": false})"},
      {"a list in a list", "[[]]"},
      {"a zero first", "01"},
      {"beyond a currency", R"({"currency": "1e20"})"},
      {"same, which is for arguments", R"({"same": 0})"},
  };
  check_rows(bad, [&](std::string_view written) {
    JsonReader json(written);
    EXPECT_THROW(static_cast<void>(read_value(json, objects, plain_numbers)), JsonError);
  });
}

TEST(JsonReader, BoundsTheDepthOfWhatItSkips) {
  const std::string deep(1'000'000, '[');
  JsonReader json(deep);
  EXPECT_THROW(json.skip_value(), JsonError);
}

}  // namespace
}  // namespace talutil::calling
