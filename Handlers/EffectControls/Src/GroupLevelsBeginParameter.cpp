#include "Handlers/EffectControls/Src/GroupLevelsBeginParameter.h"

#include <algorithm>
#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MultiComponentParamActor.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/HotFloatControl.h"
#include "Host/Toolkit/LevelsControl.h"
#include "Host/Toolkit/Static.h"

namespace {

constexpr std::size_t kPlacedFirst = 3;  // children stacked above the controls
constexpr int kLabelWidth = 120;
constexpr int kLabelHeight = 16;
constexpr int kFieldWidth = 35;
constexpr int kFieldHeight = 15;
constexpr int kFieldStep = 40;
constexpr int kControlHeight = 18;
constexpr int kInputTop = 3;
constexpr int kInputControlTop = 22;
constexpr int kOutputTop = 43;
constexpr int kOutputControlTop = 62;

}  // namespace

GroupLevelsBeginParameter::GroupLevelsBeginParameter(const ParameterControlInfo& info)
    : GroupBeginParameter(info) {}

GroupLevelsBeginParameter::~GroupLevelsBeginParameter() = default;

ComponentParamRef GroupLevelsBeginParameter::LevelParam(Level level) const {
  const auto& children = GetItems();
  if (Index(level) >= children.size()) {
    return nullptr;
  }
  const auto* row = dynamic_cast<const ParameterControl*>(children[Index(level)].get());
  return row != nullptr ? row->GetParam() : nullptr;
}

std::optional<double> GroupLevelsBeginParameter::ReadLevel(Level level) const {
  const ComponentParamRef param = LevelParam(level);
  if (!param) {
    return std::nullopt;
  }
  const std::optional<double> value = param->GetScalarAt(GetClipEditTime());
  if (!value || !std::isfinite(*value)) {
    return std::nullopt;
  }
  return value;
}

bool GroupLevelsBeginParameter::HasDivergentGroupChildren() const {
  const auto black = ReadLevel(Level::kInputBlack);
  const auto gray = ReadLevel(Level::kInputGray);
  const auto white = ReadLevel(Level::kInputWhite);
  if (!black || !gray || !white) {
    return false;
  }
  return *black > *gray || *gray > *white;
}

void GroupLevelsBeginParameter::CreateControlsSelf() {
  GroupBeginParameter::CreateControlsSelf();
  mInput = AdoptControl(std::make_shared<LevelsControl>(
      Rect{}, LevelsControl::Options{.withGray = true, .cookie = kInputCookie}, this));
  mOutput = AdoptControl(std::make_shared<LevelsControl>(
      Rect{}, LevelsControl::Options{.withGray = false, .cookie = kOutputCookie}, this));
  mInputLabel = AdoptControl(std::make_shared<Static>(
      Rect{}, "$$$/Vantile/Handlers/EffectControls/InputLevels=Input Levels:"));
  mOutputLabel = AdoptControl(std::make_shared<Static>(
      Rect{}, "$$$/Vantile/Handlers/EffectControls/OutputLevels=Output Levels:"));
  for (const auto& control : {mInput, mOutput}) {
    if (control) {
      AddListener(control->GetStation(), *this);
    }
  }
  for (std::size_t i = 0; i < kLevelCount; ++i) {
    auto field = AdoptControl(std::make_shared<HotFloatControl>(Rect{}, 0.0, this));
    if (!field) {
      continue;
    }
    field->SetOwnerCookie(static_cast<std::int32_t>(i));
    field->SetDigitsPastDecimal(0);
    field->SetMinValue(0.0);
    field->SetMaxValue(LevelsControl::kMaxLevel);
    if (const ComponentParamRef param = LevelParam(static_cast<Level>(i))) {
      field->SetMinValue(param->GetMinimum());
      field->SetMaxValue(param->GetMaximum());
      field->SetDigitsPastDecimal(param->GetPrecision());
    }
    AddListener(field->GetStation(), *this);
    mFields[i] = std::move(field);
  }
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      AddListener(row->GetParam()->GetStation(), *this);
    }
  }
}

void GroupLevelsBeginParameter::DestroyControlsSelf() {
  mActor.reset();
  mActorLevel.reset();
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      RemoveListener(row->GetParam()->GetStation(), *this);
    }
  }
  for (auto& field : mFields) {
    if (field) {
      RemoveListener(field->GetStation(), *this);
    }
    DestroyControl(field);
  }
  for (auto* control : {&mInput, &mOutput}) {
    if (*control) {
      RemoveListener((*control)->GetStation(), *this);
    }
    DestroyControl(*control);
  }
  DestroyControl(mInputLabel);
  DestroyControl(mOutputLabel);
  GroupBeginParameter::DestroyControlsSelf();
}

