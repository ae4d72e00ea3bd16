// The nine raster modes: small installers that read eng_flags (and, for the two textured
// blend modes, the current material's texel format) and store draw_triangle and draw_span.
// A mode reads its SpanTable slot at the moment it runs, so a table rebuilt by a hint is
// seen from the next installation on.
#include <array>
#include <cstddef>

#include "assets/texture.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/raster_mode.h"
#include "render/triangle.h"
#include "scene/material.h"

namespace vrx::render {

namespace {

using engine::g_eng;

bool depth_on() noexcept {
    return (g_eng.eng_flags & engine::FLAG_ZBUFFER) != 0;
}
bool perspective_on() noexcept {
    return (g_eng.eng_flags & engine::FLAG_PERSPECTIVE) != 0;
}

// The drawer for the depth flag and the slot for the depth and perspective flags, indexed
// [depth][perspective].
struct ModeChoice {
    TriangleFn tri[2];
    SpanSlot slot[2][2];
};

void install(const ModeChoice& c) noexcept {
    const int d = depth_on() ? 1 : 0;
    const int p = perspective_on() ? 1 : 0;
    draw_triangle = c.tri[d];
    draw_span = SpanTable[c.slot[d][p]];
}

// Texel format of the current material's texture: 0 RGB565, 1 RGBA4444, 2 32-bit. A missing
// material or texture, or a format outside the three, counts as RGB565 so that the candidate
// index stays inside its group.
int32_t current_alpha_kind() noexcept {
    const scene::MATERIAL* m = g_eng.cur_material;
    if (!m || !m->texture) return assets::kAlpha565;
    const int32_t kind = m->texture->alpha_kind;
    return (kind >= assets::kAlpha565 && kind <= assets::kAlpha8888) ? kind : assets::kAlpha565;
}

// The twelve candidate fillers of a blend mode: groups of three formats (565, 4444, 8888) in
// the order depth and perspective, depth only, perspective only, neither.
using BlendCandidates = std::array<SpanSlot, 12>;

inline constexpr BlendCandidates kBlendCandidates = {
    SPAN_BLEND_565_ZP, SPAN_BLEND_4444_ZP, SPAN_BLEND_8888_ZP, //
    SPAN_BLEND_565_Z,  SPAN_BLEND_4444_Z,  SPAN_BLEND_8888_Z,  //
    SPAN_BLEND_565_P,  SPAN_BLEND_4444_P,  SPAN_BLEND_8888_P,  //
    SPAN_BLEND_565,    SPAN_BLEND_4444,    SPAN_BLEND_8888,
};

// The lit blend has no perspective filler without depth; the unlit perspective blend fillers
// draw exactly the pixels it would, since a lit blend's pixel ignores the colour it steps.
inline constexpr BlendCandidates kBlendLitCandidates = {
    SPAN_BLENDLIT_565_ZP, SPAN_BLENDLIT_4444_ZP, SPAN_BLENDLIT_8888_ZP, //
    SPAN_BLENDLIT_565_Z,  SPAN_BLENDLIT_4444_Z,  SPAN_BLENDLIT_8888_Z,  //
    SPAN_BLEND_565_P,     SPAN_BLEND_4444_P,     SPAN_BLEND_8888_P,     //
    SPAN_BLENDLIT_565,    SPAN_BLENDLIT_4444,    SPAN_BLENDLIT_8888,
};

// The blend fillers weigh by the current material's opacity (the alpha of diffuse_scaled,
// 0x10000 opaque) as a weight 0 to 256; a blend mode sets it as it installs its filler.
void set_blend_weight() noexcept {
    const scene::MATERIAL* m = g_eng.cur_material;
    g_raster.blend_a = m ? m->diffuse_scaled.a >> 8 : 256;
}

void install_blend(TriangleFn flat_tri, TriangleFn z_tri, const BlendCandidates& c) noexcept {
    const bool d = depth_on(), p = perspective_on();
    const int32_t group = d ? (p ? 0 : 3) : (p ? 6 : 9);
    draw_triangle = d ? z_tri : flat_tri;
    draw_span = SpanTable[c[static_cast<std::size_t>(group + current_alpha_kind())]];
    set_blend_weight();
}

} // namespace

// The installers, under the engine's names for the modes (the RasterMode enumerators carry
// the same names, hence the namespace).
namespace modes {

void mode_flat() noexcept {
    install({{tri_flat, tri_flat_z}, {{SPAN_FLAT, SPAN_FLAT}, {SPAN_FLAT_Z, SPAN_FLAT_Z}}});
}
void mode_gouraud() noexcept {
    install({{tri_gouraud, tri_gouraud_z},
             {{SPAN_GOURAUD, SPAN_GOURAUD}, {SPAN_GOURAUD_Z, SPAN_GOURAUD_Z}}});
}
// Without depth the translucent Gouraud filler is the fixed span_gouraud_blend, which no
// filler set replaces; SpanTable keeps it in its last entry.
void mode_gouraud_blend() noexcept {
    install(
        {{tri_gouraud, tri_gouraud_z},
         {{SPAN_GOURAUD_BLEND, SPAN_GOURAUD_BLEND}, {SPAN_GOURAUD_BLEND_Z, SPAN_GOURAUD_BLEND_Z}}});
    set_blend_weight();
}
void mode_tex() noexcept {
    install({{tri_tex, tri_tex_z}, {{SPAN_TEX, SPAN_TEX_P}, {SPAN_TEX_Z, SPAN_TEX_ZP}}});
}
void mode_tex_flat() noexcept {
    install(
        {{tri_tex, tri_tex_z}, {{SPAN_TEXMOD, SPAN_TEXMOD_P}, {SPAN_TEXMOD_Z, SPAN_TEXMOD_ZP}}});
}
void mode_tex_gouraud() noexcept {
    install({{tri_tex_gouraud, tri_tex_gouraud_z},
             {{SPAN_TEXGOUR, SPAN_TEXGOUR_P}, {SPAN_TEXGOUR_Z, SPAN_TEXGOUR_ZP}}});
}
void mode_tex_add() noexcept {
    install({{tri_tex_gouraud, tri_tex_gouraud_z},
             {{SPAN_TEXADD, SPAN_TEXADD_P}, {SPAN_TEXADD_Z, SPAN_TEXADD_ZP}}});
}
void mode_tex_blend() noexcept {
    install_blend(tri_tex, tri_tex_z, kBlendCandidates);
}
void mode_tex_blend_lit() noexcept {
    install_blend(tri_tex_gouraud, tri_tex_gouraud_z, kBlendLitCandidates);
}

} // namespace modes

namespace {

using Installer = void (*)() noexcept;

struct ModeEntry {
    RasterMode mode;
    Installer install;
};

// RasterMode to installer; each row names its mode so the order is checked at compile time.
inline constexpr std::array<ModeEntry, kRasterModeCount> kModeTable = {{
    {mode_flat, modes::mode_flat},
    {mode_gouraud, modes::mode_gouraud},
    {mode_gouraud_blend, modes::mode_gouraud_blend},
    {mode_tex, modes::mode_tex},
    {mode_tex_flat, modes::mode_tex_flat},
    {mode_tex_gouraud, modes::mode_tex_gouraud},
    {mode_tex_add, modes::mode_tex_add},
    {mode_tex_blend, modes::mode_tex_blend},
    {mode_tex_blend_lit, modes::mode_tex_blend_lit},
}};

constexpr bool mode_table_in_order() {
    for (std::size_t i = 0; i < kModeTable.size(); ++i) {
        if (static_cast<std::size_t>(kModeTable[i].mode) != i) return false;
    }
    return true;
}
static_assert(mode_table_in_order(), "kModeTable rows must follow RasterMode");

} // namespace

void run_raster_mode(RasterMode mode) noexcept {
    if (mode < 0 || mode >= kRasterModeCount) {
        // No mode chosen (or a corrupt one): nothing is drawn until a real mode runs.
        draw_triangle = nullptr;
        draw_span = nullptr;
        return;
    }
    kModeTable[static_cast<std::size_t>(mode)].install();
}

} // namespace vrx::render
