#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <optional>

#include "Host/Rows/GroupBeginParameter.h"

class HotFloatControl;
class LevelsControl;
class MultiComponentParamActor;
class Static;

// Input and output levels: a levels control with black, gray and white handles over the group's
// children 0 to 2 (input black, gray, white), one with black and white over children 3 and 4
// (output black, white), their labels, and a numeric field per level. A handle drag or a field
// edit is one undoable "MZ.ComponentParam.SetValue" of its level.
//
// With W the row's width and I the parameter indent, while expanded: the first three children,
// when visible, from the row's top; below them (y) the input label at (I + 20, y + 3), the input
// fields at W/2 - 10 + I, +40 and +80 (top y + 3), the input control at (I + 15, y + 22), W - 20 -
// I wide; the output label and fields at y + 43, the output control at y + 62; the other children
// from y + 81. The group is 81 high plus its visible children, or just 81 while the children
// diverge (the input levels out of order, which the control cannot show): the children are then
// hidden and the fields carry the values. Every size is clamped at zero on a narrow list.
class GroupLevelsBeginParameter : public GroupBeginParameter {
 public:
  enum class Level : std::size_t {
    kInputBlack = 0,
    kInputGray = 1,
    kInputWhite = 2,
    kOutputBlack = 3,
    kOutputWhite = 4
  };
  static constexpr std::size_t kLevelCount = 5;
  static constexpr int kControlsHeight = 81;
  static constexpr std::int32_t kInputCookie = 0;
  static constexpr std::int32_t kOutputCookie = 1;

  explicit GroupLevelsBeginParameter(const ParameterControlInfo& info);
  ~GroupLevelsBeginParameter() override;

  void ListenToMessage(const Message& message) override;
  void Destroy() override;
  bool IsGenericGroup() const override { return false; }
  int Height() const override;
  void PositionSelf(int top, int depth, int width) override;
  void Show() override;
  void SetIsExpanded(bool expanded) override;
  void SynchGroupToTime() override;
  void OnParamChanged(const ComponentParamRef& param) override;
  bool HasDivergentGroupChildren() const override;
  void DrawTitle(DC& dc, const Rect& rect, const Font& font, Color color) const override;

  LevelsControl* GetInputLevelsControl() const { return mInput.get(); }
  LevelsControl* GetOutputLevelsControl() const { return mOutput.get(); }
  Static* GetInputLabel() const { return mInputLabel.get(); }
  Static* GetOutputLabel() const { return mOutputLabel.get(); }
  HotFloatControl* GetField(Level level) const { return mFields[Index(level)].get(); }
  // The level's value at the edit time; nullopt when the child is missing.
  std::optional<double> ReadLevel(Level level) const;

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;

 private:
  static constexpr std::size_t Index(Level level) { return static_cast<std::size_t>(level); }
  ComponentParamRef LevelParam(Level level) const;
  // Where the controls start: below the first three children that are shown.
  int ControlsOffset() const;
  void OnControlLevel(std::int32_t cookie, Level inputLevel, Level outputLevel, double value,
                      bool finished);
  void OnFieldLevel(std::int32_t cookie, double value, bool finished);
  void OnLevelChange(Level level, double value, bool finished);
  void HideChildrenWhileDivergent();

  std::shared_ptr<LevelsControl> mInput;
  std::shared_ptr<LevelsControl> mOutput;
  std::shared_ptr<Static> mInputLabel;
  std::shared_ptr<Static> mOutputLabel;
  std::array<std::shared_ptr<HotFloatControl>, kLevelCount> mFields;
  std::unique_ptr<MultiComponentParamActor> mActor;
  std::optional<Level> mActorLevel;  // the level the open edit belongs to
  bool mWriting = false;             // the group's own writes are under way
};
