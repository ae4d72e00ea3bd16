// Textures: loading from every source, sharing, sizes and resampling, memory textures and
// their names, updates, release, and allocation failures at every step.
#include <gtest/gtest.h>

#include <cctype>
#include <climits>
#include <cstring>
#include <string>
#include <vector>

#include "assets/asset_fixture.h"
#include "assets/texture.h"
#include "engine/alloc.h"

namespace {

using vrx::assets::TEXTURE;
using vrx::engine::g_eng;
using vrx::formats::Rgba;
using vrx::formats::Tg16Kind;
using vrx::formats::V3zEntry;
using vrx::formats::V3zKind;
using vrx::formats::write_tg16;
using vrx::formats::write_tga;
using vrx::formats::write_v3z;
using vrx::test::poke32;
using Words = std::vector<uint16_t>;

// A 4 x 2 picture and its RGB565 texels, worked out by hand (top bits of each channel).
const std::vector<Rgba> kPicture = {{255, 0, 0, 255},     {0, 255, 0, 255},  {0, 0, 255, 255},
                                    {255, 255, 255, 255}, {0, 0, 0, 255},    {128, 128, 128, 255},
                                    {8, 4, 8, 255},       {255, 128, 0, 255}};
const Words kPicture565 = {0xF800, 0x07E0, 0x001F, 0xFFFF, 0x0000, 0x8410, 0x0821, 0xFC00};
const std::vector<uint8_t> kTga24 = write_tga(4, 2, 24, kPicture);

std::string upper(std::string s) {
    for (char& c : s) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return s;
}

Words texels(const TEXTURE* t) {
    auto* p = static_cast<const uint16_t*>(t->data);
    return Words(p, p + size_t(t->width) * size_t(t->height));
}

class Texture : public vrx::test::AssetTest {
  protected:
    // Loads by name; null after a failure.
    static TEXTURE* load(const std::string& name) {
        void* out = nullptr;
        int32_t rc = VRX_LoadTexture(name.c_str(), &out);
        EXPECT_EQ(rc == 0, out != nullptr) << name;
        return static_cast<TEXTURE*>(out);
    }
    static TEXTURE* from_memory(int32_t w, int32_t h, const void* px, uint32_t fmt) {
        void* out = nullptr;
        VRX_LoadTextureFromMemory(w, h, px, fmt, &out);
        return static_cast<TEXTURE*>(out);
    }
    void use_dir_as_data_path() { ASSERT_EQ(VRX_SetDefaultDataPath(dir.c_str()), 0); }
};

TEST_F(Texture, EverySourceServesStoredAndCompressedTgaTextures) {
    use_dir_as_data_path();
    const auto blue = write_tga(4, 2, 24, std::vector<Rgba>(8, Rgba{0, 0, 255, 255}));
    put("p1.tga", kTga24);
    put("d.tga", blue);
    // Pack files are searched by the whole path: data path, backslash, name.
    const std::string in_dir = dir + "\\";
    auto file_pack = write_v3z(V3zKind::VRK2, {{in_dir + "F1.TGA", kTga24},
                                               {in_dir + "F2.TGA", kTga24, true},
                                               {in_dir + "D.TGA", kTga24, true}});
    auto mem_pack = write_v3z(
        V3zKind::VRKZ, {{"M1.TGA", kTga24}, {"M2.TGA", kTga24, true}, {"MD.TGA", kTga24, true}});
    // Damage both compressed "D" entries; plain files of those names stand behind them.
    poke32(file_pack.bytes, file_pack.placements[2].dir_entry + 36,
           file_pack.placements[2].packed_size - 5);
    poke32(mem_pack.bytes, mem_pack.placements[2].dir_entry + 24,
           mem_pack.placements[2].packed_size - 5);
    put("md.tga", blue);
    ASSERT_EQ(VRX_SelectResourceFile(put("files.v3z", file_pack.bytes).c_str()), 0);
    VRX_SelectResourceBuffer(mem_pack.bytes.data());

    for (const char* name : {"m1.tga", "M2.TGA", "f1.tga", "F2.tga", "p1.tga"}) {
        SCOPED_TRACE(name);
        TEXTURE* t = load(name);
        ASSERT_NE(t, nullptr);
        EXPECT_EQ(t->width, 4);
        EXPECT_EQ(t->height, 2);
        EXPECT_EQ(t->width_log2, 2);
        EXPECT_EQ(t->height_log2, 1);
        EXPECT_EQ(t->alpha_kind, vrx::assets::kAlpha565);
        EXPECT_EQ(t->ref_count, 1u);
        EXPECT_EQ(texels(t), kPicture565);
    }
    for (const char* name : {"d.tga", "md.tga"}) {
        clear_last_error();
        TEXTURE* t = load(name);
        ASSERT_NE(t, nullptr);
        EXPECT_EQ(texels(t), Words(8, 0x001F));
        EXPECT_NE(last_error().find("damaged!!\n"), std::string::npos) << last_error();
    }
}

TEST_F(Texture, PreConvertedPackEntryIsUsedInPlace) {
    const Words px = {1, 2, 3, 4, 5, 6, 7, 8};
    auto pack = write_v3z(V3zKind::VRKZ, {{"A.TG2", write_tg16(Tg16Kind::RGBA4444, 4, 2, px)}});
    VRX_SelectResourceBuffer(pack.bytes.data());
    TEXTURE* t = load("a.tg2");
    ASSERT_NE(t, nullptr);
    EXPECT_EQ(t->own_data, 0);
    EXPECT_EQ(t->data, pack.bytes.data() + pack.placements[0].offset + 20);
    EXPECT_EQ(t->alpha_kind, vrx::assets::kAlpha4444);
    long before = vrx::engine::alloc_outstanding();
    EXPECT_EQ(VRX_UnloadTexture(t), 0); // the pack's bytes are not freed with it
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before - 2);
}

