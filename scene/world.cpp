// Worlds: creation, deletion with everything a world owns, visibility, and the worlds
// step of ClearAllObjects. The exported operations are at the bottom.
#include "scene/world.h"

#include <cstddef>
#include <type_traits>

#include "engine/error.h"
#include "engine/fixed.h"
#include "engine/state.h"
#include "scene/object.h"
#include "lite_vrx.h"

namespace vrx::scene {

using engine::g_eng;

static_assert(std::is_standard_layout_v<WORLD>);
static_assert(offsetof(WORLD, tag) == 0, "the kind tag is the record's first word");

namespace {

// Walks a list from its head, freeing every record with `release`, and empties it.
// Each kind a world owns hands its own release to this walk in release_contents.
template <class T>
[[maybe_unused]] void release_list(T*& head, T*& tail, void (*release)(T*) noexcept) noexcept {
    for (T* r = head; r;) {
        T* next = r->next; // read before the record goes
        release(r);
        r = next;
    }
    head = tail = nullptr;
}

void free_object_tree(OBJECT* o) noexcept {
    FreeObjectTree(o, true);
}

// The clear-all frees every material first, so its objects must not release their uses.
void free_object_tree_cleared(OBJECT* o) noexcept {
    FreeObjectTree(o, false);
}

// Frees what a world owns, in the order the engine requires: the objects of its list with
// their whole child trees, then its omni lights, then its billboards. A kind plugs in as
// release_list(w->obj_head, w->obj_tail, <its free>); while no record of a kind can be
// linked into a world, its list is always empty and only its ends are cleared.
void release_contents(WORLD* w, bool clearing_all) noexcept {
    release_list(w->obj_head, w->obj_tail,
                 clearing_all ? free_object_tree_cleared : free_object_tree);
    w->omni_head = w->omni_tail = nullptr;
    w->bb_head = w->bb_tail = nullptr;
}

} // namespace

void LinkWorld(WORLD* w) noexcept {
    g_eng.world_list.append(w);
}

void UnlinkWorld(WORLD* w) noexcept {
    g_eng.world_list.unlink(w);
}

void world_update_ambient(WORLD* w) noexcept {
    w->amb_scaled.r = engine::F_MUL(w->amb_color.r, w->amb_scale);
    w->amb_scaled.g = engine::F_MUL(w->amb_color.g, w->amb_scale);
    w->amb_scaled.b = engine::F_MUL(w->amb_color.b, w->amb_scale);
}

WORLD* world_create(uint32_t visible) noexcept {
    WORLD* w = engine::new_record<WORLD>(); // zeroed: every list head and tail none
    if (!w) return nullptr;
    LinkWorld(w);
    w->visible = visible;
    w->amb_color = RGB_FIXED{0x10000, 0x10000, 0x10000};
    w->amb_scale = 0x10000;
    world_update_ambient(w);
    return w;
}

void world_delete(WORLD* w) noexcept {
    UnlinkWorld(w);
    release_contents(w, false);
    engine::free_record(w);
}

int32_t clear_worlds() noexcept {
    for (WORLD* w = g_eng.world_list.head; w;) {
        WORLD* next = w->next;
        release_contents(w, true);
        engine::free_record(w);
        w = next;
    }
    g_eng.world_list.clear();
    return 0;
}

} // namespace vrx::scene

using namespace vrx;
using scene::WORLD;

extern "C" {

VRX_API int32_t VRX_NewWorld(uint32_t visible, void** out) noexcept {
    if (!out) {
        engine::ReportError("Wrong out in ENG_CreateWorld!!\n");
        return -1;
    }
    WORLD* w = scene::world_create(visible);
    if (!w) {
        engine::ReportError("Allocate World fail!!\n");
        return -1;
    }
    *out = w;
    return 0;
}

VRX_API int32_t VRX_DeleteWorld(void* world) noexcept {
    if (engine::chk_world(world)) {
        engine::ReportError("chk_world return error in ENG_DeleteWorld!!\n");
        return -1;
    }
    scene::world_delete(static_cast<WORLD*>(world));
    return 0;
}

VRX_API int32_t VRX_SetWorldVisibility(void* world, uint32_t visible) noexcept {
    // The check's own message is the only one this operation reports.
    if (engine::chk_world(world)) return -1;
    static_cast<WORLD*>(world)->visible = visible;
    return 0;
}

} // extern "C"
