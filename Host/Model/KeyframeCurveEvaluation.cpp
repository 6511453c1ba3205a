// Reading a curve: values, velocities and handles at a time.
#include <algorithm>
#include <cmath>

#include "Host/Model/KeyframeCurve.h"

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
