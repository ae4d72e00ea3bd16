// Cameras: creation with its clip rules, the field-of-view update, every move with values
// worked out by hand from the engine's arithmetic (sine table, F_MUL truncation, Newton
// reciprocals), the frame rules of pan-to, the shooting vector in normal and doubled mode,
// names, the default camera, release, handle checks and allocation failure.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <functional>
#include <string>
#include <vector>

#include "engine/alloc.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "scene/camera.h"
#include "support/engine_fixture.h"

using vrx::engine::g_eng;
using vrx::scene::CAMERA;

// Compared and printed by the assertions, found by lookup in VECTOR's own (global) namespace.
static bool operator==(const VECTOR& a, const VECTOR& b) {
    return a.x == b.x && a.y == b.y && a.z == b.z;
}
static std::ostream& operator<<(std::ostream& os, const VECTOR& v) {
    return os << '(' << v.x << ", " << v.y << ", " << v.z << ')';
}

namespace {

constexpr FIXED E = 0x10000; // 1.0

double len(const VECTOR& v) {
    return std::sqrt(double(v.x) * v.x + double(v.y) * v.y + double(v.z) * v.z);
}

class CameraTest : public vrx::test::EngineTest {
  protected:
    CAMERA* make(VECTOR eye, VECTOR at, FIXED fov = 90 * E, FIXED near_clip = E,
                 FIXED far_clip = 100 * E) {
        CAMSETUP s{eye, at, fov, near_clip, far_clip};
        void* h = nullptr;
        EXPECT_EQ(VRX_NewCamera(&s, &h), 0);
        return static_cast<CAMERA*>(h);
    }
    // Eye at the origin looking along +Z at (0, 0, 10), with exact unit axes.
    CAMERA* make_exact(VECTOR eye = {0, 0, 0}, VECTOR at = {0, 0, 10 * E}) {
        CAMERA* c = make(eye, at);
        set_axes(c, {E, 0, 0}, {0, E, 0}, {0, 0, E});
        return c;
    }
    static void set_axes(CAMERA* c, VECTOR x, VECTOR y, VECTOR z) {
        c->ucs.x = x;
        c->ucs.y = y;
        c->ucs.z = z;
    }
    static CAMINFO info_of(void* c) {
        CAMINFO i{};
        EXPECT_EQ(VRX_GetCameraInfo(c, &i), 0);
        return i;
    }
    static bool same(const CAMINFO& a, const CAMINFO& b) {
        return std::memcmp(&a, &b, sizeof a) == 0;
    }
};

TEST_F(CameraTest, NewCameraBuildsItsFrameFromEyeAndTarget) {
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    ASSERT_NE(c, nullptr);
    EXPECT_EQ(c->id, 0x43414D45u); // 'CAME'
    EXPECT_EQ(c->name, nullptr);
    EXPECT_EQ(c->ckfr, nullptr);
    EXPECT_EQ(c->key_index, 0);
    // Z = (0, 0, 10.0) normalised: 1 / sqrt(100.0) is 6553 raw, times 10.0 gives 65530.
    // Y . Z is 0, so X = Y x Z and Y = Z x X, each normalised to one raw unit under 1.0.
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    EXPECT_EQ(c->ucs.x, (VECTOR{65535, 0, 0}));
    EXPECT_EQ(c->ucs.y, (VECTOR{0, 65535, 0}));
    EXPECT_EQ(c->ucs.origin, (VECTOR{0, 0, 0}));
    EXPECT_EQ(c->at, (VECTOR{0, 0, 10 * E}));
    void* def = reinterpret_cast<void*>(1);
    ASSERT_EQ(VRX_GetDefaultCam(&def), 0);
    EXPECT_EQ(def, nullptr); // a new camera does not become the default
    EXPECT_EQ(last_error(), "");
}

TEST_F(CameraTest, ClipsAreCheckedOnTheSetupAndNearIsRaisedToOne) {
    struct Case {
        FIXED near_clip, far_clip;
        bool ok;
        FIXED stored_near;
    };
    const Case cases[] = {
        {0x8000, 100 * E, true, E},   // 0.5 is raised to 1.0
        {200 * E, 100 * E, false, 0}, // near beyond far
        {100 * E, 100 * E, false, 0}, // equal is refused too
        {0x8000, 0xC000, true, E},    // checked before the raise: near ends above far
        {-E, 5 * E, true, E},         // negative near
        {2 * E, 5 * E, true, 2 * E},  // kept
        {0xFFFF, 2 * E, true, E},     // one raw unit under 1.0
    };
    for (const Case& k : cases) {
        clear_last_error();
        long before = vrx::engine::alloc_outstanding();
        CAMSETUP s{{0, 0, 0}, {0, 0, 10 * E}, 90 * E, k.near_clip, k.far_clip};
        void* h = reinterpret_cast<void*>(0x1234);
        int32_t r = VRX_NewCamera(&s, &h);
        if (!k.ok) {
            EXPECT_EQ(r, -1);
            EXPECT_EQ(last_error(), "The Far_Clip must be greater than Near_Clip !!\n");
            EXPECT_EQ(h, reinterpret_cast<void*>(0x1234));
            EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
            EXPECT_EQ(g_eng.camera_list.head, nullptr);
            continue;
        }
        ASSERT_EQ(r, 0);
        auto* c = static_cast<CAMERA*>(h);
        EXPECT_EQ(c->near_clip, k.stored_near);
        EXPECT_EQ(c->far_clip, k.far_clip);
        // tan 45 degrees comes out as 65637 in this arithmetic.
        EXPECT_EQ(c->near_extent, static_cast<FIXED>((int64_t{65637} * k.stored_near) >> 16));
        ASSERT_EQ(VRX_DeleteCamera(c), 0);
    }
}

TEST_F(CameraTest, FieldOfViewIsClampedAndItsConstantsFollow) {
    struct Case {
        FIXED fov, stored, tan_half, inv_tan, near_extent, far_extent;
    };
    // Half the angle in radians is ((fov >> 1) * 1144) >> 16; tan = EGL_Div(sin, cos) from
    // the table, then its reciprocal. Near clip 1.0 and far 100.0.
    const Case cases[] = {
        {90 * E, 90 * E, 65637, 65435, 65637, 6563700},
        {60 * E, 60 * E, 37836, 113516, 37836, 3783600},
        {E, E, 503, 8538753, 503, 50300},
        {180 * E, 0xAF0000, 1523780, 2818, 1523780, 152378000}, // 180 stored as 175
        {175 * E, 0xAF0000, 1523780, 2818, 1523780, 152378000},
        // 16 raw units: half the angle is 0 radians, so tan is 0 and its reciprocal the
        // largest value.
        {0, 16, 0, 0x7FFFFFFF, 0, 0},
        {16, 16, 0, 0x7FFFFFFF, 0, 0},
        {-5 * E, 16, 0, 0x7FFFFFFF, 0, 0},
    };
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    for (const Case& k : cases) {
        ASSERT_EQ(VRX_SetCameraFOV(c, k.fov), 0);
        EXPECT_EQ(c->fov, k.stored) << k.fov;
        EXPECT_EQ(c->tan_half, k.tan_half) << k.fov;
        EXPECT_EQ(c->inv_tan, k.inv_tan) << k.fov;
        EXPECT_EQ(c->near_extent, k.near_extent) << k.fov;
        EXPECT_EQ(c->far_extent, k.far_extent) << k.fov;
    }
    // The same limits hold at creation.
    CAMERA* wide = make({0, 0, 0}, {0, 0, E}, 180 * E);
    EXPECT_EQ(wide->fov, 0xAF0000);
    CAMERA* narrow = make({0, 0, 0}, {0, 0, E}, 0);
    EXPECT_EQ(narrow->fov, 16);
}

TEST_F(CameraTest, MoveTranslatesInCameraAxesWorldAxesOrToAPoint) {
    struct Case {
        int32_t mode;
        VECTOR v, eye, at;
    };
    // Axes X = (0, 0, -1), Y = (0, 1, 0), Z = (1, 0, 0); eye (1, 2, 3), target (4, 5, 6).
    const Case cases[] = {
        // v.x X + v.y Y + v.z Z = (3, 2, -1).
        {0, {E, 2 * E, 3 * E}, {4 * E, 4 * E, 2 * E}, {7 * E, 7 * E, 5 * E}},
        {0, {0x8000, 0, 0}, {E, 2 * E, 3 * E - 0x8000}, {4 * E, 5 * E, 6 * E - 0x8000}},
        {1, {E, 2 * E, 3 * E}, {2 * E, 4 * E, 6 * E}, {5 * E, 7 * E, 9 * E}},
        // The eye goes to v; the target moves by v - eye = (9, -2, -4).
        {2, {10 * E, 0, -E}, {10 * E, 0, -E}, {13 * E, 3 * E, 2 * E}},
        {3, {E, E, E}, {E, 2 * E, 3 * E}, {4 * E, 5 * E, 6 * E}},
        {-1, {E, E, E}, {E, 2 * E, 3 * E}, {4 * E, 5 * E, 6 * E}},
    };
    for (const Case& k : cases) {
        CAMERA* c = make({E, 2 * E, 3 * E}, {4 * E, 5 * E, 6 * E});
        set_axes(c, {0, 0, -E}, {0, E, 0}, {E, 0, 0});
        ASSERT_EQ(VRX_MoveCamera(c, &k.v, k.mode), 0);
        EXPECT_EQ(c->ucs.origin, k.eye) << "mode " << k.mode;
        EXPECT_EQ(c->at, k.at) << "mode " << k.mode;
        // Translation only: the frame is not rebuilt.
        EXPECT_EQ(c->ucs.x, (VECTOR{0, 0, -E}));
        EXPECT_EQ(c->ucs.z, (VECTOR{E, 0, 0}));
    }
}

TEST_F(CameraTest, TruckLiftAndDollySlideAlongTheCameraAxes) {
    struct Case {
        int32_t (*op)(void*, FIXED) noexcept;
        FIXED distance;
        VECTOR step;
    };
    // Axes X = (0, 0, -1), Y = (0, 1, 0), Z = (1, 0, 0).
    const Case cases[] = {
        {VRX_TruckCamera, 2 * E, {0, 0, -2 * E}},
        {VRX_LiftCamera, -0x18000, {0, -0x18000, 0}},
        {VRX_DollyCamera, 0x4000, {0x4000, 0, 0}},
        {VRX_DollyCamera, 0, {0, 0, 0}},
    };
    for (const Case& k : cases) {
        CAMERA* c = make({E, 2 * E, 3 * E}, {4 * E, 5 * E, 6 * E});
        set_axes(c, {0, 0, -E}, {0, E, 0}, {E, 0, 0});
        ASSERT_EQ(k.op(c, k.distance), 0);
        EXPECT_EQ(c->ucs.origin, (VECTOR{E + k.step.x, 2 * E + k.step.y, 3 * E + k.step.z}));
        EXPECT_EQ(c->at, (VECTOR{4 * E + k.step.x, 5 * E + k.step.y, 6 * E + k.step.z}));
        EXPECT_EQ(c->ucs.y, (VECTOR{0, E, 0}));
    }
}

TEST_F(CameraTest, RollTurnsXAndYAboutZWithoutRebuilding) {
    struct Case {
        VECTOR x, y;
        FIXED degrees;
        VECTOR new_x, new_y;
    };
    // From the table: sin 90 = 65534, cos 90 = 0; sin -90 = -65534, cos -90 = 0;
    // sin 30 = 32767, cos 30 = 56754. X' = cos X - sin Y, Y' = cos Y + sin X, each product
    // truncated by itself: with Y = (0, 3, 0), sin 30 times 3 is 1 (not -(-2)).
    const Case cases[] = {
        {{E, 0, 0}, {0, E, 0}, 90 * E, {0, -65534, 0}, {65534, 0, 0}},
        {{E, 0, 0}, {0, E, 0}, -90 * E, {0, 65534, 0}, {-65534, 0, 0}},
        {{E, 0, 0}, {0, E, 0}, 30 * E, {56754, -32767, 0}, {32767, 56754, 0}},
        {{E, 0, 0}, {0, 3, 0}, 30 * E, {56754, -1, 0}, {32767, 2, 0}},
        {{E, 0, 0}, {0, E, 0}, 0, {E - 2, 0, 0}, {0, E - 2, 0}}, // cos 0 is 65534
    };
    for (const Case& k : cases) {
        CAMERA* c = make_exact();
        set_axes(c, k.x, k.y, {0, 0, E});
        ASSERT_EQ(VRX_RollCamera(c, k.degrees), 0);
        EXPECT_EQ(c->ucs.x, k.new_x) << k.degrees;
        EXPECT_EQ(c->ucs.y, k.new_y) << k.degrees;
        EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, E}));
        EXPECT_EQ(c->at, (VECTOR{0, 0, 10 * E}));
    }
}

