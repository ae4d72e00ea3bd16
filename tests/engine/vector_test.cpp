// Vectors and coordinate systems: sums and products (where one 64-bit shift and per-product
// shifting differ), lengths and normalisation, the UCS transforms and their inverses, and the
// pair turns. Expected values are worked out by hand from the algorithms.
#include <gtest/gtest.h>

#include <cstdint>
#include <algorithm>
#include <cstdlib>

#include "engine/fixed.h"
#include "engine/vector.h"
#include "lite_vrx.h"

namespace {

constexpr FIXED kOne = 0x10000;
constexpr FIXED kS = 65534; // sine table maximum: the turns never reach 1.0

constexpr FIXED fx(int32_t whole) {
    return whole * kOne;
}

bool operator==(const VECTOR& a, const VECTOR& b) {
    return a.x == b.x && a.y == b.y && a.z == b.z;
}

::testing::AssertionResult Same(const VECTOR& got, const VECTOR& want) {
    if (got == want) return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure()
           << "got (" << got.x << ", " << got.y << ", " << got.z << "), want (" << want.x << ", "
           << want.y << ", " << want.z << ")";
}

::testing::AssertionResult Near(const VECTOR& got, const VECTOR& want, int32_t tol) {
    if (std::abs(got.x - want.x) <= tol && std::abs(got.y - want.y) <= tol &&
        std::abs(got.z - want.z) <= tol)
        return ::testing::AssertionSuccess();
    return ::testing::AssertionFailure()
           << "got (" << got.x << ", " << got.y << ", " << got.z << "), want (" << want.x << ", "
           << want.y << ", " << want.z << ") within " << tol;
}

::testing::AssertionResult SameUcs(const UCS& got, const UCS& want) {
    const VECTOR* g = &got.origin;
    const VECTOR* w = &want.origin;
    const char* names[4] = {"origin", "X", "Y", "Z"};
    for (int i = 0; i < 4; ++i) {
        auto r = Same(g[i], w[i]);
        if (!r) return r << " in " << names[i];
    }
    return ::testing::AssertionSuccess();
}

::testing::AssertionResult NearUcs(const UCS& got, const UCS& want, int32_t tol) {
    const VECTOR* g = &got.origin;
    const VECTOR* w = &want.origin;
    const char* names[4] = {"origin", "X", "Y", "Z"};
    for (int i = 0; i < 4; ++i) {
        auto r = Near(g[i], w[i], tol);
        if (!r) return r << " in " << names[i];
    }
    return ::testing::AssertionSuccess();
}

constexpr UCS kIdentity{{0, 0, 0}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};

// A quarter turn about Z, placed at (10, 20, 30): X points along the parent's Y, Y along -X.
constexpr UCS kQuarter{{fx(10), fx(20), fx(30)}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}};

// An orthonormal system at an odd angle, built by the engine's own turns.
UCS tilted() {
    UCS u = kIdentity;
    u.origin = VECTOR{fx(5), -fx(3), 0x20000};
    VRX_RotateUCS(&u, 30, 45, 60);
    return u;
}

// ---- Vectors -----------------------------------------------------------------------------------

TEST(VectorAddSub, PerComponentWithWrapAndAliasing) {
    struct Case {
        VECTOR a, b, sum, diff;
    };
    const Case cases[] = {
        {{1, 2, 3}, {10, 20, 30}, {11, 22, 33}, {-9, -18, -27}},
        {{-fx(1), 0, fx(2)}, {fx(1), -5, fx(3)}, {0, -5, fx(5)}, {-fx(2), 5, -fx(1)}},
        {{INT32_MAX, INT32_MIN, 0},
         {1, -1, 0},
         {INT32_MIN, INT32_MAX, 0},
         {INT32_MAX - 1, INT32_MIN + 1, 0}},
    };
    for (const Case& c : cases) {
        VECTOR out{};
        Vpp(&c.a, &c.b, &out);
        EXPECT_TRUE(Same(out, c.sum));
        Vmm(&c.a, &c.b, &out);
        EXPECT_TRUE(Same(out, c.diff));
        VECTOR a = c.a, b = c.b;
        Vpp(&a, &b, &a); // out is a
        EXPECT_TRUE(Same(a, c.sum));
        a = c.a;
        Vmm(&a, &b, &b); // out is b
        EXPECT_TRUE(Same(b, c.diff));
    }
}

