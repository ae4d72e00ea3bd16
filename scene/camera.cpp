// Cameras: creation and release, the look-at rebuild and the field-of-view update, the
// film-style moves (move, pan, tilt, roll, pan to a point, orbits, truck, lift, dolly),
// the setters and getters, and the shooting vector through a screen point. The exported
// operations are at the bottom.
#include "scene/camera.h"

#include <cstddef>
#include <type_traits>

#include "engine/error.h"
#include "engine/fixed.h"
#include "engine/names.h"
#include "engine/state.h"
#include "engine/vector.h"

namespace vrx::scene {

using engine::f_mul;
using engine::g_eng;
using engine::wrap_add;
using engine::wrap_sub;

static_assert(std::is_standard_layout_v<CAMERA>);
static_assert(offsetof(CAMERA, id) == 0, "the kind tag is the record's first word");

namespace {

// Y within about 12.5 degrees of the viewing direction (|Y . Z| at or above this) cannot
// give a stable X by a cross product; the rebuild starts from X instead.
constexpr uint32_t kNearParallel = 64001;
// Pan-to directions within about 2.6 degrees of the view or its reverse are ignored.
constexpr uint32_t kPanToLimit = 65470;
// The field of view is kept between 16 raw units and 175 degrees.
constexpr FIXED kFovMin = 16;
constexpr FIXED kFovMax = 0xAF0000;

bool is_zero(const VECTOR& v) noexcept {
    return v.x == 0 && v.y == 0 && v.z == 0;
}

// base + F_MUL(s, v) per component, each product shifted by itself.
VECTOR add_scaled(const VECTOR& base, FIXED s, const VECTOR& v) noexcept {
    return VECTOR{wrap_add(base.x, f_mul(s, v.x)), wrap_add(base.y, f_mul(s, v.y)),
                  wrap_add(base.z, f_mul(s, v.z))};
}

// base - F_MUL(s, v) per component. Products truncate toward minus infinity, so this is
// not base + F_MUL(-s, v).
VECTOR sub_scaled(const VECTOR& base, FIXED s, const VECTOR& v) noexcept {
    return VECTOR{wrap_sub(base.x, f_mul(s, v.x)), wrap_sub(base.y, f_mul(s, v.y)),
                  wrap_sub(base.z, f_mul(s, v.z))};
}

// F_MUL(a, p) + F_MUL(b, q) per component.
VECTOR combine(FIXED a, const VECTOR& p, FIXED b, const VECTOR& q) noexcept {
    return VECTOR{wrap_add(f_mul(a, p.x), f_mul(b, q.x)), wrap_add(f_mul(a, p.y), f_mul(b, q.y)),
                  wrap_add(f_mul(a, p.z), f_mul(b, q.z))};
}

// F_MUL(a, p) - F_MUL(b, q) per component.
VECTOR combine_sub(FIXED a, const VECTOR& p, FIXED b, const VECTOR& q) noexcept {
    return VECTOR{wrap_sub(f_mul(a, p.x), f_mul(b, q.x)), wrap_sub(f_mul(a, p.y), f_mul(b, q.y)),
                  wrap_sub(f_mul(a, p.z), f_mul(b, q.z))};
}

// Sine and cosine of an angle in degrees (16.16).
struct SinCos {
    FIXED s, c;
};
SinCos sin_cos(FIXED degrees) noexcept {
    const FIXED rad = engine::deg_to_rad(degrees);
    return {engine::Sin(rad), engine::Cos(rad)};
}

// X and Y from the current axes and a unit Z: from Y unless Y runs too close to Z, then
// from X; Y is normalised before X.
void build_axes(UCS& u) noexcept {
    if (engine::magnitude(engine::vec_dot(u.z, u.y)) < kNearParallel) {
        engine::vec_cross(u.y, u.z, u.x);
        engine::vec_cross(u.z, u.x, u.y);
    } else {
        engine::vec_cross(u.z, u.x, u.y);
        engine::vec_cross(u.y, u.z, u.x);
    }
    engine::vec_normalize(u.y);
    engine::vec_normalize(u.x);
}

} // namespace

void cam_look_at(CAMERA* c) noexcept {
    UCS& u = c->ucs;
    VECTOR z{};
    engine::vec_sub(c->at, u.origin, z);
    // With the target on the eye there is no viewing direction: the frame stays.
    if (is_zero(z)) return;
    engine::vec_normalize(z);
    u.z = z;
    build_axes(u);
    // Starting axes that were zero or parallel give no frame; start again upright.
    if (is_zero(u.x) || is_zero(u.y)) {
        engine::vec_identity_y(u.y);
        engine::vec_identity_x(u.x);
        build_axes(u);
    }
}

void cam_update_fov(CAMERA* c) noexcept {
    c->fov = engine::f_clamp(c->fov, kFovMin, kFovMax);
    const FIXED half = engine::deg_to_rad(c->fov >> 1); // half the angle, in radians
    c->tan_half = engine::Div(engine::Sin(half), engine::Cos(half));
    c->inv_tan = engine::Inverse(c->tan_half);
    c->near_extent = f_mul(c->tan_half, c->near_clip);
    c->far_extent = f_mul(c->far_clip, c->tan_half);
}

void cam_roll(CAMERA* c, FIXED degrees) noexcept {
    const SinCos a = sin_cos(degrees);
    const VECTOR x = c->ucs.x, y = c->ucs.y; // both turns read the old axes
    c->ucs.x = combine_sub(a.c, x, a.s, y);
    c->ucs.y = combine(a.c, y, a.s, x);
}

void camera_link(CAMERA* c) noexcept {
    g_eng.camera_list.append(c);
}

void camera_unlink(CAMERA* c) noexcept {
    g_eng.camera_list.unlink(c);
}

void camera_release(CAMERA* c) noexcept {
    if (g_eng.default_cam == c) g_eng.default_cam = nullptr;
    engine::eng_free(c->name);
    if (c->ckfr) {
        engine::eng_free(c->ckfr->cam_state);
        engine::eng_free(c->ckfr);
    }
    engine::free_record(c);
}

CAMERA* camera_by_name(const char* name) noexcept {
    for (CAMERA* c = g_eng.camera_list.head; c; c = c->next) {
        if (c->name && engine::StrCmpNoCase(c->name, name) == 0) return c;
    }
    return nullptr;
}

int32_t clear_cameras() noexcept {
    for (CAMERA* c = g_eng.camera_list.head; c;) {
        CAMERA* next = c->next;
        camera_release(c);
        c = next;
    }
    g_eng.camera_list.clear();
    return 0;
}

namespace {

// Makes a camera from a set-up; -1 after reporting when the clips are out of order or
// memory runs out.
int32_t cam_create(const CAMSETUP& s, CAMERA** out) noexcept {
    CAMERA* c = engine::new_record<CAMERA>(); // zeroed: no name, no track, key_index 0
    if (!c) {
        engine::ReportError("Allocate memory for pc in ENG_CreateCam fail!!\n");
        return -1;
    }
    c->ucs.origin = s.eye;
    c->at = s.at;
    c->fov = s.fov;
    c->near_clip = s.near_clip;
    c->far_clip = s.far_clip;
    if (!(s.near_clip < s.far_clip)) {
        engine::free_record(c);
        engine::ReportError("The Far_Clip must be greater than Near_Clip !!\n");
        return -1;
    }
    if (c->near_clip < 0x10000) c->near_clip = 0x10000; // nothing nearer than 1.0
    engine::vec_identity_y(c->ucs.y);
    engine::vec_identity_x(c->ucs.x);
    engine::vec_identity_z(c->ucs.z); // kept if the target lies on the eye
    cam_look_at(c);
    cam_update_fov(c);
    camera_link(c);
    *out = c;
    return 0;
}

// Translation: mode 0 in camera axes, 1 in world axes, 2 to a world point; other modes
// change nothing.
void cam_move(CAMERA* c, const VECTOR& v, int32_t mode) noexcept {
    VECTOR d{};
    switch (mode) {
        case 0:
            engine::dir_to_global(v, c->ucs, d);
            break;
        case 1:
            d = v;
            break;
        case 2:
            engine::vec_sub(v, c->ucs.origin, d);
            break;
        default:
            return;
    }
    engine::vec_add(c->ucs.origin, d, c->ucs.origin);
    engine::vec_add(c->at, d, c->at);
}

// Distance from the eye to the target.
FIXED eye_distance(const CAMERA* c) noexcept {
    VECTOR d{};
    engine::vec_sub(c->ucs.origin, c->at, d);
    return engine::vec_len(d);
}

// Turns the target about the eye, left and right.
void cam_pan(CAMERA* c, FIXED degrees) noexcept {
    const FIXED r = eye_distance(c);
    const SinCos a = sin_cos(degrees);
    const FIXED rs = f_mul(a.s, r), rc = f_mul(a.c, r);
    c->at = add_scaled(add_scaled(c->ucs.origin, rc, c->ucs.z), rs, c->ucs.x);
    cam_look_at(c);
}

// Turns the target about the eye, up and down; Y turns with it so the rebuild keeps it.
void cam_tilt(CAMERA* c, FIXED degrees) noexcept {
    const FIXED r = eye_distance(c);
    const SinCos a = sin_cos(degrees);
    const FIXED rs = f_mul(a.s, r), rc = f_mul(a.c, r);
    UCS& u = c->ucs;
    c->at = add_scaled(add_scaled(u.origin, rc, u.z), rs, u.y);
    u.y = combine_sub(a.c, u.y, a.s, u.z);
    cam_look_at(c);
}

// Looks at p from the same eye. Directions within about 2.6 degrees of the current view
// or its reverse, and a point on the eye, change nothing. The new Y is the old Y (or the
// old Z when the new view runs close to the old Y) made perpendicular to the new Z and
// turned to the old Y's side; X = Y x Z; both unit.
void cam_pan_to(CAMERA* c, const VECTOR& p) noexcept {
    UCS& u = c->ucs;
    VECTOR d{};
    engine::vec_sub(p, u.origin, d);
    engine::vec_normalize(d);
    if (is_zero(d) || engine::magnitude(engine::vec_dot(d, u.z)) > kPanToLimit) return;

    const VECTOR old_y = u.y;
    const FIXED along_y = engine::vec_dot(old_y, d);
    const bool from_y = engine::magnitude(along_y) < kNearParallel;
    // Looking along the old Y, start from the old Z the way a tilt toward d carries the top
    // (backward when looking up), so that the choice stands when the old Y has no side.
    const VECTOR z_back{-u.z.x, -u.z.y, -u.z.z};
    VECTOR y = from_y ? old_y : (along_y > 0 ? z_back : u.z);
    // Drop the part along d. d is unit only to the normalisation's precision (about 2e-4
    // for long vectors), which leaves a residue along d; a second pass removes it.
    y = sub_scaled(y, engine::vec_dot(y, d), d);
    y = sub_scaled(y, engine::vec_dot(y, d), d);
    engine::vec_normalize(y);
    if (engine::vec_dot(y, old_y) < 0) y = VECTOR{-y.x, -y.y, -y.z}; // unit: no overflow

    u.z = d;
    u.y = y;
    // X = Y x Z, normalised as the look-at rebuild does.
    engine::vec_cross(u.y, u.z, u.x);
    engine::vec_normalize(u.x);
    c->at = p;
}

// Orbits the eye about the target in the camera's axes: a1 sideways, then a2 up and down.
void cam_arc(CAMERA* c, FIXED a1, FIXED a2) noexcept {
    const FIXED r = eye_distance(c);
    UCS& u = c->ucs;
    if (a1 != 0) {
        const SinCos a = sin_cos(a1);
        const FIXED rs = f_mul(a.s, r), rc = f_mul(a.c, r);
        u.origin = sub_scaled(add_scaled(c->at, rs, u.x), rc, u.z);
        cam_look_at(c);
    }
    if (a2 != 0) {
        const SinCos a = sin_cos(a2);
        const FIXED rs = f_mul(a.s, r), rc = f_mul(a.c, r);
        u.origin = sub_scaled(add_scaled(c->at, rs, u.y), rc, u.z);
        u.y = combine(a.c, u.y, a.s, u.z);
        cam_look_at(c);
    }
}

// Orbits the eye about the target in world axes: a1 about the vertical, then a2 in
// elevation. Y restarts upright before each rebuild.
void cam_global_arc(CAMERA* c, FIXED a1, FIXED a2) noexcept {
    VECTOR& eye = c->ucs.origin;
    const VECTOR& at = c->at;
    if (a1 != 0) {
        const SinCos a = sin_cos(a1);
        VECTOR d{};
        engine::vec_sub(eye, at, d);
        eye.x = wrap_add(at.x, wrap_sub(f_mul(a.c, d.x), f_mul(a.s, d.z)));
        eye.z = wrap_add(at.z, wrap_add(f_mul(a.c, d.z), f_mul(a.s, d.x)));
        engine::vec_identity_y(c->ucs.y);
        cam_look_at(c);
    }
    if (a2 != 0) {
        const SinCos a = sin_cos(a2);
        VECTOR d{};
        engine::vec_sub(eye, at, d);
        // Horizontal distance; the squares are summed in 32 bits.
        const FIXED sq = wrap_add(f_mul(d.z, d.z), f_mul(d.x, d.x));
        const FIXED h = sq < 1 ? 0 : engine::Sqrt(sq);
        eye.y = wrap_add(at.y, wrap_add(f_mul(d.y, a.c), f_mul(a.s, h)));
        // The new horizontal distance over the old one scales x and z alike.
        const FIXED k = engine::Div(wrap_sub(f_mul(h, a.c), f_mul(a.s, d.y)), h);
        eye.x = wrap_add(at.x, f_mul(k, d.x));
        eye.z = wrap_add(at.z, f_mul(k, d.z));
        engine::vec_identity_y(c->ucs.y);
        cam_look_at(c);
    }
}

// Eye and target move together along a camera axis.
void cam_slide(CAMERA* c, FIXED distance, const VECTOR& axis) noexcept {
    const VECTOR step{f_mul(distance, axis.x), f_mul(distance, axis.y), f_mul(distance, axis.z)};
    engine::vec_add(c->ucs.origin, step, c->ucs.origin);
    engine::vec_add(c->at, step, c->at);
}

// The unit world direction from the eye through screen point (sx, sy) of the current
// window; in doubled mode the point is given in screen pixels and doubled first.
VECTOR shooting_vector(const CAMERA* c, int32_t sx, int32_t sy) noexcept {
    const render::VPORT* w = g_eng.cur_window;
    const int32_t hw = w->width >> 1, hh = w->height >> 1;
    if (g_eng.eng_flags & engine::FLAG_DOUBLE) {
        sx = engine::wrap_shl(sx, 1);
        sy = engine::wrap_shl(sy, 1);
    }
    // Offsets from the centre as fractions of the half sizes; y grows upward and is
    // corrected for the window's aspect.
    const FIXED nx = engine::Div(engine::wrap_shl(wrap_sub(sx, hw), 16), engine::wrap_shl(hw, 16));
    const FIXED ny = engine::Div(engine::wrap_shl(wrap_sub(hh, sy), 16),
                                 f_mul(engine::wrap_shl(hh, 16), w->aspect));
    const UCS& u = c->ucs;
    VECTOR dir = add_scaled(combine(ny, u.y, nx, u.x), c->inv_tan, u.z);
    engine::vec_normalize(dir);
    return dir;
}

} // namespace

} // namespace vrx::scene