TEST_F(CameraTest, PanAndTiltTurnTheTargetAboutTheEye) {
    struct Case {
        int32_t (*op)(void*, FIXED) noexcept;
        FIXED degrees;
        VECTOR at, x, y, z;
    };
    // Eye at the origin, target (0, 0, 10.0), exact unit axes. The distance is
    // Vlen(0, 0, -10.0) = 1 / (1 / sqrt(100.0)) = 655407 raw. Pan 90: rs = F_MUL(65534,
    // 655407) = 655386, rc = 0, so the target goes to (655386, 0, 0). Tilt 90 lifts it to
    // (0, 655386, 0) and turns Y into (0, 0, -65534) before the rebuild.
    const Case cases[] = {
        {VRX_PanCamera, 90 * E, {655386, 0, 0}, {0, 0, -65536}, {0, 65535, 0}, {65532, 0, 0}},
        {VRX_PanCamera,
         30 * E,
         {327693, 0, 567580},
         {56756, 0, -32769},
         {0, 65535, 0},
         {32766, 0, 56752}},
        {VRX_TiltCamera, 90 * E, {0, 655386, 0}, {65535, 0, 0}, {0, 0, -65536}, {0, 65532, 0}},
    };
    for (const Case& k : cases) {
        CAMERA* c = make_exact();
        ASSERT_EQ(k.op(c, k.degrees), 0);
        EXPECT_EQ(c->at, k.at) << k.degrees;
        EXPECT_EQ(c->ucs.x, k.x) << k.degrees;
        EXPECT_EQ(c->ucs.y, k.y) << k.degrees;
        EXPECT_EQ(c->ucs.z, k.z) << k.degrees;
        EXPECT_EQ(c->ucs.origin, (VECTOR{0, 0, 0}));
    }
}

