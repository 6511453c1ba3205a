#pragma once

#include <memory>
#include <set>
#include <string>
#include <string_view>

#include "Handlers/EffectControls/Src/FilterItemOptions.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Time/TickTime.h"
#include "Host/Toolkit/Commander.h"

class CheckBoxControl;
class ImageList;
class MultiPictureButton;
class PictureButton;
class PicturePopup;
class ViewBase;

// The list row of one effect (component): disclosure triangle, on/off switch, title, and at the
// right edge the setup, reset and preset buttons. The list build adds the children (mask-shape
// row, masks, groups, parameters); the list paints the title band and hit-tests it.
//
// The row follows its component: ComponentChangedMessage updates the switch,
// ComponentInstanceNameChangedMessage the title (then FilterItemNameChanged goes out on the
// row's station, the list's own). Every change the row makes goes through the host's undoable
// component actions; a read-only row accepts its commands and does nothing.
//
// Controls are child views of the list view (the parent view) and send their commands to the
// row (its Commander part). Held by std::shared_ptr like every row; Destroy before letting go.
// UI thread only.
class FilterItem : public EffectItem, public Commander {
 public:
  using MediaType = ::MediaType;  // Video 0, Audio 1

  // The row's commands (sent by its own buttons, or by the list to the selected row).
  static constexpr CommandID kResetCommand = 18300;
  static constexpr CommandID kSetupCommand = 18301;
  static constexpr CommandID kToggleCommand = 18305;
  static constexpr CommandID kFirstPresetCommand = 18600;  // + preset index
  static constexpr CommandID kLastPresetCommand = 18999;

  // Where the row remembers whether it is open, in its component's expansion properties.
  static constexpr std::string_view kExpandedPropertyKey = "ECP.Filter.Expanded";

  // `masterClip`: set in master-clip mode, else null. `station`: the list's own station, where
  // the row's messages go. `parentView`: the list view holding the row's controls; not owned
  // (the list owns the row and destroys it first). The row is read only when the edit
  // permissions of its track item (or master clip) say so.
  FilterItem(MediaType mediaType, ComponentRef component, TrackItemRef trackItem,
             SequenceRef sequence, MasterClipRef masterClip, const FilterItemOptions& options,
             StationName station, ViewBase* parentView);
  ~FilterItem() override;

  // --- EffectItem ---
  void ListenToMessage(const Message& message) override;
  // Makes the switch and the buttons, restores the expansion, listens to the component.
  void FinishCreateSelf() override;
  // The base teardown, then the switch, setup, reset and preset controls in that order.
  void Destroy() override;
  // For a layer of a graphics clip: the layer's depth among the clip's layers; else the base.
  int GetSubgroupLevel() const override;
  void Show() override;
  void Hide() override;
  bool IsFilter() const override { return true; }
  bool IsFolder() const override { return true; }
  // Records the state, shows or hides the children, and writes it to the component when the
  // row persists its expansion.
  void SetIsExpanded(bool expanded) override;
  void GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const override;
  // The base placement, then the switch and buttons (see the .cpp for the offsets).
  void PositionSelf(int top, int depth, int width) override;
  int GetGroupLevelIndentInPixels() const override;

  // --- Commander ---
  // 18600..18999: enabled unless read only, checked for the current preset.
  bool FindCommandStatus(CommandID command, CommandStatus& status) override;
  bool ObeyCommand(CommandID command) override;

  // --- What the row shows ---
  const ComponentRef& Component() const { return mComponent; }
  MediaType GetMediaType() const { return mMediaType; }
  const SequenceRef& GetSequence() const { return mSequence; }
  const TrackItemRef& GetTrackItem() const { return mTrackItem; }
  const MasterClipRef& GetMasterClip() const { return mMasterClip; }
  const FilterItemOptions& GetOptions() const { return mOptions; }
  bool IsOffline() const { return mOffline; }
  bool IsEnabled() const { return mEnabled; }
  bool IsReadOnly() const { return mReadOnly; }
  // For containers that know better than the edit permissions (a locked track, say).
  void SetReadOnly(bool readOnly);
  bool UsesCheckBox() const { return mUsesCheckBox; }
  bool HasSetup() const { return mHasSetup; }
  bool PersistsExpansion() const { return mPersistExpansion; }
  // The row belongs to a mask of another effect (set by the build).
  void SetIsMask(bool isMask) { mIsMask = isMask; }
  bool IsMask() const { return mIsMask; }
  // The text appended to the title for audio effects with a channel map; empty otherwise.
  const std::string& GetChannelMapText() const { return mChannelMapText; }
  void SetChannelMapText(std::string text);

  // The controls, each null when the row has none.
  MultiPictureButton* GetSwitchButton() const { return mSwitchButton.get(); }
  CheckBoxControl* GetSwitchCheckBox() const { return mSwitchCheckBox.get(); }
  PictureButton* GetSetupButton() const { return mSetupButton.get(); }
  PictureButton* GetResetButton() const { return mResetButton.get(); }
  PicturePopup* GetPresetPopup() const { return mPresetPopup.get(); }
  const ImageList& GetImageList() const { return *mImageList; }

  // The toggle as the switch does it; `modifiers` are the keys held (Alt asks the list to
  // switch every effect instead, FilterOnOffAllChanged). Nothing when read only.
  void Toggle(KeyModifiers modifiers);

 protected:
  std::shared_ptr<const void> KeepAliveForDispatch() const override;

 private:
  void RebuildTitle();
  void UpdateSwitch();
  void ShowButtons(bool show);
  void Reset();
  void RunSetup();
  void ChoosePreset(int index);
  // The popup shows the component's current preset (none when it has none).
  void UpdatePresetSelection();
  void BroadcastToMonitor() const;

  MediaType mMediaType;
  SequenceRef mSequence;
  ComponentRef mComponent;
  MasterClipRef mMasterClip;
  TrackItemRef mTrackItem;
  bool mOffline = false;
  bool mEnabled = true;
  bool mReadOnly = false;
  bool mUsesCheckBox = false;
  bool mNoIndent = false;
  std::shared_ptr<MultiPictureButton> mSwitchButton;
  std::shared_ptr<CheckBoxControl> mSwitchCheckBox;
  std::shared_ptr<PicturePopup> mPresetPopup;
  // The presets the row's reset button or popup was made for; a saved or removed preset
  // remakes the rows.
  std::size_t mShownPresetCount = 0;
  std::shared_ptr<PictureButton> mResetButton;
  std::shared_ptr<PictureButton> mSetupButton;
  std::unique_ptr<ImageList> mImageList;
  TrackItemRef mRowTrackItem;  // time conversion of keyframe times
  bool mHasSetup = false;
  bool mPersistExpansion = true;
  std::string mChannelMapText;
  bool mIsMask = false;
  FilterItemOptions mOptions;
  StationName mComponentStation;  // listened on while created
};
