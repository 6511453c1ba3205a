#pragma once

#include <string>
#include <vector>

#include "Host/Model/Action.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// One undo step that moves several parameters from their states before to their states after
// (keyframe selections, pastes, moves). Do applies the after states in the order added, Undo the
// before states in reverse order; each parameter sends its change messages either way.
class ParamStatesAction : public Action {
 public:
  using Action::Action;

  // Records one parameter's change. A second entry for the same parameter replaces the first's
  // after state (the before state stays the first one).
  void Add(const ComponentParamRef& param, ComponentParam::State before,
           ComponentParam::State after);
  bool IsEmpty() const { return mEntries.empty(); }
  std::size_t Size() const { return mEntries.size(); }

  bool Do() override;
  void Undo() override;

  // Builds the step from each parameter's current state to `after` and executes it on the
  // parameters' project. Parameters whose state would not change are left out; NoChange when none
  // is left. ReadOnly when a parameter is read only (nothing changes then).
  struct Change {
    ComponentParamRef param;
    ComponentParam::State after;
  };
  static EditStatus Execute(std::string name, std::string undoText, std::vector<Change> changes);

 private:
  struct Entry {
    ComponentParamRef param;
    ComponentParam::State before;
    ComponentParam::State after;
  };
  std::vector<Entry> mEntries;
};
