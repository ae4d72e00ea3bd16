// Textures: every source, sharing and release, resampling, updates, refusals, failed allocations.
#include <gtest/gtest.h>

#include <array>
#include <functional>
#include <string>
#include <vector>

#include "assets/asset_fixture.h"
#include "assets/texture.h"

namespace {

using namespace vrx::formats;
using vrx::assets::TEXTURE;
using vrx::engine::alloc_outstanding;
using Words = std::vector<uint16_t>;

// A 4 x 2 picture and its RGB565 texels, worked out by hand (top bits of each channel).
const std::vector<Rgba> kPicture = {{255, 0, 0, 255},     {0, 255, 0, 255},  {0, 0, 255, 255},
                                    {255, 255, 255, 255}, {0, 0, 0, 255},    {128, 128, 128, 255},
                                    {8, 4, 8, 255},       {255, 128, 0, 255}};
const Words kPicture565 = {0xF800, 0x07E0, 0x001F, 0xFFFF, 0x0000, 0x8410, 0x0821, 0xFC00};
const std::vector<uint8_t> kTga24 = write_tga(4, 2, 24, kPicture);

uint16_t texel(const TEXTURE* t, int x, int y) {
    return static_cast<const uint16_t*>(t->data)[y * t->width + x];
}
Words texels(const TEXTURE* t) {
    auto* p = static_cast<const uint16_t*>(t->data);
    return Words(p, p + t->width * t->height);
}

// Loads by name, or makes from host pixels (RGB565 unless told); null after a failure.
TEXTURE* load(const std::string& name) {
    void* out = nullptr;
    const int32_t rc = VRX_LoadTexture(name.c_str(), &out);
    EXPECT_EQ(rc == 0, out != nullptr) << name;
    return static_cast<TEXTURE*>(out);
}
TEXTURE* from_memory(int32_t w, int32_t h, const void* px, uint32_t fmt = VRX_FMT_RGB565) {
    void* out = nullptr;
    VRX_LoadTextureFromMemory(w, h, px, fmt, &out);
    return static_cast<TEXTURE*>(out);
}

class Texture : public vrx::test::AssetTest {
  protected:
    // Makes a texture with its 1st, 2nd, ... allocation failing until it succeeds, and returns
    // the number of failures: each must be reported and leak nothing.
    static long failures_before(const std::function<TEXTURE*()>& make, TEXTURE*& made) {
        const long before = alloc_outstanding();
        for (long n = 0; n < 20; ++n) {
            clear_last_error();
            vrx::engine::alloc_fail_at(n + 1, false);
            made = make();
            vrx::engine::alloc_fail_at(0, false);
            if (made) return n;
            EXPECT_NE(last_error(), "") << "allocation " << n + 1;
            EXPECT_EQ(alloc_outstanding(), before) << "allocation " << n + 1;
        }
        return -1;
    }
};

TEST_F(Texture, EverySourceServesTgaTexturesDespiteAllocationFailures) {
    ASSERT_EQ(VRX_SetDefaultDataPath(dir.c_str()), 0);
    put("p1.tga", kTga24);
    put("p2.tga", write_tga(4, 2, 24, std::vector<Rgba>(8, Rgba{0, 0, 255, 255}))); // blue
    // Pack files are searched by the whole path: data path, backslash, name. Both packs hold a
    // P2.TGA whose stream fails its checksum; the plain file stands behind.
    const std::string in_dir = dir + "\\";
    auto file_pack = write_v3z(V3zKind::VRK2, {{in_dir + "F1.TGA", kTga24},
                                               {in_dir + "F2.TGA", kTga24, true},
                                               {in_dir + "P2.TGA", kTga24, true}});
    auto mem_pack =
        write_v3z(V3zKind::VRKZ, {{"M1.TGA", kTga24},
                                  {"M2.TGA", kTga24, true},
                                  {"P2.TGA", kTga24, true},
                                  {"MP.TG1", write_tg16(Tg16Kind::RGB565, 4, 2, kPicture565)}});
    file_pack.bytes[file_pack.dir_offset - 1] ^= 0xFF; // P2's last byte, its checksum's
    mem_pack.bytes[mem_pack.placements[3].offset - 1] ^= 0xFF;
    ASSERT_EQ(VRX_SelectResourceFile(put("files.v3z", file_pack.bytes).c_str()), 0);
    VRX_SelectResourceBuffer(mem_pack.bytes.data());

    for (const char* name : {"m1.tga", "M2.TGA", "mp.tg1", "f1.tga", "F2.tga", "p1.tga"}) {
        SCOPED_TRACE(name);
        TEXTURE* t = nullptr;
        EXPECT_GE(failures_before([&] { return load(name); }, t), 2); // name, record
        ASSERT_NE(t, nullptr);
        EXPECT_EQ((std::array{t->width, t->height, t->width_log2, t->height_log2, t->alpha_kind}),
                  (std::array{4, 2, 2, 1, vrx::assets::kAlpha565}));
        EXPECT_EQ(t->ref_count, 1u);
        EXPECT_EQ(texels(t), kPicture565);
    }
    // Memory packs name the damaged entry by its base name, pack files by the whole path.
    clear_last_error();
    TEXTURE* d = load("p2.tga");
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(texels(d), Words(8, 0x001F));
    EXPECT_EQ(last_error(), "Z file P2.TGA damaged!!\nZ file " + in_dir + "P2.TGA damaged!!\n");
    // A name in any case shares the record. The stored pre-converted entry's pixels are the
    // pack's bytes: they are not updated, and stay when its last reference goes.
    TEXTURE* p = load("MP.TG1");
    EXPECT_EQ(p->ref_count, 2u);
    EXPECT_EQ(p->data, mem_pack.bytes.data() + mem_pack.placements[3].offset + 20);
    clear_last_error();
    EXPECT_EQ(VRX_UpdateTextureData(p, 4, 2, kPicture565.data(), VRX_FMT_RGB565), -1);
    EXPECT_EQ(last_error(),
              "Texture pixels belong to a resource pack in VRX_UpdateTextureData!!\n");
    EXPECT_EQ(VRX_UnloadTexture(p), 0);
    EXPECT_EQ(p->ref_count, 1u);
    long before = alloc_outstanding();
    EXPECT_EQ(VRX_UnloadTexture(p), 0);
    EXPECT_EQ(alloc_outstanding(), before - 2); // name and record only
    // Clearing frees the rest whatever their counts: name, pixels and record of each.
    ++d->ref_count;
    before = alloc_outstanding();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(vrx::engine::g_eng.texture_list.head, nullptr);
    EXPECT_EQ(alloc_outstanding(), before - 18);
}

TEST_F(Texture, FilesShrinkHostPixelsGrowAndUpdatesResampleToPowersOfTwo) {
    // Texel (x, y) of the 100 x 60 source holds y << 8 | x.
    Words src(100 * 60);
    for (size_t i = 0; i < src.size(); ++i) src[i] = uint16_t((i / 100) << 8 | i % 100);
    const std::string path = put("big.tg2", write_tg16(Tg16Kind::RGB565, 100, 60, src));
    TEXTURE *f = nullptr, *m = nullptr;
    EXPECT_EQ(failures_before([&] { return load(path); }, f), 4); // name, file, pixels, record
    EXPECT_EQ(failures_before([&] { return from_memory(100, 60, src.data()); }, m), 3);
    ASSERT_TRUE(f && m);
    EXPECT_EQ((std::array{f->width, f->height, m->width, m->height}),
              (std::array{64, 32, 128, 64}));
    // File: steps 1.5625 and 1.875; memory: steps 0.78125 and 0.9375; all truncated.
    EXPECT_EQ((std::array{texel(f, 2, 1), texel(f, 63, 31), texel(m, 5, 16), texel(m, 127, 63)}),
              (std::array<uint16_t, 4>{0x0103, 0x3A62, 0x0F03, 0x3B63}));
    // Three texels across 64: x * 3 / 64 truncated, so 0 up to 21, 1 up to 42, then 2.
    const uint16_t three[3] = {5, 6, 7};
    ASSERT_EQ(VRX_UpdateTextureData(f, 3, 1, three, VRX_FMT_RGB565), 0);
    EXPECT_EQ((std::array{texel(f, 21, 0), texel(f, 22, 0), texel(f, 42, 31), texel(f, 43, 31)}),
              (std::array<uint16_t, 4>{5, 6, 6, 7}));
}

TEST_F(Texture, EveryRefusalIsReportedAndLeavesNothing) {
    put("wide.tg2", write_tg16(Tg16Kind::RGB565, 40000, 1, Words(40000, 0)));
    const uint16_t px[4] = {};
    vrx::assets::texture_serial = 1999999; // host textures are numbered; past 2000000, from 0
    TEXTURE* t = from_memory(2, 2, px);
    ASSERT_NE(t, nullptr);
    EXPECT_STREQ(t->name, "TX1999999");
    EXPECT_EQ(load("tx1999999"), t);
    auto size = [](const char* wh, const char* fn) {
        return "Wrong texture size " + std::string(wh) + " in " + fn + "!!\n";
    };
    const std::pair<std::function<bool()>, std::string> cases[] = {
        {[&] { return load("sky.bmp"); }, "Load JPGX fail!!\n"}, // the name picks the decoder
        {[&] { return load("none.vtg"); },
         "resourceGetData file NONE.VTG not find!!\nLoadTGA1 fail!!\n"},
        {[&] { return load(dir + "/wide.tg2"); }, size("40000x1", "LoadTextureFile")},
        {[&] { return from_memory(0, 4, px); }, size("0x4", "NewTextureFromPixels")},
        {[&] { return from_memory(1, 32768, px); }, size("1x32768", "NewTextureFromPixels")},
        // Resampling is for RGB565 and 32-bit pixels only.
        {[&] { return !VRX_UpdateTextureData(t, 1, 1, px, VRX_FMT_RGBA4444); }, ""},
        {[&] { return !VRX_UpdateTextureData(t, 2, 2, px, VRX_FMT_ARGB8888); },
         "Pixel size of format 3 does not match the texture in VRX_UpdateTextureData!!\n"},
        {[&] { return !VRX_UpdateTextureData(t, 0, 1, px, VRX_FMT_RGB565); },
         size("0x1", "VRX_UpdateTextureData")},
        {[&] { return load(std::string(600, 'n')); },
         "Texture path too long in LoadTextureFile!!\n"},
    };
    const long before = alloc_outstanding();
    for (const auto& [succeeds, error] : cases) {
        clear_last_error();
        EXPECT_FALSE(succeeds());
        EXPECT_EQ(last_error(), error);
    }
    EXPECT_EQ(alloc_outstanding(), before);
    EXPECT_EQ(texels(t), Words(4, 0));
    EXPECT_STREQ(from_memory(1, 1, px)->name, "TX2000002"); // the refused ones counted too
    EXPECT_STREQ(from_memory(1, 1, px)->name, "TX0000000");
}

} // namespace
