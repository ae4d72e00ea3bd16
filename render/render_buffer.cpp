// The render buffers: whole-buffer and rectangle fills, block copies, the 2x2 reduction
// of doubled mode, and the buffers the engine owns.
#include "render/render_buffer.h"

#include <cstring>

#include "engine/alloc.h"
#include "engine/console.h"
#include "engine/error.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "render/window.h"

namespace vrx::render {

using engine::g_eng;

namespace {

bool depth_clear_wanted() noexcept {
    return (g_eng.eng_flags & engine::FLAG_ZBUFFER) && !(g_eng.eng_flags & engine::FLAG_SORT);
}

size_t buffer_pixels() noexcept {
    return static_cast<size_t>(g_eng.buf_w) * static_cast<size_t>(g_eng.buf_h);
}

// Word stores through memcpy: the host's colour buffer need only be 2-byte aligned,
// and the compiler turns each into a plain (vectorisable) store.
inline void store_word(unsigned char* p, uint32_t v) noexcept {
    std::memcpy(p, &v, 4);
}

// The mask that drops the top bit of each RGB565 channel after a halving shift.
constexpr uint32_t kHalfMask = 0x7BEF;

// Average of two pixels with the same truncation as the reduction's row step.
constexpr uint32_t row_average(uint32_t p0, uint32_t p1) noexcept {
    return ((((p0 >> 1) & kHalfMask) + ((p1 >> 1) & kHalfMask)) >> 1) & kHalfMask;
}

} // namespace

void FillWords(void* dst, uint32_t value, uint32_t bytes) noexcept {
    auto* p = static_cast<unsigned char*>(dst);
    uint32_t words = bytes / 4;
    // Blocks of 128 words, then the rest.
    for (; words >= 128; words -= 128, p += 512)
        for (int i = 0; i < 128; ++i) store_word(p + 4 * i, value);
    for (uint32_t i = 0; i < words; ++i) store_word(p + 4 * i, value);
}

void FillRect(int32_t x, int32_t y, int32_t w, int32_t h, uint16_t color) noexcept {
    if (w < 1 || h < 1) return;
    const bool depth = depth_clear_wanted() && g_eng.depth_buf;
    for (int32_t r = 0; r < h; ++r) {
        size_t at =
            static_cast<size_t>(y + r) * static_cast<size_t>(g_eng.buf_w) + static_cast<size_t>(x);
        uint16_t* c = g_eng.color_buf + at;
        for (int32_t i = 0; i < w; ++i) c[i] = color;
        if (depth) {
            int32_t* z = g_eng.depth_buf + at;
            for (int32_t i = 0; i < w; ++i) z[i] = engine::kDepthClear;
        }
    }
}

void Downsample2x2(int32_t width, int32_t height, const uint16_t* src, uint16_t* dst) noexcept {
    // Each result pixel lies at or before the four it is made from, so dst may be src.
    // Every column is reduced, including a last group of fewer than four.
    const size_t pitch = 2 * static_cast<size_t>(width);
    for (int32_t j = 0; j < height; ++j) {
        const uint16_t* top = src + 2 * static_cast<size_t>(j) * pitch;
        const uint16_t* bottom = top + pitch;
        uint16_t* out = dst + static_cast<size_t>(j) * static_cast<size_t>(width);
        for (int32_t i = 0; i < width; ++i) {
            uint32_t a = row_average(top[2 * i], top[2 * i + 1]);
            uint32_t b = row_average(bottom[2 * i], bottom[2 * i + 1]);
            out[i] = static_cast<uint16_t>(a + b);
        }
    }
}

int32_t RenderBufAlloc() noexcept {
    if (!(g_eng.eng_flags & engine::FLAG_SORT)) {
        g_eng.own_depth_buf =
            static_cast<int32_t*>(engine::eng_malloc(buffer_pixels() * sizeof(int32_t)));
        if (!g_eng.own_depth_buf) return -1;
    }
    g_eng.vtx_cap = kVtxStoreCount;
    g_eng.vtx_buf = engine::vtx_store;
    return 0;
}

void RenderBufFree() noexcept {
    if (g_eng.depth_buf == g_eng.own_depth_buf) g_eng.depth_buf = nullptr;
    engine::eng_free(g_eng.own_depth_buf);
    g_eng.own_depth_buf = nullptr;
    if (g_eng.color_buf == g_eng.own_color_buf) g_eng.color_buf = nullptr;
    engine::eng_free(g_eng.own_color_buf);
    g_eng.own_color_buf = nullptr;
    if (g_eng.vtx_buf != engine::vtx_store) engine::eng_free(g_eng.vtx_buf);
    g_eng.vtx_buf = nullptr;
}

int32_t EnsureDepthBuffer() noexcept {
    if (g_eng.depth_buf) return 0;
    if (!g_eng.own_depth_buf) {
        g_eng.own_depth_buf =
            static_cast<int32_t*>(engine::eng_malloc(buffer_pixels() * sizeof(int32_t)));
        if (!g_eng.own_depth_buf) return -1;
        FillWords(g_eng.own_depth_buf, static_cast<uint32_t>(engine::kDepthClear),
                  static_cast<uint32_t>(buffer_pixels() * sizeof(int32_t)));
    }
    g_eng.depth_buf = g_eng.own_depth_buf;
    return 0;
}

int32_t EnterDoubleMode() noexcept {
    // The engine draws into its own buffers of twice the screen size while doubled;
    // the swap reduces the picture into the start of that colour buffer.
    const size_t pixels =
        4 * static_cast<size_t>(g_eng.screen_w) * static_cast<size_t>(g_eng.screen_h);
    auto* color = static_cast<uint16_t*>(engine::eng_calloc(pixels, sizeof(uint16_t)));
    int32_t* depth = nullptr;
    if (color && !(g_eng.eng_flags & engine::FLAG_SORT))
        depth = static_cast<int32_t*>(engine::eng_malloc(pixels * sizeof(int32_t)));
    if (!color || (!depth && !(g_eng.eng_flags & engine::FLAG_SORT))) {
        engine::eng_free(color);
        engine::ReportError("Allocate double buffers fail in EnterDoubleMode!!\n");
        return 0;
    }
    if (depth)
        FillWords(depth, static_cast<uint32_t>(engine::kDepthClear),
                  static_cast<uint32_t>(pixels * sizeof(int32_t)));
    RenderBufFree();
    g_eng.own_color_buf = color;
    g_eng.own_depth_buf = depth;
    g_eng.color_buf = color;
    g_eng.depth_buf = depth;
    g_eng.vtx_cap = kVtxStoreCount;
    g_eng.vtx_buf = engine::vtx_store;
    g_eng.buf_w = 2 * g_eng.screen_w;
    g_eng.buf_h = 2 * g_eng.screen_h;
    scale_all_windows(true);
    // Windows were recomputed; keep the clip rectangle inside the new buffer.
    SetCurWindow(g_eng.cur_window);
    return 1;
}

void LeaveDoubleMode() noexcept {
    RenderBufFree();
    g_eng.buf_w = g_eng.screen_w;
    g_eng.buf_h = g_eng.screen_h;
    if (RenderBufAlloc() != 0)
        engine::ReportError("Allocate depth buffer fail in LeaveDoubleMode!!\n");
    g_eng.color_buf = nullptr;
    g_eng.depth_buf = g_eng.own_depth_buf;
    scale_all_windows(false);
    // The clip rectangle must not keep pointing past the halved buffer.
    SetCurWindow(g_eng.cur_window);
    engine::ConInit();
}

} // namespace vrx::render

