// A test fixture that opens a 240x320 RGB565 engine with a colour buffer of its own
// and closes it after the test, so every test starts from a freshly opened engine.
#pragma once

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

#include "engine/state.h"
#include "lite_vrx.h"

namespace vrx::test {

class EngineTest : public ::testing::Test {
  protected:
    static constexpr int kW = 240, kH = 320;

    void SetUp() override {
        ASSERT_EQ(VRX_Open(0, kW, kH, VRX_FMT_RGB565), 0);
        color.assign(static_cast<size_t>(kW) * kH, 0);
        ASSERT_EQ(VRX_SetRenderBuffer(color.data(), nullptr), 0);
        clear_last_error();
    }
    void TearDown() override { VRX_Close(); }

    // Empties last_error so a test sees only the messages it caused.
    static void clear_last_error() { vrx::engine::g_eng.last_error[0] = '\0'; }
    static std::string last_error() {
        char text[1024];
        VRX_GetLastError(text);
        return text;
    }
    uint16_t pixel(int x, int y) const { return color[static_cast<size_t>(y) * kW + x]; }

    std::vector<uint16_t> color;
};

} // namespace vrx::test
