#pragma once

#include <string>
#include <vector>

#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Time/TickTime.h"

// One video or audio track of a sequence: its track items (clips and transitions), ordered by
// start time. Owns its items. Adding and removing are not undoable: they are for building,
// loading and the sequence editing actions; each sends SequenceChangedMessage (structure).
class Track : public ModelObject {
 public:
  static TrackRef Create(MediaType mediaType, std::string name = {});
  ~Track() override;

  MediaType GetMediaType() const { return mMediaType; }
  const std::string& GetName() const { return mName; }
  void SetName(std::string name) { mName = std::move(name); }

  const std::vector<TrackItemRef>& GetItems() const { return mItems; }
  // The item's media type must be the track's and it must not be on a track yet.
  bool AddItem(const TrackItemRef& item);
  bool RemoveItem(const TrackItem* item);
  // Items whose span [start, end) contains `time`.
  std::vector<TrackItemRef> FindItemsAt(TickTime time) const;
  // Keeps the items ordered after an item's start changed (TrackItem calls it).
  void Reorder();

  Sequence* GetSequence() const { return mSequence; }
  // Position among the sequence's tracks of this media type, from 0; -1 when not in one.
  int GetIndex() const;
  Project* GetProject() const override;

  // Sequence only.
  void SetSequence(Sequence* sequence) { mSequence = sequence; }

 private:
  Track(MediaType mediaType, std::string name);

  MediaType mMediaType;
  std::string mName;
  std::vector<TrackItemRef> mItems;
  Sequence* mSequence = nullptr;  // owner; cleared when the sequence lets go
};
