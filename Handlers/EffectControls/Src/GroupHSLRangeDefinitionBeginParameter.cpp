#include "Handlers/EffectControls/Src/GroupHSLRangeDefinitionBeginParameter.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MultiComponentParamActor.h"
#include "Host/Rows/DoubleSliderParameter.h"
#include "Host/Rows/Limiter.h"

GroupHSLRangeDefinitionBeginParameter::GroupHSLRangeDefinitionBeginParameter(
    const ParameterControlInfo& info, Range range)
    : GroupBeginParameter(info), mRange(range) {}

GroupHSLRangeDefinitionBeginParameter::~GroupHSLRangeDefinitionBeginParameter() = default;

float GroupHSLRangeDefinitionBeginParameter::GetMinValue() const {
  return static_cast<float>(mRange.minimum);
}
float GroupHSLRangeDefinitionBeginParameter::GetMaxValue() const {
  return static_cast<float>(mRange.maximum);
}
float GroupHSLRangeDefinitionBeginParameter::GetStartThreshold() const {
  return mControl ? static_cast<float>(mControl->GetValues().startThreshold) : 0.0f;
}
float GroupHSLRangeDefinitionBeginParameter::GetStartSoftness() const {
  return mControl ? static_cast<float>(mControl->GetValues().startSoftness) : 0.0f;
}
float GroupHSLRangeDefinitionBeginParameter::GetEndThreshold() const {
  return mControl ? static_cast<float>(mControl->GetValues().endThreshold) : 0.0f;
}
float GroupHSLRangeDefinitionBeginParameter::GetEndSoftness() const {
  return mControl ? static_cast<float>(mControl->GetValues().endSoftness) : 0.0f;
}

ComponentParamRef GroupHSLRangeDefinitionBeginParameter::ChildParam(Child child) const {
  const auto& children = GetItems();
  const auto index = static_cast<std::size_t>(child);
  if (index >= children.size()) {
    return nullptr;
  }
  const auto* row = dynamic_cast<const ParameterControl*>(children[index].get());
  return row != nullptr ? row->GetParam() : nullptr;
}

void GroupHSLRangeDefinitionBeginParameter::CreateControlsSelf() {
  GroupBeginParameter::CreateControlsSelf();
  mControl = AdoptControl(
      std::make_shared<HSLRangeDefinitionControl>(Rect{}, mRange.minimum, mRange.maximum, this));
  if (mControl) {
    AddListener(mControl->GetStation(), *this);
  }
  mLimiter = MakeLimiter();
  const int f = mRange.firstHandle;
  const int handles[] = {0, f + 1, f, f + 3, f + 2};  // by child; the first child has none
  const auto& children = GetItems();
  for (std::size_t i = 0; i < children.size(); ++i) {
    auto* row = dynamic_cast<ParameterControl*>(children[i].get());
    if (row == nullptr) {
      continue;
    }
    row->SetControlID(kFirstControlID + static_cast<int>(i));
    if (i == 0) {
      // Not placed by this group: left shown it would sit wherever it was last put.
      row->SetAside(true);
    } else if (i < std::size(handles)) {
      DoubleSliderParameter::RegisterLimiter(*row, handles[i], mLimiter);
    }
    if (row->GetParam()) {
      AddListener(row->GetParam()->GetStation(), *this);
    }
  }
}

void GroupHSLRangeDefinitionBeginParameter::DestroyControlsSelf() {
  mActor.reset();
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      RemoveListener(row->GetParam()->GetStation(), *this);
    }
  }
  // The rows hold the limiter weakly; it goes before the control it reads.
  mLimiter.reset();
  if (mControl) {
    RemoveListener(mControl->GetStation(), *this);
  }
  DestroyControl(mControl);
  GroupBeginParameter::DestroyControlsSelf();
}

void GroupHSLRangeDefinitionBeginParameter::Destroy() {
  mActor.reset();
  GroupBeginParameter::Destroy();
}

int GroupHSLRangeDefinitionBeginParameter::GetExpandedAreaHeight() const {
  return 38 - OwnHeight();
}

int GroupHSLRangeDefinitionBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return 38 + ChildrenHeight();
}

void GroupHSLRangeDefinitionBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupBeginParameter::PositionSelf(top, depth, width);
  if (mControl) {
    const int indent = GetParameterIndentInPixels();
    PlaceView(*mControl,
              Rect::FromSize(indent + 20, top + 5, std::max(0, width - indent - 35), 33));
  }
}

