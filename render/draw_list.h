// The deferred draw list: translucent objects, billboards and sorted-mode objects are
// queued here during a render call and drawn back to front.
#pragma once

#include <cstdint>

namespace vrx::render {

inline constexpr int32_t kDrawListCap = 256;

enum DrawKind : int32_t {
    DRAW_TRANSLUCENT = 1,
    DRAW_BILLBOARD = 2,
    DRAW_SORTED = 3
};

struct DRAW_ENTRY {
    void* item;   // object or billboard
    int32_t kind; // DrawKind
    int32_t key;  // camera depth, farthest drawn first
};

struct DRAW_LIST {
    int32_t count;
    DRAW_ENTRY entries[kDrawListCap];
};

} // namespace vrx::render
