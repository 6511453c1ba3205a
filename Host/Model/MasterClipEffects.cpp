#include "Host/Model/MasterClipEffects.h"

#include <algorithm>
#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentChainActions.h"
#include "Host/Model/EditPermissions.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Project.h"

bool MasterClipEffects::QueryApplyEffects(const MasterClipRef& clip,
                                          const std::vector<ComponentRef>& effects) {
  return clip && !EditPermissions::IsReadOnly(*clip) &&
         !clip->GetVideoChain()->ApplicableEffects(effects).empty();
}

EditStatus MasterClipEffects::ApplyEffects(const MasterClipRef& clip,
                                           const std::vector<ComponentRef>& effects) {
  if (!HOST_VERIFY(clip != nullptr, "Invalid MasterClip")) {
    return EditStatus::InvalidArgument;
  }
  return InsertEffects(clip, effects, clip->GetVideoChain()->GetCount());
}

EditStatus MasterClipEffects::InsertEffects(const MasterClipRef& clip,
                                            const std::vector<ComponentRef>& effects, int index) {
  if (!HOST_VERIFY(clip != nullptr, "Invalid MasterClip")) {
    return EditStatus::InvalidArgument;
  }
  if (EditPermissions::IsReadOnly(*clip)) {
    return EditStatus::ReadOnly;
  }
  const ComponentChainRef& chain = clip->GetVideoChain();
  const std::vector<ComponentRef> applicable = chain->ApplicableEffects(effects);
  if (applicable.empty()) {
    return EditStatus::InvalidArgument;
  }
  index = std::clamp(index, 0, chain->GetCount());
  std::vector<ComponentRef> after = chain->WithCopiesInserted(applicable, index);
  const char* name =
      index == static_cast<int>(chain->GetComponents().size()) ? kApplyEffects : kInsertEffects;
  return ExecuteModelAction(clip->GetProject(), ComponentChainActions::CreateSetComponentsAction(
                                                    chain, name, std::move(after)));
}
