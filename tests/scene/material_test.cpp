// Materials: creation and colour conversions, setters and getters, use counts and texture
// references, names, the default material, scrolling and the generators, handle checks
// with their exact messages, allocation failures and the clear-all.
#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "assets/texture.h"
#include "engine/alloc.h"
#include "engine/fixed.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "scene/material.h"
#include "support/engine_fixture.h"

using vrx::assets::TEXTURE;
using vrx::engine::g_eng;
using vrx::render::RasterMode;
using vrx::scene::MATERIAL;
using vrx::test::EngineTest;

namespace {

constexpr int32_t kOne = 0x10000;

class Materials : public EngineTest {
  protected:
    void TearDown() override {
        // Textures the test made and nothing freed yet.
        for (TEXTURE* t : textures) {
            if (vrx::engine::registry_tag(t) != vrx::engine::TAG_TEXTURE) continue;
            g_eng.texture_list.unlink(t);
            vrx::assets::FreeTexture(t);
        }
        EngineTest::TearDown();
    }

    // A listed texture of the given texel format, holding `refs` references already.
    TEXTURE* make_texture(uint32_t refs = 1, int32_t alpha_kind = 0) {
        TEXTURE* t = vrx::engine::new_record<TEXTURE>();
        EXPECT_NE(t, nullptr);
        t->width = t->height = 1;
        t->ref_count = refs;
        t->alpha_kind = alpha_kind;
        g_eng.texture_list.append(t);
        textures.push_back(t);
        return t;
    }

    static MATINFO info(void* tex = nullptr, uint32_t flags = 0, int32_t self_illum = 0) {
        MATINFO i{};
        i.texture = tex;
        const uint8_t amb[4] = {255, 128, 0, 255};
        const uint8_t dif[4] = {10, 20, 30, 128};
        std::memcpy(i.ambient, amb, 4);
        std::memcpy(i.diffuse, dif, 4);
        i.ambient_scale = 0x8000;
        i.diffuse_scale = 0x20000;
        i.self_illum = self_illum;
        i.flags = flags;
        return i;
    }

    MATERIAL* make(const MATINFO& i) {
        void* h = nullptr;
        EXPECT_EQ(VRX_CreateMaterial(&i, &h), 0);
        return static_cast<MATERIAL*>(h);
    }
    MATERIAL* make() { return make(info()); }

    // A material as the model loader leaves it: named, listed, with `uses` packs.
    MATERIAL* make_named(const char* name, int32_t uses = 1) {
        MATERIAL* m = make();
        const size_t n = std::strlen(name) + 1;
        m->name = static_cast<char*>(vrx::engine::eng_malloc(n));
        std::memcpy(m->name, name, n);
        m->use_count = uses;
        return m;
    }

    static std::vector<MATERIAL*> listed() {
        std::vector<MATERIAL*> v;
        for (MATERIAL* m = g_eng.material_list.head; m; m = m->next) v.push_back(m);
        return v;
    }
    static bool texture_listed(const TEXTURE* t) {
        for (TEXTURE* x = g_eng.texture_list.head; x; x = x->next)
            if (x == t) return true;
        return false;
    }

    std::vector<TEXTURE*> textures;
};

void expect_color(const vrx::scene::RGBA_FIXED& c, int32_t r, int32_t g, int32_t b, int32_t a) {
    EXPECT_EQ(c.r, r);
    EXPECT_EQ(c.g, g);
    EXPECT_EQ(c.b, b);
    EXPECT_EQ(c.a, a);
}

TEST_F(Materials, CreateFillsEveryField) {
    MATERIAL* m = make(info(nullptr, 0x12 | vrx::scene::MAT_TWO_SIDED, 0x18000));
    ASSERT_NE(m, nullptr);
    EXPECT_EQ(m->id, 0x4D54524Cu);
    EXPECT_EQ(m->name, nullptr);
    EXPECT_EQ(m->texture, nullptr);
    EXPECT_EQ(m->use_count, 1);
    expect_color(m->ambient, 0x10000, 0x8000, 0, 0x10000);
    expect_color(m->diffuse, 0xA00, 0x1400, 0x1E00, 0x8000);
    expect_color(m->color3, 0, 0, 0, 0);
    // 0.5 x ambient, 2.0 x diffuse.
    expect_color(m->ambient_scaled, 0x8000, 0x4000, 0, 0x8000);
    expect_color(m->diffuse_scaled, 0x1400, 0x2800, 0x3C00, 0x10000);
    expect_color(m->color3_scaled, 0, 0, 0, 0);
    EXPECT_EQ(m->ambient_scale, 0x8000);
    EXPECT_EQ(m->diffuse_scale, 0x20000);
    EXPECT_EQ(m->color3_scale, 0);
    EXPECT_EQ(m->self_illum, kOne); // clamped
    EXPECT_EQ(m->flags, 0x13u);
    EXPECT_EQ(m->scroll_u, 0);
    EXPECT_EQ(m->scroll_v, 0);
    // Untextured, shading code 0x10, self-illuminated: flat.
    EXPECT_EQ(m->raster_mode, vrx::render::mode_flat);
    EXPECT_EQ(m->uv_func, vrx::scene::uv_none);
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{m});
    EXPECT_EQ(last_error(), "");
}

