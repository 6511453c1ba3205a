#include "Host/Model/Component.h"

#include <set>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/ModelMessages.h"

ComponentRef Component::Create(std::string matchName, std::string effectName, MediaType mediaType,
                               bool intrinsic) {
  return ComponentRef(
      new Component(std::move(matchName), std::move(effectName), mediaType, intrinsic));
}

Component::Component(std::string matchName, std::string effectName, MediaType mediaType,
                     bool intrinsic)
    : ModelObject("Component"),
      mMatchName(std::move(matchName)),
      mEffectName(std::move(effectName)),
      mMediaType(mediaType),
      mIntrinsic(intrinsic) {}

Component::~Component() {
  for (const ComponentParamRef& param : mParams) {
    if (param->GetComponent() == this) {
      param->SetComponent(nullptr);
    }
  }
  for (const ComponentRef& mask : mMasks) {
    if (mask->mMaskOwner == this) {
      mask->mMaskOwner = nullptr;
    }
  }
}

ComponentRef Component::Clone() const {
  ComponentRef copy = Create(mMatchName, mEffectName, mMediaType, mIntrinsic);
  copy->mInstanceName = mInstanceName;
  copy->mRole = mRole;
  copy->mArchived = mArchived;
  copy->mArchivedType = mArchivedType;
  copy->mBypass = mBypass;
  copy->mOffline = mOffline;
  copy->mHasSetupDialog = mHasSetupDialog;
  copy->mCanTakeMasks = mCanTakeMasks;
  copy->mPresets = mPresets;
  copy->mCurrentPreset = mCurrentPreset;
  copy->mExpansion = mExpansion;
  copy->mExpansion.SetStation({});
  for (const ComponentParamRef& param : mParams) {
    copy->AddParam(param->Clone());
  }
  for (const ComponentRef& mask : mMasks) {
    ComponentRef maskCopy = mask->Clone();
    maskCopy->mMaskOwner = copy.get();
    copy->mMasks.push_back(std::move(maskCopy));
  }
  return copy;
}

const std::string& Component::GetDisplayName() const {
  return mInstanceName.empty() ? mEffectName : mInstanceName;
}

void Component::SetInstanceName(std::string name) {
  if (name == mInstanceName) {
    return;
  }
  mInstanceName = std::move(name);
  Broadcast(ComponentInstanceNameChangedMessage(ComponentRef(this)));
}

void Component::SetArchived(bool archived, int archivedType) {
  if (archived == mArchived && archivedType == mArchivedType) {
    return;
  }
  mArchived = archived;
  mArchivedType = archivedType;
  NotifyChanged();
}

void Component::SetBypass(bool bypass) {
  if (bypass != mBypass) {
    mBypass = bypass;
    NotifyChanged();
  }
}

void Component::SetOffline(bool offline) {
  if (offline != mOffline) {
    mOffline = offline;
    NotifyChanged();
  }
}

void Component::SetPresets(std::vector<ComponentPreset> presets) {
  if (presets == mPresets) {
    return;
  }
  mPresets = std::move(presets);
  if (mCurrentPreset >= static_cast<int>(mPresets.size())) {
    mCurrentPreset = -1;
  }
  NotifyChanged();
}

bool Component::SetCurrentPreset(int index) {
  if (index < -1 || index >= static_cast<int>(mPresets.size())) {
    return false;
  }
  if (index != mCurrentPreset) {
    mCurrentPreset = index;
    NotifyChanged();
  }
  return true;
}

ComponentParamRef Component::GetParam(std::size_t position) const {
  return position < mParams.size() ? mParams[position] : nullptr;
}

std::size_t Component::GetParamIndex(const ComponentParam* param) const {
  for (std::size_t i = 0; i < mParams.size(); ++i) {
    if (mParams[i].get() == param) {
      return i + 1;
    }
  }
  return 0;
}

ComponentParamRef Component::FindParam(std::string_view name) const {
  for (const ComponentParamRef& param : mParams) {
    if (param->GetName() == name) {
      return param;
    }
  }
  return nullptr;
}

void Component::AddParam(const ComponentParamRef& param) {
  if (!HOST_VERIFY(param && param->GetComponent() == nullptr, "Invalid ComponentParam")) {
    return;
  }
  param->SetComponent(this);
  mParams.push_back(param);
}

void Component::SetMasks(std::vector<ComponentRef> masks) {
  std::set<const Component*> seen;
  for (const ComponentRef& mask : masks) {
    // A mask this effect owns already stays; any other must be free (in no chain, no owner).
    if (!HOST_VERIFY(mask && mask.get() != this &&
                         (mask->mMaskOwner == this ||
                          (mask->mMaskOwner == nullptr && mask->mChain == nullptr)) &&
                         seen.insert(mask.get()).second,
                     "Invalid mask list")) {
      return;
    }
  }
  if (!HOST_VERIFY(mCanTakeMasks || masks.empty(), "This effect takes no masks")) {
    return;
  }
  if (masks == mMasks) {
    return;
  }
  for (const ComponentRef& mask : mMasks) {
    if (!seen.contains(mask.get())) {
      mask->mMaskOwner = nullptr;
    }
  }
  for (const ComponentRef& mask : masks) {
    mask->mMaskOwner = this;
    mask->mRole = ComponentRole::Mask;
  }
  mMasks = std::move(masks);
  NotifyChanged();
  if (ComponentChain* chain = GetChain()) {
    chain->NotifyMasksChanged(ComponentRef(this));
  }
}

ComponentChain* Component::GetChain() const {
  return mMaskOwner ? mMaskOwner->GetChain() : mChain;
}

TrackItem* Component::GetTrackItem() const {
  const ComponentChain* chain = GetChain();
  return chain ? chain->GetTrackItem() : nullptr;
}

Project* Component::GetProject() const {
  const ComponentChain* chain = GetChain();
  return chain ? chain->GetProject() : nullptr;
}

void Component::FollowParamChange(const ComponentParam& param) {
  if (param.GetDisablesWhenOn().empty()) {
    return;
  }
  const auto* on = std::get_if<bool>(&param.GetConstantValue());
  for (const std::string& name : param.GetDisablesWhenOn()) {
    if (ComponentParamRef dependent = FindParam(name); dependent && dependent.get() != &param) {
      dependent->SetEnabled(!(on && *on));
    }
  }
}

void Component::NotifyChanged() {
  Broadcast(ComponentChangedMessage(ComponentRef(this)));
}

void Component::Broadcast(const Message& message) const {
  BroadcastMessage(GetStation(), message);
  if (ComponentChain* chain = GetChain()) {
    const StationName owner = chain->GetOwnerStation();
    if (!owner.empty()) {
      BroadcastMessage(owner, message);
    }
    chain->NotifyValuesChanged();
  }
}
