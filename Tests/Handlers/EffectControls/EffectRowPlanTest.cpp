// Which rows the effect list makes, in which order and section, planned without any view.
#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "Handlers/EffectControls/Src/EffectRowPlan.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/TrackItem.h"
#include "Tests/Host/Model/WideText.h"

namespace {

using Strings = std::vector<std::string>;

constexpr TickTime kSecond = kTicksPerSecond;

// "Name", "mask Name", "<shape>", "<custom 1>", with "@level" when nested.
std::string Label(const PlannedRow& row) {
  std::string label;
  switch (row.kind) {
    case PlannedRowKind::Effect:
      label = (row.isMask ? "mask " : "") + row.component->GetDisplayName();
      break;
    case PlannedRowKind::MaskShape:
      label = "<shape>";
      break;
    case PlannedRowKind::CustomAudio:
      label = "<custom " + std::to_string(row.customAudioIndex) + ">";
      break;
    case PlannedRowKind::Group:
    case PlannedRowKind::Parameter:
      label = row.param->GetName();
      break;
  }
  return row.groupLevel > 0 ? label + "@" + std::to_string(row.groupLevel) : label;
}

std::string Outline(const std::vector<PlannedRow>& rows);

// A row and everything under it on one line: "Effect{Group{Param@1}, Param}".
std::string Outline(const PlannedRow& row) {
  return row.children.empty() ? Label(row) : Label(row) + "{" + Outline(row.children) + "}";
}

std::string Outline(const std::vector<PlannedRow>& rows) {
  std::string text;
  for (const PlannedRow& row : rows) {
    text += (text.empty() ? "" : ", ") + Outline(row);
  }
  return text;
}

Strings Titles(const std::vector<PlannedRow>& rows) {
  Strings titles;
  for (const PlannedRow& row : rows) {
    titles.push_back(Label(row));
  }
  return titles;
}

class EffectRowPlanTest : public ::testing::Test {
 protected:
  EffectRowPlanTest() { rules.maxAudioParts = 50; }

  static ComponentRef Make(const char* matchName) {
    return EffectCatalogue::Standard().Create(matchName);
  }
  static ComponentRef Applied(std::string name) {
    return Component::Create("XO.KRVN " + name, name, MediaType::Video, false);
  }
  static ComponentRef WithRole(ComponentRef component, ComponentRole role) {
    component->SetRole(role);
    return component;
  }
  static ComponentChainRef Chain(const std::vector<ComponentRef>& components,
                                 MediaType mediaType = MediaType::Video) {
    ComponentChainRef chain = ComponentChain::Create(mediaType);
    for (const ComponentRef& component : components) {
      chain->Append(component);
    }
    return chain;
  }
  static TrackItemRef AudioClip(const std::vector<ComponentRef>& components,
                                std::uint32_t partKey = 0) {
    TrackItemRef item = TrackItem::CreateClip(MediaType::Audio, 0, 5 * kSecond, nullptr);
    for (const ComponentRef& component : components) {
      item->GetComponentChain()->Append(component);
    }
    item->SetPartOrderKey(partKey);
    return item;
  }
  // An effect whose first parameter is a counted group spanning `spans`.
  static ComponentRef CountedGroupEffect(ParamValue spans, const Strings& following) {
    ComponentRef effect = Applied("Test");
    effect->AddParam(ComponentParam::Create("Counted", ParamType::GroupBegin, std::move(spans))
                         ->SetGroupKind(GroupKind::Counted));
    for (const std::string& name : following) {
      effect->AddParam(ComponentParam::Create(name, ParamType::FloatSlider, 1.0));
    }
    return effect;
  }

  EffectRowPlan PlanVideo(const std::vector<ComponentRef>& components,
                          EffectRowMode mode = EffectRowMode::Clip) const {
    EffectRowSource source;
    source.mode = mode;
    source.videoChain = Chain(components);
    return PlanEffectRows(source, rules);
  }
  EffectRowPlan PlanAudio(const std::vector<TrackItemRef>& items) const {
    EffectRowSource source;
    source.audioItems = items;
    return PlanEffectRows(source, rules);
  }
  static std::string OutlineOf(const ComponentRef& effect) {
    EffectRowSource source;
    source.videoChain = Chain({effect});
    return Outline(PlanEffectRows(source, EffectRowRules{}).video);
  }

