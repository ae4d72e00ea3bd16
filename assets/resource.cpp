// resourceGetData and the pack selection. Every count, offset and size read from a pack is
// checked before use: against the pack file's length, and for a memory pack (whose length the
// engine is never told) against kMaxResourceBytes and its name fields' own sizes.
#include "assets/resource.h"

#include <zlib.h>

#include <cstdio>
#include <cstring>

#if !defined(_WIN32)
#include <dirent.h>
#include <sys/stat.h>
#endif

#include "engine/alloc.h"
#include "engine/error.h"
#include "engine/names.h"
#include "engine/platform.h"
#include "engine/state.h"
#include "lite_vrx.h"

namespace vrx::assets {

using engine::g_eng;
using engine::ReportError;

namespace {

uint32_t le32(const uint8_t* p) noexcept {
    return uint32_t{p[0]} | uint32_t{p[1]} << 8 | uint32_t{p[2]} << 16 | uint32_t{p[3]} << 24;
}

// Where the fields of one directory entry lie.
struct EntryLayout {
    uint32_t entry_size;
    uint32_t name_field; // bytes of the name field, terminator included
    uint32_t packed_at, size_at, packed_size_at, offset_at;
};
constexpr EntryLayout kLayoutVRKZ{kEntrySizeVRKZ, kNameFieldVRKZ, 16, 20, 24, 28};
constexpr EntryLayout kLayoutVRK2{kEntrySizeVRK2, kNameFieldVRK2, 31, 32, 36, 40};

const EntryLayout* layout_for(uint32_t id) noexcept {
    if (id == kPackVRKZ) return &kLayoutVRKZ;
    if (id == kPackVRK2) return &kLayoutVRK2;
    return nullptr;
}

struct PackEntry {
    const char* name;
    bool packed;
    uint32_t size;        // unpacked length
    uint32_t packed_size; // bytes in the pack
    uint32_t offset;      // from the pack's first byte
};

PackEntry read_entry(const uint8_t* e, const EntryLayout& l) noexcept {
    return {reinterpret_cast<const char*>(e), e[l.packed_at] != 0, le32(e + l.size_at),
            le32(e + l.packed_size_at), le32(e + l.offset_at)};
}

// Index of the first entry named `name` (ASCII case folded), or -1. An entry whose name fills
// its field without a terminator cannot be compared safely: it is reported and skipped.
int64_t find_entry(const uint8_t* dir, uint32_t count, const EntryLayout& l,
                   const char* name) noexcept {
    for (uint32_t i = 0; i < count; ++i) {
        const uint8_t* e = dir + uint64_t{i} * l.entry_size;
        if (!std::memchr(e, 0, l.name_field)) {
            ReportError("v3z entry %u name not terminated!!\n", i);
            continue;
        }
        if (engine::StrCmpNoCase(reinterpret_cast<const char*>(e), name) == 0) return i;
    }
    return -1;
}

// An entry must lie inside a pack of `limit` bytes, stay below the size bound, and a stored
// one must be as long as the bytes it occupies.
bool entry_ok(const PackEntry& e, uint64_t limit) noexcept {
    if (!e.packed && e.size != e.packed_size) {
        ReportError("v3z stored entry %s has size %u but packed size %u!!\n", e.name, e.size,
                    e.packed_size);
        return false;
    }
    if (e.size > kMaxResourceBytes || e.packed_size > kMaxResourceBytes ||
        uint64_t{e.offset} + e.packed_size > limit) {
        ReportError("v3z entry %s out of range!!\n", e.name);
        return false;
    }
    return true;
}

// Inflates `packed_size` bytes of a zlib stream into a new buffer of `size` bytes. On success
// `size` becomes the inflated length. `who` names the entry in the damage message.
uint8_t* inflate_entry(const uint8_t* src, uint32_t packed_size, uint32_t* size,
                       const char* who) noexcept {
    auto* dst = static_cast<uint8_t*>(engine::eng_malloc(*size));
    if (!dst) {
        ReportError("malloc fail!!\n");
        return nullptr;
    }
    uLongf len = *size;
    if (uncompress(dst, &len, src, packed_size) != Z_OK) {
        ReportError("Z file %s damaged!!\n", who);
        engine::eng_free(dst);
        return nullptr;
    }
    *size = static_cast<uint32_t>(len);
    return dst;
}

// A file's length, leaving it positioned at its start; -1 when it cannot be told.
int64_t file_length(std::FILE* f) noexcept {
    if (std::fseek(f, 0, SEEK_END) != 0) return -1;
    long n = std::ftell(f);
    if (n < 0 || std::fseek(f, 0, SEEK_SET) != 0) return -1;
    return n;
}

#if !defined(_WIN32)
// Resolves `native` (a host path) one part at a time, taking each part as it is when it
// exists and otherwise the directory's entry that equals it without regard to ASCII case (the
// smallest such name in byte order, so the choice does not depend on the directory's order).
bool resolve_any_case(const char* native, char* out, size_t cap) noexcept {
    size_t n = 0;
    out[0] = '\0';
    const char* p = native;
    if (*p == '/') {
        out[n++] = '/';
        out[n] = '\0';
        while (*p == '/') ++p;
    }
    while (*p) {
        const char* end = std::strchr(p, '/');
        size_t len = end ? static_cast<size_t>(end - p) : std::strlen(p);
        char part[256];
        if (len >= sizeof part || n + len + 2 > cap) return false;
        std::memcpy(part, p, len);
        part[len] = '\0';
        std::memcpy(out + n, part, len + 1);
        struct stat st;
        if (stat(out, &st) != 0) {
            out[n] = '\0';
            DIR* d = opendir(n ? out : ".");
            if (!d) return false;
            char best[256] = "";
            while (const dirent* de = readdir(d)) {
                if (std::strlen(de->d_name) != len) continue;
                if (engine::StrCmpNoCase(de->d_name, part) != 0) continue;
                if (!best[0] || std::strcmp(de->d_name, best) < 0)
                    std::memcpy(best, de->d_name, len + 1);
            }
            closedir(d);
            if (!best[0]) return false;
            std::memcpy(out + n, best, len + 1);
        }
        n += len;
        p += len;
        if (*p == '/') {
            out[n++] = '/';
            out[n] = '\0';
            while (*p == '/') ++p;
        }
    }
    return true;
}
#endif

// Opens an engine path for reading. Loaders upper-case the names they are given, as the
// device's file system ignores case; where the host's file system does not, the path is
// matched part by part without regard to case when it does not exist as written.
std::FILE* open_resource_file(const char* path) noexcept {
    std::FILE* f = engine::open_host_file(path, "rb");
#if !defined(_WIN32)
    if (!f) {
        char native[1024], resolved[1024];
        if (engine::host_path(path, native, sizeof native) &&
            resolve_any_case(native, resolved, sizeof resolved))
            f = std::fopen(resolved, "rb");
    }
#endif
    return f;
}

// Result of a lookup in a pack.
struct Found {
    uint8_t* data;
    uint32_t size;
    int32_t owned;
};

// Lookup in the memory pack by base name; `l` is its layout (identifier already checked).
bool memory_lookup(const char* path, const EntryLayout& l, Found& out) noexcept {
    const uint8_t* pack = g_eng.resource_buffer;
    uint32_t count = le32(pack + 4);
    uint32_t dir_offset = le32(pack + 8);
    if (uint64_t{dir_offset} + uint64_t{count} * l.entry_size > kMaxResourceBytes) {
        ReportError("v3z directory out of range!!\n");
        return false;
    }
    const char* base = engine::path_base_name(path);
    int64_t i = find_entry(pack + dir_offset, count, l, base);
    if (i < 0) {
        if (&l == &kLayoutVRK2) ReportError("v3z_err %s\n", base);
        return false;
    }
    PackEntry e = read_entry(pack + dir_offset + static_cast<uint64_t>(i) * l.entry_size, l);
    if (!entry_ok(e, kMaxResourceBytes)) return false;
    if (!e.packed) {
        // Stored entries are handed out in place: the host owns the pack's bytes.
        out = {const_cast<uint8_t*>(pack + e.offset), e.size, 0};
        return true;
    }
    uint32_t size = e.size;
    uint8_t* data = inflate_entry(pack + e.offset, e.packed_size, &size, base);
    if (!data) return false;
    out = {data, size, 1};
    return true;
}

// Lookup in the selected pack file by the whole path.
bool file_lookup(const char* path, Found& out) noexcept {
    const EntryLayout& l = g_eng.pack_id == kPackVRKZ ? kLayoutVRKZ : kLayoutVRK2;
    int64_t i = find_entry(g_eng.pack_dir, static_cast<uint32_t>(g_eng.pack_count), l, path);
    if (i < 0) return false;
    PackEntry e = read_entry(g_eng.pack_dir + static_cast<uint64_t>(i) * l.entry_size, l);

    std::FILE* f = open_resource_file(g_eng.pack_path);
    if (!f) return false;
    int64_t len = file_length(f);
    if (len < 0 || !entry_ok(e, static_cast<uint64_t>(len)) ||
        std::fseek(f, static_cast<long>(e.offset), SEEK_SET) != 0) {
        std::fclose(f);
        return false;
    }
    auto* raw = static_cast<uint8_t*>(engine::eng_malloc(e.packed_size));
    if (!raw) {
        ReportError("malloc fail!!\n");
        std::fclose(f);
        return false;
    }
    size_t got = std::fread(raw, 1, e.packed_size, f);
    std::fclose(f);
    if (got != e.packed_size) {
        ReportError("v3z entry %s cannot be read!!\n", e.name);
        engine::eng_free(raw);
        return false;
    }
    if (!e.packed) {
        out = {raw, e.size, 1};
        return true;
    }
    uint32_t size = e.size;
    uint8_t* data = inflate_entry(raw, e.packed_size, &size, e.name);
    engine::eng_free(raw);
    if (!data) return false;
    out = {data, size, 1};
    return true;
}

} // namespace

uint8_t* resourceGetData(const char* path, uint32_t* size, int32_t* owned) noexcept {
    *size = 0;
    *owned = 0;
    if (!path) {
        ReportError("Wrong path in resourceGetData!!\n");
        return nullptr;
    }
    Found found{};
    if (g_eng.resource_buffer) {
        uint32_t id = le32(g_eng.resource_buffer);
        if (const EntryLayout* l = layout_for(id)) {
            if (memory_lookup(path, *l, found)) {
                *size = found.size;
                *owned = found.owned;
                return found.data;
            }
        } else {
            ReportError("wrong v3z ID %x\n", id);
        }
    }
    if (g_eng.pack_dir && file_lookup(path, found)) {
        *size = found.size;
        *owned = found.owned;
        return found.data;
    }

    std::FILE* f = open_resource_file(path);
    if (!f) {
        ReportError("resourceGetData file %s not find!!\n", path);
        return nullptr;
    }
    int64_t len = file_length(f);
    if (len < 0) {
        ReportError("resourceGetData file %s cannot be read!!\n", path);
        std::fclose(f);
        return nullptr;
    }
    if (len > kMaxResourceBytes) {
        ReportError("resourceGetData file %s too large!!\n", path);
        std::fclose(f);
        return nullptr;
    }
    auto n = static_cast<uint32_t>(len);
    auto* data = static_cast<uint8_t*>(engine::eng_malloc(n));
    if (!data) {
        ReportError("Allocate memory for %s fail !!\n", path);
        std::fclose(f);
        return nullptr;
    }
    size_t got = std::fread(data, 1, n, f);
    std::fclose(f);
    if (got != n) {
        ReportError("resourceGetData file %s cannot be read!!\n", path);
        engine::eng_free(data);
        return nullptr;
    }
    *size = n;
    *owned = 1;
    return data;
}

void SelectResourceBuffer(const void* pack) noexcept {
    g_eng.resource_buffer = static_cast<const uint8_t*>(pack);
}

int32_t SelectResourceFile(const char* path) noexcept {
    if (!path) {
        engine::eng_free(g_eng.pack_dir);
        g_eng.pack_dir = nullptr;
        g_eng.pack_path[0] = '\0';
        g_eng.pack_count = 0;
        g_eng.pack_id = 0;
        return 0;
    }
    size_t path_len = std::strlen(path);
    if (path_len > kMaxPathLength) {
        ReportError("Pack file path too long in VRX_SelectResourceFile!!\n");
        return -1;
    }
    // Like the device's engine, a pack that cannot be selected is refused without a message.
    std::FILE* f = open_resource_file(path);
    if (!f) return -1;
    uint8_t header[kPackHeaderSize];
    int64_t len = file_length(f);
    if (len < 0 || std::fread(header, 1, sizeof header, f) != sizeof header) {
        std::fclose(f);
        return -1;
    }
    uint32_t id = le32(header);
    uint32_t count = le32(header + 4);
    uint32_t dir_offset = le32(header + 8);
    const EntryLayout* l = layout_for(id);
    uint64_t dir_bytes = uint64_t{count} * (l ? l->entry_size : 0);
    if (!l || dir_bytes > kMaxResourceBytes ||
        uint64_t{dir_offset} + dir_bytes > static_cast<uint64_t>(len) ||
        std::fseek(f, static_cast<long>(dir_offset), SEEK_SET) != 0) {
        std::fclose(f);
        return -1;
    }
    auto* dir = static_cast<uint8_t*>(engine::eng_malloc(static_cast<size_t>(dir_bytes)));
    if (!dir) {
        std::fclose(f);
        return -1;
    }
    if (std::fread(dir, 1, static_cast<size_t>(dir_bytes), f) != dir_bytes) {
        engine::eng_free(dir);
        std::fclose(f);
        return -1;
    }
    std::fclose(f);
    std::memcpy(g_eng.pack_path, path, path_len + 1);
    g_eng.pack_id = id;
    g_eng.pack_count = static_cast<int32_t>(count);
    engine::eng_free(g_eng.pack_dir);
    g_eng.pack_dir = dir;
    return 0;
}

} // namespace vrx::assets

extern "C" {

VRX_API int32_t VRX_SelectResourceBuffer(const void* pack) noexcept {
    vrx::assets::SelectResourceBuffer(pack);
    return 0;
}

VRX_API int32_t VRX_SelectResourceFile(const char* path) noexcept {
    return vrx::assets::SelectResourceFile(path);
}

} // extern "C"
