// Hierarchy links: refresh of global placements, link and unlink keeping world placement,
// name search and hierarchy data files.
#include "scene/hierarchy.h"

#include "engine/vector.h"

namespace vrx::scene {

void HieRefresh(OBJECT* o) noexcept {
    if (!o->parent) {
        o->global_ucs = o->local_ucs;
        o->flags &= ~OBJ_MOVED;
    } else if (o->flags & OBJ_MOVED) {
        o->flags &= ~OBJ_MOVED;
        engine::ucs_to_global(o->local_ucs, o->parent->global_ucs, o->global_ucs);
    }
    for (OBJECT* c = o->first_child; c; c = c->next) HieRefresh(c);
}

void hie_refresh_tree(OBJECT* o) noexcept {
    HieRefresh(object_root(o));
}

} // namespace vrx::scene
