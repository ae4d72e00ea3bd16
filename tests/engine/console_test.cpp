// ReportError, last_error and the on-screen console.
#include <gtest/gtest.h>

#include <array>
#include <string>

#include "engine/console.h"
#include "engine/error.h"
#include "engine/state.h"
#include "support/engine_fixture.h"

using namespace vrx::engine;
using vrx::test::EngineTest;

namespace {

// Glyph bit (k, r) of the font, read the way the console draws it.
bool glyph_bit(int c, int k, int r) {
    uint32_t word = ConFont[c * 4 + r / 4];
    return (word >> (31 - 8 * (r % 4) - k)) & 1u;
}

class Console : public EngineTest {
  protected:
    // True when the cell at (col, row) shows glyph c at scale 1 in the console colour.
    bool cell_shows(int col, int row, int c) const {
        for (int r = 0; r < 16; ++r)
            for (int k = 0; k < 8; ++k) {
                uint16_t want = glyph_bit(c, k, r) ? 0xFFFF : 0;
                if (pixel(col * 8 + k, row * 16 + r) != want) return false;
            }
        return true;
    }
};

TEST_F(Console, FontIsCodePage437) {
    // The full block is all set, 0 and space are blank, 'A' and the smiley face (0x01) are drawn.
    auto bits = [](int c) {
        int n = 0;
        for (int r = 0; r < 16; ++r)
            for (int k = 0; k < 8; ++k) n += glyph_bit(c, k, r);
        return n;
    };
    EXPECT_EQ(bits(0xDB), 128);
    EXPECT_EQ(bits(0) + bits(' '), 0);
    EXPECT_GT(bits('A'), 20);
    EXPECT_GT(bits(1), 20);
}

TEST_F(Console, ControlCharactersAndWrapping) {
    ConPutString("AB\bC"); // backspace moves back and draws over
    EXPECT_TRUE(cell_shows(0, 0, 'A') && cell_shows(1, 0, 'C'));
    ConPutString("\b\b\b\b"); // never below column 0
    EXPECT_EQ(g_eng.con.con_col, 0);
    ConPutString(std::string(30, 'x').c_str()); // the 30th character ends the line
    EXPECT_EQ((std::array{g_eng.con.con_col, g_eng.con.con_row}), (std::array{0, 1}));
    ConPutString("y");
    EXPECT_TRUE(cell_shows(0, 1, 'y'));
    g_eng.con.con_row = 19; // a newline on the last row starts again at the top, no scrolling
    ConPutString("\nab\rc");
    EXPECT_TRUE(cell_shows(0, 0, 'c') && cell_shows(1, 0, 'b'));
    EXPECT_EQ((std::array{g_eng.con.con_col, g_eng.con.con_row}), (std::array{1, 0}));
}

TEST_F(Console, ScaleIsClampedAndSizesFollow) {
    struct Case {
        int sx, sy;
        std::array<int32_t, 6> want; // scale x, y, cell w, h, columns, rows
    };
    const Case cases[] = {{1, 1, {1, 1, 8, 16, 30, 20}},
                          {0, 9, {1, 8, 8, 128, 30, 2}},
                          {2, 2, {2, 2, 16, 32, 15, 10}},
                          {-4, 1, {1, 1, 8, 16, 30, 20}},
                          {8, 3, {8, 3, 64, 48, 3, 6}}};
    for (const Case& c : cases) {
        ConSetScale(c.sx, c.sy);
        const CONSOLE& k = g_eng.con;
        EXPECT_EQ((std::array{k.con_scale_x, k.con_scale_y, k.con_cell_w, k.con_cell_h, k.con_cols,
                              k.con_rows}),
                  c.want);
    }
    EXPECT_EQ(g_eng.con.con_color, 0xFFFF);
    ConSetScale(1, 1); // the next open keeps the cell size
}

TEST_F(Console, ScaledGlyphsFillBlocksAndStayInsideTheBuffer) {
    ConSetScale(2, 3);
    ConDrawChar(10, 20, 0xDB); // full block: 16 x 48 pixels of console colour
    for (int y = 20; y < 20 + 48; ++y)
        for (int x = 10; x < 10 + 16; ++x) ASSERT_EQ(pixel(x, y), 0xFFFF) << x << "," << y;
    EXPECT_EQ(pixel(9, 20), 0);
    EXPECT_EQ(pixel(26, 20), 0);
    ConDrawChar(kW - 4, kH - 8, 0xDB); // hangs off the buffer's corner
    EXPECT_EQ(pixel(kW - 1, kH - 1), 0xFFFF);
    EXPECT_EQ(pixel(kW - 5, kH - 1), 0);
    ConSetScale(1, 1);
}

TEST_F(Console, ReopenAfterDoubledCloseKeepsTheConsoleInsideTheBuffer) {
    ConSetScale(2, 2); // as a close in doubled mode leaves it
    VRX_Close();
    ASSERT_EQ(VRX_Open(0, kW, kH, VRX_FMT_RGB565), 0);
    const CONSOLE& c = g_eng.con;
    EXPECT_LE(c.con_cols * c.con_cell_w, g_eng.buf_w);
    EXPECT_LE(c.con_rows * c.con_cell_h, g_eng.buf_h);
    ConSetScale(1, 1);
}

TEST_F(Console, ReportedMessagesShowAccumulateAndRestartAt1024) {
    ReportError("A%s\n", "B");
    ReportError("second\n");
    EXPECT_EQ(last_error(), "AB\nsecond\n");
    EXPECT_TRUE(cell_shows(0, 0, 'A') && cell_shows(1, 0, 'B') && cell_shows(0, 1, 's'));

    // 1000 bytes held: 30 more would reach 1024, so the text restarts; 20 more fit.
    const std::string fill(1000, 'f'), thirty(29, 't'), twenty(19, 'w');
    const std::pair<std::string, std::string> cases[] = {{thirty + "\n", thirty + "\n"},
                                                         {twenty + "\n", fill + twenty + "\n"}};
    for (const auto& [add, want] : cases) {
        std::memcpy(g_eng.last_error, fill.c_str(), fill.size() + 1);
        ReportError("%s", add.c_str());
        EXPECT_EQ(last_error(), want);
    }
    ReportError("%s", std::string(5000, 'h').c_str()); // cut, not overflowed
    EXPECT_EQ(last_error().size(), 1023u);
    g_eng.color_buf = nullptr; // no buffer: the text is kept, nothing is drawn
    ReportError("quiet\n");
    EXPECT_EQ(last_error(), "quiet\n");
    g_eng.color_buf = color.data();
}

} // namespace
