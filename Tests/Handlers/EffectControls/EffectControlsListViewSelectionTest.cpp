#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Host/Messaging/DebugFlags.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Cursor.h"
#include "Host/Toolkit/Menu.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

using Strings = std::vector<std::string>;

// Clicks reach the list through a window, as a user's would; the edit menu is answered (and
// recorded) by a scripted tracker.
class ListSelectionTest : public ListViewTest {
 protected:
  ListSelectionTest() {
    Preferences::SetApplication(std::make_unique<Preferences>());
    ResetCursorForTesting();
    MenuRegistry::Instance().RegisterFromText(
        ReadTextFile("Handlers/EffectControls/Resources/EffectControlsMenus.txt"));
    previousMenus = SetMenuTrackerForTesting(menus);
  }
  ~ListSelectionTest() override {
    SetMenuTrackerForTesting(previousMenus);
    MenuRegistry::Instance().Remove(EffectControlsListView::kEditMenuName);
    Preferences::SetApplication(nullptr);
    ResetCursorForTesting();
  }

  // A clip with Motion (its Position keyframed), Opacity, Gaussian Blur and Crop, shown.
  TrackItemRef ShowClip() {
    motion = Make(kMatchName_Motion);
    ProjectBuilder::AddKeyframes(
        motion->GetParams().front(),
        {{.time = 0, .value = ParamPoint{1, 2}}, {.time = kSecond, .value = ParamPoint{5, 6}}});
    clip = AddClip(v1, {motion, Make(kMatchName_Opacity), Make(kMatchName_GaussianBlur),
                        Make(kMatchName_Crop)});
    Open();
    Select({clip});
    return clip;
  }

  Point TitleOf(const EffectItem& row) const { return Point{60, row.GetTop() + 5}; }
  Point NameOf(const EffectItem& row) const {
    const Rect name = list->GetParameterNameRect(row);
    return Point{name.left + 2, row.GetTop() + 5};
  }
  void Press(Point at, KeyModifiers modifiers = kKeyModifierNone) {
    host->MouseDown(MouseButton::kLeft, at, modifiers);
  }
  void Click(Point at, KeyModifiers modifiers = kKeyModifierNone) {
    Press(at, modifiers);
    host->MouseUp(MouseButton::kLeft, at, modifiers);
  }
  void RightClick(Point at) {
    host->MouseDown(MouseButton::kRight, at, kKeyModifierNone);
    host->MouseUp(MouseButton::kRight, at, kKeyModifierNone);
  }
  // The top row of the named effect (the build orders intrinsics its own way).
  const EffectItem& Effect(const std::string& name) const {
    for (const auto& row : list->GetVideoItems()) {
      if (row->GetName() == name) {
        return *row;
      }
    }
    ADD_FAILURE() << "no row " << name;
    return *list->GetVideoItems().At(0);
  }
  const EffectItem& Child(const EffectItem& row, const std::string& name) const {
    for (const auto& child : row.GetItems()) {
      if (child->GetName() == name) {
        return *child;
      }
    }
    ADD_FAILURE() << "no row " << name;
    return row;
  }
  const EffectItem& PositionRow() const { return Child(Effect("Motion"), "Position"); }

  Strings Selected() const {
    Strings names;
    for (const auto& entry : list->GetSelectedItems().GetEntries()) {
      names.push_back(entry.component->GetDisplayName());
    }
    return names;
  }
  Strings SelectedParameters() const {
    Strings names;
    for (const auto& entry : list->GetSelectedParameters().GetEntries()) {
      names.push_back(entry.param->GetName());
    }
    return names;
  }
  std::size_t SelectedKeyframes() const {
    return list->GetKeyframeSelection() ? list->GetKeyframeSelection()->GetKeyframeCount() : 0;
  }
  DirectManipulationManager& DM() { return project->GetDirectManipulationManager(); }

  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<MenuTracker> previousMenus;
  ComponentRef motion;
  TrackItemRef clip;
};

