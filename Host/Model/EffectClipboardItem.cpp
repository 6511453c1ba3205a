#include "Host/Model/EffectClipboardItem.h"

#include <utility>

#include "Host/Model/Component.h"
#include "Host/Model/TrackItem.h"

EffectClipboardItem::EffectClipboardItem(std::vector<ComponentRef> effects,
                                         std::vector<ComponentRef> masks,
                                         TrackItemRef sourceTrackItem)
    : mEffects(std::move(effects)), mMasks(std::move(masks)), mSource(std::move(sourceTrackItem)) {}

EffectClipboardItem::~EffectClipboardItem() = default;
