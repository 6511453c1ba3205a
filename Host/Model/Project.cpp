#include "Host/Model/Project.h"

#include <utility>

#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"

namespace {

void VisitComponent(Component& component, const std::function<void(ModelObject&)>& visit) {
  visit(component);
  for (const ComponentParamRef& param : component.GetParams()) {
    visit(*param);
  }
  for (const ComponentRef& mask : component.GetMasks()) {
    VisitComponent(*mask, visit);
  }
}

void VisitChain(ComponentChain& chain, const std::function<void(ModelObject&)>& visit) {
  visit(chain);
  for (const ComponentRef& component : chain.GetComponents()) {
    VisitComponent(*component, visit);
  }
}

template <class Ref>
Ref FindTyped(const Project& project, ObjectID id) {
  using Object = typename Ref::element_type;
  return Ref(dynamic_cast<Object*>(project.FindObject(id)));
}

}  // namespace

ProjectRef Project::Create(std::string name) {
  return ProjectRef(new Project(std::move(name)));
}

Project::Project(std::string name)
    : ModelObject("Project"),
      mName(std::move(name)),
      mUndoStack(GetStation()),
      mClipboard(GetStation()) {
  mProperties.SetStation(GetStation());
}

Project::~Project() {
  for (const SequenceRef& sequence : mSequences) {
    sequence->SetProject(nullptr);
  }
  for (const MasterClipRef& clip : mMasterClips) {
    clip->SetProject(nullptr);
  }
}

void Project::AddSequence(const SequenceRef& sequence) {
  if (sequence && sequence->GetProject() == nullptr) {
    sequence->SetProject(this);
    mSequences.push_back(sequence);
  }
}

void Project::AddMasterClip(const MasterClipRef& masterClip) {
  if (masterClip && masterClip->GetProject() == nullptr) {
    masterClip->SetProject(this);
    mMasterClips.push_back(masterClip);
  }
}

void Project::SetActiveSequence(SequenceRef sequence) {
  if (sequence == mActiveSequence || (sequence && sequence->GetProject() != this)) {
    return;
  }
  mActiveSequence = std::move(sequence);
  BroadcastMessage(GetStation(), SequenceActivatedMessage(mActiveSequence));
}

void Project::SetReadOnly(bool readOnly) {
  if (readOnly == mReadOnly) {
    return;
  }
  mReadOnly = readOnly;
  BroadcastMessage(GetStation(), ReadOnlyStateChangedMessage(GetID(), readOnly));
}

void Project::ForEachObject(const std::function<void(ModelObject&)>& visit) const {
  for (const SequenceRef& sequence : mSequences) {
    visit(*sequence);
    for (const auto* tracks : {&sequence->GetVideoTracks(), &sequence->GetAudioTracks()}) {
      for (const TrackRef& track : *tracks) {
        visit(*track);
        for (const TrackItemRef& item : track->GetItems()) {
          visit(*item);
          VisitChain(*item->GetComponentChain(), visit);
        }
      }
    }
  }
  for (const MasterClipRef& clip : mMasterClips) {
    visit(*clip);
    if (clip->GetMedia()) {
      visit(*clip->GetMedia());
    }
    VisitChain(*clip->GetVideoChain(), visit);
  }
}

ModelObject* Project::FindObject(ObjectID id) const {
  ModelObject* found = nullptr;
  if (id == GetID()) {
    return const_cast<Project*>(this);
  }
  ForEachObject([&](ModelObject& object) {
    if (!found && object.GetID() == id) {
      found = &object;
    }
  });
  return found;
}

SequenceRef Project::FindSequence(ObjectID id) const {
  return FindTyped<SequenceRef>(*this, id);
}

TrackItemRef Project::FindTrackItem(ObjectID id) const {
  return FindTyped<TrackItemRef>(*this, id);
}

MasterClipRef Project::FindMasterClip(ObjectID id) const {
  return FindTyped<MasterClipRef>(*this, id);
}

ComponentRef Project::FindComponent(ObjectID id) const {
  return FindTyped<ComponentRef>(*this, id);
}

ComponentParamRef Project::FindParam(ObjectID id) const {
  return FindTyped<ComponentParamRef>(*this, id);
}

EditStatus ExecuteModelAction(Project* project, std::unique_ptr<Action> action) {
  if (!action) {
    return EditStatus::InvalidArgument;
  }
  if (!project) {
    return action->Do() ? EditStatus::Done : EditStatus::InvalidArgument;
  }
  if (project->IsReadOnly()) {
    return EditStatus::ReadOnly;
  }
  UndoStack& stack = project->GetUndoStack();
  if (stack.IsPerformingUndoOrRedo()) {
    // Let the stack record the misuse; it refuses.
    stack.Execute(std::move(action));
    return EditStatus::Busy;
  }
  return stack.Execute(std::move(action)) ? EditStatus::Done : EditStatus::InvalidArgument;
}
