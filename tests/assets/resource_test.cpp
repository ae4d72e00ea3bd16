// resourceGetData over memory packs, pack files and plain files, and pack selection.
#include <gtest/gtest.h>

#include <cctype>
#include <cstring>
#include <string>
#include <vector>

#include "assets/resource.h"
#include "assets/asset_fixture.h"
#include "engine/alloc.h"

namespace {

using vrx::assets::resourceGetData;
using vrx::engine::g_eng;
using vrx::formats::V3zEntry;
using vrx::formats::V3zKind;
using vrx::formats::V3zPack;
using vrx::formats::write_v3z;
using vrx::test::poke32;

const std::vector<uint8_t> kWood = {'w', 'o', 'o', 'd', ' ', 'g', 'r', 'a', 'i', 'n', '!'};
const std::vector<uint8_t> kDisk = {'f', 'r', 'o', 'm', ' ', 'd', 'i', 's', 'k'};

// 600 bytes that compress well, so a packed entry really differs from its content.
std::vector<uint8_t> long_content() {
    std::vector<uint8_t> v(600);
    for (size_t i = 0; i < v.size(); ++i) v[i] = static_cast<uint8_t>("abcab"[i % 5]);
    return v;
}

class Resource : public vrx::test::AssetTest {
  protected:
    struct Got {
        bool found;
        std::vector<uint8_t> bytes;
        const uint8_t* ptr;
        int32_t owned;
    };
    // Reads a path and releases what the engine handed over.
    static Got get(const std::string& path) {
        uint32_t size = 123;
        int32_t owned = 7;
        uint8_t* p = resourceGetData(path.c_str(), &size, &owned);
        Got g{p != nullptr, {}, p, owned};
        if (p) g.bytes.assign(p, p + size);
        if (!p) {
            EXPECT_EQ(size, 0u);
        }
        if (p && owned) vrx::engine::eng_free(p);
        return g;
    }
    std::string select_file(const V3zPack& pack) {
        std::string path = put("pack.v3z", pack.bytes);
        EXPECT_EQ(VRX_SelectResourceFile(path.c_str()), 0);
        return path;
    }
};

TEST_F(Resource, MemoryPackMatchesBaseNameWithoutCaseAndHandsStoredBytesInPlace) {
    V3zPack pack = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}});
    ASSERT_EQ(VRX_SelectResourceBuffer(pack.bytes.data()), 0);
    const uint8_t* in_place = pack.bytes.data() + pack.placements[0].offset;
    for (const char* path : {"\\data\\wood.tga", "wood.TGA", "\\data\\wood.tga"}) {
        Got g = get(path);
        ASSERT_TRUE(g.found) << path;
        EXPECT_EQ(g.ptr, in_place);
        EXPECT_EQ(g.owned, 0);
        EXPECT_EQ(g.bytes, kWood);
    }
    EXPECT_EQ(last_error(), "");
}

TEST_F(Resource, PackFileComparesTheWholePath) {
    select_file(write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}}));
    Got g = get("wood.tga");
    ASSERT_TRUE(g.found);
    EXPECT_EQ(g.owned, 1);
    EXPECT_EQ(g.bytes, kWood);
    EXPECT_FALSE(get("\\data\\wood.tga").found);
    EXPECT_EQ(last_error(), "resourceGetData file \\data\\wood.tga not find!!\n");
}

TEST_F(Resource, MissingNamesReportOnlyWhereTheFormatSays) {
    struct Case {
        V3zKind kind;
        bool memory;
        const char* expected;
    };
    const Case cases[] = {
        {V3zKind::VRK2, true, "v3z_err NOPE.TGA\nresourceGetData file \\x\\NOPE.TGA not find!!\n"},
        {V3zKind::VRKZ, true, "resourceGetData file \\x\\NOPE.TGA not find!!\n"},
        {V3zKind::VRK2, false, "resourceGetData file \\x\\NOPE.TGA not find!!\n"},
    };
    for (const Case& c : cases) {
        V3zPack pack = write_v3z(c.kind, {{"WOOD.TGA", kWood}});
        if (c.memory)
            VRX_SelectResourceBuffer(pack.bytes.data());
        else
            select_file(pack);
        clear_last_error();
        EXPECT_FALSE(get("\\x\\NOPE.TGA").found);
        EXPECT_EQ(last_error(), c.expected);
        VRX_SelectResourceBuffer(nullptr);
        VRX_SelectResourceFile(nullptr);
    }
}

TEST_F(Resource, ForeignMemoryBufferIsReportedAndSkipped) {
    std::vector<uint8_t> junk = {'A', 'B', 'C', 'D', 0, 0, 0, 0, 0, 0, 0, 0};
    VRX_SelectResourceBuffer(junk.data());
    put("wood.tga", kDisk);
    Got g = get(dir + "/wood.tga");
    ASSERT_TRUE(g.found);
    EXPECT_EQ(g.bytes, kDisk);
    EXPECT_EQ(last_error(), "wrong v3z ID 44434241\n");
}

