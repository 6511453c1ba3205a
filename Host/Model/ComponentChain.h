#pragma once

#include <string_view>
#include <vector>

#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// The ordered effects (components) of a track item or of a master clip; owns them. Index 0 is
// the first effect applied to the picture or sound.
//
// Messages on GetStation(): ComponentChainStructureChangedMessage when components are added,
// removed or reordered; ComponentChainChangedMessage when a value of one of its components
// changed (parameter, bypass, name, preset).
//
// SetComponents is not undoable: it is for building, loading and the actions
// (ComponentChainActions), which record the lists before and after.
class ComponentChain : public ModelObject {
 public:
  static ComponentChainRef Create(MediaType mediaType);
  ~ComponentChain() override;

  MediaType GetMediaType() const { return mMediaType; }

  int GetCount() const { return static_cast<int>(mComponents.size()); }
  // nullptr when out of range.
  ComponentRef GetAt(int index) const;
  // -1 when the component is not in this chain.
  int GetIndexOf(const Component* component) const;
  int GetComponentIndexInChain(const Component* component) const { return GetIndexOf(component); }
  const std::vector<ComponentRef>& GetComponents() const { return mComponents; }
  ComponentRef FindByMatchName(std::string_view matchName) const;
  // Of `effects`, those a user may apply to this chain, in order: effects (not intrinsics, not
  // masks) of the chain's media type.
  std::vector<ComponentRef> ApplicableEffects(const std::vector<ComponentRef>& effects) const;
  // This chain's list with copies (Component::Clone) of `effects` before position `index`
  // (clamped to the list): what an action applying them sets. The chain is not changed.
  std::vector<ComponentRef> WithCopiesInserted(const std::vector<ComponentRef>& effects,
                                               int index) const;

  // Replaces the whole list: components that leave lose their chain, those that arrive leave the
  // chain they were in (without a message there: callers that move between chains set both) and
  // join this one. A component may appear once. One structure message describes the change.
  void SetComponents(std::vector<ComponentRef> components);
  // Building: appends / inserts one (SetComponents underneath).
  void Append(const ComponentRef& component);
  void Insert(int index, const ComponentRef& component);

  // The track item or master clip that owns the chain (at most one of them).
  TrackItem* GetTrackItem() const { return mTrackItem; }
  MasterClip* GetMasterClip() const { return mMasterClip; }
  Sequence* GetSequence() const;
  Project* GetProject() const override;
  // The owner's station (component messages go there too), empty when unowned.
  StationName GetOwnerStation() const;

  // Owners only.
  void SetOwner(TrackItem* trackItem) { mTrackItem = trackItem; }
  void SetOwner(MasterClip* masterClip) { mMasterClip = masterClip; }
  void ClearOwner();

  // Sends ComponentChainChangedMessage (components and parameters call it).
  void NotifyValuesChanged();
  // Sends a structure message for a component whose masks were added or removed.
  void NotifyMasksChanged(const ComponentRef& component);

 private:
  explicit ComponentChain(MediaType mediaType);

  MediaType mMediaType;
  std::vector<ComponentRef> mComponents;
  TrackItem* mTrackItem = nullptr;    // owner, or null; cleared when the owner lets go
  MasterClip* mMasterClip = nullptr;  // owner, or null; cleared when the owner lets go
};
