// The screen vertex the pipeline fills and the rasteriser reads, and the static
// scratch array the pipeline starts with.
#pragma once

#include <cstdint>

namespace vrx::render {

struct SVERTEX {
    int32_t x;          // screen x, 16.16
    int32_t y;          // screen y, 16.16, growing downward
    int32_t w;          // reciprocal depth, 26 fraction bits
    int32_t u, v;       // texture coordinates, 16.16, 1.0 spans the texture
    int32_t r, g, b;    // lit colour, 0 to 255.0 in 16.16
    int32_t a;          // alpha, 0 to 255.0
    int32_t outcode;    // clip bits
    int32_t cx, cy, cz; // camera-space position for the clipper
};
static_assert(sizeof(SVERTEX) == 13 * 4);

inline constexpr int32_t kVtxStoreCount = 400;

} // namespace vrx::render
