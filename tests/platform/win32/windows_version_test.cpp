#include "platform/win32/windows_version.hpp"

#include <gtest/gtest.h>

namespace talutil::win32 {
namespace {

TEST(WindowsVersion, IsNamedAsUsersKnowIt) {
  const struct {
    RegisteredVersion registered;
    Text name, version;
  } rows[] = {
      {{u"Windows 7 Professional", u"6.1", 0, 0, u"7601", 0, u"", u"Service Pack 1"},
       u"Windows 7 Professional",
       u"6.1, build 7601, Service Pack 1"},
      {{u"Windows 10 Pro", u"6.3", 10, 0, u"19045", 4170, u"22H2", u""},
       u"Windows 10 Pro",
       u"10.0, build 19045.4170, version 22H2"},
      {{u"Windows 10 Home", u"6.3", 10, 0, u"22000", 1, u"21H2", u""},
       u"Windows 11 Home",
       u"10.0, build 22000.1, version 21H2"},
      {{}, u"", u""},
  };
  for (const auto& [registered, name, version] : rows) {
    EXPECT_EQ(windows_name(registered), name);
    EXPECT_EQ(windows_version(registered), version);
  }
}

}  // namespace
}  // namespace talutil::win32
