// The nine raster modes: for every mode and every setting of the depth and perspective
// flags (and, for the blend modes, every texel format) the drawer and the SpanTable slot
// installed. SpanTable is filled with distinct sentinel fillers, so the test names slots,
// not the fillers a set puts there. The last tests check that opening the engine and
// hint 4 build the table.
#include <gtest/gtest.h>

#include <array>
#include <utility>

#include "assets/texture.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/raster_mode.h"
#include "render/span_fillers.h"
#include "render/triangle.h"
#include "scene/material.h"
#include "support/engine_fixture.h"

using namespace vrx::render;
using vrx::engine::FLAG_PERSPECTIVE;
using vrx::engine::FLAG_ZBUFFER;
using vrx::engine::g_eng;

namespace {

int32_t g_sentinel_hit = -1;

// A distinct filler per slot; each body differs so no two can be folded into one address.
template <int N> void sentinel(const SPAN_EDGE*, const SPAN_EDGE*, int32_t) noexcept {
    g_sentinel_hit = N;
}

template <std::size_t... I>
constexpr std::array<SpanFn, kSpanSlotCount> make_sentinels(std::index_sequence<I...>) {
    return {&sentinel<static_cast<int>(I)>...};
}
constexpr std::array<SpanFn, kSpanSlotCount> kSentinels =
    make_sentinels(std::make_index_sequence<kSpanSlotCount>{});

class RasterModeTest : public vrx::test::EngineTest {
  protected:
    void SetUp() override {
        EngineTest::SetUp();
        for (int i = 0; i < kSpanSlotCount; ++i) SpanTable[i] = kSentinels[i];
        texture.alpha_kind = vrx::assets::kAlpha565;
        material.texture = &texture;
        material.diffuse_scaled.a = 0x10000;
        g_eng.cur_material = &material;
    }
    void TearDown() override {
        g_eng.cur_material = nullptr;
        draw_triangle = nullptr;
        draw_span = nullptr;
        EngineTest::TearDown();
    }
    static void set_flags(bool depth, bool persp) {
        g_eng.eng_flags = (depth ? FLAG_ZBUFFER : 0u) | (persp ? FLAG_PERSPECTIVE : 0u);
    }

