#include <gtest/gtest.h>

#include <memory>
#include <variant>
#include <vector>

#include "Handlers/EffectControls/Src/ButtonParameter.h"
#include "Handlers/EffectControls/Src/GroupButtonsBeginParameter.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/TextButton.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

class ButtonsGroupTest : public ListViewTest {
 protected:
  void Show(int width) {
    levels = Make(kMatchName_Levels);
    clip = AddClip(v1, {levels});
    Open({width, 1200});
    Select({clip});
    for (const auto& effect : list->GetVideoItems()) {
      for (const auto& child : effect->GetItems()) {
        if (auto found = std::dynamic_pointer_cast<GroupButtonsBeginParameter>(child)) {
          group = found;
        }
      }
    }
    ASSERT_NE(group, nullptr);
    ASSERT_EQ(group->GetItems().size(), 3u);
  }
  ButtonParameter& Button(std::size_t i) const {
    return dynamic_cast<ButtonParameter&>(*group->GetItems().at(i));
  }
  int FirstLeft() const {
    return (group->GetGroupLevel() + 1) * group->GetIndentPerGroupLevel() + 5;
  }

  ComponentRef levels;
  TrackItemRef clip;
  std::shared_ptr<GroupButtonsBeginParameter> group;
};

TEST_F(ButtonsGroupTest, AWideRowPutsTheButtonsSideBySideOnOneLine) {
  Show(600);
  EXPECT_FALSE(group->IsExpanded());
  EXPECT_EQ(group->Height(), group->OwnHeight());
  group->SetIsExpanded(true);
  group->PositionSelf(60, 1, 600);
  int left = FirstLeft();
  for (std::size_t i = 0; i < 3; ++i) {
    const Rect bounds = Button(i).GetButton()->GetBounds();
    EXPECT_EQ(bounds.left, left) << i;
    EXPECT_EQ(Button(i).GetTop(), 60) << i;
    left += Button(i).GetPreferredButtonWidth() + 5;
  }
  EXPECT_EQ(group->Height(), Button(0).Height());
}

TEST_F(ButtonsGroupTest, AButtonThatWouldPassTheRowStartsANewLine) {
  Show(600);
  group->SetIsExpanded(true);
  const int first = FirstLeft() + Button(0).GetPreferredButtonWidth() + 5;
  // Room for the first two only.
  const int width = first + Button(1).GetPreferredButtonWidth() + 2;
  group->PositionSelf(0, 1, width);
  const int line = Button(0).Height();
  EXPECT_EQ(Button(1).GetTop(), 0);
  EXPECT_EQ(Button(2).GetTop(), line);
  EXPECT_EQ(Button(2).GetButton()->GetBounds().left, FirstLeft());
  EXPECT_EQ(group->Height(), 2 * line);
}

TEST_F(ButtonsGroupTest, OnATinyRowEachButtonHasItsOwnLineAndNoNegativeWidth) {
  Show(600);
  group->SetIsExpanded(true);
  group->PositionSelf(0, 1, 10);
  const int line = Button(0).Height();
  for (std::size_t i = 0; i < 3; ++i) {
    EXPECT_EQ(Button(i).GetTop(), static_cast<int>(i) * line) << i;
    EXPECT_GE(Button(i).GetButton()->GetBounds().Width(), 0) << i;
  }
  EXPECT_EQ(group->Height(), 3 * line);
}

TEST_F(ButtonsGroupTest, WithoutChildrenAnOpenGroupTakesNoHeight) {
  Show(600);
  for (std::size_t i = 0; i < 3; ++i) {
    Button(i).SetAside(true);
  }
  group->SetIsExpanded(true);
  EXPECT_EQ(group->Height(), 0);
}

TEST_F(ButtonsGroupTest, AClickOnALinedUpButtonIsOneStep) {
  Show(600);
  group->SetIsExpanded(true);
  list->PositionItems();
  host->Render();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  const Point at = Button(1).GetButton()->GetBounds().Center();
  host->MouseDown(MouseButton::kLeft, at, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, at, kKeyModifierNone);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps + 1);
  EXPECT_TRUE(std::get<bool>(levels->FindParam("Auto Contrast")->GetValueAt(0)));
}

}  // namespace
