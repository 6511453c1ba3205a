#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Host/Rows/ParameterControl.h"

class TextPopup;

// The row of a track-menu parameter: an 85 x 17 popup of the entries the sequence offers for it
// (Sequence::GetTrackComboParamStrings), rebuilt whenever the sequence's structure changes.
// The parameter holds an entry's index; entry i is the command kFirstItemCommand + i, so the
// popup selects by command, never by position: "(-" is a separator and an empty or "~" entry
// adds nothing, yet each uses up its command, and a value without an item selects nothing (and
// writes nothing). Choosing an item is one undoable "MZ.ComponentParam.SetValue" (a keyframe at
// the edit time when the choice varies over time).
class TrackMenuParameter : public ParameterControl {
 public:
  static constexpr CommandID kFirstItemCommand = 18600;
  static constexpr CommandID kLastItemCommand = 18999;
  static constexpr int kPopupWidth = 85;
  static constexpr int kPopupHeight = 17;

  explicit TrackMenuParameter(const ParameterControlInfo& info);

  void ListenToMessage(const Message& message) override;
  void PositionSelf(int top, int depth, int width) override;
  void SynchToCurrentTime() override;
  // Follows the new binding's sequence: its structure changes and its tracks.
  void UpdateParamBinding(const SequenceRef& sequence, const ComponentRef& component,
                          const ComponentParamRef& param, const TrackItemRef& trackItem,
                          const StationName& playerStation = {}) override;

  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;
  static bool IsItemCommand(CommandID command) {
    return command >= kFirstItemCommand && command <= kLastItemCommand;
  }

  // Replaces the popup's items by `strings` (none: the items stay as they are). At most the 400
  // strings that have a command are read.
  void RebuildMenu(const std::vector<std::string>& strings);
  // The index the parameter holds at the edit time; -1 when it holds none.
  int GetValueIndex() const;
  CommandID GetSelectedCommand() const { return mSelectedCommand; }
  TextPopup* GetPopup() const { return mPopup.get(); }

 protected:
  void CreateControlsSelf() override;
  void DestroyControlsSelf() override;
  void ShowControls(bool show) override;
  void UpdateControlsEnabled(bool enabled) override;

 private:
  void RebuildMenuFromSequence();
  // Listens to the bound sequence's station only (none without a sequence).
  void ListenToSequence();
  void StopListeningToSequence();
  void Choose(CommandID command);

  std::shared_ptr<TextPopup> mPopup;
  CommandID mSelectedCommand = kFirstItemCommand;
  StationName mSequenceStation;  // where the structure changes come from; empty: none
};