    vrx::assets::TEXTURE texture{};
    vrx::scene::MATERIAL material{};
};

// What a mode installs, by flags: [depth off, persp off], [off, on], [on, off], [on, on].
struct ModeCase {
    const char* name;
    RasterMode mode;
    TriangleFn tri_off, tri_on; // depth off / on
    SpanSlot slot[4];
};

const ModeCase kModeCases[] = {
    {"flat", mode_flat, tri_flat, tri_flat_z, {SPAN_FLAT, SPAN_FLAT, SPAN_FLAT_Z, SPAN_FLAT_Z}},
    {"gouraud",
     mode_gouraud,
     tri_gouraud,
     tri_gouraud_z,
     {SPAN_GOURAUD, SPAN_GOURAUD, SPAN_GOURAUD_Z, SPAN_GOURAUD_Z}},
    {"gouraud_blend",
     mode_gouraud_blend,
     tri_gouraud,
     tri_gouraud_z,
     {SPAN_GOURAUD_BLEND, SPAN_GOURAUD_BLEND, SPAN_GOURAUD_BLEND_Z, SPAN_GOURAUD_BLEND_Z}},
    {"tex", mode_tex, tri_tex, tri_tex_z, {SPAN_TEX, SPAN_TEX_P, SPAN_TEX_Z, SPAN_TEX_ZP}},
    {"tex_flat",
     mode_tex_flat,
     tri_tex,
     tri_tex_z,
     {SPAN_TEXMOD, SPAN_TEXMOD_P, SPAN_TEXMOD_Z, SPAN_TEXMOD_ZP}},
    {"tex_gouraud",
     mode_tex_gouraud,
     tri_tex_gouraud,
     tri_tex_gouraud_z,
     {SPAN_TEXGOUR, SPAN_TEXGOUR_P, SPAN_TEXGOUR_Z, SPAN_TEXGOUR_ZP}},
    {"tex_add",
     mode_tex_add,
     tri_tex_gouraud,
     tri_tex_gouraud_z,
     {SPAN_TEXADD, SPAN_TEXADD_P, SPAN_TEXADD_Z, SPAN_TEXADD_ZP}},
};

TEST_F(RasterModeTest, UnblendedModesFollowTheFlagsWhateverTheTexelFormat) {
    for (const ModeCase& c : kModeCases) {
        for (int32_t kind = 0; kind < 3; ++kind) {
            texture.alpha_kind = kind;
            for (int f = 0; f < 4; ++f) {
                const bool depth = f >= 2, persp = (f & 1) != 0;
                set_flags(depth, persp);
                run_raster_mode(c.mode);
                EXPECT_EQ(draw_triangle, depth ? c.tri_on : c.tri_off)
                    << c.name << " depth " << depth;
                EXPECT_EQ(draw_span, kSentinels[c.slot[f]])
                    << c.name << " depth " << depth << " persp " << persp << " kind " << kind;
            }
        }
    }
}

struct BlendCase {
    const char* name;
    RasterMode mode;
    int32_t kind;
    SpanSlot slot[4];
};

// The blend modes pick by texel format; the lit one has no perspective filler without
// depth and takes the unlit perspective blend of the same format.
const BlendCase kBlendCases[] = {
    {"blend_565",
     mode_tex_blend,
     0,
     {SPAN_BLEND_565, SPAN_BLEND_565_P, SPAN_BLEND_565_Z, SPAN_BLEND_565_ZP}},
    {"blend_4444",
     mode_tex_blend,
     1,
     {SPAN_BLEND_4444, SPAN_BLEND_4444_P, SPAN_BLEND_4444_Z, SPAN_BLEND_4444_ZP}},
    {"blend_8888",
     mode_tex_blend,
     2,
     {SPAN_BLEND_8888, SPAN_BLEND_8888_P, SPAN_BLEND_8888_Z, SPAN_BLEND_8888_ZP}},
    {"blendlit_565",
     mode_tex_blend_lit,
     0,
     {SPAN_BLENDLIT_565, SPAN_BLEND_565_P, SPAN_BLENDLIT_565_Z, SPAN_BLENDLIT_565_ZP}},
    {"blendlit_4444",
     mode_tex_blend_lit,
     1,
     {SPAN_BLENDLIT_4444, SPAN_BLEND_4444_P, SPAN_BLENDLIT_4444_Z, SPAN_BLENDLIT_4444_ZP}},
    {"blendlit_8888",
     mode_tex_blend_lit,
     2,
     {SPAN_BLENDLIT_8888, SPAN_BLEND_8888_P, SPAN_BLENDLIT_8888_Z, SPAN_BLENDLIT_8888_ZP}},
};

TEST_F(RasterModeTest, BlendModesPickByFlagsAndTexelFormat) {
    for (const BlendCase& c : kBlendCases) {
        texture.alpha_kind = c.kind;
        const bool lit = c.mode == mode_tex_blend_lit;
        for (int f = 0; f < 4; ++f) {
            const bool depth = f >= 2, persp = (f & 1) != 0;
            set_flags(depth, persp);
            run_raster_mode(c.mode);
            const TriangleFn tri =
                lit ? (depth ? tri_tex_gouraud_z : tri_tex_gouraud) : (depth ? tri_tex_z : tri_tex);
            EXPECT_EQ(draw_triangle, tri) << c.name << " depth " << depth;
            EXPECT_EQ(draw_span, kSentinels[c.slot[f]])
                << c.name << " depth " << depth << " persp " << persp;
        }
    }
}

TEST_F(RasterModeTest, BlendModesSetTheMaterialWeight) {
    const RasterMode blends[] = {mode_gouraud_blend, mode_tex_blend, mode_tex_blend_lit};
    for (RasterMode m : blends) {
        material.diffuse_scaled.a = 0x8000; // half opaque: weight 128
        g_raster.blend_a = -1;
        run_raster_mode(m);
        EXPECT_EQ(g_raster.blend_a, 128) << m;
        material.diffuse_scaled.a = 0x10000;
        run_raster_mode(m);
        EXPECT_EQ(g_raster.blend_a, 256) << m;
    }
}

TEST_F(RasterModeTest, MissingOrStrangeTextureCountsAsRgb565) {
    set_flags(true, false);
    texture.alpha_kind = 7;
    run_raster_mode(mode_tex_blend);
    EXPECT_EQ(draw_span, kSentinels[SPAN_BLEND_565_Z]);
    texture.alpha_kind = -1;
    run_raster_mode(mode_tex_blend_lit);
    EXPECT_EQ(draw_span, kSentinels[SPAN_BLENDLIT_565_Z]);
    material.texture = nullptr;
    run_raster_mode(mode_tex_blend);
    EXPECT_EQ(draw_span, kSentinels[SPAN_BLEND_565_Z]);
    g_eng.cur_material = nullptr;
    run_raster_mode(mode_tex_blend_lit);
    EXPECT_EQ(draw_span, kSentinels[SPAN_BLENDLIT_565_Z]);
    EXPECT_EQ(g_raster.blend_a, 256);
}

TEST_F(RasterModeTest, SlotIsReadWhenTheModeRuns) {
    set_flags(false, false);
    run_raster_mode(mode_tex);
    EXPECT_EQ(draw_span, kSentinels[SPAN_TEX]);
    SpanTable[SPAN_TEX] = kSentinels[SPAN_FLAT];
    EXPECT_EQ(draw_span, kSentinels[SPAN_TEX]); // installed pointers stay until the next run
    run_raster_mode(mode_tex);
    EXPECT_EQ(draw_span, kSentinels[SPAN_FLAT]);
}

TEST_F(RasterModeTest, NoModeInstallsNothing) {
    run_raster_mode(mode_flat);
    ASSERT_NE(draw_triangle, nullptr);
    run_raster_mode(mode_none);
    EXPECT_EQ(draw_triangle, nullptr);
    EXPECT_EQ(draw_span, nullptr);
    run_raster_mode(mode_tex);
    run_raster_mode(static_cast<RasterMode>(kRasterModeCount));
    EXPECT_EQ(draw_triangle, nullptr);
    EXPECT_EQ(draw_span, nullptr);
}

// ---- The table built by opening and by hint 4 ------------------------------------------------

class SpanTableBuildTest : public vrx::test::EngineTest {};

TEST_F(SpanTableBuildTest, OpenBuildsTheStandardSetAndHintFourSwitchesIt) {
    EXPECT_EQ(SpanTable[SPAN_TEX], span_tex);
    EXPECT_EQ(SpanTable[SPAN_BLEND_4444_ZP], span_blend_4444_zp);
    EXPECT_EQ(SpanTable[SPAN_GOURAUD_BLEND], span_gouraud_blend);

    ASSERT_EQ(VRX_Hint(HINT_FILTERED, 1), 0);
    EXPECT_EQ(SpanTable[SPAN_TEX], span_tex_filtered);
    EXPECT_EQ(SpanTable[SPAN_BLEND_4444_ZP], span_blend_4444_zp_filtered);
    // Untextured and 32-bit texel slots keep their standard fillers.
    EXPECT_EQ(SpanTable[SPAN_FLAT], span_flat);
    EXPECT_EQ(SpanTable[SPAN_BLEND_8888], span_blend_8888);
    EXPECT_EQ(SpanTable[SPAN_GOURAUD_BLEND], span_gouraud_blend);

    // Any value but 1 goes back to the standard set.
    ASSERT_EQ(VRX_Hint(HINT_FILTERED, 2), 0);
    EXPECT_EQ(SpanTable[SPAN_TEX], span_tex);
    EXPECT_EQ(SpanTable[SPAN_BLEND_4444_ZP], span_blend_4444_zp);

    // A new open starts from the standard set again.
    ASSERT_EQ(VRX_Hint(HINT_FILTERED, 1), 0);
    VRX_Close();
    ASSERT_EQ(VRX_Open(0, 240, 320, VRX_FMT_RGB565), 0);
    EXPECT_EQ(SpanTable[SPAN_TEX], span_tex);
    ASSERT_EQ(VRX_SetRenderBuffer(color.data(), nullptr), 0);
}

TEST_F(SpanTableBuildTest, ModeAfterOpenIsUnfilteredWithoutDepthOrPerspective) {
    run_raster_mode(mode_tex);
    EXPECT_EQ(draw_triangle, tri_tex);
    EXPECT_EQ(draw_span, span_tex);
    draw_triangle = nullptr;
    draw_span = nullptr;
}

} // namespace
