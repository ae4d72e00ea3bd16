// Writer for v3z resource packs: a 12-byte header ("VRKZ" or "VRK2", entry count, directory
// offset), the entries' bytes, then the directory. Entries are stored or zlib-compressed.
// All numbers are little-endian 32-bit.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace vrx::formats {

enum class V3zKind {
    VRKZ, // 32-byte directory entries, names of at most 15 characters
    VRK2, // 44-byte directory entries, names of at most 30 characters
};

struct V3zEntry {
    std::string name;          // stored as given (readers compare without regard to case)
    std::vector<uint8_t> data; // the entry's content
    bool compress = false;     // store as a zlib stream instead of as it is
};

// Where an entry ended up, for callers that inspect or patch a pack.
struct V3zPlacement {
    uint32_t offset;      // first byte of the entry's bytes in the pack
    uint32_t size;        // content length
    uint32_t packed_size; // bytes the entry occupies
    uint32_t dir_entry;   // offset of its directory entry
};

struct V3zPack {
    std::vector<uint8_t> bytes;
    uint32_t dir_offset;
    std::vector<V3zPlacement> placements; // one per entry, in order
};

// Directory entry sizes and name limits of each kind.
uint32_t v3z_entry_size(V3zKind kind) noexcept;
uint32_t v3z_max_name(V3zKind kind) noexcept;

// Builds a pack. Throws std::invalid_argument for a name that is empty or does not fit its
// field, and std::runtime_error if compression fails.
V3zPack write_v3z(V3zKind kind, const std::vector<V3zEntry>& entries);

// Writes bytes to a file; false when it cannot be written completely.
bool save_file(const std::string& path, const std::vector<uint8_t>& bytes);

} // namespace vrx::formats
