#include <gtest/gtest.h>

#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/IntroOutroActions.h"
#include "Host/Model/MarkerActions.h"
#include "Host/Model/MasterClipEffects.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/SequenceActions.h"
#include "Host/Model/SequencePropertyActions.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

class TimelinePropertyActionsTest : public EditingModelTest {
 protected:
  static Marker At(TickTime time, std::string name) {
    Marker marker;
    marker.time = time;
    marker.name = std::move(name);
    return marker;
  }
  std::vector<std::string> SequenceMarkerNames() const {
    std::vector<std::string> names;
    for (const Marker& marker : sequence->GetMarkers().All()) {
      names.push_back(marker.name);
    }
    return names;
  }
};

TEST_F(TimelinePropertyActionsTest, MarkersAddMoveRemoveAndClearAreEachUndoable) {
  MessageRecorder log;
  log.Listen(sequence->GetStation());
  ASSERT_EQ(MarkerActions::AddMarker(sequence, At(3 * kSec, "b")), EditStatus::Done);
  ASSERT_EQ(MarkerActions::AddMarker(sequence, At(kSec, "a")), EditStatus::Done);
  EXPECT_EQ(SequenceMarkerNames(), (std::vector<std::string>{"a", "b"}));
  const std::string twoMarkers = State();

  ASSERT_EQ(MarkerActions::MoveMarker(sequence, 0, 5 * kSec), EditStatus::Done);
  EXPECT_EQ(SequenceMarkerNames(), (std::vector<std::string>{"b", "a"}));
  ASSERT_EQ(MarkerActions::RemoveMarker(sequence, 0), EditStatus::Done);
  ASSERT_EQ(MarkerActions::ClearAllMarkers(sequence), EditStatus::Done);
  EXPECT_TRUE(sequence->GetMarkers().IsEmpty());
  EXPECT_EQ(log.Count("MarkersChangedMessage"), 5);
  for (int i = 0; i < 3; ++i) {
    ASSERT_TRUE(project->GetUndoStack().Undo());
  }
  EXPECT_EQ(State(), twoMarkers);
  EXPECT_EQ(log.Count("MarkersChangedMessage"), 8);
}

TEST_F(TimelinePropertyActionsTest, BadMarkerEditsChangeNothing) {
  ASSERT_EQ(MarkerActions::AddMarker(sequence, At(kSec, "a")), EditStatus::Done);
  const std::string before = State();
  EXPECT_EQ(MarkerActions::AddMarker(sequence, At(kTime_Max, "x")), EditStatus::InvalidArgument);
  Marker badColour = At(kSec, "c");
  badColour.colorIndex = 8;
  EXPECT_EQ(MarkerActions::AddMarker(sequence, badColour), EditStatus::InvalidArgument);
  EXPECT_EQ(MarkerActions::RemoveMarker(sequence, 4), EditStatus::NotFound);
  EXPECT_EQ(MarkerActions::MoveMarker(sequence, 0, kTime_Min), EditStatus::TimeOutOfRange);
  EXPECT_EQ(MarkerActions::MoveMarker(sequence, 0, kSec), EditStatus::NoChange);
  EXPECT_EQ(MarkerActions::ClearAllMarkers(MasterClipRef(clipA)), EditStatus::NoChange);
  EXPECT_EQ(State(), before);
}

TEST_F(TimelinePropertyActionsTest, MasterClipMarkersAreUndoable) {
  ASSERT_EQ(MarkerActions::AddMarker(clipA, At(2 * kSec, "take")), EditStatus::Done);
  EXPECT_EQ(clipA->GetMarkers().Size(), 1u);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_TRUE(clipA->GetMarkers().IsEmpty());
  clipA->SetReadOnly(true);
  EXPECT_EQ(MarkerActions::AddMarker(clipA, At(2 * kSec, "take")), EditStatus::ReadOnly);
}