TEST_F(Materials, CreateChoosesModeFromTextureAndFlags) {
    struct Case {
        bool textured;
        uint32_t flags;
        int32_t self_illum;
        RasterMode mode;
        vrx::scene::UvFunc uv;
    };
    const Case cases[] = {
        {true, 0, kOne, vrx::render::mode_tex, vrx::scene::uv_copy},
        {true, 24, kOne, vrx::render::mode_tex_add, vrx::scene::uv_copy},
        {true, vrx::scene::MAT_REFLECT | 16, 0, vrx::render::mode_tex, vrx::scene::uv_sphere},
        {true, vrx::scene::MAT_UNTEXTURED | 8, 0x8000, vrx::render::mode_gouraud,
         vrx::scene::uv_none},
        {false, 8, 0x8000, vrx::render::mode_gouraud, vrx::scene::uv_none},
    };
    TEXTURE* t = make_texture();
    for (const Case& c : cases) {
        MATERIAL* m = make(info(c.textured ? t : nullptr, c.flags, c.self_illum));
        EXPECT_EQ(m->raster_mode, c.mode);
        EXPECT_EQ(m->uv_func, c.uv);
    }
}

TEST_F(Materials, ColorBytesConvertBothWays) {
    struct Case {
        uint8_t in[4];
        int32_t fixed[4];
    };
    const Case cases[] = {
        {{255, 128, 0, 255}, {0x10000, 0x8000, 0, 0x10000}},
        {{1, 254, 127, 0}, {0x100, 0xFE00, 0x7F00, 0}},
    };
    MATERIAL* m = make();
    for (int which : {0, 1, 7}) {
        for (const Case& c : cases) {
            ASSERT_EQ(VRX_SetMaterialColor(m, c.in, which), 0);
            const auto& col = which == 0 ? m->ambient : m->diffuse;
            expect_color(col, c.fixed[0], c.fixed[1], c.fixed[2], c.fixed[3]);
            const auto& scaled = which == 0 ? m->ambient_scaled : m->diffuse_scaled;
            const int32_t s = which == 0 ? 0x8000 : 0x20000;
            expect_color(scaled, vrx::engine::F_MUL(c.fixed[0], s),
                         vrx::engine::F_MUL(c.fixed[1], s), vrx::engine::F_MUL(c.fixed[2], s),
                         vrx::engine::F_MUL(c.fixed[3], s));
            uint8_t out[4] = {9, 9, 9, 9};
            ASSERT_EQ(VRX_GetMaterialColor(m, out, which), 0);
            EXPECT_EQ(std::memcmp(out, c.in, 4), 0);
        }
    }
    // Setting the diffuse colour leaves the ambient one alone.
    expect_color(m->ambient, 0x100, 0xFE00, 0x7F00, 0);
}

TEST(MaterialConvert, FixedToByteAndBack) {
    struct Case {
        int32_t v;
        uint8_t b;
    };
    const Case cases[] = {{0x10000, 255}, {0x20000, 255},   {0xFFFF, 255}, {0xFF00, 255},
                          {0xFEFF, 254},  {0x8000, 128},    {0xFF, 0},     {0x1FF, 1},
                          {0, 0},         {0x7FFFFFFF, 255}};
    for (const Case& c : cases) EXPECT_EQ(vrx::scene::fixed_to_byte(c.v), c.b) << c.v;
    EXPECT_EQ(vrx::scene::byte_to_fixed(255), 0x10000);
    EXPECT_EQ(vrx::scene::byte_to_fixed(254), 0xFE00);
    EXPECT_EQ(vrx::scene::byte_to_fixed(0), 0);
}

TEST_F(Materials, ColorScalesSetTheirPair) {
    MATERIAL* m = make();
    ASSERT_EQ(VRX_SetMaterialColorScale(m, 0x4000, 0), 0);
    EXPECT_EQ(m->ambient_scale, 0x4000);
    expect_color(m->ambient_scaled, 0x4000, 0x2000, 0, 0x4000);
    EXPECT_EQ(m->diffuse_scale, 0x20000);
    ASSERT_EQ(VRX_SetMaterialColorScale(m, 0x18000, 3), 0); // any non-zero: diffuse
    EXPECT_EQ(m->diffuse_scale, 0x18000);
    expect_color(m->diffuse_scaled, 0xF00, 0x1E00, 0x2D00, 0xC000);
    EXPECT_EQ(m->ambient_scale, 0x4000);
    FIXED a = 0, d = 0;
    ASSERT_EQ(VRX_GetMaterialColorScale(m, &a, 0), 0);
    ASSERT_EQ(VRX_GetMaterialColorScale(m, &d, 1), 0);
    EXPECT_EQ(a, 0x4000);
    EXPECT_EQ(d, 0x18000);
}

