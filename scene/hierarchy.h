// Hierarchy links: global placements from the tree, linking and unlinking objects while
// keeping their place in the world, and name search in a tree.
#pragma once

#include "scene/object.h"

namespace vrx::scene {

// Refreshes global_ucs over a subtree, parent before children: a root's global_ucs
// becomes its local_ucs; each object with OBJ_MOVED has it cleared and, with a parent,
// global_ucs = GlobalUCS(local_ucs, parent's global_ucs).
void HieRefresh(OBJECT* o) noexcept;

// Refreshes the whole tree of `o` from its root.
void hie_refresh_tree(OBJECT* o) noexcept;

} // namespace vrx::scene
