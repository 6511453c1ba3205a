#include <gtest/gtest.h>

#include "Host/Toolkit/ColorDefinitionParser.h"

namespace {

using Kind = ColorDefinition::Kind;

TEST(ColorDefinitionParser, ReadsEachDirective) {
  const auto result = ColorDefinitionParser::Parse(
      "colors.a\t= $MAP(colors.app.Formula.A)\n"
      "colors.b = $VOK(kColor_ContentBackground)\n"
      "colors.c   =   $RGB(207, 199, 220)\n"
      "colors.d = $RGB(0x20, 0x10, 0x00)\n"
      "colors.e = $REVERSIBLESCALED(colors.qel.black, colors.qel.white, 0%, 20%)\n");
  ASSERT_TRUE(result.problems.empty()) << result.problems[0].reason;
  ASSERT_EQ(result.definitions.size(), 5u);
  const auto& d = result.definitions;
  EXPECT_EQ(d[0].key, "colors.a");
  EXPECT_EQ(d[0].kind, Kind::kMap);
  EXPECT_EQ(d[0].reference, "colors.app.Formula.A");
  EXPECT_EQ(d[1].kind, Kind::kToolkit);
  EXPECT_EQ(d[1].reference, "kColor_ContentBackground");
  EXPECT_EQ(d[2].kind, Kind::kRGB);
  EXPECT_EQ(d[2].rgb, Color(207, 199, 220));
  EXPECT_EQ(d[3].rgb, Color(0x20, 0x10, 0x00));
  EXPECT_EQ(d[4].kind, Kind::kReversibleScaled);
  EXPECT_EQ(d[4].reference, "colors.qel.black");
  EXPECT_EQ(d[4].darkReference, "colors.qel.white");
  EXPECT_DOUBLE_EQ(d[4].lightScale, 0.0);
  EXPECT_DOUBLE_EQ(d[4].darkScale, 0.2);
  EXPECT_EQ(d[4].line, 5);
}

TEST(ColorDefinitionParser, SkipsCommentsBlankLinesAndCarriageReturns) {
  const auto result = ColorDefinitionParser::Parse(
      "# a comment\r\n"
      "\r\n"
      "   // another\n"
      "colors.x = $RGB(1, 2, 3)\r\n");
  EXPECT_TRUE(result.problems.empty());
  ASSERT_EQ(result.definitions.size(), 1u);
  EXPECT_EQ(result.definitions[0].line, 4);
}

TEST(ColorDefinitionParser, MalformedLinesAreReportedWithTheirLineAndSkipped) {
  const auto result = ColorDefinitionParser::Parse(
      "colors.ok1 = $RGB(1, 2, 3)\n"                      // 1
      "colors.noequals $RGB(1, 2, 3)\n"                   // 2
      " = $RGB(1, 2, 3)\n"                                // 3
      "colors.bad key = $RGB(1, 2, 3)\n"                  // 4
      "colors.range = $RGB(1, 256, 3)\n"                  // 5
      "colors.count = $RGB(1, 2)\n"                       // 6
      "colors.word = $RGB(red, 2, 3)\n"                   // 7
      "colors.unknown = $HSV(1, 2, 3)\n"                  // 8
      "colors.unclosed = $MAP(colors.a\n"                 // 9
      "colors.trailing = $MAP(colors.a) extra\n"          // 10
      "colors.self = $MAP(colors.self)\n"                 // 11
      "colors.pct = $REVERSIBLESCALED(a, b, 0%, 120%)\n"  // 12
      "colors.nodollar = RGB(1, 2, 3)\n"                  // 13
      "colors.empty =\n"                                  // 14
      "colors.ok1 = $RGB(9, 9, 9)\n"                      // 15: duplicate
      "colors.nested = $MAP($MAP(x))\n"                   // 16
      "colors.ok2 = $MAP(colors.ok1)\n");                 // 17
  ASSERT_EQ(result.definitions.size(), 2u);
  EXPECT_EQ(result.definitions[0].key, "colors.ok1");
  EXPECT_EQ(result.definitions[0].rgb, Color(1, 2, 3));  // the first definition is kept
  EXPECT_EQ(result.definitions[1].key, "colors.ok2");
  std::vector<int> lines;
  for (const auto& problem : result.problems) {
    lines.push_back(problem.line);
    EXPECT_FALSE(problem.reason.empty());
    EXPECT_FALSE(problem.text.empty());
  }
  EXPECT_EQ(lines, (std::vector<int>{2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16}));
  EXPECT_NE(result.problems[3].reason.find("256"), std::string::npos);
  EXPECT_NE(result.problems[13].reason.find("twice"), std::string::npos);
}

TEST(ColorDefinitionParser, PercentagesMayBeFractionalOrBare) {
  const auto result =
      ColorDefinitionParser::Parse("colors.p = $REVERSIBLESCALED(a.b, c.d, 12.5%, 100)\n");
  ASSERT_TRUE(result.problems.empty());
  EXPECT_DOUBLE_EQ(result.definitions[0].lightScale, 0.125);
  EXPECT_DOUBLE_EQ(result.definitions[0].darkScale, 1.0);
}

TEST(ColorDefinitionParser, EmptyTextGivesNothing) {
  const auto result = ColorDefinitionParser::Parse("");
  EXPECT_TRUE(result.definitions.empty());
  EXPECT_TRUE(result.problems.empty());
}

}  // namespace
