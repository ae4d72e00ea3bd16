// Worlds: creation with their ambient defaults, list order, visibility, deletion, the
// handle checks with their exact messages, allocation failure and the clear step.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/alloc.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "scene/world.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::scene::WORLD;

namespace {

class WorldTest : public vrx::test::EngineTest {
  protected:
    WORLD* make(uint32_t visible = 1) {
        void* h = nullptr;
        EXPECT_EQ(VRX_NewWorld(visible, &h), 0);
        return static_cast<WORLD*>(h);
    }
    // The worlds on world_list, head to tail, checking the back links on the way.
    static std::vector<WORLD*> listed() {
        std::vector<WORLD*> out;
        WORLD* prev = nullptr;
        for (WORLD* w = g_eng.world_list.head; w; w = w->next) {
            EXPECT_EQ(w->prev, prev);
            out.push_back(w);
            prev = w;
        }
        EXPECT_EQ(g_eng.world_list.tail, prev);
        return out;
    }
};

TEST_F(WorldTest, NewWorldHasItsTagAmbientDefaultsAndEmptyLists) {
    WORLD* w = make(0x12345);
    ASSERT_NE(w, nullptr);
    EXPECT_EQ(w->tag, 0x57524C44u); // 'WRLD'
    EXPECT_EQ(w->visible, 0x12345u);
    EXPECT_EQ(w->amb_color.r, 0x10000);
    EXPECT_EQ(w->amb_color.g, 0x10000);
    EXPECT_EQ(w->amb_color.b, 0x10000);
    EXPECT_EQ(w->amb_scale, 0x10000);
    // 1.0 times 1.0 is exactly 1.0.
    EXPECT_EQ(w->amb_scaled.r, 0x10000);
    EXPECT_EQ(w->amb_scaled.g, 0x10000);
    EXPECT_EQ(w->amb_scaled.b, 0x10000);
    EXPECT_EQ(w->obj_head, nullptr);
    EXPECT_EQ(w->obj_tail, nullptr);
    EXPECT_EQ(w->omni_head, nullptr);
    EXPECT_EQ(w->omni_tail, nullptr);
    EXPECT_EQ(w->bb_head, nullptr);
    EXPECT_EQ(w->bb_tail, nullptr);
    EXPECT_EQ(vrx::engine::chk_world(w), 0u);
    EXPECT_EQ(last_error(), "");
}

TEST_F(WorldTest, AmbientScaledFollowsColourAndMultiplier) {
    struct Case {
        int32_t color, scale, scaled;
    };
    // F_MUL truncates toward minus infinity: 255 x 256 times 0.5 is 32640 exactly,
    // 0x7F80 times 1.5 is 48960, 0xFF00 times one raw unit is 0 (65280 / 65536).
    const Case cases[] = {{0xFF00, 0x8000, 0x7F80},
                          {0x7F80, 0x18000, 48960},
                          {0xFF00, 1, 0},
                          {0x10000, 0x20000, 0x20000}};
    WORLD* w = make();
    for (const Case& c : cases) {
        w->amb_color = {c.color, c.color, c.color};
        w->amb_scale = c.scale;
        vrx::scene::world_update_ambient(w);
        EXPECT_EQ(w->amb_scaled.r, c.scaled);
        EXPECT_EQ(w->amb_scaled.g, c.scaled);
        EXPECT_EQ(w->amb_scaled.b, c.scaled);
    }
}

TEST_F(WorldTest, WorldsAreListedInCreationOrderAndDeletedFromAnyPlace) {
    WORLD* a = make();
    WORLD* b = make();
    WORLD* c = make();
    WORLD* d = make();
    EXPECT_EQ(listed(), (std::vector<WORLD*>{a, b, c, d}));
    ASSERT_EQ(VRX_DeleteWorld(b), 0); // middle
    EXPECT_EQ(listed(), (std::vector<WORLD*>{a, c, d}));
    ASSERT_EQ(VRX_DeleteWorld(a), 0); // head
    EXPECT_EQ(listed(), (std::vector<WORLD*>{c, d}));
    ASSERT_EQ(VRX_DeleteWorld(d), 0); // tail
    EXPECT_EQ(listed(), (std::vector<WORLD*>{c}));
    ASSERT_EQ(VRX_DeleteWorld(c), 0); // last one
    EXPECT_TRUE(listed().empty());
    EXPECT_EQ(last_error(), "");
}

TEST_F(WorldTest, VisibilityWordIsStoredAsGiven) {
    WORLD* w = make(0);
    for (uint32_t v : {1u, 0u, 2u, 3u, 0xFFFFFFFFu, 0x80000000u}) {
        ASSERT_EQ(VRX_SetWorldVisibility(w, v), 0);
        EXPECT_EQ(w->visible, v);
    }
}

TEST_F(WorldTest, BadHandlesAreRefusedWithExactMessages) {
    void* cam = nullptr;
    CAMSETUP setup{{0, 0, 0}, {0, 0, 0x10000}, 0x5A0000, 0x10000, 0x640000};
    ASSERT_EQ(VRX_NewCamera(&setup, &cam), 0);
    WORLD* gone = make();
    ASSERT_EQ(VRX_DeleteWorld(gone), 0);
    struct Case {
        void* handle;
        const char* check_message;
    };
    const Case cases[] = {{nullptr, "Wrong World Handle.\n"},
                          {cam, "The ID is not ID_WORLD.\n"},
                          {gone, "The ID is not ID_WORLD.\n"}}; // stale after delete
    for (const Case& c : cases) {
        clear_last_error();
        EXPECT_EQ(VRX_DeleteWorld(c.handle), -1);
        EXPECT_EQ(last_error(),
                  std::string(c.check_message) + "chk_world return error in ENG_DeleteWorld!!\n");
        clear_last_error();
        EXPECT_EQ(VRX_SetWorldVisibility(c.handle, 1), -1);
        EXPECT_EQ(last_error(), c.check_message); // the check's message alone
    }
}

TEST_F(WorldTest, NullOutIsRefused) {
    long before = vrx::engine::alloc_outstanding();
    EXPECT_EQ(VRX_NewWorld(1, nullptr), -1);
    EXPECT_EQ(last_error(), "Wrong out in ENG_CreateWorld!!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_TRUE(listed().empty());
}

TEST_F(WorldTest, AllocationFailureIsReportedAndLeavesNothing) {
    WORLD* kept = make();
    long before = vrx::engine::alloc_outstanding();
    void* out = reinterpret_cast<void*>(0x1234);
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewWorld(1, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate World fail!!\n");
    EXPECT_EQ(out, reinterpret_cast<void*>(0x1234)); // not written on failure
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(listed(), std::vector<WORLD*>{kept});
}

TEST_F(WorldTest, DeleteAndClearFreeEveryRecord) {
    long before = vrx::engine::alloc_outstanding();
    WORLD* a = make();
    make();
    make();
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before + 3);
    ASSERT_EQ(VRX_DeleteWorld(a), 0);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before + 2);
    WORLD* b = g_eng.world_list.head;
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_TRUE(listed().empty());
    EXPECT_EQ(last_error(), "");
    EXPECT_EQ(VRX_SetWorldVisibility(b, 0), -1); // stale after the clear
    EXPECT_EQ(last_error(), "The ID is not ID_WORLD.\n");
    // A world made after the clear is listed alone.
    WORLD* c = make();
    EXPECT_EQ(listed(), std::vector<WORLD*>{c});
}

} // namespace
