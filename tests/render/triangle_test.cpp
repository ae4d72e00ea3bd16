// Triangle setup: vertex sort, edge steps, sides, row pointers, the flat colour, the clip
// rectangle reject and the render-buffer guard. A recording span filler stands in for the
// real fillers, so every value checked is an edge value the drawer handed over.
#include <gtest/gtest.h>

#include <array>
#include <vector>

#include "engine/fixed.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/triangle.h"
#include "support/engine_fixture.h"

using namespace vrx::render;
using vrx::engine::g_eng;

namespace {

constexpr int32_t px(int32_t v) {
    return v * 0x10000;
}

SVERTEX vtx(int32_t x, int32_t y) {
    SVERTEX v{};
    v.x = x;
    v.y = y;
    v.w = 0x4000000; // camera depth 1.0
    return v;
}

// One draw_span call as the filler saw it.
struct SpanCall {
    const SPAN_EDGE* left_ptr;
    const SPAN_EDGE* right_ptr;
    SPAN_EDGE left, right;
    int32_t y;
    uint16_t* row;
    int32_t* zrow;
    int32_t clip_on, clip_left, clip_top, clip_right, clip_bottom;
};

std::vector<SpanCall> g_calls;

void record_span(const SPAN_EDGE* l, const SPAN_EDGE* r, int32_t y) noexcept {
    g_calls.push_back({l, r, *l, *r, y, g_raster.row, g_raster.zrow, g_eng.clip_on, g_eng.clip_left,
                       g_eng.clip_top, g_eng.clip_right, g_eng.clip_bottom});
}

constexpr int32_t kSentinel = 0x5A5A5A5A;

class TriangleTest : public vrx::test::EngineTest {
  protected:
    void SetUp() override {
        EngineTest::SetUp();
        reset();
    }
    // Forgets the recorded calls and fills the edge records and flat colour with sentinels.
    static void reset() {
        g_calls.clear();
        draw_span = record_span;
        draw_triangle = nullptr;
        SPAN_EDGE s{kSentinel, kSentinel, kSentinel, kSentinel,
                    kSentinel, kSentinel, kSentinel, kSentinel};
        g_raster.left = g_raster.right = s;
        g_raster.zrow = nullptr;
        g_raster.flat_color = 0x1234;
    }
    void TearDown() override {
        draw_span = nullptr;
        draw_triangle = nullptr;
        EngineTest::TearDown();
    }

