#include <gtest/gtest.h>

#include <cmath>
#include <memory>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/KeyframeHandleActor.h"
#include "Host/Model/KeyframeMultiSelection.h"
#include "Host/Model/KeyframeMultiSelectionActor.h"
#include "Host/Model/KeyframeMultiSelectionEditor.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

class KeyframeSelectionTest : public EditingModelTest {
 protected:
  KeyframeSelectionTest() {
    blurriness = blur->FindParam("Blurriness");
    dimensions = blur->FindParam("Blur Dimensions");
    motion = a->GetComponentChain()->FindByMatchName(kMatchName_Motion);
    position = motion->FindParam("Position");
    // Clip A shows clip time [2 s, 7 s).
    Keys(blurriness, {{2 * kSec, 0.0}, {3 * kSec, 10.0}, {4 * kSec, 20.0}, {6 * kSec, 5.0}});
    selection = std::make_shared<KeyframeMultiSelection>(sequence);
  }

  static void Keys(const ComponentParamRef& param, std::vector<std::pair<TickTime, double>> keys) {
    ComponentParam::State state = param->GetState();
    state.timeVarying = true;
    state.keyframes.Clear();
    for (auto [time, value] : keys) {
      Keyframe k;
      k.time = time;
      k.value = value;
      ASSERT_EQ(state.keyframes.Add(k), CurveStatus::Ok);
    }
    param->ApplyState(state);
  }

  std::vector<TickTime> Times(const ComponentParamRef& param) const {
    return param->GetKeyframeTimes();
  }

  void Select(const ComponentParamRef& param, TickTime time) {
    ASSERT_TRUE(selection->AddItem(a, ComponentRef(param->GetComponent()), param, time));
  }

  ComponentParamRef blurriness;
  ComponentParamRef dimensions;
  ComponentRef motion;
  ComponentParamRef position;
  std::shared_ptr<KeyframeMultiSelection> selection;
};

TEST_F(KeyframeSelectionTest, OnlyExistingKeyframesCanBeSelected) {
  EXPECT_FALSE(selection->AddItem(a, blur, blurriness, 2 * kSec + 1));
  EXPECT_TRUE(selection->AddItem(a, blur, blurriness, 3 * kSec));
  EXPECT_FALSE(selection->AddItem(a, blur, blurriness, 3 * kSec));  // already selected
  EXPECT_EQ(selection->GetKeyframeCount(), 1u);
  EXPECT_TRUE(selection->Contains(blurriness.get(), 3 * kSec));
  EXPECT_FALSE(selection->Contains(blurriness.get(), 4 * kSec));
}

TEST_F(KeyframeSelectionTest, AddAllInvertAndCloneAreIndependentSets) {
  selection->AddAllItems(a, blur, blurriness);
  EXPECT_EQ(selection->GetKeyframeCount(), 4u);

  auto snapshot = selection->Clone();
  KeyframeMultiSelection toggled(sequence);
  toggled.AddItem(a, blur, blurriness, 2 * kSec);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 3 * kSec), EditStatus::Done);
  toggled.AddItem(a, motion, position, 3 * kSec);
  selection->InvertItems(toggled);

  EXPECT_FALSE(selection->Contains(blurriness.get(), 2 * kSec));
  EXPECT_TRUE(selection->Contains(position.get(), 3 * kSec));
  EXPECT_EQ(selection->GetKeyframeCount(), 4u);
  EXPECT_EQ(snapshot->GetKeyframeCount(), 4u);
  EXPECT_TRUE(snapshot->Contains(blurriness.get(), 2 * kSec));
}

TEST_F(KeyframeSelectionTest, StaleTimesAreIgnoredUntilPruned) {
  Select(blurriness, 3 * kSec);
  Select(blurriness, 4 * kSec);
  ASSERT_EQ(ComponentParamActions::RemoveKeyframe(blurriness, 3 * kSec), EditStatus::Done);
  EXPECT_EQ(selection->GetKeyframeCount(), 1u);
  EXPECT_FALSE(selection->Contains(blurriness.get(), 3 * kSec));
  EXPECT_EQ(selection->GetAllSelections().front().GetTimes().size(), 2u);
  selection->Prune();
  EXPECT_EQ(selection->GetAllSelections().front().GetTimes().size(), 1u);
}

