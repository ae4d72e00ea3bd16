// Keyframe tracks: whole placements (and optionally whole vertex sets) per frame, stepped
// explicitly by the host. Tracks are shared between shallow object copies by `refs`.
#pragma once

#include <cstdint>

#include "lite_vrx.h"

namespace vrx::scene {

// One vertex of a vertex frame: position and normal.
struct VERT_FRAME_VERTEX {
    VECTOR pos;
    VECTOR normal;
};

// One vertex frame: `count` vertices.
struct VERT_FRAME {
    int32_t count;
    VERT_FRAME_VERTEX* Verts; // owned
};

struct KEYFRAME {
    int32_t count;               // frames
    UCS* placements;             // count placements, or null
    VERT_FRAME* vert_transforms; // count vertex frames, or null
    int32_t refs;                // objects sharing the track
};

// Drops one reference; at zero frees the vertex frames, the placements and the record.
void keyframe_release(KEYFRAME* k) noexcept;

} // namespace vrx::scene
