#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "Host/Model/CurvePath.h"
#include "Host/Model/CurveSegment.h"
#include "Host/Model/Keyframe.h"
#include "Host/Model/ParamValue.h"
#include "Host/Time/TickTime.h"

enum class CurveStatus {
  Ok,
  DuplicateTime,    // another keyframe already sits at that time
  TimeOutOfRange,   // not strictly between kTime_Min and kTime_Max
  NonFiniteValue,   // NaN or infinity in the value, a speed, an influence or a tangent
  KindMismatch,     // the value's kind differs from the curve's
  NoSuchKeyframe,   // index out of range or no keyframe at the time
  NegativeSpeed,    // a point or colour keyframe given a negative speed along its path
  ValueOutOfRange,  // a value or tangent beyond 1e100 in magnitude, a speed beyond 1e200
  InvalidMode,      // an interpolation code that does not exist
};
const char* ToString(CurveStatus status);

// The handle of one side of a keyframe: its time and its value (scalars) or speed (points and
// colours, for the velocity graph).
struct KeyframeHandle {
  TickTime time = 0;
  double value = 0.0;
};

struct VelocitySample {
  TickTime time = 0;
  double velocity = 0.0;  // value units per second
};

// At a keyframe the rate of change may jump; the side says which segment answers.
enum class Approach : std::uint8_t { FromLeft, FromRight };

// The keyframes of one parameter, ordered by time, no two at the same time, all of one value kind
// (the kind of the first keyframe added; an empty curve takes any). A plain value: copies are
// independent; no messages, no undo (callers wrap edits in actions). Every edit either succeeds
// or changes nothing and says why. An edit of one keyframe costs O(n) for the vector shift and
// O(1) for refreshing the derived speeds and segments around it; MoveKeyframes rebuilds all.
//
// Evaluation: before the first keyframe the value is the first keyframe's, after the last the
// last's; at a keyframe's time it is that keyframe's value. Between keyframes k and k + 1:
// - k is Hold, or the kind does not interpolate (bool, choice, string, blob): k's value;
// - both sides straight (k Linear, k + 1 Linear or Hold): a straight line;
// - otherwise a cubic Bezier in (time, value) whose inner control points are the handles
//   (ComputeHandle): a straight side puts its handle on the straight line.
// Points and colours travel along a path (points: straight or curved by the spatial tangents;
// colours: straight in RGBA) and the temporal curve gives the distance travelled along it.
class KeyframeCurve {
 public:
  class Sampler;

  KeyframeCurve() = default;

  // Queries.
  bool IsEmpty() const { return mKeys.empty(); }
  std::size_t Size() const { return mKeys.size(); }
  const Keyframe& At(std::size_t index) const { return mKeys.at(index); }
  const std::vector<Keyframe>& Keyframes() const { return mKeys; }
  std::optional<ParamValueKind> Kind() const;

  std::optional<std::size_t> FindAt(TickTime time) const;
  std::optional<std::size_t> FindBefore(TickTime time) const;  // last keyframe with time < t
  std::optional<std::size_t> FindAfter(TickTime time) const;   // first keyframe with time > t
  std::optional<std::size_t> FindAtOrBefore(TickTime time) const;
  std::optional<std::size_t> FindAtOrAfter(TickTime time) const;
  std::optional<TickTime> NextKeyframeTime(TickTime time) const;      // first time > t
  std::optional<TickTime> PreviousKeyframeTime(TickTime time) const;  // last time < t
  // Indices of the keyframes with first <= time <= last.
  std::vector<std::size_t> FindInRange(TickTime first, TickTime last) const;

