// Mouse handling of the effect list: hit testing, the effect and parameter selections, the
// separator at the right edge, the start of a drag, and the direct-manipulation effect.
#include <algorithm>
#include <cstdlib>
#include <utility>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/EffectControlsMessages.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Host/Messaging/DebugFlags.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/Cursor.h"

// --- Selections ---

void EffectControlsListView::SelectItem(const std::shared_ptr<EffectItem>& row, bool select) {
  auto* filter = dynamic_cast<FilterItem*>(row.get());
  if (filter == nullptr) {
    return;
  }
  const ComponentRef& component = filter->Component();
  const TrackItemRef& trackItem = filter->GetTrackItem();
  const bool found = mSelectedFilters.Contains(component.get(), trackItem.get());
  if (select && !found) {
    mSelectedFilters.Add(component, trackItem);
  } else if (!select && found) {
    mSelectedFilters.Remove(component.get(), trackItem.get());
  }
  filter->SetSelected(select);
}

void EffectControlsListView::SelectParameter(const std::shared_ptr<EffectItem>& row, bool select) {
  auto* parameter = dynamic_cast<ParameterControl*>(row.get());
  if (parameter == nullptr || !parameter->GetParam()) {
    return;
  }
  const ComponentParamRef& param = parameter->GetParam();
  const bool found = mSelectedParameters.Contains(param.get());
  if (select && !found) {
    mSelectedParameters.Add(parameter->GetComponent(), param, parameter->GetTrackItem());
  } else if (!select && found) {
    mSelectedParameters.Remove(param.get());
  }
  parameter->SetSelected(select);
}

void EffectControlsListView::ClearSelection() {
  if (mSelectedFilters.IsEmpty() && mSelectedParameters.IsEmpty()) {
    Invalidate();
    return;
  }
  mSelectedFilters.Clear();
  mSelectedParameters.Clear();
  ForEachSelectableList([](const EffectItemList& list) {
    list.ForEachRow([](const EffectItemList::Row& row) {
      row->SetSelected(false);
      return true;
    });
  });
  BroadcastMessage(mOwnStation, EffectControlsFilterSelectionChangedMessage());
  Invalidate();
}

void EffectControlsListView::SelectParameterExclusively(const std::shared_ptr<EffectItem>& row) {
  ClearSelection();
  UpdateDirectManipulation();
  SelectParameter(row, true);
  Invalidate();
}

void EffectControlsListView::ShiftClickSelection(const std::shared_ptr<EffectItem>& row) {
  // Effects in display order; only top rows and their masks are effects.
  std::vector<std::shared_ptr<EffectItem>> effects;
  ForEachSelectableList([&effects](const EffectItemList& list) {
    list.ForEachRow([&effects](const EffectItemList::Row& candidate) {
      if (dynamic_cast<const FilterItem*>(candidate.get()) != nullptr) {
        effects.push_back(candidate);
      }
      return true;
    });
  });
  const auto clicked = std::find(effects.begin(), effects.end(), row);
  if (clicked == effects.end()) {
    return;
  }
  const auto clickedIndex = clicked - effects.begin();
  // The anchor: the selected effect nearest to the click, the earlier one on a tie.
  std::ptrdiff_t anchor = clickedIndex;
  std::ptrdiff_t bestDistance = -1;
  for (std::ptrdiff_t i = 0; i < static_cast<std::ptrdiff_t>(effects.size()); ++i) {
    if (!effects[static_cast<std::size_t>(i)]->IsSelected()) {
      continue;
    }
    const std::ptrdiff_t distance = std::abs(i - clickedIndex);
    if (bestDistance < 0 || distance < bestDistance) {
      bestDistance = distance;
      anchor = i;
    }
  }
  ClearSelection();
  const auto [first, last] = std::minmax(anchor, clickedIndex);
  for (std::ptrdiff_t i = first; i <= last; ++i) {
    SelectItem(effects[static_cast<std::size_t>(i)], true);
  }
  if (mKeyframeSelection) {
    mKeyframeSelection->Clear();
  }
}