TEST_F(Texture, SameNameInAnyCaseSharesOneRecord) {
    use_dir_as_data_path();
    put("wood.tga", kTga24);
    TEXTURE* a = load("wood.tga");
    TEXTURE* b = load("WOOD.TGA");
    ASSERT_NE(a, nullptr);
    EXPECT_EQ(a, b);
    EXPECT_EQ(a->ref_count, 2u);
    EXPECT_STREQ(a->name, "WOOD.TGA");
    EXPECT_EQ(VRX_UnloadTexture(a), 0);
    int32_t w = 0, h = 0;
    EXPECT_EQ(VRX_GetTextureInfo(a, &w, &h), 0);
    EXPECT_EQ(VRX_UnloadTexture(a), 0);
    EXPECT_EQ(g_eng.texture_list.head, nullptr);
    clear_last_error();
    EXPECT_EQ(VRX_GetTextureInfo(a, &w, &h), -1);
    EXPECT_EQ(VRX_UnloadTexture(nullptr), -1);
    EXPECT_EQ(last_error(),
              "The ID is not ID_TEXT.\nchk_texture return error in ENG_GetTextureWH!!\n"
              "Wrong Texture Handle.\nchk_texture return error in ENG_UnloadText!!\n");
}

TEST_F(Texture, FilesShrinkAndHostPixelsGrowToPowersOfTwo) {
    // Texel (x, y) of the 100 x 60 source holds y << 8 | x.
    Words src(100 * 60);
    for (int y = 0; y < 60; ++y)
        for (int x = 0; x < 100; ++x) src[size_t(y * 100 + x)] = uint16_t(y << 8 | x);
    use_dir_as_data_path();
    put("big.tg2", write_tg16(Tg16Kind::RGB565, 100, 60, src));
    TEXTURE* f = load("big.tg2");
    TEXTURE* m = from_memory(100, 60, src.data(), VRX_FMT_RGB565);
    ASSERT_NE(f, nullptr);
    ASSERT_NE(m, nullptr);
    struct Case {
        TEXTURE* t;
        int32_t w, h;
        int x, y;
        uint16_t texel;
    };
    // File: steps 1.5625 and 1.875; memory: steps 0.78125 and 0.9375; all truncated.
    const Case cases[] = {
        {f, 64, 32, 0, 0, 0x0000},   {f, 64, 32, 2, 1, 0x0103},     {f, 64, 32, 63, 31, 0x3A62},
        {m, 128, 64, 5, 16, 0x0F03}, {m, 128, 64, 127, 63, 0x3B63},
    };
    for (const Case& c : cases) {
        int32_t w = 0, h = 0;
        ASSERT_EQ(VRX_GetTextureInfo(c.t, &w, &h), 0);
        EXPECT_EQ(w, c.w);
        EXPECT_EQ(h, c.h);
        EXPECT_EQ(static_cast<const uint16_t*>(c.t->data)[c.y * c.w + c.x], c.texel)
            << c.x << "," << c.y;
    }
}

