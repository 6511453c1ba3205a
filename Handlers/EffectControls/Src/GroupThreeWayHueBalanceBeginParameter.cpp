#include "Handlers/EffectControls/Src/GroupThreeWayHueBalanceBeginParameter.h"

#include <algorithm>

#include "Host/Model/ComponentParam.h"
#include "Host/Toolkit/Decals.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/Static.h"

namespace {

constexpr std::array<const char*, 3> kLabels = {
    "$$$/Vantile/Handlers/EffectControls/ShadowsLabel=Shadows",
    "$$$/Vantile/Handlers/EffectControls/MidtonesLabel=Midtones",
    "$$$/Vantile/Handlers/EffectControls/HighlightLabel=Highlights"};
constexpr int kResetSize = 16;
constexpr int kLabelHeight = 16;

}  // namespace

GroupThreeWayHueBalanceBeginParameter::GroupThreeWayHueBalanceBeginParameter(
    const ParameterControlInfo& info)
    : GroupWheelSetBeginParameter(info, 3) {}

GroupThreeWayHueBalanceBeginParameter::~GroupThreeWayHueBalanceBeginParameter() = default;

int GroupThreeWayHueBalanceBeginParameter::GetWheelDiameter() const {
  return std::max(0, (GetWidth() - GetParameterIndentInPixels() - 40) / 3);
}

int GroupThreeWayHueBalanceBeginParameter::GetExpandedAreaHeight() const {
  return kWheelTop + GetWheelDiameter() + 12 - OwnHeight();
}

int GroupThreeWayHueBalanceBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return OwnHeight() + GetExpandedAreaHeight() + ChildrenHeight();
}

bool GroupThreeWayHueBalanceBeginParameter::IsLinked() const {
  const auto& children = GetItems();
  if (children.size() <= kLinkChild) {
    return false;
  }
  const auto* row = dynamic_cast<const ParameterControl*>(children[kLinkChild].get());
  if (row == nullptr || !row->GetParam()) {
    return false;
  }
  return row->GetParam()->GetScalarAt(GetClipEditTime()).value_or(0.0) != 0.0;
}

std::vector<std::size_t> GroupThreeWayHueBalanceBeginParameter::LinkedWheels(
    std::size_t index) const {
  if (IsLinked()) {
    return {0, 1, 2};
  }
  return {index};
}

void GroupThreeWayHueBalanceBeginParameter::CreateControlsSelf() {
  GroupWheelSetBeginParameter::CreateControlsSelf();
  for (std::size_t i = 0; i < 3; ++i) {
    mLabels[i] = AdoptControl(std::make_shared<Static>(Rect{}, kLabels[i]));
    mResets[i] = AdoptControl(
        std::make_shared<PictureButton>(Rect{}, static_cast<CommandID>(kResetShadowsCommand + i),
                                        kEffectControlsResetNormalDecal, this));
  }
}

void GroupThreeWayHueBalanceBeginParameter::DestroyControlsSelf() {
  for (std::size_t i = 0; i < 3; ++i) {
    DestroyControl(mLabels[i]);
    DestroyControl(mResets[i]);
  }
  GroupWheelSetBeginParameter::DestroyControlsSelf();
}

void GroupThreeWayHueBalanceBeginParameter::ShowControls(bool show) {
  GroupWheelSetBeginParameter::ShowControls(show);
  for (std::size_t i = 0; i < 3; ++i) {
    if (mLabels[i]) {
      mLabels[i]->SetVisible(show && IsExpanded());
    }
    if (mResets[i]) {
      mResets[i]->SetVisible(show && IsExpanded());
    }
  }
}

void GroupThreeWayHueBalanceBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupWheelSetBeginParameter::PositionSelf(top, depth, width);
  const int diameter = GetWheelDiameter();
  for (std::size_t i = 0; i < 3; ++i) {
    const int left = GetParameterIndentInPixels() + 20 + static_cast<int>(i) * (diameter + 5);
    if (i < GetWheelCount()) {
      PlaceView(*GetWheel(i), Rect::FromSize(left, top + kWheelTop, diameter, diameter));
    }
    if (mLabels[i]) {
      PlaceView(*mLabels[i], Rect::FromSize(left, top + kLabelTop,
                                            std::max(0, diameter - kResetSize), kLabelHeight));
    }
    if (mResets[i]) {
      PlaceView(*mResets[i], Rect::FromSize(left + std::max(0, diameter - kResetSize),
                                            top + kLabelTop, kResetSize, kResetSize));
    }
  }
}

bool GroupThreeWayHueBalanceBeginParameter::FindCommandStatus(CommandID command,
                                                              CommandStatus& status) {
  if (command >= kResetShadowsCommand && command <= kResetHighlightsCommand) {
    status.enabled = !IsReadOnly();
    return true;
  }
  return GroupWheelSetBeginParameter::FindCommandStatus(command, status);
}

bool GroupThreeWayHueBalanceBeginParameter::ObeyCommand(CommandID command) {
  if (command >= kResetShadowsCommand && command <= kResetHighlightsCommand) {
    ResetWheels({static_cast<std::size_t>(command - kResetShadowsCommand)});
    return true;
  }
  return GroupWheelSetBeginParameter::ObeyCommand(command);
}
