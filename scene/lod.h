// Level-of-detail controllers: a list of simpler substitute objects drawn in place of
// their owner beyond depth thresholds.
#pragma once

#include <cstdint>

#include "engine/handles.h"
#include "lite_vrx.h"

namespace vrx::scene {

struct OBJECT;

struct LOD_CTRL {
    uint32_t id;       // 'LODC'; 0 once released
    int32_t refs;      // objects sharing the controller
    int32_t count;     // levels in the list
    int32_t current;   // level chosen at the last draw, 0 = the owner itself
    int32_t enabled;   // 1 at creation
    FIXED bias;        // factor applied to the depth
    OBJECT** levels;   // count objects
    FIXED* thresholds; // count depths
};

// Drops one reference; at zero frees the arrays and the record.
void lod_release(LOD_CTRL* l) noexcept;

} // namespace vrx::scene
