// The drawer and filler each raster mode installs for every flag setting and texel format, in
// each filler set; between them the modes reach every SpanTable slot.
#include <gtest/gtest.h>

#include <string>

#include "assets/texture.h"
#include "render/raster_mode.h"
#include "render/span_fillers.h"
#include "render/triangle.h"
#include "scene/material.h"
#include "support/engine_fixture.h"

using namespace vrx::render;
using vrx::engine::g_eng;

namespace {

// Runs a mode and names the filler it installed.
std::string installed(RasterMode m) {
    run_raster_mode(m);
    for (const SpanFillerInfo& f : kSpanTable) {
        if (f.fn == draw_span) return f.name;
    }
    return draw_span ? "unknown" : "none";
}

class RasterModeTest : public vrx::test::EngineTest {
  protected:
    void SetUp() override {
        EngineTest::SetUp();
        material.texture = &texture;
        material.diffuse_scaled.a = 0x8000; // half opaque: weight 128
        g_eng.cur_material = &material;
    }
    void TearDown() override {
        g_eng.cur_material = nullptr;
        EngineTest::TearDown();
    }
    vrx::assets::TEXTURE texture{};
    vrx::scene::MATERIAL material{};
};

// A mode's drawers without and with depth, and its fillers <family>[_<format>][_p|_z|_zp]
// [_filtered]: no perspective variant untextured, one per format for blends; only set 1
// takes the filtered variant, for 16-bit texels.
struct ModeCase {
    RasterMode mode;
    TriangleFn tri_off, tri_on;
    const char* family;
};

const ModeCase kModeCases[] = {
    {mode_flat, tri_flat, tri_flat_z, "span_flat"},
    {mode_gouraud, tri_gouraud, tri_gouraud_z, "span_gouraud"},
    {mode_gouraud_blend, tri_gouraud, tri_gouraud_z, "span_gouraud_blend"},
    {mode_tex, tri_tex, tri_tex_z, "span_tex"},
    {mode_tex_flat, tri_tex, tri_tex_z, "span_texmod"},
    {mode_tex_gouraud, tri_tex_gouraud, tri_tex_gouraud_z, "span_texgour"},
    {mode_tex_add, tri_tex_gouraud, tri_tex_gouraud_z, "span_texadd"},
    {mode_tex_blend, tri_tex, tri_tex_z, "span_blend"},
    {mode_tex_blend_lit, tri_tex_gouraud, tri_tex_gouraud_z, "span_blendlit"},
};

TEST_F(RasterModeTest, EveryModeFlagAndFormatInEachSet) {
    const char* const format[3] = {"_565", "_4444", "_8888"};
    // [textured][depth * 2 + perspective]
    const char* const variant[2][4] = {{"", "", "_z", "_z"}, {"", "_p", "_z", "_zp"}};
    for (int32_t set : {kSpanSetStandard, kSpanSetFiltered, 2, -1}) {
        build_span_table(set);
        for (const ModeCase& c : kModeCases) {
            const bool textured = c.mode >= mode_tex, blend = c.mode >= mode_tex_blend;
            for (int32_t f = 0; f < 12; ++f) {
                const int32_t kind = f / 4, v = f % 4;
                texture.alpha_kind = kind;
                // The lit blend without depth takes the unlit perspective filler (same pixels).
                const char* family =
                    c.mode == mode_tex_blend_lit && v == 1 ? "span_blend" : c.family;
                const bool filtered = set == kSpanSetFiltered && textured && !(blend && kind == 2);
                const std::string want = std::string(family) + (blend ? format[kind] : "") +
                                         variant[textured][v] + (filtered ? "_filtered" : "");
                SCOPED_TRACE(testing::Message() << "set " << set << ", " << want);
                g_eng.eng_flags = (v >= 2 ? vrx::engine::FLAG_ZBUFFER : 0u) |
                                  (v % 2 ? vrx::engine::FLAG_PERSPECTIVE : 0u);
                g_raster.blend_a = -1;
                EXPECT_EQ(installed(c.mode), want);
                EXPECT_EQ(draw_triangle, v >= 2 ? c.tri_on : c.tri_off);
                if (c.mode == mode_gouraud_blend || blend) {
                    EXPECT_EQ(g_raster.blend_a, 128); // the material's weight
                }
            }
        }
    }
}

// A format outside the three, a missing texture or material counts as RGB565; without a
// material the blend is opaque. No mode, or a corrupt one, installs nothing.
TEST_F(RasterModeTest, StrangeTextureOrModeStaysInRange) {
    texture.alpha_kind = 3;
    EXPECT_EQ(installed(mode_tex_blend), "span_blend_565");
    texture.alpha_kind = -1;
    EXPECT_EQ(installed(mode_tex_blend_lit), "span_blendlit_565");
    material.texture = nullptr;
    EXPECT_EQ(installed(mode_tex_blend), "span_blend_565");
    g_eng.cur_material = nullptr;
    EXPECT_EQ(installed(mode_tex_blend_lit), "span_blendlit_565");
    EXPECT_EQ(g_raster.blend_a, 256);
    for (RasterMode m : {mode_none, static_cast<RasterMode>(kRasterModeCount)}) {
        run_raster_mode(mode_flat);
        EXPECT_EQ(installed(m), "none");
        EXPECT_EQ(draw_triangle, nullptr);
    }
}

// Opening builds the standard set with depth and perspective off; hint 4 with 1 takes the
// filtered set, any other value the standard one.
TEST_F(RasterModeTest, OpenAndHintFourChooseTheSet) {
    EXPECT_EQ(installed(mode_tex), "span_tex");
    ASSERT_EQ(VRX_Hint(HINT_FILTERED, 1), 0);
    EXPECT_EQ(installed(mode_tex), "span_tex_filtered");
    ASSERT_EQ(VRX_Hint(HINT_FILTERED, 2), 0);
    EXPECT_EQ(installed(mode_tex), "span_tex");
}

} // namespace
