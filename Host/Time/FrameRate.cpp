#include "Host/Time/FrameRate.h"

#include <cctype>
#include <cmath>
#include <vector>

namespace {

constexpr TickTime k2997Ticks = 8475667200;
constexpr TickTime k5994Ticks = 4237833600;

bool CanDropFrame(TickTime ticksPerFrame) {
  return ticksPerFrame == k2997Ticks || ticksPerFrame == k5994Ticks;
}

std::int64_t TimecodeBaseFor(TickTime ticksPerFrame) {
  const double fps = static_cast<double>(kTicksPerSecond) / static_cast<double>(ticksPerFrame);
  const double base = std::round(fps);
  return base < 1.0 ? 1 : static_cast<std::int64_t>(base);
}

// Labels skipped at the start of every minute not divisible by ten: 2 at 29.97, 4 at 59.94.
std::int64_t DroppedPerMinute(std::int64_t base) {
  return base / 15;
}

int Digits(std::int64_t value) {
  int digits = 1;
  while (value >= 10) {
    value /= 10;
    ++digits;
  }
  return digits;
}

void AppendPadded(std::string& text, std::uint64_t value, int width) {
  const std::string digits = std::to_string(value);
  if (static_cast<int>(digits.size()) < width) {
    text.append(static_cast<std::size_t>(width) - digits.size(), '0');
  }
  text += digits;
}

TimecodeParseResult Failure(TimecodeError error, std::string message) {
  TimecodeParseResult result;
  result.error = error;
  result.message = std::move(message);
  return result;
}

}  // namespace

std::optional<FrameRate> FrameRate::FromTicksPerFrame(TickTime ticksPerFrame, bool dropFrame) {
  if (ticksPerFrame <= 0 || (dropFrame && !CanDropFrame(ticksPerFrame))) {
    return std::nullopt;
  }
  return FrameRate(ticksPerFrame, TimecodeBaseFor(ticksPerFrame), dropFrame, false);
}

std::optional<FrameRate> FrameRate::FromFramesPerSecond(double fps, bool dropFrame) {
  if (!std::isfinite(fps) || fps <= 0.0) {
    return std::nullopt;
  }
  for (const std::int64_t nominal : {24, 30, 48, 60, 120}) {
    const double rate = static_cast<double>(nominal) * 1000.0 / 1001.0;
    if (std::fabs(fps - rate) < 0.01) {
      return FromTicksPerFrame(kTicksPerSecond / (nominal * 1000) * 1001, dropFrame);
    }
  }
  const double ticks = std::round(static_cast<double>(kTicksPerSecond) / fps);
  if (ticks < 1.0) {
    return std::nullopt;
  }
  return FromTicksPerFrame(static_cast<TickTime>(ticks), dropFrame);
}

std::optional<FrameRate> FrameRate::FromSecondsPerFrame(double seconds) {
  if (!std::isfinite(seconds) || seconds <= 0.0) {
    return std::nullopt;
  }
  const double ticks = std::round(seconds * static_cast<double>(kTicksPerSecond));
  if (ticks >= static_cast<double>(kTime_Max)) {
    return FromTicksPerFrame(kTime_Max);
  }
  return FromTicksPerFrame(ticks < 1.0 ? 1 : static_cast<TickTime>(ticks));
}

std::optional<FrameRate> FrameRate::FromSampleRate(std::int32_t samplesPerSecond) {
  if (samplesPerSecond <= 0 || kTicksPerSecond % samplesPerSecond != 0) {
    return std::nullopt;
  }
  return FrameRate(kTicksPerSecond / samplesPerSecond, samplesPerSecond, false, true);
}

double FrameRate::GetFramesPerSecond() const {
  if (!IsValid()) {
    return 0.0;
  }
  return static_cast<double>(kTicksPerSecond) / static_cast<double>(mTicksPerFrame);
}

TickTime FrameRate::AlignToFrame(TickTime time) const {
  return FrameToTime(ToFrame(time, *this), *this);
}

TickTime FrameRate::AlignToNearestFrame(TickTime time) const {
  if (!IsValid()) {
    return time;
  }
  const std::int64_t frame = ToFrame(time, *this);
  const TickTime start = FrameToTime(frame, *this);
  // time - start lies in [0, ticks per frame), no overflow.
  const TickTime into = time - start;
  return into >= mTicksPerFrame - into ? FrameToTime(frame + 1, *this) : start;
}

bool FrameRate::IsFrameAligned(TickTime time) const {
  return IsValid() && time % mTicksPerFrame == 0;
}

std::string FrameRate::FormatTimecode(TickTime time) const {
  if (!IsValid()) {
    return {};
  }
  const std::int64_t frame = ToFrame(time, *this);
  const bool negative = frame < 0;
  // The magnitude of the smallest 64-bit value does not fit a signed 64-bit number.
  std::uint64_t label =
      negative ? 0 - static_cast<std::uint64_t>(frame) : static_cast<std::uint64_t>(frame);
  const auto base = static_cast<std::uint64_t>(mTimecodeBase);
  if (mDropFrame) {
    const std::uint64_t drop = static_cast<std::uint64_t>(DroppedPerMinute(mTimecodeBase));
    const std::uint64_t perTenMinutes = base * 600 - drop * 9;
    const std::uint64_t perMinute = base * 60 - drop;
    const std::uint64_t tens = label / perTenMinutes;
    const std::uint64_t rest = label % perTenMinutes;
    label += drop * 9 * tens;
    if (rest > drop) {
      label += drop * ((rest - drop) / perMinute);
    }
  }
  const std::uint64_t frames = label % base;
  const std::uint64_t totalSeconds = label / base;
  const std::uint64_t seconds = totalSeconds % 60;
  const std::uint64_t minutes = (totalSeconds / 60) % 60;
  const std::uint64_t hours = totalSeconds / 3600;
  const int frameDigits = std::max(2, Digits(mTimecodeBase - 1));
  std::string text = negative ? "-" : "";
  AppendPadded(text, hours, 2);
  text += ':';
  AppendPadded(text, minutes, 2);
  text += ':';
  AppendPadded(text, seconds, 2);
  text += mDropFrame ? ';' : ':';
  AppendPadded(text, frames, frameDigits);
  return text;
}

