#pragma once

#include <cstdint>

// What a drop does with the dragged data, as bits: a source offers a set, a target answers one.
using DropEffect = std::uint32_t;

inline constexpr DropEffect kDropEffectNone = 0;
inline constexpr DropEffect kDropEffectCopy = 1;
inline constexpr DropEffect kDropEffectMove = 2;
inline constexpr DropEffect kDropEffectLink = 4;
inline constexpr DropEffect kDropEffectAll = kDropEffectCopy | kDropEffectMove | kDropEffectLink;
