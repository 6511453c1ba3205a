#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"
#include "Host/Model/TransitionData.h"
#include "Host/Time/FrameRate.h"
#include "Host/Time/TickTime.h"
#include "Host/Time/TimePoint.h"
#include "Host/Time/TimeRange.h"

// A clip or a transition on a track. Times:
//   sequence time  the sequence's time line; start and end are in it;
//   clip time      the time of the clip's media (0 = the media's first frame), in which its
//                  effects' keyframes are stored, so trimming or moving the clip keeps them on
//                  the same pictures. clip = mediaIn + (sequence - start) * speed.
//
//        media  |<-- head -->|<======== item ========>|<-- tail -->|
//   sequence            start^                    end^
//
// Owns its component chain. Setters are not undoable: they are for building, loading and the
// actions (TrackItemActions, the sequence editing actions, the transition actions); each sends
// TrackItemChangedMessage on the item's station, and those that move the item in time also
// SequenceChangedMessage.
class TrackItem : public ModelObject {
 public:
  // A clip of `masterClip` (may be null for generated items) over [start, end) whose first frame
  // shows media time `mediaIn`.
  static TrackItemRef CreateClip(MediaType mediaType, TickTime start, TickTime end,
                                 MasterClipRef masterClip, TickTime mediaIn = 0);
  static TrackItemRef CreateTransition(MediaType mediaType, TickTime start, TickTime end,
                                       TransitionData transition);
  ~TrackItem() override;

  TrackItemKind GetKind() const { return mKind; }
  bool IsClip() const { return mKind == TrackItemKind::Clip; }
  bool IsTransition() const { return mKind == TrackItemKind::Transition; }
  MediaType GetMediaType() const { return mMediaType; }

  TickTime GetStart() const { return mSpan.start; }
  TickTime GetEnd() const { return mSpan.end; }
  TickTime GetDuration() const { return mSpan.Duration(); }
  // [start, end) in sequence time.
  const TimeRange& GetSpan() const { return mSpan; }
  TickTime GetMediaIn() const { return mMediaIn; }
  // start <= end, both storable; `mediaIn` is the media time at `start`.
  bool SetTimes(TickTime start, TickTime end, TickTime mediaIn);

  // Playback speed: 1 plays the media as recorded, 2 twice as fast. Must be positive and finite.
  double GetSpeed() const { return mSpeed; }
  bool SetSpeed(double speed);

  // Between the two time lines: every conversion comes here (rows through their own). Both
  // saturate at the sentinels.
  ClipTime SequenceTimeToClipTime(SequenceTime sequenceTime) const;
  SequenceTime ClipTimeToSequenceTime(ClipTime clipTime) const;

  // Where the clip's media starts and ends in sequence time: start - head and end + tail.
  // kTime_Min / kTime_Max when the media has no limit on that side (generated media, no media).
  TickTime GetMediaStartInSequence() const;
  TickTime GetMediaEndInSequence() const;
  bool HasHeadMaterial() const { return GetMediaStartInSequence() < mSpan.start; }
  bool HasTailMaterial() const { return GetMediaEndInSequence() > mSpan.end; }

  const MasterClipRef& GetMasterClip() const { return mMasterClip; }
  // The item's own name, else its master clip's, else the transition's display name.
  std::string GetName() const;
  // The name given to the item itself; empty when it shows its master clip's.
  const std::string& GetOwnName() const { return mName; }
  void SetName(std::string name);

  // Frame rate the item's times snap to: its sequence's video or audio rate, else its media's.
  FrameRate GetFrameRate() const;

  const ComponentChainRef& GetComponentChain() const { return mChain; }
  // A transition whose chain holds components shows them (as its own effects).
  bool HasOwnComponentChain() const;

  std::uint32_t GetLabelColor() const { return mLabelColor; }  // 0xRRGGBB
  void SetLabelColor(std::uint32_t rgb);

  // Orders the audio parts of one clip; 0 comes first. Keys of 10000 or more are not parts.
  std::uint32_t GetPartOrderKey() const { return mPartOrderKey; }
  void SetPartOrderKey(std::uint32_t key);

  // Items sharing a non-zero link group belong to one clip (its video and audio parts).
  int GetLinkGroup() const { return mLinkGroup; }
  void SetLinkGroup(int group);  // also TrackItemLinkStatusChangedMessage on the sequence

  // Graphics clips: the intro and outro regions, and whether they are locked against resizing.
  bool IsGraphicsClip() const;
  TickTime GetIntroDuration() const { return mIntro; }
  TickTime GetOutroDuration() const { return mOutro; }
  // Limited so that intro + outro never exceeds the duration.
  TickTime GetEffectiveIntroDuration() const;
  TickTime GetEffectiveOutroDuration() const;
  bool AreIntroOutroLocked() const { return mIntroOutroLocked; }
  bool SetIntroDuration(TickTime duration);  // not negative
  bool SetOutroDuration(TickTime duration);
  void SetIntroOutroLocked(bool locked);

  // Transitions only (empty data for clips).
  const TransitionData& GetTransitionData() const { return mTransition; }
  void SetTransitionData(TransitionData data);

  Track* GetTrack() const { return mTrack; }
  Sequence* GetSequence() const;
  Project* GetProject() const override;
  // The linked items of the same sequence (this one excluded); empty when not linked.
  std::vector<TrackItemRef> GetLinkedItems() const;

  // Track only.
  void SetTrack(Track* track) { mTrack = track; }

  // Sends TrackItemChangedMessage (setters call it; so may actions that change the item's
  // effects' timing).
  void NotifyChanged();

 private:
  TrackItem(TrackItemKind kind, MediaType mediaType, TickTime start, TickTime end);
  void NotifyTimingChanged();

  TrackItemKind mKind;
  MediaType mMediaType;
  TimeRange mSpan;  // sequence time
  TickTime mMediaIn = 0;
  double mSpeed = 1.0;
  MasterClipRef mMasterClip;
  std::string mName;
  ComponentChainRef mChain;
  std::uint32_t mLabelColor;
  std::uint32_t mPartOrderKey = 0;
  int mLinkGroup = 0;
  TickTime mIntro = 0;
  TickTime mOutro = 0;
  bool mIntroOutroLocked = false;
  TransitionData mTransition;
  Track* mTrack = nullptr;  // owner; cleared when the track lets go
};
