// build_span_table: the standard set in every slot, the filtered set in every textured slot
// but the seven 32-bit ones, and back again.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <iterator>

#include "render/raster.h"
#include "render/span_fillers.h"
#include "span_test_support.h"

namespace vrx::test {
namespace {

using namespace vrx::render;

class SpanTableTest : public ::testing::Test {
  protected:
    void SetUp() override { std::copy(std::begin(SpanTable), std::end(SpanTable), saved_); }
    void TearDown() override { std::copy(std::begin(saved_), std::end(saved_), SpanTable); }
    SpanFn saved_[kSpanSlotCount]{};
};

// The standard filler of every slot, written out by slot name.
struct SlotCase {
    SpanSlot slot;
    SpanFn standard;
    SpanFn filtered; // what set 1 holds
};

const SlotCase kSlots[] = {
    {SPAN_FLAT, span_flat, span_flat},
    {SPAN_FLAT_Z, span_flat_z, span_flat_z},
    {SPAN_GOURAUD, span_gouraud, span_gouraud},
    {SPAN_GOURAUD_Z, span_gouraud_z, span_gouraud_z},
    {SPAN_GOURAUD_BLEND_Z, span_gouraud_blend_z, span_gouraud_blend_z},
    {SPAN_TEX, span_tex, span_tex_filtered},
    {SPAN_TEX_P, span_tex_p, span_tex_p_filtered},
    {SPAN_TEX_Z, span_tex_z, span_tex_z_filtered},
    {SPAN_TEX_ZP, span_tex_zp, span_tex_zp_filtered},
    {SPAN_TEXMOD, span_texmod, span_texmod_filtered},
    {SPAN_TEXMOD_P, span_texmod_p, span_texmod_p_filtered},
    {SPAN_TEXMOD_Z, span_texmod_z, span_texmod_z_filtered},
    {SPAN_TEXMOD_ZP, span_texmod_zp, span_texmod_zp_filtered},
    {SPAN_TEXGOUR, span_texgour, span_texgour_filtered},
    {SPAN_TEXGOUR_P, span_texgour_p, span_texgour_p_filtered},
    {SPAN_TEXGOUR_Z, span_texgour_z, span_texgour_z_filtered},
    {SPAN_TEXGOUR_ZP, span_texgour_zp, span_texgour_zp_filtered},
    {SPAN_TEXADD, span_texadd, span_texadd_filtered},
    {SPAN_TEXADD_P, span_texadd_p, span_texadd_p_filtered},
    {SPAN_TEXADD_Z, span_texadd_z, span_texadd_z_filtered},
    {SPAN_TEXADD_ZP, span_texadd_zp, span_texadd_zp_filtered},
    {SPAN_BLEND_565, span_blend_565, span_blend_565_filtered},
    {SPAN_BLEND_4444, span_blend_4444, span_blend_4444_filtered},
    {SPAN_BLEND_8888, span_blend_8888, span_blend_8888},
    {SPAN_BLEND_565_P, span_blend_565_p, span_blend_565_p_filtered},
    {SPAN_BLEND_4444_P, span_blend_4444_p, span_blend_4444_p_filtered},
    {SPAN_BLEND_8888_P, span_blend_8888_p, span_blend_8888_p},
    {SPAN_BLEND_565_Z, span_blend_565_z, span_blend_565_z_filtered},
    {SPAN_BLEND_4444_Z, span_blend_4444_z, span_blend_4444_z_filtered},
    {SPAN_BLEND_8888_Z, span_blend_8888_z, span_blend_8888_z},
    {SPAN_BLEND_565_ZP, span_blend_565_zp, span_blend_565_zp_filtered},
    {SPAN_BLEND_4444_ZP, span_blend_4444_zp, span_blend_4444_zp_filtered},
    {SPAN_BLEND_8888_ZP, span_blend_8888_zp, span_blend_8888_zp},
    {SPAN_BLENDLIT_565, span_blendlit_565, span_blendlit_565_filtered},
    {SPAN_BLENDLIT_4444, span_blendlit_4444, span_blendlit_4444_filtered},
    {SPAN_BLENDLIT_8888, span_blendlit_8888, span_blendlit_8888},
    {SPAN_BLENDLIT_565_Z, span_blendlit_565_z, span_blendlit_565_z_filtered},
    {SPAN_BLENDLIT_4444_Z, span_blendlit_4444_z, span_blendlit_4444_z_filtered},
    {SPAN_BLENDLIT_8888_Z, span_blendlit_8888_z, span_blendlit_8888_z},
    {SPAN_BLENDLIT_565_ZP, span_blendlit_565_zp, span_blendlit_565_zp_filtered},
    {SPAN_BLENDLIT_4444_ZP, span_blendlit_4444_zp, span_blendlit_4444_zp_filtered},
    {SPAN_BLENDLIT_8888_ZP, span_blendlit_8888_zp, span_blendlit_8888_zp},
    {SPAN_GOURAUD_BLEND, span_gouraud_blend, span_gouraud_blend},
};
static_assert(std::size(kSlots) == kSpanSlotCount);

TEST_F(SpanTableTest, StandardFilteredAndBack) {
    std::fill(std::begin(SpanTable), std::end(SpanTable), nullptr);
    build_span_table(kSpanSetStandard);
    for (const SlotCase& c : kSlots) EXPECT_EQ(SpanTable[c.slot], c.standard) << c.slot;
    build_span_table(kSpanSetFiltered);
    for (const SlotCase& c : kSlots) EXPECT_EQ(SpanTable[c.slot], c.filtered) << c.slot;
    build_span_table(kSpanSetStandard);
    for (const SlotCase& c : kSlots) EXPECT_EQ(SpanTable[c.slot], c.standard) << c.slot;
}

// In the filtered set a slot's filler differs from its standard one only by the filter, and
// only the 32-bit and untextured slots keep the standard filler.
TEST_F(SpanTableTest, FilteredSetOnlyChangesTheFilter) {
    SpanFn standard[kSpanSlotCount];
    build_span_table(kSpanSetStandard);
    std::copy(std::begin(SpanTable), std::end(SpanTable), standard);
    build_span_table(kSpanSetFiltered);
    int changed = 0;
    for (int32_t slot = 0; slot < kSpanSlotCount; ++slot) {
        const SpanFillerInfo& s = info_of(standard[slot]);
        const SpanFillerInfo& f = info_of(SpanTable[slot]);
        SCOPED_TRACE(s.name);
        EXPECT_EQ(s.filter, Filter::Nearest);
        EXPECT_EQ(f.op, s.op);
        EXPECT_EQ(f.depth, s.depth);
        EXPECT_EQ(f.uv, s.uv);
        EXPECT_EQ(f.texel, s.texel);
        const bool filterable = s.texel == Texel::Rgb565 || s.texel == Texel::Rgba4444;
        EXPECT_EQ(f.filter, filterable ? Filter::FourTap : Filter::Nearest);
        changed += f.fn != s.fn ? 1 : 0;
    }
    EXPECT_EQ(changed, 30);
}

// Any set other than 1 is the standard set.
TEST_F(SpanTableTest, OnlySetOneIsFiltered) {
    build_span_table(2);
    EXPECT_EQ(SpanTable[SPAN_TEX], span_tex);
    build_span_table(-1);
    EXPECT_EQ(SpanTable[SPAN_TEXADD_ZP], span_texadd_zp);
}

} // namespace
} // namespace vrx::test
