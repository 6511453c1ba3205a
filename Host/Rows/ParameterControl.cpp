#include "Host/Rows/ParameterControl.h"

#include <algorithm>
#include <utility>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/ComponentParamActor.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/DC.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/MultiPictureButton.h"

namespace {

// Keyframe x positions are limited so that far-off times never overflow the drawing.
constexpr std::int64_t kMaxKeyframeX = 65536;

std::shared_ptr<const ImageList>& KeyframeImages() {
  static std::shared_ptr<const ImageList> images;
  return images;
}

ParameterControl::GraphViewerFactory& GraphFactory() {
  static ParameterControl::GraphViewerFactory factory;
  return factory;
}

enum KeyframeGlyphKind { kLinear, kBezier, kAutoBezier, kHold, kEaseIn, kEaseOut };

KeyframeGlyphKind GlyphKind(const Keyframe& key) {
  switch (key.interpolation) {
    case TemporalInterpolation::Hold:
      return kHold;
    case TemporalInterpolation::Linear:
      return kLinear;
    case TemporalInterpolation::AutoBezier:
      return kAutoBezier;
    case TemporalInterpolation::Bezier:
    case TemporalInterpolation::ContinuousBezier:
      break;
  }
  // A curved keyframe that stops on one side only reads as an ease on that side.
  if (key.inSpeed == 0.0 && key.outSpeed != 0.0) {
    return kEaseIn;
  }
  if (key.outSpeed == 0.0 && key.inSpeed != 0.0) {
    return kEaseOut;
  }
  return kBezier;
}

std::int64_t PixelOf(TickTime time, TickTime origin, const FrameRate& rate) {
  return std::clamp(ToFrame(SubtractTimes(time, origin), rate), -kMaxKeyframeX, kMaxKeyframeX);
}

}  // namespace

ParameterControl::ParameterControl(const ParameterControlInfo& info)
    : EffectItem(info.parentView,
                 !info.name.empty() ? info.name
                 : info.param       ? info.param->GetDisplayName()
                                    : std::string(),
                 info.station),
      Commander(info.parentView),
      mSequence(info.sequence),
      mComponent(info.component),
      mParam(info.param),
      mTrackItem(info.trackItem),
      mPlayerStation(info.playerStation),
      mEditTime(info.editTime),
      mReadOnly(info.readOnly) {
  HOST_ASSERT(mParam != nullptr, "Invalid ComponentParam");
  if (mPlayerStation.empty() && mSequence) {
    mPlayerStation = mSequence->GetPlayerStation();
  }
}

ParameterControl::~ParameterControl() {
  // An open edit commits as it ends; the messages it sends must not reach this half-destroyed
  // row.
  RemoveListenerFromAllStations(*this);
  mActor.reset();
  DestroyControl(mStopwatch);
}

void ParameterControl::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<ParamChangedMessage>()) {
    OnParamChanged(changed->param);
    return;
  }
  if (const auto* stopped = message.As<PlayerIsStoppedMessage>()) {
    if (!stopped->sequence || stopped->sequence == mSequence) {
      OnPlayerIsStopped();
    }
    return;
  }
  EffectItem::ListenToMessage(message);
}

void ParameterControl::FinishCreateSelf() {
  if (IsCreated() || IsDestroyed()) {
    return;
  }
  EffectItem::FinishCreateSelf();
  if (CanTimeVary()) {
    mStopwatch = AdoptControl(std::make_shared<MultiPictureButton>(
        Rect::FromSize(0, 0, kStopwatchSize, kStopwatchSize), kToggleTimeVaryingCommand,
        std::initializer_list<Decal>{kStopwatchOffDecal, kStopwatchOnDecal}, this));
    if (mStopwatch) {
      mStopwatch->SetTakesFocusOnClick(false);
      mStopwatch->SetToolTip("$$$/Vantile/Host/Rows/ToggleAnimation=Toggle animation");
    }
  }
  UpdateStopwatch();
  ListenToBinding();
  CreateControlsSelf();
  UpdateControlsEnabled(IsParamEnabled() && !IsReadOnly());
  RefreshSliderParameters();
  SynchToCurrentTime();
  mLastSynchTime = GetEditTime();
}

void ParameterControl::CommitPendingInput() {
  EffectItem::CommitPendingInput();
  ViewBase* parent = GetParentView();
  if (parent == nullptr) {
    return;
  }
  // A copy: applying a value may change the list's children.
  const std::vector<std::shared_ptr<ViewBase>> children = parent->GetChildren();
  for (const std::shared_ptr<ViewBase>& child : children) {
    if (child->GetSuperCommander() == this) {
      child->CommitPendingInput();
    }
  }
}

