#pragma once

#include <memory>
#include <optional>

#include "Host/Model/KeyframeClipboardItem.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Time/TickTime.h"
#include "Host/Time/TimePoint.h"

// The clipboard side of a keyframe selection: copy, cut and paste of keyframes through the
// project's clipboard (KeyframeClipboardItem). Copying is not an edit (no undo step); cut and
// paste are one undo step each ("MZ.KeyframeSelection.Cut", "MZ.KeyframeSelection.Paste").
//
// Paste target: a component chain. Each copied parameter goes to the chain's effect of the same
// match name and ordinal (the first of that match name when the chain has fewer) and its
// parameter at the same position with the same name and value kind; copied parameters without
// such a target are skipped. Pasted keyframes replace keyframes at the same times, and turn time
// variation on for a parameter that had it off.
class KeyframeMultiSelectionEditor {
 public:
  // The clipboard item for the selected keyframes (nullptr when none is selected).
  static std::shared_ptr<const KeyframeClipboardItem> CreateClipboardItem(
      const KeyframeMultiSelection& selection);

  // Puts the selected keyframes on the clipboard of the sequence's project (or, without a
  // sequence, of the first selected parameter's project). False when nothing is selected or
  // there is no project.
  static bool Copy(const KeyframeMultiSelection& selection, const SequenceRef& sequence,
                   const ComponentChainRef& chain = nullptr);
  // Copy, then delete the selected keyframes (of `chain` only, when given) as one undo step. The
  // selection is emptied when the keyframes went.
  static EditStatus Cut(KeyframeMultiSelection& selection, const SequenceRef& sequence,
                        const ComponentChainRef& chain = nullptr);

  // Whether the project's clipboard holds keyframes that have a target parameter in `chain`
  // that can vary over time and is not read only.
  static bool PasteValid(const SequenceRef& sequence, const ComponentChainRef& chain);
  // Pastes at the sequence's edit line (converted to clip time through the chain's track item;
  // a master clip's chain takes the edit line as clip time). When `selection` is given it is
  // replaced by the pasted keyframes.
  static EditStatus Paste(const SequenceRef& sequence, const ComponentChainRef& chain,
                          KeyframeMultiSelection* selection = nullptr);
  // Pastes `item` so that its earliest keyframe lands at `clipTime`.
  static EditStatus PasteAt(const KeyframeClipboardItem& item, const ComponentChainRef& chain,
                            ClipTime clipTime, KeyframeMultiSelection* selection = nullptr);

  // The parameter of `chain` that a copied parameter pastes into, or null.
  static ComponentParamRef FindTarget(const KeyframeClipboardItem::ParamKeyframes& copied,
                                      const ComponentChain& chain);
};