TEST_F(Resource, CompressedEntriesInflateFromEitherPack) {
    const std::vector<uint8_t> content = long_content();
    for (V3zKind kind : {V3zKind::VRKZ, V3zKind::VRK2}) {
        V3zPack pack = write_v3z(kind, {{"a.bin", kWood}, {"LONG.BIN", content, true}});
        ASSERT_LT(pack.placements[1].packed_size, content.size());
        VRX_SelectResourceBuffer(pack.bytes.data());
        Got m = get("\\dir\\long.bin");
        EXPECT_TRUE(m.found && m.owned == 1 && m.bytes == content);
        VRX_SelectResourceBuffer(nullptr);
        select_file(pack);
        Got f = get("long.bin");
        EXPECT_TRUE(f.found && f.owned == 1 && f.bytes == content);
        VRX_SelectResourceFile(nullptr);
    }
    EXPECT_EQ(last_error(), "");
}

TEST_F(Resource, MemoryPackIsSearchedBeforeThePackFile) {
    select_file(write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kDisk}}));
    V3zPack mem = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}});
    VRX_SelectResourceBuffer(mem.bytes.data());
    EXPECT_EQ(get("wood.tga").bytes, kWood);
    VRX_SelectResourceBuffer(nullptr);
    EXPECT_EQ(get("wood.tga").bytes, kDisk);
}

TEST_F(Resource, DamagedPackedEntryFallsBackToThePlainFile) {
    put("wood.tga", kDisk);
    const std::string path = dir + "\\wood.tga";
    // Memory packs are searched by base name, pack files by the whole path.
    V3zPack mem = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", long_content(), true}});
    V3zPack pack = write_v3z(V3zKind::VRK2, {{path, long_content(), true}});
    // Cut the streams short: they no longer reach their end and checksum.
    poke32(mem.bytes, mem.placements[0].dir_entry + 24, mem.placements[0].packed_size - 6);
    poke32(pack.bytes, pack.placements[0].dir_entry + 36, pack.placements[0].packed_size - 6);

    VRX_SelectResourceBuffer(mem.bytes.data());
    EXPECT_EQ(get(path).bytes, kDisk);
    EXPECT_EQ(last_error(), "Z file wood.tga damaged!!\n");
    VRX_SelectResourceBuffer(nullptr);

    clear_last_error();
    select_file(pack);
    EXPECT_EQ(get(path).bytes, kDisk);
    EXPECT_EQ(last_error(), "Z file " + path + " damaged!!\n");
}

TEST_F(Resource, InvalidEntriesAreRejectedWithAMessage) {
    struct Case {
        const char* what;
        uint32_t field; // offset within the VRKZ directory entry, or 99 to unterminate the name
        uint32_t value;
        bool memory;
        const char* expected;
    };
    constexpr uint32_t kSize = 20, kPacked = 24, kOffset = 28;
    const Case cases[] = {
        {"stored size differs", kSize, 10, true,
         "v3z stored entry WOOD.TGA has size 10 but packed size 11!!\n"},
        {"stored size differs", kPacked, 12, false,
         "v3z stored entry WOOD.TGA has size 11 but packed size 12!!\n"},
        {"beyond the cap", kOffset, 0x0FFFFFFA, true, "v3z entry WOOD.TGA out of range!!\n"},
        {"beyond the file", kOffset, 0x40, false, "v3z entry WOOD.TGA out of range!!\n"},
        {"name fills its field", 99, 0, true, "v3z entry 0 name not terminated!!\n"},
        {"name fills its field", 99, 0, false, "v3z entry 0 name not terminated!!\n"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        V3zPack pack = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}});
        uint32_t entry = pack.placements[0].dir_entry;
        if (c.field == 99)
            std::memset(pack.bytes.data() + entry, 'W', 16);
        else
            poke32(pack.bytes, entry + c.field, c.value);
        if (c.memory)
            VRX_SelectResourceBuffer(pack.bytes.data());
        else
            select_file(pack);
        clear_last_error();
        EXPECT_FALSE(get("WOOD.TGA").found);
        EXPECT_EQ(last_error(),
                  std::string(c.expected) + "resourceGetData file WOOD.TGA not find!!\n");
        VRX_SelectResourceBuffer(nullptr);
        VRX_SelectResourceFile(nullptr);
    }
}

TEST_F(Resource, MemoryDirectoryBeyondTheBoundIsRefused) {
    V3zPack pack = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}});
    // 8 Mi entries of 32 bytes fill the whole bound; with the directory offset they pass it.
    poke32(pack.bytes, 4, 0x00800000);
    VRX_SelectResourceBuffer(pack.bytes.data());
    EXPECT_FALSE(get("WOOD.TGA").found);
    EXPECT_EQ(last_error(),
              "v3z directory out of range!!\nresourceGetData file WOOD.TGA not find!!\n");
}