void GroupLevelsBeginParameter::Destroy() {
  // An open gesture ends with what it set, before the children it edits go.
  mActor.reset();
  mActorLevel.reset();
  GroupBeginParameter::Destroy();
}

int GroupLevelsBeginParameter::ControlsOffset() const {
  int offset = 0;
  const auto& children = GetItems();
  for (std::size_t i = 0; i < children.size() && i < kPlacedFirst; ++i) {
    if (!children[i]->IsSetAside()) {
      offset += children[i]->Height();
    }
  }
  return offset;
}

int GroupLevelsBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return kControlsHeight + (HasDivergentGroupChildren() ? 0 : ChildrenHeight());
}

void GroupLevelsBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupBeginParameter::PositionSelf(top, depth, width);
  const bool divergent = HasDivergentGroupChildren();
  int y = top;
  const auto& children = GetItems();
  if (!divergent) {
    for (std::size_t i = 0; i < children.size() && i < kPlacedFirst; ++i) {
      if (!children[i]->IsSetAside()) {
        children[i]->PositionSelf(y, depth + 1, width);
        y += IsExpanded() ? children[i]->Height() : 0;
      }
    }
  }
  const int indent = GetParameterIndentInPixels();
  const int fieldsLeft = width / 2 - 10 + indent;
  const int controlWidth = std::max(0, width - 20 - indent);
  if (mInputLabel) {
    PlaceView(*mInputLabel, Rect::FromSize(indent + 20, y + kInputTop, kLabelWidth, kLabelHeight));
  }
  if (mOutputLabel) {
    PlaceView(*mOutputLabel,
              Rect::FromSize(indent + 20, y + kOutputTop, kLabelWidth, kLabelHeight));
  }
  for (std::size_t i = 0; i < kLevelCount; ++i) {
    if (!mFields[i]) {
      continue;
    }
    const bool input = i < kPlacedFirst;
    const int column = static_cast<int>(input ? i : i - kPlacedFirst);
    PlaceView(*mFields[i],
              Rect::FromSize(fieldsLeft + column * kFieldStep, y + (input ? kInputTop : kOutputTop),
                             kFieldWidth, kFieldHeight));
  }
  if (mInput) {
    PlaceView(*mInput,
              Rect::FromSize(indent + 15, y + kInputControlTop, controlWidth, kControlHeight));
  }
  if (mOutput) {
    PlaceView(*mOutput,
              Rect::FromSize(indent + 15, y + kOutputControlTop, controlWidth, kControlHeight));
  }
  if (divergent) {
    return;
  }
  y += kControlsHeight;
  for (std::size_t i = kPlacedFirst; i < children.size(); ++i) {
    if (!children[i]->IsSetAside()) {
      children[i]->PositionSelf(y, depth + 1, width);
      y += IsExpanded() ? children[i]->Height() : 0;
    }
  }
}

void GroupLevelsBeginParameter::HideChildrenWhileDivergent() {
  if (!IsShown() || !IsExpanded()) {
    return;
  }
  const bool divergent = HasDivergentGroupChildren();
  for (const auto& child : GetItems()) {
    if (divergent) {
      child->Hide();
    } else if (!child->IsSetAside() && !child->IsShown()) {
      child->Show();
    }
  }
}

void GroupLevelsBeginParameter::Show() {
  GroupBeginParameter::Show();
  HideChildrenWhileDivergent();
}

void GroupLevelsBeginParameter::ShowControls(bool show) {
  GroupBeginParameter::ShowControls(show);
  const bool visible = show && IsExpanded();
  for (const auto& control : {mInput, mOutput}) {
    if (control) {
      control->SetVisible(visible);
    }
  }
  for (const auto& label : {mInputLabel, mOutputLabel}) {
    if (label) {
      label->SetVisible(visible);
    }
  }
  for (const auto& field : mFields) {
    if (field) {
      field->SetVisible(visible);
    }
  }
  if (visible) {
    SynchGroupToTime();
  }
}

void GroupLevelsBeginParameter::SetIsExpanded(bool expanded) {
  GroupBeginParameter::SetIsExpanded(expanded);
  if (!IsShown()) {
    ShowControls(false);
  }
  HideChildrenWhileDivergent();
}

void GroupLevelsBeginParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font,
                                          Color color) const {
  // Expanded, the controls take the group's band.
  if (!IsExpanded()) {
    GroupBeginParameter::DrawTitle(dc, rect, font, color);
  }
}

