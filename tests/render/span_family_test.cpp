// Every one of the 73 span fillers against hand-derived pixels: each member draws the same
// span under each clip case, and the expected scanline follows from its axes in kSpanTable
// (coverage, clip, depth, texel format, colour operation and weight variant).
#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <string>
#include <tuple>
#include <vector>

#include "span_test_support.h"

namespace vrx::test {
namespace {

using namespace vrx::render;

// ---- Inputs shared by every member ------------------------------------------------------------

// Three 8 x 8 textures, one per texel format, texel (c, r) at index r * 8 + c.
constexpr uint16_t tex565(int c, int r) {
    return static_cast<uint16_t>(0x1F3B * c + 0x0AC5 * r + 0x4242);
}
constexpr uint16_t tex4444(int c, int r) {
    return static_cast<uint16_t>(0x3A51 * c + 0x1C97 * r + 0x0303);
}
constexpr uint32_t tex8888(int c, int r) {
    return 0x1F2E3D4Cu * static_cast<uint32_t>(c) + 0x0B1A2938u * static_cast<uint32_t>(r) +
           0x11223344u;
}

constexpr int32_t kA = 160; // the material's weight
constexpr uint16_t kFlatColor = 0xA5A5;
constexpr int32_t kFlatR = 128 << 16, kFlatG = 255 << 16, kFlatB = 64 << 16;
constexpr int32_t kR = 200 << 16, kG = 100 << 16, kB = 50 << 16; // edge colour, both ends
constexpr int32_t kDepthDrawn = 0x10000;                         // the span's depth (w = 1.0)

// What lay in the buffers before the span.
constexpr uint16_t old_pixel(int col) {
    return static_cast<uint16_t>(0x1357 + col * 0x2B1D);
}
// Every third column holds the span's own depth (not drawn: strict), the next one the far
// depth (drawn), the next a nearer depth (not drawn).
constexpr int32_t old_depth(int col) {
    switch (((col % 3) + 3) % 3) {
        case 0:
            return kDepthDrawn;
        case 1:
            return kFar;
        default:
            return kDepthDrawn - 1;
    }
}

// The pixel a member writes over `under` from texel t (or the filtered average t), by the rules.
uint16_t shade(const SpanFillerInfo& f, uint32_t t, uint16_t under) {
    const bool alpha_alone = f.uv == Uv::Perspective8 || f.filter == Filter::FourTap;
    switch (f.op) {
        case ColorOp::Flat:
            return kFlatColor;
        case ColorOp::Gouraud:
            return ref_gouraud(kR, kG, kB);
        case ColorOp::GouraudBlend:
            return ref_blend(under, kR >> 16, kG >> 16, kB >> 16, kA);
        case ColorOp::Copy:
            return static_cast<uint16_t>(t);
        case ColorOp::ModulateFlat:
            return ref_modulate(t, kFlatR, kFlatG, kFlatB);
        case ColorOp::ModulateGouraud:
            return ref_modulate(t, kR, kG, kB);
        case ColorOp::Add:
            return ref_add(t, kR, kG, kB);
        case ColorOp::Blend:
        case ColorOp::BlendLit:
            switch (f.texel) {
                case Texel::Rgb565:
                    return ref_blend(under, static_cast<int32_t>((t >> 11) << 3),
                                     static_cast<int32_t>(((t >> 5) & 63) << 2),
                                     static_cast<int32_t>((t & 31) << 3), kA);
                case Texel::Rgba4444: {
                    const auto a = static_cast<int32_t>(t & 15) * 17;
                    return ref_blend(under, static_cast<int32_t>(((t >> 12) & 15) << 4),
                                     static_cast<int32_t>(((t >> 8) & 15) << 4),
                                     static_cast<int32_t>(((t >> 4) & 15) << 4),
                                     alpha_alone ? a : a * kA / 256);
                }
                case Texel::Argb8888: {
                    const auto a = static_cast<int32_t>(t >> 24);
                    return ref_blend(under, static_cast<int32_t>((t >> 16) & 255),
                                     static_cast<int32_t>((t >> 8) & 255),
                                     static_cast<int32_t>(t & 255), alpha_alone ? a : a * kA / 256);
                }
                case Texel::None:
                    break;
            }
            break;
    }
    ADD_FAILURE() << "no rule for " << f.name;
    return 0;
}

// ---- The clip cases -------------------------------------------------------------------------

struct ClipCase {
    const char* name;
    int32_t on, left, top, right, bottom;
    int32_t y;
};

const ClipCase kClipCases[] = {
    {"Unclipped", 0, 0, 0, 0, 0, 5},      {"Scissored", 1, 4, 0, 11, 100, 5}, // columns 4..10 only
    {"BelowRect", 1, 0, 0, 32, 5, 5},     // y >= bottom: the span is rejected
    {"AboveRect", 1, 0, 6, 32, 100, 5},   // y < top
    {"LeftOfRect", 1, 15, 0, 32, 100, 5}, // x1 = 14 < left
    {"RightOfRect", 1, 0, 0, 2, 100, 5},  // x0 = 2 >= right; SPAN_FLAT's x0 = 1 is not
};

// ---- The suite ------------------------------------------------------------------------------

using FamilyParam = std::tuple<size_t, size_t>; // member index, clip case index

class SpanFamilyTest : public SpanTest, public ::testing::WithParamInterface<FamilyParam> {
  protected:
    void SetUp() override {
        SpanTest::SetUp();
        for (int r = 0; r < 8; ++r) {
            for (int c = 0; c < 8; ++c) {
                t565[static_cast<size_t>(r * 8 + c)] = tex565(c, r);
                t4444[static_cast<size_t>(r * 8 + c)] = tex4444(c, r);
                t8888[static_cast<size_t>(r * 8 + c)] = tex8888(c, r);
            }
        }
        g_raster.flat_color = kFlatColor;
        g_raster.flat_r = kFlatR;
        g_raster.flat_g = kFlatG;
        g_raster.flat_b = kFlatB;
        g_raster.blend_a = kA;
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            pixel(col) = old_pixel(col);
            depth(col) = old_depth(col);
        }
    }
    std::array<uint16_t, 64> t565{};
    std::array<uint16_t, 64> t4444{};
    std::array<uint32_t, 64> t8888{};

