// Raster-mode choice: the opaque-path chooser over texture, flags, shading and
// self-illumination, and the polygon-list chooser over texel format and opacity.
#include <gtest/gtest.h>

#include "assets/texture.h"
#include "render/raster_choose.h"
#include "scene/material.h"

using namespace vrx::render;
using vrx::assets::TEXTURE;
using vrx::scene::MATERIAL;
using vrx::scene::UvFunc;

namespace {

constexpr int32_t kOne = 0x10000;
constexpr uint32_t kRefl = vrx::scene::MAT_REFLECT;
constexpr uint32_t kUntex = vrx::scene::MAT_UNTEXTURED;

struct OpaqueCase {
    bool textured;
    uint32_t flags;        // MAT_REFLECT / MAT_UNTEXTURED / MAT_TWO_SIDED
    uint32_t shading_code; // bits 0x38
    int32_t self_illum;
    RasterMode mode;
    UvFunc uv; // with both scroll offsets 0
};

const OpaqueCase kOpaque[] = {
    // Textured, drawn textured.
    {true, 0, 0, 0, mode_tex_flat, vrx::scene::uv_copy},
    {true, 0, 0, kOne, mode_tex, vrx::scene::uv_copy},
    {true, 0, 8, 0x8000, mode_tex_gouraud, vrx::scene::uv_copy},
    {true, 0, 8, kOne, mode_tex, vrx::scene::uv_copy}, // self-illuminated beats Gouraud
    {true, 0, 16, 0x8000, mode_tex_add, vrx::scene::uv_copy},
    {true, 0, 16, kOne, mode_tex_add, vrx::scene::uv_copy}, // additive whatever the self-illum
    {true, 0, 24, kOne, mode_tex_add, vrx::scene::uv_copy},
    {true, 0, 24, 0, mode_tex_add, vrx::scene::uv_copy},
    {true, 0, 32, 0x8000, mode_tex_flat, vrx::scene::uv_copy}, // codes 32..56: flat
    {true, 0, 40, 0x8000, mode_tex_flat, vrx::scene::uv_copy}, // 40 has bit 8, still flat
    {true, 0, 56, 0x8000, mode_tex_flat, vrx::scene::uv_copy},
    {true, 0, 48, kOne, mode_tex, vrx::scene::uv_copy},
    {true, 0, 0, kOne - 1, mode_tex_flat, vrx::scene::uv_copy}, // 1.0 exactly, not nearly
    {true, kRefl, 0, 0, mode_tex, vrx::scene::uv_sphere},
    {true, kRefl, 16, 0x8000, mode_tex, vrx::scene::uv_sphere}, // reflection beats shading 2
    {true, kRefl, 8, 0, mode_tex, vrx::scene::uv_sphere},
    {true, vrx::scene::MAT_TWO_SIDED, 8, 0, mode_tex_gouraud, vrx::scene::uv_copy},
    // Textured but MAT_UNTEXTURED: as untextured, no generator.
    {true, kUntex, 8, kOne, mode_flat, vrx::scene::uv_none},
    {true, kUntex, 8, 0x8000, mode_gouraud, vrx::scene::uv_none},
    {true, kUntex | kRefl, 24, 0x8000, mode_gouraud, vrx::scene::uv_none},
    {true, kUntex, 0, 0x8000, mode_flat, vrx::scene::uv_none},
    // No texture.
    {false, 0, 8, kOne, mode_flat, vrx::scene::uv_none},
    {false, 0, 8, 0x8000, mode_gouraud, vrx::scene::uv_none},
    {false, 0, 0, 0x8000, mode_flat, vrx::scene::uv_none},
    {false, 0, 0, 0, mode_flat, vrx::scene::uv_none},
    {false, 0, 24, 0, mode_gouraud, vrx::scene::uv_none},
    {false, 0, 32, 0x8000, mode_gouraud, vrx::scene::uv_none}, // any code but 0
    {false, kRefl, 16, kOne, mode_flat, vrx::scene::uv_none},
};

TEST(RasterChoose, OpaquePathModeAndGenerator) {
    TEXTURE tex{};
    int row = 0;
    for (const OpaqueCase& c : kOpaque) {
        MATERIAL m{};
        m.texture = c.textured ? &tex : nullptr;
        m.flags = c.flags | c.shading_code;
        m.self_illum = c.self_illum;
        m.raster_mode = mode_none;
        m.uv_func = vrx::scene::uv_scroll; // stale value the chooser must overwrite
        EXPECT_EQ(raster_mode_for(m), c.mode) << "row " << row;
        choose_raster_mode(&m);
        EXPECT_EQ(m.raster_mode, c.mode) << "row " << row;
        EXPECT_EQ(m.uv_func, c.uv) << "row " << row;
        ++row;
    }
}

TEST(RasterChoose, GeneratorFollowsScrollOffsets) {
    struct Case {
        uint32_t flags;
        int32_t su, sv;
        UvFunc uv;
        int32_t off_u, off_v; // 7, 7: left untouched
    };
    const Case cases[] = {
        {0, 0, 0, vrx::scene::uv_copy, 7, 7},
        {0, 0x100, 0, vrx::scene::uv_scroll, 0x100, 0},
        {0, 0, -0x8000, vrx::scene::uv_scroll, 0, -0x8000},
        {kRefl, 0, 0, vrx::scene::uv_sphere, 7, 7},
        {kRefl, 0x4000, 0x2000, vrx::scene::uv_sphere_scroll, 0x4000, 0x2000},
    };
    TEXTURE tex{};
    for (const Case& c : cases) {
        MATERIAL m{};
        m.texture = &tex;
        m.flags = c.flags;
        m.scroll_u = c.su;
        m.scroll_v = c.sv;
        m.uv_offset_u = m.uv_offset_v = 7;
        choose_raster_mode(&m);
        EXPECT_EQ(m.uv_func, c.uv);
        EXPECT_EQ(m.uv_offset_u, c.off_u);
        EXPECT_EQ(m.uv_offset_v, c.off_v);
    }
}

TEST(RasterChoose, PolygonListPath) {
    struct Case {
        bool textured;
        int32_t alpha_kind;
        int32_t opacity;   // diffuse_scaled.a
        int32_t diffuse_a; // diffuse.a
        int32_t self_illum;
        RasterMode mode;
    };
    const Case cases[] = {
        {true, 0, kOne, kOne, 0, mode_tex},
        {true, 0, kOne, 0x8000, 0x8000, mode_tex},     // the scaled alpha counts, not diffuse
        {true, 0, 0x8000, kOne, kOne, mode_tex_blend}, // translucent 565
        {true, 0, 0x8000, kOne, 0x8000, mode_tex_blend_lit},
        {true, 0, kOne + 1, kOne, kOne, mode_tex_blend}, // exactly 1.0 only
        {true, 1, kOne, kOne, kOne, mode_tex_blend},     // 4444 texels always blend
        {true, 1, kOne, kOne, 0, mode_tex_blend_lit},
        {true, 2, kOne, kOne, kOne, mode_tex_blend}, // 8888 texels always blend
        {true, 2, kOne, kOne, kOne - 1, mode_tex_blend_lit},
        {false, 0, 0x8000, kOne, 0, mode_flat}, // untextured: diffuse alpha decides
        {false, 0, kOne, 0x8000, 0, mode_gouraud_blend},
        {false, 0, kOne, 0, kOne, mode_gouraud_blend},
        {false, 0, kOne, kOne, 0, mode_flat},
    };
    int row = 0;
    for (const Case& c : cases) {
        TEXTURE tex{};
        tex.alpha_kind = c.alpha_kind;
        MATERIAL m{};
        m.texture = c.textured ? &tex : nullptr;
        m.diffuse_scaled.a = c.opacity;
        m.diffuse.a = c.diffuse_a;
        m.self_illum = c.self_illum;
        m.uv_func = vrx::scene::uv_copy;
        EXPECT_EQ(list_raster_mode_for(m), c.mode) << "row " << row;
        choose_list_raster_mode(&m);
        EXPECT_EQ(m.raster_mode, c.mode) << "row " << row;
        EXPECT_EQ(m.uv_func, vrx::scene::uv_copy) << "row " << row; // generator untouched
        ++row;
    }
}

} // namespace
