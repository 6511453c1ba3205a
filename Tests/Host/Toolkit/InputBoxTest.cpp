#include <gtest/gtest.h>

#include "Host/Messaging/Localization.h"
#include "Host/Toolkit/InputBox.h"
#include "Host/Toolkit/ScriptedInputBox.h"
#include "Tests/Host/Toolkit/ToolkitTestSupport.h"

namespace {

TEST(InputBox, TheResponderAnswersWithLocalisedTitleAndPrompt) {
  ToolkitTestScope scope;
  auto script = std::make_shared<ScriptedInputBox>();
  InputBox::SetResponder(script);
  script->PushAnswer("Soft Blur");
  SetLocalizedString("Vantile/Handlers/EffectControls/NewName", "Neuer Name");
  const std::optional<std::string> answer =
      InputBox::Ask("$$$/Vantile/Handlers/EffectControls/RenameItem=Rename Item",
                    "$$$/Vantile/Handlers/EffectControls/NewName=New Name", "Gaussian Blur");
  EXPECT_EQ(answer, "Soft Blur");
  ASSERT_EQ(script->GetRequests().size(), 1u);
  EXPECT_EQ(script->GetRequests()[0].title, "Rename Item");
  EXPECT_EQ(script->GetRequests()[0].prompt, "Neuer Name");
  EXPECT_EQ(script->GetRequests()[0].initialText, "Gaussian Blur");
}

TEST(InputBox, WithoutAnAnswerOrResponderTheBoxIsCancelled) {
  ToolkitTestScope scope;
  EXPECT_EQ(InputBox::Ask("Title", "Prompt", ""), std::nullopt);
  auto script = std::make_shared<ScriptedInputBox>();
  InputBox::SetResponder(script);
  script->PushAnswer(std::nullopt);
  script->PushAnswer("");
  EXPECT_EQ(InputBox::Ask("Title", "Prompt", "x"), std::nullopt);
  EXPECT_EQ(InputBox::Ask("Title", "Prompt", "x"), "");  // an empty answer is an answer
  EXPECT_EQ(InputBox::Ask("Title", "Prompt", "x"), std::nullopt);
  EXPECT_EQ(script->GetRequests().size(), 3u);
}

TEST(InputBox, SettingAResponderReturnsThePreviousOne) {
  ToolkitTestScope scope;
  auto first = std::make_shared<ScriptedInputBox>();
  auto second = std::make_shared<ScriptedInputBox>();
  EXPECT_EQ(InputBox::SetResponder(first), nullptr);
  EXPECT_EQ(InputBox::SetResponder(second), first);
  EXPECT_EQ(InputBox::GetResponder(), second);
}

}  // namespace
