// The world record: a scene that owns its top-level objects, its omni lights and its
// billboards, with the scene's ambient light and a visibility word. Worlds live on
// world_list in creation order, which is the order VRX_RenderAll draws them in.
#pragma once

#include <cstdint>

#include "engine/handles.h"

namespace vrx::scene {

struct OBJECT;
struct OMNI_LIGHT;
struct BILLBOARD;

// Red, green and blue as 16.16 values; a colour byte c is stored as c x 256.
struct RGB_FIXED {
    int32_t r, g, b;
};

struct WORLD {
    static constexpr uint32_t kTag = engine::TAG_WORLD;
    uint32_t tag;         // kind tag 'WRLD'; 0 once released
    uint32_t visible;     // bit 0 set: drawn by the render calls
    RGB_FIXED amb_color;  // ambient colour, 0x10000 per channel on creation
    RGB_FIXED amb_scaled; // amb_color times amb_scale, per channel
    int32_t amb_scale;    // ambient multiplier, 1.0 on creation
    WORLD* prev;          // world_list links
    WORLD* next;
    OBJECT* obj_head; // top-level objects, in order of arrival
    OBJECT* obj_tail;
    OMNI_LIGHT* omni_head; // the world's omni lights
    OMNI_LIGHT* omni_tail;
    BILLBOARD* bb_head; // the world's billboards
    BILLBOARD* bb_tail;
};

// Appends a world at the tail of world_list.
void LinkWorld(WORLD* w) noexcept;
// Removes a world from world_list and clears its links.
void UnlinkWorld(WORLD* w) noexcept;

// Recomputes amb_scaled from amb_color and amb_scale; every change of either calls it.
void world_update_ambient(WORLD* w) noexcept;

// Makes a world with the given visibility word, linked at the tail of world_list; null
// when out of memory (nothing is reported: the caller reports with its own message).
WORLD* world_create(uint32_t visible) noexcept;

// Unlinks a world and frees it with everything it owns: its objects with their trees,
// then its omni lights, then its billboards, then the record. Cameras, materials,
// textures and windows are not touched.
void world_delete(WORLD* w) noexcept;

// Frees every world in list order with everything it owns and empties world_list; the
// worlds step of ClearAllObjects. Never fails: returns 0.
int32_t clear_worlds() noexcept;

} // namespace vrx::scene
