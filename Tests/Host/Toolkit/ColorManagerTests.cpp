#include <gtest/gtest.h>

#include <string>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Toolkit/ColorManager.h"

namespace {

// The panel's colour definitions as the handler registers them.
constexpr std::string_view kEffectControlsColors = R"(
colors.effectscontrols.base	=	$VOK(kColor_ContentBackground)
colors.effectscontrols.panel.text	=	$MAP(colors.qel.reversible.black)
colors.effectscontrols.Formula.A	=	$MAP(colors.app.Formula.A)
colors.effectscontrols.Formula.B	=	$MAP(colors.app.Formula.B)
colors.effectscontrols.Formula.C	=	$MAP(colors.app.Formula.C)
colors.effectscontrols.Formula.D	=	$MAP(colors.app.Formula.D)
colors.effectscontrols.Formula.E	=	$MAP(colors.app.Formula.E)
colors.effectscontrols.Formula.F	=	$MAP(colors.app.Formula.F)
colors.effectscontrols.Formula.G	=	$MAP(colors.app.Formula.G)
colors.effectscontrols.Formula.H	=	$MAP(colors.app.Formula.H)
colors.effectscontrols.Formula.I	=	$MAP(colors.app.Formula.I)
colors.effectscontrols.Formula.J	=	$MAP(colors.app.Formula.J)
colors.effectscontrols.Formula.K	=	$MAP(colors.app.Formula.K)
colors.effectscontrols.Formula.L	=	$MAP(colors.app.Formula.L)
colors.effectscontrols.background	=	$MAP(colors.app.base)
colors.effectscontrols.listview.background	=	$VOK(kColor_ListBoxContentNormal)
colors.effectscontrols.listview.removeable	=	$VOK(kColor_ListBoxContentNormal)
colors.effectscontrols.listview.nonremoveable	=	$VOK(kColor_ListBoxContentNormal)
colors.effectscontrols.listview.Hseparator	=	$VOK(kColor_ListBoxContentDivider)
colors.effectscontrols.listview.Vseparator	=	$VOK(kColor_ListBoxContentDivider)
colors.effectscontrols.listview.expander	=	$MAP(colors.app.Formula.I)
colors.effectscontrols.listview.selected	=	$VOK(kColor_ListBoxContentSelected)
colors.effectscontrols.keyframeview.background	=	$MAP(colors.app.Formula.H)
colors.effectscontrols.keyframeview.filteritembkgd	=	$MAP(colors.app.Formula.G)
colors.effectscontrols.keyframeview.trimband	=	$MAP(colors.app.Formula.G)
colors.effectscontrols.keyframeview.noclipband	=	$MAP(colors.app.Formula.H)
colors.effectscontrols.keyframeview.Hseparator	=	$VOK(kColor_ListBoxContentDivider)
colors.effectscontrols.listheader.topbevel1	=	$MAP(colors.app.Formula.B)
colors.effectscontrols.listheader.topbevel2	=	$MAP(colors.app.Formula.E)
colors.effectscontrols.listheader.bottombevel1	=	$MAP(colors.app.Formula.G)
colors.effectscontrols.listheader.bottombevel2	=	$MAP(colors.app.Formula.H)
colors.effectscontrols.listheader.bottombevel3	=	$MAP(colors.app.Formula.I)
colors.effectscontrols.transition.ControlBackground	=	$MAP(colors.app.Formula.D)
colors.effectscontrols.transition.ClipBackground	=	$MAP(colors.app.Formula.H)
colors.effectscontrols.transition.Hseparator	=	$MAP(colors.app.Formula.J)
colors.effectscontrols.transition.TransitionFore	=	$RGB(207, 199, 220)
colors.effectscontrols.transition.TransitionBack	=	$RGB(157, 143, 182)
colors.effectscontrols.transition.Edges	=	$MAP(colors.app.Formula.L)
colors.effectscontrols.transition.MediaStart	=	$MAP(colors.app.Formula.D)
colors.effectscontrols.transition.MediaEnd	=	$MAP(colors.app.Formula.K)
colors.effectscontrols.transition.LockSlash	=	$RGB(165, 165, 165)
colors.effectscontrols.graticule.background	=	$RGB(0x20, 0x10, 0x00)
colors.effectscontrols.graticule.line	=	$RGB(0xCC, 0x91, 0x18)
colors.effectscontrols.control.point	=	$REVERSIBLESCALED(colors.qel.DarkTimecodeText, colors.qel.LightTimecodeText, 0%, 0%)
colors.effectscontrols.control.point.connector	=	$REVERSIBLESCALED(colors.qel.black, colors.qel.white, 0%, 20%)
colors.effectscontrols.direction.handle	=	$REVERSIBLESCALED(colors.qel.DarkTimecodeText, colors.qel.LightTimecodeText, 0%, 0%)
colors.effectscontrols.displayFrame.background	=	$MAP(colors.app.Formula.I)
)";

