#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/GroupHueBalanceAndPhaseBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupThreeWayHueBalanceBeginParameter.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/HueBalanceAndPhaseControl.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/Static.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

class WheelGroupsTest : public ListViewTest {
 protected:
  void Show(int width) {
    balance = Make(kMatchName_ColorBalanceWheel);
    threeWay = Make(kMatchName_ThreeWayColor);
    clip = AddClip(v1, {balance, threeWay});
    Open({width, 2000});
    Select({clip});
  }
  template <class Group>
  std::shared_ptr<Group> FindGroup() const {
    for (const auto& effect : list->GetVideoItems()) {
      for (const auto& child : effect->GetItems()) {
        if (auto group = std::dynamic_pointer_cast<Group>(child)) {
          return group;
        }
      }
    }
    return nullptr;
  }
  // Expands `group`, lays the list out and paints it, so the wheels take the pointer.
  void Expand(GroupBeginParameter& group) {
    group.SetIsExpanded(true);
    list->PositionItems();
    host->Render();
  }
  // Drags on `wheel` from its centre to `offset` from the centre (window coordinates).
  void DragWheel(const HueBalanceAndPhaseControl& wheel, Point offset) {
    const Point center{wheel.GetBounds().left + wheel.GetCenter().x,
                       wheel.GetBounds().top + wheel.GetCenter().y};
    host->MouseDown(MouseButton::kLeft, {center.x + 2, center.y}, kKeyModifierNone);
    host->MouseMove({center.x + offset.x / 2, center.y + offset.y / 2}, kKeyModifierNone);
    host->MouseMove({center.x + offset.x, center.y + offset.y}, kKeyModifierNone);
    host->MouseUp(MouseButton::kLeft, {center.x + offset.x, center.y + offset.y}, kKeyModifierNone);
  }
  // "angle/magnitude" of each wheel of the three-way effect.
  std::string Wheels() const {
    std::string text;
    for (const char* wheel : {"Shadows", "Midtones", "Highlights"}) {
      const double angle = *threeWay->FindParam(std::string(wheel) + " Angle")->GetScalarAt(0);
      const double magnitude =
          *threeWay->FindParam(std::string(wheel) + " Magnitude")->GetScalarAt(0);
      text += std::to_string(static_cast<int>(angle)) + "/" +
              std::to_string(static_cast<int>(magnitude)) + " ";
    }
    return text;
  }
  static int ChildrenHeight(const EffectItem& group) {
    int height = 0;
    for (const auto& child : group.GetItems()) {
      height += child->IsSetAside() ? 0 : child->Height();
    }
    return height;
  }
  UndoStack& Undo() const { return project->GetUndoStack(); }

  ComponentRef balance, threeWay;
  TrackItemRef clip;
};

