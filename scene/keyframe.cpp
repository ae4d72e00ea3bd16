// Keyframe tracks: release, object and camera steps and keyframe files.
#include "scene/keyframe.h"

#include "engine/alloc.h"

namespace vrx::scene {

void keyframe_release(KEYFRAME* k) noexcept {
    if (!k || --k->refs > 0) return;
    if (k->vert_transforms) {
        for (int32_t f = 0; f < k->count; ++f) engine::eng_free(k->vert_transforms[f].Verts);
        engine::eng_free(k->vert_transforms);
    }
    engine::eng_free(k->placements);
    engine::eng_free(k);
}

} // namespace vrx::scene