TEST(VectorScale, FloorsEachProduct) {
    VECTOR v{0x20000, -0x20000, 3};
    Vxx(0x8000, &v);
    EXPECT_TRUE(Same(v, {0x10000, -0x10000, 1}));
    VECTOR w{-3, fx(3), -fx(100)};
    Vxx(0x8000, &w);
    EXPECT_TRUE(Same(w, {-2, 0x18000, -fx(50)}));
}

TEST(VectorDot, SumsIn64BitsAndShiftsOnce) {
    struct Case {
        VECTOR a, b;
        FIXED want;
    };
    const Case cases[] = {
        {{fx(1), fx(2), fx(3)}, {fx(4), fx(5), fx(6)}, fx(32)},
        {{fx(100), fx(100), fx(100)}, {fx(100), -fx(100), fx(50)}, fx(5000)},
        {{1, 1, 1}, {0x8000, 0x8000, 0x8000}, 1}, // 3 * 0.5 raw: per-product shifting gives 0
        {{-1, -1, 0}, {1, 1, 0}, -1},             // -2 >> 16: per-product shifting gives -2
        {{INT32_MIN, INT32_MIN, INT32_MIN}, {INT32_MIN, INT32_MIN, INT32_MIN}, 0}, // 3 * 2^62
    };
    for (const Case& c : cases) EXPECT_EQ(Vdot(&c.a, &c.b), c.want);
}

TEST(VectorCross, FormsEachDifferenceIn64Bits) {
    struct Case {
        VECTOR a, b, want;
    };
    const Case cases[] = {
        {{kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}},
        {{0, kOne, 0}, {0, 0, kOne}, {kOne, 0, 0}},
        {{0, 0, kOne}, {kOne, 0, 0}, {0, kOne, 0}},
        {{fx(1), fx(2), fx(3)}, {fx(4), fx(5), fx(6)}, {-fx(3), fx(6), -fx(3)}},
        // x: (1 * 0x4000 - 1 * 0xC000) >> 16 = -0x8000 >> 16 = -1; shifting each product first
        // gives 0 - 0 = 0.
        {{0, 1, 1}, {0, 0xC000, 0x4000}, {-1, 0, 0}},
    };
    for (const Case& c : cases) {
        VECTOR out{};
        Vcross(&c.a, &c.b, &out);
        EXPECT_TRUE(Same(out, c.want));
    }
}

TEST(VectorLength, Values) {
    struct Case {
        VECTOR v;
        FIXED want;
    };
    const Case cases[] = {
        {{0, 0, 0}, 0},
        {{kOne, 0, 0}, kOne},     // q = 1.0: EGL_InvSqrt's early return, then EGL_Inverse(1.0)
        {{0, -fx(2), 0}, 131074}, // q = 4.0: EGL_Inverse(EGL_InvSqrt(4.0) = 32767)
        // s = 2^48 is at least 2^47: q = s >> 26 = 64.0, EGL_InvSqrt gives 8190,
        // EGL_Inverse(8190) = 524413, times 32.
        {{fx(256), 0, 0}, 524413 * 32},
        // Beyond length 5792.6: q = s >> 36 = 64.0 again, times 1024.
        {{0, 0, fx(8192)}, 524413 * 1024},
        {{1, 0, 0}, 0}, // s = 1: q = s >> 16 is 0
    };
    for (const Case& c : cases) EXPECT_EQ(Vlen(&c.v), c.want) << c.v.x << "," << c.v.y;
}

TEST(VectorLength, Approximate) {
    struct Case {
        VECTOR v;
        double want;
    };
    const Case cases[] = {
        {{fx(200), 0, 0}, 200.0},       {{fx(3), fx(4), 0}, 5.0},
        {{-fx(3), 0, -fx(4)}, 5.0},     {{fx(1000), fx(2000), -fx(2000)}, 3000.0},
        {{0x8000, 0x8000, 0}, 0.70711},
    };
    for (const Case& c : cases) EXPECT_NEAR(Vlen(&c.v) / 65536.0, c.want, c.want * 0.006);
}

