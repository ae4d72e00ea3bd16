// LoadTGA and its two true-colour converters. A file's header is trusted for nothing: the
// sizes must be at least 1 and the pixels the header promises must all be in the file.
#include "assets/tga.h"

#include <bit>
#include <cstring>

#include "assets/resource.h"
#include "engine/alloc.h"
#include "engine/error.h"

namespace vrx::assets {

// Pre-converted files hold little-endian words that are handed out as they are.
static_assert(std::endian::native == std::endian::little, "16-bit pixels are used in place");

using engine::ReportError;

namespace {

constexpr uint8_t kTrueColourSig[12] = {0, 0, 2, 0, 0, 0, 0, 0, 0, 0, 0, 0};
constexpr uint8_t kSig4444[14] = {0, 0, 0xFF, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0};
constexpr uint8_t kSig565[14] = {0, 0, 0xFE, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0};

uint32_t le16(const uint8_t* p) noexcept {
    return uint32_t{p[0]} | uint32_t{p[1]} << 8;
}

struct TgaSize {
    uint32_t width, height;
};

// The checks both converters make: sizes of at least 1, the expected depth, and all the
// pixels present after the 18-byte header.
bool true_colour_ok(const uint8_t* file, uint32_t size, uint32_t depth, TgaSize& s) noexcept {
    s = {le16(file + 12), le16(file + 14)};
    if (s.width < 1 || s.height < 1 || file[16] != depth) {
        ReportError("LoadUncompressedTGA: Invalid information!!\n");
        return false;
    }
    if (kTgaHeaderSize + uint64_t{s.width} * s.height * (depth / 8) > size) {
        ReportError("LoadUncompressedTGA: file shorter than its pixels!!\n");
        return false;
    }
    return true;
}

// Walks the stored rows (bottom row of the picture first) and hands each source pixel to
// `put` with its destination index, so the picture comes out top row first.
template <class Put>
void flip_rows(const uint8_t* file, TgaSize s, uint32_t src_bytes, Put put) noexcept {
    const uint8_t* src = file + kTgaHeaderSize;
    for (uint32_t r = 0; r < s.height; ++r) {
        size_t dst_row = size_t{s.height - 1 - r} * s.width;
        for (uint32_t x = 0; x < s.width; ++x, src += src_bytes) put(dst_row + x, src);
    }
}

void* alloc_image(TgaSize s, uint32_t bytes, const char* failure) noexcept {
    void* p = engine::eng_malloc(size_t{s.width} * s.height * bytes);
    if (!p) ReportError("%s", failure);
    return p;
}

} // namespace

uint8_t* LoadUncompressedTGA(const uint8_t* file, uint32_t size, int32_t format) noexcept {
    TgaSize s{};
    if (!true_colour_ok(file, size, 32, s)) return nullptr;
    if (format == CF_RGBA8888) {
        auto* out = static_cast<uint8_t*>(
            alloc_image(s, 4, "LoadUncompressedTGA: can not allocate 32 bit image buffer!!\n"));
        if (!out) return nullptr;
        flip_rows(file, s, 4, [out](size_t i, const uint8_t* p) {
            uint8_t* d = out + i * 4;
            d[0] = p[2];
            d[1] = p[1];
            d[2] = p[0];
            d[3] = p[3];
        });
        return out;
    }
    auto* out = static_cast<uint16_t*>(
        alloc_image(s, 2, "LoadUncompressedTGA: can not allocate 16 bit image buffer!!\n"));
    if (!out) return nullptr;
    // Each channel keeps its top four bits: red 15-12, green 11-8, blue 7-4, alpha 3-0.
    flip_rows(file, s, 4, [out](size_t i, const uint8_t* p) {
        out[i] = static_cast<uint16_t>((p[2] & 0xF0) << 8 | (p[1] & 0xF0) << 4 | (p[0] & 0xF0) |
                                       p[3] >> 4);
    });
    return reinterpret_cast<uint8_t*>(out);
}

uint8_t* LoadUncompressedTGA24(const uint8_t* file, uint32_t size, int32_t format) noexcept {
    TgaSize s{};
    if (!true_colour_ok(file, size, 24, s)) return nullptr;
    if (format == CF_RGB888) {
        auto* out = static_cast<uint8_t*>(
            alloc_image(s, 3, "LoadUncompressedTGA: can not allocate 24 bit image buffer!!\n"));
        if (!out) return nullptr;
        flip_rows(file, s, 3, [out](size_t i, const uint8_t* p) {
            uint8_t* d = out + i * 3;
            d[0] = p[2];
            d[1] = p[1];
            d[2] = p[0];
        });
        return out;
    }
    auto* out = static_cast<uint16_t*>(
        alloc_image(s, 2, "LoadUncompressedTGA: can not allocate 16 bit image buffer!!\n"));
    if (!out) return nullptr;
    // Truncation to 5-6-5 bits: the low bits are dropped, never rounded or dithered.
    flip_rows(file, s, 3, [out](size_t i, const uint8_t* p) {
        out[i] = static_cast<uint16_t>((p[2] & 0xF8) << 8 | (p[1] & 0xFC) << 3 | p[0] >> 3);
    });
    return reinterpret_cast<uint8_t*>(out);
}

int32_t LoadTGA(const char* path, int32_t* width, int32_t* height, void** pixels, int32_t* format,
                int32_t* owned, int32_t keep32) noexcept {
    *pixels = nullptr;
    uint32_t size = 0;
    int32_t must_release = 0;
    uint8_t* data = resourceGetData(path, &size, &must_release);
    auto release = [&]() noexcept {
        if (must_release) engine::eng_free(data);
    };
    if (!data || size < kTgaHeaderSize) {
        release();
        return 0;
    }

    if (std::memcmp(data, kTrueColourSig, sizeof kTrueColourSig) == 0) {
        int32_t fmt = 0;
        uint8_t* out = nullptr;
        if (data[16] == 24) {
            fmt = keep32 ? CF_RGB888 : CF_RGB565;
            out = LoadUncompressedTGA24(data, size, fmt);
        } else {
            fmt = keep32 ? CF_RGBA8888 : CF_RGBA4444;
            out = LoadUncompressedTGA(data, size, fmt);
        }
        uint32_t w = le16(data + 12), h = le16(data + 14);
        release();
        if (!out) {
            ReportError(" LoadTGA() malloc fail 0!!\n");
            return 0;
        }
        *width = static_cast<int32_t>(w);
        *height = static_cast<int32_t>(h);
        *pixels = out;
        *format = fmt;
        *owned = 1;
        return 1;
    }

    int32_t fmt = 0;
    if (std::memcmp(data, kSig4444, sizeof kSig4444) == 0)
        fmt = CF_RGBA4444;
    else if (std::memcmp(data, kSig565, sizeof kSig565) == 0)
        fmt = CF_RGB565;
    else {
        // RLE, colour-mapped or otherwise unusual TGA files: not part of the family.
        release();
        return 0;
    }
    uint32_t w = le16(data + 14), h = le16(data + 16);
    if (w < 1 || h < 1) {
        ReportError("LoadTGA: Invalid information!!\n");
        release();
        return 0;
    }
    uint64_t bytes = uint64_t{w} * h * 2;
    if (kTg16HeaderSize + bytes > size) {
        ReportError("LoadTGA: file shorter than its pixels!!\n");
        release();
        return 0;
    }
    if (must_release) {
        // The pixels move down over the header inside the buffer the file was read into.
        std::memmove(data, data + kTg16HeaderSize, static_cast<size_t>(bytes));
        *pixels = data;
        *owned = 1;
    } else if (reinterpret_cast<uintptr_t>(data + kTg16HeaderSize) % alignof(uint16_t) == 0) {
        // Inside the host's memory pack: used in place.
        *pixels = data + kTg16HeaderSize;
        *owned = 0;
    } else {
        // An entry at an odd address cannot be read as 16-bit words: it gets a copy.
        void* copy = engine::eng_malloc(static_cast<size_t>(bytes));
        if (!copy) {
            ReportError("LoadTGA: can not allocate 16 bit image buffer!!\n");
            return 0;
        }
        std::memcpy(copy, data + kTg16HeaderSize, static_cast<size_t>(bytes));
        *pixels = copy;
        *owned = 1;
    }
    *width = static_cast<int32_t>(w);
    *height = static_cast<int32_t>(h);
    *format = fmt;
    return 1;
}

} // namespace vrx::assets