class ColorManagerTest : public ::testing::Test {
 protected:
  ColorManagerTest() { ColorManager::ResetForTesting(); }
  ~ColorManagerTest() override { ColorManager::ResetForTesting(); }

  MessagingTestScope mScope;
};

TEST_F(ColorManagerTest, TheDarkThemeIsTheDefault) {
  EXPECT_EQ(ColorManager::GetTheme(), ColorTheme::kDark);
  EXPECT_EQ(ColorManager::GetColor(kColor_WindowBackground), Color::FromRGB(0x232323));
  EXPECT_EQ(ColorManager::GetColor(kColor_ContentBackground), Color::FromRGB(0x2b2b2b));
  EXPECT_EQ(ColorManager::GetColor(kColor_ReversibleBlack), Color::FromRGB(0xc8c8c8));
  EXPECT_EQ(ColorManager::GetColor(kColor_InteractiveControl), Color::FromRGB(0x2d8ceb));
}

TEST_F(ColorManagerTest, ThePanelsColourSetResolvesEveryKeyInBothThemes) {
  const auto problems =
      ColorManager::RegisterColorSet("effectcontrolscolors", kEffectControlsColors);
  EXPECT_TRUE(problems.empty()) << problems[0].reason;
  EXPECT_TRUE(ColorManager::IsColorSetRegistered("effectcontrolscolors"));
  for (ColorTheme theme : {ColorTheme::kDark, ColorTheme::kLight}) {
    ColorManager::SetTheme(theme);
    std::size_t start = 0;
    while ((start = kEffectControlsColors.find("colors.effectscontrols.", start)) !=
           std::string_view::npos) {
      const auto end = kEffectControlsColors.find('\t', start);
      const std::string key(kEffectControlsColors.substr(start, end - start));
      EXPECT_TRUE(ColorManager::HasColor(key)) << key;
      EXPECT_NE(ColorManager::GetColor(key), ColorManager::kFallbackColor) << key;
      start = kEffectControlsColors.find('\n', start);
    }
  }
  EXPECT_TRUE(ColorManager::ReportedUnknownKeys().empty());
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(ColorManagerTest, DirectivesResolveToTheirColours) {
  ColorManager::RegisterColorSet("set", kEffectControlsColors);
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.transition.TransitionFore"),
            Color(207, 199, 220));
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.graticule.line"),
            Color(0xcc, 0x91, 0x18));
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.base"),
            ColorManager::GetColor(kColor_ContentBackground));
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.keyframeview.background"),
            ColorManager::GetColor("colors.app.Formula.H"));
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.panel.text"),
            ColorManager::GetColor(kColor_ReversibleBlack));
}

TEST_F(ColorManagerTest, ReversibleColoursFollowTheTheme) {
  ColorManager::RegisterColorSet("set", kEffectControlsColors);
  const std::string connector = "colors.effectscontrols.control.point.connector";
  // Dark: white softened 20% toward the content background (#2b2b2b).
  const Color dark = ColorManager::GetColor(connector);
  EXPECT_EQ(dark, Color(255, 255, 255).Mix(Color::FromRGB(0x2b2b2b), 0.2));
  const auto generation = ColorManager::GetGeneration();
  ColorManager::SetTheme(ColorTheme::kLight);
  EXPECT_NE(ColorManager::GetGeneration(), generation);
  EXPECT_EQ(ColorManager::GetColor(connector), Color(0, 0, 0));
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.control.point"),
            ColorManager::GetColor("colors.qel.DarkTimecodeText"));
  EXPECT_NE(ColorManager::GetColor(kColor_WindowBackground), Color::FromRGB(0x232323));
  ColorManager::SetTheme(ColorTheme::kDark);
  EXPECT_EQ(ColorManager::GetColor(connector), dark);
  EXPECT_EQ(ColorManager::GetColor("colors.effectscontrols.control.point"),
            ColorManager::GetColor("colors.qel.LightTimecodeText"));
}

TEST_F(ColorManagerTest, UnknownKeysAreMagentaAndReportedOnce) {
  EXPECT_EQ(ColorManager::GetColor("colors.nowhere"), ColorManager::kFallbackColor);
  EXPECT_EQ(ColorManager::GetColor("colors.nowhere"), ColorManager::kFallbackColor);
  EXPECT_FALSE(ColorManager::HasColor("colors.nowhere"));
  EXPECT_EQ(ColorManager::ReportedUnknownKeys(), std::vector<std::string>{"colors.nowhere"});
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("colors.nowhere"), std::string::npos);
}

