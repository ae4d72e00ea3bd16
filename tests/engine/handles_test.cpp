// Kind checks, the live-record registry and their messages.
#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "engine/handles.h"
#include "engine/state.h"
#include "support/engine_fixture.h"

using namespace vrx::engine;
using vrx::test::EngineTest;

namespace {

using CheckFn = uint32_t (*)(const void*) noexcept;

struct CheckCase {
    const char* name;
    CheckFn check;
    uint32_t tag;
    const char* wrong; // message for a live record of another kind (and for a stale one)
    const char* null_msg;
};

// A world-tagged record stands in for "another kind" for every check but chk_world,
// which gets a window.
const CheckCase kChecks[] = {
    {"world", chk_world, TAG_WORLD, "The ID is not ID_WORLD.\n", "Wrong World Handle.\n"},
    {"object", chk_object, TAG_OBJECT, "This ID is not ID_OBJECT --- 57524C44 !!\n",
     "Wrong Object Handle : 0\n"},
    {"camera", chk_camera, TAG_CAMERA, "This ID is not ID_CAMERA !!\n",
     "Wrong Camera Handle : 0\n"},
    {"material", chk_material, TAG_MATERIAL, "The ID is not ID_MATERIAL.\n",
     "Wrong Material Handle.\n"},
    {"texture", chk_texture, TAG_TEXTURE, "The ID is not ID_TEXT.\n", "Wrong Texture Handle.\n"},
    {"omni", chk_omni, TAG_OMNI, "The ID is not ID_OMNI_LIGHT.\n", "Wrong Omni Light Handle.\n"},
    {"image", chk_image, TAG_IMAGE, "This ID is not ID_IMAGE !!\n", "Wrong Image Handle : 0\n"},
    {"window", chk_window, TAG_VPORT, "This ID is not ID_VPORT !!\n", "Wrong Window Handle : 0\n"},
    {"billboard", chk_billboard, TAG_BILLBOARD, "The ID is not ID_BILLBOARD.\n",
     "Wrong Billboardmation Handle.\n"},
};

// A record of any kind, for registering by hand.
struct FakeRecord {
    uint32_t tag;
    uint32_t payload[3];
};

class HandleCheck : public EngineTest, public ::testing::WithParamInterface<CheckCase> {};

TEST_P(HandleCheck, AcceptsItsKindRefusesOthersNullAndStale) {
    const CheckCase& c = GetParam();
    FakeRecord own{c.tag, {}};
    FakeRecord other{c.tag == TAG_WORLD ? TAG_VPORT : TAG_WORLD, {}};
    ASSERT_TRUE(registry_add(&own, own.tag));
    ASSERT_TRUE(registry_add(&other, other.tag));

    EXPECT_EQ(c.check(&own), 0u);
    EXPECT_EQ(last_error(), "");

    EXPECT_EQ(c.check(nullptr), 1u);
    EXPECT_EQ(last_error(), c.null_msg);

    clear_last_error();
    EXPECT_EQ(c.check(&other), 1u);
    EXPECT_EQ(last_error(), c.wrong);

    // Once unregistered, the same address is refused without its memory being read,
    // even though its tag word still holds the right value.
    registry_remove(&own);
    clear_last_error();
    EXPECT_EQ(c.check(&own), 1u);
    if (c.tag == TAG_OBJECT)
        EXPECT_EQ(last_error(), "This ID is not ID_OBJECT ---        0 !!\n");
    else
        EXPECT_EQ(last_error(), c.wrong);
    registry_remove(&other);
}

INSTANTIATE_TEST_SUITE_P(AllKinds, HandleCheck, ::testing::ValuesIn(kChecks),
                         [](const auto& p) { return std::string(p.param.name); });

TEST_F(EngineTest, GarbagePointersAreRefusedWithoutBeingRead) {
    // Addresses that are not records at all: reading any of them would fault or trip ASan.
    long before = alloc_outstanding();
    auto* freed = new_record<vrx::render::VPORT>();
    ASSERT_NE(freed, nullptr);
    EXPECT_EQ(registry_tag(freed), TAG_VPORT);
    free_record(freed);
    EXPECT_EQ(alloc_outstanding(), before);
    const void* garbage[] = {reinterpret_cast<void*>(0x10), reinterpret_cast<void*>(~uintptr_t{0}),
                             freed};
    for (const void* p : garbage) {
        clear_last_error();
        EXPECT_EQ(chk_object(p), 1u);
        EXPECT_EQ(last_error(), "This ID is not ID_OBJECT ---        0 !!\n");
    }
}

TEST(Registry, GrowsAndKeepsEveryEntryThroughRemovals) {
    constexpr int kCount = 5000;
    std::vector<FakeRecord> recs(kCount);
    long before = registry_size();
    for (int i = 0; i < kCount; ++i) ASSERT_TRUE(registry_add(&recs[i], 0x1000u + i));
    EXPECT_EQ(registry_size(), before + kCount);
    for (int i = 0; i < kCount; i += 2) registry_remove(&recs[i]);
    for (int i = 0; i < kCount; ++i)
        ASSERT_EQ(registry_tag(&recs[i]), i % 2 ? 0x1000u + i : 0u) << i;
    // Re-adding after removals reuses tombstones without losing the others.
    for (int i = 0; i < kCount; i += 2) ASSERT_TRUE(registry_add(&recs[i], 7u));
    for (int i = 0; i < kCount; ++i) ASSERT_EQ(registry_tag(&recs[i]), i % 2 ? 0x1000u + i : 7u);
    for (auto& r : recs) registry_remove(&r);
    EXPECT_EQ(registry_size(), before);
    EXPECT_EQ(registry_tag(nullptr), 0u);
}

} // namespace
