// Vectors and coordinate systems: sums and products (where one 64-bit shift and per-product
// shifting differ), lengths and normalisation, the UCS transforms and their inverses, and the
// pair turns. Expected values are worked out by hand from the algorithms.
#include <gtest/gtest.h>

#include <algorithm>
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

// An orthonormal system at an odd angle, built by the engine's own turns.
UCS tilted() {
    UCS u{{fx(5), -fx(3), 0x20000}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
    VRX_RotateUCS(&u, 30, 45, 60);
    return u;
}

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
    // 1.0: EGL_InvSqrt's early return; 2.0: EGL_Inverse(EGL_InvSqrt(4.0) = 32767). 256.0:
    // s = 2^48 >= 2^47, q = s >> 26 = 64.0, EGL_InvSqrt gives 8190, EGL_Inverse(8190) = 524413,
    // times 32. 8192.0 is beyond 5792.6: q = s >> 36 = 64.0 again, times 1024. s = 1 raw: q = 0.
    const std::pair<VECTOR, FIXED> lengths[] = {
        {{0, 0, 0}, 0}, {{kOne, 0, 0}, kOne},           {{0, -fx(2), 0}, 131074},
        {{1, 0, 0}, 0}, {{fx(256), 0, 0}, 524413 * 32}, {{0, 0, fx(8192)}, 524413 * 1024}};
    for (const auto& [v, want] : lengths) EXPECT_EQ(Vlen(&v), want) << v.x << "," << v.z;
    // Each F_MUL(0xB5, 0xB5) is 0; summing the 64-bit squares first would give 1 raw unit.
    const VECTOR unit{kOne, 0, 0}, zero{0, 0, 0}, tiny{0xB5, 0xB5, 0xB5}, v34{fx(3), fx(4), 0};
    EXPECT_TRUE(invVlen(&unit) == kOne && invVlen(&zero) == 0x7FFFFFFF);
    EXPECT_EQ(invVlen(&tiny), 0x7FFFFFFF);
    EXPECT_NEAR(invVlen(&v34) / 65536.0, 0.2, 0.001);
}

TEST(Vector, NormalizePreScalesLongVectors) {
    // 16.0 has 11 leading zeros: shifted right once to 8.0, squared 64.0, EGL_InvSqrt 8190,
    // F_MUL(8190, 8.0) = 65520. INT32_MIN is shifted by 12 to -8.0; 8.0 is not pre-scaled. Long
    // vectors come out unit within 0.2 %.
    struct Case {
        VECTOR v, want;
        int32_t tol;
    };
    const Case cases[] = {{{-fx(16), 0, 0}, {-65520, 0, 0}, 0},
                          {{0, 0, INT32_MIN}, {0, 0, -65520}, 0},
                          {{0, fx(8), 0}, {0, 65520, 0}, 0},
                          {{0, 0, 0}, {0, 0, 0}, 0},
                          {{-fx(3000), 0, fx(4000)}, {-39322, 0, 52429}, 131},
                          {{0, 0, INT32_MAX}, {0, 0, kOne}, 131}};
    for (const Case& c : cases) {
        VECTOR v = c.v, w = c.v;
        vrxNormalize(&v);
        sim_normalize(&w);
        EXPECT_TRUE(Same(v, c.want, c.tol));
        EXPECT_TRUE(Same(w, v));
    }
}

TEST(Vector, TwoDimensional) {
    VECTOR2 a{fx(1), -fx(2)}, b{fx(3), fx(5)}, d{}, v{-3, fx(6)};
    V2mm(&a, &b, &d);
    V2pp(&a, &b, &b); // out is b
    V2xx(0x8000, &v);
    EXPECT_TRUE(d.x == -fx(2) && d.y == -fx(7) && b.x == fx(4) && b.y == fx(3));
    EXPECT_TRUE(v.x == -2 && v.y == fx(3));
    const VECTOR2 m{-1, -1}, p{1, 1}, c{fx(3), fx(4)};
    EXPECT_TRUE(V2dot(&m, &p) == -1 && V2dot(&c, &c) == fx(25)); // -2 >> 16 once
    // (0, -2.0): s = 4.0, EGL_InvSqrt 32767, times -2.0 is -65534. (0xB6, 0xB6): the squares
    // are summed before the one shift, so s = 66248 >> 16 = 1 raw unit (shifting each square
    // gives 0); EGL_InvSqrt(1) is 16785446, times 0xB6 is 46614.
    VECTOR2 two{0, -fx(2)}, tiny{0xB6, 0xB6};
    V2norm(&two);
    V2norm(&tiny);
    EXPECT_TRUE(two.x == 0 && two.y == -65534 && tiny.x == 46614 && tiny.y == 46614);
}

