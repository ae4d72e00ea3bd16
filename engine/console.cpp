// The text console: cursor movement, glyph drawing and the printf front end.
#include "engine/console.h"

#include <cstdarg>
#include <cstddef>
#include <cstdio>

#include "engine/state.h"

namespace vrx::engine {

int32_t ConInit() noexcept {
    CONSOLE& c = g_eng.con;
    c.con_col = c.con_row = 0;
    c.con_color = 0xFFFF;
    if (c.con_scale_x < 1) ConSetScale(1, 1); // first start: the scale begins at 1 x 1
    // Sized by the current cell rather than a fixed 8x16, so a console that is still at
    // scale 2 after a close in doubled mode fits the buffer.
    c.con_cols = g_eng.buf_w / c.con_cell_w;
    c.con_rows = g_eng.buf_h / c.con_cell_h;
    return 0;
}

int32_t ConSetScale(int32_t sx, int32_t sy) noexcept {
    auto clamp = [](int32_t v) { return v <= 0 ? 1 : (v > 8 ? 8 : v); };
    CONSOLE& c = g_eng.con;
    c.con_scale_x = clamp(sx);
    c.con_scale_y = clamp(sy);
    c.con_cell_w = 8 * c.con_scale_x;
    c.con_cell_h = 16 * c.con_scale_y;
    c.con_cols = g_eng.buf_w / c.con_cell_w;
    c.con_rows = g_eng.buf_h / c.con_cell_h;
    return 0;
}

int32_t ConPutString(const char* text) noexcept {
    CONSOLE& c = g_eng.con;
    for (const char* p = text; *p; ++p) {
        switch (*p) {
            case 8:
                if (c.con_col > 0) --c.con_col;
                break;
            case 10:
                ++c.con_row;
                c.con_col = 0;
                break;
            case 13:
                c.con_col = 0;
                break;
            default:
                ConDrawChar(c.con_cell_w * c.con_col, c.con_cell_h * c.con_row,
                            static_cast<unsigned char>(*p));
                ++c.con_col;
                break;
        }
        if (c.con_col >= c.con_cols) {
            ++c.con_row;
            c.con_col = 0;
        }
        // No scrolling: output goes on at the top row, over what stood there.
        if (c.con_row >= c.con_rows) c.con_row = 0;
    }
    return 0;
}

int32_t ConDrawChar(int32_t x, int32_t y, int32_t ch) noexcept {
    if (!g_eng.color_buf) return 0;
    const CONSOLE& c = g_eng.con;
    const uint32_t* glyph = &ConFont[(ch & 0xFF) * 4];
    for (int32_t r = 0; r < 16; ++r) {
        auto bits = static_cast<uint32_t>(glyph[r / 4] >> (24 - 8 * (r % 4))) & 0xFFu;
        for (int32_t k = 0; k < 8; ++k) {
            uint16_t color = (bits & (0x80u >> k)) ? c.con_color : 0;
            int32_t px = x + c.con_scale_x * k;
            int32_t py = y + c.con_scale_y * r;
            for (int32_t dy = 0; dy < c.con_scale_y; ++dy) {
                int32_t row = py + dy;
                if (row < 0 || row >= g_eng.buf_h) continue; // never write outside the buffer
                uint16_t* line = g_eng.color_buf + static_cast<std::ptrdiff_t>(row) * g_eng.buf_w;
                for (int32_t dx = 0; dx < c.con_scale_x; ++dx) {
                    int32_t col = px + dx;
                    if (col >= 0 && col < g_eng.buf_w) line[col] = color;
                }
            }
        }
    }
    return 0;
}

int32_t ConPrintf(const char* fmt, ...) noexcept {
    char text[512]; // longer output is cut at 511 characters
    va_list args;
    va_start(args, fmt);
    std::vsnprintf(text, sizeof text, fmt, args);
    va_end(args);
    return ConPutString(text);
}

} // namespace vrx::engine
