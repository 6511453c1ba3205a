#pragma once

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListScroller.h"
#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Src/AudioPartInfo.h"
#include "Handlers/EffectControls/Src/FilterItem.h"
#include "Host/Messaging/Listener.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Model/Component.h"
#include "Host/Model/ComponentChain.h"
#include "Host/Model/EffectCatalogue.h"
#include "Host/Model/MasterClip.h"
#include "Host/Model/Media.h"
#include "Host/Model/Project.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Model/Track.h"
#include "Host/Model/TrackItem.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Toolkit/ColorManager.h"
#include "Host/Toolkit/ViewHost.h"
#include "Tests/Host/Model/MessageRecorder.h"

inline constexpr TickTime kSecond = kTicksPerSecond;

// Stands in for the panel view's scroll bar: keeps what the list tells it; its position moves
// only when someone sets it, so the list's own clamping shows.
class FakeScroller : public EffectControlsListScroller {
 public:
  void SizeListScrollBar(int content, int visible) override {
    contentHeight = content;
    visibleHeight = visible;
  }
  int GetListScrollPosition() const override { return position; }
  void SetListScrollPosition(int p) override { position = p; }

  int contentHeight = -1;
  int visibleHeight = -1;
  int position = 0;
};

// A list that counts what it draws, to see what painting visits.
class CountingListView : public EffectControlsListView {
 public:
  using EffectControlsListView::EffectControlsListView;

  void DrawItem(DC& dc, EffectItem& row, const Rect& rect, int flag) override {
    drawn.push_back(&row);
    EffectControlsListView::DrawItem(dc, row, rect, flag);
  }
  void DrawFilterItem(DC& dc, FilterItem& row, const Rect& rect, int flag) override {
    drawn.push_back(&row);
    EffectControlsListView::DrawFilterItem(dc, row, rect, flag);
  }
  bool DrawItemList(DC& dc, const EffectItemList& list, int headerTop, const std::string& label,
                    bool expanded, int flag) override {
    labels.push_back(label);
    return EffectControlsListView::DrawItemList(dc, list, headerTop, label, expanded, flag);
  }

  std::vector<const EffectItem*> drawn;
  std::vector<std::string> labels;
};

inline std::string ReadTextFile(const std::string& path) {
  std::ifstream in(path);
  std::stringstream text;
  text << in.rdbuf();
  return text.str();
}

// A project with one 25 fps sequence and a video and two audio tracks; clips are added by each
// test. The list is made with no style and opened in a window of `kWindow` when a test needs
// layout or painting.
class ListViewTest : public ::testing::Test {
 protected:
  static constexpr Size kWindow{420, 600};

  ListViewTest() {
    ColorManager::ResetForTesting();
    ColorManager::RegisterColorSet(
        "EFFECTCONTROLSCOLORS",
        ReadTextFile("Handlers/EffectControls/Resources/EffectControlsColors.txt"));
    sequence = builder.AddSequence("Sequence 01", kFrameRate_25);
    v1 = builder.AddTrack(sequence, MediaType::Video, "V1");
    a1 = builder.AddTrack(sequence, MediaType::Audio, "A1");
    a2 = builder.AddTrack(sequence, MediaType::Audio, "A2");
    a3 = builder.AddTrack(sequence, MediaType::Audio, "A3");
    media = builder.AddMedia("interview.mov", 60 * kSecond, ProjectBuilder::Streams::VideoAndAudio);
    masterClip = builder.AddMasterClip("Interview", media);
    list = std::make_shared<CountingListView>(nullptr, "EffectControlsTest.List");
  }

  ~ListViewTest() override {
    list->Destroy();
    host.reset();
    list.reset();
    ColorManager::ResetForTesting();
  }

  static const EffectCatalogue& Catalogue() { return EffectCatalogue::Standard(); }

  // Puts the list in a window (FinishCreate runs there).
  void Open(Size size = kWindow) {
    host = std::make_unique<ViewHost>(size);
    host->SetRootView(list);
  }

  // A clip on `track` with the given components (intrinsics are not added by themselves).
  TrackItemRef AddClip(const TrackRef& track, std::vector<ComponentRef> components,
                       TickTime start = 2 * kSecond, TickTime end = 7 * kSecond) {
    return builder.AddClip(
        track, masterClip,
        {.start = start, .end = end, .withIntrinsics = false, .effects = std::move(components)});
  }
  ComponentRef Make(const char* matchName) const { return Catalogue().Create(matchName); }

  void Select(const std::vector<TrackItemRef>& items) {
    sequence->SetSelection(items);
    list->DoSequenceClipSelectionChanged(sequence);
  }

  static std::vector<std::string> Titles(const EffectItemList& rows) {
    std::vector<std::string> titles;
    for (const auto& row : rows) {
      titles.push_back(row->GetName());
    }
    return titles;
  }
  static std::vector<std::string> ChildTitles(const EffectItem& row) {
    std::vector<std::string> titles;
    for (const auto& child : row.GetItems()) {
      titles.push_back(child->GetName());
    }
    return titles;
  }
  static FilterItem& Filter(const EffectItemList& rows, std::size_t index) {
    return dynamic_cast<FilterItem&>(*rows.At(index));
  }

  // Declared first: outlives everything that listens.
  MessagingTestScope messaging;
  ProjectBuilder builder{"List"};
  ProjectRef project = builder.GetProject();
  SequenceRef sequence;
  TrackRef v1, a1, a2, a3;
  MediaRef media;
  MasterClipRef masterClip;
  std::shared_ptr<CountingListView> list;
  std::unique_ptr<ViewHost> host;
};
