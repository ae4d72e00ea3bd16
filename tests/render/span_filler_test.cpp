// The span fillers against hand-derived pixels: all 73 members through the pixel rules below,
// then coverage edges, colour and depth steps, perspective runs and the filter footprint.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <tuple>

#include "engine/fixed.h"
#include "engine/state.h"
#include "render/span_fillers.h"

namespace vrx::test {
namespace {

using namespace vrx::render;

// The pixel rules, field by field; channels are 16.16 in 0 to 255.0.
constexpr uint16_t rgb565(int32_t r5, int32_t g6, int32_t b5) {
    return static_cast<uint16_t>((r5 << 11) | (g6 << 5) | b5);
}
constexpr uint16_t ref_gouraud(int32_t r, int32_t g, int32_t b) {
    return rgb565(r >> 19, g >> 18, b >> 19);
}
// Each texel field times channel / 256 (255.0 keeps 255/256 of the field).
constexpr uint16_t ref_modulate(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const auto f = [](uint32_t field, int32_t ch) {
        return static_cast<int32_t>((int64_t{field} * ch) >> 24);
    };
    return rgb565(f(t >> 11, r), f((t >> 5) & 63, g), f(t & 31, b));
}
// Each whole channel plus the field as an 8-bit value (field << 3, green << 2), capped at 255.
constexpr uint16_t ref_add(uint32_t t, int32_t r, int32_t g, int32_t b) {
    const auto f = [](uint32_t field, int32_t ch, int32_t scale) {
        return std::min((ch >> 16) + static_cast<int32_t>(field) * scale, 255);
    };
    return rgb565(f(t >> 11, r, 8) >> 3, f((t >> 5) & 63, g, 4) >> 2, f(t & 31, b, 8) >> 3);
}
// Source channels (0..255) over p with weight a (0..256); p's fields widened by repetition.
constexpr uint16_t ref_blend(uint16_t p, int32_t rs, int32_t gs, int32_t bs, int32_t a) {
    const int32_t r5 = p >> 11, g6 = (p >> 5) & 63, b5 = p & 31;
    const auto mix = [a](int32_t under, int32_t src) { return under * (256 - a) + src * a; };
    return rgb565(mix((r5 << 3) | (r5 >> 2), rs) >> 11, mix((g6 << 2) | (g6 >> 4), gs) >> 10,
                  mix((b5 << 3) | (b5 >> 2), bs) >> 11);
}
// Field-wise truncated average of four texels; widths of the fields from the top.
constexpr uint16_t ref_avg(std::array<uint16_t, 4> t, std::array<int32_t, 4> widths) {
    int32_t shift = 16, out = 0;
    for (int32_t w : widths) {
        shift -= w;
        int32_t sum = 0;
        for (uint16_t x : t) sum += (x >> shift) & ((1 << w) - 1);
        out |= (sum / 4) << shift;
    }
    return static_cast<uint16_t>(out);
}

// The rules themselves, pinned by hand-computed values.
static_assert(ref_modulate(0xFFFF, 0xFF0000, 0xFF0000, 0xFF0000) == 0xF7DE); // 30, 62, 30
static_assert(ref_add(0x0841, 0xFF0000, 0, 0) == 0xF841); // red capped, green 8.0, blue 8.0
static_assert(ref_blend(0xFFFF, 0, 0, 0, 128) == 0x7BEF && ref_blend(0x1234, 0, 0, 0, 0) == 0x1234);
static_assert(ref_blend(0, 255, 255, 255, 255) == 0xFFFF); // 65025 -> 31, 63, 31
static_assert(ref_avg({0x1FAC, 0x724C, 0x1FAC, 0xD61A}, {5, 6, 5, 0}) == 0x5DEF);
static_assert(ref_avg({0xFFFF, 0x8421, 0xFFFF, 0x1234}, {4, 4, 4, 4}) == 0x9988);

// w of the camera depths 1.0 and 2.0: Inverse(w >> 10) gives 0x10000 and 0x20000 exactly.
constexpr int32_t kW1 = 0x4000000, kW2 = 0x2000000;

// x in 16.16 from a whole part and a fraction in 1/65536.
constexpr int32_t fx(int32_t whole, int32_t frac = 0) {
    return whole * 0x10000 + frac;
}
// An edge record; at depth 1.0, uw and vw are the coordinates themselves (24 fraction bits).
SPAN_EDGE edge(int32_t x, int32_t w = kW1, int32_t uw = 0, int32_t vw = 0, int32_t r = 0,
               int32_t g = 0, int32_t b = 0) {
    return {x, w, r, g, b, 0, uw, vw};
}

// Texel (c, r) of the 8 x 8 texture of each format; coordinates wrap. Texel (3, 3), drawn by
// every member below, has alpha 0 in format 1 and 255 in format 2.
constexpr uint32_t texel_of(Texel tx, int c, int r) {
    const auto uc = static_cast<uint32_t>(c & 7), ur = static_cast<uint32_t>(r & 7);
    if (tx == Texel::Argb8888) return 0x1F2E3D4Cu * uc + 0x0B1A2938u * ur + 0x81223344u;
    if (tx == Texel::Rgba4444) return (0x3A51 * uc + 0x1C97 * ur + 0x0308) & 0xFFFF;
    return (0x1F3B * uc + 0x0AC5 * ur + 0x4242) & 0xFFFF;
}
static_assert((texel_of(Texel::Rgba4444, 3, 3) & 15) == 0 &&
              texel_of(Texel::Argb8888, 3, 3) >> 24 == 255);

constexpr uint16_t kFlatColor = 0xA5A5;
constexpr int32_t kFlatR = 128 << 16, kFlatG = 255 << 16, kFlatB = 64 << 16;
constexpr int32_t kR = 200 << 16, kG = 100 << 16, kB = 50 << 16; // edge colour, both ends
constexpr int32_t kZ = 0x10000, kY = 5; // the span's depth (w = 1.0) and scanline

// The buffers before the span; the depths cycle equal (not drawn: strict), one farther, one
// nearer.
constexpr uint16_t old_pixel(int col) {
    return static_cast<uint16_t>(0x1357 + col * 0x2B1D);
}
constexpr int32_t old_depth(int col) {
    return kZ + std::array{0, 1, -1}[static_cast<size_t>(((col % 3) + 3) % 3)];
}

// The pixel a member writes over `under` from texel t (or the filtered average t) at weight a.
uint16_t shade(const SpanFillerInfo& f, uint32_t t, uint16_t under, int32_t a) {
    if (f.op == ColorOp::Flat) return kFlatColor;
    if (f.op == ColorOp::Gouraud) return ref_gouraud(kR, kG, kB);
    if (f.op == ColorOp::GouraudBlend) return ref_blend(under, kR >> 16, kG >> 16, kB >> 16, a);
    if (f.op == ColorOp::Copy) return static_cast<uint16_t>(t);
    if (f.op == ColorOp::ModulateFlat) return ref_modulate(t, kFlatR, kFlatG, kFlatB);
    if (f.op == ColorOp::ModulateGouraud) return ref_modulate(t, kR, kG, kB);
    if (f.op == ColorOp::Add) return ref_add(t, kR, kG, kB);
    // Blends take the texel's channels as 8-bit values. Format 0 weighs by a; the alpha
    // formats by their alpha, times a / 256 only in the affine standard members.
    const auto ch = [t](int shift, uint32_t mask, int up) {
        return static_cast<int32_t>(((t >> shift) & mask) << up);
    };
    if (f.texel == Texel::Rgb565)
        return ref_blend(under, ch(11, 31, 3), ch(5, 63, 2), ch(0, 31, 3), a);
    const bool wide = f.texel == Texel::Argb8888;
    const int32_t alpha = wide ? ch(24, 255, 0) : ch(0, 15, 0) * 17;
    const int32_t w = f.uv == Uv::Affine && f.filter == Filter::Nearest ? alpha * a / 256 : alpha;
    if (wide) return ref_blend(under, ch(16, 255, 0), ch(8, 255, 0), ch(0, 255, 0), w);
    return ref_blend(under, ch(12, 15, 4), ch(8, 15, 4), ch(4, 15, 4), w);
}

struct ClipCase {
    const char* name;
    int32_t on, left, top, right, bottom;
};

// Each reject test exactly at its edge.
const ClipCase kClipCases[] = {
    {"scissored", 1, 4, 0, 11, 100},  // columns 4..10 only
    {"unclipped", 0, 0, 0, 0, 0},     // every column
    {"below", 1, 0, 0, 32, kY},       // y >= bottom: the span is rejected
    {"above", 1, 0, kY + 1, 32, 100}, // y < top
    {"left of", 1, 15, 0, 32, 100},   // x1 = 14 < left
    {"right of", 1, 0, 0, 2, 100},    // x0 = 2 >= right; SPAN_FLAT's x0 = 1 is not
};

// Points the raster context at a local scanline, columns -8 to 31.
class SpanFillerTest : public ::testing::Test {
  protected:
    static constexpr int kOrigin = 8, kCols = 40;