  // Edits. Influences are limited to [kMinimumInfluence, kMaximumInfluence]; derived fields (see
  // Keyframe) are recomputed, whatever the caller put in them.
  CurveStatus Add(const Keyframe& keyframe);  // fails on a duplicate time
  // Replaces the keyframe at the same time, or adds one. A continuous keyframe whose speeds
  // differ keeps the side that changed against the one it replaces (the outgoing side when both
  // or neither changed).
  CurveStatus AddOrReplace(const Keyframe& keyframe);
  // Replaces keyframe `index`; its time may change (the list is re-sorted).
  CurveStatus Replace(std::size_t index, const Keyframe& keyframe);
  CurveStatus Remove(std::size_t index);
  CurveStatus RemoveAt(TickTime time);
  void Clear();
  CurveStatus Move(std::size_t index, TickTime newTime);
  // Moves several keyframes by the same delta at once (a selection drag). Fails, changing
  // nothing, if a moved keyframe would land on one that stays or leave the storable range.
  // Duplicate indices are ignored.
  CurveStatus MoveKeyframes(const std::vector<std::size_t>& indices, TickTime delta);
  CurveStatus SetValue(std::size_t index, const ParamValue& value);
  // Turning a keyframe Bezier or ContinuousBezier starts from the speeds it had, so the curve
  // does not jump; turning it continuous averages its two speeds.
  CurveStatus SetTemporalInterpolation(std::size_t index, TemporalInterpolation mode);
  CurveStatus SetSpatialInterpolation(std::size_t index, SpatialInterpolation mode);
  // Sets the speed and influence of one side. A Linear, Hold or AutoBezier keyframe becomes
  // Bezier (a hand-set handle is no longer derived); a continuous one mirrors the speed to the
  // other side.
  CurveStatus SetEase(std::size_t index, KeyframeSide side, double speed, double influence);
  // Spatial tangent of one side (points only); a continuous keyframe turns the other tangent
  // to the opposite direction, keeping its length; Linear or AutoBezier becomes Bezier.
  CurveStatus SetSpatialTangent(std::size_t index, KeyframeSide side, ParamPoint tangent);
  // Ease In (side In) or Ease Out (side Out): that side's speed becomes 0 with the default
  // influence, and the keyframe becomes Bezier (its other side keeps the speed it had).
  CurveStatus ApplyAutomaticEase(std::size_t index, KeyframeSide side);

  // Evaluation. nullopt when the curve is empty.
  std::optional<ParamValue> ValueAt(TickTime time) const;
  // The scalar reading (AsScalar) of the value; nullopt when empty or not a scalar kind.
  std::optional<double> ScalarAt(TickTime time) const;
  // Rate of change in value units per second (points and colours: speed along the path); 0
  // before the first keyframe, after the last, on hold segments and for kinds that do not
  // interpolate.
  double VelocityAt(TickTime time, Approach approach = Approach::FromRight) const;
  // `count` samples evenly spaced from `from` to `to` inclusive (count >= 2; from < to), seen
  // from inside the span: the first sample approaches from the right, the last from the left.
  // Empty when the arguments make no span.
  std::vector<VelocitySample> CreateVelocitySegment(TickTime from, TickTime to, int count) const;
  // Exact extremes of the velocity over [from, to] (including both one-sided values at keyframes
  // inside); 0 for an empty curve or span.
  double GetMinimumVelocity(TickTime from, TickTime to) const;
  double GetMaximumVelocity(TickTime from, TickTime to) const;

  // The handle of one side of keyframe `index`: incoming needs a previous keyframe, outgoing a
  // next one. Time from GetEaseInTime/GetEaseOutTime; value from GetEaseInValue/GetEaseOutValue
  // for scalars, the side's speed for points and colours. nullopt when it does not exist.
  std::optional<KeyframeHandle> ComputeHandle(std::size_t index, KeyframeSide side) const;

  // Changes with every successful edit and is unique across all curves of the process: two
  // curves with the same revision hold the same keyframes (one was copied from the other).
  std::uint64_t Revision() const { return mRevision; }

  friend bool operator==(const KeyframeCurve& a, const KeyframeCurve& b) {
    return a.mKeys == b.mKeys;
  }

 private:
  friend class Sampler;

  // Points and colours: the temporal curve gives the distance travelled along their path.
  static bool IsPathKind(ParamValueKind kind);
  // Influences are kept to float precision, the precision the segments hold them in.
  static double ClampInfluence(double influence);

