// Queries and edits of a keyframe curve. What is derived from the keyframes, evaluation and the
// sampler live in the files named after them.
#include "Host/Model/KeyframeCurve.h"

#include <algorithm>
#include <atomic>
#include <cmath>
#include <iterator>

namespace {

// Limits that keep every product of a value, a speed and a segment length far from overflow.
constexpr double kMaximumValue = 1e100;
constexpr double kMaximumSpeed = 1e200;

double Length(ParamPoint p) {
  return std::hypot(p.x, p.y);
}

// A vector pointing against `direction` with the length of `keep`; `keep` itself when there is no
// direction to align to.
ParamPoint Opposite(ParamPoint direction, ParamPoint keep) {
  const double d = Length(direction);
  if (d == 0.0) {
    return keep;
  }
  const double k = Length(keep);
  return {-direction.x / d * k, -direction.y / d * k};
}

bool AreOpposite(ParamPoint a, ParamPoint b) {
  const double la = Length(a);
  const double lb = Length(b);
  if (la == 0.0 || lb == 0.0) {
    return true;
  }
  const double cross = (a.x * b.y - a.y * b.x) / (la * lb);
  const double dot = a.x * b.x + a.y * b.y;
  return std::fabs(cross) <= 1e-12 && dot < 0.0;
}

double Magnitude(const ParamValue& value) {
  if (const double* d = std::get_if<double>(&value)) {
    return std::fabs(*d);
  }
  if (const ParamPoint* p = std::get_if<ParamPoint>(&value)) {
    return std::max(std::fabs(p->x), std::fabs(p->y));
  }
  return 0.0;  // colours are floats; every finite float is acceptable
}

// A continuous keyframe has one speed and opposite tangents. The side that differs from the
// keyframe it replaces wins; the outgoing side when both or neither do.
void MakeContinuous(Keyframe& keyframe, const Keyframe* before) {
  if (keyframe.interpolation == TemporalInterpolation::ContinuousBezier &&
      keyframe.inSpeed != keyframe.outSpeed) {
    const bool inChanged = before && keyframe.inSpeed != before->inSpeed;
    const bool outChanged = before && keyframe.outSpeed != before->outSpeed;
    if (inChanged && !outChanged) {
      keyframe.outSpeed = keyframe.inSpeed;
    } else {
      keyframe.inSpeed = keyframe.outSpeed;
    }
  }
  if (keyframe.spatial == SpatialInterpolation::ContinuousBezier &&
      !AreOpposite(keyframe.inTangent, keyframe.outTangent)) {
    const bool inChanged = before && keyframe.inTangent != before->inTangent;
    const bool outChanged = before && keyframe.outTangent != before->outTangent;
    if (inChanged && !outChanged) {
      keyframe.outTangent = Opposite(keyframe.inTangent, keyframe.outTangent);
    } else {
      keyframe.inTangent = Opposite(keyframe.outTangent, keyframe.inTangent);
    }
  }
}

}  // namespace

const char* ToString(CurveStatus status) {
  switch (status) {
    case CurveStatus::Ok:
      return "ok";
    case CurveStatus::DuplicateTime:
      return "another keyframe is at that time";
    case CurveStatus::TimeOutOfRange:
      return "time out of range";
    case CurveStatus::NonFiniteValue:
      return "value is not a finite number";
    case CurveStatus::KindMismatch:
      return "value kind differs from the curve's";
    case CurveStatus::NoSuchKeyframe:
      return "no such keyframe";
    case CurveStatus::NegativeSpeed:
      return "speed along a path cannot be negative";
    case CurveStatus::ValueOutOfRange:
      return "value out of range";
    case CurveStatus::InvalidMode:
      return "no such interpolation";
  }
  return "unknown";
}

bool KeyframeCurve::IsPathKind(ParamValueKind kind) {
  return kind == ParamValueKind::Point || kind == ParamValueKind::Color;
}

double KeyframeCurve::ClampInfluence(double influence) {
  return std::clamp(static_cast<double>(static_cast<float>(influence)), kMinimumInfluence,
                    kMaximumInfluence);
}

void KeyframeCurve::Touch() {
  static std::atomic<std::uint64_t> revisions{0};
  mRevision = revisions.fetch_add(1, std::memory_order_relaxed) + 1;
}