    void SetUp() override {
        engine::FillRecipTable();
        TearDown();
        g_raster.row = pixels.data() + kOrigin;
        g_raster.zrow = depths.data() + kOrigin;
        depths.fill(0x7FFFFFFF); // cleared depth
    }
    // Leaves no pointer into the fixture and the clip off; opening the engine sets both up.
    void TearDown() override {
        g_raster = {};
        clip() = std::tuple{0, 0, 0, 0, 0};
    }

    static std::tuple<int32_t&, int32_t&, int32_t&, int32_t&, int32_t&> clip() {
        engine::ENG_STATE& e = engine::g_eng;
        return std::tie(e.clip_on, e.clip_left, e.clip_top, e.clip_right, e.clip_bottom);
    }
    // Binds a power-of-two texture the way the pipeline does.
    static void bind_texture(const void* texels, int32_t wlog2, int32_t hlog2) {
        g_raster.texels = texels;
        g_raster.tex_umask = (1 << wlog2) - 1, g_raster.tex_vmask = (1 << hlog2) - 1;
        g_raster.tex_wlog2 = wlog2, g_raster.tex_ushift = 24 - wlog2;
        g_raster.tex_vshift = 24 - hlog2;
    }
    uint16_t& pixel(int col) { return pixels[static_cast<size_t>(col + kOrigin)]; }
    int32_t& depth(int col) { return depths[static_cast<size_t>(col + kOrigin)]; }

