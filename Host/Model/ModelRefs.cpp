#include "Host/Model/ModelRefs.h"

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

#define HOST_MODEL_DEFINE_REF_COUNTING(Class)                      \
  void intrusive_ptr_add_ref(const Class* object) {                \
    intrusive_ptr_add_ref(static_cast<const RefCounted*>(object)); \
  }                                                                \
  void intrusive_ptr_release(const Class* object) {                \
    intrusive_ptr_release(static_cast<const RefCounted*>(object)); \
  }
HOST_MODEL_DEFINE_REF_COUNTING(Project)
HOST_MODEL_DEFINE_REF_COUNTING(Sequence)
HOST_MODEL_DEFINE_REF_COUNTING(Track)
HOST_MODEL_DEFINE_REF_COUNTING(TrackItem)
HOST_MODEL_DEFINE_REF_COUNTING(MasterClip)
HOST_MODEL_DEFINE_REF_COUNTING(Media)
HOST_MODEL_DEFINE_REF_COUNTING(ComponentChain)
HOST_MODEL_DEFINE_REF_COUNTING(Component)
HOST_MODEL_DEFINE_REF_COUNTING(ComponentParam)
