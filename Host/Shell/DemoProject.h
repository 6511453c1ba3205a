#pragma once

#include "Host/Model/ModelObject.h"
#include "Host/Model/ModelRefs.h"

// The project the program opens without --project: one 25 fps sequence, "Demo Sequence", with
// two linked clips (video on V1, audio on A1) cut at 5 s and a cross dissolve across the cut.
// Every clip carries the catalogue's intrinsic effects (EffectCatalogue::Standard), video clips
// also an applied Gaussian Blur; Motion's Scale and Opacity's Opacity have keyframes on clip A.
//
// The track items have fixed ids, so scripts can select them:
//   V1: kDemoVideoClipA [0, 5 s)   kDemoTransition [4.5 s, 5.5 s)   kDemoVideoClipB [5 s, 10 s)
//   A1: kDemoAudioClipA [0, 5 s)   kDemoAudioClipB [5 s, 10 s)
// (clip A's video and audio are linked, and so are clip B's).
inline constexpr ObjectID kDemoVideoClipA = 101;
inline constexpr ObjectID kDemoTransition = 102;
inline constexpr ObjectID kDemoVideoClipB = 103;
inline constexpr ObjectID kDemoAudioClipA = 201;
inline constexpr ObjectID kDemoAudioClipB = 202;

// A new project each call; its history is empty.
ProjectRef BuildDemoProject();
