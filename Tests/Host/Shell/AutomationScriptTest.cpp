#include <gtest/gtest.h>

#include "Host/Shell/AutomationScript.h"

namespace {

AutomationScript Ok(const AutomationScript::ParseResult& result) {
  if (const auto* error = std::get_if<ScriptError>(&result)) {
    ADD_FAILURE() << error->Describe();
    return {};
  }
  return std::get<AutomationScript>(result);
}

ScriptError Error(const AutomationScript::ParseResult& result) {
  const auto* error = std::get_if<ScriptError>(&result);
  EXPECT_NE(error, nullptr) << "the script parsed but should not have";
  return error ? *error : ScriptError{};
}

TEST(AutomationScript, ParsesEveryVerbWithItsArguments) {
  const auto script =
      Ok(AutomationScript::Parse("# tour\n"
                                 "select 3 4\n"
                                 "select-none\n"
                                 "time 00:00:01:12\n"
                                 "time 254016000000\n"
                                 "click 10 20 shift ctrl\n"
                                 "rclick 1 2\n"
                                 "dblclick 5 6 alt\n"
                                 "drag 1 2 30 40 steps 5 shift\n"
                                 "move 7 8\n"
                                 "wheel -3\n"
                                 "key Delete ctrl\n"
                                 "type hello # world\n"
                                 "command cmd.effectcontrols.toggle.snapping\n"
                                 "menu-answer none\n"
                                 "input-answer New Name\n"
                                 "resize 800 600\n"
                                 "undo\n"
                                 "redo\n"
                                 "shot out/panel.png\n"
                                 "dump out/state.json\n"
                                 "save out/project.json\n"));
  const auto& c = script.Commands();
  ASSERT_EQ(c.size(), 21u);
  EXPECT_EQ(c[0].verb, ScriptVerb::kSelect);
  EXPECT_EQ(c[0].ids, (std::vector<std::int64_t>{3, 4}));
  EXPECT_EQ(c[0].line, 2);
  EXPECT_EQ(c[2].text, "00:00:01:12");
  EXPECT_EQ(c[4].numbers, (std::vector<int>{10, 20}));
  EXPECT_EQ(c[4].modifiers, kScriptShift | kScriptCtrl);
  EXPECT_EQ(c[6].modifiers, kScriptAlt);
  EXPECT_EQ(c[7].numbers, (std::vector<int>{1, 2, 30, 40}));
  EXPECT_EQ(c[7].steps, 5);
  EXPECT_EQ(c[7].modifiers, kScriptShift);
  EXPECT_EQ(c[9].numbers, (std::vector<int>{-3}));
  EXPECT_EQ(c[10].text, "Delete");
  EXPECT_EQ(c[10].modifiers, kScriptCtrl);
  EXPECT_EQ(c[11].text, "hello # world") << "typed text keeps '#'";
  EXPECT_EQ(c[14].text, "New Name");
  EXPECT_EQ(c[18].text, "out/panel.png");
}

TEST(AutomationScript, TrailingCommentsAndBlankLinesAreIgnored) {
  const auto script = Ok(AutomationScript::Parse("\n  \nundo   # go back\n\r\n   # only\n"));
  ASSERT_EQ(script.Commands().size(), 1u);
  EXPECT_EQ(script.Commands()[0].line, 3);
}

TEST(AutomationScript, ErrorsNameTheLineAndTheFault) {
  EXPECT_EQ(Error(AutomationScript::Parse("undo\nfly 1 2\n")).line, 2);
  EXPECT_EQ(Error(AutomationScript::Parse("fly")).message, "unknown verb 'fly'");
  EXPECT_EQ(Error(AutomationScript::Parse("click 10")).Describe(), "line 1: click needs X and Y");
  EXPECT_EQ(Error(AutomationScript::Parse("\n\nclick 10 ten")).line, 3);
  EXPECT_EQ(Error(AutomationScript::Parse("click 1 2 hyper")).message,
            "'hyper' is not a modifier (shift, ctrl or alt)");
  EXPECT_EQ(Error(AutomationScript::Parse("drag 1 2 3 4 steps")).message, "steps needs a count");
  EXPECT_EQ(Error(AutomationScript::Parse("drag 1 2 3 4 steps 0")).message,
            "steps must be between 1 and 10000");
  EXPECT_EQ(Error(AutomationScript::Parse("select")).line, 1);
  EXPECT_EQ(Error(AutomationScript::Parse("select 1 -2")).message, "'-2' is not a track-item id");
  EXPECT_EQ(Error(AutomationScript::Parse("time soon")).line, 1);
  EXPECT_EQ(Error(AutomationScript::Parse("time 1:2:3")).line, 1);
  EXPECT_EQ(Error(AutomationScript::Parse("undo now")).message, "undo takes no arguments");
  EXPECT_EQ(Error(AutomationScript::Parse("resize 0 10")).line, 1);
  EXPECT_EQ(Error(AutomationScript::Parse("shot")).message, "shot needs a file name");
  EXPECT_EQ(Error(AutomationScript::Parse("wheel 1 2")).message, "wheel needs DY");
  EXPECT_EQ(Error(AutomationScript::Parse("click 99999999999 1")).line, 1);
}

TEST(AutomationScript, WaitCloseAndMemoryTakeTheirArgumentsOrRefuseThem) {
  const auto parsed = AutomationScript::Parse("wait 250\nclose\nmemory m.json\n");
  ASSERT_TRUE(std::holds_alternative<AutomationScript>(parsed));
  const auto& commands = std::get<AutomationScript>(parsed).Commands();
  ASSERT_EQ(commands.size(), 3u);
  EXPECT_EQ(commands[0].verb, ScriptVerb::kWait);
  EXPECT_EQ(commands[0].numbers, std::vector<int>{250});
  EXPECT_EQ(commands[1].verb, ScriptVerb::kClose);
  EXPECT_EQ(commands[2].text, "m.json");
  EXPECT_EQ(Error(AutomationScript::Parse("wait 60001")).message, "wait needs MS from 0 to 60000");
  EXPECT_EQ(Error(AutomationScript::Parse("wait -1")).message, "wait needs MS from 0 to 60000");
  EXPECT_EQ(Error(AutomationScript::Parse("wait")).message, "wait needs MS");
  EXPECT_EQ(Error(AutomationScript::Parse("close now")).message, "close takes no arguments");
}

TEST(AutomationScript, MenuPicksAndChecksTakeTheirArgumentsOrRefuseThem) {
  const auto script = Ok(AutomationScript::Parse("menu-answer pick 7\ncheck # between steps\n"));
  ASSERT_EQ(script.Commands().size(), 2u);
  EXPECT_EQ(script.Commands()[0].text, "pick");
  EXPECT_EQ(script.Commands()[0].numbers, std::vector<int>{7});
  EXPECT_EQ(script.Commands()[1].verb, ScriptVerb::kCheck);
  EXPECT_EQ(Error(AutomationScript::Parse("menu-answer pick -1")).message,
            "pick needs an index from 0 up, not '-1'");
  EXPECT_EQ(Error(AutomationScript::Parse("menu-answer pick")).message,
            "pick needs an index from 0 up");
  EXPECT_EQ(Error(AutomationScript::Parse("check 3")).message, "check takes no arguments");
}

TEST(AutomationScript, ParsesWhatAUserDoesOutsideThePanel) {
  const auto parsed = AutomationScript::Parse("tool rate-stretch\nopen 21 43\nreopen-panel\n");
  ASSERT_TRUE(std::holds_alternative<AutomationScript>(parsed));
  const auto& commands = std::get<AutomationScript>(parsed).Commands();
  ASSERT_EQ(commands.size(), 3u);
  EXPECT_EQ(commands[0].verb, ScriptVerb::kTool);
  EXPECT_EQ(commands[0].text, "rate-stretch");
  EXPECT_EQ(commands[1].verb, ScriptVerb::kOpen);
  EXPECT_EQ(commands[1].ids, (std::vector<std::int64_t>{21, 43}));
  EXPECT_EQ(commands[2].verb, ScriptVerb::kReopenPanel);

  EXPECT_EQ(
      Error(AutomationScript::Parse("tool chisel")).message.rfind("'chisel' is not a tool (", 0),
      0u);
  EXPECT_EQ(Error(AutomationScript::Parse("tool")).message, "tool needs one tool name");
  EXPECT_EQ(Error(AutomationScript::Parse("open")).message,
            "open needs at least one track-item id");
  EXPECT_EQ(Error(AutomationScript::Parse("reopen-panel now")).message,
            "reopen-panel takes no arguments");
}

TEST(AutomationScript, AMissingFileIsAnErrorNotACrash) {
  const auto error = Error(AutomationScript::ParseFile("/nonexistent/script.txt"));
  EXPECT_EQ(error.line, 0);
  EXPECT_NE(error.message.find("cannot open script"), std::string::npos);
}

}  // namespace

TEST(AutomationScript, PressAndReleaseTakeAPointAndModifiers) {
  const auto parsed = AutomationScript::Parse("press 10 20 shift\nmove 30 20\nrelease 30 20\n");
  ASSERT_TRUE(std::holds_alternative<AutomationScript>(parsed));
  const auto& commands = std::get<AutomationScript>(parsed).Commands();
  ASSERT_EQ(commands.size(), 3u);
  EXPECT_EQ(commands[0].verb, ScriptVerb::kPress);
  EXPECT_EQ(commands[0].numbers, (std::vector<int>{10, 20}));
  EXPECT_EQ(commands[0].modifiers, kScriptShift);
  EXPECT_EQ(commands[2].verb, ScriptVerb::kRelease);
  EXPECT_EQ(commands[2].numbers, (std::vector<int>{30, 20}));
  EXPECT_FALSE(std::holds_alternative<AutomationScript>(AutomationScript::Parse("press 10")));
  EXPECT_FALSE(std::holds_alternative<AutomationScript>(AutomationScript::Parse("release a b")));
}
