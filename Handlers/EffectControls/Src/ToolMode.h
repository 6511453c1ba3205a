#pragma once

// What a drag in the keyframe area does, following the timeline's tool; every tool that does not
// zoom, pan or draw keyframes selects. The values are the tool codes the panel has always used.
enum class ToolMode : int {
  kPointer = 100,
  kZoom = 200,
  kHand = 300,
  kPen = 400,
};
