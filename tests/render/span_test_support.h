// Shared pieces of the span-filler tests: a fixture that points the raster context at one
// local scanline (columns -8 to 31) and restores the globals afterwards, edge records, texture
// binding, and the pixel rules written out field by field as a reference.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>

#include "engine/fixed.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/span_fillers.h"

namespace vrx::test {

// w of the camera depths 1.0 and 2.0: Inverse(w >> 10) gives 0x10000 and 0x20000 exactly.
inline constexpr int32_t kWDepth1 = 0x4000000;
inline constexpr int32_t kWDepth2 = 0x2000000;
inline constexpr int32_t kFar = 0x7FFFFFFF; // cleared depth

// x in 16.16 from a whole part and a fraction in 1/65536.
constexpr int32_t fx(int32_t whole, int32_t frac = 0) {
    return whole * 0x10000 + frac;
}

// An edge record; at depth 1.0, uw and vw are the coordinates themselves (24 fraction bits).
inline render::SPAN_EDGE edge(int32_t x, int32_t w = kWDepth1, int32_t uw = 0, int32_t vw = 0,
                              int32_t r = 0, int32_t g = 0, int32_t b = 0) {
    return {x, w, r, g, b, 0, uw, vw};
}

class SpanTest : public ::testing::Test {
  protected:
    static constexpr int kOrigin = 8; // column 0 of the scanline
    static constexpr int kCols = 40;  // columns -8 to 31

    void SetUp() override {
        engine::FillRecipTable();
        saved_raster_ = render::g_raster;
        const engine::ENG_STATE& e = engine::g_eng;
        saved_clip_ = {e.clip_left, e.clip_top, e.clip_right, e.clip_bottom, e.clip_on};
        render::g_raster = {};
        set_clip_off();
        pixels.fill(0);
        depths.fill(kFar);
        render::g_raster.row = pixels.data() + kOrigin;
        render::g_raster.zrow = depths.data() + kOrigin;
        render::g_raster.blend_a = 256;
    }
    void TearDown() override {
        render::g_raster = saved_raster_;
        engine::ENG_STATE& e = engine::g_eng;
        e.clip_left = saved_clip_[0];
        e.clip_top = saved_clip_[1];
        e.clip_right = saved_clip_[2];
        e.clip_bottom = saved_clip_[3];
        e.clip_on = saved_clip_[4];
    }

    static void set_clip_off() { engine::g_eng.clip_on = 0; }
    static void set_clip(int32_t left, int32_t top, int32_t right, int32_t bottom) {
        engine::ENG_STATE& e = engine::g_eng;
        e.clip_left = left;
        e.clip_top = top;
        e.clip_right = right;
        e.clip_bottom = bottom;
        e.clip_on = 1;
    }
    // Binds a power-of-two texture the way the pipeline does.
    static void bind_texture(const void* texels, int32_t wlog2, int32_t hlog2) {
        render::RasterContext& rc = render::g_raster;
        rc.texels = texels;
        rc.tex_umask = (1 << wlog2) - 1;
        rc.tex_vmask = (1 << hlog2) - 1;
        rc.tex_wlog2 = wlog2;
        rc.tex_ushift = 24 - wlog2;
        rc.tex_vshift = 24 - hlog2;
    }

    uint16_t& pixel(int col) { return pixels[static_cast<size_t>(col + kOrigin)]; }
    int32_t& depth(int col) { return depths[static_cast<size_t>(col + kOrigin)]; }

    // Calls a filler with the two edges on scanline y.
    static void draw(render::SpanFn fn, const render::SPAN_EDGE& l, const render::SPAN_EDGE& r,
                     int32_t y = 0) {
        fn(&l, &r, y);
    }

    std::array<uint16_t, kCols> pixels{};
    std::array<int32_t, kCols> depths{};