void ParameterControl::Destroy() {
  if (IsDestroyed()) {
    return;
  }
  CommitPendingInput();
  ReleaseParamActor();
  StopListeningToBinding();
  DestroyControl(mStopwatch);
  DestroyControlsSelf();
  EffectItem::Destroy();
}

bool ParameterControl::IsParamEnabled() const {
  return mParam && mParam->IsEnabled();
}

bool ParameterControl::CanTimeVary() const {
  return mParam && mParam->CanVaryOverTime();
}

int ParameterControl::GetExpandedAreaHeight() const {
  const int graphs = HasGraphs() ? mValueGraphHeight + 1 + mVelocityGraphHeight : 0;
  return std::max(GetControlAreaHeight(), graphs);
}

void ParameterControl::PositionSelf(int top, int depth, int width) {
  EffectItem::PositionSelf(top, depth, width);
  if (mStopwatch) {
    PlaceView(*mStopwatch, Rect::FromSize(GetGroupLevelIndentInPixels() + kStopwatchOffset, top + 2,
                                          kStopwatchSize, kStopwatchSize));
  }
}

void ParameterControl::GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const {
  if (!mParam) {
    return;
  }
  for (const TickTime time : mParam->GetKeyframeTimes()) {
    times.insert(line == TimeLine::kSequence ? ClipTimeToSequenceTime(ClipTime(time)).Ticks()
                                             : time);
  }
}

int ParameterControl::GetControlsLeft() const {
  return GetParameterIndentInPixels() + GetWidth() / 2 - 20;
}

bool ParameterControl::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command == kToggleTimeVaryingCommand) {
    status.enabled = CanTimeVary() && !IsReadOnly();
    status.checked = IsTimeVarying();
    return true;
  }
  return false;
}

bool ParameterControl::ObeyCommand(CommandID command) {
  if (command == kToggleTimeVaryingCommand) {
    if (CanTimeVary() && !IsReadOnly()) {
      SetTimeVarying(!IsTimeVarying());
    }
    // The button shows the model's state, whatever its click advanced it to.
    UpdateStopwatch();
    return true;
  }
  return false;
}

void ParameterControl::UpdateParamBinding(const SequenceRef& sequence,
                                          const ComponentRef& component,
                                          const ComponentParamRef& param,
                                          const TrackItemRef& trackItem,
                                          const StationName& playerStation) {
  ReleaseParamActor();
  StopListeningToBinding();
  mSequence = sequence;
  mComponent = component;
  mParam = param;
  mTrackItem = trackItem;
  mPlayerStation = playerStation;
  if (mPlayerStation.empty() && mSequence) {
    mPlayerStation = mSequence->GetPlayerStation();
  }
  if (!IsCreated() || IsDestroyed()) {
    return;
  }
  ListenToBinding();
  BindGraphViewers();
  RefreshDisplayName();
  UpdateStopwatch();
  UpdateControlsEnabled(IsParamEnabled() && !IsReadOnly());
  RefreshSliderParameters();
  SynchToCurrentTime();
}

bool ParameterControl::IsParamVisible() const {
  return mParam && mParam->IsVisible();
}

bool ParameterControl::IsReadOnly() const {
  return mReadOnly || !mParam || mParam->IsReadOnly() || (mSequence && mSequence->IsReadOnly());
}

TickTime ParameterControl::GetEditTime() const {
  if (mEditTime) {
    return *mEditTime;
  }
  return mSequence ? mSequence->GetCurrentTime() : kTime_Zero;
}

ParamValue ParameterControl::GetValueAtEditTime() const {
  return mParam ? mParam->GetValueAt(GetClipEditTime()) : ParamValue(0.0);
}

ClipTime ParameterControl::SequenceTimeToClipTime(SequenceTime sequenceTime) const {
  return mTrackItem ? mTrackItem->SequenceTimeToClipTime(sequenceTime)
                    : ClipTime(sequenceTime.Ticks());
}

SequenceTime ParameterControl::ClipTimeToSequenceTime(ClipTime clipTime) const {
  return mTrackItem ? mTrackItem->ClipTimeToSequenceTime(clipTime) : SequenceTime(clipTime.Ticks());
}

