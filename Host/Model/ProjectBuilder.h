#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Host/Model/Keyframe.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/ModelTypes.h"
#include "Host/Model/ParamValue.h"
#include "Host/Model/TransitionData.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"

// Builds a project in code (tests, the example files, the program's demo): media, master clips,
// sequences, tracks, clips carrying the catalogue's intrinsics, transitions, effects and
// keyframes. Nothing it does is undoable and the project's history stays empty; objects are
// added to their owners as they are made, so a clip's track is the one it was made on.
//
// Ids: with Ids::Automatic every object takes the next id of the process (ModelObject); with
// Ids::Sequential the builder numbers what it makes 1, 2, 3, ... in the order of its calls, so
// a file written from the project is the same on every run. Objects made elsewhere and handed
// to AddComponent are numbered too; objects made by other means keep their ids. Either way an
// explicit id (ClipPlacement::id, AddTransition's `id`) replaces the one the object would get.
class ProjectBuilder {
 public:
  enum class Ids { Automatic, Sequential };
  enum class Streams { Video, Audio, VideoAndAudio };

  // An id of 0 asks for the builder's own.
  struct ClipPlacement {
    TickTime start = 0;  // sequence time
    TickTime end = 0;
    TickTime mediaIn = 0;  // media time at `start`
    int linkGroup = 0;     // items sharing a non-zero group are parts of one clip
    ObjectID id = 0;
    bool withIntrinsics = true;  // the catalogue's intrinsic effects of the track's media type
    std::vector<ComponentRef> effects = {};  // adopted after the intrinsics, numbered like them
  };

  struct KeyframeEntry {
    TickTime time = 0;  // clip time
    ParamValue value = 0.0;
    TemporalInterpolation interpolation = TemporalInterpolation::Linear;
  };

  explicit ProjectBuilder(std::string projectName, Ids ids = Ids::Automatic);

  const ProjectRef& GetProject() const { return mProject; }

  MediaRef AddMedia(std::string name, TickTime duration, Streams streams);
  // Master clips of the project, in order. Sequential ids go to the clips first, then to their
  // video chains.
  std::vector<MasterClipRef> AddMasterClips(
      std::initializer_list<std::pair<std::string, MediaRef>> clips);
  MasterClipRef AddMasterClip(std::string name, MediaRef media);

  // A sequence of the project; the first one becomes the active sequence.
  SequenceRef AddSequence(std::string name, FrameRate videoRate = kFrameRate_25,
                          FrameRate audioRate = kFrameRate_Audio48000);
  // A track below the sequence's others of its media type.
  TrackRef AddTrack(const SequenceRef& sequence, MediaType mediaType, std::string name);

  // A clip of `masterClip` (null for a generated item) on `track`, of the track's media type.
  // Its chain is complete when it goes on the track; its link group is set after that.
  TrackItemRef AddClip(const TrackRef& track, const MasterClipRef& masterClip,
                       const ClipPlacement& placement);
  TrackItemRef AddTransition(const TrackRef& track, TickTime start, TickTime end,
                             TransitionData data, ObjectID id = 0);

  // A fresh copy of the catalogue's effect appended to the chain; null when the catalogue has no
  // effect of that match name (the chain is then left alone).
  ComponentRef AddEffect(const TrackItemRef& item, std::string_view matchName);
  ComponentRef AddEffect(const MasterClipRef& masterClip, std::string_view matchName);
  // Appends a component made by the caller (the chain adopts it), numbering it, its parameters
  // and its masks.
  ComponentRef AddComponent(const ComponentChainRef& chain, ComponentRef component);

  // Makes `param` time-varying with these keyframes (clip time). False when the parameter is
  // null or refuses a keyframe; it then keeps those it took.
  static bool AddKeyframes(const ComponentParamRef& param,
                           std::initializer_list<KeyframeEntry> keys);

 private:
  template <class Ref>
  const Ref& Number(const Ref& object);
  const ComponentRef& NumberComponent(const ComponentRef& component);

  Ids mIds;
  ObjectID mLastID = 0;  // the last sequential id given
  ProjectRef mProject;
};
