#pragma once

#include <string_view>
#include <vector>

#include "Host/Model/ClipboardItem.h"
#include "Host/Model/ModelRefs.h"

// Copied effects and masks. The components are private copies (Component::Clone) that belong to
// no chain and are never put into one: a paste clones them again, so one copy can be pasted
// any number of times. Effects keep their own masks; `masks` holds masks copied on their own
// (to be pasted into another effect). The source track item is null for a master clip's effects.
class EffectClipboardItem : public ClipboardItem {
 public:
  static constexpr std::string_view kKind = "effects";

  EffectClipboardItem(std::vector<ComponentRef> effects, std::vector<ComponentRef> masks,
                      TrackItemRef sourceTrackItem);
  ~EffectClipboardItem() override;

  std::string_view GetKind() const override { return kKind; }
  const std::vector<ComponentRef>& GetEffects() const { return mEffects; }
  const std::vector<ComponentRef>& GetMasks() const { return mMasks; }
  bool HasMasks() const { return !mMasks.empty(); }
  const TrackItemRef& GetSourceTrackItem() const { return mSource; }

 private:
  std::vector<ComponentRef> mEffects;
  std::vector<ComponentRef> mMasks;
  TrackItemRef mSource;
};
