#include <gtest/gtest.h>

#include <memory>
#include <set>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/TextPopup.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"
#include "Tests/Host/Toolkit/PopupTestSupport.h"

namespace {

constexpr CommandID kPlain = PopupControl::kPlainItemCommandBase;

CommandStatus Status(bool enabled, bool checked) {
  CommandStatus status;
  status.enabled = enabled;
  status.checked = checked;
  return status;
}

// "chose 2 cmd 0 #5" for every PopupControlChangedMessage on the popup's station.
class ChoiceRecorder : public Listener {
 public:
  void ListenToMessage(const Message& message) override {
    if (const auto* m = message.As<PopupControlChangedMessage>()) {
      lines.push_back(Format("chose %d cmd %d #%d", m->index, m->command, m->id));
    }
  }
  std::vector<std::string> lines;
};

class TextPopupTest : public ControlTest {
 protected:
  TextPopupTest() {
    popup = Add(std::make_shared<TextPopup>(kBounds, 5));
    popup->SetItems({"Normal", "Dissolve", "Darken"});
    AddListener(popup->GetStation(), choices);
    log->Clear();
  }

  Point Inside() const { return kBounds.Center(); }
  const PopupMenuRequest& LastRequest() const { return menus->GetRequests().back(); }

  static constexpr Rect kBounds{20, 20, 120, 37};
  std::shared_ptr<TextPopup> popup;
  ChoiceRecorder choices;
};

TEST_F(TextPopupTest, APressOpensTheItemsAndChoosingOneSelectsAndReportsIt) {
  EXPECT_EQ(popup->GetSelectedText(), "Normal");
  menus->PushAnswer(kPlain + 2);
  Press(Inside());
  Release(Inside());
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  const PopupMenuRequest& request = LastRequest();
  ASSERT_EQ(request.entries.size(), 3u);
  EXPECT_EQ(request.entries[1].text, "Dissolve");
  EXPECT_TRUE(request.entries[0].checked) << "the current item is marked";
  EXPECT_FALSE(request.entries[2].checked);
  EXPECT_TRUE(request.entries[2].enabled);
  EXPECT_EQ(request.windowPoint, (Point{20, 37})) << "the menu opens below the popup";
  EXPECT_EQ(popup->GetSelectedIndex(), 2);
  EXPECT_EQ(popup->GetSelectedText(), "Darken");
  EXPECT_EQ(choices.lines, Lines{"chose 2 cmd 0 #5"});
  EXPECT_TRUE(Commands().empty()) << "plain items send no command up the chain";
}

TEST_F(TextPopupTest, DismissingTheMenuChangesNothing) {
  menus->PushAnswer(std::nullopt);
  Click(Inside());
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
  EXPECT_TRUE(choices.lines.empty());
  EXPECT_FALSE(popup->IsMenuOpen());
}

TEST_F(TextPopupTest, ADisabledItemIsShownDisabledAndCannotBeChosen) {
  popup->SetItemEnabled(1, false);
  menus->PushAnswer(kPlain + 1);
  EXPECT_EQ(popup->OpenMenu(), std::nullopt);
  EXPECT_FALSE(LastRequest().entries[1].enabled);
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
  EXPECT_TRUE(choices.lines.empty());
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u) << "the tracker's answer is refused";
}

TEST_F(TextPopupTest, ArrowKeysStepOverSeparatorsAndDisabledItemsAndStopAtTheEnds) {
  popup->ClearItems();
  popup->AddItem("A");
  popup->AddSeparator();
  popup->AddItem("B");
  popup->AddItem("C");
  popup->SetItemEnabled(2, false);
  popup->SetSelectedIndex(0);
  menus->PushAnswer(std::nullopt);
  Click(Inside());  // takes the focus
  ASSERT_TRUE(popup->IsTarget());
  Key(KeyCode::kDown);
  EXPECT_EQ(popup->GetSelectedIndex(), 3);
  Key(KeyCode::kDown);
  EXPECT_EQ(popup->GetSelectedIndex(), 3) << "no wrap at the end";
  Key(KeyCode::kUp);
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
  EXPECT_FALSE(popup->Step(-1));
  EXPECT_EQ(choices.lines, (Lines{"chose 3 cmd 0 #5", "chose 0 cmd 0 #5"}));
}

TEST_F(TextPopupTest, SpaceAndReturnOpenTheMenuOfTheFocusedPopup) {
  menus->PushAnswer(std::nullopt);
  Click(Inside());
  menus->PushAnswer(kPlain + 1);
  Key(KeyCode::kSpace);
  EXPECT_EQ(popup->GetSelectedIndex(), 1);
  menus->PushAnswer(kPlain + 2);
  Key(KeyCode::kReturn);
  EXPECT_EQ(popup->GetSelectedIndex(), 2);
  EXPECT_EQ(menus->GetRequests().size(), 3u);
}

TEST_F(TextPopupTest, ADisabledPopupNeitherOpensNorSteps) {
  popup->Disable();
  Click(Inside());
  EXPECT_EQ(popup->OpenMenu(), std::nullopt);
  EXPECT_FALSE(popup->Step(1));
  EXPECT_TRUE(menus->GetRequests().empty());
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
}

