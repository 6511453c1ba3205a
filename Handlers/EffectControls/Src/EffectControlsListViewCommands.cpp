// The effect commands of the list: delete, cut, copy, paste, select and deselect all, reset,
// enable, remove all effects, and their statuses. Every change is one undo step of the
// target's project, however many chains, masks or rows it touches.
#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Handlers/EffectControls/Src/ParameterRowFactory.h"
#include "Host/Messaging/Localization.h"
#include "Host/Model/Clipboard.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentActions.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/EffectClipboardItem.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/SequenceActions.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Toolkit/CommandStatus.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

constexpr const char* kChromilRemoveMask = "MZ.ChromilColor.RemoveMask";
constexpr const char* kChromilAddMask = "MZ.ChromilColor.AddMask";
constexpr const char* kPasteMaskText = "$$$/Vantile/MZ/PasteMask=Paste Effect Mask";
constexpr const char* kPasteMasksText = "$$$/Vantile/MZ/PasteMasks=Paste Effect Masks";

bool IsChromil(const Component& component) {
  return component.GetMatchName() == kMatchnameChromil;
}

// The components of every chain, to find what a paste added.
std::vector<ComponentRef> AllComponents(const std::vector<ComponentChainRef>& chains) {
  std::vector<ComponentRef> all;
  for (const ComponentChainRef& chain : chains) {
    const auto& components = chain->GetComponents();
    all.insert(all.end(), components.begin(), components.end());
  }
  return all;
}

// One undo step for whatever runs while it lives (none when there is no project).
class ScopedStep {
 public:
  ScopedStep(Project* project, std::string name) {
    if (project != nullptr) {
      mStep.emplace(project->GetUndoStack(), std::move(name));
    }
  }

 private:
  std::optional<UndoStack::ScopedCompound> mStep;
};

}  // namespace

// --- Queries ---

bool EffectControlsListView::CanDeleteEffects() const {
  if (mSelectedFilters.IsEmpty() ||
      (mTarget.kind != kTargetClip && mTarget.kind != kTargetTransitionComponent)) {
    return false;
  }
  const auto& entries = mSelectedFilters.GetEntries();
  return std::any_of(entries.begin(), entries.end(), [](const FilterMultiSelection::Entry& e) {
    return e.component && !e.component->IsIntrinsic();
  });
}

bool EffectControlsListView::GetAllowSavePreset() const {
  if (mSelectedFilters.IsEmpty() || mSelectedFilters.ContainsSubsidiaryItems()) {
    return false;
  }
  const auto& entries = mSelectedFilters.GetEntries();
  return std::none_of(entries.begin(), entries.end(), [](const FilterMultiSelection::Entry& e) {
    return e.component && e.component->IsCapsule();
  });
}

std::vector<ComponentChainRef> EffectControlsListView::GetPasteTargetChains() const {
  std::vector<ComponentChainRef> chains;
  auto add = [&chains](const ComponentChainRef& chain) {
    if (chain && std::find(chains.begin(), chains.end(), chain) == chains.end()) {
      chains.push_back(chain);
    }
  };
  if (mTarget.kind == kTargetTransitionComponent) {
    add(mTarget.transitionChain);
    return chains;
  }
  if (mTarget.kind != kTargetClip) {
    return chains;
  }
  add(mVideoChain);
  for (const auto& part : mAudioParts) {
    if (part->IsClipPart() && part->GetTrackItem()) {
      add(part->GetTrackItem()->GetComponentChain());
    }
  }
  return chains;
}

bool EffectControlsListView::GetMaskPasteTarget(ComponentRef& videoFilterComponent) const {
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    ComponentRef effect = entry.IsSubsidiary() ? entry.parent : entry.component;
    if (effect && effect->GetMediaType() == MediaType::Video && effect->CanTakeMasks()) {
      videoFilterComponent = std::move(effect);
      return true;
    }
  }
  return false;
}

std::shared_ptr<const EffectClipboardItem>
EffectControlsListView::CreateVideoFilterComponentClipboardItemFromSelection() const {
  return mSelectedFilters.CreateClipboardItem();
}

// --- Statuses ---

void EffectControlsListView::OnDeleteStatus(CommandID command, CommandStatus& status) const {
  status.enabled = false;
  if (mSelectedFilters.IsEmpty() || IsReadOnlyEffectContainer()) {
    return;
  }
  if (command == kCommandCut && mTarget.kind == kTargetTransitionComponent) {
    return;
  }
  status.enabled = CanDeleteEffects() ||
                   (command == kCommandClear && mSelectedFilters.ContainsSubsidiaryItems());
}

void EffectControlsListView::OnCopyStatus(CommandStatus& status) const {
  status.enabled = !mSelectedFilters.IsEmpty();
}