    // Member f draws l..r on scanline kY under clip case k at weight a_: pixels in [x0, x1]
    // passing the clip and the depth test must hold want(col), the rest their old values.
    template <class Want>
    void check(const SpanFillerInfo& f, const ClipCase& k, const SPAN_EDGE& l, const SPAN_EDGE& r,
               int x0, int x1, Want want) {
        SCOPED_TRACE(testing::Message() << f.name << ", " << k.name << ", weight " << a_);
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            pixel(col) = old_pixel(col);
            depth(col) = old_depth(col);
        }
        for (size_t i = 0; i < 64; ++i) {
            t32[i] = texel_of(f.texel, static_cast<int>(i % 8), static_cast<int>(i / 8));
            t16[i] = static_cast<uint16_t>(t32[i]);
        }
        bind_texture(f.texel == Texel::Argb8888 ? static_cast<const void*>(t32.data()) : t16.data(),
                     3, 3);
        std::tie(g_raster.flat_color, g_raster.flat_r, g_raster.flat_g, g_raster.flat_b,
                 g_raster.blend_a) = std::tuple{kFlatColor, kFlatR, kFlatG, kFlatB, a_};
        clip() = std::tuple{k.on, k.left, k.top, k.right, k.bottom};
        f.fn(&l, &r, kY);
        const bool rejected =
            k.on && (kY >= k.bottom || kY < k.top || x0 >= k.right || x1 < k.left);
        int drawn = 0;
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            const bool in_clip = !k.on || (col >= k.left && col < k.right);
            const bool nearer = f.depth == Depth::None || old_depth(col) > kZ;
            const bool draws = !rejected && col >= x0 && col <= x1 && in_clip && nearer;
            drawn += draws ? 1 : 0;
            EXPECT_EQ(pixel(col), draws ? want(col) : old_pixel(col)) << "column " << col;
            EXPECT_EQ(depth(col), draws && f.depth == Depth::Less ? kZ : old_depth(col)) << col;
        }
        EXPECT_EQ(drawn > 0, !rejected && x0 <= x1); // each case reaches the buffer unless not
    }

    // Mid-texel span: xl = 1.5, xr = 14.5 (pixels 2..14, 5 + 8 in perspective runs; rule B
    // 1..14), depth 1.0. u runs 0.5 to 13.5 texels, so pixel col samples the middle of texel
    // column col - 1 (a few raw units either way), row 3.5; the taps lie within 3/8 texel of
    // it (q about 64, taps unscaled), so filtered members average four copies of it.
    void mid_texel_span(const SpanFillerInfo& f, const ClipCase& k) {
        const int32_t one = 0x200000; // one texel of an 8-texel texture
        const SPAN_EDGE l = edge(fx(1, 0x8000), kW1, one / 2, 7 * one / 2, kR, kG, kB);
        const SPAN_EDGE r = edge(fx(14, 0x8000), kW1, 27 * one / 2, 7 * one / 2, kR, kG, kB);
        check(f, k, l, r, f.coverage == Coverage::Columns ? 1 : 2, 14,
              [&](int col) { return shade(f, texel_of(f.texel, col - 1, 3), old_pixel(col), a_); });
    }