TEST_F(Materials, SelfIllumIsClampedAndRechoosesTheMode) {
    struct Case {
        int32_t in, stored;
        RasterMode mode; // textured, shading 1
    };
    const Case cases[] = {
        {0x18000, 0x10000, vrx::render::mode_tex},       {-5, 0, vrx::render::mode_tex_gouraud},
        {0x8000, 0x8000, vrx::render::mode_tex_gouraud}, {0x10000, 0x10000, vrx::render::mode_tex},
        {INT32_MIN, 0, vrx::render::mode_tex_gouraud},
    };
    MATERIAL* m = make(info(make_texture(), 8, 0));
    for (const Case& c : cases) {
        ASSERT_EQ(VRX_SetMaterialSelfIllum(m, c.in), 0);
        EXPECT_EQ(m->self_illum, c.stored);
        EXPECT_EQ(m->raster_mode, c.mode);
        FIXED out = -1;
        ASSERT_EQ(VRX_GetMaterialSelfIllum(m, &out), 0);
        EXPECT_EQ(out, c.stored);
    }
}

TEST_F(Materials, ShadingModesAndOutOfRangeModes) {
    struct Case {
        int32_t mode;
        uint32_t flags_after;
        RasterMode raster; // textured, self-illum 0.5
    };
    const Case cases[] = {
        {1, 0x09, vrx::render::mode_tex_gouraud}, {7, 0x09, vrx::render::mode_tex_gouraud},
        {2, 0x11, vrx::render::mode_tex_add},     {-1, 0x11, vrx::render::mode_tex_add},
        {3, 0x19, vrx::render::mode_tex_add},     {0, 0x01, vrx::render::mode_tex_flat},
        {4, 0x01, vrx::render::mode_tex_flat},
    };
    MATERIAL* m = make(info(make_texture(), vrx::scene::MAT_TWO_SIDED, 0x8000));
    for (const Case& c : cases) {
        EXPECT_EQ(VRX_SetMaterialShading(m, c.mode), 0);
        EXPECT_EQ(m->flags, c.flags_after) << c.mode;
        EXPECT_EQ(m->raster_mode, c.raster) << c.mode;
    }
    // A kept mode is still chosen again: a self-illum changed behind the setters shows.
    m->self_illum = kOne;
    EXPECT_EQ(VRX_SetMaterialShading(m, 9), 0);
    EXPECT_EQ(m->raster_mode, vrx::render::mode_tex);
    EXPECT_EQ(last_error(), "");
}

TEST_F(Materials, SideSetsOnlyTheTwoSidedBit) {
    MATERIAL* m = make(info(nullptr, 0x30, 0));
    const struct {
        int32_t v;
        uint32_t flags;
    } cases[] = {{5, 0x31}, {1, 0x31}, {0, 0x30}, {-1, 0x31}, {0, 0x30}};
    for (const auto& c : cases) {
        ASSERT_EQ(VRX_SetMaterialSide(m, c.v), 0);
        EXPECT_EQ(m->flags, c.flags);
    }
}

TEST_F(Materials, InfoRoundTripsAndSetLeavesColor3) {
    TEXTURE* t = make_texture();
    MATERIAL* m = make();
    m->color3 = {1, 2, 3, 4};
    MATINFO in = info(t, 0x209, 0x4000); // two-sided, shading 1, a loader bit
    in.ambient[3] = 64;
    ASSERT_EQ(VRX_SetMaterialInfo(m, &in), 0);
    expect_color(m->color3, 1, 2, 3, 4);
    EXPECT_EQ(m->flags, 0x209u); // the whole word
    EXPECT_EQ(m->texture, t);
    EXPECT_EQ(t->ref_count, 2u);
    EXPECT_EQ(m->raster_mode, vrx::render::mode_tex_gouraud);
    expect_color(m->ambient_scaled, 0x8000, 0x4000, 0, 0x2000);

    MATINFO out{};
    ASSERT_EQ(VRX_GetMaterialInfo(m, &out), 0);
    EXPECT_EQ(out.texture, t);
    EXPECT_EQ(std::memcmp(out.ambient, in.ambient, 4), 0);
    EXPECT_EQ(std::memcmp(out.diffuse, in.diffuse, 4), 0);
    EXPECT_EQ(out.ambient_scale, in.ambient_scale);
    EXPECT_EQ(out.diffuse_scale, in.diffuse_scale);
    EXPECT_EQ(out.self_illum, 0x4000);
    EXPECT_EQ(out.flags, 0x209u);

    // The same texture again adds no reference; none unbinds and drops one.
    ASSERT_EQ(VRX_SetMaterialInfo(m, &in), 0);
    EXPECT_EQ(t->ref_count, 2u);
    MATINFO none = info(nullptr, 8, 0);
    ASSERT_EQ(VRX_SetMaterialInfo(m, &none), 0);
    EXPECT_EQ(m->texture, nullptr);
    EXPECT_EQ(t->ref_count, 1u);
    EXPECT_EQ(m->raster_mode, vrx::render::mode_gouraud);
    EXPECT_EQ(m->uv_func, vrx::scene::uv_none);
}