TEST(Ucs, GlobalComposesFramesAndPoints) {
    const UCS u = tilted();
    UCS out{};
    GlobalUCS(&u, &kIdentity, &out);
    EXPECT_TRUE(SameUcs(out, u));
    GlobalUCS(&kIdentity, &u, &out);
    EXPECT_TRUE(SameUcs(out, u));
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
    // The quarter turn: its transpose, origin -(21, -8, 33). Axes scaled by 2: cofactors 4.0,
    // determinant 8.0, r = 0x2000, axes 0.5. With origin (3, 0, 0) raw the sum is negated before
    // its one shift: -(3 * 0x8000) >> 16 = -2, where negating after the shift would give -1.
    // Singular: zero axes, parallel axes, and axes so tiny every cofactor shifts to 0.
    const UCS two{{0, 0, 0}, {fx(2), 0, 0}, {0, fx(2), 0}, {0, 0, fx(2)}};
    const UCS half{{0, 0, 0}, {0x8000, 0, 0}, {0, 0x8000, 0}, {0, 0, 0x8000}};
    struct Case {
        UCS u, want;
    };
    const Case cases[] = {{{{fx(8), fx(21), fx(33)}, kQuarter.x, kQuarter.y, kQuarter.z},
                           {{-fx(21), fx(8), -fx(33)}, {0, -kOne, 0}, {kOne, 0, 0}, {0, 0, kOne}}},
                          {{{fx(2), fx(4), fx(6)}, two.x, two.y, two.z},
                           {{-fx(1), -fx(2), -fx(3)}, half.x, half.y, half.z}},
                          {{{3, 0, 0}, two.x, two.y, two.z}, {{-2, 0, 0}, half.x, half.y, half.z}},
                          {{{fx(5), fx(6), fx(7)}, {0, 0, 0}, {0, 0, 0}, {0, 0, 0}}, kIdentity},
                          {{{0, 0, 0}, {kOne, 0, 0}, {fx(2), 0, 0}, {0, 0, kOne}}, kIdentity},
                          {{{0, 0, 0}, {1, 0, 0}, {0, 1, 0}, {0, 0, 1}}, kIdentity}};
    for (const Case& c : cases) {
        UCS out{{9, 9, 9}, {9, 9, 9}, {9, 9, 9}, {9, 9, 9}};
        EXPECT_EQ(ucs_invert(&c.u, &out), &c - cases >= 3 ? 1 : 0); // the last three are singular
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
    // The tilted frame's determinant is not exactly 1.0 and its EGL_Inverse carries a relative
    // error of a few 2^-16: unit-sized values come back within a few raw units, a point at 20.0
    // within the same relative error.
    const UCS u = tilted();
    const VECTOR q{-fx(20), fx(3), 0x4000};
    VECTOR g{};
    GlobalBase(&q, &u, &g);
    EXPECT_EQ(LocalBase(&g, &u, &g), 0); // out is the point
    EXPECT_TRUE(Same(g, q, 84));
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
    // X turns into Y, Y into -X: cos 0, sin 65534; whole turns are reduced either way. (X, Y)
    // first, then (Y, Z): Z' = -F_MUL(65534, -65534) = 65533 along X. 30: cos 56754, sin 32767.
    const Case cases[] = {
        {90, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {450, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {-270, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {0, 90, 0, {o, {kOne, 0, 0}, {0, 0, kS}, {0, -kS, 0}}},
        {0, 0, 90, {o, {0, 0, -kS}, {0, kOne, 0}, {kS, 0, 0}}},
        {90, 90, 0, {o, {0, kS, 0}, {0, 0, kS}, {65533, 0, 0}}},
        {30, 0, 0, {o, {56754, 32767, 0}, {-32767, 56754, 0}, {0, 0, kOne}}},
    };
    for (const Case& c : cases) {
        UCS u{o, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
        EXPECT_EQ(VRX_RotateUCS(&u, c.a1, c.a2, c.a3), 0);
        EXPECT_TRUE(SameUcs(u, c.want)) << c.a1 << " " << c.a2 << " " << c.a3;
    }
    // About the parent's axes: the (x, y), (y, z) and (z, x) pairs of every axis.
    void (*const about[3])(VECTOR*, VECTOR*, VECTOR*,
                           FIXED) = {ucs_rotate_about_z, ucs_rotate_about_x, ucs_rotate_about_y};
    const UCS parent[3] = {{{0, 0, 0}, {0, -kS, 0}, {kS, 0, 0}, {0, 0, kOne}},
                           {{0, 0, 0}, {kOne, 0, 0}, {0, 0, -kS}, {0, kS, 0}},
                           {{0, 0, 0}, {0, 0, kS}, {0, kOne, 0}, {-kS, 0, 0}}};
    for (int i = 0; i < 3; ++i) {
        UCS u = kIdentity;
        about[i](&u.x, &u.y, &u.z, 90 * kOne);
        EXPECT_TRUE(SameUcs(u, parent[i])) << i;
    }
}

TEST(Ucs, ReverseRotateRestoresTheAxes) {
    // Quarter turns come back within a few raw units (each turn shrinks the axes by the table's
    // 65534). Other angles only within about 0.3 %: the reverse turn by -a is reduced to 360 - a
    // whole degrees, and 360 degrees are 411840 raw radians, 65 more than a turn, so the sine and
    // cosine phases of the two turns do not mirror exactly.
    const int32_t cases[][4] = {{90, 90, 90, 12},     {180, -90, 270, 12},
                                {INT32_MIN, 0, 0, 8}, {-170, 95, 3, 300},
                                {0, 359, 0, 200},     {INT32_MIN, 1000, -7, 300}};
    for (const auto& c : cases) {
        const UCS start = tilted();
        UCS u = start;
        EXPECT_EQ(VRX_RotateUCS(&u, c[0], c[1], c[2]), 0);
        EXPECT_EQ(VRX_ReverseRotateUCS(&u, c[0], c[1], c[2]), 0);
        EXPECT_TRUE(SameUcs(u, start, c[3])) << c[0] << " " << c[1] << " " << c[2];
    }
}

TEST(Ucs, PairTurnArithmetic) {
    // -30 reduces to 330 degrees = 377520 raw radians (the exact mirror of 30 degrees would be
    // 377455): sine phase -341 reads entry 340 (32680) negated, cosine phase 683 (56805).
    // a.x = F_MUL(56805, 56754) + F_MUL(-32680, -32767) = 49192 + 16339,
    // a.y = F_MUL(56805, 32767) + F_MUL(-32680, 56754) = 28401 - 28301,
    // b.x = F_MUL(56805, -32767) - F_MUL(-32680, 56754) = -28402 + 28301,
    // b.y = F_MUL(56805, 56754) - F_MUL(-32680, 32767) = 49192 + 16340.
    VECTOR a{kOne, 0, 0}, b{0, kOne, 0};
    ucs_rotate_pair(&a, &b, 30);
    ucs_rotate_pair(&a, &b, -30);
    EXPECT_TRUE(Same(a, {65531, 100, 0}));
    EXPECT_TRUE(Same(b, {-101, 65532, 0}));
    // Each product is shifted by itself: F_MUL(56754, 1) + F_MUL(32767, 1) = 0 (one shift of
    // the sum would give 1); with -1 raw, -1 + -1 and -1 - (-1).
    VECTOR p{1, 0, -1}, q{1, 0, -1};
    ucs_rotate_pair(&p, &q, 30);
    EXPECT_TRUE(Same(p, {0, 0, -2}));
    EXPECT_TRUE(Same(q, {0, 0, 0}));
    // 3630 whole degrees reduce to 30. As FIXED degrees the radian angle 4152720 is not
    // reduced: the 32-bit phase product wraps to 363196640, sine phase 346 (33202).
    VECTOR c{kOne, 0, 0}, d{0, kOne, 0}, e{kOne, 0, 0}, f{0, kOne, 0};
    ucs_rotate_pair(&c, &d, 3630);
    ucs_rotate_pair_f(&e, &f, 3630 * kOne);
    EXPECT_TRUE(Same(c, {56754, 32767, 0}));
    EXPECT_TRUE(e.y == 33202 && f.x == -33202);
}

} // namespace
