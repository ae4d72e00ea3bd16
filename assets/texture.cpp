// Textures: loading by name through the decoder the file's extension chooses, textures made
// from host pixels, nearest-neighbour resampling to powers of two, sharing by name and
// reference count, pixel updates and release.
#include "assets/texture.h"

#include <cstdio>
#include <cstring>

#include "assets/tga.h"
#include "engine/error.h"
#include "engine/names.h"
#include "engine/state.h"
#include "lite_vrx.h"

namespace vrx::assets {

using engine::eng_free;
using engine::eng_malloc;
using engine::g_eng;
using engine::ReportError;

constinit int32_t texture_serial = 0;

namespace {

// What a file decoder hands back: 16-bit pixels (CF_RGB565 or CF_RGBA4444), owned or lying
// inside the host's memory pack.
struct DecodedImage {
    int32_t width, height;
    void* pixels;
    int32_t format;
    int32_t owned;
};

using DecodeFn = bool (*)(const char* path, DecodedImage& out) noexcept;

bool decode_tga(const char* path, DecodedImage& out) noexcept {
    return LoadTGA(path, &out.width, &out.height, &out.pixels, &out.format, &out.owned, 0) == 1;
}

// No JPEG decoder is built in yet, so every name outside the TGA family fails with the JPEG
// message. A JPEG decoder plugs in here: decode the file in its output mode 0 (CF_RGB565
// pixels that the texture owns) and return true.
bool decode_jpeg(const char* path, DecodedImage& out) noexcept {
    (void)path;
    (void)out;
    return false;
}

// A decoder, the endings of the path that choose it and its failure message.
struct TextureDecoder {
    const char* endings[4]; // none: the decoder for every other ending
    DecodeFn decode;
    const char* failure;
};
constexpr TextureDecoder kTgaDecoder{{"TGA", "TG1", "TG2", "VTG"}, decode_tga, "LoadTGA1 fail!!\n"};
constexpr TextureDecoder kJpegDecoder{{}, decode_jpeg, "Load JPGX fail!!\n"};

// Chosen by the last three characters of the path, ASCII case folded.
const TextureDecoder& choose_decoder(const char* path) noexcept {
    size_t n = std::strlen(path);
    const char* tail = path + (n >= 3 ? n - 3 : 0);
    for (const char* e : kTgaDecoder.endings)
        if (engine::StrCmpNoCase(tail, e) == 0) return kTgaDecoder;
    return kJpegDecoder;
}

bool size_ok(int32_t w, int32_t h, const char* op) noexcept {
    if (w < 1 || h < 1 || w > kMaxTextureSize || h > kMaxTextureSize) {
        ReportError("Wrong texture size %dx%d in %s!!\n", w, h, op);
        return false;
    }
    return true;
}

// Makes the record for finished pixels and links it; on failure releases `name` and the
// pixels if owned.
TEXTURE* make_texture(char* name, void* data, int32_t own, int32_t wl, int32_t hl,
                      int32_t alpha) noexcept {
    auto* t = engine::new_record<TEXTURE>();
    if (!t) {
        ReportError("Allocate memory for TEXTURE fail!!\n");
        if (own) eng_free(data);
        eng_free(name);
        return nullptr;
    }
    t->name = name;
    t->data = data;
    t->width = 1 << wl;
    t->height = 1 << hl;
    t->width_log2 = wl;
    t->height_log2 = hl;
    t->ref_count = 0;
    t->alpha_kind = alpha;
    t->own_data = own;
    LinkTexture(t);
    return t;
}

// Nearest-neighbour walk shared by both pixel sizes.
template <class Px>
void stretch(Px* dst, int32_t dw, int32_t dh, const Px* src, int32_t sw, int32_t sh) noexcept {
    if (dh < 1) return;
    // 16.16 steps; sizes stay below 32768, so sw << 16 fits.
    int32_t step_x = (sw << 16) / (dw < 1 ? 1 : dw);
    int32_t step_y = (sh << 16) / dh;
    int32_t acc_y = 0;
    for (int32_t j = 0; j < dh; ++j, acc_y += step_y) {
        int32_t sy = acc_y >> 16;
        if (sy >= sh) sy = sh - 1;
        int32_t acc_x = 0;
        for (int32_t i = 0; i < dw; ++i, acc_x += step_x) {
            int32_t sx = acc_x >> 16;
            if (sx >= sw) sx = sw - 1;
            dst[size_t(i) + size_t(j) * size_t(dw)] = src[size_t(sx) + size_t(sy) * size_t(sw)];
        }
    }
}

} // namespace

void StretchImage16(uint16_t* dst, int32_t dw, int32_t dh, const uint16_t* src, int32_t sw,
                    int32_t sh) noexcept {
    stretch(dst, dw, dh, src, sw, sh);
}

void StretchImage32(uint32_t* dst, int32_t dw, int32_t dh, const uint32_t* src, int32_t sw,
                    int32_t sh) noexcept {
    stretch(dst, dw, dh, src, sw, sh);
}

void LinkTexture(TEXTURE* t) noexcept {
    g_eng.texture_list.append(t);
}

void UnlinkTexture(TEXTURE* t) noexcept {
    g_eng.texture_list.unlink(t);
}

TEXTURE* FindOrLoadTexture(char* name) noexcept {
    if (!name) {
        ReportError("Wrong name in FindOrLoadTexture!!\n");
        return nullptr;
    }
    for (TEXTURE* t = g_eng.texture_list.head; t; t = t->next) {
        if (engine::StrCmpNoCase(t->name, name) == 0) {
            eng_free(name);
            return t;
        }
    }
    return LoadTextureFile(name);
}

TEXTURE* LoadTextureFile(char* name) noexcept {
    char path[engine::kDataPathSize];
    size_t dl = std::strlen(g_eng.data_path), nl = std::strlen(name);
    if (dl + nl >= sizeof path) {
        ReportError("Texture path too long in LoadTextureFile!!\n");
        eng_free(name);
        return nullptr;
    }
    std::memcpy(path, g_eng.data_path, dl);
    std::memcpy(path + dl, name, nl + 1);
    engine::StrUpper(path);

    const TextureDecoder& decoder = choose_decoder(path);
    DecodedImage img{};
    if (!decoder.decode(path, img)) {
        ReportError("%s", decoder.failure);
        eng_free(name);
        return nullptr;
    }
    if (!size_ok(img.width, img.height, "LoadTextureFile")) {
        if (img.owned) eng_free(img.pixels);
        eng_free(name);
        return nullptr;
    }
    int32_t alpha = img.format == CF_RGBA4444 ? kAlpha4444 : kAlpha565;
    int32_t wl = Log2Floor(img.width), hl = Log2Floor(img.height);
    if (IsPow2(img.width) && IsPow2(img.height))
        return make_texture(name, img.pixels, img.owned, wl, hl, alpha);

    // Files shrink to the power of two at or below each size; their pixels are 16-bit.
    int32_t dw = 1 << wl, dh = 1 << hl;
    auto* buf = static_cast<uint16_t*>(eng_malloc(size_t(dw) * size_t(dh) * 2));
    if (!buf) {
        ReportError("Allocate memory for StretchImage fail!!\n");
        if (img.owned) eng_free(img.pixels);
        eng_free(name);
        return nullptr;
    }
    StretchImage16(buf, dw, dh, static_cast<const uint16_t*>(img.pixels), img.width, img.height);
    if (img.owned) eng_free(img.pixels);
    return make_texture(name, buf, 1, wl, hl, alpha);
}

TEXTURE* NewTextureFromPixels(char* name, int32_t width, int32_t height, const void* pixels,
                              int32_t format) noexcept {
    if (!pixels) {
        ReportError("Wrong pixels in NewTextureFromPixels!!\n");
        eng_free(name);
        return nullptr;
    }
    if (!size_ok(width, height, "NewTextureFromPixels")) {
        eng_free(name);
        return nullptr;
    }
    bool wide = format == CF_RGBA8888;
    // Host pixels grow to the power of two at or above each size.
    int32_t wl = Log2Floor(width) + (IsPow2(width) ? 0 : 1);
    int32_t hl = Log2Floor(height) + (IsPow2(height) ? 0 : 1);
    int32_t dw = 1 << wl, dh = 1 << hl;
    uint64_t bytes = uint64_t(dw) * uint64_t(dh) * (wide ? 4u : 2u);
    void* data = bytes <= SIZE_MAX ? eng_malloc(static_cast<size_t>(bytes)) : nullptr;
    if (!data) {
        ReportError("Allocate memory for TEXTURE DATA fail!!\n");
        eng_free(name);
        return nullptr;
    }
    if (dw == width && dh == height)
        std::memcpy(data, pixels, static_cast<size_t>(bytes));
    else if (wide)
        StretchImage32(static_cast<uint32_t*>(data), dw, dh, static_cast<const uint32_t*>(pixels),
                       width, height);
    else
        StretchImage16(static_cast<uint16_t*>(data), dw, dh, static_cast<const uint16_t*>(pixels),
                       width, height);
    int32_t alpha = format == CF_RGBA4444 ? kAlpha4444 : (wide ? kAlpha8888 : kAlpha565);
    return make_texture(name, data, 1, wl, hl, alpha);
}

int32_t ClearTextures() noexcept {
    TEXTURE* t = g_eng.texture_list.head;
    while (t) {
        TEXTURE* next = t->next;
        FreeTexture(t);
        t = next;
    }
    g_eng.texture_list.clear();
    return 0;
}

} // namespace vrx::assets