TEST_F(Materials, SetInfoWithBadTextureChangesNothing) {
    TEXTURE* t = make_texture();
    MATERIAL* m = make(info(t, 8, 0x8000));
    MATERIAL* other = make();
    MATINFO before{};
    ASSERT_EQ(VRX_GetMaterialInfo(m, &before), 0);
    const RasterMode mode = m->raster_mode;
    MATINFO bad = info(other, 0, kOne); // a material where a texture belongs
    bad.ambient[0] = 1;
    EXPECT_EQ(VRX_SetMaterialInfo(m, &bad), -1);
    EXPECT_EQ(last_error(), "The ID is not ID_TEXT.\nWrong texture handle in ENG_SetMatInfo!!\n");
    MATINFO after{};
    ASSERT_EQ(VRX_GetMaterialInfo(m, &after), 0);
    EXPECT_EQ(after.texture, t);
    EXPECT_EQ(std::memcmp(after.ambient, before.ambient, 4), 0);
    EXPECT_EQ(after.self_illum, 0x8000);
    EXPECT_EQ(after.flags, 8u);
    EXPECT_EQ(m->raster_mode, mode);
    EXPECT_EQ(t->ref_count, 2u);
}

TEST_F(Materials, CreateWithBadTexture) {
    MATERIAL* other = make();
    MATINFO bad = info(other);
    void* h = reinterpret_cast<void*>(1);
    EXPECT_EQ(VRX_CreateMaterial(&bad, &h), -1);
    EXPECT_EQ(h, reinterpret_cast<void*>(1));
    EXPECT_EQ(last_error(), "The ID is not ID_TEXT.\nWrong texture handle in ENG_CreateMat!!\n");
    EXPECT_EQ(listed().size(), 1u);
}

TEST_F(Materials, TextureReferencesFollowMaterials) {
    TEXTURE* t = make_texture(1); // the host's reference
    MATERIAL* a = make(info(t));
    EXPECT_EQ(t->ref_count, 2u);
    void* b = nullptr;
    ASSERT_EQ(VRX_DuplicateMaterial(a, &b), 0);
    EXPECT_EQ(t->ref_count, 3u);
    ASSERT_EQ(VRX_DeleteMaterial(b), 0);
    EXPECT_EQ(t->ref_count, 2u);
    ASSERT_EQ(VRX_DeleteMaterial(a), 0);
    EXPECT_EQ(t->ref_count, 1u);
    EXPECT_TRUE(texture_listed(t)); // the host still holds it
    EXPECT_EQ(vrx::engine::chk_texture(t), 0u);
}

TEST_F(Materials, LastMaterialReferenceFreesTheTexture) {
    TEXTURE* t = make_texture(0); // only the material will hold it
    TEXTURE* keep = make_texture(1);
    MATERIAL* m = make(info(t));
    EXPECT_EQ(t->ref_count, 1u);
    const long before = vrx::engine::alloc_outstanding();
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_FALSE(texture_listed(t));
    EXPECT_EQ(vrx::engine::registry_tag(t), 0u);
    EXPECT_EQ(g_eng.texture_list.head, keep);
    EXPECT_EQ(g_eng.texture_list.tail, keep);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before - 2); // material and texture records
}

TEST_F(Materials, BindingKeepsTheReplacedTextureEvenAtZero) {
    TEXTURE* a = make_texture(0);
    TEXTURE* b = make_texture(0);
    MATERIAL* m = make(info(nullptr, 0, 0x8000));
    EXPECT_EQ(m->raster_mode, vrx::render::mode_flat);
    ASSERT_EQ(VRX_BindMaterialTexture(m, a), 0);
    EXPECT_EQ(a->ref_count, 1u);
    EXPECT_EQ(m->raster_mode, vrx::render::mode_tex_flat);
    EXPECT_EQ(m->uv_func, vrx::scene::uv_copy);
    ASSERT_EQ(VRX_BindMaterialTexture(m, a), 0); // same texture: no change
    EXPECT_EQ(a->ref_count, 1u);
    ASSERT_EQ(VRX_BindMaterialTexture(m, b), 0);
    EXPECT_EQ(a->ref_count, 0u);
    EXPECT_EQ(b->ref_count, 1u);
    EXPECT_TRUE(texture_listed(a));
    EXPECT_EQ(vrx::engine::chk_texture(a), 0u);
    void* got = nullptr;
    ASSERT_EQ(VRX_GetMaterialTexture(m, &got), 0);
    EXPECT_EQ(got, b);
}

TEST_F(Materials, BindRefusesAMissingTexture) {
    TEXTURE* t = make_texture();
    MATERIAL* m = make(info(t));
    EXPECT_EQ(VRX_BindMaterialTexture(m, nullptr), -1);
    EXPECT_EQ(last_error(),
              "Wrong Texture Handle.\nchk_texture return error in ENG_SetMatTextHandle!!\n");
    EXPECT_EQ(m->texture, t);
    EXPECT_EQ(t->ref_count, 2u);
}

