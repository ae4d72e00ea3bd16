// Fixture for the asset tests: an open engine, a fresh temporary directory for files the
// test writes with the format writers, and no pack selected or data path set around it.
#pragma once

#include <gtest/gtest.h>

#include <stdlib.h>

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

#include "engine/state.h"
#include "formats/tga_writer.h"
#include "formats/v3z_writer.h"
#include "lite_vrx.h"
#include "support/engine_fixture.h"

namespace vrx::test {

class AssetTest : public EngineTest {
  protected:
    void SetUp() override {
        EngineTest::SetUp();
        // Short, so that full paths still fit the 30 characters of a VRK2 entry name.
        char tmpl[] = "/tmp/vrxXXXXXX";
        ASSERT_NE(mkdtemp(tmpl), nullptr);
        dir = tmpl;
        ASSERT_EQ(VRX_SetDefaultDataPath(""), 0);
    }
    void TearDown() override {
        VRX_SelectResourceBuffer(nullptr);
        VRX_SelectResourceFile(nullptr);
        VRX_SetDefaultDataPath("");
        EngineTest::TearDown();
        std::error_code ec;
        std::filesystem::remove_all(dir, ec);
    }

    // Writes `bytes` to dir/name and returns the full path.
    std::string put(const std::string& name, const std::vector<uint8_t>& bytes) const {
        std::string path = dir + "/" + name;
        EXPECT_TRUE(formats::save_file(path, bytes));
        return path;
    }

    std::string dir;
};

// Little-endian patching of a pack or file image.
inline void poke32(std::vector<uint8_t>& b, size_t at, uint32_t v) {
    for (int i = 0; i < 4; ++i) b[at + size_t(i)] = static_cast<uint8_t>(v >> (8 * i));
}

} // namespace vrx::test
