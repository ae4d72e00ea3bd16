// Cameras: the clip rules and frame at creation, the field of view, every move with values worked
// out by hand from the engine's arithmetic (sine table, F_MUL truncation, Newton reciprocals),
// pan-to, the shooting vector, names, the default camera, release and the refusals.
#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <string>
#include <tuple>

#include "engine/alloc.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "scene/camera.h"
#include "support/engine_fixture.h"

using vrx::engine::alloc_outstanding;
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
using Op = std::function<int32_t(void*)>;

// A call of a camera operation with fixed arguments.
template <class... A> Op call(int32_t (*op)(void*, A...) noexcept, A... args) {
    return [=](void* c) { return op(c, args...); };
}

class CameraTest : public vrx::test::EngineTest {
  protected:
    CAMERA* make(VECTOR eye, VECTOR at, FIXED fov = 90 * E) {
        CAMSETUP s{eye, at, fov, E, 100 * E};
        void* h = nullptr;
        EXPECT_EQ(VRX_NewCamera(&s, &h), 0);
        return static_cast<CAMERA*>(h);
    }
    // With exact unit axes (creation leaves them one raw unit short of 1.0).
    CAMERA* make_exact(VECTOR eye, VECTOR at) {
        CAMERA* c = make(eye, at);
        c->ucs = UCS{eye, {E, 0, 0}, {0, E, 0}, {0, 0, E}};
        return c;
    }
};

TEST_F(CameraTest, NewCameraChecksTheClipsAndBuildsItsFrame) {
    // Z = (0, 0, 10.0) normalised: 1 / sqrt(100.0) is 6553 raw, times 10.0 gives 65530. Y . Z is
    // 0, so X = Y x Z and Y = Z x X, each normalised to one raw unit under 1.0.
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    EXPECT_TRUE(c->ucs.x == (VECTOR{65535, 0, 0}) && c->ucs.y == (VECTOR{0, 65535, 0}));
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    EXPECT_EQ(g_eng.default_cam, nullptr); // a new camera does not become the default
    // Near, far, stored near (0: refused). Near must lie below far, checked before a near clip
    // under 1.0 is raised to 1.0; tan 45 degrees comes out as 65637.
    const FIXED cases[][3] = {{0x8000, 100 * E, E}, {200 * E, 100 * E, 0}, {100 * E, 100 * E, 0},
                              {0x8000, 0xC000, E},  {-E, 5 * E, E},        {2 * E, 5 * E, 2 * E},
                              {0xFFFF, 2 * E, E}};
    for (const auto& k : cases) {
        clear_last_error();
        const long before = alloc_outstanding();
        CAMSETUP s{{0, 0, 0}, {0, 0, 10 * E}, 90 * E, k[0], k[1]};
        void* h = nullptr;
        EXPECT_EQ(VRX_NewCamera(&s, &h), k[2] ? 0 : -1) << k[0];
        EXPECT_EQ(last_error(), k[2] ? "" : "The Far_Clip must be greater than Near_Clip !!\n");
        const auto* n = static_cast<CAMERA*>(h);
        EXPECT_TRUE(n ? n->near_clip == k[2] && n->far_clip == k[1] &&
                            n->near_extent == k[2] / E * 65637
                      : alloc_outstanding() == before)
            << k[0];
    }
}

