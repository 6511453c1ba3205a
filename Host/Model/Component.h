#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParamValue.h"

class Message;

// A named set of parameter values. Preset 0 of every effect holds its default values; a value
// missing from a preset means the parameter's default.
struct ComponentPreset {
  std::string name;
  std::vector<std::pair<std::size_t, ParamValue>> values;  // (parameter position, value)
  friend bool operator==(const ComponentPreset&, const ComponentPreset&) = default;
};

// Component kinds that the effect list treats specially.
enum class ComponentRole : int {
  Effect = 0,
  TimeRemapping = 1,  // intrinsic; may be hidden by the list
  Mask = 2,           // embedded in another effect
  Graphics = 3,       // a layer of a graphics clip
  Capsule = 4,        // a graphics clip's template wrapper
};

// One effect: intrinsic (every clip carries it: motion, opacity, volume, ...) or applied by the
// user; its parameters in order; its presets; its masks (embedded components); its on/off state.
// Owned by a component chain, or by the effect it is a mask of.
//
// Names: the match name identifies the effect kind ("XO.KRVN GaussianBlur"); the effect name is
// what the catalogue calls it; the instance name is what the user renamed it to (empty: not
// renamed); the display name is the instance name when set, else the effect name.
//
// Messages, on the component's station and on its owner's (track item or master clip) station:
// ComponentChangedMessage (bypass, offline, preset, masks) and
// ComponentInstanceNameChangedMessage; each also sends ComponentChainChangedMessage on its chain.
//
// Setters are not undoable: they are for building, loading and the actions (ComponentActions,
// ComponentChainActions).
class Component : public ModelObject {
 public:
  static ComponentRef Create(std::string matchName, std::string effectName, MediaType mediaType,
                             bool intrinsic);
  ~Component() override;

  // A deep copy with new ids: parameters with their values and keyframes, masks, presets, names,
  // bypass and expansion properties; not in any chain.
  ComponentRef Clone() const;

  const std::string& GetMatchName() const { return mMatchName; }
  const std::string& GetEffectName() const { return mEffectName; }
  const std::string& GetInstanceName() const { return mInstanceName; }
  const std::string& GetDisplayName() const;
  void SetInstanceName(std::string name);

  MediaType GetMediaType() const { return mMediaType; }
  bool IsIntrinsic() const { return mIntrinsic; }
  ComponentRole GetRole() const { return mRole; }
  void SetRole(ComponentRole role) { mRole = role; }
  bool IsTimeRemapping() const { return mRole == ComponentRole::TimeRemapping; }
  bool IsGraphicsComponent() const { return mRole == ComponentRole::Graphics; }
  bool IsCapsule() const { return mRole == ComponentRole::Capsule; }

  // An archived component is kept for compatibility; archived type 1 counts as enabled.
  bool IsArchived() const { return mArchived; }
  int GetArchivedType() const { return mArchivedType; }
  void SetArchived(bool archived, int archivedType);

  bool IsBypassed() const { return mBypass; }
  void SetBypass(bool bypass);
  // Enabled as the list shows it: archived components by their type, others by bypass.
  bool IsEnabled() const { return mArchived ? mArchivedType == 1 : !mBypass; }

  bool IsOffline() const { return mOffline; }
  void SetOffline(bool offline);

  bool HasSetupDialog() const { return mHasSetupDialog; }
  void SetHasSetupDialog(bool has) { mHasSetupDialog = has; }

  // Presets: index 0 holds the defaults. The current preset is -1 when none was chosen.
  const std::vector<ComponentPreset>& GetPresets() const { return mPresets; }
  std::size_t GetPresetCount() const { return mPresets.size(); }
  void SetPresets(std::vector<ComponentPreset> presets);
  int GetCurrentPreset() const { return mCurrentPreset; }
  bool SetCurrentPreset(int index);  // -1 or a valid index

  // Parameters in order (group begin and end parameters included).
  std::size_t GetParamCount() const { return mParams.size(); }
  ComponentParamRef GetParam(std::size_t position) const;
  const std::vector<ComponentParamRef>& GetParams() const { return mParams; }
  // Position + 1 of the parameter; 0 when it is not one of this component's.
  std::size_t GetParamIndex(const ComponentParam* param) const;
  ComponentParamRef FindParam(std::string_view name) const;
  // Building: the component adopts the parameter.
  void AddParam(const ComponentParamRef& param);

  // Masks: components embedded in this one, in order. Only components that take masks have them.
  bool CanTakeMasks() const { return mCanTakeMasks; }
  void SetCanTakeMasks(bool can) { mCanTakeMasks = can; }
  const std::vector<ComponentRef>& GetMasks() const { return mMasks; }
  // Replaces the list, adopting the new masks (ComponentChangedMessage and a structure message on
  // the chain, as the list shows masks as rows).
  void SetMasks(std::vector<ComponentRef> masks);
  bool IsMask() const { return mRole == ComponentRole::Mask; }
  // The effect this mask belongs to, or nullptr.
  Component* GetMaskOwner() const { return mMaskOwner; }

  // Row state kept with the effect ("ECP.Group.Expanded" and the like). Not undoable, no message.
  PropertyList& GetExpansionProperties() { return mExpansion; }
  const PropertyList& GetExpansionProperties() const { return mExpansion; }

  // The chain holding this component (for a mask: its owner's chain), or nullptr.
  ComponentChain* GetChain() const;
  TrackItem* GetTrackItem() const;
  Project* GetProject() const override;

  // Chains only.
  void SetChain(ComponentChain* chain) { mChain = chain; }

  // Sends ComponentChangedMessage (setters call it; parameters that change their enabled or
  // visible state do too).
  void NotifyChanged();
  // Parameters call it after a change: keeps the parameters that depend on it up to date.
  void FollowParamChange(const ComponentParam& param);

 private:
  Component(std::string matchName, std::string effectName, MediaType mediaType, bool intrinsic);
  void Broadcast(const Message& message) const;

  std::string mMatchName;
  std::string mEffectName;
  std::string mInstanceName;
  MediaType mMediaType;
  bool mIntrinsic;
  ComponentRole mRole = ComponentRole::Effect;
  bool mArchived = false;
  int mArchivedType = 0;
  bool mBypass = false;
  bool mOffline = false;
  bool mHasSetupDialog = false;
  bool mCanTakeMasks = false;
  std::vector<ComponentPreset> mPresets;
  int mCurrentPreset = -1;
  std::vector<ComponentParamRef> mParams;
  std::vector<ComponentRef> mMasks;
  PropertyList mExpansion;
  ComponentChain* mChain = nullptr;  // owner; cleared when the chain lets go
  Component* mMaskOwner = nullptr;   // owner of a mask; cleared when it lets go
};
