#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "Host/Model/ParamValue.h"

// Direction bits of a transition (one bit each; a transition may take a pair, e.g. East and West).
inline constexpr std::uint32_t kTransitionDirectionNorth = 1;
inline constexpr std::uint32_t kTransitionDirectionEast = 2;
inline constexpr std::uint32_t kTransitionDirectionSouth = 4;
inline constexpr std::uint32_t kTransitionDirectionWest = 8;
inline constexpr std::uint32_t kTransitionDirectionNortheast = 16;
inline constexpr std::uint32_t kTransitionDirectionSoutheast = 32;
inline constexpr std::uint32_t kTransitionDirectionSouthwest = 64;
inline constexpr std::uint32_t kTransitionDirectionNorthwest = 128;

// Anti-aliasing qualities; any other stored value means Off.
inline constexpr int kTransitionAntiAliasOff = 1;
inline constexpr int kTransitionAntiAliasLow = 2;
inline constexpr int kTransitionAntiAliasMedium = 3;
inline constexpr int kTransitionAntiAliasHigh = 4;

// The settings of a transition track item. A plain value: the track item replaces it as a whole,
// so transition edits are before/after pairs.
struct TransitionData {
  std::string matchName;
  std::string displayName;

  // Where the cut between the clips lies: start + duration * cutRatio. 0 starts at the cut,
  // 0.5 centres on it, 1 ends at it.
  double cutRatio = 0.5;
  // How far the transition has progressed at its start and at its end, 0 to 1.
  float startPercent = 0.0f;
  float endPercent = 1.0f;
  // Centre of the effect at its start and end (normalised frame coordinates), where movable.
  ParamPoint startPosition{0.5, 0.5};
  ParamPoint endPosition{0.5, 0.5};
  bool startPositionMovable = false;
  bool endPositionMovable = false;

  float borderWidth = 0.0f;  // pixels
  ParamColor borderColor{0.0f, 0.0f, 0.0f, 1.0f};
  bool reverse = false;
  bool switchSources = false;

  // The chosen direction(s): one code, or a code and its pair.
  std::vector<std::uint32_t> directions;
  std::uint32_t allowedDirections = 0;  // bit set of the codes the transition offers
  bool takesDirectionPair = false;

  int antiAliasQuality = kTransitionAntiAliasOff;
  // The transition's own settings, read and written only by its custom setup.
  ParamBlob privateData;
  bool hasCustomSetup = false;

  friend bool operator==(const TransitionData&, const TransitionData&) = default;
};
