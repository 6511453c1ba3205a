#pragma once

#include <functional>
#include <optional>
#include <string>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Markers.h"
#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"

// Set on a master clip whose project is not the active one; its effects are then read only.
inline constexpr const char* kPropertyKey_FromInactiveProject = "MZ.FromInactiveProject";

// A clip of the project: a name, its media, in and out points and markers (media time), and its
// own video component chain (the effects applied to the clip itself, shown in master-clip mode).
// Owned by the project; track items refer to it.
//
// Setters are not undoable: they are for building, loading and for actions (see
// SequenceMarkerActions and the other *Actions classes), and each sends its change message.
class MasterClip : public ModelObject {
 public:
  static MasterClipRef Create(std::string name, MediaRef media);
  ~MasterClip() override;

  const std::string& GetName() const { return mName; }
  void SetName(std::string name);  // MasterClipNameChangedMessage

  const MediaRef& GetMedia() const { return mMedia; }

  std::optional<TickTime> GetInPoint() const { return mInPoint; }
  std::optional<TickTime> GetOutPoint() const { return mOutPoint; }
  // PropertiesChangedMessage with "MZ.InPoint" / "MZ.OutPoint".
  void SetInPoint(std::optional<TickTime> time);
  void SetOutPoint(std::optional<TickTime> time);

  const Markers& GetMarkers() const { return mMarkers; }
  void SetMarkers(Markers markers);  // MarkersChangedMessage
  // Edits the markers in place; MarkersChangedMessage when `change` returns true (it changed
  // something). Used by MarkerActions, whose steps keep only the marker they change.
  void ChangeMarkers(const std::function<bool(Markers&)>& change);

  const ComponentChainRef& GetVideoChain() const { return mVideoChain; }

  // A graphics clip (its effects are layers); a master graphic (a graphics clip used as a
  // source of its own); a motion-graphics template.
  bool IsGraphic() const { return mGraphic; }
  bool IsMasterGraphic() const { return mMasterGraphic; }
  bool IsTemplate() const { return mTemplate; }
  void SetGraphicsFlags(bool graphic, bool masterGraphic, bool isTemplate);

  bool IsReadOnly() const { return mReadOnly; }
  void SetReadOnly(bool readOnly);  // ReadOnlyStateChangedMessage

  // Properties of the clip (e.g. kPropertyKey_FromInactiveProject); writers send
  // PropertiesChangedMessage themselves through NotifyPropertiesChanged.
  PropertyList& GetProperties() { return mProperties; }
  const PropertyList& GetProperties() const { return mProperties; }
  void NotifyPropertiesChanged(std::vector<std::string> keys);

  Project* GetProject() const override { return mProject; }
  // Project only.
  void SetProject(Project* project) { mProject = project; }

 private:
  MasterClip(std::string name, MediaRef media);

  std::string mName;
  MediaRef mMedia;
  std::optional<TickTime> mInPoint;
  std::optional<TickTime> mOutPoint;
  Markers mMarkers;
  ComponentChainRef mVideoChain;
  bool mGraphic = false;
  bool mMasterGraphic = false;
  bool mTemplate = false;
  bool mReadOnly = false;
  PropertyList mProperties;
  Project* mProject = nullptr;  // owner; cleared when the project lets go
};