TEST_F(KeyframeSelectionTest, CapabilitiesFollowTheKindsOfTheSelectedKeyframes) {
  EXPECT_FALSE(selection->SupportsInterpolationMode(kInterpolationCapabilityHold));
  ASSERT_EQ(ComponentParamActions::AddKeyframe(dimensions, 3 * kSec), EditStatus::Done);
  Select(dimensions, 3 * kSec);
  // A menu cannot be interpolated: only Hold applies.
  EXPECT_TRUE(selection->SupportsInterpolationMode(kInterpolationCapabilityHold));
  EXPECT_FALSE(selection->SupportsInterpolationMode(kInterpolationCapabilityLinear));
  EXPECT_FALSE(selection->SupportsInterpolationMode(kInterpolationCapabilityBezier));
  EXPECT_TRUE(selection->HasNonSpatialKeyframe());
  EXPECT_FALSE(selection->HasSpatialKeyframe());

  Select(blurriness, 4 * kSec);
  EXPECT_TRUE(selection->SupportsInterpolationMode(kInterpolationCapabilityLinear));
  EXPECT_TRUE(selection->SupportsInterpolationMode(kInterpolationCapabilityBezier));
  EXPECT_FALSE(selection->SupportsInterpolationMode(3));  // not a capability code
}

TEST_F(KeyframeSelectionTest, ModeMatchesOnlyWhenEverySelectedKeyframeHasTheMode) {
  Select(blurriness, 3 * kSec);
  Select(blurriness, 4 * kSec);
  EXPECT_TRUE(selection->TemporalInterpolationModeMatches(1));
  EXPECT_FALSE(selection->TemporalInterpolationModeMatches(2));
  ASSERT_EQ(ComponentParamActions::SetTemporalInterpolation(blurriness, 4 * kSec,
                                                            TemporalInterpolation::Bezier),
            EditStatus::Done);
  EXPECT_FALSE(selection->TemporalInterpolationModeMatches(1));
  EXPECT_FALSE(selection->SpatialInterpolationModeMatches(1));  // no spatial keyframe

  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 3 * kSec), EditStatus::Done);
  Select(position, 3 * kSec);
  EXPECT_TRUE(selection->HasSpatialKeyframe());
  EXPECT_TRUE(selection->SpatialInterpolationModeMatches(1));
  EXPECT_FALSE(selection->SpatialInterpolationModeMatches(2));
}

TEST_F(KeyframeSelectionTest, TemporalInterpolationIsOneUndoStepOverAllParameters) {
  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 3 * kSec), EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(dimensions, 3 * kSec), EditStatus::Done);
  Select(blurriness, 3 * kSec);
  Select(blurriness, 6 * kSec);
  Select(position, 3 * kSec);
  Select(dimensions, 3 * kSec);
  CheckUndoRoundTrip({.name = kKeyframeActionSetTemporalInterpolation,
                      .edit = [&] { return selection->SetKeyframeTemporalInterpolation(2); },
                      .checkEdited =
                          [&] {
                            EXPECT_TRUE(selection->TemporalInterpolationModeMatches(2) ==
                                        false);  // the menu stays
                            const KeyframeCurve& curve = blurriness->GetKeyframes();
                            EXPECT_EQ(curve.At(*curve.FindAt(3 * kSec)).interpolation,
                                      TemporalInterpolation::Bezier);
                            EXPECT_EQ(curve.At(*curve.FindAt(6 * kSec)).interpolation,
                                      TemporalInterpolation::Bezier);
                            EXPECT_EQ(curve.At(*curve.FindAt(4 * kSec)).interpolation,
                                      TemporalInterpolation::Linear);
                            EXPECT_EQ(position->GetKeyframes().At(0).interpolation,
                                      TemporalInterpolation::Bezier);
                            EXPECT_NE(dimensions->GetKeyframes().At(0).interpolation,
                                      TemporalInterpolation::Bezier);
                          }});
}

