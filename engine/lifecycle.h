// Start-up, shut-down and emptying of the engine.
#pragma once

#include <cstdint>

namespace vrx::engine {

// The start-up steps of VRX_Open after the screen is recorded; 0 or -1.
int32_t Init_ENG20() noexcept;
// Frees every scene record kind by kind; 0, or -1 when a step failed.
int32_t ClearAllObjects() noexcept;

// The guard of every export that needs an open engine: while the engine is closed it
// reports "<fn>: the engine is not open!!\n" and returns true.
bool refuse_closed(const char* fn) noexcept;

} // namespace vrx::engine
