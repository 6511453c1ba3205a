#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/EffectCatalogue.h"
#include "Tests/Host/Model/MessageRecorder.h"

namespace {

class DirectManipulationManagerTest : public ::testing::Test {
 protected:
  DirectManipulationManagerTest() { recorder.Listen(kDirectManipulationStation); }
  static ComponentRef Make(const char* matchName) {
    return EffectCatalogue::Standard().Create(matchName);
  }
  // A mask embedded in an effect (what makes it one).
  ComponentRef EmbeddedMask() {
    ComponentRef mask = Make(kMatchName_Mask);
    owner->SetMasks({mask});
    return mask;
  }

  MessagingTestScope messaging;
  MessageRecorder recorder;
  DirectManipulationManager manager;
  ComponentRef owner = Make(kMatchName_GaussianBlur);
};

TEST_F(DirectManipulationManagerTest, OnlyVideoEffectsWithHandlesHaveOnScreenControls) {
  EXPECT_TRUE(DirectManipulationManager::HasOnScreenControls(*Make(kMatchName_Motion)));
  EXPECT_TRUE(DirectManipulationManager::HasOnScreenControls(*EmbeddedMask()));
  EXPECT_FALSE(DirectManipulationManager::HasOnScreenControls(*Make(kMatchName_Opacity)));
  EXPECT_FALSE(DirectManipulationManager::HasOnScreenControls(*Make(kMatchName_Volume)));
  ComponentRef archived = Make(kMatchName_Motion);
  archived->SetArchived(true, 0);
  EXPECT_FALSE(DirectManipulationManager::HasOnScreenControls(*archived));
}

TEST_F(DirectManipulationManagerTest, SettingAnnouncesOnlyChangesAndRefusesEffectsWithoutHandles) {
  const ComponentRef motion = Make(kMatchName_Motion);
  EXPECT_TRUE(manager.SetDirectManipulationFilter(motion, nullptr));
  EXPECT_TRUE(manager.SetDirectManipulationFilter(motion, nullptr));
  EXPECT_EQ(recorder.names, std::vector<std::string>{"DirectManipulationChangedMessage"});
  EXPECT_FALSE(manager.SetDirectManipulationFilter(Make(kMatchName_Opacity), nullptr));
  EXPECT_EQ(manager.GetFilter(), motion);
  manager.Clear();
  EXPECT_EQ(manager.GetFilter(), nullptr);
  EXPECT_FALSE(manager.AreControlsShown());
  EXPECT_EQ(recorder.names.size(), 2u);
}

TEST_F(DirectManipulationManagerTest, ToggleHidesAndShowsTheActiveEffectsControls) {
  const ComponentRef motion = Make(kMatchName_Motion);
  manager.ToggleDirectManipulationFilter(motion, nullptr);
  EXPECT_TRUE(manager.AreControlsShown());
  manager.ToggleDirectManipulationFilter(motion, nullptr);
  EXPECT_FALSE(manager.AreControlsShown());
  EXPECT_EQ(manager.GetFilter(), motion);
  manager.ToggleDirectManipulationFilter(motion, nullptr);
  EXPECT_TRUE(manager.AreControlsShown());
}

TEST_F(DirectManipulationManagerTest, APickMakesTheEffectActiveAndIsAnnounced) {
  const ComponentRef mask = EmbeddedMask();
  manager.PickFilter(mask, nullptr);
  EXPECT_TRUE(manager.IsActive(mask.get(), nullptr));
  EXPECT_EQ(recorder.names, (std::vector<std::string>{"DirectManipulationChangedMessage",
                                                      "DirectManipulationFilterPickedMessage"}));
  recorder.Clear();
  manager.PickFilter(Make(kMatchName_Opacity), nullptr);
  EXPECT_TRUE(recorder.names.empty());
}

}  // namespace
