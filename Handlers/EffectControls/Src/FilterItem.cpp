#include "Handlers/EffectControls/Src/FilterItem.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/UpdateActiveProgramMonitorViewMessage.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Localization.h"
#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/CheckBoxControl.h"
#include "Host/Toolkit/ControlMessages.h"
#include "Host/Toolkit/ImageList.h"
#include "Host/Toolkit/KeyModifiers.h"
#include "Host/Toolkit/MultiPictureButton.h"
#include "Host/Toolkit/PictureButton.h"
#include "Host/Toolkit/PicturePopup.h"
#include "Host/Toolkit/ViewBase.h"

namespace {

constexpr const char* kResetEffectToolTip =
    "$$$/Vantile/Handlers/EffectControls/ResetEffect=Reset Effect";
constexpr const char* kDisplayNameWithChannelMap =
    "$$$/Vantile/Handlers/EffectControls/DisplayName=@0  @1#{comment}component name + channel map "
    "string";

// Switch values: picture i shows value i.
constexpr int kSwitchOff = 0;
constexpr int kSwitchOn = 1;

// Offsets of the row's controls from its top and from the right edge.
constexpr int kSwitchLeft = 3;
constexpr int kSwitchTop = 2;
constexpr int kCheckBoxFromRight = 30;
constexpr int kCheckBoxTop = 24;
constexpr int kResetFromRight = 26;
constexpr int kResetFromRightWithCheckBox = 60;
constexpr int kResetTopWithCheckBox = 22;
constexpr int kPresetFromRight = 28;
constexpr int kSetupFromRight = 52;

Rect DecalRect(Decal decal, int x, int y) {
  const Size size = GetDecalSize(decal);
  return Rect::FromSize(x, y, size.width, size.height);
}

bool ComputeReadOnly(const TrackItemRef& trackItem, const MasterClipRef& masterClip,
                     const ComponentRef& component) {
  if (masterClip) {
    return EditPermissions::IsReadOnly(*masterClip);
  }
  if (trackItem) {
    return EditPermissions::IsReadOnly(*trackItem);
  }
  if (component && component->GetChain() != nullptr) {
    return EditPermissions::IsReadOnly(*component->GetChain());
  }
  return false;
}

}  // namespace

FilterItem::FilterItem(MediaType mediaType, ComponentRef component, TrackItemRef trackItem,
                       SequenceRef sequence, MasterClipRef masterClip,
                       const FilterItemOptions& options, StationName station, ViewBase* parentView)
    : EffectItem(parentView, component ? component->GetDisplayName() : std::string(),
                 std::move(station)),
      Commander(nullptr),
      mMediaType(mediaType),
      mSequence(std::move(sequence)),
      mComponent(std::move(component)),
      mMasterClip(std::move(masterClip)),
      mTrackItem(std::move(trackItem)),
      mImageList(std::make_unique<ImageList>()),
      mOptions(options) {
  HOST_ASSERT(mComponent, "Invalid Component");
  mRowTrackItem = mTrackItem;
  mNoIndent = options.noIndent;
  mUsesCheckBox = options.checkboxSwitch;
  if (mComponent) {
    mOffline = mComponent->IsOffline();
    mEnabled = mComponent->IsEnabled();
    mHasSetup = mComponent->HasSetupDialog() &&
                !(options.noVideoSetupButton && mComponent->GetMediaType() == ::MediaType::Video);
    mComponentStation = mComponent->GetStation();
  }
  mReadOnly = ComputeReadOnly(mTrackItem, mMasterClip, mComponent);
}

FilterItem::~FilterItem() {
  // A row that was never destroyed must not leave its controls in the list view.
  DestroyControl(mSwitchButton);
  DestroyControl(mSwitchCheckBox);
  DestroyControl(mSetupButton);
  DestroyControl(mResetButton);
  DestroyControl(mPresetPopup);
}

std::shared_ptr<const void> FilterItem::KeepAliveForDispatch() const {
  return weak_from_this().lock();
}

// --- Creation ---