void EffectControlsListView::SelectComponents(const std::vector<ComponentRef>& components) {
  ClearSelection();
  for (const ComponentRef& component : components) {
    ForEachSelectableList([&](const EffectItemList& list) {
      list.ForEachRow([&](const EffectItemList::Row& row) {
        const auto* filter = dynamic_cast<const FilterItem*>(row.get());
        if (filter != nullptr && filter->Component() == component) {
          SelectItem(row, true);
          return false;
        }
        return true;
      });
    });
  }
  UpdateDirectManipulation();
  BroadcastMessage(mOwnStation, EffectControlsFilterSelectionChangedMessage());
  Invalidate();
}

void EffectControlsListView::AutoSelectNthEmbeddedEffect() {
  // Asked for by a paste, for the rows that paste made: a later build (another clip) finds
  // none of these components and selects nothing.
  std::vector<ComponentRef> pending = std::move(mPendingSelection);
  mPendingSelection.clear();
  if (!pending.empty()) {
    SelectComponents(pending);
  }
}

void EffectControlsListView::ForEachSelectableList(
    const std::function<void(const EffectItemList&)>& visit) const {
  // Display order: a Shift range runs down the list as the user sees it.
  visit(mGraphicsItems);
  visit(mVideoItems);
  for (const auto& part : mAudioParts) {
    if (part->IsClipPart()) {
      visit(part->GetItems());
    }
  }
}

std::shared_ptr<FilterItem> EffectControlsListView::FindFilterRow(
    const Component* component, const TrackItem* trackItem) const {
  std::shared_ptr<FilterItem> found;
  ForEachSelectableList([&](const EffectItemList& list) {
    if (found) {
      return;
    }
    list.ForEachRow([&](const EffectItemList::Row& row) {
      auto filter = std::dynamic_pointer_cast<FilterItem>(row);
      if (filter && filter->Component().get() == component &&
          (trackItem == nullptr || filter->GetTrackItem().get() == trackItem)) {
        found = std::move(filter);
        return false;
      }
      return true;
    });
  });
  return found;
}

// --- Queries ---

void EffectControlsListView::GetSelectedComponents(std::vector<ComponentRef>& components,
                                                   std::vector<TrackItemRef>& trackItems) const {
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    if (!entry.IsSubsidiary()) {
      components.push_back(entry.component);
      trackItems.push_back(entry.trackItem);
    }
  }
}

std::vector<ComponentRef> EffectControlsListView::GetSelectedComponentsWithOptions(
    const SelectedComponentOptions& options) const {
  std::vector<ComponentRef> components;
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    if (options.includeMasks || !entry.IsSubsidiary()) {
      components.push_back(entry.component);
    }
  }
  if (components.empty() && options.includeParameterOwners) {
    components = mSelectedParameters.GetComponents();
  }
  return components;
}

void EffectControlsListView::GetSelectedComponentsFromComponentChain(
    const ComponentChain& chain, std::vector<ComponentRef>& components,
    std::vector<TrackItemRef>& trackItems) const {
  for (const auto& entry : mSelectedFilters.GetEntries()) {
    const Component* effect = entry.IsSubsidiary() ? entry.parent.get() : entry.component.get();
    if (effect != nullptr && effect->GetChain() == &chain) {
      components.push_back(entry.component);
      trackItems.push_back(entry.trackItem);
    }
  }
}

ComponentRef EffectControlsListView::GetSingleSelectComponent() const {
  return mSelectedFilters.Size() == 1 ? mSelectedFilters.At(0).component : nullptr;
}

bool EffectControlsListView::FirstSelectedComponent(ComponentRef& component,
                                                    TrackItemRef& trackItem) const {
  if (mSelectedFilters.IsEmpty()) {
    return false;
  }
  component = mSelectedFilters.At(0).component;
  trackItem = mSelectedFilters.At(0).trackItem;
  return true;
}

// --- Hit testing ---

bool EffectControlsListView::IsInSeparatorZone(Point point) const {
  const int right = GetLocalBounds().right;
  return mSeparatorEnabled && right - kSeparatorZoneWidth < point.x && point.x < right;
}

