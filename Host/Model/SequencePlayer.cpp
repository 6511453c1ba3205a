#include "Host/Model/SequencePlayer.h"

#include <utility>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Model/Sequence.h"

std::shared_ptr<SequencePlayer> SequencePlayer::Create(SequenceRef sequence,
                                                       std::shared_ptr<PlayerClock> clock) {
  if (!HOST_VERIFY(sequence != nullptr, "Invalid Sequence")) {
    return nullptr;
  }
  return std::shared_ptr<SequencePlayer>(new SequencePlayer(std::move(sequence), std::move(clock)));
}

SequencePlayer::SequencePlayer(SequenceRef sequence, std::shared_ptr<PlayerClock> clock)
    : Player(sequence, sequence->GetPlayerStation(), std::move(clock)) {}

SequencePlayer::~SequencePlayer() {
  if (IsPlaying()) {
    GetSequence()->SetPlayerState(PlayerState::Stopped);
  }
}

TickTime SequencePlayer::GetPosition() const {
  return GetSequence()->GetCurrentTime();
}

void SequencePlayer::PositionChangedSelf(TickTime position, int playMode) {
  GetSequence()->SetCurrentTime(position, playMode);
}

void SequencePlayer::StateChangedSelf(PlayerState /*previous*/, PlayerState state) {
  GetSequence()->SetPlayerState(state);
}
