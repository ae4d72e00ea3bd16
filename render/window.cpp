// Windows over the render buffer: creation, selection, scissor, zoom, clearing, deletion.
#include "render/window.h"

#include <algorithm>

#include "engine/error.h"
#include "engine/fixed.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "render/render_buffer.h"

namespace vrx::render {

using engine::g_eng;

namespace {

using engine::wrap_add;
using engine::wrap_mul;

// Projection values that follow the size, position and zoom.
void recalc_projection(VPORT* w) noexcept {
    // Bit 0 of the size is dropped so odd sizes centre like the even size below them.
    int32_t half_w = wrap_mul(w->width & ~1, 0x8000);
    int32_t half_h = wrap_add(wrap_mul(w->height & ~1, 0x8000), -0x4000); // quarter-pixel bias
    w->half_w = engine::F_MUL(w->zoom_x, half_w);
    w->half_h = engine::F_MUL(w->zoom_y, half_h);
    w->center_x = engine::F_MUL(w->zoom_x, wrap_add(half_w, wrap_mul(w->x, 0x10000)));
    w->center_y = engine::F_MUL(w->zoom_y, wrap_add(half_h, wrap_mul(w->y, 0x10000)));
}

// sc_on: clipping is needed when the scissor is not the whole window or a zoom is active.
void recalc_scissor_flag(VPORT* w) noexcept {
    bool whole = w->sc_x == 0 && w->sc_y == 0 && w->sc_w == w->width && w->sc_h == w->height;
    w->sc_on = (whole && w->zoom_x == 0x10000 && w->zoom_y == 0x10000) ? 0 : 1;
}

// Stores host geometry, doubled while doubled mode is on.
void store_info(VPORT* w, const WINDOW_INFO* info) noexcept {
    int32_t k = (g_eng.eng_flags & engine::FLAG_DOUBLE) ? 2 : 1;
    w->x = wrap_mul(info->x, k);
    w->y = wrap_mul(info->y, k);
    w->width = wrap_mul(info->width, k);
    w->height = wrap_mul(info->height, k);
    w->extra = info->extra;
}

// Host geometry must describe a window of at least one pixel.
bool info_ok(const WINDOW_INFO* info, const char* op) noexcept {
    if (!info) {
        engine::ReportError("Wrong info in %s!!\n", op);
        return false;
    }
    if (info->width < 1 || info->height < 1 || info->width > 0x4000 || info->height > 0x4000) {
        engine::ReportError("Wrong window size in %s!!\n", op);
        return false;
    }
    return true;
}

} // namespace

void WindowRecalc(VPORT* w) noexcept {
    // The ratio of the two whole sizes comes out of the division as a 16.16 value.
    w->aspect = engine::Div(w->width, w->height);
    recalc_projection(w);
    w->sc_x = w->sc_y = 0;
    w->sc_w = w->width;
    w->sc_h = w->height;
    w->sc_on = 0;
}

void SetCurWindow(VPORT* w) noexcept {
    g_eng.cur_window = w;
    g_eng.clip_left = w->x + w->sc_x;
    g_eng.clip_top = w->y + w->sc_y;
    g_eng.clip_right = g_eng.clip_left + w->sc_w;
    g_eng.clip_bottom = g_eng.clip_top + w->sc_h;
    g_eng.clip_on = w->sc_on;
}

int32_t clear_windows() noexcept {
    for (VPORT* w = g_eng.window_list.head; w;) {
        VPORT* next = w->next;
        engine::free_record(w);
        w = next;
    }
    g_eng.window_list.clear();
    SetCurWindow(&g_eng.main_window);
    return 0;
}

void scale_all_windows(bool doubled) noexcept {
    auto scale = [doubled](VPORT* w) {
        w->width = doubled ? wrap_mul(w->width, 2) : w->width / 2;
        w->height = doubled ? wrap_mul(w->height, 2) : w->height / 2;
        WindowRecalc(w);
    };
    scale(&g_eng.main_window);
    for (VPORT* w = g_eng.window_list.head; w; w = w->next) scale(w);
}

} // namespace vrx::render

using namespace vrx;
using render::VPORT;

namespace {
// The window behind a handle that passed chk_window.
VPORT* as_window(void* h) noexcept {
    return static_cast<VPORT*>(h);
}
} // namespace

extern "C" {

VRX_API int32_t VRX_NewWindow(const WINDOW_INFO* info, void** out) noexcept {
    if (!out) {
        engine::ReportError("Wrong out in ENG_CreateWindow!!\n");
        return -1;
    }
    if (!render::info_ok(info, "ENG_CreateWindow")) return -1;
    VPORT* w = engine::new_record<VPORT>();
    if (!w) {
        engine::ReportError("Allocate memory for pv in ENG_CreateWindow fail!!\n");
        return -1;
    }
    render::store_info(w, info);
    w->zoom_x = w->zoom_y = 0x10000;
    render::WindowRecalc(w);
    engine::g_eng.window_list.append(w);
    *out = w;
    return 0;
}

VRX_API int32_t VRX_SelectWindow(void* win) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in ENG_SelectWindow!!\n");
        return -1;
    }
    render::SetCurWindow(as_window(win));
    return 0;
}

VRX_API int32_t VRX_GetCurrentWindow(void** out) noexcept {
    if (!out) {
        engine::ReportError("Wrong out in VRX_GetCurrentWindow!!\n");
        return -1;
    }
    *out = engine::g_eng.cur_window;
    return 0;
}