TEST_F(CameraTest, ArcOrbitsTheEyeInCameraAxes) {
    struct Case {
        FIXED a1, a2;
        VECTOR eye, x, y, z;
    };
    // Eye (0, 0, -10.0), target at the origin, exact unit axes; r = 655407 as for the pan.
    // a1 = 90: eye = at + F_MUL(rs, X) - F_MUL(rc, Z) = (655386, 0, 0).
    // a2 = 30: rs = 327693, rc = 567580: eye = (0, 327693, -567580); Y becomes
    // (0, cos 30, sin 30) = (0, 56754, 32767) before the rebuild.
    const Case cases[] = {
        {90 * E, 0, {655386, 0, 0}, {0, 0, 65535}, {0, 65535, 0}, {-65533, 0, 0}},
        {0, 30 * E, {0, 327693, -567580}, {65535, 0, 0}, {0, 56755, 32769}, {0, -32767, 56752}},
    };
    for (const Case& k : cases) {
        CAMERA* c = make_exact({0, 0, -10 * E}, {0, 0, 0});
        ASSERT_EQ(VRX_ArcCamera(c, k.a1, k.a2), 0);
        EXPECT_EQ(c->ucs.origin, k.eye);
        EXPECT_EQ(c->ucs.x, k.x);
        EXPECT_EQ(c->ucs.y, k.y);
        EXPECT_EQ(c->ucs.z, k.z);
        EXPECT_EQ(c->at, (VECTOR{0, 0, 0}));
    }
    // Both angles 0: nothing moves, not even the frame.
    CAMERA* c = make_exact({0, 0, -10 * E}, {0, 0, 0});
    CAMINFO before = info_of(c);
    ASSERT_EQ(VRX_ArcCamera(c, 0, 0), 0);
    ASSERT_EQ(VRX_GlobalArcCamera(c, 0, 0), 0);
    EXPECT_TRUE(same(before, info_of(c)));
}

