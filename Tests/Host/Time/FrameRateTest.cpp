#include <gtest/gtest.h>

#include <cmath>
#include <limits>

#include "Host/Time/FrameRate.h"

namespace {

TEST(FrameRate, StandardRatesAreExactInTicks) {
  EXPECT_DOUBLE_EQ(kFrameRate_24.GetFramesPerSecond(), 24.0);
  EXPECT_DOUBLE_EQ(kFrameRate_25.GetFramesPerSecond(), 25.0);
  EXPECT_NEAR(kFrameRate_23976.GetFramesPerSecond(), 24000.0 / 1001.0, 1e-12);
  EXPECT_NEAR(kFrameRate_2997_DF.GetFramesPerSecond(), 30000.0 / 1001.0, 1e-12);
  EXPECT_NEAR(kFrameRate_5994_NDF.GetFramesPerSecond(), 60000.0 / 1001.0, 1e-12);
  // 1001 seconds of 29.97 are exactly 30000 frames.
  EXPECT_EQ(kFrameRate_2997_NDF.GetTicksPerFrame() * 30000, 1001 * kTicksPerSecond);
  EXPECT_EQ(kFrameRate_Audio48000.GetTicksPerFrame() * 48000, kTicksPerSecond);
  EXPECT_EQ(kFrameRate_Audio44100.GetTicksPerFrame() * 44100, kTicksPerSecond);
  EXPECT_TRUE(kFrameRate_Audio48000.IsAudio());
  EXPECT_FALSE(kFrameRate_25.IsAudio());
}

TEST(FrameRate, FactoriesRecogniseTheStandardRates) {
  EXPECT_EQ(FrameRate::FromFramesPerSecond(23.976), kFrameRate_23976);
  EXPECT_EQ(FrameRate::FromFramesPerSecond(29.97, true), kFrameRate_2997_DF);
  EXPECT_EQ(FrameRate::FromFramesPerSecond(59.94), kFrameRate_5994_NDF);
  EXPECT_EQ(FrameRate::FromFramesPerSecond(25.0), kFrameRate_25);
  EXPECT_EQ(FrameRate::FromTicksPerFrame(kFrameRate_30.GetTicksPerFrame()), kFrameRate_30);
  EXPECT_EQ(FrameRate::FromSampleRate(48000), kFrameRate_Audio48000);
  EXPECT_EQ(FrameRate::FromSampleRate(44100), kFrameRate_Audio44100);
}

TEST(FrameRate, FactoriesRefuseWhatCannotBeARate) {
  EXPECT_FALSE(FrameRate::FromTicksPerFrame(0));
  EXPECT_FALSE(FrameRate::FromTicksPerFrame(-5));
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(0.0));
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(-24.0));
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(std::nan("")));
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(std::numeric_limits<double>::infinity()));
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(1e15));  // shorter than a tick
  EXPECT_FALSE(FrameRate::FromSecondsPerFrame(0.0));
  EXPECT_FALSE(FrameRate::FromSecondsPerFrame(std::nan("")));
  EXPECT_FALSE(FrameRate::FromSampleRate(0));
  EXPECT_FALSE(FrameRate::FromSampleRate(44101));  // does not divide a second into ticks
  // Drop-frame labels exist only for 29.97 and 59.94.
  EXPECT_FALSE(FrameRate::FromFramesPerSecond(25.0, true));
  EXPECT_FALSE(FrameRate::FromTicksPerFrame(kFrameRate_30.GetTicksPerFrame(), true));
  EXPECT_FALSE(FrameRate().IsValid());
}

TEST(FrameRate, PixelRateKeepsAtLeastOneTick) {
  const FrameRate pixel = *FrameRate::FromSecondsPerFrame(0.01);
  EXPECT_EQ(pixel.GetTicksPerFrame(), kTicksPerSecond / 100);
  EXPECT_EQ(FrameRate::FromSecondsPerFrame(1e-20)->GetTicksPerFrame(), 1);
  EXPECT_EQ(ToFrame(kTicksPerSecond, pixel), 100);
}

