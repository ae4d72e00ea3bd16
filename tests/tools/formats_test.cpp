// The format writers: their bytes against the layouts written out by hand, their refusals,
// and round trips through the engine's readers.
#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "assets/resource.h"
#include "assets/tga.h"
#include "engine/alloc.h"
#include "formats/tga_writer.h"
#include "formats/v3z_writer.h"
#include "support/engine_fixture.h"

namespace {

using namespace vrx::formats;
using Bytes = std::vector<uint8_t>;

TEST(FormatsV3z, HeaderDataAndDirectoryFollowTheLayout) {
    V3zPack z = write_v3z(V3zKind::VRKZ, {{"AB", {1, 2, 3}}, {"C", {9}}});
    const Bytes expected = {
        'V', 'R', 'K', 'Z', 2, 0, 0, 0, 16, 0, 0, 0, // header: 2 entries, directory at 16
        1,   2,   3,   9,                            // entries' bytes
        'A', 'B', 0,   0,   0, 0, 0, 0, 0,  0, 0, 0, 0,  0, 0, 0, // name field
        0,   0,   0,   0,   3, 0, 0, 0, 3,  0, 0, 0, 12, 0, 0, 0, // stored, size, packed, offset
        'C', 0,   0,   0,   0, 0, 0, 0, 0,  0, 0, 0, 0,  0, 0, 0, //
        0,   0,   0,   0,   1, 0, 0, 0, 1,  0, 0, 0, 15, 0, 0, 0};
    EXPECT_EQ(z.bytes, expected);
    EXPECT_EQ(z.dir_offset, 16u);
    EXPECT_EQ(z.placements[1].dir_entry, 48u);

    V3zPack k2 = write_v3z(V3zKind::VRK2, {{"N", {7, 7}, true}});
    ASSERT_EQ(k2.bytes.size(), 12u + k2.placements[0].packed_size + 44u);
    const uint8_t* e = k2.bytes.data() + k2.dir_offset;
    EXPECT_EQ(Bytes(k2.bytes.begin(), k2.bytes.begin() + 4), (Bytes{'V', 'R', 'K', '2'}));
    EXPECT_EQ(e[0], 'N');
    EXPECT_EQ(e[30], 0);
    EXPECT_EQ(e[31], 1);                                      // packed
    EXPECT_EQ(e[32], 2);                                      // size
    EXPECT_EQ(uint32_t{e[36]}, k2.placements[0].packed_size); // packed size
    EXPECT_EQ(e[40], 12);                                     // offset
    EXPECT_EQ(k2.bytes[12], 0x78);                            // zlib header, 32 KB window
}

TEST(FormatsV3z, NamesMustFitTheirField) {
    EXPECT_THROW(write_v3z(V3zKind::VRKZ, {{std::string(16, 'A'), {}}}), std::invalid_argument);
    EXPECT_THROW(write_v3z(V3zKind::VRK2, {{std::string(31, 'A'), {}}}), std::invalid_argument);
    EXPECT_THROW(write_v3z(V3zKind::VRK2, {{"", {}}}), std::invalid_argument);
    EXPECT_NO_THROW(write_v3z(V3zKind::VRKZ, {{std::string(15, 'A'), {}}}));
}

TEST(FormatsTga, TrueColourIsStoredBottomRowFirst) {
    const std::vector<Rgba> picture = {{1, 2, 3, 4}, {5, 6, 7, 8}}; // 1 x 2: top, bottom
    const Bytes t32 = write_tga(1, 2, 32, picture);
    const Bytes expected32 = {0, 0, 2, 0,  0, 0, 0, 0, 0, 0, 0, 0, 1,
                              0, 2, 0, 32, 8, 7, 6, 5, 8, 3, 2, 1, 4};
    EXPECT_EQ(t32, expected32);
    const Bytes t24 = write_tga(1, 2, 24, picture);
    EXPECT_EQ(Bytes(t24.begin() + 16, t24.end()), (Bytes{24, 0, 7, 6, 5, 3, 2, 1}));
    EXPECT_THROW(write_tga(1, 1, 16, {{}}), std::invalid_argument);
    EXPECT_THROW(write_tga(2, 1, 24, {{}}), std::invalid_argument);
    EXPECT_THROW(write_tga(0, 1, 24, {}), std::invalid_argument);
}

TEST(FormatsTga, PreConvertedHeaderAndWords) {
    const Bytes b = write_tg16(Tg16Kind::RGB565, 2, 1, {0x1234, 0xF800});
    const Bytes expected = {0, 0, 0xFE, 0, 0, 0, 0, 0, 0,    0,    0,    0,
                            0, 0, 2,    0, 1, 0, 0, 0, 0x34, 0x12, 0x00, 0xF8};
    EXPECT_EQ(b, expected);
    EXPECT_EQ(write_tg16(Tg16Kind::RGBA4444, 1, 1, {0})[2], 0xFF);
}

class FormatsRoundTrip : public vrx::test::EngineTest {
  protected:
    void TearDown() override {
        VRX_SelectResourceBuffer(nullptr);
        EngineTest::TearDown();
    }
};

TEST_F(FormatsRoundTrip, EngineReadsBackWhatTheWritersWrite) {
    const std::vector<Rgba> picture = {{10, 20, 30, 40},     {50, 60, 70, 80},
                                       {90, 100, 110, 120},  {130, 140, 150, 160},
                                       {170, 180, 190, 200}, {210, 220, 230, 240}};
    Bytes rgba;
    for (const Rgba& p : picture) rgba.insert(rgba.end(), {p.r, p.g, p.b, p.a});
    Bytes rgb;
    for (const Rgba& p : picture) rgb.insert(rgb.end(), {p.r, p.g, p.b});
    const std::vector<uint16_t> words = {1, 0x8000, 3, 0xFFFF, 5, 6};
    Bytes word_bytes;
    for (uint16_t w : words) word_bytes.insert(word_bytes.end(), {uint8_t(w), uint8_t(w >> 8)});

    for (V3zKind kind : {V3zKind::VRKZ, V3zKind::VRK2}) {
        for (bool compress : {false, true}) {
            V3zPack pack =
                write_v3z(kind, {{"A.TGA", write_tga(3, 2, 32, picture), compress},
                                 {"B.TGA", write_tga(3, 2, 24, picture), compress},
                                 {"C.TG1", write_tg16(Tg16Kind::RGB565, 3, 2, words), compress}});
            VRX_SelectResourceBuffer(pack.bytes.data());
            struct Case {
                const char* name;
                size_t bpp;
                int32_t fmt;
                const Bytes& expected;
            };
            const Case cases[] = {{"A.TGA", 4, vrx::assets::CF_RGBA8888, rgba},
                                  {"B.TGA", 3, vrx::assets::CF_RGB888, rgb},
                                  {"C.TG1", 2, vrx::assets::CF_RGB565, word_bytes}};
            for (const Case& c : cases) {
                int32_t w = 0, h = 0, fmt = -1, owned = -1;
                void* px = nullptr;
                ASSERT_EQ(vrx::assets::LoadTGA(c.name, &w, &h, &px, &fmt, &owned, 1), 1);
                EXPECT_EQ(w, 3);
                EXPECT_EQ(h, 2);
                EXPECT_EQ(fmt, c.fmt);
                auto* p = static_cast<const uint8_t*>(px);
                EXPECT_EQ(Bytes(p, p + 6 * c.bpp), c.expected) << c.name;
                if (owned) vrx::engine::eng_free(px);
            }
        }
    }
    EXPECT_EQ(last_error(), "");
}

} // namespace