TEST_F(KeyframeSelectionTest, SettingTheModeItAlreadyHasMakesNoUndoStep) {
  Select(blurriness, 3 * kSec);
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  EXPECT_EQ(selection->SetKeyframeTemporalInterpolation(1), EditStatus::NoChange);
  EXPECT_EQ(selection->SetKeyframeTemporalInterpolation(9), EditStatus::InvalidArgument);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);
}

TEST_F(KeyframeSelectionTest, SpatialInterpolationChangesOnlyPointKeyframes) {
  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 3 * kSec, ParamPoint{0, 0}),
            EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 5 * kSec, ParamPoint{100, 0}),
            EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(position, 6 * kSec, ParamPoint{100, 100}),
            EditStatus::Done);
  Select(position, 5 * kSec);
  Select(blurriness, 3 * kSec);
  const std::string blurBefore = DescribeForTest(*blurriness);
  const std::string before = State();
  ASSERT_EQ(selection->SetKeyframeSpatialInterpolation(4), EditStatus::Done);
  EXPECT_EQ(position->GetKeyframes().At(1).spatial, SpatialInterpolation::AutoBezier);
  EXPECT_EQ(position->GetKeyframes().At(0).spatial, SpatialInterpolation::Linear);
  EXPECT_EQ(DescribeForTest(*blurriness), blurBefore);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(KeyframeSelectionTest, EaseInFlattensTheIncomingSideAndUndoRestores) {
  Select(blurriness, 4 * kSec);
  CheckUndoRoundTrip({.name = kKeyframeActionApplyAutomaticEase,
                      .edit = [&] { return selection->ApplyAutomaticEase(0); },
                      .checkEdited =
                          [&] {
                            const Keyframe& eased = blurriness->GetKeyframes().At(2);
                            EXPECT_EQ(eased.inSpeed, 0.0);
                            EXPECT_EQ(eased.interpolation, TemporalInterpolation::Bezier);
                          }});
}