void GroupLevelsBeginParameter::SynchGroupToTime() {
  if (mWriting) {
    return;
  }
  std::array<double, kLevelCount> levels{0.0, LevelsControl::kMaxLevel / 2,
                                         LevelsControl::kMaxLevel, 0.0, LevelsControl::kMaxLevel};
  for (std::size_t i = 0; i < kLevelCount; ++i) {
    levels[i] = ReadLevel(static_cast<Level>(i)).value_or(levels[i]);
    if (mFields[i]) {
      mFields[i]->SetValue(levels[i]);
    }
  }
  if (mInput) {
    mInput->SetAllLevels(levels[0], levels[1], levels[2]);
  }
  if (mOutput) {
    mOutput->SetBlackAndWhiteLevels(levels[3], levels[4]);
  }
}

void GroupLevelsBeginParameter::OnParamChanged(const ComponentParamRef& param) {
  GroupBeginParameter::OnParamChanged(param);
  SynchGroupToTime();
  HideChildrenWhileDivergent();
}

void GroupLevelsBeginParameter::ListenToMessage(const Message& message) {
  using L = Level;
  if (const auto* m = message.As<LevelsControlBlackLevelChangingMessage>()) {
    return OnControlLevel(m->cookie, L::kInputBlack, L::kOutputBlack, m->level, false);
  }
  if (const auto* m = message.As<LevelsControlBlackLevelChangedMessage>()) {
    return OnControlLevel(m->cookie, L::kInputBlack, L::kOutputBlack, m->level, true);
  }
  if (const auto* m = message.As<LevelsControlGrayLevelChangingMessage>()) {
    return OnControlLevel(m->cookie, L::kInputGray, L::kInputGray, m->level, false);
  }
  if (const auto* m = message.As<LevelsControlGrayLevelChangedMessage>()) {
    return OnControlLevel(m->cookie, L::kInputGray, L::kInputGray, m->level, true);
  }
  if (const auto* m = message.As<LevelsControlWhiteLevelChangingMessage>()) {
    return OnControlLevel(m->cookie, L::kInputWhite, L::kOutputWhite, m->level, false);
  }
  if (const auto* m = message.As<LevelsControlWhiteLevelChangedMessage>()) {
    return OnControlLevel(m->cookie, L::kInputWhite, L::kOutputWhite, m->level, true);
  }
  if (const auto* m = message.As<HotFloatControlChangingMessage>()) {
    return OnFieldLevel(m->cookie, m->value, false);
  }
  if (const auto* m = message.As<HotFloatControlChangedMessage>()) {
    return OnFieldLevel(m->cookie, m->value, true);
  }
  GroupBeginParameter::ListenToMessage(message);
}

void GroupLevelsBeginParameter::OnControlLevel(std::int32_t cookie, Level inputLevel,
                                               Level outputLevel, double value, bool finished) {
  if (cookie == kInputCookie) {
    OnLevelChange(inputLevel, value, finished);
  } else if (cookie == kOutputCookie && outputLevel != Level::kInputGray) {
    OnLevelChange(outputLevel, value, finished);
  }
}

void GroupLevelsBeginParameter::OnFieldLevel(std::int32_t cookie, double value, bool finished) {
  if (cookie < 0 || static_cast<std::size_t>(cookie) >= kLevelCount) {
    return;
  }
  const auto level = static_cast<Level>(cookie);
  if (static_cast<std::size_t>(cookie) < kPlacedFirst) {
    if (!HOST_VERIFY(mInput, "InputLevelsControl has not been initialized")) {
      return;
    }
  } else if (!HOST_VERIFY(mOutput, "OutputLevelsControl has not been initialized")) {
    return;
  }
  OnLevelChange(level, value, finished);
}

void GroupLevelsBeginParameter::OnLevelChange(Level level, double value, bool finished) {
  if (IsReadOnly() || !std::isfinite(value)) {
    return;
  }
  const ComponentParamRef param = LevelParam(level);
  if (!param) {
    return;
  }
  if (mActor && mActorLevel != level) {
    mActor.reset();  // another level's gesture ends with what it set
  }
  if (!mActor) {
    mActor = std::make_unique<MultiComponentParamActor>(std::vector<ComponentParamRef>{param},
                                                        GetClipEditTime());
    mActorLevel = level;
  }
  mWriting = true;
  mActor->SetValue(0, ParamValue(std::clamp(value, param->GetMinimum(), param->GetMaximum())));
  if (finished) {
    if (mActor->IsValueSet()) {
      mActor->Commit();
    }
    mActor.reset();
    mActorLevel.reset();
  }
  mWriting = false;
  if (finished) {
    SynchGroupToTime();
    HideChildrenWhileDivergent();
    RedrawKeyframeView();
  }
}
