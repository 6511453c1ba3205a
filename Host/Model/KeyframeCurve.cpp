#include "Host/Model/KeyframeCurve.h"

#include <algorithm>
#include <atomic>
#include <cmath>
#include <iterator>

namespace {

// Limits that keep every product of a value, a speed and a segment length far from overflow.
constexpr double kMaximumValue = 1e100;
constexpr double kMaximumSpeed = 1e200;
// An edit of keyframe k changes auto tangents at k +- 1, path lengths of segments k - 2 .. k + 1,
// auto speeds at k +- 2 and segments k - 3 .. k + 2; refreshing k +- 4 covers them all.
constexpr std::size_t kRefreshRadius = 4;

constexpr double kTicksPerSecondD = static_cast<double>(kTicksPerSecond);

bool IsPathKind(ParamValueKind kind) {
  return kind == ParamValueKind::Point || kind == ParamValueKind::Color;
}

double Seconds(double ticks) {
  return ticks / kTicksPerSecondD;
}

double Length(ParamPoint p) {
  return std::hypot(p.x, p.y);
}

bool IsZero(ParamPoint p) {
  return p.x == 0.0 && p.y == 0.0;
}

ParamPoint Minus(ParamPoint a, ParamPoint b) {
  return {a.x - b.x, a.y - b.y};
}
ParamPoint Plus(ParamPoint a, ParamPoint b) {
  return {a.x + b.x, a.y + b.y};
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

double PathDistance(const ParamValue& a, const ParamValue& b) {
  if (const ParamPoint* p = std::get_if<ParamPoint>(&a)) {
    return Length(Minus(std::get<ParamPoint>(b), *p));
  }
  if (const ParamColor* c = std::get_if<ParamColor>(&a)) {
    const ParamColor& d = std::get<ParamColor>(b);
    const double dr = static_cast<double>(d.r) - c->r;
    const double dg = static_cast<double>(d.g) - c->g;
    const double db = static_cast<double>(d.b) - c->b;
    const double da = static_cast<double>(d.a) - c->a;
    return std::sqrt(dr * dr + dg * dg + db * db + da * da);
  }
  return 0.0;
}

double ScalarOf(const ParamValue& value) {
  return AsScalar(value).value_or(0.0);
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

// Influences are kept to float precision, the precision the segments hold them in.
double ClampInfluence(double influence) {
  return std::clamp(static_cast<double>(static_cast<float>(influence)), kMinimumInfluence,
                    kMaximumInfluence);
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

// ---------------------------------------------------------------------------------------------
// Derived data

void KeyframeCurve::InsertKey(std::size_t index, const Keyframe& keyframe) {
  const std::size_t before = mKeys.size();
  mKeys.insert(mKeys.begin() + static_cast<std::ptrdiff_t>(index), keyframe);
  mTimes.insert(mTimes.begin() + static_cast<std::ptrdiff_t>(index), keyframe.time);
  if (before == 0) {
    // The first keyframe sets the kind; nothing derived is left from an earlier kind.
    mSegments.clear();
    mInverses.clear();
    mPathLengths.clear();
    mPaths.clear();
  } else {
    InsertSlot(std::min(index, before - 1));
  }
  Refresh(index, index);
}

void KeyframeCurve::EraseKey(std::size_t index) {
  const std::size_t before = mKeys.size();
  if (before >= 2) {
    EraseSlot(std::min(index, before - 2));
  }
  mKeys.erase(mKeys.begin() + static_cast<std::ptrdiff_t>(index));
  mTimes.erase(mTimes.begin() + static_cast<std::ptrdiff_t>(index));
  if (!mKeys.empty()) {
    Refresh(index > 0 ? index - 1 : 0, std::min(index, mKeys.size() - 1));
  }
}

void KeyframeCurve::InsertSlot(std::size_t segment) {
  const auto at = static_cast<std::ptrdiff_t>(segment);
  mSegments.insert(mSegments.begin() + at, CurveSegment{});
  mInverses.insert(mInverses.begin() + at, CurveInverse{});
  const ParamValueKind kind = *Kind();
  if (IsPathKind(kind)) {
    mPathLengths.insert(mPathLengths.begin() + at, 0.0);
  }
  if (kind == ParamValueKind::Point) {
    mPaths.insert(mPaths.begin() + at, CurvePath{});
  }
}

void KeyframeCurve::EraseSlot(std::size_t segment) {
  const auto at = static_cast<std::ptrdiff_t>(segment);
  mSegments.erase(mSegments.begin() + at);
  mInverses.erase(mInverses.begin() + at);
  if (!mPathLengths.empty()) {
    mPathLengths.erase(mPathLengths.begin() + at);
  }
  if (!mPaths.empty()) {
    mPaths.erase(mPaths.begin() + at);
  }
}

void KeyframeCurve::RebuildAll() {
  mTimes.resize(mKeys.size());
  std::transform(mKeys.begin(), mKeys.end(), mTimes.begin(),
                 [](const Keyframe& key) { return key.time; });
  const std::size_t segments = mKeys.size() < 2 ? 0 : mKeys.size() - 1;
  const std::optional<ParamValueKind> kind = Kind();
  mSegments.assign(segments, CurveSegment{});
  mInverses.assign(segments, CurveInverse{});
  mPathLengths.assign(kind && IsPathKind(*kind) ? segments : 0, 0.0);
  mPaths.assign(kind == ParamValueKind::Point ? segments : 0, CurvePath{});
  if (!mKeys.empty()) {
    Refresh(0, mKeys.size() - 1);
  }
}

void KeyframeCurve::Refresh(std::size_t first, std::size_t last) {
  const std::size_t n = mKeys.size();
  if (n == 0) {
    return;
  }
  const std::size_t lo = first > kRefreshRadius ? first - kRefreshRadius : 0;
  const std::size_t hi = std::min(n - 1, last + kRefreshRadius);
  const ParamValueKind kind = *Kind();
  if (kind == ParamValueKind::Point) {
    for (std::size_t k = lo; k <= hi; ++k) {
      RefreshTangents(k);
    }
  }
  if (n >= 2 && IsPathKind(kind)) {
    for (std::size_t s = lo; s <= std::min(hi, n - 2); ++s) {
      RefreshPathLength(s);
    }
  }
  for (std::size_t k = lo; k <= hi; ++k) {
    RefreshSpeeds(k);
  }
  if (n >= 2) {
    for (std::size_t s = lo; s <= std::min(hi, n - 2); ++s) {
      RefreshSegment(s);
    }
  }
}

void KeyframeCurve::RefreshTangents(std::size_t index) {
  Keyframe& key = mKeys[index];
  switch (key.spatial) {
    case SpatialInterpolation::Linear:
      key.inTangent = {};
      key.outTangent = {};
      break;
    case SpatialInterpolation::AutoBezier:
      if (index > 0 && index + 1 < mKeys.size()) {
        // Catmull-Rom: the tangent runs parallel to the chord of the neighbours.
        const ParamPoint chord = Minus(std::get<ParamPoint>(mKeys[index + 1].value),
                                       std::get<ParamPoint>(mKeys[index - 1].value));
        key.outTangent = {chord.x / 6.0, chord.y / 6.0};
        key.inTangent = {-chord.x / 6.0, -chord.y / 6.0};
      } else {
        key.inTangent = {};
        key.outTangent = {};
      }
      break;
    case SpatialInterpolation::Bezier:
    case SpatialInterpolation::ContinuousBezier:
      break;
  }
}

void KeyframeCurve::RefreshPathLength(std::size_t segment) {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  CurveSegment& g = mSegments[segment];
  g.SetCurvedPath(false);
  if (const ParamPoint* a = std::get_if<ParamPoint>(&from.value)) {
    const ParamPoint& b = std::get<ParamPoint>(to.value);
    if (!IsZero(from.outTangent) || !IsZero(to.inTangent)) {
      g.SetCurvedPath(true);
      mPathLengths[segment] =
          mPaths[segment].Build(*a, Plus(*a, from.outTangent), Plus(b, to.inTangent), b);
      return;
    }
  }
  mPathLengths[segment] = PathDistance(from.value, to.value);
}

double KeyframeCurve::SegmentSlope(std::size_t segment) const {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  const double seconds = Seconds(static_cast<double>(to.time - from.time));
  const ParamValueKind kind = KindOf(from.value);
  if (kind == ParamValueKind::Double) {
    return (ScalarOf(to.value) - ScalarOf(from.value)) / seconds;
  }
  if (IsPathKind(kind)) {
    return mPathLengths[segment] / seconds;
  }
  return 0.0;
}

void KeyframeCurve::RefreshSpeeds(std::size_t index) {
  Keyframe& key = mKeys[index];
  if (key.interpolation == TemporalInterpolation::Bezier ||
      key.interpolation == TemporalInterpolation::ContinuousBezier) {
    return;
  }
  const std::size_t n = mKeys.size();
  const bool heldBefore =
      index > 0 && mKeys[index - 1].interpolation == TemporalInterpolation::Hold;
  std::optional<double> slopeIn;
  std::optional<double> slopeOut;
  if (index > 0 && !heldBefore) {
    slopeIn = SegmentSlope(index - 1);
  }
  if (index + 1 < n) {
    slopeOut = SegmentSlope(index);
  }
  key.inInfluence = kDefaultInfluence;
  key.outInfluence = kDefaultInfluence;
  switch (key.interpolation) {
    case TemporalInterpolation::Hold:
      key.inSpeed = slopeIn.value_or(0.0);
      key.outSpeed = 0.0;
      break;
    case TemporalInterpolation::Linear:
      key.inSpeed = slopeIn.value_or(0.0);
      key.outSpeed = slopeOut.value_or(0.0);
      break;
    case TemporalInterpolation::AutoBezier: {
      double speed = 0.0;
      if (slopeIn && slopeOut) {
        const double a = *slopeIn;
        const double b = *slopeOut;
        if (IsPathKind(KindOf(key.value))) {
          speed = 0.5 * (a + b);
        } else if (a * b > 0.0) {
          // Parallel to the neighbours' chord, limited so the curve neither overshoots nor turns
          // back between them (Fritsch-Carlson); flat where the value turns.
          const double chord =
              (ScalarOf(mKeys[index + 1].value) - ScalarOf(mKeys[index - 1].value)) /
              Seconds(static_cast<double>(mKeys[index + 1].time - mKeys[index - 1].time));
          const double limit = 3.0 * std::min(std::fabs(a), std::fabs(b));
          speed = std::clamp(chord, -limit, limit);
        }
      } else {
        speed = slopeIn ? *slopeIn : slopeOut.value_or(0.0);
      }
      key.inSpeed = speed;
      key.outSpeed = speed;
      break;
    }
    case TemporalInterpolation::Bezier:
    case TemporalInterpolation::ContinuousBezier:
      break;
  }
}

void KeyframeCurve::RefreshSegment(std::size_t segment) {
  const Keyframe& from = mKeys[segment];
  const Keyframe& to = mKeys[segment + 1];
  CurveSegment& g = mSegments[segment];
  const ParamValueKind kind = KindOf(from.value);
  const bool path = IsPathKind(kind);
  const double y0 = path ? 0.0 : ScalarOf(from.value);
  const double y3 = path ? mPathLengths[segment] : ScalarOf(to.value);
  if (from.interpolation == TemporalInterpolation::Hold || !Interpolates(kind)) {
    g.MakeHold(from.time, to.time, y0);
    return;
  }
  const bool straightOut = from.interpolation == TemporalInterpolation::Linear;
  const bool straightIn = to.interpolation == TemporalInterpolation::Linear ||
                          to.interpolation == TemporalInterpolation::Hold;
  if (straightOut && straightIn) {
    g.MakeLinear(from.time, to.time, y0, y3);
    return;
  }
  // The inner control points are the handles (ComputeHandle), in exact rather than whole ticks.
  const double span = static_cast<double>(to.time - from.time);
  const auto outReach = static_cast<float>(ClampInfluence(from.outInfluence) * 0.5);
  const auto inReach = static_cast<float>(ClampInfluence(to.inInfluence) * 0.5);
  double y1 = y0 + Seconds(span * outReach) * from.outSpeed;
  double y2 = y3 - Seconds(span * inReach) * to.inSpeed;
  if (path) {
    // Inside [0, length] the distance neither runs back along the path nor beyond its ends.
    y1 = std::clamp(y1, 0.0, y3);
    y2 = std::clamp(y2, 0.0, y3);
  }
  g.MakeBezier(from.time, to.time, y0, y1, y2, y3, outReach, inReach, mInverses[segment]);
}

// ---------------------------------------------------------------------------------------------
// Evaluation

std::ptrdiff_t KeyframeCurve::SegmentIndexFor(TickTime time, Approach approach) const {
  const auto n = static_cast<std::ptrdiff_t>(mKeys.size());
  const auto it = approach == Approach::FromRight
                      ? std::upper_bound(mTimes.begin(), mTimes.end(), time)
                      : std::lower_bound(mTimes.begin(), mTimes.end(), time);
  const std::ptrdiff_t index = (it - mTimes.begin()) - 1;
  return std::min(index, n - 1);
}

ParamValue KeyframeCurve::SegmentValue(std::size_t segment, TickTime time) const {
  const CurveSegment& g = mSegments[segment];
  const Keyframe& from = mKeys[segment];
  if (g.Shape() == CurveSegmentShape::Hold || time <= g.Start()) {
    return from.value;
  }
  const Keyframe& to = mKeys[segment + 1];
  if (time >= mTimes[segment + 1]) {
    return to.value;
  }
  const double y = g.YAt(time, mInverses[segment]);
  if (KindOf(from.value) == ParamValueKind::Double) {
    return y;
  }
  if (g.IsCurvedPath()) {
    return mPaths[segment].PointAtDistance(y);
  }
  const double length = mPathLengths[segment];
  const double f = length > 0.0 ? std::clamp(y / length, 0.0, 1.0) : 0.0;
  return Blend(from.value, to.value, f);
}

std::optional<ParamValue> KeyframeCurve::ValueAt(TickTime time) const {
  if (mKeys.empty()) {
    return std::nullopt;
  }
  const std::ptrdiff_t segment = SegmentIndexFor(time, Approach::FromRight);
  if (segment < 0) {
    return mKeys.front().value;
  }
  if (segment >= static_cast<std::ptrdiff_t>(mKeys.size()) - 1) {
    return mKeys.back().value;
  }
  return SegmentValue(static_cast<std::size_t>(segment), time);
}

std::optional<double> KeyframeCurve::ScalarAt(TickTime time) const {
  const std::optional<ParamValue> value = ValueAt(time);
  return value ? AsScalar(*value) : std::nullopt;
}

double KeyframeCurve::VelocityAt(TickTime time, Approach approach) const {
  const std::ptrdiff_t segment = SegmentIndexFor(time, approach);
  if (segment < 0 || segment >= static_cast<std::ptrdiff_t>(mKeys.size()) - 1) {
    return 0.0;
  }
  const auto k = static_cast<std::size_t>(segment);
  return mSegments[k].VelocityAt(time, mInverses[k]);
}

std::vector<VelocitySample> KeyframeCurve::CreateVelocitySegment(TickTime from, TickTime to,
                                                                 int count) const {
  std::vector<VelocitySample> samples;
  if (count < 2 || !(from < to)) {
    return samples;
  }
  samples.reserve(static_cast<std::size_t>(count));
  Sampler sampler(*this);
  const double span = static_cast<double>(to) - static_cast<double>(from);
  for (int i = 0; i < count; ++i) {
    TickTime time = to;
    if (i + 1 < count) {
      time = from + static_cast<TickTime>(std::floor(span * i / (count - 1)));
    }
    const Approach approach = i + 1 == count ? Approach::FromLeft : Approach::FromRight;
    samples.push_back({time, sampler.VelocityAt(time, approach)});
  }
  return samples;
}

void KeyframeCurve::VelocityExtremes(TickTime from, TickTime to, double* minimum,
                                     double* maximum) const {
  bool any = false;
  auto include = [&](double v) {
    if (!any) {
      *minimum = v;
      *maximum = v;
      any = true;
    } else {
      *minimum = std::min(*minimum, v);
      *maximum = std::max(*maximum, v);
    }
  };
  *minimum = 0.0;
  *maximum = 0.0;
  const std::size_t n = mKeys.size();
  if (n < 2 || to < from) {
    return;
  }
  if (from == to) {
    include(VelocityAt(from));
    return;
  }
  if (from < mKeys.front().time || to > mKeys.back().time) {
    include(0.0);
  }
  const std::ptrdiff_t firstSegment =
      std::max<std::ptrdiff_t>(0, SegmentIndexFor(from, Approach::FromRight));
  for (auto s = static_cast<std::size_t>(firstSegment); s + 1 < n; ++s) {
    const CurveSegment& g = mSegments[s];
    if (g.Start() >= to) {
      break;
    }
    if (mTimes[s + 1] <= from) {
      continue;
    }
    double low = 0.0;
    double high = 0.0;
    g.VelocityRange(from, to, mInverses[s], &low, &high);
    include(low);
    include(high);
  }
  if (!any) {
    include(0.0);
  }
}

double KeyframeCurve::GetMinimumVelocity(TickTime from, TickTime to) const {
  double minimum = 0.0;
  double maximum = 0.0;
  VelocityExtremes(from, to, &minimum, &maximum);
  return minimum;
}

double KeyframeCurve::GetMaximumVelocity(TickTime from, TickTime to) const {
  double minimum = 0.0;
  double maximum = 0.0;
  VelocityExtremes(from, to, &minimum, &maximum);
  return maximum;
}

std::optional<KeyframeHandle> KeyframeCurve::ComputeHandle(std::size_t index,
                                                           KeyframeSide side) const {
  if (index >= mKeys.size()) {
    return std::nullopt;
  }
  const Keyframe& key = mKeys[index];
  const bool scalar = AsScalar(key.value).has_value();
  if (side == KeyframeSide::In) {
    if (index == 0) {
      return std::nullopt;
    }
    const std::optional<TickTime> time = key.GetEaseInTime(mKeys[index - 1].time);
    if (!time) {
      return std::nullopt;
    }
    return KeyframeHandle{*time, scalar ? *key.GetEaseInValue(*time) : key.inSpeed};
  }
  if (index + 1 >= mKeys.size()) {
    return std::nullopt;
  }
  const std::optional<TickTime> time = key.GetEaseOutTime(mKeys[index + 1].time);
  if (!time) {
    return std::nullopt;
  }
  return KeyframeHandle{*time, scalar ? *key.GetEaseOutValue(*time) : key.outSpeed};
}

// ---------------------------------------------------------------------------------------------
// Sampler

void KeyframeCurve::Sampler::Sync() {
  const KeyframeCurve& curve = *mCurve;
  if (mRevision == curve.mRevision) {
    return;
  }
  mRevision = curve.mRevision;
  mSegment = 0;
  const std::optional<ParamValueKind> kind = curve.Kind();
  mScalarSegments = kind == ParamValueKind::Double || kind == ParamValueKind::Bool ||
                    kind == ParamValueKind::Choice;
}

std::ptrdiff_t KeyframeCurve::Sampler::Locate(TickTime time, Approach approach) {
  Sync();
  const KeyframeCurve& curve = *mCurve;
  const std::size_t n = curve.mTimes.size();
  if (n < 2) {
    return curve.SegmentIndexFor(time, approach);
  }
  // Segment k runs from times[k] to times[k + 1] and answers for `time` when times[k] is
  // "reached" and times[k + 1] is not. The compact time list keeps the walk in cache.
  const TickTime* times = curve.mTimes.data();
  const auto reached = [&](TickTime t) {
    return approach == Approach::FromRight ? t <= time : t < time;
  };
  const std::size_t last = n - 2;
  const std::size_t k = std::min(mSegment, last);
  if (reached(times[k])) {
    if (!reached(times[k + 1])) {
      return static_cast<std::ptrdiff_t>(k);
    }
    // Forward within the next kCursorSteps keyframes: count the reached ones without branching,
    // so an irregular stride costs no mispredictions.
    if (k + kCursorSteps <= last + 1) {
      std::size_t j = k;
      for (std::size_t i = 1; i <= kCursorSteps; ++i) {
        j += reached(times[k + i]) ? 1 : 0;
      }
      if (j < k + kCursorSteps) {
        mSegment = j;
        return static_cast<std::ptrdiff_t>(j);
      }
    }
  } else if (k >= kCursorSteps) {
    // Backward likewise, for a graph sampled from right to left.
    std::size_t passed = 0;
    for (std::size_t i = 1; i <= kCursorSteps; ++i) {
      passed += reached(times[k - i]) ? 0 : 1;
    }
    if (passed < kCursorSteps) {
      mSegment = k - passed - 1;
      return static_cast<std::ptrdiff_t>(mSegment);
    }
  }
  const std::ptrdiff_t found = curve.SegmentIndexFor(time, approach);
  mSegment = static_cast<std::size_t>(
      std::clamp<std::ptrdiff_t>(found, 0, static_cast<std::ptrdiff_t>(last)));
  return found;
}

std::optional<ParamValue> KeyframeCurve::Sampler::ValueAt(TickTime time) {
  const KeyframeCurve& curve = *mCurve;
  if (curve.mKeys.empty()) {
    return std::nullopt;
  }
  const std::ptrdiff_t segment = Locate(time, Approach::FromRight);
  if (segment < 0) {
    return curve.mKeys.front().value;
  }
  if (segment >= static_cast<std::ptrdiff_t>(curve.mKeys.size()) - 1) {
    return curve.mKeys.back().value;
  }
  return curve.SegmentValue(static_cast<std::size_t>(segment), time);
}

std::optional<double> KeyframeCurve::Sampler::ScalarAtSlowly(TickTime time) {
  const KeyframeCurve& curve = *mCurve;
  const std::ptrdiff_t segment = Locate(time, Approach::FromRight);
  if (!mScalarSegments) {
    return std::nullopt;  // empty, or points, colours, text or blobs
  }
  if (segment < 0) {
    return AsScalar(curve.mKeys.front().value);
  }
  if (segment >= static_cast<std::ptrdiff_t>(curve.mKeys.size()) - 1) {
    return AsScalar(curve.mKeys.back().value);
  }
  // Segments hold the scalar readings of their ends, so no value is unpacked here.
  const auto k = static_cast<std::size_t>(segment);
  return curve.mSegments[k].YAt(time, curve.mInverses[k]);
}

bool KeyframeCurve::Sampler::ScalarsAt(std::span<const TickTime> times, std::span<double> values) {
  Sync();
  if (!mScalarSegments || values.size() < times.size()) {
    return false;
  }
  const KeyframeCurve& curve = *mCurve;
  const CurveSegment* const segments = curve.mSegments.data();
  const auto segmentCount = static_cast<std::ptrdiff_t>(curve.mSegments.size());
  const TickTime* time = times.data();
  const TickTime* const timesEnd = time + times.size();
  double* value = values.data();
  while (time != timesEnd) {
    const std::ptrdiff_t located = Locate(*time, Approach::FromRight);
    if (located < 0 || located >= segmentCount) {
      *value++ = *ScalarAtSlowly(*time++);
      continue;
    }
    // Pointers that move together, so that a graph's loop keeps them all in registers:
    // bounds[0] and bounds[1] are the segment's start and end times.
    const CurveSegment* record = segments + located;
    const CurveInverse* inverse = curve.mInverses.data() + located;
    const TickTime* bounds = curve.mTimes.data() + located;
    const CurveSegment* const lastRecord = segments + segmentCount - 1;
    for (;;) {
      *value++ = record->YInside(*time++, *inverse);
      if (time == timesEnd) {
        break;
      }
      if (*time < bounds[1]) {
        if (*time >= bounds[0]) {
          continue;
        }
        break;  // a step back: located afresh
      }
      // On by one or two segments (keyframes denser than the times); farther is located afresh.
      if (record == lastRecord) {
        break;
      }
      ++record, ++inverse, ++bounds;
      if (*time < bounds[1]) {
        continue;
      }
      if (record == lastRecord) {
        break;
      }
      ++record, ++inverse, ++bounds;
      if (*time < bounds[1]) {
        continue;
      }
      break;
    }
    mSegment = static_cast<std::size_t>(record - segments);
  }
  return true;
}

double KeyframeCurve::Sampler::VelocityAt(TickTime time, Approach approach) {
  const KeyframeCurve& curve = *mCurve;
  const std::ptrdiff_t segment = Locate(time, approach);
  if (segment < 0 || segment >= static_cast<std::ptrdiff_t>(curve.mKeys.size()) - 1) {
    return 0.0;
  }
  const auto k = static_cast<std::size_t>(segment);
  return curve.mSegments[k].VelocityAt(time, curve.mInverses[k]);
}
