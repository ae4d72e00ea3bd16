// The span fillers' rules one at a time: coverage, depth, colour stepping, the colour
// operations, texel addressing, affine and perspective coordinates, the four-tap filter and
// the clip. Every expected value is worked out by hand in the comments beside it.
#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <vector>

#include "span_test_support.h"

namespace vrx::test {
namespace {

using namespace vrx::render;

// ---- Coverage -------------------------------------------------------------------------------

struct CoverageCase {
    const char* what;
    SpanFn fn;
    int32_t xl, xr;
    int first, last; // drawn columns; first > last: nothing
};

// Rule A draws the pixels whose centre lies in (xl, xr]; SPAN_FLAT's rule B draws every column
// from floor(xl) to floor(xr) when xr > xl.
const CoverageCase kCoverage[] = {
    {"A: 2.5..3.5 is pixel 3 only", span_gouraud, fx(2, 0x8000), fx(3, 0x8000), 3, 3},
    {"A: 2.5..2.5 is empty", span_gouraud, fx(2, 0x8000), fx(2, 0x8000), 1, 0},
    {"A: just left of centre 2.5", span_gouraud, fx(2, 0x7FFF), fx(3, 0x8000), 2, 3},
    {"A: 3.0..3.49998 holds no centre", span_gouraud, fx(3), fx(3, 0x7FFF), 1, 0},
    {"A: reversed ends", span_gouraud, fx(3, 0x8000), fx(2, 0x8000), 1, 0},
    {"A: negative columns", span_gouraud, fx(-1, -0x8000), fx(1, 0x8000), -1, 1},
    {"A: depth filler alike", span_flat_z, fx(2, 0x8000), fx(3, 0x8000), 3, 3},
    {"B: 2.25..3.25 is pixels 2 and 3", span_flat, fx(2, 0x4000), fx(3, 0x4000), 2, 3},
    {"B: 2.25..2.25 is empty", span_flat, fx(2, 0x4000), fx(2, 0x4000), 1, 0},
    {"B: one raw unit wide", span_flat, fx(2, 0x4000), fx(2, 0x4001), 2, 2},
    {"B: reversed ends", span_flat, fx(3, 0x4000), fx(2, 0x4000), 1, 0},
    {"B: floors negative x", span_flat, fx(-1, -0x8000), fx(0, 0xC000), -2, 0},
};

using SpanCoverageTest = SpanTest;

TEST_F(SpanCoverageTest, DrawsExactlyTheCoveredColumns) {
    for (const CoverageCase& c : kCoverage) {
        SCOPED_TRACE(c.what);
        pixels.fill(0);
        g_raster.flat_color = 0xFFFF;
        draw(c.fn, edge(c.xl, kWDepth1, 0, 0, 0xFF0000, 0xFF0000, 0xFF0000),
             edge(c.xr, kWDepth1, 0, 0, 0xFF0000, 0xFF0000, 0xFF0000));
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            const bool drawn = col >= c.first && col <= c.last;
            EXPECT_EQ(pixel(col), drawn ? 0xFFFF : 0) << "column " << col;
        }
    }
}

// ---- Depth ----------------------------------------------------------------------------------

using SpanDepthTest = SpanTest;

// Pixels 2..6 from depth 1.0 to 2.0: RecipTable[4] >> 8 = 0x4000, so the step is
// (0x10000 * 0x4000) >> 16 = 0x4000 and the depths are 0x10000, 0x14000, ..., 0x20000. Stored
// depths: far (drawn), equal (not drawn: strict), nearer by one unit (not drawn), farther by one
// unit (drawn), far (drawn). Every affine and untextured depth filler behaves alike.
TEST_F(SpanDepthTest, StrictCompareAndStoredDepthAcrossAffineFillers) {
    static const uint32_t tex[1] = {0}; // wide enough for every texel format
    bind_texture(tex, 0, 0);
    int checked = 0;
    for (const SpanFillerInfo& f : kSpanTable) {
        if (f.depth != Depth::Less || f.uv == Uv::Perspective8) continue;
        SCOPED_TRACE(f.name);
        ++checked;
        pixels.fill(0xABCD);
        depths.fill(kFar);
        depth(3) = 0x14000;
        depth(4) = 0x17FFF;
        depth(5) = 0x1C001;
        draw(f.fn, edge(fx(1, 0x8000), kWDepth1), edge(fx(6, 0x8000), kWDepth2));
        const std::array<int32_t, 5> want_depth{0x10000, 0x14000, 0x17FFF, 0x1C000, 0x20000};
        for (int col = 2; col <= 6; ++col) EXPECT_EQ(depth(col), want_depth[col - 2]) << col;
        EXPECT_EQ(pixel(3), 0xABCD);
        EXPECT_EQ(pixel(4), 0xABCD);
        EXPECT_EQ(depth(1), kFar);
        EXPECT_EQ(depth(7), kFar);
    }
    // 3 untextured, 4 + 3 + 3 standard textured, 4 + 2 + 2 filtered.
    EXPECT_EQ(checked, 21);
}

// ---- Colour stepping ------------------------------------------------------------------------

using SpanColourTest = SpanTest;

// Pixels 2..6, red 0 -> 255.0, green 255.0 -> 0, blue 128.0: steps of +-(0xFF0000 * 0x4000)
// >> 16 = 0x3FC000 (63.75). Red 0, 63.75, 127.5, 191.25, 255 has top bits 0, 7, 15, 23, 31;
// green 255 .. 0 has 63, 47, 31, 15, 0; blue 128 gives 16.
TEST_F(SpanColourTest, GouraudStepsEachChannelFromTheLeftEnd) {
    draw(span_gouraud, edge(fx(1, 0x8000), kWDepth1, 0, 0, 0, 0xFF0000, 0x800000),
         edge(fx(6, 0x8000), kWDepth1, 0, 0, 0xFF0000, 0, 0x800000));
    const std::array<uint16_t, 5> want{0x07F0, 0x3DF0, 0x7BF0, 0xB9F0, 0xF810};
    for (int col = 2; col <= 6; ++col) EXPECT_EQ(pixel(col), want[col - 2]) << col;
}

// Colour and depth steps multiply by RecipTable[n] >> 8 and shift by 16, so the table entry
// loses its low 8 bits first. Pixels 2..5 (n = 3, RecipTable[3] = 0x555555):
// - red from 4 raw units up by 24.0: step (0x180000 * 0x5555) >> 16 = 0x7FFF8, so pixel 3 holds
//   0x7FFFC, just below 8.0 (field 0), and pixel 5 0x17FFEC (field 2);
// - depth from 1.0 to 16.0 (w 0x4000000 to 0x400000): step (0xF0000 * 0x5555) >> 16 = 0x4FFFB.
TEST_F(SpanColourTest, StepsUseTheTableEntryWithoutItsLowByte) {
    draw(span_gouraud, edge(fx(1, 0x8000), kWDepth1, 0, 0, 4, 0, 0),
         edge(fx(5, 0x8000), kWDepth1, 0, 0, 4 + 0x180000, 0, 0));
    const std::array<uint16_t, 4> want{0x0000, 0x0000, 0x0800, 0x1000};
    for (int col = 2; col <= 5; ++col) EXPECT_EQ(pixel(col), want[col - 2]) << col;
    draw(span_flat_z, edge(fx(1, 0x8000), kWDepth1), edge(fx(5, 0x8000), 0x400000));
    for (int col = 2; col <= 5; ++col) EXPECT_EQ(depth(col), 0x10000 + (col - 2) * 0x4FFFB) << col;
}

// ---- Colour operations on single pixels -------------------------------------------------------

struct OpCase {
    const char* what;
    SpanFn fn;
    uint32_t texel;     // the one texel of a 1 x 1 texture
    int32_t r, g, b;    // edge colour (both ends)
    int32_t fr, fg, fb; // flat_r, flat_g, flat_b
    int32_t a;          // blend_a
    uint16_t under;     // pixel before
    uint16_t want;
};

constexpr int32_t c8(int32_t v) {
    return v << 16;
} // an 8-bit channel as 16.16

const OpCase kOps[] = {
    // Modulate: 0xFFFF by 255.0: red 31 * 255 / 256 = 30.9 -> 30 ... gives 0xF7DE.
    {"modulate 0xFFFF by flat 255", span_texmod, 0xFFFF, 0, 0, 0, c8(255), c8(255), c8(255), 0, 0,
     0xF7DE},
    {"modulate 0xFFFF by stepped 255", span_texgour, 0xFFFF, c8(255), c8(255), c8(255), 0, 0, 0, 0,
     0, 0xF7DE},
    {"modulate by black", span_texmod, 0xFFFF, 0, 0, 0, 0, 0, 0, 0, 0, 0x0000},
    // 0x8410 is fields 16, 32, 16; times 128/256: 8, 16, 8.
    {"modulate grey by half", span_texgour, 0x8410, c8(128), c8(128), c8(128), 0, 0, 0, 0, 0,
     0x4208},
    // Flat modulation reads flat_r/g/b, not the edge colour.
    {"modulate reads the flat colour", span_texmod, 0xFFFF, c8(255), c8(255), c8(255), 0, 0, 0, 0,
     0, 0x0000},
    // Add: red 255.0 + any red saturates at 31; 0x0841 adds green 2 * 4 = 8.0 and blue 8.0.
    {"add saturates red", span_texadd, 0x0841, c8(255), 0, 0, 0, 0, 0, 0, 0, 0xF841},
    {"add to black texel", span_texadd, 0x0000, c8(255), 0, 0, 0, 0, 0, 0, 0, 0xF800},
    {"add saturates all", span_texadd, 0xFFFF, c8(255), c8(255), c8(255), 0, 0, 0, 0, 0, 0xFFFF},
    // 0x8410 adds 128.0 to each: 228 -> 28, 328 -> 255 -> 63, 128 -> 16.
    {"add mixed", span_texadd, 0x8410, c8(100), c8(200), 0, 0, 0, 0, 0, 0, 0xE7F0},
    // Blend black over white at weight 128: 255 * 128 = 32640 -> 15, 31, 15.
    {"blend 565 half", span_blend_565, 0x0000, 0, 0, 0, 0, 0, 0, 128, 0xFFFF, 0x7BEF},
    {"blend 565 opaque is a copy", span_blend_565, 0x1234, 0, 0, 0, 0, 0, 0, 256, 0xFFFF, 0x1234},
    {"blend 565 weight 0 keeps", span_blend_565_p, 0x1234, 0, 0, 0, 0, 0, 0, 0, 0x8C51, 0x8C51},
    // Format 1 alpha 0: weight 0, the pixel comes back exactly.
    {"4444 alpha 0 affine", span_blend_4444, 0xFFF0, 0, 0, 0, 0, 0, 0, 256, 0x1234, 0x1234},
    {"4444 alpha 0 perspective", span_blend_4444_p, 0xFFF0, 0, 0, 0, 0, 0, 0, 256, 0xFFFF, 0xFFFF},
    {"4444 alpha 0 lit", span_blendlit_4444_z, 0xFFF0, 0, 0, 0, 0, 0, 0, 256, 0x7BEF, 0x7BEF},
    // Format 1 alpha 8 (8 * 17 = 136) over black: affine standard scales by A = 128 to 68,
    // 240 * 68 = 16320 -> 7, 15, 7; perspective uses 136: 240 * 136 = 32640 -> 15, 31, 15.
    {"4444 alpha times A", span_blend_4444, 0xFFF8, 0, 0, 0, 0, 0, 0, 128, 0, 0x39E7},
    {"4444 perspective alpha alone", span_blend_4444_p, 0xFFF8, 0, 0, 0, 0, 0, 0, 128, 0, 0x7BEF},
    // Format 2: alpha 255 with A = 256 is weight 255: 255 * 255 = 65025 -> 31, 63, 31.
    {"8888 opaque", span_blend_8888, 0xFFFFFFFF, 0, 0, 0, 0, 0, 0, 256, 0, 0xFFFF},
    // Alpha 128 times A 128 >> 8 = 64: 255 * 64 = 16320 -> 7, 15, 7; perspective: 128.
    {"8888 alpha times A", span_blend_8888, 0x80FFFFFF, 0, 0, 0, 0, 0, 0, 128, 0, 0x39E7},
    {"8888 perspective alpha alone", span_blend_8888_p, 0x80FFFFFF, 0, 0, 0, 0, 0, 0, 128, 0,
     0x7BEF},
    {"8888 lit alike", span_blendlit_8888, 0x80FFFFFF, 0, 0, 0, 0, 0, 0, 128, 0, 0x39E7},
    // Interpolated colour (255, 0, 255) at 128 over black: 15, 0, 15.
    {"Gouraud blend", span_gouraud_blend, 0, c8(255), 0, c8(255), 0, 0, 0, 128, 0, 0x780F},
    {"Gouraud blend depth", span_gouraud_blend_z, 0, c8(255), 0, c8(255), 0, 0, 0, 128, 0, 0x780F},
};

using SpanColourOpTest = SpanTest;

TEST_F(SpanColourOpTest, SinglePixels) {
    for (const OpCase& c : kOps) {
        SCOPED_TRACE(c.what);
        const uint16_t t16 = static_cast<uint16_t>(c.texel);
        const bool wide = info_of(c.fn).texel == Texel::Argb8888;
        bind_texture(wide ? static_cast<const void*>(&c.texel) : &t16, 0, 0);
        g_raster.flat_r = c.fr;
        g_raster.flat_g = c.fg;
        g_raster.flat_b = c.fb;
        g_raster.blend_a = c.a;
        pixels.fill(c.under);
        depths.fill(kFar);
        // Pixel 2 alone: xl = 2.0, xr = 3.0.
        draw(c.fn, edge(fx(2), kWDepth1, 0, 0, c.r, c.g, c.b),
             edge(fx(3), kWDepth1, 0, 0, c.r, c.g, c.b));
        EXPECT_EQ(pixel(2), c.want);
        EXPECT_EQ(pixel(1), c.under);
        EXPECT_EQ(pixel(3), c.under);
    }
}

// A format-1 texel with alpha 0 leaves every pixel exactly as it was, whatever its fields.
TEST_F(SpanColourOpTest, Alpha0LeavesAnyPixel) {
    static const uint16_t tex[1] = {0xFFF0};
    bind_texture(tex, 0, 0);
    for (SpanFn fn : {span_blend_4444, span_blend_4444_p, span_blend_4444_filtered}) {
        const std::array<uint16_t, 7> unders{0x0000, 0xFFFF, 0x0821, 0xF7DE,
                                             0x8410, 0x7BEF, 0x5A5A};
        for (uint16_t under : unders) {
            pixels.fill(under);
            draw(fn, edge(fx(2)), edge(fx(9)));
            for (int col = 2; col <= 8; ++col) EXPECT_EQ(pixel(col), under);
        }
    }
}

// ---- Texel addressing -------------------------------------------------------------------------

struct WrapCase {
    int32_t u, v; // 24 fraction bits: 0x1000000 spans the texture once
    int index;
};

// An 8 x 4 texture: the column is (u >> 21) & 7, the row (v >> 22) & 3, index row * 8 + column.
const WrapCase kWraps[] = {
    {0, 0, 0},
    {0x1000000, 0, 0},           // 1.0 wraps to 0
    {0, 0x1000000, 0},           // in v too
    {0x1200000, 0x400000, 9},    // 1 + 1/8 -> column 1; 1/4 -> row 1
    {-0x200000, -0x400000, 31},  // -1/8 -> column 7; -1/4 -> row 3
    {0xFFFFFF, 0xFFFFFF, 31},    // just below 1.0: last column and row
    {0x7FE00000, 0x40000000, 7}, // large positive coordinates wrap as well
};

using SpanTexelTest = SpanTest;

TEST_F(SpanTexelTest, CoordinatesWrapByMasking) {
    std::array<uint16_t, 32> tex{};
    for (size_t i = 0; i < tex.size(); ++i) tex[i] = static_cast<uint16_t>(0x100 + i);
    bind_texture(tex.data(), 3, 2);
    for (const WrapCase& c : kWraps) {
        SCOPED_TRACE(c.index);
        // One pixel with equal ends: du = dv = 0, so pixel 2 fetches at (u, v).
        draw(span_tex, edge(fx(2), kWDepth1, c.u, c.v), edge(fx(3), kWDepth1, c.u, c.v));
        EXPECT_EQ(pixel(2), 0x100 + c.index);
        draw(span_tex_p, edge(fx(2), kWDepth1, c.u, c.v), edge(fx(3), kWDepth1, c.u, c.v));
        EXPECT_EQ(pixel(2), 0x100 + c.index);
    }
}

// ---- Affine and perspective coordinates ---------------------------------------------------------

// A 16 x 1 texture whose texel i is 0x100 + i, so a pixel shows which column it fetched.
class SpanCoordinateTest : public SpanTest {
  protected:
    void SetUp() override {
        SpanTest::SetUp();
        for (size_t i = 0; i < tex.size(); ++i) tex[i] = static_cast<uint16_t>(0x100 + i);
        bind_texture(tex.data(), 4, 0);
    }
    // u from 0 at depth 1.0 on the left to 1.0 at depth 2.0 on the right: uw = (u * w) >> 18,
    // 0 and (0x10000 * 0x2000000) >> 18 = 0x800000.
    void draw_ramp(SpanFn fn, int32_t xr) {
        draw(fn, edge(fx(1, 0x8000), kWDepth1, 0, 0), edge(xr, kWDepth2, 0x800000, 0));
    }
    std::array<uint16_t, 16> tex{};
};

// Affine, pixels 2..14 (13 pixels, n = 12). The ends give u 0 and 0x1000000 exactly; the step is
// ((0x1000000 - 0) * hInverse(13.0)) >> 24 = hInverse(13.0) = 0x13B13B, and pixel 2 lies 1.0 to
// the right of xl, so u(col) = (col - 1) * 0x13B13B, column u >> 20. Depth steps by
// RecipTable[12] >> 8 = 0x1555 from 0x10000.
TEST_F(SpanCoordinateTest, AffineIsExactAtTheEndsAndLinearBetween) {
    draw_ramp(span_tex_z, fx(14, 0x8000));
    const std::array<int, 13> want{1, 2, 3, 4, 6, 7, 8, 9, 11, 12, 13, 14, 15};
    for (int col = 2; col <= 14; ++col) {
        EXPECT_EQ(pixel(col), 0x100 + want[col - 2]) << col;
        EXPECT_EQ(depth(col), 0x10000 + (col - 2) * 0x1555) << col;
    }
    EXPECT_EQ(pixel(15), 0);
}

struct RunCase {
    const char* what;
    int32_t xr;
    bool receding;              // depth 1.0 -> 2.0 with u 0 -> 1.0, else 2.0 -> 1.0 with u 1.0 -> 0
    std::vector<int32_t> depth; // pixels 2 onward
    std::vector<int> column;
};

// Perspective runs. w steps by dw = ((0x2000000 - 0x4000000) * hInverse(width)) >> 24 and the
// first pixel centre lies 1.0 right of xl; the true depth Inverse(W >> 10) and coordinates are
// taken at the run ends, and the pixels of a run step linearly between them.
// - 13 pixels: a short run of 13 & 7 = 5 (depth 0x10A3E .. step 0xD4F, ending at the exact
//   0x14CCD), then one run of 8 from 0x14CCD by (0x22AAC - 0x14CCD) >> 3 = 0x1BBB.
// - 8 pixels: no short run, one run of 8 from 0x11112 by 0x2702.
// - 7 pixels: one short run of 7 from 0x113B1 by ((0x25559 - 0x113B1) * (RecipTable[7] >> 8))
//   >> 16 = 0x2DF3.
// - 13 pixels approaching: 5 from 0x1DB6C by -0x1906, then 8 from 0x15E51 by
//   (0xF685 - 0x15E51) >> 3 = -0x67CC >> 3 = -0xCFA (the shift rounds down).
const RunCase kRuns[] = {
    {"13 = 5 + 8",
     fx(14, 0x8000),
     true,
     {0x10A3E, 0x1178D, 0x124DC, 0x1322B, 0x13F7A, 0x14CCD, 0x16888, 0x18443, 0x19FFE, 0x1BBB9,
      0x1D774, 0x1F32F, 0x20EEA},
     {0, 1, 2, 3, 3, 4, 6, 8, 10, 11, 13, 15, 0}},
    {"8 is one run",
     fx(9, 0x8000),
     true,
     {0x11112, 0x13814, 0x15F16, 0x18618, 0x1AD1A, 0x1D41C, 0x1FB1E, 0x22220},
     {1, 3, 5, 8, 10, 13, 15, 2}},
    {"7 is one short run",
     fx(8, 0x8000),
     true,
     {0x113B1, 0x141A4, 0x16F97, 0x19D8A, 0x1CB7D, 0x1F970, 0x22763},
     {1, 4, 6, 9, 12, 15, 2}},
    {"13 approaching",
     fx(14, 0x8000),
     false,
     {0x1DB6C, 0x1C266, 0x1A960, 0x1905A, 0x17754, 0x15E51, 0x15157, 0x1445D, 0x13763, 0x12A69,
      0x11D6F, 0x11075, 0x1037B},
     {13, 12, 10, 9, 7, 5, 5, 4, 3, 2, 1, 1, 0}},
};

TEST_F(SpanCoordinateTest, PerspectiveRunsOfEightAfterAShortRun) {
    for (const RunCase& c : kRuns) {
        SCOPED_TRACE(c.what);
        pixels.fill(0);
        depths.fill(kFar);
        if (c.receding) {
            draw_ramp(span_tex_zp, c.xr);
        } else {
            draw(span_tex_zp, edge(fx(1, 0x8000), kWDepth2, 0x800000, 0),
                 edge(c.xr, kWDepth1, 0, 0));
        }
        for (size_t i = 0; i < c.depth.size(); ++i) {
            const int col = 2 + static_cast<int>(i);
            EXPECT_EQ(depth(col), c.depth[i]) << col;
            EXPECT_EQ(pixel(col), 0x100 + c.column[i]) << col;
        }
        EXPECT_EQ(pixel(2 + static_cast<int>(c.depth.size())), 0);
    }
}

// ---- Four-tap filter ------------------------------------------------------------------------

// An 8 x 8 RGB565 texture without structure, so different tap sets give different averages.
constexpr uint16_t kNoise[8][8] = {
    {0xA5CD, 0x4D3C, 0xCA26, 0x18B8, 0x2516, 0x3031, 0xBB3B, 0x1DB2},
    {0x6DEC, 0x1332, 0x2C01, 0xDE06, 0xD61A, 0x23C4, 0x7B38, 0x2E71},
    {0xD95A, 0x1E43, 0x3F62, 0x724C, 0x1FAC, 0xCB19, 0x1963, 0x7131},
    {0x17D9, 0x442F, 0x9447, 0xD699, 0x49DB, 0x3C4F, 0x9DF1, 0x5C88},
    {0x34C3, 0x6030, 0xBEAA, 0x31E2, 0x2025, 0x1E84, 0x6973, 0xFE2A},
    {0xDAED, 0xA0D7, 0xEE63, 0xE807, 0xB921, 0x997B, 0x7F31, 0x5C0A},
    {0x7CFA, 0x29E8, 0x99BA, 0xFD7F, 0xAFDC, 0xE5CD, 0x936C, 0x257A},
    {0x3C73, 0xD614, 0x5475, 0xAF21, 0x4DD0, 0xFA59, 0xD7E8, 0x1412},
};

struct FootprintCase {
    int32_t eu, ev; // per-pixel step in eighths of a texel; q = eu^2 + ev^2
    int32_t u, v;   // coordinates at the pixel centre
    uint16_t want;
};

constexpr int32_t kEighth = 0x40000; // 1/8 of a texel of an 8-texel texture
constexpr int32_t kU4_125 = 0x840000, kV2_125 = 0x440000;
constexpr int32_t kU4_25 = 0x880000, kV2_25 = 0x480000;

// Taps at (u + a1, v + a3), (u - a3, v + a1), (u + a3, v - a1), (u - a1, v - a3) with a1, a3 =
// 1/8, 3/8 texel, halved for q < 32, again for q < 16, doubled for q > 512, again for q > 1024.
// Texels are named (column, row):
// - at (4.125, 2.125): /4 -> all (4,2) = 0x1FAC; /2 or x1 -> (4,2) (3,2) (4,2) (4,1), average
//   of 0x1FAC 0x724C 0x1FAC 0xD61A = 0x5DEF; x2 -> (4,2) (3,2) (4,1) (3,1) = 0x8D6E;
//   x4 -> (4,3) (2,2) (5,1) (3,0) = 0x2B6E.
// - at (4.25, 2.25): /2 -> all (4,2); x1 -> (4,2) (3,2) (4,2) (4,1) = 0x5DEF.
const FootprintCase kFootprints[] = {
    {3, 0, kU4_125, kV2_125, 0x1FAC},   // q = 9: halved twice
    {4, 0, kU4_125, kV2_125, 0x5DEF},   // q = 16: halved once
    {5, 0, kU4_25, kV2_25, 0x1FAC},     // q = 25: halved once
    {4, 4, kU4_25, kV2_25, 0x5DEF},     // q = 32: as is
    {8, 0, kU4_25, kV2_25, 0x5DEF},     // q = 64: as is
    {16, 16, kU4_125, kV2_125, 0x5DEF}, // q = 512: as is
    {23, 0, kU4_125, kV2_125, 0x8D6E},  // q = 529: doubled
    {32, 0, kU4_125, kV2_125, 0x8D6E},  // q = 1024: doubled once
    {33, 0, kU4_125, kV2_125, 0x2B6E},  // q = 1089: doubled twice
    {0, 33, kU4_125, kV2_125, 0x2B6E},  // the step in v counts alike
};

using SpanFilterTest = SpanTest;

TEST_F(SpanFilterTest, FootprintScalesTheTaps) {
    bind_texture(kNoise, 3, 3);
    for (const FootprintCase& c : kFootprints) {
        SCOPED_TRACE(testing::Message() << "eu " << c.eu << " ev " << c.ev);
        // One pixel, xl = 2.0 and xr = 3.0: hInverse(1.0) = 1 << 24, so du is the difference of
        // the ends, and the centre lies half a pixel in: ends at u -+ du / 2.
        const int32_t du = c.eu * kEighth, dv = c.ev * kEighth;
        draw(span_tex_filtered, edge(fx(2), kWDepth1, c.u - du / 2, c.v - dv / 2),
             edge(fx(3), kWDepth1, c.u + du / 2, c.v + dv / 2));
        EXPECT_EQ(pixel(2), c.want);
        // The standard filler takes the one texel under the centre, (4, 2).
        draw(span_tex, edge(fx(2), kWDepth1, c.u - du / 2, c.v - dv / 2),
             edge(fx(3), kWDepth1, c.u + du / 2, c.v + dv / 2));
        EXPECT_EQ(pixel(2), 0x1FAC);
    }
}

// A perspective span measures its footprint per run: one pixel is a short run of 1 whose end
// lies on the pixel itself (RecipTable[0] = 0 makes the span's step 0), so q = 0 and the taps are
// halved twice, where the affine filler sees the step of the ends (q = 64) and spreads them.
TEST_F(SpanFilterTest, PerspectiveMeasuresTheFootprintPerRun) {
    bind_texture(kNoise, 3, 3);
    const int32_t du = 8 * kEighth;
    const SPAN_EDGE l = edge(fx(2), kWDepth1, kU4_125 - du / 2, kV2_125);
    const SPAN_EDGE r = edge(fx(3), kWDepth1, kU4_125 + du / 2, kV2_125);
    draw(span_tex_p_filtered, l, r);
    EXPECT_EQ(pixel(2), 0x1FAC);
    draw(span_tex_filtered, l, r);
    EXPECT_EQ(pixel(2), 0x5DEF);
}

// RGBA4444 on an 8 x 4 texture: row offsets are fractions of a row of height 4 (3/8 of
// 0x400000 = 0x180000). At (4.125, 1.125) the taps are (4,1) (3,1) (4,1) (4,0): 0xFFFF, 0x8421,
// 0xFFFF, 0x1234 average per field to 0x9988 (39/4, 36/4, 35/4, 35/4). Its alpha 8 alone is the
// weight, 136, whatever A: over black 0x90 * 136 = 19584 -> 9, 19, 8 = 0x4A68; over white
// 255 * 120 + 0x90 * 136 -> 24, 49, 23 = 0xC637.
TEST_F(SpanFilterTest, Rgba4444AverageBlendsByItsAlphaAlone) {
    std::array<uint16_t, 32> tex{};
    tex[1 * 8 + 4] = 0xFFFF;
    tex[1 * 8 + 3] = 0x8421;
    tex[0 * 8 + 4] = 0x1234;
    bind_texture(tex.data(), 3, 2);
    g_raster.blend_a = 128;
    const int32_t du = 8 * kEighth, u = 0x840000, v = 0x480000;
    const SPAN_EDGE l = edge(fx(2), kWDepth1, u - du / 2, v);
    const SPAN_EDGE r = edge(fx(3), kWDepth1, u + du / 2, v);
    for (SpanFn fn : {span_blend_4444_filtered, span_blend_4444_z_filtered,
                      span_blendlit_4444_filtered, span_blendlit_4444_z_filtered}) {
        pixels.fill(0);
        depths.fill(kFar);
        draw(fn, l, r);
        EXPECT_EQ(pixel(2), 0x4A68);
        pixels.fill(0xFFFF);
        depths.fill(kFar);
        draw(fn, l, r);
        EXPECT_EQ(pixel(2), 0xC637);
    }
    // The standard affine filler blends the one texel (4,1), alpha 15 -> 255 * 128 >> 8 = 127,
    // over black: 240 * 127 = 30480 -> 14, 29, 14.
    pixels.fill(0);
    draw(span_blend_4444, l, r);
    EXPECT_EQ(pixel(2), 0x73AE);
}

// ---- Clip -----------------------------------------------------------------------------------

using SpanClipTest = SpanTest;

// Filtered fillers keep a scissored window's rectangle exactly as the standard ones do, and a
// clipped pixel's depth is not written either.
TEST_F(SpanClipTest, FilteredFillersClipLikeStandardOnes) {
    static const uint16_t tex[1] = {0x07E0};
    bind_texture(tex, 0, 0);
    set_clip(4, 0, 9, 10);
    for (SpanFn fn : {span_tex, span_tex_filtered, span_tex_zp_filtered, span_blend_565_p_filtered,
                      span_texadd_z_filtered}) {
        const SpanFillerInfo& f = info_of(fn);
        SCOPED_TRACE(f.name);
        pixels.fill(0);
        depths.fill(kFar);
        draw(fn, edge(fx(0)), edge(fx(20)), 3);
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            const bool inside = col >= 4 && col < 9;
            EXPECT_EQ(pixel(col) != 0, inside) << col;
            EXPECT_EQ(depth(col) != kFar, inside && f.depth == Depth::Less) << col;
        }
        // Scanlines outside [top, bottom) are dropped whole.
        pixels.fill(0);
        draw(fn, edge(fx(0)), edge(fx(20)), 10);
        draw(fn, edge(fx(0)), edge(fx(20)), -1);
        for (uint16_t p : pixels) EXPECT_EQ(p, 0);
    }
}

// A span far wider than the reciprocal table (a zoomed window) is cut to the clip rectangle
// and never reads beyond the table; its constant colour fills the visible columns.
TEST_F(SpanClipTest, SpanWiderThanTheTableStaysInTheRectangle) {
    set_clip(0, 0, 32, 10);
    draw(span_gouraud, edge(fx(-3000), kWDepth1, 0, 0, c8(255), 0, 0),
         edge(fx(3000), kWDepth1, 0, 0, c8(255), 0, 0), 0);
    for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
        EXPECT_EQ(pixel(col), col >= 0 && col < 32 ? 0xF800 : 0) << col;
    }
}

} // namespace
} // namespace vrx::test