  private:
    render::RasterContext saved_raster_{};
    std::array<int32_t, 5> saved_clip_{};
};

// The family member whose function is fn.
inline const render::SpanFillerInfo& info_of(render::SpanFn fn) {
    for (const render::SpanFillerInfo& f : render::kSpanTable) {
        if (f.fn == fn) return f;
    }
    ADD_FAILURE() << "not a span filler";
    return render::kSpanTable[0];
}

// ---- The pixel rules, field by field --------------------------------------------------------
// Channels are 16.16 values in 0 to 255.0; each field of the result is the channel's top bits.

constexpr uint16_t rgb565(int32_t r5, int32_t g6, int32_t b5) {
    return static_cast<uint16_t>((r5 << 11) | (g6 << 5) | b5);
}

// An interpolated colour: the top 5, 6, 5 bits of the 8-bit channels.
constexpr uint16_t ref_gouraud(int32_t r, int32_t g, int32_t b) {
    return rgb565(r >> 19, g >> 18, b >> 19);
}

// Each texel field times channel / 256 (a channel of 255.0 keeps 255/256 of the field).
constexpr uint16_t ref_modulate(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const auto f = [](int32_t field, int32_t ch) {
        return static_cast<int32_t>((int64_t{field} * ch) >> 24);
    };
    return rgb565(f(static_cast<int32_t>(t >> 11), r), f(static_cast<int32_t>((t >> 5) & 63), g),
                  f(static_cast<int32_t>(t & 31), b));
}

// Each channel plus the texel field as an 8-bit value (field << 3, green << 2), capped at 255.
constexpr uint16_t ref_add(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const int32_t r8 = std::min((r >> 16) + static_cast<int32_t>(t >> 11) * 8, 255);
    const int32_t g8 = std::min((g >> 16) + static_cast<int32_t>((t >> 5) & 63) * 4, 255);
    const int32_t b8 = std::min((b >> 16) + static_cast<int32_t>(t & 31) * 8, 255);
    // Channels here are whole, as in the tests' colours; the fraction would not reach the pixel.
    return rgb565(r8 >> 3, g8 >> 2, b8 >> 3);
}

// Source channels (0..255) over pixel p with weight a (0..256); p's fields are widened by
// repeating their top bits.
constexpr uint16_t ref_blend(uint16_t p, int32_t rs, int32_t gs, int32_t bs, int32_t a) {
    const int32_t r5 = p >> 11, g6 = (p >> 5) & 63, b5 = p & 31;
    const int32_t r8 = (r5 << 3) | (r5 >> 2), g8 = (g6 << 2) | (g6 >> 4),
                  b8 = (b5 << 3) | (b5 >> 2);
    const auto mix = [a](int32_t under, int32_t src) { return under * (256 - a) + src * a; };
    return rgb565(mix(r8, rs) >> 11, mix(g8, gs) >> 10, mix(b8, bs) >> 11);
}

// Field-wise truncated average of four texels.
constexpr uint16_t ref_avg(std::array<uint16_t, 4> t, int32_t f0, int32_t f1, int32_t f2,
                           int32_t f3) {
    // f0..f3: widths of the fields from the top; 565 has three fields (f3 = 0).
    const std::array<int32_t, 4> widths{f0, f1, f2, f3};
    int32_t shift = 16, out = 0;
    for (int32_t w : widths) {
        if (w == 0) continue;
        shift -= w;
        int32_t sum = 0;
        for (uint16_t x : t) sum += (x >> shift) & ((1 << w) - 1);
        out |= (sum / 4) << shift;
    }
    return static_cast<uint16_t>(out);
}
constexpr uint16_t ref_avg565(std::array<uint16_t, 4> t) {
    return ref_avg(t, 5, 6, 5, 0);
}
constexpr uint16_t ref_avg4444(std::array<uint16_t, 4> t) {
    return ref_avg(t, 4, 4, 4, 4);
}

// The references themselves, pinned by hand-computed values.
static_assert(ref_modulate(0xFFFF, 0xFF0000, 0xFF0000, 0xFF0000) == 0xF7DE);
static_assert(ref_gouraud(0xC80000, 0x640000, 0x320000) == 0xCB26); // 200, 100, 50
static_assert(ref_add(0x0841, 0xFF0000, 0, 0) == 0xF841);
static_assert(ref_blend(0xFFFF, 0, 0, 0, 128) == 0x7BEF);
static_assert(ref_blend(0x1234, 0, 0, 0, 0) == 0x1234);
static_assert(ref_avg565({0x1FAC, 0x724C, 0x1FAC, 0xD61A}) == 0x5DEF);
static_assert(ref_avg4444({0xFFFF, 0x8421, 0xFFFF, 0x1234}) == 0x9988);

} // namespace vrx::test