    const SpanFillerInfo& member() const { return kSpanTable[std::get<0>(GetParam())]; }
    const ClipCase& clip() const { return kClipCases[std::get<1>(GetParam())]; }

    void bind_member_texture() {
        switch (member().texel) {
            case Texel::Rgb565:
                bind_texture(t565.data(), 3, 3);
                break;
            case Texel::Rgba4444:
                bind_texture(t4444.data(), 3, 3);
                break;
            case Texel::Argb8888:
                bind_texture(t8888.data(), 3, 3);
                break;
            case Texel::None:
                bind_texture(nullptr, 3, 3);
                break;
        }
    }
    uint32_t texel(int c, int r) const {
        c &= 7;
        r &= 7;
        switch (member().texel) {
            case Texel::Rgb565:
                return tex565(c, r);
            case Texel::Rgba4444:
                return tex4444(c, r);
            case Texel::Argb8888:
                return tex8888(c, r);
            case Texel::None:
                break;
        }
        return 0;
    }

    // Compares the whole scanline with what the rules say: pixels in [x0, x1] that pass the
    // span and column clip and the depth test get want(col), the rest keep their old values.
    template <class Want> void check_scanline(int x0, int x1, Want want) {
        const SpanFillerInfo& f = member();
        const ClipCase& k = clip();
        const bool rejected =
            k.on && (k.y >= k.bottom || k.y < k.top || x0 >= k.right || x1 < k.left);
        int drawn = 0;
        for (int col = -kOrigin; col < kCols - kOrigin; ++col) {
            const bool in_span = !rejected && col >= x0 && col <= x1;
            const bool in_clip = !k.on || (col >= k.left && col < k.right);
            const bool nearer = f.depth == Depth::None || old_depth(col) > kDepthDrawn;
            const bool draws = in_span && in_clip && nearer;
            drawn += draws ? 1 : 0;
            EXPECT_EQ(pixel(col), draws ? want(col) : old_pixel(col)) << "column " << col;
            const bool stores = draws && f.depth == Depth::Less;
            EXPECT_EQ(depth(col), stores ? kDepthDrawn : old_depth(col)) << "column " << col;
        }
        if (!k.on) {
            EXPECT_GT(drawn, 0); // the unclipped span must reach the buffer
        }
    }
};

// Mid-texel span: xl = 1.5, xr = 14.5 (pixels 2..14, 13 = 5 + 8 for the perspective members;
// SPAN_FLAT's rule B draws 1..14), depth 1.0 at both ends. u runs 0.5 texel at xl to 13.5 at
// xr, so pixel col samples the middle of texel column col - 1 (within a few raw units whatever
// the rounding of the steps); v is 3.5 texels throughout. All four filter taps lie within 3/8
// texel of that middle (the step is one texel, q about 64, taps unscaled), so the filtered
// members average four copies of the same texel.
TEST_P(SpanFamilyTest, MidTexelSpan) {
    const SpanFillerInfo& f = member();
    const ClipCase& k = clip();
    if (k.on) set_clip(k.left, k.top, k.right, k.bottom);
    bind_member_texture();
    const int32_t one = 0x200000; // one texel of an 8-texel texture
    const SPAN_EDGE l = edge(fx(1, 0x8000), kWDepth1, one / 2, 7 * one / 2, kR, kG, kB);
    const SPAN_EDGE r = edge(fx(14, 0x8000), kWDepth1, 27 * one / 2, 7 * one / 2, kR, kG, kB);
    f.fn(&l, &r, k.y);
    const int x0 = f.coverage == Coverage::Columns ? 1 : 2;
    check_scanline(x0, 14, [&](int col) { return shade(f, texel(col - 1, 3), old_pixel(col)); });
}

// Corner span for the filtered members: xl = 2.0, xr = 10.0 (pixels 2..9), u from 7.5 texels at
// xl by exactly one texel per pixel (hInverse(8.0) = 1 << 21 makes the affine step exact), so
// pixel col samples the corner of texels col - 2 and col - 3; v sits on the corner of rows 3
// and 4. The taps (u + 1/8, v + 3/8), (u - 3/8, v + 1/8), (u + 3/8, v - 1/8), (u - 1/8, v - 3/8)
// then take the four texels around the corner. The perspective step comes out one raw unit
// short per pixel, which no tap notices.
using SpanFilteredFamilyTest = SpanFamilyTest;

TEST_P(SpanFilteredFamilyTest, CornerSpan) {
    const SpanFillerInfo& f = member();
    ASSERT_EQ(f.filter, Filter::FourTap);
    const ClipCase& k = clip();
    if (k.on) set_clip(k.left, k.top, k.right, k.bottom);
    bind_member_texture();
    const SPAN_EDGE l = edge(fx(2), kWDepth1, 0xF00000, 0x800000, kR, kG, kB);
    const SPAN_EDGE r = edge(fx(10), kWDepth1, 0x1F00000, 0x800000, kR, kG, kB);
    f.fn(&l, &r, k.y);
    check_scanline(2, 9, [&](int col) {
        const int c = col - 2;
        const std::array<uint16_t, 4> taps{
            static_cast<uint16_t>(texel(c, 4)), static_cast<uint16_t>(texel(c - 1, 4)),
            static_cast<uint16_t>(texel(c, 3)), static_cast<uint16_t>(texel(c - 1, 3))};
        const uint16_t avg = f.texel == Texel::Rgb565 ? ref_avg565(taps) : ref_avg4444(taps);
        return shade(f, avg, old_pixel(col));
    });
}

std::string family_name(const testing::TestParamInfo<FamilyParam>& info) {
    return std::string(kSpanTable[std::get<0>(info.param)].name) + "_" +
           kClipCases[std::get<1>(info.param)].name;
}

INSTANTIATE_TEST_SUITE_P(AllMembers, SpanFamilyTest,
                         ::testing::Combine(::testing::Range<size_t>(0, std::size(kSpanTable)),
                                            ::testing::Range<size_t>(0, std::size(kClipCases))),
                         family_name);

// The filtered members (the corner would be ambiguous for a single texel).
std::vector<size_t> filtered_members() {
    std::vector<size_t> out;
    for (size_t i = 0; i < std::size(kSpanTable); ++i) {
        if (kSpanTable[i].filter == Filter::FourTap) out.push_back(i);
    }
    return out;
}

INSTANTIATE_TEST_SUITE_P(FilteredMembers, SpanFilteredFamilyTest,
                         ::testing::Combine(::testing::ValuesIn(filtered_members()),
                                            ::testing::Range<size_t>(0, std::size(kClipCases))),
                         family_name);

// ---- The family as data -----------------------------------------------------------------------

// The list holds 43 standard and 30 filtered members, every one a distinct function with a
// distinct name, and exactly the axis combinations the rasteriser needs.
TEST(SpanFamilyList, MembersAreDistinctAndComplete) {
    int standard = 0, filtered = 0;
    for (size_t i = 0; i < std::size(kSpanTable); ++i) {
        const SpanFillerInfo& f = kSpanTable[i];
        (f.filter == Filter::FourTap ? filtered : standard) += 1;
        for (size_t j = 0; j < i; ++j) {
            EXPECT_NE(f.fn, kSpanTable[j].fn) << f.name;
            EXPECT_STRNE(f.name, kSpanTable[j].name);
        }
        // Untextured members fetch nothing; filtered ones never read 32-bit texels.
        EXPECT_EQ(f.uv == Uv::None, f.texel == Texel::None) << f.name;
        if (f.filter == Filter::FourTap) {
            EXPECT_NE(f.texel, Texel::Argb8888) << f.name;
        }
        // Only SPAN_FLAT uses rule B.
        EXPECT_EQ(f.coverage == Coverage::Columns, f.fn == span_flat) << f.name;
    }
    EXPECT_EQ(standard, 43);
    EXPECT_EQ(filtered, 30);
    EXPECT_EQ(info_of(span_blendlit_4444_zp).op, ColorOp::BlendLit);
    EXPECT_EQ(info_of(span_texmod_p_filtered).uv, Uv::Perspective8);
}

} // namespace
} // namespace vrx::test