TEST_F(ListSelectionTest, AClickNearTheRightEdgeDragsTheSeparatorAndChangesNoSelection) {
  ShowClip();
  Click(TitleOf(Effect("Gaussian Blur")));
  ASSERT_EQ(Selected(), Strings{"Gaussian Blur"});
  MessageRecorder recorder;
  recorder.Listen(list->GetOwnStation());

  const int right = list->GetBounds().Width();
  Press(Point{right - 3, Effect("Motion").GetTop() + 5});
  EXPECT_TRUE(list->IsDraggingSeparator());
  EXPECT_EQ(GetCurrentCursor(), Cursor::kSplitterHorizontal);
  host->MouseMove(Point{right - 40, 30}, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, Point{right - 40, 30}, kKeyModifierNone);

  EXPECT_FALSE(list->IsDraggingSeparator());
  EXPECT_EQ(Selected(), Strings{"Gaussian Blur"});
  EXPECT_EQ(recorder.names, Strings{"EffectControlsListSeparatorMoved"});
}

TEST_F(ListSelectionTest, LosingTheCaptureEndsASeparatorDrag) {
  ShowClip();
  Press(Point{list->GetBounds().Width() - 2, 40});
  ASSERT_TRUE(list->IsDraggingSeparator());
  list->Hide();
  EXPECT_FALSE(list->IsDraggingSeparator());
}

TEST_F(ListSelectionTest, AClickBelowTheLastRowClearsBothSelectionsAndTheOnScreenControls) {
  ShowClip();
  Click(TitleOf(Effect("Motion")));
  ASSERT_EQ(Selected(), Strings{"Motion"});
  EXPECT_EQ(DM().GetFilter(), motion);
  list->SelectParameter(
      std::const_pointer_cast<EffectItem>(Child(Effect("Crop"), "Left").shared_from_this()), true);
  ASSERT_FALSE(list->GetSelectedParameters().IsEmpty());

  Click(Point{60, list->GetMaxHeight() + 10});
  EXPECT_TRUE(Selected().empty());
  EXPECT_TRUE(SelectedParameters().empty());
  EXPECT_EQ(DM().GetFilter(), nullptr);
  EXPECT_FALSE(Effect("Motion").IsSelected());
}

TEST_F(ListSelectionTest, AClickSelectsOneEffectAndCtrlClickTogglesOneAtATime) {
  ShowClip();
  Click(TitleOf(Effect("Opacity")));
  EXPECT_EQ(Selected(), Strings{"Opacity"});
  Click(TitleOf(Effect("Gaussian Blur")), kKeyModifierCtrl);
  Click(TitleOf(Effect("Crop")), kKeyModifierCtrl);
  EXPECT_EQ(Selected(), (Strings{"Opacity", "Gaussian Blur", "Crop"}));
  Click(TitleOf(Effect("Gaussian Blur")), kKeyModifierCtrl);
  EXPECT_EQ(Selected(), (Strings{"Opacity", "Crop"}));
  EXPECT_FALSE(Effect("Gaussian Blur").IsSelected());
  EXPECT_TRUE(Effect("Crop").IsSelected());
  Click(TitleOf(Effect("Motion")));
  EXPECT_EQ(Selected(), Strings{"Motion"});
}

TEST_F(ListSelectionTest, ARightClickOnAnUnselectedEffectSelectsItAloneAndOpensTheEditMenu) {
  ShowClip();
  Click(TitleOf(Effect("Opacity")));
  Click(TitleOf(Effect("Gaussian Blur")), kKeyModifierCtrl);
  RightClick(TitleOf(Effect("Crop")));
  EXPECT_EQ(Selected(), Strings{"Crop"});
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  EXPECT_EQ(menus->GetRequests().front().menuName, EffectControlsListView::kEditMenuName);
}