using namespace vrx;
using scene::CAMERA;

namespace {

// The camera behind a handle, or null after chk_camera's message and the operation's own.
CAMERA* camera_arg(void* h, const char* op) noexcept {
    if (engine::chk_camera(h)) {
        engine::ReportError("Wrong chd in %s!!\n", op);
        return nullptr;
    }
    return static_cast<CAMERA*>(h);
}

// False after reporting when a pointer argument is null.
bool present(const void* p, const char* what, const char* op) noexcept {
    if (p) return true;
    engine::ReportError("Wrong %s in %s!!\n", what, op);
    return false;
}

// The getters: one camera field copied out.
template <class T> int32_t get_field(void* camera, T* out, T CAMERA::*field, const char* op) {
    CAMERA* c = camera_arg(camera, op);
    if (!c || !present(out, "out", op)) return -1;
    *out = c->*field;
    return 0;
}

// A clip distance and the half-extent of the view at that distance.
int32_t set_clip(void* camera, FIXED distance, FIXED CAMERA::*clip, FIXED CAMERA::*extent,
                 const char* op) {
    CAMERA* c = camera_arg(camera, op);
    if (!c) return -1;
    c->*clip = distance;
    c->*extent = engine::f_mul(distance, c->tan_half);
    return 0;
}

} // namespace