TEST_F(Materials, UseCountKeepsAMaterialAlive) {
    MATERIAL* m = make_named("BOX", 2);
    MATERIAL* other = make();
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_EQ(m->use_count, 1);
    EXPECT_EQ(listed(), (std::vector<MATERIAL*>{m, other}));
    EXPECT_EQ(vrx::engine::chk_material(m), 0u);
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_EQ(listed(), std::vector<MATERIAL*>{other});
    clear_last_error();
    EXPECT_EQ(VRX_DeleteMaterial(m), -1); // stale handle
    EXPECT_EQ(last_error(),
              "The ID is not ID_MATERIAL.\nchk_material return error in ENG_DeleteMat!!\n");
}

TEST_F(Materials, UnusedFileMaterialIsReleasedByOneDelete) {
    MATERIAL* m = make_named("SPARE", 0);
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_TRUE(listed().empty());
}

TEST_F(Materials, DuplicateCopiesEverythingButNameAndUses) {
    TEXTURE* t = make_texture();
    MATERIAL* src = make_named("Chrome", 3);
    src->texture = t; // as the loader binds it
    ++t->ref_count;
    src->color3 = {5, 6, 7, 8};
    src->file_param = 0x1234;
    ASSERT_EQ(VRX_MoveMaterialTexture(src, 0x100, 0x200), 0);
    void* h = nullptr;
    ASSERT_EQ(VRX_DuplicateMaterial(src, &h), 0);
    auto* d = static_cast<MATERIAL*>(h);
    ASSERT_NE(d, src);
    EXPECT_NE(d->name, src->name);
    EXPECT_STREQ(d->name, "Chrome");
    EXPECT_EQ(d->use_count, 1);
    EXPECT_EQ(d->texture, t);
    EXPECT_EQ(t->ref_count, 3u);
    expect_color(d->color3, 5, 6, 7, 8);
    EXPECT_EQ(d->file_param, 0x1234);
    EXPECT_EQ(d->uv_func, vrx::scene::uv_scroll);
    EXPECT_EQ(d->uv_offset_u, 0x100);
    EXPECT_EQ(d->raster_mode, src->raster_mode);
    EXPECT_EQ(d->flags, src->flags);
    EXPECT_EQ(listed(), (std::vector<MATERIAL*>{src, d}));
    // An unnamed source gives an unnamed copy.
    MATERIAL* plain = make();
    ASSERT_EQ(VRX_DuplicateMaterial(plain, &h), 0);
    EXPECT_EQ(static_cast<MATERIAL*>(h)->name, nullptr);
}

TEST_F(Materials, FindByNameIgnoresCaseAndSkipsUnnamed) {
    make();
    MATERIAL* box = make_named("BOX01");
    make_named("box01"); // a later match is not returned
    MATERIAL* wood = make_named("WOOD");
    struct Case {
        const char* query;
        int32_t result;
        MATERIAL* found;
    };
    const Case cases[] = {{"box01", 0, box},    {"BOX01", 0, box}, {"Wood", 0, wood},
                          {"BOX0", 1, nullptr}, {"", 1, nullptr},  {"BOX011", 1, nullptr}};
    for (const Case& c : cases) {
        void* out = reinterpret_cast<void*>(1);
        EXPECT_EQ(VRX_GetMaterialByName(c.query, &out), c.result) << c.query;
        EXPECT_EQ(out, c.found) << c.query;
    }
    EXPECT_EQ(last_error(), "");
}

TEST_F(Materials, NameOfNamedAndUnnamed) {
    char buf[32];
    std::memset(buf, 'x', sizeof buf);
    ASSERT_EQ(VRX_GetMaterialName(make_named("METAL_PLATE"), buf), 0);
    EXPECT_STREQ(buf, "METAL_PLATE");
    std::memset(buf, 'x', sizeof buf);
    ASSERT_EQ(VRX_GetMaterialName(make(), buf), 0);
    EXPECT_STREQ(buf, "");
}

TEST_F(Materials, DefaultMaterialIsRecordedAndForgotten) {
    MATERIAL* m = make();
    g_eng.cur_material = m;
    ASSERT_EQ(VRX_SetDefaultMaterial(m), 0);
    EXPECT_EQ(vrx::scene::default_material(), m);
    EXPECT_EQ(g_eng.cur_material, nullptr);
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_EQ(vrx::scene::default_material(), nullptr);
    // The clear-all forgets it too.
    MATERIAL* n = make_named("N", 4);
    ASSERT_EQ(VRX_SetDefaultMaterial(n), 0);
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(vrx::scene::default_material(), nullptr);
}

