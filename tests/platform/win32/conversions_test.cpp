// Every conversion of a variant, a code unit and a byte, beside the platform's.
#include <algorithm>
#include <array>
#include <cstring>
#include <regex>

#include "platform/win32/win32_code_page.hpp"
#include "tests/platform/win32/oracle.hpp"

namespace talutil::testing {
namespace {

constexpr int generated_count = 20'000;

/// Fills the platform's variant with a value, whose bytes are the same there; the kinds left out have nothing to
/// compare.
struct Filler {
  VARIANT& target;

  template <class T>
  void fill(VARTYPE type, const T& value) const {
    target.vt = type;
    std::memcpy(&target.llVal, &value, sizeof value);
  }
  void operator()(Boolean value) const { fill(VT_BOOL, value); }
  void operator()(std::uint8_t value) const { fill(VT_UI1, value); }
  void operator()(std::int16_t value) const { fill(VT_I2, value); }
  void operator()(std::int32_t value) const { fill(VT_I4, value); }
  void operator()(float value) const { fill(VT_R4, value); }
  void operator()(double value) const { fill(VT_R8, value); }
  void operator()(Currency value) const { fill(VT_CY, value); }
  void operator()(ErrorValue value) const { fill(VT_ERROR, value); }
  void operator()(Text value) const { fill(VT_BSTR, SysAllocString(raw(value))); }
  template <class T>
  void operator()(const T&) const {}
};

/// What is in the platform's variant, whose type has been changed to ours.
template <class T>
Variant result_of(const VARIANT& value) {
  if constexpr (std::is_same_v<T, Text>) {
    return Text(win32::view(value.bstrVal, SysStringLen(value.bstrVal)));
  } else {
    // Our types hold their number alone, in the platform's form.
    static_assert(std::is_trivially_copyable_v<T>);
    T result;
    std::memcpy(static_cast<void*>(&result), &value.llVal, sizeof result);
    return result;
  }
}

template <class T>
std::string changed_by_platform(const Variant& value, VARTYPE type) {
  return platform_outcome<Variant>(
      [&](Variant* result) {
        VARIANT source{};
        VARIANT changed{};
        value.visit(Filler{source});
        const HRESULT status = VariantChangeTypeEx(&changed, &source, british_english, VARIANT_ALPHABOOL, type);
        if (status == S_OK) *result = result_of<T>(changed);
        VariantClear(&changed);
        VariantClear(&source);
        return status;
      },
      "error 13");
}

/// Numbers as hosts have them, of every size, plainly decimal, halves, at the ends of types, or any bits at all.
double any_number(Generator& generator) {
  const double base = generator.whole(-1000000, 1000000);
  constexpr double edges[] = {32767.5, -32768.5, 32767.4999, -32768.50001, 2147483647.5, -2147483648.5, 2147483647.25};
  const double fraction = generator.whole(0, 1 << 30) * 0x1p-30;
  const double numbers[] = {base / 2, base / std::pow(10, generator.whole(0, 12)),
                            base * std::pow(10, generator.whole(0, 20)), generator.one_of(edges),
                            std::ldexp(base + fraction, generator.whole(-300, 300))};
  return generator.one_of(numbers);
}

Text number_like_text(Generator& generator) {
  constexpr TextView pieces[] = {u"1", u"25", u"0", u"007", u"9999", u".",  u",",  u"-",  u"+", u"\u00A3", u"(",   u")",
                                 u" ", u"\t", u"E", u"E-",  u"E+2",  u"&H", u"&O", u"FF", u"x", u".5",     u"12.5"};
  Text text;
  for (std::int32_t left = generator.whole(1, 6); left > 0; --left) text += generator.one_of(pieces);
  return text;
}

/// Null and Date are left out: the platform answers 13 for Null, and writes dates in the user's own form.
Variant any_value(Generator& generator) {
  constexpr TextView booleans[] = {u"True",    u"tRUE",  u"FALSE", u" True", u"#TRUE#", u"#true#",
                                   u"#FALSE#", u"True ", u"yes",   u"1E400", u"-0.01",  u""};
  const double number = any_number(generator);
  const Text like_a_number = number_like_text(generator);
  const Variant values[] = {Variant(),
                            missing_argument,
                            Boolean(generator.whole(0, 1) != 0),
                            static_cast<std::uint8_t>(generator.whole(0, 255)),
                            static_cast<std::int16_t>(generator.whole(-32768, 32767)),
                            generator.whole(-2000000000, 2000000000),
                            static_cast<float>(number),
                            Currency{static_cast<std::int64_t>(std::fmod(number, 9e18))},
                            number_to_text(generator.whole(1000, 100000) / 4.0),
                            generator.one_of(booleans),
                            number,
                            number,
                            like_a_number,
                            like_a_number,
                            like_a_number};
  return generator.one_of(values);
}

/// What the platform takes for a number and we refuse, or the other way round, in UTF-8 ("\xC2\xA3" is a pound).
bool is_deliberate_difference(const std::string& text) {
  static const struct {
    const char* reason;
    std::regex pattern;
  } differences[] = {
      {"marks around &H and &O count as they do around digits", std::regex("&.*(-|\xC2\xA3)|[-(\xC2].*&")},
      {"other bases may have more than 32 bits", std::regex("&H0*[1-9A-F][0-9A-F]{8}|&O0*[1-7][0-7]{10}")},
      {"no mark counts twice", std::regex("[+].*[+]|-.*-|\xC2.*\xC2")},
      {"a bracket that opens closes", std::regex("[(][^)]*$")},
      {"a thousands separator stands among digits", std::regex("[^0-9.,],|^,|[.],")},
      {"an exponent belongs to digits and has nothing but digits", std::regex("^[^0-9]*E|E.*,")},
      {"an amount of money may have an exponent", std::regex("\xC2.*E", std::regex::icase)},
  };
  return std::ranges::any_of(differences, [&](const auto& row) { return std::regex_search(text, row.pattern); });
}

/// Deliberate: what the platform makes of a value is not what it says.
bool is_left_out(const Variant& value, VARTYPE type, const std::string& converted) {
  // A fraction that needs more decimal places than digits are shown has an exponent, as on Windows; Wine writes one
  // only below 0.0001.
  if (type == VT_BSTR) return converted.ends_with("E-02") || converted.ends_with("E-03") || converted.ends_with("E-04");
  const Text* const text = value.get_if<Text>();
  if (text == nullptr || text->find_first_of(u"0123456789&") == Text::npos) return false;
  if (type == VT_DATE || is_deliberate_difference(to_utf8(*text))) return true;
  // The platform makes 1 of some fractions, and no currency of hexadecimal numbers nor a right one of more than four
  // decimals.
  double number = 1;
  if (error_of([&] { number = text_to_number(*text, british).value_or(1); }) != 0) return false;
  if (type == VT_I2 || type == VT_I4) return std::abs(number) < 1;
  return type == VT_CY && (number * 10000 != std::floor(number * 10000) || text->find(u'&') != Text::npos);
}

TEST(PlatformVariants, Conversions) {
  Generator generator;
  int numbers = 0;
  for (int i = 0; i < generated_count; ++i) {
    const Variant value = any_value(generator);
    const auto expect = [&](VARTYPE type, const auto& convert) {
      const std::string converted = outcome(convert);
      if (is_left_out(value, type, converted)) return;
      if (type == VT_R8 && value.is(Variant::Kind::text) && !converted.starts_with("error")) ++numbers;
      EXPECT_EQ(converted, changed_by_platform<decltype(convert())>(value, type))
          << "type " << type << " from kind " << int(value.kind()) << ": "
          << outcome([&] { return value.to_text(british); });
    };
    expect(VT_BSTR, [&] { return value.to_text(british); });
    expect(VT_I2, [&] { return value.to_int16(british); });
    expect(VT_I4, [&] { return value.to_int32(british); });
    expect(VT_R4, [&] { return value.to_single(british); });
    expect(VT_R8, [&] { return value.to_double(british); });
    expect(VT_CY, [&] { return value.to_currency(british); });
    expect(VT_BOOL, [&] { return value.to_boolean(british); });
    expect(VT_DATE, [&] { return value.to_date(british); });
  }
  EXPECT_GT(numbers, generated_count / 20) << "texts that are numbers";
}

constexpr std::uint32_t unit_count = 0x10000;

/// The code of a unit by the platform's own conversion, here of a text of two characters.
std::uint32_t code_before_a_bar(UINT page, char16_t unit) {
  const wchar_t text[] = {static_cast<wchar_t>(unit), L'|'};
  std::array<unsigned char, 8> bytes{};
  const int size = WideCharToMultiByte(page, 0, text, 2, reinterpret_cast<char*>(bytes.data()), 8, nullptr, nullptr);
  std::uint32_t code = 0;
  for (int i = 0; i + 1 < size; ++i) code = code * 256 + bytes[static_cast<std::size_t>(i)];
  return code;
}

char16_t case_of(LPWSTR(WINAPI* function)(LPWSTR), std::uint32_t unit) {
  const std::uintptr_t value = unit;
  return static_cast<char16_t>(reinterpret_cast<std::uintptr_t>(function(reinterpret_cast<LPWSTR>(value))));
}

TEST(CodeUnits, HaveTheCodesOfThePlatform) {
  for (const UINT number : {1252U, 1251U, 1253U, 932U, 65001U, UINT{CP_ACP}}) {
    win32::Win32CodePage numbered(number);
    win32::Win32CodePage systems;
    CodePage& page = number == CP_ACP ? systems : numbered;
    for (std::uint32_t unit = 0; unit < unit_count; ++unit) {
      ASSERT_EQ(page.code(static_cast<char16_t>(unit)), code_before_a_bar(number, static_cast<char16_t>(unit)))
          << number << " " << unit;
    }
  }
}

TEST(CodeUnits, HaveTheirPlacesInOurOwnTables) {
  for (std::uint32_t i = 0; i < unit_count; ++i) {
    const auto unit = static_cast<char16_t>(i);
    ASSERT_EQ(ansi_code(unit), code_before_a_bar(1252, unit)) << i;
    ASSERT_EQ(upper_case(unit), case_of(&CharUpperW, i)) << i;
    ASSERT_EQ(lower_case(unit), case_of(&CharLowerW, i)) << i;
  }
  for (int i = 0; i < 256; ++i) {
    const auto byte = static_cast<char>(i);
    wchar_t unit = 0;
    MultiByteToWideChar(1252, 0, &byte, 1, &unit, 1);
    EXPECT_EQ(chr(i), Text(1, static_cast<char16_t>(unit))) << i;
  }
}

}  // namespace
}  // namespace talutil::testing