// Host-visible records: layouts fixed by the interface.
static_assert(std::is_standard_layout_v<CAMSETUP> && sizeof(CAMSETUP) == 9 * 4);
static_assert(offsetof(CAMSETUP, at) == 12 && offsetof(CAMSETUP, fov) == 24 &&
              offsetof(CAMSETUP, near_clip) == 28 && offsetof(CAMSETUP, far_clip) == 32);
static_assert(std::is_standard_layout_v<CAMINFO> && sizeof(CAMINFO) == 18 * 4);
static_assert(offsetof(CAMINFO, x_axis) == 12 && offsetof(CAMINFO, y_axis) == 24 &&
              offsetof(CAMINFO, z_axis) == 36 && offsetof(CAMINFO, at) == 48 &&
              offsetof(CAMINFO, fov) == 60 && offsetof(CAMINFO, near_clip) == 64 &&
              offsetof(CAMINFO, far_clip) == 68);

extern "C" {

VRX_API int32_t VRX_NewCamera(const CAMSETUP* setup, void** out) noexcept {
    if (!present(setup, "setup", "ENG_CreateCam") || !present(out, "out", "ENG_CreateCam"))
        return -1;
    CAMERA* c = nullptr;
    if (scene::cam_create(*setup, &c) != 0) return -1;
    *out = c;
    return 0;
}

VRX_API int32_t VRX_SetDefaultCam(void* camera) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_DefaultCam");
    if (!c) return -1;
    engine::g_eng.default_cam = c;
    return 0;
}

