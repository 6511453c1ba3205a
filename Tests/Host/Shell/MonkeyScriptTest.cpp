#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <string>
#include <variant>

#include "Host/Shell/AutomationScript.h"
#include "Host/Shell/MonkeyScript.h"

namespace {

MonkeyOptions Options(std::uint64_t seed, int events) {
  MonkeyOptions options;
  options.seed = seed;
  options.events = events;
  options.trackItemIds = {21, 43, 107};
  return options;
}

// The script up to its last line ("check"), which a shorter run puts after its own last event.
std::string WithoutFinalCheck(const std::string& script) {
  const std::string check = "check\n";
  return script.ends_with(check) ? script.substr(0, script.size() - check.size()) : script;
}

std::string Body(const std::string& script) {
  return script.substr(script.find('\n') + 1);  // past the header naming the count
}

TEST(MonkeyScript, ASeedGivesTheSameEventsAndAShorterRunIsAPrefixOfALongerOne) {
  const std::string longer = MonkeyScript::Generate(Options(7, 450));
  EXPECT_EQ(MonkeyScript::Generate(Options(7, 450)), longer);
  const std::string shorter = Body(WithoutFinalCheck(MonkeyScript::Generate(Options(7, 170))));
  EXPECT_TRUE(Body(longer).starts_with(shorter));
  EXPECT_NE(Body(MonkeyScript::Generate(Options(8, 450))), Body(longer));
}

TEST(MonkeyScript, EveryLineParsesAndAChecksFollowsEveryHundredEventsAndTheEnd) {
  const std::string text = MonkeyScript::Generate(Options(20261207, 1050));
  const auto parsed = AutomationScript::Parse(text);
  ASSERT_TRUE(std::holds_alternative<AutomationScript>(parsed))
      << std::get<ScriptError>(parsed).Describe();
  const auto& commands = std::get<AutomationScript>(parsed).Commands();
  const auto checks = std::count_if(commands.begin(), commands.end(), [](const auto& command) {
    return command.verb == ScriptVerb::kCheck;
  });
  EXPECT_EQ(checks, 11);  // after 100, 200, ..., 1000 and at 1050
  EXPECT_EQ(commands.back().verb, ScriptVerb::kCheck);
}

TEST(MonkeyScript, SelectsOnlyTheGivenItemsAndUsesMostKindsOfInput) {
  const auto parsed = AutomationScript::Parse(MonkeyScript::Generate(Options(3, 2000)));
  ASSERT_TRUE(std::holds_alternative<AutomationScript>(parsed));
  std::set<ScriptVerb> verbs;
  for (const auto& command : std::get<AutomationScript>(parsed).Commands()) {
    verbs.insert(command.verb);
    for (const auto id : command.ids)
      EXPECT_TRUE(id == 21 || id == 43 || id == 107) << id;
    // The program's own save, open and quit keys would leave the session.
    if (command.verb == ScriptVerb::kKey && (command.modifiers & kScriptCtrl) != 0) {
      EXPECT_TRUE(command.text != "s" && command.text != "o" && command.text != "q")
          << command.text;
    }
  }
  for (const ScriptVerb verb :
       {ScriptVerb::kClick, ScriptVerb::kRightClick, ScriptVerb::kDoubleClick, ScriptVerb::kDrag,
        ScriptVerb::kMove, ScriptVerb::kWheel, ScriptVerb::kKey, ScriptVerb::kType,
        ScriptVerb::kCommand, ScriptVerb::kMenuAnswer, ScriptVerb::kInputAnswer,
        ScriptVerb::kSelect, ScriptVerb::kSelectNone, ScriptVerb::kTime, ScriptVerb::kResize,
        ScriptVerb::kTool, ScriptVerb::kOpen, ScriptVerb::kReopenPanel}) {
    EXPECT_TRUE(verbs.contains(verb)) << static_cast<int>(verb);
  }
  EXPECT_FALSE(verbs.contains(ScriptVerb::kClose));
}

}  // namespace