bool EffectControlsListView::HitTestCustomUIRectangles(Point point) const {
  bool inside = false;
  ForEachTopRow([&](const std::shared_ptr<EffectItem>& top) {
    std::function<void(const std::shared_ptr<EffectItem>&)> visit =
        [&](const std::shared_ptr<EffectItem>& row) {
          if (inside || !row->IsShown()) {
            return;
          }
          if (row->HasCustomView() && row->GetCustomViewRect().Contains(point)) {
            inside = true;
            return;
          }
          for (const auto& child : row->GetItems()) {
            visit(child);
          }
        };
    visit(top);
  });
  return inside;
}

std::shared_ptr<EffectItem> EffectControlsListView::FindItemFromPoint(Point point) const {
  std::shared_ptr<EffectItem> found;
  auto look = [&](const EffectItemList& list, bool expanded) {
    if (!found && expanded) {
      found = list.FindRowAt(point.y);
    }
  };
  look(mVideoItems, mVideoExpanded);
  look(mGraphicsItems, mGraphicsExpanded);
  for (const auto& part : mAudioParts) {
    look(part->GetItems(), part->IsExpanded());
  }
  return found && found->IsShown() ? found : nullptr;
}

Rect EffectControlsListView::GetParameterNameRect(const EffectItem& row) const {
  const int halfWidth = GetLocalBounds().Width() / 2;
  if (halfWidth <= kParameterNameEndBeforeMiddle) {
    return {};
  }
  const int left = row.GetGroupLevelIndentInPixels() + EffectItem::kTitleOffset;
  const int right = halfWidth - kParameterNameEndBeforeMiddle;
  return Rect{left, row.GetTop(), std::max(left, right), row.GetTop() + row.OwnHeight()};
}

bool EffectControlsListView::ClickedItem(Point point, KeyModifiers modifiers, MouseButton button) {
  const FilterMultiSelection::Selection filtersBefore = mSelectedFilters;
  const ParameterMultiSelection::Selection parametersBefore = mSelectedParameters;

  // Every section keeps the keyframe selection when it misses: only a click that hits nothing
  // at all may empty it (a later section can still be the one clicked).
  const HitTestOptions keep{.keepKeyframesOnMiss = true};
  bool hit = mVideoExpanded && HitTestAndSelect(mVideoItems, point, modifiers, button, keep);
  hit = hit ||
        (mGraphicsExpanded && HitTestAndSelect(mGraphicsItems, point, modifiers, button, keep));
  for (const auto& part : mAudioParts) {
    if (hit) {
      break;
    }
    if (part->IsClipPart() && part->IsExpanded()) {
      hit = HitTestAndSelect(part->GetItems(), point, modifiers, button, keep);
    }
  }
  if (!hit && mKeyframeSelection) {
    mKeyframeSelection->Clear();
  }
  if (!hit && button == MouseButton::kRight) {
    OpenEditMenu(point);
  }

  if (!(filtersBefore == mSelectedFilters) || !(parametersBefore == mSelectedParameters)) {
    UpdateDirectManipulation();
    Invalidate();
  }
  BroadcastMessage(mOwnStation, EffectControlsFilterSelectionChangedMessage());
  return hit;
}

bool EffectControlsListView::HitTestAndSelect(const EffectItemList& list, Point point,
                                              KeyModifiers modifiers, MouseButton button,
                                              const HitTestOptions& options) {
  for (const auto& row : list) {
    if (HitTestRow(row, point, modifiers, button)) {
      return true;
    }
  }
  if (!options.keepKeyframesOnMiss && mKeyframeSelection) {
    mKeyframeSelection->Clear();
  }
  return false;
}

bool EffectControlsListView::HitTestRow(const std::shared_ptr<EffectItem>& row, Point point,
                                        KeyModifiers modifiers, MouseButton button) {
  if (!row->IsShown() || row->IsSetAside()) {
    return false;
  }
  if (row->IsFolder()) {
    if (point.y >= row->GetTop() && point.y < row->GetTop() + kFolderHitBandHeight) {
      // A group's title band is hit (nothing to select), an effect's selects it.
      if (row->IsFilter()) {
        HitFilter(row, point, modifiers, button);
      }
      return true;
    }
    if (row->IsExpanded()) {
      for (const auto& child : row->GetItems()) {
        if (HitTestRow(child, point, modifiers, button)) {
          return true;
        }
      }
    }
    return false;
  }
  if (row->IsParameter() && !row->IsGroupBegin()) {
    return HitParam(row, point, modifiers, button);
  }
  return false;
}

