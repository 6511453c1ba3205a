// Playing and stepping the active sequence from the keys every panel shares.
#include <gtest/gtest.h>

#include <memory>

#include "Host/Messaging/MessageLoop.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Model/ManualPlayerClock.h"
#include "Host/Model/ProjectBuilder.h"
#include "Host/Model/Sequence.h"
#include "Host/Shell/Application.h"
#include "Host/Toolkit/StandardCommands.h"

namespace {

constexpr TickTime kSecond = kTicksPerSecond;

class TransportTest : public ::testing::Test {
 protected:
  TransportTest() {
    sequence = builder.AddSequence("Sequence");
    const TrackRef track = builder.AddTrack(sequence, MediaType::Video, "V1");
    const MasterClipRef clip = builder.AddMasterClip(
        "Clip", builder.AddMedia("clip.mov", 10 * kSecond, ProjectBuilder::Streams::Video));
    builder.AddClip(track, clip, {.start = 0, .end = 4 * kSecond});
    application.SetPlayerClock(clock);
    application.OpenProject(builder.GetProject());
  }

  // Lets `ticks` of the manual clock pass and the player take its step.
  void Elapse(TickTime ticks) {
    clock->Advance(ticks);
    MessageLoop::Instance().RunPending();
  }

  MessagingTestScope messaging;
  ProjectBuilder builder{"Transport"};
  SequenceRef sequence;
  std::shared_ptr<ManualPlayerClock> clock = std::make_shared<ManualPlayerClock>();
  Application application;
};

}  // namespace

TEST_F(TransportTest, SpacePlaysFromTheEditLineAndStopsWhereItGot) {
  sequence->SetCurrentTime(kSecond);
  EXPECT_TRUE(application.DoCommand(kCommandPlayStop));
  EXPECT_TRUE(application.IsPlaying());
  EXPECT_TRUE(application.GetCommandStatus(kCommandPlayStop).checked);
  Elapse(kSecond / 2);
  EXPECT_EQ(sequence->GetCurrentTime(), kSecond + kSecond / 2);
  EXPECT_TRUE(application.DoCommand(kCommandPlayStop));
  EXPECT_FALSE(application.IsPlaying());
  Elapse(kSecond);
  EXPECT_EQ(sequence->GetCurrentTime(), kSecond + kSecond / 2);
}

TEST_F(TransportTest, PlayingStopsAtTheEndAndStartsOverFromThere) {
  application.TogglePlayback();
  Elapse(10 * kSecond);
  EXPECT_FALSE(application.IsPlaying());
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSecond);
  application.TogglePlayback();
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  EXPECT_TRUE(application.IsPlaying());
}

TEST_F(TransportTest, StepsAndEndsStopPlaybackAndStayInTheSequence) {
  application.TogglePlayback();
  EXPECT_TRUE(application.DoCommand(kCommandGoToEnd));
  EXPECT_FALSE(application.IsPlaying());
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSecond);
  application.DoCommand(kCommandStepForward);
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSecond);
  application.DoCommand(kCommandStepBack);
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSecond - kSecond / 25);
  application.DoCommand(kCommandGoToStart);
  application.DoCommand(kCommandStepBack);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  application.DoCommand(kCommandStepForward);
  EXPECT_EQ(sequence->GetCurrentTime(), kSecond / 25);
}

TEST_F(TransportTest, WithoutASequenceTheKeysAreOff) {
  application.CloseProject();
  EXPECT_FALSE(application.GetCommandStatus(kCommandPlayStop).enabled);
  EXPECT_FALSE(application.TogglePlayback());
}
