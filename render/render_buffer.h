// The render buffers: fills, block copies, the end-of-frame reduction and doubled mode.
#pragma once

#include <cstdint>

namespace vrx::render {

// Writes `value` into bytes / 4 consecutive words (a 1-3 byte remainder is untouched).
void FillWords(void* dst, uint32_t value, uint32_t bytes) noexcept;
// Fills a rectangle of the colour buffer (and of the depth buffer while depth testing
// is on and sorting off). Nothing for w or h below 1.
void FillRect(int32_t x, int32_t y, int32_t w, int32_t h, uint16_t color) noexcept;
// Reduces a picture of 2*width x 2*height pixels to width x height (dst may be src).
void Downsample2x2(int32_t width, int32_t height, const uint16_t* src, uint16_t* dst) noexcept;
// Allocates the engine's depth buffer (unless sorting) and resets the vertex scratch;
// 0, or -1 when out of memory.
int32_t RenderBufAlloc() noexcept;
// Frees what RenderBufAlloc and doubled mode allocated.
void RenderBufFree() noexcept;
// Switches doubled mode; EnterDoubleMode returns 1 on success and 0 on failure.
int32_t EnterDoubleMode() noexcept;
void LeaveDoubleMode() noexcept;
// Makes sure a depth buffer exists for depth testing; 0, or -1 when out of memory.
int32_t EnsureDepthBuffer() noexcept;

} // namespace vrx::render
