// The rasteriser's shared state and entry points: the span edge records, the raster
// context the triangle drawers set up for the span fillers, the two current function
// pointers, the table of span-filler slots and the clip tests.
#pragma once

#include <cstdint>

#include "engine/state.h"
#include "render/svertex.h"

namespace vrx::render {

// One end of the current span (eight 32-bit words).
struct SPAN_EDGE {
    int32_t x; // x on this scanline, 16.16
    int32_t w; // reciprocal depth, 26 fraction bits
    int32_t r; // colour channels, 16.16 in 0 to 255.0
    int32_t g;
    int32_t b;
    int32_t a;
    int32_t uw; // u * w >> 18
    int32_t vw; // v * w >> 18
};
static_assert(sizeof(SPAN_EDGE) == 8 * 4);

using TriangleFn = void (*)(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;
using SpanFn = void (*)(const SPAN_EDGE* left, const SPAN_EDGE* right, int32_t y) noexcept;

// Globals shared by the drawers, the fillers and the pipeline.
struct RasterContext {
    SPAN_EDGE left, right;          // the span ends handed to every draw_span call
    uint16_t* row;                  // first pixel of the current scanline
    int32_t* zrow;                  // first depth of the current scanline (depth drawers)
    uint16_t flat_color;            // RGB565 colour of the first vertex (flat and textured drawers)
    int32_t flat_r, flat_g, flat_b; // that vertex's channels, 16.16
    const void* texels;             // current texture's pixels (16- or 32-bit)
    int32_t tex_umask;              // width - 1
    int32_t tex_vmask;              // height - 1
    int32_t tex_wlog2;              // log2 of width
    int32_t tex_ushift;             // 24 - log2 width
    int32_t tex_vshift;             // 24 - log2 height
    int32_t blend_a;                // opacity of the current material as a weight 0 to 256
};

extern RasterContext g_raster;
extern TriangleFn draw_triangle; // current triangle drawer
extern SpanFn draw_span;         // current span filler

// Slots of SpanTable, named after what their filler does: _P perspective, _Z depth-tested,
// _ZP both. The last entry holds the untextured translucent filler without depth test,
// which no slot names and no filler set replaces; mode_gouraud_blend installs it.
enum SpanSlot : int32_t {
    SPAN_FLAT,
    SPAN_FLAT_Z,
    SPAN_GOURAUD,
    SPAN_GOURAUD_Z,
    SPAN_GOURAUD_BLEND_Z,
    SPAN_TEX,
    SPAN_TEX_P,
    SPAN_TEX_Z,
    SPAN_TEX_ZP,
    SPAN_TEXMOD,
    SPAN_TEXMOD_P,
    SPAN_TEXMOD_Z,
    SPAN_TEXMOD_ZP,
    SPAN_TEXGOUR,
    SPAN_TEXGOUR_P,
    SPAN_TEXGOUR_Z,
    SPAN_TEXGOUR_ZP,
    SPAN_TEXADD,
    SPAN_TEXADD_P,
    SPAN_TEXADD_Z,
    SPAN_TEXADD_ZP,
    SPAN_BLEND_565,
    SPAN_BLEND_4444,
    SPAN_BLEND_8888,
    SPAN_BLEND_565_P,
    SPAN_BLEND_4444_P,
    SPAN_BLEND_8888_P,
    SPAN_BLEND_565_Z,
    SPAN_BLEND_4444_Z,
    SPAN_BLEND_8888_Z,
    SPAN_BLEND_565_ZP,
    SPAN_BLEND_4444_ZP,
    SPAN_BLEND_8888_ZP,
    SPAN_BLENDLIT_565,
    SPAN_BLENDLIT_4444,
    SPAN_BLENDLIT_8888,
    SPAN_BLENDLIT_565_Z,
    SPAN_BLENDLIT_4444_Z,
    SPAN_BLENDLIT_8888_Z,
    SPAN_BLENDLIT_565_ZP,
    SPAN_BLENDLIT_4444_ZP,
    SPAN_BLENDLIT_8888_ZP,
    SPAN_GOURAUD_BLEND, // the fixed filler span_gouraud_blend
    kSpanSlotCount
};

extern SpanFn SpanTable[kSpanSlotCount];

// Filler sets for build_span_table.
inline constexpr int32_t kSpanSetStandard = 0;
inline constexpr int32_t kSpanSetFiltered = 1;
// Fills every slot with the standard set (0) or the filtered set (1).
void build_span_table(int32_t set) noexcept;

// Span and pixel clip tests against the clip rectangle; both pass everything while the
// clip is off.
inline int32_t span_rejected(int32_t x0, int32_t x1, int32_t y) noexcept {
    const engine::ENG_STATE& e = engine::g_eng;
    if (!e.clip_on) return 0;
    return (y >= e.clip_bottom || y < e.clip_top || x0 >= e.clip_right || x1 < e.clip_left) ? 1 : 0;
}
inline int32_t pixel_clipped(int32_t x) noexcept {
    const engine::ENG_STATE& e = engine::g_eng;
    if (!e.clip_on) return 0;
    return (x >= e.clip_right || x < e.clip_left) ? 1 : 0;
}

} // namespace vrx::render