// ---------------------------------------------------------------------------------------------
// Queries

std::optional<ParamValueKind> KeyframeCurve::Kind() const {
  if (mKeys.empty()) {
    return std::nullopt;
  }
  return KindOf(mKeys.front().value);
}

std::optional<std::size_t> KeyframeCurve::FindAt(TickTime time) const {
  const auto it = std::lower_bound(mTimes.begin(), mTimes.end(), time);
  if (it == mTimes.end() || *it != time) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mTimes.begin());
}

std::optional<std::size_t> KeyframeCurve::FindBefore(TickTime time) const {
  const auto it = std::lower_bound(mTimes.begin(), mTimes.end(), time);
  if (it == mTimes.begin()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mTimes.begin()) - 1;
}

std::optional<std::size_t> KeyframeCurve::FindAfter(TickTime time) const {
  const auto it = std::upper_bound(mTimes.begin(), mTimes.end(), time);
  if (it == mTimes.end()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mTimes.begin());
}

std::optional<std::size_t> KeyframeCurve::FindAtOrBefore(TickTime time) const {
  const auto it = std::upper_bound(mTimes.begin(), mTimes.end(), time);
  if (it == mTimes.begin()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mTimes.begin()) - 1;
}

std::optional<std::size_t> KeyframeCurve::FindAtOrAfter(TickTime time) const {
  const auto it = std::lower_bound(mTimes.begin(), mTimes.end(), time);
  if (it == mTimes.end()) {
    return std::nullopt;
  }
  return static_cast<std::size_t>(it - mTimes.begin());
}

std::optional<TickTime> KeyframeCurve::NextKeyframeTime(TickTime time) const {
  const std::optional<std::size_t> index = FindAfter(time);
  if (!index) {
    return std::nullopt;
  }
  return mKeys[*index].time;
}

std::optional<TickTime> KeyframeCurve::PreviousKeyframeTime(TickTime time) const {
  const std::optional<std::size_t> index = FindBefore(time);
  if (!index) {
    return std::nullopt;
  }
  return mKeys[*index].time;
}

std::vector<std::size_t> KeyframeCurve::FindInRange(TickTime first, TickTime last) const {
  std::vector<std::size_t> result;
  if (last < first) {
    return result;
  }
  auto it = std::lower_bound(mTimes.begin(), mTimes.end(), first);
  for (; it != mTimes.end() && *it <= last; ++it) {
    result.push_back(static_cast<std::size_t>(it - mTimes.begin()));
  }
  return result;
}

// ---------------------------------------------------------------------------------------------
// Edits

CurveStatus KeyframeCurve::Validate(Keyframe& keyframe, std::optional<std::size_t> ignoring) const {
  if (!IsStorableTime(keyframe.time)) {
    return CurveStatus::TimeOutOfRange;
  }
  if (!TemporalInterpolationFromCode(static_cast<int>(keyframe.interpolation)) ||
      !SpatialInterpolationFromCode(static_cast<int>(keyframe.spatial))) {
    return CurveStatus::InvalidMode;
  }
  const double numbers[] = {keyframe.inSpeed,      keyframe.outSpeed,    keyframe.inInfluence,
                            keyframe.outInfluence, keyframe.inTangent.x, keyframe.inTangent.y,
                            keyframe.outTangent.x, keyframe.outTangent.y};
  if (!IsFinite(keyframe.value) || !std::all_of(std::begin(numbers), std::end(numbers),
                                                [](double n) { return std::isfinite(n); })) {
    return CurveStatus::NonFiniteValue;
  }
  if (Magnitude(keyframe.value) > kMaximumValue ||
      std::max(std::fabs(keyframe.inSpeed), std::fabs(keyframe.outSpeed)) > kMaximumSpeed ||
      std::max({std::fabs(keyframe.inTangent.x), std::fabs(keyframe.inTangent.y),
                std::fabs(keyframe.outTangent.x), std::fabs(keyframe.outTangent.y)}) >
          kMaximumValue) {
    return CurveStatus::ValueOutOfRange;
  }
  const ParamValueKind kind = KindOf(keyframe.value);
  const std::size_t others = mKeys.size() - (ignoring ? 1 : 0);
  if (others > 0 && kind != *Kind()) {
    return CurveStatus::KindMismatch;
  }
  const bool handSet = keyframe.interpolation == TemporalInterpolation::Bezier ||
                       keyframe.interpolation == TemporalInterpolation::ContinuousBezier;
  if (IsPathKind(kind) && handSet && (keyframe.inSpeed < 0.0 || keyframe.outSpeed < 0.0)) {
    return CurveStatus::NegativeSpeed;
  }
  keyframe.inInfluence = ClampInfluence(keyframe.inInfluence);
  keyframe.outInfluence = ClampInfluence(keyframe.outInfluence);
  if (kind != ParamValueKind::Point) {
    keyframe.inTangent = {};
    keyframe.outTangent = {};
  }
  return CurveStatus::Ok;
}