VRX_API int32_t VRX_GetDefaultCam(void** out) noexcept {
    if (!present(out, "out", "ENG_GetDefaultCam")) return -1;
    *out = engine::g_eng.default_cam;
    return 0;
}

VRX_API int32_t VRX_GetCameraByName(const char* name, void** out) noexcept {
    if (!present(name, "name", "ENG_GetCamByName") || !present(out, "out", "ENG_GetCamByName"))
        return -1;
    CAMERA* c = scene::camera_by_name(name);
    *out = c;
    return c ? 0 : 1;
}

VRX_API int32_t VRX_DeleteCamera(void* camera) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_DeleteCam");
    if (!c) return -1;
    scene::camera_unlink(c);
    scene::camera_release(c);
    return 0;
}

VRX_API int32_t VRX_DeleteAllCameras(void) noexcept {
    return scene::clear_cameras();
}

VRX_API int32_t VRX_MoveCamera(void* camera, const VECTOR* v, int32_t mode) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_MoveCam");
    if (!c || !present(v, "vector", "ENG_MoveCam")) return -1;
    scene::cam_move(c, *v, mode);
    return 0;
}

VRX_API int32_t VRX_PanCamera(void* camera, FIXED degrees) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_PanCam");
    if (!c) return -1;
    scene::cam_pan(c, degrees);
    return 0;
}

