#include "Handlers/EffectControls/Src/GroupTonalRangeDefinitionBeginParameter.h"

#include <algorithm>
#include <utility>

#include "Handlers/EffectControls/Src/TonalRangeLimiter.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MultiComponentParamActor.h"
#include "Host/Rows/DoubleSliderParameter.h"

namespace {

constexpr std::size_t kChildCount = 4;
constexpr int kControlTop = 5;
constexpr int kControlHeight = 33;
constexpr int kAreaHeight = 38;

}  // namespace

GroupTonalRangeDefinitionBeginParameter::GroupTonalRangeDefinitionBeginParameter(
    const ParameterControlInfo& info)
    : GroupBeginParameter(info) {}

GroupTonalRangeDefinitionBeginParameter::~GroupTonalRangeDefinitionBeginParameter() = default;

int GroupTonalRangeDefinitionBeginParameter::LimiterHandle(Child child) {
  switch (child) {
    case Child::kShadowThreshold:
      return 2;
    case Child::kShadowSoftness:
      return 3;
    case Child::kHighlightThreshold:
      return 4;
    case Child::kHighlightSoftness:
      return 1;
  }
  return 0;
}

float GroupTonalRangeDefinitionBeginParameter::GetMinValue() const {
  return static_cast<float>(kMinimum);
}
float GroupTonalRangeDefinitionBeginParameter::GetMaxValue() const {
  return static_cast<float>(kMaximum);
}
float GroupTonalRangeDefinitionBeginParameter::GetShadowThreshold() const {
  return static_cast<float>(mControl ? mControl->GetValues().shadowThreshold : kMinimum);
}
float GroupTonalRangeDefinitionBeginParameter::GetHighlightThreshold() const {
  return static_cast<float>(mControl ? mControl->GetValues().highlightThreshold : kMaximum);
}

ComponentParamRef GroupTonalRangeDefinitionBeginParameter::ChildParam(Child child) const {
  const auto& children = GetItems();
  const auto index = static_cast<std::size_t>(child);
  if (index >= children.size()) {
    return nullptr;
  }
  const auto* row = dynamic_cast<const ParameterControl*>(children[index].get());
  return row != nullptr ? row->GetParam() : nullptr;
}

std::vector<ComponentParamRef> GroupTonalRangeDefinitionBeginParameter::AllParams() const {
  std::vector<ComponentParamRef> params;
  for (std::size_t i = 0; i < kChildCount; ++i) {
    ComponentParamRef param = ChildParam(static_cast<Child>(i));
    if (!param) {
      return {};
    }
    params.push_back(std::move(param));
  }
  return params;
}

void GroupTonalRangeDefinitionBeginParameter::CreateControlsSelf() {
  GroupBeginParameter::CreateControlsSelf();
  mControl =
      AdoptControl(std::make_shared<TonalRangeDefinitionControl>(Rect{}, kMinimum, kMaximum, this));
  if (mControl) {
    AddListener(mControl->GetStation(), *this);
  }
  mLimiter = std::make_shared<TonalRangeLimiter>(this);
  const auto& children = GetItems();
  for (std::size_t i = 0; i < children.size(); ++i) {
    auto* row = dynamic_cast<ParameterControl*>(children[i].get());
    if (row == nullptr) {
      continue;
    }
    if (i < kChildCount) {
      DoubleSliderParameter::RegisterLimiter(*row, LimiterHandle(static_cast<Child>(i)), mLimiter);
    }
    if (row->GetParam()) {
      AddListener(row->GetParam()->GetStation(), *this);
    }
  }
}

void GroupTonalRangeDefinitionBeginParameter::DestroyControlsSelf() {
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

void GroupTonalRangeDefinitionBeginParameter::Destroy() {
  mActor.reset();
  GroupBeginParameter::Destroy();
}

int GroupTonalRangeDefinitionBeginParameter::GetExpandedAreaHeight() const {
  return kAreaHeight - OwnHeight();
}

int GroupTonalRangeDefinitionBeginParameter::Height() const {
  if (!IsExpanded()) {
    return OwnHeight();
  }
  return kAreaHeight + ChildrenHeight();
}

void GroupTonalRangeDefinitionBeginParameter::PositionSelf(int top, int depth, int width) {
  GroupBeginParameter::PositionSelf(top, depth, width);
  if (mControl) {
    const int indent = GetParameterIndentInPixels();
    PlaceView(*mControl, Rect::FromSize(indent + 20, top + kControlTop,
                                        std::max(0, width - indent - 35), kControlHeight));
  }
}

void GroupTonalRangeDefinitionBeginParameter::ShowControls(bool show) {
  GroupBeginParameter::ShowControls(show);
  if (mControl) {
    mControl->SetVisible(show && IsExpanded());
  }
  SynchGroupToTime();
}

void GroupTonalRangeDefinitionBeginParameter::SetIsExpanded(bool expanded) {
  GroupBeginParameter::SetIsExpanded(expanded);
  if (!IsShown()) {
    ShowControls(false);
  }
}

void GroupTonalRangeDefinitionBeginParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font,
                                                        Color color) const {
  if (!IsExpanded()) {
    GroupBeginParameter::DrawTitle(dc, rect, font, color);
  }
}

