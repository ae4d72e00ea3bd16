// The engine's global state: one aggregate, defined once in state.cpp. The library serves
// one thread, so nothing here is locked. Every subsystem reads and changes these fields by
// the names used throughout the engine.
#pragma once

#include <cstdint>

#include "engine/list.h"
#include "render/draw_list.h"
#include "render/svertex.h"
#include "render/vport.h"

namespace vrx::scene {
struct WORLD;
struct CAMERA;
struct MATERIAL;
} // namespace vrx::scene
namespace vrx::assets {
struct TEXTURE;
struct IMAGE;
} // namespace vrx::assets

namespace vrx::engine {

// Bits of eng_flags.
inline constexpr uint32_t FLAG_PERSPECTIVE = 1;
inline constexpr uint32_t FLAG_SORT = 2;
inline constexpr uint32_t FLAG_ZBUFFER = 4;
inline constexpr uint32_t FLAG_DOUBLE = 8;
inline constexpr uint32_t FLAG_FILTER = 16;

inline constexpr int32_t kDepthClear = 0x7FFFFFFF; // farthest depth
inline constexpr int kDataPathSize = 512;
inline constexpr int kLastErrorSize = 1024;

// The on-screen text console that every reported message is printed on.
struct CONSOLE {
    int32_t con_col, con_row;         // cursor, in cells
    int32_t con_cols, con_rows;       // console size in cells
    int32_t con_scale_x, con_scale_y; // glyph pixel scale, 1 to 8
    int32_t con_cell_w, con_cell_h;   // cell size in pixels
    uint16_t con_color;               // RGB565 colour of set glyph pixels
};

struct ENG_STATE {
    int32_t screen_w, screen_h;      // screen size from VRX_Open
    uint32_t screen_fmt;             // ColorFmt code of the screen
    int32_t buf_w, buf_h;            // render buffer size; buf_w is the pitch
    uint16_t* color_buf;             // host's colour buffer (never freed here)
    int32_t* depth_buf;              // current depth buffer
    int32_t* own_depth_buf;          // the depth buffer the engine allocated
    render::SVERTEX* vtx_buf;        // pipeline scratch vertices
    int32_t vtx_cap;                 // capacity of vtx_buf in records
    render::DRAW_LIST* draw_list;    // deferred draws of one render call
    render::VPORT main_window;       // full-screen window, never freed
    render::VPORT* cur_window;       // the selected window
    int32_t clip_left, clip_top;     // clip rectangle in buffer pixels
    int32_t clip_right, clip_bottom; // exclusive
    int32_t clip_on;                 // rasteriser clips only while set
    RecordList<scene::WORLD> world_list;
    RecordList<render::VPORT> window_list;
    RecordList<scene::CAMERA> camera_list;
    RecordList<scene::MATERIAL> material_list;
    RecordList<assets::TEXTURE> texture_list;
    RecordList<assets::IMAGE> image_list;
    scene::CAMERA* default_cam;          // camera of render calls given none
    scene::MATERIAL* cur_material;       // material the rasteriser was last set up for
    const uint8_t* resource_buffer;      // selected memory pack (host-owned)
    char pack_path[512];                 // selected pack file
    uint32_t pack_id;                    // identifier word of the pack file
    int32_t pack_count;                  // entries in the pack file's directory
    uint8_t* pack_dir;                   // heap copy of the pack file's directory
    uint32_t eng_flags = FLAG_ZBUFFER;   // FLAG_* render hints; depth on before any open
    char data_path[kDataPathSize];       // default data directory, ends in '\'
    char last_error[kLastErrorSize];     // accumulated error texts
    uint32_t mem_amount_1, mem_amount_2; // memory statistics (always 0)
    CONSOLE con;                         // the text console
    uint16_t* own_color_buf;             // doubled mode: engine-owned double-size colour buffer
    int32_t is_open;                     // between a successful VRX_Open and VRX_Close
};

extern ENG_STATE g_eng;
// The pipeline's static scratch vertices; vtx_buf points here until it needs more.
extern render::SVERTEX vtx_store[render::kVtxStoreCount];

} // namespace vrx::engine
