#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <vector>

#include "Host/Rows/GroupBeginParameter.h"
#include "Host/Toolkit/HueBalanceAndPhaseControl.h"

class MultiComponentParamActor;

// A group whose composite control is one or more colour wheels, each editing a hue angle child
// and a balance magnitude child (wheel w: children 2w and 2w + 1). A wheel gesture is one
// undoable "MZ.ComponentParam.SetValue" over the parameters it moves: its own two, or those of
// every wheel it is linked with (LinkedWheels). The wheels show the children's values at the
// edit time and follow every change of them, so a value typed or dragged in a child row moves its
// wheel live. UI thread only.
class GroupWheelSetBeginParameter : public GroupBeginParameter {
 public:
  ~GroupWheelSetBeginParameter() override;

  void ListenToMessage(const Message& message) override;
  void Destroy() override;
  bool IsGenericGroup() const override { return false; }
  void SetIsExpanded(bool expanded) override;
  void SynchGroupToTime() override;
  void OnParamChanged(const ComponentParamRef& param) override;

  std::size_t GetWheelCount() const { return mWheels.size(); }
  HueBalanceAndPhaseControl* GetWheel(std::size_t index) const { return mWheels.at(index).get(); }
  // The angle and magnitude parameters of wheel `index`; null when the group lacks them.
  ComponentParamRef GetAngleParam(std::size_t index) const;
  ComponentParamRef GetMagnitudeParam(std::size_t index) const;

 protected:
  GroupWheelSetBeginParameter(const ParameterControlInfo& info, std::size_t wheels);

  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  // The wheels a gesture on wheel `index` moves, itself included.
  virtual std::vector<std::size_t> LinkedWheels(std::size_t index) const { return {index}; }
  // Sets wheels `indexes` to their parameters' defaults as one undo step.
  void ResetWheels(const std::vector<std::size_t>& indexes);
  bool IsShowingWheels() const { return IsShown() && IsExpanded(); }

 private:
  void OnWheelChange(const HueBalanceAndPhaseValue& value, bool finished);
  ComponentParamRef ChildParam(std::size_t child) const;
  std::vector<ComponentParamRef> ParamsOf(const std::vector<std::size_t>& wheels) const;
  void ListenToChildren(bool listen);

  std::size_t mWheelCount;
  std::vector<std::shared_ptr<HueBalanceAndPhaseControl>> mWheels;
  std::unique_ptr<MultiComponentParamActor> mActor;
  bool mWriting = false;  // the group's own writes are under way
};