TEST_F(KeyframeSelectionTest, RemovingEveryKeyframeKeepsTheFirstValueAsConstant) {
  selection->AddAllItems(a, blur, blurriness);
  const std::string before = State();
  ASSERT_EQ(selection->RemoveSelectionFromComponentParams(a), EditStatus::Done);
  EXPECT_FALSE(blurriness->HasKeyframes());
  EXPECT_EQ(blurriness->GetValueAt(5 * kSec), ParamValue(0.0));
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(KeyframeSelectionTest, RemovalForAnotherTrackItemLeavesTheseKeyframes) {
  Select(blurriness, 3 * kSec);
  EXPECT_EQ(selection->RemoveSelectionFromComponentParams(b), EditStatus::NoChange);
  EXPECT_EQ(blurriness->GetKeyframes().Size(), 4u);
}

TEST_F(KeyframeSelectionTest, ReadOnlyParameterRefusesEdits) {
  Select(blurriness, 3 * kSec);
  blurriness->SetReadOnly(true);
  const std::string before = State();
  EXPECT_EQ(selection->SetKeyframeTemporalInterpolation(0), EditStatus::ReadOnly);
  EXPECT_EQ(selection->RemoveSelectionFromComponentParams(), EditStatus::ReadOnly);
  EXPECT_EQ(State(), before);
}

// --- Move actor ---

TEST_F(KeyframeSelectionTest, MoveStopsOneFrameBeforeTheNextUnselectedKeyframe) {
  Select(blurriness, 3 * kSec);
  KeyframeMultiSelectionActor actor(sequence, selection);
  TickTime delta = 5 * kSec;
  EXPECT_TRUE(actor.QueryMoveSelection(delta));
  EXPECT_EQ(delta, kSec - kFrame25);  // the keyframe at 4 s stays
  delta = -5 * kSec;
  EXPECT_TRUE(actor.QueryMoveSelection(delta));
  EXPECT_EQ(delta, -(kSec - kFrame25));  // the keyframe at 2 s stays
}

TEST_F(KeyframeSelectionTest, MoveOfABlockIsLimitedByTheClipBounds) {
  // Keys at 4 s and 6 s move together; the clip shows clip time [2 s, 7 s).
  Select(blurriness, 4 * kSec);
  Select(blurriness, 6 * kSec);
  KeyframeMultiSelectionActor actor(sequence, selection);
  EXPECT_EQ(actor.GetMaximumMoveDelta(), kSec);  // 6 s reaches the clip end at 7 s
  EXPECT_EQ(actor.GetMinimumMoveDelta(), -(kSec - kFrame25));
  EXPECT_EQ(actor.MoveSelection(10 * kSec), kSec);
  EXPECT_EQ(Times(blurriness), (std::vector<TickTime>{2 * kSec, 3 * kSec, 5 * kSec, 7 * kSec}));
  // Already at the limit: nothing more to the right.
  TickTime more = kFrame25;
  EXPECT_FALSE(actor.QueryMoveSelection(more));
  EXPECT_EQ(more, 0);
}

TEST_F(KeyframeSelectionTest, LiveMoveCommitsAsOneStepAndUndoRestoresExactly) {
  Select(blurriness, 3 * kSec);
  Select(blurriness, 4 * kSec);
  const std::string before = State();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  {
    KeyframeMultiSelectionActor actor(sequence, selection);
    actor.MoveSelection(kFrame25);
    actor.MoveSelection(kFrame25);
    EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);  // live: no step yet
    EXPECT_TRUE(selection->Contains(blurriness.get(), 3 * kSec + 2 * kFrame25));
    EXPECT_EQ(actor.CommitMoveSelection(), EditStatus::Done);
  }
  EXPECT_EQ(Times(blurriness), (std::vector<TickTime>{2 * kSec, 3 * kSec + 2 * kFrame25,
                                                      4 * kSec + 2 * kFrame25, 6 * kSec}));
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps + 1);
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), kKeyframeActionMoveKeyframes);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
  ASSERT_TRUE(project->GetUndoStack().Redo());
  EXPECT_EQ(Times(blurriness)[1], 3 * kSec + 2 * kFrame25);
}

TEST_F(KeyframeSelectionTest, RollbackAndDroppingAnUncommittedActorRestoreTheKeyframes) {
  Select(blurriness, 3 * kSec);
  const std::string before = State();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  {
    KeyframeMultiSelectionActor actor(sequence, selection);
    actor.MoveSelection(5 * kFrame25);
    actor.RollbackMoveSelection();
    EXPECT_EQ(State(), before);
    actor.MoveSelection(-3 * kFrame25);
  }
  EXPECT_EQ(State(), before);
  EXPECT_TRUE(selection->Contains(blurriness.get(), 3 * kSec));
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);
}

TEST_F(KeyframeSelectionTest, ValueMoveIsLimitedToTheParameterRange) {
  Select(blurriness, 3 * kSec);
  KeyframeMultiSelectionActor actor(sequence, selection);
  ASSERT_TRUE(actor.MoveSelectionTo(kFrame25, -50.0));
  EXPECT_EQ(blurriness->GetValueAt(3 * kSec + kFrame25), ParamValue(0.0));
  ASSERT_TRUE(actor.MoveSelectionTo(0, 2.5));
  EXPECT_EQ(blurriness->GetValueAt(3 * kSec), ParamValue(12.5));
  EXPECT_EQ(actor.CommitMoveSelection(), EditStatus::Done);
}

TEST_F(KeyframeSelectionTest, ReadOnlyProjectAllowsNoMove) {
  Select(blurriness, 3 * kSec);
  project->SetReadOnly(true);
  KeyframeMultiSelectionActor actor(sequence, selection);
  TickTime delta = kFrame25;
  EXPECT_FALSE(actor.QueryMoveSelection(delta));
  EXPECT_EQ(actor.MoveSelection(kFrame25), 0);
  EXPECT_FALSE(actor.MoveSelectionTo(kFrame25));
  EXPECT_EQ(Times(blurriness)[1], 3 * kSec);
}

