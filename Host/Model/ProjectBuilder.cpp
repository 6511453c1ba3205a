#include "Host/Model/ProjectBuilder.h"

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

const EffectCatalogue& Catalogue() {
  return EffectCatalogue::Standard();
}

}  // namespace

ProjectBuilder::ProjectBuilder(std::string projectName, Ids ids) : mIds(ids) {
  mProject = Project::Create(std::move(projectName));
  Number(mProject);
}

template <class Ref>
const Ref& ProjectBuilder::Number(const Ref& object) {
  if (mIds == Ids::Sequential) {
    object->SetID(++mLastID);
  }
  return object;
}

const ComponentRef& ProjectBuilder::NumberComponent(const ComponentRef& component) {
  Number(component);
  for (const ComponentParamRef& param : component->GetParams()) {
    Number(param);
  }
  for (const ComponentRef& mask : component->GetMasks()) {
    NumberComponent(mask);
  }
  return component;
}

MediaRef ProjectBuilder::AddMedia(std::string name, TickTime duration, Streams streams) {
  return Number(Media::Create(std::move(name), duration, streams != Streams::Audio,
                              streams != Streams::Video));
}

std::vector<MasterClipRef> ProjectBuilder::AddMasterClips(
    std::initializer_list<std::pair<std::string, MediaRef>> clips) {
  std::vector<MasterClipRef> made;
  for (const auto& [name, media] : clips) {
    made.push_back(Number(MasterClip::Create(name, media)));
  }
  for (const MasterClipRef& clip : made) {
    Number(clip->GetVideoChain());
    mProject->AddMasterClip(clip);
  }
  return made;
}

MasterClipRef ProjectBuilder::AddMasterClip(std::string name, MediaRef media) {
  return AddMasterClips({{std::move(name), std::move(media)}}).front();
}

SequenceRef ProjectBuilder::AddSequence(std::string name, FrameRate videoRate,
                                        FrameRate audioRate) {
  SequenceRef sequence = Number(Sequence::Create(std::move(name), videoRate, audioRate));
  mProject->AddSequence(sequence);
  if (mProject->GetActiveSequence() == nullptr) {
    mProject->SetActiveSequence(sequence);
  }
  return sequence;
}

TrackRef ProjectBuilder::AddTrack(const SequenceRef& sequence, MediaType mediaType,
                                  std::string name) {
  TrackRef track = Number(Track::Create(mediaType, std::move(name)));
  sequence->AddTrack(track);
  return track;
}

TrackItemRef ProjectBuilder::AddClip(const TrackRef& track, const MasterClipRef& masterClip,
                                     const ClipPlacement& placement) {
  const MediaType mediaType = track->GetMediaType();
  TrackItemRef item = Number(TrackItem::CreateClip(mediaType, placement.start, placement.end,
                                                   masterClip, placement.mediaIn));
  if (placement.id != 0) {
    item->SetID(placement.id);
  }
  const ComponentChainRef& chain = Number(item->GetComponentChain());
  if (placement.withIntrinsics) {
    for (const ComponentRef& intrinsic : Catalogue().CreateIntrinsics(mediaType)) {
      chain->Append(NumberComponent(intrinsic));
    }
  }
  for (const ComponentRef& effect : placement.effects) {
    chain->Append(NumberComponent(effect));
  }
  track->AddItem(item);
  if (placement.linkGroup != 0) {
    item->SetLinkGroup(placement.linkGroup);
  }
  return item;
}

TrackItemRef ProjectBuilder::AddTransition(const TrackRef& track, TickTime start, TickTime end,
                                           TransitionData data, ObjectID id) {
  TrackItemRef item =
      Number(TrackItem::CreateTransition(track->GetMediaType(), start, end, std::move(data)));
  if (id != 0) {
    item->SetID(id);
  }
  Number(item->GetComponentChain());
  track->AddItem(item);
  return item;
}

ComponentRef ProjectBuilder::AddEffect(const TrackItemRef& item, std::string_view matchName) {
  ComponentRef effect = Catalogue().Create(matchName);
  return effect ? AddComponent(item->GetComponentChain(), std::move(effect)) : nullptr;
}

ComponentRef ProjectBuilder::AddEffect(const MasterClipRef& masterClip,
                                       std::string_view matchName) {
  ComponentRef effect = Catalogue().Create(matchName);
  return effect ? AddComponent(masterClip->GetVideoChain(), std::move(effect)) : nullptr;
}

ComponentRef ProjectBuilder::AddComponent(const ComponentChainRef& chain, ComponentRef component) {
  chain->Append(NumberComponent(component));
  return component;
}

bool ProjectBuilder::AddKeyframes(const ComponentParamRef& param,
                                  std::initializer_list<KeyframeEntry> keys) {
  if (param == nullptr) {
    return false;
  }
  ComponentParam::State state = param->GetState();
  state.timeVarying = true;
  bool tookAll = true;
  for (const KeyframeEntry& key : keys) {
    Keyframe keyframe;
    keyframe.time = key.time;
    keyframe.value = key.value;
    keyframe.interpolation = key.interpolation;
    tookAll = state.keyframes.Add(keyframe) == CurveStatus::Ok && tookAll;
  }
  param->ApplyState(std::move(state));
  return tookAll;
}