TEST_F(Materials, ReleasingTheBoundMaterialClearsCurMaterial) {
    MATERIAL* m = make();
    MATERIAL* other = make();
    g_eng.cur_material = other;
    ASSERT_EQ(VRX_DeleteMaterial(m), 0);
    EXPECT_EQ(g_eng.cur_material, other);
    ASSERT_EQ(VRX_DeleteMaterial(other), 0);
    EXPECT_EQ(g_eng.cur_material, nullptr);
}

TEST_F(Materials, MoveTextureStoresOffsetsAndRechoosesTheGenerator) {
    struct Case {
        bool textured;
        uint32_t flags;
        int32_t u, v;
        vrx::scene::UvFunc uv;
        int32_t off_u, off_v;
    };
    const Case cases[] = {
        {true, vrx::scene::MAT_REFLECT, 0x800, 0, vrx::scene::uv_sphere_scroll, 0x800, 0},
        {true, vrx::scene::MAT_REFLECT, 0, 0, vrx::scene::uv_sphere, 0x800, 0}, // back to sphere
        {true, 0, 0, -0x10000, vrx::scene::uv_scroll, 0, -0x10000},
        {true, 0, 0, 0, vrx::scene::uv_copy, 0, -0x10000},
        {true, vrx::scene::MAT_UNTEXTURED, 5, 6, vrx::scene::uv_none, 0, 0},
        {false, 0, 5, 6, vrx::scene::uv_none, 0, 0},
    };
    TEXTURE* t = make_texture();
    MATERIAL* m = nullptr;
    for (size_t i = 0; i < std::size(cases); ++i) {
        const Case& c = cases[i];
        // A fresh material for each new kind; the same one runs on through a sequence.
        if (i == 0 || i == 2 || i >= 4) m = make(info(c.textured ? t : nullptr, c.flags, 0));
        ASSERT_EQ(VRX_MoveMaterialTexture(m, c.u, c.v), 0);
        EXPECT_EQ(m->scroll_u, c.u) << i;
        EXPECT_EQ(m->scroll_v, c.v) << i;
        EXPECT_EQ(m->uv_func, c.uv) << i;
        EXPECT_EQ(m->uv_offset_u, c.off_u) << i;
        EXPECT_EQ(m->uv_offset_v, c.off_v) << i;
    }
}

TEST_F(Materials, BadHandlesReportBothMessages) {
    MATERIAL* live = make();
    ASSERT_EQ(VRX_DeleteMaterial(live), 0); // now stale
    TEXTURE* tex = make_texture();
    uint8_t rgba[4] = {};
    FIXED f = 0;
    void* out = nullptr;
    char name[32];
    MATINFO mi = info();
    using Call = std::function<int32_t(void*)>;
    struct Case {
        const char* op_message;
        Call call;
    };
    const Case cases[] = {
        {"chk_material return error in ENG_DuplicateMat!!\n",
         [&](void* h) { return VRX_DuplicateMaterial(h, &out); }},
        {"chk_material return error in ENG_DeleteMat!!\n",
         [&](void* h) { return VRX_DeleteMaterial(h); }},
        {"chk_material return error in ENG_DefaultMat!!\n",
         [&](void* h) { return VRX_SetDefaultMaterial(h); }},
        {"chk_material return error in ENG_GetMatName!!\n",
         [&](void* h) { return VRX_GetMaterialName(h, name); }},
        {"chk_material return error in ENG_SetMatAmbColor!\n",
         [&](void* h) { return VRX_SetMaterialColor(h, rgba, 0); }},
        {"chk_material return error in ENG_GetMatAmbColor!!\n",
         [&](void* h) { return VRX_GetMaterialColor(h, rgba, 0); }},
        {"chk_material return error in ENG_SetMatAmbMultiplier!!\n",
         [&](void* h) { return VRX_SetMaterialColorScale(h, 1, 0); }},
        {"chk_material return error in ENG_GetMatAmbMultiplier!!\n",
         [&](void* h) { return VRX_GetMaterialColorScale(h, &f, 0); }},
        {"chk_material return error in ENG_SetMatSelfIllum!!\n",
         [&](void* h) { return VRX_SetMaterialSelfIllum(h, 0); }},
        {"chk_material return error in ENG_GetMatSelfIllum!!\n",
         [&](void* h) { return VRX_GetMaterialSelfIllum(h, &f); }},
        {"chk_material return error in ENG_SetMatSide!!\n",
         [&](void* h) { return VRX_SetMaterialSide(h, 1); }},
        {"chk_material return error in ENG_SetMatShading!!\n",
         [&](void* h) { return VRX_SetMaterialShading(h, 1); }},
        {"chk_material return error in ENG_GetMatInfo!!\n",
         [&](void* h) { return VRX_GetMaterialInfo(h, &mi); }},
        {"chk_material return error in ENG_SetMatInfo!!\n",
         [&](void* h) { return VRX_SetMaterialInfo(h, &mi); }},
        {"chk_material return error in ENG_GetMatTextHandle!!\n",
         [&](void* h) { return VRX_GetMaterialTexture(h, &out); }},
        {"chk_material return error in ENG_SetMatTextHandle!!\n",
         [&](void* h) { return VRX_BindMaterialTexture(h, tex); }},
        {"chk_material return error in ENG_ScrollMatText !!\n",
         [&](void* h) { return VRX_MoveMaterialTexture(h, 0, 0); }},
    };
    struct Handle {
        void* h;
        const char* check_message;
    };
    const Handle handles[] = {{nullptr, "Wrong Material Handle.\n"},
                              {live, "The ID is not ID_MATERIAL.\n"},
                              {tex, "The ID is not ID_MATERIAL.\n"}};
    for (const Case& c : cases) {
        for (const Handle& h : handles) {
            clear_last_error();
            EXPECT_EQ(c.call(h.h), -1) << c.op_message;
            EXPECT_EQ(last_error(), std::string(h.check_message) + c.op_message);
        }
    }
    EXPECT_EQ(tex->ref_count, 1u);
}