VRX_API int32_t VRX_TiltCamera(void* camera, FIXED degrees) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_TiltCam");
    if (!c) return -1;
    scene::cam_tilt(c, degrees);
    return 0;
}

VRX_API int32_t VRX_RollCamera(void* camera, FIXED degrees) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_RollCam");
    if (!c) return -1;
    scene::cam_roll(c, degrees);
    return 0;
}

VRX_API int32_t VRX_PanCameraTo(void* camera, const VECTOR* point) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_FreePanCam");
    if (!c || !present(point, "point", "ENG_FreePanCam")) return -1;
    scene::cam_pan_to(c, *point);
    return 0;
}

VRX_API int32_t VRX_ArcCamera(void* camera, FIXED a1, FIXED a2) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_ArcCam");
    if (!c) return -1;
    scene::cam_arc(c, a1, a2);
    return 0;
}

VRX_API int32_t VRX_GlobalArcCamera(void* camera, FIXED a1, FIXED a2) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_GlobalArcCam");
    if (!c) return -1;
    scene::cam_global_arc(c, a1, a2);
    return 0;
}

VRX_API int32_t VRX_SetCameraFOV(void* camera, FIXED degrees) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_FOVCam");
    if (!c) return -1;
    c->fov = degrees;
    scene::cam_update_fov(c);
    return 0;
}

VRX_API int32_t VRX_TruckCamera(void* camera, FIXED distance) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_TruckCam");
    if (!c) return -1;
    scene::cam_slide(c, distance, c->ucs.x);
    return 0;
}

