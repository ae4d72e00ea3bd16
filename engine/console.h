// The on-screen text console: an 8x16 code-page-437 font drawn straight into the colour
// buffer at the cursor, wrapping to the top when it reaches the bottom.
#pragma once

#include <cstdint>

namespace vrx::engine {

// 256 glyphs, four 32-bit words each; row r of a glyph is byte (3 - r % 4) of word r / 4,
// its most significant bit the leftmost pixel.
extern const uint32_t ConFont[256 * 4];

int32_t ConInit() noexcept;
int32_t ConSetScale(int32_t sx, int32_t sy) noexcept;
int32_t ConPutString(const char* text) noexcept;
int32_t ConDrawChar(int32_t x, int32_t y, int32_t c) noexcept;
int32_t ConPrintf(const char* fmt, ...) noexcept __attribute__((format(printf, 1, 2)));

} // namespace vrx::engine