CurveStatus KeyframeCurve::Add(const Keyframe& keyframe) {
  Keyframe added = keyframe;
  if (const CurveStatus status = Validate(added, std::nullopt); status != CurveStatus::Ok) {
    return status;
  }
  if (FindAt(added.time)) {
    return CurveStatus::DuplicateTime;
  }
  MakeContinuous(added, nullptr);
  const auto it = std::lower_bound(mTimes.begin(), mTimes.end(), added.time);
  InsertKey(static_cast<std::size_t>(it - mTimes.begin()), added);
  Touch();
  return CurveStatus::Ok;
}

CurveStatus KeyframeCurve::AddOrReplace(const Keyframe& keyframe) {
  if (const std::optional<std::size_t> index = FindAt(keyframe.time)) {
    return Replace(*index, keyframe);
  }
  return Add(keyframe);
}

CurveStatus KeyframeCurve::Replace(std::size_t index, const Keyframe& keyframe) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  Keyframe replacement = keyframe;
  if (const CurveStatus status = Validate(replacement, index); status != CurveStatus::Ok) {
    return status;
  }
  const std::optional<std::size_t> occupant = FindAt(replacement.time);
  if (occupant && *occupant != index) {
    return CurveStatus::DuplicateTime;
  }
  MakeContinuous(replacement, &mKeys[index]);
  const bool staysInPlace = (index == 0 || mKeys[index - 1].time < replacement.time) &&
                            (index + 1 == mKeys.size() || replacement.time < mKeys[index + 1].time);
  if (staysInPlace) {
    mKeys[index] = replacement;
    mTimes[index] = replacement.time;
    Refresh(index, index);
  } else {
    EraseKey(index);
    const auto it = std::lower_bound(mTimes.begin(), mTimes.end(), replacement.time);
    InsertKey(static_cast<std::size_t>(it - mTimes.begin()), replacement);
  }
  Touch();
  return CurveStatus::Ok;
}

CurveStatus KeyframeCurve::Remove(std::size_t index) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  EraseKey(index);
  Touch();
  return CurveStatus::Ok;
}

CurveStatus KeyframeCurve::RemoveAt(TickTime time) {
  const std::optional<std::size_t> index = FindAt(time);
  return index ? Remove(*index) : CurveStatus::NoSuchKeyframe;
}

void KeyframeCurve::Clear() {
  mKeys.clear();
  mTimes.clear();
  mSegments.clear();
  mInverses.clear();
  mPathLengths.clear();
  mPaths.clear();
  Touch();
}

CurveStatus KeyframeCurve::Move(std::size_t index, TickTime newTime) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  Keyframe moved = mKeys[index];
  moved.time = newTime;
  return Replace(index, moved);
}

CurveStatus KeyframeCurve::MoveKeyframes(const std::vector<std::size_t>& indices, TickTime delta) {
  std::vector<bool> moving(mKeys.size(), false);
  for (const std::size_t index : indices) {
    if (index >= mKeys.size()) {
      return CurveStatus::NoSuchKeyframe;
    }
    moving[index] = true;
  }
  if (delta == 0 || indices.empty()) {
    return CurveStatus::Ok;
  }
  std::vector<Keyframe> keys = mKeys;
  for (std::size_t i = 0; i < keys.size(); ++i) {
    if (!moving[i]) {
      continue;
    }
    TickTime time = 0;
    if (__builtin_add_overflow(keys[i].time, delta, &time) || !IsStorableTime(time)) {
      return CurveStatus::TimeOutOfRange;
    }
    // Moved keyframes keep their distances, so they can only land on one that stays.
    const std::optional<std::size_t> occupant = FindAt(time);
    if (occupant && !moving[*occupant]) {
      return CurveStatus::DuplicateTime;
    }
    keys[i].time = time;
  }
  std::stable_sort(keys.begin(), keys.end(),
                   [](const Keyframe& a, const Keyframe& b) { return a.time < b.time; });
  mKeys = std::move(keys);
  RebuildAll();
  Touch();
  return CurveStatus::Ok;
}