void FilterItem::FinishCreateSelf() {
  if (IsCreated() || IsDestroyed()) {
    return;
  }
  if (mComponent) {
    const PropertyList& properties = mComponent->GetExpansionProperties();
    const bool expanded = properties.Has(kExpandedPropertyKey)
                              ? properties.GetBool(kExpandedPropertyKey, true)
                              : !mOptions.startCollapsed;
    // Before the base makes the triangle, so it opens in the right state; the model already
    // holds this state, nothing to write back.
    EffectItem::SetIsExpanded(expanded);
  }
  EffectItem::FinishCreateSelf();
  RebuildTitle();
  if (!mComponent) {
    return;
  }

  if (mOptions.topLevel) {
    if (mUsesCheckBox) {
      mSwitchCheckBox = AdoptControl(std::make_shared<CheckBoxControl>(
          Rect::FromSize(0, 0, CheckBoxControl::kBoxSize, CheckBoxControl::kBoxSize), 0,
          std::string(), mEnabled, this));
      if (mSwitchCheckBox) {
        mSwitchCheckBox->SetTakesFocusOnClick(false);
        AddListener(mSwitchCheckBox->GetStation(), *this);
      }
    } else {
      const bool graphics = mComponent->IsGraphicsComponent();
      const Decal off =
          graphics ? kTLVideoMuteOffButtonNormalDecal : kEffectControlsOffToggleNormalDecal;
      const Decal on =
          graphics ? kTLVideoMuteButtonNormalDecal : kEffectControlsOnToggleNormalDecal;
      mSwitchButton = AdoptControl(std::make_shared<MultiPictureButton>(
          DecalRect(on, 0, 0), kToggleCommand, std::initializer_list<Decal>{off, on}, this));
      if (mSwitchButton) {
        mSwitchButton->SetTakesFocusOnClick(false);
      }
    }
    UpdateSwitch();
  }

  if (mHasSetup) {
    mSetupButton = AdoptControl(
        std::make_shared<PictureButton>(DecalRect(kEffectControlsSetupNormalDecal, 0, 0),
                                        kSetupCommand, kEffectControlsSetupNormalDecal, this));
  }

  const std::size_t presetCount = mComponent->GetPresetCount();
  mShownPresetCount = presetCount;
  if (presetCount == 1 && mOptions.topLevel && !mNoIndent) {
    mResetButton = AdoptControl(
        std::make_shared<PictureButton>(DecalRect(kEffectControlsResetNormalDecal, 0, 0),
                                        kResetCommand, kEffectControlsResetNormalDecal, this));
    if (mResetButton) {
      mResetButton->SetToolTip(kResetEffectToolTip);
      mResetButton->SetEnabled(!mOffline && !mReadOnly);
    }
  } else if (presetCount >= 2) {
    // Items send their commands (18600 + index) to this row, which applies the preset and
    // answers which one is current; no command past 18999 is used.
    auto popup = std::make_shared<PicturePopup>(DecalRect(kEffectControlsPresetNormalDecal, 0, 0),
                                                kEffectControlsPresetNormalDecal, 0, this);
    const std::size_t count = std::min<std::size_t>(
        presetCount, static_cast<std::size_t>(kLastPresetCommand - kFirstPresetCommand + 1));
    for (std::size_t i = 0; i < count; ++i) {
      popup->AddItem(mComponent->GetPresets()[i].name,
                     kFirstPresetCommand + static_cast<CommandID>(i));
    }
    mPresetPopup = AdoptControl(std::move(popup));
    if (mPresetPopup) {
      mPresetPopup->SetEnabled(!mReadOnly);
      UpdatePresetSelection();
    }
  }

  mImageList->Add(kEffectControlsKeySumNormalDecal);
  AddListener(mComponentStation, *this);
}

void FilterItem::Destroy() {
  if (IsDestroyed()) {
    return;
  }
  EffectItem::Destroy();  // also stops listening everywhere
  DestroyControl(mSwitchButton);
  DestroyControl(mSwitchCheckBox);
  DestroyControl(mSetupButton);
  DestroyControl(mResetButton);
  DestroyControl(mPresetPopup);
}

// --- Messages ---

void FilterItem::ListenToMessage(const Message& message) {
  if (const auto* changed = message.As<ComponentChangedMessage>()) {
    if (changed->component == mComponent && !mOffline) {
      if (mComponent->GetPresetCount() != mShownPresetCount && IsCreated()) {
        // The reset button or the popup no longer fits: the list makes its rows again, this
        // one included.
        if (auto* list = dynamic_cast<EffectControlsListView*>(GetParentView())) {
          list->ClearAndRebuildList();
          return;
        }
      }
      mEnabled = mComponent->IsEnabled();
      UpdateSwitch();
      UpdatePresetSelection();  // an undo may have brought another preset back
    }
    return;
  }
  if (const auto* renamed = message.As<ComponentInstanceNameChangedMessage>()) {
    if (renamed->component == mComponent) {
      RebuildTitle();
      if (!GetStation().empty()) {
        BroadcastMessage(GetStation(), FilterItemNameChanged());
      }
    }
    return;
  }
  if (message.Is<CheckBoxControlChangedMessage>()) {
    Toggle(GetAsyncKeyModifiers());
    return;
  }
  // The disclosure triangle.
  EffectItem::ListenToMessage(message);
}