TEST_F(TextPopupTest, AnEmptyPopupOpensNothing) {
  popup->ClearItems();
  EXPECT_EQ(popup->GetSelectedIndex(), -1);
  EXPECT_EQ(popup->GetSelectedText(), "");
  EXPECT_EQ(popup->OpenMenu(), std::nullopt);
  EXPECT_TRUE(menus->GetRequests().empty());
}

TEST_F(TextPopupTest, CommandItemsAreTheOwnersAndSelectOnlyWhenHandled) {
  ASSERT_TRUE(MenuRegistry::Instance().RegisterFromText(
      "menu Test_Quality\n item 18461 \"Off\"\n item 18462 \"Low\"\n separator\n"
      " item 18463 \"High\"\nend\n"));
  ASSERT_TRUE(popup->LoadMenu("Test_Quality"));
  EXPECT_EQ(popup->GetItemCount(), 4);
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
  root->obeys.insert(18462);
  menus->PushAnswer(18462);
  EXPECT_EQ(popup->OpenMenu(), 1);
  EXPECT_EQ(Commands(), Lines{"root command 18462"}) << "sent once, up from the popup";
  EXPECT_EQ(popup->GetSelectedIndex(), 1);
  EXPECT_EQ(choices.lines, Lines{"chose 1 cmd 18462 #5"});

  // Nobody handles 18463: the popup does not claim the choice.
  menus->PushAnswer(18463);
  EXPECT_EQ(popup->OpenMenu(), std::nullopt);
  EXPECT_EQ(popup->GetSelectedIndex(), 1);
  EXPECT_EQ(choices.lines.size(), 1u);
  EXPECT_TRUE(popup->SelectCommand(18463));
  EXPECT_EQ(popup->GetSelectedIndex(), 3);
  EXPECT_FALSE(popup->SelectCommand(18999));
}

TEST_F(TextPopupTest, TheOwnersStatusDecidesForCommandItems) {
  popup->ClearItems();
  popup->AddItem("Centre", 18471);
  popup->AddItem("Start", 18472);
  popup->AddItem("End", 18473);
  popup->SetSelectedIndex(0);
  root->statuses[18471] = Status(true, false);
  root->statuses[18472] = Status(false, false);
  root->statuses[18473] = Status(true, true);
  menus->PushAnswer(std::nullopt);
  popup->OpenMenu();
  const auto& entries = LastRequest().entries;
  EXPECT_TRUE(entries[0].enabled);
  EXPECT_FALSE(entries[0].checked) << "the owner's check marks, not the popup's selection";
  EXPECT_FALSE(entries[1].enabled);
  EXPECT_TRUE(entries[2].checked);
  // An item disabled here stays disabled whatever the owner says.
  popup->SetItemEnabled(2, false);
  menus->PushAnswer(std::nullopt);
  popup->OpenMenu();
  EXPECT_FALSE(LastRequest().entries[2].enabled);
}

TEST_F(TextPopupTest, TheOwnerMayDestroyThePopupWhileItChooses) {
  popup->ClearItems();
  popup->AddItem("Track 1", 18600);
  popup->AddItem("Track 2", 18601);
  root->onCommand = [this](RecordingView&, CommandID command) {
    popup->Destroy();
    popup.reset();
    return command == 18601;
  };
  menus->PushAnswer(18601);
  Click(Inside());
  EXPECT_EQ(popup, nullptr);
  EXPECT_TRUE(choices.lines.empty()) << "a destroyed popup reports nothing";
}

TEST_F(TextPopupTest, BadSelectionsAndReservedCommandsAreRefused) {
  popup->AddSeparator();
  popup->SetSelectedIndex(3);  // the separator
  popup->SetSelectedIndex(7);
  popup->SetSelectedIndex(-2);
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
  EXPECT_EQ(popup->AddItem("Reserved", kPlain + 1), -1);
  EXPECT_EQ(popup->GetItemCount(), 4);
  EXPECT_FALSE(popup->LoadMenu("No_Such_Menu"));
  EXPECT_EQ(popup->GetItemCount(), 4) << "an unknown menu leaves the items";
  std::set<std::string> reasons;
  for (const DebugAssertionRecord& record : RecordedDebugAssertions()) {
    reasons.insert(record.message);
  }
  EXPECT_EQ(reasons, (std::set<std::string>{"Invalid popup item", "A separator cannot be selected",
                                            "Popup item command in the reserved range",
                                            "Unknown menu resource"}));
  popup->SetSelectedIndex(-1);
  EXPECT_EQ(popup->GetSelectedText(), "");
}

TEST_F(TextPopupTest, PaintsTheSelectedTextInsideItsBoundsAndRepaintsOnAChoice) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  const Image before = host.GetImage().Clone();
  popup->SetSelectedIndex(1);
  host.Render();
  EXPECT_GT(DifferingPixels(before, host.GetImage(), kBounds), 20) << "the new text is drawn";
  const Image enabled = host.GetImage().Clone();
  popup->Disable();
  host.Render();
  EXPECT_GT(DifferingPixels(enabled, host.GetImage(), kBounds), 20) << "disabled looks different";
  SaveForInspection(host.GetImage(), "textpopup-disabled.png");
}

}  // namespace