TEST(FrameRate, AlignsToFrameBoundaries) {
  const TickTime frame = kFrameRate_25.GetTicksPerFrame();
  EXPECT_EQ(kFrameRate_25.AlignToFrame(frame + 1), frame);
  EXPECT_EQ(kFrameRate_25.AlignToFrame(-1), -frame);
  EXPECT_EQ(kFrameRate_25.AlignToNearestFrame(frame + frame / 2 - 1), frame);
  EXPECT_EQ(kFrameRate_25.AlignToNearestFrame(frame + frame / 2), 2 * frame);
  EXPECT_EQ(kFrameRate_25.AlignToNearestFrame(-frame / 2 - 1), -frame);
  EXPECT_TRUE(kFrameRate_25.IsFrameAligned(-3 * frame));
  EXPECT_FALSE(kFrameRate_25.IsFrameAligned(frame + 1));
  EXPECT_FALSE(FrameRate().IsFrameAligned(0));
}

TEST(FrameRate, FormatsNonDropTimecode) {
  const TickTime frame = kFrameRate_25.GetTicksPerFrame();
  const TickTime time = ((1 * 3600 + 2 * 60 + 3) * 25 + 4) * frame;
  EXPECT_EQ(kFrameRate_25.FormatTimecode(time), "01:02:03:04");
  EXPECT_EQ(kFrameRate_25.FormatTimecode(time + frame - 1), "01:02:03:04");
  EXPECT_EQ(kFrameRate_25.FormatTimecode(0), "00:00:00:00");
  EXPECT_EQ(kFrameRate_25.FormatTimecode(-1), "-00:00:00:01");
  EXPECT_EQ(kFrameRate_25.FormatTimecode(200 * 3600 * kTicksPerSecond), "200:00:00:00");
  // 23.976 labels frames as 24 per second: one hour of labels is 86400 frames.
  EXPECT_EQ(kFrameRate_23976.FormatTimecode(FrameToTime(86400, kFrameRate_23976)), "01:00:00:00");
  EXPECT_EQ(FrameRate().FormatTimecode(0), "");
}

TEST(FrameRate, FormatsDropFrameTimecode) {
  auto format = [](std::int64_t frame, const FrameRate& rate) {
    return rate.FormatTimecode(FrameToTime(frame, rate));
  };
  EXPECT_EQ(format(1799, kFrameRate_2997_DF), "00:00:59;29");
  EXPECT_EQ(format(1800, kFrameRate_2997_DF), "00:01:00;02");   // ;00 and ;01 are skipped
  EXPECT_EQ(format(17982, kFrameRate_2997_DF), "00:10:00;00");  // every tenth minute keeps them
  EXPECT_EQ(format(107892, kFrameRate_2997_DF), "01:00:00;00");
  EXPECT_EQ(format(3600, kFrameRate_5994_DF), "00:01:00;04");  // 59.94 skips four
  EXPECT_EQ(format(1800, kFrameRate_2997_NDF), "00:01:00:00");
}

TEST(FrameRate, FormatsAudioSamples) {
  EXPECT_EQ(kFrameRate_Audio48000.FormatTimecode(kTicksPerSecond + 5 * 5292000), "00:00:01:00005");
  EXPECT_EQ(kFrameRate_Audio44100.FormatTimecode(kTicksPerSecond - 1), "00:00:00:44099");
}

TEST(FrameRate, ParsesWhatItFormats) {
  for (const FrameRate& rate :
       {kFrameRate_23976, kFrameRate_25, kFrameRate_2997_DF, kFrameRate_2997_NDF,
        kFrameRate_5994_DF, kFrameRate_60, kFrameRate_Audio48000}) {
    for (const std::int64_t frame :
         {0LL, 1LL, 1799LL, 1800LL, 17982LL, 107892LL, 123456789LL, -1LL, -1800LL}) {
      const TickTime time = FrameToTime(frame, rate);
      const TimecodeParseResult parsed = rate.ParseTimecode(rate.FormatTimecode(time));
      ASSERT_TRUE(parsed.Ok()) << rate.FormatTimecode(time) << ": " << parsed.message;
      EXPECT_EQ(*parsed.time, time) << rate.FormatTimecode(time);
    }
  }
}

