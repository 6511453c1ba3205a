#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "Host/Model/EffectClipboardItem.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

class ClipboardItem;
class Component;
class TrackItem;

// Undoable action names of effect pastes.
inline constexpr const char* kPasteFiltersActionName = "MZ.ComponentChainActions.PasteFilters";
inline constexpr const char* kPasteMasksActionName = "MZ.EffectControls.AddMask";

// The effects (components) the user selected in the effect list, shared with the other panels
// through the host, and the clipboard operations on them.
class FilterMultiSelection {
 public:
  // One selected effect on one track item (null in master-clip mode). A mask is a subsidiary
  // entry: `parent` is the effect it belongs to (null for effects).
  struct Entry {
    ComponentRef component;
    TrackItemRef trackItem;
    ComponentRef parent;
    bool IsSubsidiary() const { return parent != nullptr; }
  };

  // The same effect: the same component object. (A component is never copied into place, so
  // identity is sameness; the test stays one function should that change.)
  static bool IsSameComponent(const Component* a, const Component* b);

  class Selection {
   public:
    bool IsEmpty() const { return mEntries.empty(); }
    std::size_t Size() const { return mEntries.size(); }
    const Entry& At(std::size_t index) const { return mEntries.at(index); }
    const std::vector<Entry>& GetEntries() const { return mEntries; }

    // Index of the entry of that effect on that track item, or -1.
    int Find(const Component* component, const TrackItem* trackItem) const;
    bool Contains(const Component* component, const TrackItem* trackItem) const {
      return Find(component, trackItem) >= 0;
    }
    // Appends an entry (a mask gets its owner as parent). False when it is there already.
    bool Add(const ComponentRef& component, const TrackItemRef& trackItem);
    bool Remove(const Component* component, const TrackItem* trackItem);
    void Clear() { mEntries.clear(); }
    bool ContainsSubsidiaryItems() const;
    std::vector<ComponentRef> GetComponents() const;
    // Same entries in the same order.
    friend bool operator==(const Selection& a, const Selection& b);

    // The clipboard item for the selection: copies of the selected effects (with their masks)
    // and of the selected masks; the source track item is the first entry's. nullptr when empty.
    std::shared_ptr<const EffectClipboardItem> CreateClipboardItem() const;
    // Puts it on the project's clipboard. False when the selection is empty.
    bool Copy(Project& project) const;

    // Whether Paste would add or change something in `targets` (the chains of the shown track
    // items, or a master clip's chain).
    bool QueryPaste(const ClipboardItem* item, const std::vector<ComponentChainRef>& targets) const;
    // Pastes the effects of an effect clipboard item, as one undo step named
    // kPasteFiltersActionName: each applied effect is copied into the first target chain of its
    // media type, after the last selected effect of that chain (at its end when none is
    // selected); an intrinsic effect gives its parameter values to the chain's intrinsic of the
    // same match name (a chain carries each intrinsic once). Read-only chains are skipped.
    // Masks on their own are not pasted here (see PasteMasks).
    EditStatus Paste(const ClipboardItem& item,
                     const std::vector<ComponentChainRef>& targets) const;

   private:
    std::vector<Entry> mEntries;
  };

  // Appends copies of the item's masks to `effect`'s masks as one undo step (action
  // kPasteMasksActionName unless `actionName` is given), with `undoText`. InvalidArgument when the
  // effect cannot take masks; NoChange when the item holds none.
  static EditStatus PasteMasks(const ComponentRef& effect, const EffectClipboardItem& item,
                               std::string undoText = {},
                               std::string actionName = kPasteMasksActionName);
};