bool EffectControlsListView::IsMaskMultiSelectEnabled() const {
  return IsDebugFlagSet(kDebugFlagEnableMaskMultiSelect);
}

bool EffectControlsListView::HitFilter(const std::shared_ptr<EffectItem>& row, Point point,
                                       KeyModifiers modifiers, MouseButton button) {
  auto* filter = dynamic_cast<FilterItem*>(row.get());
  if (filter == nullptr) {
    return false;
  }
  if (filter->IsMask() && !IsMaskMultiSelectEnabled()) {
    // A mask is never selected together with other effects.
    ClearSelection();
    UpdateDirectManipulation();
  }
  if (IsCtrlDown(modifiers)) {
    SelectItem(row, !row->IsSelected());
  } else if (button == MouseButton::kRight) {
    if (!row->IsSelected()) {
      ClearSelection();
      SelectItem(row, true);
    }
    OpenEditMenu(point);
  } else if (IsShiftDown(modifiers) && mVideoTrackItem && mVideoTrackItem->IsGraphicsClip() &&
             !filter->IsMask()) {
    ShiftClickSelection(row);
  } else {
    ClearSelection();
    SelectItem(row, true);
  }
  return true;
}

bool EffectControlsListView::HitParam(const std::shared_ptr<EffectItem>& row, Point point,
                                      KeyModifiers modifiers, MouseButton button) {
  if (!GetParameterNameRect(*row).Contains(point)) {
    return false;
  }
  if (button == MouseButton::kRight) {
    return false;
  }
  auto* parameter = dynamic_cast<ParameterControl*>(row.get());
  if (parameter != nullptr && parameter->GetParam() && parameter->IsTimeVarying() &&
      mKeyframeSelection) {
    if (!IsCtrlDown(modifiers) && !IsShiftDown(modifiers)) {
      mKeyframeSelection->Clear();
    }
    mKeyframeSelection->AddAllItems(parameter->GetTrackItem(), parameter->GetComponent(),
                                    parameter->GetParam());
    BroadcastMessage(mKeyframeStation, EffectControlsBecomeTargetMessage());
  }
  if (!row->IsParamEnabled()) {
    return true;
  }
  if (IsCtrlDown(modifiers)) {
    SelectParameter(row, !row->IsSelected());
  } else if (IsShiftDown(modifiers)) {
    SelectParameter(row, true);
  } else {
    ClearSelection();
    SelectParameter(row, true);
  }
  return true;
}

void EffectControlsListView::OpenEditMenu(Point point) {
  Invalidate();
  BroadcastRefreshKeyframes();
  TrackPopupMenu(kEditMenuName, point);
}

// --- Mouse ---

void EffectControlsListView::LeftButtonDownSelf(Point point, KeyModifiers modifiers) {
  if (IsShown()) {
    CaptureMouse();
  }
  if (IsInSeparatorZone(point)) {
    mSeparatorDragging = true;
    mSeparatorGrabOffset = GetLocalBounds().right - point.x;
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return;
  }
  mPressPoint = point;
  if (!ClickedItem(point, modifiers, MouseButton::kLeft)) {
    ClearSelection();
    UpdateDirectManipulation();
  }
  Invalidate();
  BroadcastRefreshKeyframes();
}

void EffectControlsListView::LeftButtonUpSelf(Point /*point*/, KeyModifiers /*modifiers*/) {
  ReleaseMouse();
  mSeparatorDragging = false;
  mPressPoint.reset();
}

void EffectControlsListView::MouseCaptureLostSelf() {
  // Nothing of a click or a separator drag was committed: forget it.
  mSeparatorDragging = false;
  mPressPoint.reset();
}

void EffectControlsListView::RightButtonDownSelf(Point point, KeyModifiers modifiers) {
  ClickedItem(point, modifiers, MouseButton::kRight);
  Invalidate();
  BroadcastRefreshKeyframes();
}

bool EffectControlsListView::SetCursorSelf(Point point, KeyModifiers /*modifiers*/) {
  if (mSeparatorDragging || (IsInSeparatorZone(point) && !HitTestCustomUIRectangles(point))) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    return true;
  }
  return false;
}

