// The material record: colours, multipliers, self-illumination, texture binding, the
// texture-coordinate generator and the raster mode chosen for it.
#pragma once

#include <cstdint>

#include "assets/texture.h"
#include "engine/handles.h"
#include "render/raster_mode.h"

namespace vrx::scene {

// Bits of MATERIAL::flags.
inline constexpr uint32_t MAT_TWO_SIDED = 1;
inline constexpr uint32_t MAT_REFLECT = 2;
inline constexpr uint32_t MAT_UNTEXTURED = 4;
inline constexpr uint32_t MAT_SHADING = 0x38;

// Red, green, blue, alpha as 16.16 values, 0 to 1.0.
struct RGBA_FIXED {
    int32_t r, g, b, a;
};

// Texture-coordinate generators.
enum UvFunc : int32_t { uv_none = 0, uv_copy, uv_scroll, uv_sphere, uv_sphere_scroll };

struct MATERIAL {
    static constexpr uint32_t kTag = engine::TAG_MATERIAL;
    uint32_t id;                 // kind tag 'MTRL'; 0 once released
    char* name;                  // owned, or null
    assets::TEXTURE* texture;    // bound texture, or null
    int32_t use_count;           // holders; released at 0
    RGBA_FIXED ambient;
    RGBA_FIXED diffuse;          // diffuse_scaled.a is the opacity
    RGBA_FIXED color3;           // filled by engine files only
    RGBA_FIXED ambient_scaled;
    RGBA_FIXED diffuse_scaled;
    RGBA_FIXED color3_scaled;
    int32_t ambient_scale;       // multipliers, 16.16
    int32_t diffuse_scale;
    int32_t color3_scale;
    int32_t file_param;          // copied from engine files, unused
    int32_t self_illum;          // 0 to 0x10000
    render::RasterMode raster_mode; // chosen by choose_raster_mode / choose_list_raster_mode
    UvFunc uv_func;              // texture-coordinate generator
    int32_t scroll_u, scroll_v;  // offsets set by VRX_MoveMaterialTexture
    int32_t uv_offset_u, uv_offset_v; // the offsets the scrolling generators add
    uint32_t flags;              // MAT_* bits
    MATERIAL* prev;              // material_list links
    MATERIAL* next;
};

} // namespace vrx::scene