TEST_F(Texture, StretchTakesTruncatedSourceColumns) {
    struct Case {
        int32_t sw, dw;
        std::vector<uint32_t> cols;
    };
    const Case cases[] = {
        {3, 4, {0, 0, 1, 2}}, {4, 2, {0, 2}}, {5, 3, {0, 1, 3}}, {1, 3, {0, 0, 0}}, {2, 2, {0, 1}}};
    for (const Case& c : cases) {
        std::vector<uint32_t> src(size_t(c.sw)), dst32(size_t(c.dw), 99);
        std::vector<uint16_t> src16(size_t(c.sw)), dst16(size_t(c.dw), 99);
        for (int32_t i = 0; i < c.sw; ++i) src[size_t(i)] = src16[size_t(i)] = uint16_t(i);
        vrx::assets::StretchImage32(dst32.data(), c.dw, 1, src.data(), c.sw, 1);
        vrx::assets::StretchImage16(dst16.data(), c.dw, 1, src16.data(), c.sw, 1);
        EXPECT_EQ(dst32, c.cols);
        EXPECT_EQ(std::vector<uint32_t>(dst16.begin(), dst16.end()), c.cols);
    }
    uint16_t untouched = 7, one = 1;
    vrx::assets::StretchImage16(&untouched, 1, 0, &one, 1, 1);
    vrx::assets::StretchImage16(&untouched, 0, 1, &one, 1, 1);
    EXPECT_EQ(untouched, 7);
}

TEST_F(Texture, PowerOfTwoHelpers) {
    struct Case {
        int32_t x;
        bool pow2;
        int32_t log2;
    };
    const Case cases[] = {{0, false, 0},  {1, true, 0},           {2, true, 1},
                          {3, false, 1},  {64, true, 6},          {100, false, 6},
                          {-4, false, 0}, {0x40000000, true, 30}, {INT32_MIN, false, 0}};
    for (const Case& c : cases) {
        EXPECT_EQ(vrx::assets::IsPow2(c.x), c.pow2) << c.x;
        EXPECT_EQ(vrx::assets::Log2Floor(c.x), c.log2) << c.x;
    }
}

TEST_F(Texture, AlphaKindFollowsTheSource) {
    use_dir_as_data_path();
    put("c24.tga", kTga24);
    put("c32.tga", write_tga(4, 2, 32, kPicture));
    const uint32_t px[4] = {};
    struct Case {
        TEXTURE* t;
        int32_t alpha;
    };
    const Case cases[] = {{load("c24.tga"), 0},
                          {load("c32.tga"), 1},
                          {from_memory(2, 2, px, VRX_FMT_RGB565), 0},
                          {from_memory(2, 2, px, VRX_FMT_RGBA4444), 1},
                          {from_memory(2, 2, px, VRX_FMT_ARGB8888), 2}};
    for (const Case& c : cases) {
        ASSERT_NE(c.t, nullptr);
        EXPECT_EQ(c.t->alpha_kind, c.alpha);
    }
}

TEST_F(Texture, DecoderFailuresReportTheirFamily) {
    use_dir_as_data_path();
    put("sky.bmp", kTga24); // a TGA file by content, but its name sends it to JPEG decoding
    struct Case {
        const char* name;
        std::string expected;
    };
    const Case cases[] = {
        {"sky.bmp", "Load JPGX fail!!\n"},
        {"sky.jpg", "Load JPGX fail!!\n"},
        // The whole path is upper-cased before it is looked up.
        {"none.vtg",
         "resourceGetData file " + upper(dir) + "\\NONE.VTG not find!!\nLoadTGA1 fail!!\n"},
    };
    long before = vrx::engine::alloc_outstanding();
    for (const Case& c : cases) {
        clear_last_error();
        EXPECT_EQ(load(c.name), nullptr);
        EXPECT_EQ(last_error(), c.expected);
    }
    EXPECT_EQ(g_eng.texture_list.head, nullptr);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
}

