#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/ComponentParamActions.h"
#include "ModelTestFixture.h"

namespace {

class ComponentChainActionsTest : public ModelTest {
 protected:
  // Match names of the chain, shortened: "Motion Opacity TimeRemapping GaussianBlur Crop".
  static std::string Names(const ComponentChain& chain) {
    std::string names;
    for (const ComponentRef& component : chain.GetComponents()) {
      std::string name = component->GetMatchName();
      names += (names.empty() ? "" : " ") + name.substr(name.find(' ') + 1);
    }
    return names;
  }
};

TEST_F(ComponentChainActionsTest, RemovingAFilterIsUndoable) {
  CheckUndoRoundTrip({.name = "MZ.ComponentChainActions.RemoveFilter",
                      .edit = [&] { return ComponentChainActions::RemoveFilter(videoChain, blur); },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping Crop");
                            EXPECT_EQ(blur->GetChain(), nullptr);
                          }});
  EXPECT_EQ(blur->GetChain(), videoChain.get());
}

TEST_F(ComponentChainActionsTest, IntrinsicsAreNeverRemoved) {
  EXPECT_EQ(ComponentChainActions::RemoveFilter(videoChain, Intrinsic(kMatchName_Motion)),
            EditStatus::NoChange);
  EXPECT_EQ(ComponentChainActions::RemoveMultipleFilters(
                videoChain, {Intrinsic(kMatchName_Motion), Intrinsic(kMatchName_Opacity)}),
            EditStatus::NoChange);
  EXPECT_EQ(videoChain->GetCount(), 5);
  EXPECT_FALSE(Undo().CanUndo());
}

TEST_F(ComponentChainActionsTest, RemovingSeveralMakesOneStepAndSkipsIntrinsics) {
  ASSERT_EQ(ComponentChainActions::RemoveMultipleFilters(
                videoChain, {crop, Intrinsic(kMatchName_Opacity), blur}),
            EditStatus::Done);
  EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping");
  EXPECT_EQ(Undo().GetUndoNames().size(), 1u);
  Undo().Undo();
  EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping GaussianBlur Crop");
}

TEST_F(ComponentChainActionsTest, RemovingAComponentOfAnotherChainReportsNotFound) {
  const ComponentRef delay = audio1->GetComponentChain()->FindByMatchName(kMatchName_Delay);
  EXPECT_EQ(ComponentChainActions::RemoveFilter(videoChain, delay), EditStatus::NotFound);
}

TEST_F(ComponentChainActionsTest, MovingPutsTheComponentsAfterTheInsertionComponent) {
  const ComponentRef motion = Intrinsic(kMatchName_Motion);
  ASSERT_EQ(ComponentChainActions::MoveFilters(videoChain, {crop}, motion), EditStatus::Done);
  EXPECT_EQ(Names(*videoChain), "Motion Crop Opacity TimeRemapping GaussianBlur");
  ASSERT_EQ(ComponentChainActions::MoveFilters(videoChain, {blur, crop}, nullptr),
            EditStatus::Done);
  EXPECT_EQ(Names(*videoChain), "GaussianBlur Crop Motion Opacity TimeRemapping");
  Undo().Undo();
  Undo().Undo();
  EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping GaussianBlur Crop");
}

TEST_F(ComponentChainActionsTest, AnInsertionComponentThatIsMovedAnchorsOnItsPredecessor) {
  ASSERT_EQ(ComponentChainActions::MoveFilters(videoChain, {crop, blur}, blur), EditStatus::Done);
  EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping Crop GaussianBlur");
}

TEST_F(ComponentChainActionsTest, AnInsertionComponentOutsideTheChainIsRefusedVisibly) {
  const ComponentRef delay = audio1->GetComponentChain()->FindByMatchName(kMatchName_Delay);
  EXPECT_EQ(ComponentChainActions::MoveFilters(videoChain, {blur}, delay),
            EditStatus::InvalidArgument);
  EXPECT_FALSE(RecordedDebugAssertions().empty());
  EXPECT_EQ(RecordedDebugAssertions().back().message, "Invalid insertionComponent");
}

