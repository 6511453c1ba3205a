#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/GroupHueRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupLumaRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupSaturationRangeDefinitionBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupTonalRangeDefinitionBeginParameter.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/UndoStack.h"
#include "Host/Rows/DoubleSliderParameter.h"
#include "Host/Toolkit/HSLRangeDefinitionControl.h"
#include "Host/Toolkit/TonalRangeDefinitionControl.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

class RangeGroupsTest : public ListViewTest {
 protected:
  void Show(int width) {
    hue = Make(kMatchName_HueRange);
    clip = AddClip(v1, {hue});
    Open({width, 1200});
    Select({clip});
    for (const auto& effect : list->GetVideoItems()) {
      for (const auto& child : effect->GetItems()) {
        if (auto found = std::dynamic_pointer_cast<GroupHueRangeDefinitionBeginParameter>(child)) {
          group = found;
        }
      }
    }
    ASSERT_NE(group, nullptr);
  }
  DoubleSliderParameter& Row(std::size_t child) const {
    return dynamic_cast<DoubleSliderParameter&>(*group->GetItems().at(child));
  }
  double Value(const char* name) const { return *hue->FindParam(name)->GetScalarAt(0); }
  UndoStack& Undo() const { return project->GetUndoStack(); }

  ComponentRef hue;
  TrackItemRef clip;
  std::shared_ptr<GroupHueRangeDefinitionBeginParameter> group;
};

TEST_F(RangeGroupsTest, ChildrenAreNumbered100To104AndTheFirstIsSetAside) {
  Show(455);
  ASSERT_EQ(group->GetItems().size(), 5u);
  const auto& first = dynamic_cast<const ParameterControl&>(*group->GetItems()[0]);
  EXPECT_EQ(first.GetControlID(), 100);
  EXPECT_TRUE(first.IsSetAside());
  const int handles[] = {0, 6, 5, 8, 7};
  for (std::size_t i = 1; i < 5; ++i) {
    EXPECT_EQ(Row(i).GetControlID(), 100 + static_cast<int>(i));
    EXPECT_TRUE(Row(i).HasLimiter());
    EXPECT_EQ(Row(i).GetLimiterHandle(), handles[i]);
  }
}

TEST_F(RangeGroupsTest, AValueTypedPastALimiterBoundIsClampedToIt) {
  Show(455);
  // Start threshold between the start softness (30) and the end threshold (180).
  Row(1).OnSliderValueChanged(250.0f, true);
  EXPECT_DOUBLE_EQ(Value("Start Threshold"), 180.0);
  // Start softness between the minimum and the start threshold, now 180.
  Row(2).OnSliderValueChanged(300.0f, true);
  EXPECT_DOUBLE_EQ(Value("Start Softness"), 180.0);
  // Within its bounds a value passes unchanged.
  Row(3).OnSliderValueChanged(200.0f, true);
  EXPECT_DOUBLE_EQ(Value("End Threshold"), 200.0);
  EXPECT_EQ(Undo().GetUndoNames().size(), 3u);
}

