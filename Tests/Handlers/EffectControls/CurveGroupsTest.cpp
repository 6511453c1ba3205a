#include <gtest/gtest.h>

#include <climits>
#include <limits>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Src/GroupCurveBeginParameter.h"
#include "Handlers/EffectControls/Src/GroupRGBCurvesBeginParameter.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/CurveControl.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

class CurveGroupsTest : public ListViewTest {
 protected:
  // A clip with the Luma Curve and RGB Curves effects, selected in a list `width` wide. The first
  // point parameter of each is made visible so that the groups have a child to place.
  void Show(int width) {
    luma = Make(kMatchName_LumaCurve);
    rgb = Make(kMatchName_RGBCurves);
    luma->FindParam("Luma Point 1 X")->SetVisible(true);
    rgb->FindParam("Master Point 1 X")->SetVisible(true);
    clip = AddClip(v1, {luma, rgb});
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
  static const EffectItem& FirstShownChild(const EffectItem& group) {
    for (const auto& child : group.GetItems()) {
      if (!child->IsSetAside()) {
        return *child;
      }
    }
    throw std::logic_error("no child shown");
  }
  // The window position of a curve level (the list fills the window).
  static Point At(const CurveControl& curve, CurvePoint level) {
    const Point local = curve.LevelToLocal(level);
    return {curve.GetBounds().left + local.x, curve.GetBounds().top + local.y};
  }
  std::string Points(const ComponentRef& effect, const char* curve) const {
    std::string text;
    for (int i = 1; i <= 16; ++i) {
      for (const char* axis : {"X", "Y"}) {
        const auto param =
            effect->FindParam(std::string(curve) + " Point " + std::to_string(i) + " " + axis);
        text +=
            std::to_string(static_cast<int>(*param->GetScalarAt(0))) + (*axis == 'X' ? "," : " ");
      }
    }
    return text;
  }

  ComponentRef luma, rgb;
  TrackItemRef clip;
};

TEST_F(CurveGroupsTest, ACurveGroupDrawsItsCurveFromTheListWidthAndItsChildBelow) {
  Show(455);
  auto group = FindGroup<GroupCurveBeginParameter>();
  ASSERT_NE(group, nullptr);
  EXPECT_FALSE(group->IsExpanded()) << "groups start collapsed";
  EXPECT_EQ(group->Height(), group->OwnHeight());
  EXPECT_FALSE(group->GetCurve(0)->IsVisible());

  group->SetIsExpanded(true);
  group->PositionSelf(100, 1, 455);
  const int indent = group->GetParameterIndentInPixels();
  EXPECT_EQ(group->GetCurve(0)->GetBounds(), Rect::FromSize(indent + 20, 100, 200, 220));
  EXPECT_TRUE(group->GetCurve(0)->IsVisible());
  const EffectItem& child = FirstShownChild(*group);
  EXPECT_EQ(child.GetTop(), 100 + 226);
  EXPECT_EQ(group->Height(), (455 - 55 - indent) / 2 + 32 + child.Height());
}

TEST_F(CurveGroupsTest, TheRGBCurvesSitInATwoByTwoGridFivePixelsApart) {
  Show(455);
  auto group = FindGroup<GroupRGBCurvesBeginParameter>();
  ASSERT_NE(group, nullptr);
  ASSERT_EQ(group->GetCurveCount(), 4u);
  group->SetIsExpanded(true);
  group->PositionSelf(50, 1, 455);
  const int i = group->GetParameterIndentInPixels();
  EXPECT_EQ(group->GetCurve(0)->GetBounds(), Rect::FromSize(i + 20, 50, 200, 220));
  EXPECT_EQ(group->GetCurve(1)->GetBounds(), Rect::FromSize(i + 225, 50, 200, 220));
  EXPECT_EQ(group->GetCurve(2)->GetBounds(), Rect::FromSize(i + 20, 275, 200, 220));
  EXPECT_EQ(group->GetCurve(3)->GetBounds(), Rect::FromSize(i + 225, 275, 200, 220));
  EXPECT_EQ(group->GetCurve(1)->GetLabel(), "Red");
  const EffectItem& child = FirstShownChild(*group);
  EXPECT_EQ(child.GetTop(), 50 + 5 + 2 * 220);
  EXPECT_EQ(group->Height(), 455 + 10 - i + child.Height());
}

TEST_F(CurveGroupsTest, OnANarrowListNoSizeGoesBelowZero) {
  Show(455);
  auto curve = FindGroup<GroupCurveBeginParameter>();
  auto rgbGroup = FindGroup<GroupRGBCurvesBeginParameter>();
  for (const auto& group :
       std::vector<std::shared_ptr<GroupCurveSetBeginParameter>>{curve, rgbGroup}) {
    group->SetIsExpanded(true);
    group->PositionSelf(0, 1, 12);
    for (std::size_t c = 0; c < group->GetCurveCount(); ++c) {
      EXPECT_GE(group->GetCurve(c)->GetBounds().Width(), 0);
      EXPECT_GE(group->GetCurve(c)->GetBounds().Height(), 0);
    }
    EXPECT_GE(group->Height(), FirstShownChild(*group).Height());
  }
  EXPECT_EQ(curve->GetCurve(0)->GetBounds().Width(), 0);
  EXPECT_EQ(curve->Height(), 32 + FirstShownChild(*curve).Height());
}

TEST_F(CurveGroupsTest, ADragOnTheCurveChangesAllItsPointParametersInOneStep) {
  // Fifteen points from 16 to 240; the sixteenth unused. A point added left of them all moves
  // every pair one place on.
  luma = Make(kMatchName_LumaCurve);
  for (int p = 1; p <= 15; ++p) {
    const double level = 16.0 * p;
    luma->FindParam("Luma Point " + std::to_string(p) + " X")->SetValueAt(0, ParamValue(level));
    luma->FindParam("Luma Point " + std::to_string(p) + " Y")->SetValueAt(0, ParamValue(level));
  }
  clip = AddClip(v1, {luma});
  Open({455, 1000});
  Select({clip});
  auto group = FindGroup<GroupCurveBeginParameter>();
  ASSERT_NE(group, nullptr);
  group->SetIsExpanded(true);
  list->PositionItems();
  host->Render();
  CurveControl& curve = *group->GetCurve(0);
  ASSERT_EQ(curve.GetCurvePointList().size(), 15u);

  const std::string before = Points(luma, "Luma");
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  const Point from = At(curve, {4, 150});
  const Point to = At(curve, {6, 200});
  host->MouseDown(MouseButton::kLeft, from, kKeyModifierNone);
  host->MouseMove({from.x + 1, from.y - 20}, kKeyModifierNone);
  host->MouseMove(to, kKeyModifierNone);
  host->MouseUp(MouseButton::kLeft, to, kKeyModifierNone);

  const std::string after = Points(luma, "Luma");
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps + 1);
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), "MZ.ComponentParam.SetValue");
  EXPECT_EQ(curve.GetCurvePointList().size(), 16u);
  EXPECT_EQ(curve.GetCurvePointList().front().x, 6);
  for (int p = 1; p <= 16; ++p) {
    for (const char* axis : {"X", "Y"}) {
      const auto param = luma->FindParam("Luma Point " + std::to_string(p) + " " + axis);
      const double was = p <= 15 ? 16.0 * p : -1.0;
      EXPECT_NE(*param->GetScalarAt(0), was) << param->GetName();
    }
  }
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(Points(luma, "Luma"), before);
  EXPECT_EQ(curve.GetCurvePointList().size(), 15u) << "the curve follows the undo";
  ASSERT_TRUE(project->GetUndoStack().Redo());
  EXPECT_EQ(Points(luma, "Luma"), after);
}

TEST_F(CurveGroupsTest, ProjectValuesAreClampedIntoTheIntRangeBeforeTruncation) {
  EXPECT_EQ(GroupCurveSetBeginParameter::ToLevel(1e300), INT_MAX);
  EXPECT_EQ(GroupCurveSetBeginParameter::ToLevel(-1e300), INT_MIN);
  EXPECT_EQ(GroupCurveSetBeginParameter::ToLevel(std::numeric_limits<double>::quiet_NaN()), 0);
  EXPECT_EQ(GroupCurveSetBeginParameter::ToLevel(12.9), 12);
  EXPECT_EQ(GroupCurveSetBeginParameter::ToLevel(-0.5), 0);
}

TEST_F(CurveGroupsTest, UnusedPointsAreWrittenBehindTheLastPoint) {
  const std::vector<ParamValue> values =
      GroupCurveSetBeginParameter::ToParamValues({{0, 10}, {255, 200}});
  ASSERT_EQ(values.size(), 32u);
  EXPECT_EQ(values[1], ParamValue(10.0));
  EXPECT_EQ(values[2], ParamValue(255.0));
  EXPECT_EQ(values[4], ParamValue(-1.0));
  EXPECT_EQ(values[31], ParamValue(-1.0));
}

}  // namespace
