// The one span-filler kernel. fill_span<...> draws the pixels of one scanline between the
// two edge records; each of the 73 fillers (render/span_list.inc) is this template with one
// choice per axis: colour operation, coverage rule, depth test, coordinate interpolation,
// texel filter and texel format. Every axis is resolved at compile time, so a filler's loop
// holds no test but the clip column and the depth compare.
//
// Arithmetic is the engine's: every product that is shifted right is formed in 64 bits and
// cut to 32; the colour operations use 32-bit products; sums that could leave the 32-bit
// range wrap (uint32_t) as the target's registers do.
#pragma once

#include <cstddef>
#include <cstdint>
#include <utility>

#include "engine/fixed.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/span_fillers.h"

#if defined(__GNUC__) || defined(__clang__)
#define VRX_SPAN_INLINE [[gnu::always_inline]] inline
#else
#define VRX_SPAN_INLINE inline
#endif

namespace vrx::render::span {

using engine::wrap_add;
using engine::wrap_mul;
using engine::wrap_sub;

// (a * b) >> s on the 64-bit product, low 32 bits kept.
VRX_SPAN_INLINE constexpr int32_t mul_shr(int32_t a, int32_t b, int32_t s) {
    return static_cast<int32_t>((int64_t{a} * b) >> s);
}

// RecipTable entry for a pixel count. Spans longer than the table (only possible when a zoomed
// window projects far outside the buffer, where the clip drops those pixels anyway) read the
// last entry instead of memory beyond the table.
VRX_SPAN_INLINE int32_t recip(int32_t n) {
    return engine::RecipTable[n < engine::kRecipCount ? n : engine::kRecipCount - 1];
}

// ---- Texel fetch ----------------------------------------------------------------------------

// The current texture as the fetch sees it.
struct TexView {
    const void* texels;
    int32_t umask, vmask, wlog2, ushift, vshift;
};

// One texel at (u, v), coordinates with 24 fraction bits. Masking wraps them, negative ones
// included, so the texture repeats in both directions.
template <Texel Tx> VRX_SPAN_INLINE uint32_t fetch(const TexView& t, int32_t u, int32_t v) {
    const auto index = static_cast<uint32_t>((t.umask & (u >> t.ushift)) +
                                             ((t.vmask & (v >> t.vshift)) << t.wlog2));
    if constexpr (Tx == Texel::Argb8888) {
        return static_cast<const uint32_t*>(t.texels)[index];
    } else {
        return static_cast<const uint16_t*>(t.texels)[index];
    }
}

// Offsets of the four filter taps in coordinate units (a1 = 1/8, a3 = 3/8 of a texel).
struct Taps {
    int32_t a1u, a3u, a1v, a3v;
};

VRX_SPAN_INLINE Taps base_taps(const TexView& t) {
    // 24 - vshift is log2 of the height: the same fractions of a texel down.
    return {0x200000 >> t.wlog2, 0x600000 >> t.wlog2, 0x200000 >> (24 - t.vshift),
            0x600000 >> (24 - t.vshift)};
}

// Taps scaled to the per-pixel footprint: q is the squared step in eighths of a texel (a
// 32-bit sum of 32-bit squares); wide steps spread the taps, small ones draw them in.
VRX_SPAN_INLINE Taps footprint(const Taps& base, const TexView& t, int32_t du, int32_t dv) {
    const int32_t eu = du >> (t.ushift - 3);
    const int32_t ev = dv >> (t.vshift - 3);
    const int32_t q = wrap_add(wrap_mul(eu, eu), wrap_mul(ev, ev));
    int32_t grow = 0;
    if (q > 512) ++grow;
    if (q > 1024) ++grow;
    if (q < 32) --grow;
    if (q < 16) --grow;
    if (grow >= 0) {
        return {base.a1u << grow, base.a3u << grow, base.a1v << grow, base.a3v << grow};
    }
    return {base.a1u >> -grow, base.a3u >> -grow, base.a1v >> -grow, base.a3v >> -grow};
}

// Four-tap rotated-grid average around (u, v). Whole texels are summed under field masks, two
// fields at a time: four 5- or 6-bit fields sum below the next field's bits, and the shift by
// 2 truncates each field's average on its own.
template <Texel Tx>
VRX_SPAN_INLINE uint32_t fetch4(const TexView& t, const Taps& a, int32_t u, int32_t v) {
    const uint32_t t0 = fetch<Tx>(t, wrap_add(u, a.a1u), wrap_add(v, a.a3v));
    const uint32_t t1 = fetch<Tx>(t, wrap_sub(u, a.a3u), wrap_add(v, a.a1v));
    const uint32_t t2 = fetch<Tx>(t, wrap_add(u, a.a3u), wrap_sub(v, a.a1v));
    const uint32_t t3 = fetch<Tx>(t, wrap_sub(u, a.a1u), wrap_sub(v, a.a3v));
    constexpr uint32_t kMaskA = Tx == Texel::Rgb565 ? 0xF81Fu : 0xF0F0u; // red and blue
    constexpr uint32_t kMaskB = Tx == Texel::Rgb565 ? 0x07E0u : 0x0F0Fu; // green (and alpha)
    static_assert(Tx == Texel::Rgb565 || Tx == Texel::Rgba4444, "no filtered 32-bit texels");
    const uint32_t sum_a = (t0 & kMaskA) + (t1 & kMaskA) + (t2 & kMaskA) + (t3 & kMaskA);
    const uint32_t sum_b = (t0 & kMaskB) + (t1 & kMaskB) + (t2 & kMaskB) + (t3 & kMaskB);
    return ((sum_a >> 2) & kMaskA) | ((sum_b >> 2) & kMaskB);
}

// ---- Colour operations ----------------------------------------------------------------------

// An interpolated colour (16.16 channels, 0 to 255.0) packed to RGB565.
VRX_SPAN_INLINE uint16_t pack_colour(int32_t r, int32_t g, int32_t b) {
    return static_cast<uint16_t>(((r >> 8) & 0xF800) + ((g >> 13) & 0xFFE0) + (b >> 19));
}

// RGB565 texel times a colour; a channel of 255.0 keeps 255/256 of the field.
VRX_SPAN_INLINE uint16_t modulate(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const auto ti = static_cast<int32_t>(t);
    return static_cast<uint16_t>(((wrap_mul(ti >> 11, r) >> 13) & 0xF800) +
                                 ((wrap_mul((ti >> 5) & 63, g) >> 19) & 0xFFE0) +
                                 (wrap_mul(ti & 31, b) >> 24));
}

// RGB565 texel plus a colour, each channel saturating at 255.0. The texel's fields count as
// 8-bit values without repeated low bits (red 31 adds 248.0).
VRX_SPAN_INLINE uint16_t add_saturate(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const auto ti = static_cast<int32_t>(t);
    const int32_t rr = engine::f_min(wrap_add(r, (ti >> 11) << 19), 0xFF0000);
    const int32_t gg = engine::f_min(wrap_add(g, (ti & 0x7E0) << 13), 0xFF0000);
    const int32_t bb = engine::f_min(wrap_add(b, (ti & 31) << 19), 0xFF0000);
    return pack_colour(rr, gg, bb);
}

// Source channels (0 to 255) blended over an RGB565 pixel with weight a (0 to 256). The
// pixel's channels are widened with their top bits repeated, so a weight of 0 gives back each
// field exactly.
VRX_SPAN_INLINE uint16_t blend(uint16_t p, int32_t rs, int32_t gs, int32_t bs, int32_t a) {
    const int32_t r8 = ((p >> 8) & 0xF8) | (p >> 13);
    const int32_t g8 = ((p >> 3) & 0xFC) | ((p >> 9) & 3);
    const int32_t b8 = ((p & 31) << 3) | ((p & 31) >> 2);
    const int32_t keep = 256 - a;
    return static_cast<uint16_t>(((wrap_mul(r8, keep) + wrap_mul(rs, a)) & 0xF800) +
                                 (((wrap_mul(g8, keep) + wrap_mul(gs, a)) >> 5) & 0xFFE0) +
                                 ((wrap_mul(b8, keep) + wrap_mul(bs, a)) >> 11));
}

// A texel blended over p. Format 0 blends by the material weight A; the alpha formats blend by
// the texel's alpha, times A only in the affine standard fillers (kScaleByA).
template <Texel Tx, bool kScaleByA>
VRX_SPAN_INLINE uint16_t blend_texel(uint16_t p, uint32_t t, int32_t a_material) {
    const auto ti = static_cast<int32_t>(t);
    if constexpr (Tx == Texel::Rgb565) {
        return blend(p, (ti >> 8) & 0xF8, (ti >> 3) & 0xFC, (ti & 31) << 3, a_material);
    } else if constexpr (Tx == Texel::Rgba4444) {
        const int32_t a = (ti & 15) * 17; // 4-bit alpha to 0..255
        return blend(p, (ti >> 8) & 0xF0, (ti >> 4) & 0xF0, ti & 0xF0,
                     kScaleByA ? wrap_mul(a, a_material) >> 8 : a);
    } else {
        const auto a = static_cast<int32_t>(t >> 24);
        return blend(p, (ti >> 16) & 255, (ti >> 8) & 255, ti & 255,
                     kScaleByA ? wrap_mul(a, a_material) >> 8 : a);
    }
}

// ---- The kernel -----------------------------------------------------------------------------

// Per-pixel values, stepped once per pixel (within a perspective run the texture steps are
// reset per run; stepping in 32-bit wrap arithmetic makes value j exactly start + j * step).
struct Cursor {
    int32_t col;
    int32_t z, dz;   // depth
    int32_t r, g, b; // colour, 16.16
    int32_t dr, dg, db;
    int32_t u, v, du, dv; // texture coordinates, 24 fraction bits
};

// Values fixed for a span (the taps for a perspective run).
struct SpanConsts {
    int32_t clip_lo, clip_hi; // pixel_clipped's columns, read once per span
    TexView tex;
    Taps taps;
    int32_t flat_r, flat_g, flat_b;
    int32_t blend_a;
    uint16_t flat_color;
};

template <ColorOp Op>
inline constexpr bool kStepsColour =
    Op == ColorOp::Gouraud || Op == ColorOp::GouraudBlend || Op == ColorOp::ModulateGouraud ||
    Op == ColorOp::Add || Op == ColorOp::BlendLit;

template <ColorOp Op, Depth Dp, Uv Coords, Filter Filt, Texel Tx> struct Kernel {
    static constexpr bool kDepth = Dp == Depth::Less;
    static constexpr bool kTextured = Coords != Uv::None;
    static constexpr bool kColour = kStepsColour<Op>;

    // The stored pixel for the cursor's column.
    VRX_SPAN_INLINE static uint16_t shade(const Cursor& c, const SpanConsts& k,
                                          const uint16_t* row) {
        if constexpr (Op == ColorOp::Flat) {
            return k.flat_color;
        } else if constexpr (Op == ColorOp::Gouraud) {
            return pack_colour(c.r, c.g, c.b);
        } else if constexpr (Op == ColorOp::GouraudBlend) {
            return blend(row[c.col], c.r >> 16, c.g >> 16, c.b >> 16, k.blend_a);
        } else {
            static_assert(kTextured && Tx != Texel::None);
            uint32_t t;
            if constexpr (Filt == Filter::FourTap) {
                t = fetch4<Tx>(k.tex, k.taps, c.u, c.v);
            } else {
                t = fetch<Tx>(k.tex, c.u, c.v);
            }
            if constexpr (Op == ColorOp::Copy) {
                return static_cast<uint16_t>(t);
            } else if constexpr (Op == ColorOp::ModulateFlat) {
                return modulate(t, k.flat_r, k.flat_g, k.flat_b);
            } else if constexpr (Op == ColorOp::ModulateGouraud) {
                return modulate(t, c.r, c.g, c.b);
            } else if constexpr (Op == ColorOp::Add) {
                return add_saturate(t, c.r, c.g, c.b);
            } else {
                constexpr bool kScaleByA = Coords == Uv::Affine && Filt == Filter::Nearest;
                return blend_texel<Tx, kScaleByA>(row[c.col], t, k.blend_a);
            }
        }
    }

    // One pixel: the clip column and the depth compare are the only tests.
    VRX_SPAN_INLINE static void pixel(Cursor& c, const SpanConsts& k, uint16_t* __restrict row,
                                      int32_t* __restrict zrow) {
        const int32_t col = c.col;
        if (col >= k.clip_lo && col < k.clip_hi) {
            bool nearer = true;
            if constexpr (kDepth) nearer = zrow[col] > c.z; // strict: equal depth loses
            if (nearer) {
                row[col] = shade(c, k, row);
                if constexpr (kDepth) zrow[col] = c.z;
            }
        }
        ++c.col;
        if constexpr (kDepth) c.z = wrap_add(c.z, c.dz);
        if constexpr (kColour) {
            c.r = wrap_add(c.r, c.dr);
            c.g = wrap_add(c.g, c.dg);
            c.b = wrap_add(c.b, c.db);
        }
        if constexpr (kTextured) {
            c.u = wrap_add(c.u, c.du);
            c.v = wrap_add(c.v, c.dv);
        }
    }

    // count pixels from the cursor on.
    VRX_SPAN_INLINE static void run(Cursor& c, const SpanConsts& k, int32_t count,
                                    uint16_t* __restrict row, int32_t* __restrict zrow) {
        for (int32_t i = 0; i < count; ++i) pixel(c, k, row, zrow);
    }

    // A perspective run of exactly 8 pixels, unrolled at compile time.
    VRX_SPAN_INLINE static void run8(Cursor& c, const SpanConsts& k, uint16_t* __restrict row,
                                     int32_t* __restrict zrow) {
        [&]<std::size_t... J>(std::index_sequence<J...>) {
            ((static_cast<void>(J), pixel(c, k, row, zrow)), ...);
        }
        (std::make_index_sequence<8>{});
    }
};

// Draws one span of scanline y between left and right with the chosen axes.
template <ColorOp Op, Coverage Cov, Depth Dp, Uv Coords, Filter Filt, Texel Tx>
VRX_SPAN_INLINE void fill_span(const SPAN_EDGE& left, const SPAN_EDGE& right, int32_t y) {
    using K = Kernel<Op, Dp, Coords, Filt, Tx>;
    static_assert(Cov == Coverage::Centres || (Op == ColorOp::Flat && Dp == Depth::None));
    static_assert(Filt == Filter::Nearest || K::kTextured);

    const int32_t xl = left.x;
    const int32_t xr = right.x;
    int32_t x0, x1;
    if constexpr (Cov == Coverage::Columns) {
        // Every column from the integer part of xl to that of xr.
        if (wrap_sub(xr, xl) <= 0) return;
        x0 = xl >> 16;
        x1 = xr >> 16;
    } else {
        // The pixels whose centre col + 0.5 satisfies xl < col + 0.5 <= xr.
        x0 = wrap_add(xl, 0x8000) >> 16;
        x1 = wrap_sub(xr, 0x8000) >> 16;
    }
    const int32_t n = x1 - x0;
    if (n < 0) return;
    if (span_rejected(x0, x1, y)) return;

    const engine::ENG_STATE& e = engine::g_eng;
    const RasterContext& rc = g_raster;
    SpanConsts k{};
    k.clip_lo = e.clip_on ? e.clip_left : INT32_MIN;
    k.clip_hi = e.clip_on ? e.clip_right : INT32_MAX;
    k.flat_color = rc.flat_color;
    k.flat_r = rc.flat_r;
    k.flat_g = rc.flat_g;
    k.flat_b = rc.flat_b;
    k.blend_a = rc.blend_a;
    k.tex = {rc.texels, rc.tex_umask, rc.tex_vmask, rc.tex_wlog2, rc.tex_ushift, rc.tex_vshift};
    uint16_t* const row = rc.row;
    int32_t* const zrow = rc.zrow;

    Cursor c{};
    c.col = x0;
    const int32_t recip_n = recip(n);
    if constexpr (K::kColour) {
        // Per-pixel colour steps over the whole span; no sub-pixel correction.
        const int32_t rn = recip_n >> 8;
        c.r = left.r;
        c.g = left.g;
        c.b = left.b;
        c.dr = mul_shr(wrap_sub(right.r, left.r), rn, 16);
        c.dg = mul_shr(wrap_sub(right.g, left.g), rn, 16);
        c.db = mul_shr(wrap_sub(right.b, left.b), rn, 16);
    }

    if constexpr (Coords != Uv::Perspective8) {
        // Untextured and affine: one run over the whole span, values exact at both ends.
        int32_t z_left = 0, z_right = 0;
        if constexpr (K::kDepth || K::kTextured) {
            z_left = engine::Inverse(left.w >> 10);
            z_right = engine::Inverse(right.w >> 10);
        }
        if constexpr (K::kDepth) {
            c.z = z_left;
            c.dz = mul_shr(wrap_sub(z_right, z_left), recip_n >> 8, 16);
        }
        if constexpr (K::kTextured) {
            // Coordinates at the span ends, 24 fraction bits.
            const int32_t ul = mul_shr(left.uw, z_left, 16);
            const int32_t vl = mul_shr(left.vw, z_left, 16);
            const int32_t ur = mul_shr(right.uw, z_right, 16);
            const int32_t vr = mul_shr(right.vw, z_right, 16);
            const int32_t h = engine::hInverse(wrap_sub(xr, xl)); // 1 / width, 24 fraction bits
            c.du = mul_shr(wrap_sub(ur, ul), h, 24);
            c.dv = mul_shr(wrap_sub(vr, vl), h, 24);
            // Distance from the left edge to the centre of pixel x0.
            const int32_t s = wrap_sub(wrap_add(wrap_add(xl, 0x8000) & ~0xFFFF, 0x8000), xl);
            c.u = wrap_add(ul, mul_shr(c.du, s, 16));
            c.v = wrap_add(vl, mul_shr(c.dv, s, 16));
            if constexpr (Filt == Filter::FourTap) {
                k.taps = footprint(base_taps(k.tex), k.tex, c.du, c.dv);
            }
        }
        K::run(c, k, n + 1, row, zrow);
    } else {
        // Perspective: w, u*w and v*w are linear on screen; the true coordinates are taken
        // at the ends of runs of 8 pixels and interpolated linearly within each run.
        const int32_t h = engine::hInverse(wrap_sub(xr, xl));
        const int32_t dw = mul_shr(wrap_sub(right.w, left.w), h, 24);
        const int32_t duw = mul_shr(wrap_sub(right.uw, left.uw), h, 24);
        const int32_t dvw = mul_shr(wrap_sub(right.vw, left.vw), h, 24);
        // Distances from the left edge to the centres of the first and the last pixel.
        const int32_t s0 = wrap_sub((wrap_add(xl, 0x8000) & ~0xFFFF) | 0x8000, xl);
        const int32_t s1 = wrap_sub((wrap_sub(xr, 0x8000) & ~0xFFFF) | 0x8000, xl);
        int32_t w = wrap_add(left.w, mul_shr(s0, dw, 16));
        int32_t uw = wrap_add(left.uw, mul_shr(s0, duw, 16));
        int32_t vw = wrap_add(left.vw, mul_shr(s0, dvw, 16));
        // Steps per 8 pixels from the first to the last pixel centre.
        const auto step8 = [&](int32_t edge, int32_t d, int32_t first) {
            const int32_t last = wrap_add(edge, mul_shr(s1, d, 16));
            return wrap_mul(mul_shr(wrap_sub(last, first), recip_n, 24), 8);
        };
        const int32_t dw8 = step8(left.w, dw, w);
        const int32_t duw8 = step8(left.uw, duw, uw);
        const int32_t dvw8 = step8(left.vw, dvw, vw);

        int32_t z = engine::Inverse(w >> 10);
        c.u = mul_shr(uw, z, 16);
        c.v = mul_shr(vw, z, 16);
        const Taps base = Filt == Filter::FourTap ? base_taps(k.tex) : Taps{};
        const int32_t count = n + 1;

        // A short run of count & 7 pixels first, so the rest falls into whole runs of 8.
        if (const int32_t kshort = count & 7; kshort > 0) {
            const int32_t w2 = wrap_add(w, mul_shr(kshort, dw8, 3));
            const int32_t z2 = engine::Inverse(w2 >> 10);
            const int32_t uw2 = wrap_add(uw, mul_shr(kshort, duw8, 3));
            const int32_t vw2 = wrap_add(vw, mul_shr(kshort, dvw8, 3));
            const int32_t rk = engine::RecipTable[kshort];
            c.du = mul_shr(wrap_sub(mul_shr(uw2, z2, 16), c.u), rk, 24);
            c.dv = mul_shr(wrap_sub(mul_shr(vw2, z2, 16), c.v), rk, 24);
            if constexpr (K::kDepth) {
                c.z = z;
                c.dz = mul_shr(wrap_sub(z2, z), rk >> 8, 16);
            }
            if constexpr (Filt == Filter::FourTap) k.taps = footprint(base, k.tex, c.du, c.dv);
            // The coordinates go on from where the short run's steps left them.
            K::run(c, k, kshort, row, zrow);
            w = w2;
            uw = uw2;
            vw = vw2;
            z = z2;
        }
        for (int32_t runs = count >> 3; runs > 0; --runs) {
            w = wrap_add(w, dw8);
            const int32_t z2 = engine::Inverse(w >> 10);
            uw = wrap_add(uw, duw8);
            vw = wrap_add(vw, dvw8);
            const int32_t ue = mul_shr(uw, z2, 16);
            const int32_t ve = mul_shr(vw, z2, 16);
            c.du = wrap_sub(ue, c.u) >> 3;
            c.dv = wrap_sub(ve, c.v) >> 3;
            if constexpr (K::kDepth) {
                c.z = z;
                c.dz = wrap_sub(z2, z) >> 3;
            }
            if constexpr (Filt == Filter::FourTap) k.taps = footprint(base, k.tex, c.du, c.dv);
            K::run8(c, k, row, zrow);
            c.u = ue;
            c.v = ve;
            z = z2;
        }
    }
}

} // namespace vrx::render::span