void GroupTonalRangeDefinitionBeginParameter::SynchGroupToTime() {
  if (mWriting || !mControl) {
    return;
  }
  const TickTime time = GetClipEditTime();
  const auto read = [&](Child child, double fallback) {
    const ComponentParamRef param = ChildParam(child);
    return param ? param->GetScalarAt(time).value_or(fallback) : fallback;
  };
  // The limiter reads the control, so it follows the model even while the group is closed.
  mControl->SetValues({read(Child::kShadowThreshold, kMinimum), read(Child::kShadowSoftness, 0.0),
                       read(Child::kHighlightThreshold, kMaximum),
                       read(Child::kHighlightSoftness, 0.0)});
}

void GroupTonalRangeDefinitionBeginParameter::OnParamChanged(const ComponentParamRef& param) {
  GroupBeginParameter::OnParamChanged(param);
  SynchGroupToTime();
}

void GroupTonalRangeDefinitionBeginParameter::ListenToMessage(const Message& message) {
  using C = Child;
#define EC_TONAL_CASE(What, ...)                                                          \
  if (const auto* m = message.As<TonalRangeDefinitionControl##What##ChangingMessage>()) { \
    return OnRangeChange(*m, {__VA_ARGS__}, false);                                       \
  }                                                                                       \
  if (const auto* m = message.As<TonalRangeDefinitionControl##What##ChangedMessage>()) {  \
    return OnRangeChange(*m, {__VA_ARGS__}, true);                                        \
  }
  EC_TONAL_CASE(ShadowThreshold, C::kShadowThreshold)
  EC_TONAL_CASE(ShadowSoftness, C::kShadowSoftness)
  EC_TONAL_CASE(ShadowThresholdAndSoftness, C::kShadowThreshold, C::kShadowSoftness)
  EC_TONAL_CASE(HighlightThreshold, C::kHighlightThreshold)
  EC_TONAL_CASE(HighlightSoftness, C::kHighlightSoftness)
  EC_TONAL_CASE(HighlightThresholdAndSoftness, C::kHighlightThreshold, C::kHighlightSoftness)
  EC_TONAL_CASE(ShadowAndHighlightThreshold, C::kShadowThreshold, C::kHighlightThreshold)
  EC_TONAL_CASE(HighlightAndShadowThreshold, C::kHighlightThreshold, C::kShadowThreshold)
  EC_TONAL_CASE(ShadowAndHighlightThresholdAndShadowSoftness, C::kShadowThreshold,
                C::kHighlightThreshold, C::kShadowSoftness)
  EC_TONAL_CASE(ShadowAndHighlightThresholdAndHighlightSoftness, C::kShadowThreshold,
                C::kHighlightThreshold, C::kHighlightSoftness)
#undef EC_TONAL_CASE
  GroupBeginParameter::ListenToMessage(message);
}

void GroupTonalRangeDefinitionBeginParameter::OnRangeChange(
    const TonalRangeDefinitionValues& values, std::vector<Child> named, bool finished) {
  if (IsReadOnly()) {
    return;
  }
  const auto valueOf = [&](Child child) {
    switch (child) {
      case Child::kShadowThreshold:
        return values.shadowThreshold;
      case Child::kShadowSoftness:
        return values.shadowSoftness;
      case Child::kHighlightThreshold:
        return values.highlightThreshold;
      case Child::kHighlightSoftness:
        return values.highlightSoftness;
    }
    return 0.0;
  };
  if (!mActor) {
    std::vector<ComponentParamRef> params = AllParams();
    if (params.empty()) {
      return;
    }
    // All four: a drag that pushes a second value along stays one step.
    mActor = std::make_unique<MultiComponentParamActor>(std::move(params), GetClipEditTime());
  }
  mWriting = true;
  for (const Child child : named) {
    mActor->SetValue(static_cast<std::size_t>(child), ParamValue(valueOf(child)));
  }
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