  CurveStatus Validate(Keyframe& keyframe, std::optional<std::size_t> ignoring) const;
  void InsertKey(std::size_t index, const Keyframe& keyframe);
  void EraseKey(std::size_t index);
  void InsertSlot(std::size_t segment);
  void EraseSlot(std::size_t segment);
  void RebuildAll();
  void Refresh(std::size_t first, std::size_t last);
  void RefreshTangents(std::size_t index);
  void RefreshPathLength(std::size_t segment);
  void RefreshSpeeds(std::size_t index);
  void RefreshSegment(std::size_t segment);
  double SegmentSlope(std::size_t segment) const;
  // The segment that answers for `time`: -1 before the first keyframe, Size() - 1 after the last.
  std::ptrdiff_t SegmentIndexFor(TickTime time, Approach approach) const;
  ParamValue SegmentValue(std::size_t segment, TickTime time) const;
  void VelocityExtremes(TickTime from, TickTime to, double* minimum, double* maximum) const;
  void Touch();

  std::vector<Keyframe> mKeys;
  std::vector<TickTime> mTimes;         // mTimes[k] == mKeys[k].time, compact for searching
  std::vector<CurveSegment> mSegments;  // mSegments[k] joins mKeys[k] and mKeys[k + 1]
  std::vector<CurveInverse> mInverses;  // beside mSegments, used by Bezier segments
  std::vector<double> mPathLengths;     // points and colours: length of segment k's path
  std::vector<CurvePath> mPaths;        // points: the path of segment k when it is curved
  std::uint64_t mRevision = 0;
};

// Evaluates a curve at many times, as a graph does pixel by pixel: remembers the segment of the
// last answer, so a time in that segment or within the next few keyframes (either way) costs O(1)
// and only a farther jump costs a binary search. Monotone sampling is thus O(1) per sample
// whether keyframes are sparse or denser than the samples. The curve must outlive the sampler; an
// edit of the curve is noticed (through its revision) and the cursor starts over. Not
// thread-safe; one sampler per thread.
class KeyframeCurve::Sampler {
 public:
  explicit Sampler(const KeyframeCurve& curve) : mCurve(&curve) {}

  std::optional<ParamValue> ValueAt(TickTime time);
  std::optional<double> ScalarAt(TickTime time);
  double VelocityAt(TickTime time, Approach approach = Approach::FromRight);
  // ScalarAt for many times at once, as a graph samples a row of pixels: values[i] is the
  // reading at times[i] (values holds at least as many as times). The segment is found once per
  // run of times that lie in it, which is where a graph's work goes. False, with the values
  // untouched, when the curve has no scalar reading (empty, points, colours, text, blobs).
  bool ScalarsAt(std::span<const TickTime> times, std::span<double> values);

 private:
  // The segment for `time`, or -1 before the first keyframe, Size() - 1 at or after the last.
  std::ptrdiff_t Locate(TickTime time, Approach approach);
  std::optional<double> ScalarAtSlowly(TickTime time);
  void Sync();

  // A sampler steps over at most this many keyframes before it falls back to a binary search.
  static constexpr std::size_t kCursorSteps = 4;

  const KeyframeCurve* mCurve;  // not owned; the caller keeps the curve alive
  std::uint64_t mRevision = ~std::uint64_t{0};
  std::size_t mSegment = 0;
  bool mScalarSegments = false;  // the curve's segments hold scalar values (not path distances)
};

// Inline so that a graph's sampling loop runs without calls in the common case: the time lies in
// the cursor's segment or one of the next few.
inline std::optional<double> KeyframeCurve::Sampler::ScalarAt(TickTime time) {
  const KeyframeCurve& curve = *mCurve;
  if (mRevision == curve.mRevision && mScalarSegments) {
    const std::size_t count = curve.mSegments.size();
    const TickTime* times = curve.mTimes.data();
    const std::size_t k = mSegment;
    if (k < count && times[k] <= time) {
      if (time < times[k + 1]) {
        return curve.mSegments[k].YInside(time, curve.mInverses[k]);
      }
      if (k + kCursorSteps <= count) {
        // Count the keyframes passed without branching, so irregular strides cost nothing.
        std::size_t j = k;
        for (std::size_t i = 1; i <= kCursorSteps; ++i) {
          j += times[k + i] <= time ? 1 : 0;
        }
        if (j < k + kCursorSteps) {
          mSegment = j;
          return curve.mSegments[j].YInside(time, curve.mInverses[j]);
        }
      }
    }
  }
  return ScalarAtSlowly(time);
}
