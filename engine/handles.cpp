// The live-record registry (an open-addressing hash table keyed by address) and the
// kind checks with their messages.
#include "engine/handles.h"

#include <cstdlib>

#include "engine/error.h"

namespace vrx::engine {

namespace {

// Slots hold a record address and its tag; a removed slot keeps kTombstone so probe
// chains stay intact.
struct Slot {
    const void* key;
    uint32_t tag;
};

const void* const kTombstone = reinterpret_cast<const void*>(~uintptr_t{0});

struct Registry {
    Slot* slots;     // table of `capacity` slots, calloc'd
    size_t capacity; // power of two, or 0 before the first record
    size_t used;     // live entries
    size_t filled;   // live entries plus tombstones
};
constinit Registry g_registry{};

size_t hash_ptr(const void* p) noexcept {
    // Records are at least 8-byte aligned: drop the low bits, then mix.
    auto v = static_cast<uint64_t>(reinterpret_cast<uintptr_t>(p)) >> 3;
    v *= 0x9E3779B97F4A7C15ull;
    return static_cast<size_t>(v ^ (v >> 29));
}

// Index of the slot holding `key`, or of the first free slot of its probe chain.
size_t find_slot(const Slot* slots, size_t capacity, const void* key, bool for_insert) noexcept {
    size_t mask = capacity - 1;
    size_t i = hash_ptr(key) & mask;
    size_t first_tomb = capacity;
    for (;;) {
        const void* k = slots[i].key;
        if (k == key) return i;
        if (k == nullptr) return (for_insert && first_tomb != capacity) ? first_tomb : i;
        if (k == kTombstone && first_tomb == capacity) first_tomb = i;
        i = (i + 1) & mask;
    }
}

bool grow() noexcept {
    size_t cap = g_registry.capacity ? g_registry.capacity * 2 : 256;
    // Rehash in place of tombstones when the table is mostly dead entries.
    if (g_registry.used * 4 < g_registry.capacity) cap = g_registry.capacity;
    auto* slots = static_cast<Slot*>(std::calloc(cap, sizeof(Slot)));
    if (!slots) return false;
    for (size_t i = 0; i < g_registry.capacity; ++i) {
        const Slot& s = g_registry.slots[i];
        if (s.key && s.key != kTombstone) slots[find_slot(slots, cap, s.key, true)] = s;
    }
    std::free(g_registry.slots);
    g_registry.slots = slots;
    g_registry.capacity = cap;
    g_registry.filled = g_registry.used;
    return true;
}

} // namespace

bool registry_add(const void* rec, uint32_t tag) noexcept {
    if (!rec || rec == kTombstone) return false;
    // Keep at most half the slots occupied so probe chains stay short.
    if ((g_registry.filled + 1) * 2 > g_registry.capacity && !grow()) return false;
    size_t i = find_slot(g_registry.slots, g_registry.capacity, rec, true);
    Slot& s = g_registry.slots[i];
    if (s.key != rec) {
        if (s.key == nullptr) ++g_registry.filled;
        ++g_registry.used;
        s.key = rec;
    }
    s.tag = tag;
    return true;
}

void registry_remove(const void* rec) noexcept {
    if (!rec || g_registry.capacity == 0) return;
    size_t i = find_slot(g_registry.slots, g_registry.capacity, rec, false);
    Slot& s = g_registry.slots[i];
    if (s.key != rec) return;
    s.key = kTombstone;
    s.tag = 0;
    --g_registry.used;
}

uint32_t registry_tag(const void* rec) noexcept {
    if (!rec || g_registry.capacity == 0 || rec == kTombstone) return 0;
    const Slot& s = g_registry.slots[find_slot(g_registry.slots, g_registry.capacity, rec, false)];
    return s.key == rec ? s.tag : 0;
}

long registry_size() noexcept {
    return static_cast<long>(g_registry.used);
}

namespace {

// How a check reports: the wrong-tag message (some show the tag found) and the
// null-handle message (some show the 0 they were given).
struct CheckInfo {
    uint32_t tag;
    const char* wrong_tag;
    bool wrong_shows_tag;
    const char* null_handle;
    bool null_shows_zero;
};

uint32_t check(const void* h, const CheckInfo& info) noexcept {
    if (!h) {
        if (info.null_shows_zero)
            ReportError(info.null_handle, 0u);
        else
            ReportError("%s", info.null_handle);
        return 1;
    }
    uint32_t found = registry_tag(h);
    if (found == info.tag) return 0;
    if (info.wrong_shows_tag)
        ReportError(info.wrong_tag, found);
    else
        ReportError("%s", info.wrong_tag);
    return 1;
}

constexpr CheckInfo kWorld{TAG_WORLD, "The ID is not ID_WORLD.\n", false, "Wrong World Handle.\n",
                           false};
constexpr CheckInfo kObject{TAG_OBJECT, "This ID is not ID_OBJECT --- %8X !!\n", true,
                            "Wrong Object Handle : %x\n", true};
constexpr CheckInfo kCamera{TAG_CAMERA, "This ID is not ID_CAMERA !!\n", false,
                            "Wrong Camera Handle : %x\n", true};
constexpr CheckInfo kMaterial{TAG_MATERIAL, "The ID is not ID_MATERIAL.\n", false,
                              "Wrong Material Handle.\n", false};
constexpr CheckInfo kTexture{TAG_TEXTURE, "The ID is not ID_TEXT.\n", false,
                             "Wrong Texture Handle.\n", false};
constexpr CheckInfo kOmni{TAG_OMNI, "The ID is not ID_OMNI_LIGHT.\n", false,
                          "Wrong Omni Light Handle.\n", false};
constexpr CheckInfo kImage{TAG_IMAGE, "This ID is not ID_IMAGE !!\n", false,
                           "Wrong Image Handle : %x\n", true};
constexpr CheckInfo kWindow{TAG_VPORT, "This ID is not ID_VPORT !!\n", false,
                            "Wrong Window Handle : %x\n", true};
constexpr CheckInfo kBillboard{TAG_BILLBOARD, "The ID is not ID_BILLBOARD.\n", false,
                               "Wrong Billboardmation Handle.\n", false};

} // namespace

uint32_t chk_world(const void* h) noexcept {
    return check(h, kWorld);
}
uint32_t chk_object(const void* h) noexcept {
    return check(h, kObject);
}
uint32_t chk_camera(const void* h) noexcept {
    return check(h, kCamera);
}
uint32_t chk_material(const void* h) noexcept {
    return check(h, kMaterial);
}
uint32_t chk_texture(const void* h) noexcept {
    return check(h, kTexture);
}
uint32_t chk_omni(const void* h) noexcept {
    return check(h, kOmni);
}
uint32_t chk_image(const void* h) noexcept {
    return check(h, kImage);
}
uint32_t chk_window(const void* h) noexcept {
    return check(h, kWindow);
}
uint32_t chk_billboard(const void* h) noexcept {
    return check(h, kBillboard);
}

} // namespace vrx::engine
