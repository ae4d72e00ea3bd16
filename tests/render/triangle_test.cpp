// Triangle setup: vertex sort, edge steps, sides, row pointers, the flat colour, the clip
// rectangle reject and the render-buffer guard, seen through a recording span filler.
#include <gtest/gtest.h>

#include <array>
#include <tuple>
#include <vector>

#include "engine/state.h"
#include "render/triangle.h"
#include "support/engine_fixture.h"

using namespace vrx::render;
using vrx::engine::g_eng;

namespace {

using Span = std::array<int32_t, 3>; // y, left x, right x
using Clip = std::array<int32_t, 5>; // on, left, top, right, bottom

constexpr int32_t px(int32_t v) {
    return v * 0x10000;
}

// A vertex, at camera depth 1.0 unless told.
SVERTEX vtx(int32_t x, int32_t y, int32_t w = 0x4000000, int32_t u = 0, int32_t v = 0,
            int32_t r = 0, int32_t g = 0, int32_t b = 0, int32_t a = 0) {
    return {x, y, w, u, v, r, g, b, a, 0, 0, 0, 0};
}

Clip clip_now() {
    return {g_eng.clip_on, g_eng.clip_left, g_eng.clip_top, g_eng.clip_right, g_eng.clip_bottom};
}
// The three vertices at whole-pixel (x0, y0), (x1, y1), (x2, y2).
std::array<SVERTEX, 3> tri_at(std::array<int32_t, 6> p) {
    return {vtx(px(p[0]), px(p[1])), vtx(px(p[2]), px(p[3])), vtx(px(p[4]), px(p[5]))};
}
void set_clip(Clip c) {
    std::tie(g_eng.clip_on, g_eng.clip_left, g_eng.clip_top, g_eng.clip_right, g_eng.clip_bottom) =
        std::tuple_cat(c);
}

// One draw_span call as the filler saw it.
struct SpanCall {
    SPAN_EDGE left, right;
    int32_t y;
    uint16_t* row;
    int32_t* zrow;
    Clip clip;
};
std::vector<SpanCall> g_calls;

void record_span(const SPAN_EDGE* l, const SPAN_EDGE* r, int32_t y) noexcept {
    if (l != &g_raster.left || r != &g_raster.right) ADD_FAILURE() << "not the context's edges";
    g_calls.push_back({*l, *r, y, g_raster.row, g_raster.zrow, clip_now()});
}

constexpr int32_t kS = 0x5A5A5A5A; // sentinel

class TriangleTest : public vrx::test::EngineTest {
  protected:
    void SetUp() override {
        EngineTest::SetUp();
        reset();
    }
    void TearDown() override {
        draw_span = nullptr, draw_triangle = nullptr;
        EngineTest::TearDown();
    }
    // Forgets the calls and puts sentinels in the edge records, zrow and the flat colour.
    static void reset() {
        g_calls.clear();
        draw_span = record_span;
        g_raster.left = g_raster.right = {kS, kS, kS, kS, kS, kS, kS, kS};
        g_raster.zrow = nullptr;
        g_raster.flat_color = 0x1234;
    }
    static std::vector<Span> spans() {
        std::vector<Span> out;
        for (const SpanCall& c : g_calls) out.push_back({c.y, c.left.x, c.right.x});
        return out;
    }
};

// (r >> 8 without its low 11 bits) + (g >> 13 without its low 5 bits) + (b >> 19), just below
// one step of each field and exactly one.
static_assert(flat_color_of(0x07FFFF, 0x03FFFF, 0x07FFFF) == 0 &&
              flat_color_of(0x080000, 0x040000, 0x080000) == 0x0821);

// T (10.0, 2.25), M (4.0, 5.5), B (16.0, 8.99998), depths 1, 2, 4; y fractions play no part.
// Heights 3, 6, 3: RecipTable 5592405, 2796202. x steps (d * recip) >> 24: T->M -131072,
// T->B 65535, M->B 262143 (floors of -131071.99, 65535.98, 262143.98): short side left.
const SVERTEX kTop =
    vtx(px(10), px(2) + 0x4000, 0x4000000, 0, 0x10000, 0, 0xFF0000, 0x100000, 0xFF0000);
const SVERTEX kMid =
    vtx(px(4), px(5) + 0x8000, 0x2000000, 0x10000, 0x8000, 0x300000, 0x800000, 0x100000, 0xFF0000);
const SVERTEX kBot =
    vtx(px(16), px(8) + 0xFFFF, 0x1000000, 0x20000, 0, 0x600000, 0, 0x400000, 0x800000);

// Each drawer: whether it carries colour and texture fields and keeps zrow; the order of T, M, B.
struct DrawerCase {
    TriangleFn fn;
    bool colour, tex, depth;
    std::array<int, 3> order;
};

const DrawerCase kDrawers[] = {
    {tri_flat, false, false, false, {0, 1, 2}},
    {tri_flat_z, false, false, true, {1, 0, 2}},
    {tri_gouraud, true, false, false, {0, 2, 1}},
    {tri_gouraud_z, true, false, true, {1, 2, 0}},
    {tri_tex, false, true, false, {2, 0, 1}},
    {tri_tex_z, false, true, true, {2, 1, 0}},
    {tri_tex_gouraud, true, true, false, {1, 0, 2}},
    {tri_tex_gouraud_z, true, true, true, {0, 2, 1}},
};

// Every drawer walks scanlines 2 to 8 alike in any call order: the upper part from T, the
// lower part restarting the short side at M (4.0) on scanline 5. uw, vw ((u * w) >> 18): T 0,
// 0x1000000; M 0x800000, 0x400000; B 0x800000, 0. Steps (d * recip) >> 24, e.g. w T->M
// -11184810, r T->B floor(1048575.75), g M->B floor(-2796202.5) = -2796203. Flat colours:
// T 0x07E2; M (48, 128, 16) 6 << 11 | 32 << 5 | 2 = 0x3402; B (96, 0, 64) 0x6008.
TEST_F(TriangleTest, EveryDrawerAndCallOrderWalksTheSameExactEdges) {
    const std::vector<Span> walk = {
        {2, 655360, 655360}, {3, 524288, 720895}, {4, 393216, 786430},   {5, 262144, 851965},
        {6, 524287, 917500}, {7, 786430, 983035}, {8, 1048573, 1048570},
    };
    // x, w, r, g, b, a, uw, vw of both ends on scanlines 3, 5 (M restarts) and 8 (the last).
    const std::array<int32_t, 8> want[3][2] = {
        {{524288, 55924054, 1048575, 13937322, 1048576, 16711680, 2796202, 12582912},
         {720895, 58720258, 1048575, 13926400, 1572863, 15324501, 1398101, 13981014}},
        {{262144, 33554432, 3145728, 8388608, 1048576, 16711680, 8388608, 4194304},
         {851965, 41943046, 3145725, 8355840, 2621437, 12550143, 4194303, 8388610}},
        {{1048573, 16777217, 6291453, -1, 4194301, 8388606, 8388608, -2},
         {1048570, 16777228, 6291450, 0, 4194298, 8388606, 8388606, 4}},
    };
    const SVERTEX* v[3] = {&kTop, &kMid, &kBot};
    const uint16_t flat[3] = {0x07E2, 0x3402, 0x6008};
    for (const DrawerCase& d : kDrawers) {
        SCOPED_TRACE(&d - kDrawers);
        reset();
        const SVERTEX* first = v[d.order[0]];
        d.fn(first, v[d.order[1]], v[d.order[2]]);
        EXPECT_EQ(spans(), walk);
        EXPECT_EQ(g_raster.flat_color, d.colour ? 0x1234 : flat[d.order[0]]);
        if (!d.colour) {
            EXPECT_EQ((std::array{g_raster.flat_r, g_raster.flat_g, g_raster.flat_b}),
                      (std::array{first->r, first->g, first->b}));
        }
        for (const SpanCall& c : g_calls) {
            EXPECT_EQ(c.row, g_eng.color_buf + 240 * c.y);
            EXPECT_EQ(c.zrow, d.depth ? g_eng.depth_buf + 240 * c.y : nullptr);
            EXPECT_EQ(c.clip[0], 0); // inside the buffer: walked with the clip as it was
        }
        for (size_t i = 0; i < 3 && g_calls.size() == 7; ++i) {
            const SpanCall& c = g_calls[std::array<size_t, 3>{1, 3, 6}[i]];
            for (size_t side = 0; side < 2; ++side) {
                const SPAN_EDGE& e = side == 0 ? c.left : c.right;
                std::array<int32_t, 8> w = want[i][side]; // fields not carried keep sentinels
                if (!d.colour) w[2] = w[3] = w[4] = w[5] = kS;
                if (!d.tex) w[6] = w[7] = kS;
                EXPECT_EQ((std::array{e.x, e.w, e.r, e.g, e.b, e.a, e.uw, e.vw}), w)
                    << "scanline " << c.y << " side " << side;
            }
        }
    }
}

// Clip rectangle left 10, top 20, right 50, bottom 60, which the vertex bounds must overlap
// strictly: pairs of a triangle on an edge (rejected; a largest scanline equal to clip_top
// though that scanline is inside) and one a pixel over (drawn). All are flat tops, whose sides
// come from the x of T and M, in either order.
const std::array<int32_t, 6> kClipCases[] = {
    {20, 15, 40, 15, 30, 20}, {40, 15, 20, 15, 30, 21}, // max y on top
    {20, 60, 40, 60, 30, 70}, {20, 59, 40, 59, 30, 70}, // min y on bottom
    {0, 30, 10, 30, 5, 40},   {0, 30, 11, 30, 5, 40},   // max x on left
    {50, 30, 70, 30, 60, 40}, {49, 30, 70, 30, 60, 40}, // min x on right
};

TEST_F(TriangleTest, ClipRectangleRejectsByStrictBounds) {
    draw_triangle = tri_flat;
    for (size_t i = 0; i < std::size(kClipCases); ++i) {
        const auto v = tri_at(kClipCases[i]);
        for (int32_t on : {1, 0}) { // with the clip off, every one is drawn
            g_calls.clear();
            set_clip({on, 10, 20, 50, 60});
            const int32_t want = on && i % 2 == 0 ? 1 : 0;
            EXPECT_EQ(draw_triangle_clipped(&v[0], &v[1], &v[2]), want) << i << on;
            ASSERT_EQ(g_calls.empty(), want == 1);
            EXPECT_TRUE(want == 1 || g_calls[2].left.x < g_calls[2].right.x); // sides not swapped
        }
    }
    draw_triangle = nullptr; // nothing installed: not drawn
    EXPECT_EQ(draw_triangle_clipped(&kTop, &kMid, &kBot), 1);
}

// T (-20, -10), M (-30, 30), B (40, 50). Steps: T->M (-10.0 * RecipTable[40]) >> 24 = -16384,
// T->B (60.0 * RecipTable[60]) >> 24 = 65535, M->B (70.0 * RecipTable[20]) >> 24 = 229375.
// Scanline 0 is ten steps below T: -20.0 - 10 * 16384 = -1474560 and -20.0 + 10 * 65535 =
// -655370; 30 restarts the left side at M. The spans see the clip off, or a window's clip on,
// cut to the buffer; afterwards it is as it was.
TEST_F(TriangleTest, TriangleReachingOutsideIsWalkedOverBufferRowsOnly) {
    const auto v = tri_at({-30, 30, -20, -10, 40, 50});
    for (const auto& [window, narrowed] :
         {std::array{Clip{0, 1, 2, 3, 4}, Clip{1, 0, 0, 240, 320}},
          std::array{Clip{1, -5, -5, 400, 500}, Clip{1, 0, 0, 240, 320}},
          std::array{Clip{1, 200, 300, 230, 310}, Clip{1, 200, 300, 230, 310}}}) {
        reset();
        set_clip(window);
        tri_flat(&v[0], &v[1], &v[2]);
        ASSERT_EQ(g_calls.size(), 51u); // scanlines 0 to 50
        for (const Span& s : {Span{0, -1474560, -655370}, Span{1, -1490944, -589835},
                              Span{29, -1949696, 1245145}, Span{30, -1966080, 1310680},
                              Span{31, -1736705, 1376215}, Span{50, 2621420, 2621380}}) {
            EXPECT_EQ(spans()[static_cast<size_t>(s[0])], s);
        }
        for (const SpanCall& c : g_calls) {
            EXPECT_EQ(c.clip, narrowed);
            EXPECT_EQ(c.row, g_eng.color_buf + 240 * c.y);
        }
        EXPECT_EQ(clip_now(), window);
    }
}

// Nothing is drawn (the flat colour is stored first) of triangles outside the 240 x 320 buffer,
// with spans wider than the reciprocal table reaches or y differences overflowing into an
// impossible sort row; nor without a colour buffer, a depth buffer for _z drawers, a filler.
TEST_F(TriangleTest, NothingIsDrawnOutsideTheBufferOrWithoutBuffersOrFiller) {
    const std::array<int32_t, 6> cases[] = {
        {10, -30, 50, -20, 30, -1},  {10, 320, 50, 330, 30, 340}, {-30, 10, -1, 20, -20, 40},
        {241, 10, 300, 20, 250, 40}, {-700, 10, 700, 20, 0, 40},  {0, 0x7FFF, 0, -0x7FFF, 0, 0}};
    for (const auto& p : cases) {
        auto v = tri_at(p);
        v[0].r = v[0].g = v[0].b = 0xFF0000;
        g_raster.flat_color = 0;
        tri_tex(&v[0], &v[1], &v[2]);
        EXPECT_TRUE(g_calls.empty()) << &p - cases;
        EXPECT_EQ(g_raster.flat_color, 0xFFFF);
    }
    EXPECT_EQ(clip_now()[0], 0);
    g_eng.color_buf = nullptr;
    tri_flat(&kTop, &kMid, &kBot);
    g_eng.color_buf = color.data();
    int32_t* const depth = g_eng.depth_buf;
    g_eng.depth_buf = nullptr;
    tri_flat_z(&kTop, &kMid, &kBot);
    tri_flat(&kTop, &kMid, &kBot); // of the three, only the drawer without depth draws
    EXPECT_EQ(g_calls.size(), 7u);
    g_eng.depth_buf = depth;
    draw_span = nullptr;
    tri_gouraud(&kTop, &kMid, &kBot); // must not call through a null filler
}

} // namespace
