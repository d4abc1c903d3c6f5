#pragma once

#include <gtest/gtest.h>

#include <vector>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/fake_platform.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil::testing {

inline TextArray array_of(std::vector<Text> items, std::int32_t lower_bound = 0) {
  return {.items = std::move(items), .lower_bound = lower_bound, .allocated = true};
}

/// A toolkit that notes each call of the members that others call, then does the real work.
class RecordingUtils final : public ORVUtils {
 public:
  using ORVUtils::ORVUtils;

  std::vector<Text> calls;

  Text StripNulls(const Text& s) override { return note(u"StripNulls|" + s), ORVUtils::StripNulls(s); }
  Text StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace) override {
    note(u"StringReplace|" + sSrc + u"|" + sChr + u"|" + sReplace);
    return ORVUtils::StringReplace(sSrc, sChr, sReplace);
  }
  Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo) override {
    note(u"StringReplaceWord|" + sSource + u"|" + sChangeFrom + u"|" + sChangeTo);
    return ORVUtils::StringReplaceWord(sSource, sChangeFrom, sChangeTo);
  }
  std::int32_t MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount) override {
    note(u"MyPos|" + s1 + u"|" + s2 + u"|" + number_to_text(iCount));
    return ORVUtils::MyPos(s1, s2, iCount);
  }
  std::int32_t SubStrCount(const Text& sSubStr, const Text& sSrcStr) override {
    note(u"SubStrCount|" + sSubStr + u"|" + sSrcStr);
    return ORVUtils::SubStrCount(sSubStr, sSrcStr);
  }

 private:
  void note(Text call) { calls.push_back(std::move(call)); }
};

/// The library with one object, on a platform that is made up, but for what `replace` puts in its place.
struct UtilsTest : ::testing::Test {
  UtilsTest() = default;
  explicit UtilsTest(void (*replace)(FakePlatform& platform)) : library((replace(platform), platform.platform())) {}

  FakePlatform platform;
  Library library{platform.platform()};
  RecordingUtils utils{library};
};

}  // namespace talutil::testing
