// Materials: creation and colour conversions, setters, use counts and texture references,
// names, the default material, scrolling and the generators, handle and argument checks with
// their exact messages, allocation failures and the clear-all.
#include <gtest/gtest.h>

#include <cstddef>
#include <cstring>
#include <functional>
#include <string>
#include <tuple>
#include <vector>

#include "assets/texture.h"
#include "engine/alloc.h"
#include "engine/fixed.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "scene/material.h"
#include "support/engine_fixture.h"

using namespace vrx::scene;
using namespace vrx::render;
using vrx::assets::TEXTURE;
using vrx::engine::alloc_outstanding;
using vrx::engine::eng_malloc;
using vrx::engine::g_eng;

namespace {

class Materials : public vrx::test::EngineTest {
  protected:
    static auto rgba(const RGBA_FIXED& c) { return std::tuple(c.r, c.g, c.b, c.a); }
    // The generator with the scroll offsets set and the offsets it adds.
    static auto uv_state(const MATERIAL* m) {
        return std::tuple(m->uv_func, m->scroll_u, m->scroll_v, m->uv_offset_u, m->uv_offset_v);
    }
    // A listed texture already holding `refs` references; the clear-all at close frees it.
    static TEXTURE* make_texture(uint32_t refs = 1) {
        TEXTURE* t = vrx::engine::new_record<TEXTURE>();
        t->ref_count = refs;
        g_eng.texture_list.append(t);
        return t;
    }
    // Ambient (255, 128, 0, 255) scaled by 0.5, diffuse (10, 20, 30, 128) scaled by 2.0.
    static MATINFO info(void* tex = nullptr, uint32_t flags = 0, int32_t self_illum = 0) {
        return {tex, {255, 128, 0, 255}, {10, 20, 30, 128}, 0x8000, 0x20000, self_illum, flags};
    }
    // A named material is made as the model loader leaves it, with `uses` packs.
    static MATERIAL* make(const MATINFO& i = info(), const char* name = nullptr, int32_t uses = 1) {
        void* h = nullptr;
        EXPECT_EQ(VRX_CreateMaterial(&i, &h), 0);
        auto* m = static_cast<MATERIAL*>(h);
        if (name) {
            m->name = std::strcpy(static_cast<char*>(eng_malloc(std::strlen(name) + 1)), name);
            m->use_count = uses;
        }
        return m;
    }
    static std::vector<MATERIAL*> listed() {
        std::vector<MATERIAL*> v;
        for (MATERIAL* m = g_eng.material_list.head; m; m = m->next) v.push_back(m);
        return v;
    }
};

TEST_F(Materials, CreateAndColorSettersConvertAndScale) {
    MATERIAL* m = make(info(nullptr, 0x12 | MAT_TWO_SIDED, 0x18000));
    // 'MTRL', one use, self-illum clamped to 1.0, the flags word whole; untextured, shading
    // code 0x10 and self-illuminated: flat.
    EXPECT_EQ(std::tuple(m->id, m->use_count, m->self_illum, m->flags, m->raster_mode, m->uv_func),
              std::tuple(0x4D54524Cu, 1, kOne, 0x13u, mode_flat, uv_none));
    // 255 is exactly 1.0, any other byte b / 256; then 0.5 x ambient and 2.0 x diffuse.
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x8000, 0x4000, 0, 0x8000));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x1400, 0x2800, 0x3C00, kOne));
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{m});
    const uint8_t amb[4] = {1, 254, 127, 0}, dif[4] = {255, 1, 128, 254};
    ASSERT_EQ(VRX_SetMaterialColor(m, amb, 0), 0);
    ASSERT_EQ(VRX_SetMaterialColor(m, dif, 7), 0); // any non-zero: diffuse
    EXPECT_EQ(rgba(m->ambient), std::tuple(0x100, 0xFE00, 0x7F00, 0));
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x80, 0x7F00, 0x3F80, 0));
    EXPECT_EQ(rgba(m->diffuse), std::tuple(kOne, 0x100, 0x8000, 0xFE00));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x20000, 0x200, kOne, 0x1FC00));
    uint8_t out[8] = {};
    ASSERT_EQ(VRX_GetMaterialColor(m, out, 0) | VRX_GetMaterialColor(m, out + 4, 1), 0);
    EXPECT_EQ(std::vector<int>(out, out + 8), (std::vector<int>{1, 254, 127, 0, 255, 1, 128, 254}));
    // Each multiplier rescales its own pair: 0.25 x ambient, 1.5 x diffuse.
    ASSERT_EQ(VRX_SetMaterialColorScale(m, 0x4000, 0), 0);
    ASSERT_EQ(VRX_SetMaterialColorScale(m, 0x18000, 3), 0);
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x40, 0x3F80, 0x1FC0, 0));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x18000, 0x180, 0xC000, 0x17D00));
}

