// v3z pack writer: entries' bytes follow the header in order, the directory comes last.
#include "formats/v3z_writer.h"

#include <zlib.h>

#include <cstdio>
#include <stdexcept>

namespace vrx::formats {

namespace {

void put32(std::vector<uint8_t>& out, size_t at, uint32_t v) {
    for (int i = 0; i < 4; ++i) out[at + size_t(i)] = static_cast<uint8_t>(v >> (8 * i));
}

std::vector<uint8_t> deflate_bytes(const std::vector<uint8_t>& in) {
    uLongf cap = compressBound(static_cast<uLong>(in.size()));
    std::vector<uint8_t> out(cap);
    if (compress2(out.data(), &cap, in.data(), static_cast<uLong>(in.size()), Z_BEST_COMPRESSION) !=
        Z_OK)
        throw std::runtime_error("v3z: compression failed");
    out.resize(cap);
    return out;
}

} // namespace

uint32_t v3z_entry_size(V3zKind kind) noexcept {
    return kind == V3zKind::VRKZ ? 32u : 44u;
}

uint32_t v3z_max_name(V3zKind kind) noexcept {
    return kind == V3zKind::VRKZ ? 15u : 30u;
}

V3zPack write_v3z(V3zKind kind, const std::vector<V3zEntry>& entries) {
    const uint32_t esize = v3z_entry_size(kind);
    const uint32_t name_field = v3z_max_name(kind) + 1;
    // The packed flag follows the name field in both layouts, then size, packed size, offset.
    const uint32_t fields_at = kind == V3zKind::VRKZ ? 20u : 32u;

    V3zPack pack{};
    pack.bytes.assign(12, 0);
    const char* id = kind == V3zKind::VRKZ ? "VRKZ" : "VRK2";
    for (int i = 0; i < 4; ++i) pack.bytes[size_t(i)] = static_cast<uint8_t>(id[i]);
    put32(pack.bytes, 4, static_cast<uint32_t>(entries.size()));

    for (const V3zEntry& e : entries) {
        if (e.name.empty() || e.name.size() > v3z_max_name(kind))
            throw std::invalid_argument("v3z: entry name does not fit: " + e.name);
        std::vector<uint8_t> stored = e.compress ? deflate_bytes(e.data) : e.data;
        V3zPlacement p{};
        p.offset = static_cast<uint32_t>(pack.bytes.size());
        p.size = static_cast<uint32_t>(e.data.size());
        p.packed_size = static_cast<uint32_t>(stored.size());
        pack.bytes.insert(pack.bytes.end(), stored.begin(), stored.end());
        pack.placements.push_back(p);
    }

    pack.dir_offset = static_cast<uint32_t>(pack.bytes.size());
    put32(pack.bytes, 8, pack.dir_offset);
    pack.bytes.resize(pack.bytes.size() + entries.size() * esize, 0);
    for (size_t i = 0; i < entries.size(); ++i) {
        V3zPlacement& p = pack.placements[i];
        p.dir_entry = pack.dir_offset + static_cast<uint32_t>(i) * esize;
        const std::string& name = entries[i].name;
        for (size_t k = 0; k < name.size(); ++k)
            pack.bytes[p.dir_entry + k] = static_cast<uint8_t>(name[k]);
        pack.bytes[p.dir_entry + name_field] = entries[i].compress ? 1 : 0;
        put32(pack.bytes, p.dir_entry + fields_at, p.size);
        put32(pack.bytes, p.dir_entry + fields_at + 4, p.packed_size);
        put32(pack.bytes, p.dir_entry + fields_at + 8, p.offset);
    }
    return pack;
}

bool save_file(const std::string& path, const std::vector<uint8_t>& bytes) {
    std::FILE* f = std::fopen(path.c_str(), "wb");
    if (!f) return false;
    bool ok = bytes.empty() || std::fwrite(bytes.data(), 1, bytes.size(), f) == bytes.size();
    return std::fclose(f) == 0 && ok;
}

} // namespace vrx::formats
