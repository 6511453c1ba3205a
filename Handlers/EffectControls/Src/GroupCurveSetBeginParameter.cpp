#include "Handlers/EffectControls/Src/GroupCurveSetBeginParameter.h"

#include <algorithm>
#include <climits>
#include <cmath>
#include <utility>

#include "Host/Messaging/Station.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MultiComponentParamActor.h"

namespace {

constexpr int kUnusedLevel = -1;

}  // namespace

GroupCurveSetBeginParameter::GroupCurveSetBeginParameter(const ParameterControlInfo& info,
                                                         std::vector<CurveLook> curves)
    : GroupBeginParameter(info), mLooks(std::move(curves)) {}

GroupCurveSetBeginParameter::~GroupCurveSetBeginParameter() = default;

int GroupCurveSetBeginParameter::ToLevel(double value) {
  if (!std::isfinite(value)) {
    return 0;
  }
  return static_cast<int>(std::trunc(std::clamp(value, double{INT_MIN}, double{INT_MAX})));
}

int GroupCurveSetBeginParameter::GetCurveSide() const {
  return std::max(0, (GetWidth() - 55) / 2);
}

int GroupCurveSetBeginParameter::GetExpandedAreaHeight() const {
  return std::max(0, GetChildrenOffset() - OwnHeight());
}

std::vector<ComponentParamRef> GroupCurveSetBeginParameter::CurveParams(std::size_t index) const {
  std::vector<ComponentParamRef> params;
  const auto& children = GetItems();
  for (std::size_t i = index * kParamsPerCurve;
       i < children.size() && params.size() < kParamsPerCurve; ++i) {
    const auto* row = dynamic_cast<const ParameterControl*>(children[i].get());
    if (row == nullptr || !row->GetParam()) {
      return {};
    }
    params.push_back(row->GetParam());
  }
  if (params.size() != kParamsPerCurve) {
    return {};
  }
  return params;
}

CurvePointList GroupCurveSetBeginParameter::ReadCurvePoints(std::size_t index) const {
  CurvePointList points;
  const TickTime time = GetClipEditTime();
  const std::vector<ComponentParamRef> params = CurveParams(index);
  for (std::size_t i = 0; i + 1 < params.size(); i += 2) {
    const int x = ToLevel(params[i]->GetScalarAt(time).value_or(kUnusedLevel));
    const int y = ToLevel(params[i + 1]->GetScalarAt(time).value_or(kUnusedLevel));
    if (x >= 0) {
      points.push_back({x, y});
    }
  }
  return points;
}

std::vector<ParamValue> GroupCurveSetBeginParameter::ToParamValues(const CurvePointList& points) {
  std::vector<ParamValue> values;
  values.reserve(kParamsPerCurve);
  for (std::size_t i = 0; i < kParamsPerCurve / 2; ++i) {
    const CurvePoint p = i < points.size() ? points[i] : CurvePoint{kUnusedLevel, kUnusedLevel};
    values.emplace_back(static_cast<double>(p.x));
    values.emplace_back(static_cast<double>(p.y));
  }
  return values;
}

void GroupCurveSetBeginParameter::CreateControlsSelf() {
  GroupBeginParameter::CreateControlsSelf();
  for (std::size_t i = 0; i < mLooks.size(); ++i) {
    auto curve = AdoptControl(std::make_shared<CurveControl>(
        Rect{},
        CurveControl::Options{.label = mLooks[i].label,
                              .curveColor = mLooks[i].color,
                              .cookie = static_cast<std::int32_t>(i)},
        this));
    if (!curve) {
      continue;
    }
    AddListener(curve->GetStation(), *this);
    mCurves.push_back(std::move(curve));
  }
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      AddListener(row->GetParam()->GetStation(), *this);
    }
  }
}

void GroupCurveSetBeginParameter::DestroyControlsSelf() {
  mActor.reset();
  for (auto& curve : mCurves) {
    RemoveListener(curve->GetStation(), *this);
    DestroyControl(curve);
  }
  mCurves.clear();
  for (const auto& child : GetItems()) {
    if (const auto* row = dynamic_cast<const ParameterControl*>(child.get());
        row != nullptr && row->GetParam()) {
      RemoveListener(row->GetParam()->GetStation(), *this);
    }
  }
  GroupBeginParameter::DestroyControlsSelf();
}

void GroupCurveSetBeginParameter::Destroy() {
  // An open gesture ends with what it set, before the children it edits go.
  mActor.reset();
  mActorCurve.reset();
  GroupBeginParameter::Destroy();
}

bool GroupCurveSetBeginParameter::IsShowingCurves() const {
  return IsShown() && IsExpanded();
}

void GroupCurveSetBeginParameter::ShowControls(bool show) {
  GroupBeginParameter::ShowControls(show);
  for (const auto& curve : mCurves) {
    curve->SetVisible(show && IsExpanded());
  }
  if (show && IsExpanded()) {
    SynchGroupToTime();
  }
}

void GroupCurveSetBeginParameter::SetIsExpanded(bool expanded) {
  GroupBeginParameter::SetIsExpanded(expanded);
  if (!IsShown()) {
    ShowControls(false);
  }
}

void GroupCurveSetBeginParameter::DrawTitle(DC& dc, const Rect& rect, const Font& font,
                                            Color color) const {
  if (!IsExpanded()) {
    GroupBeginParameter::DrawTitle(dc, rect, font, color);
  }
}

void GroupCurveSetBeginParameter::SynchGroupToTime() {
  if (mWriting || !IsShowingCurves()) {
    return;
  }
  for (std::size_t i = 0; i < mLooks.size(); ++i) {
    mCurves[i]->SetCurvePointList(ReadCurvePoints(i));
  }
}

void GroupCurveSetBeginParameter::OnParamChanged(const ComponentParamRef& param) {
  GroupBeginParameter::OnParamChanged(param);
  SynchGroupToTime();
}

void GroupCurveSetBeginParameter::ListenToMessage(const Message& message) {
  if (const auto* changing = message.As<CurveChangingMessage>()) {
    OnCurveChange(changing->cookie, false);
    return;
  }
  if (const auto* changed = message.As<CurveChangedMessage>()) {
    OnCurveChange(changed->cookie, true);
    return;
  }
  GroupBeginParameter::ListenToMessage(message);
}

void GroupCurveSetBeginParameter::OnCurveChange(std::int32_t cookie, bool finished) {
  if (cookie < 0 || static_cast<std::size_t>(cookie) >= mCurves.size() || IsReadOnly()) {
    return;
  }
  const auto index = static_cast<std::size_t>(cookie);
  const std::vector<ComponentParamRef> params = CurveParams(index);
  if (params.empty()) {
    return;
  }
  if (mActor && mActorCurve != index) {
    mActor.reset();  // another curve's gesture ends with what it set
  }
  if (!mActor) {
    mActor = std::make_unique<MultiComponentParamActor>(params, GetClipEditTime());
    mActorCurve = index;
  }
  mWriting = true;
  mActor->SetValues(ToParamValues(mCurves[index]->GetCurvePointList()));
  if (finished) {
    if (mActor->IsValueSet()) {
      mActor->Commit();
    }
    mActor.reset();
    mActorCurve.reset();
  }
  mWriting = false;
  if (finished) {
    SynchGroupToTime();
    RedrawKeyframeView();
  }
}
