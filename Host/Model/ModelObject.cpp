#include "Host/Model/ModelObject.h"

#include <atomic>

namespace {

std::atomic<ObjectID> gLastObjectID{0};
std::atomic<std::uint64_t> gLastStationSerial{0};

}  // namespace

ModelObject::ModelObject(std::string_view kind)
    : mID(AllocateObjectID()),
      mStation("Model." + std::string(kind) + "." + std::to_string(++gLastStationSerial)) {}

ModelObject::~ModelObject() {
  DisposeStation(mStation);
}

void ModelObject::SetID(ObjectID id) {
  mID = id;
  ReserveObjectIDsThrough(id);
}

ObjectID ModelObject::AllocateObjectID() {
  return ++gLastObjectID;
}

void ModelObject::ReserveObjectIDsThrough(ObjectID id) {
  ObjectID last = gLastObjectID.load();
  while (last < id && !gLastObjectID.compare_exchange_weak(last, id)) {
  }
}