TEST(FrameRate, DropFrameLabelsRoundTripForTwentyMinutes) {
  for (std::int64_t frame = 0; frame < 20 * 60 * 30; ++frame) {
    const TickTime time = FrameToTime(frame, kFrameRate_2997_DF);
    const std::string text = kFrameRate_2997_DF.FormatTimecode(time);
    const TimecodeParseResult parsed = kFrameRate_2997_DF.ParseTimecode(text);
    ASSERT_TRUE(parsed.Ok()) << text;
    ASSERT_EQ(*parsed.time, time) << text;
  }
}

TEST(FrameRate, ParsesShortFormsSignsAndBlanks) {
  const TickTime frame = kFrameRate_25.GetTicksPerFrame();
  EXPECT_EQ(kFrameRate_25.ParseTimecode("10:05").time, 255 * frame);
  EXPECT_EQ(kFrameRate_25.ParseTimecode("1:00:00").time, 60 * 25 * frame);
  EXPECT_EQ(kFrameRate_25.ParseTimecode("  -00:00:01:00 ").time, -25 * frame);
  EXPECT_EQ(kFrameRate_25.ParseTimecode("+00:00:01:00").time, 25 * frame);
  // A drop-frame rate reads ':' as drop-frame too.
  EXPECT_EQ(kFrameRate_2997_DF.ParseTimecode("00:01:00:02").time,
            FrameToTime(1800, kFrameRate_2997_DF));
}

TEST(FrameRate, RefusesBadTimecodeWithAReason) {
  struct Case {
    const FrameRate& rate;
    const char* text;
    TimecodeError error;
  };
  const FrameRate invalid;
  const Case cases[] = {
      {kFrameRate_25, "", TimecodeError::Empty},
      {kFrameRate_25, "   ", TimecodeError::Empty},
      {kFrameRate_25, "aa:bb:cc:dd", TimecodeError::BadCharacter},
      {kFrameRate_25, "00:00:00.00", TimecodeError::BadCharacter},
      {kFrameRate_25, "--00:00:01:00", TimecodeError::BadCharacter},
      {kFrameRate_25, "00::00:00", TimecodeError::EmptyField},
      {kFrameRate_25, "00:00:00:", TimecodeError::EmptyField},
      {kFrameRate_25, ":00:00:00", TimecodeError::EmptyField},
      {kFrameRate_25, "-", TimecodeError::EmptyField},
      {kFrameRate_25, "12", TimecodeError::BadFieldCount},
      {kFrameRate_25, "1:2:3:4:5", TimecodeError::BadFieldCount},
      {kFrameRate_25, "00:60:00:00", TimecodeError::FieldOutOfRange},
      {kFrameRate_25, "00:00:60:00", TimecodeError::FieldOutOfRange},
      {kFrameRate_25, "00:00:00:25", TimecodeError::FieldOutOfRange},
      {kFrameRate_25, "00:00:00;10", TimecodeError::DropFrameNotAllowed},
      {kFrameRate_2997_NDF, "00:00:00;10", TimecodeError::DropFrameNotAllowed},
      {kFrameRate_2997_DF, "00:01:00;00", TimecodeError::DroppedFrameNumber},
      {kFrameRate_2997_DF, "00:01:00;01", TimecodeError::DroppedFrameNumber},
      {kFrameRate_5994_DF, "00:09:00;03", TimecodeError::DroppedFrameNumber},
      {kFrameRate_25, "9999999999999999:00:00:00", TimecodeError::OutOfRange},
      {kFrameRate_25, "1234567890123456789012:00:00:00", TimecodeError::OutOfRange},
      {kFrameRate_25, "250000:00:00:00", TimecodeError::OutOfRange},
      {invalid, "00:00:00:00", TimecodeError::InvalidRate},
  };
  for (const Case& c : cases) {
    const TimecodeParseResult result = c.rate.ParseTimecode(c.text);
    EXPECT_FALSE(result.Ok()) << c.text;
    EXPECT_EQ(result.error, c.error) << c.text << ": " << result.message;
    EXPECT_FALSE(result.message.empty()) << c.text;
  }
  // The tenth minute keeps its first labels.
  EXPECT_TRUE(kFrameRate_2997_DF.ParseTimecode("00:10:00;00").Ok());
}

}  // namespace