TEST_F(Materials, SelfIllumShadingAndSideKeepTheirRangesAndRechoose) {
    // Textured, shading 1, a loader bit: exactly 1.0 draws unlit, anything less Gouraud.
    MATERIAL* m = make(info(make_texture(), 0x208, 0));
    const std::tuple<int32_t, int32_t, RasterMode> illums[] = {
        {0x18000, kOne, mode_tex},
        {INT32_MIN, 0, mode_tex_gouraud},
        {kOne - 1, kOne - 1, mode_tex_gouraud},
        {kOne, kOne, mode_tex}};
    for (auto [in, stored, mode] : illums) {
        ASSERT_EQ(VRX_SetMaterialSelfIllum(m, in), 0);
        EXPECT_EQ(std::pair(m->self_illum, m->raster_mode), std::pair(stored, mode)) << in;
    }
    // Shading 0..3 replaces bits 0x38 only; other values keep the code but still rechoose.
    ASSERT_EQ(VRX_SetMaterialSelfIllum(m, 0x8000), 0);
    const std::tuple<int32_t, uint32_t, RasterMode> shadings[] = {
        {1, 0x208u, mode_tex_gouraud}, {7, 0x208u, mode_tex_gouraud}, {2, 0x210u, mode_tex_add},
        {-1, 0x210u, mode_tex_add},    {4, 0x210u, mode_tex_add},     {3, 0x218u, mode_tex_add},
        {0, 0x200u, mode_tex_flat}};
    for (auto [mode, flags, raster] : shadings) {
        EXPECT_EQ(VRX_SetMaterialShading(m, mode), 0);
        EXPECT_EQ(std::pair(m->flags, m->raster_mode), std::pair(flags, raster)) << mode;
    }
    m->self_illum = kOne; // changed behind the setters: a kept code shows it
    EXPECT_EQ(VRX_SetMaterialShading(m, 9), 0);
    EXPECT_EQ(m->raster_mode, mode_tex);
    for (auto [side, flags] : {std::pair{5, 0x201u}, {0, 0x200u}, {-1, 0x201u}}) {
        ASSERT_EQ(VRX_SetMaterialSide(m, side), 0);
        EXPECT_EQ(m->flags, flags) << side;
    }
}

TEST_F(Materials, InfoRoundTripsAndLeavesColor3) {
    TEXTURE* t = make_texture();
    MATERIAL* m = make();
    m->color3 = {1, 2, 3, 4};
    MATINFO in = info(t, 0x209, 0x4000), out{}; // two-sided, shading 1, a loader bit
    in.ambient[3] = 64;
    ASSERT_EQ(VRX_SetMaterialInfo(m, &in), 0);
    ASSERT_EQ(VRX_SetMaterialInfo(m, &in), 0); // the same texture again: no second reference
    EXPECT_EQ(t->ref_count, 2u);
    EXPECT_EQ(rgba(m->color3), std::tuple(1, 2, 3, 4)); // not part of the info
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x8000, 0x4000, 0, 0x2000));
    EXPECT_EQ(m->raster_mode, mode_tex_gouraud);
    ASSERT_EQ(VRX_GetMaterialInfo(m, &out), 0);
    EXPECT_EQ(std::memcmp(&out, &in, sizeof in), 0);
    const MATINFO none = info(nullptr, 8, 0); // no texture: unbound, one reference fewer
    ASSERT_EQ(VRX_SetMaterialInfo(m, &none), 0);
    EXPECT_EQ(std::tuple(m->texture, t->ref_count, m->raster_mode, m->uv_func),
              std::tuple(static_cast<TEXTURE*>(nullptr), 1u, mode_gouraud, uv_none));
}

