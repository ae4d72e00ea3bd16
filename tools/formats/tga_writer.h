// Writers for the TGA-family files the engine reads: uncompressed true-colour TGA (24 or 32
// bits, rows stored bottom row first) and the pre-converted 16-bit files whose 20-byte header
// starts 00 00 FF (RGBA4444 words) or 00 00 FE (RGB565 words), rows top row first.
#pragma once

#include <cstdint>
#include <vector>

namespace vrx::formats {

struct Rgba {
    uint8_t r, g, b, a;
};

// A true-colour TGA of `pixels` (width x height, top row of the picture first). `bits` is 24
// (alpha dropped) or 32. Throws std::invalid_argument for other depths, sizes outside
// 1..65535 or a pixel count that does not match.
std::vector<uint8_t> write_tga(int width, int height, int bits, const std::vector<Rgba>& pixels);

enum class Tg16Kind : uint8_t {
    RGBA4444 = 0xFF,
    RGB565 = 0xFE,
};

// A pre-converted 16-bit file of `words` (width x height, top row first), written as
// little-endian words; bytes 18-19 of the header are written as 0.
std::vector<uint8_t> write_tg16(Tg16Kind kind, int width, int height,
                                const std::vector<uint16_t>& words);

} // namespace vrx::formats
