#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "Host/Time/TickTime.h"

enum class TimecodeError {
  None,
  InvalidRate,          // the frame rate is not valid
  Empty,                // nothing but blanks
  BadCharacter,         // something other than digits, ':' ';' and a leading sign
  BadFieldCount,        // fewer than 2 or more than 4 fields
  EmptyField,           // two separators in a row, or a separator at an end
  FieldOutOfRange,      // minutes or seconds above 59, frames at or above the timecode base
  DropFrameNotAllowed,  // ';' given for a rate that has no drop-frame timecode
  DroppedFrameNumber,   // a frame label that drop-frame timecode skips (e.g. 00:01:00;00)
  OutOfRange,           // the time does not fit between kTime_Min and kTime_Max
};

struct TimecodeParseResult {
  std::optional<TickTime> time;  // set on success
  TimecodeError error = TimecodeError::None;
  std::string message;  // for the user; empty on success

  bool Ok() const { return time.has_value(); }
};

// A frame rate held as the exact duration of one frame in ticks, with how its frames are labelled
// in timecode. Video rates label frames by their nominal rate (23.976 counts 0..23, 29.97 counts
// 0..29); 29.97 and 59.94 may use drop-frame labels. Audio rates ("audio time units") count
// samples. Any positive tick count is a valid rate, so a rate can also describe one pixel of a
// zoomed time line. A default-constructed rate is invalid: conversions give 0 and parsing fails.
class FrameRate {
 public:
  constexpr FrameRate() = default;

  // nullopt unless ticksPerFrame > 0 (and drop-frame is only asked of 29.97 or 59.94).
  static std::optional<FrameRate> FromTicksPerFrame(TickTime ticksPerFrame, bool dropFrame = false);
  // Recognises the 1001-based rates (23.976, 29.97, 47.952, 59.94) within 0.01 fps and makes them
  // exact; other rates are rounded to whole ticks. nullopt for non-finite or non-positive input.
  static std::optional<FrameRate> FromFramesPerSecond(double fps, bool dropFrame = false);
  // One frame lasting `seconds` (rounded to whole ticks, at least one tick).
  static std::optional<FrameRate> FromSecondsPerFrame(double seconds);
  // Audio time units: one frame per sample. nullopt unless the rate divides kTicksPerSecond.
  static std::optional<FrameRate> FromSampleRate(std::int32_t samplesPerSecond);

  bool IsValid() const { return mTicksPerFrame > 0; }
  TickTime GetTicksPerFrame() const { return mTicksPerFrame; }
  double GetFramesPerSecond() const;
  bool IsDropFrame() const { return mDropFrame; }
  bool IsAudio() const { return mAudio; }
  // Frames per labelled second in timecode: 24 for 23.976, 30 for 29.97, 48000 for 48 kHz audio.
  std::int64_t GetTimecodeBase() const { return mTimecodeBase; }

  // Start of the frame that contains `time` (toward minus infinity).
  TickTime AlignToFrame(TickTime time) const;
  // Nearest frame boundary; halfway rounds up.
  TickTime AlignToNearestFrame(TickTime time) const;
  bool IsFrameAligned(TickTime time) const;

  // "hh:mm:ss:ff" of the frame containing `time`; drop-frame rates use ';' before the frames;
  // audio rates print the sample number with as many digits as the largest one needs; negative
  // times get a leading '-'; hours are not wrapped at 24. Empty for an invalid rate.
  std::string FormatTimecode(TickTime time) const;
  // Accepts "[+-]hh:mm:ss:ff", "mm:ss:ff" or "ss:ff" with blanks around. ';' (anywhere) asks for
  // drop-frame labels and is only valid for a drop-frame rate; a drop-frame rate reads ':' as
  // drop-frame too. Never throws.
  TimecodeParseResult ParseTimecode(std::string_view text) const;

  friend bool operator==(const FrameRate&, const FrameRate&) = default;

 private:
  constexpr FrameRate(TickTime ticksPerFrame, std::int64_t timecodeBase, bool dropFrame, bool audio)
      : mTicksPerFrame(ticksPerFrame),
        mTimecodeBase(timecodeBase),
        mDropFrame(dropFrame),
        mAudio(audio) {}
  friend struct FrameRateConstants;

  TickTime mTicksPerFrame = 0;
  std::int64_t mTimecodeBase = 0;
  bool mDropFrame = false;
  bool mAudio = false;
};

// The common rates, exact in ticks.
struct FrameRateConstants {
  static constexpr FrameRate Make(TickTime ticks, std::int64_t base, bool dropFrame, bool audio) {
    return FrameRate(ticks, base, dropFrame, audio);
  }
};

inline constexpr FrameRate kFrameRate_23976 =
    FrameRateConstants::Make(10594584000, 24, false, false);
inline constexpr FrameRate kFrameRate_24 = FrameRateConstants::Make(10584000000, 24, false, false);
inline constexpr FrameRate kFrameRate_25 = FrameRateConstants::Make(10160640000, 25, false, false);
inline constexpr FrameRate kFrameRate_2997_NDF =
    FrameRateConstants::Make(8475667200, 30, false, false);
inline constexpr FrameRate kFrameRate_2997_DF =
    FrameRateConstants::Make(8475667200, 30, true, false);
inline constexpr FrameRate kFrameRate_30 = FrameRateConstants::Make(8467200000, 30, false, false);
inline constexpr FrameRate kFrameRate_50 = FrameRateConstants::Make(5080320000, 50, false, false);
inline constexpr FrameRate kFrameRate_5994_NDF =
    FrameRateConstants::Make(4237833600, 60, false, false);
inline constexpr FrameRate kFrameRate_5994_DF =
    FrameRateConstants::Make(4237833600, 60, true, false);
inline constexpr FrameRate kFrameRate_60 = FrameRateConstants::Make(4233600000, 60, false, false);
inline constexpr FrameRate kFrameRate_Audio44100 =
    FrameRateConstants::Make(5760000, 44100, false, true);
inline constexpr FrameRate kFrameRate_Audio48000 =
    FrameRateConstants::Make(5292000, 48000, false, true);
inline constexpr FrameRate kFrameRate_Audio96000 =
    FrameRateConstants::Make(2646000, 96000, false, true);
