#include <gtest/gtest.h>

#include "tests/platform/win32/oracle.hpp"

namespace talutil {
namespace {

/// Fills the platform's variant; the kinds left out have nothing to compare.
struct Filler {
  VARIANT& target;

  void fill(VARTYPE type) const { target.vt = type; }
  void operator()(std::monostate) const { fill(VT_EMPTY); }
  void operator()(Null) const { fill(VT_NULL); }
  void operator()(Boolean value) const { fill(VT_BOOL), target.boolVal = value.bits(); }
  void operator()(std::uint8_t value) const { fill(VT_UI1), target.bVal = value; }
  void operator()(std::int16_t value) const { fill(VT_I2), target.iVal = value; }
  void operator()(std::int32_t value) const { fill(VT_I4), target.lVal = value; }
  void operator()(float value) const { fill(VT_R4), target.fltVal = value; }
  void operator()(double value) const { fill(VT_R8), target.dblVal = value; }
  void operator()(Currency value) const { fill(VT_CY), target.cyVal.int64 = value.ten_thousandths; }
  void operator()(Date value) const { fill(VT_DATE), target.date = value.days; }
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

/// Null and Date are left out: the platform answers 13 for Null, and writes dates in the user's own form.
Variant generated(Generator& generator) {
  const double number = generator.number();
  switch (generator.whole(0, 9)) {
    case 0:
      return {};
    case 1:
      return Boolean(generator.whole(0, 1) != 0);
    case 2:
      return static_cast<std::uint8_t>(generator.whole(0, 255));
    case 3:
      return static_cast<std::int16_t>(generator.whole(-32768, 32767));
    case 4:
      return generator.whole(-2000000000, 2000000000);
    case 5:
      return static_cast<float>(number);
    case 6:
      return Currency{static_cast<std::int64_t>(std::fmod(number, 9e18))};
    case 7:
      return number_to_text(generator.whole(1000, 100000) / 4.0);
    case 8:
      return generator.whole(0, 1) != 0 ? missing_argument : Variant(u"no number");
    default:
      return number;
  }
}

TEST(PlatformVariants, Conversions) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const Variant value = generated(generator);
    const auto expect = [&](VARTYPE type, const auto& convert) {
      const std::string converted = outcome(convert);
      if (type == VT_BSTR && is_long_fraction(converted)) return;
      EXPECT_EQ(converted, changed_by_platform(value, type))
          << "type " << type << " from kind " << int(value.kind());
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
}  // namespace talutil