TEST_F(Texture, MemoryTexturesAreNumberedAndFoundByName) {
    const uint16_t px[4] = {1, 2, 3, 4};
    vrx::assets::texture_serial = 1999999;
    TEXTURE* a = from_memory(2, 2, px, VRX_FMT_RGB565);
    EXPECT_EQ(from_memory(0, 2, px, VRX_FMT_RGB565), nullptr); // fails, still counts
    TEXTURE* c = from_memory(2, 2, px, VRX_FMT_RGB565);
    ASSERT_TRUE(a && c);
    EXPECT_STREQ(a->name, "TX1999999");
    EXPECT_STREQ(c->name, "TX2000001");
    EXPECT_EQ(vrx::assets::texture_serial, 0); // passed 2,000,000 on a successful load
    TEXTURE* d = from_memory(2, 2, px, VRX_FMT_RGB565);
    EXPECT_STREQ(d->name, "TX0000000");
    EXPECT_EQ(d->ref_count, 1u);
    EXPECT_EQ(load("tx2000001"), c);
    EXPECT_EQ(c->ref_count, 2u);
    EXPECT_EQ(texels(d), Words(px, px + 4));
}

TEST_F(Texture, SizesOutsideOneTo32767AreRefused) {
    use_dir_as_data_path();
    put("wide.tg2", write_tg16(Tg16Kind::RGB565, 40000, 1, Words(40000, 0)));
    const uint16_t px[4] = {};
    struct Case {
        int32_t w, h;
        const char* expected;
    };
    const Case cases[] = {{0, 4, "Wrong texture size 0x4 in NewTextureFromPixels!!\n"},
                          {4, -1, "Wrong texture size 4x-1 in NewTextureFromPixels!!\n"},
                          {32768, 1, "Wrong texture size 32768x1 in NewTextureFromPixels!!\n"}};
    long before = vrx::engine::alloc_outstanding();
    for (const Case& c : cases) {
        clear_last_error();
        EXPECT_EQ(from_memory(c.w, c.h, px, VRX_FMT_RGB565), nullptr);
        EXPECT_EQ(last_error(), c.expected);
    }
    clear_last_error();
    EXPECT_EQ(load("wide.tg2"), nullptr);
    EXPECT_EQ(last_error(), "Wrong texture size 40000x1 in LoadTextureFile!!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(g_eng.texture_list.head, nullptr);
}

TEST_F(Texture, OverlongPathIsRefused) {
    ASSERT_EQ(VRX_SetDefaultDataPath(std::string(250, 'd').c_str()), 0);
    EXPECT_EQ(load(std::string(261, 'n') + ".tga"), nullptr);
    EXPECT_EQ(last_error(), "Texture path too long in LoadTextureFile!!\n");
}

TEST_F(Texture, UpdatesCopyOrResampleInTheTexturesOwnLayout) {
    const uint16_t start[4] = {1, 2, 3, 4};
    TEXTURE* t = from_memory(4, 1, start, VRX_FMT_RGB565);
    const uint16_t same[4] = {9, 8, 7, 6};
    ASSERT_EQ(VRX_UpdateTextureData(t, 4, 1, same, VRX_FMT_RGB565), 0);
    EXPECT_EQ(texels(t), (Words{9, 8, 7, 6}));
    const uint16_t three[3] = {5, 6, 7};
    ASSERT_EQ(VRX_UpdateTextureData(t, 3, 1, three, VRX_FMT_RGB565), 0);
    EXPECT_EQ(texels(t), (Words{5, 5, 6, 7}));

    const uint32_t wide[4] = {0xAA000001, 0xBB000002, 0xCC000003, 0};
    TEXTURE* w = from_memory(3, 1, wide, VRX_FMT_ARGB8888);
    ASSERT_NE(w, nullptr);
    auto* wp = static_cast<const uint32_t*>(w->data);
    EXPECT_EQ(std::vector<uint32_t>(wp, wp + 4),
              (std::vector<uint32_t>{0xAA000001, 0xAA000001, 0xBB000002, 0xCC000003}));

    struct Case {
        TEXTURE* t;
        int32_t w;
        uint32_t fmt;
        const char* expected;
    };
    const Case refused[] = {
        {t, 3, VRX_FMT_RGBA4444, ""}, // resampling is for RGB565 and 32-bit pixels only
        {t, 4, VRX_FMT_ARGB8888,
         "Pixel size of format 3 does not match the texture in VRX_UpdateTextureData!!\n"},
        {w, 4, VRX_FMT_RGB565,
         "Pixel size of format 0 does not match the texture in VRX_UpdateTextureData!!\n"},
        {t, 0, VRX_FMT_RGB565, "Wrong texture size 0x1 in VRX_UpdateTextureData!!\n"},
        {nullptr, 4, VRX_FMT_RGB565, "Wrong Texture Handle.\n"},
    };
    for (const Case& c : refused) {
        clear_last_error();
        EXPECT_EQ(VRX_UpdateTextureData(c.t, c.w, 1, wide, c.fmt), -1);
        EXPECT_EQ(last_error(), c.expected);
    }
    EXPECT_EQ(texels(t), (Words{5, 5, 6, 7}));

    auto pack = write_v3z(V3zKind::VRKZ, {{"P.TG2", write_tg16(Tg16Kind::RGB565, 1, 1, {42})}});
    VRX_SelectResourceBuffer(pack.bytes.data());
    TEXTURE* p = load("p.tg2");
    ASSERT_NE(p, nullptr);
    clear_last_error();
    EXPECT_EQ(VRX_UpdateTextureData(p, 1, 1, same, VRX_FMT_RGB565), -1);
    EXPECT_EQ(last_error(),
              "Texture pixels belong to a resource pack in VRX_UpdateTextureData!!\n");
    EXPECT_EQ(*static_cast<const uint16_t*>(p->data), 42);
}

TEST_F(Texture, ClearFreesEveryTextureWhateverItsCount) {
    long before = vrx::engine::alloc_outstanding();
    const uint16_t px[1] = {};
    TEXTURE* a = from_memory(1, 1, px, VRX_FMT_RGB565);
    from_memory(1, 1, px, VRX_FMT_RGB565);
    ++a->ref_count;
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(g_eng.texture_list.head, nullptr);
    EXPECT_EQ(g_eng.texture_list.tail, nullptr);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(VRX_UnloadTexture(a), -1);
}

// Fails the 1st, 2nd, ... allocation of one load until the load succeeds: every failure is
// reported, gives -1 and a null handle, leaves the texture list alone and leaks nothing.
TEST_F(Texture, EveryAllocationFailureOfEverySourceIsClean) {
    use_dir_as_data_path();
    const std::string in_dir = dir + "\\";
    auto file_pack =
        write_v3z(V3zKind::VRK2, {{in_dir + "FS.TGA", kTga24}, {in_dir + "FC.TGA", kTga24, true}});
    auto mem_pack =
        write_v3z(V3zKind::VRKZ, {{"MS.TGA", kTga24},
                                  {"MC.TGA", kTga24, true},
                                  {"MP.TG1", write_tg16(Tg16Kind::RGB565, 4, 2, kPicture565)}});
    put("plain.tga", kTga24);
    put("odd.tga", write_tga(3, 2, 24, std::vector<Rgba>(6, Rgba{255, 0, 0, 255})));
    ASSERT_EQ(VRX_SelectResourceFile(put("files.v3z", file_pack.bytes).c_str()), 0);
    VRX_SelectResourceBuffer(mem_pack.bytes.data());

    for (const char* name :
         {"ms.tga", "mc.tga", "mp.tg1", "fs.tga", "fc.tga", "plain.tga", "odd.tga"}) {
        SCOPED_TRACE(name);
        long before = vrx::engine::alloc_outstanding();
        long failures = 0;
        for (long n = 1;; ++n) {
            clear_last_error();
            vrx::engine::alloc_fail_at(n, false);
            TEXTURE* t = load(name);
            vrx::engine::alloc_fail_at(0, false);
            if (t) {
                EXPECT_EQ(texels(t)[0], 0xF800); // red, whatever the source
                ASSERT_EQ(VRX_UnloadTexture(t), 0);
                break;
            }
            ++failures;
            EXPECT_FALSE(last_error().empty()) << "allocation " << n;
            EXPECT_EQ(g_eng.texture_list.head, nullptr);
            EXPECT_EQ(vrx::engine::alloc_outstanding(), before) << "allocation " << n;
            ASSERT_LT(n, 20);
        }
        EXPECT_GE(failures, 2);
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    }

    const uint16_t px[6] = {};
    long before = vrx::engine::alloc_outstanding();
    for (long n = 1;; ++n) {
        clear_last_error();
        vrx::engine::alloc_fail_at(n, false);
        TEXTURE* t = from_memory(3, 2, px, VRX_FMT_RGB565);
        vrx::engine::alloc_fail_at(0, false);
        if (t) {
            ASSERT_EQ(VRX_UnloadTexture(t), 0);
            EXPECT_EQ(n, 4); // name, pixels, record: the fourth attempt succeeds
            break;
        }
        EXPECT_FALSE(last_error().empty());
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    }
}

} // namespace
