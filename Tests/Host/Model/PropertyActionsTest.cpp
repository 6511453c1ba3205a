#include <gtest/gtest.h>

#include "Host/Messaging/FunctionListener.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/SequenceSettingsActions.h"
#include "Host/Model/TrackItemActions.h"
#include "ModelTestFixture.h"

namespace {

class PropertyActionsTest : public ModelTest {};

TEST_F(PropertyActionsTest, FrameAlignmentIsUndoableAndAnnouncedAsAProperty) {
  std::vector<std::string> keys;
  FunctionListener listener([&](const Message& message) {
    if (const auto* changed = message.As<PropertiesChangedMessage>()) {
      EXPECT_EQ(changed->objectID, sequence->GetID());
      keys.insert(keys.end(), changed->keys.begin(), changed->keys.end());
    }
  });
  AddListener(sequence->GetStation(), listener);
  MessageRecorder recorder;
  recorder.Listen(sequence->GetStation());
  CheckUndoRoundTrip(
      {.name = SequenceSettingsActions::kSetFrameAlignment,
       .edit = [&] { return SequenceSettingsActions::SetAudioFrameAligned(sequence, true); },
       .checkEdited =
           [&] {
             EXPECT_TRUE(sequence->IsAudioFrameAligned());
             EXPECT_EQ(SequenceSettingsActions::SetAudioFrameAligned(sequence, true),
                       EditStatus::NoChange);
           },
       .messages = {"PropertiesChangedMessage"}},
      recorder);
  EXPECT_FALSE(sequence->IsAudioFrameAligned());
  // Do, undo, redo and the closing undo.
  EXPECT_EQ(keys, std::vector<std::string>(4, "MZ.FrameAlignment"));
}

TEST_F(PropertyActionsTest, TheZeroPointIsUndoable) {
  MessageRecorder recorder;
  recorder.Listen(sequence->GetStation());
  CheckUndoRoundTrip(
      {.name = SequenceSettingsActions::kSetZeroPoint,
       .edit = [&] { return SequenceSettingsActions::SetZeroPoint(sequence, 3600 * kSecond); },
       .messages = {"SequenceZeroPointChangedMessage"}},
      recorder);
  EXPECT_EQ(sequence->GetZeroPoint(), 0);
  EXPECT_EQ(SequenceSettingsActions::SetZeroPoint(sequence, kTime_Max),
            EditStatus::InvalidArgument);
}

TEST_F(PropertyActionsTest, RenamingAnItemAndUndoingShowsTheMasterClipNameAgain) {
  CheckUndoRoundTrip({.name = TrackItemActions::kSetName,
                      .edit = [&] { return TrackItemActions::SetName(video, "Close-up"); },
                      .checkEdited = [&] { EXPECT_EQ(video->GetName(), "Close-up"); }});
  masterClip->SetName("Interview 2");
  EXPECT_EQ(video->GetName(), "Interview 2");
}

TEST_F(PropertyActionsTest, TheLabelColourIsUndoableAndSendsATrackItemChange) {
  MessageRecorder recorder;
  recorder.Listen(video->GetStation());
  const std::uint32_t before = video->GetLabelColor();
  CheckUndoRoundTrip({.name = TrackItemActions::kSetLabelColor,
                      .edit = [&] { return TrackItemActions::SetLabelColor(video, 0xFF0000); },
                      .checkEdited =
                          [&] {
                            EXPECT_EQ(TrackItemActions::SetLabelColor(video, 0xFF0000),
                                      EditStatus::NoChange);
                          },
                      .messages = {"TrackItemChangedMessage"}},
                     recorder);
  EXPECT_EQ(video->GetLabelColor(), before);
}

TEST_F(PropertyActionsTest, ARefusedEditOnAReadOnlyProjectChangesNothing) {
  project->SetReadOnly(true);
  EXPECT_EQ(TrackItemActions::SetIntroOutroLocked(video, true), EditStatus::ReadOnly);
  EXPECT_FALSE(video->AreIntroOutroLocked());
  EXPECT_FALSE(Undo().CanUndo());
}

}  // namespace
