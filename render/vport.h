// The window record (a viewport over the render buffer) shared by the window operations,
// the engine state that holds the main window by value, and the projection.
#pragma once

#include <cstdint>

namespace vrx::render {

inline constexpr uint32_t kTagVport = 0x56505254; // 'VPRT'

struct VPORT {
    static constexpr uint32_t kTag = kTagVport;
    uint32_t tag;           // kind tag
    int32_t x, y;           // top-left pixel in the buffer
    int32_t width, height;  // size in pixels
    int32_t extra;          // the host's value, unused here
    int32_t aspect;         // width / height, 16.16
    int32_t half_w, half_h; // zoomed half sizes, 16.16
    int32_t center_x;       // zoomed centre, 16.16
    int32_t center_y;       // zoomed centre, 16.16
    int32_t sc_x, sc_y;     // scissor origin relative to the window
    int32_t sc_w, sc_h;     // scissor size
    int32_t sc_on;          // 1 when the scissor or zoom makes clipping necessary
    int32_t zoom_x, zoom_y; // 16.16 zoom factors
    VPORT* prev;            // window_list links
    VPORT* next;
};

} // namespace vrx::render
