#pragma once

class ComponentChain;
class MasterClip;
class Sequence;
class TrackItem;

// Whether the user may edit an object, as the editing actions and selections ask before they
// build a step: a read-only project, sequence or master clip (or one from an inactive project)
// makes everything in it read only. Objects that belong to no project are editable.
class EditPermissions {
 public:
  static bool IsReadOnly(const Sequence& sequence);
  static bool IsReadOnly(const TrackItem& item);
  static bool IsReadOnly(const MasterClip& clip);
  static bool IsReadOnly(const ComponentChain& chain);
};
