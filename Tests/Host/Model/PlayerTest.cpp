#include <gtest/gtest.h>

#include "Host/Messaging/MessageLoop.h"
#include "Host/Model/AudioTrackItemPlayer.h"
#include "Host/Model/ManualPlayerClock.h"
#include "Host/Model/ModelMessages.h"
#include "Host/Model/SequencePlayer.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

// Positions reported on a station, and the stop messages.
class PlayerLog : public Listener {
 public:
  void ListenToMessage(const Message& message) override {
    if (const auto* moved = message.As<PlayerPositionChangedMessage>()) {
      positions.push_back(moved->time);
      modes.push_back(moved->playMode);
    } else if (message.As<PlayerIsStoppedMessage>()) {
      ++stopped;
    } else if (message.As<PlayerIsPlayingMessage>()) {
      ++playing;
    }
  }
  std::vector<TickTime> positions;
  std::vector<int> modes;
  int stopped = 0;
  int playing = 0;
};

class PlayerTest : public EditingModelTest {
 protected:
  // One frame of the message loop after `elapsed` of clock time.
  void Tick(TickTime elapsed) {
    clock->Advance(elapsed);
    MessageLoop::Instance().RunPending();
  }

  std::shared_ptr<ManualPlayerClock> clock = std::make_shared<ManualPlayerClock>();
  PlayerLog log;
};

TEST_F(PlayerTest, PlayingMovesTheEditLineWithTheClock) {
  auto player = SequencePlayer::Create(sequence, clock);
  AddListener(sequence->GetPlayerStation(), log);
  sequence->SetCurrentTime(kSec);
  log.positions.clear();
  ASSERT_TRUE(player->Play(0, 10 * kSec));
  EXPECT_EQ(sequence->GetPlayerState(), PlayerState::Playing);
  EXPECT_EQ(log.playing, 1);
  Tick(kSec / 2);
  Tick(kSec / 2);
  EXPECT_EQ(sequence->GetCurrentTime(), 2 * kSec);
  EXPECT_EQ(log.positions, (std::vector<TickTime>{kSec + kSec / 2, 2 * kSec}));
  EXPECT_EQ(log.modes.back(), kPlayModePlaying);
  // No time passed: no step, no message.
  Tick(0);
  EXPECT_EQ(log.positions.size(), 2u);
}

TEST_F(PlayerTest, ReachingTheEndStopsThereWithOneStopMessage) {
  auto player = SequencePlayer::Create(sequence, clock);
  AddListener(sequence->GetPlayerStation(), log);
  ASSERT_TRUE(player->Play(kSec, 2 * kSec));
  EXPECT_EQ(sequence->GetCurrentTime(), kSec);  // started outside the range: from its start
  Tick(5 * kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), 2 * kSec);
  EXPECT_FALSE(player->IsPlaying());
  EXPECT_EQ(log.stopped, 1);
  Tick(kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), 2 * kSec);
  EXPECT_EQ(log.stopped, 1);
  EXPECT_FALSE(MessageLoop::Instance().HasPending());
}

TEST_F(PlayerTest, LoopingWrapsToTheStartOfTheRange) {
  auto player = SequencePlayer::Create(sequence, clock);
  player->SetLooping(true);
  ASSERT_TRUE(player->Play(kSec, 3 * kSec));
  Tick(2500 * kSec / 1000);
  EXPECT_EQ(sequence->GetCurrentTime(), 1500 * kSec / 1000);
  Tick(7 * kSec);  // several laps at once
  EXPECT_EQ(sequence->GetCurrentTime(), 2500 * kSec / 1000);
  EXPECT_TRUE(player->IsPlaying());
}

TEST_F(PlayerTest, SpeedScalesTheAdvanceAndBackwardsPlayStopsAtTheStart) {
  auto player = SequencePlayer::Create(sequence, clock);
  ASSERT_TRUE(player->Play(0, 10 * kSec, 2.0));
  Tick(kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), 2 * kSec);
  ASSERT_TRUE(player->Play(0, 10 * kSec, -0.5));
  Tick(2 * kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), kSec);
  Tick(4 * kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  EXPECT_FALSE(player->IsPlaying());
}

TEST_F(PlayerTest, BadRangesAndSpeedsAreRefused) {
  auto player = SequencePlayer::Create(sequence, clock);
  EXPECT_FALSE(player->Play(2 * kSec, 2 * kSec));
  EXPECT_FALSE(player->Play(2 * kSec, kSec));
  EXPECT_FALSE(player->Play(0, kSec, 0.0));
  EXPECT_FALSE(player->Play(0, kSec, std::nan("")));
  EXPECT_FALSE(player->Play(0, kTime_Max));
  EXPECT_FALSE(player->IsPlaying());
  EXPECT_FALSE(MessageLoop::Instance().HasPending());
}

