// The engine's lifecycle: open, close, clear, and the small global queries.
#include "engine/lifecycle.h"

#include <cstring>

#include "assets/texture.h"
#include "engine/alloc.h"
#include "engine/console.h"
#include "engine/error.h"
#include "engine/fixed.h"
#include "engine/handles.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "render/raster.h"
#include "render/render_buffer.h"
#include "render/window.h"
#include "scene/camera.h"
#include "scene/material.h"
#include "scene/world.h"

namespace vrx::engine {

namespace {

// One step of ClearAllObjects: frees one kind of record; its message is reported when
// it fails, and no later step runs.
struct ClearStep {
    int32_t (*run)() noexcept;
    const char* failure;
};

// In the order records must go: users before what they use, worlds last.
constexpr ClearStep kClearSteps[] = {
    {assets::ClearTextures, "Clear textures failed in ClearAllObjects!!\n"},
    {scene::clear_materials, "Clear materials failed in ClearAllObjects!!\n"},
    {scene::clear_cameras, "Clear cameras failed in ClearAllObjects!!\n"},
    {render::clear_windows, "Clear windows failed in ClearAllObjects!!\n"},
    // Worlds last; this step cannot fail, so its message is never reported.
    {scene::clear_worlds, "Clear worlds failed in ClearAllObjects!!\n"},
};

void release_buffers() noexcept {
    eng_free(g_eng.pack_dir);
    g_eng.pack_dir = nullptr;
    eng_free(g_eng.draw_list);
    g_eng.draw_list = nullptr;
    render::RenderBufFree();
}

} // namespace

bool refuse_closed(const char* fn) noexcept {
    if (g_eng.is_open) return false;
    ReportError("%s: the engine is not open!!\n", fn);
    return true;
}

int32_t ClearAllObjects() noexcept {
    for (const ClearStep& step : kClearSteps) {
        if (step.run() != 0) {
            ReportError("%s", step.failure);
            return -1;
        }
    }
    return 0;
}

int32_t Init_ENG20() noexcept {
    render::VPORT& mw = g_eng.main_window;
    mw = render::VPORT{};
    mw.tag = TAG_VPORT;
    mw.width = g_eng.screen_w;
    mw.height = g_eng.screen_h;
    mw.zoom_x = mw.zoom_y = 0x10000;
    if (!registry_add(&mw, TAG_VPORT)) {
        ReportError("Register main window fail in Init_ENG20!!\n");
        return -1;
    }

    g_eng.world_list.clear();
    g_eng.texture_list.clear();
    g_eng.material_list.clear();
    g_eng.camera_list.clear();
    g_eng.image_list.clear();
    g_eng.window_list.clear();
    g_eng.default_cam = nullptr;
    g_eng.resource_buffer = nullptr;
    g_eng.pack_dir = nullptr;
    g_eng.pack_count = 0;
    g_eng.pack_path[0] = '\0';
    g_eng.cur_material = nullptr;

    FillRecipTable();

    render::WindowRecalc(&mw);
    render::SetCurWindow(&mw);

    g_eng.buf_w = g_eng.screen_w;
    g_eng.buf_h = g_eng.screen_h;
    if (render::RenderBufAlloc() != 0) {
        ReportError("Allocate depth buffer fail in Init_ENG20!!\n");
        return -1;
    }
    g_eng.color_buf = nullptr;
    g_eng.depth_buf = g_eng.own_depth_buf;

    g_eng.draw_list = static_cast<render::DRAW_LIST*>(eng_calloc(1, sizeof(render::DRAW_LIST)));
    if (!g_eng.draw_list) {
        ReportError("Allocate draw list fail in Init_ENG20!!\n");
        render::RenderBufFree();
        return -1;
    }

    ConInit();
    return 0;
}

} // namespace vrx::engine

using namespace vrx::engine;

extern "C" {

VRX_API int32_t VRX_Open(uint32_t reserved, uint32_t width, uint32_t height,
                         uint32_t color_fmt) noexcept {
    (void)reserved;
    // Screen sizes the buffers can hold: positive, and small enough that a doubled
    // buffer's byte size stays far inside 32 bits.
    if (width == 0 || height == 0 || width > 8192 || height > 8192) {
        ReportError("Wrong screen size %ux%u in VRX_Open!!\n", width, height);
        return -1;
    }
    // Opening an open engine first closes it, so nothing it held is lost.
    if (g_eng.is_open) VRX_Close();
    g_eng.screen_w = static_cast<int32_t>(width);
    g_eng.screen_h = static_cast<int32_t>(height);
    g_eng.screen_fmt = color_fmt;
    g_eng.mem_amount_1 = g_eng.mem_amount_2 = 0;
    g_eng.eng_flags = 0;
    if (Init_ENG20() != 0) {
        g_eng.eng_flags = FLAG_ZBUFFER;
        return -1;
    }
    // The rasteriser starts with the standard (unfiltered) span fillers.
    vrx::render::build_span_table(vrx::render::kSpanSetStandard);
    g_eng.is_open = 1;
    return 0;
}

VRX_API int32_t VRX_Close(void) noexcept {
    g_eng.mem_amount_1 = g_eng.mem_amount_2 = 0;
    if (ClearAllObjects() != 0) {
        ReportError("Clear all objects failed in End_ENG20!!\n");
        return -1;
    }
    release_buffers();
    g_eng.color_buf = nullptr;
    g_eng.depth_buf = nullptr;
    g_eng.is_open = 0;
    g_eng.eng_flags = FLAG_ZBUFFER;
    return 0;
}

VRX_API int32_t VRX_Clear(void) noexcept {
    if (ClearAllObjects() != 0) {
        ReportError("Clear all objects failed in Clear_ENG20!!\n");
        return -1;
    }
    return 0;
}

VRX_API int32_t VRX_SetDefaultDataPath(const char* path) noexcept {
    if (!path) {
        ReportError("Wrong path in VRX_SetDefaultDataPath!!\n");
        return -1;
    }
    // The model loader keeps a 256-byte copy of the path while it loads, so with room
    // for the appended backslash the path may be at most 254 characters.
    size_t n = std::strlen(path);
    if (n > 254) {
        ReportError("Data path too long in VRX_SetDefaultDataPath!!\n");
        return -1;
    }
    std::memcpy(g_eng.data_path, path, n + 1);
    // An empty path means the current directory: no separator is added.
    if (n > 0 && path[n - 1] != '\\') {
        g_eng.data_path[n] = '\\';
        g_eng.data_path[n + 1] = '\0';
    }
    return 0;
}

VRX_API int32_t VRX_GetVersion(char* out) noexcept {
    if (!out) return -1;
    std::memcpy(out, "v1.0.3.23", 10);
    return 0;
}

VRX_API int32_t VRX_GetUsedMemAmount(uint32_t* out1, uint32_t* out2) noexcept {
    if (out1) *out1 = g_eng.mem_amount_1;
    if (out2) *out2 = g_eng.mem_amount_2;
    return -1;
}

} // extern "C"
