// Worlds: creation, list order, deletion, the clear step and the refusals' exact messages.
#include <gtest/gtest.h>

#include <string>
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

TEST_F(WorldTest, ListOrderDeletionRefusalsAndClear) {
    const long before = alloc_outstanding();
    WORLD* a = make(0xFFFFFFFEu); // the whole word is kept, not one bit
    WORLD* b = make();
    WORLD* c = make();
    EXPECT_EQ(std::pair(a->tag, a->visible), std::pair(0x57524C44u, 0xFFFFFFFEu)); // 'WRLD'
    EXPECT_EQ(listed(), (std::vector<WORLD*>{a, b, c}));
    ASSERT_EQ(VRX_DeleteWorld(b), 0); // a middle, then the tail
    EXPECT_EQ(listed(), (std::vector<WORLD*>{a, c}));
    ASSERT_EQ(VRX_DeleteWorld(c), 0);
    EXPECT_EQ(listed(), std::vector<WORLD*>{a});
    const long kept = alloc_outstanding();
    const std::pair<void*, std::string> handles[] = {{nullptr, "Wrong World Handle.\n"},
                                                     {b, "The ID is not ID_WORLD.\n"}};
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
    EXPECT_EQ(alloc_outstanding(), kept);
    EXPECT_EQ(listed(), std::vector<WORLD*>{a});
    make();
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(alloc_outstanding(), before);
    EXPECT_TRUE(listed().empty());
    EXPECT_EQ(VRX_SetWorldVisibility(a, 0), -1); // stale after the clear
}

} // namespace