TEST_F(Materials, TextureReferencesFollowBindingDuplicationAndRelease) {
    TEXTURE* a = make_texture(0); // only the materials hold these two
    TEXTURE* b = make_texture(0);
    TEXTURE* keep = make_texture(1);
    MATERIAL* m = make(info(nullptr, 0, 0x8000));
    ASSERT_EQ(VRX_BindMaterialTexture(m, a), 0);
    EXPECT_EQ(std::tuple(m->raster_mode, m->uv_func), std::tuple(mode_tex_flat, uv_copy));
    void* d = nullptr;
    ASSERT_EQ(VRX_DuplicateMaterial(m, &d), 0);
    ASSERT_EQ(VRX_BindMaterialTexture(m, a), 0); // the same texture: no second reference
    EXPECT_EQ(a->ref_count, 2u);
    // Rebinding drops the old texture's reference but keeps the texture, even at zero.
    ASSERT_EQ(VRX_BindMaterialTexture(m, b), 0);
    ASSERT_EQ(VRX_BindMaterialTexture(d, b), 0);
    EXPECT_EQ(std::pair(a->ref_count, b->ref_count), std::pair(0u, 2u));
    EXPECT_EQ(vrx::engine::chk_texture(a), 0u);
    ASSERT_EQ(VRX_DeleteMaterial(d), 0);
    EXPECT_EQ(b->ref_count, 1u);
    const long before = alloc_outstanding();
    ASSERT_EQ(VRX_DeleteMaterial(m), 0); // the last reference frees the texture
    EXPECT_EQ(std::pair(g_eng.texture_list.head, g_eng.texture_list.tail), std::pair(a, keep));
    EXPECT_EQ(alloc_outstanding(), before - 2); // material and texture records
}

TEST_F(Materials, UsesKeepAMaterialAndReleaseForgetsTheDefaultAndBound) {
    MATERIAL* m = make(info(), "BOX", 2);
    MATERIAL* other = make();
    g_eng.cur_material = other;
    ASSERT_EQ(VRX_SetDefaultMaterial(m), 0);
    EXPECT_EQ(g_eng.cur_material, nullptr); // choosing a default unbinds
    g_eng.cur_material = m;
    ASSERT_EQ(VRX_DeleteMaterial(m), 0); // one use left
    EXPECT_EQ(listed(), (std::vector<MATERIAL*>{m, other}));
    EXPECT_EQ(std::pair(default_material(), g_eng.cur_material), std::pair(m, m));
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{other});
    EXPECT_TRUE(!default_material() && !g_eng.cur_material);
    // A file material no pack uses (count 0) goes with one delete, forgetting only itself.
    g_eng.cur_material = other;
    ASSERT_EQ(VRX_DeleteMaterial(make(info(), "SPARE", 0)), 0);
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{other});
    EXPECT_EQ(g_eng.cur_material, other);
}

TEST_F(Materials, DuplicateCopiesEverythingButNameAndUses) {
    TEXTURE* t = make_texture(0);
    MATERIAL* src = make(info(t, MAT_REFLECT, 0x4000), "Chrome", 3);
    src->color3 = {5, 6, 7, 8};
    src->file_param = 0x1234;
    void* h = nullptr;
    ASSERT_EQ(VRX_DuplicateMaterial(src, &h), 0);
    auto* d = static_cast<MATERIAL*>(h);
    EXPECT_EQ(std::tuple(d->texture, t->ref_count, d->use_count), std::tuple(t, 2u, 1));
    // Colours, multipliers, modes, scrolling and flags, byte for byte.
    const size_t from = offsetof(MATERIAL, ambient), to = offsetof(MATERIAL, flags) + 4;
    EXPECT_EQ(std::memcmp(reinterpret_cast<char*>(d) + from, reinterpret_cast<char*>(src) + from,
                          to - from),
              0);
    EXPECT_EQ(listed(), (std::vector<MATERIAL*>{src, d}));
    EXPECT_NE(d->name, src->name); // a copy of its own
    char buf[16] = "xxxxxxxxxxxxxxx";
    ASSERT_EQ(VRX_GetMaterialName(d, buf), 0);
    EXPECT_STREQ(buf, "Chrome");
    // An unnamed source gives an unnamed copy, whose name reads as empty.
    ASSERT_EQ(VRX_DuplicateMaterial(make(), &h), 0);
    ASSERT_EQ(VRX_GetMaterialName(h, buf), 0);
    EXPECT_STREQ(buf, "");
}

