#include "Host/Toolkit/HotTimecodeControl.h"

#include <algorithm>
#include <cmath>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/ControlMessages.h"

namespace {

// Digits a frame number needs at `rate` (2 for 30 fps, 5 for 48 kHz samples).
std::size_t FrameDigits(const FrameRate& rate) {
  std::size_t digits = 1;
  for (std::int64_t largest = rate.GetTimecodeBase() - 1; largest >= 10; largest /= 10) {
    ++digits;
  }
  return std::max<std::size_t>(digits, 2);
}

// "1000" -> "00:00:10:00"; nullopt when `text` is not a signed run of digits.
std::optional<std::string> DigitsToTimecode(std::string_view text, const FrameRate& rate) {
  std::string sign;
  if (!text.empty() && (text.front() == '-' || text.front() == '+')) {
    sign = std::string(1, text.front());
    text.remove_prefix(1);
  }
  if (text.empty() || text.find_first_not_of("0123456789") != std::string_view::npos) {
    return std::nullopt;
  }
  const std::size_t frameDigits = FrameDigits(rate);
  std::string digits(text);
  if (digits.size() < frameDigits + 6) {
    digits.insert(0, frameDigits + 6 - digits.size(), '0');
  }
  const std::size_t hoursLength = digits.size() - frameDigits - 4;
  return sign + digits.substr(0, hoursLength) + ":" + digits.substr(hoursLength, 2) + ":" +
         digits.substr(hoursLength + 2, 2) + ":" + digits.substr(hoursLength + 4);
}

}  // namespace

HotTimecodeControl::HotTimecodeControl(const Rect& bounds, const FrameRate& displayRate,
                                       TickTime time, Commander* commander)
    : HotTextControl("HotTimecodeControl", commander),
      mRate(displayRate.IsValid() ? displayRate : kFrameRate_30) {
  SetBounds(bounds);
  SetTime(time, false);
}

TickTime HotTimecodeControl::Normalize(TickTime time) const {
  if (mQuantize && mQuantize->IsValid()) {
    time = mQuantize->AlignToNearestFrame(time);
  }
  return std::max(mMin, std::min(time, mMax));
}

void HotTimecodeControl::SetTime(TickTime time, bool redraw) {
  const TickTime normalized = Normalize(time);
  if (normalized != mTime) {
    mTime = normalized;
    if (redraw) {
      Invalidate();
    }
  }
}

void HotTimecodeControl::SetFrameRate(const FrameRate& rate) {
  if (HOST_VERIFY(rate.IsValid(), "Invalid frame rate")) {
    mRate = rate;
    Invalidate();
  }
}

void HotTimecodeControl::SetQuantizeFrameRate(std::optional<FrameRate> rate) {
  if (rate && !HOST_VERIFY(rate->IsValid(), "Invalid frame rate")) {
    return;
  }
  mQuantize = rate;
  SetTime(mTime);
}

void HotTimecodeControl::SetZeroPoint(TickTime zeroPoint) {
  mZeroPoint = zeroPoint;
  Invalidate();
}

void HotTimecodeControl::SetMinTime(TickTime minimum) {
  mMin = minimum;
  SetTime(mTime);
}

void HotTimecodeControl::SetMaxTime(TickTime maximum) {
  mMax = maximum;
  SetTime(mTime);
}

std::string HotTimecodeControl::GetDisplayText() const {
  return mRate.FormatTimecode(AddTimes(mTime, mZeroPoint));
}

std::optional<TickTime> HotTimecodeControl::ParseText(std::string_view text) const {
  while (!text.empty() && (text.front() == ' ' || text.front() == '\t')) {
    text.remove_prefix(1);
  }
  while (!text.empty() && (text.back() == ' ' || text.back() == '\t')) {
    text.remove_suffix(1);
  }
  TimecodeParseResult result;
  if (const std::optional<std::string> expanded = DigitsToTimecode(text, mRate)) {
    result = mRate.ParseTimecode(*expanded);
  } else {
    result = mRate.ParseTimecode(text);
  }
  if (!result.Ok()) {
    return std::nullopt;
  }
  return Normalize(SubtractTimes(*result.time, mZeroPoint));
}

bool HotTimecodeControl::ApplyUserTime(TickTime time) {
  const TickTime normalized = Normalize(time);
  if (normalized == mTime) {
    return false;
  }
  mTime = normalized;
  Invalidate();
  return true;
}

bool HotTimecodeControl::CommitTextSelf(std::string_view text) {
  const std::optional<TickTime> time = ParseText(text);
  if (!time) {
    return false;
  }
  if (ApplyUserTime(*time)) {
    Broadcast(HotTimecodeValueChangedMessage(mTime, GetOwnerCookie()));
  }
  return true;
}

TickTime HotTimecodeControl::StepDuration() const {
  return mQuantize ? mQuantize->GetTicksPerFrame() : mRate.GetTicksPerFrame();
}

void HotTimecodeControl::BeginScrubSelf() {
  mScrubStart = mTime;
  mSentChanging = false;
}

void HotTimecodeControl::ScrubSelf(double units) {
  // Whole frames only: with Ctrl, ten pixels make one frame.
  const auto frames = static_cast<TickTime>(std::trunc(std::clamp(units, -1e9, 1e9)));
  if (ApplyUserTime(AddTimes(mScrubStart, frames * StepDuration()))) {
    mSentChanging = true;
    Broadcast(HotTimecodeValueChangingMessage(mTime, GetOwnerCookie()));
  }
}

void HotTimecodeControl::EndScrubSelf() {
  if (mSentChanging) {
    mSentChanging = false;
    Broadcast(HotTimecodeValueChangedMessage(mTime, GetOwnerCookie()));
  }
}

void HotTimecodeControl::StepSelf(double units) {
  const auto frames = static_cast<TickTime>(units);
  if (ApplyUserTime(AddTimes(mTime, frames * StepDuration()))) {
    Broadcast(HotTimecodeValueChangedMessage(mTime, GetOwnerCookie()));
  }
}
