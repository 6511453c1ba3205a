#include "Host/Toolkit/Decals.h"

#include <array>

namespace {

struct DecalInfo {
  std::string_view name;
  Size size;
};

// In enum order; checked by the test that every name maps back to its decal.
constexpr std::array<DecalInfo, kDecalCount> kDecalTable = {{
    {"kEffectControlsKeyLinearNormalDecal", {16, 16}},
    {"kEffectControlsKeyLinearFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyLinearLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyLinearSelectedDecal", {16, 16}},
    {"kEffectControlsKeyLinearFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyLinearLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyBezierNormalDecal", {16, 16}},
    {"kEffectControlsKeyBezierFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyBezierLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyBezierSelectedDecal", {16, 16}},
    {"kEffectControlsKeyBezierFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyBezierLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierNormalDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierSelectedDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyAutoBezierLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyHoldNormalDecal", {16, 16}},
    {"kEffectControlsKeyHoldFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyHoldLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyHoldSelectedDecal", {16, 16}},
    {"kEffectControlsKeyHoldFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyHoldLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseInNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseInFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseInLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseInSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseInFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseInLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutFirstNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutLastNormalDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutFirstSelectedDecal", {16, 16}},
    {"kEffectControlsKeyEaseOutLastSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRDualControlPointNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRDualControlPointSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRLeftControlPointNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRLeftControlPointSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRRightControlPointNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRRightControlPointSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRHoldControlPointNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRHoldControlPointSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRDualHoldRightNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRDualHoldRightSelectedDecal", {16, 16}},
    {"kEffectControlsKeyTRDualHoldLeftNormalDecal", {16, 16}},
    {"kEffectControlsKeyTRDualHoldLeftSelectedDecal", {16, 16}},
    {"kEffectControlsKeySumNormalDecal", {16, 16}},
    {"kChevronUpNormalDecal", {16, 16}},
    {"kChevronDownNormalDecal", {16, 16}},
    {"kChevronLeftNormalDecal", {16, 16}},
    {"kChevronRightNormalDecal", {16, 16}},
    {"kDisclosureTriangleClosedDecal", {16, 16}},
    {"kDisclosureTriangleOpenDecal", {16, 16}},
    {"kEffectControlsOnToggleNormalDecal", {16, 16}},
    {"kEffectControlsOffToggleNormalDecal", {16, 16}},
    {"kTLVideoMuteButtonNormalDecal", {16, 16}},
    {"kTLVideoMuteOffButtonNormalDecal", {16, 16}},
    {"kEffectControlsSetupNormalDecal", {16, 16}},
    {"kEffectControlsResetNormalDecal", {16, 16}},
    {"kEffectControlsPresetNormalDecal", {16, 16}},
    {"kDirectManipulationDecal", {16, 16}},
    {"kStopwatchOffDecal", {16, 16}},
    {"kStopwatchOnDecal", {16, 16}},
    {"kKeyframeNavigatorPreviousDecal", {16, 16}},
    {"kKeyframeNavigatorNextDecal", {16, 16}},
    {"kKeyframeNavigatorAddDecal", {16, 16}},
    {"kKeyframeNavigatorRemoveDecal", {16, 16}},
    {"kPlayNormalDecal", {16, 16}},
    {"kStopNormalDecal", {16, 16}},
    {"kLoopNormalDecal", {16, 16}},
    {"kLoopOnDecal", {16, 16}},
    {"kPanelMenuDecal", {16, 16}},
    {"kNoHeadMaterialDecal", {8, 8}},
    {"kNoTailMaterialDecal", {8, 8}},
    {"kTitlerEllipseNormalDecal", {16, 16}},
    {"kTitlerRectNormalDecal", {16, 16}},
    {"kToolsPenDecal", {16, 16}},
    {"kTrackerStepBackDecal", {16, 16}},
    {"kTrackerReverseDecal", {16, 16}},
    {"kTrackerStopDecal", {16, 16}},
    {"kTrackerPlayDecal", {16, 16}},
    {"kTrackerStepForwardDecal", {16, 16}},
    {"kPlaybackSettingsSmallDecal", {16, 16}},
    {"kUIFColorPickerOffDecal", {16, 16}},
    {"kUIFColorPickerOnDecal", {16, 16}},
    {"kEffectControlsAudioTransitionConstantPowerDecal", {32, 32}},
    {"kEffectControlsAudioTransitionConstantGainDecal", {32, 32}},
    {"kEffectControlsSampleADecal", {160, 120}},
    {"kEffectControlsSampleBDecal", {160, 120}},
    {"kEffectControlsTransitionArrowEastDecal", {16, 16}},
    {"kEffectControlsTransitionArrowEastSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthEastDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthEastSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthWestDecal", {16, 16}},
    {"kEffectControlsTransitionArrowNorthWestSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthEastDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthEastSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthWestDecal", {16, 16}},
    {"kEffectControlsTransitionArrowSouthWestSelectedDecal", {16, 16}},
    {"kEffectControlsTransitionArrowWestDecal", {16, 16}},
    {"kEffectControlsTransitionArrowWestSelectedDecal", {16, 16}},
}};

bool InRange(Decal decal) {
  return decal >= 0 && decal < kDecalCount;
}

}  // namespace

std::string_view GetDecalName(Decal decal) {
  return InRange(decal) ? kDecalTable[decal].name : std::string_view();
}

std::optional<Decal> FindDecalByName(std::string_view name) {
  for (int i = 0; i < kDecalCount; ++i) {
    if (kDecalTable[i].name == name)
      return static_cast<Decal>(i);
  }
  return std::nullopt;
}

Size GetDecalSize(Decal decal) {
  return InRange(decal) ? kDecalTable[decal].size : Size{};
}
