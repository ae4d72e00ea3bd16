// Fixed-point arithmetic: the multiply convention, the normalisation step, reciprocals, division,
// square roots, sine and cosine, rounding and the constant tables. Expected values are worked out
// by hand from the algorithms (the steps are noted where they are not obvious).
#include <gtest/gtest.h>

#include <cmath>
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
    // 1.5 * 1.5; -1 and -1.5 raw floor (truncation toward 0 would give 0 and -1); 2^36 before
    // the shift needs the 64-bit product; 2^32 - 2 and 2^44 keep their low 32 bits.
    const Binary cases[] = {{0x10000, 0x10000, 0x10000},
                            {0x18000, 0x18000, 0x24000},
                            {-0x18000, 0x18000, -0x24000},
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
    const Case cases[] = {
        {0, 31, 0},       {1, 31, 0},         {2, 30, 0},          {3, 30, 0},
        {7, 29, 0},       {8, 28, 0},         {15, 28, 7},         {12, 28, 4},
        {0xFFFF, 16, 7},  {0x10000, 15, 0},   {0x1E000, 15, 7},    {0x30000, 14, 4},
        {0x7F0000, 9, 7}, {0x7FFFFFFF, 1, 7}, {0x80000000u, 0, 0}, {0x90000000u, 0, 1},
    };
    for (const Case& c : cases) {
        const NormStep ns = normalise(c.a);
        EXPECT_EQ(ns.n, c.n) << c.a;
        EXPECT_EQ(ns.k, c.k) << c.a;
        EXPECT_EQ(ns.s, c.n - 16) << c.a;
    }
}

TEST(FixedUnary, HandDerivedValues) {
    // 1/3: seed 0x5555555 >> 10 >> 2 = 21845, a fixed point of the step. 1/127: seed 546, then
    // 514, then 516. Below 8 the seed shift wraps: 0x20000 << 14 is 0x80000000, and the steps
    // give 0x40000000 and then 1342177280 (the true value is 1431655765). Magnitudes 1 and 2
    // saturate; the magnitude of INT32_MIN is 2^31, whose reciprocal is 2 raw units. Powers of
    // two from 4 to 2^30 are exact.
    const Unary inverse[] = {{0, 0x7FFFFFFF},   {0x10000, 0x10000}, {-0x10000, -0x10000},
                             {0x30000, 21845},  {-0x30000, -21845}, {0x20000, 0x8000},
                             {0x7F0000, 516},   {3, 1342177280},    {-3, -1342177280},
                             {1, 0x7FFFFFFF},   {2, 0x7FFFFFFF},    {-1, -0x7FFFFFFF},
                             {-2, -0x7FFFFFFF}, {INT32_MIN, -2},    {4, 0x40000000},
                             {-0x40000000, -4}, {0x400000, 0x400}};
    // 1/3: seed 0x1555555, t = 67108865, y = 89478485; t = 67108865, y = 357913945; >> 6.
    // Magnitudes up to 0x8000 give the truncated quotient 2^40 / |x|, saturated.
    const Unary h_inverse[] = {{0, 0x7FFFFFFF},      {0x10000, 0x1000000}, {-0x10000, -0x1000000},
                               {0x8001, 33553408},   {0x20000, 0x800000},  {0x30000, 5592405},
                               {-0x30000, -5592405}, {0x8000, 0x2000000},  {-0x8000, -0x2000000},
                               {513, 2143297520},    {512, 0x7FFFFFFF},    {1, 0x7FFFFFFF},
                               {-1, -0x7FFFFFFF}};
    // 4.0: seed 92680 >> 1, times 46340 -> 32766; steps 32767, 32766, 32767. 64.0: seed
    // 92680 >> 3 = 11585, times 46340 -> 8191; steps 8190, 8191, 8190. Negatives act as zero.
    const Unary inv_sqrt[] = {{0, 0x7FFFFFFF},        {0x10000, 0x10000},     {0x20000, 46341},
                              {0x40000, 32767},       {0x400000, 8190},       {-1, 0x7FFFFFFF},
                              {-0x10000, 0x7FFFFFFF}, {INT32_MIN, 0x7FFFFFFF}};
    // sqrt(4.0) is EGL_Inverse(32767): seed 139810, then 130495, then 131074.
    const Unary roots[] = {{0x20000, 92682}, {0x40000, 131074}, {0x10000, 0x10000},
                           {0, 0},           {-5, 0},           {INT32_MIN, 0}};
    // pi/2 = 102943 and pi/6 = 34314 (phase 341, sin(341 pi / 2046) = 0.5 exactly). -pi/2 is
    // reduced to 308832, phase -1025: the mirror of entry 1023, negated; -pi/6 to 377461, phase
    // -342: entry 1023 - 682 = 341, negated. pi: phase 2047. -411775 is one turn back (0);
    // -411776 is reduced by two turns to 411774, phase -1. INT32_MAX is not reduced: the product
    // wraps to -10430, phase -1. Ten turns past pi/6 (4152064) wrap the product to 356354560,
    // phase 339 (not 341); INT32_MIN gets 5216 turns added (334752), phase -767: entry 766,
    // negated.
    const Unary sines[] = {
        {0, 0},           {102943, 65534},  {34314, 32767},     {-102943, -65534},
        {-34314, -32767}, {205887, 0},      {-411775, 0},       {-411776, 0},
        {INT32_MAX, 0},   {4152064, 32593}, {INT32_MIN, -60498}};
    // Phase 0x400 reads the mirrored entry 1023; pi/2: 2047; pi: 3071; -pi/2: -1; -411776:
    // 1023; 30 degrees (34320): phase 1365, the mirror of entry 341 = entry 682.
    const Unary cosines[] = {{0, 65534},       {102943, 0},        {205887, -65534}, {-102943, 0},
                             {-411776, 65534}, {INT32_MAX, 65534}, {34320, 56754}};
    // 90 degrees: 90 * 1144; -1144 >> 16 floors to -1; INT32_MAX needs the 64-bit product.
    const Unary deg[] = {{0x5A0000, 102960}, {-0x5A0000, -102960}, {0xB40000, 205920}, {1, 0},
                         {-1, -1},           {INT32_MAX, 37486591}};
    // Halves round upward; INT32_MAX + 0.5 wraps in 32 bits.
    const Unary rnd[] = {{0x18000, 2},   {0x17FFF, 1},   {-0x8000, 0}, {-0x8001, -1},
                         {-0x18000, -1}, {-0x18001, -2}, {0, 0},       {INT32_MAX, -32768}};
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
    // A divisor of 256.0 or more is pre-shifted: F_MUL(0x100, EGL_Inverse(3.0) = 21845) = 85,
    // and -86 with a negative divisor (the product floors). 127.0 / 127.0 is F_MUL(127.0, 516)
    // = 65532 (without the pre-shift it would be 65024). For -256.0, b >> 24 is -1: not
    // pre-shifted. A zero divisor multiplies a by 0x7FFFFFFF.
    const Binary cases[] = {{0x30000, 0x20000, 0x18000},
                            {-0x30000, 0x20000, -0x18000},
                            {0x10000, 0x3000000, 85},
                            {0x10000, -0x3000000, -86},
                            {0x7F000000, 0x7F000000, 65532},
                            {0x10000, -0x1000000, -256},
                            {0x10000, 0, 0x7FFFFFFF},
                            {2, 0, 65535},
                            {0, 0, 0}};
    for (const Binary& c : cases) EXPECT_EQ(EGL_Div(c.a, c.b), c.want) << c.a << " / " << c.b;
}

