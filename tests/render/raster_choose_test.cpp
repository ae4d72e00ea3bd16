// Raster-mode choice: the opaque path and the polygon-list path.
#include <gtest/gtest.h>

#include <tuple>

#include "assets/texture.h"
#include "render/raster_choose.h"
#include "scene/material.h"

using namespace vrx::render;
using namespace vrx::scene;
using vrx::assets::TEXTURE;

namespace {

TEST(RasterChoose, OpaquePathModeAndGenerator) {
    // Textured?, flags with the shading code (0x38), self-illum; no setter makes 56.
    const std::tuple<bool, uint32_t, int32_t, RasterMode, UvFunc> cases[] = {
        {true, MAT_REFLECT | 24, kOne - 1, mode_tex, uv_sphere}, // reflection beats shading
        {true, 16, kOne, mode_tex_add, uv_copy},                 // adds even when self-lit
        {true, 24, 0, mode_tex_add, uv_copy},
        {true, 8, kOne, mode_tex, uv_copy},
        {true, MAT_TWO_SIDED | 8, kOne - 1, mode_tex_gouraud, uv_copy},
        {true, 0, 0, mode_tex_flat, uv_copy},
        {true, 56, kOne - 1, mode_tex_flat, uv_copy},
        {true, MAT_UNTEXTURED | MAT_REFLECT | 8, 0, mode_gouraud, uv_none},
        {false, MAT_REFLECT | 16, kOne - 1, mode_gouraud, uv_none},
        {false, 8, kOne, mode_flat, uv_none},
        {false, 0, 0, mode_flat, uv_none}};
    TEXTURE tex{};
    for (const auto& [textured, flags, illum, mode, uv] : cases) {
        MATERIAL m{};
        m.texture = textured ? &tex : nullptr;
        m.flags = flags;
        m.self_illum = illum;
        m.uv_func = uv_scroll; // stale: the chooser must overwrite it
        choose_raster_mode(&m);
        EXPECT_EQ(std::pair(m.raster_mode, m.uv_func), std::pair(mode, uv))
            << textured << " flags " << flags << " illum " << illum;
    }
}

TEST(RasterChoose, PolygonListPath) {
    // Texel kind (-1: untextured, 0: 565), diffuse_scaled.a, diffuse.a, self-illum.
    const std::tuple<int32_t, int32_t, int32_t, int32_t, RasterMode> cases[] = {
        {0, kOne, 0x8000, 0x8000, mode_tex},
        {0, 0x8000, kOne, 0x8000, mode_tex_blend_lit},
        {0, kOne + 1, kOne, kOne, mode_tex_blend},
        {1, kOne, kOne, kOne, mode_tex_blend},
        {2, kOne, kOne, kOne - 1, mode_tex_blend_lit},
        {-1, 0x8000, kOne, 0, mode_flat}, // untextured: diffuse.a alone decides
        {-1, kOne, 0x8000, 0, mode_gouraud_blend}};
    for (const auto& [kind, opacity, diffuse_a, self_illum, mode] : cases) {
        TEXTURE tex{};
        tex.alpha_kind = kind;
        MATERIAL m{};
        m.texture = kind >= 0 ? &tex : nullptr;
        m.diffuse_scaled.a = opacity;
        m.diffuse.a = diffuse_a;
        m.self_illum = self_illum;
        m.uv_func = uv_copy;
        choose_list_raster_mode(&m);
        EXPECT_EQ(std::pair(m.raster_mode, m.uv_func), std::pair(mode, uv_copy)) // uv untouched
            << kind << " " << opacity << " " << diffuse_a << " " << self_illum;
    }
}

} // namespace
