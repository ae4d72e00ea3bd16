// Objects: the record's life (creation, tree links, release with shared geometry, tracks
// and controllers) and the exported object operations.
#include "scene/object.h"

#include <cstddef>
#include <type_traits>

#include "engine/alloc.h"
#include "engine/vector.h"
#include "scene/hierarchy.h"
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

namespace {

// Widens [lo, hi] by p; the first point sets both corners.
void widen(bool& first, VECTOR& lo, VECTOR& hi, const VECTOR& p) noexcept {
    if (first) {
        lo = hi = p;
        first = false;
        return;
    }
    lo = {p.x < lo.x ? p.x : lo.x, p.y < lo.y ? p.y : lo.y, p.z < lo.z ? p.z : lo.z};
    hi = {p.x > hi.x ? p.x : hi.x, p.y > hi.y ? p.y : hi.y, p.z > hi.z ? p.z : hi.z};
}

} // namespace

void object_calc_bbox(OBJECT* o) noexcept {
    bool first = true;
    VECTOR lo = o->bbox_min, hi = o->bbox_max;
    for (OBJECT* c = o->first_child; c; c = c->next) {
        for (int i = 0; i < 8; ++i) {
            const VECTOR corner{(i & 1) ? c->bbox_max.x : c->bbox_min.x,
                                (i & 2) ? c->bbox_max.y : c->bbox_min.y,
                                (i & 4) ? c->bbox_max.z : c->bbox_min.z};
            VECTOR p{};
            engine::base_to_global(corner, c->local_ucs, p);
            widen(first, lo, hi, p);
        }
    }
    if (o->geo)
        for (int32_t i = 0; i < o->geo->num_vertexs; ++i)
            widen(first, lo, hi, o->geo->vertexs[i].pos);
    o->bbox_min = lo;
    o->bbox_max = hi;
    VECTOR sum{};
    engine::vec_add(lo, hi, sum);
    o->center = {engine::F_MUL(sum.x, 0x8000), engine::F_MUL(sum.y, 0x8000),
                 engine::F_MUL(sum.z, 0x8000)};
    hie_refresh_tree(o);
    VECTOR diag{}, world_diag{};
    engine::vec_sub(hi, lo, diag);
    engine::dir_to_global(diag, o->global_ucs, world_diag);
    o->radius = engine::vec_len(world_diag) >> 1;
}

} // namespace vrx::scene