TEST(VectorInvLength, SumsFmulProductsIn32Bits) {
    const VECTOR unit{kOne, 0, 0}, zero{0, 0, 0}, tiny{0xB5, 0xB5, 0xB5}, v34{fx(3), fx(4), 0};
    EXPECT_EQ(invVlen(&unit), kOne);
    EXPECT_EQ(invVlen(&zero), 0x7FFFFFFF);
    // Each F_MUL(0xB5, 0xB5) is 0; summing the 64-bit squares first would give 1 raw unit.
    EXPECT_EQ(invVlen(&tiny), 0x7FFFFFFF);
    EXPECT_NEAR(invVlen(&v34) / 65536.0, 0.2, 0.001);
}

TEST(VectorNormalize, Values) {
    struct Case {
        VECTOR v, want;
    };
    const Case cases[] = {
        // 16.0 has 11 leading zeros: shifted right once to 8.0, squared 64.0, EGL_InvSqrt 8190,
        // F_MUL(8190, 8.0) = 65520.
        {{fx(16), 0, 0}, {65520, 0, 0}},
        {{-fx(16), 0, 0}, {-65520, 0, 0}},
        // INT32_MIN: 0 leading zeros, shifted by 12 to -8.0.
        {{0, 0, INT32_MIN}, {0, 0, -65520}},
        // 8.0 is not pre-scaled and gives the same.
        {{0, fx(8), 0}, {0, 65520, 0}},
        {{0, 0, 0}, {0, 0, 0}},
    };
    for (const Case& c : cases) {
        VECTOR v = c.v;
        vrxNormalize(&v);
        EXPECT_TRUE(Same(v, c.want));
        v = c.v;
        sim_normalize(&v);
        EXPECT_TRUE(Same(v, c.want));
    }
}

TEST(VectorNormalize, LongVectorsArePreScaled) {
    struct Case {
        VECTOR v;
        double x, y, z;
    };
    const Case cases[] = {
        {{fx(1000), 0, 0}, 1.0, 0.0, 0.0},          {{fx(30), fx(40), 0}, 0.6, 0.8, 0.0},
        {{-fx(3000), 0, fx(4000)}, -0.6, 0.0, 0.8}, {{0, 0, INT32_MAX}, 0.0, 0.0, 1.0},
        {{fx(3), -fx(4), 0}, 0.6, -0.8, 0.0},
    };
    for (const Case& c : cases) {
        VECTOR v = c.v;
        vrxNormalize(&v);
        EXPECT_NEAR(v.x / 65536.0, c.x, 0.002);
        EXPECT_NEAR(v.y / 65536.0, c.y, 0.002);
        EXPECT_NEAR(v.z / 65536.0, c.z, 0.002);
    }
}

TEST(Vector2, AddSubScaleDot) {
    VECTOR2 a{fx(1), -fx(2)}, b{fx(3), fx(5)}, out{};
    V2pp(&a, &b, &out);
    EXPECT_EQ(out.x, fx(4));
    EXPECT_EQ(out.y, fx(3));
    V2mm(&a, &b, &out);
    EXPECT_EQ(out.x, -fx(2));
    EXPECT_EQ(out.y, -fx(7));
    V2pp(&a, &b, &b); // out is b
    EXPECT_EQ(b.x, fx(4));
    EXPECT_EQ(b.y, fx(3));
    VECTOR2 v{-3, fx(6)};
    V2xx(0x8000, &v);
    EXPECT_EQ(v.x, -2);
    EXPECT_EQ(v.y, fx(3));
    const VECTOR2 m{-1, -1}, p{1, 1}, c{fx(3), fx(4)};
    EXPECT_EQ(V2dot(&m, &p), -1); // -2 >> 16 once
    EXPECT_EQ(V2dot(&c, &c), fx(25));
}

TEST(Vector2, Norm) {
    VECTOR2 unit{kOne, 0};
    V2norm(&unit);
    EXPECT_EQ(unit.x, kOne);
    EXPECT_EQ(unit.y, 0);
    VECTOR2 two{0, -fx(2)}; // s = 4.0, EGL_InvSqrt 32767, F_MUL(32767, -2.0) = -65534
    V2norm(&two);
    EXPECT_EQ(two.x, 0);
    EXPECT_EQ(two.y, -65534);
    // (0xB6, 0xB6): the squares are summed before the one shift, so s = 66248 >> 16 = 1 raw
    // unit (shifting each square gives 0). EGL_InvSqrt(1) is 16785446; times 0xB6 is 46614.
    VECTOR2 tiny{0xB6, 0xB6};
    V2norm(&tiny);
    EXPECT_EQ(tiny.x, 46614);
    EXPECT_EQ(tiny.y, 46614);
}

