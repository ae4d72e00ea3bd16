// Raster-mode choice: the opaque-path chooser over texture, flags, shading and
// self-illumination, and the polygon-list chooser over texel format and opacity.
#include <gtest/gtest.h>

#include <string_view>
#include <tuple>

#include "assets/texture.h"
#include "render/raster_choose.h"
#include "scene/material.h"

using namespace vrx::render;
using namespace vrx::scene;
using vrx::assets::TEXTURE;

namespace {

TEST(RasterChoose, OpaquePathModeAndGenerator) {
    // One letter per shading code (0, 8, 16, 24, then 40, 48 and 56, which no setter makes)
    // and self-illum (0, 1.0 less one raw unit, 1.0): f flat, g Gouraud, T texture,
    // F texture x flat, G texture x Gouraud, A texture + colour. Scroll offsets are 0.
    const uint32_t codes[] = {0, 8, 16, 24, 40, 48, 56};
    const int32_t illums[] = {0, kOne - 1, kOne};
    const RasterMode letters[] = {mode_flat,     mode_gouraud,     mode_tex,
                                  mode_tex_flat, mode_tex_gouraud, mode_tex_add};
    const std::tuple<bool, uint32_t, const char*, UvFunc> cases[] = {
        {true, 0, "FFT GGT AAA AAA FFT FFT FFT", uv_copy},
        {true, MAT_TWO_SIDED, "FFT GGT AAA AAA FFT FFT FFT", uv_copy},
        {true, MAT_REFLECT, "TTT TTT TTT TTT TTT TTT TTT", uv_sphere},
        {true, MAT_UNTEXTURED | MAT_REFLECT, "fff ggf ggf ggf ggf ggf ggf", uv_none},
        {false, 0, "fff ggf ggf ggf ggf ggf ggf", uv_none},
        {false, MAT_REFLECT, "fff ggf ggf ggf ggf ggf ggf", uv_none}};
    TEXTURE tex{};
    for (const auto& [textured, flags, modes, uv] : cases) {
        for (size_t i = 0; i < std::size(codes) * std::size(illums); ++i) {
            const RasterMode want =
                letters[std::string_view("fgTFGA").find(modes[i / 3 * 4 + i % 3])];
            MATERIAL m{};
            m.texture = textured ? &tex : nullptr;
            m.flags = flags | codes[i / 3];
            m.self_illum = illums[i % 3];
            m.uv_func = uv_scroll; // stale: the chooser must overwrite it
            choose_raster_mode(&m);
            EXPECT_EQ(std::pair(m.raster_mode, m.uv_func), std::pair(want, uv))
                << "flags " << flags << " code " << codes[i / 3] << " illum " << illums[i % 3];
        }
    }
}

TEST(RasterChoose, PolygonListPath) {
    // Texel kind (-1: untextured), diffuse_scaled.a, diffuse.a, self-illum. Textured: only 565
    // texels at a scaled opacity of exactly 1.0 skip blending (diffuse.a does not count), else
    // lit unless self-illuminated. Untextured: diffuse.a alone decides.
    const std::tuple<int32_t, int32_t, int32_t, int32_t, RasterMode> cases[] = {
        {0, kOne, 0x8000, 0x8000, mode_tex},
        {0, 0x8000, kOne, kOne, mode_tex_blend},
        {0, 0x8000, kOne, 0x8000, mode_tex_blend_lit},
        {0, kOne + 1, kOne, kOne, mode_tex_blend},
        {1, kOne, kOne, kOne, mode_tex_blend},
        {2, kOne, kOne, kOne - 1, mode_tex_blend_lit},
        {-1, 0x8000, kOne, 0, mode_flat},
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
