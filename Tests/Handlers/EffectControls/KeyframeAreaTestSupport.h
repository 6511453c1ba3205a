#pragma once

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/EffectControlsKeyframeView.h"
#include "Handlers/EffectControls/Src/EffectControlsView.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Preferences.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentParam.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Model/UndoStack.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/ParameterControl.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/MenuRegistry.h"
#include "Host/Toolkit/MenuTracker.h"
#include "Host/Toolkit/PersistentToolTip.h"
#include "Host/Toolkit/ScriptedMenuTracker.h"
#include "Host/Toolkit/StandardCommands.h"
#include "Host/Toolkit/TimeBarControl.h"
#include "Host/Toolkit/ViewHost.h"

// The panel in a window over a clip with Motion (Position keyframed at 3 s and 4 s of the
// sequence) and Opacity (keyframed at 3 s, 5 s and 6 s), for the keyframe area's tests. Input
// goes through the window, as a user's would; menus are answered by a scripted tracker.
namespace keyframe_area_test {

constexpr TickTime kSec = kTicksPerSecond;

inline std::string ReadText(const std::string& path) {
  std::ifstream in(path);
  std::stringstream text;
  text << in.rdbuf();
  return text.str();
}

class KeyframeAreaTest : public ::testing::Test {
 protected:
  KeyframeAreaTest() {
    Preferences::SetApplication(std::make_unique<Preferences>());
    ColorManager::ResetForTesting();
    ColorManager::RegisterColorSet(
        "EFFECTCONTROLSCOLORS",
        ReadText("Handlers/EffectControls/Resources/EffectControlsColors.txt"));
    MenuRegistry::Instance().RegisterFromText(
        ReadText("Handlers/EffectControls/Resources/EffectControlsMenus.txt"));
    previousMenus = SetMenuTrackerForTesting(menus);
    sequence = builder.AddSequence("Sequence 01", kFrameRate_25);
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    media = builder.AddMedia("Beach.mov", 600 * kSec, ProjectBuilder::Streams::VideoAndAudio);
    master = builder.AddMasterClip("Beach.mov", media);
  }

  ~KeyframeAreaTest() override {
    if (view) {
      view->Destroy();
    }
    host.reset();
    view.reset();
    SetMenuTrackerForTesting(previousMenus);
    ColorManager::ResetForTesting();
    Preferences::SetApplication(nullptr);
  }

  // The clip from 2 s to 8 s with its keyframes; the panel opened on it, edit line at 2 s.
  void OpenClip(Size size = {1000, 600}) {
    motion = EffectCatalogue::Standard().Create(kMatchName_Motion);
    opacity = EffectCatalogue::Standard().Create(kMatchName_Opacity);
    clip = builder.AddClip(v1, master,
                           {.start = 2 * kSec,
                            .end = 8 * kSec,
                            .withIntrinsics = false,
                            .effects = {motion, opacity}});
    position = motion->GetParams().front();
    fade = opacity->GetParams().front();
    ProjectBuilder::AddKeyframes(position, {{.time = ClipAt(3 * kSec), .value = ParamPoint{1, 2}},
                                            {.time = ClipAt(4 * kSec), .value = ParamPoint{5, 6}}});
    ProjectBuilder::AddKeyframes(fade, {{.time = ClipAt(3 * kSec), .value = 100.0},
                                        {.time = ClipAt(5 * kSec), .value = 50.0},
                                        {.time = ClipAt(6 * kSec), .value = 0.0}});
    view = std::make_shared<EffectControlsView>(nullptr, "effectcontrols");
    view->Create("effectcontrols", "Effect Controls", nullptr, true);
    host = std::make_unique<ViewHost>(size);
    host->SetRootView(view);
    view->SetBounds(Rect::FromSize(0, 0, size.width, size.height));
    view->OnSequenceActivated(sequence);
    sequence->SetCurrentTime(2 * kSec);
    sequence->SetSelection({clip});
    view->RefreshFromClipSelection();
    host->Render();
  }

