#pragma once

#include <string>
#include <string_view>

#include "Host/Messaging/Station.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/RefCounted.h"

class Project;

// Base of every project model object: an intrusive reference count, a stable integer id (project
// files and automation refer to objects by it) and the name of the object's notification station.
//
// Ids are handed out from one process-wide counter, so objects of one process never share an id;
// a project loader may give an object the id its file recorded (SetID) after reserving the ids it
// will use (ReserveObjectIDsThrough). The station name is fixed at construction, unique in the
// process, and disposed with the object; it is not registered until someone listens or a message
// goes out, so objects nobody watches cost no station.
class ModelObject : public RefCounted {
 public:
  ObjectID GetID() const { return mID; }
  // Loaders only. The caller keeps ids unique within its project.
  void SetID(ObjectID id);

  const StationName& GetStation() const { return mStation; }

  // The project that owns this object through its owners, or nullptr while the object is not
  // part of one (effect templates, clipboard copies, objects being built or removed by an edit).
  virtual Project* GetProject() const = 0;

  static ObjectID AllocateObjectID();
  // Later AllocateObjectID calls return ids above `id`.
  static void ReserveObjectIDsThrough(ObjectID id);

 protected:
  // `kind` names the station: "Model.<kind>.<serial>".
  explicit ModelObject(std::string_view kind);
  ~ModelObject() override;

 private:
  ObjectID mID;
  StationName mStation;
};
