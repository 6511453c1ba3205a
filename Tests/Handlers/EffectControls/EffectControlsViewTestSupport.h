#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>

#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ScrollBar.h"
#include "Host/Toolkit/ViewHost.h"

// The panel view over a small project, for the view's tests.
namespace panel_view_test {

constexpr TickTime kSec = kTicksPerSecond;
constexpr int kS = ScrollBar::kDefaultSize;

inline bool HasAssertion(std::string_view message) {
  for (const auto& record : RecordedDebugAssertions()) {
    if (record.message == message) {
      return true;
    }
  }
  return false;
}

// A panel in a window over a project with one 25 fps sequence, a video and an audio track.
class PanelViewTest : public ::testing::Test {
 protected:
  PanelViewTest() {
    ColorManager::ResetForTesting();
    sequence = builder.AddSequence("Sequence 01", kFrameRate_25);
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    a1 = builder.AddTrack(sequence, MediaType::Audio, "A1");
    media = builder.AddMedia("Beach.mov", 600 * kSec, ProjectBuilder::Streams::VideoAndAudio);
    master = builder.AddMasterClip("Beach.mov", media);
  }

  ~PanelViewTest() override {
    if (view) {
      view->Destroy();
    }
    host.reset();
    view.reset();
    ColorManager::ResetForTesting();
  }

  void Open(Size size) {
    view = std::make_shared<EffectControlsView>(nullptr, "effectcontrols");
    view->Create("effectcontrols", "Effect Controls", nullptr, true);
    host = std::make_unique<ViewHost>(size);
    host->SetRootView(view);
    view->SetBounds(Rect::FromSize(0, 0, size.width, size.height));
    view->OnSequenceActivated(sequence);
  }

  TrackItemRef AddClip(const TrackRef& track, TickTime start, TickTime end, int link = 0) {
    return builder.AddClip(
        track, master, {.start = start, .end = end, .linkGroup = link, .withIntrinsics = false});
  }

  int KeyframeLeft() const { return view->GetKeyframeView()->GetBounds().left; }

  MessagingTestScope scope;
  ProjectBuilder builder{"Panel"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence;
  TrackRef v1;
  TrackRef a1;
  MediaRef media;
  MasterClipRef master;
  std::unique_ptr<ViewHost> host;
  std::shared_ptr<EffectControlsView> view;
};

}  // namespace panel_view_test