  MessagingTestScope messaging;
  EffectRowRules rules;
};

// --- Sections and their order ---

TEST_F(EffectRowPlanTest, IntrinsicsComeFirstThenAppliedEffectsEachInReverseChainOrder) {
  const EffectRowPlan plan = PlanVideo({Make(kMatchName_Motion), Make(kMatchName_GaussianBlur),
                                        Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  EXPECT_EQ(Titles(plan.video), (Strings{"Opacity", "Motion", "Crop", "Gaussian Blur"}));
  EXPECT_TRUE(plan.graphics.empty());
  EXPECT_FALSE(plan.graphicsLayers);
  EXPECT_TRUE(plan.audioParts.empty());
  for (const PlannedRow& row : plan.video) {
    EXPECT_EQ(row.mediaType, MediaType::Video);
    EXPECT_FALSE(row.masterClipEffect);
    EXPECT_EQ(row.groupLevel, 0);
  }
}

TEST_F(EffectRowPlanTest, HidingTimeRemappingDropsOnlyThatIntrinsic) {
  const std::vector<ComponentRef> intrinsics =
      EffectCatalogue::Standard().CreateIntrinsics(MediaType::Video);
  EXPECT_EQ(Titles(PlanVideo(intrinsics).video), (Strings{"Time Remapping", "Opacity", "Motion"}));
  rules.hideTimeRemapping = true;
  EXPECT_EQ(Titles(PlanVideo(intrinsics).video), (Strings{"Opacity", "Motion"}));
}

TEST_F(EffectRowPlanTest, CapsulesShowOnlyForATemplate) {
  ComponentRef capsule = Component::Create("XO.KRVN Capsule", "Capsule", MediaType::Video, true);
  capsule->SetRole(ComponentRole::Capsule);
  EffectRowSource source;
  source.videoChain = Chain({Make(kMatchName_Motion), capsule, Make(kMatchName_Crop)});
  EXPECT_EQ(Titles(PlanEffectRows(source, rules).video), (Strings{"Motion", "Crop"}));
  source.showCapsules = true;
  EXPECT_EQ(Titles(PlanEffectRows(source, rules).video), (Strings{"Capsule", "Motion", "Crop"}));
}

TEST_F(EffectRowPlanTest, GraphicsLayersTakeTheAppliedEffectsToTheGraphicsSectionInChainOrder) {
  ComponentRef group = Component::Create("XO.KRVN GraphicGroup", "Graphic", MediaType::Video, true);
  EffectRowSource source;
  source.videoChain =
      Chain({Make(kMatchName_Motion), WithRole(Applied("Text"), ComponentRole::Graphics),
             Make(kMatchName_Opacity), group, WithRole(Applied("Shape"), ComponentRole::Graphics),
             Make(kMatchName_GaussianBlur)});
  // The master graphic's own layers follow; its intrinsics do not.
  source.masterGraphicChain = Chain({Make(kMatchName_Motion), Applied("Logo")});
  const EffectRowPlan plan = PlanEffectRows(source, rules);
  EXPECT_TRUE(plan.graphicsLayers);
  EXPECT_EQ(Titles(plan.video), (Strings{"Opacity", "Motion"}));
  EXPECT_EQ(Titles(plan.graphics), (Strings{"Graphic", "Text", "Shape", "Gaussian Blur", "Logo"}));
}

TEST_F(EffectRowPlanTest, AGraphicGroupAloneMakesNoGraphicsClip) {
  ComponentRef group = Component::Create("XO.KRVN GraphicGroup", "Graphic", MediaType::Video, true);
  EffectRowSource source;
  source.videoChain = Chain({group, Applied("First"), Make(kMatchName_Opacity), Applied("Second")});
  source.masterGraphicChain = Chain({Applied("Logo")});
  const EffectRowPlan plan = PlanEffectRows(source, rules);
  EXPECT_FALSE(plan.graphicsLayers);
  EXPECT_EQ(Titles(plan.graphics), (Strings{"Graphic"}));
  EXPECT_EQ(Titles(plan.video), (Strings{"Opacity", "Second", "First"}));
}

TEST_F(EffectRowPlanTest, MasterClipEffectsHaveNoMaskShapeAndTheClipNoAudio) {
  ComponentRef tint = Make(kMatchName_Tint);
  tint->SetMasks({Make(kMatchName_Mask)});
  EffectRowSource source;
  source.mode = EffectRowMode::MasterClip;
  source.videoChain = Chain({tint});
  source.audioItems = {AudioClip({Make(kMatchName_Volume)})};
  const EffectRowPlan plan = PlanEffectRows(source, rules);
  ASSERT_EQ(plan.video.size(), 1u);
  EXPECT_TRUE(plan.video[0].masterClipEffect);
  EXPECT_TRUE(plan.audioParts.empty());
  // The mask keeps its row, but is not the master clip's.
  EXPECT_EQ(Titles(plan.video[0].children),
            (Strings{"mask Mask@1", "Map Black To", "Map White To", "Amount to Tint"}));
  EXPECT_FALSE(plan.video[0].children[0].masterClipEffect);

  source.mode = EffectRowMode::Clip;
  EXPECT_EQ(Titles(PlanEffectRows(source, rules).video[0].children).front(), "<shape>");
}

TEST_F(EffectRowPlanTest, TransitionChainShowsOnlyTheComponentAfterTheTransition) {
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({Make(kMatchName_Mask)});
  EXPECT_TRUE(PlanVideo({}, EffectRowMode::TransitionEffects).video.empty());
  EXPECT_TRUE(
      PlanVideo({Make(kMatchName_Opacity)}, EffectRowMode::TransitionEffects).video.empty());
  const EffectRowPlan plan = PlanVideo({Make(kMatchName_Opacity), blur, Make(kMatchName_Crop)},
                                       EffectRowMode::TransitionEffects);
  ASSERT_EQ(Titles(plan.video), (Strings{"Gaussian Blur"}));
  // Its masks, but no mask shape to draw new ones with.
  EXPECT_EQ(Titles(plan.video[0].children).front(), "mask Mask@1");
  EXPECT_FALSE(plan.video[0].masterClipEffect);
}

TEST_F(EffectRowPlanTest, NoChainOrAnEmptyOnePlansNothing) {
  EffectRowSource source;
  const EffectRowPlan none = PlanEffectRows(source, rules);
  EXPECT_TRUE(none.video.empty());
  EXPECT_TRUE(none.graphics.empty());
  EXPECT_TRUE(none.audioParts.empty());
  EXPECT_FALSE(none.videoLimiterPresent);
  EXPECT_TRUE(PlanVideo({}).video.empty());
}

// --- Under an effect ---

TEST_F(EffectRowPlanTest, MaskShapeHeadsOnlyEffectsThatTakeMasksOutsideMasterClipMode) {
  ComponentRef stabilizer =
      Component::Create("XO.KRVN WarpStabilizer", "Warp", MediaType::Video, false);
  ComponentRef reframe =
      Component::Create("XO.KRVN AutoReframe", "Reframe", MediaType::Video, false);
  ComponentRef intrinsic = Component::Create("XO.KRVN Inner", "Inner", MediaType::Video, true);
  for (const ComponentRef& component : {stabilizer, reframe, intrinsic}) {
    component->SetCanTakeMasks(true);
  }
  const EffectRowPlan plan = PlanVideo({Make(kMatchName_Opacity), intrinsic, stabilizer, reframe,
                                        Make(kMatchName_Crop), Make(kMatchName_GaussianBlur)});
  Strings shaped;
  for (const PlannedRow& row : plan.video) {
    if (!row.children.empty() && row.children.front().kind == PlannedRowKind::MaskShape) {
      shaped.push_back(Label(row));
    }
  }
  // Of the intrinsics only opacity; Crop takes no masks.
  EXPECT_EQ(shaped, (Strings{"Opacity", "Gaussian Blur"}));

  rules.noMaskControls = true;
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({Make(kMatchName_Mask)});
  EXPECT_EQ(Titles(PlanVideo({blur}).video[0].children),
            (Strings{"Blurriness", "Blur Dimensions", "Repeat Edge Pixels"}));
}

TEST_F(EffectRowPlanTest, MasksFollowTheShapeOneLevelDeeperWithTheirOwnMasksDeeperStill) {
  ComponentRef inner = Make(kMatchName_Mask);
  ComponentRef outer = Make(kMatchName_Mask);
  outer->SetCanTakeMasks(true);
  outer->SetMasks({inner});
  ComponentRef notAMask = Applied("Matte");
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({outer, notAMask});
  const PlannedRow row = PlanVideo({blur}).video.at(0);
  ASSERT_EQ(Titles(row.children), (Strings{"<shape>", "mask Mask@1", "Matte@1", "Blurriness",
                                           "Blur Dimensions", "Repeat Edge Pixels"}));
  const PlannedRow& mask = row.children[1];
  // A mask has no shape row of its own; its parameters sit at its level.
  const Strings maskRows = Titles(mask.children);
  ASSERT_GE(maskRows.size(), 2u);
  EXPECT_EQ(Strings(maskRows.begin(), maskRows.begin() + 2),
            (Strings{"mask Mask@2", "Mask Feather@1"}));
  EXPECT_EQ(mask.mediaType, MediaType::Video);
  EXPECT_FALSE(row.children[2].isMask);
}

TEST_F(EffectRowPlanTest, OfflineEffectHasNoRowsUnderIt) {
  ComponentRef missing = Make(kMatchName_GaussianBlur);
  missing->SetOffline(true);
  missing->SetMasks({Make(kMatchName_Mask)});
  const EffectRowPlan plan = PlanVideo({Make(kMatchName_Opacity), missing});
  ASSERT_EQ(Titles(plan.video), (Strings{"Opacity", "Gaussian Blur"}));
  EXPECT_TRUE(plan.video[1].children.empty());
  EXPECT_FALSE(plan.video[0].children.empty());
}

TEST_F(EffectRowPlanTest, AVideoLimiterIsNotedWhereverItIsUnlessOffline) {
  auto limiter = [] {
    return Component::Create("XO.KRVN VideoLimiter", "Limiter", MediaType::Video, false);
  };
  EXPECT_FALSE(PlanVideo({Make(kMatchName_Opacity)}).videoLimiterPresent);
  EXPECT_TRUE(PlanVideo({limiter()}).videoLimiterPresent);
  ComponentRef offline = limiter();
  offline->SetOffline(true);
  EXPECT_FALSE(PlanVideo({offline}).videoLimiterPresent);
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks(
      {Component::Create("XO.KRVN DigitalVideoLimiter", "Digital", MediaType::Video, false)});
  EXPECT_TRUE(PlanVideo({blur}).videoLimiterPresent);
}

// --- Parameter groups ---

TEST_F(EffectRowPlanTest, GroupHoldsTheParametersBetweenItsBeginAndEnd) {
  EXPECT_EQ(OutlineOf(Make(kMatchName_Timecode)),
            "Timecode{Position and Size{Position@1, Size@1}, Time Display, Field Symbol, "
            "Starting Timecode, Offset}");
}

TEST_F(EffectRowPlanTest, EveryGroupKindNestsItsParameters) {
  ComponentRef effect = Applied("Kinds");
  for (const GroupKind kind : {GroupKind::None, GroupKind::Buttons, GroupKind::Levels}) {
    effect->AddParam(ComponentParam::Create("G", ParamType::GroupBegin, false)->SetGroupKind(kind));
    effect->AddParam(ComponentParam::Create("p", ParamType::FloatSlider, 1.0));
    effect->AddParam(ComponentParam::Create("", ParamType::GroupEnd, false));
  }
  EXPECT_EQ(OutlineOf(effect), "Kinds{G{p@1}, G{p@1}, G{p@1}}");
}

TEST_F(EffectRowPlanTest, CountedGroupSpansAsManyParametersAsItsValueHasSemicolons) {
  EXPECT_EQ(OutlineOf(CountedGroupEffect(WideText("Smoothness;Settings;"),
                                         {"Smoothness", "Settings", "After"})),
            "Test{Counted{Smoothness@1, Settings@1}, After}");
  // Plain text counts the same way.
  EXPECT_EQ(OutlineOf(CountedGroupEffect(std::string("a;"), {"One", "After"})),
            "Test{Counted{One@1}, After}");
  // No semicolon: an empty group.
  EXPECT_EQ(OutlineOf(CountedGroupEffect(WideText(""), {"After"})), "Test{Counted, After}");
}

TEST_F(EffectRowPlanTest, TheCataloguesCountedGroupHoldsTheParametersItNames) {
  // Grid Distortion's "Advanced" group is counted: its text names Smoothness and Settings.
  const PlannedRow row = PlanVideo({Make(kMatchName_GridDistortion)}).video.at(0);
  ASSERT_FALSE(row.children.empty());
  EXPECT_EQ(Outline(row.children.back()), "Advanced{Smoothness@1, Settings@1}");
}

TEST_F(EffectRowPlanTest, CountedGroupEndsEarlyWhenTheEffectRunsOutOfParameters) {
  ComponentRef effect = CountedGroupEffect(WideText("a;b;c;d;"), {"Only"});
  // A stray group end closes nothing it should not.
  effect->AddParam(ComponentParam::Create("", ParamType::GroupEnd, false));
  EXPECT_EQ(OutlineOf(effect), "Test{Counted{Only@1}}");
}

TEST_F(EffectRowPlanTest, GroupEndClosesTheCountedGroupsInsideItsGroup) {
  ComponentRef effect = Applied("Nest");
  effect->AddParam(ComponentParam::Create("Outer", ParamType::GroupBegin, false));
  effect->AddParam(ComponentParam::Create("Counted", ParamType::GroupBegin, WideText("a;b;c;"))
                       ->SetGroupKind(GroupKind::Counted));
  effect->AddParam(ComponentParam::Create("One", ParamType::FloatSlider, 1.0));
  effect->AddParam(ComponentParam::Create("", ParamType::GroupEnd, false));
  effect->AddParam(ComponentParam::Create("After", ParamType::FloatSlider, 1.0));
  EXPECT_EQ(OutlineOf(effect), "Nest{Outer{Counted@1{One@2}}, After}");
}

TEST_F(EffectRowPlanTest, ACountedGroupThatRunsOutInsideAnInnerGroupClosesWithIt) {
  ComponentRef effect = CountedGroupEffect(WideText("a;b;"), {});
  effect->AddParam(ComponentParam::Create("Inner", ParamType::GroupBegin, false));
  effect->AddParam(ComponentParam::Create("x", ParamType::FloatSlider, 1.0));
  effect->AddParam(ComponentParam::Create("y", ParamType::FloatSlider, 1.0));
  effect->AddParam(ComponentParam::Create("", ParamType::GroupEnd, false));
  effect->AddParam(ComponentParam::Create("After", ParamType::FloatSlider, 1.0));
  EXPECT_EQ(OutlineOf(effect), "Test{Counted{Inner@1{x@2, y@2}}, After}");
}

// --- Audio parts ---

TEST_F(EffectRowPlanTest, AudioPartsFollowTheirOrderKeysWithEachChainInOrder) {
  const TrackItemRef keyTwo = AudioClip({Make(kMatchName_Volume)}, 2);
  const TrackItemRef keyZero = AudioClip({Make(kMatchName_Panner), Make(kMatchName_Volume)}, 0);
  const TrackItemRef keyOne = AudioClip({Make(kMatchName_Delay)}, 1);
  const EffectRowPlan plan = PlanAudio({keyTwo, keyZero, keyOne});
  ASSERT_EQ(plan.audioParts.size(), 3u);
  EXPECT_EQ(plan.audioParts[0].item, keyZero);
  EXPECT_EQ(plan.audioParts[1].item, keyOne);
  EXPECT_EQ(plan.audioParts[2].item, keyTwo);
  EXPECT_EQ(Titles(plan.audioParts[0].rows), (Strings{"Panner", "Volume"}));
  EXPECT_EQ(plan.audioParts[0].rows[0].mediaType, MediaType::Audio);
  EXPECT_TRUE(plan.video.empty());

  const EffectRowPlan single = PlanAudio({keyOne});
  ASSERT_EQ(single.audioParts.size(), 1u);
  EXPECT_EQ(single.audioParts[0].item, keyOne);
}

TEST_F(EffectRowPlanTest, AudioPartsSharingAKeyAreAllShownInSelectionOrder) {
  // Regression: taking "the smallest key above the last one" lost every part after the first
  // of equal keys (every new part has key 0).
  const TrackItemRef left = AudioClip({Make(kMatchName_Volume)});
  const TrackItemRef right = AudioClip({Make(kMatchName_Panner)});
  const TrackItemRef notAPart = AudioClip({Make(kMatchName_Delay)}, 10000);
  TransitionData data;
  data.matchName = "XO.KRVN ConstantPower";
  const TrackItemRef transition = TrackItem::CreateTransition(MediaType::Audio, 0, kSecond, data);
  const EffectRowPlan plan = PlanAudio({left, nullptr, notAPart, transition, right});
  ASSERT_EQ(plan.audioParts.size(), 2u);
  EXPECT_EQ(plan.audioParts[0].item, left);
  EXPECT_EQ(plan.audioParts[1].item, right);
}

TEST_F(EffectRowPlanTest, AtMostTheAllowedNumberOfPartsTheFirstByKey) {
  rules.maxAudioParts = 2;
  const TrackItemRef last = AudioClip({}, 9);
  const TrackItemRef first = AudioClip({}, 1);
  const TrackItemRef second = AudioClip({}, 5);
  const EffectRowPlan plan = PlanAudio({last, first, second});
  ASSERT_EQ(plan.audioParts.size(), 2u);
  EXPECT_EQ(plan.audioParts[0].item, first);
  EXPECT_EQ(plan.audioParts[1].item, second);
  EXPECT_TRUE(plan.audioParts[0].rows.empty());
}

TEST_F(EffectRowPlanTest, OnlyAClipWithAudioAllowedHasParts) {
  EffectRowSource source;
  source.videoChain = Chain({Make(kMatchName_Opacity), Make(kMatchName_Crop)});
  source.audioItems = {AudioClip({Make(kMatchName_Volume)})};
  EXPECT_EQ(PlanEffectRows(source, rules).audioParts.size(), 1u);
  source.mode = EffectRowMode::TransitionEffects;
  EXPECT_TRUE(PlanEffectRows(source, rules).audioParts.empty());
  source.mode = EffectRowMode::Clip;
  rules.noAudio = true;
  const EffectRowPlan plan = PlanEffectRows(source, rules);
  EXPECT_TRUE(plan.audioParts.empty());
  EXPECT_EQ(Titles(plan.video), (Strings{"Opacity", "Crop"}));
}

TEST_F(EffectRowPlanTest, AudioEffectsShowWhatTheirDescriptionShowsAndTheirOwnWindowFirst) {
  ComponentRef plugin = Make(kMatchName_Delay);
  plugin->SetHasSetupDialog(true);
  // Masks are a video matter.
  plugin->SetCanTakeMasks(true);
  plugin->SetMasks({Make(kMatchName_Mask)});
  const EffectRowPlan plan = PlanAudio({AudioClip({Make(kMatchName_Delay), plugin})});
  ASSERT_EQ(plan.audioParts.size(), 1u);
  // "Plug-in State" is hidden by the effect's description.
  EXPECT_EQ(Outline(plan.audioParts[0].rows),
            "Delay{Delay, Feedback, Mix}, Delay{<custom 0>, <custom 1>, Delay, Feedback, Mix}");
}

}  // namespace
