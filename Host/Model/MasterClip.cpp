#include "Host/Model/MasterClip.h"

#include <utility>

#include "Host/Model/ComponentChain.h"
#include "Host/Model/ModelMessages.h"

MasterClipRef MasterClip::Create(std::string name, MediaRef media) {
  return MasterClipRef(new MasterClip(std::move(name), std::move(media)));
}

MasterClip::MasterClip(std::string name, MediaRef media)
    : ModelObject("MasterClip"),
      mName(std::move(name)),
      mMedia(std::move(media)),
      mVideoChain(ComponentChain::Create(MediaType::Video)) {
  mVideoChain->SetOwner(this);
  mProperties.SetStation(GetStation());
}

MasterClip::~MasterClip() {
  mVideoChain->ClearOwner();
}

void MasterClip::SetName(std::string name) {
  if (name == mName) {
    return;
  }
  mName = std::move(name);
  BroadcastMessage(GetStation(), MasterClipNameChangedMessage(MasterClipRef(this)));
}

void MasterClip::SetInPoint(std::optional<TickTime> time) {
  if (time == mInPoint) {
    return;
  }
  mInPoint = time;
  NotifyPropertiesChanged({kPropertyKey_InPoint});
}

void MasterClip::SetOutPoint(std::optional<TickTime> time) {
  if (time == mOutPoint) {
    return;
  }
  mOutPoint = time;
  NotifyPropertiesChanged({kPropertyKey_OutPoint});
}

void MasterClip::ChangeMarkers(const std::function<bool(Markers&)>& change) {
  if (change(mMarkers)) {
    BroadcastMessage(GetStation(), MarkersChangedMessage(GetID()));
  }
}

void MasterClip::SetMarkers(Markers markers) {
  if (markers == mMarkers) {
    return;
  }
  mMarkers = std::move(markers);
  BroadcastMessage(GetStation(), MarkersChangedMessage(GetID()));
}

void MasterClip::SetGraphicsFlags(bool graphic, bool masterGraphic, bool isTemplate) {
  mGraphic = graphic;
  mMasterGraphic = masterGraphic;
  mTemplate = isTemplate;
  BroadcastMessage(GetStation(), MasterClipClipChangedMessage(MasterClipRef(this)));
}

void MasterClip::SetReadOnly(bool readOnly) {
  if (readOnly == mReadOnly) {
    return;
  }
  mReadOnly = readOnly;
  BroadcastMessage(GetStation(), ReadOnlyStateChangedMessage(GetID(), readOnly));
}

void MasterClip::NotifyPropertiesChanged(std::vector<std::string> keys) {
  BroadcastMessage(GetStation(), PropertiesChangedMessage(GetID(), std::move(keys)));
}
