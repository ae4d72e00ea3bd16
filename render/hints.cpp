// VRX_Hint: the engine-wide render flags. A changed flag takes effect when the next
// material installs its raster mode.
#include "engine/console.h"
#include "engine/error.h"
#include "engine/state.h"
#include "lite_vrx.h"
#include "render/raster.h"
#include "render/render_buffer.h"

using namespace vrx;
using engine::g_eng;

extern "C" {

VRX_API int32_t VRX_Hint(int32_t hint, uint32_t value) noexcept {
    uint32_t& flags = g_eng.eng_flags;
    switch (hint) {
        case HINT_PERSPECTIVE:
            flags =
                value ? (flags | engine::FLAG_PERSPECTIVE) : (flags & ~engine::FLAG_PERSPECTIVE);
            return 0;
        case HINT_DEPTH:
            // Sorting and depth testing exclude each other.
            if (flags & engine::FLAG_SORT) return -1;
            if (value) {
                // After doubled mode was left while sorting, no depth buffer exists.
                if (g_eng.is_open && render::EnsureDepthBuffer() != 0) {
                    engine::ReportError("Allocate depth buffer fail in VRX_Hint!!\n");
                    return -1;
                }
                flags |= engine::FLAG_ZBUFFER;
            } else {
                flags &= ~engine::FLAG_ZBUFFER;
            }
            return 0;
        case HINT_DOUBLED:
            if (value) {
                if (flags & engine::FLAG_DOUBLE) return 0;
                if (!g_eng.is_open || render::EnterDoubleMode() == 0) return 0;
                flags |= engine::FLAG_DOUBLE;
                engine::ConSetScale(2, 2);
            } else if (flags & engine::FLAG_DOUBLE) {
                render::LeaveDoubleMode();
                engine::ConSetScale(1, 1);
                flags &= ~engine::FLAG_DOUBLE;
            }
            return 0;
        case HINT_SORTED:
            flags = value ? ((flags | engine::FLAG_SORT) & ~engine::FLAG_ZBUFFER)
                          : (flags & ~engine::FLAG_SORT);
            return 0;
        case HINT_FILTERED:
            // Only the value 1 selects the filtered fillers; the table follows the flag.
            if (value == 1) {
                flags |= engine::FLAG_FILTER;
                render::build_span_table(render::kSpanSetFiltered);
            } else {
                flags &= ~engine::FLAG_FILTER;
                render::build_span_table(render::kSpanSetStandard);
            }
            return 0;
        default:
            return -1;
    }
}

} // extern "C"