TEST_F(CameraTest, GlobalArcTurnsAboutTheVerticalThenRaisesTheEye) {
    CAMERA* c = make({0, 0, -10 * E}, {0, 0, 0});
    ASSERT_EQ(VRX_GlobalArcCamera(c, 90 * E, 0), 0);
    // d = (0, 0, -10.0): eye.x = cos 0 - sin 90 (-10.0) = 655340, eye.z = F_MUL(0, d.z) = 0.
    EXPECT_EQ(c->ucs.origin, (VECTOR{655340, 0, 0}));
    EXPECT_EQ(c->ucs.z, (VECTOR{-65529, 0, 0}));
    EXPECT_EQ(c->ucs.y, (VECTOR{0, 65535, 0}));

    CAMERA* g = make({0, 0, -10 * E}, {0, 0, 0});
    ASSERT_EQ(VRX_GlobalArcCamera(g, 90 * E, 30 * E), 0);
    // After the quarter turn the horizontal distance h is EGL_Sqrt(100.0) = 655407;
    // eye.y = F_MUL(32767, h) = 327693 (5.0), and k = EGL_Div(F_MUL(h, 56754), h) = 56752
    // scales the horizontal part to F_MUL(56752, 655340) = 567502 (8.66).
    EXPECT_EQ(g->ucs.origin, (VECTOR{567502, 327693, 0}));
    EXPECT_EQ(g->ucs.x, (VECTOR{0, 0, 65535}));
    EXPECT_EQ(g->ucs.y, (VECTOR{-32773, 56753, 0}));
    EXPECT_EQ(g->ucs.z, (VECTOR{-56746, -32767, 0}));
    EXPECT_EQ(g->at, (VECTOR{0, 0, 0}));
}

TEST_F(CameraTest, PanToAlmostStraightAheadOrBehindChangesNothing) {
    const VECTOR points[] = {
        {0, 0, 50 * E},   // straight ahead
        {0, 0, -5 * E},   // straight behind
        {E / 40, 0, E},   // 1.4 degrees off the view
        {0, -E / 40, -E}, // 1.4 degrees off the reverse
        {0, 0, 0},        // on the eye: no direction at all
    };
    for (const VECTOR& p : points) {
        CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
        CAMINFO before = info_of(c);
        ASSERT_EQ(VRX_PanCameraTo(c, &p), 0);
        EXPECT_TRUE(same(before, info_of(c))) << p;
    }
}

TEST_F(CameraTest, PanToBuildsAnOrthonormalFrameOnTheSideOfTheOldY) {
    struct Case {
        VECTOR eye;
        FIXED roll;
        VECTOR p;
    };
    const Case cases[] = {
        {{0, 0, 0}, 0, {10 * E, 0, 10 * E}},        // 45 degrees right
        {{0, 0, 0}, 0, {0, 10 * E, 0}},             // straight up: along the old Y
        {{0, 0, 0}, 0, {0, -10 * E, 0}},            // straight down
        {{0, 0, 0}, 0, {0, 10 * E, -E / 10}},       // up and a little behind
        {{0, 0, 0}, 0, {0, 10 * E, E / 10}},        // up and a little ahead
        {{0, 0, 0}, 0, {0, -10 * E, -E / 10}},      // down and a little behind
        {{0, 0, 0}, 0, {10 * E, 10 * E, -10 * E}},  // behind, up and right
        {{0, 0, 0}, 0, {-3 * E, E, -20 * E}},       // 9 degrees off the reverse
        {{0, 0, 0}, 30 * E, {5 * E, 5 * E, 5 * E}}, // from a rolled frame
        {{E, 2 * E, 3 * E}, -45 * E, {-7 * E, 2 * E, 4 * E}},
        {{0, 0, 0}, 0, {3000 * E, 0, 10}}, // far away: pre-scaled normalisation
    };
    for (const Case& k : cases) {
        CAMERA* c = make(k.eye, {k.eye.x, k.eye.y, k.eye.z + 10 * E});
        ASSERT_EQ(VRX_RollCamera(c, k.roll), 0);
        const VECTOR old_y = c->ucs.y;
        ASSERT_EQ(VRX_PanCameraTo(c, &k.p), 0);
        VECTOR d{};
        Vmm(&k.p, &k.eye, &d);
        vrxNormalize(&d);
        EXPECT_EQ(c->ucs.z, d) << k.p;   // the new viewing direction
        EXPECT_EQ(c->at, k.p);           // the new target
        EXPECT_EQ(c->ucs.origin, k.eye); // the eye stays
        VECTOR cross{};
        Vcross(&c->ucs.y, &c->ucs.z, &cross);
        vrxNormalize(&cross);
        EXPECT_EQ(c->ucs.x, cross) << k.p;       // X = Y x Z, normalised
        EXPECT_NEAR(len(c->ucs.y), E, 8) << k.p; // unit, to the normalisation's precision
        EXPECT_NEAR(len(c->ucs.x), E, 8) << k.p;
        EXPECT_LE(std::abs(Vdot(&c->ucs.y, &c->ucs.z)), 4) << k.p; // perpendicular
        EXPECT_LE(std::abs(Vdot(&c->ucs.x, &c->ucs.z)), 4) << k.p;
        EXPECT_LE(std::abs(Vdot(&c->ucs.x, &c->ucs.y)), 4) << k.p;
        EXPECT_GE(Vdot(&c->ucs.y, &old_y), 0) << k.p; // on the old Y's side
    }
}

