// The camera record: an eye point, a target point, the orthonormal frame built from them,
// a field of view and near and far clip distances, with the values the projection reads.
// Cameras live on camera_list in creation order. Engine files add a name and a keyframe
// track of camera states.
#pragma once

#include <cstdint>

#include "engine/handles.h"
#include "lite_vrx.h"

namespace vrx::scene {

// One state of a camera track: eye, target, roll and field of view (degrees), all 16.16.
struct CAM_STATE {
    VECTOR eye;
    VECTOR at;
    FIXED roll;
    FIXED fov;
};

// A camera's keyframe track. Contract: the record and its cam_state array are allocated
// with eng_malloc/eng_calloc and belong to the camera, which frees both when released.
struct CAM_KEYFRAME {
    int32_t count;        // number of states
    CAM_STATE* cam_state; // count states
    int32_t one;          // set to 1 when the track is made
};

struct CAMERA {
    static constexpr uint32_t kTag = engine::TAG_CAMERA;
    uint32_t id;     // kind tag 'CAME'; 0 once released
    char* name;      // owned (eng_malloc), upper-cased, or null
    UCS ucs;         // origin: the eye; axes X right, Y up, Z toward the target
    VECTOR at;       // target
    FIXED fov;       // field of view in degrees, 16 raw units to 175.0
    FIXED near_clip; // clip distances
    FIXED far_clip;
    FIXED near_extent; // F_MUL(tan_half, near_clip): near plane in scaled view space
    FIXED far_extent;  // F_MUL(far_clip, tan_half)
    FIXED inv_tan;     // 1 / tan_half
    FIXED tan_half;    // tan(fov / 2)
    CAMERA* prev;      // camera_list links
    CAMERA* next;
    int32_t key_index;  // current camera keyframe
    CAM_KEYFRAME* ckfr; // keyframe track, or null
};

// Rebuilds the frame after the eye or the target moved: Z toward the target, X and Y
// perpendicular to it, starting from the current Y (or X when Y is too close to Z), so a
// roll survives.
void cam_look_at(CAMERA* c) noexcept;

// Clamps fov to 16 raw units .. 175 degrees and recomputes tan_half, inv_tan, near_extent
// and far_extent.
void cam_update_fov(CAMERA* c) noexcept;

// Turns X and Y about Z by `degrees` (16.16); the frame is not rebuilt.
void cam_roll(CAMERA* c, FIXED degrees) noexcept;

// Appends a camera at the tail of camera_list / removes it from the list.
void camera_link(CAMERA* c) noexcept;
void camera_unlink(CAMERA* c) noexcept;

// Frees a camera that is not on camera_list: its name, its track and the record. If it is
// default_cam, default_cam becomes none, so the render calls never see a freed camera.
void camera_release(CAMERA* c) noexcept;

// The first named camera on camera_list whose name equals `name` without regard to ASCII
// case, or null.
CAMERA* camera_by_name(const char* name) noexcept;

// Frees every camera on camera_list and empties it; the cameras step of ClearAllObjects
// and VRX_DeleteAllCameras. Never fails: returns 0.
int32_t clear_cameras() noexcept;

} // namespace vrx::scene