using namespace vrx;
using engine::g_eng;

namespace {

// A block copy must lie inside the buffer and have a non-empty size.
bool block_ok(int32_t x, int32_t y, int32_t w, int32_t h, const void* colors, const char* op) {
    if (!g_eng.color_buf) {
        engine::ReportError("No render buffer in %s!!\n", op);
        return false;
    }
    if (!colors || w < 1 || h < 1 || x < 0 || y < 0 || int64_t{x} + w > g_eng.buf_w ||
        int64_t{y} + h > g_eng.buf_h) {
        engine::ReportError("Wrong block in %s!!\n", op);
        return false;
    }
    return true;
}

} // namespace

extern "C" {

VRX_API int32_t VRX_ClearRenderBuffer(int32_t r, int32_t g, int32_t b) noexcept {
    if (!g_eng.color_buf) {
        engine::ReportError("No render buffer in VRX_ClearRenderBuffer!!\n");
        return -1;
    }
    const size_t pixels = static_cast<size_t>(g_eng.buf_w) * static_cast<size_t>(g_eng.buf_h);
    const auto ur = static_cast<uint32_t>(r), ug = static_cast<uint32_t>(g),
               ub = static_cast<uint32_t>(b);
    if (g_eng.screen_fmt != VRX_FMT_ARGB8888) {
        if (render::depth_clear_wanted() && g_eng.depth_buf)
            render::FillWords(g_eng.depth_buf, static_cast<uint32_t>(engine::kDepthClear),
                              static_cast<uint32_t>(pixels * 4));
        uint32_t color = ((ur & 0xF8) << 8) + ((ug & 0xFC) << 3) + ((ub & 0xFF) >> 3);
        color &= 0xFFFF;
        render::FillWords(g_eng.color_buf, color | (color << 16),
                          static_cast<uint32_t>(pixels * 2));
    } else {
        // Four bytes per pixel, in whole groups of four pixels.
        uint32_t value = ur + ((ug & ~3u) << 8) + ((ub & ~7u) << 16);
        auto words = static_cast<uint32_t>(pixels / 4 * 4);
        render::FillWords(g_eng.color_buf, value, words * 4);
        if ((g_eng.eng_flags & engine::FLAG_ZBUFFER) && g_eng.depth_buf)
            render::FillWords(g_eng.depth_buf, static_cast<uint32_t>(engine::kDepthClear),
                              words * 4);
    }
    return 0;
}

VRX_API int32_t VRX_CopyToRenderBuffer(int32_t x, int32_t y, int32_t w, int32_t h,
                                       const uint16_t* colors, const int32_t* depths) noexcept {
    if (!block_ok(x, y, w, h, colors, "VRX_CopyToRenderBuffer")) return -1;
    const bool with_depth = g_eng.depth_buf && depths;
    for (int32_t r = 0; r < h; ++r) {
        size_t at =
            static_cast<size_t>(y + r) * static_cast<size_t>(g_eng.buf_w) + static_cast<size_t>(x);
        size_t from = static_cast<size_t>(r) * static_cast<size_t>(w);
        std::memcpy(g_eng.color_buf + at, colors + from, static_cast<size_t>(w) * 2);
        if (with_depth)
            std::memcpy(g_eng.depth_buf + at, depths + from, static_cast<size_t>(w) * 4);
    }
    return 0;
}

VRX_API int32_t VRX_CopyFromRenderBuffer(int32_t x, int32_t y, int32_t w, int32_t h,
                                         uint16_t* colors, int32_t* depths) noexcept {
    if (!block_ok(x, y, w, h, colors, "VRX_CopyFromRenderBuffer")) return -1;
    const bool with_depth = g_eng.depth_buf && depths;
    for (int32_t r = 0; r < h; ++r) {
        size_t at =
            static_cast<size_t>(y + r) * static_cast<size_t>(g_eng.buf_w) + static_cast<size_t>(x);
        size_t to = static_cast<size_t>(r) * static_cast<size_t>(w);
        std::memcpy(colors + to, g_eng.color_buf + at, static_cast<size_t>(w) * 2);
        if (with_depth) std::memcpy(depths + to, g_eng.depth_buf + at, static_cast<size_t>(w) * 4);
    }
    return 0;
}

VRX_API int32_t VRX_GetRenderBuffer(int32_t* width, int32_t* height, uint16_t** colors,
                                    int32_t** depths) noexcept {
    const bool doubled = g_eng.eng_flags & engine::FLAG_DOUBLE;
    if (width) *width = doubled ? g_eng.screen_w : g_eng.buf_w;
    if (height) *height = doubled ? g_eng.screen_h : g_eng.buf_h;
    if (colors) *colors = g_eng.color_buf;
    if (depths) *depths = g_eng.depth_buf;
    return 0;
}

VRX_API int32_t VRX_SetRenderBuffer(uint16_t* colors, int32_t* depths) noexcept {
    if (g_eng.eng_flags & engine::FLAG_DOUBLE) return -1;
    if (colors) g_eng.color_buf = colors;
    if (depths) g_eng.depth_buf = depths;
    return 0;
}

VRX_API int32_t VRX_SwapRenderBuffer(void) noexcept {
    if ((g_eng.eng_flags & engine::FLAG_DOUBLE) && g_eng.color_buf)
        render::Downsample2x2(g_eng.screen_w, g_eng.screen_h, g_eng.color_buf, g_eng.color_buf);
    g_eng.cur_material = nullptr;
    return 0;
}

} // extern "C"
