// The span-filler family as data: the axes a filler is built from, the 73 filler functions
// (declared from render/span_list.inc) and kSpanTable, which names each one with its choice
// of axes. build_span_table, the tests and the benchmark all read the family from here.
#pragma once

#include <cstdint>
#include <iterator>

#include "render/raster.h"

namespace vrx::render {

// How texel and colour become the stored pixel.
enum class ColorOp : uint8_t {
    Flat,            // flat_color
    Gouraud,         // the interpolated colour
    GouraudBlend,    // the interpolated colour blended over the buffer by the material's weight
    Copy,            // the texel
    ModulateFlat,    // texel times flat_r, flat_g, flat_b
    ModulateGouraud, // texel times the interpolated colour
    Add,             // texel plus the interpolated colour, saturating
    Blend,           // texel blended over the buffer
    BlendLit,        // as Blend; the colour is stepped along but does not reach the pixel
};

// Which pixels a span covers.
enum class Coverage : uint8_t {
    Centres, // the pixels whose centres lie in (xl, xr]
    Columns, // every column from the integer part of xl to that of xr (SPAN_FLAT only)
};

enum class Depth : uint8_t {
    None, // no depth test or write
    Less, // drawn only where strictly nearer; the depth is stored
};

// How texture coordinates travel along the span.
enum class Uv : uint8_t {
    None,         // untextured
    Affine,       // exact at both ends, linear between
    Perspective8, // exact every 8 pixels, linear within each run
};

enum class Filter : uint8_t {
    Nearest, // one texel
    FourTap, // average of four texels in a rotated grid
};

// Texel formats (a texture's alpha_kind, plus None for untextured fillers).
enum class Texel : uint8_t {
    None,
    Rgb565,   // alpha_kind 0
    Rgba4444, // alpha_kind 1
    Argb8888, // alpha_kind 2: the word 0xAARRGGBB
};

// The 73 fillers, each with the SpanFn signature.
#define SPAN_FILLER(name, op, coverage, depth, uv, filter, texel)                                  \
    void name(const SPAN_EDGE* left, const SPAN_EDGE* right, int32_t y) noexcept;
#include "render/span_list.inc"

// Ids of the fillers in list order.
enum class SpanFillerId : int32_t {
#define SPAN_FILLER(name, op, coverage, depth, uv, filter, texel) name,
#include "render/span_list.inc"
    kCount
};

// One member of the family: its name, its function and the axes it was built from.
struct SpanFillerInfo {
    const char* name;
    SpanFn fn;
    ColorOp op;
    Coverage coverage;
    Depth depth;
    Uv uv;
    Filter filter;
    Texel texel;
};

inline constexpr SpanFillerInfo kSpanTable[] = {
#define SPAN_FILLER(name, op, coverage, depth, uv, filter, texel)                                  \
    {#name, &name, op, coverage, depth, uv, filter, texel},
#include "render/span_list.inc"
};
static_assert(std::size(kSpanTable) == 73, "43 standard and 30 filtered span fillers");
static_assert(std::size(kSpanTable) == static_cast<std::size_t>(SpanFillerId::kCount));

// The descriptor of one filler.
constexpr const SpanFillerInfo& span_info(SpanFillerId id) {
    return kSpanTable[static_cast<std::size_t>(id)];
}

} // namespace vrx::render
