#include "Host/Model/EditPermissions.h"

#include "Host/Model/ComponentChain.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/TrackItem.h"

bool EditPermissions::IsReadOnly(const Sequence& sequence) {
  const Project* project = sequence.GetProject();
  return sequence.IsReadOnly() || (project && project->IsReadOnly());
}

bool EditPermissions::IsReadOnly(const TrackItem& item) {
  if (const Sequence* sequence = item.GetSequence()) {
    return IsReadOnly(*sequence);
  }
  const Project* project = item.GetProject();
  return project && project->IsReadOnly();
}

bool EditPermissions::IsReadOnly(const MasterClip& clip) {
  const Project* project = clip.GetProject();
  return clip.IsReadOnly() ||
         clip.GetProperties().GetBool(kPropertyKey_FromInactiveProject, false) ||
         (project && project->IsReadOnly());
}

bool EditPermissions::IsReadOnly(const ComponentChain& chain) {
  if (const TrackItem* item = chain.GetTrackItem()) {
    return IsReadOnly(*item);
  }
  if (const MasterClip* clip = chain.GetMasterClip()) {
    return IsReadOnly(*clip);
  }
  return false;
}
