#pragma once

#include <cstdint>
#include <string>

#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"

// Undoable edits of a track item's own properties (not its place in the sequence, which the
// sequence editing actions change, nor its intro and outro: IntroOutroActions). One step each,
// recording old and new value; NoChange (and no step) when the value is already set.
class TrackItemActions {
 public:
  static constexpr const char* kSetIntroOutroLocked = "MZ.TrackItemActions.SetIntroOutroLocked";
  static constexpr const char* kSetLabelColor = "MZ.TrackItemActions.SetLabelColor";
  static constexpr const char* kSetName = "MZ.TrackItemActions.SetName";

  static EditStatus SetIntroOutroLocked(const TrackItemRef& item, bool locked);
  static EditStatus SetLabelColor(const TrackItemRef& item, std::uint32_t rgb);
  // An empty name shows the master clip's again.
  static EditStatus SetName(const TrackItemRef& item, std::string name);
};