TEST_F(TimelinePropertyActionsTest, InAndOutPointsStayOrderedAndAnnounceOnlyWhatChanged) {
  std::vector<std::string> keys;
  class KeyLog : public Listener {
   public:
    explicit KeyLog(std::vector<std::string>& keys) : mKeys(keys) {}
    void ListenToMessage(const Message& message) override {
      if (const auto* changed = message.As<PropertiesChangedMessage>()) {
        mKeys.insert(mKeys.end(), changed->keys.begin(), changed->keys.end());
      }
    }

   private:
    std::vector<std::string>& mKeys;
  } keyLog(keys);
  AddListener(sequence->GetStation(), keyLog);

  ASSERT_EQ(SequencePropertyActions::SetInPoint(sequence, kSec), EditStatus::Done);
  ASSERT_EQ(SequencePropertyActions::SetOutPoint(sequence, 9 * kSec), EditStatus::Done);
  EXPECT_EQ(SequencePropertyActions::SetInPoint(sequence, 10 * kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(SequencePropertyActions::SetOutPoint(sequence, -kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(SequencePropertyActions::SetInPoint(sequence, kSec), EditStatus::NoChange);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(sequence->GetInPoint(), kSec);
  EXPECT_FALSE(sequence->GetOutPoint().has_value());
  EXPECT_EQ(keys, (std::vector<std::string>{"MZ.InPoint", "MZ.OutPoint", "MZ.OutPoint"}));

  ASSERT_EQ(SequencePropertyActions::SetInOutPoints(sequence, std::nullopt, std::nullopt),
            EditStatus::Done);
  EXPECT_FALSE(sequence->GetInPoint().has_value());
  // A master clip's points lie within its media (20 s).
  EXPECT_EQ(SequencePropertyActions::SetOutPoint(clipA, 21 * kSec), EditStatus::TimeOutOfRange);
  EXPECT_EQ(SequencePropertyActions::SetOutPoint(clipA, 20 * kSec), EditStatus::Done);
}

TEST_F(TimelinePropertyActionsTest, IntroAndOutroLeaveAFrameBetweenThem) {
  EXPECT_EQ(IntroOutroActions::SetIntroDuration(c, kSec), EditStatus::InvalidArgument);
  clipB->SetGraphicsFlags(true, false, false);
  ASSERT_TRUE(IntroOutroActions::CanResize(*c));
  const std::string before = State();
  ASSERT_EQ(IntroOutroActions::SetIntroDuration(c, kSec), EditStatus::Done);
  // C lasts 2 s: the outro may take what is left but one frame.
  EXPECT_EQ(IntroOutroActions::GetMaximumOutroDuration(*c), kSec - kFrame25);
  EXPECT_EQ(IntroOutroActions::SetOutroDuration(c, kSec), EditStatus::TimeOutOfRange);
  ASSERT_EQ(IntroOutroActions::SetOutroDuration(c, kSec - kFrame25), EditStatus::Done);
  EXPECT_EQ(IntroOutroActions::SetIntroDuration(c, -1), EditStatus::TimeOutOfRange);
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), IntroOutroActions::kSetOutroDuration);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
  c->SetIntroOutroLocked(true);
  EXPECT_EQ(IntroOutroActions::SetIntroDuration(c, kSec), EditStatus::InvalidArgument);
}

TEST_F(TimelinePropertyActionsTest, EffectsApplyToClipsOfTheirMediaTypeOnly) {
  const EffectCatalogue& catalogue = EffectCatalogue::Standard();
  const std::vector<ComponentRef> effects{catalogue.Create(kMatchName_Tint),
                                          catalogue.Create(kMatchName_Delay)};
  EXPECT_TRUE(SequenceActions::QueryApplyTrackItemEffects(b, effects));
  EXPECT_FALSE(SequenceActions::QueryApplyTrackItemEffects(transition, effects));
  EXPECT_FALSE(SequenceActions::QueryApplyTrackItemEffects(
      b, {catalogue.Create(kMatchName_Motion)}));  // an intrinsic
  const std::string before = State();
  ASSERT_EQ(SequenceActions::InsertTrackItemEffects(b, effects, 0), EditStatus::Done);
  ASSERT_EQ(b->GetComponentChain()->GetCount(), 4);
  EXPECT_EQ(b->GetComponentChain()->GetAt(0)->GetMatchName(), kMatchName_Tint);
  EXPECT_NE(b->GetComponentChain()->GetAt(0), effects[0]);  // a copy
  ASSERT_EQ(SequenceActions::ApplyTrackItemEffects(bAudio, effects), EditStatus::Done);
  EXPECT_EQ(bAudio->GetComponentChain()->GetAt(3)->GetMatchName(), kMatchName_Delay);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(TimelinePropertyActionsTest, MasterClipEffectsRefuseAnInactiveProjectsClip) {
  const std::vector<ComponentRef> effects{EffectCatalogue::Standard().Create(kMatchName_Tint)};
  ASSERT_TRUE(MasterClipEffects::QueryApplyEffects(clipA, effects));
  ASSERT_EQ(MasterClipEffects::ApplyEffects(clipA, effects), EditStatus::Done);
  EXPECT_EQ(clipA->GetVideoChain()->GetCount(), 1);
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), MasterClipEffects::kApplyEffects);
  clipA->GetProperties().SetBool(kPropertyKey_FromInactiveProject, true);
  EXPECT_FALSE(MasterClipEffects::QueryApplyEffects(clipA, effects));
  EXPECT_EQ(MasterClipEffects::InsertEffects(clipA, effects, 0), EditStatus::ReadOnly);
  EXPECT_EQ(clipA->GetVideoChain()->GetCount(), 1);
}

TEST_F(TimelinePropertyActionsTest, RemoveAttributesDropsEffectsAndResetsIntrinsicsInOneStep) {
  const ComponentRef opacity = a->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(opacity->FindParam("Opacity"), 3 * kSec, 20.0),
            EditStatus::Done);
  CheckUndoRoundTrip({.name = SequenceActions::kRemoveAttributes,
                      .edit =
                          [&] {
                            return SequenceActions::RemoveAttributes({a, aAudio});
                          },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(a->GetComponentChain()->GetCount(), 3);
                            EXPECT_FALSE(opacity->FindParam("Opacity")->IsTimeVarying());
                            EXPECT_EQ(opacity->FindParam("Opacity")->GetConstantValue(),
                                      ParamValue(100.0));
                          }});
  EXPECT_EQ(SequenceActions::RemoveAttributes({c}), EditStatus::NoChange);
}

}  // namespace