TEST(VectorIdentity, WritesAllThreeComponents) {
    VECTOR v{7, 8, 9};
    IdentityX(&v);
    EXPECT_TRUE(Same(v, {kOne, 0, 0}));
    v = VECTOR{7, 8, 9};
    IdentityY(&v);
    EXPECT_TRUE(Same(v, {0, kOne, 0}));
    v = VECTOR{7, 8, 9};
    IdentityZ(&v);
    EXPECT_TRUE(Same(v, {0, 0, kOne}));
}

// ---- Coordinate systems ------------------------------------------------------------------------

TEST(UcsGlobal, IdentityOnEitherSideChangesNothing) {
    const UCS u = tilted();
    UCS out{};
    GlobalUCS(&u, &kIdentity, &out);
    EXPECT_TRUE(SameUcs(out, u));
    GlobalUCS(&kIdentity, &u, &out);
    EXPECT_TRUE(SameUcs(out, u));
}

TEST(UcsGlobal, QuarterTurnParent) {
    const UCS local{{fx(1), fx(2), fx(3)}, {kOne, 0, 0}, {0, 0, kOne}, {0, -kOne, 0}};
    // origin = (10, 20, 30) + 1 * (0, 1, 0) + 2 * (-1, 0, 0) + 3 * (0, 0, 1) = (8, 21, 33).
    const UCS want{{fx(8), fx(21), fx(33)}, {0, kOne, 0}, {0, 0, kOne}, {kOne, 0, 0}};
    UCS out{};
    GlobalUCS(&local, &kQuarter, &out);
    EXPECT_TRUE(SameUcs(out, want));
    UCS same = local;
    GlobalUCS(&same, &kQuarter, &same); // out is the local system
    EXPECT_TRUE(SameUcs(same, want));
}

TEST(UcsGlobal, EachComponentIsShiftedOnce) {
    // Parent X and Y are (0.5, 0, 0); a local X row of (1, 1, 0) raw gives (0x8000 + 0x8000)
    // >> 16 = 1, where shifting each product would give 0.
    const UCS parent{{1, 0, 0}, {0x8000, 0, 0}, {0x8000, 0, 0}, {0, 0, kOne}};
    const UCS local{{1, 1, 0}, {1, 1, 0}, {0, 0, 0}, {0, 0, 0}};
    UCS out{};
    GlobalUCS(&local, &parent, &out);
    EXPECT_TRUE(Same(out.x, {1, 0, 0}));
    EXPECT_TRUE(Same(out.origin, {2, 0, 0})); // parent origin added after the shift
}

TEST(UcsGlobal, BaseAndDir) {
    struct Case {
        VECTOR in, base, dir;
    };
    const Case cases[] = {
        {{fx(1), fx(2), fx(3)}, {fx(8), fx(21), fx(33)}, {-fx(2), fx(1), fx(3)}},
        {{0, 0, 0}, {fx(10), fx(20), fx(30)}, {0, 0, 0}},
        {{-fx(4), 0, 0x8000}, {fx(10), fx(16), 0x1E8000}, {0, -fx(4), 0x8000}},
    };
    for (const Case& c : cases) {
        VECTOR out{};
        GlobalBase(&c.in, &kQuarter, &out);
        EXPECT_TRUE(Same(out, c.base));
        GlobalDir(&c.in, &kQuarter, &out);
        EXPECT_TRUE(Same(out, c.dir));
        VECTOR p = c.in;
        GlobalBase(&p, &kQuarter, &p); // out is the point
        EXPECT_TRUE(Same(p, c.base));
        p = c.in;
        GlobalDir(&p, &kQuarter, &p);
        EXPECT_TRUE(Same(p, c.dir));
    }
}

