// Worlds: creation with their ambient defaults, list order and deletion from any place, the
// clear step, and the refusals with their exact messages.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <vector>

#include "engine/alloc.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "scene/world.h"
#include "support/engine_fixture.h"

using vrx::engine::alloc_outstanding;
using vrx::engine::g_eng;
using vrx::scene::WORLD;

namespace {

class WorldTest : public vrx::test::EngineTest {
  protected:
    static WORLD* make(uint32_t visible = 1) {
        void* h = nullptr;
        EXPECT_EQ(VRX_NewWorld(visible, &h), 0);
        return static_cast<WORLD*>(h);
    }
    // The worlds on world_list, head to tail, checking the back links on the way.
    static std::vector<WORLD*> listed() {
        std::vector<WORLD*> out;
        WORLD* prev = nullptr;
        for (WORLD* w = g_eng.world_list.head; w; prev = w, w = w->next) {
            EXPECT_EQ(w->prev, prev);
            out.push_back(w);
        }
        EXPECT_EQ(g_eng.world_list.tail, prev);
        return out;
    }
};

TEST_F(WorldTest, NewWorldDefaultsAndTheAmbientProduct) {
    WORLD* w = make(0xFFFFFFFEu); // the whole word is kept, not one bit
    ASSERT_NE(w, nullptr);
    // 'WRLD'; ambient colour and multiplier 1.0, so their product is exactly 1.0.
    EXPECT_EQ(std::tuple(w->tag, w->visible, w->amb_color.r, w->amb_color.g, w->amb_color.b,
                         w->amb_scale, w->amb_scaled.r, w->amb_scaled.g, w->amb_scaled.b),
              std::tuple(0x57524C44u, 0xFFFFFFFEu, 0x10000, 0x10000, 0x10000, 0x10000, 0x10000,
                         0x10000, 0x10000));
    // Per channel, truncated: 1.5 x 0x7F81 is 0xBF41.8.
    w->amb_color = {0xFF00, 0x7F81, 0x10000};
    w->amb_scale = 0x18000;
    vrx::scene::world_update_ambient(w);
    EXPECT_EQ(std::tuple(w->amb_scaled.r, w->amb_scaled.g, w->amb_scaled.b),
              std::tuple(0x17E80, 0xBF41, 0x18000));
    ASSERT_EQ(VRX_SetWorldVisibility(w, 1), 0);
    EXPECT_EQ(w->visible, 1u);
}

TEST_F(WorldTest, ListedInCreationOrderDeletedFromAnyPlaceAndCleared) {
    const long before = alloc_outstanding();
    WORLD* a = make();
    WORLD* b = make();
    WORLD* c = make();
    WORLD* d = make();
    EXPECT_EQ(listed(), (std::vector<WORLD*>{a, b, c, d}));
    // Middle, head, tail, then the only one left.
    const std::pair<WORLD*, std::vector<WORLD*>> steps[] = {
        {b, {a, c, d}}, {a, {c, d}}, {d, {c}}, {c, {}}};
    for (const auto& [gone, left] : steps) {
        ASSERT_EQ(VRX_DeleteWorld(gone), 0);
        EXPECT_EQ(listed(), left);
    }
    EXPECT_EQ(alloc_outstanding(), before);
    WORLD* e = make();
    make();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(alloc_outstanding(), before);
    EXPECT_TRUE(listed().empty());
    EXPECT_EQ(VRX_SetWorldVisibility(e, 0), -1); // stale after the clear
    EXPECT_EQ(last_error(), "The ID is not ID_WORLD.\n");
}

TEST_F(WorldTest, RefusalsReportExactlyAndLeaveNothing) {
    WORLD* kept = make();
    WORLD* gone = make();
    ASSERT_EQ(VRX_DeleteWorld(gone), 0);
    const long before = alloc_outstanding();
    const std::pair<void*, std::string> handles[] = {{nullptr, "Wrong World Handle.\n"},
                                                     {gone, "The ID is not ID_WORLD.\n"}};
    for (const auto& [handle, check_message] : handles) {
        clear_last_error();
        EXPECT_EQ(VRX_DeleteWorld(handle), -1);
        EXPECT_EQ(last_error(), check_message + "chk_world return error in ENG_DeleteWorld!!\n");
        clear_last_error();
        EXPECT_EQ(VRX_SetWorldVisibility(handle, 1), -1);
        EXPECT_EQ(last_error(), check_message); // the check's message alone
    }
    clear_last_error();
    EXPECT_EQ(VRX_NewWorld(1, nullptr), -1);
    void* out = &out;
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewWorld(1, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Wrong out in ENG_CreateWorld!!\nAllocate World fail!!\n");
    EXPECT_EQ(out, &out); // not written on failure
    EXPECT_EQ(alloc_outstanding(), before);
    EXPECT_EQ(listed(), std::vector<WORLD*>{kept});
}

} // namespace