TEST_F(Materials, NullArgumentsAreRefused) {
    MATERIAL* m = make();
    struct Case {
        std::function<int32_t()> call;
        const char* message;
    };
    const MATINFO mi = info();
    void* out = nullptr;
    const Case cases[] = {
        {[&] { return VRX_CreateMaterial(nullptr, &out); }, "Wrong info in ENG_CreateMat!!\n"},
        {[&] { return VRX_CreateMaterial(&mi, nullptr); }, "Wrong out in ENG_CreateMat!!\n"},
        {[&] { return VRX_DuplicateMaterial(m, nullptr); }, "Wrong out in ENG_DuplicateMat!!\n"},
        {[&] { return VRX_GetMaterialByName(nullptr, &out); },
         "Wrong name in VRX_GetMaterialByName!!\n"},
        {[&] { return VRX_GetMaterialName(m, nullptr); }, "Wrong buffer in ENG_GetMatName!!\n"},
        {[&] { return VRX_SetMaterialColor(m, nullptr, 0); },
         "Wrong color in ENG_SetMatAmbColor!!\n"},
        {[&] { return VRX_GetMaterialInfo(m, nullptr); }, "Wrong info in ENG_GetMatInfo!!\n"},
        {[&] { return VRX_SetMaterialInfo(m, nullptr); }, "Wrong info in ENG_SetMatInfo!!\n"},
    };
    for (const Case& c : cases) {
        clear_last_error();
        EXPECT_EQ(c.call(), -1);
        EXPECT_EQ(last_error(), c.message);
    }
    EXPECT_EQ(listed().size(), 1u);
}

TEST_F(Materials, AllocationFailuresReportAndLeakNothing) {
    TEXTURE* t = make_texture(1);
    const MATINFO mi = info(t);
    const long before = vrx::engine::alloc_outstanding();
    vrx::engine::alloc_fail_at(1, false);
    void* h = nullptr;
    EXPECT_EQ(VRX_CreateMaterial(&mi, &h), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for MATERIAL in ENG_CreateMat fail !!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(t->ref_count, 1u);
    EXPECT_TRUE(listed().empty());

    MATERIAL* src = make_named("NAMED");
    src->texture = t;
    ++t->ref_count;
    const char* expected[] = {"Allocate memory for MATERIAL in ENG_DuplicateMat fail!!\n",
                              "Allocate memory for p->name in ENG_DuplicateMat fail !!\n"};
    for (long n = 1;; ++n) {
        clear_last_error();
        const long outstanding = vrx::engine::alloc_outstanding();
        vrx::engine::alloc_fail_at(n, true);
        const int32_t r = VRX_DuplicateMaterial(src, &h);
        vrx::engine::alloc_fail_at(0, false);
        if (r == 0) {
            EXPECT_EQ(n, 3); // record and name
            EXPECT_EQ(t->ref_count, 3u);
            break;
        }
        ASSERT_LE(n, 2);
        EXPECT_EQ(r, -1);
        EXPECT_EQ(last_error(), expected[n - 1]);
        EXPECT_EQ(vrx::engine::alloc_outstanding(), outstanding);
        EXPECT_EQ(t->ref_count, 2u);
        EXPECT_EQ(listed(), std::vector<MATERIAL*>{src});
    }
}

TEST_F(Materials, ClearFreesEveryMaterialWithoutTouchingTextures) {
    TEXTURE* t = make_texture(0);
    MATERIAL* a = make_named("A", 3);
    MATERIAL* b = make(info(t));
    MATERIAL* c = make();
    // The textures step runs before the materials step and frees every texture.
    g_eng.texture_list.unlink(t);
    vrx::assets::FreeTexture(t);
    const long before = vrx::engine::alloc_outstanding();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_TRUE(listed().empty());
    EXPECT_EQ(g_eng.material_list.tail, nullptr);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before - 4); // three records and one name
    for (MATERIAL* m : {a, b, c}) EXPECT_NE(vrx::engine::chk_material(m), 0u);
}

// ---- Texture-coordinate generators ------------------------------------------------------

