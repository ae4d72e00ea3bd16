// The TGA-family decoder: uncompressed true-colour TGA files (24 or 32 bits) and the two
// pre-converted 16-bit files whose pixels are already in the engine's RGBA4444 or RGB565
// layout. The first fourteen bytes tell the members apart, never the file's extension.
#pragma once

#include <cstdint>

namespace vrx::assets {

// The engine's pixel-format codes (ColorFmt).
enum ColorFmt : int32_t {
    CF_RGB565 = 0,   // 16-bit word, red in bits 15-11
    CF_RGB888 = 2,   // bytes red, green, blue
    CF_RGBA8888 = 3, // four bytes a pixel (byte order depends on the user, see textures)
    CF_RGBA4444 = 4, // 16-bit word, red in bits 15-12, alpha in bits 3-0
};

inline constexpr uint32_t kTgaHeaderSize = 18;  // true-colour header
inline constexpr uint32_t kTg16HeaderSize = 20; // pre-converted 16-bit header

// Decodes the file at `path` (read through resourceGetData) into width x height pixels,
// top row first. With keep32 0 true-colour files become CF_RGB565 (24-bit) or CF_RGBA4444
// (32-bit); otherwise CF_RGB888 or CF_RGBA8888 (bytes R, G, B, A). Pre-converted files come
// in their own format either way. On success returns 1 and `owned` says whether the caller
// releases the pixels with eng_free (0: they lie inside the host's memory pack). On failure
// returns 0 with `pixels` null, having released everything it allocated.
int32_t LoadTGA(const char* path, int32_t* width, int32_t* height, void** pixels, int32_t* format,
                int32_t* owned, int32_t keep32) noexcept;

// The true-colour converters over a whole file of `size` bytes: 32-bit source to
// CF_RGBA4444 or CF_RGBA8888, 24-bit source to CF_RGB565 or CF_RGB888. Each returns a new
// buffer, or null after reporting why.
uint8_t* LoadUncompressedTGA(const uint8_t* file, uint32_t size, int32_t format) noexcept;
uint8_t* LoadUncompressedTGA24(const uint8_t* file, uint32_t size, int32_t format) noexcept;

} // namespace vrx::assets
