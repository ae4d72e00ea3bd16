// Span fillers: fill rate (items are pixels) of every member of the family on 320-pixel spans
// (one scanline of a 320-pixel-wide buffer), with a 64 x 64 texture repeated twice across the
// span, a depth ramp of 1.0 to 2.0 and the clip off. Depth-tested spans move a little nearer
// every iteration so that every pixel passes the test and is written.
#include <benchmark/benchmark.h>

#include <algorithm>
#include <array>
#include <string>
#include <vector>

#include "engine/fixed.h"
#include "engine/state.h"
#include "render/raster.h"
#include "render/span_fillers.h"

namespace {

using namespace vrx::render;

constexpr int32_t kSpanPixels = 320;
constexpr int32_t kTexLog2 = 6; // 64 x 64 texels

struct Scene {
    std::vector<uint16_t> row = std::vector<uint16_t>(kSpanPixels, 0x7BEF);
    std::vector<int32_t> zrow = std::vector<int32_t>(kSpanPixels, 0x7FFFFFFF);
    std::vector<uint16_t> tex16 = std::vector<uint16_t>(1u << (2 * kTexLog2));
    std::vector<uint32_t> tex32 = std::vector<uint32_t>(1u << (2 * kTexLog2));

    Scene() {
        for (size_t i = 0; i < tex16.size(); ++i) {
            tex16[i] = static_cast<uint16_t>(i * 0x9E37u + 0x1234u);
            tex32[i] = static_cast<uint32_t>(i) * 0x9E3779B1u;
        }
    }
};

void bind(Scene& s, const SpanFillerInfo& f) {
    RasterContext& rc = g_raster;
    rc.row = s.row.data();
    rc.zrow = s.zrow.data();
    rc.flat_color = 0x5AAB;
    rc.flat_r = 200 << 16;
    rc.flat_g = 150 << 16;
    rc.flat_b = 100 << 16;
    rc.blend_a = 200;
    rc.texels = f.texel == Texel::Argb8888 ? static_cast<const void*>(s.tex32.data())
                                           : static_cast<const void*>(s.tex16.data());
    rc.tex_umask = rc.tex_vmask = (1 << kTexLog2) - 1;
    rc.tex_wlog2 = kTexLog2;
    rc.tex_ushift = rc.tex_vshift = 24 - kTexLog2;
    vrx::engine::g_eng.clip_on = 0;
}

void fill_rate(benchmark::State& state, const SpanFillerInfo& f) {
    vrx::engine::FillRecipTable();
    Scene scene;
    bind(scene, f);
    // Pixels 0..319; u twice across the texture, v a quarter down; colour ramps on all channels.
    SPAN_EDGE left{0, 0x4000000, 30 << 16, 220 << 16, 60 << 16, 0xFF0000, 0, 0};
    SPAN_EDGE right{kSpanPixels << 16, 0x2000000, 250 << 16, 40 << 16, 180 << 16, 0xFF0000, 0, 0};
    int32_t step = 0;
    for (auto _ : state) {
        // Nearer by a little each time; start over from a cleared depth row every 4096 spans.
        if ((step & 4095) == 0) {
            std::fill(scene.zrow.begin(), scene.zrow.end(), 0x7FFFFFFF);
        }
        const int32_t nearer = (step & 4095) << 10;
        left.w = 0x4000000 + nearer;
        right.w = 0x2000000 + nearer;
        // uw = (u * w) >> 18: u from 0 to 2.0 across the span, v from 0 to 0.25.
        right.uw = static_cast<int32_t>((int64_t{0x20000} * right.w) >> 18);
        right.vw = static_cast<int32_t>((int64_t{0x4000} * right.w) >> 18);
        f.fn(&left, &right, 0);
        benchmark::DoNotOptimize(scene.row.data());
        benchmark::ClobberMemory();
        ++step;
    }
    state.SetItemsProcessed(state.iterations() * kSpanPixels); // pixels per second
}

// One benchmark per member, named Span/<filler>.
const bool kRegistered = [] {
    for (const SpanFillerInfo& f : kSpanTable) {
        benchmark::RegisterBenchmark((std::string("Span/") + f.name).c_str(),
                                     [&f](benchmark::State& st) { fill_rate(st, f); })
            ->MinTime(0.2);
    }
    return true;
}();

} // namespace