TEST_F(Materials, FindByNameIgnoresCaseAndSkipsUnnamed) {
    make();
    MATERIAL* box = make(info(), "BOX01");
    make(info(), "box01"); // a later match is not returned
    for (auto [query, result, found] :
         {std::tuple{"box01", 0, box}, {"BOX0", 1, nullptr}, {"BOX011", 1, nullptr}}) {
        void* out = &out;
        EXPECT_EQ(VRX_GetMaterialByName(query, &out), result) << query;
        EXPECT_EQ(out, found) << query;
    }
}

TEST_F(Materials, ClearFreesEveryMaterialWithoutTouchingTextures) {
    TEXTURE* t = make_texture(0);
    MATERIAL* a = make(info(), "A", 3);
    make(info(t));
    ASSERT_EQ(VRX_SetDefaultMaterial(a), 0);
    // The textures step runs before the materials step and frees every texture.
    g_eng.texture_list.unlink(t);
    vrx::assets::FreeTexture(t);
    const long before = alloc_outstanding();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_TRUE(!g_eng.material_list.head && !g_eng.material_list.tail);
    EXPECT_EQ(alloc_outstanding(), before - 3); // two records and one name
    EXPECT_EQ(default_material(), nullptr);
}

TEST_F(Materials, MoveTextureStoresOffsetsAndRechoosesTheGenerator) {
    TEXTURE* t = make_texture();
    MATERIAL* r = make(info(t, MAT_REFLECT));
    MATERIAL* p = make(info(t));
    ASSERT_EQ(VRX_MoveMaterialTexture(r, 0x800, 0), 0);
    EXPECT_EQ(uv_state(r), std::tuple(uv_sphere_scroll, 0x800, 0, 0x800, 0));
    ASSERT_EQ(VRX_MoveMaterialTexture(r, 0, 0), 0); // still again: the old offsets stay
    EXPECT_EQ(uv_state(r), std::tuple(uv_sphere, 0, 0, 0x800, 0));
    ASSERT_EQ(VRX_MoveMaterialTexture(p, 0, -kOne), 0);
    EXPECT_EQ(uv_state(p), std::tuple(uv_scroll, 0, -kOne, 0, -kOne));
    ASSERT_EQ(VRX_MoveMaterialTexture(p, 0, 0), 0);
    EXPECT_EQ(uv_state(p), std::tuple(uv_copy, 0, 0, 0, -kOne));
    // Drawn untextured: the offsets are stored but no generator is chosen.
    for (MATERIAL* u : {make(info(t, MAT_UNTEXTURED)), make()}) {
        ASSERT_EQ(VRX_MoveMaterialTexture(u, 5, 6), 0);
        EXPECT_EQ(uv_state(u), std::tuple(uv_none, 5, 6, 0, 0));
    }
}

