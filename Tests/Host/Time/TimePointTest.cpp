#include <gtest/gtest.h>

#include <concepts>
#include <type_traits>

#include "Host/Time/TimePoint.h"

namespace {

template <typename A, typename B>
concept Addable = requires(A a, B b) {
  a + b;
};
template <typename A, typename B>
concept Subtractable = requires(A a, B b) {
  a - b;
};

// What the types are for: a time of one line never passes for a time of the other, nor for bare
// ticks, without saying so. The positive cases show the checks themselves can tell.
static_assert(!std::is_convertible_v<ClipTime, SequenceTime>);
static_assert(!std::is_convertible_v<SequenceTime, ClipTime>);
static_assert(!std::is_constructible_v<SequenceTime, ClipTime>);
static_assert(!std::is_convertible_v<TickTime, ClipTime>);
static_assert(!std::is_convertible_v<ClipTime, TickTime>);
static_assert(std::is_constructible_v<ClipTime, TickTime>);
static_assert(!std::equality_comparable_with<ClipTime, SequenceTime>);
static_assert(!std::equality_comparable_with<SequenceTime, TickTime>);
static_assert(std::totally_ordered<SequenceTime>);
static_assert(!Subtractable<ClipTime, SequenceTime>);
static_assert(!Addable<SequenceTime, ClipTime>);
static_assert(!Addable<ClipTime, ClipTime>);
static_assert(Addable<ClipTime, TickTime>);
static_assert(std::same_as<decltype(ClipTime() - ClipTime()), TickTime>);
static_assert(std::same_as<decltype(SequenceTime() - TickTime()), SequenceTime>);

TEST(TimePoint, MovesByADurationAndKeepsItsLine) {
  const SequenceTime start(10 * kTicksPerSecond);
  EXPECT_EQ((start + kTicksPerSecond).Ticks(), 11 * kTicksPerSecond);
  EXPECT_EQ((start - 12 * kTicksPerSecond).Ticks(), -2 * kTicksPerSecond);
  EXPECT_EQ(SequenceTime().Ticks(), kTime_Zero);
}

TEST(TimePoint, TwoTimesOfOneLineDifferByASignedDuration) {
  const ClipTime early(3);
  const ClipTime late(8);
  EXPECT_EQ(late - early, 5);
  EXPECT_EQ(early - late, -5);
  EXPECT_EQ(early + (late - early), late);
}

TEST(TimePoint, OrdersLikeItsTicks) {
  EXPECT_LT(ClipTime(kTime_Min), ClipTime(-1));
  EXPECT_LT(ClipTime(-1), ClipTime(0));
  EXPECT_GT(ClipTime(kTime_Max), ClipTime(0));
  EXPECT_EQ(ClipTime(7), ClipTime(7));
  EXPECT_NE(ClipTime(7), ClipTime(8));
}

}  // namespace
