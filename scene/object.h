// The object record: a node of a scene tree with a placement relative to its parent (or
// its world), optional shared geometry, an optional keyframe track and level-of-detail
// controller, flags, alpha and a name; and the tree operations every scene file uses.
//
// Ownership: an object owns its name and its children. Geometry, keyframe tracks and
// level-of-detail controllers are shared by reference count between copies and freed
// with their last holder.
#pragma once

#include <cstdint>

#include "engine/handles.h"
#include "lite_vrx.h"

namespace vrx::scene {

struct WORLD;
struct MATERIAL;
struct KEYFRAME;
struct LOD_CTRL;

// Bits of OBJECT::flags.
inline constexpr uint32_t OBJ_VISIBLE = 0x1;
inline constexpr uint32_t OBJ_SHOW_BOX = 0x100;
inline constexpr uint32_t OBJ_WIREFRAME = 0x200;
inline constexpr uint32_t OBJ_KEY_FROZEN = 0x400;
inline constexpr uint32_t OBJ_MOVED = 0x800;
inline constexpr uint32_t OBJ_SHOW_AXES = 0x1000;
// Bit of VRX_SetObjectVisibility's argument: apply to the whole subtree.
inline constexpr uint32_t VIS_TREE = 0x10000000;

// One triangle: face normal, plane constant, three vertex indices counted from the first
// vertex of the face's pack, and one further value kept from the file.
struct FACE {
    VECTOR normal;
    FIXED d;
    uint16_t v[3];
    uint16_t extra;
};

// A run of vertices and faces drawn with one material.
struct GEO_PACK {
    MATERIAL* material;
    int32_t num_vertexs;
    int32_t num_faces;
    VERTEX* vertexs; // first vertex, inside GEO::vertexs
    FACE* faces;     // first face, inside GEO::faces
    int32_t user[3]; // not set by the loader
};

// Geometry shared between copies of an object.
struct GEO {
    int32_t refs; // objects pointing here
    int32_t num_vertexs;
    int32_t num_faces;
    VERTEX* vertexs;
    FACE* faces;
    int32_t num_packs;
    GEO_PACK* geo_pack;
};

struct OBJECT {
    static constexpr uint32_t kTag = engine::TAG_OBJECT;
    uint32_t tag;    // kind tag 'OBCT'; 0 once released
    char* name;      // owned, upper-cased, or null
    UCS local_ucs;   // placement in the parent's (or world's) coordinates
    UCS global_ucs;  // placement in world coordinates, valid after HieRefresh
    VECTOR bbox_min; // bounding box in own coordinates
    VECTOR bbox_max;
    VECTOR center; // centre of the box (the pivot), own coordinates
    FIXED radius;  // bounding-sphere radius about center
    OBJECT* prev;  // siblings: parent's child list, or the world's object list
    OBJECT* next;
    OBJECT* parent; // null for a top-level object
    OBJECT* first_child;
    OBJECT* last_child;
    GEO* geo;           // shared geometry, or null for a grouping node
    WORLD* world;       // the world of the object's tree
    uint32_t flags;     // OBJ_* bits
    int32_t key_index;  // current keyframe
    KEYFRAME* keyframe; // shared keyframe track, or null
    void* reserved;     // always null
    LOD_CTRL* lod;      // shared level-of-detail controller, or null
    FIXED alpha;        // 0x10000 opaque, at most 0x10000
};

// Sets the tag and clears name, parent, children, geo, key_index, keyframe, reserved and
// lod; the other fields are left as they are.
void InitObject(OBJECT* o) noexcept;

// Allocates a zeroed, registered object with InitObject applied and alpha 0x10000; null
// when out of memory (nothing reported).
OBJECT* object_new() noexcept;

// Frees an object with its whole subtree (children first, in child order): drops one
// reference on geo (at zero the geometry goes, releasing one use of each pack's material
// when release_materials is set), keyframe and lod, then the name and the record. The
// caller has already unlinked the object from its parent or world.
void FreeObjectTree(OBJECT* o, bool release_materials = true) noexcept;

// Drops one reference on geometry; at zero frees it (and releases one use of each pack's
// material when release_materials is set).
void geo_release(GEO* g, bool release_materials) noexcept;

// Sets OBJ_MOVED on an object and every descendant.
void MarkMoved(OBJECT* o) noexcept;

// Makes `child` the last child of `parent` (prev = old last child, next none).
void AppendChild(OBJECT* parent, OBJECT* child) noexcept;

// Takes an object out of its parent's child list; parent, prev and next become null.
void RemoveChild(OBJECT* child) noexcept;

// The root of an object's tree (following parent up).
OBJECT* object_root(OBJECT* o) noexcept;

// Sets `world` on an object and every descendant.
void object_set_world(OBJECT* o, WORLD* w) noexcept;

// Appends a top-level object at the tail of its world's object list / removes it from
// that list, clearing prev and next.
void LinkObjectToWorld(OBJECT* o) noexcept;
void UnlinkObjectFromWorld(OBJECT* o) noexcept;

// ENG_CalcObjectBBox: rebuilds bbox_min/bbox_max from the children's box corners (in the
// object's coordinates) and the object's own vertices, keeping the old box when there is
// neither; then center, a tree refresh, and radius from the box diagonal in world scale.
void object_calc_bbox(OBJECT* o) noexcept;

// Applies f to an object and then to every descendant, parent before children.
template <class F> void for_each_in_tree(OBJECT* o, F&& f) noexcept {
    f(o);
    for (OBJECT* c = o->first_child; c; c = c->next) for_each_in_tree(c, f);
}

} // namespace vrx::scene