TEST_F(CameraTest, FieldOfViewIsClampedAndItsConstantsFollow) {
    // Half the angle in radians is ((fov >> 1) * 1144) >> 16; tan = EGL_Div(sin, cos) from the
    // table, then its reciprocal. Near clip 1.0 and far 100.0. 180 is stored as 175; at 16 raw
    // units half the angle is 0 radians, so tan is 0 and its reciprocal the largest value.
    const FIXED cases[][6] = {{90 * E, 90 * E, 65637, 65435, 65637, 6563700},
                              {60 * E, 60 * E, 37836, 113516, 37836, 3783600},
                              {E, E, 503, 8538753, 503, 50300},
                              {180 * E, 0xAF0000, 1523780, 2818, 1523780, 152378000},
                              {175 * E, 0xAF0000, 1523780, 2818, 1523780, 152378000},
                              {16, 16, 0, 0x7FFFFFFF, 0, 0},
                              {-5 * E, 16, 0, 0x7FFFFFFF, 0, 0}};
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    for (const auto& k : cases) {
        ASSERT_EQ(VRX_SetCameraFOV(c, k[0]), 0);
        const FIXED got[5] = {c->fov, c->tan_half, c->inv_tan, c->near_extent, c->far_extent};
        for (int i = 0; i < 5; ++i) EXPECT_EQ(got[i], k[i + 1]) << k[0] << " field " << i;
    }
    EXPECT_EQ(make({0, 0, 0}, {0, 0, E}, 180 * E)->fov, 0xAF0000); // the same limits at creation
    EXPECT_EQ(make({0, 0, 0}, {0, 0, E}, 0)->fov, 16);
}

TEST_F(CameraTest, TranslationsMoveEyeAndTargetAndKeepTheFrame) {
    auto move = [](int32_t mode, VECTOR v) -> Op {
        return [=](void* c) { return VRX_MoveCamera(c, &v, mode); };
    };
    // Axes X = (0, 0, -1), Y = (0, 1, 0), Z = (1, 0, 0); eye (1, 2, 3). Mode 2 goes to v (so by
    // v - eye), mode 0 by v.x X + v.y Y + v.z Z, mode 1 by v; other modes do nothing. Each row
    // moves on from where the one before left the camera.
    const std::pair<Op, VECTOR> cases[] = {{move(2, {10 * E, 0, -E}), {9 * E, -2 * E, -4 * E}},
                                           {move(0, {E, 2 * E, 3 * E}), {3 * E, 2 * E, -E}},
                                           {move(1, {E, 2 * E, 3 * E}), {E, 2 * E, 3 * E}},
                                           {move(3, {E, E, E}), {0, 0, 0}},
                                           {call(VRX_TruckCamera, 2 * E), {0, 0, -2 * E}},
                                           {call(VRX_LiftCamera, -0x18000), {0, -0x18000, 0}},
                                           {call(VRX_DollyCamera, 0x4000), {0x4000, 0, 0}}};
    CAMERA* c = make({E, 2 * E, 3 * E}, {4 * E, 5 * E, 6 * E});
    const UCS axes{{E, 2 * E, 3 * E}, {0, 0, -E}, {0, E, 0}, {E, 0, 0}};
    c->ucs = axes;
    VECTOR eye = axes.origin, at = c->at;
    for (const auto& [op, step] : cases) {
        ASSERT_EQ(op(c), 0);
        Vpp(&eye, &step, &eye);
        Vpp(&at, &step, &at);
        EXPECT_TRUE(c->ucs.origin == eye && c->at == at) << step;
    }
    EXPECT_TRUE(c->ucs.x == axes.x && c->ucs.y == axes.y && c->ucs.z == axes.z);
}