TEST_F(PlayerTest, StopSendsTheStopMessageAndADestroyedPlayerIsNotStepped) {
  AddListener(sequence->GetPlayerStation(), log);
  {
    auto player = SequencePlayer::Create(sequence, clock);
    ASSERT_TRUE(player->Play(0, 10 * kSec));
    player->Stop();
    EXPECT_EQ(log.stopped, 1);
    EXPECT_EQ(player->GetStateCode(), kPlayModeStopped);
    ASSERT_TRUE(player->Play(0, 10 * kSec));
  }
  // Destroying a playing player stops the sequence's playback.
  EXPECT_EQ(log.stopped, 2);
  EXPECT_EQ(sequence->GetPlayerState(), PlayerState::Stopped);
  Tick(kSec);  // the pending step finds no player
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
}

TEST_F(PlayerTest, ScrubbingShowsATimeWithoutPlaying) {
  auto player = SequencePlayer::Create(sequence, clock);
  AddListener(sequence->GetPlayerStation(), log);
  ASSERT_TRUE(player->Play(0, 10 * kSec));
  player->Scrub(4 * kSec);
  EXPECT_EQ(player->GetStateCode(), kPlayModeScrubbing);
  EXPECT_EQ(log.stopped, 1);
  EXPECT_EQ(log.modes.back(), kPlayModeScrubbing);
  Tick(kSec);
  EXPECT_EQ(sequence->GetCurrentTime(), 4 * kSec);
  player->EndScrub();
  EXPECT_EQ(player->GetState(), PlayerState::Stopped);
}

// --- Audio parts ---

TEST_F(PlayerTest, OnlyAudioClipsAtNormalSpeedCanBePlayedAlone) {
  EXPECT_TRUE(AudioTrackItemPlayer::CanPlay(*bAudio));
  EXPECT_FALSE(AudioTrackItemPlayer::CanPlay(*b));  // video
  EXPECT_FALSE(AudioTrackItemPlayer::CanPlay(*transition));
  ASSERT_TRUE(bAudio->SetSpeed(1.0001));
  EXPECT_FALSE(AudioTrackItemPlayer::CanPlay(*bAudio));
  EXPECT_EQ(AudioTrackItemPlayer::Create(bAudio, clock), nullptr);
  ASSERT_TRUE(bAudio->SetSpeed(1.0));
  clipB->GetProperties().SetBool(kPropertyKey_FromInactiveProject, true);
  EXPECT_TRUE(AudioTrackItemPlayer::IsPlaybackRestricted(*bAudio));
  EXPECT_FALSE(AudioTrackItemPlayer::CanPlay(*bAudio));
}

TEST_F(PlayerTest, APartPlaysInItsOwnTimeWithoutMovingTheEditLine) {
  auto player = AudioTrackItemPlayer::Create(bAudio, clock);
  ASSERT_NE(player, nullptr);
  PlayerLog partLog;
  AddListener(player->GetStation(), partLog);
  AddListener(sequence->GetPlayerStation(), log);
  // The edit line at 6 s is 1 s into the part that starts at 5 s.
  ASSERT_TRUE(player->PlayPart(6 * kSec, false));
  EXPECT_EQ(player->GetPosition(), kSec);
  EXPECT_EQ(player->GetRangeEnd(), 5 * kSec);
  Tick(3 * kSec);
  EXPECT_EQ(player->GetPosition(), 4 * kSec);
  Tick(3 * kSec);
  EXPECT_EQ(player->GetPosition(), 5 * kSec);
  EXPECT_EQ(partLog.stopped, 1);
  EXPECT_EQ(sequence->GetCurrentTime(), 0);
  EXPECT_TRUE(log.positions.empty());
}

TEST_F(PlayerTest, LoopRangeComesFromTheSequencesInAndOutFallingBackToThePart) {
  auto player = AudioTrackItemPlayer::Create(bAudio, clock);
  ASSERT_NE(player, nullptr);
  using Range = std::pair<TickTime, TickTime>;
  EXPECT_EQ(player->GetPlayRange(true), (Range{0, 5 * kSec}));
  sequence->SetInPoint(6 * kSec);
  sequence->SetOutPoint(8 * kSec);
  EXPECT_EQ(player->GetPlayRange(true), (Range{kSec, 3 * kSec}));
  EXPECT_EQ(player->GetPlayRange(false), (Range{0, 5 * kSec}));
  // An in point before the part's start: playback starts at the part's beginning.
  sequence->SetInPoint(2 * kSec);
  EXPECT_EQ(player->GetPlayRange(true), (Range{0, 3 * kSec}));
  sequence->SetOutPoint(20 * kSec);
  EXPECT_EQ(player->GetPlayRange(true), (Range{0, 5 * kSec}));

  sequence->SetInPoint(6 * kSec);
  sequence->SetOutPoint(8 * kSec);
  ASSERT_TRUE(player->PlayPart(0, true));
  EXPECT_EQ(player->GetPosition(), kSec);
  Tick(2500 * kSec / 1000);
  EXPECT_EQ(player->GetPosition(), 1500 * kSec / 1000);  // wrapped past 3 s
  EXPECT_TRUE(player->IsPlaying());
}

}  // namespace
