// Triangle setup: triangles per second of each of the eight drawers at a few sizes. The
// span filler is a plain flat fill defined here, so the figures measure the drawers' sort,
// edge steps and scanline walk plus the cheapest possible pixel loop, and do not move when
// the real fillers change.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <array>
#include <vector>

#include "lite_vrx.h"
#include "render/raster.h"
#include "render/triangle.h"

namespace {

using namespace vrx::render;

// Fills the pixels whose centres lie between the span ends with the flat colour.
void bench_flat_span(const SPAN_EDGE* left, const SPAN_EDGE* right, int32_t) noexcept {
    const int32_t x0 = (left->x + 0x8000) >> 16, x1 = (right->x - 0x8000) >> 16;
    if (x1 < x0) return;
    std::fill(g_raster.row + x0, g_raster.row + x1 + 1, g_raster.flat_color);
}

struct Drawer {
    const char* name;
    TriangleFn fn;
};

constexpr std::array<Drawer, 8> kDrawers = {{
    {"tri_flat", tri_flat},
    {"tri_flat_z", tri_flat_z},
    {"tri_gouraud", tri_gouraud},
    {"tri_gouraud_z", tri_gouraud_z},
    {"tri_tex", tri_tex},
    {"tri_tex_z", tri_tex_z},
    {"tri_tex_gouraud", tri_tex_gouraud},
    {"tri_tex_gouraud_z", tri_tex_gouraud_z},
}};

SVERTEX vertex(int32_t x, int32_t y, int32_t i) {
    SVERTEX v{};
    v.x = x;
    v.y = y;
    v.w = 0x4000000 >> (i % 3); // depth 1, 2 or 4
    v.u = i * 0x4000;
    v.v = 0x10000 - i * 0x2000;
    v.r = (40 + 50 * i) << 16;
    v.g = (200 - 30 * i) << 16;
    v.b = (90 + 20 * i) << 16;
    v.a = 0xFF0000;
    return v;
}

// Triangles of about size x size pixels tiled over a 240 x 320 buffer, half with the long
// edge on the left and half on the right, at sub-pixel offsets so every sort path is taken.
std::vector<std::array<SVERTEX, 3>> make_triangles(int32_t size) {
    std::vector<std::array<SVERTEX, 3>> tris;
    const int32_t s = size << 16;
    int32_t i = 0;
    for (int32_t y = 2; y + size + 2 < 320; y += size + 1) {
        for (int32_t x = 2; x + size + 2 < 240; x += size + 1, ++i) {
            const int32_t fx = (x << 16) + (i * 0x1357 & 0xFFFF);
            const int32_t fy = (y << 16) + (i * 0x2468 & 0xFFFF);
            if (i & 1) {
                tris.push_back({vertex(fx, fy, 0), vertex(fx + s, fy + s / 2, 1),
                                vertex(fx + s / 3, fy + s, 2)});
            } else {
                tris.push_back({vertex(fx + s, fy + s, 0), vertex(fx, fy + s / 3, 1),
                                vertex(fx + s / 2, fy, 2)});
            }
        }
    }
    return tris;
}

void BM_TriangleDrawer(benchmark::State& state) {
    const Drawer& d = kDrawers[static_cast<size_t>(state.range(0))];
    const auto size = static_cast<int32_t>(state.range(1));
    std::vector<uint16_t> color(240 * 320);
    VRX_Open(0, 240, 320, VRX_FMT_RGB565);
    VRX_SetRenderBuffer(color.data(), nullptr);
    draw_span = bench_flat_span;
    const auto tris = make_triangles(size);
    for (auto _ : state) {
        for (const auto& t : tris) d.fn(&t[0], &t[1], &t[2]);
        benchmark::DoNotOptimize(color.data());
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(tris.size()));
    state.SetLabel(d.name);
    draw_span = nullptr;
    VRX_Close();
}
BENCHMARK(BM_TriangleDrawer)->ArgsProduct({{0, 1, 2, 3, 4, 5, 6, 7}, {4, 16, 64}});

} // namespace