// Every refusal reports its exact message and leaves lists, references and memory as they were.
TEST_F(Materials, RefusalsReportTheirMessagesAndChangeNothing) {
    TEXTURE* tex = make_texture();
    MATERIAL* m = make(info(tex), "M"); // its name makes Duplicate allocate twice
    void* g = make();                   // stale once deleted
    ASSERT_EQ(VRX_DeleteMaterial(g), 0);
    uint8_t c[4] = {};
    FIXED f = 0;
    void* out = &out;
    char name[32];
    MATINFO mi = info(), bad_tex = info(m); // a material where a texture belongs
    // The call with its Nth allocation failing.
    auto failing = [](long n, std::function<int32_t()> call) {
        return [=] {
            vrx::engine::alloc_fail_at(n, true);
            const int32_t r = call();
            vrx::engine::alloc_fail_at(0, false);
            return r;
        };
    };
    const std::string bad = "The ID is not ID_MATERIAL.\nchk_material return error in ";
    const std::pair<std::string, std::function<int32_t()>> cases[] = {
        {bad + "ENG_DuplicateMat!!\n", [&] { return VRX_DuplicateMaterial(g, &out); }},
        {bad + "ENG_DeleteMat!!\n", [&] { return VRX_DeleteMaterial(g); }},
        {bad + "ENG_DefaultMat!!\n", [&] { return VRX_SetDefaultMaterial(g); }},
        {bad + "ENG_GetMatName!!\n", [&] { return VRX_GetMaterialName(g, name); }},
        {bad + "ENG_SetMatAmbColor!\n", [&] { return VRX_SetMaterialColor(g, c, 0); }},
        {bad + "ENG_GetMatAmbColor!!\n", [&] { return VRX_GetMaterialColor(g, c, 0); }},
        {bad + "ENG_SetMatAmbMultiplier!!\n", [&] { return VRX_SetMaterialColorScale(g, 1, 0); }},
        {bad + "ENG_GetMatAmbMultiplier!!\n", [&] { return VRX_GetMaterialColorScale(g, &f, 0); }},
        {bad + "ENG_SetMatSelfIllum!!\n", [&] { return VRX_SetMaterialSelfIllum(g, 0); }},
        {bad + "ENG_GetMatSelfIllum!!\n", [&] { return VRX_GetMaterialSelfIllum(g, &f); }},
        {bad + "ENG_SetMatSide!!\n", [&] { return VRX_SetMaterialSide(g, 1); }},
        {bad + "ENG_SetMatShading!!\n", [&] { return VRX_SetMaterialShading(g, 1); }},
        {bad + "ENG_GetMatInfo!!\n", [&] { return VRX_GetMaterialInfo(g, &mi); }},
        {bad + "ENG_SetMatInfo!!\n", [&] { return VRX_SetMaterialInfo(g, &mi); }},
        {bad + "ENG_GetMatTextHandle!!\n", [&] { return VRX_GetMaterialTexture(g, &out); }},
        {bad + "ENG_SetMatTextHandle!!\n", [&] { return VRX_BindMaterialTexture(g, tex); }},
        {bad + "ENG_ScrollMatText !!\n", [&] { return VRX_MoveMaterialTexture(g, 0, 0); }},
        {"Wrong Texture Handle.\nchk_texture return error in ENG_SetMatTextHandle!!\n",
         [&] { return VRX_BindMaterialTexture(m, nullptr); }},
        {"The ID is not ID_TEXT.\nWrong texture handle in ENG_SetMatInfo!!\n",
         [&] { return VRX_SetMaterialInfo(m, &bad_tex); }},
        {"The ID is not ID_TEXT.\nWrong texture handle in ENG_CreateMat!!\n",
         [&] { return VRX_CreateMaterial(&bad_tex, &out); }},
        {"Wrong info in ENG_CreateMat!!\n", [&] { return VRX_CreateMaterial(nullptr, &out); }},
        {"Wrong out in ENG_CreateMat!!\n", [&] { return VRX_CreateMaterial(&mi, nullptr); }},
        {"Wrong out in ENG_DuplicateMat!!\n", [&] { return VRX_DuplicateMaterial(m, nullptr); }},
        {"Wrong name in VRX_GetMaterialByName!!\n", [&] { return VRX_GetMaterialByName(0, &out); }},
        {"Wrong buffer in ENG_GetMatName!!\n", [&] { return VRX_GetMaterialName(m, nullptr); }},
        {"Wrong color in ENG_SetMatAmbColor!!\n", [&] { return VRX_SetMaterialColor(m, 0, 0); }},
        {"Wrong info in ENG_GetMatInfo!!\n", [&] { return VRX_GetMaterialInfo(m, nullptr); }},
        {"Wrong info in ENG_SetMatInfo!!\n", [&] { return VRX_SetMaterialInfo(m, nullptr); }},
        {"Allocate memory for MATERIAL in ENG_CreateMat fail !!\n",
         failing(1, [&] { return VRX_CreateMaterial(&mi, &out); })},
        {"Allocate memory for MATERIAL in ENG_DuplicateMat fail!!\n",
         failing(1, [&] { return VRX_DuplicateMaterial(m, &out); })},
        {"Allocate memory for p->name in ENG_DuplicateMat fail !!\n",
         failing(2, [&] { return VRX_DuplicateMaterial(m, &out); })}};
    const long outstanding = alloc_outstanding();
    for (const auto& [message, call] : cases) {
        clear_last_error();
        EXPECT_EQ(call(), -1) << message;
        EXPECT_EQ(last_error(), message);
    }
    EXPECT_EQ(out, &out); // never written
    EXPECT_EQ(alloc_outstanding(), outstanding);
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{m});
    EXPECT_EQ(tex->ref_count, 2u);
    ASSERT_EQ(VRX_GetMaterialInfo(m, &mi), 0);
    const MATINFO as_made = info(tex);
    EXPECT_EQ(std::memcmp(&mi, &as_made, sizeof mi), 0);
}

