// The material record: colours, multipliers, self-illumination, texture binding, the
// texture-coordinate generator and the raster mode chosen for it; and the operations the
// model loader, objects, the pipeline and the clear-all use on it.
//
// Ownership: a material holds one reference on its bound texture and lives on
// g_eng.material_list until its use count falls to zero (or the clear-all frees it).
#pragma once

#include <cstdint>

#include "assets/texture.h"
#include "engine/handles.h"
#include "lite_vrx.h"
#include "render/raster_mode.h"
#include "render/svertex.h"

namespace vrx::scene {

// Bits of MATERIAL::flags.
inline constexpr uint32_t MAT_TWO_SIDED = 1;
inline constexpr uint32_t MAT_REFLECT = 2;
inline constexpr uint32_t MAT_UNTEXTURED = 4;
inline constexpr uint32_t MAT_SHADING = 0x38;
inline constexpr uint32_t MAT_FILE_UNTEXTURED = 0x200; // set by the model loader, never tested
inline constexpr uint32_t MAT_FILE_TEXTURED = 0x400;   // set by the model loader, never tested

inline constexpr int32_t kOne = 0x10000; // 1.0

// Red, green, blue, alpha as 16.16 values, 0 to 1.0.
struct RGBA_FIXED {
    int32_t r, g, b, a;
};

// Texture-coordinate generators.
enum UvFunc : int32_t {
    uv_none = 0,
    uv_copy,
    uv_scroll,
    uv_sphere,
    uv_sphere_scroll
};

struct MATERIAL {
    static constexpr uint32_t kTag = engine::TAG_MATERIAL;
    uint32_t id;              // kind tag 'MTRL'; 0 once released
    char* name;               // owned, or null
    assets::TEXTURE* texture; // bound texture, or null
    int32_t use_count;        // holders; released at 0
    RGBA_FIXED ambient;
    RGBA_FIXED diffuse; // diffuse_scaled.a is the opacity
    RGBA_FIXED color3;  // filled by engine files only
    RGBA_FIXED ambient_scaled;
    RGBA_FIXED diffuse_scaled;
    RGBA_FIXED color3_scaled;
    int32_t ambient_scale; // multipliers, 16.16
    int32_t diffuse_scale;
    int32_t color3_scale;
    int32_t file_param;               // copied from engine files, unused
    int32_t self_illum;               // 0 to 0x10000
    render::RasterMode raster_mode;   // chosen by choose_raster_mode / choose_list_raster_mode
    UvFunc uv_func;                   // texture-coordinate generator
    int32_t scroll_u, scroll_v;       // offsets set by VRX_MoveMaterialTexture
    int32_t uv_offset_u, uv_offset_v; // the offsets the scrolling generators add
    uint32_t flags;                   // MAT_* bits
    MATERIAL* prev;                   // material_list links
    MATERIAL* next;
};

// ---- Colour conversions ------------------------------------------------------------------

// Byte to 16.16: 255 is exactly 1.0, any other byte b is b / 256.
constexpr int32_t byte_to_fixed(uint8_t b) noexcept {
    return b == 255 ? kOne : int32_t{b} << 8;
}

// 16.16 to byte: 1.0 or more is 255, anything else its top fraction byte (the low 8 bits of
// v >> 8; values below 0 never come from bytes).
constexpr uint8_t fixed_to_byte(int32_t v) noexcept {
    return v >= kOne ? uint8_t{255} : static_cast<uint8_t>(v >> 8);
}

// self_illum lies in 0 to 1.0.
constexpr int32_t clamp_self_illum(int32_t v) noexcept {
    return v < 0 ? 0 : (v > kOne ? kOne : v);
}

// ---- Operations ----------------------------------------------------------------------------

// Each component of `c` F_MUL'd by `scale`.
RGBA_FIXED scale_color(const RGBA_FIXED& c, int32_t scale) noexcept;
// Recomputes ambient_scaled, diffuse_scaled and color3_scaled from colours and multipliers.
void rescale_material(MATERIAL* m) noexcept;
// Chooses uv_func (and the offsets the scrolling generators add) from the scroll offsets and
// MAT_REFLECT; only for a material drawn textured.
void choose_uv_func(MATERIAL* m) noexcept;
// Appends a finished material to material_list.
void link_material(MATERIAL* m) noexcept;
// Releases one use: at zero uses the material is unlinked and freed, and its texture
// reference dropped (the texture itself freed when no reference is left).
void release_material(MATERIAL* m) noexcept;
// The materials step of the clear-all: frees every material whatever its use count. The
// textures are freed by the step before, so no texture pointer is followed. Returns 0.
int32_t clear_materials() noexcept;
// The material recorded by VRX_SetDefaultMaterial, or null.
MATERIAL* default_material() noexcept;

// Where reflection mapping looks from: the axes of the object being drawn (null: the
// vertices are already in world coordinates) and the camera's eye (null: the origin).
struct UvPlacement {
    const UCS* global;
    const VECTOR* eye;
};

// Runs the material's generator for one pack vertex (position, normal, stored u, v) and
// writes out.u and out.v. A material without a generator leaves `out` unchanged.
void generate_uv(const MATERIAL& m, const VECTOR& pos, const VECTOR& normal, int32_t u, int32_t v,
                 const UvPlacement& where, render::SVERTEX& out) noexcept;

} // namespace vrx::scene
