// build_span_table: which filler of the family fills each SpanTable slot, in the standard and
// in the filtered set. The 32-bit texel slots and the untextured ones have no filtered filler
// and keep their standard one in both sets.
#include <cstddef>

#include "render/raster.h"
#include "render/span_fillers.h"

namespace vrx::render {

namespace {

struct SlotFillers {
    SpanSlot slot;
    SpanFn standard;
    SpanFn filtered; // nullptr: the standard filler serves both sets
};

constexpr SlotFillers kSlotFillers[] = {
    {SPAN_FLAT, span_flat, nullptr},
    {SPAN_FLAT_Z, span_flat_z, nullptr},
    {SPAN_GOURAUD, span_gouraud, nullptr},
    {SPAN_GOURAUD_Z, span_gouraud_z, nullptr},
    {SPAN_GOURAUD_BLEND_Z, span_gouraud_blend_z, nullptr},
    {SPAN_TEX, span_tex, span_tex_filtered},
    {SPAN_TEX_P, span_tex_p, span_tex_p_filtered},
    {SPAN_TEX_Z, span_tex_z, span_tex_z_filtered},
    {SPAN_TEX_ZP, span_tex_zp, span_tex_zp_filtered},
    {SPAN_TEXMOD, span_texmod, span_texmod_filtered},
    {SPAN_TEXMOD_P, span_texmod_p, span_texmod_p_filtered},
    {SPAN_TEXMOD_Z, span_texmod_z, span_texmod_z_filtered},
    {SPAN_TEXMOD_ZP, span_texmod_zp, span_texmod_zp_filtered},
    {SPAN_TEXGOUR, span_texgour, span_texgour_filtered},
    {SPAN_TEXGOUR_P, span_texgour_p, span_texgour_p_filtered},
    {SPAN_TEXGOUR_Z, span_texgour_z, span_texgour_z_filtered},
    {SPAN_TEXGOUR_ZP, span_texgour_zp, span_texgour_zp_filtered},
    {SPAN_TEXADD, span_texadd, span_texadd_filtered},
    {SPAN_TEXADD_P, span_texadd_p, span_texadd_p_filtered},
    {SPAN_TEXADD_Z, span_texadd_z, span_texadd_z_filtered},
    {SPAN_TEXADD_ZP, span_texadd_zp, span_texadd_zp_filtered},
    {SPAN_BLEND_565, span_blend_565, span_blend_565_filtered},
    {SPAN_BLEND_4444, span_blend_4444, span_blend_4444_filtered},
    {SPAN_BLEND_8888, span_blend_8888, nullptr},
    {SPAN_BLEND_565_P, span_blend_565_p, span_blend_565_p_filtered},
    {SPAN_BLEND_4444_P, span_blend_4444_p, span_blend_4444_p_filtered},
    {SPAN_BLEND_8888_P, span_blend_8888_p, nullptr},
    {SPAN_BLEND_565_Z, span_blend_565_z, span_blend_565_z_filtered},
    {SPAN_BLEND_4444_Z, span_blend_4444_z, span_blend_4444_z_filtered},
    {SPAN_BLEND_8888_Z, span_blend_8888_z, nullptr},
    {SPAN_BLEND_565_ZP, span_blend_565_zp, span_blend_565_zp_filtered},
    {SPAN_BLEND_4444_ZP, span_blend_4444_zp, span_blend_4444_zp_filtered},
    {SPAN_BLEND_8888_ZP, span_blend_8888_zp, nullptr},
    {SPAN_BLENDLIT_565, span_blendlit_565, span_blendlit_565_filtered},
    {SPAN_BLENDLIT_4444, span_blendlit_4444, span_blendlit_4444_filtered},
    {SPAN_BLENDLIT_8888, span_blendlit_8888, nullptr},
    {SPAN_BLENDLIT_565_Z, span_blendlit_565_z, span_blendlit_565_z_filtered},
    {SPAN_BLENDLIT_4444_Z, span_blendlit_4444_z, span_blendlit_4444_z_filtered},
    {SPAN_BLENDLIT_8888_Z, span_blendlit_8888_z, nullptr},
    {SPAN_BLENDLIT_565_ZP, span_blendlit_565_zp, span_blendlit_565_zp_filtered},
    {SPAN_BLENDLIT_4444_ZP, span_blendlit_4444_zp, span_blendlit_4444_zp_filtered},
    {SPAN_BLENDLIT_8888_ZP, span_blendlit_8888_zp, nullptr},
    {SPAN_GOURAUD_BLEND, span_gouraud_blend, nullptr},
};

// Every slot appears once, in enum order, so the table is a plain sequence of stores.
constexpr bool slots_in_order() {
    for (std::size_t i = 0; i < std::size(kSlotFillers); ++i) {
        if (kSlotFillers[i].slot != static_cast<SpanSlot>(i)) return false;
    }
    return std::size(kSlotFillers) == kSpanSlotCount;
}
static_assert(slots_in_order(), "one row per SpanTable slot, in slot order");

} // namespace

void build_span_table(int32_t set) noexcept {
    const bool filtered = set == kSpanSetFiltered;
    for (const SlotFillers& row : kSlotFillers) {
        SpanTable[row.slot] = filtered && row.filtered != nullptr ? row.filtered : row.standard;
    }
}

} // namespace vrx::render
