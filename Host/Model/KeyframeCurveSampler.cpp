// KeyframeCurve::Sampler: reading a curve at many nearby times with a cursor.
#include <algorithm>

#include "Host/Model/KeyframeCurve.h"

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
