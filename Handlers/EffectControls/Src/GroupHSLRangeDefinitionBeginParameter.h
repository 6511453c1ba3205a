#pragma once

#include <cstddef>
#include <memory>
#include <vector>

#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/HSLRangeValues.h"
#include "Host/Toolkit/HSLRangeDefinitionControl.h"

class Limiter;
class MultiComponentParamActor;

// A hue, saturation or luma range definition: one range control over the group's children
// 101 start threshold, 102 start softness, 103 end threshold and 104 end softness (control
// identifiers; children 1 to 4). The first child (100) is neither placed nor counted: the group
// sets it aside. The group owns a limiter made with its range values and registers it on the
// four value rows (101 with the first handle + 1, 102 with the first handle, 103 with + 3, 104
// with + 2), so a value typed or dragged in a row keeps the handles in order.
//
// With W the row's width and I the parameter indent: the control at (I + 20, top + 5),
// W - I - 35 wide (never below zero) and 33 high, standing in for the group's name while
// expanded; the other children from top + 38; the group 38 high plus those children.
// A handle gesture is one undoable "MZ.ComponentParam.SetValue" over what it moved.
class GroupHSLRangeDefinitionBeginParameter : public GroupBeginParameter, public HSLRangeValues {
 public:
  static constexpr int kFirstControlID = 100;

  ~GroupHSLRangeDefinitionBeginParameter() override;

  void ListenToMessage(const Message& message) override;
  void Destroy() override;
  bool IsGenericGroup() const override { return false; }
  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  void SetIsExpanded(bool expanded) override;
  void SynchGroupToTime() override;
  void OnParamChanged(const ComponentParamRef& param) override;
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

  HSLRangeDefinitionControl* GetRangeControl() const { return mControl.get(); }
  const Limiter* GetLimiter() const { return mLimiter.get(); }

  // --- HSLRangeValues: the control's handles (zeros before it exists) ---
  float GetMinValue() const override;
  float GetMaxValue() const override;
  float GetStartThreshold() const override;
  float GetStartSoftness() const override;
  float GetEndThreshold() const override;
  float GetEndSoftness() const override;

 protected:
  struct Range {
    double minimum = 0.0;
    double maximum = 0.0;
    int firstHandle = 0;
  };
  GroupHSLRangeDefinitionBeginParameter(const ParameterControlInfo& info, Range range);
  // The limiter of the group's kind, made with this group's values.
  virtual std::shared_ptr<const Limiter> MakeLimiter() const = 0;

  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  int GetExpandedAreaHeight() const override;

 private:
  enum class Child : std::size_t {
    kStartThreshold = 1,
    kStartSoftness = 2,
    kEndThreshold = 3,
    kEndSoftness = 4
  };
  ComponentParamRef ChildParam(Child child) const;
  void OnRangeChange(const HSLRangeDefinitionValues& values, std::vector<Child> moved,
                     bool finished);

  Range mRange;
  std::shared_ptr<HSLRangeDefinitionControl> mControl;
  std::shared_ptr<const Limiter> mLimiter;  // rows refer to it weakly
  std::unique_ptr<MultiComponentParamActor> mActor;
  bool mWriting = false;
};
