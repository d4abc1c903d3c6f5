// Conversions of variants, beside the platform's. What texts are numbers is compared in automation/numbers_test.cpp.
#include "tests/platform/win32/oracle.hpp"

namespace talutil::testing {
namespace {

constexpr int generated_count = 20'000;

/// Fills the platform's variant; the kinds left out have nothing to compare.
struct Filler {
  VARIANT& target;

  void fill(VARTYPE type) const { target.vt = type; }
  void operator()(std::monostate) const { fill(VT_EMPTY); }
  void operator()(Boolean value) const { fill(VT_BOOL), target.boolVal = value.bits(); }
  void operator()(std::uint8_t value) const { fill(VT_UI1), target.bVal = value; }
  void operator()(std::int16_t value) const { fill(VT_I2), target.iVal = value; }
  void operator()(std::int32_t value) const { fill(VT_I4), target.lVal = value; }
  void operator()(float value) const { fill(VT_R4), target.fltVal = value; }
  void operator()(double value) const { fill(VT_R8), target.dblVal = value; }
  void operator()(Currency value) const { fill(VT_CY), target.cyVal.int64 = value.ten_thousandths; }
  void operator()(ErrorValue value) const { fill(VT_ERROR), target.scode = value.code; }
  void operator()(const Text& value) const {
    Text copy = value;
    fill(VT_BSTR), target.bstrVal = SysAllocString(raw(copy));
  }
  template <class T>
  void operator()(const T&) const {}
};

Variant result_of(const VARIANT& value) {
  switch (value.vt) {
    case VT_I2:
      return value.iVal;
    case VT_I4:
      return static_cast<std::int32_t>(value.lVal);
    case VT_R4:
      return value.fltVal;
    case VT_R8:
      return value.dblVal;
    case VT_CY:
      return Currency{value.cyVal.int64};
    case VT_DATE:
      return Date{value.date};
    case VT_BOOL:
      return Boolean::from_bits(value.boolVal);
    default:
      return Text(win32::view(value.bstrVal, SysStringLen(value.bstrVal)));
  }
}

std::string changed_by_platform(const Variant& value, VARTYPE type) {
  return platform_outcome<Variant>(
      [&](Variant* result) {
        VARIANT source{};
        VARIANT changed{};
        value.visit(Filler{source});
        const HRESULT status = VariantChangeTypeEx(&changed, &source, british_english, VARIANT_ALPHABOOL, type);
        if (status == S_OK) *result = result_of(changed);
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
  switch (generator.whole(0, 4)) {
    case 0:
      return base / 2;
    case 1:
      return base / std::pow(10, generator.whole(0, 12));
    case 2:
      return base * std::pow(10, generator.whole(0, 20));
    case 3:
      return generator.one_of(edges);
    default:
      return std::ldexp(base + generator.whole(0, 1 << 30) * 0x1p-30, generator.whole(-300, 300));
  }
}

/// Null and Date are left out: the platform answers 13 for Null, and writes dates in the user's own form.
Variant any_value(Generator& generator) {
  constexpr TextView booleans[] = {u"True",    u"tRUE",  u"FALSE", u" True", u"#TRUE#", u"#true#",
                                   u"#FALSE#", u"True ", u"yes",   u"1E400", u""};
  switch (generator.whole(0, 10)) {
    case 0:
      return generator.whole(0, 1) != 0 ? Variant() : missing_argument;
    case 1:
      return Boolean(generator.whole(0, 1) != 0);
    case 2:
      return static_cast<std::uint8_t>(generator.whole(0, 255));
    case 3:
      return static_cast<std::int16_t>(generator.whole(-32768, 32767));
    case 4:
      return generator.whole(-2000000000, 2000000000);
    case 5:
      return static_cast<float>(any_number(generator));
    case 6:
      return Currency{static_cast<std::int64_t>(std::fmod(any_number(generator), 9e18))};
    case 7:
      return number_to_text(generator.whole(1000, 100000) / 4.0);
    case 8:
      return generator.one_of(booleans);
    default:
      return any_number(generator);
  }
}

/// What the platform has another form for: fractions that need more decimal places than digits are shown have an
/// exponent, as on Windows, but Wine writes one only below 0.0001; and texts of numbers may be dates.
bool is_left_out(const Variant& value, VARTYPE type, const std::string& converted) {
  if (type == VT_BSTR) return converted.ends_with("E-02") || converted.ends_with("E-03") || converted.ends_with("E-04");
  return type == VT_DATE && value.is(Variant::Kind::text);
}

TEST(PlatformVariants, Conversions) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const Variant value = any_value(generator);
    const auto expect = [&](VARTYPE type, const auto& convert) {
      const std::string converted = outcome(convert);
      if (is_left_out(value, type, converted)) return;
      EXPECT_EQ(converted, changed_by_platform(value, type)) << "type " << type << " from kind " << int(value.kind())
                                                             << ": " << outcome([&] { return value.to_text(british); });
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
}

}  // namespace
}  // namespace talutil::testing
