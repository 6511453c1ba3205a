#pragma once

#include "Host/Toolkit/Decals.h"

struct _cairo;

// Draws `decal` as a vector glyph in its logical box (0, 0) - GetDecalSize(decal) on `cr`,
// whose transform maps logical to device pixels. Colours come from the current theme.
// Toolkit-internal; used by Bitmap.
void PaintDecal(_cairo* cr, Decal decal);
