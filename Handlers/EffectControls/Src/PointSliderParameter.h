#pragma once

#include "Host/Rows/SliderParameter.h"

// One coordinate of a two-dimensional point parameter (a position, an anchor); a point gets two
// such rows, X first. The slider spans from half a frame before the sequence's frame to half a
// frame beyond it (-960 to 2880 for X of a 1920-wide frame); the number field takes the
// parameter's whole range. A write replaces only this row's coordinate and keeps the other as it
// is at the edit time, through the base's edit contract (one undoable step per gesture).
class PointSliderParameter : public SliderParameter {
 public:
  enum class Coordinate { X, Y };

  PointSliderParameter(const ParameterControlInfo& info, Coordinate coordinate);

  Coordinate GetCoordinate() const { return mCoordinate; }
  // The slider's range for a frame `extent` pixels wide (X) or high (Y), truncated toward zero.
  static int SliderMinimumFor(int extent);
  static int SliderMaximumFor(int extent);

  void SynchToCurrentTime() override;
  void RefreshSliderParameters() override;

  float GetCachedValue() const { return mCachedValue; }
  TickTime GetCachedTime() const { return mCachedTime; }

 protected:
  double ReadValue() const override;
  ParamValue ToParamValue(double value) const override;

 private:
  // The frame extent along this row's coordinate; 1920 x 1080 without a sequence.
  int GetFrameExtent() const;

  Coordinate mCoordinate;
  float mCachedValue = 0.0f;
  TickTime mCachedTime = kTime_Min;
};
