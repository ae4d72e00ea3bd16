// Fixed-point arithmetic: the multiply convention, the normalisation step, reciprocals, division,
// square roots, sine and cosine, rounding and the constant tables. Expected values are worked out
// by hand from the algorithms (the steps are noted where they are not obvious).
#include <gtest/gtest.h>

#include <cmath>
#include <cstddef>
#include <cstdint>

#include "engine/fixed.h"
#include "lite_vrx.h"

namespace {

using namespace vrx::engine;

struct Unary {
    int32_t x;
    int32_t want;
};

struct Binary {
    int32_t a, b;
    int32_t want;
};

TEST(FixedMul, TruncatesTheSigned64BitProduct) {
    const Binary cases[] = {
        {0x10000, 0x10000, 0x10000},
        {0x18000, 0x18000, 0x24000},   // 1.5 * 1.5 = 2.25
        {-0x18000, 0x18000, -0x24000}, // exact, so no rounding question
        {-1, 1, -1},                   // arithmetic shift floors; truncation toward 0 gives 0
        {-3, 0x8000, -2},              // -1.5 raw floors to -2
        {0x10000000, 0x100, 0x100000}, // needs the 64-bit product (2^36 before the shift)
        {0x7FFFFFFF, 0x20000, -2},     // 2^32 - 2 keeps its low 32 bits: wraps
        {0x40000000, 0x40000000, 0},   // 2^44: low 32 bits are zero
    };
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

TEST(FixedInverse, Values) {
    const Unary cases[] = {
        {0, 0x7FFFFFFF},
        {0x10000, 0x10000},
        {-0x10000, -0x10000},
        {0x30000, 21845}, // seed 0x5555555 >> 10 >> 2 = 21845, a fixed point of the step
        {-0x30000, -21845},
        {0x20000, 0x8000},
        {0x7F0000, 516}, // seed 546, then 514, then 516
        // Below 8 the seed shift wraps: 0x20000 << 14 is 0x80000000, and the steps give
        // 0x40000000 and then 1342177280 (the true value is 1431655765).
        {3, 1342177280},
        {-3, -1342177280},
        // Magnitudes 1 and 2 saturate (their reciprocals do not fit).
        {1, 0x7FFFFFFF},
        {2, 0x7FFFFFFF},
        {-1, -0x7FFFFFFF},
        {-2, -0x7FFFFFFF},
        // The magnitude of INT32_MIN is 2^31, whose reciprocal is 2 raw units.
        {INT32_MIN, -2},
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_Inverse(c.x), c.want) << c.x;
    static_assert(Inverse(0x30000) == 21845);
}

TEST(FixedInverse, PowersOfTwoFrom4To2Pow30AreExact) {
    for (int shift = 2; shift <= 30; ++shift) {
        const int32_t x = int32_t{1} << shift;
        const int32_t want = static_cast<int32_t>((int64_t{1} << 32) >> shift);
        EXPECT_EQ(EGL_Inverse(x), want) << "2^" << shift;
        EXPECT_EQ(EGL_Inverse(-x), -want) << "-2^" << shift;
    }
}

TEST(FixedInverse, RelativeErrorBelowFourTenthsOfAPercentFrom16To2Pow24) {
    for (int64_t x = 16; x <= (int64_t{1} << 24); x = x * 9 / 8 + 1) {
        const double want = 4294967296.0 / static_cast<double>(x);
        const double got = EGL_Inverse(static_cast<int32_t>(x));
        EXPECT_LT(std::fabs(got - want) / want, 0.004) << x;
    }
}

TEST(FixedHInverse, Values) {
    const Unary cases[] = {
        {0, 0x7FFFFFFF},
        {0x10000, 0x1000000},
        {-0x10000, -0x1000000},
        {0x8001, 33553408},
        {0x20000, 0x800000},
        // 1/3: seed 0x1555555, t = 67108865, y = 89478485; t = 67108865, y = 357913945; >> 6.
        {0x30000, 5592405},
        {-0x30000, -5592405},
        // Magnitudes up to 0x8000: the truncated quotient 2^40 / |x|, saturated.
        {0x8000, 0x2000000},
        {-0x8000, -0x2000000},
        {513, 2143297520},
        {512, 0x7FFFFFFF},
        {1, 0x7FFFFFFF},
        {-1, -0x7FFFFFFF},
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_hInverse(c.x), c.want) << c.x;
}

TEST(FixedDiv, Values) {
    const Binary cases[] = {
        {0x30000, 0x20000, 0x18000},
        {-0x30000, 0x20000, -0x18000},
        {0x10000, 0x3000000, 85},   // pre-shifted: F_MUL(0x100, EGL_Inverse(0x30000) = 21845)
        {0x10000, -0x3000000, -86}, // F_MUL(0x100, -21845) floors
        // Pre-shifted: F_MUL(0x7F0000, EGL_Inverse(0x7F0000) = 516) = 127 * 516. Without the
        // pre-shift it would be F_MUL(2, 0x7F000000) = 65024.
        {0x7F000000, 0x7F000000, 65532},
        {0x10000, -0x1000000, -256}, // b >> 24 is -1: not pre-shifted
        {0x10000, 0, 0x7FFFFFFF},    // zero divisor: a times 0x7FFFFFFF
        {2, 0, 65535},
        {0, 0, 0},
    };
    for (const Binary& c : cases) EXPECT_EQ(EGL_Div(c.a, c.b), c.want) << c.a << " / " << c.b;
}

TEST(FixedInvSqrt, Values) {
    const Unary cases[] = {
        {0, 0x7FFFFFFF},
        {0x10000, 0x10000},
        {0x20000, 46341},
        // 4.0: seed 92680 >> 1, times 46340 -> 32766; steps 32767, 32766, 32767.
        {0x40000, 32767},
        // 64.0: seed 92680 >> 3 = 11585, times 46340 -> 8191; steps 8190, 8191, 8190.
        {0x400000, 8190},
        // Negative arguments are refused like zero.
        {-1, 0x7FFFFFFF},
        {-0x10000, 0x7FFFFFFF},
        {INT32_MIN, 0x7FFFFFFF},
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_InvSqrt(c.x), c.want) << c.x;
}

TEST(FixedSqrt, Values) {
    const Unary cases[] = {
        {0x20000, 92682},
        {0x40000, 131074}, // EGL_Inverse(32767): seed 139810, then 130495, then 131074
        {0x10000, 0x10000},
        {0, 0},
        {-5, 0},
        {INT32_MIN, 0},
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_Sqrt(c.x), c.want) << c.x;
}

TEST(FixedSqrt, RelativeErrorBelowSixTenthsOfAPercent) {
    for (int64_t x = 1; x <= INT32_MAX; x = x * 5 / 4 + 1) {
        const double want = std::sqrt(static_cast<double>(x) * 65536.0);
        const double got = EGL_Sqrt(static_cast<int32_t>(x));
        EXPECT_LT(std::fabs(got - want) / want, 0.006) << x;
    }
}

TEST(FixedSin, Values) {
    const Unary cases[] = {
        {0, 0},
        {102943, 65534},   // pi/2
        {34314, 32767},    // pi/6: phase 341, sin(341 pi / 2046) = 0.5 exactly
        {-102943, -65534}, // reduced to 308832; phase -1025: mirror of entry 1023, negated
        {-34314, -32767},  // reduced to 377461; phase -342: entry 1023 - 682 = 341, negated
        {205887, 0},       // pi: phase 2047
        {-411775, 0},      // exactly one turn back: reduced to 0
        {-411776, 0},      // reduced by two turns to 411774; phase -1
        {INT32_MAX, 0},    // not reduced: the product wraps to -10430, phase -1
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_Sin(c.x), c.want) << c.x;
}

TEST(FixedSin, PhaseWrapsForPositiveAnglesAndNegativesAreReduced) {
    // Ten turns past pi/6: the 32-bit product wraps to 356354560, phase 339 (not 341).
    EXPECT_EQ(EGL_Sin(10 * 411775 + 34314), SinTable[339]);
    EXPECT_NE(SinTable[339], SinTable[341]);
    // INT32_MIN: 5216 turns are added (334752); phase -767 mirrors entry 257, negated.
    EXPECT_EQ(EGL_Sin(INT32_MIN), -SinTable[766]);
}

TEST(FixedCos, Values) {
    const Unary cases[] = {
        {0, 65534},       // phase 0x400: mirrored entry 1023
        {102943, 0},      // pi/2: phase 2047
        {205887, -65534}, // pi: phase 3071
        {-102943, 0},     // phase -1
        {-411776, 65534}, // phase 1023
        {INT32_MAX, 65534},
        {34320, 56754}, // 30 degrees: phase 1365, mirror of entry 341 = entry 682
    };
    for (const Unary& c : cases) EXPECT_EQ(EGL_Cos(c.x), c.want) << c.x;
}

TEST(FixedSinCos, StayWithinTheTableRangeAndOnTheUnitCircle) {
    for (int32_t a = -3 * 411775; a < 3 * 411775; a += 997) {
        const int32_t s = EGL_Sin(a), c = EGL_Cos(a);
        ASSERT_LE(std::abs(s), 65534) << a;
        ASSERT_LE(std::abs(c), 65534) << a;
        const double r = std::hypot(s / 65536.0, c / 65536.0);
        ASSERT_NEAR(r, 1.0, 0.002) << a;
        const double want = std::sin(a / 65536.0);
        ASSERT_NEAR(s / 65536.0, want, 0.0025) << a;
    }
}

TEST(FixedDegToRad, Values) {
    const Unary cases[] = {
        {0x5A0000, 102960}, // 90 degrees: 90 * 1144
        {-0x5A0000, -102960},
        {0xB40000, 205920}, // 180 degrees
        {1, 0},
        {-1, -1},              // -1144 >> 16 floors
        {INT32_MAX, 37486591}, // needs the 64-bit product
    };
    for (const Unary& c : cases) EXPECT_EQ(deg_to_rad(c.x), c.want) << c.x;
}

TEST(FixedRound, IRnd) {
    const Unary cases[] = {
        {0x18000, 2},   {0x17FFF, 1}, {-0x8000, 0},        {-0x8001, -1}, {-0x18000, -1},
        {-0x18001, -2}, {0, 0},       {INT32_MAX, -32768}, // the sum wraps in 32 bits
    };
    for (const Unary& c : cases) EXPECT_EQ(I_RND(c.x), c.want) << c.x;
}

TEST(FixedMinMax, CompareSigned) {
    const Binary mins[] = {{-1, 1, -1}, {INT32_MIN, INT32_MAX, INT32_MIN}, {5, 5, 5}, {7, 3, 3}};
    for (const Binary& c : mins) {
        EXPECT_EQ(F_MIN(c.a, c.b), c.want);
        EXPECT_EQ(I_MIN(c.a, c.b), c.want);
        EXPECT_EQ(F_MIN(c.b, c.a), c.want);
    }
    const Binary maxs[] = {{-1, 1, 1}, {INT32_MIN, INT32_MAX, INT32_MAX}, {5, 5, 5}, {7, 3, 7}};
    for (const Binary& c : maxs) {
        EXPECT_EQ(F_MAX(c.a, c.b), c.want);
        EXPECT_EQ(I_MAX(c.a, c.b), c.want);
        EXPECT_EQ(F_MAX(c.b, c.a), c.want);
    }
}

TEST(FixedMinMax, Clamp) {
    EXPECT_EQ(f_clamp(5, 0, 3), 3);
    EXPECT_EQ(f_clamp(-1, 0, 3), 0);
    EXPECT_EQ(f_clamp(2, 0, 3), 2);
    EXPECT_EQ(f_clamp(-0x10000, -0x8000, 0x8000), -0x8000);
}

TEST(FixedTables, SinTableMatchesTheFormula) {
    const long double pi = 3.14159265358979323846264338327950288L;
    for (std::size_t k = 0; k < 1023; ++k) {
        const long double v = 65535.0L * std::sin(static_cast<long double>(k) * pi / 2046.0L);
        const long double f = std::floor(v);
        // The long double value is trustworthy only away from integers.
        if (k != 0) {
            ASSERT_GT(std::fmin(v - f, f + 1 - v), 1e-6L) << k;
        }
        EXPECT_EQ(SinTable[k], static_cast<uint16_t>(f)) << k;
    }
    EXPECT_EQ(SinTable[1], 100);
    EXPECT_EQ(SinTable[2], 201);
    EXPECT_EQ(SinTable[682], 56754); // sin(pi / 3)
    for (std::size_t k = 1020; k < 1024; ++k) EXPECT_EQ(SinTable[k], 65534) << k;
}

TEST(FixedTables, SeedsMatchTheirFormulas) {
    const int32_t inverse_hex[8] = {0x8000000, 0x71C71C7, 0x6666666, 0x5D1745D,
                                    0x5555555, 0x4EC4EC4, 0x4924924, 0x4444444};
    const uint16_t inv_sqrt_hex[8] = {0xB504, 0xAAAA, 0xA1E8, 0x9A5F,
                                      0x93CD, 0x8E00, 0x88D6, 0x8432};
    for (std::size_t k = 0; k < 8; ++k) {
        EXPECT_EQ(InverseSeed[k], inverse_hex[k]) << k;
        EXPECT_EQ(InvSqrtSeed[k], inv_sqrt_hex[k]) << k;
        const long double root = 131072.0L / std::sqrt(static_cast<long double>(8 + k));
        EXPECT_EQ(InvSqrtSeed[k], static_cast<uint16_t>(std::floor(root))) << k;
    }
}

TEST(FixedTables, RecipTableIsFilledOnce) {
    FillRecipTable();
    EXPECT_EQ(RecipTable[0], 0);
    EXPECT_EQ(RecipTable[1], 0x1000000);
    EXPECT_EQ(RecipTable[2], 0x800000);
    EXPECT_EQ(RecipTable[3], 5592405);
    EXPECT_EQ(RecipTable[7], 2396745);
    EXPECT_EQ(RecipTable[1280], 13107);
    // A second fill is skipped: a marked entry survives it.
    const int32_t saved = RecipTable[5];
    RecipTable[5] = -1;
    FillRecipTable();
    EXPECT_EQ(RecipTable[5], -1);
    RecipTable[5] = saved;
}

TEST(FixedExports, MatchTheInlineRoutines) {
    for (int64_t wide = INT32_MIN; wide <= INT32_MAX; wide += 0x00FEDCBA) {
        const int32_t x = static_cast<int32_t>(wide);
        EXPECT_EQ(EGL_Inverse(x), Inverse(x));
        EXPECT_EQ(EGL_hInverse(x), hInverse(x));
        EXPECT_EQ(EGL_InvSqrt(x), InvSqrt(x));
        EXPECT_EQ(EGL_Sqrt(x), Sqrt(x));
        EXPECT_EQ(EGL_Sin(x), Sin(x));
        EXPECT_EQ(EGL_Cos(x), Cos(x));
        EXPECT_EQ(EGL_Div(x, 0x12345), Div(x, 0x12345));
        EXPECT_EQ(I_RND(x), i_rnd(x));
    }
}

} // namespace