void ParameterControl::RefreshDisplayName() {
  if (mParam) {
    SetName(mParam->GetDisplayName());
  }
}

void ParameterControl::OnParamChanged(const ComponentParamRef& param) {
  if (!param || param != mParam || IsDestroyed()) {
    return;
  }
  UpdateStopwatch();
  UpdateControlsEnabled(IsParamEnabled() && !IsReadOnly());
  SynchToCurrentTime();
  // A parameter the effect hides or shows changes the list's layout.
  if (UpdateSetAside() && !GetStation().empty()) {
    BroadcastMessage(GetStation(), EffectControlsDisclosureStateChanged());
  }
}

void ParameterControl::OnPlayerPositionChanged(TickTime /*sequenceTime*/) {
  if (!IsDestroyed()) {
    SynchToCurrentTime();
  }
}

void ParameterControl::OnPlayerIsStopped() {
  ReleaseParamActor();
}

void ParameterControl::RedrawKeyframeView() {
  if (!GetStation().empty()) {
    BroadcastMessage(GetStation(), ParameterControlChangedMessage(mParam));
  }
}

void ParameterControl::UpdateCurrentVelocity() {
  mCurrentVelocity = mParam && mParam->IsTimeVarying()
                         ? mParam->GetKeyframes().VelocityAt(GetClipEditTime())
                         : 0.0;
}

bool ParameterControl::SynchParamActor() {
  if (mActor) {
    return true;
  }
  if (IsReadOnly() || IsDestroyed()) {
    return false;
  }
  mActor = std::make_unique<ComponentParamActor>(mParam, GetClipEditTime());
  return true;
}

void ParameterControl::ReleaseParamActor() {
  // reset() clears the member before the actor commits, so the messages of that commit see no
  // open edit.
  mActor.reset();
}

bool ParameterControl::SetEditValue(const ParamValue& value) {
  if (!SynchParamActor()) {
    return false;
  }
  return mActor->SetValue(value);
}

bool ParameterControl::CommitEdit() {
  if (!mActor || !mActor->IsValueSet() || mActor->IsCommitted()) {
    return false;
  }
  return mActor->Commit();
}

bool ParameterControl::ApplyValue(const ParamValue& value) {
  if (!SynchParamActor()) {
    return false;
  }
  bool done = mActor->SetValue(value);
  if (done) {
    done = CommitEdit();
  }
  ReleaseParamActor();
  RedrawKeyframeView();
  return done;
}

bool ParameterControl::IsTimeVarying() const {
  return mParam && mParam->IsTimeVarying();
}

void ParameterControl::SetTimeVarying(bool timeVarying) {
  if (!CanTimeVary() || IsReadOnly()) {
    return;
  }
  ReleaseParamActor();
  ComponentParamActions::SetTimeVarying(mParam, timeVarying, GetClipEditTime());
  UpdateStopwatch();
  RedrawKeyframeView();
}

void ParameterControl::SetKeyframeViewer(EffectControlsKeyframeViewHSLBase* viewer, bool flag) {
  mKeyframeViewer = viewer;
  mKeyframeViewerFlag = flag;
}

void ParameterControl::DrawKeyframes(DC& dc, const Rect& rowRect, TickTime visibleStart,
                                     const FrameRate& pixelRate,
                                     const std::set<TickTime>& selectedClipTimes) {
  if (!mParam || !mParam->HasKeyframes()) {
    return;
  }
  const std::shared_ptr<const ImageList> images = GetKeyframeImageList();
  const Rect clip = dc.GetClipBox();
  const std::vector<Keyframe>& keys = mParam->GetKeyframes().Keyframes();
  const int glyphTop = rowRect.top + kKeyframeStripHeight / 2 - 8;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    const std::int64_t x =
        rowRect.left +
        PixelOf(ClipTimeToSequenceTime(ClipTime(keys[i].time)).Ticks(), visibleStart, pixelRate);
    if (x + 16 < clip.left || x - 16 > clip.right) {
      continue;
    }
    const bool selected = selectedClipTimes.count(keys[i].time) != 0;
    images->Draw(dc, GetKeyframeImageIndex(*mParam, i, selected),
                 {static_cast<int>(x) - 7, glyphTop});
  }
}