TEST_F(CameraTest, TurnsMoveTheTargetOrTheEyeByTheTable) {
    // sin 90 = S = 65534, cos 90 = 0; sin 30 = 32767, cos 30 = 56754; cos 0 = S. Roll: X' = cos X
    // - sin Y, Y' = cos Y + sin X, each product truncated alone (sin 30 times 3 raw is 1, not
    // -(-2)), no rebuild. Pan and tilt turn the target (0, 0, 10.0) about the eye at the origin
    // by r = 1 / (1 / sqrt(100.0)) = 655407 raw: F_MUL(S, r) = 655386; tilt turns Y to (0, 0, -S)
    // before the rebuild. Arcs turn the eye (0, 0, -10.0) about the target at the origin: at +
    // F_MUL(rs, X) - F_MUL(rc, Z); for 30, rs = 327693, rc = 567580, Y becomes (0, cos, sin)
    // first; both 0 move nothing. The global arc by 90 takes the eye to (cos 0 - sin 90 (-10.0),
    // 0, 0) = (655340, 0, 0), and X = Y x Z = (0, 0, 65529), Y = Z x X = (0, 65522, 0) normalise
    // to U = 65535. Raised by 30 after that: h = EGL_Sqrt(100.0) = 655407, y = F_MUL(32767, h) =
    // 327693, x = F_MUL(EGL_Div(F_MUL(h, 56754), h) = 56752, 655340) = 567502.
    auto roll = [](FIXED deg, FIXED y) -> Op {
        return [=](void* c) {
            static_cast<CAMERA*>(c)->ucs.y.y = y;
            return VRX_RollCamera(c, deg);
        };
    };
    const FIXED S = 65534, U = 65535, B = -10 * E;
    struct Turn {
        Op op;
        FIXED v[13]; // the eye turning (1) or the target (0); the point that moves, X, Y, Z
    };
    const Turn cases[] = {
        {roll(90 * E, E), {0, 0, 0, 10 * E, 0, -S, 0, S, 0, 0, 0, 0, E}},
        {roll(30 * E, E), {0, 0, 0, 10 * E, 56754, -32767, 0, 32767, 56754, 0, 0, 0, E}},
        {roll(30 * E, 3), {0, 0, 0, 10 * E, 56754, -1, 0, 32767, 2, 0, 0, 0, E}},
        {roll(0, E), {0, 0, 0, 10 * E, S, 0, 0, 0, S, 0, 0, 0, E}},
        {call(VRX_PanCamera, 90 * E), {0, 655386, 0, 0, 0, 0, -E, 0, U, 0, 65532, 0, 0}},
        {call(VRX_PanCamera, 30 * E),
         {0, 327693, 0, 567580, 56756, 0, -32769, 0, U, 0, 32766, 0, 56752}},
        {call(VRX_TiltCamera, 90 * E), {0, 0, 655386, 0, U, 0, 0, 0, 0, -E, 0, 65532, 0}},
        {call(VRX_ArcCamera, 90 * E, 0), {1, 655386, 0, 0, 0, 0, U, 0, U, 0, -65533, 0, 0}},
        {call(VRX_ArcCamera, 0, 30 * E),
         {1, 0, 327693, -567580, U, 0, 0, 0, 56755, 32769, 0, -32767, 56752}},
        {call(VRX_ArcCamera, 0, 0), {1, 0, 0, B, E, 0, 0, 0, E, 0, 0, 0, E}},
        {call(VRX_GlobalArcCamera, 0, 0), {1, 0, 0, B, E, 0, 0, 0, E, 0, 0, 0, E}},
        {call(VRX_GlobalArcCamera, 90 * E, 0), {1, 655340, 0, 0, 0, 0, U, 0, U, 0, -65529, 0, 0}},
        {call(VRX_GlobalArcCamera, 90 * E, 30 * E),
         {1, 567502, 327693, 0, 0, 0, U, -32773, 56753, 0, -56746, -32767, 0}}};
    for (const Turn& k : cases) {
        const VECTOR o{0, 0, 0}, ahead{0, 0, 10 * E}, back{0, 0, B};
        const FIXED* v = k.v;
        CAMERA* c = v[0] ? make_exact(back, o) : make_exact(o, ahead);
        ASSERT_EQ(k.op(c), 0);
        const auto row = &k - cases;
        EXPECT_EQ(v[0] ? c->ucs.origin : c->at, (VECTOR{v[1], v[2], v[3]})) << row;
        EXPECT_EQ(v[0] ? c->at : c->ucs.origin, o) << row;
        EXPECT_EQ(c->ucs.x, (VECTOR{v[4], v[5], v[6]})) << row;
        EXPECT_EQ(c->ucs.y, (VECTOR{v[7], v[8], v[9]})) << row;
        EXPECT_EQ(c->ucs.z, (VECTOR{v[10], v[11], v[12]})) << row;
    }
}

