// LoadTGA: the true-colour converters, the pre-converted 16-bit files, and every rejection.
// Files are written byte by byte here, so the decoder is checked against the format itself
// rather than against the writer.
#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "assets/asset_fixture.h"
#include "assets/tga.h"
#include "engine/alloc.h"

namespace {

using vrx::assets::CF_RGB565;
using vrx::assets::CF_RGB888;
using vrx::assets::CF_RGBA4444;
using vrx::assets::CF_RGBA8888;
using vrx::formats::V3zKind;
using vrx::formats::write_v3z;
using Bytes = std::vector<uint8_t>;

// An 18-byte true-colour header followed by the stored pixel bytes.
Bytes tga(uint16_t w, uint16_t h, uint8_t bits, const Bytes& stored, uint8_t descriptor = 0) {
    Bytes b = {0, 0, 2, 0, 0, 0, 0, 0, 0, 0, 0, 0};
    b.insert(b.end(), {uint8_t(w), uint8_t(w >> 8), uint8_t(h), uint8_t(h >> 8), bits, descriptor});
    b.insert(b.end(), stored.begin(), stored.end());
    return b;
}

// A 20-byte pre-converted header (signature byte 0xFF or 0xFE) followed by the pixel bytes.
Bytes tg16(uint8_t sig, uint16_t w, uint16_t h, const Bytes& pixels) {
    Bytes b(20, 0);
    b[2] = sig;
    b[14] = uint8_t(w);
    b[15] = uint8_t(w >> 8);
    b[16] = uint8_t(h);
    b[17] = uint8_t(h >> 8);
    b.insert(b.end(), pixels.begin(), pixels.end());
    return b;
}

// Stored rows: red (B G R A = 00 00 FF FF) first, then blue (FF 00 00 FF).
const Bytes kRedThenBlue =
    tga(2, 2, 32, {0, 0, 255, 255, 0, 0, 255, 255, 255, 0, 0, 255, 255, 0, 0, 255});

class Tga : public vrx::test::AssetTest {
  protected:
    struct Out {
        int32_t ok, w, h, fmt, owned;
        void* pixels;
        Bytes bytes; // the pixels, copied
    };
    // Decodes `path`, copies `bytes_per_pixel` x w x h bytes out and releases owned pixels.
    static Out load(const std::string& path, int32_t keep32, size_t bytes_per_pixel) {
        Out o{};
        o.ok = vrx::assets::LoadTGA(path.c_str(), &o.w, &o.h, &o.pixels, &o.fmt, &o.owned, keep32);
        if (o.ok) {
            auto* p = static_cast<const uint8_t*>(o.pixels);
            o.bytes.assign(p, p + size_t(o.w) * size_t(o.h) * bytes_per_pixel);
            if (o.owned) vrx::engine::eng_free(o.pixels);
        } else {
            EXPECT_EQ(o.pixels, nullptr);
        }
        return o;
    }
    static Bytes words(std::initializer_list<uint16_t> ws) {
        Bytes b;
        for (uint16_t w : ws) b.insert(b.end(), {uint8_t(w), uint8_t(w >> 8)});
        return b;
    }
};

TEST_F(Tga, TrueColourRowsAreFlippedAndConverted) {
    struct Case {
        Bytes file;
        int32_t keep32;
        int32_t fmt;
        size_t bpp;
        Bytes expected;
    };
    const Case cases[] = {
        // Each channel keeps its top four bits; the rows come out swapped.
        {kRedThenBlue, 0, CF_RGBA4444, 2, words({0x00FF, 0x00FF, 0xF00F, 0xF00F})},
        {kRedThenBlue,
         1,
         CF_RGBA8888,
         4,
         {0, 0, 255, 255, 0, 0, 255, 255, 255, 0, 0, 255, 255, 0, 0, 255}},
        // 24-bit B G R = 07 03 FF: low bits dropped, not rounded.
        {tga(1, 1, 24, {0x07, 0x03, 0xFF}), 0, CF_RGB565, 2, words({0xF800})},
        {tga(1, 1, 24, {0x07, 0x03, 0xFF}), 1, CF_RGB888, 3, {0xFF, 0x03, 0x07}},
        {tga(1, 1, 24, {0xFF, 0xFF, 0x07}), 0, CF_RGB565, 2, words({0x07FF})},
        // The descriptor's top-down bit is not consulted: still flipped.
        {tga(1, 2, 24, {0, 0, 0xF8, 0xF8, 0, 0}, 0x20), 0, CF_RGB565, 2, words({0x001F, 0xF800})},
    };
    for (const Case& c : cases) {
        std::string path = put("t.tga", c.file);
        Out o = load(path, c.keep32, c.bpp);
        ASSERT_EQ(o.ok, 1);
        EXPECT_EQ(o.fmt, c.fmt);
        EXPECT_EQ(o.owned, 1);
        EXPECT_EQ(o.bytes, c.expected);
    }
    EXPECT_EQ(last_error(), "");
}

TEST_F(Tga, PreConvertedFilesKeepTheirWordsFromDiskAndFromAPack) {
    const Bytes px = words({1, 2, 3, 4, 0xF800, 0x07E0, 0x001F, 0xFFFF});
    const Bytes file = tg16(0xFE, 4, 2, px);
    for (int32_t keep32 : {0, 1}) {
        Out o = load(put("p.tg2", file), keep32, 2);
        ASSERT_EQ(o.ok, 1);
        EXPECT_EQ(o.w, 4);
        EXPECT_EQ(o.h, 2);
        EXPECT_EQ(o.fmt, CF_RGB565);
        EXPECT_EQ(o.owned, 1);
        EXPECT_EQ(o.bytes, px);
    }
    auto pack = write_v3z(V3zKind::VRKZ, {{"P.TG1", tg16(0xFF, 4, 2, px)}, {"Q.TG1", file, true}});
    VRX_SelectResourceBuffer(pack.bytes.data());
    Out in_place = load("P.TG1", 0, 2);
    ASSERT_EQ(in_place.ok, 1);
    EXPECT_EQ(in_place.fmt, CF_RGBA4444);
    EXPECT_EQ(in_place.owned, 0);
    EXPECT_EQ(in_place.pixels, pack.bytes.data() + pack.placements[0].offset + 20);
    EXPECT_EQ(in_place.bytes, px);
    Out inflated = load("Q.TG1", 0, 2);
    EXPECT_EQ(inflated.owned, 1);
    EXPECT_EQ(inflated.bytes, px);
}

TEST_F(Tga, PreConvertedEntryAtAnOddAddressIsCopied) {
    const Bytes px = words({0x1234, 0xABCD});
    auto pack = write_v3z(V3zKind::VRKZ, {{"X", {0}}, {"ODD.VTG", tg16(0xFE, 2, 1, px)}});
    ASSERT_EQ(pack.placements[1].offset % 2, 1u);
    VRX_SelectResourceBuffer(pack.bytes.data());
    long before = vrx::engine::alloc_outstanding();
    Out o = load("ODD.VTG", 0, 2);
    ASSERT_EQ(o.ok, 1);
    EXPECT_EQ(o.owned, 1);
    EXPECT_EQ(o.bytes, px);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
}

TEST_F(Tga, RejectedFilesReportTheirCauseAndLeaveNothing) {
    const std::string invalid =
        "LoadUncompressedTGA: Invalid information!!\n LoadTGA() malloc fail 0!!\n";
    Bytes origin = kRedThenBlue;
    origin[10] = 1; // y origin
    Bytes rle = kRedThenBlue;
    rle[2] = 10;
    Bytes cut = kRedThenBlue;
    cut.pop_back();
    Bytes header_only = tg16(0xFE, 1, 1, {});
    header_only.pop_back(); // 19 bytes: enough for a TGA header, not for this one
    struct Case {
        const char* what;
        Bytes file;
        std::string expected;
    };
    const Case cases[] = {
        {"16-bit true colour", tga(1, 1, 16, {0, 0}), invalid},
        {"8-bit true colour", tga(1, 1, 8, {0}), invalid},
        {"zero width", tga(0, 2, 32, {}), invalid},
        {"zero height", tga(2, 0, 24, {}), invalid},
        {"y origin", origin, ""},
        {"run-length", rle, ""},
        {"shorter than a header", Bytes(17, 0), ""},
        {"pixels cut short", cut,
         "LoadUncompressedTGA: file shorter than its pixels!!\n LoadTGA() malloc fail 0!!\n"},
        {"16-bit pixels cut short", tg16(0xFF, 2, 2, {1, 2, 3, 4, 5, 6, 7}),
         "LoadTGA: file shorter than its pixels!!\n"},
        {"16-bit header only", header_only, "LoadTGA: file shorter than its pixels!!\n"},
        {"16-bit zero size", tg16(0xFE, 0, 5, {}), "LoadTGA: Invalid information!!\n"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        std::string path = put("bad.tga", c.file);
        auto pack = write_v3z(V3zKind::VRKZ, {{"BAD.TGA", c.file}});
        for (bool from_pack : {false, true}) {
            VRX_SelectResourceBuffer(from_pack ? pack.bytes.data() : nullptr);
            long before = vrx::engine::alloc_outstanding();
            clear_last_error();
            EXPECT_EQ(load(path, 0, 2).ok, 0);
            EXPECT_EQ(last_error(), c.expected);
            EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
        }
    }
}

TEST_F(Tga, ConverterAllocationFailuresNameTheirBuffer) {
    struct Case {
        Bytes file;
        int32_t keep32;
        const char* bits;
    };
    const Case cases[] = {
        {kRedThenBlue, 0, "16"},
        {kRedThenBlue, 1, "32"},
        {tga(1, 1, 24, {1, 2, 3}), 0, "16"},
        {tga(1, 1, 24, {1, 2, 3}), 1, "24"},
    };
    for (const Case& c : cases) {
        auto pack = write_v3z(V3zKind::VRKZ, {{"A.TGA", c.file}});
        VRX_SelectResourceBuffer(pack.bytes.data()); // stored: the converter allocates first
        long before = vrx::engine::alloc_outstanding();
        clear_last_error();
        vrx::engine::alloc_fail_at(1, false);
        EXPECT_EQ(load("A.TGA", c.keep32, 2).ok, 0);
        vrx::engine::alloc_fail_at(0, false);
        EXPECT_EQ(last_error(), std::string("LoadUncompressedTGA: can not allocate ") + c.bits +
                                    " bit image buffer!!\n LoadTGA() malloc fail 0!!\n");
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    }
}

TEST_F(Tga, MissingFileFailsWithTheResourceMessage) {
    EXPECT_EQ(load(dir + "/none.tga", 0, 2).ok, 0);
    EXPECT_EQ(last_error(), "resourceGetData file " + dir + "/none.tga not find!!\n");
}

} // namespace
