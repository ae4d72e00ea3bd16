// LoadTGA: its converters, pre-converted files, rejections, and the writers' files read back.
// Most files are written byte by byte, so the decoder is checked against the format itself.
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "assets/asset_fixture.h"
#include "assets/tga.h"

namespace {

using namespace vrx::assets;
using vrx::engine::alloc_fail_at;
using vrx::engine::alloc_outstanding;
using namespace vrx::formats;
using Bytes = std::vector<uint8_t>;

// An 18-byte header (image type 2: true colour) followed by the stored pixels.
Bytes tga(uint8_t w, uint8_t h, uint8_t bits, const Bytes& px, uint8_t desc = 0, uint8_t type = 2) {
    Bytes b = {0, 0, type, 0, 0, 0, 0, 0, 0, 0, 0, 0, w, 0, h, 0, bits, desc};
    b.insert(b.end(), px.begin(), px.end());
    return b;
}

// A 20-byte pre-converted header (signature byte 0xFF or 0xFE) followed by the pixel bytes.
Bytes tg16(uint8_t sig, uint8_t w, uint8_t h, const Bytes& pixels) {
    Bytes b = {0, 0, sig, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, w, 0, h, 0, 0, 0};
    b.insert(b.end(), pixels.begin(), pixels.end());
    return b;
}

Bytes words(std::initializer_list<uint16_t> ws) {
    Bytes b;
    for (uint16_t w : ws) b.insert(b.end(), {uint8_t(w), uint8_t(w >> 8)});
    return b;
}

// Decodes a file: `size` bytes of its pixels and their format; none and -1 after a failure.
std::pair<Bytes, int32_t> decode(const std::string& path, int32_t keep32, size_t size) {
    int32_t w = 0, h = 0, fmt = -1, owned = 0;
    void* px = nullptr;
    if (!LoadTGA(path.c_str(), &w, &h, &px, &fmt, &owned, keep32)) return {{}, -1};
    auto* p = static_cast<const uint8_t*>(px);
    Bytes bytes(p, p + size);
    if (owned) vrx::engine::eng_free(px);
    return {bytes, fmt};
}

using Tga = vrx::test::AssetTest;

// Each file is decoded from disk and from a stored memory-pack entry.
TEST_F(Tga, FilesAreConvertedOrRefusedWithTheirCause) {
    // Stored rows: red (B G R A = 00 00 FF FF) first, then blue (FF 00 00 FF).
    const Bytes bgra = {0, 0, 255, 255, 0, 0, 255, 255, 255, 0, 0, 255, 255, 0, 0, 255};
    const Bytes red_blue = tga(2, 2, 32, bgra), one24 = tga(1, 1, 24, {0x07, 0x03, 0xFF});
    Bytes header_only = tg16(0xFE, 1, 1, {});
    header_only.pop_back(); // 19 bytes: enough for a TGA header, not for this one
    const std::string tail = " LoadTGA() malloc fail 0!!\n";
    const std::string lu = "LoadUncompressedTGA: ", invalid = lu + "Invalid information!!\n" + tail;
    const std::vector<Rgba> picture = {{10, 20, 30, 40}, {50, 60, 70, 80}}; // 1 x 2
    struct Case {
        Bytes file;
        int32_t mode; // 0 or 1: keep32; 2 or 3: the same with no memory for the converter
        int32_t fmt;  // -1: refused
        Bytes pixels;
        std::string error;
    };
    const Case cases[] = {
        // Rows come out top row first; each channel keeps its top four bits.
        {red_blue, 0, CF_RGBA4444, words({0x00FF, 0x00FF, 0xF00F, 0xF00F}), ""},
        // The same bytes, by chance: blue (R G B A = 00 00 FF FF) then red (FF 00 00 FF).
        {red_blue, 1, CF_RGBA8888, bgra, ""},
        // B G R = 07 03 FF: the low bits are dropped, not rounded.
        {one24, 0, CF_RGB565, words({0xF800}), ""},
        {one24, 1, CF_RGB888, {0xFF, 0x03, 0x07}, ""},
        // The descriptor's top-down bit is not consulted: still flipped.
        {tga(1, 2, 24, {0, 0, 0xF8, 0xF8, 0, 0}, 0x20), 0, CF_RGB565, words({0x001F, 0xF800}), ""},
        {tg16(0xFE, 2, 1, words({1, 0xF800})), 1, CF_RGB565, words({1, 0xF800}), ""},
        // The writers' files, top row first: R G B A or R G B bytes, or the words.
        {write_tga(1, 2, 32, picture), 1, CF_RGBA8888, {10, 20, 30, 40, 50, 60, 70, 80}, ""},
        {write_tga(1, 2, 24, picture), 1, CF_RGB888, {10, 20, 30, 50, 60, 70}, ""},
        {write_tg16(Tg16Kind::RGB565, 2, 1, {1, 0x8000}), 0, CF_RGB565, {1, 0, 0, 0x80}, ""},
        {write_tg16(Tg16Kind::RGBA4444, 1, 1, {0xF00F}), 0, CF_RGBA4444, {0x0F, 0xF0}, ""},
        // Refused: 16-bit true colour, zero height, run-length, shorter than any header.
        {tga(1, 1, 16, {0, 0}), 0, -1, {}, invalid},
        {tga(2, 0, 24, {}), 0, -1, {}, invalid},
        {tga(2, 2, 32, bgra, 0, 10), 0, -1, {}, ""},
        {Bytes(17, 0), 0, -1, {}, ""},
        {tga(1, 1, 24, {0, 0}), 0, -1, {}, lu + "file shorter than its pixels!!\n" + tail},
        {header_only, 0, -1, {}, "LoadTGA: file shorter than its pixels!!\n"},
        {tg16(0xFE, 0, 5, {}), 0, -1, {}, "LoadTGA: Invalid information!!\n"},
        {red_blue, 2, -1, {}, lu + "can not allocate 16 bit image buffer!!\n" + tail},
        {red_blue, 3, -1, {}, lu + "can not allocate 32 bit image buffer!!\n" + tail},
        {one24, 2, -1, {}, lu + "can not allocate 16 bit image buffer!!\n" + tail},
        {one24, 3, -1, {}, lu + "can not allocate 24 bit image buffer!!\n" + tail},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(&c - cases);
        const std::string path = put("t.tga", c.file);
        auto pack = write_v3z(V3zKind::VRKZ, {{"T.TGA", c.file}});
        for (bool from_pack : {false, true}) {
            VRX_SelectResourceBuffer(from_pack ? pack.bytes.data() : nullptr);
            const long before = alloc_outstanding();
            clear_last_error();
            // A stored entry is used in place; a file's bytes are the first allocation.
            alloc_fail_at(c.mode < 2 ? 0 : from_pack ? 1 : 2, false);
            EXPECT_EQ(decode(path, c.mode % 2, c.pixels.size()), std::make_pair(c.pixels, c.fmt));
            alloc_fail_at(0, false);
            EXPECT_EQ(last_error(), c.error);
            EXPECT_EQ(alloc_outstanding(), before);
        }
    }
}

TEST_F(Tga, PreConvertedWordsAtAnOddAddressAreCopied) {
    const Bytes px = words({0x1234, 0xF00F});
    // X (one byte) puts ODD's pixels at an odd address, where they cannot be read as words.
    auto pack = write_v3z(V3zKind::VRKZ, {{"X", {0}}, {"ODD.TG1", tg16(0xFF, 2, 1, px)}});
    VRX_SelectResourceBuffer(pack.bytes.data());
    const long before = alloc_outstanding();
    EXPECT_EQ(decode("ODD.TG1", 0, 4), std::make_pair(px, int32_t{CF_RGBA4444}));
    alloc_fail_at(1, false);
    EXPECT_EQ(decode("ODD.TG1", 0, 4).second, -1);
    alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "LoadTGA: can not allocate 16 bit image buffer!!\n");
    EXPECT_EQ(alloc_outstanding(), before);
}

} // namespace