TEST_F(Resource, FailedSelectionKeepsThePreviousPackFile) {
    std::string good = select_file(write_v3z(V3zKind::VRK2, {{"WOOD.TGA", kWood}}));
    V3zPack shortdir = write_v3z(V3zKind::VRKZ, {{"A", kWood}, {"B", kWood}});
    poke32(shortdir.bytes, 4, 3); // one entry more than the directory holds
    V3zPack badid = write_v3z(V3zKind::VRKZ, {{"A", kWood}});
    badid.bytes[3] = 'X';
    const std::vector<uint8_t> header_only = {'V', 'R', 'K', 'Z', 0, 0, 0};
    const std::string too_long(600, 'a');
    const std::string refused[] = {put("short.v3z", shortdir.bytes), put("badid.v3z", badid.bytes),
                                   put("tiny.v3z", header_only), dir + "/missing.v3z", too_long};
    for (const std::string& path : refused) {
        clear_last_error();
        EXPECT_EQ(VRX_SelectResourceFile(path.c_str()), -1) << path;
        EXPECT_EQ(std::string(g_eng.pack_path), good);
        EXPECT_EQ(get("wood.tga").bytes, kWood);
    }
    EXPECT_EQ(last_error(), "Pack file path too long in VRX_SelectResourceFile!!\n");

    ASSERT_EQ(VRX_SelectResourceFile(nullptr), 0);
    EXPECT_EQ(g_eng.pack_dir, nullptr);
    EXPECT_EQ(g_eng.pack_path[0], '\0');
    EXPECT_FALSE(get("wood.tga").found);
}

TEST_F(Resource, LongestNamesOfEachLayoutMatch) {
    const std::string n15 = "ABCDEFGHIJK.TGA", n30 = "ABCDEFGHIJKLMNOPQRSTUVWXYZ.TGA";
    ASSERT_EQ(n15.size(), 15u);
    ASSERT_EQ(n30.size(), 30u);
    V3zPack z = write_v3z(V3zKind::VRKZ, {{n15, kWood}});
    V3zPack k2 = write_v3z(V3zKind::VRK2, {{n30, kDisk}});
    VRX_SelectResourceBuffer(z.bytes.data());
    EXPECT_EQ(get("x\\abcdefghijk.tga").bytes, kWood);
    VRX_SelectResourceBuffer(k2.bytes.data());
    EXPECT_EQ(get("abcdefghijklmnopqrstuvwxyz.tga").bytes, kDisk);
    EXPECT_EQ(last_error(), "");
}

TEST_F(Resource, PlainFilesAreFoundWhateverTheCaseOfTheirPath) {
    put("Mixed.Bin", kDisk);
    std::string upper = dir + "\\MIXED.BIN";
    for (char& ch : upper) ch = static_cast<char>(std::toupper(static_cast<unsigned char>(ch)));
    Got g = get(upper);
    ASSERT_TRUE(g.found);
    EXPECT_EQ(g.owned, 1);
    EXPECT_EQ(g.bytes, kDisk);
    put("empty.bin", {});
    EXPECT_TRUE(get(dir + "/empty.bin").bytes.empty());
}

TEST_F(Resource, AllocationFailuresAreReportedAndLeaveNothing) {
    const std::vector<uint8_t> content = long_content();
    V3zPack pack = write_v3z(V3zKind::VRKZ, {{"S.BIN", kWood}, {"C.BIN", content, true}});
    struct Case {
        const char* name;
        bool memory;
        long fail_at;
        const char* first;
    };
    const Case cases[] = {
        {"C.BIN", true, 1, "malloc fail!!\n"},  // inflation buffer
        {"S.BIN", false, 1, "malloc fail!!\n"}, // entry bytes
        {"C.BIN", false, 1, "malloc fail!!\n"}, // packed bytes
        {"C.BIN", false, 2, "malloc fail!!\n"}, // inflation buffer
    };
    for (const Case& c : cases) {
        if (c.memory)
            VRX_SelectResourceBuffer(pack.bytes.data());
        else
            select_file(pack);
        long before = vrx::engine::alloc_outstanding();
        clear_last_error();
        vrx::engine::alloc_fail_at(c.fail_at, false);
        EXPECT_FALSE(get(c.name).found);
        vrx::engine::alloc_fail_at(0, false);
        EXPECT_EQ(last_error(),
                  std::string(c.first) + "resourceGetData file " + c.name + " not find!!\n");
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
        VRX_SelectResourceBuffer(nullptr);
        VRX_SelectResourceFile(nullptr);
    }
    std::string plain = put("plain.bin", kDisk);
    clear_last_error();
    long before = vrx::engine::alloc_outstanding();
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_FALSE(get(plain).found);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for " + plain + " fail !!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
}

} // namespace
