#include <gtest/gtest.h>

#include <memory>

#include "Host/Messaging/DebugFlags.h"
#include "Host/Messaging/Preferences.h"

namespace {

class DebugFlagsTest : public ::testing::Test {
 protected:
  DebugFlagsTest() { Preferences::SetApplication(std::make_unique<Preferences>()); }
  ~DebugFlagsTest() override { Preferences::SetApplication(nullptr); }
};

TEST_F(DebugFlagsTest, AFlagIsOffUntilSetAndLivesInThePreferences) {
  EXPECT_FALSE(IsDebugFlagSet(kDebugFlagEnableMaskMultiSelect));
  EXPECT_TRUE(SetDebugFlag(kDebugFlagEnableMaskMultiSelect, true));
  EXPECT_TRUE(IsDebugFlagSet(kDebugFlagEnableMaskMultiSelect));
  EXPECT_TRUE(Preferences::Application().GetBool("Debug.EnableMaskMultiSelect", false));
  EXPECT_FALSE(IsDebugFlagSet("SomethingElse"));
}

}  // namespace
