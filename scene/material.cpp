// Materials: creation, duplication, release by use count, colours and multipliers,
// self-illumination, sides, shading, texture binding and scrolling, the texture-coordinate
// generators, and the VRX_ material exports at the bottom.
#include "scene/material.h"

#include <cstddef>
#include <cstring>
#include <type_traits>

#include "engine/alloc.h"
#include "engine/error.h"
#include "engine/fixed.h"
#include "engine/handles.h"
#include "engine/names.h"
#include "engine/state.h"
#include "engine/vector.h"
#include "render/raster_choose.h"

namespace vrx::scene {

using assets::TEXTURE;
using engine::g_eng;

namespace {

// State of this module that the engine aggregate does not hold.
struct MaterialState {
    MATERIAL* default_material; // recorded by VRX_SetDefaultMaterial; no drawing path reads it
};
constinit MaterialState g_mat{};

// A texture pointer a material holds is followed only while it names a live texture: a
// host that unloads a texture more often than it loaded it must not make the engine
// write into freed memory.
bool live_texture(const TEXTURE* t) noexcept {
    return t && engine::registry_tag(t) == engine::TAG_TEXTURE;
}

void add_texture_ref(TEXTURE* t) noexcept {
    if (live_texture(t)) ++t->ref_count;
}

// One reference fewer without releasing (rebinding keeps a texture even at 0).
void drop_texture_ref(TEXTURE* t) noexcept {
    if (live_texture(t) && t->ref_count > 0) --t->ref_count;
}

// One reference fewer; the last one unlinks and frees the texture.
void release_texture_ref(TEXTURE* t) noexcept {
    if (!live_texture(t)) return;
    if (t->ref_count > 0) --t->ref_count;
    if (t->ref_count == 0) {
        assets::UnlinkTexture(t);
        assets::FreeTexture(t);
    }
}

// Nothing may keep pointing at a material once it is freed.
void forget_material(const MATERIAL* m) noexcept {
    if (g_mat.default_material == m) g_mat.default_material = nullptr;
    if (g_eng.cur_material == m) g_eng.cur_material = nullptr;
}

RGBA_FIXED color_from_bytes(const uint8_t* b) noexcept {
    return {byte_to_fixed(b[0]), byte_to_fixed(b[1]), byte_to_fixed(b[2]), byte_to_fixed(b[3])};
}

void color_to_bytes(const RGBA_FIXED& c, uint8_t* b) noexcept {
    b[0] = fixed_to_byte(c.r);
    b[1] = fixed_to_byte(c.g);
    b[2] = fixed_to_byte(c.b);
    b[3] = fixed_to_byte(c.a);
}

// Binds `t` in place of the current texture: the new one gains a reference, the old one
// loses one but is not released here, even at 0.
void rebind_texture(MATERIAL* m, TEXTURE* t) noexcept {
    if (t == m->texture) return;
    add_texture_ref(t);
    drop_texture_ref(m->texture);
    m->texture = t;
}

// The fields a MATINFO sets, shared by creation and VRX_SetMaterialInfo.
void apply_info(MATERIAL* m, const MATINFO& info) noexcept {
    m->ambient = color_from_bytes(info.ambient);
    m->diffuse = color_from_bytes(info.diffuse);
    m->ambient_scale = info.ambient_scale;
    m->diffuse_scale = info.diffuse_scale;
    m->self_illum = clamp_self_illum(info.self_illum);
    m->ambient_scaled = scale_color(m->ambient, m->ambient_scale);
    m->diffuse_scaled = scale_color(m->diffuse, m->diffuse_scale);
    m->flags = info.flags;
}

// Sum of the three axes weighted by the components of `d`, wrapping in 32 bits.
VECTOR turn_by_axes(const VECTOR& d, const UCS& axes) noexcept {
    using engine::F_MUL;
    using engine::wrap_add;
    return {wrap_add(wrap_add(F_MUL(d.x, axes.x.x), F_MUL(d.y, axes.y.x)), F_MUL(d.z, axes.z.x)),
            wrap_add(wrap_add(F_MUL(d.x, axes.x.y), F_MUL(d.y, axes.y.y)), F_MUL(d.z, axes.z.y)),
            wrap_add(wrap_add(F_MUL(d.x, axes.x.z), F_MUL(d.y, axes.y.z)), F_MUL(d.z, axes.z.z))};
}

// Sphere-map coordinates of one vertex, before any scroll offset.
void sphere_uv(const VECTOR& pos, const VECTOR& normal, const UvPlacement& where, int32_t& u,
               int32_t& v) noexcept {
    using engine::F_MUL;
    // Packs drawn without an object are already in world coordinates.
    static constexpr UCS kIdentity{{0, 0, 0}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
    const UCS& axes = where.global ? *where.global : kIdentity;
    const VECTOR eye = where.eye ? *where.eye : VECTOR{0, 0, 0};

    // Eye-to-vertex direction; the object's origin is deliberately not added.
    VECTOR e = turn_by_axes(pos, axes);
    engine::vec_sub(e, eye, e);
    engine::vec_normalize(e);
    VECTOR n = turn_by_axes(normal, axes);
    engine::vec_normalize(n);

    // Reflect e about n, then tilt towards +z so the map's centre faces the viewer.
    VECTOR twice_n = n;
    engine::vec_scale(engine::wrap_shl(engine::vec_dot(n, e), 1), twice_n);
    VECTOR r;
    engine::vec_sub(e, twice_n, r);
    r.z = engine::wrap_add(r.z, kOne);

    const int32_t q = engine::vec_dot(r, r);
    const int32_t h = q > 0 ? F_MUL(engine::Sqrt(q), 0x8000) : 0;
    u = engine::wrap_add(F_MUL(h, r.x), 0x8000);
    v = engine::wrap_sub(0x8000, F_MUL(h, r.y));
}

} // namespace

RGBA_FIXED scale_color(const RGBA_FIXED& c, int32_t scale) noexcept {
    using engine::F_MUL;
    return {F_MUL(c.r, scale), F_MUL(c.g, scale), F_MUL(c.b, scale), F_MUL(c.a, scale)};
}

void rescale_material(MATERIAL* m) noexcept {
    m->ambient_scaled = scale_color(m->ambient, m->ambient_scale);
    m->diffuse_scaled = scale_color(m->diffuse, m->diffuse_scale);
    m->color3_scaled = scale_color(m->color3, m->color3_scale);
}

void choose_uv_func(MATERIAL* m) noexcept {
    const bool reflect = (m->flags & MAT_REFLECT) != 0;
    if (m->scroll_u == 0 && m->scroll_v == 0) {
        m->uv_func = reflect ? uv_sphere : uv_copy;
        return;
    }
    m->uv_offset_u = m->scroll_u;
    m->uv_offset_v = m->scroll_v;
    m->uv_func = reflect ? uv_sphere_scroll : uv_scroll;
}

void link_material(MATERIAL* m) noexcept {
    g_eng.material_list.append(m);
}

void release_material(MATERIAL* m) noexcept {
    // A count already at 0 (a file material no pack uses) is released too, not kept at -1.
    if (--m->use_count > 0) return;
    g_eng.material_list.unlink(m);
    engine::eng_free(m->name);
    m->name = nullptr;
    release_texture_ref(m->texture);
    forget_material(m);
    engine::free_record(m);
}

int32_t clear_materials() noexcept {
    for (MATERIAL* m = g_eng.material_list.head; m;) {
        MATERIAL* next = m->next;
        engine::eng_free(m->name);
        forget_material(m);
        engine::free_record(m);
        m = next;
    }
    g_eng.material_list.clear();
    return 0;
}

MATERIAL* default_material() noexcept {
    return g_mat.default_material;
}

void generate_uv(const MATERIAL& m, const VECTOR& pos, const VECTOR& normal, int32_t u, int32_t v,
                 const UvPlacement& where, render::SVERTEX& out) noexcept {
    switch (m.uv_func) {
        case uv_copy:
            out.u = u;
            out.v = v;
            return;
        case uv_scroll:
            out.u = engine::wrap_add(u, m.uv_offset_u);
            out.v = engine::wrap_add(v, m.uv_offset_v);
            return;
        case uv_sphere:
            sphere_uv(pos, normal, where, out.u, out.v);
            return;
        case uv_sphere_scroll:
            sphere_uv(pos, normal, where, out.u, out.v);
            out.u = engine::wrap_add(out.u, m.uv_offset_u);
            out.v = engine::wrap_add(out.v, m.uv_offset_v);
            return;
        case uv_none:
            return;
    }
}

// ---- Operations behind the exports (handles already checked) ------------------------------

namespace {

// ENG_CreateMat: a new unnamed material with one use; 0, or -1 after the message.
int32_t create_material(const MATINFO& info, MATERIAL** out) noexcept {
    auto* tex = static_cast<TEXTURE*>(info.texture);
    if (tex && engine::chk_texture(tex)) {
        engine::ReportError("Wrong texture handle in ENG_CreateMat!!\n");
        return -1;
    }
    MATERIAL* m = engine::new_record<MATERIAL>();
    if (!m) {
        engine::ReportError("Allocate memory for MATERIAL in ENG_CreateMat fail !!\n");
        return -1;
    }
    m->texture = tex;
    add_texture_ref(tex);
    m->use_count = 1;
    apply_info(m, info);
    rescale_material(m); // color3 and its multiplier are 0
    render::choose_raster_mode(m);
    link_material(m);
    *out = m;
    return 0;
}

// ENG_DuplicateMat: a copy with its own name string and one use.
int32_t duplicate_material(const MATERIAL* src, MATERIAL** out) noexcept {
    MATERIAL* m = engine::new_record<MATERIAL>();
    if (!m) {
        engine::ReportError("Allocate memory for MATERIAL in ENG_DuplicateMat fail!!\n");
        return -1;
    }
    char* name = nullptr;
    if (src->name) {
        const size_t len = std::strlen(src->name) + 1;
        name = static_cast<char*>(engine::eng_malloc(len));
        if (!name) {
            engine::ReportError("Allocate memory for p->name in ENG_DuplicateMat fail !!\n");
            engine::free_record(m);
            return -1;
        }
        std::memcpy(name, src->name, len);
    }
    *m = *src; // the tag comes along: the source passed its check
    m->name = name;
    m->use_count = 1;
    add_texture_ref(m->texture);
    link_material(m);
    *out = m;
    return 0;
}

// ENG_SetMatInfo: the texture is checked before anything changes.
int32_t set_material_info(MATERIAL* m, const MATINFO& info) noexcept {
    auto* tex = static_cast<TEXTURE*>(info.texture);
    if (tex && engine::chk_texture(tex)) {
        engine::ReportError("Wrong texture handle in ENG_SetMatInfo!!\n");
        return -1;
    }
    rebind_texture(m, tex);
    apply_info(m, info); // color3 is left alone
    render::choose_raster_mode(m);
    return 0;
}

void get_material_info(const MATERIAL& m, MATINFO& info) noexcept {
    info.texture = m.texture;
    color_to_bytes(m.ambient, info.ambient);
    color_to_bytes(m.diffuse, info.diffuse);
    info.ambient_scale = m.ambient_scale;
    info.diffuse_scale = m.diffuse_scale;
    info.self_illum = m.self_illum;
    info.flags = m.flags;
}

void set_shading(MATERIAL* m, int32_t mode) noexcept {
    if (mode >= 0 && mode <= 3)
        m->flags = (m->flags & ~MAT_SHADING) | (static_cast<uint32_t>(mode) << 3);
    render::choose_raster_mode(m);
}

// ENG_ScrollMatText: offsets replace the old ones; only a material drawn textured gets a
// new generator.
void scroll_texture(MATERIAL* m, int32_t u, int32_t v) noexcept {
    m->scroll_u = u;
    m->scroll_v = v;
    if (m->texture && !(m->flags & MAT_UNTEXTURED)) choose_uv_func(m);
}

} // namespace

} // namespace vrx::scene

// ---- Exports ---------------------------------------------------------------------------------

using namespace vrx;
using scene::MATERIAL;

static_assert(std::is_standard_layout_v<MATINFO>);
static_assert(offsetof(MATINFO, texture) == 0);
static_assert(offsetof(MATINFO, ambient) == sizeof(void*));
static_assert(offsetof(MATINFO, diffuse) == sizeof(void*) + 4);
static_assert(offsetof(MATINFO, ambient_scale) == sizeof(void*) + 8);
static_assert(offsetof(MATINFO, diffuse_scale) == sizeof(void*) + 12);
static_assert(offsetof(MATINFO, self_illum) == sizeof(void*) + 16);
static_assert(offsetof(MATINFO, flags) == sizeof(void*) + 20);
static_assert(sizeof(MATINFO) == (sizeof(void*) == 4 ? 28 : 32));

namespace {

MATERIAL* as_material(void* h) noexcept {
    return static_cast<MATERIAL*>(h);
}

// chk_material with the operation's own message after the check's.
bool bad_material(const void* h, const char* op) noexcept {
    if (!engine::chk_material(h)) return false;
    engine::ReportError("chk_material return error in %s!!\n", op);
    return true;
}

// A null argument the operation needs.
bool missing(const void* p, const char* what, const char* op) noexcept {
    if (p) return false;
    engine::ReportError("Wrong %s in %s!!\n", what, op);
    return true;
}

} // namespace

extern "C" {

VRX_API int32_t VRX_CreateMaterial(const MATINFO* info, void** out) noexcept {
    if (missing(info, "info", "ENG_CreateMat") || missing(out, "out", "ENG_CreateMat")) return -1;
    MATERIAL* m = nullptr;
    if (scene::create_material(*info, &m) != 0) return -1;
    *out = m;
    return 0;
}

VRX_API int32_t VRX_DuplicateMaterial(void* mat, void** out) noexcept {
    if (bad_material(mat, "ENG_DuplicateMat") || missing(out, "out", "ENG_DuplicateMat")) return -1;
    MATERIAL* m = nullptr;
    if (scene::duplicate_material(as_material(mat), &m) != 0) return -1;
    *out = m;
    return 0;
}

VRX_API int32_t VRX_DeleteMaterial(void* mat) noexcept {
    if (bad_material(mat, "ENG_DeleteMat")) return -1;
    scene::release_material(as_material(mat));
    return 0;
}

VRX_API int32_t VRX_SetDefaultMaterial(void* mat) noexcept {
    if (bad_material(mat, "ENG_DefaultMat")) return -1;
    scene::g_mat.default_material = as_material(mat);
    engine::g_eng.cur_material = nullptr;
    return 0;
}

VRX_API int32_t VRX_GetMaterialByName(const char* name, void** out) noexcept {
    if (missing(name, "name", "VRX_GetMaterialByName") ||
        missing(out, "out", "VRX_GetMaterialByName"))
        return -1;
    for (MATERIAL* m = engine::g_eng.material_list.head; m; m = m->next) {
        if (m->name && engine::StrCmpNoCase(m->name, name) == 0) {
            *out = m;
            return 0;
        }
    }
    *out = nullptr;
    return 1;
}

VRX_API int32_t VRX_GetMaterialName(void* mat, char* buf) noexcept {
    if (bad_material(mat, "ENG_GetMatName") || missing(buf, "buffer", "ENG_GetMatName")) return -1;
    const char* name = as_material(mat)->name;
    std::strcpy(buf, name ? name : "");
    return 0;
}

VRX_API int32_t VRX_SetMaterialColor(void* mat, const uint8_t* rgba, int32_t which) noexcept {
    if (engine::chk_material(mat)) {
        engine::ReportError("chk_material return error in ENG_SetMatAmbColor!\n");
        return -1;
    }
    if (missing(rgba, "color", "ENG_SetMatAmbColor")) return -1;
    MATERIAL* m = as_material(mat);
    if (which == 0) {
        m->ambient = scene::color_from_bytes(rgba);
        m->ambient_scaled = scene::scale_color(m->ambient, m->ambient_scale);
    } else {
        m->diffuse = scene::color_from_bytes(rgba);
        m->diffuse_scaled = scene::scale_color(m->diffuse, m->diffuse_scale);
    }
    return 0;
}

VRX_API int32_t VRX_GetMaterialColor(void* mat, uint8_t* rgba, int32_t which) noexcept {
    if (bad_material(mat, "ENG_GetMatAmbColor") || missing(rgba, "color", "ENG_GetMatAmbColor"))
        return -1;
    const MATERIAL* m = as_material(mat);
    scene::color_to_bytes(which == 0 ? m->ambient : m->diffuse, rgba);
    return 0;
}

VRX_API int32_t VRX_SetMaterialColorScale(void* mat, FIXED scale, int32_t which) noexcept {
    if (bad_material(mat, "ENG_SetMatAmbMultiplier")) return -1;
    MATERIAL* m = as_material(mat);
    if (which == 0) {
        m->ambient_scale = scale;
        m->ambient_scaled = scene::scale_color(m->ambient, scale);
    } else {
        m->diffuse_scale = scale;
        m->diffuse_scaled = scene::scale_color(m->diffuse, scale);
    }
    return 0;
}

VRX_API int32_t VRX_GetMaterialColorScale(void* mat, FIXED* scale, int32_t which) noexcept {
    if (bad_material(mat, "ENG_GetMatAmbMultiplier") ||
        missing(scale, "out", "ENG_GetMatAmbMultiplier"))
        return -1;
    const MATERIAL* m = as_material(mat);
    *scale = which == 0 ? m->ambient_scale : m->diffuse_scale;
    return 0;
}

VRX_API int32_t VRX_SetMaterialSelfIllum(void* mat, FIXED value) noexcept {
    if (bad_material(mat, "ENG_SetMatSelfIllum")) return -1;
    MATERIAL* m = as_material(mat);
    m->self_illum = scene::clamp_self_illum(value);
    render::choose_raster_mode(m);
    return 0;
}

VRX_API int32_t VRX_GetMaterialSelfIllum(void* mat, FIXED* value) noexcept {
    if (bad_material(mat, "ENG_GetMatSelfIllum") || missing(value, "out", "ENG_GetMatSelfIllum"))
        return -1;
    *value = as_material(mat)->self_illum;
    return 0;
}

VRX_API int32_t VRX_SetMaterialSide(void* mat, int32_t two_sided) noexcept {
    if (bad_material(mat, "ENG_SetMatSide")) return -1;
    MATERIAL* m = as_material(mat);
    m->flags = two_sided ? (m->flags | scene::MAT_TWO_SIDED) : (m->flags & ~scene::MAT_TWO_SIDED);
    return 0;
}

VRX_API int32_t VRX_SetMaterialShading(void* mat, int32_t mode) noexcept {
    if (bad_material(mat, "ENG_SetMatShading")) return -1;
    scene::set_shading(as_material(mat), mode);
    return 0;
}

VRX_API int32_t VRX_GetMaterialInfo(void* mat, MATINFO* info) noexcept {
    if (bad_material(mat, "ENG_GetMatInfo") || missing(info, "info", "ENG_GetMatInfo")) return -1;
    scene::get_material_info(*as_material(mat), *info);
    return 0;
}

VRX_API int32_t VRX_SetMaterialInfo(void* mat, const MATINFO* info) noexcept {
    if (bad_material(mat, "ENG_SetMatInfo") || missing(info, "info", "ENG_SetMatInfo")) return -1;
    return scene::set_material_info(as_material(mat), *info);
}

VRX_API int32_t VRX_GetMaterialTexture(void* mat, void** out) noexcept {
    if (bad_material(mat, "ENG_GetMatTextHandle") || missing(out, "out", "ENG_GetMatTextHandle"))
        return -1;
    *out = as_material(mat)->texture;
    return 0;
}

VRX_API int32_t VRX_BindMaterialTexture(void* mat, void* tex) noexcept {
    if (bad_material(mat, "ENG_SetMatTextHandle")) return -1;
    if (engine::chk_texture(tex)) {
        engine::ReportError("chk_texture return error in ENG_SetMatTextHandle!!\n");
        return -1;
    }
    MATERIAL* m = as_material(mat);
    scene::rebind_texture(m, static_cast<assets::TEXTURE*>(tex));
    render::choose_raster_mode(m);
    return 0;
}

VRX_API int32_t VRX_MoveMaterialTexture(void* mat, FIXED u, FIXED v) noexcept {
    if (engine::chk_material(mat)) {
        engine::ReportError("chk_material return error in ENG_ScrollMatText !!\n");
        return -1;
    }
    scene::scroll_texture(as_material(mat), u, v);
    return 0;
}

} // extern "C"
