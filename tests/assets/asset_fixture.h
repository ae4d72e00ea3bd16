// Fixture for the asset tests: an open engine with no data path set, and a fresh temporary
// directory for the files a test writes with the format writers.
#pragma once

#include <gtest/gtest.h>

#include <stdlib.h>

#include <filesystem>
#include <string>
#include <vector>

#include "engine/alloc.h"
#include "formats/tga_writer.h"
#include "formats/v3z_writer.h"
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
        EngineTest::TearDown(); // closing frees the pack file's directory
        std::filesystem::remove_all(dir);
    }
    // Writes `bytes` to dir/name and returns the full path.
    std::string put(const std::string& name, const std::vector<uint8_t>& bytes) const {
        EXPECT_TRUE(formats::save_file(dir + "/" + name, bytes));
        return dir + "/" + name;
    }
    // Little-endian patching of a pack or file image.
    static void poke32(std::vector<uint8_t>& b, size_t at, uint32_t v) {
        for (int i = 0; i < 4; ++i) b[at + size_t(i)] = static_cast<uint8_t>(v >> (8 * i));
    }
    std::string dir;
};

} // namespace vrx::test