bool ParameterControl::HitKeyframe(Point point, TickTime originTime, const FrameRate& timeScale,
                                   TickTime& hitTime) const {
  if (!mParam) {
    return false;
  }
  const KeyframeCurve& curve = mParam->GetKeyframes();
  const std::vector<Keyframe>& keys = curve.Keyframes();
  // Keyframes left of the tolerance are skipped by a binary search on the earliest time whose
  // pixel could be in reach; one step back covers the rounding of the two conversions.
  std::size_t index = 0;
  const TickTime frame = timeScale.GetTicksPerFrame();
  const std::int64_t firstPixel = static_cast<std::int64_t>(point.x) - kKeyframeHitTolerance + 1;
  if (frame > 0 && firstPixel > -kMaxKeyframeX && firstPixel < kMaxKeyframeX) {
    const double offset = static_cast<double>(firstPixel) * static_cast<double>(frame);
    const TickTime firstTime = AddTimes(originTime, SecondsToTicks(offset / kTicksPerSecond));
    const TickTime firstClipTime = SequenceTimeToClipTime(SequenceTime(firstTime)).Ticks();
    index = curve.FindAtOrAfter(firstClipTime).value_or(keys.size());
    index = index > 0 ? index - 1 : 0;
  }
  for (; index < keys.size(); ++index) {
    const TickTime time = ClipTimeToSequenceTime(ClipTime(keys[index].time)).Ticks();
    const std::int64_t x = PixelOf(time, originTime, timeScale);
    if (x >= point.x + kKeyframeHitTolerance) {
      break;
    }
    if (point.x < x + kKeyframeHitTolerance && time >= 0) {
      hitTime = time;
      return true;
    }
  }
  return false;
}

int ParameterControl::GetKeyframeImageIndex(const ComponentParam& param, std::size_t keyframeIndex,
                                            bool selected) {
  const KeyframeCurve& curve = param.GetKeyframes();
  if (keyframeIndex >= curve.Size()) {
    return 0;
  }
  const std::size_t count = curve.Size();
  if (param.GetType() == ParamType::TimeRemapping) {
    // Speed keyframes: halves at the ends (left half for the last, right half for the first),
    // with their own pictures for holds.
    const bool hold = curve.At(keyframeIndex).interpolation == TemporalInterpolation::Hold;
    const bool first = count > 1 && keyframeIndex == 0;
    const bool last = count > 1 && keyframeIndex == count - 1;
    int base = kEffectControlsKeyTRDualControlPointNormalDecal;
    if (hold) {
      base = first  ? kEffectControlsKeyTRDualHoldRightNormalDecal
             : last ? kEffectControlsKeyTRDualHoldLeftNormalDecal
                    : kEffectControlsKeyTRHoldControlPointNormalDecal;
    } else if (first) {
      base = kEffectControlsKeyTRRightControlPointNormalDecal;
    } else if (last) {
      base = kEffectControlsKeyTRLeftControlPointNormalDecal;
    }
    return base - kFirstKeyframeDecal + (selected ? 1 : 0);
  }
  int variant = 0;
  if (count > 1 && keyframeIndex == 0) {
    variant = 1;  // nothing before it: the glyph's right half
  } else if (count > 1 && keyframeIndex == count - 1) {
    variant = 2;
  }
  if (selected) {
    variant += 3;
  }
  return kKeyframeDecalVariants * GlyphKind(curve.At(keyframeIndex)) + variant;
}

void ParameterControl::SetKeyframeImageList(std::shared_ptr<const ImageList> images) {
  KeyframeImages() = std::move(images);
}

std::shared_ptr<const ImageList> ParameterControl::GetKeyframeImageList() {
  std::shared_ptr<const ImageList>& images = KeyframeImages();
  if (!images) {
    auto standard = std::make_shared<ImageList>();
    for (int decal = kEffectControlsKeyLinearNormalDecal;
         decal <= kEffectControlsKeyTRDualHoldLeftSelectedDecal; ++decal) {
      standard->Add(static_cast<Decal>(decal));
    }
    images = std::move(standard);
  }
  return images;
}

bool ParameterControl::HasGraphs() const {
  return mParam && CanExpand() && CanTimeVary() && mParam->GetValueKind() == ParamValueKind::Double;
}

void ParameterControl::SetValueGraphHeight(int height) {
  mValueGraphHeight = std::max(height, GetValueGraphMinimumHeight());
}

void ParameterControl::SetVelocityGraphHeight(int height) {
  mVelocityGraphHeight = std::max(height, GetVelocityGraphMinimumHeight());
}

