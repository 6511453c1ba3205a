#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// The four values of a tonal range as its messages carry them. The shadows run from the
// minimum up to the shadow threshold, fading out over the shadow softness above it; the
// highlights from the highlight threshold up to the maximum, fading in over the highlight
// softness below it.
struct TonalRangeDefinitionValues {
  double shadowThreshold = 0.0;
  double shadowSoftness = 0.0;
  double highlightThreshold = 0.0;
  double highlightSoftness = 0.0;
  std::int32_t cookie = 0;
};

#define EC_TONAL_RANGE_MESSAGE(Name)                                               \
  struct Name : MessageOf<Name>, TonalRangeDefinitionValues {                      \
    static constexpr std::string_view kTypeName = #Name;                           \
    explicit Name(TonalRangeDefinitionValues v) : TonalRangeDefinitionValues(v) {} \
  };
#define EC_TONAL_RANGE_PAIR(What)                                            \
  EC_TONAL_RANGE_MESSAGE(TonalRangeDefinitionControl##What##ChangingMessage) \
  EC_TONAL_RANGE_MESSAGE(TonalRangeDefinitionControl##What##ChangedMessage)
EC_TONAL_RANGE_PAIR(ShadowThreshold)
EC_TONAL_RANGE_PAIR(ShadowSoftness)
EC_TONAL_RANGE_PAIR(ShadowThresholdAndSoftness)
EC_TONAL_RANGE_PAIR(HighlightThreshold)
EC_TONAL_RANGE_PAIR(HighlightSoftness)
EC_TONAL_RANGE_PAIR(HighlightThresholdAndSoftness)
EC_TONAL_RANGE_PAIR(ShadowAndHighlightThreshold)
EC_TONAL_RANGE_PAIR(HighlightAndShadowThreshold)
EC_TONAL_RANGE_PAIR(ShadowAndHighlightThresholdAndShadowSoftness)
EC_TONAL_RANGE_PAIR(ShadowAndHighlightThresholdAndHighlightSoftness)
#undef EC_TONAL_RANGE_PAIR
#undef EC_TONAL_RANGE_MESSAGE

// A tonal range: a bar from the minimum to the maximum with four handles under it, at the
// shadow threshold, the shadow threshold + softness, the highlight threshold and the highlight
// threshold - softness. The thresholds stay in order; each softness stays inside the range.
//
// Mouse: dragging a threshold moves it (its softness follows; with Shift the softness edge stays
// put, so both change) and pushes the other threshold along when it would pass it; dragging a
// softness handle changes that softness; pressing on the bar between the thresholds moves both.
// Each step is reported with the changing message that names what moved since the press, the
// release with the matching changed message. Keys, while focused: Left and Right move the last
// pressed handle (the shadow threshold before any) by one unit, Shift by ten, each as one
// finished change. SetValues sends nothing. UI thread only.
class TonalRangeDefinitionControl : public SubView {
 public:
  enum class Handle {
    kShadowThreshold,
    kShadowSoftness,
    kHighlightThreshold,
    kHighlightSoftness,
    kThresholds
  };
  static constexpr int kBarHeight = 18;
  static constexpr int kHandleHitRadius = 5;

  TonalRangeDefinitionControl(const Rect& bounds, double minimum, double maximum,
                              Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }

  // Takes the four values, put in order; ignored while dragging.
  void SetValues(const TonalRangeDefinitionValues& values);
  TonalRangeDefinitionValues GetValues() const;
  std::optional<Handle> GetDraggedHandle() const { return mDragged; }
  double GetMinValue() const { return mMinimum; }
  double GetMaxValue() const { return mMaximum; }
  // Where a handle is drawn (its value as an x, local coordinates).
  int HandleToLocal(Handle handle) const;
  int ValueToLocal(double value) const;
  double LocalToValue(int x) const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  TonalRangeDefinitionValues Ordered(TonalRangeDefinitionValues v) const;
  TonalRangeDefinitionValues Dragged(double delta, bool keepEdge) const;
  std::optional<Handle> HitHandle(Point point) const;
  void Report(bool finished) const;

  ControlStation mStation{"TonalRangeDefinitionControl"};
  double mMinimum;
  double mMaximum;
  std::int32_t mCookie = 0;
  TonalRangeDefinitionValues mValues;
  std::optional<Handle> mDragged;
  std::optional<Handle> mKeyHandle;  // what the keys move: the last handle pressed
  double mGrabValue = 0.0;
  TonalRangeDefinitionValues mGrabValues;
  bool mMoved = false;
};
