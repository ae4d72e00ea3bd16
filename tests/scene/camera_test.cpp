// Cameras: creation, field of view, every move with values worked out by hand from the engine's
// arithmetic, the shooting vector, names, the default camera, release and the refusals.
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
    // Z = (0, 0, 10.0) times 1 / sqrt(100.0) = 6553 raw; a new camera is not the default.
    EXPECT_EQ(make({0, 0, 0}, {0, 0, 10 * E})->ucs.z, (VECTOR{0, 0, 65530}));
    EXPECT_EQ(g_eng.default_cam, nullptr);
    // Near, far, stored near (0: refused). Near below far is checked before a near clip under
    // 1.0 is raised to 1.0; tan 45 degrees comes out as 65637.
    const FIXED cases[][3] = {{200 * E, 100 * E, 0},
                              {100 * E, 100 * E, 0},
                              {0x8000, 0xC000, E},
                              {2 * E, 5 * E, 2 * E},
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
    // Half angle ((fov >> 1) * 1144) >> 16 radians; tan = EGL_Div(sin, cos), then 1 / tan; clips
    // 1.0 and 100.0. 180 is stored as 175; at 16 raw the half angle is 0 and 1 / tan saturates.
    const FIXED cases[][6] = {{90 * E, 90 * E, 65637, 65435, 65637, 6563700},
                              {E, E, 503, 8538753, 503, 50300},
                              {180 * E, 0xAF0000, 1523780, 2818, 1523780, 152378000},
                              {-5 * E, 16, 0, 0x7FFFFFFF, 0, 0}};
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    for (const auto& k : cases) {
        ASSERT_EQ(VRX_SetCameraFOV(c, k[0]), 0);
        const FIXED got[5] = {c->fov, c->tan_half, c->inv_tan, c->near_extent, c->far_extent};
        for (int i = 0; i < 5; ++i) EXPECT_EQ(got[i], k[i + 1]) << k[0] << " field " << i;
    }
    EXPECT_EQ(make({0, 0, 0}, {0, 0, E}, 0)->fov, 16); // the same limits at creation
}