void EffectControlsListView::MouseMoveSelf(Point point, KeyModifiers /*modifiers*/) {
  if (!HasMouseCapture()) {
    mSeparatorHovering = IsInSeparatorZone(point) && !HitTestCustomUIRectangles(point);
    SetCurrentCursor(mSeparatorHovering ? Cursor::kSplitterHorizontal : Cursor::kOSArrow);
    return;
  }
  if (mSeparatorDragging) {
    SetCurrentCursor(Cursor::kSplitterHorizontal);
    BroadcastMessage(mOwnStation, EffectControlsListSeparatorMoved(point));
    return;
  }
  if (!mPressPoint || (std::abs(point.x - mPressPoint->x) <= kDragThreshold &&
                       std::abs(point.y - mPressPoint->y) <= kDragThreshold)) {
    return;
  }
  const Point pressed = *mPressPoint;
  mPressPoint.reset();
  if (GetLocalBounds().Contains(point)) {
    DragSelection(pressed);
  }
}

void EffectControlsListView::DragSelection(Point point) {
  // What moves is the row the press grabbed, wherever the pointer went since.
  const std::shared_ptr<EffectItem> row = FindItemFromPoint(point);
  auto* filter = dynamic_cast<FilterItem*>(row.get());
  if (filter == nullptr) {
    return;
  }
  mDragAudioPart = FindAudioPartInfo(*row);
  const ComponentRef& component = filter->Component();
  const bool movable = !IsReadOnlyEffectContainer() && !filter->IsReadOnly() && component &&
                       !component->IsIntrinsic() && !component->IsArchived();
  SetCurrentCursor(movable ? Cursor::kFist : Cursor::kFistNo);
  ReleaseMouse();
  // Moving effects by drag and drop builds on this; an immovable selection never starts one.
}

// --- Direct manipulation ---

Project* EffectControlsListView::GetTargetProject() const {
  if (mTarget.masterClip) {
    return mTarget.masterClip->GetProject();
  }
  return mTarget.sequence ? mTarget.sequence->GetProject() : nullptr;
}

DirectManipulationManager* EffectControlsListView::GetDirectManipulationManager() const {
  Project* project = GetTargetProject();
  return project != nullptr ? &project->GetDirectManipulationManager() : nullptr;
}

ComponentRef EffectControlsListView::GetDirectManipulationComponent() const {
  const auto components = mSelectedParameters.GetComponents();
  return components.empty() ? nullptr : components.front();
}

void EffectControlsListView::UpdateDirectManipulation() {
  DirectManipulationManager* manager = GetDirectManipulationManager();
  if (manager == nullptr) {
    return;
  }
  // The change we make must not come back to us as a pick.
  RemoveListener(kDirectManipulationStation, *this);
  const std::vector<ComponentRef> selected =
      GetSelectedComponentsWithOptions({.includeMasks = true, .includeParameterOwners = true});
  ComponentRef chosen;
  TrackItemRef trackItem;
  if (!mSelectedFilters.IsEmpty()) {
    const bool allHaveControls =
        std::all_of(selected.begin(), selected.end(), [](const ComponentRef& c) {
          return c && DirectManipulationManager::HasOnScreenControls(*c);
        });
    if (allHaveControls && !selected.empty()) {
      chosen = selected.front();
      trackItem = mSelectedFilters.At(0).trackItem;
    }
  } else if (ComponentRef owner = GetDirectManipulationComponent();
             owner && DirectManipulationManager::HasOnScreenControls(*owner)) {
    chosen = owner;
    trackItem = mSelectedParameters.At(0).trackItem;
  }
  if (chosen && manager->IsActive(chosen.get(), trackItem.get()) && !manager->AreControlsShown()) {
    manager->ToggleDirectManipulationFilter(chosen, trackItem);
  } else {
    manager->SetDirectManipulationFilter(chosen, trackItem);
  }
  AddListener(kDirectManipulationStation, *this);
}

void EffectControlsListView::SelectDMFilterItem(const ComponentRef& component) {
  if (!component) {
    return;
  }
  ClearSelection();
  if (const auto row = FindFilterRow(component.get(), nullptr)) {
    SelectItem(row, true);
  }
  BroadcastMessage(mOwnStation, EffectControlsFilterSelectionChangedMessage());
  Invalidate();
}
