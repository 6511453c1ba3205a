#pragma once

#include <string>

// One undoable change of the model. An action records the old and the new values when it is
// built, so Do and Undo are mirror images; Do serves as redo. Both send the model's change
// messages as any edit does. Actions are executed through the project's UndoStack, never by
// calling Do directly (except for objects that belong to no project, see ExecuteModelAction).
class Action {
 public:
  // `name` identifies the action ("MZ.ComponentParam.SetValue"); `undoText` is what the user
  // sees in the Edit menu (a localisation key with its default text); empty means the name.
  explicit Action(std::string name, std::string undoText = {});
  Action(const Action&) = delete;
  Action& operator=(const Action&) = delete;
  virtual ~Action();

  const std::string& GetName() const { return mName; }
  const std::string& GetUndoText() const { return mUndoText.empty() ? mName : mUndoText; }
  void SetUndoText(std::string text) { mUndoText = std::move(text); }

  // Applies the change. Returns false, with the model unchanged, when it cannot be applied; an
  // action that succeeded once succeeds again after its Undo.
  virtual bool Do() = 0;
  // Restores the state before Do. Only called after a successful Do.
  virtual void Undo() = 0;

 private:
  std::string mName;
  std::string mUndoText;
};
