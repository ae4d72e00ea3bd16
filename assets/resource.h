// File access for every loader: resourceGetData reads a whole file from the selected memory
// pack, else the selected pack file, else the file system. Resource packs (v3z) hold named
// entries, stored as they are or as zlib streams; the engine only reads them.
#pragma once

#include <cstdint>

namespace vrx::assets {

// Identifier words of a v3z pack, as its first four bytes read little-endian.
inline constexpr uint32_t kPackVRKZ = 0x5A4B5256; // bytes "VRKZ": 32-byte entries
inline constexpr uint32_t kPackVRK2 = 0x324B5256; // bytes "VRK2": 44-byte entries

inline constexpr uint32_t kPackHeaderSize = 12;
inline constexpr uint32_t kEntrySizeVRKZ = 32;
inline constexpr uint32_t kEntrySizeVRK2 = 44;
inline constexpr uint32_t kNameFieldVRKZ = 16;
inline constexpr uint32_t kNameFieldVRK2 = 31;

// No entry, directory or file the engine reads may be larger than this. A memory pack
// comes without a length, so this bound is also all that keeps a damaged directory from
// sending the reader across the whole address space.
inline constexpr uint32_t kMaxResourceBytes = 256u << 20;

// Longest pack-file path the engine keeps (pack_path holds 512 bytes with the terminator).
inline constexpr uint32_t kMaxPathLength = 511;

// Reads the whole file at `path` (engine form, '\' separators). On success returns its bytes,
// stores their count in `size` and in `owned` whether the caller must release them with
// eng_free (1) or they lie inside the host's memory pack and live as long as it (0). On
// failure reports why, stores size 0 and returns null. Never fails silently.
uint8_t* resourceGetData(const char* path, uint32_t* size, int32_t* owned) noexcept;

// Selects (or with null deselects) the memory pack; nothing is checked until it is read.
void SelectResourceBuffer(const void* pack) noexcept;
// Selects (or with null deselects) a pack file: its directory is copied and the file
// closed. On failure the previous selection stays. Returns 0 or -1.
int32_t SelectResourceFile(const char* path) noexcept;

} // namespace vrx::assets
