// The nine raster modes a material can be drawn with. A material records its mode by
// this number; running the mode installs draw_triangle and draw_span from eng_flags.
#pragma once

#include <cstdint>

namespace vrx::render {

enum RasterMode : int32_t {
    mode_none = -1, // not chosen yet
    mode_flat = 0,
    mode_gouraud,
    mode_gouraud_blend,
    mode_tex,
    mode_tex_flat,
    mode_tex_gouraud,
    mode_tex_add,
    mode_tex_blend,
    mode_tex_blend_lit,
    kRasterModeCount
};

// Runs a raster mode: stores draw_triangle and draw_span for the current flags (and,
// for the blend modes, the current material's texture format).
void run_raster_mode(RasterMode mode) noexcept;

} // namespace vrx::render