using vrx::assets::TEXTURE;

extern "C" {

VRX_API int32_t VRX_LoadTexture(const char* name, void** out) noexcept {
    using namespace vrx;
    if (!name) {
        engine::ReportError("Wrong name in VRX_LoadTexture!!\n");
        return -1;
    }
    if (!out) {
        engine::ReportError("Wrong out in VRX_LoadTexture!!\n");
        return -1;
    }
    size_t n = std::strlen(name);
    auto* copy = static_cast<char*>(engine::eng_malloc(n + 1));
    if (!copy) {
        engine::ReportError("Allocate memory for TEXTURE NAME fail!!\n");
        return -1;
    }
    std::memcpy(copy, name, n + 1);
    engine::StrUpper(copy);
    TEXTURE* t = assets::FindOrLoadTexture(copy);
    if (t) ++t->ref_count;
    *out = t;
    return t ? 0 : -1;
}

VRX_API int32_t VRX_LoadTextureFromMemory(int32_t width, int32_t height, const void* pixels,
                                          uint32_t format, void** out) noexcept {
    using namespace vrx;
    if (!out) {
        engine::ReportError("Wrong out in VRX_LoadTextureFromMemory!!\n");
        return -1;
    }
    auto* name = static_cast<char*>(engine::eng_malloc(16));
    if (!name) {
        engine::ReportError("Allocate memory for TEXTURE NAME fail!!\n");
        *out = nullptr;
        return -1;
    }
    std::snprintf(name, 16, "TX%07d", assets::texture_serial);
    // The serial advances whether or not the texture can be made.
    ++assets::texture_serial;
    TEXTURE* t =
        assets::NewTextureFromPixels(name, width, height, pixels, static_cast<int32_t>(format));
    if (!t) {
        *out = nullptr;
        return -1;
    }
    ++t->ref_count;
    *out = t;
    if (assets::texture_serial > 2000000) assets::texture_serial = 0;
    return 0;
}

VRX_API int32_t VRX_UpdateTextureData(void* tex, int32_t width, int32_t height, const void* pixels,
                                      uint32_t format) noexcept {
    using namespace vrx;
    if (engine::chk_texture(tex)) return -1;
    auto* t = static_cast<TEXTURE*>(tex);
    if (!pixels) {
        engine::ReportError("Wrong pixels in VRX_UpdateTextureData!!\n");
        return -1;
    }
    // The pixels of a stored memory-pack entry are the host's pack bytes, perhaps read-only.
    if (!t->own_data) {
        engine::ReportError(
            "Texture pixels belong to a resource pack in VRX_UpdateTextureData!!\n");
        return -1;
    }
    bool wide = format == assets::CF_RGBA8888;
    if (wide != (t->alpha_kind == assets::kAlpha8888)) {
        engine::ReportError(
            "Pixel size of format %u does not match the texture in VRX_UpdateTextureData!!\n",
            format);
        return -1;
    }
    if (width == t->width && height == t->height) {
        std::memcpy(t->data, pixels, size_t(width) * size_t(height) * (wide ? 4u : 2u));
        return 0;
    }
    if (format != assets::CF_RGB565 && !wide) return -1;
    if (width < 1 || height < 1 || width > assets::kMaxTextureSize ||
        height > assets::kMaxTextureSize) {
        engine::ReportError("Wrong texture size %dx%d in VRX_UpdateTextureData!!\n", width, height);
        return -1;
    }
    if (wide)
        assets::StretchImage32(static_cast<uint32_t*>(t->data), t->width, t->height,
                               static_cast<const uint32_t*>(pixels), width, height);
    else
        assets::StretchImage16(static_cast<uint16_t*>(t->data), t->width, t->height,
                               static_cast<const uint16_t*>(pixels), width, height);
    return 0;
}

VRX_API int32_t VRX_UnloadTexture(void* tex) noexcept {
    using namespace vrx;
    if (engine::chk_texture(tex)) {
        engine::ReportError("chk_texture return error in ENG_UnloadText!!\n");
        return -1;
    }
    auto* t = static_cast<TEXTURE*>(tex);
    // The last reference releases it; a count already at 0 (a texture a material let go of
    // without releasing) is released too rather than wrapping round.
    if (t->ref_count <= 1) {
        assets::UnlinkTexture(t);
        assets::FreeTexture(t);
    } else {
        --t->ref_count;
    }
    return 0;
}

VRX_API int32_t VRX_GetTextureInfo(void* tex, int32_t* width, int32_t* height) noexcept {
    using namespace vrx;
    if (engine::chk_texture(tex)) {
        engine::ReportError("chk_texture return error in ENG_GetTextureWH!!\n");
        return -1;
    }
    if (!width || !height) {
        engine::ReportError("Wrong out in ENG_GetTextureWH!!\n");
        return -1;
    }
    const auto* t = static_cast<const TEXTURE*>(tex);
    *width = t->width;
    *height = t->height;
    return 0;
}

} // extern "C"