TEST(FixedErrorBounds, InverseSqrtSinAndCos) {
    for (int64_t x = 16; x <= (int64_t{1} << 24); x = x * 9 / 8 + 1) {
        const double want = 4294967296.0 / static_cast<double>(x);
        EXPECT_LT(std::fabs(EGL_Inverse(static_cast<int32_t>(x)) - want) / want, 0.004) << x;
    }
    for (int64_t x = 1; x <= INT32_MAX; x = x * 5 / 4 + 1) {
        const double want = std::sqrt(static_cast<double>(x) * 65536.0);
        EXPECT_LT(std::fabs(EGL_Sqrt(static_cast<int32_t>(x)) - want) / want, 0.006) << x;
    }
    // Within the table range, on the unit circle and close to the true sine.
    for (int32_t a = -3 * 411775; a < 3 * 411775; a += 997) {
        const int32_t s = EGL_Sin(a), c = EGL_Cos(a);
        ASSERT_LE(std::abs(s), 65534) << a;
        ASSERT_LE(std::abs(c), 65534) << a;
        ASSERT_NEAR(std::hypot(s / 65536.0, c / 65536.0), 1.0, 0.002) << a;
        ASSERT_NEAR(s / 65536.0, std::sin(a / 65536.0), 0.0025) << a;
    }
}

TEST(FixedMinMax, CompareSignedAndClamp) {
    const int32_t pairs[][4] = {
        {-1, 1, -1, 1}, {INT32_MIN, INT32_MAX, INT32_MIN, INT32_MAX}, {5, 5, 5, 5}};
    for (const auto& c : pairs) {
        EXPECT_TRUE(F_MIN(c[0], c[1]) == c[2] && I_MIN(c[1], c[0]) == c[2]) << c[0];
        EXPECT_TRUE(F_MAX(c[1], c[0]) == c[3] && I_MAX(c[0], c[1]) == c[3]) << c[0];
    }
    // Value, low, high, result: below, at and above either end.
    const int32_t clamps[][4] = {{-1, 0, 3, 0}, {0, 0, 3, 0}, {2, 0, 3, 2},
                                 {3, 0, 3, 3},  {4, 0, 3, 3}, {-0x10000, -0x8000, 0x8000, -0x8000}};
    for (const auto& c : clamps) EXPECT_EQ(f_clamp(c[0], c[1], c[2]), c[3]) << c[0];
}

TEST(FixedTables, RecipTableIsFilledOnce) {
    FillRecipTable();
    const Unary entries[] = {{0, 0},       {1, 0x1000000}, {2, 0x800000},
                             {3, 5592405}, {7, 2396745},   {1280, 13107}};
    for (const Unary& e : entries) EXPECT_EQ(RecipTable[e.x], e.want) << e.x;
    // A second fill is skipped: a marked entry survives it.
    const int32_t saved = RecipTable[5];
    RecipTable[5] = -1;
    FillRecipTable();
    EXPECT_EQ(RecipTable[5], -1);
    RecipTable[5] = saved;
}

} // namespace