TEST_F(CameraTest, PanToBuildsAnOrthonormalFrameOnTheSideOfTheOldY) {
    // Within 1.4 degrees of the view or its reverse, or on the eye: nothing changes.
    for (const VECTOR& p : {VECTOR{E / 40, 0, E}, VECTOR{0, -E / 40, -E}, VECTOR{0, 0, 0}}) {
        CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
        unsigned char before[sizeof(CAMERA)];
        std::memcpy(before, c, sizeof before);
        ASSERT_EQ(VRX_PanCameraTo(c, &p), 0);
        EXPECT_EQ(std::memcmp(before, c, sizeof before), 0) << p;
    }
    // Roll, point: right (X stays level), along the old Y, down and a little behind, from a
    // rolled frame, and far away (the direction is pre-scaled).
    const std::pair<FIXED, VECTOR> cases[] = {{0, {10 * E, 0, 10 * E}},
                                              {0, {0, 10 * E, 0}},
                                              {0, {0, -10 * E, -E / 10}},
                                              {-45 * E, {-7 * E, 2 * E, 4 * E}},
                                              {0, {3000 * E, 0, 10}}};
    for (const auto& [roll, p] : cases) {
        CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
        ASSERT_EQ(VRX_RollCamera(c, roll), 0);
        const VECTOR old_y = c->ucs.y;
        ASSERT_EQ(VRX_PanCameraTo(c, &p), 0);
        VECTOR d = p;
        vrxNormalize(&d);
        EXPECT_TRUE(c->ucs.z == d && c->at == p && c->ucs.origin == (VECTOR{0, 0, 0})) << p;
        const VECTOR *x = &c->ucs.x, *y = &c->ucs.y, *z = &c->ucs.z;
        EXPECT_TRUE(std::abs(Vdot(x, x) - E) <= 16 && std::abs(Vdot(y, y) - E) <= 16) << p;
        EXPECT_LE(std::abs(Vdot(x, y)) + std::abs(Vdot(y, z)) + std::abs(Vdot(z, x)), 8) << p;
        EXPECT_GE(Vdot(y, &old_y), 0) << p;                   // on the old Y's side
        EXPECT_TRUE(roll != 0 || p.y != 0 || x->y == 0) << p; // X stays level
    }
}

TEST_F(CameraTest, SettersResetAndInfoRebuildTheFrame) {
    // The squares of (10.0, 0, 10.0) sum to 200.0, whose inverse root is 4634 raw (seed 4729,
    // then 4630, 4634, 4634); times 10.0. Moving the eye back in line looks along +Z again.
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    const VECTOR at{10 * E, 0, 10 * E}, eye{10 * E, 0, 0};
    ASSERT_EQ(VRX_SetCameraAt(c, &at), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{46340, 0, 46340}));
    ASSERT_EQ(VRX_SetCameraPos(c, &eye), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    // The clips are not checked against each other; the extents use tan 45 (65637).
    ASSERT_EQ(VRX_SetCameraFarClip(c, 50 * E), 0);
    ASSERT_EQ(VRX_SetCameraNearClip(c, 0x8000), 0);
    EXPECT_TRUE(c->near_extent == 32818 && c->far_extent == 50 * 65637); // 65637 / 2, truncated
    // Reset: no clip check and no raise of the near clip.
    const CAMSETUP s{{0, 0, -10 * E}, {0, 0, 0}, 90 * E, 0x8000, 0x4000};
    ASSERT_EQ(VRX_ResetCamera(c, &s), 0);
    EXPECT_TRUE(c->near_clip == 0x8000 && c->far_clip == 0x4000 && c->near_extent == 32818);
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    // SetCameraInfo: the given axes only start the rebuild, so a rolled Y survives. Zero axes
    // or axes parallel to the view give no frame by cross products and restart upright.
    CAMINFO in{
        {0, 0, 0}, {56754, -32767, 0}, {32767, 56754, 0}, {0, 0, E}, {0, 0, 10 * E}, 60 * E, 2 * E,
        30 * E};
    ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    EXPECT_TRUE(std::abs(c->ucs.y.x - 32767) <= 8 && std::abs(c->ucs.y.y - 56754) <= 8);
    EXPECT_EQ(c->near_extent, 75672); // 2.0 times tan 30 (37836)
    for (const VECTOR& axis : {VECTOR{0, 0, 0}, VECTOR{0, 0, E}, VECTOR{0, 0, -E}}) {
        in.x_axis = in.y_axis = axis;
        ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
        EXPECT_TRUE(c->ucs.x == (VECTOR{65535, 0, 0}) && c->ucs.y == (VECTOR{0, 65535, 0}));
    }
    ASSERT_EQ(VRX_GetCameraInfo(c, &in), 0);
    EXPECT_TRUE(in.eye == c->ucs.origin && in.z_axis == c->ucs.z && in.fov == 60 * E);
    // A target on the eye has no direction: the frame stays as it was.
    CAMERA* p = make_exact({E, E, E}, {E, E, 10 * E});
    ASSERT_EQ(VRX_SetCameraPos(p, &p->at), 0);
    EXPECT_TRUE(p->ucs.z == (VECTOR{0, 0, E}) && p->ucs.y == (VECTOR{0, E, 0}));
}