VRX_API int32_t VRX_LiftCamera(void* camera, FIXED distance) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_LiftCam");
    if (!c) return -1;
    scene::cam_slide(c, distance, c->ucs.y);
    return 0;
}

VRX_API int32_t VRX_DollyCamera(void* camera, FIXED distance) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_DollyCam");
    if (!c) return -1;
    scene::cam_slide(c, distance, c->ucs.z);
    return 0;
}

VRX_API int32_t VRX_ResetCamera(void* camera, const CAMSETUP* setup) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_AdjustCam");
    if (!c || !present(setup, "setup", "ENG_AdjustCam")) return -1;
    c->ucs.origin = setup->eye;
    c->at = setup->at;
    c->fov = setup->fov;
    c->near_clip = setup->near_clip;
    c->far_clip = setup->far_clip;
    scene::cam_look_at(c);
    scene::cam_update_fov(c);
    return 0;
}

VRX_API int32_t VRX_SetCameraInfo(void* camera, const CAMINFO* info) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_SetCamInfo");
    if (!c || !present(info, "info", "ENG_SetCamInfo")) return -1;
    c->ucs = UCS{info->eye, info->x_axis, info->y_axis, info->z_axis};
    c->at = info->at;
    c->fov = info->fov;
    c->near_clip = info->near_clip;
    c->far_clip = info->far_clip;
    scene::cam_look_at(c);
    scene::cam_update_fov(c);
    return 0;
}

VRX_API int32_t VRX_GetCameraInfo(void* camera, CAMINFO* info) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_GetCamInfo");
    if (!c || !present(info, "info", "ENG_GetCamInfo")) return -1;
    *info = CAMINFO{c->ucs.origin, c->ucs.x, c->ucs.y,     c->ucs.z,
                    c->at,         c->fov,   c->near_clip, c->far_clip};
    return 0;
}

VRX_API int32_t VRX_SetCameraPos(void* camera, const VECTOR* eye) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_SetCamPos");
    if (!c || !present(eye, "point", "ENG_SetCamPos")) return -1;
    c->ucs.origin = *eye;
    scene::cam_look_at(c);
    return 0;
}

VRX_API int32_t VRX_GetCameraPos(void* camera, VECTOR* eye) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_GetCamPos");
    if (!c || !present(eye, "out", "ENG_GetCamPos")) return -1;
    *eye = c->ucs.origin;
    return 0;
}

VRX_API int32_t VRX_SetCameraAt(void* camera, const VECTOR* at) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_SetCamAt");
    if (!c || !present(at, "point", "ENG_SetCamAt")) return -1;
    c->at = *at;
    scene::cam_look_at(c);
    return 0;
}

VRX_API int32_t VRX_GetCameraAt(void* camera, VECTOR* at) noexcept {
    return get_field(camera, at, &CAMERA::at, "ENG_GetCamAt");
}

VRX_API int32_t VRX_SetCameraNearClip(void* camera, FIXED distance) noexcept {
    return set_clip(camera, distance, &CAMERA::near_clip, &CAMERA::near_extent,
                    "ENG_SetCamNearClip");
}

VRX_API int32_t VRX_GetCameraNearClip(void* camera, FIXED* distance) noexcept {
    return get_field(camera, distance, &CAMERA::near_clip, "ENG_GetCamNearClip");
}

VRX_API int32_t VRX_SetCameraFarClip(void* camera, FIXED distance) noexcept {
    return set_clip(camera, distance, &CAMERA::far_clip, &CAMERA::far_extent, "ENG_SetCamFarClip");
}

VRX_API int32_t VRX_GetCameraFarClip(void* camera, FIXED* distance) noexcept {
    return get_field(camera, distance, &CAMERA::far_clip, "ENG_GetCamFarClip");
}

VRX_API int32_t VRX_GetShootingVector(void* camera, int32_t sx, int32_t sy, VECTOR* out) noexcept {
    CAMERA* c = camera_arg(camera, "ENG_GetSightingVecFromScr");
    if (!c || !present(out, "out", "ENG_GetSightingVecFromScr")) return -1;
    *out = scene::shooting_vector(c, sx, sy);
    return 0;
}

} // extern "C"
