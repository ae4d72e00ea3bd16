// VRX_Hint: the flag rules of every hint.
#include <gtest/gtest.h>

#include "engine/alloc.h"
#include "engine/state.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::test::EngineTest;

namespace {

struct Step {
    int32_t hint;
    uint32_t value;
    int32_t result;
    uint32_t flags_after;
};

struct Sequence {
    const char* name;
    std::vector<Step> steps;
};

class HintSequence : public EngineTest, public ::testing::WithParamInterface<Sequence> {};

TEST_P(HintSequence, FlagsFollowTheRules) {
    int i = 0;
    for (const Step& s : GetParam().steps) {
        EXPECT_EQ(VRX_Hint(s.hint, s.value), s.result) << "step " << i;
        EXPECT_EQ(g_eng.eng_flags, s.flags_after) << "step " << i;
        ++i;
    }
    EXPECT_EQ(last_error(), ""); // refused hints say nothing
}

const Sequence kSequences[] = {
    {"perspective", {{0, 1, 0, 1}, {0, 7, 0, 1}, {0, 0, 0, 0}}},
    {"sort_refuses_depth", {{3, 1, 0, 2}, {1, 1, -1, 2}, {1, 0, -1, 2}}},
    {"unsort_then_depth", {{3, 1, 0, 2}, {3, 0, 0, 0}, {1, 1, 0, 4}}},
    {"sort_clears_depth", {{1, 1, 0, 4}, {3, 1, 0, 2}, {3, 0, 0, 0}}},
    {"unsort_keeps_depth", {{1, 1, 0, 4}, {3, 0, 0, 4}, {1, 0, 0, 0}}},
    {"filter_only_value_1", {{4, 1, 0, 16}, {4, 2, 0, 0}, {4, 1, 0, 16}, {4, 0, 0, 0}}},
    {"unknown_hints", {{5, 1, -1, 0}, {-1, 1, -1, 0}, {0, 1, 0, 1}, {99, 0, -1, 1}}},
};

INSTANTIATE_TEST_SUITE_P(Rules, HintSequence, ::testing::ValuesIn(kSequences),
                         [](const auto& p) { return std::string(p.param.name); });

TEST_F(EngineTest, DepthAfterLeavingDoubledModeWhileSortingGetsABuffer) {
    // Leaving doubled mode with sorting on allocates no depth buffer; turning depth testing on
    // later provides one, cleared to the farthest depth. The second time, out of memory: the
    // hint is reported, refused and the flag stays off.
    for (bool fail : {false, true}) {
        for (auto [hint, value] :
             {std::pair{HINT_DOUBLED, 1}, {HINT_SORTED, 1}, {HINT_DOUBLED, 0}, {HINT_SORTED, 0}})
            ASSERT_EQ(VRX_Hint(hint, value), 0);
        EXPECT_EQ(g_eng.depth_buf, nullptr);
        vrx::engine::alloc_fail_at(fail ? 1 : 0, false);
        EXPECT_EQ(VRX_Hint(HINT_DEPTH, 1), fail ? -1 : 0);
        vrx::engine::alloc_fail_at(0, false);
        if (fail) break;
        ASSERT_NE(g_eng.depth_buf, nullptr);
        EXPECT_EQ(g_eng.depth_buf[0], 0x7FFFFFFF);
        EXPECT_EQ(g_eng.depth_buf[kW * kH - 1], 0x7FFFFFFF);
        ASSERT_EQ(VRX_Hint(HINT_DEPTH, 0), 0);
    }
    EXPECT_EQ(g_eng.eng_flags & 4u, 0u);
    EXPECT_EQ(last_error(), "Allocate depth buffer fail in VRX_Hint!!\n");
}

} // namespace
