// Vectors and coordinate systems: sums, products, lengths, normalisation, the UCS transforms,
// inverses and turns, against values worked out by hand from the algorithms.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>

#include "engine/fixed.h"
#include "engine/vector.h"
#include "lite_vrx.h"

namespace {

using namespace vrx::engine;

constexpr FIXED kOne = 0x10000;
constexpr FIXED kS = 65534; // sine table maximum: the turns never reach 1.0

constexpr FIXED fx(int32_t whole) {
    return whole * kOne;
}

// n vectors against n vectors, each component within tol.
::testing::AssertionResult Near(const VECTOR* got, const VECTOR* want, int n, int32_t tol) {
    for (int i = 0; i < n; ++i) {
        const VECTOR &g = got[i], &w = want[i];
        if (std::abs(int64_t{g.x} - w.x) > tol || std::abs(int64_t{g.y} - w.y) > tol ||
            std::abs(int64_t{g.z} - w.z) > tol)
            return ::testing::AssertionFailure()
                   << "row " << i << ": got (" << g.x << ", " << g.y << ", " << g.z << "), want ("
                   << w.x << ", " << w.y << ", " << w.z << ") within " << tol;
    }
    return ::testing::AssertionSuccess();
}
::testing::AssertionResult Same(const VECTOR& got, const VECTOR& want, int32_t tol = 0) {
    return Near(&got, &want, 1, tol);
}
// Rows origin, X, Y, Z.
::testing::AssertionResult SameUcs(const UCS& got, const UCS& want, int32_t tol = 0) {
    const VECTOR g[4] = {got.origin, got.x, got.y, got.z},
                 w[] = {want.origin, want.x, want.y, want.z};
    return Near(g, w, 4, tol);
}

constexpr UCS kIdentity{{0, 0, 0}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
// A quarter turn about Z, placed at (10, 20, 30): X points along the parent's Y, Y along -X.
constexpr UCS kQuarter{{fx(10), fx(20), fx(30)}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}};

TEST(Vector, SumsWrapProductsShiftAsTheEngineDoes) {
    VECTOR a{INT32_MAX, INT32_MIN, fx(2)}, b{1, -1, fx(3)}, out{};
    Vpp(&a, &b, &out);
    EXPECT_TRUE(Same(out, {INT32_MIN, INT32_MAX, fx(5)}));
    Vmm(&a, &b, &b); // out is an operand
    EXPECT_TRUE(Same(b, {INT32_MAX - 1, INT32_MIN + 1, -fx(1)}));
    // Scaling floors each product: -1.5 raw becomes -2.
    VECTOR v{-3, fx(3), 3};
    Vxx(0x8000, &v);
    EXPECT_TRUE(Same(v, {-2, 0x18000, 1}));
    // One shift of the 64-bit sum: 3 * 0.5 raw is 1 and -2 >> 16 is -1, where shifting each
    // product would give 0 and -2; 3 * 2^62 needs the unsigned 64-bit accumulation.
    const VECTOR d[][2] = {{{fx(1), fx(2), fx(3)}, {fx(4), fx(5), fx(6)}},
                           {{1, 1, 1}, {0x8000, 0x8000, 0x8000}},
                           {{-1, -1, 0}, {1, 1, 0}},
                           {{INT32_MIN, INT32_MIN, INT32_MIN}, {INT32_MIN, INT32_MIN, INT32_MIN}}};
    const FIXED dots[] = {fx(32), 1, -1, 0};
    for (int i = 0; i < 4; ++i) EXPECT_EQ(Vdot(&d[i][0], &d[i][1]), dots[i]) << i;
    // Cross: (1 * 0x4000 - 1 * 0xC000) >> 16 = -1; shifting each product first gives 0 - 0.
    const VECTOR p{0, 1, 1}, q{0, 0xC000, 0x4000};
    Vcross(&d[0][0], &d[0][1], &out);
    EXPECT_TRUE(Same(out, {-fx(3), fx(6), -fx(3)}));
    Vcross(&p, &q, &out);
    EXPECT_TRUE(Same(out, {-1, 0, 0}));
}

TEST(Vector, LengthInScaledRangesAndInverseLengthIn32Bits) {
    // 2.0: EGL_Inverse(32767). 256.0: s = 2^48, q = s >> 26 = 64.0, EGL_Inverse(8190) = 524413,
    // times 32; 8192.0: q = s >> 36 = 64.0 again, times 1024. s = 1 raw: q = 0.
    const std::pair<VECTOR, FIXED> lengths[] = {
        {{0, 0, 0}, 0}, {{kOne, 0, 0}, kOne},           {{0, -fx(2), 0}, 131074},
        {{1, 0, 0}, 0}, {{fx(256), 0, 0}, 524413 * 32}, {{0, 0, fx(8192)}, 524413 * 1024}};
    for (const auto& [v, want] : lengths) EXPECT_EQ(Vlen(&v), want) << v.x << "," << v.z;
    // Each F_MUL(0xB5, 0xB5) is 0; summing the 64-bit squares first would give 1 raw unit.
    const VECTOR unit{kOne, 0, 0}, zero{0, 0, 0}, tiny{0xB5, 0xB5, 0xB5};
    EXPECT_TRUE(invVlen(&unit) == kOne && invVlen(&zero) == 0x7FFFFFFF);
    EXPECT_EQ(invVlen(&tiny), 0x7FFFFFFF);
}

TEST(Vector, NormalizePreScalesLongVectors) {
    // 16.0 (11 leading zeros) is halved to 8.0: EGL_InvSqrt(64.0) = 8190, times 8.0 is 65520.
    // INT32_MIN is shifted by 12 to -8.0; 8.0 is not pre-scaled; long vectors unit within 0.2 %.
    struct Case {
        VECTOR v, want;
        int32_t tol;
    };
    const Case cases[] = {{{-fx(16), 0, 0}, {-65520, 0, 0}, 0},
                          {{0, 0, INT32_MIN}, {0, 0, -65520}, 0},
                          {{0, fx(8), 0}, {0, 65520, 0}, 0},
                          {{0, 0, 0}, {0, 0, 0}, 0},
                          {{-fx(3000), 0, fx(4000)}, {-39322, 0, 52429}, 131}};
    for (const Case& c : cases) {
        VECTOR v = c.v, w = c.v;
        vrxNormalize(&v);
        sim_normalize(&w);
        EXPECT_TRUE(Same(v, c.want, c.tol));
        EXPECT_TRUE(Same(w, v));
    }
}

TEST(Vector, TwoDimensional) {
    // The squares of 0xB6 are summed before the one shift: s = 1 raw (0 per square);
    // EGL_InvSqrt(1) = 16785446, times 0xB6 is 46614. Dot: -2 >> 16 once.
    VECTOR2 a{fx(1), -fx(2)}, b{fx(3), fx(5)}, t{0xB6, 0xB6};
    const VECTOR2 m{-1, -1}, p{1, 1};
    V2pp(&a, &b, &b); // out is b: (4, 3)
    V2mm(&a, &b, &a); // (-3, -5)
    V2xx(0x8000, &a);
    V2norm(&t);
    EXPECT_TRUE(b.x == fx(4) && b.y == fx(3) && a.x == -0x18000 && a.y == -0x28000);
    EXPECT_TRUE(t.x == 46614 && t.y == 46614 && V2dot(&m, &p) == -1);
}

TEST(Ucs, GlobalComposesFramesAndPoints) {
    UCS out{};
    // origin = (10, 20, 30) + 1 * (0, 1, 0) + 2 * (-1, 0, 0) + 3 * (0, 0, 1) = (8, 21, 33).
    UCS local{{fx(1), fx(2), fx(3)}, {kOne, 0, 0}, {0, 0, kOne}, {0, -kOne, 0}};
    GlobalUCS(&local, &kQuarter, &local); // out is the local system
    EXPECT_TRUE(
        SameUcs(local, {{fx(8), fx(21), fx(33)}, {0, kOne, 0}, {0, 0, kOne}, {kOne, 0, 0}}));
    // Parent X and Y are (0.5, 0, 0): a row (1, 1, 0) raw gives (0x8000 + 0x8000) >> 16 = 1,
    // where shifting each product would give 0; the parent origin is added after the shift.
    const UCS parent{{1, 0, 0}, {0x8000, 0, 0}, {0x8000, 0, 0}, {0, 0, kOne}};
    const UCS ones{{1, 1, 0}, {1, 1, 0}, {0, 0, 0}, {0, 0, 0}};
    GlobalUCS(&ones, &parent, &out);
    EXPECT_TRUE(SameUcs(out, {{2, 0, 0}, {1, 0, 0}, {0, 0, 0}, {0, 0, 0}}));
    VECTOR p{-fx(4), 0, 0x8000}, d = p;
    GlobalBase(&p, &kQuarter, &p); // out is the point
    GlobalDir(&d, &kQuarter, &d);
    EXPECT_TRUE(Same(p, {fx(10), fx(16), 0x1E8000}));
    EXPECT_TRUE(Same(d, {0, -fx(4), 0x8000}));
}

TEST(Ucs, InvertIsAGeneralInverseAndRefusesSingularFrames) {
    // The quarter turn: its transpose. Axes 2.0: determinant 8.0, axes 0.5; origin 3 raw is
    // negated before the one shift: -(3 * 0x8000) >> 16 = -2, not -1. Then three singular frames.
    const UCS two{{0, 0, 0}, {fx(2), 0, 0}, {0, fx(2), 0}, {0, 0, fx(2)}};
    const UCS half{{0, 0, 0}, {0x8000, 0, 0}, {0, 0x8000, 0}, {0, 0, 0x8000}};
    struct Case {
        UCS u, want;
    };
    const Case cases[] = {{{{fx(8), fx(21), fx(33)}, kQuarter.x, kQuarter.y, kQuarter.z},
                           {{-fx(21), fx(8), -fx(33)}, {0, -kOne, 0}, {kOne, 0, 0}, {0, 0, kOne}}},
                          {{{3, 0, 0}, two.x, two.y, two.z}, {{-2, 0, 0}, half.x, half.y, half.z}},
                          {{{fx(5), fx(6), fx(7)}, {0, 0, 0}, {0, 0, 0}, {0, 0, 0}}, kIdentity},
                          {{{0, 0, 0}, {kOne, 0, 0}, {fx(2), 0, 0}, {0, 0, kOne}}, kIdentity},
                          {{{0, 0, 0}, {1, 0, 0}, {0, 1, 0}, {0, 0, 1}}, kIdentity}};
    for (const Case& c : cases) {
        UCS out{{9, 9, 9}, {9, 9, 9}, {9, 9, 9}, {9, 9, 9}};
        EXPECT_EQ(ucs_invert(&c.u, &out), &c - cases >= 2 ? 1 : 0); // the last three are singular
        EXPECT_TRUE(SameUcs(out, c.want));
    }
}

TEST(Ucs, LocalUndoesGlobalAndTakesSingularFramesAsIdentity) {
    const VECTOR p{fx(8), fx(21), fx(33)};
    const UCS singular{{fx(5), fx(6), fx(7)}, {0, 0, 0}, {0, 0, 0}, {0, 0, 0}};
    VECTOR out{};
    EXPECT_EQ(LocalBase(&p, &kQuarter, &out), 0);
    EXPECT_TRUE(Same(out, {fx(1), fx(2), fx(3)}));
    EXPECT_EQ(LocalDir(&p, &kQuarter, &out), 0);
    EXPECT_TRUE(Same(out, {fx(21), -fx(8), fx(33)}));
    EXPECT_EQ(LocalBase(&p, &singular, &out), 0);
    EXPECT_TRUE(Same(out, p));
    // A frame turned by odd angles has a determinant just off 1.0: back within a few raw units.
    UCS u{{fx(5), -fx(3), 0x20000}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
    VRX_RotateUCS(&u, 30, 45, 60);
    const UCS local{{0x8000, -kOne, 0x4000}, {0, kOne, 0}, {0, 0, kOne}, {kOne, 0, 0}};
    UCS a{};
    GlobalUCS(&local, &u, &a);
    EXPECT_EQ(LocalUCS(&a, &u, &a), 0); // out is A
    EXPECT_TRUE(SameUcs(a, local, 4));
    EXPECT_EQ(LocalUCS(&u, &singular, &a), 0);
    EXPECT_TRUE(SameUcs(a, u));
}

TEST(Ucs, RotateTurnsAboutOwnAxesInOrder) {
    const VECTOR o{fx(1), fx(2), fx(3)};
    struct Case {
        int32_t a1, a2, a3;
        UCS want;
    };
    // X turns into Y, Y into -X (sin 65534); 450 and -270 are reduced. (X, Y) first, then (Y, Z):
    // Z' = -F_MUL(65534, -65534) = 65533 along X. 30: cos 56754, sin 32767.
    const Case cases[] = {{90, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
                          {450, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
                          {-270, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
                          {0, 90, 0, {o, {kOne, 0, 0}, {0, 0, kS}, {0, -kS, 0}}},
                          {0, 0, 90, {o, {0, 0, -kS}, {0, kOne, 0}, {kS, 0, 0}}},
                          {90, 90, 0, {o, {0, kS, 0}, {0, 0, kS}, {65533, 0, 0}}},
                          {30, 0, 0, {o, {56754, 32767, 0}, {-32767, 56754, 0}, {0, 0, kOne}}}};
    for (const Case& c : cases) {
        UCS u{o, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
        EXPECT_EQ(VRX_RotateUCS(&u, c.a1, c.a2, c.a3), 0);
        EXPECT_TRUE(SameUcs(u, c.want)) << c.a1 << " " << c.a2 << " " << c.a3;
    }
    // About the parent's axes: the (x, y), (y, z) and (z, x) pairs of every axis.
    UCS z = kIdentity, x = kIdentity, y = kIdentity;
    ucs_rotate_about_z(&z.x, &z.y, &z.z, 90 * kOne);
    ucs_rotate_about_x(&x.x, &x.y, &x.z, 90 * kOne);
    ucs_rotate_about_y(&y.x, &y.y, &y.z, 90 * kOne);
    EXPECT_TRUE(SameUcs(z, {{0, 0, 0}, {0, -kS, 0}, {kS, 0, 0}, {0, 0, kOne}}));
    EXPECT_TRUE(SameUcs(x, {{0, 0, 0}, {kOne, 0, 0}, {0, 0, -kS}, {0, kS, 0}}));
    EXPECT_TRUE(SameUcs(y, {{0, 0, 0}, {0, 0, kS}, {0, kOne, 0}, {-kS, 0, 0}}));
}

TEST(Ucs, PairTurnArithmetic) {
    // The reverse of 30 turns by 330 degrees = 377520 raw radians (not the mirror, 377455): sin
    // -32680 (entry 340), cos 56805. X.x = F_MUL(56805, 56754) + F_MUL(-32680, -32767) = 49192 +
    // 16339, X.y = 28401 - 28301; Y.x = -28402 + 28301, Y.y = 49192 + 16340.
    UCS u = kIdentity;
    VRX_RotateUCS(&u, 30, 0, 0);
    EXPECT_EQ(VRX_ReverseRotateUCS(&u, 30, 0, 0), 0);
    EXPECT_TRUE(SameUcs(u, {{0, 0, 0}, {65531, 100, 0}, {-101, 65532, 0}, {0, 0, kOne}}));
    // Each product is shifted alone: F_MUL(56754, 1) + F_MUL(32767, 1) = 0, not 1; -1 + -1 for -1.
    VECTOR p{1, 0, -1}, q{1, 0, -1};
    ucs_rotate_pair(&p, &q, 30);
    EXPECT_TRUE(Same(p, {0, 0, -2}));
    EXPECT_TRUE(Same(q, {0, 0, 0}));
}

} // namespace