TEST_F(ListSelectionTest, ARightClickOnASelectedEffectKeepsTheSelectionAndOpensTheEditMenu) {
  ShowClip();
  Click(TitleOf(Effect("Opacity")));
  Click(TitleOf(Effect("Gaussian Blur")), kKeyModifierCtrl);
  RightClick(TitleOf(Effect("Gaussian Blur")));
  EXPECT_EQ(Selected(), (Strings{"Opacity", "Gaussian Blur"}));
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  // Below the rows the menu still opens, and what was selected stays.
  RightClick(Point{60, list->GetMaxHeight() + 10});
  EXPECT_EQ(menus->GetRequests().size(), 2u);
  EXPECT_EQ(Selected(), (Strings{"Opacity", "Gaussian Blur"}));
}

TEST_F(ListSelectionTest, ClickingAKeyframedParametersNameSelectsItsKeyframesAndShiftAdds) {
  ShowClip();
  MessageRecorder recorder;
  recorder.Listen(list->GetKeyframeViewStation());

  Click(NameOf(PositionRow()));
  EXPECT_EQ(SelectedKeyframes(), 2u);
  EXPECT_EQ(SelectedParameters(), Strings{"Position"});
  EXPECT_TRUE(Selected().empty());
  EXPECT_NE(
      std::find(recorder.names.begin(), recorder.names.end(), "EffectControlsBecomeTargetMessage"),
      recorder.names.end());

  // A second keyframed parameter: a plain click replaces, Shift and Ctrl add.
  const EffectItem& left = Child(Effect("Crop"), "Left");
  ProjectBuilder::AddKeyframes(dynamic_cast<const ParameterControl&>(left).GetParam(),
                               {{.time = 0, .value = 1.0}});
  Click(NameOf(left));
  EXPECT_EQ(SelectedKeyframes(), 1u);
  Click(NameOf(PositionRow()), kKeyModifierShift);
  EXPECT_EQ(SelectedKeyframes(), 3u);
  EXPECT_EQ(SelectedParameters(), (Strings{"Left", "Position"}));
  Click(NameOf(left));
  EXPECT_EQ(SelectedKeyframes(), 1u);
  Click(NameOf(PositionRow()), kKeyModifierCtrl);
  EXPECT_EQ(SelectedKeyframes(), 3u);
}

TEST_F(ListSelectionTest, AClickBesideAParametersNameIsNoHitAndEmptiesTheSelections) {
  ShowClip();
  Click(NameOf(PositionRow()));
  ASSERT_EQ(SelectedKeyframes(), 2u);
  const Rect name = list->GetParameterNameRect(PositionRow());
  Click(Point{name.right + 5, PositionRow().GetTop() + 5});
  EXPECT_EQ(SelectedKeyframes(), 0u);
  EXPECT_TRUE(SelectedParameters().empty());
}

TEST_F(ListSelectionTest, AMoveOfTwoPixelsStartsNoDragAndAnIntrinsicShowsTheNoDropCursor) {
  ShowClip();
  const Point at = TitleOf(Effect("Motion"));
  Press(at);
  host->MouseMove(Point{at.x + 2, at.y - 2}, kKeyModifierNone);
  EXPECT_TRUE(list->HasMouseCapture());
  EXPECT_EQ(GetCurrentCursor(), Cursor::kOSArrow);

  const auto before = clip->GetComponentChain()->GetComponents();
  host->MouseMove(Point{at.x + 3, at.y + 40}, kKeyModifierNone);
  EXPECT_FALSE(list->HasMouseCapture());
  EXPECT_EQ(GetCurrentCursor(), Cursor::kFistNo);
  host->MouseUp(MouseButton::kLeft, Point{at.x + 3, at.y + 40}, kKeyModifierNone);
  EXPECT_EQ(clip->GetComponentChain()->GetComponents(), before);
  EXPECT_FALSE(project->GetUndoStack().CanUndo());
}

TEST_F(ListSelectionTest, DraggingAnAppliedEffectShowsTheFist) {
  ShowClip();
  const Point at = TitleOf(Effect("Gaussian Blur"));
  Press(at);
  host->MouseMove(Point{at.x, at.y + 3}, kKeyModifierNone);
  EXPECT_EQ(GetCurrentCursor(), Cursor::kFist);
  host->MouseUp(MouseButton::kLeft, Point{at.x, at.y + 3}, kKeyModifierNone);
}

