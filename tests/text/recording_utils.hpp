#pragma once

#include <gtest/gtest.h>

#include <vector>

#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil::testing {

/// A toolkit that notes each call of the members that others call, then does the real work.
class RecordingUtils final : public ORVUtils {
 public:
  using ORVUtils::ORVUtils;

  std::vector<Text> calls;

  Text StripNulls(const Text& s) override {
    note(u"StripNulls", {s});
    return ORVUtils::StripNulls(s);
  }
  Text StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace) override {
    note(u"StringReplace", {sSrc, sChr, sReplace});
    return ORVUtils::StringReplace(sSrc, sChr, sReplace);
  }
  Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo) override {
    note(u"StringReplaceWord", {sSource, sChangeFrom, sChangeTo});
    return ORVUtils::StringReplaceWord(sSource, sChangeFrom, sChangeTo);
  }
  std::int32_t MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount) override {
    note(u"MyPos", {s1, s2, number_to_text(iCount)});
    return ORVUtils::MyPos(s1, s2, iCount);
  }
  std::int32_t SubStrCount(const Text& sSubStr, const Text& sSrcStr) override {
    note(u"SubStrCount", {sSubStr, sSrcStr});
    return ORVUtils::SubStrCount(sSubStr, sSrcStr);
  }

 private:
  void note(TextView member, const std::vector<Text>& arguments) {
    Text& call = calls.emplace_back(member);
    for (const Text& argument : arguments) call.append(u"|").append(argument);
  }
};

class TextMembersTest : public ::testing::Test {
 protected:
  FakePlatform platform;
  Library library{platform.platform()};
  RecordingUtils utils{library};
};

}  // namespace talutil::testing
