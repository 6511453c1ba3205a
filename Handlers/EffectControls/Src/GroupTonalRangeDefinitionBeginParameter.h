#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <vector>

#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Rows/TonalRangeValues.h"
#include "Host/Toolkit/TonalRangeDefinitionControl.h"

class Limiter;
class MultiComponentParamActor;

// A tonal range definition: one range control over the group's children 0 shadow threshold,
// 1 shadow softness, 2 highlight threshold and 3 highlight softness. The group owns a
// TonalRangeLimiter made with its range values and registers it on those rows (handles 2, 3, 4
// and 1), so a value typed or dragged in a row keeps the handles in order. A handle gesture is
// one undoable "MZ.ComponentParam.SetValue" over the values it named.
//
// With W the row's width and I the parameter indent: the control at (I + 20, top + 5),
// W - I - 35 wide (never below zero) and 33 high, standing in for the group's name while
// expanded; the children from top + 38; the group 38 high plus its visible children.
class GroupTonalRangeDefinitionBeginParameter : public GroupBeginParameter,
                                                public TonalRangeValues {
 public:
  enum class Child : std::size_t {
    kShadowThreshold = 0,
    kShadowSoftness = 1,
    kHighlightThreshold = 2,
    kHighlightSoftness = 3
  };
  static constexpr double kMinimum = 0.0;
  static constexpr double kMaximum = 100.0;

  explicit GroupTonalRangeDefinitionBeginParameter(const ParameterControlInfo& info);
  ~GroupTonalRangeDefinitionBeginParameter() override;

  void ListenToMessage(const Message& message) override;
  void Destroy() override;
  bool IsGenericGroup() const override { return false; }
  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  void SetIsExpanded(bool expanded) override;
  void SynchGroupToTime() override;
  void OnParamChanged(const ComponentParamRef& param) override;
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

  TonalRangeDefinitionControl* GetRangeControl() const { return mControl.get(); }
  const Limiter* GetLimiter() const { return mLimiter.get(); }
  // The limiter handle registered on a child's row.
  static int LimiterHandle(Child child);

  // --- TonalRangeValues: the control's handles (the range's bounds before it exists) ---
  float GetMinValue() const override;
  float GetMaxValue() const override;
  float GetShadowThreshold() const override;
  float GetHighlightThreshold() const override;

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  int GetExpandedAreaHeight() const override;

 private:
  ComponentParamRef ChildParam(Child child) const;
  std::vector<ComponentParamRef> AllParams() const;
  void OnRangeChange(const TonalRangeDefinitionValues& values, std::vector<Child> named,
                     bool finished);

  std::shared_ptr<TonalRangeDefinitionControl> mControl;
  std::shared_ptr<const Limiter> mLimiter;  // rows refer to it weakly
  std::unique_ptr<MultiComponentParamActor> mActor;
  bool mWriting = false;
};