TEST_F(KeyframeSelectionTest, GainKeyframesMoveInDecibelsWhenAskedTo) {
  const ComponentRef volume = aAudio->GetComponentChain()->FindByMatchName(kMatchName_Volume);
  const ComponentParamRef level = volume->FindParam("Level");
  Keys(level, {{3 * kSec, 1.0}});
  ASSERT_TRUE(selection->AddItem(aAudio, volume, level, 3 * kSec));
  KeyframeMultiSelectionActor actor(sequence, selection);
  actor.SetScaleDB(true);
  ASSERT_TRUE(actor.MoveSelectionTo(0, -6.0));
  EXPECT_NEAR(*level->GetScalarAt(3 * kSec), std::pow(10.0, -6.0 / 20.0), 1e-12);
  actor.SetScaleDB(false);
  ASSERT_TRUE(actor.MoveSelectionTo(0, 0.5));
  EXPECT_NEAR(*level->GetScalarAt(3 * kSec), 1.5, 1e-12);
}

// --- Clipboard ---

TEST_F(KeyframeSelectionTest, CopyThenPasteAtANewTimeKeepsDistancesAndValues) {
  Select(blurriness, 3 * kSec);
  Select(blurriness, 4 * kSec);
  ASSERT_TRUE(KeyframeMultiSelectionEditor::Copy(*selection, sequence));
  // Paste into clip A itself at sequence time 3 s = clip time 5 s.
  sequence->SetCurrentTime(3 * kSec);
  const std::string before = State();
  ASSERT_EQ(KeyframeMultiSelectionEditor::Paste(sequence, a->GetComponentChain(), selection.get()),
            EditStatus::Done);
  // 3 s and 4 s land at 5 s and 6 s; the one at 6 s (value 5) is replaced.
  EXPECT_EQ(Times(blurriness),
            (std::vector<TickTime>{2 * kSec, 3 * kSec, 4 * kSec, 5 * kSec, 6 * kSec}));
  EXPECT_EQ(blurriness->GetValueAt(5 * kSec), ParamValue(10.0));
  EXPECT_EQ(blurriness->GetValueAt(6 * kSec), ParamValue(20.0));
  // The pasted keyframes become the selection.
  EXPECT_EQ(selection->GetKeyframeCount(), 2u);
  EXPECT_TRUE(selection->Contains(blurriness.get(), 6 * kSec));
  EXPECT_FALSE(selection->Contains(blurriness.get(), 3 * kSec));
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), kKeyframeActionPaste);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(KeyframeSelectionTest, PasteOntoAnotherClipFindsTheSameEffectParameter) {
  Select(blurriness, 3 * kSec);
  ASSERT_TRUE(KeyframeMultiSelectionEditor::Copy(*selection, sequence));
  EXPECT_FALSE(KeyframeMultiSelectionEditor::PasteValid(sequence, b->GetComponentChain()));
  ComponentRef blurOnB = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
  b->GetComponentChain()->Append(blurOnB);
  ASSERT_TRUE(KeyframeMultiSelectionEditor::PasteValid(sequence, b->GetComponentChain()));
  sequence->SetCurrentTime(6 * kSec);  // clip B's clip time 4 s
  ASSERT_EQ(KeyframeMultiSelectionEditor::Paste(sequence, b->GetComponentChain()),
            EditStatus::Done);
  const ComponentParamRef target = blurOnB->FindParam("Blurriness");
  EXPECT_TRUE(target->IsTimeVarying());
  EXPECT_EQ(target->GetKeyframeTimes(), std::vector<TickTime>{4 * kSec});
  EXPECT_EQ(target->GetValueAt(4 * kSec), ParamValue(10.0));
}

