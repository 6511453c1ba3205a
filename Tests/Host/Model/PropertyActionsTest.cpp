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
  ASSERT_EQ(SequenceSettingsActions::SetAudioFrameAligned(sequence, true), EditStatus::Done);
  EXPECT_TRUE(sequence->IsAudioFrameAligned());
  EXPECT_EQ(SequenceSettingsActions::SetAudioFrameAligned(sequence, true), EditStatus::NoChange);
  Undo().Undo();
  EXPECT_FALSE(sequence->IsAudioFrameAligned());
  EXPECT_EQ(keys, (std::vector<std::string>{"MZ.FrameAlignment", "MZ.FrameAlignment"}));
}

TEST_F(PropertyActionsTest, TheZeroPointIsUndoable) {
  MessageRecorder recorder;
  recorder.Listen(sequence->GetStation());
  ASSERT_EQ(SequenceSettingsActions::SetZeroPoint(sequence, 3600 * kSecond), EditStatus::Done);
  Undo().Undo();
  EXPECT_EQ(sequence->GetZeroPoint(), 0);
  EXPECT_EQ(recorder.Count("SequenceZeroPointChangedMessage"), 2);
  EXPECT_EQ(SequenceSettingsActions::SetZeroPoint(sequence, kTime_Max),
            EditStatus::InvalidArgument);
}

TEST_F(PropertyActionsTest, RenamingAnItemAndUndoingShowsTheMasterClipNameAgain) {
  ASSERT_EQ(TrackItemActions::SetName(video, "Close-up"), EditStatus::Done);
  EXPECT_EQ(video->GetName(), "Close-up");
  Undo().Undo();
  masterClip->SetName("Interview 2");
  EXPECT_EQ(video->GetName(), "Interview 2");
}

TEST_F(PropertyActionsTest, TheLabelColourIsUndoableAndSendsATrackItemChange) {
  MessageRecorder recorder;
  recorder.Listen(video->GetStation());
  const std::uint32_t before = video->GetLabelColor();
  ASSERT_EQ(TrackItemActions::SetLabelColor(video, 0xFF0000), EditStatus::Done);
  EXPECT_EQ(TrackItemActions::SetLabelColor(video, 0xFF0000), EditStatus::NoChange);
  Undo().Undo();
  EXPECT_EQ(video->GetLabelColor(), before);
  EXPECT_EQ(recorder.Count("TrackItemChangedMessage"), 2);
}

TEST_F(PropertyActionsTest, ARefusedEditOnAReadOnlyProjectChangesNothing) {
  project->SetReadOnly(true);
  EXPECT_EQ(TrackItemActions::SetIntroOutroLocked(video, true), EditStatus::ReadOnly);
  EXPECT_FALSE(video->AreIntroOutroLocked());
  EXPECT_FALSE(Undo().CanUndo());
}

}  // namespace