TEST_F(CameraTest, ShootingVectorThroughScreenPointsInNormalAndDoubledMode) {
    // Window 240 x 320, camera along +Z with fov 90 (inv_tan 65435). At (0, 0): nx =
    // EGL_Div(-120.0, 120.0) = -65520, ny = EGL_Div(160.0, 120.0) = 87360, and the sum (-65520,
    // 87358, 65429) normalised. The centre gives Z. Doubled, the window is 480 x 640 and screen
    // points are doubled first, so the same points give the same directions.
    const std::tuple<int32_t, int32_t, VECTOR> cases[] = {{0, 0, {-33730, 44971, 33682}},
                                                          {120, 160, {0, 0, 65535}},
                                                          {240, 320, {33729, -44973, 33682}},
                                                          {60, 200, {-28116, -18744, 56153}},
                                                          {0, 160, {-46372, 0, 46307}}};
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    VECTOR v{};
    for (int32_t doubled : {0, 1, 0}) {
        ASSERT_EQ(VRX_Hint(HINT_DOUBLED, doubled), 0);
        for (const auto& [sx, sy, dir] : cases) {
            ASSERT_EQ(VRX_GetShootingVector(c, sx, sy, &v), 0);
            EXPECT_EQ(v, dir) << doubled << ": " << sx << ", " << sy;
        }
    }
    // A selected window's centre is in its own size, whatever its position.
    WINDOW_INFO info{20, 40, 100, 50, 0};
    void* win = nullptr;
    ASSERT_EQ(VRX_NewWindow(&info, &win), 0);
    ASSERT_EQ(VRX_SelectWindow(win), 0);
    ASSERT_EQ(VRX_GetShootingVector(c, 50, 25, &v), 0);
    EXPECT_EQ(v, (VECTOR{0, 0, 65535}));
}

