// When the list rebuilds: exactly when the target it built for differs from the one the
// selection asks for now.
#include <functional>
#include <string>
#include <vector>

#include "Handlers/EffectControls/Public/EffectControlsListView.h"
#include "Handlers/EffectControls/Public/PanelTarget.h"
#include "Host/Model/TransitionData.h"
#include "Tests/Handlers/EffectControls/EffectControlsListViewTestSupport.h"

namespace {

TEST(PanelTarget, EveryMemberThatDiffersMakesADifferentTarget) {
  const SequenceRef sequence = Sequence::Create("S", kFrameRate_25);
  const TrackItemRef clip = TrackItem::CreateClip(MediaType::Video, 0, kSecond, nullptr);
  PanelTarget base;
  base.sequence = sequence;
  base.selection = {TrackItemGroup{{clip}, {}}};
  base.kind = PanelTarget::kClip;
  base.showVideo = true;

  const std::vector<std::pair<std::string, std::function<void(PanelTarget&)>>> changes = {
      {"sequence", [](PanelTarget& t) { t.sequence = Sequence::Create("T", kFrameRate_25); }},
      {"selection", [](PanelTarget& t) { t.selection.clear(); }},
      {"kind", [](PanelTarget& t) { t.kind = PanelTarget::kTransition; }},
      {"showVideo", [](PanelTarget& t) { t.showVideo = false; }},
      {"showAudio", [](PanelTarget& t) { t.showAudio = true; }},
      {"transitionChain", [&](PanelTarget& t) { t.transitionChain = clip->GetComponentChain(); }},
      {"masterClip", [](PanelTarget& t) { t.masterClip = MasterClip::Create("M", nullptr); }},
  };
  for (const auto& [member, change] : changes) {
    PanelTarget changed = base;
    change(changed);
    EXPECT_NE(changed, base) << member;
  }
  EXPECT_EQ(PanelTarget(base), base);
}

// A list whose transitions may be shown or not, as a panel that extends it decides.
class ViewModeListView : public EffectControlsListView {
 public:
  using EffectControlsListView::EffectControlsListView;
  bool AllowsViewMode(int /*viewMode*/) const override { return allowTransitions; }
  bool allowTransitions = true;
};

class ListRebuildTest : public ListViewTest {
 protected:
  // The first video row, to tell a rebuild (new rows) from a refresh (the same rows).
  const EffectItem* FirstRow() const {
    return list->GetVideoItems().IsEmpty() ? nullptr : list->GetVideoItems().At(0).get();
  }
};

TEST_F(ListRebuildTest, TheSameSelectionAgainKeepsTheRows) {
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  Open();
  Select({clip});
  const EffectItem* row = FirstRow();
  ASSERT_NE(row, nullptr);
  list->DoSequenceClipSelectionChanged(sequence);
  EXPECT_EQ(FirstRow(), row);
  ASSERT_TRUE(list->GetBuiltTarget().has_value());
  EXPECT_EQ(*list->GetBuiltTarget(), list->GetTarget());
}

TEST_F(ListRebuildTest, TheMasterClipAloneMakesARebuildEachWay) {
  masterClip->GetVideoChain()->Append(Make(kMatchName_Opacity));
  const TrackItemRef clip = AddClip(v1, {Make(kMatchName_Opacity)});
  Open();
  Select({clip});
  const EffectItem* own = FirstRow();
  list->SetMasterClip(masterClip);
  list->DoSequenceClipSelectionChanged(sequence);
  EXPECT_NE(FirstRow(), own);
  EXPECT_EQ(list->GetVideoChain(), masterClip->GetVideoChain());
  list->ClearMasterClip();
  list->DoSequenceClipSelectionChanged(sequence);
  EXPECT_EQ(list->GetVideoChain(), clip->GetComponentChain());
}

TEST_F(ListRebuildTest, ATransitionThatGainsItsOwnEffectsIsRebuiltUnderTheSameSelection) {
  TransitionData data;
  data.matchName = "XO.KRVN CrossDissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 6 * kSecond, 7 * kSecond, data);
  v1->AddItem(transition);
  Open();
  Select({transition});
  ASSERT_EQ(list->GetTargetKind(), EffectControlsListView::kTargetTransition);
  const EffectItem* row = FirstRow();
  transition->GetComponentChain()->Append(Make(kMatchName_Opacity));
  list->DoSequenceClipSelectionChanged(sequence);
  EXPECT_EQ(list->GetTargetKind(), EffectControlsListView::kTargetTransitionComponent);
  EXPECT_EQ(list->GetTransitionChain(), transition->GetComponentChain());
  EXPECT_NE(FirstRow(), row);
}

TEST_F(ListRebuildTest, ATransitionNoLongerAllowedIsDroppedUnderTheSameSelection) {
  auto modal = std::make_shared<ViewModeListView>(nullptr, "EffectControlsTest.ModalList");
  ViewHost window(kWindow);
  window.SetRootView(modal);
  TransitionData data;
  data.matchName = "XO.KRVN CrossDissolve";
  const TrackItemRef transition =
      TrackItem::CreateTransition(MediaType::Video, 6 * kSecond, 7 * kSecond, data);
  v1->AddItem(transition);
  sequence->SetSelection({transition});
  modal->DoSequenceClipSelectionChanged(sequence);
  ASSERT_EQ(modal->GetVideoItems().Size(), 1u);
  modal->allowTransitions = false;
  modal->DoSequenceClipSelectionChanged(sequence);
  EXPECT_EQ(modal->GetTargetKind(), EffectControlsListView::kTargetClip);
  EXPECT_FALSE(modal->GetShowVideo());
  EXPECT_TRUE(modal->GetVideoItems().IsEmpty());
  modal->Destroy();
}

TEST_F(ListRebuildTest, AnotherSequenceIsAnotherTargetEvenWithNothingSelectedInEither) {
  const SequenceRef other = Sequence::Create("Sequence 02", kFrameRate_25);
  project->AddSequence(other);
  Open();
  list->DoSequenceClipSelectionChanged(sequence);
  ASSERT_TRUE(list->GetBuiltTarget().has_value());
  list->DoSequenceClipSelectionChanged(other);
  ASSERT_TRUE(list->GetBuiltTarget().has_value());
  EXPECT_EQ(list->GetBuiltTarget()->sequence, other);
}

}  // namespace