TEST_F(CameraTest, TranslationsMoveEyeAndTargetAndKeepTheFrame) {
    static const VECTOR mv[] = {{10 * E, 0, -E}, {E, 2 * E, 3 * E}, {E, E, E}};
    // Axes X = (0, 0, -1), Y = (0, 1, 0), Z = (1, 0, 0); eye (1, 2, 3). Mode 2 goes to v, mode 0
    // moves by v in camera axes, mode 1 by v, others not at all; each row starts where the last
    // one left the camera.
    const std::pair<Op, VECTOR> cases[] = {
        {call(VRX_MoveCamera, &mv[0], 2), {9 * E, -2 * E, -4 * E}},
        {call(VRX_MoveCamera, &mv[1], 0), {3 * E, 2 * E, -E}},
        {call(VRX_MoveCamera, &mv[1], 1), {E, 2 * E, 3 * E}},
        {call(VRX_MoveCamera, &mv[2], 3), {0, 0, 0}},
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

TEST_F(CameraTest, TurnsMoveTheTargetOrTheEye) {
    // sin 90 = S = 65534, cos 90 = 0; sin 30 = 32767, cos 30 = 56754. Roll: X' = cos X - sin Y,
    // Y' = cos Y + sin X, products truncated alone. Pan, tilt: r = 1 / (1 / sqrt(100.0)) = 655407.
    // Arcs 30: rs = 327693, rc = 567580. Global arc 90 then up 30: h = EGL_Sqrt(100.0) = 655407.
    // Pan to: Y from the old Y, or the old Z when looking along the old Y, turned to the old Y's
    // side (with no side, backward when looking up, as a tilt); X = Y x Z. Near the view or its
    // reverse, or on the eye, nothing changes.
    auto with_y = [](VECTOR y, Op op) -> Op {
        return [=](void* c) {
            static_cast<CAMERA*>(c)->ucs.y = y;
            return op(c);
        };
    };
    static const VECTOR to[] = {{E, 0, 0}, {0, E, 0}, {E / 40, 0, E}, {0, -E / 40, -E}, {0, 0, 0}};
    const FIXED S = 65534, U = 65535, B = -10 * E, T = 10 * E;
    struct Turn {
        Op op;
        FIXED v[13]; // the eye turning (1) or the target (0); the point that moves, X, Y, Z
    };
    const Turn cases[] = {
        {call(VRX_RollCamera, 30 * E), {0, 0, 0, T, 56754, -32767, 0, 32767, 56754, 0, 0, 0, E}},
        {with_y({0, 3, 0}, call(VRX_RollCamera, 30 * E)),
         {0, 0, 0, T, 56754, -1, 0, 32767, 2, 0, 0, 0, E}},
        {call(VRX_RollCamera, 0), {0, 0, 0, T, S, 0, 0, 0, S, 0, 0, 0, E}},
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
         {1, 567502, 327693, 0, 0, 0, U, -32773, 56753, 0, -56746, -32767, 0}},
        {call(VRX_PanCameraTo, &to[0]), {0, E, 0, 0, 0, 0, -E, 0, E, 0, E, 0, 0}},
        {with_y({0x2000, E, -0x2000}, call(VRX_PanCameraTo, &to[1])),
         {0, 0, E, 0, E, 0, 0, 0, 0, -E, 0, E, 0}},
        {with_y({0x2000, E, 0x2000}, call(VRX_PanCameraTo, &to[1])),
         {0, 0, E, 0, -E, 0, 0, 0, 0, E, 0, E, 0}},
        {call(VRX_PanCameraTo, &to[1]), {0, 0, E, 0, E, 0, 0, 0, 0, -E, 0, E, 0}}, // as a tilt
        {call(VRX_PanCameraTo, &to[2]), {0, 0, 0, T, E, 0, 0, 0, E, 0, 0, 0, E}},
        {call(VRX_PanCameraTo, &to[3]), {0, 0, 0, T, E, 0, 0, 0, E, 0, 0, 0, E}},
        {call(VRX_PanCameraTo, &to[4]), {0, 0, 0, T, E, 0, 0, 0, E, 0, 0, 0, E}}};
    for (const Turn& k : cases) {
        const VECTOR o{0, 0, 0}, ahead{0, 0, T}, back{0, 0, B};
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

TEST_F(CameraTest, SettersRebuildTheFrame) {
    // (10.0, 0, 10.0) squared sums to 200.0: inverse root 4634 raw (seed 4729, 4630, 4634, 4634).
    CAMERA* c = make({0, 0, 0}, {0, 0, 10 * E});
    const VECTOR at{10 * E, 0, 10 * E}, eye{10 * E, 0, 0};
    ASSERT_EQ(VRX_SetCameraAt(c, &at), 0);
    EXPECT_EQ(c->ucs.z, (VECTOR{46340, 0, 46340}));
    ASSERT_EQ(VRX_SetCameraPos(c, &eye), 0); // back in line: along +Z again
    EXPECT_EQ(c->ucs.z, (VECTOR{0, 0, 65530}));
    // The clip setters neither order the clips nor raise the near one; tan 45 is 65637.
    ASSERT_EQ(VRX_SetCameraFarClip(c, 50 * E), 0);
    ASSERT_EQ(VRX_SetCameraNearClip(c, 0x8000), 0);
    EXPECT_TRUE(c->near_extent == 32818 && c->far_extent == 50 * 65637);
    // The given axes only start the rebuild, so a rolled Y survives; zero axes or axes along the
    // view give no frame by cross products and restart upright, one raw short of 1.0.
    CAMINFO in{
        {0, 0, 0}, {56754, -32767, 0}, {32767, 56754, 0}, {0, 0, E}, {0, 0, 10 * E}, 60 * E, 2 * E,
        30 * E};
    ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
    EXPECT_TRUE(std::abs(c->ucs.y.x - 32767) <= 8 && std::abs(c->ucs.y.y - 56754) <= 8);
    EXPECT_EQ(c->near_extent, 75672); // 2.0 times tan 30
    for (const VECTOR& axis : {VECTOR{0, 0, 0}, VECTOR{0, 0, E}, VECTOR{0, 0, -E}}) {
        in.x_axis = in.y_axis = axis;
        ASSERT_EQ(VRX_SetCameraInfo(c, &in), 0);
        EXPECT_TRUE(c->ucs.x == (VECTOR{65535, 0, 0}) && c->ucs.y == (VECTOR{0, 65535, 0}));
    }
    // A target on the eye has no direction: the frame stays as it was.
    CAMERA* p = make_exact({E, E, E}, {E, E, 10 * E});
    ASSERT_EQ(VRX_SetCameraPos(p, &p->at), 0);
    EXPECT_TRUE(p->ucs.z == (VECTOR{0, 0, E}) && p->ucs.y == (VECTOR{0, E, 0}));
}

TEST_F(CameraTest, ShootingVectorThroughScreenPointsInNormalAndDoubledMode) {
    // 240 x 320, inv_tan 65435. (0, 0): nx = EGL_Div(-120.0, 120.0) = -65520, ny = 87360, then
    // (-65520, 87358, 65429) normalised. Doubled, window and points double: the same directions.
    const std::tuple<int32_t, int32_t, VECTOR> cases[] = {{0, 0, {-33730, 44971, 33682}},
                                                          {120, 160, {0, 0, 65535}},
                                                          {240, 320, {33729, -44973, 33682}}};
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

TEST_F(CameraTest, RefusalsReportExactMessagesAndChangeNothing) {
    static VECTOR v{E, 0, 0};
    static void* h = nullptr;
    static CAMERA* live = nullptr;
    live = make({0, 0, 0}, {0, 0, E});
    const std::string chd = "Wrong Camera Handle : 0\nWrong chd in ENG_";
    // The messages differ only in the operation's name: a few bad handles, then one of each kind
    // of pointer argument.
    const std::pair<int32_t (*)(), std::string> cases[] = {
        {[] { return VRX_DeleteCamera(nullptr); }, chd + "DeleteCam!!\n"},
        {[] { return VRX_PanCamera(nullptr, E); }, chd + "PanCam!!\n"},
        {[] { return VRX_GetShootingVector(nullptr, 0, 0, &v); },
         chd + "GetSightingVecFromScr!!\n"},
        {[] { return VRX_MoveCamera(live, nullptr, 1); }, "Wrong vector in ENG_MoveCam!!\n"},
        {[] { return VRX_PanCameraTo(live, nullptr); }, "Wrong point in ENG_FreePanCam!!\n"},
        {[] { return VRX_ResetCamera(live, nullptr); }, "Wrong setup in ENG_AdjustCam!!\n"},
        {[] { return VRX_SetCameraInfo(live, nullptr); }, "Wrong info in ENG_SetCamInfo!!\n"},
        {[] { return VRX_GetCameraNearClip(live, nullptr); },
         "Wrong out in ENG_GetCamNearClip!!\n"},
        {[] { return VRX_NewCamera(nullptr, &h); }, "Wrong setup in ENG_CreateCam!!\n"},
        {[] { return VRX_GetDefaultCam(nullptr); }, "Wrong out in ENG_GetDefaultCam!!\n"},
        {[] { return VRX_GetCameraByName(nullptr, &h); }, "Wrong name in ENG_GetCamByName!!\n"}};
    unsigned char before[sizeof(CAMERA)];
    std::memcpy(before, live, sizeof before);
    const long allocated = alloc_outstanding();
    for (const auto& [call, message] : cases) {
        clear_last_error();
        EXPECT_EQ(call(), -1) << message;
        EXPECT_EQ(last_error(), message);
    }
    EXPECT_TRUE(!std::memcmp(before, live, sizeof before) && alloc_outstanding() == allocated);
    EXPECT_TRUE(g_eng.camera_list.tail == live && g_eng.default_cam == nullptr);
    CAMSETUP s{{0, 0, 0}, {0, 0, E}, 90 * E, E, 100 * E};
    clear_last_error();
    vrx::engine::alloc_fail_at(1, false);
    EXPECT_EQ(VRX_NewCamera(&s, &h), -1);
    vrx::engine::alloc_fail_at(0, false);
    EXPECT_EQ(last_error(), "Allocate memory for pc in ENG_CreateCam fail!!\n");
    EXPECT_TRUE(h == nullptr && alloc_outstanding() == allocated && g_eng.camera_list.tail == live);
    // A camera made before a clear is no camera any more.
    ASSERT_EQ(VRX_Clear(), 0);
    clear_last_error();
    EXPECT_EQ(VRX_PanCamera(live, E), -1);
    EXPECT_EQ(last_error(), "This ID is not ID_CAMERA !!\nWrong chd in ENG_PanCam!!\n");
}

} // namespace