Rect ParameterControl::GetValueGraphRect(const Rect& rowRect) const {
  if (!HasGraphs() || !IsExpanded()) {
    return {};
  }
  const int bottom = rowRect.bottom - mVelocityGraphHeight - 1;
  return {rowRect.left, bottom - mValueGraphHeight, rowRect.right, bottom};
}

Rect ParameterControl::GetVelocityGraphRect(const Rect& rowRect) const {
  if (!HasGraphs() || !IsExpanded()) {
    return {};
  }
  return {rowRect.left, rowRect.bottom - mVelocityGraphHeight, rowRect.right, rowRect.bottom};
}

void ParameterControl::DisplayGraph(DC& dc, const Rect& rowRect, TickTime visibleStart,
                                    double secondsPerPixel, bool pinToClip) {
  const Rect valueRect = GetValueGraphRect(rowRect);
  if (valueRect.IsEmpty()) {
    return;
  }
  EnsureGraphViewers();
  if (mValueViewer) {
    mValueViewer->SetupForPaint(mKeyframeViewer, valueRect, pinToClip, visibleStart,
                                secondsPerPixel);
    mValueViewer->DrawGraph(dc);
  }
  if (mVelocityViewer) {
    mVelocityViewer->SetupForPaint(mKeyframeViewer, GetVelocityGraphRect(rowRect), pinToClip,
                                   visibleStart, secondsPerPixel);
    mVelocityViewer->DrawGraph(dc);
  }
}

ControlPointHit ParameterControl::HitControlPointGraph(Point point) {
  if (!HasGraphs() || !IsExpanded()) {
    return {};
  }
  for (ControlPointViewerHSLBase* viewer : {mValueViewer.get(), mVelocityViewer.get()}) {
    if (viewer != nullptr) {
      ControlPointHit hit = viewer->HitTest(point);
      if (hit.IsHit()) {
        return hit;
      }
    }
  }
  return {};
}

void ParameterControl::SetGraphViewerFactory(GraphViewerFactory factory) {
  GraphFactory() = std::move(factory);
}

void ParameterControl::ShowControls(bool show) {
  if (mStopwatch) {
    mStopwatch->SetVisible(show);
  }
}

Point ParameterControl::GetDisclosureTrianglePosition() const {
  return {GetGroupLevelIndentInPixels() + 3, 2};
}

bool ParameterControl::UpdateSetAside() {
  const bool aside = !IsParamVisible();
  if (aside == IsSetAside()) {
    return false;
  }
  SetAside(aside);
  return true;
}

bool ParameterControl::UpdateParameterUI() {
  RefreshDisplayName();
  UpdateStopwatch();
  UpdateControlsEnabled(IsParamEnabled() && !IsReadOnly());
  return UpdateSetAside();
}

void ParameterControl::SynchToTime(bool force) {
  const TickTime time = GetEditTime();
  if (!force && mLastSynchTime == time) {
    return;
  }
  mLastSynchTime = time;
  SynchToCurrentTime();
}

std::shared_ptr<const void> ParameterControl::KeepAliveForDispatch() const {
  return weak_from_this().lock();
}

void ParameterControl::UpdateStopwatch() {
  if (!mStopwatch) {
    return;
  }
  mStopwatch->SetValue(IsTimeVarying() ? 1 : 0);
  mStopwatch->SetEnabled(CanTimeVary() && !IsReadOnly());
}

void ParameterControl::ListenToBinding() {
  if (mListening) {
    return;
  }
  if (mParam) {
    AddListener(mParam->GetStation(), *this);
  }
  if (!mPlayerStation.empty()) {
    AddListener(mPlayerStation, *this);
  }
  mListening = true;
}

void ParameterControl::StopListeningToBinding() {
  if (!mListening) {
    return;
  }
  if (mParam) {
    RemoveListener(mParam->GetStation(), *this);
  }
  if (!mPlayerStation.empty()) {
    RemoveListener(mPlayerStation, *this);
  }
  mListening = false;
}

void ParameterControl::EnsureGraphViewers() {
  if (mValueViewer || !GraphFactory()) {
    return;
  }
  mValueViewer = GraphFactory()(*this, false);
  mVelocityViewer = GraphFactory()(*this, true);
  BindGraphViewers();
}

void ParameterControl::BindGraphViewers() {
  for (ControlPointViewerHSLBase* viewer : {mValueViewer.get(), mVelocityViewer.get()}) {
    if (viewer != nullptr) {
      viewer->SetOwner(this);
      viewer->BindToParameter(mSequence, mTrackItem, mComponent, mParam);
    }
  }
}
