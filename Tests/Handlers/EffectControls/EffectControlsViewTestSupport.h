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
    project = Project::Create("Panel");
    sequence = Sequence::Create("Sequence 01", kFrameRate_25);
    project->AddSequence(sequence);
    project->SetActiveSequence(sequence);
    v1 = Track::Create(MediaType::Video, "V1");
    a1 = Track::Create(MediaType::Audio, "A1");
    sequence->AddTrack(v1);
    sequence->AddTrack(a1);
    media = Media::Create("Beach.mov", 600 * kSec, true, true);
    master = MasterClip::Create("Beach.mov", media);
    project->AddMasterClip(master);
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
    TrackItemRef item = TrackItem::CreateClip(track->GetMediaType(), start, end, master);
    track->AddItem(item);
    if (link != 0) {
      item->SetLinkGroup(link);
    }
    return item;
  }

  int KeyframeLeft() const { return view->GetKeyframeView()->GetBounds().left; }

  MessagingTestScope scope;
  ProjectRef project;
  SequenceRef sequence;
  TrackRef v1;
  TrackRef a1;
  MediaRef media;
  MasterClipRef master;
  std::unique_ptr<ViewHost> host;
  std::shared_ptr<EffectControlsView> view;
};

}  // namespace panel_view_test
