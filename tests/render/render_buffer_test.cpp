// Render-buffer fills, block copies, the 2x2 reduction and doubled mode.
#include <gtest/gtest.h>

#include <array>
#include <numeric>

#include "engine/alloc.h"
#include "engine/state.h"
#include "render/render_buffer.h"
#include "render/vport.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::test::EngineTest;

namespace {

TEST_F(EngineTest, ClearRenderBufferConvertsColourAndTouchesDepthOnlyWhenAsked) {
    struct Case {
        int r, g, b;
        uint32_t flags;
        uint16_t want;
        bool depth_cleared;
    };
    const Case cases[] = {
        {255, 0, 0, 0, 0xF800, false}, {0, 255, 0, 4, 0x07E0, true},
        {0, 0, 255, 2, 0x001F, false}, {8, 4, 8, 4, 0x0821, true},
        {7, 3, 7, 0, 0x0000, false},   {255, 255, 255, 6, 0xFFFF, false},
    };
    for (const Case& c : cases) {
        g_eng.eng_flags = c.flags;
        g_eng.depth_buf[0] = 1;
        g_eng.depth_buf[kW * kH - 1] = 1;
        ASSERT_EQ(VRX_ClearRenderBuffer(c.r, c.g, c.b), 0);
        EXPECT_EQ(pixel(0, 0), c.want);
        EXPECT_EQ(pixel(kW - 1, kH - 1), c.want);
        int32_t want_depth = c.depth_cleared ? 0x7FFFFFFF : 1;
        EXPECT_EQ(g_eng.depth_buf[0], want_depth);
        EXPECT_EQ(g_eng.depth_buf[kW * kH - 1], want_depth);
    }
}

TEST(RenderBuffer, FourBytePixelScreensClearWholeGroupsOfFour) {
    ASSERT_EQ(VRX_Open(0, 3, 3, VRX_FMT_ARGB8888), 0); // 9 pixels: 8 cleared, 1 left
    std::vector<uint32_t> buf(9, 0xDEADBEEF);
    ASSERT_EQ(VRX_SetRenderBuffer(reinterpret_cast<uint16_t*>(buf.data()), nullptr), 0);
    VRX_Hint(HINT_DEPTH, 1);
    ASSERT_EQ(VRX_ClearRenderBuffer(0x12, 0x37, 0x5F), 0);
    // r + (g & ~3) << 8 + (b & ~7) << 16
    for (int i = 0; i < 8; ++i) EXPECT_EQ(buf[i], 0x00583412u) << i;
    EXPECT_EQ(buf[8], 0xDEADBEEFu);
    EXPECT_EQ(g_eng.depth_buf[7], 0x7FFFFFFF);
    VRX_Close();
}

TEST(RenderBuffer, DownsampleInPlaceReducesEveryColumn) {
    // A 5 x 1 result from a 10 x 2 source in the same buffer: blocks of white, black, red 31,
    // blue 31 and green 63. Each channel loses its low bit (31 -> 15) before the rows add up.
    std::vector<uint16_t> buf = {0xFFFF, 0xFFFF, 0,      0,      0xF800, 0xF800, 0x001F,
                                 0x001F, 0x07E0, 0x07E0, 0xFFFF, 0xFFFF, 0,      0,
                                 0xF800, 0xF800, 0x001F, 0x001F, 0x07E0, 0x07E0};
    vrx::render::Downsample2x2(5, 1, buf.data(), buf.data());
    const std::vector<uint16_t> want = {0xF7DE, 0, 0xF000, 0x001E, 0x07C0};
    EXPECT_EQ(std::vector<uint16_t>(buf.begin(), buf.begin() + 5), want);
}

TEST_F(EngineTest, BlockCopiesRoundTripAndRespectTheBuffer) {
    std::vector<uint16_t> in(6);
    std::iota(in.begin(), in.end(), 100);
    std::vector<int32_t> zin = {1, 2, 3, 4, 5, 6};
    ASSERT_EQ(VRX_CopyToRenderBuffer(237, 318, 3, 2, in.data(), zin.data()), 0);
    EXPECT_EQ(pixel(237, 318), 100);
    EXPECT_EQ(pixel(239, 319), 105);
    EXPECT_EQ(g_eng.depth_buf[319 * kW + 238], 5);

    std::vector<uint16_t> out(6);
    std::vector<int32_t> zout(6);
    ASSERT_EQ(VRX_CopyFromRenderBuffer(237, 318, 3, 2, out.data(), zout.data()), 0);
    EXPECT_EQ(out, in);
    EXPECT_EQ(zout, zin);

    // Null depth array: colours only. A null colour buffer handed over keeps the current one.
    ASSERT_EQ(VRX_CopyFromRenderBuffer(237, 318, 3, 1, out.data(), nullptr), 0);
    std::vector<int32_t> depth(kW * kH);
    ASSERT_EQ(VRX_SetRenderBuffer(nullptr, depth.data()), 0);
    EXPECT_EQ(g_eng.depth_buf, depth.data());
    EXPECT_EQ(g_eng.color_buf, color.data());
    ASSERT_EQ(VRX_SetRenderBuffer(nullptr, g_eng.own_depth_buf), 0);

    struct Bad {
        int x, y, w, h;
    };
    const Bad bad[] = {{238, 318, 3, 2}, {-1, 0, 2, 2}, {0, 319, 1, 2},
                       {0, 0, 0, 1},     {0, 0, 1, -1}, {0x7FFFFFFF, 0, 2, 1}};
    for (const Bad& b : bad) {
        clear_last_error();
        EXPECT_EQ(VRX_CopyToRenderBuffer(b.x, b.y, b.w, b.h, in.data(), nullptr), -1);
        EXPECT_EQ(VRX_CopyFromRenderBuffer(b.x, b.y, b.w, b.h, out.data(), nullptr), -1);
        EXPECT_EQ(last_error(), "Wrong block in VRX_CopyToRenderBuffer!!\n"
                                "Wrong block in VRX_CopyFromRenderBuffer!!\n");
    }
    EXPECT_EQ(VRX_CopyToRenderBuffer(0, 0, 1, 1, nullptr, nullptr), -1);
}

TEST(RenderBuffer, OperationsWithoutAColourBufferAreRefused) {
    ASSERT_EQ(VRX_Open(0, 8, 8, VRX_FMT_RGB565), 0);
    g_eng.last_error[0] = '\0';
    uint16_t px[1] = {0};
    EXPECT_EQ(VRX_ClearRenderBuffer(1, 2, 3), -1);
    EXPECT_EQ(VRX_CopyToRenderBuffer(0, 0, 1, 1, px, nullptr), -1);
    EXPECT_STREQ(g_eng.last_error, "No render buffer in VRX_ClearRenderBuffer!!\n"
                                   "No render buffer in VRX_CopyToRenderBuffer!!\n");
    VRX_Close();
}

TEST_F(EngineTest, DoubledModeDrawsAtTwiceTheSizeAndSwapReduces) {
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 1), 0);
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 1), 0); // twice doubles once
    EXPECT_EQ(g_eng.eng_flags, 8u);
    EXPECT_EQ((std::array{g_eng.buf_w, g_eng.buf_h, g_eng.main_window.width, g_eng.clip_right,
                          g_eng.con.con_scale_x}),
              (std::array{2 * kW, 2 * kH, 2 * kW, 2 * kW, 2}));

    int32_t w = 0, h = 0;
    uint16_t* c = nullptr;
    ASSERT_EQ(VRX_GetRenderBuffer(&w, &h, &c, nullptr), 0);
    EXPECT_EQ((std::array{w, h}), (std::array{kW, kH}));
    ASSERT_NE(c, nullptr);
    EXPECT_NE(c, color.data());
    EXPECT_EQ(VRX_SetRenderBuffer(color.data(), nullptr), -1);
    EXPECT_EQ(last_error(), "");
    // Window geometry is doubled going in and halved coming out.
    WINDOW_INFO info{10, 20, 100, 50, 0};
    void* win = nullptr;
    ASSERT_EQ(VRX_NewWindow(&info, &win), 0);
    auto* vp = static_cast<vrx::render::VPORT*>(win);
    EXPECT_EQ((std::array{vp->x, vp->y, vp->width, vp->height}), (std::array{20, 40, 200, 100}));
    ASSERT_EQ(VRX_GetWindowInfo(win, &info), 0);
    EXPECT_EQ((std::array{info.x, info.y, info.width}), (std::array{10, 20, 100}));

    // Paint the top-left 2x2 block white and the rest black, then end the frame.
    ASSERT_EQ(VRX_ClearRenderBuffer(0, 0, 0), 0);
    c[0] = c[1] = c[2 * kW] = c[2 * kW + 1] = 0xFFFF;
    c[2 * kW * (2 * kH - 1)] = 0xFFFF; // bottom-left source pixel: a quarter of a pixel
    ASSERT_EQ(VRX_SwapRenderBuffer(), 0);
    EXPECT_EQ(c[0], 0xF7DE);
    EXPECT_EQ(c[1], 0);
    // One white source pixel of four: its row averages to 0x39E7, the black row adds 0.
    EXPECT_EQ(c[kW * (kH - 1)], 0x39E7);

    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 0), 0);
    EXPECT_EQ(g_eng.eng_flags, 0u);
    EXPECT_EQ(g_eng.buf_w, kW);
    EXPECT_EQ(g_eng.color_buf, nullptr); // the host hands a buffer over again
    EXPECT_EQ(g_eng.con.con_scale_x, 1);
    EXPECT_EQ(g_eng.depth_buf, g_eng.own_depth_buf);
    EXPECT_EQ((std::array{vp->x, vp->width, vp->height}), (std::array{20, 100, 50})); // x stays
    EXPECT_EQ(VRX_Hint(HINT_DOUBLED, 0), 0); // not doubled: nothing
    ASSERT_EQ(VRX_SetRenderBuffer(color.data(), nullptr), 0);
}

TEST_F(EngineTest, SwapForgetsTheCurrentMaterialAndDoublingOutOfMemoryStaysSingle) {
    g_eng.cur_material = reinterpret_cast<vrx::scene::MATERIAL*>(&g_eng);
    ASSERT_EQ(VRX_SwapRenderBuffer(), 0);
    EXPECT_EQ(g_eng.cur_material, nullptr);

    long before = vrx::engine::alloc_outstanding();
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_Hint(HINT_DOUBLED, 1), 0);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(g_eng.eng_flags & 8u, 0u);
    EXPECT_EQ(g_eng.buf_w, kW);
    EXPECT_EQ(g_eng.color_buf, color.data());
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(last_error(), "Allocate double buffers fail in EnterDoubleMode!!\n");
}

} // namespace