VRX_API int32_t VRX_SetWindowInfo(void* win, const WINDOW_INFO* info) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in ENG_SetWindowInfo!!\n");
        return -1;
    }
    if (!render::info_ok(info, "ENG_SetWindowInfo")) return -1;
    render::store_info(as_window(win), info);
    render::WindowRecalc(as_window(win));
    return 0;
}

VRX_API int32_t VRX_GetWindowInfo(void* win, WINDOW_INFO* info) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in ENG_GetWindowInfo!!\n");
        return -1;
    }
    if (!info) {
        engine::ReportError("Wrong info in ENG_GetWindowInfo!!\n");
        return -1;
    }
    const VPORT* w = as_window(win);
    int32_t k = (engine::g_eng.eng_flags & engine::FLAG_DOUBLE) ? 2 : 1;
    info->x = w->x / k;
    info->y = w->y / k;
    info->width = w->width / k;
    info->height = w->height / k;
    info->extra = w->extra;
    return 0;
}

VRX_API int32_t VRX_WindowScissor(void* win, int32_t x, int32_t y, int32_t w, int32_t h) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in VRX_WindowScissor!!\n");
        return -1;
    }
    VPORT* v = as_window(win);
    // 64-bit ends so a huge size cannot wrap into a small rectangle.
    int64_t x0 = std::max<int64_t>(x, 0), y0 = std::max<int64_t>(y, 0);
    int64_t x1 = std::min<int64_t>(int64_t{x} + w, v->width);
    int64_t y1 = std::min<int64_t>(int64_t{y} + h, v->height);
    if (x0 >= x1 || y0 >= y1) return -1;
    v->sc_x = static_cast<int32_t>(x0);
    v->sc_y = static_cast<int32_t>(y0);
    v->sc_w = static_cast<int32_t>(x1 - x0);
    v->sc_h = static_cast<int32_t>(y1 - y0);
    render::recalc_scissor_flag(v);
    if (v == engine::g_eng.cur_window) render::SetCurWindow(v);
    return 0;
}

VRX_API int32_t VRX_GetWindowScissor(void* win, int32_t* x, int32_t* y, int32_t* w,
                                     int32_t* h) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in VRX_GetWindowScissor!!\n");
        return -1;
    }
    if (!x || !y || !w || !h) {
        engine::ReportError("Wrong out in VRX_GetWindowScissor!!\n");
        return -1;
    }
    const VPORT* v = as_window(win);
    *x = v->sc_x;
    *y = v->sc_y;
    *w = v->sc_w;
    *h = v->sc_h;
    return 0;
}

VRX_API int32_t VRX_SetWindowZoomFactor(void* win, FIXED zx, FIXED zy) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in VRX_SetWindowZoomFactor!!\n");
        return -1;
    }
    VPORT* v = as_window(win);
    v->zoom_x = zx;
    v->zoom_y = zy;
    render::recalc_scissor_flag(v);
    render::recalc_projection(v);
    if (v == engine::g_eng.cur_window) render::SetCurWindow(v);
    return 0;
}

VRX_API int32_t VRX_GetWindowZoomFactor(void* win, FIXED* zx, FIXED* zy) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in VRX_GetWindowZoomFactor!!\n");
        return -1;
    }
    if (!zx || !zy) {
        engine::ReportError("Wrong out in VRX_GetWindowZoomFactor!!\n");
        return -1;
    }
    *zx = as_window(win)->zoom_x;
    *zy = as_window(win)->zoom_y;
    return 0;
}

VRX_API int32_t VRX_ClearWindow(void* win, const uint8_t* rgb) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in ENG_ClearWindow!!\n");
        return -1;
    }
    const engine::ENG_STATE& e = engine::g_eng;
    if (!rgb || !e.color_buf) {
        engine::ReportError("No colour or render buffer in ENG_ClearWindow!!\n");
        return -1;
    }
    const VPORT* v = as_window(win);
    int64_t x = int64_t{v->x} + v->sc_x, y = int64_t{v->y} + v->sc_y;
    // The fill itself does not clip: a scissor reaching outside the buffer is refused.
    if (x < 0 || y < 0 || x + v->sc_w > e.buf_w || y + v->sc_h > e.buf_h) {
        engine::ReportError("Window outside the render buffer in ENG_ClearWindow!!\n");
        return -1;
    }
    auto color =
        static_cast<uint16_t>(((rgb[0] >> 3) << 11) | ((rgb[1] >> 2) << 5) | (rgb[2] >> 3));
    render::FillRect(static_cast<int32_t>(x), static_cast<int32_t>(y), v->sc_w, v->sc_h, color);
    return 0;
}

VRX_API int32_t VRX_DeleteWindow(void* win) noexcept {
    if (engine::chk_window(win)) {
        engine::ReportError("Wrong whd in ENG_DeleteWindow!!\n");
        return -1;
    }
    VPORT* v = as_window(win);
    if (v == &engine::g_eng.main_window) {
        engine::ReportError("The main window cannot be deleted in ENG_DeleteWindow!!\n");
        return -1;
    }
    engine::g_eng.window_list.unlink(v);
    if (v == engine::g_eng.cur_window) render::SetCurWindow(&engine::g_eng.main_window);
    engine::free_record(v);
    return 0;
}

} // extern "C"