TEST(UcsInvert, Values) {
    struct Case {
        UCS u;
        int32_t result;
        UCS want;
    };
    const Case cases[] = {
        {kIdentity, 0, kIdentity},
        {{{fx(1), fx(2), fx(3)}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}},
         0,
         {{-fx(1), -fx(2), -fx(3)}, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}}},
        // The quarter turn: its transpose; origin -(21, -8, 33).
        {{{fx(8), fx(21), fx(33)}, {0, kOne, 0}, {-kOne, 0, 0}, {0, 0, kOne}},
         0,
         {{-fx(21), fx(8), -fx(33)}, {0, -kOne, 0}, {kOne, 0, 0}, {0, 0, kOne}}},
        // Axes scaled by 2: cofactors 4.0, determinant 8.0, r = 0x2000, axes 0.5.
        {{{fx(2), fx(4), fx(6)}, {fx(2), 0, 0}, {0, fx(2), 0}, {0, 0, fx(2)}},
         0,
         {{-fx(1), -fx(2), -fx(3)}, {0x8000, 0, 0}, {0, 0x8000, 0}, {0, 0, 0x8000}}},
        // The origin sum is negated before its one shift: -(3 * 0x8000) >> 16 = -2, where
        // negating after the shift would give -1.
        {{{3, 0, 0}, {fx(2), 0, 0}, {0, fx(2), 0}, {0, 0, fx(2)}},
         0,
         {{-2, 0, 0}, {0x8000, 0, 0}, {0, 0x8000, 0}, {0, 0, 0x8000}}},
        // Singular systems: identity written, result 1.
        {{{fx(5), fx(6), fx(7)}, {0, 0, 0}, {0, 0, 0}, {0, 0, 0}}, 1, kIdentity},
        {{{0, 0, 0}, {kOne, 0, 0}, {fx(2), 0, 0}, {0, 0, kOne}}, 1, kIdentity},
        // Tiny axes: every cofactor shifts to 0, so the determinant is 0.
        {{{0, 0, 0}, {1, 0, 0}, {0, 1, 0}, {0, 0, 1}}, 1, kIdentity},
    };
    for (const Case& c : cases) {
        UCS out{{9, 9, 9}, {9, 9, 9}, {9, 9, 9}, {9, 9, 9}};
        EXPECT_EQ(ucs_invert(&c.u, &out), c.result);
        EXPECT_TRUE(SameUcs(out, c.want));
    }
}

TEST(UcsLocal, UndoesGlobalForAnOrthonormalFrame) {
    // The frame's axes come from table turns, so the determinant is not exactly 1.0 and its
    // EGL_Inverse carries a relative error of a few 2^-16: points of unit size come back within
    // a few raw units, larger ones within the same relative error.
    const UCS u = tilted();
    const VECTOR points[] = {{0x8000, -0xC000, 0x4000},
                             {0, 0, 0},
                             {kOne, kOne, -kOne},
                             {0x18000, -0x24000, fx(7)},
                             {-fx(20), fx(3), 0x4000}};
    for (const VECTOR& p : points) {
        const int32_t tol = 4 + std::max({std::abs(p.x), std::abs(p.y), std::abs(p.z)}) / 16384;
        VECTOR g{}, back{};
        GlobalBase(&p, &u, &g);
        EXPECT_EQ(LocalBase(&g, &u, &back), 0);
        EXPECT_TRUE(Near(back, p, tol));
        GlobalDir(&p, &u, &g);
        EXPECT_EQ(LocalDir(&g, &u, &g), 0); // out is the direction
        EXPECT_TRUE(Near(g, p, tol));
    }
    const UCS local{{0x8000, -kOne, 0x4000}, {0, kOne, 0}, {0, 0, kOne}, {kOne, 0, 0}};
    UCS g{};
    GlobalUCS(&local, &u, &g);
    EXPECT_EQ(LocalUCS(&g, &u, &g), 0); // out is A
    EXPECT_TRUE(NearUcs(g, local, 4));
}

TEST(UcsLocal, QuarterTurnFrameIsExact) {
    const VECTOR p{fx(8), fx(21), fx(33)};
    VECTOR out{};
    EXPECT_EQ(LocalBase(&p, &kQuarter, &out), 0);
    EXPECT_TRUE(Same(out, {fx(1), fx(2), fx(3)}));
    EXPECT_EQ(LocalDir(&p, &kQuarter, &out), 0);
    EXPECT_TRUE(Same(out, {fx(21), -fx(8), fx(33)}));
}