    std::array<uint16_t, kCols> pixels{};
    std::array<int32_t, kCols> depths{};
    int32_t a_ = 160; // the material's weight
    std::array<uint16_t, 64> t16{};
    std::array<uint32_t, 64> t32{};
};

using SpanFamilyTest = SpanFillerTest;

// Every member on the scissored scanline at the material weight 160 and at 0 (blends keep
// the pixel exactly) and 256 (a format 0 blend is a copy); every clip case on rule B, depth,
// perspective with depth and a filtered perspective blend.
TEST_F(SpanFamilyTest, EveryMemberAndEveryClipCase) {
    for (int32_t a : {160, 0, 256}) {
        a_ = a;
        for (const SpanFillerInfo& f : kSpanTable) mid_texel_span(f, kClipCases[0]);
    }
    using enum SpanFillerId;
    for (SpanFillerId id :
         {span_flat, span_gouraud_blend_z, span_texmod_zp, span_blend_4444_p_filtered})
        for (const ClipCase& k : kClipCases) mid_texel_span(span_info(id), k);
}

// Corner span: xl = 2.0, xr = 10.0 (pixels 2..9), u from 7.5 texels by exactly one texel per
// pixel (hInverse(8.0) = 1 << 21; in perspective one raw unit short, which no tap notices), so
// pixel col samples the corner of texel columns col - 2, col - 3 and rows 3, 4, and the taps
// (u + 1/8, v + 3/8), (u - 3/8, v + 1/8), (u + 3/8, v - 1/8), (u - 1/8, v - 3/8) take the four.
TEST_F(SpanFamilyTest, FilteredMembersAverageAroundTexelCorners) {
    const SPAN_EDGE l = edge(fx(2), kW1, 0xF00000, 0x800000, kR, kG, kB);
    const SPAN_EDGE r = edge(fx(10), kW1, 0x1F00000, 0x800000, kR, kG, kB);
    int filtered = 0;
    for (const SpanFillerInfo& f : kSpanTable) {
        if (f.filter != Filter::FourTap) continue;
        ++filtered;
        const auto widths =
            f.texel == Texel::Rgb565 ? std::array{5, 6, 5, 0} : std::array{4, 4, 4, 4};
        const auto tx = [&](int c, int row) {
            return static_cast<uint16_t>(texel_of(f.texel, c, row));
        };
        check(f, kClipCases[0], l, r, 2, 9, [&](int col) {
            const int c = col - 2;
            return shade(f, ref_avg({tx(c, 4), tx(c - 1, 4), tx(c, 3), tx(c - 1, 3)}, widths),
                         old_pixel(col), a_);
        });
    }
    EXPECT_EQ(filtered, 30);
}

// Rule A draws the pixels whose centre lies in (xl, xr]; SPAN_FLAT's rule B every column from
// floor(xl) to floor(xr) when xr > xl.
TEST_F(SpanFillerTest, CoverageRulesAtTheirEdges) {
    using enum SpanFillerId;
    const auto span = [&](SpanFillerId id, const ClipCase& k, int32_t xl, int32_t xr, int x0,
                          int x1) {
        const SpanFillerInfo& f = span_info(id);
        check(f, k, edge(xl, kW1, 0, 0, kR, kG, kB), edge(xr, kW1, 0, 0, kR, kG, kB), x0, x1,
              [&](int col) { return shade(f, 0, old_pixel(col), a_); });
    };
    const ClipCase& off = kClipCases[1];
    span(span_gouraud, off, fx(2, 0x7FFF), fx(3, 0x8000), 2, 3);    // just left of 2.5
    span(span_gouraud, off, fx(3), fx(3, 0x7FFF), 1, 0);            // no centre in 3..3.49
    span(span_gouraud, off, fx(-1, -0x8000), fx(1, 0x8000), -1, 1); // negative columns
    span(span_flat, off, fx(2, 0x4000), fx(2, 0x4000), 1, 0);       // empty
    span(span_flat, off, fx(2, 0x4000), fx(2, 0x4001), 2, 2);       // one raw unit wide
    span(span_flat, off, fx(3, 0x4000), fx(2, 0x4000), 1, 0);       // reversed
    span(span_flat, off, fx(-1, -0x8000), fx(0, 0xC000), -2, 0);    // floors negative x
    // Far wider than the reciprocal table (a zoomed window): cut to the clip, no read beyond.
    span(span_gouraud, {"wide", 1, 0, 0, 32, 100}, fx(-3000), fx(3000), -3000, 3000);
}

