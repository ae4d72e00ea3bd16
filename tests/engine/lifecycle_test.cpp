// Open, close, clear and the small global queries.
#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <string>

#include "engine/alloc.h"
#include "engine/fixed.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::test::EngineTest;

namespace {

TEST(Lifecycle, OpenSetsUpTheScreenAndCloseLeavesOnlyTheDepthFlag) {
    for (uint32_t reserved : {0u, 1u, 0xFFFFFFFFu}) {
        ASSERT_EQ(VRX_Open(reserved, 176, 208, VRX_FMT_RGB565), 0);
        EXPECT_EQ(g_eng.eng_flags, 0u);
        EXPECT_NE(g_eng.own_depth_buf, nullptr);
        EXPECT_EQ(g_eng.depth_buf, g_eng.own_depth_buf);
        EXPECT_EQ(g_eng.color_buf, nullptr);
        void* win = nullptr;
        WINDOW_INFO info{};
        ASSERT_EQ(VRX_GetCurrentWindow(&win), 0);
        ASSERT_EQ(VRX_GetWindowInfo(win, &info), 0);
        EXPECT_EQ(win, &g_eng.main_window);
        EXPECT_EQ(info.width, 176);
        EXPECT_EQ(info.height, 208);
        EXPECT_EQ(VRX_DeleteWindow(win), -1); // the main window lives as long as the engine
        ASSERT_EQ(VRX_Close(), 0);
        EXPECT_EQ(g_eng.eng_flags, 4u);
        EXPECT_EQ(g_eng.own_depth_buf, nullptr);
        EXPECT_EQ(g_eng.draw_list, nullptr);
    }
}

TEST(Lifecycle, RecipTableIsFilledOnceAndExact) {
    ASSERT_EQ(VRX_Open(0, 16, 16, VRX_FMT_RGB565), 0);
    const auto& t = vrx::engine::RecipTable;
    EXPECT_EQ((std::array{t[0], t[1], t[3], t[1280]}), (std::array{0, 0x1000000, 5592405, 13107}));
    vrx::engine::RecipTable[7] = 12345; // a second open must not refill it
    VRX_Close();
    ASSERT_EQ(VRX_Open(0, 16, 16, VRX_FMT_RGB565), 0);
    EXPECT_EQ(vrx::engine::RecipTable[7], 12345);
    vrx::engine::RecipTable[7] = 0x1000000 / 7;
    VRX_Close();
}

TEST(Lifecycle, RefusesUnusableScreenSizes) {
    g_eng.last_error[0] = '\0';
    EXPECT_EQ(VRX_Open(0, 0, 320, 0), -1);
    EXPECT_EQ(VRX_Open(0, 240, 0x80000000u, 0), -1);
    EXPECT_NE(std::string(g_eng.last_error).find("Wrong screen size"), std::string::npos);
}

TEST(Lifecycle, FailedAllocationsAtOpenReportAndLeaveNothing) {
    struct Case {
        long fail_at;
        const char* message;
    };
    // The depth buffer is the first engine allocation of an open, the draw list the second.
    const Case cases[] = {{1, "Allocate depth buffer fail in Init_ENG20!!\n"},
                          {2, "Allocate draw list fail in Init_ENG20!!\n"}};
    for (const Case& c : cases) {
        long before = vrx::engine::alloc_outstanding();
        g_eng.last_error[0] = '\0';
        vrx::engine::alloc_fail_at(c.fail_at, false);
        EXPECT_EQ(VRX_Open(0, 64, 64, VRX_FMT_RGB565), -1);
        vrx::engine::alloc_fail_at(0, false);
        EXPECT_STREQ(g_eng.last_error, c.message);
        EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
        EXPECT_EQ(g_eng.is_open, 0);
    }
}

TEST_F(EngineTest, DataPathGetsOneTrailingBackslashAndAtMost255Characters) {
    struct Case {
        std::string in;
        int32_t result;
        std::string stored; // what the path holds afterwards, starting from "keep\"
    };
    const Case cases[] = {{"data", 0, "data\\"},
                          {"data\\", 0, "data\\"},
                          {"a\\b/c", 0, "a\\b/c\\"},
                          {"", 0, ""},
                          {std::string(254, 'p'), 0, std::string(254, 'p') + "\\"},
                          {std::string(255, 'p'), -1, "keep\\"}};
    for (const Case& c : cases) {
        ASSERT_EQ(VRX_SetDefaultDataPath("keep"), 0);
        EXPECT_EQ(VRX_SetDefaultDataPath(c.in.c_str()), c.result);
        EXPECT_EQ(std::string(g_eng.data_path), c.stored) << c.in;
    }
    EXPECT_EQ(VRX_SetDefaultDataPath(nullptr), -1);
    EXPECT_EQ(last_error(), "Data path too long in VRX_SetDefaultDataPath!!\n"
                            "Wrong path in VRX_SetDefaultDataPath!!\n");
}

TEST_F(EngineTest, VersionAndMemoryQueries) {
    char version[16];
    std::memset(version, 'x', sizeof version);
    ASSERT_EQ(VRX_GetVersion(version), 0);
    EXPECT_EQ(std::memcmp(version, "v1.0.3.23\0xxxxxx", 16), 0);
    uint32_t a = 7, b = 9;
    EXPECT_EQ(VRX_GetUsedMemAmount(&a, &b), -1);
    EXPECT_EQ(a, 0u);
    EXPECT_EQ(b, 0u);
}

TEST_F(EngineTest, ClearFreesRecordsAndSelectsMainWindow) {
    WINDOW_INFO info{0, 0, 10, 10, 0};
    void* w1 = nullptr;
    void* w2 = nullptr;
    ASSERT_EQ(VRX_NewWindow(&info, &w1), 0);
    ASSERT_EQ(VRX_NewWindow(&info, &w2), 0);
    ASSERT_EQ(VRX_SelectWindow(w2), 0);
    g_eng.eng_flags = 1;
    ASSERT_EQ(VRX_Clear(), 0);
    void* cur = nullptr;
    VRX_GetCurrentWindow(&cur);
    EXPECT_EQ(cur, &g_eng.main_window);
    EXPECT_EQ(g_eng.eng_flags, 1u); // flags survive a clear
    EXPECT_EQ(g_eng.color_buf, color.data());
    clear_last_error();
    EXPECT_EQ(VRX_SelectWindow(w1), -1);
    EXPECT_EQ(last_error(), "This ID is not ID_VPORT !!\nWrong whd in ENG_SelectWindow!!\n");
    EXPECT_EQ(VRX_Clear(), 0); // clearing an empty engine

    // Opening an open engine closes it first: what it held is released.
    ASSERT_EQ(VRX_NewWindow(&info, &w1), 0);
    long held = vrx::engine::alloc_outstanding();
    ASSERT_EQ(VRX_Open(0, kW, kH, VRX_FMT_RGB565), 0);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), held - 1); // the window went
}

} // namespace