TEST_F(CameraTest, NamesDefaultCameraAndRelease) {
    const long before = alloc_outstanding();
    CAMERA* cams[4];
    const char* names[4] = {nullptr, "ROOM.000", "ROOM.001", "ROOM.000"};
    for (int i = 0; i < 4; ++i) {
        cams[i] = make({0, 0, 0}, {0, 0, E});
        if (i)
            cams[i]->name = std::strcpy(static_cast<char*>(vrx::engine::eng_malloc(9)), names[i]);
    }
    // Found without regard to case; the first of two equal names wins.
    const std::pair<const char*, CAMERA*> lookups[] = {
        {"room.001", cams[2]}, {"Room.000", cams[1]}, {"ROOM.00", nullptr}, {"", nullptr}};
    for (const auto& [query, found] : lookups) {
        void* out = reinterpret_cast<void*>(1);
        EXPECT_EQ(VRX_GetCameraByName(query, &out), found ? 0 : 1) << query;
        EXPECT_EQ(out, found) << query;
    }
    // The name and the track go with their camera; the default only with its own.
    using vrx::scene::CAM_KEYFRAME, vrx::scene::CAM_STATE, vrx::engine::eng_calloc;
    cams[2]->ckfr = static_cast<CAM_KEYFRAME*>(eng_calloc(1, sizeof(CAM_KEYFRAME)));
    cams[2]->ckfr->cam_state = static_cast<CAM_STATE*>(eng_calloc(2, sizeof(CAM_STATE)));
    ASSERT_EQ(VRX_SetDefaultCam(cams[1]), 0);
    ASSERT_EQ(VRX_DeleteCamera(cams[2]), 0);
    EXPECT_EQ(alloc_outstanding(), before + 5); // three cameras and two names left
    EXPECT_TRUE(cams[1]->next == cams[3] && cams[3]->prev == cams[1]);
    void* def = nullptr;
    ASSERT_EQ(VRX_GetDefaultCam(&def), 0);
    EXPECT_EQ(def, cams[1]);
    ASSERT_EQ(VRX_DeleteCamera(cams[1]), 0);
    EXPECT_EQ(g_eng.default_cam, nullptr);
    ASSERT_EQ(VRX_SetDefaultCam(cams[3]), 0);
    ASSERT_EQ(VRX_DeleteAllCameras(), 0);
    EXPECT_TRUE(!g_eng.default_cam && !g_eng.camera_list.head && !g_eng.camera_list.tail);
    EXPECT_EQ(alloc_outstanding(), before);
    ASSERT_EQ(VRX_SetDefaultCam(make({0, 0, 0}, {0, 0, E})), 0);
    ASSERT_EQ(VRX_Clear(), 0);
    EXPECT_EQ(g_eng.default_cam, nullptr);
    EXPECT_EQ(last_error(), "");
}