  TickTime ClipAt(TickTime sequenceTime) const {
    return clip->SequenceTimeToClipTime(SequenceTime(sequenceTime)).Ticks();
  }
  TickTime SequenceAt(TickTime clipTime) const {
    return clip->ClipTimeToSequenceTime(ClipTime(clipTime)).Ticks();
  }

  EffectControlsKeyframeView& Area() const { return *view->GetKeyframeView(); }
  KeyframeMultiSelection& Selection() const { return *view->GetListView()->GetKeyframeSelection(); }
  // Window coordinates of the glyph of `param`'s keyframe at `sequenceTime`.
  Point Glyph(const ComponentParamRef& param, TickTime sequenceTime) const {
    const TickTime clipTime = ClipAt(sequenceTime);
    for (const auto& glyph : Area().GetKeyframeGlyphs()) {
      if (glyph.row->GetParam() == param && glyph.clipTime == clipTime) {
        return glyph.centre + Area().GetBounds().TopLeft();
      }
    }
    ADD_FAILURE() << "no glyph of " << param->GetName() << " at " << sequenceTime;
    return {};
  }
  // Window x of a sequence time.
  int XOf(TickTime sequenceTime) const {
    return Area().TimeToX(sequenceTime) + Area().GetBounds().left;
  }
  // A point of the area below every track (nothing to hit there).
  Point Empty() const { return Point{Area().GetBounds().left + 30, Area().GetBounds().bottom - 5}; }

  void Click(Point at, KeyModifiers modifiers = kKeyModifierNone) {
    host->MouseMove(at, modifiers);
    host->MouseDown(MouseButton::kLeft, at, modifiers);
    host->MouseUp(MouseButton::kLeft, at, modifiers);
  }
  void RightClick(Point at, KeyModifiers modifiers = kKeyModifierNone) {
    host->MouseMove(at, modifiers);
    host->MouseDown(MouseButton::kRight, at, modifiers);
    host->MouseUp(MouseButton::kRight, at, modifiers);
  }
  // Press, move in `steps` steps, release.
  void Drag(Point from, Point to, KeyModifiers modifiers = kKeyModifierNone, int steps = 4) {
    host->MouseMove(from, modifiers);
    host->MouseDown(MouseButton::kLeft, from, modifiers);
    for (int i = 1; i <= steps; ++i) {
      host->MouseMove(
          Point{from.x + (to.x - from.x) * i / steps, from.y + (to.y - from.y) * i / steps},
          modifiers);
    }
    host->MouseUp(MouseButton::kLeft, to, modifiers);
  }
  bool Key(KeyCode key, KeyModifiers modifiers = kKeyModifierNone) {
    return host->KeyDown(KeyEvent{key, modifiers, false});
  }

  std::vector<TickTime> SequenceTimes(const ComponentParamRef& param) const {
    std::vector<TickTime> times;
    for (const TickTime time : param->GetKeyframeTimes()) {
      times.push_back(SequenceAt(time));
    }
    return times;
  }
  std::vector<TickTime> SelectedSequenceTimes(const ComponentParamRef& param) const {
    std::vector<TickTime> times;
    if (const KeyframeSelection* keys = Selection().Find(param.get())) {
      for (const TickTime time : keys->GetKeyframeTimes()) {
        times.push_back(SequenceAt(time));
      }
    }
    return times;
  }
  UndoStack& Undo() { return project->GetUndoStack(); }

  MessagingTestScope scope;
  ProjectBuilder builder{"Keyframes"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence;
  TrackRef v1;
  MediaRef media;
  MasterClipRef master;
  ComponentRef motion;
  ComponentRef opacity;
  TrackItemRef clip;
  ComponentParamRef position;
  ComponentParamRef fade;
  std::shared_ptr<ScriptedMenuTracker> menus = std::make_shared<ScriptedMenuTracker>();
  std::shared_ptr<MenuTracker> previousMenus;
  std::unique_ptr<ViewHost> host;
  std::shared_ptr<EffectControlsView> view;
};

}  // namespace keyframe_area_test
