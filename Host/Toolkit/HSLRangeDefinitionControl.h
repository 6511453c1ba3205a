#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// The four handles of a range as its messages carry them. The end softness is measured down
// from the maximum (its handle sits at maximum - end softness).
struct HSLRangeDefinitionValues {
  double startSoftness = 0.0;
  double startThreshold = 0.0;
  double endThreshold = 0.0;
  double endSoftness = 0.0;
  std::int32_t cookie = 0;
};

#define EC_HSL_RANGE_MESSAGE(Name)                                             \
  struct Name : MessageOf<Name>, HSLRangeDefinitionValues {                    \
    static constexpr std::string_view kTypeName = #Name;                       \
    explicit Name(HSLRangeDefinitionValues v) : HSLRangeDefinitionValues(v) {} \
  };
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartThresholdChangingQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartThresholdChangedQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartSoftnessChangingQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartSoftnessChangedQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlEndThresholdChangingQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlEndThresholdChangedQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlEndSoftnessChangingQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlEndSoftnessChangedQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartEndThresholdChangingQuickMessage)
EC_HSL_RANGE_MESSAGE(HSLRangeDefinitionControlStartEndThresholdChangedQuickMessage)
#undef EC_HSL_RANGE_MESSAGE

// A range of hue, saturation or luma with soft edges: a bar from the minimum to the maximum,
// and under it four handles in order, start softness <= start threshold <= end threshold <=
// maximum - end softness. Dragging a handle moves it, clamped between its neighbours; pressing
// on the bar between the thresholds moves both thresholds together, clamped by the softness
// handles. Each step is reported with the changing message of what moved, the release with the
// changed one. Keys, while focused: Left and Right move the last pressed handle (the start
// threshold before any) by one unit, Shift by ten, each as one finished change. SetValues sends
// nothing. UI thread only.
class HSLRangeDefinitionControl : public SubView {
 public:
  enum class Handle { kStartSoftness, kStartThreshold, kEndThreshold, kEndSoftness, kThresholds };
  static constexpr int kBarHeight = 18;
  static constexpr int kHandleHitRadius = 5;

  HSLRangeDefinitionControl(const Rect& bounds, double minimum, double maximum,
                            Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }

  // Takes the four values, clamped into order. Sends nothing; ignored while dragging.
  void SetValues(const HSLRangeDefinitionValues& values);
  HSLRangeDefinitionValues GetValues() const;
  std::optional<Handle> GetDraggedHandle() const { return mDragged; }
  // The x of a value, local coordinates.
  int ValueToLocal(double value) const;
  double LocalToValue(int x) const;

  double GetMinValue() const { return mMinimum; }
  double GetMaxValue() const { return mMaximum; }

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  HSLRangeDefinitionValues Ordered(HSLRangeDefinitionValues v) const;
  std::optional<Handle> HitHandle(Point point) const;
  // The grabbed values with the dragged handle moved by `delta`, kept in order.
  HSLRangeDefinitionValues Dragged(double delta) const;
  // Takes the values; true when they differ from the shown ones.
  bool Take(const HSLRangeDefinitionValues& values);
  void Report(bool finished) const;

  ControlStation mStation{"HSLRangeDefinitionControl"};
  double mMinimum;
  double mMaximum;
  std::int32_t mCookie = 0;
  HSLRangeDefinitionValues mValues;
  std::optional<Handle> mDragged;
  std::optional<Handle> mKeyHandle;  // what the keys move: the last handle pressed
  double mGrabValue = 0.0;           // the value under the pointer when the drag began
  HSLRangeDefinitionValues mGrabValues;
  bool mMoved = false;
};