TEST_F(RangeGroupsTest, TheRangeControlIsPlacedFromTheWidthAndClampedWhenNarrow) {
  Show(455);
  group->SetIsExpanded(true);
  group->PositionSelf(10, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  EXPECT_EQ(group->GetRangeControl()->GetBounds(), Rect::FromSize(i + 20, 15, 455 - i - 35, 33));
  EXPECT_EQ(group->GetItems()[1]->GetTop(), 10 + 38);
  int children = 0;
  for (std::size_t c = 1; c < 5; ++c) {
    children += group->GetItems()[c]->Height();
  }
  EXPECT_EQ(group->Height(), 38 + children) << "the set-aside first child is not counted";
  group->PositionSelf(10, 1, 20);
  EXPECT_EQ(group->GetRangeControl()->GetBounds().Width(), 0);
}

TEST_F(RangeGroupsTest, AHandleDragIsOneStepAndUndoRestoresIt) {
  Show(455);
  group->SetIsExpanded(true);
  list->PositionItems();
  host->Render();
  const HSLRangeDefinitionControl& range = *group->GetRangeControl();
  const Rect bounds = range.GetBounds();
  const Point from{bounds.left + range.ValueToLocal(180.0),
                   bounds.top + HSLRangeDefinitionControl::kBarHeight + 4};
  const Point to{from.x - 40, from.y};
  const std::size_t steps = Undo().GetUndoNames().size();
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  host->MouseMove({from.x - 20, from.y}, kKeyModifierNone);
  host->MouseMove(to, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, to, kKeyModifierNone);
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  EXPECT_LT(Value("End Threshold"), 180.0);
  EXPECT_DOUBLE_EQ(Value("Start Threshold"), 60.0);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_DOUBLE_EQ(Value("End Threshold"), 180.0);
  EXPECT_DOUBLE_EQ(range.GetValues().endThreshold, 180.0) << "the control follows the undo";
}

// The saturation and luma ranges: the same rows with their own limiter handles, in percent.
class PercentRangeGroupsTest : public ListViewTest {
 protected:
  template <class Group>
  std::shared_ptr<Group> Show(const char* matchName) {
    effect = Make(matchName);
    clip = AddClip(v1, {effect});
    Open({455, 1200});
    Select({clip});
    for (const auto& row : list->GetVideoItems()) {
      for (const auto& child : row->GetItems()) {
        if (auto found = std::dynamic_pointer_cast<Group>(child)) {
          return found;
        }
      }
    }
    return nullptr;
  }
  static DoubleSliderParameter& Row(const EffectItem& group, std::size_t child) {
    return dynamic_cast<DoubleSliderParameter&>(*group.GetItems().at(child));
  }
  double Value(const char* name) const { return *effect->FindParam(name)->GetScalarAt(0); }

  ComponentRef effect;
  TrackItemRef clip;
};

TEST_F(PercentRangeGroupsTest, TheSaturationRowsAnswerToHandles9To12AndAreClamped) {
  auto group = Show<GroupSaturationRangeDefinitionBeginParameter>(kMatchName_SaturationRange);
  ASSERT_NE(group, nullptr);
  const int handles[] = {0, 10, 9, 12, 11};
  for (std::size_t i = 1; i < 5; ++i) {
    EXPECT_EQ(Row(*group, i).GetLimiterHandle(), handles[i]);
  }
  EXPECT_TRUE(group->GetItems()[0]->IsSetAside());
  // Start threshold between the start softness (10) and the end threshold (70).
  Row(*group, 1).OnSliderValueChanged(95.0f, true);
  EXPECT_DOUBLE_EQ(Value("Start Threshold"), 70.0);
  EXPECT_DOUBLE_EQ(group->GetRangeControl()->GetValues().startThreshold, 70.0);
}

TEST_F(PercentRangeGroupsTest, TheLumaRowsAnswerToHandles13To16AndAreClamped) {
  auto group = Show<GroupLumaRangeDefinitionBeginParameter>(kMatchName_LumaRange);
  ASSERT_NE(group, nullptr);
  const int handles[] = {0, 14, 13, 16, 15};
  for (std::size_t i = 1; i < 5; ++i) {
    EXPECT_EQ(Row(*group, i).GetLimiterHandle(), handles[i]);
  }
  EXPECT_DOUBLE_EQ(group->GetMaxValue(), 100.0f);
  // End threshold between the start threshold (30) and 100 less the end softness (20).
  Row(*group, 3).OnSliderValueChanged(99.0f, true);
  EXPECT_DOUBLE_EQ(Value("End Threshold"), 80.0);
  Row(*group, 3).OnSliderValueChanged(5.0f, true);
  EXPECT_DOUBLE_EQ(Value("End Threshold"), 30.0);
}

TEST_F(PercentRangeGroupsTest, TheTonalRowsAnswerToTheirHandlesAndAreClamped) {
  auto group = Show<GroupTonalRangeDefinitionBeginParameter>(kMatchName_TonalRange);
  ASSERT_NE(group, nullptr);
  const int handles[] = {2, 3, 4, 1};
  for (std::size_t i = 0; i < 4; ++i) {
    EXPECT_EQ(Row(*group, i).GetLimiterHandle(), handles[i]);
  }
  // The shadow threshold stays below the highlight threshold (75).
  Row(*group, 0).OnSliderValueChanged(90.0f, true);
  EXPECT_DOUBLE_EQ(Value("Shadow Threshold"), 75.0);
  // The highlight threshold stays above the shadow threshold, now 75.
  Row(*group, 2).OnSliderValueChanged(40.0f, true);
  EXPECT_DOUBLE_EQ(Value("Highlight Threshold"), 75.0);
  Row(*group, 0).OnSliderValueChanged(20.0f, true);
  EXPECT_DOUBLE_EQ(Value("Shadow Threshold"), 20.0);
  EXPECT_DOUBLE_EQ(group->GetRangeControl()->GetValues().shadowThreshold, 20.0);
}

TEST_F(PercentRangeGroupsTest, TheTonalControlIsPlacedFromTheWidthAndClampedWhenNarrow) {
  auto group = Show<GroupTonalRangeDefinitionBeginParameter>(kMatchName_TonalRange);
  ASSERT_NE(group, nullptr);
  EXPECT_FALSE(group->IsExpanded());
  group->SetIsExpanded(true);
  group->PositionSelf(10, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  EXPECT_EQ(group->GetRangeControl()->GetBounds(), Rect::FromSize(i + 20, 15, 455 - i - 35, 33));
  EXPECT_EQ(group->GetItems()[0]->GetTop(), 10 + 38);
  int children = 0;
  for (const auto& child : group->GetItems()) {
    children += child->Height();
  }
  EXPECT_EQ(group->Height(), 38 + children);
  group->PositionSelf(10, 1, 20);
  EXPECT_EQ(group->GetRangeControl()->GetBounds().Width(), 0);
}

TEST_F(PercentRangeGroupsTest, ATonalDragThatPushesIsOneStepAndUndoRestoresBoth) {
  auto group = Show<GroupTonalRangeDefinitionBeginParameter>(kMatchName_TonalRange);
  ASSERT_NE(group, nullptr);
  group->SetIsExpanded(true);
  list->PositionItems();
  host->Render();
  const TonalRangeDefinitionControl& range = *group->GetRangeControl();
  const Rect bounds = range.GetBounds();
  const int y = bounds.top + TonalRangeDefinitionControl::kBarHeight + 4;
  const Point from{bounds.left + range.ValueToLocal(25.0), y};
  const Point to{bounds.left + range.ValueToLocal(90.0), y};
  UndoStack& undo = project->GetUndoStack();
  const std::size_t steps = undo.GetUndoNames().size();
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  host->MouseMove({(from.x + to.x) / 2, y}, kKeyModifierNone);
  host->MouseMove(to, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, to, kKeyModifierNone);
  EXPECT_EQ(undo.GetUndoNames().size(), steps + 1);
  EXPECT_GT(Value("Shadow Threshold"), 75.0);
  EXPECT_DOUBLE_EQ(Value("Highlight Threshold"), Value("Shadow Threshold"));
  ASSERT_TRUE(undo.Undo());
  EXPECT_DOUBLE_EQ(Value("Shadow Threshold"), 25.0);
  EXPECT_DOUBLE_EQ(Value("Highlight Threshold"), 75.0);
  EXPECT_DOUBLE_EQ(range.GetValues().highlightThreshold, 75.0) << "the control follows the undo";
}

}  // namespace
