// Windows: derived projection values, scissor, zoom, selection, clearing, deletion.
#include <gtest/gtest.h>

#include "engine/alloc.h"
#include "engine/state.h"
#include "render/vport.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::render::VPORT;
using vrx::test::EngineTest;

namespace {

class Windows : public EngineTest {
  protected:
    VPORT* make(int x, int y, int w, int h, int extra = 0) {
        WINDOW_INFO info{x, y, w, h, extra};
        void* win = nullptr;
        EXPECT_EQ(VRX_NewWindow(&info, &win), 0);
        return static_cast<VPORT*>(win);
    }
};

TEST_F(Windows, DerivedValuesOfNewWindows) {
    struct Case {
        int x, y, w, h;
        int32_t half_w, half_h, center_x, center_y;
    };
    const Case cases[] = {
        // 120.0, 159.75, centre at the same values, aspect 0.75.
        {0, 0, 240, 320, 120 << 16, (159 << 16) + 0xC000, 120 << 16, (159 << 16) + 0xC000},
        // Odd width: bit 0 dropped, so it centres like 240.
        {0, 0, 241, 320, 120 << 16, (159 << 16) + 0xC000, 120 << 16, (159 << 16) + 0xC000},
        // Offsets move the centre only.
        {10, 20, 100, 50, 50 << 16, (24 << 16) + 0xC000, 60 << 16, (44 << 16) + 0xC000},
    };
    for (const Case& c : cases) {
        VPORT* w = make(c.x, c.y, c.w, c.h, 77);
        EXPECT_EQ(w->half_w, c.half_w);
        EXPECT_EQ(w->half_h, c.half_h);
        EXPECT_EQ(w->center_x, c.center_x);
        EXPECT_EQ(w->center_y, c.center_y);
        EXPECT_EQ(w->sc_on, 0);
        EXPECT_EQ(w->sc_w, c.w);
        EXPECT_EQ(w->sc_h, c.h);
        EXPECT_EQ(w->extra, 77);
        EXPECT_EQ(w->zoom_x, 0x10000);
    }
    EXPECT_EQ(make(0, 0, 240, 320)->aspect, 0xC000); // 0.75
}

TEST_F(Windows, ScissorIntersectsAndSetsTheFlag) {
    struct Case {
        int x, y, w, h;
        int result;
        int sx, sy, sw, sh, on;
    };
    const Case cases[] = {
        {-10, -10, 50, 50, 0, 0, 0, 40, 40, 1},
        {0, 0, 240, 320, 0, 0, 0, 240, 320, 0},
        {0, 0, 0x7FFFFFFF, 0x7FFFFFFF, 0, 0, 0, 240, 320, 0}, // no wrap of x + w
        {200, 300, 100, 100, 0, 200, 300, 40, 20, 1},
        {240, 0, 10, 10, -1, 200, 300, 40, 20, 1}, // outside: the last one stays
        {5, 5, 0, 10, -1, 200, 300, 40, 20, 1},
    };
    VPORT* w = make(0, 0, 240, 320);
    for (const Case& c : cases) {
        EXPECT_EQ(VRX_WindowScissor(w, c.x, c.y, c.w, c.h), c.result);
        int32_t sx, sy, sw, sh;
        ASSERT_EQ(VRX_GetWindowScissor(w, &sx, &sy, &sw, &sh), 0);
        EXPECT_EQ(sx, c.sx);
        EXPECT_EQ(sy, c.sy);
        EXPECT_EQ(sw, c.sw);
        EXPECT_EQ(sh, c.sh);
        EXPECT_EQ(w->sc_on, c.on);
    }
    EXPECT_EQ(last_error(), ""); // an empty scissor is refused without a message
}

TEST_F(Windows, ZoomSetsTheFlagAndScalesAboutTheBufferOrigin) {
    VPORT* w = make(10, 0, 100, 100);
    ASSERT_EQ(VRX_SetWindowZoomFactor(w, 0x20000, 0x10000), 0);
    EXPECT_EQ(w->sc_on, 1);
    EXPECT_EQ(w->half_w, 100 << 16);
    EXPECT_EQ(w->center_x, 120 << 16); // (50 + 10) * 2
    FIXED zx = 0, zy = 0;
    ASSERT_EQ(VRX_GetWindowZoomFactor(w, &zx, &zy), 0);
    EXPECT_EQ(zx, 0x20000);
    EXPECT_EQ(zy, 0x10000);
    // Whole-window scissor with zoom 2 stays on; back to 1.0 turns it off.
    ASSERT_EQ(VRX_WindowScissor(w, 0, 0, 100, 100), 0);
    EXPECT_EQ(w->sc_on, 1);
    ASSERT_EQ(VRX_SetWindowZoomFactor(w, 0x10000, 0x10000), 0);
    EXPECT_EQ(w->sc_on, 0);
}

TEST_F(Windows, SelectionSetsTheClipRectangle) {
    VPORT* w = make(20, 30, 100, 80);
    ASSERT_EQ(VRX_SelectWindow(w), 0);
    EXPECT_EQ(g_eng.clip_left, 20);
    EXPECT_EQ(g_eng.clip_top, 30);
    EXPECT_EQ(g_eng.clip_right, 120);
    EXPECT_EQ(g_eng.clip_bottom, 110);
    EXPECT_EQ(g_eng.clip_on, 0);
    // A scissor on the selected window moves the clip at once.
    ASSERT_EQ(VRX_WindowScissor(w, 10, 5, 20, 20), 0);
    EXPECT_EQ(g_eng.clip_left, 30);
    EXPECT_EQ(g_eng.clip_top, 35);
    EXPECT_EQ(g_eng.clip_right, 50);
    EXPECT_EQ(g_eng.clip_bottom, 55);
    EXPECT_EQ(g_eng.clip_on, 1);
    // SetWindowInfo on the selected window waits for the next selection.
    WINDOW_INFO info{0, 0, 50, 50, 0};
    ASSERT_EQ(VRX_SetWindowInfo(w, &info), 0);
    EXPECT_EQ(g_eng.clip_left, 30);
    EXPECT_EQ(w->sc_w, 50);
    ASSERT_EQ(VRX_SelectWindow(w), 0);
    EXPECT_EQ(g_eng.clip_right, 50);
    EXPECT_EQ(g_eng.clip_on, 0);
}

TEST_F(Windows, DeletingTheSelectedWindowSelectsMain) {
    VPORT* a = make(0, 0, 10, 10);
    VPORT* b = make(0, 0, 20, 20);
    ASSERT_EQ(VRX_SelectWindow(b), 0);
    ASSERT_EQ(VRX_DeleteWindow(a), 0);
    void* cur = nullptr;
    VRX_GetCurrentWindow(&cur);
    EXPECT_EQ(cur, b);
    ASSERT_EQ(VRX_DeleteWindow(b), 0);
    VRX_GetCurrentWindow(&cur);
    EXPECT_EQ(cur, &g_eng.main_window);
    EXPECT_EQ(g_eng.clip_right, kW);
    EXPECT_TRUE(g_eng.window_list.empty());
}

TEST_F(Windows, ClearWindowFillsTheScissorWithTheConvertedColour) {
    struct Case {
        uint8_t rgb[3];
        uint16_t want;
    };
    const Case cases[] = {{{255, 255, 255}, 0xFFFF}, {{8, 4, 8}, 0x0821}, {{7, 3, 7}, 0}};
    VPORT* w = make(10, 10, 20, 20);
    ASSERT_EQ(VRX_WindowScissor(w, 5, 5, 4, 3), 0);
    for (const Case& c : cases) {
        std::fill(color.begin(), color.end(), 0x1234);
        ASSERT_EQ(VRX_ClearWindow(w, c.rgb), 0);
        int filled = 0;
        for (int y = 0; y < kH; ++y)
            for (int x = 0; x < kW; ++x) {
                bool inside = x >= 15 && x < 19 && y >= 15 && y < 18;
                if (inside) ++filled;
                ASSERT_EQ(pixel(x, y), inside ? c.want : 0x1234) << x << "," << y;
            }
        EXPECT_EQ(filled, 12);
    }
}

TEST_F(Windows, ClearWindowClearsDepthOnlyWithDepthOnAndSortOff) {
    VPORT* w = make(0, 0, 4, 1);
    const uint8_t black[3] = {0, 0, 0};
    struct Case {
        uint32_t flags;
        bool depth_cleared;
    };
    const Case cases[] = {{0, false}, {4, true}, {2, false}, {6, false}};
    for (const Case& c : cases) {
        g_eng.depth_buf[0] = 5;
        g_eng.eng_flags = c.flags;
        ASSERT_EQ(VRX_ClearWindow(w, black), 0);
        EXPECT_EQ(g_eng.depth_buf[0], c.depth_cleared ? 0x7FFFFFFF : 5) << c.flags;
    }
}

TEST_F(Windows, WindowsOutsideTheBufferAreNotCleared) {
    VPORT* w = make(230, 0, 20, 20);
    const uint8_t white[3] = {255, 255, 255};
    EXPECT_EQ(VRX_ClearWindow(w, white), -1);
    EXPECT_EQ(last_error(), "Window outside the render buffer in ENG_ClearWindow!!\n");
    EXPECT_EQ(pixel(235, 5), 0);
}

TEST_F(Windows, BadHandlesAndArgumentsAreReported) {
    VPORT* w = make(0, 0, 10, 10);
    WINDOW_INFO info{0, 0, 10, 10, 0};
    int32_t i = 0;
    FIXED f = 0;
    const uint8_t rgb[3] = {1, 2, 3};
    // Each operation refuses a null handle with the check's message, then its own.
    std::vector<std::pair<std::string, int32_t>> results = {
        {"Wrong whd in ENG_SelectWindow!!\n", VRX_SelectWindow(nullptr)},
        {"Wrong whd in ENG_SetWindowInfo!!\n", VRX_SetWindowInfo(nullptr, &info)},
        {"Wrong whd in ENG_GetWindowInfo!!\n", VRX_GetWindowInfo(nullptr, &info)},
        {"Wrong whd in VRX_WindowScissor!!\n", VRX_WindowScissor(nullptr, 0, 0, 1, 1)},
        {"Wrong whd in VRX_GetWindowScissor!!\n", VRX_GetWindowScissor(nullptr, &i, &i, &i, &i)},
        {"Wrong whd in VRX_SetWindowZoomFactor!!\n", VRX_SetWindowZoomFactor(nullptr, 1, 1)},
        {"Wrong whd in VRX_GetWindowZoomFactor!!\n", VRX_GetWindowZoomFactor(nullptr, &f, &f)},
        {"Wrong whd in ENG_ClearWindow!!\n", VRX_ClearWindow(nullptr, rgb)},
        {"Wrong whd in ENG_DeleteWindow!!\n", VRX_DeleteWindow(nullptr)},
    };
    std::string want;
    for (auto& r : results) {
        EXPECT_EQ(r.second, -1) << r.first;
        want += "Wrong Window Handle : 0\n" + r.first;
    }
    EXPECT_EQ(last_error(), want);

    // A freed window is refused as a stale handle.
    ASSERT_EQ(VRX_DeleteWindow(w), 0);
    clear_last_error();
    EXPECT_EQ(VRX_SelectWindow(w), -1);
    EXPECT_EQ(last_error(), "This ID is not ID_VPORT !!\nWrong whd in ENG_SelectWindow!!\n");

    clear_last_error();
    WINDOW_INFO bad{0, 0, 0, 10, 0};
    void* out = nullptr;
    EXPECT_EQ(VRX_NewWindow(&bad, &out), -1);
    EXPECT_EQ(VRX_NewWindow(nullptr, &out), -1);
    EXPECT_EQ(VRX_NewWindow(&info, nullptr), -1);
    EXPECT_EQ(out, nullptr);
}

TEST_F(Windows, NewWindowOutOfMemory) {
    long before = vrx::engine::alloc_outstanding();
    vrx::engine::alloc_fail_at(1, false);
    WINDOW_INFO info{0, 0, 10, 10, 0};
    void* out = nullptr;
    EXPECT_EQ(VRX_NewWindow(&info, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for pv in ENG_CreateWindow fail!!\n");
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_TRUE(g_eng.window_list.empty());
}

TEST_F(Windows, DoubledModeDoublesGeometryInAndHalvesItOut) {
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 1), 0);
    VPORT* w = make(10, 20, 100, 50);
    EXPECT_EQ(w->x, 20);
    EXPECT_EQ(w->y, 40);
    EXPECT_EQ(w->width, 200);
    EXPECT_EQ(w->height, 100);
    WINDOW_INFO info{};
    ASSERT_EQ(VRX_GetWindowInfo(w, &info), 0);
    EXPECT_EQ(info.x, 10);
    EXPECT_EQ(info.y, 20);
    EXPECT_EQ(info.width, 100);
    EXPECT_EQ(info.height, 50);
    // Leaving halves the sizes (positions stay) as the engine returns to screen size.
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 0), 0);
    EXPECT_EQ(w->width, 100);
    EXPECT_EQ(w->height, 50);
    EXPECT_EQ(w->x, 20);
    EXPECT_EQ(g_eng.main_window.width, kW);
}

} // namespace
