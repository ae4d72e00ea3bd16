// The texture record shared by materials, the rasteriser and the texture loaders, and the
// operations on it: find-or-load by name, textures from host pixels, resampling to powers of
// two, sharing by reference count, and release.
//
// Ownership: a texture owns its name and, when own_data is 1, its pixels. It lives on
// g_eng.texture_list until its last reference goes or the clear-all frees it.
#pragma once

#include <cstdint>

#include "engine/alloc.h"
#include "engine/handles.h"

namespace vrx::assets {

// Texel layouts (alpha_kind).
inline constexpr int32_t kAlpha565 = 0;
inline constexpr int32_t kAlpha4444 = 1;
inline constexpr int32_t kAlpha8888 = 2; // little-endian word 0xAARRGGBB

// Texture sizes run from 1 to 32767 so that size << 16 fits a signed 32-bit step.
inline constexpr int32_t kMaxTextureSize = 32767;

struct TEXTURE {
    static constexpr uint32_t kTag = engine::TAG_TEXTURE;
    uint32_t id;    // kind tag 'TXUR'; 0 once released
    char* name;     // owned, upper-cased name
    void* data;     // width x height texels, top row first
    int32_t width;  // power of two
    int32_t height; // power of two
    int32_t width_log2;
    int32_t height_log2;
    uint32_t ref_count; // holders: materials, the host
    int32_t alpha_kind; // kAlpha565, kAlpha4444 or kAlpha8888
    TEXTURE* prev;      // texture_list links
    TEXTURE* next;
    int32_t own_data; // 1 when data is freed with the record
};

// Releases the name, the pixels if owned, and the record (tag cleared); does not unlink.
inline void FreeTexture(TEXTURE* t) noexcept {
    engine::eng_free(t->name);
    if (t->own_data) engine::eng_free(t->data);
    engine::free_record(t);
}

// Numbers the textures made from host pixels (names TX0000000 onward).
extern int32_t texture_serial;

// True for x > 0 with exactly one bit set.
constexpr bool IsPow2(int32_t x) noexcept {
    return x > 0 && (x & (x - 1)) == 0;
}
// Index of the highest set bit; 0 for x <= 1.
constexpr int32_t Log2Floor(int32_t x) noexcept {
    int32_t n = 0;
    while (x > 1) {
        x >>= 1;
        ++n;
    }
    return n;
}

// Nearest-neighbour resampling of a sw x sh image into dw x dh, with 16.16 steps and no
// half-pixel offset. Contract: 1 <= sw, sh <= kMaxTextureSize; dw, dh below 1 draw nothing.
void StretchImage16(uint16_t* dst, int32_t dw, int32_t dh, const uint16_t* src, int32_t sw,
                    int32_t sh) noexcept;
void StretchImage32(uint32_t* dst, int32_t dw, int32_t dh, const uint32_t* src, int32_t sw,
                    int32_t sh) noexcept;

// Appends at the tail of texture_list / unlinks in place.
void LinkTexture(TEXTURE* t) noexcept;
void UnlinkTexture(TEXTURE* t) noexcept;

// The texture named `name` on texture_list, or else a new one loaded from its file. Takes
// ownership of `name` (heap, from eng_malloc); does not add a reference. Null after a
// reported failure.
TEXTURE* FindOrLoadTexture(char* name) noexcept;
// Loads data_path + name through the decoder its extension chooses. Takes ownership of
// `name`; null after a reported failure, with texture_list unchanged.
TEXTURE* LoadTextureFile(char* name) noexcept;
// A new texture holding a copy of the host's pixels, grown to powers of two. Takes ownership
// of `name`; null after a reported failure.
TEXTURE* NewTextureFromPixels(char* name, int32_t width, int32_t height, const void* pixels,
                              int32_t format) noexcept;
// The textures step of the clear-all: frees every texture whatever its count. Returns 0.
int32_t ClearTextures() noexcept;

} // namespace vrx::assets
