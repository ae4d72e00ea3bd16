// Materials: colours, setters, use counts, texture references, generators and refusals.
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
    // 'MTRL', self-illum clamped to 1.0, flags whole; untextured and self-illuminated: flat.
    EXPECT_EQ(std::tuple(m->id, m->use_count, m->self_illum, m->flags, m->raster_mode, m->uv_func),
              std::tuple(0x4D54524Cu, 1, kOne, 0x13u, mode_flat, uv_none));
    // 255 is exactly 1.0, any other byte b / 256; then 0.5 x ambient and 2.0 x diffuse.
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x8000, 0x4000, 0, 0x8000));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x1400, 0x2800, 0x3C00, kOne));
    const uint8_t amb[4] = {1, 254, 127, 0}, dif[4] = {255, 1, 128, 254};
    ASSERT_EQ(VRX_SetMaterialColor(m, amb, 0) | VRX_SetMaterialColor(m, dif, 7), 0); // 7: diffuse
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x80, 0x7F00, 0x3F80, 0));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x20000, 0x200, kOne, 0x1FC00));
    uint8_t out[8] = {};
    ASSERT_EQ(VRX_GetMaterialColor(m, out, 0) | VRX_GetMaterialColor(m, out + 4, 1), 0);
    EXPECT_EQ(std::vector<int>(out, out + 8), (std::vector<int>{1, 254, 127, 0, 255, 1, 128, 254}));
    // Each multiplier rescales its own pair: 0.25 x ambient, 1.5 x diffuse.
    ASSERT_EQ(VRX_SetMaterialColorScale(m, 0x4000, 0) | VRX_SetMaterialColorScale(m, 0x18000, 3),
              0);
    EXPECT_EQ(rgba(m->ambient_scaled), std::tuple(0x40, 0x3F80, 0x1FC0, 0));
    EXPECT_EQ(rgba(m->diffuse_scaled), std::tuple(0x18000, 0x180, 0xC000, 0x17D00));
}

TEST_F(Materials, SetterRangesRechoosingAndInfoRoundTrip) {
    // Textured, shading 1, a loader bit: exactly 1.0 draws unlit, anything less Gouraud.
    TEXTURE* t = make_texture();
    MATERIAL* m = make(info(t, 0x208, 0));
    const std::tuple<int32_t, int32_t, RasterMode> illums[] = {
        {0x18000, kOne, mode_tex},
        {INT32_MIN, 0, mode_tex_gouraud},
        {kOne, kOne, mode_tex},
        {kOne - 1, kOne - 1, mode_tex_gouraud}};
    for (auto [in, stored, mode] : illums) {
        ASSERT_EQ(VRX_SetMaterialSelfIllum(m, in), 0);
        EXPECT_EQ(std::pair(m->self_illum, m->raster_mode), std::pair(stored, mode)) << in;
    }
    // Shading 0..3 replaces bits 0x38 only; other values keep the code but still rechoose.
    const std::tuple<int32_t, uint32_t, RasterMode> shadings[] = {
        {1, 0x208u, mode_tex_gouraud}, {2, 0x210u, mode_tex_add}, {-1, 0x210u, mode_tex_add},
        {4, 0x210u, mode_tex_add},     {3, 0x218u, mode_tex_add}, {0, 0x200u, mode_tex_flat}};
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
    m->color3 = {1, 2, 3, 4};
    MATINFO in = info(t, 0x209, 0x4000), out{}; // the same texture: no second reference
    ASSERT_EQ(VRX_SetMaterialInfo(m, &in), 0);
    ASSERT_EQ(VRX_GetMaterialInfo(m, &out), 0);
    EXPECT_EQ(std::memcmp(&out, &in, sizeof in), 0);
    EXPECT_EQ(std::tuple(t->ref_count, rgba(m->color3), m->raster_mode),
              std::tuple(2u, std::tuple(1, 2, 3, 4), mode_tex_gouraud)); // color3 not in the info
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
    ASSERT_EQ(VRX_BindMaterialTexture(m, b) | VRX_BindMaterialTexture(d, b), 0);
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
    EXPECT_EQ(std::pair(listed(), g_eng.cur_material), std::pair(std::vector{other}, other));
}

TEST_F(Materials, DuplicateCopiesAllButNameAndUsesAndClearFreesAll) {
    TEXTURE* t = make_texture(0);
    MATERIAL* src = make(info(t, MAT_REFLECT, 0x4000), "Chrome", 3);
    src->color3 = {5, 6, 7, 8};
    src->file_param = 0x1234;
    void* h = nullptr;
    ASSERT_EQ(VRX_DuplicateMaterial(src, &h), 0);
    auto* d = static_cast<MATERIAL*>(h);
    EXPECT_EQ(std::tuple(d->texture, t->ref_count, d->use_count), std::tuple(t, 2u, 1));
    // Colours, multipliers, modes, scrolling and flags, byte for byte.
    const size_t from = offsetof(MATERIAL, ambient), n = offsetof(MATERIAL, flags) + 4 - from;
    auto bytes = [&](MATERIAL* p) { return std::string(reinterpret_cast<char*>(p) + from, n); };
    EXPECT_EQ(bytes(d), bytes(src));
    EXPECT_EQ(listed(), (std::vector<MATERIAL*>{src, d}));
    EXPECT_NE(d->name, src->name); // a copy of its own
    char buf[16] = "xxxxxxxxxxxxxxx";
    ASSERT_EQ(VRX_GetMaterialName(d, buf), 0);
    EXPECT_STREQ(buf, "Chrome");
    void* found = nullptr; // the first of the two in list order, in any case; none: 1
    EXPECT_EQ(VRX_GetMaterialByName("CHROME", &found), 0);
    EXPECT_EQ(found, src);
    EXPECT_EQ(VRX_GetMaterialByName("Gold", &found), 1);
    EXPECT_EQ(found, nullptr);
    // An unnamed source gives an unnamed copy, whose name reads as empty.
    ASSERT_EQ(VRX_DuplicateMaterial(make(), &h), 0);
    ASSERT_EQ(VRX_GetMaterialName(h, buf), 0);
    EXPECT_STREQ(buf, "");
    // The clear-all frees every material and name but no texture: that step, run first, has.
    ASSERT_EQ(VRX_SetDefaultMaterial(src), 0);
    g_eng.texture_list.unlink(t);
    vrx::assets::FreeTexture(t);
    const long before = alloc_outstanding();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_TRUE(!g_eng.material_list.head && !g_eng.material_list.tail && !default_material());
    EXPECT_EQ(alloc_outstanding(), before - 6); // four records and two names
}