TEST_F(ColorManagerTest, BrokenReferencesFallBackWithoutRecursingForever) {
  const auto problems =
      ColorManager::RegisterColorSet("loops",
                                     "colors.a = $MAP(colors.b)\n"
                                     "colors.b = $MAP(colors.a)\n"
                                     "colors.c = $MAP(colors.missing)\n"
                                     "colors.d = $REVERSIBLESCALED(colors.c, colors.c, 0%, 0%)\n");
  EXPECT_TRUE(problems.empty());
  EXPECT_EQ(ColorManager::GetColor("colors.a"), ColorManager::kFallbackColor);
  EXPECT_EQ(ColorManager::GetColor("colors.c"), ColorManager::kFallbackColor);
  EXPECT_EQ(ColorManager::GetColor("colors.d"), ColorManager::kFallbackColor);
  EXPECT_EQ(ColorManager::ReportedUnknownKeys().size(), 3u);
}

TEST_F(ColorManagerTest, MalformedLinesAreReturnedAndRecordedAndTheRestIsUsed) {
  const auto problems = ColorManager::RegisterColorSet("mixed",
                                                       "colors.good = $RGB(1, 2, 3)\n"
                                                       "colors.bad = $RGB(1, 2)\n"
                                                       "colors.vok = $VOK(kColor_NoSuchColour)\n"
                                                       "colors.also.good = $MAP(colors.good)\n");
  ASSERT_EQ(problems.size(), 2u);
  EXPECT_EQ(problems[0].line, 2);
  EXPECT_EQ(problems[1].line, 3);
  EXPECT_NE(problems[1].reason.find("kColor_NoSuchColour"), std::string::npos);
  EXPECT_EQ(ColorManager::GetColor("colors.also.good"), Color(1, 2, 3));
  EXPECT_FALSE(ColorManager::HasColor("colors.bad"));
  ASSERT_EQ(RecordedDebugAssertions().size(), 2u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("line 2"), std::string::npos);
}

TEST_F(ColorManagerTest, SetsAreReplacedByNameAndTheNewestWins) {
  ColorManager::RegisterColorSet("first", "colors.k = $RGB(1, 1, 1)\n");
  ColorManager::RegisterColorSet("second", "colors.k = $RGB(2, 2, 2)\n");
  EXPECT_EQ(ColorManager::GetColor("colors.k"), Color(2, 2, 2));
  ColorManager::RegisterColorSet("second", "colors.other = $RGB(3, 3, 3)\n");
  EXPECT_EQ(ColorManager::GetColor("colors.k"), Color(1, 1, 1));
  EXPECT_TRUE(ColorManager::UnregisterColorSet("first"));
  EXPECT_FALSE(ColorManager::UnregisterColorSet("first"));
  EXPECT_FALSE(ColorManager::HasColor("colors.k"));
  EXPECT_TRUE(ColorManager::HasColor("colors.other"));
}

TEST_F(ColorManagerTest, ChangesAreAnnouncedToListeners) {
  std::vector<ColorTheme> themes;
  FunctionListener listener([&](const Message& message) {
    if (const auto* changed = message.As<ColorsChangedMessage>())
      themes.push_back(changed->theme);
  });
  AddListener(std::string(kColorManagerStation), listener);
  ColorManager::SetTheme(ColorTheme::kLight);
  ColorManager::SetTheme(ColorTheme::kLight);  // no change, no message
  ColorManager::RegisterColorSet("set", "colors.k = $RGB(1, 1, 1)\n");
  ColorManager::UnregisterColorSet("set");
  ColorManager::UnregisterColorSet("set");  // nothing removed, no message
  EXPECT_EQ(themes,
            (std::vector<ColorTheme>{ColorTheme::kLight, ColorTheme::kLight, ColorTheme::kLight}));
}

TEST(Color, MixAndHex) {
  EXPECT_EQ(Color(0, 0, 0).Mix(Color(255, 255, 255), 0.5), Color(128, 128, 128));
  EXPECT_EQ(Color(10, 20, 30).Mix(Color(200, 200, 200), -3.0), Color(10, 20, 30));
  EXPECT_EQ(Color(10, 20, 30).Mix(Color(200, 200, 200), 7.0), Color(200, 200, 200));
  EXPECT_EQ(Color::FromRGB(0x2d8ceb).ToHex(), "#2d8ceb");
  EXPECT_EQ(Color(1, 2, 3, 4).ToHex(), "#01020304");
}

}  // namespace
