// Raster-mode choice per material: which of the nine modes draws it, decided from the
// material alone. The installers that turn a mode into a drawer and a filler live with
// the rasteriser.
#include "render/raster_choose.h"

#include "assets/texture.h"
#include "scene/material.h"

namespace vrx::render {

using scene::MATERIAL;

RasterMode raster_mode_for(const MATERIAL& m) noexcept {
    const uint32_t shading = m.flags & scene::MAT_SHADING;
    if (m.texture && !(m.flags & scene::MAT_UNTEXTURED)) {
        // Reflection mapping overrides every shading mode.
        if (m.flags & scene::MAT_REFLECT) return mode_tex;
        // Shading 2 and 3 add the lit colour, even to a self-illuminated texture.
        if (shading == 16 || shading == 24) return mode_tex_add;
        if (m.self_illum == scene::kOne) return mode_tex;
        if (shading == 8) return mode_tex_gouraud;
        // Shading 0 and the codes no setter produces (32 to 56) modulate by a flat colour.
        return mode_tex_flat;
    }
    return (m.self_illum != scene::kOne && shading != 0) ? mode_gouraud : mode_flat;
}

void choose_raster_mode(MATERIAL* m) noexcept {
    if (m->texture && !(m->flags & scene::MAT_UNTEXTURED))
        scene::choose_uv_func(m);
    else
        m->uv_func = scene::uv_none;
    m->raster_mode = raster_mode_for(*m);
}

RasterMode list_raster_mode_for(const MATERIAL& m) noexcept {
    if (m.texture) {
        // Only an opaque texel format at full opacity can skip blending.
        if (m.texture->alpha_kind == assets::kAlpha565 && m.diffuse_scaled.a == scene::kOne)
            return mode_tex;
        return m.self_illum == scene::kOne ? mode_tex_blend : mode_tex_blend_lit;
    }
    // Untextured: the unscaled diffuse alpha decides, as the host set it.
    return m.diffuse.a == scene::kOne ? mode_flat : mode_gouraud_blend;
}

void choose_list_raster_mode(MATERIAL* m) noexcept {
    m->raster_mode = list_raster_mode_for(*m);
}

} // namespace vrx::render
