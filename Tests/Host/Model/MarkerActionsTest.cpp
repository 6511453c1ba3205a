#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Model/MarkerActions.h"
#include "Host/Model/Markers.h"
#include "Host/Model/ModelMessages.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

Marker At1(TickTime time) {
  Marker marker;
  marker.time = time;
  return marker;
}

class MarkerActionsTest : public EditingModelTest {
 protected:
  static Marker At(TickTime time, std::string name) {
    Marker marker;
    marker.time = time;
    marker.name = std::move(name);
    return marker;
  }
  // "name@second" of each sequence marker, in order.
  std::string Names() const {
    std::string text;
    for (const Marker& marker : sequence->GetMarkers().All()) {
      text += (text.empty() ? "" : " ") + marker.name + "@" + std::to_string(marker.time / kSec);
    }
    return text;
  }
  void AddThree() {
    ASSERT_EQ(MarkerActions::AddMarker(sequence, At(kSec, "a")), EditStatus::Done);
    ASSERT_EQ(MarkerActions::AddMarker(sequence, At(kSec, "b")), EditStatus::Done);
    ASSERT_EQ(MarkerActions::AddMarker(sequence, At(2 * kSec, "c")), EditStatus::Done);
  }
};

TEST_F(MarkerActionsTest, ChangingAMarkerIsOneStepThatUndoAndRedoMirror) {
  AddThree();
  Marker edited = sequence->GetMarkers().At(1);
  edited.name = "renamed";
  edited.comment = "a note";
  edited.colorIndex = 5;
  edited.duration = kSec;
  CheckUndoRoundTrip({.name = MarkerActions::kChangeMarker,
                      .edit = [&] { return MarkerActions::ChangeMarker(sequence, 1, edited); },
                      .checkEdited = [&] { EXPECT_EQ(sequence->GetMarkers().At(1), edited); },
                      .messages = {"MarkersChangedMessage"}});
}

TEST_F(MarkerActionsTest, UndoPutsAMarkerBackInItsPlaceAmongMarkersAtTheSameTime) {
  AddThree();
  ASSERT_EQ(Names(), "a@1 b@1 c@2");
  // Removing the first of two markers at one time, then undoing, must not swap them.
  ASSERT_EQ(MarkerActions::RemoveMarker(sequence, 0), EditStatus::Done);
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(Names(), "a@1 b@1 c@2");
  // A move to a time that already has a marker lands after it; undo returns it to its index.
  ASSERT_EQ(MarkerActions::MoveMarker(sequence, 0, 2 * kSec), EditStatus::Done);
  EXPECT_EQ(Names(), "b@1 c@2 a@2");
  ASSERT_TRUE(project->GetUndoStack().Undo());
  EXPECT_EQ(Names(), "a@1 b@1 c@2");
  ASSERT_TRUE(project->GetUndoStack().Redo());
  EXPECT_EQ(Names(), "b@1 c@2 a@2");
}

TEST_F(MarkerActionsTest, ManyEditsUndoneAndRedoneInAnyMixReturnToEachState) {
  std::vector<std::string> states{Names()};
  for (int i = 0; i < 12; ++i) {
    EditStatus status = EditStatus::NoChange;
    switch (i % 4) {
      case 0:
      case 1:
        status = MarkerActions::AddMarker(sequence, At((i % 3) * kSec, "m" + std::to_string(i)));
        break;
      case 2:
        status = MarkerActions::MoveMarker(sequence, 0, (i % 5) * kSec + kSec / 2);
        break;
      case 3:
        status = MarkerActions::RemoveMarker(sequence, 1);
        break;
    }
    ASSERT_EQ(status, EditStatus::Done) << "edit " << i;
    states.push_back(Names());
  }
  for (auto it = states.rbegin() + 1; it != states.rend(); ++it) {
    ASSERT_TRUE(project->GetUndoStack().Undo());
    EXPECT_EQ(Names(), *it);
  }
  for (std::size_t i = 1; i < states.size(); ++i) {
    ASSERT_TRUE(project->GetUndoStack().Redo());
    EXPECT_EQ(Names(), states[i]);
  }
}

TEST_F(MarkerActionsTest, BadChangesAreRefusedWithoutAStep) {
  AddThree();
  const std::string before = State();
  const std::size_t steps = project->GetUndoStack().GetUndoNames().size();
  Marker bad = sequence->GetMarkers().At(0);
  bad.duration = -kSec;
  EXPECT_EQ(MarkerActions::ChangeMarker(sequence, 0, bad), EditStatus::InvalidArgument);
  bad.duration = kTime_Max;
  EXPECT_EQ(MarkerActions::ChangeMarker(sequence, 0, bad), EditStatus::InvalidArgument);
  bad = sequence->GetMarkers().At(0);
  bad.colorIndex = -1;
  EXPECT_EQ(MarkerActions::ChangeMarker(sequence, 0, bad), EditStatus::InvalidArgument);
  EXPECT_EQ(MarkerActions::ChangeMarker(sequence, 3, At(kSec, "x")), EditStatus::NotFound);
  EXPECT_EQ(MarkerActions::ChangeMarker(sequence, 0, sequence->GetMarkers().At(0)),
            EditStatus::NoChange);
  EXPECT_EQ(State(), before);
  EXPECT_EQ(project->GetUndoStack().GetUndoNames().size(), steps);
}

TEST(MarkerOrder, InsertAtRefusesAPlaceThatBreaksTheOrderByTime) {
  Markers markers;
  ASSERT_TRUE(markers.Add(At1(kSec)));
  ASSERT_TRUE(markers.Add(At1(3 * kSec)));
  EXPECT_FALSE(markers.InsertAt(0, At1(2 * kSec)));
  EXPECT_FALSE(markers.InsertAt(3, At1(4 * kSec)));
  EXPECT_TRUE(markers.InsertAt(1, At1(2 * kSec)));
  EXPECT_EQ(markers.At(1).time, 2 * kSec);
}

}  // namespace
