#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/Color.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// One point of a tone curve: input level x and output level y, both 0..CurveControl::kMaxLevel.
struct CurvePoint {
  int x = 0;
  int y = 0;
  friend bool operator==(const CurvePoint&, const CurvePoint&) = default;
};
using CurvePointList = std::vector<CurvePoint>;

// What a curve gesture changed: a point's position only, or the list itself (a point added or
// removed), after which a listener must read the whole list anew.
enum class CurveChangeCode : std::int32_t { kPointMoved = 0, kPointListChanged = 1 };

// A curve gesture is under way (sent for every step) and has ended (once, at release).
struct CurveChangingMessage : MessageOf<CurveChangingMessage> {
  static constexpr std::string_view kTypeName = "CurveChangingMessage";
  CurveChangingMessage(CurveChangeCode c, std::int32_t k) : code(c), cookie(k) {}
  CurveChangeCode code;
  std::int32_t cookie;
};
struct CurveChangedMessage : MessageOf<CurveChangedMessage> {
  static constexpr std::string_view kTypeName = "CurveChangedMessage";
  CurveChangedMessage(CurveChangeCode c, std::int32_t k) : code(c), cookie(k) {}
  CurveChangeCode code;
  std::int32_t cookie;
};

// A tone curve of 2 to 16 points kept in increasing x, drawn under a label strip in a square
// plot (input left to right, output bottom to top).
//
// Mouse: pressing on a point picks it, elsewhere in the plot adds a point there (while fewer
// than 16) and picks it; dragging moves the picked point, clamped to the plot and strictly
// between its neighbours' x; releasing a point more than kRemoveDistance outside the plot
// removes it (never when only two are left). Keys, while focused: arrows move the picked point
// by one level (Shift: ten), Delete and Backspace remove it; each is one finished change.
// Every step of a gesture is reported with CurveChangingMessage, its end with one
// CurveChangedMessage carrying kPointListChanged when a point was added or removed.
// SetCurvePointList sends nothing. UI thread only.
class CurveControl : public SubView {
 public:
  static constexpr std::size_t kMaxPoints = 16;
  static constexpr std::size_t kMinPoints = 2;
  static constexpr int kMaxLevel = 255;
  static constexpr int kLabelHeight = 20;
  static constexpr int kHitRadius = 5;
  static constexpr int kRemoveDistance = 20;

  struct Options {
    std::string label;  // localisation key with its default text, or plain text
    Color curveColor{255, 255, 255};
    std::int32_t cookie = 0;
  };
  CurveControl(const Rect& bounds, Options options, Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  void SetOwnerCookie(std::int32_t cookie) { mCookie = cookie; }
  std::int32_t GetOwnerCookie() const { return mCookie; }
  const std::string& GetLabel() const { return mLabel; }
  Color GetCurveColor() const { return mCurveColor; }

  // Takes `points` as a curve: each clamped to the levels, sorted by x, later points with an x
  // already taken dropped, at most 16 kept; fewer than two leave the straight diagonal. Sends
  // nothing; ignored while a gesture is under way (the gesture's points win).
  void SetCurvePointList(const CurvePointList& points);
  const CurvePointList& GetCurvePointList() const { return mPoints; }
  std::optional<std::size_t> GetPickedPoint() const { return mPicked; }
  bool IsDragging() const { return mDragging; }

  // The square plot in local coordinates (below the label strip); empty when too small.
  Rect GetPlotRect() const;
  // Where a point is drawn, local coordinates; and the point under a local position, clamped.
  Point LevelToLocal(const CurvePoint& point) const;
  CurvePoint LocalToLevel(Point local) const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  std::optional<std::size_t> HitPoint(Point local) const;
  // Index where a point at level x goes; nullopt when x is taken or the list is full.
  std::optional<std::size_t> InsertionIndex(int x) const;
  void MovePicked(CurvePoint to);
  bool RemovePicked();
  bool IsFarOutside(Point local) const;
  void Report(bool finished, CurveChangeCode code) const;
  void PaintGrid(DC& dc, const Rect& plot) const;
  void PaintCurve(DC& dc) const;

  ControlStation mStation{"CurveControl"};
  std::string mLabel;
  Color mCurveColor;
  std::int32_t mCookie;
  CurvePointList mPoints;
  std::optional<std::size_t> mPicked;
  bool mDragging = false;
  bool mListChanged = false;  // the gesture added a point
  bool mMoved = false;
};