TEST_F(CameraTest, PanToKeepsTheRollOfAnUprightFrame) {
    // Turning right by 45 degrees from an upright camera keeps Y = (0, 1, 0) exactly up to
    // the normalisation and X horizontal.
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    const VECTOR p{10 * E, 0, 10 * E};
    ASSERT_EQ(VRX_PanCameraTo(c, &p), 0);
    EXPECT_EQ(c->ucs.y.x, 0);
    EXPECT_EQ(c->ucs.y.z, 0);
    EXPECT_NEAR(c->ucs.y.y, E, 2);
    EXPECT_EQ(c->ucs.x.y, 0);
    EXPECT_GT(c->ucs.x.x, 0);
    EXPECT_LT(c->ucs.x.z, 0);
}

TEST_F(CameraTest, SettersRebuildTheFrameAndGettersReadBack) {
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    const VECTOR at{10 * E, 0, 10 * E};
    ASSERT_EQ(VRX_SetCameraAt(c, &at), 0);
    VECTOR z = at;
    vrxNormalize(&z);
    EXPECT_EQ(c->ucs.z, z);
    VECTOR got{};
    ASSERT_EQ(VRX_GetCameraAt(c, &got), 0);
    EXPECT_EQ(got, at);

    const VECTOR eye{10 * E, 0, 0};
    ASSERT_EQ(VRX_SetCameraPos(c, &eye), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530})); // looking along +Z again, as at creation
    ASSERT_EQ(VRX_GetCameraPos(c, &got), 0);
    EXPECT_EQ(got, eye);

    // Near and far clips: no check against each other; the extents use tan_half (65637).
    FIXED v = 0;
    ASSERT_EQ(VRX_SetCameraNearClip(c, 0x8000), 0);
    EXPECT_EQ(c->near_extent, 32818); // 65637 / 2, truncated
    ASSERT_EQ(VRX_SetCameraNearClip(c, 200 * E), 0);
    ASSERT_EQ(VRX_GetCameraNearClip(c, &v), 0);
    EXPECT_EQ(v, 200 * E);
    ASSERT_EQ(VRX_SetCameraFarClip(c, 50 * E), 0);
    EXPECT_EQ(c->far_extent, 3281850);
    ASSERT_EQ(VRX_GetCameraFarClip(c, &v), 0);
    EXPECT_EQ(v, 50 * E);
    EXPECT_EQ(last_error(), "");
}

TEST_F(CameraTest, ResetAndSetInfoReplaceEverythingAndRebuild) {
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    // Reset: no clip check and no raise of the near clip; the field of view is clamped.
    CAMSETUP s{{0, 0, -10 * E}, {0, 0, 0}, 180 * E, 0x8000, 0x4000};
    ASSERT_EQ(VRX_ResetCamera(c, &s), 0);
    CAMINFO i = info_of(c);
    EXPECT_EQ(i.eye, (VECTOR{0, 0, -10 * E}));
    EXPECT_EQ(i.at, (VECTOR{0, 0, 0}));
    EXPECT_EQ(i.z_axis, (VECTOR{0, 0, 65530}));
    EXPECT_EQ(i.fov, 0xAF0000);
    EXPECT_EQ(i.near_clip, 0x8000);
    EXPECT_EQ(i.far_clip, 0x4000);
    EXPECT_EQ(c->tan_half, 1523780);

    // SetCameraInfo: the given axes only start the rebuild, so a rolled Y survives.
    CAMINFO in{
        {0, 0, 0}, {56754, -32767, 0}, {32767, 56754, 0}, {0, 0, E}, {0, 0, 10 * E}, 60 * E, 2 * E,
        30 * E};
    ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
    CAMINFO out = info_of(c);
    EXPECT_EQ(out.eye, in.eye);
    EXPECT_EQ(out.at, in.at);
    EXPECT_EQ(out.z_axis, (VECTOR{0, 0, 65530}));
    EXPECT_NEAR(out.y_axis.x, 32767, 8);
    EXPECT_NEAR(out.y_axis.y, 56754, 8);
    EXPECT_EQ(out.fov, 60 * E);
    EXPECT_EQ(out.near_clip, 2 * E);
    EXPECT_EQ(out.far_clip, 30 * E);
    EXPECT_EQ(c->tan_half, 37836);
    EXPECT_EQ(c->near_extent, 75672);
}

TEST_F(CameraTest, DegenerateStartingFramesFallBackToUpright) {
    struct Case {
        VECTOR x, y;
    };
    // Zero axes, or axes that are parallel to the view, give no frame by cross products.
    const Case cases[] = {{{0, 0, 0}, {0, 0, 0}}, {{0, 0, E}, {0, 0, E}}, {{0, 0, 0}, {0, 0, -E}}};
    for (const Case& k : cases) {
        CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
        CAMINFO in{{0, 0, 0}, k.x, k.y, {0, 0, E}, {0, 0, 10 * E}, 90 * E, E, 100 * E};
        ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
        EXPECT_EQ(c->ucs.x, (VECTOR{65535, 0, 0}));
        EXPECT_EQ(c->ucs.y, (VECTOR{0, 65535, 0}));
        EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    }
    // A target on the eye has no direction: the frame stays as it was.
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    set_axes(c, {E, 0, 0}, {0, E, 0}, {0, 0, E});
    const VECTOR eye{0, 0, 10 * E};
    ASSERT_EQ(VRX_SetCameraPos(c, &eye), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, E}));
    EXPECT_EQ(c->ucs.y, (VECTOR{0, E, 0}));
    CAMERA* same_point = make({E, E, E}, {E, E, E});
    EXPECT_EQ(same_point->ucs.z, (VECTOR{0, 0, E}));
    EXPECT_EQ(same_point->ucs.y, (VECTOR{0, E, 0}));
}