TEST_F(KeyframeSelectionTest, PasteReplacesAKeyframeAtTheSameTime) {
  Select(blurriness, 3 * kSec);
  ASSERT_TRUE(KeyframeMultiSelectionEditor::Copy(*selection, sequence));
  sequence->SetCurrentTime(2 * kSec);  // clip time 4 s, where 20 is
  ASSERT_EQ(KeyframeMultiSelectionEditor::Paste(sequence, a->GetComponentChain()),
            EditStatus::Done);
  EXPECT_EQ(blurriness->GetKeyframes().Size(), 4u);
  EXPECT_EQ(blurriness->GetValueAt(4 * kSec), ParamValue(10.0));
}

TEST_F(KeyframeSelectionTest, CutRemovesAsOneStepAndEmptiesTheSelection) {
  Select(blurriness, 3 * kSec);
  Select(blurriness, 6 * kSec);
  const std::string before = State();
  ASSERT_EQ(KeyframeMultiSelectionEditor::Cut(*selection, sequence, a->GetComponentChain()),
            EditStatus::Done);
  EXPECT_EQ(Times(blurriness), (std::vector<TickTime>{2 * kSec, 4 * kSec}));
  EXPECT_TRUE(selection->IsEmpty());
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), kKeyframeActionCut);
  ASSERT_TRUE(project->GetClipboard().GetItem() != nullptr);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
  // What was cut can be pasted back.
  sequence->SetCurrentTime(0);
  EXPECT_TRUE(KeyframeMultiSelectionEditor::PasteValid(sequence, a->GetComponentChain()));
}

TEST_F(KeyframeSelectionTest, CopyWithNothingSelectedLeavesTheClipboard) {
  EXPECT_FALSE(KeyframeMultiSelectionEditor::Copy(*selection, sequence));
  EXPECT_TRUE(project->GetClipboard().IsEmpty());
  EXPECT_EQ(KeyframeMultiSelectionEditor::Paste(sequence, a->GetComponentChain()),
            EditStatus::NoChange);
}

// --- Handles ---

TEST_F(KeyframeSelectionTest, DraggingAValueHandleUpSteepensTheOutgoingSide) {
  // Keys 10 at 3 s and 20 at 4 s: a straight 10 per second.
  const std::string before = State();
  {
    KeyframeHandleActor actor(blurriness, 3 * kSec, KeyframeSide::Out,
                              KeyframeHandleActor::Graph::Value);
    ASSERT_TRUE(actor.IsValid());
    // The handle sits a third of the way (1/3 s, value 13.33); lift it by 2.
    ASSERT_TRUE(actor.MoveTo(0, 2.0));
    const Keyframe& key = blurriness->GetKeyframes().At(1);
    EXPECT_EQ(key.interpolation, TemporalInterpolation::Bezier);
    EXPECT_NEAR(key.outSpeed, 16.0, 1e-6);
    EXPECT_NEAR(key.outInfluence, kDefaultInfluence, 1e-9);
    // Dragged past the segment's middle, the handle stops there.
    ASSERT_TRUE(actor.MoveTo(5 * kSec, 0.0));
    EXPECT_NEAR(blurriness->GetKeyframes().At(1).outInfluence, kMaximumInfluence, 1e-9);
    EXPECT_EQ(actor.Commit(), EditStatus::Done);
  }
  EXPECT_EQ(project->GetUndoStack().GetUndoName(), kKeyframeActionMoveHandle);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(State(), before);
}

TEST_F(KeyframeSelectionTest, VelocityHandleAddsToTheSpeedAndTheLastKeyHasNoOutgoingHandle) {
  KeyframeHandleActor last(blurriness, 6 * kSec, KeyframeSide::Out,
                           KeyframeHandleActor::Graph::Velocity);
  EXPECT_FALSE(last.IsValid());
  EXPECT_FALSE(last.MoveTo(0, 1.0));
  const std::string before = State();
  {
    KeyframeHandleActor actor(blurriness, 4 * kSec, KeyframeSide::In,
                              KeyframeHandleActor::Graph::Velocity);
    ASSERT_TRUE(actor.MoveTo(0, -4.0));
    EXPECT_NEAR(blurriness->GetKeyframes().At(2).inSpeed, 6.0, 1e-9);
  }
  EXPECT_EQ(State(), before);  // dropped without a commit
}

}  // namespace
