// Fixed-point arithmetic: multiply, the normalisation step, reciprocals, division, roots, sine,
// cosine, rounding and the tables, against values worked out by hand from the algorithms.
#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <span>

#include "engine/fixed.h"
#include "lite_vrx.h"

namespace {

using namespace vrx::engine;

struct Unary {
    int32_t x, want;
};
struct Binary {
    int32_t a, b, want;
};

TEST(FixedMul, TruncatesTheSigned64BitProduct) {
    // -1 and -1.5 raw floor (truncation toward 0 would give 0 and -1); 2^36 before the shift
    // needs the 64-bit product; 2^32 - 2 and 2^44 keep their low 32 bits.
    const Binary cases[] = {{-0x18000, 0x18000, -0x24000},
                            {-1, 1, -1},
                            {-3, 0x8000, -2},
                            {0x10000000, 0x100, 0x100000},
                            {0x7FFFFFFF, 0x20000, -2},
                            {0x40000000, 0x40000000, 0}};
    for (const Binary& c : cases) {
        EXPECT_EQ(F_MUL(c.a, c.b), c.want) << c.a << " * " << c.b;
        EXPECT_EQ(f_mul(c.b, c.a), c.want) << c.b << " * " << c.a;
    }
}

TEST(FixedNormalise, CountsLeadingZerosAndPicksTheSeedBits) {
    struct Case {
        uint32_t a;
        int32_t n, k;
    };
    // Below 8 there are no seed bits; each step of the search, and both ends.
    const Case cases[] = {{0, 31, 0},          {7, 29, 0},         {8, 28, 0},
                          {15, 28, 7},         {0xFFFF, 16, 7},    {0x30000, 14, 4},
                          {0x80000000u, 0, 0}, {0x90000000u, 0, 1}};
    for (const Case& c : cases) {
        const NormStep ns = normalise(c.a);
        EXPECT_EQ(ns.n, c.n) << c.a;
        EXPECT_EQ(ns.k, c.k) << c.a;
    }
}

TEST(FixedUnary, HandDerivedValues) {
    // 1/3: seed 0x5555555 >> 12 = 21845, a fixed point; 1/127: seed 546, 514, 516. Below 8 the
    // seed shift wraps (0x20000 << 14); 1 and 2 saturate; |INT32_MIN| = 2^31 gives 2 raw.
    const Unary inverse[] = {{0, 0x7FFFFFFF},   {0x10000, 0x10000}, {-0x30000, -21845},
                             {0x7F0000, 516},   {3, 1342177280},    {2, 0x7FFFFFFF},
                             {-1, -0x7FFFFFFF}, {INT32_MIN, -2},    {4, 0x40000000},
                             {0x400000, 0x400}};
    // 1/3: t = 67108865, y = 89478485, then 357913945, >> 6. Up to 0x8000: 2^40 / |x| saturated.
    const Unary h_inverse[] = {{0, 0x7FFFFFFF},    {-0x10000, -0x1000000}, {0x8001, 33553408},
                               {0x30000, 5592405}, {0x8000, 0x2000000},    {513, 2143297520},
                               {512, 0x7FFFFFFF},  {-1, -0x7FFFFFFF}};
    // 4.0: seed 92680 >> 1, times 46340 -> 32766; steps 32767, 32766, 32767. Negatives act as 0.
    const Unary inv_sqrt[] = {{0, 0x7FFFFFFF},  {0x10000, 0x10000}, {0x20000, 46341},
                              {0x40000, 32767}, {0x400000, 8190},   {INT32_MIN, 0x7FFFFFFF}};
    // sqrt(4.0) is EGL_Inverse(32767): seed 139810, then 130495, then 131074.
    const Unary roots[] = {{0x20000, 92682}, {0x40000, 131074}, {0, 0}, {-5, 0}};
    // pi/2 = 102943, pi/6 = 34314 (entry 341). Negatives gain whole turns: -411775 is one turn,
    // -411776 is phase -1, INT32_MIN phase -767 (entry 766); INT32_MAX wraps to phase -1.
    const Unary sines[] = {{102943, 65534},  {34314, 32767}, {-102943, -65534},
                           {-34314, -32767}, {205887, 0},    {-411775, 0},
                           {-411776, 0},     {INT32_MAX, 0}, {INT32_MIN, -60498}};
    // A quarter turn ahead: 0 reads the mirrored entry 1023; 30 degrees (34320) entry 682.
    const Unary cosines[] = {
        {0, 65534}, {102943, 0}, {205887, -65534}, {-411776, 65534}, {34320, 56754}};
    // 90 * 1144; -1144 >> 16 floors to -1; INT32_MAX needs the 64-bit product.
    const Unary deg[] = {{0x5A0000, 102960}, {1, 0}, {-1, -1}, {INT32_MAX, 37486591}};
    // Halves round upward; INT32_MAX + 0.5 wraps in 32 bits.
    const Unary rnd[] = {
        {0x18000, 2}, {0x17FFF, 1}, {-0x8000, 0}, {-0x8001, -1}, {INT32_MAX, -32768}};
    const struct {
        const char* name;
        int32_t (*fn)(int32_t);
        std::span<const Unary> cases;
    } fns[] = {{"EGL_Inverse", EGL_Inverse, inverse},
               {"EGL_hInverse", EGL_hInverse, h_inverse},
               {"EGL_InvSqrt", EGL_InvSqrt, inv_sqrt},
               {"EGL_Sqrt", EGL_Sqrt, roots},
               {"EGL_Sin", EGL_Sin, sines},
               {"EGL_Cos", EGL_Cos, cosines},
               {"deg_to_rad", deg_to_rad, deg},
               {"I_RND", I_RND, rnd}};
    for (const auto& f : fns) {
        for (const Unary& c : f.cases) EXPECT_EQ(f.fn(c.x), c.want) << f.name << "(" << c.x << ")";
    }
    static_assert(Inverse(0x30000) == 21845);
}

TEST(FixedDiv, HandDerivedValues) {
    // From 256.0 the divisor is pre-shifted: F_MUL(0x100, 21845) = 85, -86 negated (floored);
    // 127.0 / 127.0 = F_MUL(127.0, 516) (65024 unshifted). -256.0 is not; zero gives a *
    // 0x7FFFFFFF.
    const Binary cases[] = {{-0x30000, 0x20000, -0x18000},
                            {0x10000, 0x3000000, 85},
                            {0x10000, -0x3000000, -86},
                            {0x7F000000, 0x7F000000, 65532},
                            {0x10000, -0x1000000, -256},
                            {0x10000, 0, 0x7FFFFFFF},
                            {2, 0, 65535}};
    for (const Binary& c : cases) EXPECT_EQ(EGL_Div(c.a, c.b), c.want) << c.a << " / " << c.b;
}

TEST(FixedMinMax, CompareSignedAndClamp) {
    EXPECT_TRUE(F_MIN(-1, 1) == -1 && I_MIN(INT32_MAX, INT32_MIN) == INT32_MIN);
    EXPECT_TRUE(F_MAX(-1, 1) == 1 && I_MAX(INT32_MIN, INT32_MAX) == INT32_MAX);
    // Value, low, high, result: below, inside, above.
    const int32_t clamps[][4] = {
        {-1, 0, 3, 0}, {2, 0, 3, 2}, {4, 0, 3, 3}, {-0x10000, -0x8000, 0x8000, -0x8000}};
    for (const auto& c : clamps) EXPECT_EQ(f_clamp(c[0], c[1], c[2]), c[3]) << c[0];
}

TEST(FixedTables, RecipTableIsFilledOnce) {
    FillRecipTable();
    const Unary entries[] = {{0, 0}, {1, 0x1000000}, {3, 5592405}, {1280, 13107}};
    for (const Unary& e : entries) EXPECT_EQ(RecipTable[e.x], e.want) << e.x;
    // A second fill is skipped: a marked entry survives it.
    const int32_t saved = RecipTable[5];
    RecipTable[5] = -1;
    FillRecipTable();
    EXPECT_EQ(RecipTable[5], -1);
    RecipTable[5] = saved;
}

} // namespace