TEST(UcsLocal, SingularFrameActsAsIdentity) {
    const UCS singular{{fx(5), fx(6), fx(7)}, {0, 0, 0}, {0, 0, 0}, {0, 0, 0}};
    const VECTOR p{fx(1), fx(2), fx(3)};
    VECTOR out{};
    EXPECT_EQ(LocalBase(&p, &singular, &out), 0);
    EXPECT_TRUE(Same(out, p));
    EXPECT_EQ(LocalDir(&p, &singular, &out), 0);
    EXPECT_TRUE(Same(out, p));
    const UCS u = tilted();
    UCS o{};
    EXPECT_EQ(LocalUCS(&u, &singular, &o), 0);
    EXPECT_TRUE(SameUcs(o, u));
}

// ---- Rotations ---------------------------------------------------------------------------------

TEST(UcsRotate, QuarterTurnsAboutOwnAxes) {
    struct Case {
        int32_t a1, a2, a3;
        UCS want;
    };
    const VECTOR o{fx(1), fx(2), fx(3)};
    const Case cases[] = {
        // X turns into Y, Y into -X: cos 0, sin 65534.
        {90, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {450, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {-270, 0, 0, {o, {0, kS, 0}, {-kS, 0, 0}, {0, 0, kOne}}},
        {0, 90, 0, {o, {kOne, 0, 0}, {0, 0, kS}, {0, -kS, 0}}},
        {0, 0, 90, {o, {0, 0, -kS}, {0, kOne, 0}, {kS, 0, 0}}},
        // (X, Y) first, then (Y, Z): Z' = -F_MUL(65534, -65534) = 65533 along X.
        {90, 90, 0, {o, {0, kS, 0}, {0, 0, kS}, {65533, 0, 0}}},
        // 30 degrees: cos 56754, sin 32767.
        {30, 0, 0, {o, {56754, 32767, 0}, {-32767, 56754, 0}, {0, 0, kOne}}},
    };
    for (const Case& c : cases) {
        UCS u{o, {kOne, 0, 0}, {0, kOne, 0}, {0, 0, kOne}};
        EXPECT_EQ(VRX_RotateUCS(&u, c.a1, c.a2, c.a3), 0);
        EXPECT_TRUE(SameUcs(u, c.want)) << c.a1 << " " << c.a2 << " " << c.a3;
    }
}

TEST(UcsRotate, ReverseRestoresTheAxes) {
    // Quarter turns come back within a few raw units (each turn shrinks the axes by the table's
    // 65534). Other angles only within about 0.3 %: the reverse turn by -a is reduced to 360 - a
    // whole degrees, and 360 degrees are 411840 raw radians, 65 more than a turn, so the sine and
    // cosine phases of the two turns do not mirror exactly.
    struct Case {
        int32_t a1, a2, a3;
        int32_t tol;
    };
    const Case cases[] = {
        {90, 0, 0, 8},        {90, 90, 90, 12},  {180, -90, 270, 12},
        {INT32_MIN, 0, 0, 8}, {30, 45, 60, 200}, {-170, 95, 3, 300},
        {0, 359, 0, 200},     {1, 1, 1, 200},    {INT32_MIN, 1000, -7, 300},
    };
    for (const Case& c : cases) {
        const UCS start = tilted();
        UCS u = start;
        EXPECT_EQ(VRX_RotateUCS(&u, c.a1, c.a2, c.a3), 0);
        EXPECT_EQ(VRX_ReverseRotateUCS(&u, c.a1, c.a2, c.a3), 0);
        EXPECT_TRUE(NearUcs(u, start, c.tol)) << c.a1 << " " << c.a2 << " " << c.a3;
    }
}

TEST(UcsRotate, ReverseOfThirtyDegrees) {
    // -30 reduces to 330 degrees = 377520 raw radians (the exact mirror of 30 degrees would be
    // 377455). Its sine phase is -341: the mirror of entry 340, negated (-32680), where 30
    // degrees read entry 341 (32767); its cosine phase is 683 (56805) against 682 (56754).
    VECTOR a{kOne, 0, 0}, b{0, kOne, 0};
    vrx::engine::ucs_rotate_pair(&a, &b, 30);
    ASSERT_TRUE(Same(a, {56754, 32767, 0}));
    ASSERT_TRUE(Same(b, {-32767, 56754, 0}));
    vrx::engine::ucs_rotate_pair(&a, &b, -30);
    EXPECT_EQ(vrx::engine::SinTable[683], 56805);
    EXPECT_EQ(vrx::engine::SinTable[340], 32680);
    // a.x = F_MUL(56805, 56754) + F_MUL(-32680, -32767) = 49192 + 16339,
    // a.y = F_MUL(56805, 32767) + F_MUL(-32680, 56754) = 28401 - 28301,
    // b.x = F_MUL(56805, -32767) - F_MUL(-32680, 56754) = -28402 + 28301,
    // b.y = F_MUL(56805, 56754) - F_MUL(-32680, 32767) = 49192 + 16340.
    EXPECT_TRUE(Same(a, {65531, 100, 0}));
    EXPECT_TRUE(Same(b, {-101, 65532, 0}));
}

TEST(UcsRotate, PairTurnShiftsEachProduct) {
    // 30 degrees on (1, 0, 0) raw and (1, 0, 0) raw: F_MUL(56754, 1) + F_MUL(32767, 1) = 0,
    // where one shift of the 64-bit sum would give 1.
    VECTOR a{1, 0, 0}, b{1, 0, 0};
    vrx::engine::ucs_rotate_pair(&a, &b, 30);
    EXPECT_TRUE(Same(a, {0, 0, 0}));
    EXPECT_TRUE(Same(b, {0, 0, 0}));
    // -1 raw: F_MUL(56754, -1) + F_MUL(32767, -1) = -1 + -1.
    VECTOR c{-1, 0, 0}, d{-1, 0, 0};
    vrx::engine::ucs_rotate_pair(&c, &d, 30);
    EXPECT_TRUE(Same(c, {-2, 0, 0}));
    EXPECT_TRUE(Same(d, {0, 0, 0})); // -1 - (-1)
}

TEST(UcsRotate, WholeDegreesAreReducedFixedDegreesAreNot) {
    // 3630 whole degrees reduce to 30. As FIXED degrees the radian angle 4152720 is not
    // reduced: the 32-bit phase product wraps to 363196640, sine phase 346.
    VECTOR a{kOne, 0, 0}, b{0, kOne, 0};
    vrx::engine::ucs_rotate_pair(&a, &b, 3630);
    EXPECT_TRUE(Same(a, {56754, 32767, 0}));
    VECTOR c{kOne, 0, 0}, d{0, kOne, 0};
    vrx::engine::ucs_rotate_pair_f(&c, &d, 3630 * kOne);
    EXPECT_EQ(c.y, vrx::engine::SinTable[346]);
    EXPECT_EQ(d.x, -vrx::engine::SinTable[346]);
    // Within one turn the two agree.
    VECTOR e{kOne, 0, 0}, f{0, kOne, 0};
    vrx::engine::ucs_rotate_pair_f(&e, &f, 30 * kOne);
    EXPECT_TRUE(Same(e, a));
    EXPECT_TRUE(Same(f, b));
}

TEST(UcsRotate, AboutParentAxes) {
    using vrx::engine::ucs_rotate_about_x;
    using vrx::engine::ucs_rotate_about_y;
    using vrx::engine::ucs_rotate_about_z;
    struct Case {
        void (*turn)(VECTOR*, VECTOR*, VECTOR*, FIXED);
        UCS want;
    };
    const Case cases[] = {
        // (x, y) pairs: X = (1, 0, 0) -> (0, -s, 0); Y = (0, 1, 0) -> (s, 0, 0).
        {ucs_rotate_about_z, {{0, 0, 0}, {0, -kS, 0}, {kS, 0, 0}, {0, 0, kOne}}},
        // (y, z) pairs.
        {ucs_rotate_about_x, {{0, 0, 0}, {kOne, 0, 0}, {0, 0, -kS}, {0, kS, 0}}},
        // (z, x) pairs.
        {ucs_rotate_about_y, {{0, 0, 0}, {0, 0, kS}, {0, kOne, 0}, {-kS, 0, 0}}},
    };
    for (const Case& c : cases) {
        UCS u = kIdentity;
        c.turn(&u.x, &u.y, &u.z, 90 * kOne);
        EXPECT_TRUE(SameUcs(u, c.want));
    }
}

} // namespace
