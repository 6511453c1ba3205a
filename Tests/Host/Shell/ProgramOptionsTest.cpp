#include <gtest/gtest.h>

#include <initializer_list>
#include <vector>

#include "Host/Messaging/PropertyList.h"
#include "Host/Shell/ProgramOptions.h"

namespace {

ProgramOptions::ParseResult ParseArgs(std::initializer_list<std::string_view> args) {
  const std::vector<std::string_view> list(args);
  return ProgramOptions::Parse(list);
}

std::string ErrorOf(const ProgramOptions::ParseResult& result) {
  const auto* error = std::get_if<std::string>(&result);
  return error ? *error : std::string("(parsed)");
}

TEST(ProgramOptions, DefaultsWithoutArguments) {
  const auto options = std::get<ProgramOptions>(ParseArgs({}));
  EXPECT_TRUE(options.projectPath.empty());
  EXPECT_EQ(options.size, ProgramOptions::kDefaultSize);
  EXPECT_TRUE(options.scriptPath.empty());
  EXPECT_EQ(options.outDir, ".");
  EXPECT_FALSE(options.headless);
}

TEST(ProgramOptions, ReadsEveryOptionInBothForms) {
  const auto options = std::get<ProgramOptions>(ParseArgs(
      {"--project", "a b.json", "--size=800x600", "--script", "s.txt", "--out=o", "--headless"}));
  EXPECT_EQ(options.projectPath, "a b.json");
  EXPECT_EQ(options.size, (Size{800, 600}));
  EXPECT_EQ(options.scriptPath, "s.txt");
  EXPECT_EQ(options.outDir, "o");
  EXPECT_TRUE(options.headless);
}

TEST(ProgramOptions, PreferencesAreSetAsFlagsNumbersOrTextAndTheLastWins) {
  const auto options = std::get<ProgramOptions>(
      ParseArgs({"--pref", "a.flag=true", "--pref=a.count=12", "--pref", "a.name=x=y", "--pref",
                 "a.flag=false", "--pref", "a.locked=true", "--pref", "a.empty="}));
  ASSERT_EQ(options.preferences.size(), 6u);
  PropertyList properties;
  properties.SetBool("a.locked", false);
  properties.SetReadOnly("a.locked", true);
  options.ApplyPreferences(properties);
  EXPECT_EQ(properties.GetValue("a.flag"), PropertyList::Value(false));
  EXPECT_EQ(properties.GetValue("a.count"), PropertyList::Value(12));
  EXPECT_EQ(properties.GetValue("a.name"), PropertyList::Value(std::string("x=y")));
  EXPECT_EQ(properties.GetValue("a.empty"), PropertyList::Value(std::string()));
  EXPECT_FALSE(properties.GetBool("a.locked", true));
}

TEST(ProgramOptions, APreferenceNeedsAKey) {
  EXPECT_EQ(ErrorOf(ParseArgs({"--pref", "novalue"})), "--pref needs KEY=VALUE, not 'novalue'");
  EXPECT_EQ(ErrorOf(ParseArgs({"--pref=", "x"})), "--pref needs KEY=VALUE, not ''");
  EXPECT_EQ(ErrorOf(ParseArgs({"--pref", "=1"})), "--pref needs KEY=VALUE, not '=1'");
  EXPECT_EQ(ErrorOf(ParseArgs({"--pref"})), "--pref needs KEY=VALUE, not ''");
}

TEST(ProgramOptions, RejectsMalformedSizes) {
  for (auto bad : {"800", "800x", "x600", "0x600", "800x-1", "800x600x2", "20000x10", "8OOx600"}) {
    EXPECT_NE(ErrorOf(ParseArgs({"--size", bad})).find("--size needs WxH"), std::string::npos)
        << bad;
  }
}

TEST(ProgramOptions, NamesTheOffendingArgument) {
  EXPECT_EQ(ErrorOf(ParseArgs({"--projct", "x"})), "unknown option '--projct'");
  EXPECT_EQ(ErrorOf(ParseArgs({"--script"})), "--script needs a value");
  EXPECT_EQ(ErrorOf(ParseArgs({"--out="})), "--out needs a value");
  EXPECT_EQ(ErrorOf(ParseArgs({"--project", "a", "--project", "b"})), "--project given twice");
  EXPECT_EQ(ErrorOf(ParseArgs({"--headless=yes"})), "--headless takes no value");
  EXPECT_EQ(ErrorOf(ParseArgs({"stray.json"})), "unknown option 'stray.json'");
}

TEST(ProgramOptions, AMonkeyTakesASeedAndACountButNoScript) {
  const auto options =
      std::get<ProgramOptions>(ParseArgs({"--monkey", "18446744073709551615", "--events=12"}));
  EXPECT_EQ(options.monkeySeed, std::optional<std::uint64_t>(18446744073709551615ULL));
  EXPECT_EQ(options.monkeyEvents, 12);
  EXPECT_EQ(std::get<ProgramOptions>(ParseArgs({"--monkey", "3"})).monkeyEvents,
            ProgramOptions::kDefaultMonkeyEvents);
  EXPECT_EQ(ErrorOf(ParseArgs({"--monkey", "x"})),
            "--monkey needs a seed (a whole number), not 'x'");
  EXPECT_EQ(ErrorOf(ParseArgs({"--monkey", "1", "--events", "0"})),
            "--events needs a count from 1 up, not '0'");
  EXPECT_EQ(ErrorOf(ParseArgs({"--events", "5"})),
            "--events counts a monkey's events: give --monkey SEED too");
  EXPECT_EQ(ErrorOf(ParseArgs({"--monkey", "1", "--script", "s.ecs"})),
            "--monkey and --script cannot go together: the monkey writes its own script");
}

TEST(ProgramOptions, HelpIsRecognised) {
  EXPECT_TRUE(std::get<ProgramOptions>(ParseArgs({"--help"})).help);
  EXPECT_NE(ProgramOptions::Usage().find("--headless"), std::string::npos);
}

}  // namespace
