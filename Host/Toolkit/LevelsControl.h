#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "Host/Messaging/Message.h"
#include "Host/Toolkit/ControlStation.h"
#include "Host/Toolkit/SubView.h"

// A level handle moved: a changing message for every step of a gesture, a changed one at its
// end. Each carries the handle's new level and the control's owner cookie.
#define EC_LEVELS_MESSAGE(Name)                             \
  struct Name : MessageOf<Name> {                           \
    static constexpr std::string_view kTypeName = #Name;    \
    Name(double l, std::int32_t c) : level(l), cookie(c) {} \
    double level;                                           \
    std::int32_t cookie;                                    \
  };
EC_LEVELS_MESSAGE(LevelsControlBlackLevelChangingMessage)
EC_LEVELS_MESSAGE(LevelsControlBlackLevelChangedMessage)
EC_LEVELS_MESSAGE(LevelsControlGrayLevelChangingMessage)
EC_LEVELS_MESSAGE(LevelsControlGrayLevelChangedMessage)
EC_LEVELS_MESSAGE(LevelsControlWhiteLevelChangingMessage)
EC_LEVELS_MESSAGE(LevelsControlWhiteLevelChangedMessage)
#undef EC_LEVELS_MESSAGE

// A black-to-white ramp with handles under it: black and white, and for input levels a gray
// handle between them. Levels run 0..kMaxLevel and stay in order (black <= gray <= white).
//
// Mouse: pressing near a handle picks it (the nearest), dragging moves it clamped between its
// neighbours, releasing ends the gesture. Keys, while focused: Left and Right move the picked
// handle (the black one before any pick) by one level, Shift by ten; each key is one
// finished change. SetAllLevels and SetBlackAndWhiteLevels send nothing. UI thread only.
class LevelsControl : public SubView {
 public:
  enum class Handle { kBlack, kGray, kWhite };
  static constexpr double kMaxLevel = 255.0;
  static constexpr int kRampHeight = 10;
  static constexpr int kHitRadius = 6;

  struct Options {
    bool withGray = false;
    std::int32_t cookie = 0;
  };
  LevelsControl(const Rect& bounds, Options options, Commander* commander = nullptr);

  const StationName& GetStation() const { return mStation.GetName(); }
  std::int32_t GetOwnerCookie() const { return mCookie; }
  bool HasGrayHandle() const { return mWithGray; }

  // Take the levels, clamped to the range and put in order; ignored during a drag.
  void SetAllLevels(double black, double gray, double white);
  void SetBlackAndWhiteLevels(double black, double white);
  double GetBlackLevel() const { return mBlack; }
  double GetGrayLevel() const { return mGray; }
  double GetWhiteLevel() const { return mWhite; }
  double GetLevel(Handle handle) const;
  std::optional<Handle> GetPickedHandle() const { return mPicked; }
  bool IsDragging() const { return mDragging; }

  // The x of a level and the level under an x, local coordinates (0 on an empty control).
  int LevelToLocal(double level) const;
  double LocalToLevel(int x) const;

  void LeftButtonDownSelf(Point point, KeyModifiers modifiers) override;
  void MouseMoveSelf(Point point, KeyModifiers modifiers) override;
  void LeftButtonUpSelf(Point point, KeyModifiers modifiers) override;
  bool KeyDownSelf(const KeyEvent& event) override;
  void HideSelf() override;
  void PaintSelf(DC& dc) override;

 private:
  std::optional<Handle> HitHandle(Point local) const;
  // Moves the handle, clamped between its neighbours; true when it moved.
  bool MoveHandle(Handle handle, double level);
  void Report(Handle handle, bool finished) const;

  ControlStation mStation{"LevelsControl"};
  bool mWithGray;
  std::int32_t mCookie;
  double mBlack = 0.0;
  double mGray = kMaxLevel / 2;
  double mWhite = kMaxLevel;
  std::optional<Handle> mPicked;
  bool mDragging = false;
  bool mMoved = false;
};
