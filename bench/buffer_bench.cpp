// Whole-buffer operations that run once per frame: clears, window fills and the 2x2
// reduction of doubled mode.
#include <benchmark/benchmark.h>

#include <vector>

#include "lite_vrx.h"
#include "render/render_buffer.h"

namespace {

// An open engine over a host buffer of the given size, closed when the benchmark ends.
struct OpenEngine {
    std::vector<uint16_t> color;
    OpenEngine(int w, int h) : color(static_cast<size_t>(w) * static_cast<size_t>(h)) {
        VRX_Open(0, static_cast<uint32_t>(w), static_cast<uint32_t>(h), VRX_FMT_RGB565);
        VRX_SetRenderBuffer(color.data(), nullptr);
    }
    ~OpenEngine() { VRX_Close(); }
};

void BM_ClearRenderBuffer(benchmark::State& state) {
    const int w = static_cast<int>(state.range(0)), h = static_cast<int>(state.range(1));
    OpenEngine eng(w, h);
    VRX_Hint(HINT_DEPTH, static_cast<uint32_t>(state.range(2)));
    for (auto _ : state) {
        VRX_ClearRenderBuffer(10, 20, 30);
        benchmark::DoNotOptimize(eng.color.data());
    }
    state.SetItemsProcessed(state.iterations() * w * h);
}
BENCHMARK(BM_ClearRenderBuffer)->Args({240, 320, 0})->Args({240, 320, 1})->Args({640, 480, 1});

void BM_ClearWindow(benchmark::State& state) {
    OpenEngine eng(320, 240);
    WINDOW_INFO info{16, 16, 256, 192, 0};
    void* win = nullptr;
    VRX_NewWindow(&info, &win);
    const uint8_t rgb[3] = {1, 2, 3};
    for (auto _ : state) {
        VRX_ClearWindow(win, rgb);
        benchmark::DoNotOptimize(eng.color.data());
    }
    state.SetItemsProcessed(state.iterations() * 256 * 192);
}
BENCHMARK(BM_ClearWindow);

void BM_Downsample2x2(benchmark::State& state) {
    const int w = static_cast<int>(state.range(0)), h = static_cast<int>(state.range(1));
    std::vector<uint16_t> src(static_cast<size_t>(4 * w * h), 0x7BEF);
    std::vector<uint16_t> dst(static_cast<size_t>(w * h));
    for (auto _ : state) {
        vrx::render::Downsample2x2(w, h, src.data(), dst.data());
        benchmark::DoNotOptimize(dst.data());
    }
    state.SetItemsProcessed(state.iterations() * w * h);
}
BENCHMARK(BM_Downsample2x2)->Args({240, 320})->Args({320, 240});

} // namespace