TEST_F(ComponentChainActionsTest, MovingBetweenChainsIsOneStepBothWays) {
  const ComponentChainRef otherChain = second->GetComponentChain();
  CheckUndoRoundTrip(
      {.name = ComponentChainActions::kMoveFilters,
       .edit =
           [&] {
             return ComponentChainActions::MoveFilters(otherChain, {blur}, otherChain->GetAt(0));
           },
       .checkEdited =
           [&] {
             EXPECT_EQ(Names(*otherChain), "Motion GaussianBlur Opacity TimeRemapping");
             EXPECT_EQ(Names(*videoChain), "Motion Opacity TimeRemapping Crop");
             EXPECT_EQ(blur->GetChain(), otherChain.get());
             EXPECT_EQ(blur->GetTrackItem(), second.get());
           }});
  EXPECT_EQ(blur->GetChain(), videoChain.get());
}

TEST_F(ComponentChainActionsTest, AudioEffectsDoNotMoveIntoAVideoChain) {
  const ComponentRef delay = audio1->GetComponentChain()->FindByMatchName(kMatchName_Delay);
  EXPECT_EQ(ComponentChainActions::MoveFilters(videoChain, {delay}, nullptr), EditStatus::NoChange);
  EXPECT_EQ(delay->GetChain(), audio1->GetComponentChain().get());
}

TEST_F(ComponentChainActionsTest, SetBypassOfManyChainsIsOneStep) {
  ComponentActions::SetBypass(blur, true);
  const std::vector<ComponentChainRef> chains{videoChain, audio1->GetComponentChain()};
  ASSERT_EQ(ComponentChainActions::SetBypass(chains, true), EditStatus::Done);
  for (const ComponentChainRef& chain : chains) {
    for (const ComponentRef& component : chain->GetComponents()) {
      EXPECT_TRUE(component->IsBypassed()) << component->GetMatchName();
    }
  }
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentChainActions.SetBypass");
  Undo().Undo();
  EXPECT_TRUE(blur->IsBypassed());  // was off before: stays off
  EXPECT_FALSE(crop->IsBypassed());
  EXPECT_EQ(ComponentChainActions::SetBypassOfComponents({blur}, true), EditStatus::NoChange);
}

TEST_F(ComponentChainActionsTest, AddingAnEffectInsertsACopyOfTheTemplate) {
  const Component* tint = Catalogue().FindTemplate(kMatchName_Tint);
  ASSERT_NE(tint, nullptr);
  const auto result = ComponentChainActions::InsertFilter(videoChain, *tint, 3);
  ASSERT_EQ(result.status, EditStatus::Done);
  EXPECT_NE(result.component.get(), tint);
  EXPECT_EQ(videoChain->GetIndexOf(result.component.get()), 3);
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentChainActions.InsertFilter");
  // Editing the copy leaves the template alone.
  ComponentParamActions::SetValue(result.component->FindParam("Amount to Tint"), 0, 10.0);
  EXPECT_EQ(tint->FindParam("Amount to Tint")->GetConstantValue(), ParamValue(100.0));

  const auto appended = ComponentChainActions::AddFilter(videoChain, *tint);
  EXPECT_EQ(videoChain->GetIndexOf(appended.component.get()), videoChain->GetCount() - 1);
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentChainActions.AddFilter");
}

TEST_F(ComponentChainActionsTest, AnAudioEffectCannotBeAddedToAVideoChain) {
  const auto result =
      ComponentChainActions::AddFilter(videoChain, *Catalogue().FindTemplate(kMatchName_Delay));
  EXPECT_EQ(result.status, EditStatus::InvalidArgument);
  EXPECT_EQ(result.component, nullptr);
  EXPECT_EQ(videoChain->GetCount(), 5);
}

TEST_F(ComponentChainActionsTest, ResetRestoresDefaultsAndTheEffectName) {
  const ComponentParamRef blurriness = blur->FindParam("Blurriness");
  ComponentParamActions::AddKeyframe(blurriness, kSecond, 20.0);
  ComponentParamActions::SetValue(blur->FindParam("Repeat Edge Pixels"), 0, true);
  ComponentActions::SetInstanceName(blur, "Soft focus");
  ComponentActions::ApplyPreset(blur, 2);
  const std::string edited = Dump();

  ASSERT_EQ(ComponentChainActions::ResetComponent(blur), EditStatus::Done);
  EXPECT_FALSE(blurriness->IsTimeVarying());
  EXPECT_FALSE(blurriness->HasKeyframes());
  EXPECT_EQ(blurriness->GetConstantValue(), ParamValue(0.0));
  EXPECT_EQ(blur->FindParam("Repeat Edge Pixels")->GetConstantValue(), ParamValue(false));
  EXPECT_EQ(blur->GetDisplayName(), "Gaussian Blur");
  EXPECT_EQ(blur->GetCurrentPreset(), 0);
  Undo().Undo();
  EXPECT_EQ(Dump(), edited);
  EXPECT_EQ(ComponentChainActions::ResetComponent(crop), EditStatus::NoChange);
}