    // (y, left x, right x) of every recorded call.
    static std::vector<std::array<int32_t, 3>> xs() {
        std::vector<std::array<int32_t, 3>> out;
        for (const SpanCall& c : g_calls) out.push_back({c.y, c.left.x, c.right.x});
        return out;
    }
};

// ---- Sort order -------------------------------------------------------------------------------

struct SortCase {
    int32_t y0, y1, y2;
    int32_t k;
    SortRow row;
};

// Each call order of three scanlines 1, 5, 9 (and some ties): the index from the three
// signs and the row it names.
const SortCase kSortCases[] = {
    {1, 5, 9, 0, {0, 1, 2}}, {1, 9, 5, 1, {0, 2, 1}}, {5, 9, 1, 3, {2, 0, 1}},
    {5, 1, 9, 4, {1, 0, 2}}, {9, 1, 5, 6, {1, 2, 0}}, {9, 5, 1, 7, {2, 1, 0}},
    {3, 3, 3, 0, {0, 1, 2}}, {3, 3, 1, 3, {2, 0, 1}}, {3, 1, 1, 6, {1, 2, 0}},
};

TEST(SortOrder, SixCallOrdersAndTies) {
    for (const SortCase& c : kSortCases) {
        const int32_t k = sort_index(px(c.y0), px(c.y1), px(c.y2));
        EXPECT_EQ(k, c.k) << c.y0 << " " << c.y1 << " " << c.y2;
        const SortRow& r = SortOrderTable[static_cast<size_t>(k)];
        EXPECT_EQ(r.top, c.row.top);
        EXPECT_EQ(r.mid, c.row.mid);
        EXPECT_EQ(r.bot, c.row.bot);
        EXPECT_FALSE(sort_row_impossible(r));
    }
    // Rows 2 and 5 are the two sign patterns no ordering has.
    EXPECT_TRUE(sort_row_impossible(SortOrderTable[2]));
    EXPECT_TRUE(sort_row_impossible(SortOrderTable[5]));
}

TEST(SortOrder, OverflowingDifferenceNamesAnImpossibleRow) {
    // y1 - y0 wraps to +2.0, y2 - y0 is negative, y2 - y1 wraps positive: pattern 2.
    EXPECT_EQ(sort_index(0x7FFF0000, static_cast<int32_t>(0x80010000u), 0), 2);
}

// ---- The walk ---------------------------------------------------------------------------------

// Top (10.0, 2.25), middle (4.0, 5.5), bottom (16.0, 8.99998): the y fractions play no part.
// Heights 3, 6, 3; RecipTable[3] = 5592405, RecipTable[6] = 2796202.
//   T->M x step: (-6.0 * 5592405) >> 24 = floor(-131071.99) = -131072
//   T->B x step: (6.0 * 2796202) >> 24 = floor(65535.98) = 65535
//   M->B x step: (12.0 * 5592405) >> 24 = floor(262143.98) = 262143
// T->M steps left of T->B, so the short side is on the left.
const SVERTEX kTop = [] {
    SVERTEX v = vtx(px(10), px(2) + 0x4000);
    v.w = 0x4000000; // z 1
    v.u = 0;
    v.v = 0x10000;
    v.r = 0;
    v.g = 0xFF0000;
    v.b = 0x100000;
    v.a = 0xFF0000;
    return v;
}();
const SVERTEX kMid = [] {
    SVERTEX v = vtx(px(4), px(5) + 0x8000);
    v.w = 0x2000000; // z 2
    v.u = 0x10000;
    v.v = 0x8000;
    v.r = 0x300000;
    v.g = 0x800000;
    v.b = 0x100000;
    v.a = 0xFF0000;
    return v;
}();
const SVERTEX kBot = [] {
    SVERTEX v = vtx(px(16), px(8) + 0xFFFF);
    v.w = 0x1000000; // z 4
    v.u = 0x20000;
    v.v = 0;
    v.r = 0x600000;
    v.g = 0;
    v.b = 0x400000;
    v.a = 0x800000;
    return v;
}();

// x of the left and right ends on scanlines 2 to 8: the upper part steps from T, the lower
// part restarts the short side at M (4.0) on scanline 5.
const std::vector<std::array<int32_t, 3>> kWalkXs = {
    {2, 655360, 655360}, {3, 524288, 720895}, {4, 393216, 786430},   {5, 262144, 851965},
    {6, 524287, 917500}, {7, 786430, 983035}, {8, 1048573, 1048570},
};

TEST_F(TriangleTest, EveryCallOrderWalksTheSameSpansWithTheFirstVertexColour) {
    SVERTEX v[3] = {kTop, kMid, kBot};
    v[0].r = 0xFF0000, v[0].g = 0, v[0].b = 0; // red: 0xF800
    v[1].r = 0, v[1].g = 0xFF0000, v[1].b = 0; // green: 0x07E0
    v[2].r = 0, v[2].g = 0, v[2].b = 0xFF0000; // blue: 0x001F
    const uint16_t colour[3] = {0xF800, 0x07E0, 0x001F};
    const int order[6][3] = {{0, 1, 2}, {0, 2, 1}, {1, 0, 2}, {1, 2, 0}, {2, 0, 1}, {2, 1, 0}};
    for (const auto& o : order) {
        g_calls.clear();
        tri_flat(&v[o[0]], &v[o[1]], &v[o[2]]);
        EXPECT_EQ(xs(), kWalkXs) << o[0] << o[1] << o[2];
        EXPECT_EQ(g_raster.flat_color, colour[o[0]]);
        EXPECT_EQ(g_raster.flat_r, v[o[0]].r);
        EXPECT_EQ(g_raster.flat_g, v[o[0]].g);
        EXPECT_EQ(g_raster.flat_b, v[o[0]].b);
    }
}

TEST_F(TriangleTest, EdgeStepsOfEveryFieldAreExact) {
    // uw, vw at the vertices ((u * w) >> 18): T 0, 0x1000000; M 0x800000, 0x400000;
    // B 0x800000, 0. Steps (64-bit product with the reciprocal, >> 24), e.g.
    //   w T->M: (-0x2000000 * 5592405) >> 24 = -11184810
    //   r T->B: (0x600000 * 2796202) >> 24 = floor(1048575.75) = 1048575
    //   g M->B: (-0x800000 * 5592405) >> 24 = floor(-2796202.5) = -2796203
    // Fields in order x, w, r, g, b, a, uw, vw.
    const int32_t expect[7][2][8] = {
        {{655360, 67108864, 0, 16711680, 1048576, 16711680, 0, 16777216},
         {655360, 67108864, 0, 16711680, 1048576, 16711680, 0, 16777216}},
        {{524288, 55924054, 1048575, 13937322, 1048576, 16711680, 2796202, 12582912},
         {720895, 58720258, 1048575, 13926400, 1572863, 15324501, 1398101, 13981014}},
        {{393216, 44739244, 2097150, 11162964, 1048576, 16711680, 5592404, 8388608},
         {786430, 50331652, 2097150, 11141120, 2097150, 13937322, 2796202, 11184812}},
        {{262144, 33554432, 3145728, 8388608, 1048576, 16711680, 8388608, 4194304},
         {851965, 41943046, 3145725, 8355840, 2621437, 12550143, 4194303, 8388610}},
        {{524287, 27962027, 4194303, 5592405, 2097151, 13937322, 8388608, 2796202},
         {917500, 33554440, 4194300, 5570560, 3145724, 11162964, 5592404, 5592408}},
        {{786430, 22369622, 5242878, 2796202, 3145726, 11162964, 8388608, 1398100},
         {983035, 25165834, 5242875, 2785280, 3670011, 9775785, 6990505, 2796206}},
        {{1048573, 16777217, 6291453, -1, 4194301, 8388606, 8388608, -2},
         {1048570, 16777228, 6291450, 0, 4194298, 8388606, 8388606, 4}},
    };
    tri_tex_gouraud(&kMid, &kBot, &kTop);
    ASSERT_EQ(g_calls.size(), 7u);
    for (size_t i = 0; i < 7; ++i) {
        const SpanCall& c = g_calls[i];
        EXPECT_EQ(c.y, static_cast<int32_t>(2 + i));
        EXPECT_EQ(c.left_ptr, &g_raster.left);
        EXPECT_EQ(c.right_ptr, &g_raster.right);
        const SPAN_EDGE* got[2] = {&c.left, &c.right};
        for (int side = 0; side < 2; ++side) {
            const SPAN_EDGE& e = *got[side];
            const int32_t fields[8] = {e.x, e.w, e.r, e.g, e.b, e.a, e.uw, e.vw};
            for (int f = 0; f < 8; ++f)
                EXPECT_EQ(fields[f], expect[i][side][f])
                    << "row " << c.y << " side " << side << " field " << f;
        }
    }
}

// The eight drawers: which fields each carries, whether it keeps zrow, whether it stores
// the flat colour.
struct DrawerCase {
    const char* name;
    TriangleFn fn;
    bool colour, tex, depth;
};

const DrawerCase kDrawers[] = {
    {"tri_flat", tri_flat, false, false, false},
    {"tri_flat_z", tri_flat_z, false, false, true},
    {"tri_gouraud", tri_gouraud, true, false, false},
    {"tri_gouraud_z", tri_gouraud_z, true, false, true},
    {"tri_tex", tri_tex, false, true, false},
    {"tri_tex_z", tri_tex_z, false, true, true},
    {"tri_tex_gouraud", tri_tex_gouraud, true, true, false},
    {"tri_tex_gouraud_z", tri_tex_gouraud_z, true, true, true},
};

TEST_F(TriangleTest, EachDrawerCarriesItsFieldsAndKeepsItsRows) {
    for (const DrawerCase& d : kDrawers) {
        reset();
        d.fn(&kTop, &kMid, &kBot);
        ASSERT_EQ(g_calls.size(), 7u) << d.name;
        for (const SpanCall& c : g_calls) {
            EXPECT_EQ(c.row, g_eng.color_buf + 240 * c.y) << d.name;
            if (d.depth) {
                EXPECT_EQ(c.zrow, g_eng.depth_buf + 240 * c.y) << d.name;
            } else {
                EXPECT_EQ(c.zrow, nullptr) << d.name;
            }
        }
        // First span: both ends at T (x 10.0, w 0x4000000) for every drawer.
        const SPAN_EDGE& e = g_calls[0].left;
        EXPECT_EQ(e.x, px(10)) << d.name;
        EXPECT_EQ(e.w, 0x4000000) << d.name;
        EXPECT_EQ(e.r, d.colour ? 0 : kSentinel) << d.name;
        EXPECT_EQ(e.g, d.colour ? 0xFF0000 : kSentinel) << d.name;
        EXPECT_EQ(e.b, d.colour ? 0x100000 : kSentinel) << d.name;
        EXPECT_EQ(e.a, d.colour ? 0xFF0000 : kSentinel) << d.name;
        EXPECT_EQ(e.uw, d.tex ? 0 : kSentinel) << d.name;
        EXPECT_EQ(e.vw, d.tex ? 0x1000000 : kSentinel) << d.name;
        // T's colour (0, 255.0, 16.0) packs to 0x07E2; the Gouraud drawers leave it alone.
        EXPECT_EQ(g_raster.flat_color, d.colour ? 0x1234 : 0x07E2) << d.name;
    }
}

struct FlatColourCase {
    int32_t r, g, b;
    uint16_t expect;
};

// (r >> 8 without its low 11 bits) + (g >> 13 without its low 5 bits) + (b >> 19).
const FlatColourCase kFlatColours[] = {
    {0xFF0000, 0xFF0000, 0xFF0000, 0xFFFF},
    {0x800000, 0x400000, 0x200000, 0x8204}, // 128, 64, 32: 16 << 11, 16 << 5, 4
    {0x07FFFF, 0x03FFFF, 0x07FFFF, 0x0000}, // just below one step of each field
    {0x080000, 0x040000, 0x080000, 0x0821}, // exactly one step of each field
    {0x000000, 0x000000, 0x000000, 0x0000},
};

TEST_F(TriangleTest, FlatColourPacksTheFirstVertex) {
    for (const FlatColourCase& c : kFlatColours) {
        EXPECT_EQ(flat_color_of(c.r, c.g, c.b), c.expect);
        SVERTEX a = kTop;
        a.r = c.r, a.g = c.g, a.b = c.b;
        tri_tex(&a, &kMid, &kBot);
        EXPECT_EQ(g_raster.flat_color, c.expect);
    }
}

TEST_F(TriangleTest, FlatTopUsesTheMiddleVertexSide) {
    // (2.0, 1.0), (8.0, 1.0), (5.0, 4.0): T and M share scanline 1, so the walk starts with
    // the lower part. Edges to B: (3.0 * 5592405) >> 24 = 65535, (-3.0 * 5592405) >> 24 =
    // -65536. Passed either way round, the edge from x 2.0 is the left one.
    const SVERTEX a = vtx(px(2), px(1)), b = vtx(px(8), px(1)), c = vtx(px(5), px(4));
    const std::vector<std::array<int32_t, 3>> expect = {
        {1, 131072, 524288}, {2, 196607, 458752}, {3, 262142, 393216}, {4, 327677, 327680}};
    tri_flat(&a, &b, &c);
    EXPECT_EQ(xs(), expect);
    g_calls.clear();
    tri_flat(&b, &a, &c);
    EXPECT_EQ(xs(), expect);
}

TEST_F(TriangleTest, EqualSidesPutTheShortSideOnTheRight) {
    // The short side is on the left only when strictly left: with equal x steps (a straight
    // line T, M, B) or, on a flat top, M.x equal to T.x, the long edge T->B is the left one.
    // The red channel tells the edges apart: T->M steps by (100.0 * 0x400000) >> 24 = 25.0.
    SVERTEX t = vtx(0, 0), m = vtx(px(4), px(4)), b = vtx(px(8), px(8));
    m.r = px(100);
    tri_gouraud(&t, &m, &b);
    ASSERT_EQ(g_calls.size(), 9u);
    EXPECT_EQ(g_calls[1].left.r, 0);
    EXPECT_EQ(g_calls[1].right.r, px(25));
    EXPECT_EQ(g_calls[4].right.r, px(100)); // the short side restarts at M
    reset();
    SVERTEX ft = vtx(px(5), px(1)), fm = vtx(px(5), px(1) + 0x8000), fb = vtx(px(9), px(5));
    fm.r = px(100);
    tri_gouraud(&ft, &fm, &fb);
    ASSERT_FALSE(g_calls.empty());
    EXPECT_EQ(g_calls[0].left.r, 0);
    EXPECT_EQ(g_calls[0].right.r, px(100));
}

TEST_F(TriangleTest, OneScanlineTriangleDrawsOneSpanBetweenTopAndMiddle) {
    // All three on scanline 3: T is the first (y 3.0), M the second (3.25); B's x plays no
    // part. M lies left of T, so left is M.
    const SVERTEX a = vtx(px(7), px(3)), b = vtx(px(2), px(3) + 0x4000),
                  c = vtx(px(20), px(3) + 0xE666);
    tri_gouraud(&a, &b, &c);
    const std::vector<std::array<int32_t, 3>> expect = {{3, px(2), px(7)}};
    EXPECT_EQ(xs(), expect);
}

TEST_F(TriangleTest, SharedScanlineIsDrawnByBothTriangles) {
    // Apex (5, 0) over the edge (0, 4)-(10, 4), and that edge over the apex (5, 8).
    const SVERTEX top = vtx(px(5), 0), l = vtx(0, px(4)), r = vtx(px(10), px(4)),
                  bottom = vtx(px(5), px(8));
    tri_flat(&top, &l, &r);
    tri_flat(&l, &r, &bottom);
    int per_row[9] = {};
    for (const SpanCall& c : g_calls) ++per_row[c.y];
    const int expect[9] = {1, 1, 1, 1, 2, 1, 1, 1, 1};
    for (int y = 0; y < 9; ++y) EXPECT_EQ(per_row[y], expect[y]) << y;
    // Both spans on the shared scanline run from 0 to 10.0.
    EXPECT_EQ(g_calls[4].left.x, 0);
    EXPECT_EQ(g_calls[4].right.x, px(10));
    EXPECT_EQ(g_calls[5].left.x, 0);
    EXPECT_EQ(g_calls[5].right.x, px(10));
}

TEST_F(TriangleTest, ImpossibleSortRowDrawsNothingButStoresTheFlatColour) {
    SVERTEX a = vtx(0, 0x7FFF0000), b = vtx(0, static_cast<int32_t>(0x80010000u)), c = vtx(0, 0);
    a.r = a.g = a.b = 0xFF0000;
    tri_flat(&a, &b, &c);
    EXPECT_TRUE(g_calls.empty());
    EXPECT_EQ(g_raster.flat_color, 0xFFFF);
}

// ---- Clip rectangle reject --------------------------------------------------------------------

struct ClipCase {
    const char* name;
    int32_t x0, y0, x1, y1, x2, y2; // whole pixels
    int32_t result;
};

// Clip rectangle left 10, top 20, right 50, bottom 60. The bounds must overlap strictly:
// a triangle whose largest scanline equals clip_top is rejected although that scanline is
// inside the rectangle.
const ClipCase kClipCases[] = {
    {"maxy_on_top", 20, 15, 40, 15, 30, 20, 1},
    {"maxy_below_top", 20, 15, 40, 15, 30, 21, 0},
    {"miny_on_bottom", 20, 60, 40, 60, 30, 70, 1},
    {"miny_above_bottom", 20, 59, 40, 59, 30, 70, 0},
    {"maxx_on_left", 0, 30, 10, 30, 5, 40, 1},
    {"maxx_right_of_left", 0, 30, 11, 30, 5, 40, 0},
    {"minx_on_right", 50, 30, 70, 30, 60, 40, 1},
    {"minx_left_of_right", 49, 30, 70, 30, 60, 40, 0},
    {"inside", 20, 30, 40, 30, 30, 40, 0},
};

TEST_F(TriangleTest, ClipRectangleRejectsByStrictBounds) {
    for (const ClipCase& c : kClipCases) {
        g_calls.clear();
        g_eng.clip_on = 1;
        g_eng.clip_left = 10, g_eng.clip_top = 20, g_eng.clip_right = 50, g_eng.clip_bottom = 60;
        draw_triangle = tri_flat;
        const SVERTEX a = vtx(px(c.x0), px(c.y0)), b = vtx(px(c.x1), px(c.y1)),
                      d = vtx(px(c.x2), px(c.y2));
        EXPECT_EQ(draw_triangle_clipped(&a, &b, &d), c.result) << c.name;
        EXPECT_EQ(g_calls.empty(), c.result == 1) << c.name;
        // With the clip off, every one of them is drawn.
        g_calls.clear();
        g_eng.clip_on = 0;
        EXPECT_EQ(draw_triangle_clipped(&a, &b, &d), 0) << c.name;
        EXPECT_FALSE(g_calls.empty()) << c.name;
    }
}

TEST_F(TriangleTest, NoDrawerInstalledIsNotDrawn) {
    draw_triangle = nullptr;
    EXPECT_EQ(draw_triangle_clipped(&kTop, &kMid, &kBot), 1);
    EXPECT_TRUE(g_calls.empty());
}

// ---- Render-buffer guard ----------------------------------------------------------------------

TEST_F(TriangleTest, TriangleInsideTheBufferIsWalkedWithTheClipAsItWas) {
    tri_flat(&kTop, &kMid, &kBot);
    ASSERT_FALSE(g_calls.empty());
    for (const SpanCall& c : g_calls) EXPECT_EQ(c.clip_on, 0);
}

TEST_F(TriangleTest, TriangleReachingOutsideIsWalkedOverBufferRowsOnly) {
    // T (-20, -10), M (-30, 30), B (40, 50). Steps: T->M (-10.0 * RecipTable[40]) >> 24 =
    // -16384, T->B (60.0 * RecipTable[60]) >> 24 = 65535, M->B (70.0 * RecipTable[20]) >> 24
    // = 229375. Scanline 0 is ten steps below T: left -20.0 - 10 * 16384 = -1474560,
    // right -20.0 + 10 * 65535 = -655370; scanline 30 restarts the left side at M.
    const SVERTEX t = vtx(px(-20), px(-10)), m = vtx(px(-30), px(30)), b = vtx(px(40), px(50));
    tri_flat(&m, &t, &b);
    ASSERT_EQ(g_calls.size(), 51u); // scanlines 0 to 50
    const std::vector<std::array<int32_t, 3>> expect = {
        {0, -1474560, -655370},  {1, -1490944, -589835},  {29, -1949696, 1245145},
        {30, -1966080, 1310680}, {31, -1736705, 1376215}, {50, 2621420, 2621380}};
    for (const auto& e : expect) {
        const SpanCall& c = g_calls[static_cast<size_t>(e[0])];
        EXPECT_EQ(c.y, e[0]);
        EXPECT_EQ(c.left.x, e[1]) << e[0];
        EXPECT_EQ(c.right.x, e[2]) << e[0];
    }
    // The spans see the clip narrowed to the buffer; afterwards the clip is as it was.
    for (const SpanCall& c : g_calls) {
        EXPECT_EQ(c.clip_on, 1);
        EXPECT_EQ(c.clip_left, 0);
        EXPECT_EQ(c.clip_top, 0);
        EXPECT_EQ(c.clip_right, 240);
        EXPECT_EQ(c.clip_bottom, 320);
        EXPECT_EQ(c.row, g_eng.color_buf + 240 * c.y);
    }
    EXPECT_EQ(g_eng.clip_on, 0);
}

TEST_F(TriangleTest, TallEdgeBeyondTheTableStepsByTheSameQuotient) {
    // T (100, -2000), M (10, 50), B (200, 100): T->B is 2100 scanlines, T->M 2050.
    //   T->M: (-90.0 * (0x1000000 / 2050 = 8184)) >> 24 = floor(-2877.2) = -2878
    //   T->B: (100.0 * (0x1000000 / 2100 = 7989)) >> 24 = floor(3120.6) = 3120
    // Scanline 0: left 100.0 - 2000 * 2878 = 797600, right 100.0 + 2000 * 3120 = 12793600.
    const SVERTEX t = vtx(px(100), px(-2000)), m = vtx(px(10), px(50)), b = vtx(px(200), px(100));
    tri_gouraud(&t, &m, &b);
    ASSERT_EQ(g_calls.size(), 101u);
    EXPECT_EQ(g_calls[0].left.x, 797600);
    EXPECT_EQ(g_calls[0].right.x, 12793600);
    EXPECT_EQ(g_calls[50].left.x, px(10));
    EXPECT_EQ(g_calls[50].right.x, 12949600);
}

struct OutsideCase {
    const char* name;
    int32_t x0, y0, x1, y1, x2, y2;
};

// Triangles that draw nothing in the 240 x 320 buffer, and one whose spans would be wider
// than the reciprocal table reaches.
const OutsideCase kOutsideCases[] = {
    {"above", 10, -30, 50, -20, 30, -1},    {"below", 10, 320, 50, 330, 30, 340},
    {"left", -30, 10, -1, 20, -20, 40},     {"right", 241, 10, 300, 20, 250, 40},
    {"too_wide", -700, 10, 700, 20, 0, 40},
};

TEST_F(TriangleTest, TrianglesWithNothingInTheBufferAreNotDrawn) {
    for (const OutsideCase& c : kOutsideCases) {
        g_calls.clear();
        const SVERTEX a = vtx(px(c.x0), px(c.y0)), b = vtx(px(c.x1), px(c.y1)),
                      d = vtx(px(c.x2), px(c.y2));
        tri_tex(&a, &b, &d);
        EXPECT_TRUE(g_calls.empty()) << c.name;
    }
    EXPECT_EQ(g_eng.clip_on, 0);
}

TEST_F(TriangleTest, WindowClipBeyondTheBufferIsNarrowedToIt) {
    // A scissored window whose rectangle sticks out of the buffer on the right and bottom.
    g_eng.clip_on = 1;
    g_eng.clip_left = 200, g_eng.clip_top = 300, g_eng.clip_right = 400, g_eng.clip_bottom = 500;
    const SVERTEX a = vtx(px(210), px(310)), b = vtx(px(300), px(310)), c = vtx(px(250), px(330));
    draw_triangle = tri_flat;
    EXPECT_EQ(draw_triangle_clipped(&a, &b, &c), 0);
    ASSERT_EQ(g_calls.size(), 10u); // scanlines 310 to 319
    for (const SpanCall& s : g_calls) {
        EXPECT_EQ(s.clip_left, 200);
        EXPECT_EQ(s.clip_top, 300);
        EXPECT_EQ(s.clip_right, 240);
        EXPECT_EQ(s.clip_bottom, 320);
    }
    EXPECT_EQ(g_eng.clip_right, 400);
    EXPECT_EQ(g_eng.clip_bottom, 500);
}

TEST_F(TriangleTest, NothingIsDrawnWithoutBuffersOrFiller) {
    g_eng.color_buf = nullptr;
    tri_flat(&kTop, &kMid, &kBot);
    EXPECT_TRUE(g_calls.empty());
    g_eng.color_buf = color.data();
    int32_t* depth = g_eng.depth_buf;
    g_eng.depth_buf = nullptr;
    tri_flat_z(&kTop, &kMid, &kBot);
    EXPECT_TRUE(g_calls.empty());
    tri_flat(&kTop, &kMid, &kBot); // the drawer without depth still draws
    EXPECT_EQ(g_calls.size(), 7u);
    g_eng.depth_buf = depth;
    draw_span = nullptr;
    tri_gouraud(&kTop, &kMid, &kBot); // must not call through a null filler
}

// A filler with the standard coverage and clip tests that paints its pixels and depths, to
// show that a guarded triangle writes nothing outside the buffers.
void paint_span(const SPAN_EDGE* l, const SPAN_EDGE* r, int32_t y) noexcept {
    const int32_t x0 = (l->x + 0x8000) >> 16, x1 = (r->x - 0x8000) >> 16;
    if (x1 < x0 || span_rejected(x0, x1, y)) return;
    for (int32_t col = x0; col <= x1; ++col) {
        if (pixel_clipped(col)) continue;
        g_raster.row[col] = 0xFFFF;
        g_raster.zrow[col] = 1;
    }
}

TEST_F(TriangleTest, GuardedTriangleWritesOnlyInsideTheBuffers) {
    // Buffers with 4 rows of canaries before and after.
    constexpr size_t kPad = 4 * 240;
    std::vector<uint16_t> colours(kPad + 240 * 320 + kPad, 0x1111);
    std::vector<int32_t> depths(kPad + 240 * 320 + kPad, 0x2222);
    g_eng.color_buf = colours.data() + kPad;
    g_eng.depth_buf = depths.data() + kPad;
    std::fill(g_eng.color_buf, g_eng.color_buf + 240 * 320, uint16_t{0});
    std::fill(g_eng.depth_buf, g_eng.depth_buf + 240 * 320, 0);
    draw_span = paint_span;
    // A triangle over all four edges of the buffer.
    const SVERTEX a = vtx(px(-100), px(-50)), b = vtx(px(500), px(100)), c = vtx(px(60), px(600));
    tri_flat_z(&a, &b, &c);
    for (size_t i = 0; i < kPad; ++i) {
        EXPECT_EQ(colours[i], 0x1111) << i;
        EXPECT_EQ(colours[kPad + 240 * 320 + i], 0x1111) << i;
        EXPECT_EQ(depths[i], 0x2222) << i;
        EXPECT_EQ(depths[kPad + 240 * 320 + i], 0x2222) << i;
    }
    // Columns 0 and 239 of a middle row are covered and were written, not wrapped around.
    EXPECT_EQ(g_eng.color_buf[240 * 100 + 0], 0xFFFF);
    EXPECT_EQ(g_eng.color_buf[240 * 100 + 239], 0xFFFF);
    EXPECT_EQ(g_eng.depth_buf[240 * 319 + 60], 1);
    g_eng.color_buf = color.data();
    g_eng.depth_buf = g_eng.own_depth_buf;
}

} // namespace