// One row per distinct message; each leaves lists, references and memory as they were.
TEST_F(Materials, RefusalsReportTheirMessagesAndChangeNothing) {
    TEXTURE* tex = make_texture();
    MATERIAL* m = make(info(tex), "M"); // its name makes Duplicate allocate twice
    void* g = make();                   // stale once deleted
    ASSERT_EQ(VRX_DeleteMaterial(g), 0);
    uint8_t c[4] = {};
    void* out = &out;
    MATINFO mi = info(), bad_tex = info(m); // a material where a texture belongs
    const std::string bad = "The ID is not ID_MATERIAL.\nchk_material return error in ";
    // With a non-zero first column that allocation, counted from the call, fails.
    const std::tuple<long, std::string, std::function<int32_t()>> cases[] = {
        {0, bad + "ENG_DeleteMat!!\n", [&] { return VRX_DeleteMaterial(g); }},
        {0, bad + "ENG_SetMatAmbColor!\n", [&] { return VRX_SetMaterialColor(g, c, 0); }},
        {0, bad + "ENG_ScrollMatText !!\n", [&] { return VRX_MoveMaterialTexture(g, 0, 0); }},
        {0, "Wrong Texture Handle.\nchk_texture return error in ENG_SetMatTextHandle!!\n",
         [&] { return VRX_BindMaterialTexture(m, nullptr); }},
        {0, "The ID is not ID_TEXT.\nWrong texture handle in ENG_SetMatInfo!!\n",
         [&] { return VRX_SetMaterialInfo(m, &bad_tex); }},
        {0, "The ID is not ID_TEXT.\nWrong texture handle in ENG_CreateMat!!\n",
         [&] { return VRX_CreateMaterial(&bad_tex, &out); }},
        {0, "Wrong info in ENG_CreateMat!!\n", [&] { return VRX_CreateMaterial(nullptr, &out); }},
        {0, "Wrong out in ENG_DuplicateMat!!\n", [&] { return VRX_DuplicateMaterial(m, nullptr); }},
        {1, "Allocate memory for MATERIAL in ENG_CreateMat fail !!\n",
         [&] { return VRX_CreateMaterial(&mi, &out); }},
        {1, "Allocate memory for MATERIAL in ENG_DuplicateMat fail!!\n",
         [&] { return VRX_DuplicateMaterial(m, &out); }},
        {2, "Allocate memory for p->name in ENG_DuplicateMat fail !!\n",
         [&] { return VRX_DuplicateMaterial(m, &out); }}};
    const long outstanding = alloc_outstanding();
    for (const auto& [fail_at, message, call] : cases) {
        clear_last_error();
        vrx::engine::alloc_fail_at(fail_at, true);
        EXPECT_EQ(call(), -1) << message;
        vrx::engine::alloc_fail_at(0, false);
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
    // Normal (1, 0, -1) -> (k, 0, -k), k = 1/sqrt(2); eye along +z: r = (2k^2, 0, 2 - 2k^2).
    const int32_t k = vrx::engine::InvSqrt(0x20000);
    const int32_t rx = -F_MUL(-2 * k, k), rz = kOne - F_MUL(-2 * k, -k) + kOne;
    const int32_t q = static_cast<int32_t>((int64_t{rx} * rx + int64_t{rz} * rz) >> 16);
    const int32_t h = F_MUL(vrx::engine::Sqrt(q), 0x8000);
    // X turned onto Y: (x, y, z) -> (-y, x, z); the origin must not be added.
    const UCS turned{{0x50000, 0x50000, 0x50000}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}};
    const VECTOR back{0, 0, -kOne}, side{kOne, 0, -kOne}, x{kOne, 0, 0}, o{0, 0, 0};
    const std::tuple<UvFunc, VECTOR, VECTOR, const UCS*, const VECTOR*, int32_t, int32_t> cases[] =
        {{uv_copy, o, o, nullptr, nullptr, 0x7FFFFFFF, 0x5678},
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
    int row = 0;
    for (const auto& [f, pos, normal, global, eye, u, v] : cases) {
        m.uv_func = f;
        SVERTEX out{};
        generate_uv(m, pos, normal, 0x7FFFFFFF, 0x5678, {global, eye}, out);
        EXPECT_EQ(std::pair(out.u, out.v), std::pair(u, v)) << "row " << row++;
    }
}

} // namespace