TEST_F(CameraTest, ShootingVectorThroughScreenPointsInNormalAndDoubledMode) {
    struct Case {
        int32_t sx, sy;
        VECTOR dir;
    };
    // Window 240 x 320, camera along +Z with fov 90 (inv_tan 65435). At (0, 0): nx =
    // EGL_Div(-120.0, 120.0) = -65520, ny = EGL_Div(160.0, 120.0) = 87360, and the sum
    // (-65520, 87358, 65429) normalised.
    const Case cases[] = {
        {120, 160, {0, 0, 65535}}, // the centre gives Z
        {0, 0, {-33730, 44971, 33682}},     {240, 320, {33729, -44973, 33682}},
        {60, 200, {-28116, -18744, 56153}}, {0, 160, {-46372, 0, 46307}},
    };
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    for (const Case& k : cases) {
        VECTOR v{};
        ASSERT_EQ(VRX_GetShootingVector(c, k.sx, k.sy, &v), 0);
        EXPECT_EQ(v, k.dir) << k.sx << ", " << k.sy;
    }
    // Doubled: the window is 480 x 640 and screen points are doubled first, so the same
    // screen points give the same directions.
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 1), 0);
    ASSERT_EQ(g_eng.cur_window->width, 480);
    for (const Case& k : cases) {
        VECTOR v{};
        ASSERT_EQ(VRX_GetShootingVector(c, k.sx, k.sy, &v), 0);
        EXPECT_EQ(v, k.dir) << "doubled " << k.sx << ", " << k.sy;
    }
    // Undoubled points in the doubled window: (240, 320) is now the centre.
    VECTOR v{};
    ASSERT_EQ(VRX_Hint(HINT_DOUBLED, 0), 0);
    ASSERT_EQ(VRX_GetShootingVector(c, 240, 320, &v), 0);
    EXPECT_EQ(v, (VECTOR{33729, -44973, 33682}));
}

TEST_F(CameraTest, ShootingVectorUsesTheSelectedWindow) {
    WINDOW_INFO info{20, 40, 100, 50, 0};
    void* win = nullptr;
    ASSERT_EQ(VRX_NewWindow(&info, &win), 0);
    ASSERT_EQ(VRX_SelectWindow(win), 0);
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    VECTOR v{};
    // The centre is (50, 25) in the window's own size, whatever its position.
    ASSERT_EQ(VRX_GetShootingVector(c, 50, 25, &v), 0);
    EXPECT_EQ(v, (VECTOR{0, 0, 65535}));
    ASSERT_EQ(VRX_GetShootingVector(c, 120, 160, &v), 0);
    EXPECT_GT(v.x, 0);
    EXPECT_LT(v.y, 0);
}

TEST_F(CameraTest, CamerasAreFoundByNameWithoutRegardToCase) {
    auto name = [](CAMERA* c, const char* text) {
        c->name = static_cast<char*>(vrx::engine::eng_malloc(std::strlen(text) + 1));
        std::strcpy(c->name, text);
    };
    CAMERA* unnamed = make({0, 0, 0}, {0, 0, E});
    CAMERA* a = make({0, 0, 0}, {0, 0, E});
    CAMERA* b = make({0, 0, 0}, {0, 0, E});
    CAMERA* a2 = make({0, 0, 0}, {0, 0, E});
    name(a, "ROOM.000");
    name(b, "ROOM.001");
    name(a2, "ROOM.000");
    (void)unnamed;
    struct Case {
        const char* query;
        int32_t result;
        CAMERA* found;
    };
    const Case cases[] = {{"ROOM.000", 0, a},      {"room.001", 0, b},        {"Room.000", 0, a},
                          {"ROOM.00", 1, nullptr}, {"ROOM.0000", 1, nullptr}, {"", 1, nullptr}};
    for (const Case& k : cases) {
        void* out = reinterpret_cast<void*>(1);
        EXPECT_EQ(VRX_GetCameraByName(k.query, &out), k.result) << k.query;
        EXPECT_EQ(out, k.found) << k.query;
    }
    EXPECT_EQ(last_error(), "");
}

TEST_F(CameraTest, DefaultCameraIsClearedWhenItsCameraIsFreed) {
    CAMERA* a = make({0, 0, 0}, {0, 0, E});
    CAMERA* b = make({0, 0, 0}, {0, 0, E});
    void* def = nullptr;
    ASSERT_EQ(VRX_SetDefaultCam(a), 0);
    ASSERT_EQ(VRX_GetDefaultCam(&def), 0);
    EXPECT_EQ(def, a);
    ASSERT_EQ(VRX_DeleteCamera(b), 0); // another camera: the default stays
    ASSERT_EQ(VRX_GetDefaultCam(&def), 0);
    EXPECT_EQ(def, a);
    ASSERT_EQ(VRX_DeleteCamera(a), 0);
    ASSERT_EQ(VRX_GetDefaultCam(&def), 0);
    EXPECT_EQ(def, nullptr);

    CAMERA* c = make({0, 0, 0}, {0, 0, E});
    ASSERT_EQ(VRX_SetDefaultCam(c), 0);
    ASSERT_EQ(VRX_DeleteAllCameras(), 0);
    EXPECT_EQ(g_eng.default_cam, nullptr);

    CAMERA* d = make({0, 0, 0}, {0, 0, E});
    ASSERT_EQ(VRX_SetDefaultCam(d), 0);
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(g_eng.default_cam, nullptr);
    EXPECT_EQ(last_error(), "");
}