void EffectControlsListView::OnPasteStatus(CommandStatus& status) const {
  status.enabled = false;
  if (IsReadOnlyEffectContainer()) {
    return;
  }
  Project* project = GetTargetProject();
  if (project == nullptr) {
    return;
  }
  const auto& item = project->GetClipboard().GetItem();
  const auto* effects = dynamic_cast<const EffectClipboardItem*>(item.get());
  ComponentRef maskTarget;
  status.enabled = (effects != nullptr && effects->HasMasks() && GetMaskPasteTarget(maskTarget)) ||
                   mSelectedFilters.QueryPaste(item.get(), GetPasteTargetChains());
}

void EffectControlsListView::OnSelectAllStatus(CommandStatus& status) const {
  bool any = false;
  ForEachSelectableList([&any](const EffectItemList& list) { any = any || !list.IsEmpty(); });
  status.enabled = any;
}

void EffectControlsListView::OnDeselectAllStatus(CommandStatus& status) const {
  status.enabled = !mSelectedFilters.IsEmpty() || !mSelectedParameters.IsEmpty();
}

void EffectControlsListView::OnCommandStatus(CommandID command, CommandStatus& status) const {
  status.enabled = false;
  const bool readOnly = IsReadOnlyEffectContainer();
  switch (command) {
    case kDeleteAllEffectsCommand: {
      bool any = false;
      ForEachSelectableList([&any](const EffectItemList& list) { any = any || !list.IsEmpty(); });
      status.enabled = !readOnly && any;
      break;
    }
    case kEffectsEnabledCommand: {
      status.enabled = !readOnly && !mSelectedFilters.IsEmpty() && mTarget.kind == kTargetClip;
      const auto& entries = mSelectedFilters.GetEntries();
      status.checked =
          !entries.empty() && std::all_of(entries.begin(), entries.end(), [](const auto& e) {
            return e.component && e.component->IsEnabled();
          });
      break;
    }
    case kCommandClear:
    case kDeleteEffectCommand:
      status.enabled =
          !readOnly && (CanDeleteEffects() || mSelectedFilters.ContainsSubsidiaryItems());
      break;
    case kResetEffectCommand:
      status.enabled = !readOnly && !mSelectedFilters.IsEmpty() &&
                       (mTarget.kind == kTargetClip || mTarget.kind == kTargetTransitionComponent);
      break;
    case kSavePresetCommand:
      status.enabled = GetAllowSavePreset();
      break;
    default:
      break;
  }
}

// --- Delete, cut, copy, paste ---

bool EffectControlsListView::OnDelete() {
  if (mSelectedFilters.IsEmpty()) {
    return false;
  }
  if (IsReadOnlyEffectContainer()) {
    return true;
  }
  Project* project = GetTargetProject();
  if (mSelectedFilters.ContainsSubsidiaryItems()) {
    bool removed = false;
    // A removal rebuilds the list, which empties the selection: work from a copy.
    const std::vector<FilterMultiSelection::Entry> entries = mSelectedFilters.GetEntries();
    {
      ScopedStep step(project, ComponentActions::kRemoveMask);
      for (const auto& entry : entries) {
        if (entry.IsSubsidiary()) {
          const char* name =
              IsChromil(*entry.parent) ? kChromilRemoveMask : ComponentActions::kRemoveMask;
          removed = ComponentActions::RemoveMask(entry.parent, entry.component, name) ==
                        EditStatus::Done ||
                    removed;
        }
      }
    }
    if (removed) {
      ClearAndRebuildList();
    }
    return true;
  }
  if (mTarget.kind == kTargetTransitionComponent) {
    if (mVideoTrackItem && mVideoTrackItem->IsTransition()) {
      SequenceActions::RemoveItems({mVideoTrackItem});
    }
    return true;
  }
  if (mTarget.kind != kTargetClip || !CanDeleteEffects()) {
    // Intrinsic effects are never removed: nothing here to act on.
    return false;
  }
  std::map<ComponentChain*, std::vector<ComponentRef>> byChain;
  std::vector<ComponentChain*> order;
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    ComponentChain* chain = entry.component ? entry.component->GetChain() : nullptr;
    if (chain == nullptr || entry.component->IsIntrinsic()) {
      continue;
    }
    if (byChain.find(chain) == byChain.end()) {
      order.push_back(chain);
    }
    byChain[chain].push_back(entry.component);
  }
  ScopedStep step(project, ComponentChainActions::kRemoveMultipleFilters);
  for (ComponentChain* chain : order) {
    ComponentChainActions::RemoveMultipleFilters(ComponentChainRef(chain), byChain[chain]);
  }
  return true;
}

bool EffectControlsListView::OnCopy() {
  Project* project = GetTargetProject();
  auto item = CreateVideoFilterComponentClipboardItemFromSelection();
  if (project == nullptr || !item) {
    return false;
  }
  project->GetClipboard().AddItem(std::move(item));
  return true;
}

bool EffectControlsListView::OnCut() {
  if (mSelectedFilters.IsEmpty()) {
    return false;
  }
  if (IsReadOnlyEffectContainer()) {
    return true;
  }
  CommandStatus status;
  OnDeleteStatus(kCommandCut, status);
  // What cannot be deleted is not cut (not even copied); what was not copied is not deleted.
  if (!status.enabled || !OnCopy()) {
    return true;
  }
  OnDelete();
  return true;
}

