#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <vector>

#include "Host/Model/ParamValue.h"
#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Toolkit/CurveControl.h"

class MultiComponentParamActor;

// A group whose composite control is one or more tone curves. Curve c edits the group's
// children 32c to 32c + 31: point i takes x from child 2i and y from child 2i + 1, read at the
// edit time and truncated to whole levels; a point whose x is negative is unused (written as
// -1, -1 behind the last point of the curve). One curve gesture is one undoable
// "MZ.ComponentParam.SetValue" over the curve's 32 parameters.
//
// The group's own band holds only the disclosure triangle while expanded: the curves' label
// strips take the place of the group's name. The curves are shown only while the group is shown
// and expanded. UI thread only.
class GroupCurveSetBeginParameter : public GroupBeginParameter {
 public:
  static constexpr std::size_t kParamsPerCurve = 32;

  ~GroupCurveSetBeginParameter() override;

  void ListenToMessage(const Message& message) override;
  void Destroy() override;
  bool IsGenericGroup() const override { return false; }
  void SetIsExpanded(bool expanded) override;
  void SynchGroupToTime() override;
  void OnParamChanged(const ComponentParamRef& param) override;
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

  std::size_t GetCurveCount() const { return mCurves.size(); }
  CurveControl* GetCurve(std::size_t index) const { return mCurves.at(index).get(); }
  // The point list curve `index` shows for the children's values at the edit time.
  CurvePointList ReadCurvePoints(std::size_t index) const;
  // The 32 values a point list is written as.
  static std::vector<ParamValue> ToParamValues(const CurvePointList& points);
  // A parameter's value as a whole level: not finite is 0, otherwise clamped into the int range
  // first, then truncated towards zero.
  static int ToLevel(double value);

 protected:
  struct CurveLook {
    const char* label;
    Color color;
  };
  GroupCurveSetBeginParameter(const ParameterControlInfo& info, std::vector<CurveLook> curves);

  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  // Where the children start, from the row's top.
  virtual int GetChildrenOffset() const = 0;
  int GetExpandedAreaHeight() const override;
  // S: the side of one curve's plot for the row's width, never below zero.
  int GetCurveSide() const;

 private:
  void OnCurveChange(std::int32_t cookie, bool finished);
  std::vector<ComponentParamRef> CurveParams(std::size_t index) const;
  bool IsShowingCurves() const;

  std::vector<CurveLook> mLooks;
  std::vector<std::shared_ptr<CurveControl>> mCurves;
  std::unique_ptr<MultiComponentParamActor> mActor;
  std::optional<std::size_t> mActorCurve;  // the curve the open edit belongs to
  bool mWriting = false;                   // the group's own writes are under way
};