TEST_F(CameraTest, DeleteUnlinksAndReleasesNameAndTrack) {
    long before = vrx::engine::alloc_outstanding();
    CAMERA* a = make({0, 0, 0}, {0, 0, E});
    CAMERA* b = make({0, 0, 0}, {0, 0, E});
    CAMERA* c = make({0, 0, 0}, {0, 0, E});
    b->name = static_cast<char*>(vrx::engine::eng_malloc(4));
    std::strcpy(b->name, "CAM");
    b->ckfr = static_cast<vrx::scene::CAM_KEYFRAME*>(
        vrx::engine::eng_calloc(1, sizeof(vrx::scene::CAM_KEYFRAME)));
    b->ckfr->count = 2;
    b->ckfr->cam_state = static_cast<vrx::scene::CAM_STATE*>(
        vrx::engine::eng_calloc(2, sizeof(vrx::scene::CAM_STATE)));
    b->ckfr->one = 1;
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before + 6);
    ASSERT_EQ(VRX_DeleteCamera(b), 0);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before + 2);
    EXPECT_EQ(g_eng.camera_list.head, a);
    EXPECT_EQ(a->next, c);
    EXPECT_EQ(c->prev, a);
    EXPECT_EQ(g_eng.camera_list.tail, c);
    ASSERT_EQ(VRX_DeleteAllCameras(), 0);
    EXPECT_EQ(g_eng.camera_list.head, nullptr);
    EXPECT_EQ(g_eng.camera_list.tail, nullptr);
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(VRX_DeleteAllCameras(), 0); // an empty list
}

