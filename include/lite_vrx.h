/*
 * lite_vrx: a fixed-point software 3D engine rendering into RGB565 colour buffers.
 *
 * This is the whole public interface: a flat C API usable from C99 and C++. Every
 * number is 16.16 fixed point (FIXED, 0x10000 is 1.0) unless a comment says
 * otherwise. Operations return 0 on success and -1 on failure; the failure's text is
 * drawn on the engine's on-screen console and kept for VRX_GetLastError.
 *
 * Handles are plain pointers to engine-owned records. The engine refuses a handle of
 * the wrong kind, a null handle, or one it no longer owns, and reports why.
 */
#ifndef LITE_VRX_H
#define LITE_VRX_H

#include <stdint.h>

#if defined(_WIN32)
#if defined(VRX_STATIC)
#define VRX_API
#elif defined(VRX_BUILDING)
#define VRX_API __declspec(dllexport)
#else
#define VRX_API __declspec(dllimport)
#endif
#else
#define VRX_API __attribute__((visibility("default")))
#endif

#ifdef __cplusplus
#define VRX_NOEXCEPT noexcept
extern "C" {
#else
#define VRX_NOEXCEPT
#endif

/* ---- Shared types ------------------------------------------------------------ */

typedef int32_t FIXED; /* 16.16 fixed point */

typedef struct VECTOR {
    FIXED x, y, z;
} VECTOR;

typedef struct VECTOR2 {
    FIXED x, y;
} VECTOR2;

/* A coordinate system: origin, then the X, Y and Z axes, all in parent coordinates. */
typedef struct UCS {
    VECTOR origin;
    VECTOR x, y, z;
} UCS;

/* A mesh vertex: position, normal and texture coordinates (32 bytes). */
typedef struct VERTEX {
    VECTOR pos;
    VECTOR normal;
    FIXED u, v;
} VERTEX;

/* One triangle of VRX_GetObjectPolygons and VRX_RenderPolygonList: a frame whose origin is
   the reference point (axes unit), the material, then three vertices whose positions are
   relative to the reference point and whose normals are in world coordinates. */
typedef struct POLYGON {
    UCS ucs;
    void* material;
    VERTEX v[3];
} POLYGON;

/* Host geometry of a window, in screen pixels. */
typedef struct WINDOW_INFO {
    int32_t x, y;
    int32_t width, height;
    int32_t extra; /* kept for the host, unused by the engine */
} WINDOW_INFO;

/* Pixel-format codes of the screen and of textures. */
enum {
    VRX_FMT_RGB565 = 0,
    VRX_FMT_RGB888 = 2,
    VRX_FMT_ARGB8888 = 3,
    VRX_FMT_RGBA4444 = 4
};

/* Render hints for VRX_Hint. */
enum {
    HINT_PERSPECTIVE = 0,
    HINT_DEPTH = 1,
    HINT_DOUBLED = 2,
    HINT_SORTED = 3,
    HINT_FILTERED = 4
};

/* ---- Engine -------------------------------------------------------------------- */

/* Starts the engine for a screen of width x height pixels in format color_fmt. */
VRX_API int32_t VRX_Open(uint32_t reserved, uint32_t width, uint32_t height,
                         uint32_t color_fmt) VRX_NOEXCEPT;
/* Frees every record and the engine's buffers; the engine may be opened again. */
VRX_API int32_t VRX_Close(void) VRX_NOEXCEPT;
/* Frees every scene record and keeps the engine open. */
VRX_API int32_t VRX_Clear(void) VRX_NOEXCEPT;
/* Sets the directory that model and texture names are looked up in. */
VRX_API int32_t VRX_SetDefaultDataPath(const char* path) VRX_NOEXCEPT;
/* Copies the version text (10 bytes with its terminator) into out. */
VRX_API int32_t VRX_GetVersion(char* out) VRX_NOEXCEPT;
/* Stores the two memory statistics; always returns -1. */
VRX_API int32_t VRX_GetUsedMemAmount(uint32_t* out1, uint32_t* out2) VRX_NOEXCEPT;
/* Copies the accumulated error text into dst, which must hold 1024 bytes. */
VRX_API int32_t VRX_GetLastError(char* dst) VRX_NOEXCEPT;
/* Sets a render hint (HINT_*); returns -1 for an unknown or refused hint. */
VRX_API int32_t VRX_Hint(int32_t hint, uint32_t value) VRX_NOEXCEPT;

/* ---- Arithmetic ---------------------------------------------------------------- */

/* Square root; 0 for x <= 0. */
VRX_API FIXED EGL_Sqrt(FIXED x) VRX_NOEXCEPT;
/* 1/sqrt(x) for positive x; 0x7FFFFFFF for x <= 0. */
VRX_API FIXED EGL_InvSqrt(FIXED x) VRX_NOEXCEPT;
/* 1/x; 0x7FFFFFFF for 0, +-0x7FFFFFFF for magnitudes 1 and 2 raw units. */
VRX_API FIXED EGL_Inverse(FIXED x) VRX_NOEXCEPT;
/* 1/x with 24 fraction bits, for |x| > 0.5; 0x7FFFFFFF for 0. */
VRX_API int32_t EGL_hInverse(FIXED x) VRX_NOEXCEPT;
/* a/b; a zero divisor multiplies a by 0x7FFFFFFF. */
VRX_API FIXED EGL_Div(FIXED a, FIXED b) VRX_NOEXCEPT;
/* Sine of an angle in radians (one turn is 411775); result within -65534..65534. */
VRX_API FIXED EGL_Sin(FIXED angle) VRX_NOEXCEPT;
/* Cosine of an angle in radians; result within -65534..65534. */
VRX_API FIXED EGL_Cos(FIXED angle) VRX_NOEXCEPT;
/* The smaller of a and b (signed). */
VRX_API FIXED F_MIN(FIXED a, FIXED b) VRX_NOEXCEPT;
/* The larger of a and b (signed). */
VRX_API FIXED F_MAX(FIXED a, FIXED b) VRX_NOEXCEPT;
/* The smaller of two integers (same routine as F_MIN). */
VRX_API int32_t I_MIN(int32_t a, int32_t b) VRX_NOEXCEPT;
/* The larger of two integers (same routine as F_MAX). */
VRX_API int32_t I_MAX(int32_t a, int32_t b) VRX_NOEXCEPT;
/* Nearest integer of x, halves rounded upward. */
VRX_API int32_t I_RND(FIXED x) VRX_NOEXCEPT;

/* ---- Vectors and coordinate systems -------------------------------------------- */

/* out = a + b (out may be a or b). */
VRX_API void Vpp(const VECTOR* a, const VECTOR* b, VECTOR* out) VRX_NOEXCEPT;
/* out = a - b (out may be a or b). */
VRX_API void Vmm(const VECTOR* a, const VECTOR* b, VECTOR* out) VRX_NOEXCEPT;
/* v = s * v, in place. */
VRX_API void Vxx(FIXED s, VECTOR* v) VRX_NOEXCEPT;
/* Dot product, summed in 64 bits. */
VRX_API FIXED Vdot(const VECTOR* a, const VECTOR* b) VRX_NOEXCEPT;
/* out = a x b; out must differ from a and b. */
VRX_API void Vcross(const VECTOR* a, const VECTOR* b, VECTOR* out) VRX_NOEXCEPT;
/* Length of v (up to 5792.6 as documented; longer vectors scaled further). */
VRX_API FIXED Vlen(const VECTOR* v) VRX_NOEXCEPT;
/* 1/length of v; v must be shorter than 181.0. */
VRX_API FIXED invVlen(const VECTOR* v) VRX_NOEXCEPT;
/* Scales v to unit length in place (any length). */
VRX_API void vrxNormalize(VECTOR* v) VRX_NOEXCEPT;
/* Same as vrxNormalize. */
VRX_API void sim_normalize(VECTOR* v) VRX_NOEXCEPT;
/* out = a + b (out may be a or b). */
VRX_API void V2pp(const VECTOR2* a, const VECTOR2* b, VECTOR2* out) VRX_NOEXCEPT;
/* out = a - b (out may be a or b). */
VRX_API void V2mm(const VECTOR2* a, const VECTOR2* b, VECTOR2* out) VRX_NOEXCEPT;
/* v = s * v, in place. */
VRX_API void V2xx(FIXED s, VECTOR2* v) VRX_NOEXCEPT;
/* Dot product of two-component vectors, summed in 64 bits. */
VRX_API FIXED V2dot(const VECTOR2* a, const VECTOR2* b) VRX_NOEXCEPT;
/* Scales v to unit length in place; v must be shorter than 181.0. */
VRX_API void V2norm(VECTOR2* v) VRX_NOEXCEPT;
/* v = (1, 0, 0). */
VRX_API void IdentityX(VECTOR* v) VRX_NOEXCEPT;
/* v = (0, 1, 0). */
VRX_API void IdentityY(VECTOR* v) VRX_NOEXCEPT;
/* v = (0, 0, 1). */
VRX_API void IdentityZ(VECTOR* v) VRX_NOEXCEPT;
/* out = local expressed in parent's coordinates (out may be local, never parent). */
VRX_API void GlobalUCS(const UCS* local, const UCS* parent, UCS* out) VRX_NOEXCEPT;
/* out = a local point of ucs in parent coordinates (out may be p). */
VRX_API void GlobalBase(const VECTOR* p, const UCS* ucs, VECTOR* out) VRX_NOEXCEPT;
/* out = a local direction of ucs in parent coordinates (out may be d). */
VRX_API void GlobalDir(const VECTOR* d, const UCS* ucs, VECTOR* out) VRX_NOEXCEPT;
/* out = a expressed in frame's coordinates (out may be a); returns 0. */
VRX_API int32_t LocalUCS(const UCS* a, const UCS* frame, UCS* out) VRX_NOEXCEPT;
/* out = a parent-space point in frame's coordinates (out may be p); returns 0. */
VRX_API int32_t LocalBase(const VECTOR* p, const UCS* frame, VECTOR* out) VRX_NOEXCEPT;
/* out = a parent-space direction in frame's coordinates (out may be d); returns 0. */
VRX_API int32_t LocalDir(const VECTOR* d, const UCS* frame, VECTOR* out) VRX_NOEXCEPT;
/* out = inverse of ucs; returns 0, or 1 with out the identity when singular. */
VRX_API int32_t ucs_invert(const UCS* ucs, UCS* out) VRX_NOEXCEPT;
/* Turns ucs about its own axes by whole degrees: (X,Y) a1, (Y,Z) a2, (Z,X) a3; returns 0. */
VRX_API int32_t VRX_RotateUCS(UCS* ucs, int32_t a1, int32_t a2, int32_t a3) VRX_NOEXCEPT;
/* Undoes VRX_RotateUCS with the same angles; returns 0. */
VRX_API int32_t VRX_ReverseRotateUCS(UCS* ucs, int32_t a1, int32_t a2, int32_t a3) VRX_NOEXCEPT;

/* ---- Windows and render buffer ------------------------------------------------- */

/* Makes a window from info and stores its handle through out. */
VRX_API int32_t VRX_NewWindow(const WINDOW_INFO* info, void** out) VRX_NOEXCEPT;
/* Selects a window: its scissor becomes the clip rectangle. */
VRX_API int32_t VRX_SelectWindow(void* win) VRX_NOEXCEPT;
/* Stores the selected window through out. */
VRX_API int32_t VRX_GetCurrentWindow(void** out) VRX_NOEXCEPT;
/* Replaces a window's geometry; the scissor becomes the whole window. */
VRX_API int32_t VRX_SetWindowInfo(void* win, const WINDOW_INFO* info) VRX_NOEXCEPT;
/* Reads a window's geometry. */
VRX_API int32_t VRX_GetWindowInfo(void* win, WINDOW_INFO* info) VRX_NOEXCEPT;
/* Sets the scissor in window pixels; -1 when it does not meet the window. */
VRX_API int32_t VRX_WindowScissor(void* win, int32_t x, int32_t y, int32_t w,
                                  int32_t h) VRX_NOEXCEPT;
/* Reads the scissor. */
VRX_API int32_t VRX_GetWindowScissor(void* win, int32_t* x, int32_t* y, int32_t* w,
                                     int32_t* h) VRX_NOEXCEPT;
/* Sets the 16.16 zoom factors of a window. */
VRX_API int32_t VRX_SetWindowZoomFactor(void* win, FIXED zx, FIXED zy) VRX_NOEXCEPT;
/* Reads the zoom factors of a window. */
VRX_API int32_t VRX_GetWindowZoomFactor(void* win, FIXED* zx, FIXED* zy) VRX_NOEXCEPT;
/* Fills a window's scissor with the colour rgb[0..2] (and clears its depth). */
VRX_API int32_t VRX_ClearWindow(void* win, const uint8_t* rgb) VRX_NOEXCEPT;
/* Deletes a window; deleting the selected one selects the main window. */
VRX_API int32_t VRX_DeleteWindow(void* win) VRX_NOEXCEPT;
/* Clears the whole colour buffer (and the depth buffer while depth testing is on). */
VRX_API int32_t VRX_ClearRenderBuffer(int32_t r, int32_t g, int32_t b) VRX_NOEXCEPT;
/* Copies a w x h block from the host's arrays into the buffers at (x, y). */
VRX_API int32_t VRX_CopyToRenderBuffer(int32_t x, int32_t y, int32_t w, int32_t h,
                                       const uint16_t* colors, const int32_t* depths) VRX_NOEXCEPT;
/* Copies a w x h block from the buffers at (x, y) into the host's arrays. */
VRX_API int32_t VRX_CopyFromRenderBuffer(int32_t x, int32_t y, int32_t w, int32_t h,
                                         uint16_t* colors, int32_t* depths) VRX_NOEXCEPT;
/* Reads the buffer size and pointers; null outputs are skipped. */
VRX_API int32_t VRX_GetRenderBuffer(int32_t* width, int32_t* height, uint16_t** colors,
                                    int32_t** depths) VRX_NOEXCEPT;
/* Hands the engine a colour and/or depth buffer; null arguments keep the current one. */
VRX_API int32_t VRX_SetRenderBuffer(uint16_t* colors, int32_t* depths) VRX_NOEXCEPT;
/* Ends a frame (reducing the picture to screen size in doubled mode). */
VRX_API int32_t VRX_SwapRenderBuffer(void) VRX_NOEXCEPT;

/* ---- Worlds -------------------------------------------------------------------- */

/* Makes a world (bit 0 of visible set: drawn) and stores its handle through out. */
VRX_API int32_t VRX_NewWorld(uint32_t visible, void** out) VRX_NOEXCEPT;
/* Deletes a world with its objects, omni lights and billboards. */
VRX_API int32_t VRX_DeleteWorld(void* world) VRX_NOEXCEPT;
/* Sets a world's visibility word (bit 0: drawn by the render calls). */
VRX_API int32_t VRX_SetWorldVisibility(void* world, uint32_t visible) VRX_NOEXCEPT;

/* ---- Cameras ------------------------------------------------------------------- */

/* Set-up of a new or reset camera; fov in degrees. */
typedef struct CAMSETUP {
    VECTOR eye;
    VECTOR at; /* target */
    FIXED fov;
    FIXED near_clip;
    FIXED far_clip;
} CAMSETUP;

/* Everything a camera shows the host: eye, frame, target, fov (degrees) and clips. */
typedef struct CAMINFO {
    VECTOR eye;
    VECTOR x_axis; /* right */
    VECTOR y_axis; /* up */
    VECTOR z_axis; /* viewing direction */
    VECTOR at;     /* target */
    FIXED fov;
    FIXED near_clip;
    FIXED far_clip;
} CAMINFO;

/* Makes a camera looking from eye at the target; near must be below far. */
VRX_API int32_t VRX_NewCamera(const CAMSETUP* setup, void** out) VRX_NOEXCEPT;
/* Names the camera the render calls use when given none. */
VRX_API int32_t VRX_SetDefaultCam(void* camera) VRX_NOEXCEPT;
/* Stores the default camera (null when there is none) through out. */
VRX_API int32_t VRX_GetDefaultCam(void** out) VRX_NOEXCEPT;
/* Finds a named camera, ignoring ASCII case; returns 1 with out null when none matches. */
VRX_API int32_t VRX_GetCameraByName(const char* name, void** out) VRX_NOEXCEPT;
/* Deletes a camera. */
VRX_API int32_t VRX_DeleteCamera(void* camera) VRX_NOEXCEPT;
/* Deletes every camera. */
VRX_API int32_t VRX_DeleteAllCameras(void) VRX_NOEXCEPT;
/* Moves eye and target: mode 0 by v in camera axes, 1 by v in world axes, 2 eye to v. */
VRX_API int32_t VRX_MoveCamera(void* camera, const VECTOR* v, int32_t mode) VRX_NOEXCEPT;
/* Turns the target about the eye, left and right (degrees). */
VRX_API int32_t VRX_PanCamera(void* camera, FIXED degrees) VRX_NOEXCEPT;
/* Turns the target about the eye, up and down (degrees). */
VRX_API int32_t VRX_TiltCamera(void* camera, FIXED degrees) VRX_NOEXCEPT;
/* Turns the camera about its viewing direction (degrees). */
VRX_API int32_t VRX_RollCamera(void* camera, FIXED degrees) VRX_NOEXCEPT;
/* Looks at a new target from the same eye. */
VRX_API int32_t VRX_PanCameraTo(void* camera, const VECTOR* point) VRX_NOEXCEPT;
/* Orbits the eye about the target in camera axes: a1 sideways, a2 up and down (degrees). */
VRX_API int32_t VRX_ArcCamera(void* camera, FIXED a1, FIXED a2) VRX_NOEXCEPT;
/* Orbits the eye about the target in world axes: a1 about the vertical, a2 in elevation. */
VRX_API int32_t VRX_GlobalArcCamera(void* camera, FIXED a1, FIXED a2) VRX_NOEXCEPT;
/* Sets the field of view in degrees (kept between 16 raw units and 175 degrees). */
VRX_API int32_t VRX_SetCameraFOV(void* camera, FIXED degrees) VRX_NOEXCEPT;
/* Moves eye and target along the camera's X axis. */
VRX_API int32_t VRX_TruckCamera(void* camera, FIXED distance) VRX_NOEXCEPT;
/* Moves eye and target along the camera's Y axis. */
VRX_API int32_t VRX_LiftCamera(void* camera, FIXED distance) VRX_NOEXCEPT;
/* Moves eye and target along the camera's Z axis. */
VRX_API int32_t VRX_DollyCamera(void* camera, FIXED distance) VRX_NOEXCEPT;
/* Replaces eye, target, fov and clips (the clips are not checked). */
VRX_API int32_t VRX_ResetCamera(void* camera, const CAMSETUP* setup) VRX_NOEXCEPT;
/* Replaces everything; the given axes only start the rebuild of the frame. */
VRX_API int32_t VRX_SetCameraInfo(void* camera, const CAMINFO* info) VRX_NOEXCEPT;
/* Reads eye, frame, target, fov and clips. */
VRX_API int32_t VRX_GetCameraInfo(void* camera, CAMINFO* info) VRX_NOEXCEPT;
/* Moves the eye; the camera keeps looking at its target. */
VRX_API int32_t VRX_SetCameraPos(void* camera, const VECTOR* eye) VRX_NOEXCEPT;
/* Reads the eye. */
VRX_API int32_t VRX_GetCameraPos(void* camera, VECTOR* eye) VRX_NOEXCEPT;
/* Moves the target; the eye stays. */
VRX_API int32_t VRX_SetCameraAt(void* camera, const VECTOR* at) VRX_NOEXCEPT;
/* Reads the target. */
VRX_API int32_t VRX_GetCameraAt(void* camera, VECTOR* at) VRX_NOEXCEPT;
/* Sets the near clip distance (not checked against the far one). */
VRX_API int32_t VRX_SetCameraNearClip(void* camera, FIXED distance) VRX_NOEXCEPT;
/* Reads the near clip distance. */
VRX_API int32_t VRX_GetCameraNearClip(void* camera, FIXED* distance) VRX_NOEXCEPT;
/* Sets the far clip distance. */
VRX_API int32_t VRX_SetCameraFarClip(void* camera, FIXED distance) VRX_NOEXCEPT;
/* Reads the far clip distance. */
VRX_API int32_t VRX_GetCameraFarClip(void* camera, FIXED* distance) VRX_NOEXCEPT;
/* Unit world direction from the eye through screen point (sx, sy) of the current window. */
VRX_API int32_t VRX_GetShootingVector(void* camera, int32_t sx, int32_t sy,
                                      VECTOR* out) VRX_NOEXCEPT;

/* ---- Materials ----------------------------------------------------------------- */

/* Material settings as the host passes and reads them. Colours are bytes r, g, b, a
 * (255 is 1.0); the multipliers and self-illumination are FIXED. */
typedef struct MATINFO {
    void* texture;       /* bound texture handle, or null */
    uint8_t ambient[4];  /* ambient r, g, b, a */
    uint8_t diffuse[4];  /* diffuse r, g, b, a; a is the opacity */
    FIXED ambient_scale; /* ambient multiplier */
    FIXED diffuse_scale; /* diffuse multiplier */
    FIXED self_illum;    /* 0 to 1.0; 1.0 draws the diffuse colour unlit */
    uint32_t flags;      /* VRX_MAT_* bits, shading mode in VRX_MAT_SHADING */
} MATINFO;

/* Bits of MATINFO.flags. */
enum {
    VRX_MAT_TWO_SIDED = 1,  /* faces drawn from both sides */
    VRX_MAT_REFLECT = 2,    /* texture coordinates by reflection mapping */
    VRX_MAT_UNTEXTURED = 4, /* drawn untextured even with a texture bound */
    VRX_MAT_SHADING = 0x38  /* shading mode times 8 */
};

/* Makes an unnamed material from info (one use) and stores its handle through out. */
VRX_API int32_t VRX_CreateMaterial(const MATINFO* info, void** out) VRX_NOEXCEPT;
/* Copies a material (name included) into a new one with one use. */
VRX_API int32_t VRX_DuplicateMaterial(void* mat, void** out) VRX_NOEXCEPT;
/* Releases one use of a material; the last use frees it. */
VRX_API int32_t VRX_DeleteMaterial(void* mat) VRX_NOEXCEPT;
/* Records the engine's default material. */
VRX_API int32_t VRX_SetDefaultMaterial(void* mat) VRX_NOEXCEPT;
/* Finds a named material, ignoring ASCII case; returns 1 with out null when none matches. */
VRX_API int32_t VRX_GetMaterialByName(const char* name, void** out) VRX_NOEXCEPT;
/* Copies the name (at most 24 characters; empty when unnamed) into buf, 25 bytes. */
VRX_API int32_t VRX_GetMaterialName(void* mat, char* buf) VRX_NOEXCEPT;
/* Sets the ambient (which 0) or diffuse (otherwise) colour from 4 bytes r, g, b, a. */
VRX_API int32_t VRX_SetMaterialColor(void* mat, const uint8_t* rgba, int32_t which) VRX_NOEXCEPT;
/* Reads the ambient (which 0) or diffuse colour as 4 bytes. */
VRX_API int32_t VRX_GetMaterialColor(void* mat, uint8_t* rgba, int32_t which) VRX_NOEXCEPT;
/* Sets the ambient (which 0) or diffuse multiplier. */
VRX_API int32_t VRX_SetMaterialColorScale(void* mat, FIXED scale, int32_t which) VRX_NOEXCEPT;
/* Reads the ambient (which 0) or diffuse multiplier. */
VRX_API int32_t VRX_GetMaterialColorScale(void* mat, FIXED* scale, int32_t which) VRX_NOEXCEPT;
/* Sets the self-illumination, clamped to 0..1.0. */
VRX_API int32_t VRX_SetMaterialSelfIllum(void* mat, FIXED value) VRX_NOEXCEPT;
/* Reads the self-illumination. */
VRX_API int32_t VRX_GetMaterialSelfIllum(void* mat, FIXED* value) VRX_NOEXCEPT;
/* Draws faces from both sides when two_sided is not 0. */
VRX_API int32_t VRX_SetMaterialSide(void* mat, int32_t two_sided) VRX_NOEXCEPT;
/* Sets the shading mode 0 to 3; any other mode keeps the current one. */
VRX_API int32_t VRX_SetMaterialShading(void* mat, int32_t mode) VRX_NOEXCEPT;
/* Reads texture, colours, multipliers, self-illumination and flags. */
VRX_API int32_t VRX_GetMaterialInfo(void* mat, MATINFO* info) VRX_NOEXCEPT;
/* Replaces texture, colours, multipliers, self-illumination and flags. */
VRX_API int32_t VRX_SetMaterialInfo(void* mat, const MATINFO* info) VRX_NOEXCEPT;
/* Stores the bound texture (or null) through out. */
VRX_API int32_t VRX_GetMaterialTexture(void* mat, void** out) VRX_NOEXCEPT;
/* Binds a texture to a material. */
VRX_API int32_t VRX_BindMaterialTexture(void* mat, void* tex) VRX_NOEXCEPT;
/* Sets the texture scroll offsets (1.0 is the texture's size). */
VRX_API int32_t VRX_MoveMaterialTexture(void* mat, FIXED u, FIXED v) VRX_NOEXCEPT;

/* ---- Resource packs ------------------------------------------------------------ */

/* Selects a resource pack image in host memory (null deselects); the host keeps it alive. */
VRX_API int32_t VRX_SelectResourceBuffer(const void* pack) VRX_NOEXCEPT;
/* Selects a resource pack file (null deselects); -1 keeps the previous selection. */
VRX_API int32_t VRX_SelectResourceFile(const char* path) VRX_NOEXCEPT;

/* ---- Textures ------------------------------------------------------------------ */

/* Finds the texture called name or loads it from the data path; one more reference. */
VRX_API int32_t VRX_LoadTexture(const char* name, void** out) VRX_NOEXCEPT;
/* Makes a texture from a copy of width x height pixels in format (VRX_FMT_*). */
VRX_API int32_t VRX_LoadTextureFromMemory(int32_t width, int32_t height, const void* pixels,
                                          uint32_t format, void** out) VRX_NOEXCEPT;
/* Replaces a texture's pixels, resampling them when their size differs. */
VRX_API int32_t VRX_UpdateTextureData(void* tex, int32_t width, int32_t height, const void* pixels,
                                      uint32_t format) VRX_NOEXCEPT;
/* Drops one reference; the last one releases the texture. */
VRX_API int32_t VRX_UnloadTexture(void* tex) VRX_NOEXCEPT;
/* Stores the texture's (power-of-two) width and height. */
VRX_API int32_t VRX_GetTextureInfo(void* tex, int32_t* width, int32_t* height) VRX_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif /* LITE_VRX_H */