TEST_F(WheelGroupsTest, TheHueBalanceWheelIsSizedFromTheListWidth) {
  Show(455);
  auto group = FindGroup<GroupHueBalanceAndPhaseBeginParameter>();
  ASSERT_NE(group, nullptr);
  EXPECT_FALSE(group->IsExpanded());
  group->SetIsExpanded(true);
  group->PositionSelf(40, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  const int d = 455 - i - 90;
  EXPECT_EQ(group->GetWheel(0)->GetBounds(), Rect::FromSize(i + 35, 60, d, d));
  ASSERT_EQ(group->GetItems().size(), 2u);
  EXPECT_EQ(group->GetItems()[0]->GetTop(), 40 + 18 + d);
  EXPECT_EQ(group->Height(), 455 - i - 72 + ChildrenHeight(*group));
}

TEST_F(WheelGroupsTest, OnANarrowListTheWheelsShrinkToNothingAndTheBandStays) {
  Show(455);
  auto balanceGroup = FindGroup<GroupHueBalanceAndPhaseBeginParameter>();
  auto threeWayGroup = FindGroup<GroupThreeWayHueBalanceBeginParameter>();
  balanceGroup->SetIsExpanded(true);
  threeWayGroup->SetIsExpanded(true);
  balanceGroup->PositionSelf(0, 1, 30);
  threeWayGroup->PositionSelf(500, 1, 30);
  EXPECT_EQ(balanceGroup->GetWheelDiameter(), 0);
  EXPECT_EQ(balanceGroup->GetWheel(0)->GetBounds().Width(), 0);
  EXPECT_EQ(balanceGroup->Height(), balanceGroup->OwnHeight() + ChildrenHeight(*balanceGroup));
  EXPECT_GE(balanceGroup->GetItems()[0]->GetTop(), balanceGroup->OwnHeight());
  for (std::size_t w = 0; w < 3; ++w) {
    EXPECT_EQ(threeWayGroup->GetWheel(w)->GetBounds().Width(), 0);
    EXPECT_GE(threeWayGroup->GetLabel(w)->GetBounds().Width(), 0);
  }
}

TEST_F(WheelGroupsTest, TheThreeWheelsStandInColumnsFivePixelsApart) {
  Show(455);
  auto group = FindGroup<GroupThreeWayHueBalanceBeginParameter>();
  ASSERT_NE(group, nullptr);
  group->SetIsExpanded(true);
  group->PositionSelf(0, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  const int d = (455 - i - 40) / 3;
  EXPECT_EQ(group->GetWheel(0)->GetBounds().left, i + 20);
  EXPECT_EQ(group->GetWheel(1)->GetBounds().left, i + 25 + d);
  EXPECT_EQ(group->GetWheel(2)->GetBounds().left, i + 30 + 2 * d);
  EXPECT_EQ(group->GetWheel(2)->GetBounds().Width(), d);
  EXPECT_EQ(group->GetResetButton(2)->GetBounds().right, i + 30 + 3 * d);
  EXPECT_EQ(group->GetResetButton(1)->GetCommand(), 18514);
}

TEST_F(WheelGroupsTest, AWheelDragIsOneStepOverAngleAndMagnitudeThatUndoRestores) {
  Show(455);
  auto group = FindGroup<GroupHueBalanceAndPhaseBeginParameter>();
  Expand(*group);
  const std::size_t steps = Undo().GetUndoNames().size();
  const HueBalanceAndPhaseControl& wheel = *group->GetWheel(0);
  DragWheel(wheel, {0, -wheel.GetRadius() / 2});
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  EXPECT_EQ(Undo().GetUndoName(), "MZ.ComponentParam.SetValue");
  EXPECT_NEAR(*balance->FindParam("Balance Angle")->GetScalarAt(0), 90.0, 0.5);
  EXPECT_NEAR(*balance->FindParam("Balance Magnitude")->GetScalarAt(0), 50.0, 1.0);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(*balance->FindParam("Balance Angle")->GetScalarAt(0), 0.0);
  EXPECT_EQ(*balance->FindParam("Balance Magnitude")->GetScalarAt(0), 0.0);
  EXPECT_EQ(wheel.GetMagnitude(), 0.0) << "the wheel follows the undo";
}

TEST_F(WheelGroupsTest, UnlinkedWheelsMoveAloneAndLinkedOnesTogether) {
  Show(455);
  auto group = FindGroup<GroupThreeWayHueBalanceBeginParameter>();
  Expand(*group);
  const HueBalanceAndPhaseControl& midtones = *group->GetWheel(1);
  DragWheel(midtones, {-midtones.GetRadius(), 0});
  EXPECT_EQ(Wheels(), "0/0 180/100 0/0 ");

  ASSERT_EQ(threeWay->FindParam("Link Wheels")->SetValueAt(0, ParamValue(true)), true);
  ASSERT_TRUE(group->IsLinked());
  const std::size_t steps = Undo().GetUndoNames().size();
  const HueBalanceAndPhaseControl& shadows = *group->GetWheel(0);
  DragWheel(shadows, {0, shadows.GetRadius() / 2});
  EXPECT_EQ(Wheels(), "270/50 270/50 270/50 ");
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  EXPECT_EQ(group->GetWheel(2)->GetAngle(), 270.0);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Wheels(), "0/0 180/100 0/0 ");
}

TEST_F(WheelGroupsTest, AResetButtonResetsItsWheelAsOneStep) {
  Show(455);
  auto group = FindGroup<GroupThreeWayHueBalanceBeginParameter>();
  Expand(*group);
  DragWheel(*group->GetWheel(2), {group->GetWheel(2)->GetRadius(), 0});
  DragWheel(*group->GetWheel(0), {-group->GetWheel(0)->GetRadius(), 0});
  EXPECT_EQ(Wheels(), "180/100 0/0 0/100 ");
  const std::size_t steps = Undo().GetUndoNames().size();
  EXPECT_TRUE(group->ObeyCommand(GroupThreeWayHueBalanceBeginParameter::kResetShadowsCommand));
  EXPECT_EQ(Wheels(), "0/0 0/0 0/100 ");
  EXPECT_EQ(Undo().GetUndoNames().size(), steps + 1);
  ASSERT_TRUE(Undo().Undo());
  EXPECT_EQ(Wheels(), "180/100 0/0 0/100 ");
}

}  // namespace