CurveStatus KeyframeCurve::SetValue(std::size_t index, const ParamValue& value) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  Keyframe changed = mKeys[index];
  changed.value = value;
  return Replace(index, changed);
}

CurveStatus KeyframeCurve::SetTemporalInterpolation(std::size_t index, TemporalInterpolation mode) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  if (!TemporalInterpolationFromCode(static_cast<int>(mode))) {
    return CurveStatus::InvalidMode;
  }
  Keyframe changed = mKeys[index];
  if (mode == TemporalInterpolation::ContinuousBezier && changed.interpolation != mode) {
    const double mean = 0.5 * (changed.inSpeed + changed.outSpeed);
    changed.inSpeed = mean;
    changed.outSpeed = mean;
  }
  changed.interpolation = mode;
  return Replace(index, changed);
}

CurveStatus KeyframeCurve::SetSpatialInterpolation(std::size_t index, SpatialInterpolation mode) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  if (Kind() != ParamValueKind::Point) {
    return CurveStatus::KindMismatch;
  }
  if (!SpatialInterpolationFromCode(static_cast<int>(mode))) {
    return CurveStatus::InvalidMode;
  }
  Keyframe changed = mKeys[index];
  if (mode == SpatialInterpolation::ContinuousBezier && changed.spatial != mode &&
      !AreOpposite(changed.inTangent, changed.outTangent)) {
    changed.inTangent = Opposite(changed.outTangent, changed.inTangent);
  }
  changed.spatial = mode;
  return Replace(index, changed);
}

CurveStatus KeyframeCurve::SetEase(std::size_t index, KeyframeSide side, double speed,
                                   double influence) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  Keyframe changed = mKeys[index];
  if (changed.interpolation != TemporalInterpolation::ContinuousBezier) {
    changed.interpolation = TemporalInterpolation::Bezier;
  }
  const bool continuous = changed.interpolation == TemporalInterpolation::ContinuousBezier;
  if (side == KeyframeSide::In) {
    changed.inSpeed = speed;
    changed.inInfluence = influence;
    if (continuous) {
      changed.outSpeed = speed;
    }
  } else {
    changed.outSpeed = speed;
    changed.outInfluence = influence;
    if (continuous) {
      changed.inSpeed = speed;
    }
  }
  return Replace(index, changed);
}

CurveStatus KeyframeCurve::SetSpatialTangent(std::size_t index, KeyframeSide side,
                                             ParamPoint tangent) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  if (Kind() != ParamValueKind::Point) {
    return CurveStatus::KindMismatch;
  }
  Keyframe changed = mKeys[index];
  if (changed.spatial != SpatialInterpolation::ContinuousBezier) {
    changed.spatial = SpatialInterpolation::Bezier;
  }
  ParamPoint& mine = side == KeyframeSide::In ? changed.inTangent : changed.outTangent;
  ParamPoint& other = side == KeyframeSide::In ? changed.outTangent : changed.inTangent;
  mine = tangent;
  if (changed.spatial == SpatialInterpolation::ContinuousBezier) {
    other = Opposite(tangent, other);
  }
  return Replace(index, changed);
}

CurveStatus KeyframeCurve::ApplyAutomaticEase(std::size_t index, KeyframeSide side) {
  if (index >= mKeys.size()) {
    return CurveStatus::NoSuchKeyframe;
  }
  Keyframe changed = mKeys[index];
  changed.interpolation = TemporalInterpolation::Bezier;
  if (side == KeyframeSide::In) {
    changed.inSpeed = 0.0;
    changed.inInfluence = kDefaultInfluence;
  } else {
    changed.outSpeed = 0.0;
    changed.outInfluence = kDefaultInfluence;
  }
  return Replace(index, changed);
}
