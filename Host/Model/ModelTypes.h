#pragma once

#include <cstdint>

// Codes shared by the model and the rows that present it. Numbers are the host's: rows and
// project files compare and store them as integers.

using ObjectID = std::int64_t;
inline constexpr ObjectID kInvalidObjectID = 0;

enum class MediaType : int { Video = 0, Audio = 1 };

enum class TrackItemKind : int { Clip = 1, Transition = 2 };

// What a parameter row presents. Codes not listed get no row.
enum class ParamType : int {
  Slider = 1,       // integer slider
  FloatSlider = 2,  // scalar
  Angle = 3,        // degrees
  Checkbox = 4,
  Color = 5,
  Point = 6,
  Menu = 7,  // popup of choices
  DoubleSlider = 8,
  Custom = 9,  // the effect's own user interface; opaque data
  GroupBegin = 11,
  GroupEnd = 12,
  TrackMenu = 13,
  Timecode = 14,  // a time, in ticks, held as a double
  Button = 16,
  AudioGain = 17,  // older files: read as FloatSlider with the audio-gain flag
  TimeRemapping = 21,
  Opaque = 22,
  Text = 23,
  Info = 24,
  Spreadsheet = 25,
};

// The row class of a group-begin parameter. Other values give a plain group.
enum class GroupKind : int {
  None = 0,
  HueBalanceAndPhase = 1,
  ThreeWayHueBalance = 2,
  TonalRangeDefinition = 3,
  Levels = 4,
  RGBCurves = 10,
  Buttons = 14,
  Curve = 18,
  ColorPickerRange = 19,
  HueRangeDefinition = 20,
  SaturationRangeDefinition = 21,
  LumaRangeDefinition = 22,
  SecondaryColorCorrection = 23,
  // Closes by itself after as many parameters as its value (text) holds semicolons.
  Counted = 24,
};

// The unit a parameter's number is shown in.
enum class ParamUnits : int {
  None = 0,
  Pixels = 1,
  Percent = 2,
  Degrees = 3,
  Decibels = 4,
  Seconds = 5
};
// The symbol a number field appends for the units ("%", "°", " dB", " s"); empty for none and
// pixels.
const char* UnitSymbol(ParamUnits units);

// Host value-kind codes of a parameter (GetValueKindCode).
inline constexpr int kValueKindDouble = 1;
inline constexpr int kValueKindPoint = 2;
inline constexpr int kValueKindColor = 3;
inline constexpr int kValueKindBool = 4;
inline constexpr int kValueKindChoice = 5;
inline constexpr int kValueKindString = 6;
inline constexpr int kValueKindBinary = 14;

// Player states and play modes carried by the player messages.
enum class PlayerState : int { Stopped = 0, Playing = 1, Scrubbing = 2 };
inline constexpr int kPlayModeStopped = 0;
inline constexpr int kPlayModeSet = 1;  // the edit line was set (click, command, edit)
inline constexpr int kPlayModePlaying = 3;
inline constexpr int kPlayModeScrubbing = 5;

// The outcome of a model edit. Edits report failures as values; nothing changes unless Done.
enum class EditStatus {
  Done,
  NoChange,         // the edit would leave the model as it is; no undo step was made
  ReadOnly,         // the target (project, parameter) accepts no edits
  Busy,             // an undo or redo is running; no new edit may start
  InvalidArgument,  // null object, value of the wrong kind, NaN, index out of range
  NotFound,         // no keyframe at that time, component not in that chain
  DuplicateTime,    // another keyframe already sits at that time
  TimeOutOfRange,
  CannotVary,  // the parameter cannot vary over time
};
const char* ToString(EditStatus status);
