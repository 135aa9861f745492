#include <kelcore/config/ClientIdentity.h>

#include "ConfigTestSupport.h"

namespace kelcore::config::testing {
namespace {

using ClientIdentityTest = ConfigTest;

TEST_F(ClientIdentityTest, ApplicationNameFollowsTheClientNameUntilSet) {
  SetCompanyName(U16("Varden"));
  EXPECT_FALSE(IsClientNameInitialized());
  EXPECT_EQ(GetApplicationName(), UTF16String());
  SetClientName(U16("Studio"));
  EXPECT_TRUE(IsClientNameInitialized());
  EXPECT_EQ(GetApplicationName(), U16("Studio"));
  SetApplicationName(UTF16String());
  EXPECT_EQ(GetApplicationName(), UTF16String());
  SetClientName(GetClientName());
  EXPECT_EQ(GetClientName(), U16("Studio"));
}

TEST_F(ClientIdentityTest, SuiteVersionNumberOnly) {
  SetClientVersion(U16("3.2"));
  EXPECT_EQ(GetSuiteClientVersion(), U16("VS"));
  EXPECT_EQ(GetSuiteClientVersion_NumberOnly(), U16("3.2"));
  const struct {
    const char* suite;
    const char* number;
  } cases[] = {{"7", "7.0"}, {"7.1", "7.1"}, {"VS7", "7.0"}, {"VS7.5", "7.5"}, {"XY7", "XY7.0"}};
  for (const auto& c : cases) {
    SetClientSuiteVersion(U16(c.suite));
    EXPECT_EQ(GetSuiteClientVersion(), U16(c.suite));
    EXPECT_EQ(GetSuiteClientVersion_NumberOnly(), U16(c.number)) << c.suite;
  }
}

TEST_F(ClientIdentityTest, SuiteClientNameAndVersions) {
  SetCompanyName(U16("Varden"));
  SetClientName(U16("Studio"));
  SetClientSuiteVersion(U16("VS4"));
#if defined(_WIN32)
  EXPECT_EQ(GetClientPlatform(), U16("Windows"));
#elif defined(__linux__)
  EXPECT_EQ(GetClientPlatform(), U16("Linux"));
#endif
  EXPECT_EQ(GetSuiteClientName(), U16("Varden Studio VS4 (") + GetClientPlatform() + U16(")"));
  EXPECT_EQ(GetVersionString(), U16("2.0.0.420171"));
}

}  // namespace
}  // namespace kelcore::config::testing