void GroupHSLRangeDefinitionBeginParameter::ShowControls(bool show) {
  GroupBeginParameter::ShowControls(show);
  if (mControl) {
    mControl->SetVisible(show && IsExpanded());
  }
  SynchGroupToTime();
}

void GroupHSLRangeDefinitionBeginParameter::SetIsExpanded(bool expanded) {
  GroupBeginParameter::SetIsExpanded(expanded);
  if (!IsShown()) {
    ShowControls(false);
  }
}

void GroupHSLRangeDefinitionBeginParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font,
                                                      Color color) const {
  if (!IsExpanded()) {
    GroupBeginParameter::DrawTitle(dc, rect, font, color);
  }
}

void GroupHSLRangeDefinitionBeginParameter::SynchGroupToTime() {
  if (mWriting || !mControl) {
    return;
  }
  const TickTime time = GetClipEditTime();
  const auto read = [&](Child child, double fallback) {
    const ComponentParamRef param = ChildParam(child);
    return param ? param->GetScalarAt(time).value_or(fallback) : fallback;
  };
  // The limiter reads the control, so it follows the model even while the group is closed.
  mControl->SetValues({read(Child::kStartSoftness, mRange.minimum),
                       read(Child::kStartThreshold, mRange.minimum),
                       read(Child::kEndThreshold, mRange.maximum), read(Child::kEndSoftness, 0.0)});
}

void GroupHSLRangeDefinitionBeginParameter::OnParamChanged(const ComponentParamRef& param) {
  GroupBeginParameter::OnParamChanged(param);
  SynchGroupToTime();
}

void GroupHSLRangeDefinitionBeginParameter::ListenToMessage(const Message& message) {
  using C = Child;
  if (const auto* m = message.As<HSLRangeDefinitionControlStartThresholdChangingQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartThreshold}, false);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlStartThresholdChangedQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartThreshold}, true);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlStartSoftnessChangingQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartSoftness}, false);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlStartSoftnessChangedQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartSoftness}, true);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlEndThresholdChangingQuickMessage>()) {
    return OnRangeChange(*m, {C::kEndThreshold}, false);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlEndThresholdChangedQuickMessage>()) {
    return OnRangeChange(*m, {C::kEndThreshold}, true);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlEndSoftnessChangingQuickMessage>()) {
    return OnRangeChange(*m, {C::kEndSoftness}, false);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlEndSoftnessChangedQuickMessage>()) {
    return OnRangeChange(*m, {C::kEndSoftness}, true);
  }
  if (const auto* m =
          message.As<HSLRangeDefinitionControlStartEndThresholdChangingQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartThreshold, C::kEndThreshold}, false);
  }
  if (const auto* m = message.As<HSLRangeDefinitionControlStartEndThresholdChangedQuickMessage>()) {
    return OnRangeChange(*m, {C::kStartThreshold, C::kEndThreshold}, true);
  }
  GroupBeginParameter::ListenToMessage(message);
}

void GroupHSLRangeDefinitionBeginParameter::OnRangeChange(const HSLRangeDefinitionValues& values,
                                                          std::vector<Child> moved, bool finished) {
  if (IsReadOnly()) {
    return;
  }
  const auto valueOf = [&](Child child) {
    switch (child) {
      case Child::kStartThreshold:
        return values.startThreshold;
      case Child::kStartSoftness:
        return values.startSoftness;
      case Child::kEndThreshold:
        return values.endThreshold;
      case Child::kEndSoftness:
        return values.endSoftness;
    }
    return 0.0;
  };
  std::vector<ComponentParamRef> params;
  std::vector<ParamValue> writes;
  for (const Child child : moved) {
    ComponentParamRef param = ChildParam(child);
    if (!param) {
      return;
    }
    params.push_back(std::move(param));
    writes.emplace_back(valueOf(child));
  }
  if (mActor && mActor->GetSize() != params.size()) {
    mActor.reset();  // a gesture of another kind ends with what it set
  }
  if (!mActor) {
    mActor = std::make_unique<MultiComponentParamActor>(std::move(params), GetClipEditTime());
  }
  mWriting = true;
  mActor->SetValues(writes);
  if (finished) {
    if (mActor->IsValueSet()) {
      mActor->Commit();
    }
    mActor.reset();
  }
  mWriting = false;
  if (finished) {
    SynchGroupToTime();
    RedrawKeyframeView();
  }
}
