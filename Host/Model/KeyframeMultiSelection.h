#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "Host/Model/KeyframeSelection.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"

// The selected keyframes over several parameters: one KeyframeSelection per parameter, in the
// order the parameters were first added. The effect list holds one for its sequence (shared with
// the keyframe area, which edits it in place); the marquee keeps a clone. Copyable value; it
// refers to the model without listening to it (see KeyframeSelection for stale times).
//
// Every edit is one undo step over all the parameters it changes.
class KeyframeMultiSelection {
 public:
  explicit KeyframeMultiSelection(SequenceRef sequence = nullptr);

  const SequenceRef& GetSequence() const { return mSequence; }
  std::shared_ptr<KeyframeMultiSelection> Clone() const;

  // Selections with at least one existing keyframe, and all of them (stale ones too).
  std::vector<const KeyframeSelection*> GetSelections() const;
  const std::vector<KeyframeSelection>& GetAllSelections() const { return mSelections; }
  bool IsEmpty() const { return GetKeyframeCount() == 0; }
  std::size_t GetKeyframeCount() const;
  // nullptr when the parameter has no selection here.
  const KeyframeSelection* Find(const ComponentParam* param) const;
  bool Contains(const ComponentParam* param, TickTime clipTime) const;

  // Times are clip times. Adding a time without a keyframe is refused (false).
  bool AddItem(const TrackItemRef& trackItem, const ComponentRef& component,
               const ComponentParamRef& param, TickTime clipTime);
  bool RemoveItem(const ComponentParam* param, TickTime clipTime);
  // Every keyframe of the parameter.
  void AddAllItems(const TrackItemRef& trackItem, const ComponentRef& component,
                   const ComponentParamRef& param);
  // Adds every keyframe selected in `other` (union).
  void AddItems(const KeyframeMultiSelection& other);
  // Toggles every keyframe selected in `other`: selected ones leave, others join.
  void InvertItems(const KeyframeMultiSelection& other);
  // Forgets the parameter's selection.
  void RemoveParam(const ComponentParam* param);
  void Clear() { mSelections.clear(); }
  // Drops stale times and empty parameter selections.
  void Prune();
  // Replaces a parameter's selected times (the move actor keeps the selection on moving keys).
  void SetTimes(const ComponentParam* param, std::set<TickTime> times);

  // Queries over the existing selected keyframes.
  bool HasSpatialKeyframe() const;
  bool HasNonSpatialKeyframe() const;
  bool HasTimeRemappingKeyframe() const;
  // True when some selected keyframe can take the mode (kInterpolationCapability...).
  bool SupportsInterpolationMode(int capability) const;
  // True when every selected keyframe has that temporal mode (spatial: every selected spatial
  // keyframe has that spatial mode; false without spatial keyframes).
  bool TemporalInterpolationModeMatches(int code) const;
  bool SpatialInterpolationModeMatches(int code) const;

  // Edits of every selected keyframe, one undo step (see KeyframeSelection for the codes).
  EditStatus SetKeyframeTemporalInterpolation(int code, std::string undoText = {}) const;
  EditStatus SetKeyframeSpatialInterpolation(int code, std::string undoText = {}) const;
  EditStatus ApplyAutomaticEase(int side, std::string undoText = {}) const;
  // Deletes the selected keyframes of the parameters shown for `trackItem` (all of them when it
  // is null). The selection keeps the times; Prune or Clear it afterwards.
  EditStatus RemoveSelectionFromComponentParams(const TrackItemRef& trackItem = nullptr,
                                                std::string name = kKeyframeActionRemoveKeyframes,
                                                std::string undoText = {}) const;

 private:
  KeyframeSelection* FindMutable(const ComponentParam* param);
  KeyframeSelection& Obtain(const TrackItemRef& trackItem, const ComponentRef& component,
                            const ComponentParamRef& param);
  EditStatus RunEdit(const char* name, std::string undoText,
                     const std::optional<KeyframeSelection::KeyframeEdit>& edit) const;

  SequenceRef mSequence;
  std::vector<KeyframeSelection> mSelections;
};