// Steps are (difference * (RecipTable[n] >> 8)) >> 16. Pixels 2..6 (0x4000): red 0 -> 255.0,
// green 255.0 -> 0, blue 128.0 step by 63.75 (red fields 0, 7, 15, 23, 31). Pixels 2..5
// (0x5555, the low byte lost): red 4 raw units up by 24.0 steps 0x7FFF8, pixel 3 0x7FFFC
// (field 0), pixel 5 0x17FFEC; depth 1.0 to 16.0 steps 0xF0000 * 0x5555 >> 16 = 0x4FFFB.
TEST_F(SpanFillerTest, ColourAndDepthStepFromTheLeftEnd) {
    const auto draw = [](SpanFn fn, SPAN_EDGE l, SPAN_EDGE r) { fn(&l, &r, 0); };
    draw(span_gouraud, edge(fx(1, 0x8000), kW1, 0, 0, 0, 255 << 16, 128 << 16),
         edge(fx(6, 0x8000), kW1, 0, 0, 255 << 16, 0, 128 << 16));
    const std::array<uint16_t, 5> want{0x07F0, 0x3DF0, 0x7BF0, 0xB9F0, 0xF810};
    for (int col = 2; col <= 6; ++col) EXPECT_EQ(pixel(col), want[col - 2]) << col;
    draw(span_gouraud, edge(fx(1, 0x8000), kW1, 0, 0, 4), edge(fx(5, 0x8000), kW1, 0, 0, 0x180004));
    const std::array<uint16_t, 4> want_low{0x0000, 0x0000, 0x0800, 0x1000};
    for (int col = 2; col <= 5; ++col) EXPECT_EQ(pixel(col), want_low[col - 2]) << col;
    draw(span_flat_z, edge(fx(1, 0x8000), kW1), edge(fx(5, 0x8000), 0x400000));
    for (int col = 2; col <= 5; ++col) EXPECT_EQ(depth(col), 0x10000 + (col - 2) * 0x4FFFB) << col;
}

// 13 pixels of u over a 16 x 1 texture (uw 0 to 0x800000): true depth and u at run ends, linear
// between; a short run of 13 & 7 = 5 (0x10A3E by 0xD4F to the exact 0x14CCD), then 8 by
// (0x22AAC - 0x14CCD) >> 3 = 0x1BBB. Approaching: 5 from 0x1DB6C by -0x1906, then 8 from
// 0x15E51 by (0xF685 - 0x15E51) >> 3 = -0x67CC >> 3 = -0xCFA (the shift rounds down).
TEST_F(SpanFillerTest, PerspectiveRunsOfEightAfterAShortRun) {
    const int32_t want_depth[2][13] = {
        {0x10A3E, 0x1178D, 0x124DC, 0x1322B, 0x13F7A, 0x14CCD, 0x16888, 0x18443, 0x19FFE, 0x1BBB9,
         0x1D774, 0x1F32F, 0x20EEA},
        {0x1DB6C, 0x1C266, 0x1A960, 0x1905A, 0x17754, 0x15E51, 0x15157, 0x1445D, 0x13763, 0x12A69,
         0x11D6F, 0x11075, 0x1037B}};
    const int want_column[2][13] = {{0, 1, 2, 3, 3, 4, 6, 8, 10, 11, 13, 15, 0},
                                    {13, 12, 10, 9, 7, 5, 5, 4, 3, 2, 1, 1, 0}};
    std::array<uint16_t, 16> tex{};
    for (size_t i = 0; i < tex.size(); ++i) tex[i] = static_cast<uint16_t>(0x100 + i);
    bind_texture(tex.data(), 4, 0);
    for (int approaching = 0; approaching < 2; ++approaching) {
        pixels.fill(0);
        depths.fill(0x7FFFFFFF);
        const int32_t wl = approaching ? kW2 : kW1, ul = approaching ? 0x800000 : 0;
        const SPAN_EDGE l = edge(fx(1, 0x8000), wl, ul);
        const SPAN_EDGE r = edge(fx(14, 0x8000), kW1 + kW2 - wl, 0x800000 - ul);
        span_tex_zp(&l, &r, 0);
        for (int col = 2; col <= 14; ++col) {
            EXPECT_EQ(depth(col), want_depth[approaching][col - 2]) << approaching << col;
            EXPECT_EQ(pixel(col), 0x100 + want_column[approaching][col - 2]) << approaching << col;
        }
        EXPECT_EQ(pixel(15), 0);
    }
}