TEST_F(ListSelectionTest, ClickingAMaskClearsTheOtherSelectedEffectsUnlessTheDebugFlagAllowsIt) {
  ComponentRef blur = Make(kMatchName_GaussianBlur);
  blur->SetMasks({Make(kMatchName_Mask)});
  clip = AddClip(v1, {Make(kMatchName_Opacity), blur});
  Open();
  Select({clip});
  const EffectItem& blurRow = Effect("Gaussian Blur");
  std::shared_ptr<EffectItem> maskRow;
  for (const auto& child : blurRow.GetItems()) {
    if (auto* filter = dynamic_cast<FilterItem*>(child.get()); filter && filter->IsMask()) {
      maskRow = child;
    }
  }
  ASSERT_NE(maskRow, nullptr);

  Click(TitleOf(Effect("Opacity")));
  Click(TitleOf(blurRow), kKeyModifierCtrl);
  Click(TitleOf(*maskRow), kKeyModifierCtrl);
  EXPECT_EQ(list->GetSelectedItems().Size(), 1u);
  EXPECT_TRUE(list->SelectionContainsSubsidiaryItems());
  EXPECT_FALSE(Effect("Opacity").IsSelected());

  SetDebugFlag(kDebugFlagEnableMaskMultiSelect, true);
  Click(TitleOf(Effect("Opacity")));
  Click(TitleOf(*maskRow), kKeyModifierCtrl);
  EXPECT_EQ(list->GetSelectedItems().Size(), 2u);
}

// A miss in the video section must not cost the keyframes a Shift-click in the audio section
// adds to.
TEST_F(ListSelectionTest, AShiftClickInTheAudioSectionKeepsTheKeyframeSelection) {
  motion = Make(kMatchName_Motion);
  ProjectBuilder::AddKeyframes(motion->GetParams().front(),
                               {{.time = 0, .value = ParamPoint{1, 2}}});
  clip = AddClip(v1, {motion});
  const TrackItemRef sound = AddClip(a1, {Make(kMatchName_Volume)});
  clip->SetLinkGroup(3);
  sound->SetLinkGroup(3);
  Open({420, 900});
  Select({clip, sound});
  ASSERT_EQ(list->GetNumberOfAudioParts(), 1);
  Click(NameOf(PositionRow()));
  ASSERT_EQ(SelectedKeyframes(), 1u);

  const EffectItem& volume = *list->GetAudioParts().front()->GetItems().At(0);
  Click(TitleOf(volume), kKeyModifierCtrl);
  EXPECT_EQ(SelectedKeyframes(), 1u);
  EXPECT_EQ(Selected(), Strings{"Volume"});
  Click(Point{60, list->GetMaxHeight() + 10});
  EXPECT_EQ(SelectedKeyframes(), 0u);
}

TEST_F(ListSelectionTest, ThePickedOnScreenControlsSelectTheirEffect) {
  ShowClip();
  Click(TitleOf(Effect("Opacity")));
  DM().PickFilter(motion, clip);
  EXPECT_EQ(Selected(), Strings{"Motion"});
  EXPECT_TRUE(Effect("Motion").IsSelected());
  EXPECT_FALSE(Effect("Opacity").IsSelected());
}

TEST_F(ListSelectionTest, EffectsWithoutOnScreenControlsLeaveTheMonitorWithout) {
  ShowClip();
  Click(TitleOf(Effect("Motion")));
  EXPECT_EQ(DM().GetFilter(), motion);
  Click(TitleOf(Effect("Gaussian Blur")));
  EXPECT_EQ(DM().GetFilter(), nullptr);
  // The owner of a selected parameter is the fallback.
  Click(NameOf(PositionRow()));
  EXPECT_EQ(DM().GetFilter(), motion);
}

}  // namespace