TEST(MaterialUv, GeneratorsCopyScrollAndSphereMap) {
    using vrx::engine::F_MUL;
    const int32_t h2 = vrx::engine::Sqrt(0x20000) >> 1; // sqrt(2) / 2 as the generator forms it
    // Normal (1, 0, -1) normalises to (k, 0, -k), k = 1/sqrt(2); seen along +z, n.e = -k and
    // r = e - 2 (n.e) n = (2k^2, 0, 1 - 2k^2), then z + 1: oblique, both about 1.0.
    const int32_t k = vrx::engine::InvSqrt(0x20000);
    const int32_t rx = -F_MUL(-2 * k, k), rz = kOne - F_MUL(-2 * k, -k) + kOne;
    const int32_t q = static_cast<int32_t>((int64_t{rx} * rx + int64_t{rz} * rz) >> 16);
    const int32_t h = F_MUL(vrx::engine::Sqrt(q), 0x8000);
    // X turned onto Y: (x, y, z) -> (-y, x, z); the origin must not be added.
    const UCS turned{{0x50000, 0x50000, 0x50000}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}};
    const VECTOR back{0, 0, -kOne}, side{kOne, 0, -kOne}, x{kOne, 0, 0}, o{0, 0, 0};
    const struct {
        UvFunc f;
        VECTOR pos, normal;
        const UCS* global;
        const VECTOR* eye;
        int32_t u, v;
    } cases[] = {{uv_copy, o, o, nullptr, nullptr, 0x7FFFFFFF, 0x5678},
                 {uv_scroll, o, o, nullptr, nullptr, INT32_MIN + 0xFF, 0x5478}, // u wraps
                 {uv_none, o, o, nullptr, nullptr, 0, 0},                       // left alone
                 // Looking straight at a facing normal: r = (0, 0, -1), tilted to 0: the centre.
                 {uv_sphere, o, back, nullptr, &back, 0x8000, 0x8000},
                 // Direction +x, normal -z: r = (1, 0, 1), |r|^2 = 2; then scrolled.
                 {uv_sphere, x, back, nullptr, nullptr, 0x8000 + h2, 0x8000},
                 {uv_sphere_scroll, x, back, nullptr, nullptr, 0x8100 + h2, 0x8000 - 0x200},
                 // The same vertex turned onto +y: v moves instead, downwards.
                 {uv_sphere, x, back, &turned, nullptr, 0x8000, 0x8000 - h2},
                 // The eye is subtracted: e = (1, 0, 0) - (1, 0, -1) = (0, 0, 1): the centre.
                 {uv_sphere, x, back, nullptr, &side, 0x8000, 0x8000},
                 {uv_sphere, o, side, nullptr, &back, F_MUL(h, rx) + 0x8000, 0x8000}};
    MATERIAL m{};
    m.uv_offset_u = 0x100;
    m.uv_offset_v = -0x200;
    for (size_t i = 0; i < std::size(cases); ++i) {
        const auto& c = cases[i];
        SCOPED_TRACE(i);
        m.uv_func = c.f;
        SVERTEX out{};
        generate_uv(m, c.pos, c.normal, 0x7FFFFFFF, 0x5678, {c.global, c.eye}, out);
        EXPECT_EQ(std::pair(out.u, out.v), std::pair(c.u, c.v));
    }
}

} // namespace