TEST(MaterialUv, CopyAndScroll) {
    MATERIAL m{};
    m.uv_offset_u = 0x100;
    m.uv_offset_v = -0x200;
    const VECTOR p{}, n{};
    struct Case {
        vrx::scene::UvFunc f;
        int32_t u, v, out_u, out_v;
    };
    const Case cases[] = {
        {vrx::scene::uv_copy, 0x1234, 0x5678, 0x1234, 0x5678},
        {vrx::scene::uv_scroll, 0x1234, 0x5678, 0x1334, 0x5478},
        {vrx::scene::uv_scroll, 0x7FFFFFFF, 0x200, INT32_MIN + 0xFF, 0}, // wraps
        {vrx::scene::uv_none, 1, 2, -7, -8},                             // left alone
    };
    for (const Case& c : cases) {
        m.uv_func = c.f;
        vrx::render::SVERTEX out{};
        out.u = -7;
        out.v = -8;
        vrx::scene::generate_uv(m, p, n, c.u, c.v, {nullptr, nullptr}, out);
        EXPECT_EQ(out.u, c.out_u);
        EXPECT_EQ(out.v, c.out_v);
    }
}

TEST(MaterialUv, SphereMapping) {
    const int32_t h2 = vrx::engine::Sqrt(0x20000) >> 1; // sqrt(2) / 2 as the generator forms it
    // X turned onto Y: (x, y, z) -> (-y, x, z); the origin must not be added.
    const UCS turned{{0x50000, 0x50000, 0x50000}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}};
    const VECTOR eye_back{0, 0, -kOne};
    const VECTOR eye_side{kOne, 0, -kOne};
    struct Case {
        VECTOR pos, normal;
        const UCS* global;
        const VECTOR* eye;
        int32_t u, v;
    };
    const Case cases[] = {
        // Looking straight at a facing normal: r = (0, 0, -1), tilted to 0: the centre.
        {{0, 0, 0}, {0, 0, -kOne}, nullptr, &eye_back, 0x8000, 0x8000},
        // Direction +x, normal -z: r = (1, 0, 1), |r|^2 = 2.
        {{kOne, 0, 0}, {0, 0, -kOne}, nullptr, nullptr, 0x8000 + h2, 0x8000},
        // The same vertex turned onto +y: v moves instead, downwards.
        {{kOne, 0, 0}, {0, 0, -kOne}, &turned, nullptr, 0x8000, 0x8000 - h2},
        // The eye is subtracted: e = (1,0,0) - (1,0,-1) = (0,0,1): the centre again.
        {{kOne, 0, 0}, {0, 0, -kOne}, nullptr, &eye_side, 0x8000, 0x8000},
    };
    MATERIAL m{};
    m.uv_offset_u = 0x10;
    m.uv_offset_v = 0x20;
    for (const Case& c : cases) {
        for (auto f : {vrx::scene::uv_sphere, vrx::scene::uv_sphere_scroll}) {
            m.uv_func = f;
            vrx::render::SVERTEX out{};
            vrx::scene::generate_uv(m, c.pos, c.normal, 0x1111, 0x2222, {c.global, c.eye}, out);
            const int32_t du = f == vrx::scene::uv_sphere ? 0 : 0x10;
            const int32_t dv = f == vrx::scene::uv_sphere ? 0 : 0x20;
            EXPECT_EQ(out.u, c.u + du);
            EXPECT_EQ(out.v, c.v + dv);
        }
    }
}

TEST(MaterialUv, SphereMappingReflectsAboutAnObliqueNormal) {
    // Normal (1, 0, -1) normalises to (k, 0, -k), k = 1/sqrt(2) as InvSqrt gives it; the
    // view direction is +z. The reflection subtracts 2 (n.e) n with n.e = -k:
    // r = (0, 0, 1) + 2k (k, 0, -k) = (2k^2, 0, 1 - 2k^2), then z + 1.
    using vrx::engine::F_MUL;
    const int32_t k = vrx::engine::InvSqrt(0x20000);
    const int32_t two_k = -2 * k; // 2 (n.e)
    const int32_t rx = -F_MUL(two_k, k);
    const int32_t rz = kOne - F_MUL(two_k, -k) + kOne;
    const int32_t q = static_cast<int32_t>((int64_t{rx} * rx + int64_t{rz} * rz) >> 16);
    const int32_t h = F_MUL(vrx::engine::Sqrt(q), 0x8000);
    ASSERT_GT(rx, 0xFF00); // about 1.0 each: the reflection is really oblique
    ASSERT_GT(rz, 0xFF00);
    MATERIAL m{};
    m.uv_func = vrx::scene::uv_sphere;
    const VECTOR eye{0, 0, -kOne};
    vrx::render::SVERTEX out{};
    vrx::scene::generate_uv(m, VECTOR{0, 0, 0}, VECTOR{kOne, 0, -kOne}, 0, 0, {nullptr, &eye}, out);
    EXPECT_EQ(out.u, F_MUL(h, rx) + 0x8000);
    EXPECT_EQ(out.v, 0x8000);
}

} // namespace
