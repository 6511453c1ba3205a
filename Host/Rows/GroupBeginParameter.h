#pragma once

#include <cstddef>
#include <string>

#include "Host/Rows/ParameterControl.h"

class ComponentParam;

// The row of a group-begin parameter: a folder whose children are the group's parameters. The
// plain group shows only its name and triangle; groups with a composite control (curves,
// levels, colour wheels) derive from it, draw their control and edit the children's parameters
// together. A group starts collapsed unless its component remembers it open (the expansion
// property "ECP.Group.Expanded.<parameter index>"), and remembers each change there.
class GroupBeginParameter : public ParameterControl {
 public:
  static constexpr std::string_view kExpandedPropertyPrefix = "ECP.Group.Expanded";

  explicit GroupBeginParameter(const ParameterControlInfo& info);

  bool IsFolder() const override { return true; }
  bool IsGroupBegin() const override { return true; }
  // A group without a composite control of its own; the composite groups answer false.
  bool IsGenericGroup() const override { return true; }
  bool CanExpand() const override { return true; }
  bool CanTimeVary() const override { return false; }
  int OwnHeight() const override { return kParameterRowHeight; }
  // The children's keyframes (the group parameter itself has none).
  void GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const override;
  // Records the state in the component (unless the property is read only, in which case the
  // component's property station is warned) and shows or hides the children.
  void SetIsExpanded(bool expanded) override;
  // The group row's name spans to the right edge: it has no value of its own.
  int GetTitleRightEdge() const override { return GetWidth(); }

  // A group shows nothing of its own at a time; composite groups copy the children's values
  // into their control (SynchGroupToTime).
  void SynchToCurrentTime() override { SynchGroupToTime(); }
  virtual void SynchGroupToTime() {}
  // Whether the children's values differ in a way the composite control cannot show.
  virtual bool HasDivergentGroupChildren() const { return false; }

  // The key under which the group's expanded state is kept in its component.
  std::string GetExpandedPropertyKey() const;
};
