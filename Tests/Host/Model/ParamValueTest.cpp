#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <type_traits>

#include "Host/Model/ParamValue.h"

namespace {

// A bare integer must not silently become a double or a bool.
static_assert(!std::is_convertible_v<int, ParamValue>);
static_assert(std::is_convertible_v<double, ParamValue>);
static_assert(std::is_convertible_v<ParamChoice, ParamValue>);

TEST(ParamValue, KindFollowsTheAlternative) {
  EXPECT_EQ(KindOf(1.5), ParamValueKind::Double);
  EXPECT_EQ(KindOf(ParamPoint{1, 2}), ParamValueKind::Point);
  EXPECT_EQ(KindOf(ParamColor{}), ParamValueKind::Color);
  EXPECT_EQ(KindOf(true), ParamValueKind::Bool);
  EXPECT_EQ(KindOf(ParamChoice{3}), ParamValueKind::Choice);
  EXPECT_EQ(KindOf(std::string("a")), ParamValueKind::String);
  EXPECT_EQ(KindOf(ParamBlob{{1, 2}}), ParamValueKind::Blob);
  EXPECT_EQ(KindOf(ParamValue("text")), ParamValueKind::String);
}

TEST(ParamValue, OnlyNumbersPointsAndColoursInterpolate) {
  EXPECT_TRUE(Interpolates(ParamValueKind::Double));
  EXPECT_TRUE(Interpolates(ParamValueKind::Point));
  EXPECT_TRUE(Interpolates(ParamValueKind::Color));
  EXPECT_FALSE(Interpolates(ParamValueKind::Bool));
  EXPECT_FALSE(Interpolates(ParamValueKind::Choice));
  EXPECT_FALSE(Interpolates(ParamValueKind::String));
  EXPECT_FALSE(Interpolates(ParamValueKind::Blob));
}

TEST(ParamValue, EqualityComparesKindAndContents) {
  EXPECT_EQ(ParamValue(ParamPoint{1, 2}), ParamValue(ParamPoint{1, 2}));
  EXPECT_NE(ParamValue(ParamPoint{1, 2}), ParamValue(ParamPoint{2, 1}));
  EXPECT_NE(ParamValue(1.0), ParamValue(true));
  EXPECT_NE(ParamValue(1.0), ParamValue(ParamChoice{1}));
  EXPECT_EQ(ParamValue(ParamBlob{{1, 2, 3}}), ParamValue(ParamBlob{{1, 2, 3}}));
  EXPECT_NE(ParamValue(ParamBlob{{1, 2, 3}}), ParamValue(ParamBlob{{1, 2}}));
}

TEST(ParamValue, FiniteRejectsNaNAndInfinityInEveryComponent) {
  const double nan = std::numeric_limits<double>::quiet_NaN();
  const float inf = std::numeric_limits<float>::infinity();
  EXPECT_TRUE(IsFinite(1e300));
  EXPECT_FALSE(IsFinite(nan));
  EXPECT_FALSE(IsFinite(ParamPoint{0, nan}));
  EXPECT_FALSE(IsFinite(ParamColor{0, 0, 0, inf}));
  EXPECT_TRUE(IsFinite(ParamColor{2.0f, 0, 0, 1}));  // bright, but a number
  EXPECT_TRUE(IsFinite(std::string("nan")));
}

TEST(ParamValue, ScalarReadingOfNumbersBoolsAndChoices) {
  EXPECT_EQ(AsScalar(2.5), 2.5);
  EXPECT_EQ(AsScalar(true), 1.0);
  EXPECT_EQ(AsScalar(false), 0.0);
  EXPECT_EQ(AsScalar(ParamChoice{4}), 4.0);
  EXPECT_FALSE(AsScalar(ParamPoint{}));
  EXPECT_FALSE(AsScalar(std::string("1")));
}

TEST(ParamValue, BlendMixesPerComponentOrHolds) {
  EXPECT_EQ(Blend(0.0, 10.0, 0.25), ParamValue(2.5));
  EXPECT_EQ(Blend(ParamPoint{0, 10}, ParamPoint{10, 0}, 0.5), ParamValue(ParamPoint{5, 5}));
  EXPECT_EQ(Blend(ParamColor{0, 0, 0, 0}, ParamColor{1, 1, 1, 1}, 0.5),
            ParamValue(ParamColor{0.5f, 0.5f, 0.5f, 0.5f}));
  EXPECT_EQ(Blend(false, true, 0.99), ParamValue(false));
  EXPECT_EQ(Blend(false, true, 1.0), ParamValue(true));
  EXPECT_EQ(Blend(std::string("a"), std::string("b"), 0.5), ParamValue(std::string("a")));
  EXPECT_EQ(Blend(1.0, ParamPoint{}, 0.5), ParamValue(1.0));  // kinds differ: hold
}

TEST(ParamValue, PrintsShortly) {
  EXPECT_EQ(ToString(1.5), "1.5");
  EXPECT_EQ(ToString(ParamPoint{3, 4}), "(3, 4)");
  EXPECT_EQ(ToString(ParamColor{1, 0, 0, 1}), "rgba(1, 0, 0, 1)");
  EXPECT_EQ(ToString(true), "true");
  EXPECT_EQ(ToString(ParamChoice{2}), "choice 2");
  EXPECT_EQ(ToString(std::string("x")), "\"x\"");
  EXPECT_EQ(ToString(ParamBlob{{1, 2, 3}}), "blob[3]");
}

}  // namespace
