// Objects: the record's life (creation, tree links, release with shared geometry, tracks
// and controllers) and the exported object operations.
#include "scene/object.h"

#include <cstddef>
#include <type_traits>

#include "engine/alloc.h"
#include "scene/keyframe.h"
#include "scene/lod.h"
#include "scene/material.h"
#include "scene/world.h"

namespace vrx::scene {

static_assert(std::is_standard_layout_v<OBJECT>);
static_assert(offsetof(OBJECT, tag) == 0, "the kind tag is the record's first word");
static_assert(sizeof(VERTEX) == 32);

void InitObject(OBJECT* o) noexcept {
    engine::set_tag(o, OBJECT::kTag);
    o->name = nullptr;
    o->parent = o->first_child = o->last_child = nullptr;
    o->geo = nullptr;
    o->key_index = 0;
    o->keyframe = nullptr;
    o->reserved = nullptr;
    o->lod = nullptr;
}

OBJECT* object_new() noexcept {
    OBJECT* o = engine::new_record<OBJECT>();
    if (!o) return nullptr;
    InitObject(o);
    o->alpha = 0x10000;
    return o;
}

void geo_release(GEO* g, bool release_materials) noexcept {
    if (!g || --g->refs > 0) return;
    engine::eng_free(g->vertexs);
    engine::eng_free(g->faces);
    if (g->geo_pack && release_materials)
        for (int32_t i = 0; i < g->num_packs; ++i)
            if (g->geo_pack[i].material) release_material(g->geo_pack[i].material);
    engine::eng_free(g->geo_pack);
    engine::eng_free(g);
}

void FreeObjectTree(OBJECT* o, bool release_materials) noexcept {
    for (OBJECT* c = o->first_child; c;) {
        OBJECT* next = c->next; // read before the child goes
        FreeObjectTree(c, release_materials);
        c = next;
    }
    geo_release(o->geo, release_materials);
    keyframe_release(o->keyframe);
    lod_release(o->lod);
    engine::eng_free(o->reserved);
    engine::eng_free(o->name);
    engine::free_record(o);
}

void MarkMoved(OBJECT* o) noexcept {
    for_each_in_tree(o, [](OBJECT* n) { n->flags |= OBJ_MOVED; });
}

void AppendChild(OBJECT* parent, OBJECT* child) noexcept {
    child->parent = parent;
    child->prev = parent->last_child;
    child->next = nullptr;
    if (parent->last_child)
        parent->last_child->next = child;
    else
        parent->first_child = child;
    parent->last_child = child;
}

void RemoveChild(OBJECT* child) noexcept {
    OBJECT* p = child->parent;
    if (child->prev)
        child->prev->next = child->next;
    else if (p)
        p->first_child = child->next;
    if (child->next)
        child->next->prev = child->prev;
    else if (p)
        p->last_child = child->prev;
    child->parent = child->prev = child->next = nullptr;
}

OBJECT* object_root(OBJECT* o) noexcept {
    while (o->parent) o = o->parent;
    return o;
}

void object_set_world(OBJECT* o, WORLD* w) noexcept {
    for_each_in_tree(o, [w](OBJECT* n) { n->world = w; });
}

void LinkObjectToWorld(OBJECT* o) noexcept {
    WORLD* w = o->world;
    o->prev = w->obj_tail;
    o->next = nullptr;
    if (w->obj_tail)
        w->obj_tail->next = o;
    else
        w->obj_head = o;
    w->obj_tail = o;
}

void UnlinkObjectFromWorld(OBJECT* o) noexcept {
    WORLD* w = o->world;
    if (o->prev)
        o->prev->next = o->next;
    else if (w && w->obj_head == o)
        w->obj_head = o->next;
    if (o->next)
        o->next->prev = o->prev;
    else if (w && w->obj_tail == o)
        w->obj_tail = o->prev;
    o->prev = o->next = nullptr;
}

} // namespace vrx::scene