TEST_F(CameraTest, AllocationFailureIsReportedAndLeavesNothing) {
    CAMERA* kept = make({0, 0, 0}, {0, 0, E});
    const long before = alloc_outstanding();
    CAMSETUP s{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    void* out = nullptr;
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewCamera(&s, &out), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for pc in ENG_CreateCam fail!!\n");
    EXPECT_TRUE(out == nullptr && alloc_outstanding() == before);
    EXPECT_TRUE(g_eng.camera_list.head == kept && g_eng.camera_list.tail == kept);
}

struct CamOp {
    const char *op, *arg; // the name in its messages, the word for its pointer argument or null
    int32_t (*call)(void* camera, bool n); // with a null pointer argument when n is set
};
#define CAM_OP(o, a, e) (CamOp{o, a, [](void* c, bool n) { return (void)n, e; }})
#define ARG(x) (n ? nullptr : &x)

TEST_F(CameraTest, BadHandlesAndNullPointersAreRefusedWithExactMessages) {
    static VECTOR v{E, 0, 0};
    static CAMSETUP setup{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    static CAMINFO info{};
    static FIXED f = 0;
    static void* h = nullptr;
    const CamOp ops[] = {
        CAM_OP("DefaultCam", nullptr, VRX_SetDefaultCam(c)),
        CAM_OP("DeleteCam", nullptr, VRX_DeleteCamera(c)),
        CAM_OP("MoveCam", "vector", VRX_MoveCamera(c, ARG(v), 1)),
        CAM_OP("PanCam", nullptr, VRX_PanCamera(c, E)),
        CAM_OP("TiltCam", nullptr, VRX_TiltCamera(c, E)),
        CAM_OP("RollCam", nullptr, VRX_RollCamera(c, E)),
        CAM_OP("FreePanCam", "point", VRX_PanCameraTo(c, ARG(v))),
        CAM_OP("ArcCam", nullptr, VRX_ArcCamera(c, E, E)),
        CAM_OP("GlobalArcCam", nullptr, VRX_GlobalArcCamera(c, E, E)),
        CAM_OP("FOVCam", nullptr, VRX_SetCameraFOV(c, E)),
        CAM_OP("TruckCam", nullptr, VRX_TruckCamera(c, E)),
        CAM_OP("LiftCam", nullptr, VRX_LiftCamera(c, E)),
        CAM_OP("DollyCam", nullptr, VRX_DollyCamera(c, E)),
        CAM_OP("AdjustCam", "setup", VRX_ResetCamera(c, ARG(setup))),
        CAM_OP("SetCamInfo", "info", VRX_SetCameraInfo(c, ARG(info))),
        CAM_OP("GetCamInfo", "info", VRX_GetCameraInfo(c, ARG(info))),
        CAM_OP("SetCamPos", "point", VRX_SetCameraPos(c, ARG(v))),
        CAM_OP("GetCamPos", "out", VRX_GetCameraPos(c, ARG(v))),
        CAM_OP("SetCamAt", "point", VRX_SetCameraAt(c, ARG(v))),
        CAM_OP("GetCamAt", "out", VRX_GetCameraAt(c, ARG(v))),
        CAM_OP("SetCamNearClip", nullptr, VRX_SetCameraNearClip(c, E)),
        CAM_OP("GetCamNearClip", "out", VRX_GetCameraNearClip(c, ARG(f))),
        CAM_OP("SetCamFarClip", nullptr, VRX_SetCameraFarClip(c, E)),
        CAM_OP("GetCamFarClip", "out", VRX_GetCameraFarClip(c, ARG(f))),
        CAM_OP("GetSightingVecFromScr", "out", VRX_GetShootingVector(c, 0, 0, ARG(v)))};
    // The calls that take no camera, each with its one message.
    const std::pair<int32_t (*)(), const char*> others[] = {
        {[] { return VRX_NewCamera(nullptr, &h); }, "Wrong setup in ENG_CreateCam!!\n"},
        {[] { return VRX_NewCamera(&setup, nullptr); }, "Wrong out in ENG_CreateCam!!\n"},
        {[] { return VRX_GetDefaultCam(nullptr); }, "Wrong out in ENG_GetDefaultCam!!\n"},
        {[] { return VRX_GetCameraByName(nullptr, &h); }, "Wrong name in ENG_GetCamByName!!\n"},
        {[] { return VRX_GetCameraByName("A", nullptr); }, "Wrong out in ENG_GetCamByName!!\n"}};
    CAMERA* live = make({0, 0, 0}, {0, 0, E});
    unsigned char before[sizeof(CAMERA)];
    std::memcpy(before, live, sizeof before);
    const long allocated = alloc_outstanding();
    for (const CamOp& k : ops) {
        const std::string op = std::string("ENG_") + k.op;
        clear_last_error();
        EXPECT_EQ(k.call(nullptr, false), -1) << op;
        EXPECT_EQ(last_error(), "Wrong Camera Handle : 0\nWrong chd in " + op + "!!\n");
        if (!k.arg) continue;
        clear_last_error();
        EXPECT_EQ(k.call(live, true), -1) << op;
        EXPECT_EQ(last_error(), std::string("Wrong ") + k.arg + " in " + op + "!!\n");
    }
    for (const auto& [call, message] : others) {
        clear_last_error();
        EXPECT_EQ(call(), -1) << message;
        EXPECT_EQ(last_error(), message);
    }
    EXPECT_TRUE(!std::memcmp(before, live, sizeof before) && alloc_outstanding() == allocated);
    EXPECT_TRUE(g_eng.camera_list.tail == live && g_eng.default_cam == nullptr);
    // A camera made before a clear is no camera any more.
    ASSERT_EQ(VRX_Clear(), 0);
    clear_last_error();
    EXPECT_EQ(VRX_PanCamera(live, E), -1);
    EXPECT_EQ(last_error(), "This ID is not ID_CAMERA !!\nWrong chd in ENG_PanCam!!\n");
}

#undef CAM_OP
#undef ARG

} // namespace
