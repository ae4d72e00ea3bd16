// TGA-family writers.
#include "formats/tga_writer.h"

#include <stdexcept>

namespace vrx::formats {

namespace {

void check_size(int width, int height, size_t count) {
    if (width < 1 || height < 1 || width > 0xFFFF || height > 0xFFFF)
        throw std::invalid_argument("tga: size out of range");
    if (count != size_t(width) * size_t(height))
        throw std::invalid_argument("tga: pixel count does not match the size");
}

void put16(std::vector<uint8_t>& out, size_t at, int v) {
    out[at] = static_cast<uint8_t>(v & 0xFF);
    out[at + 1] = static_cast<uint8_t>((v >> 8) & 0xFF);
}

} // namespace

std::vector<uint8_t> write_tga(int width, int height, int bits, const std::vector<Rgba>& pixels) {
    if (bits != 24 && bits != 32) throw std::invalid_argument("tga: depth must be 24 or 32");
    check_size(width, height, pixels.size());
    std::vector<uint8_t> out(18, 0);
    out[2] = 2; // uncompressed true colour
    put16(out, 12, width);
    put16(out, 14, height);
    out[16] = static_cast<uint8_t>(bits);
    out[17] = bits == 32 ? 8 : 0; // alpha bits; origin bottom-left
    out.reserve(out.size() + pixels.size() * size_t(bits / 8));
    for (int row = height - 1; row >= 0; --row) {
        for (int x = 0; x < width; ++x) {
            const Rgba& p = pixels[size_t(row) * size_t(width) + size_t(x)];
            out.push_back(p.b);
            out.push_back(p.g);
            out.push_back(p.r);
            if (bits == 32) out.push_back(p.a);
        }
    }
    return out;
}

std::vector<uint8_t> write_tg16(Tg16Kind kind, int width, int height,
                                const std::vector<uint16_t>& words) {
    check_size(width, height, words.size());
    std::vector<uint8_t> out(20, 0);
    out[2] = static_cast<uint8_t>(kind);
    put16(out, 14, width);
    put16(out, 16, height);
    out.reserve(out.size() + words.size() * 2);
    for (uint16_t w : words) {
        out.push_back(static_cast<uint8_t>(w & 0xFF));
        out.push_back(static_cast<uint8_t>(w >> 8));
    }
    return out;
}

} // namespace vrx::formats