// --- Commands ---

bool FilterItem::FindCommandStatus(CommandID command, CommandStatus& status) {
  if (command >= kFirstPresetCommand && command <= kLastPresetCommand) {
    status.enabled = !mReadOnly;
    const int current = mComponent ? mComponent->GetCurrentPreset() : -1;
    status.checked = current >= 0 &&
                     static_cast<std::size_t>(current) < mComponent->GetPresetCount() &&
                     kFirstPresetCommand + current == command;
    return true;
  }
  return Commander::FindCommandStatus(command, status);
}

bool FilterItem::ObeyCommand(CommandID command) {
  switch (command) {
    case kResetCommand:
      Reset();
      return true;
    case kSetupCommand:
      RunSetup();
      return true;
    case kToggleCommand:
      Toggle(GetAsyncKeyModifiers());
      return true;
    default:
      break;
  }
  if (command >= kFirstPresetCommand && command <= kLastPresetCommand) {
    ChoosePreset(command - kFirstPresetCommand);
    return true;
  }
  return Commander::ObeyCommand(command);
}

void FilterItem::Toggle(KeyModifiers modifiers) {
  if (mReadOnly || !mComponent) {
    UpdateSwitch();  // a check box flips itself on click; show the model's state again
    return;
  }
  if (IsAltDown(modifiers)) {
    // The list switches every effect of the target in one step; this row follows the model.
    UpdateSwitch();
    if (!GetStation().empty()) {
      BroadcastMessage(GetStation(), FilterOnOffAllChanged(!mEnabled));
    }
    return;
  }
  const bool wasEnabled = mEnabled;
  const EditStatus status = ComponentActions::SetBypass(mComponent, wasEnabled);
  // The model decides: a refused edit leaves the switch where the effect is.
  mEnabled = mComponent->IsEnabled();
  UpdateSwitch();
  if (status == EditStatus::Done) {
    BroadcastToMonitor();
  }
}

void FilterItem::Reset() {
  if (mReadOnly || !mComponent) {
    return;
  }
  EditStatus values = EditStatus::NoChange;
  EditStatus name = EditStatus::NoChange;
  {
    // Values and name go back together: one undo step.
    Project* project = mComponent->GetProject();
    std::optional<UndoStack::ScopedCompound> step;
    if (project != nullptr) {
      step.emplace(project->GetUndoStack(), ComponentActions::kResetParameterValues);
    }
    values = ComponentActions::ResetParameterValues(mComponent, 0);
    name = ComponentActions::SetInstanceName(mComponent, std::string());
  }
  if (values != EditStatus::Done && name != EditStatus::Done) {
    return;
  }
  BroadcastToMonitor();
  if (!GetStation().empty()) {
    BroadcastMessage(GetStation(), EffectControlsBecomeTargetMessage());
  }
}

void FilterItem::RunSetup() {
  if (mReadOnly || !mComponent || !mHasSetup) {
    return;
  }
  // The host offers no way to run an effect's setup dialog.
  throw NullInterfaceException("IComponentSetup");
}

void FilterItem::ChoosePreset(int index) {
  if (mReadOnly || !mComponent || index < 0 ||
      static_cast<std::size_t>(index) >= mComponent->GetPresetCount()) {
    return;
  }
  if (ComponentActions::ApplyPreset(mComponent, index) == EditStatus::Done) {
    UpdatePresetSelection();
    BroadcastToMonitor();
  }
}

void FilterItem::UpdatePresetSelection() {
  if (!mPresetPopup || !mComponent) {
    return;
  }
  const int current = mComponent->GetCurrentPreset();
  if (current < 0 || !mPresetPopup->SelectCommand(kFirstPresetCommand + current)) {
    mPresetPopup->SetSelectedIndex(-1);
  }
}

void FilterItem::BroadcastToMonitor() const {
  if (mSequence) {
    BroadcastMessage(mSequence->GetStation(), UpdateActiveProgramMonitorViewMessage());
  }
}

// --- State ---

void FilterItem::SetReadOnly(bool readOnly) {
  mReadOnly = readOnly;
  if (mResetButton) {
    mResetButton->SetEnabled(!mOffline && !mReadOnly);
  }
  if (mPresetPopup) {
    mPresetPopup->SetEnabled(!mReadOnly);
  }
  if (mSwitchCheckBox) {
    mSwitchCheckBox->SetEnabled(!mReadOnly);
  }
}