TimecodeParseResult FrameRate::ParseTimecode(std::string_view text) const {
  std::string quoted;
  quoted += '"';
  quoted.append(text);
  quoted += '"';
  if (!IsValid()) {
    return Failure(TimecodeError::InvalidRate, "No valid frame rate to read " + quoted);
  }
  while (!text.empty() && std::isspace(static_cast<unsigned char>(text.front()))) {
    text.remove_prefix(1);
  }
  while (!text.empty() && std::isspace(static_cast<unsigned char>(text.back()))) {
    text.remove_suffix(1);
  }
  if (text.empty()) {
    return Failure(TimecodeError::Empty, "Enter a timecode such as 00:00:01:00");
  }
  bool negative = false;
  if (text.front() == '-' || text.front() == '+') {
    negative = text.front() == '-';
    text.remove_prefix(1);
  }

  // Fields are read as at most 18 digits, so a field fits in 64 bits.
  std::vector<std::int64_t> fields;
  bool dropFrameAsked = false;
  std::int64_t field = 0;
  int digits = 0;
  for (const char c : text) {
    if (c >= '0' && c <= '9') {
      if (++digits > 18) {
        return Failure(TimecodeError::OutOfRange, "Timecode " + quoted + " is too large");
      }
      field = field * 10 + (c - '0');
    } else if (c == ':' || c == ';') {
      if (digits == 0) {
        return Failure(TimecodeError::EmptyField, "Timecode " + quoted + " has an empty field");
      }
      dropFrameAsked = dropFrameAsked || c == ';';
      fields.push_back(field);
      field = 0;
      digits = 0;
    } else {
      return Failure(TimecodeError::BadCharacter,
                     "Timecode " + quoted + " may only hold digits, ':' and ';'");
    }
  }
  if (digits == 0) {
    return Failure(TimecodeError::EmptyField, "Timecode " + quoted + " has an empty field");
  }
  fields.push_back(field);
  if (fields.size() < 2 || fields.size() > 4) {
    return Failure(TimecodeError::BadFieldCount,
                   "Timecode " + quoted + " must have the form hh:mm:ss:ff");
  }
  if (dropFrameAsked && !mDropFrame) {
    return Failure(TimecodeError::DropFrameNotAllowed,
                   "Drop-frame timecode " + quoted + " needs a 29.97 or 59.94 drop-frame rate");
  }
  fields.insert(fields.begin(), 4 - fields.size(), 0);
  const std::int64_t hours = fields[0];
  const std::int64_t minutes = fields[1];
  const std::int64_t seconds = fields[2];
  const std::int64_t frames = fields[3];
  if (minutes > 59 || seconds > 59) {
    return Failure(TimecodeError::FieldOutOfRange,
                   "Minutes and seconds of " + quoted + " must be 0 to 59");
  }
  if (frames >= mTimecodeBase) {
    return Failure(TimecodeError::FieldOutOfRange,
                   "Frames of " + quoted + " must be 0 to " + std::to_string(mTimecodeBase - 1));
  }
  const std::int64_t drop = mDropFrame ? DroppedPerMinute(mTimecodeBase) : 0;
  if (mDropFrame && seconds == 0 && frames < drop && minutes % 10 != 0) {
    return Failure(TimecodeError::DroppedFrameNumber, "Drop-frame timecode skips " + quoted +
                                                          "; the minute starts at frame " +
                                                          std::to_string(drop));
  }

  // frame = ((h * 60 + m) * 60 + s) * base + f - drop * (totalMinutes - totalMinutes / 10)
  std::int64_t totalMinutes = 0;
  std::int64_t label = 0;
  std::int64_t frame = 0;
  TickTime time = 0;
  const bool overflow =
      __builtin_mul_overflow(hours, std::int64_t{60}, &totalMinutes) ||
      __builtin_add_overflow(totalMinutes, minutes, &totalMinutes) ||
      __builtin_mul_overflow(totalMinutes, std::int64_t{60}, &label) ||
      __builtin_add_overflow(label, seconds, &label) ||
      __builtin_mul_overflow(label, mTimecodeBase, &label) ||
      __builtin_add_overflow(label, frames, &label) ||
      __builtin_sub_overflow(label, drop * (totalMinutes - totalMinutes / 10), &frame) ||
      __builtin_mul_overflow(frame, mTicksPerFrame, &time);
  if (overflow || !IsStorableTime(time)) {
    return Failure(TimecodeError::OutOfRange, "Timecode " + quoted + " is too large");
  }
  TimecodeParseResult result;
  result.time = negative ? -time : time;
  return result;
}
