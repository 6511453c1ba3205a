#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/PropertyList.h"
#include "Host/Model/Action.h"
#include "Host/Model/Clipboard.h"
#include "Host/Model/DirectManipulationManager.h"
#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/UndoStack.h"

// The root of the model: owns the sequences, the master clips, the undo history and the
// clipboard, and the project's properties. Every model object is reachable from here
// (ForEachObject), which is what project files and `select ID` rely on.
//
// Messages on GetStation(): UndoHistoryChangedMessage, ClipboardChangedMessage,
// SequenceActivatedMessage, ReadOnlyStateChangedMessage.
class Project : public ModelObject {
 public:
  static ProjectRef Create(std::string name = "Untitled");
  ~Project() override;

  const std::string& GetName() const { return mName; }
  void SetName(std::string name) { mName = std::move(name); }

  // Building and loading; not undoable. The project adopts them.
  void AddSequence(const SequenceRef& sequence);
  void AddMasterClip(const MasterClipRef& masterClip);
  const std::vector<SequenceRef>& GetSequences() const { return mSequences; }
  const std::vector<MasterClipRef>& GetMasterClips() const { return mMasterClips; }

  // The sequence the user works in (null when none). SequenceActivatedMessage.
  const SequenceRef& GetActiveSequence() const { return mActiveSequence; }
  void SetActiveSequence(SequenceRef sequence);

  UndoStack& GetUndoStack() { return mUndoStack; }
  Clipboard& GetClipboard() { return mClipboard; }
  // Whose on-screen controls the monitor shows; announced on kDirectManipulationStation.
  DirectManipulationManager& GetDirectManipulationManager() { return mDirectManipulation; }
  PropertyList& GetProperties() { return mProperties; }
  const PropertyList& GetProperties() const { return mProperties; }

  // A read-only project refuses every action (ExecuteModelAction).
  bool IsReadOnly() const { return mReadOnly; }
  void SetReadOnly(bool readOnly);

  // Every object of the project, depth first: sequences (tracks, items, their chains,
  // components, masks, parameters), then master clips (media, chain, ...).
  void ForEachObject(const std::function<void(ModelObject&)>& visit) const;
  // nullptr when no object of that id (and type) belongs to the project.
  ModelObject* FindObject(ObjectID id) const;
  SequenceRef FindSequence(ObjectID id) const;
  TrackItemRef FindTrackItem(ObjectID id) const;
  MasterClipRef FindMasterClip(ObjectID id) const;
  ComponentRef FindComponent(ObjectID id) const;
  ComponentParamRef FindParam(ObjectID id) const;

  Project* GetProject() const override { return const_cast<Project*>(this); }

 private:
  explicit Project(std::string name);

  std::string mName;
  std::vector<SequenceRef> mSequences;
  std::vector<MasterClipRef> mMasterClips;
  SequenceRef mActiveSequence;
  UndoStack mUndoStack;
  Clipboard mClipboard;
  DirectManipulationManager mDirectManipulation;
  PropertyList mProperties;
  bool mReadOnly = false;
};

// Executes an action on the project's undo stack. Objects that belong to no project (templates,
// clipboard copies, objects being built) have no history: the action is simply done. Refused
// (ReadOnly) on a read-only project, (Busy) while an undo or redo runs; InvalidArgument when the
// action itself fails.
EditStatus ExecuteModelAction(Project* project, std::unique_ptr<Action> action);