TEST_F(CameraTest, AllocationFailureIsReportedAndLeavesNothing) {
    CAMERA* kept = make({0, 0, 0}, {0, 0, E});
    long before = vrx::engine::alloc_outstanding();
    CAMSETUP s{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    void* out = reinterpret_cast<void*>(0x1234);
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewCamera(&s, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for pc in ENG_CreateCam fail!!\n");
    EXPECT_EQ(out, reinterpret_cast<void*>(0x1234));
    EXPECT_EQ(vrx::engine::alloc_outstanding(), before);
    EXPECT_EQ(g_eng.camera_list.head, kept);
    EXPECT_EQ(g_eng.camera_list.tail, kept);
}

// Every operation that takes a camera, with valid other arguments.
struct CameraOp {
    const char* own_message;
    std::function<int32_t(void*)> call;
};

std::vector<CameraOp> camera_ops() {
    static VECTOR v{E, 0, 0};
    static CAMSETUP setup{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    static CAMINFO info{};
    static FIXED f = 0;
    return {
        {"Wrong chd in ENG_DefaultCam!!\n", [](void* c) { return VRX_SetDefaultCam(c); }},
        {"Wrong chd in ENG_DeleteCam!!\n", [](void* c) { return VRX_DeleteCamera(c); }},
        {"Wrong chd in ENG_MoveCam!!\n", [](void* c) { return VRX_MoveCamera(c, &v, 1); }},
        {"Wrong chd in ENG_PanCam!!\n", [](void* c) { return VRX_PanCamera(c, E); }},
        {"Wrong chd in ENG_TiltCam!!\n", [](void* c) { return VRX_TiltCamera(c, E); }},
        {"Wrong chd in ENG_RollCam!!\n", [](void* c) { return VRX_RollCamera(c, E); }},
        {"Wrong chd in ENG_FreePanCam!!\n", [](void* c) { return VRX_PanCameraTo(c, &v); }},
        {"Wrong chd in ENG_ArcCam!!\n", [](void* c) { return VRX_ArcCamera(c, E, E); }},
        {"Wrong chd in ENG_GlobalArcCam!!\n", [](void* c) { return VRX_GlobalArcCamera(c, E, E); }},
        {"Wrong chd in ENG_FOVCam!!\n", [](void* c) { return VRX_SetCameraFOV(c, E); }},
        {"Wrong chd in ENG_TruckCam!!\n", [](void* c) { return VRX_TruckCamera(c, E); }},
        {"Wrong chd in ENG_LiftCam!!\n", [](void* c) { return VRX_LiftCamera(c, E); }},
        {"Wrong chd in ENG_DollyCam!!\n", [](void* c) { return VRX_DollyCamera(c, E); }},
        {"Wrong chd in ENG_AdjustCam!!\n", [](void* c) { return VRX_ResetCamera(c, &setup); }},
        {"Wrong chd in ENG_SetCamInfo!!\n", [](void* c) { return VRX_SetCameraInfo(c, &info); }},
        {"Wrong chd in ENG_GetCamInfo!!\n", [](void* c) { return VRX_GetCameraInfo(c, &info); }},
        {"Wrong chd in ENG_SetCamPos!!\n", [](void* c) { return VRX_SetCameraPos(c, &v); }},
        {"Wrong chd in ENG_GetCamPos!!\n", [](void* c) { return VRX_GetCameraPos(c, &v); }},
        {"Wrong chd in ENG_SetCamAt!!\n", [](void* c) { return VRX_SetCameraAt(c, &v); }},
        {"Wrong chd in ENG_GetCamAt!!\n", [](void* c) { return VRX_GetCameraAt(c, &v); }},
        {"Wrong chd in ENG_SetCamNearClip!!\n",
         [](void* c) { return VRX_SetCameraNearClip(c, E); }},
        {"Wrong chd in ENG_GetCamNearClip!!\n",
         [](void* c) { return VRX_GetCameraNearClip(c, &f); }},
        {"Wrong chd in ENG_SetCamFarClip!!\n", [](void* c) { return VRX_SetCameraFarClip(c, E); }},
        {"Wrong chd in ENG_GetCamFarClip!!\n", [](void* c) { return VRX_GetCameraFarClip(c, &f); }},
        {"Wrong chd in ENG_GetSightingVecFromScr!!\n",
         [](void* c) { return VRX_GetShootingVector(c, 0, 0, &v); }},
    };
}

TEST_F(CameraTest, BadHandlesAreRefusedWithExactMessages) {
    void* world = nullptr;
    ASSERT_EQ(VRX_NewWorld(1, &world), 0);
    CAMERA* live = make({0, 0, 0}, {0, 0, E});
    CAMERA* gone = make({0, 0, 0}, {0, 0, E}); // made after `live` so its memory is not reused
    ASSERT_EQ(VRX_DeleteCamera(gone), 0);
    const CAMINFO before = info_of(live);
    struct Case {
        void* handle;
        std::string check_message;
    };
    const Case cases[] = {{nullptr, "Wrong Camera Handle : 0\n"},
                          {world, "This ID is not ID_CAMERA !!\n"},
                          {gone, "This ID is not ID_CAMERA !!\n"}, // stale after delete
                          {&g_eng.main_window, "This ID is not ID_CAMERA !!\n"}};
    for (const CameraOp& op : camera_ops()) {
        for (const Case& k : cases) {
            clear_last_error();
            EXPECT_EQ(op.call(k.handle), -1) << op.own_message;
            EXPECT_EQ(last_error(), k.check_message + op.own_message);
        }
    }
    // Nothing changed on the live camera, and the default is still none.
    EXPECT_TRUE(same(before, info_of(live)));
    EXPECT_EQ(g_eng.default_cam, nullptr);
}

TEST_F(CameraTest, HandlesMadeBeforeAClearAreRefused) {
    CAMERA* c = make({0, 0, 0}, {0, 0, E});
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(g_eng.camera_list.head, nullptr);
    for (const CameraOp& op : camera_ops()) {
        clear_last_error();
        EXPECT_EQ(op.call(c), -1);
        EXPECT_EQ(last_error(), std::string("This ID is not ID_CAMERA !!\n") + op.own_message);
    }
}

TEST_F(CameraTest, NullPointerArgumentsAreRefused) {
    CAMERA* c = make({0, 0, 0}, {0, 0, E});
    const CAMINFO before = info_of(c);
    CAMSETUP s{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    void* h = nullptr;
    struct Case {
        std::function<int32_t()> call;
        const char* message;
    };
    const Case cases[] = {
        {[&] { return VRX_NewCamera(nullptr, &h); }, "Wrong setup in ENG_CreateCam!!\n"},
        {[&] { return VRX_NewCamera(&s, nullptr); }, "Wrong out in ENG_CreateCam!!\n"},
        {[] { return VRX_GetDefaultCam(nullptr); }, "Wrong out in ENG_GetDefaultCam!!\n"},
        {[&] { return VRX_GetCameraByName(nullptr, &h); }, "Wrong name in ENG_GetCamByName!!\n"},
        {[] { return VRX_GetCameraByName("A", nullptr); }, "Wrong out in ENG_GetCamByName!!\n"},
        {[&] { return VRX_MoveCamera(c, nullptr, 1); }, "Wrong vector in ENG_MoveCam!!\n"},
        {[&] { return VRX_PanCameraTo(c, nullptr); }, "Wrong point in ENG_FreePanCam!!\n"},
        {[&] { return VRX_ResetCamera(c, nullptr); }, "Wrong setup in ENG_AdjustCam!!\n"},
        {[&] { return VRX_SetCameraInfo(c, nullptr); }, "Wrong info in ENG_SetCamInfo!!\n"},
        {[&] { return VRX_GetCameraInfo(c, nullptr); }, "Wrong info in ENG_GetCamInfo!!\n"},
        {[&] { return VRX_SetCameraPos(c, nullptr); }, "Wrong point in ENG_SetCamPos!!\n"},
        {[&] { return VRX_GetCameraPos(c, nullptr); }, "Wrong out in ENG_GetCamPos!!\n"},
        {[&] { return VRX_SetCameraAt(c, nullptr); }, "Wrong point in ENG_SetCamAt!!\n"},
        {[&] { return VRX_GetCameraAt(c, nullptr); }, "Wrong out in ENG_GetCamAt!!\n"},
        {[&] { return VRX_GetCameraNearClip(c, nullptr); }, "Wrong out in ENG_GetCamNearClip!!\n"},
        {[&] { return VRX_GetCameraFarClip(c, nullptr); }, "Wrong out in ENG_GetCamFarClip!!\n"},
        {[&] { return VRX_GetShootingVector(c, 0, 0, nullptr); },
         "Wrong out in ENG_GetSightingVecFromScr!!\n"},
    };
    long allocated = vrx::engine::alloc_outstanding();
    for (const Case& k : cases) {
        clear_last_error();
        EXPECT_EQ(k.call(), -1) << k.message;
        EXPECT_EQ(last_error(), k.message);
    }
    EXPECT_TRUE(same(before, info_of(c)));
    EXPECT_EQ(vrx::engine::alloc_outstanding(), allocated);
    EXPECT_EQ(g_eng.camera_list.head, c);
    EXPECT_EQ(g_eng.camera_list.tail, c);
}

} // namespace
