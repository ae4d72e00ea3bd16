// The two choosers that give a material its raster mode: one for objects and geometry
// packs, one for the polygon-list path (translucent-aware). A mode is chosen when the
// material changes, never per frame; the flags of VRX_Hint do not enter the choice.
#pragma once

#include "render/raster_mode.h"

namespace vrx::scene {
struct MATERIAL;
}

namespace vrx::render {

// The mode for drawing `m` on the opaque path (reads texture, flags and self_illum).
RasterMode raster_mode_for(const scene::MATERIAL& m) noexcept;
// Stores raster_mode_for(m) in m's raster_mode; for a material drawn textured it first
// chooses the texture-coordinate generator, for any other it clears it.
void choose_raster_mode(scene::MATERIAL* m) noexcept;

// The mode for drawing `m` from a polygon list (reads texture and its alpha_kind,
// self_illum, and the alpha of diffuse and diffuse_scaled).
RasterMode list_raster_mode_for(const scene::MATERIAL& m) noexcept;
// Stores list_raster_mode_for(m) in m's raster_mode.
void choose_list_raster_mode(scene::MATERIAL* m) noexcept;

} // namespace vrx::render
