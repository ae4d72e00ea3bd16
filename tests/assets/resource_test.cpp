// resourceGetData over memory packs, pack files and plain files, pack selection, and the
// rejection of every kind of damaged pack.
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "assets/asset_fixture.h"
#include "assets/resource.h"

namespace {

using namespace vrx::formats;
using Bytes = std::vector<uint8_t>;

const Bytes kWood(11, 'w'), kDisk(9, 'd');

// Reads a path: its bytes, or nothing when not found; bytes the engine handed over are released.
std::optional<Bytes> get(const std::string& path) {
    uint32_t size = 123;
    int32_t owned = 7;
    uint8_t* p = vrx::assets::resourceGetData(path.c_str(), &size, &owned);
    EXPECT_TRUE(p || (size == 0 && owned == 0)) << path;
    if (!p) return std::nullopt;
    Bytes bytes(p, p + size);
    if (owned) vrx::engine::eng_free(p);
    return bytes;
}

using Resource = vrx::test::AssetTest;

TEST_F(Resource, MemoryPackMatchesBaseNamesAndPackFileWholePaths) {
    V3zPack mem = write_v3z(V3zKind::VRKZ, {{"WOOD.TGA", kWood}, {"ABCDEFGHIJK.TGA", kDisk}});
    V3zPack file =
        write_v3z(V3zKind::VRK2, {{"WOOD.TGA", kDisk}, {"ABCDEFGHIJKLMNOPQRSTUVWXYZ.TGA", kWood}});
    ASSERT_EQ(VRX_SelectResourceFile(put("p.v3z", file.bytes).c_str()), 0);
    VRX_SelectResourceBuffer(mem.bytes.data());
    // The memory pack comes before the pack file.
    EXPECT_EQ(get("\\data\\wood.TGA"), kWood);
    EXPECT_EQ(get("x\\abcdefghijk.tga"), kDisk); // the longest VRKZ name
    VRX_SelectResourceBuffer(nullptr);
    EXPECT_EQ(get("wood.tga"), kDisk);
    EXPECT_EQ(get("abcdefghijklmnopqrstuvwxyz.tga"), kWood); // the longest VRK2 name
    put("empty.bin", {});
    EXPECT_EQ(get(dir + "/EMPTY.BIN"), Bytes{}); // plain files are found in any case
    EXPECT_EQ(last_error(), "");
    EXPECT_FALSE(get("\\data\\wood.tga"));
    EXPECT_EQ(last_error(), "resourceGetData file \\data\\wood.tga not find!!\n");
}

// The pack holds ABCDEFGHIJK.TGA: 11 bytes at 12, its directory entry at 23 (VRKZ: name field
// of 16, then packed flag at 39, size at 43, packed size at 47, offset at 51). After the
// damage the lookup leaks nothing and falls through to a plain file that does not exist.
TEST_F(Resource, DamagedPacksAreReportedAndSkipped) {
    struct Case {
        V3zKind kind;
        bool file; // else the memory pack
        uint32_t at, value;
        long fail_at; // the allocation that fails, if any
        const char* expected;
    };
    const Case cases[] = {
        {V3zKind::VRK2, false, 23, 'X', 0, "v3z_err abcdefghijk.tga\n"}, // renamed
        {V3zKind::VRKZ, false, 23, 'X', 0, ""},                          // renamed
        {V3zKind::VRKZ, false, 0, 0x5A4B5241, 0, "wrong v3z ID 5a4b5241\n"},
        // 8 Mi entries of 32 bytes fill the whole bound; with the directory offset they pass it.
        {V3zKind::VRKZ, false, 4, 0x00800000, 0, "v3z directory out of range!!\n"},
        {V3zKind::VRKZ, false, 43, 10, 0,
         "v3z stored entry ABCDEFGHIJK.TGA has size 10 but packed size 11!!\n"},
        {V3zKind::VRKZ, false, 51, 0x0FFFFFFA, 0, "v3z entry ABCDEFGHIJK.TGA out of range!!\n"},
        {V3zKind::VRKZ, true, 51, 0x40, 0, "v3z entry ABCDEFGHIJK.TGA out of range!!\n"},
        {V3zKind::VRKZ, true, 35, 0x41414141, 0, "v3z entry 0 name not terminated!!\n"}, // ".TGA"
        {V3zKind::VRKZ, true, 0, 0x5A4B5256, 1, "malloc fail!!\n"}, // intact: "VRKZ"
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(&c - cases);
        V3zPack pack = write_v3z(c.kind, {{"ABCDEFGHIJK.TGA", kWood}});
        poke32(pack.bytes, c.at, c.value);
        VRX_SelectResourceBuffer(c.file ? nullptr : pack.bytes.data());
        ASSERT_EQ(VRX_SelectResourceFile(c.file ? put("p.v3z", pack.bytes).c_str() : nullptr), 0);
        clear_last_error();
        const long before = vrx::engine::alloc_outstanding();
        vrx::engine::alloc_fail_at(c.fail_at, false);
        EXPECT_FALSE(get("abcdefghijk.tga"));
        vrx::engine::alloc_fail_at(0, false);
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
        EXPECT_EQ(last_error(),
                  std::string(c.expected) + "resourceGetData file abcdefghijk.tga not find!!\n");
    }
}

TEST_F(Resource, FailedSelectionKeepsThePreviousPackFile) {
    V3zPack good = write_v3z(V3zKind::VRK2, {{"WOOD.TGA", kWood}});
    ASSERT_EQ(VRX_SelectResourceFile(put("good.v3z", good.bytes).c_str()), 0);
    Bytes shortdir = write_v3z(V3zKind::VRKZ, {{"A", kWood}}).bytes, badid = shortdir;
    shortdir[4] = 2; // one entry more than the directory holds
    badid[3] = 'X';
    const std::string refused[] = {put("short.v3z", shortdir), put("badid.v3z", badid),
                                   put("tiny.v3z", {'V', 'R', 'K', 'Z', 0, 0, 0}),
                                   dir + "/missing.v3z", std::string(600, 'a')};
    for (const std::string& path : refused) {
        clear_last_error();
        EXPECT_EQ(VRX_SelectResourceFile(path.c_str()), -1) << path;
        EXPECT_EQ(get("wood.tga"), kWood);
    }
    EXPECT_EQ(last_error(), "Pack file path too long in VRX_SelectResourceFile!!\n");
    ASSERT_EQ(VRX_SelectResourceFile(nullptr), 0);
    EXPECT_FALSE(get("wood.tga"));
}

} // namespace
