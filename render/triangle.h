// Triangle setup: the rasteriser's entry draw_triangle_clipped, the vertex sort table and
// the eight triangle drawers. A drawer walks the two edges of a triangle down the screen,
// one SPAN_EDGE value per scanline and end, and hands each scanline to draw_span; it never
// writes a pixel itself.
#pragma once

#include <array>
#include <cstdint>

#include "engine/fixed.h"
#include "render/raster.h"

namespace vrx::render {

// Indices (0, 1, 2 for the vertices in call order) of the top, middle and bottom vertex.
struct SortRow {
    uint8_t top, mid, bot;
};

// Sort orders indexed by sort_index(y0, y1, y2). Rows 2 and 5 name sign patterns that only a
// 32-bit overflow of a y difference produces; they hold (0, 0, 0) and are never drawn.
inline constexpr std::array<SortRow, 8> SortOrderTable = {{
    {0, 1, 2},
    {0, 2, 1},
    {0, 0, 0},
    {2, 0, 1},
    {1, 0, 2},
    {0, 0, 0},
    {1, 2, 0},
    {2, 1, 0},
}};

// 4*[y1 < y0] + 2*[y2 < y0] + [y2 < y1], each test being the sign of the 32-bit (wrapping)
// difference, as the target's subtract-and-test gives it.
constexpr int32_t sort_index(int32_t y0, int32_t y1, int32_t y2) {
    return (engine::wrap_sub(y1, y0) < 0 ? 4 : 0) + (engine::wrap_sub(y2, y0) < 0 ? 2 : 0) +
           (engine::wrap_sub(y2, y1) < 0 ? 1 : 0);
}

// True for the two rows that no consistent ordering produces.
constexpr bool sort_row_impossible(const SortRow& row) {
    return row.top == row.mid;
}

// flat_color of a vertex colour: r, g, b (16.16, 0 to 255.0) packed into RGB565 by shifting
// each channel to its field and clearing the bits below the field; the sum keeps 16 bits.
constexpr uint16_t flat_color_of(int32_t r, int32_t g, int32_t b) {
    return static_cast<uint16_t>(
        engine::wrap_add(engine::wrap_add((r >> 8) & ~0x7FF, (g >> 13) & ~0x1F), b >> 19));
}

// The rasteriser's entry for one projected triangle (vertices with outcode 0). With the clip
// rectangle on, a triangle whose vertex bounds miss it is rejected: returns 1, nothing drawn.
// Also returns 1 when no drawer is installed. Otherwise runs draw_triangle and returns 0.
int32_t draw_triangle_clipped(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;

// The eight drawers. They share one walk and differ in the SPAN_EDGE fields they carry and
// in whether they keep zrow in step with row. The flat and textured ones first store
// flat_color and flat_r/g/b from `a`, the first vertex passed.
//
// Contract: the walk never asks a filler to reach outside the render buffer. A triangle that
// lies inside the buffer is walked as it is. One that reaches outside is walked over the
// buffer's rows only, with the clip rectangle narrowed to the buffer for its spans; one wholly
// outside the buffer, or with spans that could be wider than RecipTable reaches, is not drawn.
// Nothing is drawn without a colour buffer (and a depth buffer for the _z drawers) or without
// a span filler.
void tri_flat(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;          // x, w
void tri_flat_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;        // + zrow
void tri_gouraud(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;       // + rgba
void tri_gouraud_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;     // + zrow
void tri_tex(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;           // + uw, vw
void tri_tex_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;         // + zrow
void tri_tex_gouraud(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept;   // all
void tri_tex_gouraud_z(const SVERTEX* a, const SVERTEX* b, const SVERTEX* c) noexcept; // + zrow

} // namespace vrx::render
