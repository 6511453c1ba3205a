#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Host/Model/Action.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// Undoable edits of the effects of component chains. Each makes one undo step that records the
// chains' component lists (or values) before and after; the Create... forms return the action,
// for gathering several in one step. NoChange (and no step) when nothing would change.
// Intrinsic effects are never removed, nor moved to another chain.
class ComponentChainActions {
 public:
  static constexpr const char* kRemoveFilter = "MZ.ComponentChainActions.RemoveFilter";
  static constexpr const char* kRemoveMultipleFilters =
      "MZ.ComponentChainActions.RemoveMultipleFilters";
  static constexpr const char* kRemoveAllFilters = "MZ.ComponentChainActions.RemoveAllFilters";
  static constexpr const char* kMoveFilters = "MZ.ComponentChainActions.MoveFilters";
  static constexpr const char* kSetBypass = "MZ.ComponentChainActions.SetBypass";
  static constexpr const char* kInsertFilter = "MZ.ComponentChainActions.InsertFilter";
  static constexpr const char* kAddFilter = "MZ.ComponentChainActions.AddFilter";
  static constexpr const char* kResetComponent = "MZ.ComponentChainActions.ResetComponent";

  static EditStatus RemoveFilter(const ComponentChainRef& chain, const ComponentRef& component);
  // Components not in the chain and intrinsic ones are skipped.
  static EditStatus RemoveMultipleFilters(const ComponentChainRef& chain,
                                          const std::vector<ComponentRef>& components);
  // Every applied (not intrinsic) effect of the chain.
  static EditStatus RemoveAllFilters(const ComponentChainRef& chain);

  // Moves `components` (from this chain or others, in the order given) into `target`, just after
  // `insertAfter` in chain order, or to the front when it is null. `insertAfter` must be in
  // `target`; when it is itself moved, the nearest earlier component that stays is used.
  // Components of another media type, masks and intrinsics of other chains are refused.
  static std::unique_ptr<Action> CreateMoveFiltersAction(
      const ComponentChainRef& target, const std::vector<ComponentRef>& components,
      const ComponentRef& insertAfter);
  static EditStatus MoveFilters(const ComponentChainRef& target,
                                const std::vector<ComponentRef>& components,
                                const ComponentRef& insertAfter);

  // Switches every component of the chains on (bypass false) or off, as one step.
  static EditStatus SetBypass(const std::vector<ComponentChainRef>& chains, bool bypass);
  static EditStatus SetBypassOfComponents(const std::vector<ComponentRef>& components, bool bypass);

  // Inserts a copy of `effect` (a catalogue template or any component; it is not changed) at
  // `index` (limited to [0, count]); AddFilter appends. The copy is returned when it was
  // inserted.
  struct InsertResult {
    EditStatus status = EditStatus::InvalidArgument;
    ComponentRef component;
  };
  static InsertResult InsertFilter(const ComponentChainRef& chain, const Component& effect,
                                   int index);
  static InsertResult AddFilter(const ComponentChainRef& chain, const Component& effect);

  // Every parameter back to its default, the user's name dropped, the default preset chosen.
  static EditStatus ResetComponent(const ComponentRef& component);

  static std::unique_ptr<Action> CreateSetComponentsAction(const ComponentChainRef& chain,
                                                           std::string name,
                                                           std::vector<ComponentRef> after);
};
