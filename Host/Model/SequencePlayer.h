#pragma once

#include <memory>

#include "Host/Model/Player.h"

// Plays a sequence: the position is the sequence's edit line, so playing moves it. Messages go
// out through the sequence (Sequence::SetCurrentTime and SetPlayerState) on its player station.
// Destroying a playing player stops it (PlayerIsStoppedMessage).
class SequencePlayer : public Player {
 public:
  static std::shared_ptr<SequencePlayer> Create(SequenceRef sequence,
                                                std::shared_ptr<PlayerClock> clock = nullptr);
  ~SequencePlayer() override;

  TickTime GetPosition() const override;

 protected:
  SequencePlayer(SequenceRef sequence, std::shared_ptr<PlayerClock> clock);
  void PositionChangedSelf(TickTime position, int playMode) override;
  void StateChangedSelf(PlayerState previous, PlayerState state) override;
};