bool EffectControlsListView::PasteFromVideoFilterComponentClipboardItem(
    const EffectClipboardItem& item) {
  ComponentRef target;
  if (!item.HasMasks() || !GetMaskPasteTarget(target)) {
    return false;
  }
  const std::vector<ComponentRef> before = target->GetMasks();
  const std::string text =
      LocalizeString(item.GetMasks().size() == 1 ? kPasteMaskText : kPasteMasksText);
  const std::string action = IsChromil(*target) ? kChromilAddMask : ComponentActions::kAddMask;
  if (FilterMultiSelection::PasteMasks(target, item, text, action) != EditStatus::Done) {
    return false;
  }
  const std::vector<ComponentRef>& after = target->GetMasks();
  if (after.size() > before.size()) {
    BroadcastMessage(mOwnStation, EmbeddedEffectAdded(after.back()));
  }
  return true;
}

bool EffectControlsListView::OnPaste() {
  Project* project = GetTargetProject();
  if (project == nullptr) {
    return false;
  }
  const std::shared_ptr<const ClipboardItem> item = project->GetClipboard().GetItem();
  const auto* effects = dynamic_cast<const EffectClipboardItem*>(item.get());
  if (effects == nullptr) {
    return false;
  }
  if (IsReadOnlyEffectContainer()) {
    return true;
  }
  ComponentRef maskTarget;
  if (effects->HasMasks() && GetMaskPasteTarget(maskTarget)) {
    PasteFromVideoFilterComponentClipboardItem(*effects);
    return true;
  }
  const std::vector<ComponentChainRef> targets = GetPasteTargetChains();
  if (!mSelectedFilters.QueryPaste(item.get(), targets)) {
    return false;
  }
  const std::vector<ComponentRef> before = AllComponents(targets);
  // The selection is read while the paste rebuilds the list: paste from a copy of it.
  const FilterMultiSelection::Selection selection = mSelectedFilters;
  if (selection.Paste(*item, targets) != EditStatus::Done) {
    return true;
  }
  std::vector<ComponentRef> added;
  for (const ComponentRef& component : AllComponents(targets)) {
    if (std::find(before.begin(), before.end(), component) == before.end()) {
      added.push_back(component);
    }
  }
  if (!added.empty()) {
    // The pasted effects are selected at once when their rows exist, else after the rebuild.
    if (FindFilterRow(added.front().get(), nullptr)) {
      SelectComponents(added);
    } else {
      mPendingSelection = std::move(added);
    }
  }
  return true;
}

// --- Select all, reset, enable, remove all ---

void EffectControlsListView::OnSelectAll() {
  ClearSelection();
  UpdateDirectManipulation();
  ForEachSelectableList([this](const EffectItemList& list) {
    for (const auto& row : list) {
      if (row->IsFilter() && row->IsShown()) {
        SelectItem(row, true);
      }
    }
  });
  UpdateDirectManipulation();
  BroadcastMessage(mOwnStation, EffectControlsFilterSelectionChangedMessage());
  Invalidate();
}

void EffectControlsListView::OnResetEffect() {
  if (IsReadOnlyEffectContainer() ||
      (mTarget.kind != kTargetClip && mTarget.kind != kTargetTransitionComponent)) {
    return;
  }
  std::vector<std::shared_ptr<FilterItem>> rows;
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    if (auto row = FindFilterRow(entry.component.get(), entry.trackItem.get())) {
      rows.push_back(std::move(row));
    }
  }
  ScopedStep step(GetTargetProject(), ComponentActions::kResetParameterValues);
  for (const auto& row : rows) {
    row->ObeyCommand(FilterItem::kResetCommand);
  }
}

void EffectControlsListView::OnEffectEnabled() {
  if (IsReadOnlyEffectContainer() || mTarget.kind != kTargetClip || mSelectedFilters.IsEmpty()) {
    return;
  }
  const ComponentRef& first = mSelectedFilters.At(0).component;
  if (!first) {
    return;
  }
  const bool enable = !first->IsEnabled();
  std::vector<ComponentRef> toSwitch;
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    if (entry.component && !entry.component->IsArchived() &&
        entry.component->IsEnabled() != enable) {
      toSwitch.push_back(entry.component);
    }
  }
  ComponentChainActions::SetBypassOfComponents(toSwitch, !enable);
}

void EffectControlsListView::OnDeleteAllEffects() {
  if (IsReadOnlyEffectContainer()) {
    return;
  }
  ClearSelection();
  UpdateDirectManipulation();
  if (mTarget.masterClip) {
    ComponentChainActions::RemoveAllFilters(mVideoChain);
    return;
  }
  std::vector<TrackItemRef> items;
  if (mVideoTrackItem && mVideoTrackItem->IsClip()) {
    items.push_back(mVideoTrackItem);
  }
  for (const auto& part : mAudioParts) {
    if (part->IsClipPart() && part->GetTrackItem()) {
      items.push_back(part->GetTrackItem());
    }
  }
  if (!items.empty()) {
    SequenceActions::RemoveAttributes(items);
  }
}
