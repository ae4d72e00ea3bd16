// Windows: derived projection values, scissor, zoom, selection, clearing, deletion.
#include <gtest/gtest.h>

#include <array>

#include "engine/alloc.h"
#include "engine/state.h"
#include "render/vport.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::render::VPORT;
using vrx::test::EngineTest;

namespace {

using Quad = std::array<int32_t, 4>;

class Windows : public EngineTest {
  protected:
    VPORT* make(int x, int y, int w, int h, int extra = 0) {
        WINDOW_INFO info{x, y, w, h, extra};
        void* win = nullptr;
        EXPECT_EQ(VRX_NewWindow(&info, &win), 0);
        return static_cast<VPORT*>(win);
    }
    static Quad clip() {
        return {g_eng.clip_left, g_eng.clip_top, g_eng.clip_right, g_eng.clip_bottom};
    }
};

TEST_F(Windows, DerivedValuesOfNewWindows) {
    constexpr int32_t kHalfH = (159 << 16) + 0xC000; // 159.75: a quarter-pixel bias
    struct Case {
        int x, y, w, h;
        Quad half_and_centre;
    };
    const Case cases[] = {
        {0, 0, 240, 320, {120 << 16, kHalfH, 120 << 16, kHalfH}},
        {0, 0, 241, 320, {120 << 16, kHalfH, 120 << 16, kHalfH}}, // odd width centres as 240
        {10, 20, 100, 50, {50 << 16, (24 << 16) + 0xC000, 60 << 16, (44 << 16) + 0xC000}},
    };
    for (const Case& c : cases) {
        VPORT* w = make(c.x, c.y, c.w, c.h, 77);
        EXPECT_EQ((Quad{w->half_w, w->half_h, w->center_x, w->center_y}), c.half_and_centre);
        EXPECT_EQ((Quad{w->sc_on, w->sc_w, w->sc_h, w->extra}), (Quad{0, c.w, c.h, 77}));
    }
    EXPECT_EQ(make(0, 0, 240, 320)->aspect, 0xC000); // 0.75
}

TEST_F(Windows, ScissorIntersectsAndSetsTheFlag) {
    struct Case {
        int x, y, w, h, result;
        std::array<int32_t, 5> after; // x, y, w, h, flag
    };
    const Case cases[] = {
        {-10, -10, 50, 50, 0, {0, 0, 40, 40, 1}},
        {0, 0, 240, 320, 0, {0, 0, 240, 320, 0}},
        {0, 0, 0x7FFFFFFF, 0x7FFFFFFF, 0, {0, 0, 240, 320, 0}}, // no wrap of x + w
        {200, 300, 100, 100, 0, {200, 300, 40, 20, 1}},
        {240, 0, 10, 10, -1, {200, 300, 40, 20, 1}}, // outside: the last one stays
        {5, 5, 0, 10, -1, {200, 300, 40, 20, 1}},
    };
    VPORT* w = make(0, 0, 240, 320);
    for (const Case& c : cases) {
        EXPECT_EQ(VRX_WindowScissor(w, c.x, c.y, c.w, c.h), c.result);
        std::array<int32_t, 5> got{};
        ASSERT_EQ(VRX_GetWindowScissor(w, &got[0], &got[1], &got[2], &got[3]), 0);
        got[4] = w->sc_on;
        EXPECT_EQ(got, c.after) << c.x << "," << c.y;
    }
    EXPECT_EQ(last_error(), ""); // an empty scissor is refused without a message
}

TEST_F(Windows, ZoomScalesAboutTheBufferOriginAndKeepsTheScissorOn) {
    VPORT* w = make(10, 0, 100, 100);
    ASSERT_EQ(VRX_SetWindowZoomFactor(w, 0x20000, 0x10000), 0);
    ASSERT_EQ(VRX_WindowScissor(w, 0, 0, 100, 100), 0); // whole window, zoomed: stays on
    EXPECT_EQ((Quad{w->half_w, w->center_x, w->sc_on, 0}), (Quad{100 << 16, 120 << 16, 1, 0}));
    ASSERT_EQ(VRX_SetWindowZoomFactor(w, 0x10000, 0x10000), 0);
    EXPECT_EQ(w->sc_on, 0);
}

TEST_F(Windows, SelectionScissorAndInfoMoveTheClipRectangle) {
    VPORT* w = make(20, 30, 100, 80);
    ASSERT_EQ(VRX_SelectWindow(w), 0);
    EXPECT_EQ(clip(), (Quad{20, 30, 120, 110}));
    EXPECT_EQ(g_eng.clip_on, 0);
    ASSERT_EQ(VRX_WindowScissor(w, 10, 5, 20, 20), 0); // selected: moves the clip at once
    EXPECT_EQ(clip(), (Quad{30, 35, 50, 55}));
    EXPECT_EQ(g_eng.clip_on, 1);
    WINDOW_INFO info{0, 0, 50, 50, 0};
    ASSERT_EQ(VRX_SetWindowInfo(w, &info), 0); // waits for the next selection
    EXPECT_EQ(clip(), (Quad{30, 35, 50, 55}));
    ASSERT_EQ(VRX_SelectWindow(w), 0);
    EXPECT_EQ(clip(), (Quad{0, 0, 50, 50}));
    EXPECT_EQ(g_eng.clip_on, 0);
}

TEST_F(Windows, DeletingTheSelectedWindowSelectsMain) {
    VPORT* a = make(0, 0, 10, 10);
    VPORT* b = make(0, 0, 20, 20);
    ASSERT_EQ(VRX_SelectWindow(b), 0);
    ASSERT_EQ(VRX_DeleteWindow(a), 0); // not selected: the selection stays
    EXPECT_EQ(g_eng.cur_window, b);
    ASSERT_EQ(VRX_DeleteWindow(b), 0);
    EXPECT_EQ(g_eng.cur_window, &g_eng.main_window);
    EXPECT_EQ(g_eng.clip_right, kW);
    EXPECT_TRUE(g_eng.window_list.empty());
}

TEST_F(Windows, ClearWindowFillsTheScissorAndDepthOnlyWithDepthOnAndSortOff) {
    struct Case {
        uint8_t rgb[3];
        uint32_t flags;
        uint16_t want;
        bool depth_cleared;
    };
    const Case cases[] = {{{255, 255, 255}, 0, 0xFFFF, false},
                          {{8, 4, 8}, 4, 0x0821, true},
                          {{7, 3, 7}, 2, 0, false},
                          {{7, 3, 7}, 6, 0, false}};
    VPORT* w = make(10, 10, 20, 20);
    ASSERT_EQ(VRX_WindowScissor(w, 5, 5, 4, 3), 0);
    const int depth_at = 15 * kW + 15;
    for (const Case& c : cases) {
        std::fill(color.begin(), color.end(), 0x1234);
        g_eng.depth_buf[depth_at] = 5;
        g_eng.eng_flags = c.flags;
        ASSERT_EQ(VRX_ClearWindow(w, c.rgb), 0);
        int filled = 0;
        for (int y = 0; y < kH; ++y)
            for (int x = 0; x < kW; ++x) {
                bool inside = x >= 15 && x < 19 && y >= 15 && y < 18;
                filled += inside;
                ASSERT_EQ(pixel(x, y), inside ? c.want : 0x1234) << x << "," << y;
            }
        EXPECT_EQ(filled, 12);
        EXPECT_EQ(g_eng.depth_buf[depth_at], c.depth_cleared ? 0x7FFFFFFF : 5) << c.flags;
    }
    VPORT* outside = make(230, 0, 20, 20);
    EXPECT_EQ(VRX_ClearWindow(outside, cases[0].rgb), -1);
    EXPECT_EQ(last_error(), "Window outside the render buffer in ENG_ClearWindow!!\n");
    EXPECT_EQ(pixel(235, 18), 0x1234); // below the message's first console row
}

TEST_F(Windows, BadHandlesAndArgumentsAreReported) {
    VPORT* w = make(0, 0, 10, 10);
    WINDOW_INFO info{0, 0, 10, 10, 0};
    int32_t i = 0;
    FIXED f = 0;
    const uint8_t rgb[3] = {1, 2, 3};
    // Each operation refuses a null handle with the check's message, then its own.
    const std::pair<const char*, int32_t> results[] = {
        {"ENG_SelectWindow", VRX_SelectWindow(nullptr)},
        {"ENG_SetWindowInfo", VRX_SetWindowInfo(nullptr, &info)},
        {"ENG_GetWindowInfo", VRX_GetWindowInfo(nullptr, &info)},
        {"VRX_WindowScissor", VRX_WindowScissor(nullptr, 0, 0, 1, 1)},
        {"VRX_GetWindowScissor", VRX_GetWindowScissor(nullptr, &i, &i, &i, &i)},
        {"VRX_SetWindowZoomFactor", VRX_SetWindowZoomFactor(nullptr, 1, 1)},
        {"VRX_GetWindowZoomFactor", VRX_GetWindowZoomFactor(nullptr, &f, &f)},
        {"ENG_ClearWindow", VRX_ClearWindow(nullptr, rgb)},
        {"ENG_DeleteWindow", VRX_DeleteWindow(nullptr)},
    };
    std::string want;
    for (const auto& [fn, result] : results) {
        EXPECT_EQ(result, -1) << fn;
        want += std::string("Wrong Window Handle : 0\nWrong whd in ") + fn + "!!\n";
    }
    EXPECT_EQ(last_error(), want);

    ASSERT_EQ(VRX_DeleteWindow(w), 0); // a freed window is a stale handle
    clear_last_error();
    EXPECT_EQ(VRX_SelectWindow(w), -1);
    EXPECT_EQ(last_error(), "This ID is not ID_VPORT !!\nWrong whd in ENG_SelectWindow!!\n");

    WINDOW_INFO bad{0, 0, 0, 10, 0};
    void* out = nullptr;
    EXPECT_EQ(VRX_NewWindow(&bad, &out) + VRX_NewWindow(nullptr, &out), -2);
    EXPECT_EQ(out, nullptr);

    long before = vrx::engine::alloc_outstanding();
    clear_last_error();
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewWindow(&info, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for pv in ENG_CreateWindow fail!!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_TRUE(g_eng.window_list.empty());
}

} // namespace