void FilterItem::SetChannelMapText(std::string text) {
  mChannelMapText = std::move(text);
  RebuildTitle();
}

void FilterItem::RebuildTitle() {
  if (!mComponent) {
    return;
  }
  const std::string& displayName = mComponent->GetDisplayName();
  if (mChannelMapText.empty()) {
    SetName(displayName);
  } else {
    SetName(LocalizeString(kDisplayNameWithChannelMap, {displayName, mChannelMapText}));
  }
}

void FilterItem::UpdateSwitch() {
  if (mSwitchButton) {
    mSwitchButton->SetValue(mEnabled ? kSwitchOn : kSwitchOff);
  }
  if (mSwitchCheckBox) {
    mSwitchCheckBox->SetChecked(mEnabled);
    mSwitchCheckBox->SetEnabled(!mReadOnly);
  }
}

int FilterItem::GetSubgroupLevel() const {
  // The host's graphics clips keep their layers in one flat chain, so every layer sits at the
  // row's own level.
  return EffectItem::GetSubgroupLevel();
}

int FilterItem::GetGroupLevelIndentInPixels() const {
  if (mNoIndent) {
    return 0;
  }
  return EffectItem::GetGroupLevelIndentInPixels() + mOptions.indent;
}

// --- Visibility and expansion ---

void FilterItem::Show() {
  EffectItem::Show();
  if (IsShown()) {
    ShowButtons(!mNoIndent);
  }
}

void FilterItem::Hide() {
  EffectItem::Hide();
  ShowButtons(false);
}

void FilterItem::ShowButtons(bool show) {
  for (ViewBase* control :
       {static_cast<ViewBase*>(mSwitchButton.get()), static_cast<ViewBase*>(mSwitchCheckBox.get()),
        static_cast<ViewBase*>(mSetupButton.get()), static_cast<ViewBase*>(mResetButton.get()),
        static_cast<ViewBase*>(mPresetPopup.get())}) {
    if (control != nullptr) {
      control->SetVisible(show);
    }
  }
}

void FilterItem::SetIsExpanded(bool expanded) {
  EffectItem::SetIsExpanded(expanded);
  if (!mPersistExpansion || !mComponent) {
    return;
  }
  PropertyList& properties = mComponent->GetExpansionProperties();
  if (properties.Has(kExpandedPropertyKey) &&
      properties.GetBool(kExpandedPropertyKey, !expanded) == expanded) {
    return;
  }
  if (properties.IsReadOnly(kExpandedPropertyKey)) {
    return;
  }
  properties.SetBool(kExpandedPropertyKey, expanded);
}

void FilterItem::GetKeyframeTimes(std::set<TickTime>& times, TimeLine line) const {
  if (mOffline) {
    return;
  }
  EffectItem::GetKeyframeTimes(times, line);
}

// --- Placement ---

void FilterItem::PositionSelf(int top, int depth, int width) {
  EffectItem::PositionSelf(top, depth, width);
  // Controls move whenever their place changed (a wider list moves the right-hand buttons too).
  if (mSwitchCheckBox) {
    PlaceView(*mSwitchCheckBox,
              Rect::FromSize(width - kCheckBoxFromRight, top + kCheckBoxTop,
                             CheckBoxControl::kBoxSize, CheckBoxControl::kBoxSize));
  }
  if (mSwitchButton) {
    const Size size = mSwitchButton->GetSize();
    PlaceView(*mSwitchButton, Rect::FromSize(GetGroupLevelIndentInPixels() + kSwitchLeft,
                                             top + kSwitchTop, size.width, size.height));
  }
  if (mResetButton) {
    const Size size = mResetButton->GetSize();
    const int x = width - (mUsesCheckBox ? kResetFromRightWithCheckBox : kResetFromRight);
    const int y = top + (mUsesCheckBox ? kResetTopWithCheckBox : 0);
    PlaceView(*mResetButton, Rect::FromSize(x, y, size.width, size.height));
  }
  if (mPresetPopup) {
    const Size size = mPresetPopup->GetSize();
    PlaceView(*mPresetPopup,
              Rect::FromSize(width - kPresetFromRight, top, size.width, size.height));
  }
  if (mSetupButton) {
    const Size size = mSetupButton->GetSize();
    PlaceView(*mSetupButton, Rect::FromSize(width - kSetupFromRight, top, size.width, size.height));
  }
}
