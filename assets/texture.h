// The texture record shared by materials, the rasteriser and the texture loaders.
#pragma once

#include <cstdint>

#include "engine/alloc.h"
#include "engine/handles.h"

namespace vrx::assets {

// Texel layouts (alpha_kind).
inline constexpr int32_t kAlpha565 = 0;
inline constexpr int32_t kAlpha4444 = 1;
inline constexpr int32_t kAlpha8888 = 2;

struct TEXTURE {
    static constexpr uint32_t kTag = engine::TAG_TEXTURE;
    uint32_t id;          // kind tag 'TXUR'; 0 once released
    char* name;           // owned, upper-cased name
    void* data;           // width x height texels, top row first
    int32_t width;        // power of two
    int32_t height;       // power of two
    int32_t width_log2;
    int32_t height_log2;
    uint32_t ref_count;   // holders: materials, the host
    int32_t alpha_kind;   // kAlpha565, kAlpha4444 or kAlpha8888
    TEXTURE* prev;        // texture_list links
    TEXTURE* next;
    int32_t own_data;     // 1 when data is freed with the record
};

// Releases the name, the pixels if owned, and the record (tag cleared); does not unlink.
inline void FreeTexture(TEXTURE* t) noexcept {
    engine::eng_free(t->name);
    if (t->own_data) engine::eng_free(t->data);
    engine::free_record(t);
}

} // namespace vrx::assets
