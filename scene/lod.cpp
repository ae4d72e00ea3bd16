// Level-of-detail controllers: creation, release and the exported controls.
#include "scene/lod.h"

#include "engine/alloc.h"

namespace vrx::scene {

void lod_release(LOD_CTRL* l) noexcept {
    if (!l || --l->refs > 0) return;
    l->id = 0;
    engine::eng_free(l->levels);
    engine::eng_free(l->thresholds);
    engine::eng_free(l);
}

} // namespace vrx::scene
