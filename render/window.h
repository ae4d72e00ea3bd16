// Windows: rectangles of the render buffer that a camera's view is projected into.
#pragma once

#include <cstdint>

#include "render/vport.h"

namespace vrx::render {

// Recomputes the derived values of a window and resets its scissor to the whole window.
void WindowRecalc(VPORT* win) noexcept;
// Selects a window: the clip rectangle follows its scissor.
void SetCurWindow(VPORT* win) noexcept;
// Frees every window on window_list and selects the main window; the windows step of
// ClearAllObjects.
int32_t clear_windows() noexcept;
// Halves (or doubles) the sizes of the main window and every listed window and
// recomputes them, for leaving (or entering) doubled mode.
void scale_all_windows(bool doubled) noexcept;

} // namespace vrx::render
