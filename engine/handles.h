// Tagged handles: every record handed to the host starts with a 32-bit kind tag, and
// every live record is in a registry, so a check can refuse a stale or garbage pointer
// without reading memory the engine does not own.
#pragma once

#include <cstdint>
#include <cstring>
#include <type_traits>

#include "engine/alloc.h"

namespace vrx::engine {

// Kind tags: four characters, the first in the most significant byte.
inline constexpr uint32_t TAG_WORLD = 0x57524C44;     // 'WRLD'
inline constexpr uint32_t TAG_OBJECT = 0x4F424354;    // 'OBCT'
inline constexpr uint32_t TAG_CAMERA = 0x43414D45;    // 'CAME'
inline constexpr uint32_t TAG_MATERIAL = 0x4D54524C;  // 'MTRL'
inline constexpr uint32_t TAG_TEXTURE = 0x54585552;   // 'TXUR'
inline constexpr uint32_t TAG_OMNI = 0x4F4D4E49;      // 'OMNI'
inline constexpr uint32_t TAG_IMAGE = 0x494D4147;     // 'IMAG'
inline constexpr uint32_t TAG_VPORT = 0x56505254;     // 'VPRT'
inline constexpr uint32_t TAG_BILLBOARD = 0x424C4244; // 'BLBD'
inline constexpr uint32_t TAG_LODC = 0x4C4F4443;      // 'LODC', never checked

// Live-record registry, O(1) per operation. A pointer that is not registered reads as
// tag 0, exactly as a freed record's cleared tag would.
bool registry_add(const void* rec, uint32_t tag) noexcept;
void registry_remove(const void* rec) noexcept;
uint32_t registry_tag(const void* rec) noexcept;
long registry_size() noexcept;

// Allocates a zeroed record of kind T, writes its tag and registers it; null when out
// of memory (nothing is reported: the caller reports with its own message).
// The tag is the record's first word, whatever the record calls it.
template <class T> void set_tag(T* rec, uint32_t tag) noexcept {
    static_assert(std::is_standard_layout_v<T> && sizeof(T) >= 4);
    std::memcpy(static_cast<void*>(rec), &tag, sizeof tag);
}

template <class T> T* new_record() noexcept {
    auto* rec = static_cast<T*>(eng_calloc(1, sizeof(T)));
    if (!rec) return nullptr;
    set_tag(rec, T::kTag);
    if (!registry_add(rec, T::kTag)) {
        eng_free(rec);
        return nullptr;
    }
    return rec;
}

// Clears the tag, unregisters and frees a record made by new_record.
template <class T> void free_record(T* rec) noexcept {
    if (!rec) return;
    set_tag(rec, 0);
    registry_remove(rec);
    eng_free(rec);
}

// The kind checks: 0 when `h` is a live record of the kind; otherwise they report their
// message and return 1.
uint32_t chk_world(const void* h) noexcept;
uint32_t chk_object(const void* h) noexcept;
uint32_t chk_camera(const void* h) noexcept;
uint32_t chk_material(const void* h) noexcept;
uint32_t chk_texture(const void* h) noexcept;
uint32_t chk_omni(const void* h) noexcept;
uint32_t chk_image(const void* h) noexcept;
uint32_t chk_window(const void* h) noexcept;
uint32_t chk_billboard(const void* h) noexcept;

} // namespace vrx::engine