// An 8 x 8 RGB565 texture without structure (no tap below reaches rows 4 to 7).
constexpr uint16_t kNoise[8][8] = {
    {0xA5CD, 0x4D3C, 0xCA26, 0x18B8, 0x2516, 0x3031, 0xBB3B, 0x1DB2},
    {0x6DEC, 0x1332, 0x2C01, 0xDE06, 0xD61A, 0x23C4, 0x7B38, 0x2E71},
    {0xD95A, 0x1E43, 0x3F62, 0x724C, 0x1FAC, 0xCB19, 0x1963, 0x7131},
    {0x17D9, 0x442F, 0x9447, 0xD699, 0x49DB, 0x3C4F, 0x9DF1, 0x5C88},
};

constexpr int32_t kEighth = 0x40000; // 1/8 of a texel of an 8-texel texture
constexpr int32_t kU4_125 = 0x840000, kV2_125 = 0x440000, kU4_25 = 0x880000, kV2_25 = 0x480000;

// Taps a1, a3 = 1/8, 3/8 texel as above, halved for q < 32, again for q < 16, doubled for
// q > 512, again for q > 1024. Texels (column, row) at (4.125, 2.125): /4 all (4,2) = 0x1FAC;
// /2 or x1 (4,2) (3,2) (4,2) (4,1), average 0x5DEF; x2 (4,2) (3,2) (4,1) (3,1) = 0x8D6E; x4
// (4,3) (2,2) (5,1) (3,0) = 0x2B6E. At (4.25, 2.25): /2 all (4,2); x1 as at 4.125, 0x5DEF.
// Per-pixel steps eu, ev in eighths of a texel (q = eu^2 + ev^2), centre u, v, the average.
const std::array<int32_t, 5> kFootprints[] = {
    {3, 0, kU4_125, kV2_125, 0x1FAC},   // q = 9: halved twice
    {4, 0, kU4_125, kV2_125, 0x5DEF},   // q = 16: halved once
    {5, 0, kU4_25, kV2_25, 0x1FAC},     // q = 25: halved once
    {4, 4, kU4_25, kV2_25, 0x5DEF},     // q = 32: as is
    {16, 16, kU4_125, kV2_125, 0x5DEF}, // q = 512: as is
    {23, 0, kU4_125, kV2_125, 0x8D6E},  // q = 529: doubled
    {32, 0, kU4_125, kV2_125, 0x8D6E},  // q = 1024: doubled once
    {33, 0, kU4_125, kV2_125, 0x2B6E},  // q = 1089: doubled twice
};

// Pixel 2 alone (xl = 2.0, xr = 3.0): du is the difference of the ends, the centre half way;
// the standard filler takes the one texel (4, 2). A perspective pixel is a short run of 1 with
// step 0 (RecipTable[0] = 0), so q = 0 and its taps are halved twice (affine: q = 64).
TEST_F(SpanFillerTest, FilterFootprintScalesTheTaps) {
    bind_texture(kNoise, 3, 3);
    const auto one_pixel = [&](SpanFn fn, int32_t u, int32_t v, int32_t du, int32_t dv) {
        const SPAN_EDGE l = edge(fx(2), kW1, u - du / 2, v - dv / 2);
        const SPAN_EDGE r = edge(fx(3), kW1, u + du / 2, v + dv / 2);
        fn(&l, &r, 0);
        return pixel(2);
    };
    for (const auto& [eu, ev, u, v, want] : kFootprints) {
        EXPECT_EQ(one_pixel(span_tex_filtered, u, v, eu * kEighth, ev * kEighth), want) << eu << ev;
        EXPECT_EQ(one_pixel(span_tex, u, v, eu * kEighth, ev * kEighth), 0x1FAC) << eu << ev;
    }
    EXPECT_EQ(one_pixel(span_tex_p_filtered, kU4_125, kV2_125, 8 * kEighth, 0), 0x1FAC);
    EXPECT_EQ(one_pixel(span_tex_filtered, kU4_125, kV2_125, 8 * kEighth, 0), 0x5DEF);
}

} // namespace
} // namespace vrx::test