TEST_F(ComponentChainActionsTest, APresetSetsItsValuesAndTheRestToDefaults) {
  ComponentParamActions::SetValue(blur->FindParam("Blur Dimensions"), 0, ParamChoice{1});
  ASSERT_EQ(ComponentActions::ApplyPreset(blur, 1), EditStatus::Done);
  EXPECT_EQ(blur->GetCurrentPreset(), 1);
  EXPECT_EQ(blur->FindParam("Blurriness")->GetConstantValue(), ParamValue(10.0));
  EXPECT_EQ(blur->FindParam("Blur Dimensions")->GetConstantValue(), ParamValue(ParamChoice{0}));
  EXPECT_EQ(Undo().GetUndoNames().back(), "MZ.Component.ApplyPreset");
  EXPECT_EQ(ComponentActions::ApplyPreset(blur, 7), EditStatus::InvalidArgument);
}

TEST_F(ComponentChainActionsTest, MasksAreAddedAndRemovedAsEmbeddedComponents) {
  const ComponentRef opacity = Intrinsic(kMatchName_Opacity);
  const ComponentRef mask = Catalogue().Create(kMatchName_Mask);
  ASSERT_EQ(ComponentActions::AddMask(opacity, mask), EditStatus::Done);
  EXPECT_TRUE(mask->IsMask());
  EXPECT_EQ(mask->GetMaskOwner(), opacity.get());
  EXPECT_EQ(mask->GetChain(), videoChain.get());
  EXPECT_EQ(mask->GetProject(), project.get());
  EXPECT_EQ(Undo().GetUndoName(), "MZ.EffectControls.AddMask");
  // A mask's parameters edit through the project like any other.
  ComponentParamActions::SetValue(mask->GetParam(kMaskParamTrackingMethod), 0, ParamChoice{2});
  EXPECT_EQ(Undo().GetUndoNames().size(), 2u);

  ASSERT_EQ(ComponentActions::RemoveMask(opacity, mask), EditStatus::Done);
  EXPECT_EQ(mask->GetMaskOwner(), nullptr);
  Undo().Undo();
  EXPECT_EQ(opacity->GetMasks().size(), 1u);
  EXPECT_EQ(ComponentActions::AddMask(crop, Catalogue().Create(kMatchName_Mask)),
            EditStatus::InvalidArgument);  // crop takes no masks
}

// Regression: the masks an effect keeps were taken for masks of another chain, so a second mask
// could not be added to an effect in a chain, nor one of two removed.
TEST_F(ComponentChainActionsTest, AnEffectInAChainTakesASecondMaskAndGivesUpOneOfTwo) {
  const ComponentRef opacity = Intrinsic(kMatchName_Opacity);
  const ComponentRef first = Catalogue().Create(kMatchName_Mask);
  const ComponentRef other = Catalogue().Create(kMatchName_Mask);
  ASSERT_EQ(ComponentActions::AddMask(opacity, first), EditStatus::Done);
  ASSERT_EQ(ComponentActions::AddMask(opacity, other), EditStatus::Done);
  EXPECT_EQ(opacity->GetMasks(), (std::vector<ComponentRef>{first, other}));
  ASSERT_EQ(ComponentActions::RemoveMask(opacity, first), EditStatus::Done);
  EXPECT_EQ(opacity->GetMasks(), std::vector<ComponentRef>{other});
  EXPECT_EQ(first->GetMaskOwner(), nullptr);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(opacity->GetMasks(), (std::vector<ComponentRef>{first, other}));
  // A mask of another effect is still refused.
  const ComponentRef blurMask = Catalogue().Create(kMatchName_Mask);
  ASSERT_EQ(ComponentActions::AddMask(blur, blurMask), EditStatus::Done);
  EXPECT_NE(ComponentActions::AddMask(opacity, blurMask), EditStatus::Done);
  EXPECT_EQ(blurMask->GetMaskOwner(), blur.get());
}

}  // namespace
